<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="nl">
<context>
    <name>QObject</name>
    <message>
        <source>Cancel</source>
        <translation>Annuleren</translation>
    </message>
    <message>
        <source>No default xml was provided for app configuration.</source>
        <translation>Er is geen standaard-XML opgegeven voor de appconfiguratie.</translation>
    </message>
    <message>
        <source>No key found for com.apple.configuration.managed.</source>
        <translation>Geen sleutel gevonden voor com.apple.configuration.managed.</translation>
    </message>
    <message>
        <source>OK</source>
        <translation>OK</translation>
    </message>
    <message>
        <source>Open in </source>
        <translation>Openen in </translation>
    </message>
    <message>
        <source>Select from options</source>
        <translation>Kies uit de opties</translation>
    </message>
    <message>
        <source>Share Via</source>
        <translation>Delen via</translation>
    </message>
    <message>
        <source>This platform does not support managed app configuration through MDM.</source>
        <translation>Dit platform ondersteunt geen configuratie van beheerde apps via MDM.</translation>
    </message>
    <message>
        <source>Unsupported data type</source>
        <translation>Niet-ondersteund gegevenstype</translation>
    </message>
    <message>
        <source>Unsupported operation</source>
        <translation>Niet-ondersteunde bewerking</translation>
    </message>
    <message>
        <source>Unsupported platform</source>
        <translation>Niet-ondersteund platform</translation>
    </message>
    <message>
        <source>View</source>
        <translation>Weergeven</translation>
    </message>
</context>
</TS>
