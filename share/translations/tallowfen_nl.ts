<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="nl_NL" sourcelanguage="en_US">
<context>
    <name>EditNumberDialog</name>
    <message>
        <source>Hexadecimal</source>
        <translation>Hexadecimaal</translation>
    </message>
    <message>
        <source>Value name:</source>
        <translation>Naam van de waarde:</translation>
    </message>
    <message>
        <source>Value data:</source>
        <translation>Waardegegevens:</translation>
    </message>
    <message>
        <source>Base</source>
        <translation>Grondtal</translation>
    </message>
    <message>
        <source>Decimal</source>
        <translation>Decimaal</translation>
    </message>
</context>
<context>
    <name>FailureReport</name>
    <message>
        <source>The registry cannot be read: %1</source>
        <translation>Het register kan niet worden gelezen: %1</translation>
    </message>
    <message>
        <source>The key &quot;%1&quot; cannot be read: %2</source>
        <translation>De sleutel &quot;%1&quot; kan niet worden gelezen: %2</translation>
    </message>
    <message>
        <source>More keys cannot be read: %1</source>
        <translation>Andere sleutels die niet kunnen worden gelezen: %1</translation>
    </message>
</context>
<context>
    <name>KeyDelegate</name>
    <message>
        <source>The specified key name already exists.</source>
        <translation>De opgegeven sleutelnaam bestaat al.</translation>
    </message>
    <message>
        <source>(cannot be read)</source>
        <translation>(kan niet worden gelezen)</translation>
    </message>
</context>
<context>
    <name>KeysView</name>
    <message>
        <source>New</source>
        <comment>menu title</comment>
        <translation>Nieuw</translation>
    </message>
    <message>
        <source>The key could not be created.</source>
        <translation>De sleutel kan niet worden gemaakt.</translation>
    </message>
    <message>
        <source>The key could not be deleted.</source>
        <translation>De sleutel kan niet worden verwijderd.</translation>
    </message>
    <message>
        <source>Confirm Key Removal</source>
        <translation>Verwijderen van sleutel bevestigen</translation>
    </message>
    <message>
        <source>Are you sure you want to delete this key and its subkeys?</source>
        <translation>Weet u zeker dat u deze sleutel en de subsleutels ervan wilt verwijderen?</translation>
    </message>
