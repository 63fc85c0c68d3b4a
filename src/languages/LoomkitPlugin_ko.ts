<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="ko">
<context>
    <name>QObject</name>
    <message>
        <source>Cancel</source>
        <translation>취소</translation>
    </message>
    <message>
        <source>No default xml was provided for app configuration.</source>
        <translation>앱 구성에 대한 기본 XML이 제공되지 않았습니다.</translation>
    </message>
    <message>
        <source>No key found for com.apple.configuration.managed.</source>
        <translation>com.apple.configuration.managed에 대한 키를 찾을 수 없습니다.</translation>
    </message>
    <message>
        <source>OK</source>
        <translation>확인</translation>
    </message>
    <message>
        <source>Open in </source>
        <translation>다음에서 열기: </translation>
    </message>
    <message>
        <source>Select from options</source>
        <translation>옵션에서 선택</translation>
    </message>
    <message>
        <source>Share Via</source>
        <translation>공유 방법</translation>
    </message>
    <message>
        <source>This platform does not support managed app configuration through MDM.</source>
        <translation>이 플랫폼은 MDM을 통한 관리형 앱 구성을 지원하지 않습니다.</translation>
    </message>
    <message>
        <source>Unsupported data type</source>
        <translation>지원되지 않는 데이터 유형</translation>
    </message>
    <message>
        <source>Unsupported operation</source>
        <translation>지원되지 않는 작업</translation>
    </message>
    <message>
        <source>Unsupported platform</source>
        <translation>지원되지 않는 플랫폼</translation>
    </message>
    <message>
        <source>View</source>
        <translation>보기</translation>
    </message>
</context>
</TS>
