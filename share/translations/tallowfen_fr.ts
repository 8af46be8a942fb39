<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="fr_FR" sourcelanguage="en_US">
<context>
    <name>EditNumberDialog</name>
    <message>
        <source>Hexadecimal</source>
        <translation>Hexadécimale</translation>
    </message>
    <message>
        <source>Value name:</source>
        <translation>Nom de la valeur :</translation>
    </message>
    <message>
        <source>Value data:</source>
        <translation>Données de la valeur :</translation>
    </message>
    <message>
        <source>Base</source>
        <translation>Base</translation>
    </message>
    <message>
        <source>Decimal</source>
        <translation>Décimale</translation>
    </message>
</context>
<context>
    <name>FailureReport</name>
    <message>
        <source>The registry cannot be read: %1</source>
        <translation>Impossible de lire le registre : %1</translation>
    </message>
    <message>
        <source>The key &quot;%1&quot; cannot be read: %2</source>
        <translation>Impossible de lire la clé « %1 » : %2</translation>
    </message>
    <message>
        <source>More keys cannot be read: %1</source>
        <translation>Autres clés impossibles à lire : %1</translation>
    </message>
</context>
<context>
    <name>KeyDelegate</name>
    <message>
        <source>The specified key name already exists.</source>
        <translation>Le nom de clé spécifié existe déjà.</translation>
    </message>
    <message>
        <source>(cannot be read)</source>
        <translation>(illisible)</translation>
    </message>
</context>
<context>
    <name>KeysView</name>
    <message>
        <source>New</source>
        <comment>menu title</comment>
        <translation>Nouveau</translation>
    </message>
    <message>
        <source>The key could not be created.</source>
        <translation>La clé n&apos;a pas pu être créée.</translation>
    </message>
    <message>
        <source>The key could not be deleted.</source>
        <translation>La clé n&apos;a pas pu être supprimée.</translation>
    </message>
    <message>
        <source>Confirm Key Removal</source>
        <translation>Confirmation de la suppression de la clé</translation>
    </message>
    <message>
        <source>Are you sure you want to delete this key and its subkeys?</source>
        <translation>Voulez-vous vraiment supprimer cette clé et ses sous-clés ?</translation>
    </message>
