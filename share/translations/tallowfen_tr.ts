<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="tr_TR" sourcelanguage="en_US">
<context>
    <name>EditNumberDialog</name>
    <message>
        <source>Hexadecimal</source>
        <translation>Onaltılık</translation>
    </message>
    <message>
        <source>Value name:</source>
        <translation>Değer adı:</translation>
    </message>
    <message>
        <source>Value data:</source>
        <translation>Değer verisi:</translation>
    </message>
    <message>
        <source>Base</source>
        <translation>Taban</translation>
    </message>
    <message>
        <source>Decimal</source>
        <translation>Onluk</translation>
    </message>
</context>
<context>
    <name>FailureReport</name>
    <message>
        <source>The registry cannot be read: %1</source>
        <translation>Kayıt defteri okunamıyor: %1</translation>
    </message>
    <message>
        <source>The key &quot;%1&quot; cannot be read: %2</source>
        <translation>&quot;%1&quot; anahtarı okunamıyor: %2</translation>
    </message>
    <message>
        <source>More keys cannot be read: %1</source>
        <translation>Okunamayan diğer anahtarlar: %1</translation>
    </message>
</context>
<context>
    <name>KeyDelegate</name>
    <message>
        <source>The specified key name already exists.</source>
        <translation>Belirtilen anahtar adı zaten var.</translation>
    </message>
    <message>
        <source>(cannot be read)</source>
        <translation>(okunamıyor)</translation>
    </message>
</context>
<context>
    <name>KeysView</name>
    <message>
        <source>New</source>
        <comment>menu title</comment>
        <translation>Yeni</translation>
    </message>
    <message>
        <source>The key could not be created.</source>
        <translation>Anahtar oluşturulamadı.</translation>
    </message>
    <message>
        <source>The key could not be deleted.</source>
        <translation>Anahtar silinemedi.</translation>
    </message>
    <message>
        <source>Confirm Key Removal</source>
        <translation>Anahtar Silmeyi Onayla</translation>
    </message>
    <message>
        <source>Are you sure you want to delete this key and its subkeys?</source>
        <translation>Bu anahtarı ve alt anahtarlarını silmek istediğinizden emin misiniz?</translation>
    </message>
