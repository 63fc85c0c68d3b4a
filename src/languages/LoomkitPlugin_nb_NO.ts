<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="nb_NO">
<context>
    <name>QObject</name>
    <message>
        <source>Cancel</source>
        <translation>Avbryt</translation>
    </message>
    <message>
        <source>No default xml was provided for app configuration.</source>
        <translation>Ingen standard-XML ble oppgitt for appkonfigurasjonen.</translation>
    </message>
    <message>
        <source>No key found for com.apple.configuration.managed.</source>
        <translation>Fant ingen nøkkel for com.apple.configuration.managed.</translation>
    </message>
    <message>
        <source>OK</source>
        <translation>OK</translation>
    </message>
    <message>
        <source>Open in </source>
        <translation>Åpne i </translation>
    </message>
    <message>
        <source>Select from options</source>
        <translation>Velg blant alternativene</translation>
    </message>
    <message>
        <source>Share Via</source>
        <translation>Del via</translation>
    </message>
    <message>
        <source>This platform does not support managed app configuration through MDM.</source>
        <translation>Denne plattformen støtter ikke konfigurasjon av administrerte apper via MDM.</translation>
    </message>
    <message>
        <source>Unsupported data type</source>
        <translation>Datatypen støttes ikke</translation>
    </message>
    <message>
        <source>Unsupported operation</source>
        <translation>Operasjonen støttes ikke</translation>
    </message>
    <message>
        <source>Unsupported platform</source>
        <translation>Plattformen støttes ikke</translation>
    </message>
    <message>
        <source>View</source>
        <translation>Vis</translation>
    </message>
</context>
</TS>
