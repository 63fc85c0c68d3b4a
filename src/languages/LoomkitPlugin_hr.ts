<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="hr">
<context>
    <name>QObject</name>
    <message>
        <source>Cancel</source>
        <translation>Odustani</translation>
    </message>
    <message>
        <source>No default xml was provided for app configuration.</source>
        <translation>Nije naveden zadani XML za konfiguraciju aplikacije.</translation>
    </message>
    <message>
        <source>No key found for com.apple.configuration.managed.</source>
        <translation>Nije pronađen ključ za com.apple.configuration.managed.</translation>
    </message>
    <message>
        <source>OK</source>
        <translation>U redu</translation>
    </message>
    <message>
        <source>Open in </source>
        <translation>Otvori u </translation>
    </message>
    <message>
        <source>Select from options</source>
        <translation>Odaberite jednu od mogućnosti</translation>
    </message>
    <message>
        <source>Share Via</source>
        <translation>Podijeli putem</translation>
    </message>
    <message>
        <source>This platform does not support managed app configuration through MDM.</source>
        <translation>Ova platforma ne podržava konfiguraciju upravljanih aplikacija putem MDM-a.</translation>
    </message>
    <message>
        <source>Unsupported data type</source>
        <translation>Nepodržana vrsta podataka</translation>
    </message>
    <message>
        <source>Unsupported operation</source>
        <translation>Nepodržana operacija</translation>
    </message>
    <message>
        <source>Unsupported platform</source>
        <translation>Nepodržana platforma</translation>
    </message>
    <message>
        <source>View</source>
        <translation>Prikaži</translation>
    </message>
</context>
</TS>
