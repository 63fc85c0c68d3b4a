<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="ro">
<context>
    <name>QObject</name>
    <message>
        <source>Cancel</source>
        <translation>Anulare</translation>
    </message>
    <message>
        <source>No default xml was provided for app configuration.</source>
        <translation>Nu a fost furnizat niciun XML implicit pentru configurarea aplicației.</translation>
    </message>
    <message>
        <source>No key found for com.apple.configuration.managed.</source>
        <translation>Nu a fost găsită nicio cheie pentru com.apple.configuration.managed.</translation>
    </message>
    <message>
        <source>OK</source>
        <translation>OK</translation>
    </message>
    <message>
        <source>Open in </source>
        <translation>Deschide în </translation>
    </message>
    <message>
        <source>Select from options</source>
        <translation>Selectați dintre opțiuni</translation>
    </message>
    <message>
        <source>Share Via</source>
        <translation>Partajare prin</translation>
    </message>
    <message>
        <source>This platform does not support managed app configuration through MDM.</source>
        <translation>Această platformă nu acceptă configurarea aplicațiilor gestionate prin MDM.</translation>
    </message>
    <message>
        <source>Unsupported data type</source>
        <translation>Tip de date neacceptat</translation>
    </message>
    <message>
        <source>Unsupported operation</source>
        <translation>Operațiune neacceptată</translation>
    </message>
    <message>
        <source>Unsupported platform</source>
        <translation>Platformă neacceptată</translation>
    </message>
    <message>
        <source>View</source>
        <translation>Vizualizare</translation>
    </message>
</context>
</TS>
