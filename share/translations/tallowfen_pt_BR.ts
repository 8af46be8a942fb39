<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="pt_BR" sourcelanguage="en_US">
<context>
    <name>EditNumberDialog</name>
    <message>
        <source>Hexadecimal</source>
        <translation>Hexadecimal</translation>
    </message>
    <message>
        <source>Value name:</source>
        <translation>Nome do valor:</translation>
    </message>
    <message>
        <source>Value data:</source>
        <translation>Dados do valor:</translation>
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
        <translation>Não é possível ler o registro: %1</translation>
    </message>
    <message>
        <source>The key &quot;%1&quot; cannot be read: %2</source>
        <translation>Não é possível ler a chave &quot;%1&quot;: %2</translation>
    </message>
    <message>
        <source>More keys cannot be read: %1</source>
        <translation>Outras chaves que não podem ser lidas: %1</translation>
    </message>
</context>
<context>
    <name>KeyDelegate</name>
    <message>
        <source>The specified key name already exists.</source>
        <translation>O nome de chave especificado já existe.</translation>
    </message>
    <message>
        <source>(cannot be read)</source>
        <translation>(não pode ser lido)</translation>
    </message>
</context>
<context>
    <name>KeysView</name>
    <message>
        <source>New</source>
        <comment>menu title</comment>
        <translation>Novo</translation>
    </message>
    <message>
        <source>The key could not be created.</source>
        <translation>Não foi possível criar a chave.</translation>
    </message>
    <message>
        <source>The key could not be deleted.</source>
        <translation>Não foi possível excluir a chave.</translation>
    </message>
    <message>
        <source>Confirm Key Removal</source>
        <translation>Confirmar exclusão de chave</translation>
    </message>
    <message>
        <source>Are you sure you want to delete this key and its subkeys?</source>
        <translation>Tem certeza de que deseja excluir esta chave e suas subchaves?</translation>
    </message>
