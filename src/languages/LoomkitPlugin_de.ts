<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="de">
<context>
    <name>QObject</name>
    <message>
        <source>Cancel</source>
        <translation>Abbrechen</translation>
    </message>
    <message>
        <source>No default xml was provided for app configuration.</source>
        <translation>Für die App-Konfiguration wurde kein Standard-XML angegeben.</translation>
    </message>
    <message>
        <source>No key found for com.apple.configuration.managed.</source>
        <translation>Kein Schlüssel für com.apple.configuration.managed gefunden.</translation>
    </message>
    <message>
        <source>OK</source>
        <translation>OK</translation>
    </message>
    <message>
        <source>Open in </source>
        <translation>Öffnen in </translation>
    </message>
    <message>
        <source>Select from options</source>
        <translation>Aus Optionen auswählen</translation>
    </message>
    <message>
        <source>Share Via</source>
        <translation>Teilen über</translation>
    </message>
    <message>
        <source>This platform does not support managed app configuration through MDM.</source>
        <translation>Diese Plattform unterstützt keine Konfiguration verwalteter Apps über MDM.</translation>
    </message>
    <message>
        <source>Unsupported data type</source>
        <translation>Nicht unterstützter Datentyp</translation>
    </message>
    <message>
        <source>Unsupported operation</source>
        <translation>Nicht unterstützter Vorgang</translation>
    </message>
    <message>
        <source>Unsupported platform</source>
        <translation>Nicht unterstützte Plattform</translation>
    </message>
    <message>
        <source>View</source>
        <translation>Anzeigen</translation>
    </message>
</context>
</TS>
