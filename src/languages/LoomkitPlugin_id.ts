<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="id">
<context>
    <name>QObject</name>
    <message>
        <source>Cancel</source>
        <translation>Batal</translation>
    </message>
    <message>
        <source>No default xml was provided for app configuration.</source>
        <translation>Tidak ada XML default yang diberikan untuk konfigurasi aplikasi.</translation>
    </message>
    <message>
        <source>No key found for com.apple.configuration.managed.</source>
        <translation>Tidak ditemukan kunci untuk com.apple.configuration.managed.</translation>
    </message>
    <message>
        <source>OK</source>
        <translation>OK</translation>
    </message>
    <message>
        <source>Open in </source>
        <translation>Buka di </translation>
    </message>
    <message>
        <source>Select from options</source>
        <translation>Pilih dari opsi</translation>
    </message>
    <message>
        <source>Share Via</source>
        <translation>Bagikan Melalui</translation>
    </message>
    <message>
        <source>This platform does not support managed app configuration through MDM.</source>
        <translation>Platform ini tidak mendukung konfigurasi aplikasi terkelola melalui MDM.</translation>
    </message>
    <message>
        <source>Unsupported data type</source>
        <translation>Tipe data tidak didukung</translation>
    </message>
    <message>
        <source>Unsupported operation</source>
        <translation>Operasi tidak didukung</translation>
    </message>
    <message>
        <source>Unsupported platform</source>
        <translation>Platform tidak didukung</translation>
    </message>
    <message>
        <source>View</source>
        <translation>Lihat</translation>
    </message>
</context>
</TS>