</context>
<context>
    <name>MainWindow</name>
    <message>
        <source>(zero-length binary value)</source>
        <translation>(sıfır uzunlukta ikili değer)</translation>
    </message>
    <message>
        <source>Find</source>
        <comment>dialog title</comment>
        <translation>Bul</translation>
    </message>
    <message>
        <source>Search term:</source>
        <translation>Aranacak metin:</translation>
    </message>
    <message>
        <source>Find keys</source>
        <translation>Anahtarları ara</translation>
    </message>
    <message>
        <source>Find values</source>
        <translation>Değerleri ara</translation>
    </message>
    <message>
        <source>Find substring</source>
        <translation>Metnin bir bölümünü ara</translation>
    </message>
    <message>
        <source>Find whole string</source>
        <translation>Metnin tamamını ara</translation>
    </message>
    <message>
        <source>Use wildcards</source>
        <translation>Joker karakter kullan</translation>
    </message>
    <message>
        <source>Find</source>
        <comment>dialog title (search in progress</comment>
        <translation>Bul</translation>
    </message>
    <message>
        <source>Searching...</source>
        <translation>Aranıyor...</translation>
    </message>
    <message>
        <source>&amp;File</source>
        <comment>menu title</comment>
        <translation>&amp;Dosya</translation>
    </message>
    <message>
        <source>Exit</source>
        <comment>menu item</comment>
        <translation>Çıkış</translation>
    </message>
    <message>
        <source>&amp;Edit</source>
        <comment>menu title</comment>
        <translation>Dü&amp;zen</translation>
    </message>
    <message>
        <source>&amp;New</source>
        <comment>menu title</comment>
        <translation>&amp;Yeni</translation>
    </message>
    <message>
        <source>Find...</source>
        <comment>menu item</comment>
        <translation>Bul...</translation>
    </message>
    <message>
        <source>Find next</source>
        <comment>menu item</comment>
        <translation>Sonrakini bul</translation>
    </message>
    <message>
        <source>&amp;View</source>
        <comment>menu title</comment>
        <translation>&amp;Görünüm</translation>
    </message>
    <message>
        <source>Refresh</source>
        <comment>menu item</comment>
        <translation>Yenile</translation>
    </message>
    <message>
        <source>The search could not go on: %1</source>
        <translation>Arama sürdürülemedi: %1</translation>
    </message>
    <message>
        <source>Finished searching.</source>
        <translation>Arama tamamlandı.</translation>
    </message>
    <message>
        <source>Key</source>
        <comment>menu item</comment>
        <translation>Anahtar</translation>
    </message>
    <message>
        <source>String Value</source>
        <comment>menu item</comment>
        <translation>Dize Değeri</translation>
    </message>
    <message>
        <source>Binary Value</source>
        <comment>menu item</comment>
        <translation>İkili Değer</translation>
    </message>
    <message>
        <source>DWORD (32-bit) Value</source>
        <comment>menu item</comment>
        <translation>DWORD (32 bit) Değeri</translation>
    </message>
    <message>
        <source>QWORD (64-bit) Value</source>
        <comment>menu item</comment>
        <translation>QWORD (64 bit) Değeri</translation>
    </message>
    <message>
        <source>Multi-String Value</source>
        <comment>menu item</comment>
        <translation>Çoklu Dize Değeri</translation>
    </message>
    <message>
        <source>Expandable String Value</source>
        <comment>menu item</comment>
        <translation>Genişletilebilir Dize Değeri</translation>
    </message>
    <message>
        <source>Delete</source>
        <comment>menu item</comment>
        <translation>Sil</translation>
    </message>
    <message>
        <source>Rename</source>
        <comment>menu item</comment>
        <translation>Yeniden adlandır</translation>
    </message>
</context>
<context>
    <name>QObject</name>
    <message>
        <source>Hibernation Detected</source>
        <translation>Hazırda Bekletme Algılandı</translation>
    </message>
    <message>
        <source>Your system is in hibernate mode. Therefore the registry cannot be edited. Please restart your system and exit the hibernate mode or contact Zenta Support</source>
        <translation>Sisteminiz hazırda bekletme modunda. Bu nedenle kayıt defteri düzenlenemez. Lütfen sisteminizi yeniden başlatıp hazırda bekletme modundan çıkın ya da Zenta Support ile iletişime geçin</translation>
    </message>
</context>
<context>
    <name>ValueDelegate</name>
    <message>
        <source>(value not set)</source>
        <translation>(değer atanmamış)</translation>
    </message>
    <message>
        <source>The specified value name already exists.</source>
        <translation>Belirtilen değer adı zaten var.</translation>
    </message>
</context>
<context>
    <name>ValuesModel</name>
    <message>
        <source>(Default)</source>
        <translation>(Varsayılan)</translation>
    </message>
    <message>
        <source>Name</source>
        <comment>column title</comment>
        <translation>Ad</translation>
    </message>
    <message>
        <source>Type</source>
        <comment>column title</comment>
        <translation>Tür</translation>
    </message>
    <message>
        <source>Data</source>
        <comment>column title</comment>
        <translation>Veri</translation>
    </message>
</context>
<context>
    <name>ValuesProxyModel</name>
    <message>
        <source>(Default)</source>
        <translation>(Varsayılan)</translation>
    </message>
</context>
<context>
    <name>ValuesView</name>
    <message>
        <source>Value name:</source>
        <translation>Değer adı:</translation>
    </message>
    <message>
        <source>Value data:</source>
        <translation>Değer verisi:</translation>
    </message>
    <message>
        <source>Edit String</source>
        <comment>dialog title</comment>
        <translation>Dizeyi Düzenle</translation>
    </message>
    <message>
        <source>Edit Binary Value</source>
        <comment>dialog title</comment>
        <translation>İkili Değeri Düzenle</translation>
    </message>
    <message>
        <source>Edit Multi-String</source>
        <comment>dialog title</comment>
        <translation>Çoklu Dizeyi Düzenle</translation>
    </message>
    <message>
        <source>Data type cannot be edited yet</source>
        <translation>Bu veri türü henüz düzenlenemiyor</translation>
    </message>
    <message>
        <source>Edit DWORD (32-bit) Value</source>
        <comment>dialog title</comment>
        <translation>DWORD (32 bit) Değerini Düzenle</translation>
    </message>
    <message>
        <source>Edit QWORD (64-bit) Value</source>
        <comment>dialog title</comment>
        <translation>QWORD (64 bit) Değerini Düzenle</translation>
    </message>
    <message>
        <source>Edit</source>
        <comment>menu title</comment>
        <translation>Düzenle</translation>
    </message>
    <message>
        <source>New</source>
        <comment>menu title</comment>
        <translation>Yeni</translation>
    </message>
    <message>
        <source>The value could not be created.</source>
        <translation>Değer oluşturulamadı.</translation>
    </message>
    <message>
        <source>The value could not be changed.</source>
        <translation>Değer değiştirilemedi.</translation>
    </message>
    <message>
        <source>Confirm Value Removal</source>
        <translation>Değer Silmeyi Onayla</translation>
    </message>
    <message>
        <source>Are you sure you want to delete this value?</source>
        <translation>Bu değeri silmek istediğinizden emin misiniz?</translation>
    </message>
    <message>
        <source>The value could not be deleted.</source>
        <translation>Değer silinemedi.</translation>
    </message>
</context>
</TS>
