<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="ja_JP" sourcelanguage="en_US">
<context>
    <name>EditNumberDialog</name>
    <message>
        <source>Hexadecimal</source>
        <translation>16 進数</translation>
    </message>
    <message>
        <source>Value name:</source>
        <translation>値の名前:</translation>
    </message>
    <message>
        <source>Value data:</source>
        <translation>値のデータ:</translation>
    </message>
    <message>
        <source>Base</source>
        <translation>表記</translation>
    </message>
    <message>
        <source>Decimal</source>
        <translation>10 進数</translation>
    </message>
</context>
<context>
    <name>FailureReport</name>
    <message>
        <source>The registry cannot be read: %1</source>
        <translation>レジストリを読み取れません: %1</translation>
    </message>
    <message>
        <source>The key &quot;%1&quot; cannot be read: %2</source>
        <translation>キー &quot;%1&quot; を読み取れません: %2</translation>
    </message>
    <message>
        <source>More keys cannot be read: %1</source>
        <translation>ほかに読み取れないキーの数: %1</translation>
    </message>
</context>
<context>
    <name>KeyDelegate</name>
    <message>
        <source>The specified key name already exists.</source>
        <translation>指定されたキー名は既に存在します。</translation>
    </message>
    <message>
        <source>(cannot be read)</source>
        <translation>(読み取れません)</translation>
    </message>
</context>
<context>
    <name>KeysView</name>
    <message>
        <source>New</source>
        <comment>menu title</comment>
        <translation>新規</translation>
    </message>
    <message>
        <source>The key could not be created.</source>
        <translation>キーを作成できませんでした。</translation>
    </message>
    <message>
        <source>The key could not be deleted.</source>
        <translation>キーを削除できませんでした。</translation>
    </message>
    <message>
        <source>Confirm Key Removal</source>
        <translation>キーの削除の確認</translation>
    </message>
    <message>
        <source>Are you sure you want to delete this key and its subkeys?</source>
        <translation>このキーとそのサブキーを削除しますか?</translation>
    </message>
