<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="uk_UA" sourcelanguage="en_US">
<context>
    <name>EditNumberDialog</name>
    <message>
        <source>Hexadecimal</source>
        <translation>Шістнадцяткова</translation>
    </message>
    <message>
        <source>Value name:</source>
        <translation>Назва параметра:</translation>
    </message>
    <message>
        <source>Value data:</source>
        <translation>Значення параметра:</translation>
    </message>
    <message>
        <source>Base</source>
        <translation>Система числення</translation>
    </message>
    <message>
        <source>Decimal</source>
        <translation>Десяткова</translation>
    </message>
</context>
<context>
    <name>FailureReport</name>
    <message>
        <source>The registry cannot be read: %1</source>
        <translation>Не вдається прочитати реєстр: %1</translation>
    </message>
    <message>
        <source>The key &quot;%1&quot; cannot be read: %2</source>
        <translation>Не вдається прочитати розділ «%1»: %2</translation>
    </message>
    <message>
        <source>More keys cannot be read: %1</source>
        <translation>Інші розділи, які не вдається прочитати: %1</translation>
    </message>
</context>
<context>
    <name>KeyDelegate</name>
    <message>
        <source>The specified key name already exists.</source>
        <translation>Указана назва розділу вже існує.</translation>
    </message>
    <message>
        <source>(cannot be read)</source>
        <translation>(не вдається прочитати)</translation>
    </message>
</context>
<context>
    <name>KeysView</name>
    <message>
        <source>New</source>
        <comment>menu title</comment>
        <translation>Створити</translation>
    </message>
    <message>
        <source>The key could not be created.</source>
        <translation>Не вдалося створити розділ.</translation>
    </message>
    <message>
        <source>The key could not be deleted.</source>
        <translation>Не вдалося видалити розділ.</translation>
    </message>
    <message>
        <source>Confirm Key Removal</source>
        <translation>Підтвердження видалення розділу</translation>
    </message>
    <message>
        <source>Are you sure you want to delete this key and its subkeys?</source>
        <translation>Ви дійсно хочете видалити цей розділ і його підрозділи?</translation>
    </message>
