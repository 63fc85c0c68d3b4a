<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="cs">
<context>
    <name>QObject</name>
    <message>
        <source>Cancel</source>
        <translation>Zrušit</translation>
    </message>
    <message>
        <source>No default xml was provided for app configuration.</source>
        <translation>Pro konfiguraci aplikace nebyl poskytnut výchozí XML.</translation>
    </message>
    <message>
        <source>No key found for com.apple.configuration.managed.</source>
        <translation>Pro com.apple.configuration.managed nebyl nalezen žádný klíč.</translation>
    </message>
    <message>
        <source>OK</source>
        <translation>OK</translation>
    </message>
    <message>
        <source>Open in </source>
        <translation>Otevřít v </translation>
    </message>
    <message>
        <source>Select from options</source>
        <translation>Vyberte z možností</translation>
    </message>
    <message>
        <source>Share Via</source>
        <translation>Sdílet přes</translation>
    </message>
    <message>
        <source>This platform does not support managed app configuration through MDM.</source>
        <translation>Tato platforma nepodporuje konfiguraci spravovaných aplikací prostřednictvím MDM.</translation>
    </message>
    <message>
        <source>Unsupported data type</source>
        <translation>Nepodporovaný datový typ</translation>
    </message>
    <message>
        <source>Unsupported operation</source>
        <translation>Nepodporovaná operace</translation>
    </message>
    <message>
        <source>Unsupported platform</source>
        <translation>Nepodporovaná platforma</translation>
    </message>
    <message>
        <source>View</source>
        <translation>Zobrazit</translation>
    </message>
</context>
</TS>
