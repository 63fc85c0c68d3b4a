<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="zh_CN">
<context>
    <name>QObject</name>
    <message>
        <source>Cancel</source>
        <translation>取消</translation>
    </message>
    <message>
        <source>No default xml was provided for app configuration.</source>
        <translation>未提供用于应用配置的默认 XML。</translation>
    </message>
    <message>
        <source>No key found for com.apple.configuration.managed.</source>
        <translation>未找到 com.apple.configuration.managed 的键。</translation>
    </message>
    <message>
        <source>OK</source>
        <translation>确定</translation>
    </message>
    <message>
        <source>Open in </source>
        <translation>打开于 </translation>
    </message>
    <message>
        <source>Select from options</source>
        <translation>从选项中选择</translation>
    </message>
    <message>
        <source>Share Via</source>
        <translation>分享方式</translation>
    </message>
    <message>
        <source>This platform does not support managed app configuration through MDM.</source>
        <translation>此平台不支持通过 MDM 进行托管应用配置。</translation>
    </message>
    <message>
        <source>Unsupported data type</source>
        <translation>不支持的数据类型</translation>
    </message>
    <message>
        <source>Unsupported operation</source>
        <translation>不支持的操作</translation>
    </message>
    <message>
        <source>Unsupported platform</source>
        <translation>不支持的平台</translation>
    </message>
    <message>
        <source>View</source>
        <translation>查看</translation>
    </message>
</context>
</TS>
