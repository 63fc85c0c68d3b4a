<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="ru">
<context>
    <name>QObject</name>
    <message>
        <source>Cancel</source>
        <translation>Отмена</translation>
    </message>
    <message>
        <source>No default xml was provided for app configuration.</source>
        <translation>Не предоставлен XML по умолчанию для конфигурации приложения.</translation>
    </message>
    <message>
        <source>No key found for com.apple.configuration.managed.</source>
        <translation>Не найден ключ для com.apple.configuration.managed.</translation>
    </message>
    <message>
        <source>OK</source>
        <translation>ОК</translation>
    </message>
    <message>
        <source>Open in </source>
        <translation>Открыть в </translation>
    </message>
    <message>
        <source>Select from options</source>
        <translation>Выберите один из вариантов</translation>
    </message>
    <message>
        <source>Share Via</source>
        <translation>Поделиться через</translation>
    </message>
    <message>
        <source>This platform does not support managed app configuration through MDM.</source>
        <translation>Эта платформа не поддерживает конфигурацию управляемых приложений через MDM.</translation>
    </message>
    <message>
        <source>Unsupported data type</source>
        <translation>Неподдерживаемый тип данных</translation>
    </message>
    <message>
        <source>Unsupported operation</source>
        <translation>Неподдерживаемая операция</translation>
    </message>
    <message>
        <source>Unsupported platform</source>
        <translation>Неподдерживаемая платформа</translation>
    </message>
    <message>
        <source>View</source>
        <translation>Просмотр</translation>
    </message>
</context>
</TS>
