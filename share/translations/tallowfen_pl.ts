<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="pl_PL" sourcelanguage="en_US">
<context>
    <name>EditNumberDialog</name>
    <message>
        <source>Hexadecimal</source>
        <translation>Szesnastkowy</translation>
    </message>
    <message>
        <source>Value name:</source>
        <translation>Nazwa wartości:</translation>
    </message>
    <message>
        <source>Value data:</source>
        <translation>Dane wartości:</translation>
    </message>
    <message>
        <source>Base</source>
        <translation>System</translation>
    </message>
    <message>
        <source>Decimal</source>
        <translation>Dziesiętny</translation>
    </message>
</context>
<context>
    <name>FailureReport</name>
    <message>
        <source>The registry cannot be read: %1</source>
        <translation>Nie można odczytać rejestru: %1</translation>
    </message>
    <message>
        <source>The key &quot;%1&quot; cannot be read: %2</source>
        <translation>Nie można odczytać klucza „%1”: %2</translation>
    </message>
    <message>
        <source>More keys cannot be read: %1</source>
        <translation>Inne klucze, których nie można odczytać: %1</translation>
    </message>
</context>
<context>
    <name>KeyDelegate</name>
    <message>
        <source>The specified key name already exists.</source>
        <translation>Podana nazwa klucza już istnieje.</translation>
    </message>
    <message>
        <source>(cannot be read)</source>
        <translation>(nie można odczytać)</translation>
    </message>
</context>
<context>
    <name>KeysView</name>
    <message>
        <source>New</source>
        <comment>menu title</comment>
        <translation>Nowy</translation>
    </message>
    <message>
        <source>The key could not be created.</source>
        <translation>Nie można utworzyć klucza.</translation>
    </message>
    <message>
        <source>The key could not be deleted.</source>
        <translation>Nie można usunąć klucza.</translation>
    </message>
    <message>
        <source>Confirm Key Removal</source>
        <translation>Potwierdzenie usunięcia klucza</translation>
    </message>
    <message>
        <source>Are you sure you want to delete this key and its subkeys?</source>
        <translation>Czy na pewno chcesz usunąć ten klucz i jego podklucze?</translation>
    </message>