</context>
<context>
    <name>MainWindow</name>
    <message>
        <source>(zero-length binary value)</source>
        <translation>(binaire waarde met lengte nul)</translation>
    </message>
    <message>
        <source>Find</source>
        <comment>dialog title</comment>
        <translation>Zoeken</translation>
    </message>
    <message>
        <source>Search term:</source>
        <translation>Zoekterm:</translation>
    </message>
    <message>
        <source>Find keys</source>
        <translation>Sleutels zoeken</translation>
    </message>
    <message>
        <source>Find values</source>
        <translation>Waarden zoeken</translation>
    </message>
    <message>
        <source>Find substring</source>
        <translation>Deel van tekenreeks zoeken</translation>
    </message>
    <message>
        <source>Find whole string</source>
        <translation>Hele tekenreeks zoeken</translation>
    </message>
    <message>
        <source>Use wildcards</source>
        <translation>Jokertekens gebruiken</translation>
    </message>
    <message>
        <source>Find</source>
        <comment>dialog title (search in progress</comment>
        <translation>Zoeken</translation>
    </message>
    <message>
        <source>Searching...</source>
        <translation>Bezig met zoeken...</translation>
    </message>
    <message>
        <source>&amp;File</source>
        <comment>menu title</comment>
        <translation>&amp;Bestand</translation>
    </message>
    <message>
        <source>Exit</source>
        <comment>menu item</comment>
        <translation>Afsluiten</translation>
    </message>
    <message>
        <source>&amp;Edit</source>
        <comment>menu title</comment>
        <translation>Be&amp;werken</translation>
    </message>
    <message>
        <source>&amp;New</source>
        <comment>menu title</comment>
        <translation>&amp;Nieuw</translation>
    </message>
    <message>
        <source>Find...</source>
        <comment>menu item</comment>
        <translation>Zoeken...</translation>
    </message>
    <message>
        <source>Find next</source>
        <comment>menu item</comment>
        <translation>Volgende zoeken</translation>
    </message>
    <message>
        <source>&amp;View</source>
        <comment>menu title</comment>
        <translation>Bee&amp;ld</translation>
    </message>
    <message>
        <source>Refresh</source>
        <comment>menu item</comment>
        <translation>Vernieuwen</translation>
    </message>
    <message>
        <source>The search could not go on: %1</source>
        <translation>Het zoeken kan niet worden voortgezet: %1</translation>
    </message>
    <message>
        <source>Finished searching.</source>
        <translation>Zoeken is voltooid.</translation>
    </message>
    <message>
        <source>Key</source>
        <comment>menu item</comment>
        <translation>Sleutel</translation>
    </message>
    <message>
        <source>String Value</source>
        <comment>menu item</comment>
        <translation>Tekenreekswaarde</translation>
    </message>
    <message>
        <source>Binary Value</source>
        <comment>menu item</comment>
        <translation>Binaire waarde</translation>
    </message>
    <message>
        <source>DWORD (32-bit) Value</source>
        <comment>menu item</comment>
        <translation>DWORD-waarde (32-bits)</translation>
    </message>
    <message>
        <source>QWORD (64-bit) Value</source>
        <comment>menu item</comment>
        <translation>QWORD-waarde (64-bits)</translation>
    </message>
    <message>
        <source>Multi-String Value</source>
        <comment>menu item</comment>
        <translation>Waarde met meerdere tekenreeksen</translation>
    </message>
    <message>
        <source>Expandable String Value</source>
        <comment>menu item</comment>
        <translation>Uitbreidbare tekenreekswaarde</translation>
    </message>
    <message>
        <source>Delete</source>
        <comment>menu item</comment>
        <translation>Verwijderen</translation>
    </message>
    <message>
        <source>Rename</source>
        <comment>menu item</comment>
        <translation>Naam wijzigen</translation>
    </message>
</context>
<context>
    <name>QObject</name>
    <message>
        <source>Hibernation Detected</source>
        <translation>Sluimerstand gedetecteerd</translation>
    </message>
    <message>
        <source>Your system is in hibernate mode. Therefore the registry cannot be edited. Please restart your system and exit the hibernate mode or contact Zenta Support</source>
        <translation>Uw systeem is in de sluimerstand. Daarom kan het register niet worden bewerkt. Start uw systeem opnieuw op en beëindig de sluimerstand of neem contact op met Zenta Support</translation>
    </message>
</context>
<context>
    <name>ValueDelegate</name>
    <message>
        <source>(value not set)</source>
        <translation>(waarde niet ingesteld)</translation>
    </message>
    <message>
        <source>The specified value name already exists.</source>
        <translation>De opgegeven waardenaam bestaat al.</translation>
    </message>
</context>
<context>
    <name>ValuesModel</name>
    <message>
        <source>(Default)</source>
        <translation>(Standaard)</translation>
    </message>
    <message>
        <source>Name</source>
        <comment>column title</comment>
        <translation>Naam</translation>
    </message>
    <message>
        <source>Type</source>
        <comment>column title</comment>
        <translation>Type</translation>
    </message>
    <message>
        <source>Data</source>
        <comment>column title</comment>
        <translation>Gegevens</translation>
    </message>
</context>
<context>
    <name>ValuesProxyModel</name>
    <message>
        <source>(Default)</source>
        <translation>(Standaard)</translation>
    </message>
</context>
<context>
    <name>ValuesView</name>
    <message>
        <source>Value name:</source>
        <translation>Naam van de waarde:</translation>
    </message>
    <message>
        <source>Value data:</source>
        <translation>Waardegegevens:</translation>
    </message>
    <message>
        <source>Edit String</source>
        <comment>dialog title</comment>
        <translation>Tekenreeks bewerken</translation>
    </message>
    <message>
        <source>Edit Binary Value</source>
        <comment>dialog title</comment>
        <translation>Binaire waarde bewerken</translation>
    </message>
    <message>
        <source>Edit Multi-String</source>
        <comment>dialog title</comment>
        <translation>Meerdere tekenreeksen bewerken</translation>
    </message>
    <message>
        <source>Data type cannot be edited yet</source>
        <translation>Dit gegevenstype kan nog niet worden bewerkt</translation>
    </message>
    <message>
        <source>Edit DWORD (32-bit) Value</source>
        <comment>dialog title</comment>
        <translation>DWORD-waarde (32-bits) bewerken</translation>
    </message>
    <message>
        <source>Edit QWORD (64-bit) Value</source>
        <comment>dialog title</comment>
        <translation>QWORD-waarde (64-bits) bewerken</translation>
    </message>
    <message>
        <source>Edit</source>
        <comment>menu title</comment>
        <translation>Bewerken</translation>
    </message>
    <message>
        <source>New</source>
        <comment>menu title</comment>
        <translation>Nieuw</translation>
    </message>
    <message>
        <source>The value could not be created.</source>
        <translation>De waarde kan niet worden gemaakt.</translation>
    </message>
    <message>
        <source>The value could not be changed.</source>
        <translation>De waarde kan niet worden gewijzigd.</translation>
    </message>
    <message>
        <source>Confirm Value Removal</source>
        <translation>Verwijderen van waarde bevestigen</translation>
    </message>
    <message>
        <source>Are you sure you want to delete this value?</source>
        <translation>Weet u zeker dat u deze waarde wilt verwijderen?</translation>
    </message>
    <message>
        <source>The value could not be deleted.</source>
        <translation>De waarde kan niet worden verwijderd.</translation>
    </message>
</context>
</TS>
