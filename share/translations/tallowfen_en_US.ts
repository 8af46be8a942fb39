<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="en_US" sourcelanguage="en_US">
<context>
    <name>EditNumberDialog</name>
    <message>
        <source>Hexadecimal</source>
        <translation>Hexadecimal</translation>
    </message>
    <message>
        <source>Value name:</source>
        <translation>Value name:</translation>
    </message>
    <message>
        <source>Value data:</source>
        <translation>Value data:</translation>
    </message>
    <message>
        <source>Base</source>
        <translation>Base</translation>
    </message>
    <message>
        <source>Decimal</source>
        <translation>Decimal</translation>
    </message>
</context>
<context>
    <name>FailureReport</name>
    <message>
        <source>The registry cannot be read: %1</source>
        <translation>The registry cannot be read: %1</translation>
    </message>
    <message>
        <source>The key &quot;%1&quot; cannot be read: %2</source>
        <translation>The key &quot;%1&quot; cannot be read: %2</translation>
    </message>
    <message>
        <source>More keys cannot be read: %1</source>
        <translation>More keys cannot be read: %1</translation>
    </message>
</context>
<context>
    <name>KeyDelegate</name>
    <message>
        <source>The specified key name already exists.</source>
        <translation>The specified key name already exists.</translation>
    </message>
    <message>
        <source>(cannot be read)</source>
        <translation>(cannot be read)</translation>
    </message>
</context>
<context>
    <name>KeysView</name>
    <message>
        <source>New</source>
        <comment>menu title</comment>
        <translation>New</translation>
    </message>
    <message>
        <source>The key could not be created.</source>
        <translation>The key could not be created.</translation>
    </message>
    <message>
        <source>The key could not be deleted.</source>
        <translation>The key could not be deleted.</translation>
    </message>
    <message>
        <source>Confirm Key Removal</source>
        <translation>Confirm Key Removal</translation>
    </message>
    <message>
        <source>Are you sure you want to delete this key and its subkeys?</source>
        <translation>Are you sure you want to delete this key and its subkeys?</translation>
    </message>
