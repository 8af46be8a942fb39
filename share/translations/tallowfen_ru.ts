<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="ru_RU" sourcelanguage="en_US">
<context>
    <name>EditNumberDialog</name>
    <message>
        <source>Hexadecimal</source>
        <translation>Шестнадцатеричная</translation>
    </message>
    <message>
        <source>Value name:</source>
        <translation>Параметр:</translation>
    </message>
    <message>
        <source>Value data:</source>
        <translation>Значение:</translation>
    </message>
    <message>
        <source>Base</source>
        <translation>Система исчисления</translation>
    </message>
    <message>
        <source>Decimal</source>
        <translation>Десятичная</translation>
    </message>
</context>
<context>
    <name>FailureReport</name>
    <message>
        <source>The registry cannot be read: %1</source>
        <translation>Не удаётся прочитать реестр: %1</translation>
    </message>
    <message>
        <source>The key &quot;%1&quot; cannot be read: %2</source>
        <translation>Не удаётся прочитать раздел «%1»: %2</translation>
    </message>
    <message>
        <source>More keys cannot be read: %1</source>
        <translation>Другие разделы, которые не удаётся прочитать: %1</translation>
    </message>
</context>
<context>
    <name>KeyDelegate</name>
    <message>
        <source>The specified key name already exists.</source>
        <translation>Указанное имя раздела уже существует.</translation>
    </message>
    <message>
        <source>(cannot be read)</source>
        <translation>(не удаётся прочитать)</translation>
    </message>
</context>
<context>
    <name>KeysView</name>
    <message>
        <source>New</source>
        <comment>menu title</comment>
        <translation>Создать</translation>
    </message>
    <message>
        <source>The key could not be created.</source>
        <translation>Не удалось создать раздел.</translation>
    </message>
    <message>
        <source>The key could not be deleted.</source>
        <translation>Не удалось удалить раздел.</translation>
    </message>
    <message>
        <source>Confirm Key Removal</source>
        <translation>Подтверждение удаления раздела</translation>
    </message>
    <message>
        <source>Are you sure you want to delete this key and its subkeys?</source>
        <translation>Вы действительно хотите удалить этот раздел и его подразделы?</translation>
    </message>
