<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="es_ES" sourcelanguage="en_US">
<context>
    <name>EditNumberDialog</name>
    <message>
        <source>Hexadecimal</source>
        <translation>Hexadecimal</translation>
    </message>
    <message>
        <source>Value name:</source>
        <translation>Nombre del valor:</translation>
    </message>
    <message>
        <source>Value data:</source>
        <translation>Datos del valor:</translation>
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
        <translation>No se puede leer el registro: %1</translation>
    </message>
    <message>
        <source>The key &quot;%1&quot; cannot be read: %2</source>
        <translation>No se puede leer la clave «%1»: %2</translation>
    </message>
    <message>
        <source>More keys cannot be read: %1</source>
        <translation>Otras claves que no se pueden leer: %1</translation>
    </message>
</context>
<context>
    <name>KeyDelegate</name>
    <message>
        <source>The specified key name already exists.</source>
        <translation>El nombre de clave especificado ya existe.</translation>
    </message>
    <message>
        <source>(cannot be read)</source>
        <translation>(no se puede leer)</translation>
    </message>
</context>
<context>
    <name>KeysView</name>
    <message>
        <source>New</source>
        <comment>menu title</comment>
        <translation>Nuevo</translation>
    </message>
    <message>
        <source>The key could not be created.</source>
        <translation>No se pudo crear la clave.</translation>
    </message>
    <message>
        <source>The key could not be deleted.</source>
        <translation>No se pudo eliminar la clave.</translation>
    </message>
    <message>
        <source>Confirm Key Removal</source>
        <translation>Confirmar eliminación de clave</translation>
    </message>
    <message>
        <source>Are you sure you want to delete this key and its subkeys?</source>
        <translation>¿Seguro que desea eliminar esta clave y sus subclaves?</translation>
    </message>
