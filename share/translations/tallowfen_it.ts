<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="it_IT" sourcelanguage="en_US">
<context>
    <name>EditNumberDialog</name>
    <message>
        <source>Hexadecimal</source>
        <translation>Esadecimale</translation>
    </message>
    <message>
        <source>Value name:</source>
        <translation>Nome valore:</translation>
    </message>
    <message>
        <source>Value data:</source>
        <translation>Dati valore:</translation>
    </message>
    <message>
        <source>Base</source>
        <translation>Base</translation>
    </message>
    <message>
        <source>Decimal</source>
        <translation>Decimale</translation>
    </message>
</context>
<context>
    <name>FailureReport</name>
    <message>
        <source>The registry cannot be read: %1</source>
        <translation>Impossibile leggere il registro: %1</translation>
    </message>
    <message>
        <source>The key &quot;%1&quot; cannot be read: %2</source>
        <translation>Impossibile leggere la chiave &quot;%1&quot;: %2</translation>
    </message>
    <message>
        <source>More keys cannot be read: %1</source>
        <translation>Altre chiavi che non si possono leggere: %1</translation>
    </message>
</context>
<context>
    <name>KeyDelegate</name>
    <message>
        <source>The specified key name already exists.</source>
        <translation>Il nome di chiave specificato esiste già.</translation>
    </message>
    <message>
        <source>(cannot be read)</source>
        <translation>(illeggibile)</translation>
    </message>
</context>
<context>
    <name>KeysView</name>
    <message>
        <source>New</source>
        <comment>menu title</comment>
        <translation>Nuovo</translation>
    </message>
    <message>
        <source>The key could not be created.</source>
        <translation>Impossibile creare la chiave.</translation>
    </message>
    <message>
        <source>The key could not be deleted.</source>
        <translation>Impossibile eliminare la chiave.</translation>
    </message>
    <message>
        <source>Confirm Key Removal</source>
        <translation>Conferma eliminazione chiave</translation>
    </message>
    <message>
        <source>Are you sure you want to delete this key and its subkeys?</source>
        <translation>Eliminare la chiave e le relative sottochiavi?</translation>
    </message>
