<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="zh_CN" sourcelanguage="en_US">
<context>
    <name>EditNumberDialog</name>
    <message>
        <source>Hexadecimal</source>
        <translation>十六进制</translation>
    </message>
    <message>
        <source>Value name:</source>
        <translation>数值名称:</translation>
    </message>
    <message>
        <source>Value data:</source>
        <translation>数值数据:</translation>
    </message>
    <message>
        <source>Base</source>
        <translation>基数</translation>
    </message>
    <message>
        <source>Decimal</source>
        <translation>十进制</translation>
    </message>
</context>
<context>
    <name>FailureReport</name>
    <message>
        <source>The registry cannot be read: %1</source>
        <translation>无法读取注册表：%1</translation>
    </message>
    <message>
        <source>The key &quot;%1&quot; cannot be read: %2</source>
        <translation>无法读取项“%1”：%2</translation>
    </message>
    <message>
        <source>More keys cannot be read: %1</source>
        <translation>另有无法读取的项：%1</translation>
    </message>
</context>
<context>
    <name>KeyDelegate</name>
    <message>
        <source>The specified key name already exists.</source>
        <translation>指定的项名称已存在。</translation>
    </message>
    <message>
        <source>(cannot be read)</source>
        <translation>(无法读取)</translation>
    </message>
</context>
<context>
    <name>KeysView</name>
    <message>
        <source>New</source>
        <comment>menu title</comment>
        <translation>新建</translation>
    </message>
    <message>
        <source>The key could not be created.</source>
        <translation>无法创建该项。</translation>
    </message>
    <message>
        <source>The key could not be deleted.</source>
        <translation>无法删除该项。</translation>
    </message>
    <message>
        <source>Confirm Key Removal</source>
        <translation>确认删除项</translation>
    </message>
    <message>
        <source>Are you sure you want to delete this key and its subkeys?</source>
        <translation>确实要删除此项及其子项吗？</translation>
    </message>
