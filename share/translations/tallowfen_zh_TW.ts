<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="zh_TW" sourcelanguage="en_US">
<context>
    <name>EditNumberDialog</name>
    <message>
        <source>Hexadecimal</source>
        <translation>十六進位</translation>
    </message>
    <message>
        <source>Value name:</source>
        <translation>數值名稱:</translation>
    </message>
    <message>
        <source>Value data:</source>
        <translation>數值資料:</translation>
    </message>
    <message>
        <source>Base</source>
        <translation>基數</translation>
    </message>
    <message>
        <source>Decimal</source>
        <translation>十進位</translation>
    </message>
</context>
<context>
    <name>FailureReport</name>
    <message>
        <source>The registry cannot be read: %1</source>
        <translation>無法讀取登錄：%1</translation>
    </message>
    <message>
        <source>The key &quot;%1&quot; cannot be read: %2</source>
        <translation>無法讀取機碼「%1」：%2</translation>
    </message>
    <message>
        <source>More keys cannot be read: %1</source>
        <translation>另有無法讀取的機碼：%1</translation>
    </message>
</context>
<context>
    <name>KeyDelegate</name>
    <message>
        <source>The specified key name already exists.</source>
        <translation>指定的機碼名稱已存在。</translation>
    </message>
    <message>
        <source>(cannot be read)</source>
        <translation>(無法讀取)</translation>
    </message>
</context>
<context>
    <name>KeysView</name>
    <message>
        <source>New</source>
        <comment>menu title</comment>
        <translation>新增</translation>
    </message>
    <message>
        <source>The key could not be created.</source>
        <translation>無法建立機碼。</translation>
    </message>
    <message>
        <source>The key could not be deleted.</source>
        <translation>無法刪除機碼。</translation>
    </message>
    <message>
        <source>Confirm Key Removal</source>
        <translation>確認刪除機碼</translation>
    </message>
    <message>
        <source>Are you sure you want to delete this key and its subkeys?</source>
        <translation>確定要刪除此機碼及其子機碼嗎？</translation>
    </message>
