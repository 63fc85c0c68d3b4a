<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="ar">
<context>
    <name>QObject</name>
    <message>
        <source>Cancel</source>
        <translation>إلغاء</translation>
    </message>
    <message>
        <source>No default xml was provided for app configuration.</source>
        <translation>لم يتم توفير ملف XML افتراضي لتكوين التطبيق.</translation>
    </message>
    <message>
        <source>No key found for com.apple.configuration.managed.</source>
        <translation>لم يتم العثور على مفتاح لـ com.apple.configuration.managed.</translation>
    </message>
    <message>
        <source>OK</source>
        <translation>موافق</translation>
    </message>
    <message>
        <source>Open in </source>
        <translation>فتح في </translation>
    </message>
    <message>
        <source>Select from options</source>
        <translation>اختر من الخيارات</translation>
    </message>
    <message>
        <source>Share Via</source>
        <translation>مشاركة عبر</translation>
    </message>
    <message>
        <source>This platform does not support managed app configuration through MDM.</source>
        <translation>لا يدعم هذا النظام الأساسي تكوين التطبيقات المُدارة عبر MDM.</translation>
    </message>
    <message>
        <source>Unsupported data type</source>
        <translation>نوع بيانات غير مدعوم</translation>
    </message>
    <message>
        <source>Unsupported operation</source>
        <translation>عملية غير مدعومة</translation>
    </message>
    <message>
        <source>Unsupported platform</source>
        <translation>نظام أساسي غير مدعوم</translation>
    </message>
    <message>
        <source>View</source>
        <translation>عرض</translation>
    </message>
</context>
</TS>
