<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="sr">
<context>
    <name>QObject</name>
    <message>
        <source>Cancel</source>
        <translation>Откажи</translation>
    </message>
    <message>
        <source>No default xml was provided for app configuration.</source>
        <translation>Није наведен подразумевани XML за конфигурацију апликације.</translation>
    </message>
    <message>
        <source>No key found for com.apple.configuration.managed.</source>
        <translation>Није пронађен кључ за com.apple.configuration.managed.</translation>
    </message>
    <message>
        <source>OK</source>
        <translation>У реду</translation>
    </message>
    <message>
        <source>Open in </source>
        <translation>Отвори у </translation>
    </message>
    <message>
        <source>Select from options</source>
        <translation>Изаберите једну од опција</translation>
    </message>
    <message>
        <source>Share Via</source>
        <translation>Подели путем</translation>
    </message>
    <message>
        <source>This platform does not support managed app configuration through MDM.</source>
        <translation>Ова платформа не подржава конфигурацију управљаних апликација путем MDM-а.</translation>
    </message>
    <message>
        <source>Unsupported data type</source>
        <translation>Неподржани тип података</translation>
    </message>
    <message>
        <source>Unsupported operation</source>
        <translation>Неподржана операција</translation>
    </message>
    <message>
        <source>Unsupported platform</source>
        <translation>Неподржана платформа</translation>
    </message>
    <message>
        <source>View</source>
        <translation>Прикажи</translation>
    </message>
</context>
</TS>
