<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="de_DE" sourcelanguage="en_US">
<context>
    <name>EditNumberDialog</name>
    <message>
        <source>Hexadecimal</source>
        <translation>Hexadezimal</translation>
    </message>
    <message>
        <source>Value name:</source>
        <translation>Name des Werts:</translation>
    </message>
    <message>
        <source>Value data:</source>
        <translation>Wert:</translation>
    </message>
    <message>
        <source>Base</source>
        <translation>Basis</translation>
    </message>
    <message>
        <source>Decimal</source>
        <translation>Dezimal</translation>
    </message>
</context>
<context>
    <name>FailureReport</name>
    <message>
        <source>The registry cannot be read: %1</source>
        <translation>Die Registrierung kann nicht gelesen werden: %1</translation>
    </message>
    <message>
        <source>The key &quot;%1&quot; cannot be read: %2</source>
        <translation>Der Schlüssel „%1“ kann nicht gelesen werden: %2</translation>
    </message>
    <message>
        <source>More keys cannot be read: %1</source>
        <translation>Weitere Schlüssel, die nicht gelesen werden können: %1</translation>
    </message>
</context>
<context>
    <name>KeyDelegate</name>
    <message>
        <source>The specified key name already exists.</source>
        <translation>Der angegebene Schlüsselname ist bereits vorhanden.</translation>
    </message>
    <message>
        <source>(cannot be read)</source>
        <translation>(kann nicht gelesen werden)</translation>
    </message>
</context>
<context>
    <name>KeysView</name>
    <message>
        <source>New</source>
        <comment>menu title</comment>
        <translation>Neu</translation>
    </message>
    <message>
        <source>The key could not be created.</source>
        <translation>Der Schlüssel konnte nicht erstellt werden.</translation>
    </message>
    <message>
        <source>The key could not be deleted.</source>
        <translation>Der Schlüssel konnte nicht gelöscht werden.</translation>
    </message>
    <message>
        <source>Confirm Key Removal</source>
        <translation>Löschen des Schlüssels bestätigen</translation>
    </message>
    <message>
        <source>Are you sure you want to delete this key and its subkeys?</source>
        <translation>Möchten Sie diesen Schlüssel und seine Unterschlüssel wirklich löschen?</translation>
    </message>
