<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="lt">
<context>
    <name>QObject</name>
    <message>
        <source>Cancel</source>
        <translation>Atšaukti</translation>
    </message>
    <message>
        <source>No default xml was provided for app configuration.</source>
        <translation>Programėlės konfigūracijai nepateiktas numatytasis XML.</translation>
    </message>
    <message>
        <source>No key found for com.apple.configuration.managed.</source>
        <translation>Nerastas raktas, skirtas com.apple.configuration.managed.</translation>
    </message>
    <message>
        <source>OK</source>
        <translation>Gerai</translation>
    </message>
    <message>
        <source>Open in </source>
        <translation>Atidaryti programoje </translation>
    </message>
    <message>
        <source>Select from options</source>
        <translation>Pasirinkite iš parinkčių</translation>
    </message>
    <message>
        <source>Share Via</source>
        <translation>Bendrinti per</translation>
    </message>
    <message>
        <source>This platform does not support managed app configuration through MDM.</source>
        <translation>Ši platforma nepalaiko valdomų programėlių konfigūravimo per MDM.</translation>
    </message>
    <message>
        <source>Unsupported data type</source>
        <translation>Nepalaikomas duomenų tipas</translation>
    </message>
    <message>
        <source>Unsupported operation</source>
        <translation>Nepalaikoma operacija</translation>
    </message>
    <message>
        <source>Unsupported platform</source>
        <translation>Nepalaikoma platforma</translation>
    </message>
    <message>
        <source>View</source>
        <translation>Peržiūrėti</translation>
    </message>
</context>
</TS>
