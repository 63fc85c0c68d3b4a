<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="el">
<context>
    <name>QObject</name>
    <message>
        <source>Cancel</source>
        <translation>Ακύρωση</translation>
    </message>
    <message>
        <source>No default xml was provided for app configuration.</source>
        <translation>Δεν παρασχέθηκε προεπιλεγμένο XML για τη διαμόρφωση της εφαρμογής.</translation>
    </message>
    <message>
        <source>No key found for com.apple.configuration.managed.</source>
        <translation>Δεν βρέθηκε κλειδί για το com.apple.configuration.managed.</translation>
    </message>
    <message>
        <source>OK</source>
        <translation>OK</translation>
    </message>
    <message>
        <source>Open in </source>
        <translation>Άνοιγμα σε </translation>
    </message>
    <message>
        <source>Select from options</source>
        <translation>Επιλέξτε από τις επιλογές</translation>
    </message>
    <message>
        <source>Share Via</source>
        <translation>Κοινή χρήση μέσω</translation>
    </message>
    <message>
        <source>This platform does not support managed app configuration through MDM.</source>
        <translation>Αυτή η πλατφόρμα δεν υποστηρίζει διαμόρφωση διαχειριζόμενων εφαρμογών μέσω MDM.</translation>
    </message>
    <message>
        <source>Unsupported data type</source>
        <translation>Μη υποστηριζόμενος τύπος δεδομένων</translation>
    </message>
    <message>
        <source>Unsupported operation</source>
        <translation>Μη υποστηριζόμενη λειτουργία</translation>
    </message>
    <message>
        <source>Unsupported platform</source>
        <translation>Μη υποστηριζόμενη πλατφόρμα</translation>
    </message>
    <message>
        <source>View</source>
        <translation>Προβολή</translation>
    </message>
</context>
</TS>
