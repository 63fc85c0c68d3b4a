<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="sl">
<context>
    <name>QObject</name>
    <message>
        <source>Cancel</source>
        <translation>Prekliči</translation>
    </message>
    <message>
        <source>No default xml was provided for app configuration.</source>
        <translation>Za konfiguracijo aplikacije ni bil podan privzeti XML.</translation>
    </message>
    <message>
        <source>No key found for com.apple.configuration.managed.</source>
        <translation>Za com.apple.configuration.managed ni bilo mogoče najti ključa.</translation>
    </message>
    <message>
        <source>OK</source>
        <translation>V redu</translation>
    </message>
    <message>
        <source>Open in </source>
        <translation>Odpri v </translation>
    </message>
    <message>
        <source>Select from options</source>
        <translation>Izberite med možnostmi</translation>
    </message>
    <message>
        <source>Share Via</source>
        <translation>Deli prek</translation>
    </message>
    <message>
        <source>This platform does not support managed app configuration through MDM.</source>
        <translation>Ta platforma ne podpira konfiguracije upravljanih aplikacij prek MDM.</translation>
    </message>
    <message>
        <source>Unsupported data type</source>
        <translation>Nepodprta vrsta podatkov</translation>
    </message>
    <message>
        <source>Unsupported operation</source>
        <translation>Nepodprta operacija</translation>
    </message>
    <message>
        <source>Unsupported platform</source>
        <translation>Nepodprta platforma</translation>
    </message>
    <message>
        <source>View</source>
        <translation>Prikaži</translation>
    </message>
</context>
</TS>
