<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="tr">
<context>
    <name>QObject</name>
    <message>
        <source>Cancel</source>
        <translation>İptal</translation>
    </message>
    <message>
        <source>No default xml was provided for app configuration.</source>
        <translation>Uygulama yapılandırması için varsayılan XML sağlanmadı.</translation>
    </message>
    <message>
        <source>No key found for com.apple.configuration.managed.</source>
        <translation>com.apple.configuration.managed için anahtar bulunamadı.</translation>
    </message>
    <message>
        <source>OK</source>
        <translation>Tamam</translation>
    </message>
    <message>
        <source>Open in </source>
        <translation>Şurada aç: </translation>
    </message>
    <message>
        <source>Select from options</source>
        <translation>Seçeneklerden birini seçin</translation>
    </message>
    <message>
        <source>Share Via</source>
        <translation>Şununla paylaş</translation>
    </message>
    <message>
        <source>This platform does not support managed app configuration through MDM.</source>
        <translation>Bu platform, MDM aracılığıyla yönetilen uygulama yapılandırmasını desteklemiyor.</translation>
    </message>
    <message>
        <source>Unsupported data type</source>
        <translation>Desteklenmeyen veri türü</translation>
    </message>
    <message>
        <source>Unsupported operation</source>
        <translation>Desteklenmeyen işlem</translation>
    </message>
    <message>
        <source>Unsupported platform</source>
        <translation>Desteklenmeyen platform</translation>
    </message>
    <message>
        <source>View</source>
        <translation>Görüntüle</translation>
    </message>
</context>
</TS>
