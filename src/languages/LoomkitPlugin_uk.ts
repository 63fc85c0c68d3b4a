<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="uk">
<context>
    <name>QObject</name>
    <message>
        <source>Cancel</source>
        <translation>Скасувати</translation>
    </message>
    <message>
        <source>No default xml was provided for app configuration.</source>
        <translation>Не надано XML за замовчуванням для конфігурації застосунку.</translation>
    </message>
    <message>
        <source>No key found for com.apple.configuration.managed.</source>
        <translation>Не знайдено ключ для com.apple.configuration.managed.</translation>
    </message>
    <message>
        <source>OK</source>
        <translation>OK</translation>
    </message>
    <message>
        <source>Open in </source>
        <translation>Відкрити в </translation>
    </message>
    <message>
        <source>Select from options</source>
        <translation>Виберіть один із варіантів</translation>
    </message>
    <message>
        <source>Share Via</source>
        <translation>Поділитися через</translation>
    </message>
    <message>
        <source>This platform does not support managed app configuration through MDM.</source>
        <translation>Ця платформа не підтримує конфігурацію керованих застосунків через MDM.</translation>
    </message>
    <message>
        <source>Unsupported data type</source>
        <translation>Непідтримуваний тип даних</translation>
    </message>
    <message>
        <source>Unsupported operation</source>
        <translation>Непідтримувана операція</translation>
    </message>
    <message>
        <source>Unsupported platform</source>
        <translation>Непідтримувана платформа</translation>
    </message>
    <message>
        <source>View</source>
        <translation>Переглянути</translation>
    </message>
</context>
</TS>