</context>
<context>
    <name>MainWindow</name>
    <message>
        <source>(zero-length binary value)</source>
        <translation>(長さ 0 のバイナリ値)</translation>
    </message>
    <message>
        <source>Find</source>
        <comment>dialog title</comment>
        <translation>検索</translation>
    </message>
    <message>
        <source>Search term:</source>
        <translation>検索する文字列:</translation>
    </message>
    <message>
        <source>Find keys</source>
        <translation>キーを検索</translation>
    </message>
    <message>
        <source>Find values</source>
        <translation>値を検索</translation>
    </message>
    <message>
        <source>Find substring</source>
        <translation>部分一致で検索</translation>
    </message>
    <message>
        <source>Find whole string</source>
        <translation>完全一致で検索</translation>
    </message>
    <message>
        <source>Use wildcards</source>
        <translation>ワイルドカードを使用</translation>
    </message>
    <message>
        <source>Find</source>
        <comment>dialog title (search in progress</comment>
        <translation>検索</translation>
    </message>
    <message>
        <source>Searching...</source>
        <translation>検索しています...</translation>
    </message>
    <message>
        <source>&amp;File</source>
        <comment>menu title</comment>
        <translation>ファイル(&amp;F)</translation>
    </message>
    <message>
        <source>Exit</source>
        <comment>menu item</comment>
        <translation>終了</translation>
    </message>
    <message>
        <source>&amp;Edit</source>
        <comment>menu title</comment>
        <translation>編集(&amp;E)</translation>
    </message>
    <message>
        <source>&amp;New</source>
        <comment>menu title</comment>
        <translation>新規(&amp;N)</translation>
    </message>
    <message>
        <source>Find...</source>
        <comment>menu item</comment>
        <translation>検索...</translation>
    </message>
    <message>
        <source>Find next</source>
        <comment>menu item</comment>
        <translation>次を検索</translation>
    </message>
    <message>
        <source>&amp;View</source>
        <comment>menu title</comment>
        <translation>表示(&amp;V)</translation>
    </message>
    <message>
        <source>Refresh</source>
        <comment>menu item</comment>
        <translation>最新の情報に更新</translation>
    </message>
    <message>
        <source>The search could not go on: %1</source>
        <translation>検索を続行できませんでした: %1</translation>
    </message>
    <message>
        <source>Finished searching.</source>
        <translation>検索が終了しました。</translation>
    </message>
    <message>
        <source>Key</source>
        <comment>menu item</comment>
        <translation>キー</translation>
    </message>
    <message>
        <source>String Value</source>
        <comment>menu item</comment>
        <translation>文字列値</translation>
    </message>
    <message>
        <source>Binary Value</source>
        <comment>menu item</comment>
        <translation>バイナリ値</translation>
    </message>
    <message>
        <source>DWORD (32-bit) Value</source>
        <comment>menu item</comment>
        <translation>DWORD (32 ビット) 値</translation>
    </message>
    <message>
        <source>QWORD (64-bit) Value</source>
        <comment>menu item</comment>
        <translation>QWORD (64 ビット) 値</translation>
    </message>
    <message>
        <source>Multi-String Value</source>
        <comment>menu item</comment>
        <translation>複数行文字列値</translation>
    </message>
    <message>
        <source>Expandable String Value</source>
        <comment>menu item</comment>
        <translation>展開可能な文字列値</translation>
    </message>
    <message>
        <source>Delete</source>
        <comment>menu item</comment>
        <translation>削除</translation>
    </message>
    <message>
        <source>Rename</source>
        <comment>menu item</comment>
        <translation>名前の変更</translation>
    </message>
</context>
<context>
    <name>QObject</name>
    <message>
        <source>Hibernation Detected</source>
        <translation>休止状態が検出されました</translation>
    </message>
    <message>
        <source>Your system is in hibernate mode. Therefore the registry cannot be edited. Please restart your system and exit the hibernate mode or contact Zenta Support</source>
        <translation>システムは休止状態です。そのため、レジストリを編集できません。システムを再起動して休止状態を終了するか、Zenta Support にお問い合わせください</translation>
    </message>
</context>
<context>
    <name>ValueDelegate</name>
    <message>
        <source>(value not set)</source>
        <translation>(値の設定なし)</translation>
    </message>
    <message>
        <source>The specified value name already exists.</source>
        <translation>指定された値の名前は既に存在します。</translation>
    </message>
</context>
<context>
    <name>ValuesModel</name>
    <message>
        <source>(Default)</source>
        <translation>(既定)</translation>
    </message>
    <message>
        <source>Name</source>
        <comment>column title</comment>
        <translation>名前</translation>
    </message>
    <message>
        <source>Type</source>
        <comment>column title</comment>
        <translation>種類</translation>
    </message>
    <message>
        <source>Data</source>
        <comment>column title</comment>
        <translation>データ</translation>
    </message>
</context>
<context>
    <name>ValuesProxyModel</name>
    <message>
        <source>(Default)</source>
        <translation>(既定)</translation>
    </message>
</context>
<context>
    <name>ValuesView</name>
    <message>
        <source>Value name:</source>
        <translation>値の名前:</translation>
    </message>
    <message>
        <source>Value data:</source>
        <translation>値のデータ:</translation>
    </message>
    <message>
        <source>Edit String</source>
        <comment>dialog title</comment>
        <translation>文字列の編集</translation>
    </message>
    <message>
        <source>Edit Binary Value</source>
        <comment>dialog title</comment>
        <translation>バイナリ値の編集</translation>
    </message>
    <message>
        <source>Edit Multi-String</source>
        <comment>dialog title</comment>
        <translation>複数行文字列の編集</translation>
    </message>
    <message>
        <source>Data type cannot be edited yet</source>
        <translation>この種類のデータはまだ編集できません</translation>
    </message>
    <message>
        <source>Edit DWORD (32-bit) Value</source>
        <comment>dialog title</comment>
        <translation>DWORD (32 ビット) 値の編集</translation>
    </message>
    <message>
        <source>Edit QWORD (64-bit) Value</source>
        <comment>dialog title</comment>
        <translation>QWORD (64 ビット) 値の編集</translation>
    </message>
    <message>
        <source>Edit</source>
        <comment>menu title</comment>
        <translation>編集</translation>
    </message>
    <message>
        <source>New</source>
        <comment>menu title</comment>
        <translation>新規</translation>
    </message>
    <message>
        <source>The value could not be created.</source>
        <translation>値を作成できませんでした。</translation>
    </message>
    <message>
        <source>The value could not be changed.</source>
        <translation>値を変更できませんでした。</translation>
    </message>
    <message>
        <source>Confirm Value Removal</source>
        <translation>値の削除の確認</translation>
    </message>
    <message>
        <source>Are you sure you want to delete this value?</source>
        <translation>この値を削除しますか?</translation>
    </message>
    <message>
        <source>The value could not be deleted.</source>
        <translation>値を削除できませんでした。</translation>
    </message>
</context>
</TS>
