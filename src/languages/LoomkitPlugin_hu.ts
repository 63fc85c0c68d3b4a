<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="hu">
<context>
    <name>QObject</name>
    <message>
        <source>Cancel</source>
        <translation>Mégse</translation>
    </message>
    <message>
        <source>No default xml was provided for app configuration.</source>
        <translation>Nem adtak meg alapértelmezett XML-t az alkalmazás konfigurációjához.</translation>
    </message>
    <message>
        <source>No key found for com.apple.configuration.managed.</source>
        <translation>Nem található kulcs a következőhöz: com.apple.configuration.managed.</translation>
    </message>
    <message>
        <source>OK</source>
        <translation>OK</translation>
    </message>
    <message>
        <source>Open in </source>
        <translation>Megnyitás ebben: </translation>
    </message>
    <message>
        <source>Select from options</source>
        <translation>Válasszon a lehetőségek közül</translation>
    </message>
    <message>
        <source>Share Via</source>
        <translation>Megosztás módja</translation>
    </message>
    <message>
        <source>This platform does not support managed app configuration through MDM.</source>
        <translation>Ez a platform nem támogatja a felügyelt alkalmazások MDM-en keresztüli konfigurálását.</translation>
    </message>
    <message>
        <source>Unsupported data type</source>
        <translation>Nem támogatott adattípus</translation>
    </message>
    <message>
        <source>Unsupported operation</source>
        <translation>Nem támogatott művelet</translation>
    </message>
    <message>
        <source>Unsupported platform</source>
        <translation>Nem támogatott platform</translation>
    </message>
    <message>
        <source>View</source>
        <translation>Megtekintés</translation>
    </message>
</context>
</TS>