</context>
<context>
    <name>MainWindow</name>
    <message>
        <source>(zero-length binary value)</source>
        <translation>(двоичное значение нулевой длины)</translation>
    </message>
    <message>
        <source>Find</source>
        <comment>dialog title</comment>
        <translation>Поиск</translation>
    </message>
    <message>
        <source>Search term:</source>
        <translation>Искомый текст:</translation>
    </message>
    <message>
        <source>Find keys</source>
        <translation>Искать разделы</translation>
    </message>
    <message>
        <source>Find values</source>
        <translation>Искать параметры</translation>
    </message>
    <message>
        <source>Find substring</source>
        <translation>Искать часть строки</translation>
    </message>
    <message>
        <source>Find whole string</source>
        <translation>Искать строку целиком</translation>
    </message>
    <message>
        <source>Use wildcards</source>
        <translation>Использовать подстановочные знаки</translation>
    </message>
    <message>
        <source>Find</source>
        <comment>dialog title (search in progress</comment>
        <translation>Поиск</translation>
    </message>
    <message>
        <source>Searching...</source>
        <translation>Идёт поиск...</translation>
    </message>
    <message>
        <source>&amp;File</source>
        <comment>menu title</comment>
        <translation>&amp;Файл</translation>
    </message>
    <message>
        <source>Exit</source>
        <comment>menu item</comment>
        <translation>Выход</translation>
    </message>
    <message>
        <source>&amp;Edit</source>
        <comment>menu title</comment>
        <translation>&amp;Правка</translation>
    </message>
    <message>
        <source>&amp;New</source>
        <comment>menu title</comment>
        <translation>&amp;Создать</translation>
    </message>
    <message>
        <source>Find...</source>
        <comment>menu item</comment>
        <translation>Найти...</translation>
    </message>
    <message>
        <source>Find next</source>
        <comment>menu item</comment>
        <translation>Найти далее</translation>
    </message>
    <message>
        <source>&amp;View</source>
        <comment>menu title</comment>
        <translation>&amp;Вид</translation>
    </message>
    <message>
        <source>Refresh</source>
        <comment>menu item</comment>
        <translation>Обновить</translation>
    </message>
    <message>
        <source>The search could not go on: %1</source>
        <translation>Не удалось продолжить поиск: %1</translation>
    </message>
    <message>
        <source>Finished searching.</source>
        <translation>Поиск завершён.</translation>
    </message>
    <message>
        <source>Key</source>
        <comment>menu item</comment>
        <translation>Раздел</translation>
    </message>
    <message>
        <source>String Value</source>
        <comment>menu item</comment>
        <translation>Строковый параметр</translation>
    </message>
    <message>
        <source>Binary Value</source>
        <comment>menu item</comment>
        <translation>Двоичный параметр</translation>
    </message>
    <message>
        <source>DWORD (32-bit) Value</source>
        <comment>menu item</comment>
        <translation>Параметр DWORD (32 бита)</translation>
    </message>
    <message>
        <source>QWORD (64-bit) Value</source>
        <comment>menu item</comment>
        <translation>Параметр QWORD (64 бита)</translation>
    </message>
    <message>
        <source>Multi-String Value</source>
        <comment>menu item</comment>
        <translation>Мультистроковый параметр</translation>
    </message>
    <message>
        <source>Expandable String Value</source>
        <comment>menu item</comment>
        <translation>Расширяемый строковый параметр</translation>
    </message>
    <message>
        <source>Delete</source>
        <comment>menu item</comment>
        <translation>Удалить</translation>
    </message>
    <message>
        <source>Rename</source>
        <comment>menu item</comment>
        <translation>Переименовать</translation>
    </message>
</context>
<context>
    <name>QObject</name>
    <message>
        <source>Hibernation Detected</source>
        <translation>Обнаружена гибернация</translation>
    </message>
    <message>
        <source>Your system is in hibernate mode. Therefore the registry cannot be edited. Please restart your system and exit the hibernate mode or contact Zenta Support</source>
        <translation>Система находится в режиме гибернации. Поэтому изменить реестр нельзя. Перезагрузите систему и выйдите из режима гибернации или обратитесь в Zenta Support</translation>
    </message>
</context>
<context>
    <name>ValueDelegate</name>
    <message>
        <source>(value not set)</source>
        <translation>(значение не присвоено)</translation>
    </message>
    <message>
        <source>The specified value name already exists.</source>
        <translation>Указанное имя параметра уже существует.</translation>
    </message>
</context>
<context>
    <name>ValuesModel</name>
    <message>
        <source>(Default)</source>
        <translation>(По умолчанию)</translation>
    </message>
    <message>
        <source>Name</source>
        <comment>column title</comment>
        <translation>Имя</translation>
    </message>
    <message>
        <source>Type</source>
        <comment>column title</comment>
        <translation>Тип</translation>
    </message>
    <message>
        <source>Data</source>
        <comment>column title</comment>
        <translation>Значение</translation>
    </message>
</context>
<context>
    <name>ValuesProxyModel</name>
    <message>
        <source>(Default)</source>
        <translation>(По умолчанию)</translation>
    </message>
</context>
<context>
    <name>ValuesView</name>
    <message>
        <source>Value name:</source>
        <translation>Параметр:</translation>
    </message>
    <message>
        <source>Value data:</source>
        <translation>Значение:</translation>
    </message>
    <message>
        <source>Edit String</source>
        <comment>dialog title</comment>
        <translation>Изменение строкового параметра</translation>
    </message>
    <message>
        <source>Edit Binary Value</source>
        <comment>dialog title</comment>
        <translation>Изменение двоичного параметра</translation>
    </message>
    <message>
        <source>Edit Multi-String</source>
        <comment>dialog title</comment>
        <translation>Изменение мультистрокового параметра</translation>
    </message>
    <message>
        <source>Data type cannot be edited yet</source>
        <translation>Данные этого типа пока нельзя изменить</translation>
    </message>
    <message>
        <source>Edit DWORD (32-bit) Value</source>
        <comment>dialog title</comment>
        <translation>Изменение параметра DWORD (32 бита)</translation>
    </message>
    <message>
        <source>Edit QWORD (64-bit) Value</source>
        <comment>dialog title</comment>
        <translation>Изменение параметра QWORD (64 бита)</translation>
    </message>
    <message>
        <source>Edit</source>
        <comment>menu title</comment>
        <translation>Изменить</translation>
    </message>
    <message>
        <source>New</source>
        <comment>menu title</comment>
        <translation>Создать</translation>
    </message>
    <message>
        <source>The value could not be created.</source>
        <translation>Не удалось создать параметр.</translation>
    </message>
    <message>
        <source>The value could not be changed.</source>
        <translation>Не удалось изменить параметр.</translation>
    </message>
    <message>
        <source>Confirm Value Removal</source>
        <translation>Подтверждение удаления параметра</translation>
    </message>
    <message>
        <source>Are you sure you want to delete this value?</source>
        <translation>Вы действительно хотите удалить этот параметр?</translation>
    </message>
    <message>
        <source>The value could not be deleted.</source>
        <translation>Не удалось удалить параметр.</translation>
    </message>
</context>
</TS>