</context>
<context>
    <name>MainWindow</name>
    <message>
        <source>(zero-length binary value)</source>
        <translation>(valor binário de comprimento zero)</translation>
    </message>
    <message>
        <source>Find</source>
        <comment>dialog title</comment>
        <translation>Localizar</translation>
    </message>
    <message>
        <source>Search term:</source>
        <translation>Termo da pesquisa:</translation>
    </message>
    <message>
        <source>Find keys</source>
        <translation>Localizar chaves</translation>
    </message>
    <message>
        <source>Find values</source>
        <translation>Localizar valores</translation>
    </message>
    <message>
        <source>Find substring</source>
        <translation>Localizar parte do texto</translation>
    </message>
    <message>
        <source>Find whole string</source>
        <translation>Localizar o texto inteiro</translation>
    </message>
    <message>
        <source>Use wildcards</source>
        <translation>Usar caracteres curinga</translation>
    </message>
    <message>
        <source>Find</source>
        <comment>dialog title (search in progress</comment>
        <translation>Localizar</translation>
    </message>
    <message>
        <source>Searching...</source>
        <translation>Pesquisando...</translation>
    </message>
    <message>
        <source>&amp;File</source>
        <comment>menu title</comment>
        <translation>&amp;Arquivo</translation>
    </message>
    <message>
        <source>Exit</source>
        <comment>menu item</comment>
        <translation>Sair</translation>
    </message>
    <message>
        <source>&amp;Edit</source>
        <comment>menu title</comment>
        <translation>&amp;Editar</translation>
    </message>
    <message>
        <source>&amp;New</source>
        <comment>menu title</comment>
        <translation>&amp;Novo</translation>
    </message>
    <message>
        <source>Find...</source>
        <comment>menu item</comment>
        <translation>Localizar...</translation>
    </message>
    <message>
        <source>Find next</source>
        <comment>menu item</comment>
        <translation>Localizar próxima</translation>
    </message>
    <message>
        <source>&amp;View</source>
        <comment>menu title</comment>
        <translation>E&amp;xibir</translation>
    </message>
    <message>
        <source>Refresh</source>
        <comment>menu item</comment>
        <translation>Atualizar</translation>
    </message>
    <message>
        <source>The search could not go on: %1</source>
        <translation>Não foi possível continuar a pesquisa: %1</translation>
    </message>
    <message>
        <source>Finished searching.</source>
        <translation>Pesquisa concluída.</translation>
    </message>
    <message>
        <source>Key</source>
        <comment>menu item</comment>
        <translation>Chave</translation>
    </message>
    <message>
        <source>String Value</source>
        <comment>menu item</comment>
        <translation>Valor da cadeia de caracteres</translation>
    </message>
    <message>
        <source>Binary Value</source>
        <comment>menu item</comment>
        <translation>Valor binário</translation>
    </message>
    <message>
        <source>DWORD (32-bit) Value</source>
        <comment>menu item</comment>
        <translation>Valor DWORD (32 bits)</translation>
    </message>
    <message>
        <source>QWORD (64-bit) Value</source>
        <comment>menu item</comment>
        <translation>Valor QWORD (64 bits)</translation>
    </message>
    <message>
        <source>Multi-String Value</source>
        <comment>menu item</comment>
        <translation>Valor da cadeia de caracteres múltipla</translation>
    </message>
    <message>
        <source>Expandable String Value</source>
        <comment>menu item</comment>
        <translation>Valor da cadeia de caracteres expansível</translation>
    </message>
    <message>
        <source>Delete</source>
        <comment>menu item</comment>
        <translation>Excluir</translation>
    </message>
    <message>
        <source>Rename</source>
        <comment>menu item</comment>
        <translation>Renomear</translation>
    </message>
</context>
<context>
    <name>QObject</name>
    <message>
        <source>Hibernation Detected</source>
        <translation>Hibernação detectada</translation>
    </message>
    <message>
        <source>Your system is in hibernate mode. Therefore the registry cannot be edited. Please restart your system and exit the hibernate mode or contact Zenta Support</source>
        <translation>O sistema está em modo de hibernação. Por isso o registro não pode ser editado. Reinicie o sistema e saia do modo de hibernação ou entre em contato com o Zenta Support</translation>
    </message>
</context>
<context>
    <name>ValueDelegate</name>
    <message>
        <source>(value not set)</source>
        <translation>(valor não definido)</translation>
    </message>
    <message>
        <source>The specified value name already exists.</source>
        <translation>O nome de valor especificado já existe.</translation>
    </message>
</context>
<context>
    <name>ValuesModel</name>
    <message>
        <source>(Default)</source>
        <translation>(Padrão)</translation>
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
        <translation>Dados</translation>
    </message>
</context>
<context>
    <name>ValuesProxyModel</name>
    <message>
        <source>(Default)</source>
        <translation>(Padrão)</translation>
    </message>
</context>
<context>
    <name>ValuesView</name>
    <message>
        <source>Value name:</source>
        <translation>Nome do valor:</translation>
    </message>
    <message>
        <source>Value data:</source>
        <translation>Dados do valor:</translation>
    </message>
    <message>
        <source>Edit String</source>
        <comment>dialog title</comment>
        <translation>Editar cadeia de caracteres</translation>
    </message>
    <message>
        <source>Edit Binary Value</source>
        <comment>dialog title</comment>
        <translation>Editar valor binário</translation>
    </message>
    <message>
        <source>Edit Multi-String</source>
        <comment>dialog title</comment>
        <translation>Editar cadeia de caracteres múltipla</translation>
    </message>
    <message>
        <source>Data type cannot be edited yet</source>
        <translation>Este tipo de dados ainda não pode ser editado</translation>
    </message>
    <message>
        <source>Edit DWORD (32-bit) Value</source>
        <comment>dialog title</comment>
        <translation>Editar valor DWORD (32 bits)</translation>
    </message>
    <message>
        <source>Edit QWORD (64-bit) Value</source>
        <comment>dialog title</comment>
        <translation>Editar valor QWORD (64 bits)</translation>
    </message>
    <message>
        <source>Edit</source>
        <comment>menu title</comment>
        <translation>Editar</translation>
    </message>
    <message>
        <source>New</source>
        <comment>menu title</comment>
        <translation>Novo</translation>
    </message>
    <message>
        <source>The value could not be created.</source>
        <translation>Não foi possível criar o valor.</translation>
    </message>
    <message>
        <source>The value could not be changed.</source>
        <translation>Não foi possível alterar o valor.</translation>
    </message>
    <message>
        <source>Confirm Value Removal</source>
        <translation>Confirmar exclusão de valor</translation>
    </message>
    <message>
        <source>Are you sure you want to delete this value?</source>
        <translation>Tem certeza de que deseja excluir este valor?</translation>
    </message>
    <message>
        <source>The value could not be deleted.</source>
        <translation>Não foi possível excluir o valor.</translation>
    </message>
</context>
</TS>
