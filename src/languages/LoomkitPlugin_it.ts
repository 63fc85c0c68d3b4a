<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="it">
<context>
    <name>QObject</name>
    <message>
        <source>Cancel</source>
        <translation>Annulla</translation>
    </message>
    <message>
        <source>No default xml was provided for app configuration.</source>
        <translation>Non è stato fornito alcun XML predefinito per la configurazione dell'app.</translation>
    </message>
    <message>
        <source>No key found for com.apple.configuration.managed.</source>
        <translation>Nessuna chiave trovata per com.apple.configuration.managed.</translation>
    </message>
    <message>
        <source>OK</source>
        <translation>OK</translation>
    </message>
    <message>
        <source>Open in </source>
        <translation>Apri in </translation>
    </message>
    <message>
        <source>Select from options</source>
        <translation>Seleziona tra le opzioni</translation>
    </message>
    <message>
        <source>Share Via</source>
        <translation>Condividi tramite</translation>
    </message>
    <message>
        <source>This platform does not support managed app configuration through MDM.</source>
        <translation>Questa piattaforma non supporta la configurazione delle app gestite tramite MDM.</translation>
    </message>
    <message>
        <source>Unsupported data type</source>
        <translation>Tipo di dati non supportato</translation>
    </message>
    <message>
        <source>Unsupported operation</source>
        <translation>Operazione non supportata</translation>
    </message>
    <message>
        <source>Unsupported platform</source>
        <translation>Piattaforma non supportata</translation>
    </message>
    <message>
        <source>View</source>
        <translation>Visualizza</translation>
    </message>
</context>
</TS>
