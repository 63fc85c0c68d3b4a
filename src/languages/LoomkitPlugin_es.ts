<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="es">
<context>
    <name>QObject</name>
    <message>
        <source>Cancel</source>
        <translation>Cancelar</translation>
    </message>
    <message>
        <source>No default xml was provided for app configuration.</source>
        <translation>No se proporcionó ningún XML predeterminado para la configuración de la aplicación.</translation>
    </message>
    <message>
        <source>No key found for com.apple.configuration.managed.</source>
        <translation>No se encontró ninguna clave para com.apple.configuration.managed.</translation>
    </message>
    <message>
        <source>OK</source>
        <translation>Aceptar</translation>
    </message>
    <message>
        <source>Open in </source>
        <translation>Abrir en </translation>
    </message>
    <message>
        <source>Select from options</source>
        <translation>Seleccione una de las opciones</translation>
    </message>
    <message>
        <source>Share Via</source>
        <translation>Compartir mediante</translation>
    </message>
    <message>
        <source>This platform does not support managed app configuration through MDM.</source>
        <translation>Esta plataforma no admite la configuración de aplicaciones administradas mediante MDM.</translation>
    </message>
    <message>
        <source>Unsupported data type</source>
        <translation>Tipo de datos no compatible</translation>
    </message>
    <message>
        <source>Unsupported operation</source>
        <translation>Operación no compatible</translation>
    </message>
    <message>
        <source>Unsupported platform</source>
        <translation>Plataforma no compatible</translation>
    </message>
    <message>
        <source>View</source>
        <translation>Ver</translation>
    </message>
</context>
</TS>
