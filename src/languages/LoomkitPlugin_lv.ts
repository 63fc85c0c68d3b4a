<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="lv">
<context>
    <name>QObject</name>
    <message>
        <source>Cancel</source>
        <translation>Atcelt</translation>
    </message>
    <message>
        <source>No default xml was provided for app configuration.</source>
        <translation>Lietotnes konfigurācijai netika nodrošināts noklusējuma XML.</translation>
    </message>
    <message>
        <source>No key found for com.apple.configuration.managed.</source>
        <translation>Vienumam com.apple.configuration.managed netika atrasta atslēga.</translation>
    </message>
    <message>
        <source>OK</source>
        <translation>Labi</translation>
    </message>
    <message>
        <source>Open in </source>
        <translation>Atvērt lietotnē </translation>
    </message>
    <message>
        <source>Select from options</source>
        <translation>Izvēlieties no opcijām</translation>
    </message>
    <message>
        <source>Share Via</source>
        <translation>Kopīgot, izmantojot</translation>
    </message>
    <message>
        <source>This platform does not support managed app configuration through MDM.</source>
        <translation>Šī platforma neatbalsta pārvaldīto lietotņu konfigurāciju, izmantojot MDM.</translation>
    </message>
    <message>
        <source>Unsupported data type</source>
        <translation>Neatbalstīts datu tips</translation>
    </message>
    <message>
        <source>Unsupported operation</source>
        <translation>Neatbalstīta darbība</translation>
    </message>
    <message>
        <source>Unsupported platform</source>
        <translation>Neatbalstīta platforma</translation>
    </message>
    <message>
        <source>View</source>
        <translation>Skatīt</translation>
    </message>
</context>
</TS>
