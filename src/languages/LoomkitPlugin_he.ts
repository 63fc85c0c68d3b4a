<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="he">
<context>
    <name>QObject</name>
    <message>
        <source>Cancel</source>
        <translation>ביטול</translation>
    </message>
    <message>
        <source>No default xml was provided for app configuration.</source>
        <translation>לא סופק קובץ XML ברירת מחדל עבור תצורת היישום.</translation>
    </message>
    <message>
        <source>No key found for com.apple.configuration.managed.</source>
        <translation>לא נמצא מפתח עבור com.apple.configuration.managed.</translation>
    </message>
    <message>
        <source>OK</source>
        <translation>אישור</translation>
    </message>
    <message>
        <source>Open in </source>
        <translation>פתיחה באמצעות </translation>
    </message>
    <message>
        <source>Select from options</source>
        <translation>בחירה מתוך האפשרויות</translation>
    </message>
    <message>
        <source>Share Via</source>
        <translation>שיתוף באמצעות</translation>
    </message>
    <message>
        <source>This platform does not support managed app configuration through MDM.</source>
        <translation>פלטפורמה זו אינה תומכת בתצורת יישומים מנוהלים באמצעות MDM.</translation>
    </message>
    <message>
        <source>Unsupported data type</source>
        <translation>סוג נתונים לא נתמך</translation>
    </message>
    <message>
        <source>Unsupported operation</source>
        <translation>פעולה לא נתמכת</translation>
    </message>
    <message>
        <source>Unsupported platform</source>
        <translation>פלטפורמה לא נתמכת</translation>
    </message>
    <message>
        <source>View</source>
        <translation>הצגה</translation>
    </message>
</context>
</TS>