</context>
<context>
    <name>MainWindow</name>
    <message>
        <source>(zero-length binary value)</source>
        <translation>(Binärwert der Länge Null)</translation>
    </message>
    <message>
        <source>Find</source>
        <comment>dialog title</comment>
        <translation>Suchen</translation>
    </message>
    <message>
        <source>Search term:</source>
        <translation>Suchbegriff:</translation>
    </message>
    <message>
        <source>Find keys</source>
        <translation>Schlüssel suchen</translation>
    </message>
    <message>
        <source>Find values</source>
        <translation>Werte suchen</translation>
    </message>
    <message>
        <source>Find substring</source>
        <translation>Teil der Zeichenfolge suchen</translation>
    </message>
    <message>
        <source>Find whole string</source>
        <translation>Ganze Zeichenfolge suchen</translation>
    </message>
    <message>
        <source>Use wildcards</source>
        <translation>Platzhalter verwenden</translation>
    </message>
    <message>
        <source>Find</source>
        <comment>dialog title (search in progress</comment>
        <translation>Suchen</translation>
    </message>
    <message>
        <source>Searching...</source>
        <translation>Suche läuft...</translation>
    </message>
    <message>
        <source>&amp;File</source>
        <comment>menu title</comment>
        <translation>&amp;Datei</translation>
    </message>
    <message>
        <source>Exit</source>
        <comment>menu item</comment>
        <translation>Beenden</translation>
    </message>
    <message>
        <source>&amp;Edit</source>
        <comment>menu title</comment>
        <translation>&amp;Bearbeiten</translation>
    </message>
    <message>
        <source>&amp;New</source>
        <comment>menu title</comment>
        <translation>&amp;Neu</translation>
    </message>
    <message>
        <source>Find...</source>
        <comment>menu item</comment>
        <translation>Suchen...</translation>
    </message>
    <message>
        <source>Find next</source>
        <comment>menu item</comment>
        <translation>Weitersuchen</translation>
    </message>
    <message>
        <source>&amp;View</source>
        <comment>menu title</comment>
        <translation>&amp;Ansicht</translation>
    </message>
    <message>
        <source>Refresh</source>
        <comment>menu item</comment>
        <translation>Aktualisieren</translation>
    </message>
    <message>
        <source>The search could not go on: %1</source>
        <translation>Die Suche konnte nicht fortgesetzt werden: %1</translation>
    </message>
    <message>
        <source>Finished searching.</source>
        <translation>Die Suche ist beendet.</translation>
    </message>
    <message>
        <source>Key</source>
        <comment>menu item</comment>
        <translation>Schlüssel</translation>
    </message>
    <message>
        <source>String Value</source>
        <comment>menu item</comment>
        <translation>Zeichenfolge</translation>
    </message>
    <message>
        <source>Binary Value</source>
        <comment>menu item</comment>
        <translation>Binärwert</translation>
    </message>
    <message>
        <source>DWORD (32-bit) Value</source>
        <comment>menu item</comment>
        <translation>DWORD-Wert (32-Bit)</translation>
    </message>
    <message>
        <source>QWORD (64-bit) Value</source>
        <comment>menu item</comment>
        <translation>QWORD-Wert (64-Bit)</translation>
    </message>
    <message>
        <source>Multi-String Value</source>
        <comment>menu item</comment>
        <translation>Mehrteilige Zeichenfolge</translation>
    </message>
    <message>
        <source>Expandable String Value</source>
        <comment>menu item</comment>
        <translation>Erweiterbare Zeichenfolge</translation>
    </message>
    <message>
        <source>Delete</source>
        <comment>menu item</comment>
        <translation>Löschen</translation>
    </message>
    <message>
        <source>Rename</source>
        <comment>menu item</comment>
        <translation>Umbenennen</translation>
    </message>
</context>
<context>
    <name>QObject</name>
    <message>
        <source>Hibernation Detected</source>
        <translation>Ruhezustand erkannt</translation>
    </message>
    <message>
        <source>Your system is in hibernate mode. Therefore the registry cannot be edited. Please restart your system and exit the hibernate mode or contact Zenta Support</source>
        <translation>Ihr System befindet sich im Ruhezustand. Die Registrierung kann daher nicht bearbeitet werden. Bitte starten Sie Ihr System neu und beenden Sie den Ruhezustand, oder wenden Sie sich an den Zenta Support</translation>
    </message>
</context>
<context>
    <name>ValueDelegate</name>
    <message>
        <source>(value not set)</source>
        <translation>(Wert nicht festgelegt)</translation>
    </message>
    <message>
        <source>The specified value name already exists.</source>
        <translation>Der angegebene Wertname ist bereits vorhanden.</translation>
    </message>
</context>
<context>
    <name>ValuesModel</name>
    <message>
        <source>(Default)</source>
        <translation>(Standard)</translation>
    </message>
    <message>
        <source>Name</source>
        <comment>column title</comment>
        <translation>Name</translation>
    </message>
    <message>
        <source>Type</source>
        <comment>column title</comment>
        <translation>Typ</translation>
    </message>
    <message>
        <source>Data</source>
        <comment>column title</comment>
        <translation>Daten</translation>
    </message>
</context>
<context>
    <name>ValuesProxyModel</name>
    <message>
        <source>(Default)</source>
        <translation>(Standard)</translation>
    </message>
</context>
<context>
    <name>ValuesView</name>
    <message>
        <source>Value name:</source>
        <translation>Name des Werts:</translation>
    </message>
    <message>
        <source>Value data:</source>
        <translation>Wert:</translation>
    </message>
    <message>
        <source>Edit String</source>
        <comment>dialog title</comment>
        <translation>Zeichenfolge bearbeiten</translation>
    </message>
    <message>
        <source>Edit Binary Value</source>
        <comment>dialog title</comment>
        <translation>Binärwert bearbeiten</translation>
    </message>
    <message>
        <source>Edit Multi-String</source>
        <comment>dialog title</comment>
        <translation>Mehrteilige Zeichenfolge bearbeiten</translation>
    </message>
    <message>
        <source>Data type cannot be edited yet</source>
        <translation>Dieser Datentyp kann noch nicht bearbeitet werden</translation>
    </message>
    <message>
        <source>Edit DWORD (32-bit) Value</source>
        <comment>dialog title</comment>
        <translation>DWORD-Wert (32-Bit) bearbeiten</translation>
    </message>
    <message>
        <source>Edit QWORD (64-bit) Value</source>
        <comment>dialog title</comment>
        <translation>QWORD-Wert (64-Bit) bearbeiten</translation>
    </message>
    <message>
        <source>Edit</source>
        <comment>menu title</comment>
        <translation>Bearbeiten</translation>
    </message>
    <message>
        <source>New</source>
        <comment>menu title</comment>
        <translation>Neu</translation>
    </message>
    <message>
        <source>The value could not be created.</source>
        <translation>Der Wert konnte nicht erstellt werden.</translation>
    </message>
    <message>
        <source>The value could not be changed.</source>
        <translation>Der Wert konnte nicht geändert werden.</translation>
    </message>
    <message>
        <source>Confirm Value Removal</source>
        <translation>Löschen des Werts bestätigen</translation>
    </message>
    <message>
        <source>Are you sure you want to delete this value?</source>
        <translation>Möchten Sie diesen Wert wirklich löschen?</translation>
    </message>
    <message>
        <source>The value could not be deleted.</source>
        <translation>Der Wert konnte nicht gelöscht werden.</translation>
    </message>
</context>
</TS>
