<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="sv">
<context>
    <name>QObject</name>
    <message>
        <source>Cancel</source>
        <translation>Avbryt</translation>
    </message>
    <message>
        <source>No default xml was provided for app configuration.</source>
        <translation>Ingen standard-XML angavs för appkonfigurationen.</translation>
    </message>
    <message>
        <source>No key found for com.apple.configuration.managed.</source>
        <translation>Ingen nyckel hittades för com.apple.configuration.managed.</translation>
    </message>
    <message>
        <source>OK</source>
        <translation>OK</translation>
    </message>
    <message>
        <source>Open in </source>
        <translation>Öppna i </translation>
    </message>
    <message>
        <source>Select from options</source>
        <translation>Välj bland alternativen</translation>
    </message>
    <message>
        <source>Share Via</source>
        <translation>Dela via</translation>
    </message>
    <message>
        <source>This platform does not support managed app configuration through MDM.</source>
        <translation>Den här plattformen stöder inte konfiguration av hanterade appar via MDM.</translation>
    </message>
    <message>
        <source>Unsupported data type</source>
        <translation>Datatypen stöds inte</translation>
    </message>
    <message>
        <source>Unsupported operation</source>
        <translation>Åtgärden stöds inte</translation>
    </message>
    <message>
        <source>Unsupported platform</source>
        <translation>Plattformen stöds inte</translation>
    </message>
    <message>
        <source>View</source>
        <translation>Visa</translation>
    </message>
</context>
</TS>