</context>
<context>
    <name>MainWindow</name>
    <message>
        <source>(zero-length binary value)</source>
        <translation>(长度为零的二进制值)</translation>
    </message>
    <message>
        <source>Find</source>
        <comment>dialog title</comment>
        <translation>查找</translation>
    </message>
    <message>
        <source>Search term:</source>
        <translation>查找内容:</translation>
    </message>
    <message>
        <source>Find keys</source>
        <translation>查找项</translation>
    </message>
    <message>
        <source>Find values</source>
        <translation>查找值</translation>
    </message>
    <message>
        <source>Find substring</source>
        <translation>查找部分字符串</translation>
    </message>
    <message>
        <source>Find whole string</source>
        <translation>查找整个字符串</translation>
    </message>
    <message>
        <source>Use wildcards</source>
        <translation>使用通配符</translation>
    </message>
    <message>
        <source>Find</source>
        <comment>dialog title (search in progress</comment>
        <translation>查找</translation>
    </message>
    <message>
        <source>Searching...</source>
        <translation>正在查找...</translation>
    </message>
    <message>
        <source>&amp;File</source>
        <comment>menu title</comment>
        <translation>文件(&amp;F)</translation>
    </message>
    <message>
        <source>Exit</source>
        <comment>menu item</comment>
        <translation>退出</translation>
    </message>
    <message>
        <source>&amp;Edit</source>
        <comment>menu title</comment>
        <translation>编辑(&amp;E)</translation>
    </message>
    <message>
        <source>&amp;New</source>
        <comment>menu title</comment>
        <translation>新建(&amp;N)</translation>
    </message>
    <message>
        <source>Find...</source>
        <comment>menu item</comment>
        <translation>查找...</translation>
    </message>
    <message>
        <source>Find next</source>
        <comment>menu item</comment>
        <translation>查找下一个</translation>
    </message>
    <message>
        <source>&amp;View</source>
        <comment>menu title</comment>
        <translation>查看(&amp;V)</translation>
    </message>
    <message>
        <source>Refresh</source>
        <comment>menu item</comment>
        <translation>刷新</translation>
    </message>
    <message>
        <source>The search could not go on: %1</source>
        <translation>无法继续查找：%1</translation>
    </message>
    <message>
        <source>Finished searching.</source>
        <translation>查找完毕。</translation>
    </message>
    <message>
        <source>Key</source>
        <comment>menu item</comment>
        <translation>项</translation>
    </message>
    <message>
        <source>String Value</source>
        <comment>menu item</comment>
        <translation>字符串值</translation>
    </message>
    <message>
        <source>Binary Value</source>
        <comment>menu item</comment>
        <translation>二进制值</translation>
    </message>
    <message>
        <source>DWORD (32-bit) Value</source>
        <comment>menu item</comment>
        <translation>DWORD (32 位) 值</translation>
    </message>
    <message>
        <source>QWORD (64-bit) Value</source>
        <comment>menu item</comment>
        <translation>QWORD (64 位) 值</translation>
    </message>
    <message>
        <source>Multi-String Value</source>
        <comment>menu item</comment>
        <translation>多字符串值</translation>
    </message>
    <message>
        <source>Expandable String Value</source>
        <comment>menu item</comment>
        <translation>可扩充字符串值</translation>
    </message>
    <message>
        <source>Delete</source>
        <comment>menu item</comment>
        <translation>删除</translation>
    </message>
    <message>
        <source>Rename</source>
        <comment>menu item</comment>
        <translation>重命名</translation>
    </message>
</context>
<context>
    <name>QObject</name>
    <message>
        <source>Hibernation Detected</source>
        <translation>检测到休眠</translation>
    </message>
    <message>
        <source>Your system is in hibernate mode. Therefore the registry cannot be edited. Please restart your system and exit the hibernate mode or contact Zenta Support</source>
        <translation>您的系统处于休眠模式，因此无法编辑注册表。请重新启动系统并退出休眠模式，或与 Zenta Support 联系</translation>
    </message>
</context>
<context>
    <name>ValueDelegate</name>
    <message>
        <source>(value not set)</source>
        <translation>(数值未设置)</translation>
    </message>
    <message>
        <source>The specified value name already exists.</source>
        <translation>指定的数值名称已存在。</translation>
    </message>
</context>
<context>
    <name>ValuesModel</name>
    <message>
        <source>(Default)</source>
        <translation>(默认)</translation>
    </message>
    <message>
        <source>Name</source>
        <comment>column title</comment>
        <translation>名称</translation>
    </message>
    <message>
        <source>Type</source>
        <comment>column title</comment>
        <translation>类型</translation>
    </message>
    <message>
        <source>Data</source>
        <comment>column title</comment>
        <translation>数据</translation>
    </message>
</context>
<context>
    <name>ValuesProxyModel</name>
    <message>
        <source>(Default)</source>
        <translation>(默认)</translation>
    </message>
</context>
<context>
    <name>ValuesView</name>
    <message>
        <source>Value name:</source>
        <translation>数值名称:</translation>
    </message>
    <message>
        <source>Value data:</source>
        <translation>数值数据:</translation>
    </message>
    <message>
        <source>Edit String</source>
        <comment>dialog title</comment>
        <translation>编辑字符串</translation>
    </message>
    <message>
        <source>Edit Binary Value</source>
        <comment>dialog title</comment>
        <translation>编辑二进制数值</translation>
    </message>
    <message>
        <source>Edit Multi-String</source>
        <comment>dialog title</comment>
        <translation>编辑多字符串</translation>
    </message>
    <message>
        <source>Data type cannot be edited yet</source>
        <translation>尚不能编辑此数据类型</translation>
    </message>
    <message>
        <source>Edit DWORD (32-bit) Value</source>
        <comment>dialog title</comment>
        <translation>编辑 DWORD (32 位) 值</translation>
    </message>
    <message>
        <source>Edit QWORD (64-bit) Value</source>
        <comment>dialog title</comment>
        <translation>编辑 QWORD (64 位) 值</translation>
    </message>
    <message>
        <source>Edit</source>
        <comment>menu title</comment>
        <translation>编辑</translation>
    </message>
    <message>
        <source>New</source>
        <comment>menu title</comment>
        <translation>新建</translation>
    </message>
    <message>
        <source>The value could not be created.</source>
        <translation>无法创建该值。</translation>
    </message>
    <message>
        <source>The value could not be changed.</source>
        <translation>无法更改该值。</translation>
    </message>
    <message>
        <source>Confirm Value Removal</source>
        <translation>确认删除数值</translation>
    </message>
    <message>
        <source>Are you sure you want to delete this value?</source>
        <translation>确实要删除此数值吗？</translation>
    </message>
    <message>
        <source>The value could not be deleted.</source>
        <translation>无法删除该值。</translation>
    </message>
</context>
</TS>