</context>
<context>
    <name>MainWindow</name>
    <message>
        <source>(zero-length binary value)</source>
        <translation>(valore binario di lunghezza zero)</translation>
    </message>
    <message>
        <source>Find</source>
        <comment>dialog title</comment>
        <translation>Trova</translation>
    </message>
    <message>
        <source>Search term:</source>
        <translation>Termine da cercare:</translation>
    </message>
    <message>
        <source>Find keys</source>
        <translation>Cerca chiavi</translation>
    </message>
    <message>
        <source>Find values</source>
        <translation>Cerca valori</translation>
    </message>
    <message>
        <source>Find substring</source>
        <translation>Cerca parte del testo</translation>
    </message>
    <message>
        <source>Find whole string</source>
        <translation>Cerca il testo intero</translation>
    </message>
    <message>
        <source>Use wildcards</source>
        <translation>Usa caratteri jolly</translation>
    </message>
    <message>
        <source>Find</source>
        <comment>dialog title (search in progress</comment>
        <translation>Trova</translation>
    </message>
    <message>
        <source>Searching...</source>
        <translation>Ricerca in corso...</translation>
    </message>
    <message>
        <source>&amp;File</source>
        <comment>menu title</comment>
        <translation>&amp;File</translation>
    </message>
    <message>
        <source>Exit</source>
        <comment>menu item</comment>
        <translation>Esci</translation>
    </message>
    <message>
        <source>&amp;Edit</source>
        <comment>menu title</comment>
        <translation>&amp;Modifica</translation>
    </message>
    <message>
        <source>&amp;New</source>
        <comment>menu title</comment>
        <translation>&amp;Nuovo</translation>
    </message>
    <message>
        <source>Find...</source>
        <comment>menu item</comment>
        <translation>Trova...</translation>
    </message>
    <message>
        <source>Find next</source>
        <comment>menu item</comment>
        <translation>Trova successivo</translation>
    </message>
    <message>
        <source>&amp;View</source>
        <comment>menu title</comment>
        <translation>&amp;Visualizza</translation>
    </message>
    <message>
        <source>Refresh</source>
        <comment>menu item</comment>
        <translation>Aggiorna</translation>
    </message>
    <message>
        <source>The search could not go on: %1</source>
        <translation>Impossibile continuare la ricerca: %1</translation>
    </message>
    <message>
        <source>Finished searching.</source>
        <translation>Ricerca completata.</translation>
    </message>
    <message>
        <source>Key</source>
        <comment>menu item</comment>
        <translation>Chiave</translation>
    </message>
    <message>
        <source>String Value</source>
        <comment>menu item</comment>
        <translation>Valore stringa</translation>
    </message>
    <message>
        <source>Binary Value</source>
        <comment>menu item</comment>
        <translation>Valore binario</translation>
    </message>
    <message>
        <source>DWORD (32-bit) Value</source>
        <comment>menu item</comment>
        <translation>Valore DWORD (32 bit)</translation>
    </message>
    <message>
        <source>QWORD (64-bit) Value</source>
        <comment>menu item</comment>
        <translation>Valore QWORD (64 bit)</translation>
    </message>
    <message>
        <source>Multi-String Value</source>
        <comment>menu item</comment>
        <translation>Valore multistringa</translation>
    </message>
    <message>
        <source>Expandable String Value</source>
        <comment>menu item</comment>
        <translation>Valore stringa espandibile</translation>
    </message>
    <message>
        <source>Delete</source>
        <comment>menu item</comment>
        <translation>Elimina</translation>
    </message>
    <message>
        <source>Rename</source>
        <comment>menu item</comment>
        <translation>Rinomina</translation>
    </message>
</context>
<context>
    <name>QObject</name>
    <message>
        <source>Hibernation Detected</source>
        <translation>Ibernazione rilevata</translation>
    </message>
    <message>
        <source>Your system is in hibernate mode. Therefore the registry cannot be edited. Please restart your system and exit the hibernate mode or contact Zenta Support</source>
        <translation>Il sistema è ibernato. Pertanto il registro non può essere modificato. Riavviare il sistema e uscire dall&apos;ibernazione oppure contattare Zenta Support</translation>
    </message>
</context>
<context>
    <name>ValueDelegate</name>
    <message>
        <source>(value not set)</source>
        <translation>(valore non impostato)</translation>
    </message>
    <message>
        <source>The specified value name already exists.</source>
        <translation>Il nome di valore specificato esiste già.</translation>
    </message>
</context>
<context>
    <name>ValuesModel</name>
    <message>
        <source>(Default)</source>
        <translation>(Predefinito)</translation>
    </message>
    <message>
        <source>Name</source>
        <comment>column title</comment>
        <translation>Nome</translation>
    </message>
    <message>
        <source>Type</source>
        <comment>column title</comment>
        <translation>Tipo</translation>
    </message>
    <message>
        <source>Data</source>
        <comment>column title</comment>
        <translation>Dati</translation>
    </message>
</context>
<context>
    <name>ValuesProxyModel</name>
    <message>
        <source>(Default)</source>
        <translation>(Predefinito)</translation>
    </message>
</context>
<context>
    <name>ValuesView</name>
    <message>
        <source>Value name:</source>
        <translation>Nome valore:</translation>
    </message>
    <message>
        <source>Value data:</source>
        <translation>Dati valore:</translation>
    </message>
    <message>
        <source>Edit String</source>
        <comment>dialog title</comment>
        <translation>Modifica stringa</translation>
    </message>
    <message>
        <source>Edit Binary Value</source>
        <comment>dialog title</comment>
        <translation>Modifica valore binario</translation>
    </message>
    <message>
        <source>Edit Multi-String</source>
        <comment>dialog title</comment>
        <translation>Modifica multistringa</translation>
    </message>
    <message>
        <source>Data type cannot be edited yet</source>
        <translation>Questo tipo di dati non può ancora essere modificato</translation>
    </message>
    <message>
        <source>Edit DWORD (32-bit) Value</source>
        <comment>dialog title</comment>
        <translation>Modifica valore DWORD (32 bit)</translation>
    </message>
    <message>
        <source>Edit QWORD (64-bit) Value</source>
        <comment>dialog title</comment>
        <translation>Modifica valore QWORD (64 bit)</translation>
    </message>
    <message>
        <source>Edit</source>
        <comment>menu title</comment>
        <translation>Modifica</translation>
    </message>
    <message>
        <source>New</source>
        <comment>menu title</comment>
        <translation>Nuovo</translation>
    </message>
    <message>
        <source>The value could not be created.</source>
        <translation>Impossibile creare il valore.</translation>
    </message>
    <message>
        <source>The value could not be changed.</source>
        <translation>Impossibile modificare il valore.</translation>
    </message>
    <message>
        <source>Confirm Value Removal</source>
        <translation>Conferma eliminazione valore</translation>
    </message>
    <message>
        <source>Are you sure you want to delete this value?</source>
        <translation>Eliminare questo valore?</translation>
    </message>
    <message>
        <source>The value could not be deleted.</source>
        <translation>Impossibile eliminare il valore.</translation>
    </message>
</context>
</TS>