</context>
<context>
    <name>MainWindow</name>
    <message>
        <source>(zero-length binary value)</source>
        <translation>(長度為零的二進位值)</translation>
    </message>
    <message>
        <source>Find</source>
        <comment>dialog title</comment>
        <translation>尋找</translation>
    </message>
    <message>
        <source>Search term:</source>
        <translation>尋找目標:</translation>
    </message>
    <message>
        <source>Find keys</source>
        <translation>尋找機碼</translation>
    </message>
    <message>
        <source>Find values</source>
        <translation>尋找值</translation>
    </message>
    <message>
        <source>Find substring</source>
        <translation>尋找部分字串</translation>
    </message>
    <message>
        <source>Find whole string</source>
        <translation>尋找整個字串</translation>
    </message>
    <message>
        <source>Use wildcards</source>
        <translation>使用萬用字元</translation>
    </message>
    <message>
        <source>Find</source>
        <comment>dialog title (search in progress</comment>
        <translation>尋找</translation>
    </message>
    <message>
        <source>Searching...</source>
        <translation>正在尋找...</translation>
    </message>
    <message>
        <source>&amp;File</source>
        <comment>menu title</comment>
        <translation>檔案(&amp;F)</translation>
    </message>
    <message>
        <source>Exit</source>
        <comment>menu item</comment>
        <translation>結束</translation>
    </message>
    <message>
        <source>&amp;Edit</source>
        <comment>menu title</comment>
        <translation>編輯(&amp;E)</translation>
    </message>
    <message>
        <source>&amp;New</source>
        <comment>menu title</comment>
        <translation>新增(&amp;N)</translation>
    </message>
    <message>
        <source>Find...</source>
        <comment>menu item</comment>
        <translation>尋找...</translation>
    </message>
    <message>
        <source>Find next</source>
        <comment>menu item</comment>
        <translation>找下一個</translation>
    </message>
    <message>
        <source>&amp;View</source>
        <comment>menu title</comment>
        <translation>檢視(&amp;V)</translation>
    </message>
    <message>
        <source>Refresh</source>
        <comment>menu item</comment>
        <translation>重新整理</translation>
    </message>
    <message>
        <source>The search could not go on: %1</source>
        <translation>無法繼續尋找：%1</translation>
    </message>
    <message>
        <source>Finished searching.</source>
        <translation>尋找完畢。</translation>
    </message>
    <message>
        <source>Key</source>
        <comment>menu item</comment>
        <translation>機碼</translation>
    </message>
    <message>
        <source>String Value</source>
        <comment>menu item</comment>
        <translation>字串值</translation>
    </message>
    <message>
        <source>Binary Value</source>
        <comment>menu item</comment>
        <translation>二進位值</translation>
    </message>
    <message>
        <source>DWORD (32-bit) Value</source>
        <comment>menu item</comment>
        <translation>DWORD (32 位元) 值</translation>
    </message>
    <message>
        <source>QWORD (64-bit) Value</source>
        <comment>menu item</comment>
        <translation>QWORD (64 位元) 值</translation>
    </message>
    <message>
        <source>Multi-String Value</source>
        <comment>menu item</comment>
        <translation>多字串值</translation>
    </message>
    <message>
        <source>Expandable String Value</source>
        <comment>menu item</comment>
        <translation>可擴充字串值</translation>
    </message>
    <message>
        <source>Delete</source>
        <comment>menu item</comment>
        <translation>刪除</translation>
    </message>
    <message>
        <source>Rename</source>
        <comment>menu item</comment>
        <translation>重新命名</translation>
    </message>
</context>
<context>
    <name>QObject</name>
    <message>
        <source>Hibernation Detected</source>
        <translation>偵測到休眠</translation>
    </message>
    <message>
        <source>Your system is in hibernate mode. Therefore the registry cannot be edited. Please restart your system and exit the hibernate mode or contact Zenta Support</source>
        <translation>您的系統處於休眠模式，因此無法編輯登錄。請重新啟動系統並結束休眠模式，或與 Zenta Support 聯絡</translation>
    </message>
</context>
<context>
    <name>ValueDelegate</name>
    <message>
        <source>(value not set)</source>
        <translation>(數值未設定)</translation>
    </message>
    <message>
        <source>The specified value name already exists.</source>
        <translation>指定的數值名稱已存在。</translation>
    </message>
</context>
<context>
    <name>ValuesModel</name>
    <message>
        <source>(Default)</source>
        <translation>(預設值)</translation>
    </message>
    <message>
        <source>Name</source>
        <comment>column title</comment>
        <translation>名稱</translation>
    </message>
    <message>
        <source>Type</source>
        <comment>column title</comment>
        <translation>類型</translation>
    </message>
    <message>
        <source>Data</source>
        <comment>column title</comment>
        <translation>資料</translation>
    </message>
</context>
<context>
    <name>ValuesProxyModel</name>
    <message>
        <source>(Default)</source>
        <translation>(預設值)</translation>
    </message>
</context>
<context>
    <name>ValuesView</name>
    <message>
        <source>Value name:</source>
        <translation>數值名稱:</translation>
    </message>
    <message>
        <source>Value data:</source>
        <translation>數值資料:</translation>
    </message>
    <message>
        <source>Edit String</source>
        <comment>dialog title</comment>
        <translation>編輯字串</translation>
    </message>
    <message>
        <source>Edit Binary Value</source>
        <comment>dialog title</comment>
        <translation>編輯二進位值</translation>
    </message>
    <message>
        <source>Edit Multi-String</source>
        <comment>dialog title</comment>
        <translation>編輯多字串</translation>
    </message>
    <message>
        <source>Data type cannot be edited yet</source>
        <translation>尚無法編輯此資料類型</translation>
    </message>
    <message>
        <source>Edit DWORD (32-bit) Value</source>
        <comment>dialog title</comment>
        <translation>編輯 DWORD (32 位元) 值</translation>
    </message>
    <message>
        <source>Edit QWORD (64-bit) Value</source>
        <comment>dialog title</comment>
        <translation>編輯 QWORD (64 位元) 值</translation>
    </message>
    <message>
        <source>Edit</source>
        <comment>menu title</comment>
        <translation>編輯</translation>
    </message>
    <message>
        <source>New</source>
        <comment>menu title</comment>
        <translation>新增</translation>
    </message>
    <message>
        <source>The value could not be created.</source>
        <translation>無法建立值。</translation>
    </message>
    <message>
        <source>The value could not be changed.</source>
        <translation>無法變更值。</translation>
    </message>
    <message>
        <source>Confirm Value Removal</source>
        <translation>確認刪除值</translation>
    </message>
    <message>
        <source>Are you sure you want to delete this value?</source>
        <translation>確定要刪除此值嗎？</translation>
    </message>
    <message>
        <source>The value could not be deleted.</source>
        <translation>無法刪除值。</translation>
    </message>
</context>
</TS>
