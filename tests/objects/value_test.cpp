// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "hive_on_disk.h"

#include "reg_hive.h"
#include "reg_key.h"

#include <QTest>

#include <stdexcept>

namespace {

QByteArray utf16(const QString& text) {
    QByteArray bytes;
    for (const QChar c : text) {
        bytes.append(static_cast<char>(c.unicode() & 0xFF));
        bytes.append(static_cast<char>(c.unicode() >> 8));
    }
    return bytes;
}

testkit::Bytes raw(const QByteArray& bytes) { return testkit::Bytes(bytes.begin(), bytes.end()); }

const QChar zero(u'\0');

testkit::HiveLayout layout() {
    testkit::HiveLayout hive;
    testkit::KeyLayout& key = hive.root.add("Key");
    key.set("behind", 1, raw(utf16(QStringLiteral("abc") + zero + QStringLiteral("def"))));
    key.set("reversed", 5, {0, 0, 1, 2});
    key.set("wrong dword", 4, testkit::pattern(8));
    key.set("short dword", 4, {5, 1});
    key.set("nothing", 7, {});
    key.set("ab", 7, raw(utf16(QStringLiteral("a") + zero + QStringLiteral("b") + zero + zero)));
    key.set("open", 7, raw(utf16(QStringLiteral("a") + zero + QStringLiteral("b") + zero)));
    key.set("hole", 7, raw(utf16(QStringLiteral("a") + zero + zero + QStringLiteral("b") + zero + zero)));
    key.set("qword", 11, {1, 2, 3, 4, 5, 6, 7, 8});
    key.set("odd", 1, {'a', 0, 'b'});
    key.set("strange", 0xFFFF0012, {9, 9});
    testkit::ValueLayout& big = key.set("big", 3, testkit::pattern(40000));
    big.storage = testkit::Storage::big;
    testkit::KeyLayout& wide = hive.root.add("Wide");
    testkit::ValueLayout& named = wide.set("Ab", 4, testkit::pattern(4));
    named.wide_name = true;
    wide.set("A", 4, testkit::pattern(4));
    testkit::ValueLayout unicode;
    unicode.name = u"\u4e2d";
    unicode.wide_name = true;
    unicode.type = 4;
    unicode.data = testkit::pattern(4);
    wide.values.push_back(unicode);
    hive.root.add("Empty");
    return hive;
}

struct Opened {
    HiveOnDisk file{layout()};
    DummyRegKey top{QStringLiteral("TOP")};
    RegHive hive{QStringLiteral("HIVE"), file.path(), &top};

    // The keys stand in alphabetical order: Empty, Key, Wide.
    RegKey* empty() { return static_cast<RegKey*>(hive.root_key()->child(0)); }
    RegKey* key() { return static_cast<RegKey*>(hive.root_key()->child(1)); }
    RegKey* wide() { return static_cast<RegKey*>(hive.root_key()->child(2)); }

    static int row(RegKey* key, const QString& name) {
        for (int i = 0; i < key->value_count(); i++) {
            if (key->read_value_without_data(i).name == name)
                return i;
        }
        return -1;
    }
    std::unique_ptr<RegValue> read(const QString& name) { return key()->read_value(row(key(), name)); }
};

}  // namespace

class ValueTest : public QObject {
    Q_OBJECT

private slots:
    void text_ends_at_its_first_zero() {
        Opened opened;
        QCOMPARE(opened.read(QStringLiteral("behind"))->data, QVariant(QStringLiteral("abc")));
        QCOMPARE(opened.read(QStringLiteral("odd"))->data, QVariant(QStringLiteral("a")));
    }

    void a_big_endian_number_keeps_its_bytes() {
        Opened opened;
        const auto value = opened.read(QStringLiteral("reversed"));
        QCOMPARE(value->data, QVariant(258U));
        QCOMPARE(value->type, 5U);
        QVERIFY(opened.key()->set_dword_value(value->name, value->data.toUInt(), big_endian_order));
        QCOMPARE(opened.file.stored("Key", "reversed"), QByteArray("\0\0\1\2", 4));
        QCOMPARE(opened.file.stored_type("Key", "reversed"), 5);
    }

    void a_dword_of_eight_bytes_reads_as_nothing_and_one_of_two_as_if_zeros_followed() {
        Opened opened;
        QVERIFY(opened.read(QStringLiteral("wrong dword")) == nullptr);
        QCOMPARE(opened.read(QStringLiteral("short dword"))->data, QVariant(0x105U));
    }

    void a_missing_index_throws() {
        Opened opened;
        for (const int index : {-1, 99}) {
            try {
                opened.key()->read_value(index);
                QFAIL("nothing was thrown");
            } catch (const std::invalid_argument& thrown) {
                QCOMPARE(thrown.what(), "index");
            }
        }
    }

