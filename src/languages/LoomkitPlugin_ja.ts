<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="ja">
<context>
    <name>QObject</name>
    <message>
        <source>Cancel</source>
        <translation>キャンセル</translation>
    </message>
    <message>
        <source>No default xml was provided for app configuration.</source>
        <translation>アプリ構成用のデフォルト XML が指定されていません。</translation>
    </message>
    <message>
        <source>No key found for com.apple.configuration.managed.</source>
        <translation>com.apple.configuration.managed のキーが見つかりません。</translation>
    </message>
    <message>
        <source>OK</source>
        <translation>OK</translation>
    </message>
    <message>
        <source>Open in </source>
        <translation>次で開く: </translation>
    </message>
    <message>
        <source>Select from options</source>
        <translation>オプションから選択</translation>
    </message>
    <message>
        <source>Share Via</source>
        <translation>共有方法</translation>
    </message>
    <message>
        <source>This platform does not support managed app configuration through MDM.</source>
        <translation>このプラットフォームは MDM による管理対象アプリ構成をサポートしていません。</translation>
    </message>
    <message>
        <source>Unsupported data type</source>
        <translation>サポートされていないデータ型</translation>
    </message>
    <message>
        <source>Unsupported operation</source>
        <translation>サポートされていない操作</translation>
    </message>
    <message>
        <source>Unsupported platform</source>
        <translation>サポートされていないプラットフォーム</translation>
    </message>
    <message>
        <source>View</source>
        <translation>表示</translation>
    </message>
</context>
</TS>
