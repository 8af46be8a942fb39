<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="ko_KR" sourcelanguage="en_US">
<context>
    <name>EditNumberDialog</name>
    <message>
        <source>Hexadecimal</source>
        <translation>16진수</translation>
    </message>
    <message>
        <source>Value name:</source>
        <translation>값 이름:</translation>
    </message>
    <message>
        <source>Value data:</source>
        <translation>값 데이터:</translation>
    </message>
    <message>
        <source>Base</source>
        <translation>진법</translation>
    </message>
    <message>
        <source>Decimal</source>
        <translation>10진수</translation>
    </message>
</context>
<context>
    <name>FailureReport</name>
    <message>
        <source>The registry cannot be read: %1</source>
        <translation>레지스트리를 읽을 수 없습니다: %1</translation>
    </message>
    <message>
        <source>The key &quot;%1&quot; cannot be read: %2</source>
        <translation>키 &quot;%1&quot;을(를) 읽을 수 없습니다: %2</translation>
    </message>
    <message>
        <source>More keys cannot be read: %1</source>
        <translation>읽을 수 없는 다른 키의 수: %1</translation>
    </message>
</context>
<context>
    <name>KeyDelegate</name>
    <message>
        <source>The specified key name already exists.</source>
        <translation>지정한 키 이름이 이미 있습니다.</translation>
    </message>
    <message>
        <source>(cannot be read)</source>
        <translation>(읽을 수 없음)</translation>
    </message>
</context>
<context>
    <name>KeysView</name>
    <message>
        <source>New</source>
        <comment>menu title</comment>
        <translation>새로 만들기</translation>
    </message>
    <message>
        <source>The key could not be created.</source>
        <translation>키를 만들 수 없습니다.</translation>
    </message>
    <message>
        <source>The key could not be deleted.</source>
        <translation>키를 삭제할 수 없습니다.</translation>
    </message>
    <message>
        <source>Confirm Key Removal</source>
        <translation>키 삭제 확인</translation>
    </message>
    <message>
        <source>Are you sure you want to delete this key and its subkeys?</source>
        <translation>이 키와 하위 키를 삭제하시겠습니까?</translation>
    </message>
