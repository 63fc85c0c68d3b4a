<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="fr">
<context>
    <name>QObject</name>
    <message>
        <source>Cancel</source>
        <translation>Annuler</translation>
    </message>
    <message>
        <source>No default xml was provided for app configuration.</source>
        <translation>Aucun XML par défaut n’a été fourni pour la configuration de l’application.</translation>
    </message>
    <message>
        <source>No key found for com.apple.configuration.managed.</source>
        <translation>Aucune clé trouvée pour com.apple.configuration.managed.</translation>
    </message>
    <message>
        <source>OK</source>
        <translation>OK</translation>
    </message>
    <message>
        <source>Open in </source>
        <translation>Ouvrir dans </translation>
    </message>
    <message>
        <source>Select from options</source>
        <translation>Sélectionnez parmi les options</translation>
    </message>
    <message>
        <source>Share Via</source>
        <translation>Partager via</translation>
    </message>
    <message>
        <source>This platform does not support managed app configuration through MDM.</source>
        <translation>Cette plateforme ne prend pas en charge la configuration d’applications gérées via MDM.</translation>
    </message>
    <message>
        <source>Unsupported data type</source>
        <translation>Type de données non pris en charge</translation>
    </message>
    <message>
        <source>Unsupported operation</source>
        <translation>Opération non prise en charge</translation>
    </message>
    <message>
        <source>Unsupported platform</source>
        <translation>Plateforme non prise en charge</translation>
    </message>
    <message>
        <source>View</source>
        <translation>Afficher</translation>
    </message>
</context>
</TS>