</context>
<context>
    <name>MainWindow</name>
    <message>
        <source>(zero-length binary value)</source>
        <translation>(двійкове значення нульової довжини)</translation>
    </message>
    <message>
        <source>Find</source>
        <comment>dialog title</comment>
        <translation>Пошук</translation>
    </message>
    <message>
        <source>Search term:</source>
        <translation>Шуканий текст:</translation>
    </message>
    <message>
        <source>Find keys</source>
        <translation>Шукати розділи</translation>
    </message>
    <message>
        <source>Find values</source>
        <translation>Шукати параметри</translation>
    </message>
    <message>
        <source>Find substring</source>
        <translation>Шукати частину рядка</translation>
    </message>
    <message>
        <source>Find whole string</source>
        <translation>Шукати рядок повністю</translation>
    </message>
    <message>
        <source>Use wildcards</source>
        <translation>Використовувати символи узагальнення</translation>
    </message>
    <message>
        <source>Find</source>
        <comment>dialog title (search in progress</comment>
        <translation>Пошук</translation>
    </message>
    <message>
        <source>Searching...</source>
        <translation>Триває пошук...</translation>
    </message>
    <message>
        <source>&amp;File</source>
        <comment>menu title</comment>
        <translation>&amp;Файл</translation>
    </message>
    <message>
        <source>Exit</source>
        <comment>menu item</comment>
        <translation>Вихід</translation>
    </message>
    <message>
        <source>&amp;Edit</source>
        <comment>menu title</comment>
        <translation>&amp;Редагування</translation>
    </message>
    <message>
        <source>&amp;New</source>
        <comment>menu title</comment>
        <translation>&amp;Створити</translation>
    </message>
    <message>
        <source>Find...</source>
        <comment>menu item</comment>
        <translation>Знайти...</translation>
    </message>
    <message>
        <source>Find next</source>
        <comment>menu item</comment>
        <translation>Знайти далі</translation>
    </message>
    <message>
        <source>&amp;View</source>
        <comment>menu title</comment>
        <translation>&amp;Вигляд</translation>
    </message>
    <message>
        <source>Refresh</source>
        <comment>menu item</comment>
        <translation>Оновити</translation>
    </message>
    <message>
        <source>The search could not go on: %1</source>
        <translation>Не вдалося продовжити пошук: %1</translation>
    </message>
    <message>
        <source>Finished searching.</source>
        <translation>Пошук завершено.</translation>
    </message>
    <message>
        <source>Key</source>
        <comment>menu item</comment>
        <translation>Розділ</translation>
    </message>
    <message>
        <source>String Value</source>
        <comment>menu item</comment>
        <translation>Рядковий параметр</translation>
    </message>
    <message>
        <source>Binary Value</source>
        <comment>menu item</comment>
        <translation>Двійковий параметр</translation>
    </message>
    <message>
        <source>DWORD (32-bit) Value</source>
        <comment>menu item</comment>
        <translation>Параметр DWORD (32 біти)</translation>
    </message>
    <message>
        <source>QWORD (64-bit) Value</source>
        <comment>menu item</comment>
        <translation>Параметр QWORD (64 біти)</translation>
    </message>
    <message>
        <source>Multi-String Value</source>
        <comment>menu item</comment>
        <translation>Багаторядковий параметр</translation>
    </message>
    <message>
        <source>Expandable String Value</source>
        <comment>menu item</comment>
        <translation>Розширюваний рядковий параметр</translation>
    </message>
    <message>
        <source>Delete</source>
        <comment>menu item</comment>
        <translation>Видалити</translation>
    </message>
    <message>
        <source>Rename</source>
        <comment>menu item</comment>
        <translation>Перейменувати</translation>
    </message>
</context>
<context>
    <name>QObject</name>
    <message>
        <source>Hibernation Detected</source>
        <translation>Виявлено режим глибокого сну</translation>
    </message>
    <message>
        <source>Your system is in hibernate mode. Therefore the registry cannot be edited. Please restart your system and exit the hibernate mode or contact Zenta Support</source>
        <translation>Система перебуває в режимі глибокого сну. Тому змінити реєстр не можна. Перезавантажте систему й вийдіть із режиму глибокого сну або зверніться до Zenta Support</translation>
    </message>
</context>
<context>
    <name>ValueDelegate</name>
    <message>
        <source>(value not set)</source>
        <translation>(значення не задано)</translation>
    </message>
    <message>
        <source>The specified value name already exists.</source>
        <translation>Указана назва параметра вже існує.</translation>
    </message>
</context>
<context>
    <name>ValuesModel</name>
    <message>
        <source>(Default)</source>
        <translation>(За промовчанням)</translation>
    </message>
    <message>
        <source>Name</source>
        <comment>column title</comment>
        <translation>Ім&apos;я</translation>
    </message>
    <message>
        <source>Type</source>
        <comment>column title</comment>
        <translation>Тип</translation>
    </message>
    <message>
        <source>Data</source>
        <comment>column title</comment>
        <translation>Значення</translation>
    </message>
</context>
<context>
    <name>ValuesProxyModel</name>
    <message>
        <source>(Default)</source>
        <translation>(За промовчанням)</translation>
    </message>
</context>
<context>
    <name>ValuesView</name>
    <message>
        <source>Value name:</source>
        <translation>Назва параметра:</translation>
    </message>
    <message>
        <source>Value data:</source>
        <translation>Значення параметра:</translation>
    </message>
    <message>
        <source>Edit String</source>
        <comment>dialog title</comment>
        <translation>Змінення рядкового параметра</translation>
    </message>
    <message>
        <source>Edit Binary Value</source>
        <comment>dialog title</comment>
        <translation>Змінення двійкового параметра</translation>
    </message>
    <message>
        <source>Edit Multi-String</source>
        <comment>dialog title</comment>
        <translation>Змінення багаторядкового параметра</translation>
    </message>
    <message>
        <source>Data type cannot be edited yet</source>
        <translation>Дані цього типу поки що не можна змінити</translation>
    </message>
    <message>
        <source>Edit DWORD (32-bit) Value</source>
        <comment>dialog title</comment>
        <translation>Змінення параметра DWORD (32 біти)</translation>
    </message>
    <message>
        <source>Edit QWORD (64-bit) Value</source>
        <comment>dialog title</comment>
        <translation>Змінення параметра QWORD (64 біти)</translation>
    </message>
    <message>
        <source>Edit</source>
        <comment>menu title</comment>
        <translation>Змінити</translation>
    </message>
    <message>
        <source>New</source>
        <comment>menu title</comment>
        <translation>Створити</translation>
    </message>
    <message>
        <source>The value could not be created.</source>
        <translation>Не вдалося створити параметр.</translation>
    </message>
    <message>
        <source>The value could not be changed.</source>
        <translation>Не вдалося змінити параметр.</translation>
    </message>
    <message>
        <source>Confirm Value Removal</source>
        <translation>Підтвердження видалення параметра</translation>
    </message>
    <message>
        <source>Are you sure you want to delete this value?</source>
        <translation>Ви дійсно хочете видалити цей параметр?</translation>
    </message>
    <message>
        <source>The value could not be deleted.</source>
        <translation>Не вдалося видалити параметр.</translation>
    </message>
</context>
</TS>