</context>
<context>
    <name>MainWindow</name>
    <message>
        <source>(zero-length binary value)</source>
        <translation>(길이가 0인 이진값)</translation>
    </message>
    <message>
        <source>Find</source>
        <comment>dialog title</comment>
        <translation>찾기</translation>
    </message>
    <message>
        <source>Search term:</source>
        <translation>찾을 내용:</translation>
    </message>
    <message>
        <source>Find keys</source>
        <translation>키 찾기</translation>
    </message>
    <message>
        <source>Find values</source>
        <translation>값 찾기</translation>
    </message>
    <message>
        <source>Find substring</source>
        <translation>부분 문자열 찾기</translation>
    </message>
    <message>
        <source>Find whole string</source>
        <translation>전체 문자열 찾기</translation>
    </message>
    <message>
        <source>Use wildcards</source>
        <translation>와일드카드 사용</translation>
    </message>
    <message>
        <source>Find</source>
        <comment>dialog title (search in progress</comment>
        <translation>찾기</translation>
    </message>
    <message>
        <source>Searching...</source>
        <translation>찾는 중...</translation>
    </message>
    <message>
        <source>&amp;File</source>
        <comment>menu title</comment>
        <translation>파일(&amp;F)</translation>
    </message>
    <message>
        <source>Exit</source>
        <comment>menu item</comment>
        <translation>끝내기</translation>
    </message>
    <message>
        <source>&amp;Edit</source>
        <comment>menu title</comment>
        <translation>편집(&amp;E)</translation>
    </message>
    <message>
        <source>&amp;New</source>
        <comment>menu title</comment>
        <translation>새로 만들기(&amp;N)</translation>
    </message>
    <message>
        <source>Find...</source>
        <comment>menu item</comment>
        <translation>찾기...</translation>
    </message>
    <message>
        <source>Find next</source>
        <comment>menu item</comment>
        <translation>다음 찾기</translation>
    </message>
    <message>
        <source>&amp;View</source>
        <comment>menu title</comment>
        <translation>보기(&amp;V)</translation>
    </message>
    <message>
        <source>Refresh</source>
        <comment>menu item</comment>
        <translation>새로 고침</translation>
    </message>
    <message>
        <source>The search could not go on: %1</source>
        <translation>검색을 계속할 수 없습니다: %1</translation>
    </message>
    <message>
        <source>Finished searching.</source>
        <translation>검색을 마쳤습니다.</translation>
    </message>
    <message>
        <source>Key</source>
        <comment>menu item</comment>
        <translation>키</translation>
    </message>
    <message>
        <source>String Value</source>
        <comment>menu item</comment>
        <translation>문자열 값</translation>
    </message>
    <message>
        <source>Binary Value</source>
        <comment>menu item</comment>
        <translation>이진값</translation>
    </message>
    <message>
        <source>DWORD (32-bit) Value</source>
        <comment>menu item</comment>
        <translation>DWORD(32비트) 값</translation>
    </message>
    <message>
        <source>QWORD (64-bit) Value</source>
        <comment>menu item</comment>
        <translation>QWORD(64비트) 값</translation>
    </message>
    <message>
        <source>Multi-String Value</source>
        <comment>menu item</comment>
        <translation>다중 문자열 값</translation>
    </message>
    <message>
        <source>Expandable String Value</source>
        <comment>menu item</comment>
        <translation>확장 가능한 문자열 값</translation>
    </message>
    <message>
        <source>Delete</source>
        <comment>menu item</comment>
        <translation>삭제</translation>
    </message>
    <message>
        <source>Rename</source>
        <comment>menu item</comment>
        <translation>이름 바꾸기</translation>
    </message>
</context>
<context>
    <name>QObject</name>
    <message>
        <source>Hibernation Detected</source>
        <translation>최대 절전 모드 감지됨</translation>
    </message>
    <message>
        <source>Your system is in hibernate mode. Therefore the registry cannot be edited. Please restart your system and exit the hibernate mode or contact Zenta Support</source>
        <translation>시스템이 최대 절전 모드입니다. 따라서 레지스트리를 편집할 수 없습니다. 시스템을 다시 시작하여 최대 절전 모드를 끝내거나 Zenta Support에 문의하십시오</translation>
    </message>
</context>
<context>
    <name>ValueDelegate</name>
    <message>
        <source>(value not set)</source>
        <translation>(값이 설정되지 않음)</translation>
    </message>
    <message>
        <source>The specified value name already exists.</source>
        <translation>지정한 값 이름이 이미 있습니다.</translation>
    </message>
</context>
<context>
    <name>ValuesModel</name>
    <message>
        <source>(Default)</source>
        <translation>(기본값)</translation>
    </message>
    <message>
        <source>Name</source>
        <comment>column title</comment>
        <translation>이름</translation>
    </message>
    <message>
        <source>Type</source>
        <comment>column title</comment>
        <translation>종류</translation>
    </message>
    <message>
        <source>Data</source>
        <comment>column title</comment>
        <translation>데이터</translation>
    </message>
</context>
<context>
    <name>ValuesProxyModel</name>
    <message>
        <source>(Default)</source>
        <translation>(기본값)</translation>
    </message>
</context>
<context>
    <name>ValuesView</name>
    <message>
        <source>Value name:</source>
        <translation>값 이름:</translation>
    </message>
    <message>
        <source>Value data:</source>
        <translation>값 데이터:</translation>
    </message>
    <message>
        <source>Edit String</source>
        <comment>dialog title</comment>
        <translation>문자열 편집</translation>
    </message>
    <message>
        <source>Edit Binary Value</source>
        <comment>dialog title</comment>
        <translation>이진값 편집</translation>
    </message>
    <message>
        <source>Edit Multi-String</source>
        <comment>dialog title</comment>
        <translation>다중 문자열 편집</translation>
    </message>
    <message>
        <source>Data type cannot be edited yet</source>
        <translation>이 데이터 형식은 아직 편집할 수 없습니다</translation>
    </message>
    <message>
        <source>Edit DWORD (32-bit) Value</source>
        <comment>dialog title</comment>
        <translation>DWORD(32비트) 값 편집</translation>
    </message>
    <message>
        <source>Edit QWORD (64-bit) Value</source>
        <comment>dialog title</comment>
        <translation>QWORD(64비트) 값 편집</translation>
    </message>
    <message>
        <source>Edit</source>
        <comment>menu title</comment>
        <translation>편집</translation>
    </message>
    <message>
        <source>New</source>
        <comment>menu title</comment>
        <translation>새로 만들기</translation>
    </message>
    <message>
        <source>The value could not be created.</source>
        <translation>값을 만들 수 없습니다.</translation>
    </message>
    <message>
        <source>The value could not be changed.</source>
        <translation>값을 변경할 수 없습니다.</translation>
    </message>
    <message>
        <source>Confirm Value Removal</source>
        <translation>값 삭제 확인</translation>
    </message>
    <message>
        <source>Are you sure you want to delete this value?</source>
        <translation>이 값을 삭제하시겠습니까?</translation>
    </message>
    <message>
        <source>The value could not be deleted.</source>
        <translation>값을 삭제할 수 없습니다.</translation>
    </message>
</context>
</TS>
