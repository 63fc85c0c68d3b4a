<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="th">
<context>
    <name>QObject</name>
    <message>
        <source>Cancel</source>
        <translation>ยกเลิก</translation>
    </message>
    <message>
        <source>No default xml was provided for app configuration.</source>
        <translation>ไม่ได้ระบุ XML เริ่มต้นสำหรับการกำหนดค่าแอป</translation>
    </message>
    <message>
        <source>No key found for com.apple.configuration.managed.</source>
        <translation>ไม่พบคีย์สำหรับ com.apple.configuration.managed</translation>
    </message>
    <message>
        <source>OK</source>
        <translation>ตกลง</translation>
    </message>
    <message>
        <source>Open in </source>
        <translation>เปิดใน </translation>
    </message>
    <message>
        <source>Select from options</source>
        <translation>เลือกจากตัวเลือก</translation>
    </message>
    <message>
        <source>Share Via</source>
        <translation>แชร์ผ่าน</translation>
    </message>
    <message>
        <source>This platform does not support managed app configuration through MDM.</source>
        <translation>แพลตฟอร์มนี้ไม่รองรับการกำหนดค่าแอปที่มีการจัดการผ่าน MDM</translation>
    </message>
    <message>
        <source>Unsupported data type</source>
        <translation>ไม่รองรับชนิดข้อมูลนี้</translation>
    </message>
    <message>
        <source>Unsupported operation</source>
        <translation>ไม่รองรับการดำเนินการนี้</translation>
    </message>
    <message>
        <source>Unsupported platform</source>
        <translation>ไม่รองรับแพลตฟอร์มนี้</translation>
    </message>
    <message>
        <source>View</source>
        <translation>ดู</translation>
    </message>
</context>
</TS>
