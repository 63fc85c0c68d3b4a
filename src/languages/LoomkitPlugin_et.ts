<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="et">
<context>
    <name>QObject</name>
    <message>
        <source>Cancel</source>
        <translation>Tühista</translation>
    </message>
    <message>
        <source>No default xml was provided for app configuration.</source>
        <translation>Rakenduse konfigureerimiseks ei antud vaikimisi XML-i.</translation>
    </message>
    <message>
        <source>No key found for com.apple.configuration.managed.</source>
        <translation>com.apple.configuration.managed jaoks ei leitud võtit.</translation>
    </message>
    <message>
        <source>OK</source>
        <translation>OK</translation>
    </message>
    <message>
        <source>Open in </source>
        <translation>Ava rakenduses </translation>
    </message>
    <message>
        <source>Select from options</source>
        <translation>Valige suvandite hulgast</translation>
    </message>
    <message>
        <source>Share Via</source>
        <translation>Jaga kaudu</translation>
    </message>
    <message>
        <source>This platform does not support managed app configuration through MDM.</source>
        <translation>See platvorm ei toeta hallatud rakenduste konfigureerimist MDM-i kaudu.</translation>
    </message>
    <message>
        <source>Unsupported data type</source>
        <translation>Toetamata andmetüüp</translation>
    </message>
    <message>
        <source>Unsupported operation</source>
        <translation>Toetamata toiming</translation>
    </message>
    <message>
        <source>Unsupported platform</source>
        <translation>Toetamata platvorm</translation>
    </message>
    <message>
        <source>View</source>
        <translation>Kuva</translation>
    </message>
</context>
</TS>
