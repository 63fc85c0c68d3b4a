<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="ca">
<context>
    <name>QObject</name>
    <message>
        <source>Cancel</source>
        <translation>Cancel·la</translation>
    </message>
    <message>
        <source>No default xml was provided for app configuration.</source>
        <translation>No s'ha proporcionat cap XML per defecte per a la configuració de l'aplicació.</translation>
    </message>
    <message>
        <source>No key found for com.apple.configuration.managed.</source>
        <translation>No s'ha trobat cap clau per a com.apple.configuration.managed.</translation>
    </message>
    <message>
        <source>OK</source>
        <translation>D'acord</translation>
    </message>
    <message>
        <source>Open in </source>
        <translation>Obre a </translation>
    </message>
    <message>
        <source>Select from options</source>
        <translation>Seleccioneu entre les opcions</translation>
    </message>
    <message>
        <source>Share Via</source>
        <translation>Comparteix mitjançant</translation>
    </message>
    <message>
        <source>This platform does not support managed app configuration through MDM.</source>
        <translation>Aquesta plataforma no admet la configuració d'aplicacions gestionades mitjançant MDM.</translation>
    </message>
    <message>
        <source>Unsupported data type</source>
        <translation>Tipus de dades no admès</translation>
    </message>
    <message>
        <source>Unsupported operation</source>
        <translation>Operació no admesa</translation>
    </message>
    <message>
        <source>Unsupported platform</source>
        <translation>Plataforma no admesa</translation>
    </message>
    <message>
        <source>View</source>
        <translation>Visualitza</translation>
    </message>
</context>
</TS>