</context>
<context>
    <name>MainWindow</name>
    <message>
        <source>(zero-length binary value)</source>
        <translation>(valeur binaire de longueur nulle)</translation>
    </message>
    <message>
        <source>Find</source>
        <comment>dialog title</comment>
        <translation>Rechercher</translation>
    </message>
    <message>
        <source>Search term:</source>
        <translation>Terme à rechercher :</translation>
    </message>
    <message>
        <source>Find keys</source>
        <translation>Rechercher dans les clés</translation>
    </message>
    <message>
        <source>Find values</source>
        <translation>Rechercher dans les valeurs</translation>
    </message>
    <message>
        <source>Find substring</source>
        <translation>Rechercher une partie du texte</translation>
    </message>
    <message>
        <source>Find whole string</source>
        <translation>Rechercher le texte entier</translation>
    </message>
    <message>
        <source>Use wildcards</source>
        <translation>Utiliser des caractères génériques</translation>
    </message>
    <message>
        <source>Find</source>
        <comment>dialog title (search in progress</comment>
        <translation>Rechercher</translation>
    </message>
    <message>
        <source>Searching...</source>
        <translation>Recherche en cours...</translation>
    </message>
    <message>
        <source>&amp;File</source>
        <comment>menu title</comment>
        <translation>&amp;Fichier</translation>
    </message>
    <message>
        <source>Exit</source>
        <comment>menu item</comment>
        <translation>Quitter</translation>
    </message>
    <message>
        <source>&amp;Edit</source>
        <comment>menu title</comment>
        <translation>&amp;Édition</translation>
    </message>
    <message>
        <source>&amp;New</source>
        <comment>menu title</comment>
        <translation>&amp;Nouveau</translation>
    </message>
    <message>
        <source>Find...</source>
        <comment>menu item</comment>
        <translation>Rechercher...</translation>
    </message>
    <message>
        <source>Find next</source>
        <comment>menu item</comment>
        <translation>Rechercher le suivant</translation>
    </message>
    <message>
        <source>&amp;View</source>
        <comment>menu title</comment>
        <translation>&amp;Affichage</translation>
    </message>
    <message>
        <source>Refresh</source>
        <comment>menu item</comment>
        <translation>Actualiser</translation>
    </message>
    <message>
        <source>The search could not go on: %1</source>
        <translation>La recherche n&apos;a pas pu continuer : %1</translation>
    </message>
    <message>
        <source>Finished searching.</source>
        <translation>Recherche terminée.</translation>
    </message>
    <message>
        <source>Key</source>
        <comment>menu item</comment>
        <translation>Clé</translation>
    </message>
    <message>
        <source>String Value</source>
        <comment>menu item</comment>
        <translation>Valeur chaîne</translation>
    </message>
    <message>
        <source>Binary Value</source>
        <comment>menu item</comment>
        <translation>Valeur binaire</translation>
    </message>
    <message>
        <source>DWORD (32-bit) Value</source>
        <comment>menu item</comment>
        <translation>Valeur DWORD (32 bits)</translation>
    </message>
    <message>
        <source>QWORD (64-bit) Value</source>
        <comment>menu item</comment>
        <translation>Valeur QWORD (64 bits)</translation>
    </message>
    <message>
        <source>Multi-String Value</source>
        <comment>menu item</comment>
        <translation>Valeur de chaînes multiples</translation>
    </message>
    <message>
        <source>Expandable String Value</source>
        <comment>menu item</comment>
        <translation>Valeur de chaîne extensible</translation>
    </message>
    <message>
        <source>Delete</source>
        <comment>menu item</comment>
        <translation>Supprimer</translation>
    </message>
    <message>
        <source>Rename</source>
        <comment>menu item</comment>
        <translation>Renommer</translation>
    </message>
</context>
<context>
    <name>QObject</name>
    <message>
        <source>Hibernation Detected</source>
        <translation>Mise en veille prolongée détectée</translation>
    </message>
    <message>
        <source>Your system is in hibernate mode. Therefore the registry cannot be edited. Please restart your system and exit the hibernate mode or contact Zenta Support</source>
        <translation>Votre système est en veille prolongée. Le registre ne peut donc pas être modifié. Redémarrez votre système et quittez la veille prolongée, ou contactez le Zenta Support</translation>
    </message>
</context>
<context>
    <name>ValueDelegate</name>
    <message>
        <source>(value not set)</source>
        <translation>(valeur non définie)</translation>
    </message>
    <message>
        <source>The specified value name already exists.</source>
        <translation>Le nom de valeur spécifié existe déjà.</translation>
    </message>
</context>
<context>
    <name>ValuesModel</name>
    <message>
        <source>(Default)</source>
        <translation>(par défaut)</translation>
    </message>
    <message>
        <source>Name</source>
        <comment>column title</comment>
        <translation>Nom</translation>
    </message>
    <message>
        <source>Type</source>
        <comment>column title</comment>
        <translation>Type</translation>
    </message>
    <message>
        <source>Data</source>
        <comment>column title</comment>
        <translation>Données</translation>
    </message>
</context>
<context>
    <name>ValuesProxyModel</name>
    <message>
        <source>(Default)</source>
        <translation>(par défaut)</translation>
    </message>
</context>
<context>
    <name>ValuesView</name>
    <message>
        <source>Value name:</source>
        <translation>Nom de la valeur :</translation>
    </message>
    <message>
        <source>Value data:</source>
        <translation>Données de la valeur :</translation>
    </message>
    <message>
        <source>Edit String</source>
        <comment>dialog title</comment>
        <translation>Modifier la chaîne</translation>
    </message>
    <message>
        <source>Edit Binary Value</source>
        <comment>dialog title</comment>
        <translation>Modifier la valeur binaire</translation>
    </message>
    <message>
        <source>Edit Multi-String</source>
        <comment>dialog title</comment>
        <translation>Modifier les chaînes multiples</translation>
    </message>
    <message>
        <source>Data type cannot be edited yet</source>
        <translation>Ce type de données ne peut pas encore être modifié</translation>
    </message>
    <message>
        <source>Edit DWORD (32-bit) Value</source>
        <comment>dialog title</comment>
        <translation>Modifier la valeur DWORD (32 bits)</translation>
    </message>
    <message>
        <source>Edit QWORD (64-bit) Value</source>
        <comment>dialog title</comment>
        <translation>Modifier la valeur QWORD (64 bits)</translation>
    </message>
    <message>
        <source>Edit</source>
        <comment>menu title</comment>
        <translation>Modifier</translation>
    </message>
    <message>
        <source>New</source>
        <comment>menu title</comment>
        <translation>Nouveau</translation>
    </message>
    <message>
        <source>The value could not be created.</source>
        <translation>La valeur n&apos;a pas pu être créée.</translation>
    </message>
    <message>
        <source>The value could not be changed.</source>
        <translation>La valeur n&apos;a pas pu être modifiée.</translation>
    </message>
    <message>
        <source>Confirm Value Removal</source>
        <translation>Confirmation de la suppression de la valeur</translation>
    </message>
    <message>
        <source>Are you sure you want to delete this value?</source>
        <translation>Voulez-vous vraiment supprimer cette valeur ?</translation>
    </message>
    <message>
        <source>The value could not be deleted.</source>
        <translation>La valeur n&apos;a pas pu être supprimée.</translation>
    </message>
</context>
</TS>