    void lists_are_split_at_zeros() {
        Opened opened;
        const QStringList ab = {QStringLiteral("a"), QStringLiteral("b")};
        QCOMPARE(opened.read(QStringLiteral("nothing"))->data.toStringList(), QStringList());
        QCOMPARE(opened.read(QStringLiteral("ab"))->data.toStringList(), ab);
        QCOMPARE(opened.read(QStringLiteral("open"))->data.toStringList(), ab);
        QCOMPARE(opened.read(QStringLiteral("hole"))->data.toStringList(),
                 QStringList({QStringLiteral("a"), QString(), QStringLiteral("b")}));
    }

    void an_empty_list_is_four_zero_bytes() {
        Opened opened;
        QVERIFY(opened.key()->set_multi_string_value(QStringLiteral("nothing"), QStringList()));
        QCOMPARE(opened.file.stored("Key", "nothing"), QByteArray(4, '\0'));
    }

    void empty_strings_of_a_list_are_dropped() {
        Opened opened;
        QVERIFY(opened.key()->set_multi_string_value(QStringLiteral("list"),
                                                     {QStringLiteral("a"), QString(), QStringLiteral("b")}));
        QCOMPARE(opened.file.stored("Key", "list"),
                 utf16(QStringLiteral("a") + zero + QStringLiteral("b") + zero + zero));
    }

    void big_data_is_read_whole() {
        Opened opened;
        const testkit::Bytes expected = testkit::pattern(40000);
        QCOMPARE(opened.read(QStringLiteral("big"))->data.toByteArray(),
                 QByteArray(reinterpret_cast<const char*>(expected.data()), 40000));
    }

    void other_types_are_bytes_with_their_number() {
        Opened opened;
        const auto value = opened.read(QStringLiteral("strange"));
        QCOMPARE(value->type, 0xFFFF0012U);
        QCOMPARE(value->data, QVariant(QByteArray("\11\11")));
    }

    void stored_sizes_data() {
        QTest::addColumn<int>("size");
        for (const int size : {0, 1, 4, 5, 100, 16344, 16345, 1048576})
            QTest::addRow("%d bytes", size) << size;
    }
    void stored_sizes() {
        QFETCH(int, size);
        Opened opened;
        const testkit::Bytes data = testkit::pattern(static_cast<size_t>(size));
        const QByteArray bytes(reinterpret_cast<const char*>(data.data()), size);
        QVERIFY(opened.key()->set_binary_value(QStringLiteral("sized"), bytes, 3));
        QCOMPARE(opened.file.stored("Key", "sized"), bytes);
        QCOMPARE(opened.read(QStringLiteral("sized"))->data.toByteArray(), bytes);
        QCOMPARE(opened.file.faults(), std::string());
    }

    void text_of_every_script_is_stored_with_a_final_zero() {
        Opened opened;
        const QString text = QStringLiteral("a\u00e4\u4e2d\U0001F600<b>x</b>\t\"\n");
        QVERIFY(opened.key()->set_string_value(QStringLiteral("text"), text, 2));
        QCOMPARE(opened.file.stored("Key", "text"), utf16(text + zero));
        QCOMPARE(opened.file.stored_type("Key", "text"), 2);
        QCOMPARE(opened.read(QStringLiteral("text"))->data.toString(), text);
    }

    void a_name_in_utf_16_is_a_new_value_s_by_its_text_and_not_by_its_bytes() {
        testkit::HiveLayout hive;
        testkit::KeyLayout& layout = hive.root.add("Key");
        layout.set("New Value #2", 4, testkit::pattern(4)).wide_name = true;
        testkit::ValueLayout& bytes = layout.set("", 4, testkit::pattern(4));
        bytes.name = u"\u654e\u2077\u6156\u756c\u2065\u3123";  // "New Value #1", two letters a unit
        bytes.wide_name = true;
        const HiveOnDisk file(hive);
        DummyRegKey top(QStringLiteral("TOP"));
        RegHive opened(QStringLiteral("HIVE"), file.path(), &top);
        auto* const key = static_cast<RegKey*>(opened.root_key()->child(0));
        QCOMPARE(key->new_value_name(), QStringLiteral("New Value #1"));
        QVERIFY(key->set_qword_value(QStringLiteral("New Value #1"), 1, RegKey::new_value));
        QCOMPARE(key->new_value_name(), QStringLiteral("New Value #3"));
    }

