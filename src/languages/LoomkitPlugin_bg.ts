<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="bg">
<context>
    <name>QObject</name>
    <message>
        <source>Cancel</source>
        <translation>Отказ</translation>
    </message>
    <message>
        <source>No default xml was provided for app configuration.</source>
        <translation>Не е предоставен XML файл по подразбиране за конфигурацията на приложението.</translation>
    </message>
    <message>
        <source>No key found for com.apple.configuration.managed.</source>
        <translation>Не е намерен ключ за com.apple.configuration.managed.</translation>
    </message>
    <message>
        <source>OK</source>
        <translation>OK</translation>
    </message>
    <message>
        <source>Open in </source>
        <translation>Отваряне в </translation>
    </message>
    <message>
        <source>Select from options</source>
        <translation>Изберете от опциите</translation>
    </message>
    <message>
        <source>Share Via</source>
        <translation>Споделяне чрез</translation>
    </message>
    <message>
        <source>This platform does not support managed app configuration through MDM.</source>
        <translation>Тази платформа не поддържа конфигуриране на управлявани приложения чрез MDM.</translation>
    </message>
    <message>
        <source>Unsupported data type</source>
        <translation>Неподдържан тип данни</translation>
    </message>
    <message>
        <source>Unsupported operation</source>
        <translation>Неподдържана операция</translation>
    </message>
    <message>
        <source>Unsupported platform</source>
        <translation>Неподдържана платформа</translation>
    </message>
    <message>
        <source>View</source>
        <translation>Преглед</translation>
    </message>
</context>
</TS>
