<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="pt_PT">
<context>
    <name>QObject</name>
    <message>
        <source>Cancel</source>
        <translation>Cancelar</translation>
    </message>
    <message>
        <source>No default xml was provided for app configuration.</source>
        <translation>Não foi fornecido nenhum XML predefinido para a configuração da aplicação.</translation>
    </message>
    <message>
        <source>No key found for com.apple.configuration.managed.</source>
        <translation>Não foi encontrada nenhuma chave para com.apple.configuration.managed.</translation>
    </message>
    <message>
        <source>OK</source>
        <translation>OK</translation>
    </message>
    <message>
        <source>Open in </source>
        <translation>Abrir em </translation>
    </message>
    <message>
        <source>Select from options</source>
        <translation>Selecione uma das opções</translation>
    </message>
    <message>
        <source>Share Via</source>
        <translation>Partilhar via</translation>
    </message>
    <message>
        <source>This platform does not support managed app configuration through MDM.</source>
        <translation>Esta plataforma não suporta a configuração de aplicações geridas através de MDM.</translation>
    </message>
    <message>
        <source>Unsupported data type</source>
        <translation>Tipo de dados não suportado</translation>
    </message>
    <message>
        <source>Unsupported operation</source>
        <translation>Operação não suportada</translation>
    </message>
    <message>
        <source>Unsupported platform</source>
        <translation>Plataforma não suportada</translation>
    </message>
    <message>
        <source>View</source>
        <translation>Ver</translation>
    </message>
</context>
</TS>
