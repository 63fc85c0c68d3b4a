<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="fi">
<context>
    <name>QObject</name>
    <message>
        <source>Cancel</source>
        <translation>Peruuta</translation>
    </message>
    <message>
        <source>No default xml was provided for app configuration.</source>
        <translation>Sovelluksen määritykselle ei annettu oletus-XML:ää.</translation>
    </message>
    <message>
        <source>No key found for com.apple.configuration.managed.</source>
        <translation>Kohteelle com.apple.configuration.managed ei löytynyt avainta.</translation>
    </message>
    <message>
        <source>OK</source>
        <translation>OK</translation>
    </message>
    <message>
        <source>Open in </source>
        <translation>Avaa sovelluksessa </translation>
    </message>
    <message>
        <source>Select from options</source>
        <translation>Valitse vaihtoehdoista</translation>
    </message>
    <message>
        <source>Share Via</source>
        <translation>Jaa palvelun kautta</translation>
    </message>
    <message>
        <source>This platform does not support managed app configuration through MDM.</source>
        <translation>Tämä alusta ei tue hallittujen sovellusten määrittämistä MDM:n kautta.</translation>
    </message>
    <message>
        <source>Unsupported data type</source>
        <translation>Tietotyyppiä ei tueta</translation>
    </message>
    <message>
        <source>Unsupported operation</source>
        <translation>Toimintoa ei tueta</translation>
    </message>
    <message>
        <source>Unsupported platform</source>
        <translation>Alustaa ei tueta</translation>
    </message>
    <message>
        <source>View</source>
        <translation>Näytä</translation>
    </message>
</context>
</TS>
