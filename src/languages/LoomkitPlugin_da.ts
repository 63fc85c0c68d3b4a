<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="da">
<context>
    <name>QObject</name>
    <message>
        <source>Cancel</source>
        <translation>Annuller</translation>
    </message>
    <message>
        <source>No default xml was provided for app configuration.</source>
        <translation>Der blev ikke angivet nogen standard-XML til appkonfigurationen.</translation>
    </message>
    <message>
        <source>No key found for com.apple.configuration.managed.</source>
        <translation>Der blev ikke fundet nogen nøgle til com.apple.configuration.managed.</translation>
    </message>
    <message>
        <source>OK</source>
        <translation>OK</translation>
    </message>
    <message>
        <source>Open in </source>
        <translation>Åbn i </translation>
    </message>
    <message>
        <source>Select from options</source>
        <translation>Vælg blandt mulighederne</translation>
    </message>
    <message>
        <source>Share Via</source>
        <translation>Del via</translation>
    </message>
    <message>
        <source>This platform does not support managed app configuration through MDM.</source>
        <translation>Denne platform understøtter ikke konfiguration af administrerede apps via MDM.</translation>
    </message>
    <message>
        <source>Unsupported data type</source>
        <translation>Datatypen understøttes ikke</translation>
    </message>
    <message>
        <source>Unsupported operation</source>
        <translation>Handlingen understøttes ikke</translation>
    </message>
    <message>
        <source>Unsupported platform</source>
        <translation>Platformen understøttes ikke</translation>
    </message>
    <message>
        <source>View</source>
        <translation>Vis</translation>
    </message>
</context>
</TS>
