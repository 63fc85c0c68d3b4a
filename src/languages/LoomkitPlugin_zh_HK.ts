<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="zh_HK">
<context>
    <name>QObject</name>
    <message>
        <source>Cancel</source>
        <translation>取消</translation>
    </message>
    <message>
        <source>No default xml was provided for app configuration.</source>
        <translation>未有提供用於應用程式設定的預設 XML。</translation>
    </message>
    <message>
        <source>No key found for com.apple.configuration.managed.</source>
        <translation>找不到 com.apple.configuration.managed 的鍵。</translation>
    </message>
    <message>
        <source>OK</source>
        <translation>確定</translation>
    </message>
    <message>
        <source>Open in </source>
        <translation>開啟於 </translation>
    </message>
    <message>
        <source>Select from options</source>
        <translation>從選項中選擇</translation>
    </message>
    <message>
        <source>Share Via</source>
        <translation>分享方式</translation>
    </message>
    <message>
        <source>This platform does not support managed app configuration through MDM.</source>
        <translation>此平台不支援透過 MDM 進行受管理應用程式設定。</translation>
    </message>
    <message>
        <source>Unsupported data type</source>
        <translation>不支援的資料類型</translation>
    </message>
    <message>
        <source>Unsupported operation</source>
        <translation>不支援的操作</translation>
    </message>
    <message>
        <source>Unsupported platform</source>
        <translation>不支援的平台</translation>
    </message>
    <message>
        <source>View</source>
        <translation>檢視</translation>
    </message>
</context>
</TS>