</context>
<context>
    <name>MainWindow</name>
    <message>
        <source>(zero-length binary value)</source>
        <translation>(zero-length binary value)</translation>
    </message>
    <message>
        <source>Find</source>
        <comment>dialog title</comment>
        <translation>Find</translation>
    </message>
    <message>
        <source>Search term:</source>
        <translation>Search term:</translation>
    </message>
    <message>
        <source>Find keys</source>
        <translation>Find keys</translation>
    </message>
    <message>
        <source>Find values</source>
        <translation>Find values</translation>
    </message>
    <message>
        <source>Find substring</source>
        <translation>Find substring</translation>
    </message>
    <message>
        <source>Find whole string</source>
        <translation>Find whole string</translation>
    </message>
    <message>
        <source>Use wildcards</source>
        <translation>Use wildcards</translation>
    </message>
    <message>
        <source>Find</source>
        <comment>dialog title (search in progress</comment>
        <translation>Find</translation>
    </message>
    <message>
        <source>Searching...</source>
        <translation>Searching...</translation>
    </message>
    <message>
        <source>&amp;File</source>
        <comment>menu title</comment>
        <translation>&amp;File</translation>
    </message>
    <message>
        <source>Exit</source>
        <comment>menu item</comment>
        <translation>Exit</translation>
    </message>
    <message>
        <source>&amp;Edit</source>
        <comment>menu title</comment>
        <translation>&amp;Edit</translation>
    </message>
    <message>
        <source>&amp;New</source>
        <comment>menu title</comment>
        <translation>&amp;New</translation>
    </message>
    <message>
        <source>Find...</source>
        <comment>menu item</comment>
        <translation>Find...</translation>
    </message>
    <message>
        <source>Find next</source>
        <comment>menu item</comment>
        <translation>Find next</translation>
    </message>
    <message>
        <source>&amp;View</source>
        <comment>menu title</comment>
        <translation>&amp;View</translation>
    </message>
    <message>
        <source>Refresh</source>
        <comment>menu item</comment>
        <translation>Refresh</translation>
    </message>
    <message>
        <source>The search could not go on: %1</source>
        <translation>The search could not go on: %1</translation>
    </message>
    <message>
        <source>Finished searching.</source>
        <translation>Finished searching.</translation>
    </message>
    <message>
        <source>Key</source>
        <comment>menu item</comment>
        <translation>Key</translation>
    </message>
    <message>
        <source>String Value</source>
        <comment>menu item</comment>
        <translation>String Value</translation>
    </message>
    <message>
        <source>Binary Value</source>
        <comment>menu item</comment>
        <translation>Binary Value</translation>
    </message>
    <message>
        <source>DWORD (32-bit) Value</source>
        <comment>menu item</comment>
        <translation>DWORD (32-bit) Value</translation>
    </message>
    <message>
        <source>QWORD (64-bit) Value</source>
        <comment>menu item</comment>
        <translation>QWORD (64-bit) Value</translation>
    </message>
    <message>
        <source>Multi-String Value</source>
        <comment>menu item</comment>
        <translation>Multi-String Value</translation>
    </message>
    <message>
        <source>Expandable String Value</source>
        <comment>menu item</comment>
        <translation>Expandable String Value</translation>
    </message>
    <message>
        <source>Delete</source>
        <comment>menu item</comment>
        <translation>Delete</translation>
    </message>
    <message>
        <source>Rename</source>
        <comment>menu item</comment>
        <translation>Rename</translation>
    </message>
</context>
<context>
    <name>QObject</name>
    <message>
        <source>Hibernation Detected</source>
        <translation>Hibernation Detected</translation>
    </message>
    <message>
        <source>Your system is in hibernate mode. Therefore the registry cannot be edited. Please restart your system and exit the hibernate mode or contact Zenta Support</source>
        <translation>Your system is in hibernate mode. Therefore the registry cannot be edited. Please restart your system and exit the hibernate mode or contact Zenta Support</translation>
    </message>
</context>
<context>
    <name>ValueDelegate</name>
    <message>
        <source>(value not set)</source>
        <translation>(value not set)</translation>
    </message>
    <message>
        <source>The specified value name already exists.</source>
        <translation>The specified value name already exists.</translation>
    </message>
</context>
<context>
    <name>ValuesModel</name>
    <message>
        <source>(Default)</source>
        <translation>(Default)</translation>
    </message>
    <message>
        <source>Name</source>
        <comment>column title</comment>
        <translation>Name</translation>
    </message>
    <message>
        <source>Type</source>
        <comment>column title</comment>
        <translation>Type</translation>
    </message>
    <message>
        <source>Data</source>
        <comment>column title</comment>
        <translation>Data</translation>
    </message>
</context>
<context>
    <name>ValuesProxyModel</name>
    <message>
        <source>(Default)</source>
        <translation>(Default)</translation>
    </message>
</context>
<context>
    <name>ValuesView</name>
    <message>
        <source>Value name:</source>
        <translation>Value name:</translation>
    </message>
    <message>
        <source>Value data:</source>
        <translation>Value data:</translation>
    </message>
    <message>
        <source>Edit String</source>
        <comment>dialog title</comment>
        <translation>Edit String</translation>
    </message>
    <message>
        <source>Edit Binary Value</source>
        <comment>dialog title</comment>
        <translation>Edit Binary Value</translation>
    </message>
    <message>
        <source>Edit Multi-String</source>
        <comment>dialog title</comment>
        <translation>Edit Multi-String</translation>
    </message>
    <message>
        <source>Data type cannot be edited yet</source>
        <translation>Data type cannot be edited yet</translation>
    </message>
    <message>
        <source>Edit DWORD (32-bit) Value</source>
        <comment>dialog title</comment>
        <translation>Edit DWORD (32-bit) Value</translation>
    </message>
    <message>
        <source>Edit QWORD (64-bit) Value</source>
        <comment>dialog title</comment>
        <translation>Edit QWORD (64-bit) Value</translation>
    </message>
    <message>
        <source>Edit</source>
        <comment>menu title</comment>
        <translation>Edit</translation>
    </message>
    <message>
        <source>New</source>
        <comment>menu title</comment>
        <translation>New</translation>
    </message>
    <message>
        <source>The value could not be created.</source>
        <translation>The value could not be created.</translation>
    </message>
    <message>
        <source>The value could not be changed.</source>
        <translation>The value could not be changed.</translation>
    </message>
    <message>
        <source>Confirm Value Removal</source>
        <translation>Confirm Value Removal</translation>
    </message>
    <message>
        <source>Are you sure you want to delete this value?</source>
        <translation>Are you sure you want to delete this value?</translation>
    </message>
    <message>
        <source>The value could not be deleted.</source>
        <translation>The value could not be deleted.</translation>
    </message>
</context>
</TS>