</context>
<context>
    <name>MainWindow</name>
    <message>
        <source>(zero-length binary value)</source>
        <translation>(wartość binarna o zerowej długości)</translation>
    </message>
    <message>
        <source>Find</source>
        <comment>dialog title</comment>
        <translation>Znajdowanie</translation>
    </message>
    <message>
        <source>Search term:</source>
        <translation>Szukany tekst:</translation>
    </message>
    <message>
        <source>Find keys</source>
        <translation>Szukaj kluczy</translation>
    </message>
    <message>
        <source>Find values</source>
        <translation>Szukaj wartości</translation>
    </message>
    <message>
        <source>Find substring</source>
        <translation>Szukaj fragmentu ciągu</translation>
    </message>
    <message>
        <source>Find whole string</source>
        <translation>Szukaj całego ciągu</translation>
    </message>
    <message>
        <source>Use wildcards</source>
        <translation>Użyj symboli wieloznacznych</translation>
    </message>
    <message>
        <source>Find</source>
        <comment>dialog title (search in progress</comment>
        <translation>Znajdowanie</translation>
    </message>
    <message>
        <source>Searching...</source>
        <translation>Wyszukiwanie...</translation>
    </message>
    <message>
        <source>&amp;File</source>
        <comment>menu title</comment>
        <translation>&amp;Plik</translation>
    </message>
    <message>
        <source>Exit</source>
        <comment>menu item</comment>
        <translation>Zakończ</translation>
    </message>
    <message>
        <source>&amp;Edit</source>
        <comment>menu title</comment>
        <translation>&amp;Edycja</translation>
    </message>
    <message>
        <source>&amp;New</source>
        <comment>menu title</comment>
        <translation>&amp;Nowy</translation>
    </message>
    <message>
        <source>Find...</source>
        <comment>menu item</comment>
        <translation>Znajdź...</translation>
    </message>
    <message>
        <source>Find next</source>
        <comment>menu item</comment>
        <translation>Znajdź następny</translation>
    </message>
    <message>
        <source>&amp;View</source>
        <comment>menu title</comment>
        <translation>&amp;Widok</translation>
    </message>
    <message>
        <source>Refresh</source>
        <comment>menu item</comment>
        <translation>Odśwież</translation>
    </message>
    <message>
        <source>The search could not go on: %1</source>
        <translation>Nie można kontynuować wyszukiwania: %1</translation>
    </message>
    <message>
        <source>Finished searching.</source>
        <translation>Zakończono wyszukiwanie.</translation>
    </message>
    <message>
        <source>Key</source>
        <comment>menu item</comment>
        <translation>Klucz</translation>
    </message>
    <message>
        <source>String Value</source>
        <comment>menu item</comment>
        <translation>Wartość ciągu</translation>
    </message>
    <message>
        <source>Binary Value</source>
        <comment>menu item</comment>
        <translation>Wartość binarna</translation>
    </message>
    <message>
        <source>DWORD (32-bit) Value</source>
        <comment>menu item</comment>
        <translation>Wartość DWORD (32-bitowa)</translation>
    </message>
    <message>
        <source>QWORD (64-bit) Value</source>
        <comment>menu item</comment>
        <translation>Wartość QWORD (64-bitowa)</translation>
    </message>
    <message>
        <source>Multi-String Value</source>
        <comment>menu item</comment>
        <translation>Wartość ciągu wielokrotnego</translation>
    </message>
    <message>
        <source>Expandable String Value</source>
        <comment>menu item</comment>
        <translation>Wartość ciągu rozwijalnego</translation>
    </message>
    <message>
        <source>Delete</source>
        <comment>menu item</comment>
        <translation>Usuń</translation>
    </message>
    <message>
        <source>Rename</source>
        <comment>menu item</comment>
        <translation>Zmień nazwę</translation>
    </message>
</context>
<context>
    <name>QObject</name>
    <message>
        <source>Hibernation Detected</source>
        <translation>Wykryto hibernację</translation>
    </message>
    <message>
        <source>Your system is in hibernate mode. Therefore the registry cannot be edited. Please restart your system and exit the hibernate mode or contact Zenta Support</source>
        <translation>System jest w stanie hibernacji. Dlatego nie można edytować rejestru. Uruchom system ponownie i zakończ hibernację lub skontaktuj się z Zenta Support</translation>
    </message>
</context>
<context>
    <name>ValueDelegate</name>
    <message>
        <source>(value not set)</source>
        <translation>(wartość nie ustalona)</translation>
    </message>
    <message>
        <source>The specified value name already exists.</source>
        <translation>Podana nazwa wartości już istnieje.</translation>
    </message>
</context>
<context>
    <name>ValuesModel</name>
    <message>
        <source>(Default)</source>
        <translation>(Domyślna)</translation>
    </message>
    <message>
        <source>Name</source>
        <comment>column title</comment>
        <translation>Nazwa</translation>
    </message>
    <message>
        <source>Type</source>
        <comment>column title</comment>
        <translation>Typ</translation>
    </message>
    <message>
        <source>Data</source>
        <comment>column title</comment>
        <translation>Dane</translation>
    </message>
</context>
<context>
    <name>ValuesProxyModel</name>
    <message>
        <source>(Default)</source>
        <translation>(Domyślna)</translation>
    </message>
</context>
<context>
    <name>ValuesView</name>
    <message>
        <source>Value name:</source>
        <translation>Nazwa wartości:</translation>
    </message>
    <message>
        <source>Value data:</source>
        <translation>Dane wartości:</translation>
    </message>
    <message>
        <source>Edit String</source>
        <comment>dialog title</comment>
        <translation>Edytowanie ciągu</translation>
    </message>
    <message>
        <source>Edit Binary Value</source>
        <comment>dialog title</comment>
        <translation>Edytowanie wartości binarnej</translation>
    </message>
    <message>
        <source>Edit Multi-String</source>
        <comment>dialog title</comment>
        <translation>Edytowanie ciągu wielokrotnego</translation>
    </message>
    <message>
        <source>Data type cannot be edited yet</source>
        <translation>Tego typu danych nie można jeszcze edytować</translation>
    </message>
    <message>
        <source>Edit DWORD (32-bit) Value</source>
        <comment>dialog title</comment>
        <translation>Edytowanie wartości DWORD (32-bitowej)</translation>
    </message>
    <message>
        <source>Edit QWORD (64-bit) Value</source>
        <comment>dialog title</comment>
        <translation>Edytowanie wartości QWORD (64-bitowej)</translation>
    </message>
    <message>
        <source>Edit</source>
        <comment>menu title</comment>
        <translation>Edytuj</translation>
    </message>
    <message>
        <source>New</source>
        <comment>menu title</comment>
        <translation>Nowy</translation>
    </message>
    <message>
        <source>The value could not be created.</source>
        <translation>Nie można utworzyć wartości.</translation>
    </message>
    <message>
        <source>The value could not be changed.</source>
        <translation>Nie można zmienić wartości.</translation>
    </message>
    <message>
        <source>Confirm Value Removal</source>
        <translation>Potwierdzenie usunięcia wartości</translation>
    </message>
    <message>
        <source>Are you sure you want to delete this value?</source>
        <translation>Czy na pewno chcesz usunąć tę wartość?</translation>
    </message>
    <message>
        <source>The value could not be deleted.</source>
        <translation>Nie można usunąć wartości.</translation>
    </message>
</context>
</TS>