    void new_value_names_count_up() {
        Opened opened;
        QCOMPARE(opened.empty()->new_value_name(), QStringLiteral("New Value #1"));
        QVERIFY(opened.empty()->set_qword_value(QStringLiteral("New Value #1"), 1));
        QCOMPARE(opened.empty()->new_value_name(), QStringLiteral("New Value #2"));
        for (const char* name : {"NEW value #2", "New Value #4", "New Value #03", "New Value #3x", "New Value #"})
            QVERIFY(opened.empty()->set_qword_value(QLatin1String(name), 1));
        QCOMPARE(opened.empty()->new_value_name(), QStringLiteral("New Value #3"));
        QVERIFY(opened.empty()->set_qword_value(QStringLiteral("New Value #3"), 1));
        QCOMPARE(opened.empty()->new_value_name(), QStringLiteral("New Value #5"));
    }

    void a_rename_keeps_type_and_bytes() {
        Opened opened;
        for (const char* name : {"qword", "behind", "odd", "hole", "short dword", "strange"}) {
            const QByteArray before = opened.file.stored("Key", name);
            const int type = opened.file.stored_type("Key", name);
            const QString renamed = QStringLiteral("new ") + QLatin1String(name);
            QVERIFY2(opened.key()->rename_value(Opened::row(opened.key(), QLatin1String(name)), renamed), name);
            QCOMPARE(opened.file.stored("Key", renamed.toStdString()), before);
            QCOMPARE(opened.file.stored_type("Key", renamed.toStdString()), type);
            QCOMPARE(opened.file.stored("Key", name), QByteArrayLiteral("?"));
        }
        QCOMPARE(opened.file.faults(), std::string());
    }

    void renames_that_are_refused_change_nothing_data() {
        QTest::addColumn<QString>("old_name");
        QTest::addColumn<QString>("new_name");
        QTest::newRow("a name that is taken") << "qword"
                                              << "AB";
        QTest::newRow("its own name in another case") << "qword"
                                                      << "QWORD";
        QTest::newRow("no name") << "qword"
                                 << "";
        QTest::newRow("16384 characters") << "qword" << QString(16384, QLatin1Char('x'));
        QTest::newRow("a character that 8 bits do not carry") << "qword" << QStringLiteral("\u4e2d");
        QTest::newRow("data that cannot be read") << "wrong dword"
                                                  << "other";
    }
    void renames_that_are_refused_change_nothing() {
        QFETCH(QString, old_name);
        QFETCH(QString, new_name);
        Opened opened;
        const testkit::Bytes before = opened.file.bytes();
        QVERIFY(!opened.key()->rename_value(Opened::row(opened.key(), old_name), new_name));
        QVERIFY(opened.file.bytes() == before);
    }

    void the_longest_name_can_be_given_and_taken_away() {
        Opened opened;
        const QString longest(16383, QLatin1Char('n'));
        QVERIFY(opened.key()->rename_value(Opened::row(opened.key(), QStringLiteral("qword")), longest));
        QCOMPARE(opened.file.stored("Key", longest.toStdString()), QByteArray("\1\2\3\4\5\6\7\10", 8));
        QVERIFY(opened.key()->delete_value(Opened::row(opened.key(), longest)));
        QCOMPARE(Opened::row(opened.key(), longest), -1);
    }

    void a_name_in_utf16_is_not_taken_for_another() {
        Opened opened;
        const int ab = Opened::row(opened.wide(), QStringLiteral("Ab"));
        const int a = Opened::row(opened.wide(), QStringLiteral("A"));
        QVERIFY(opened.wide()->set_dword_value(QStringLiteral("A"), 5, little_endian_order, a));
        QVERIFY(!opened.wide()->set_dword_value(QStringLiteral("A"), 6, little_endian_order, ab));
        const testkit::Bytes pattern = testkit::pattern(4);
        QCOMPARE(opened.file.stored("Wide", "Ab"), QByteArray(reinterpret_cast<const char*>(pattern.data()), 4));
        QVERIFY(opened.wide()->delete_value(ab));
        QCOMPARE(opened.file.stored("Wide", "A"), QByteArray("\5\0\0\0", 4));
        const int unicode = Opened::row(opened.wide(), QStringLiteral("\u4e2d"));
        QVERIFY(unicode >= 0);
        QVERIFY(!opened.wide()->delete_value(unicode));
    }

    void the_default_value_is_known_made_and_deleted() {
        Opened opened;
        QVERIFY(!opened.empty()->has_default_value());
        QVERIFY(opened.empty()->set_string_value(QString(), QStringLiteral("x"), 1));
        QVERIFY(opened.empty()->has_default_value());
        QVERIFY(opened.empty()->delete_value(0));
        QVERIFY(!opened.empty()->has_default_value());
        QCOMPARE(opened.empty()->value_count(), 0);
    }
};

QTEST_GUILESS_MAIN(ValueTest)
#include "value_test.moc"
