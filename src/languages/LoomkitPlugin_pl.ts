<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="pl">
<context>
    <name>QObject</name>
    <message>
        <source>Cancel</source>
        <translation>Anuluj</translation>
    </message>
    <message>
        <source>No default xml was provided for app configuration.</source>
        <translation>Nie podano domyślnego pliku XML dla konfiguracji aplikacji.</translation>
    </message>
    <message>
        <source>No key found for com.apple.configuration.managed.</source>
        <translation>Nie znaleziono klucza dla com.apple.configuration.managed.</translation>
    </message>
    <message>
        <source>OK</source>
        <translation>OK</translation>
    </message>
    <message>
        <source>Open in </source>
        <translation>Otwórz w </translation>
    </message>
    <message>
        <source>Select from options</source>
        <translation>Wybierz spośród opcji</translation>
    </message>
    <message>
        <source>Share Via</source>
        <translation>Udostępnij przez</translation>
    </message>
    <message>
        <source>This platform does not support managed app configuration through MDM.</source>
        <translation>Ta platforma nie obsługuje konfiguracji zarządzanych aplikacji za pomocą MDM.</translation>
    </message>
    <message>
        <source>Unsupported data type</source>
        <translation>Nieobsługiwany typ danych</translation>
    </message>
    <message>
        <source>Unsupported operation</source>
        <translation>Nieobsługiwana operacja</translation>
    </message>
    <message>
        <source>Unsupported platform</source>
        <translation>Nieobsługiwana platforma</translation>
    </message>
    <message>
        <source>View</source>
        <translation>Wyświetl</translation>
    </message>
</context>
</TS>