</context>
<context>
    <name>MainWindow</name>
    <message>
        <source>(zero-length binary value)</source>
        <translation>(valor binario de longitud cero)</translation>
    </message>
    <message>
        <source>Find</source>
        <comment>dialog title</comment>
        <translation>Buscar</translation>
    </message>
    <message>
        <source>Search term:</source>
        <translation>Término de búsqueda:</translation>
    </message>
    <message>
        <source>Find keys</source>
        <translation>Buscar claves</translation>
    </message>
    <message>
        <source>Find values</source>
        <translation>Buscar valores</translation>
    </message>
    <message>
        <source>Find substring</source>
        <translation>Buscar subcadena</translation>
    </message>
    <message>
        <source>Find whole string</source>
        <translation>Buscar cadena completa</translation>
    </message>
    <message>
        <source>Use wildcards</source>
        <translation>Usar comodines</translation>
    </message>
    <message>
        <source>Find</source>
        <comment>dialog title (search in progress</comment>
        <translation>Buscar</translation>
    </message>
    <message>
        <source>Searching...</source>
        <translation>Buscando...</translation>
    </message>
    <message>
        <source>&amp;File</source>
        <comment>menu title</comment>
        <translation>&amp;Archivo</translation>
    </message>
    <message>
        <source>Exit</source>
        <comment>menu item</comment>
        <translation>Salir</translation>
    </message>
    <message>
        <source>&amp;Edit</source>
        <comment>menu title</comment>
        <translation>&amp;Edición</translation>
    </message>
    <message>
        <source>&amp;New</source>
        <comment>menu title</comment>
        <translation>&amp;Nuevo</translation>
    </message>
    <message>
        <source>Find...</source>
        <comment>menu item</comment>
        <translation>Buscar...</translation>
    </message>
    <message>
        <source>Find next</source>
        <comment>menu item</comment>
        <translation>Buscar siguiente</translation>
    </message>
    <message>
        <source>&amp;View</source>
        <comment>menu title</comment>
        <translation>&amp;Ver</translation>
    </message>
    <message>
        <source>Refresh</source>
        <comment>menu item</comment>
        <translation>Actualizar</translation>
    </message>
    <message>
        <source>The search could not go on: %1</source>
        <translation>No se pudo continuar la búsqueda: %1</translation>
    </message>
    <message>
        <source>Finished searching.</source>
        <translation>Búsqueda finalizada.</translation>
    </message>
    <message>
        <source>Key</source>
        <comment>menu item</comment>
        <translation>Clave</translation>
    </message>
    <message>
        <source>String Value</source>
        <comment>menu item</comment>
        <translation>Valor de cadena</translation>
    </message>
    <message>
        <source>Binary Value</source>
        <comment>menu item</comment>
        <translation>Valor binario</translation>
    </message>
    <message>
        <source>DWORD (32-bit) Value</source>
        <comment>menu item</comment>
        <translation>Valor de DWORD (32 bits)</translation>
    </message>
    <message>
        <source>QWORD (64-bit) Value</source>
        <comment>menu item</comment>
        <translation>Valor de QWORD (64 bits)</translation>
    </message>
    <message>
        <source>Multi-String Value</source>
        <comment>menu item</comment>
        <translation>Valor de cadena múltiple</translation>
    </message>
    <message>
        <source>Expandable String Value</source>
        <comment>menu item</comment>
        <translation>Valor de cadena expandible</translation>
    </message>
    <message>
        <source>Delete</source>
        <comment>menu item</comment>
        <translation>Eliminar</translation>
    </message>
    <message>
        <source>Rename</source>
        <comment>menu item</comment>
        <translation>Cambiar nombre</translation>
    </message>
</context>
<context>
    <name>QObject</name>
    <message>
        <source>Hibernation Detected</source>
        <translation>Hibernación detectada</translation>
    </message>
    <message>
        <source>Your system is in hibernate mode. Therefore the registry cannot be edited. Please restart your system and exit the hibernate mode or contact Zenta Support</source>
        <translation>El sistema está en hibernación. Por eso no se puede editar el registro. Reinicie el sistema y salga de la hibernación o póngase en contacto con Zenta Support</translation>
    </message>
</context>
<context>
    <name>ValueDelegate</name>
    <message>
        <source>(value not set)</source>
        <translation>(valor no establecido)</translation>
    </message>
    <message>
        <source>The specified value name already exists.</source>
        <translation>El nombre de valor especificado ya existe.</translation>
    </message>
</context>
<context>
    <name>ValuesModel</name>
    <message>
        <source>(Default)</source>
        <translation>(Predeterminado)</translation>
    </message>
    <message>
        <source>Name</source>
        <comment>column title</comment>
        <translation>Nombre</translation>
    </message>
    <message>
        <source>Type</source>
        <comment>column title</comment>
        <translation>Tipo</translation>
    </message>
    <message>
        <source>Data</source>
        <comment>column title</comment>
        <translation>Datos</translation>
    </message>
</context>
<context>
    <name>ValuesProxyModel</name>
    <message>
        <source>(Default)</source>
        <translation>(Predeterminado)</translation>
    </message>
</context>
<context>
    <name>ValuesView</name>
    <message>
        <source>Value name:</source>
        <translation>Nombre del valor:</translation>
    </message>
    <message>
        <source>Value data:</source>
        <translation>Datos del valor:</translation>
    </message>
    <message>
        <source>Edit String</source>
        <comment>dialog title</comment>
        <translation>Editar cadena</translation>
    </message>
    <message>
        <source>Edit Binary Value</source>
        <comment>dialog title</comment>
        <translation>Editar valor binario</translation>
    </message>
    <message>
        <source>Edit Multi-String</source>
        <comment>dialog title</comment>
        <translation>Editar cadena múltiple</translation>
    </message>
    <message>
        <source>Data type cannot be edited yet</source>
        <translation>Este tipo de datos aún no se puede editar</translation>
    </message>
    <message>
        <source>Edit DWORD (32-bit) Value</source>
        <comment>dialog title</comment>
        <translation>Editar valor de DWORD (32 bits)</translation>
    </message>
    <message>
        <source>Edit QWORD (64-bit) Value</source>
        <comment>dialog title</comment>
        <translation>Editar valor de QWORD (64 bits)</translation>
    </message>
    <message>
        <source>Edit</source>
        <comment>menu title</comment>
        <translation>Editar</translation>
    </message>
    <message>
        <source>New</source>
        <comment>menu title</comment>
        <translation>Nuevo</translation>
    </message>
    <message>
        <source>The value could not be created.</source>
        <translation>No se pudo crear el valor.</translation>
    </message>
    <message>
        <source>The value could not be changed.</source>
        <translation>No se pudo modificar el valor.</translation>
    </message>
    <message>
        <source>Confirm Value Removal</source>
        <translation>Confirmar eliminación de valor</translation>
    </message>
    <message>
        <source>Are you sure you want to delete this value?</source>
        <translation>¿Seguro que desea eliminar este valor?</translation>
    </message>
    <message>
        <source>The value could not be deleted.</source>
        <translation>No se pudo eliminar el valor.</translation>
    </message>
</context>
</TS>
