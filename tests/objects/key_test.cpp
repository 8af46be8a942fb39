// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "hive_on_disk.h"

#include "reg_hive.h"
#include "reg_key.h"

#include <QTest>

#include <malloc.h>

#include <functional>
#include <stdexcept>

namespace {

testkit::HiveLayout layout() {
    testkit::HiveLayout hive;
    testkit::KeyLayout& parent = hive.root.add("Parent");
    for (const char* name : {"alpha", "Beta", "gamma", "_under", "Zulu"})
        parent.add(name);
    parent.children[0].add("inner").set("v", 4, testkit::pattern(4));
    hive.root.add("Empty");
    testkit::KeyLayout& wide = hive.root.add("Wide");
    wide.add("Abc").wide_name = true;
    wide.add("A");
    wide.add("B");
    hive.root.add("Rooted").per_leaf = 2;
    for (const char* name : {"r1", "r2", "r3"})
        hive.root.children.back().add(name);
    return hive;
}

// A hive that is open for one test.
struct Opened {
    HiveOnDisk file{layout()};
    DummyRegKey top{QStringLiteral("TOP")};
    RegHive hive{QStringLiteral("HIVE"), file.path(), &top};

    RegKey* key(const QString& name) {
        for (int i = 0; i < hive.root_key()->child_count(); i++) {
            if (hive.root_key()->child(i)->name() == name)
                return static_cast<RegKey*>(hive.root_key()->child(i));
        }
        qFatal("no key %s", qPrintable(name));
    }
    static QStringList names(AbstractRegKey* parent) {
        QStringList all;
        for (int i = 0; i < parent->child_count(); i++)
            all.append(parent->child(i)->name());
        return all;
    }
    static int row(AbstractRegKey* parent, const QString& name) {
        return static_cast<int>(names(parent).indexOf(name));
    }
};

template <typename Thrown, typename Call>
QString thrown(Call call) {
    try {
        call();
    } catch (const Thrown& failure) {
        return QString::fromLatin1(failure.what());
    }
    return QString();
}

}  // namespace

class KeyTest : public QObject {
    Q_OBJECT

private slots:
    // Two objects then stand for one key: what is made through the one moves what the other shows.
    void a_key_that_lists_itself_changes_no_other_subkey_than_the_one_it_shows() {
        testkit::LaidHive laid = testkit::lay_out(layout());
        laid.put32(laid.at("Parent").index, 4 + 8 * 4, laid.at("Parent").record);  // for the last of the five
        const HiveOnDisk file(laid.bytes);
        DummyRegKey top(QStringLiteral("TOP"));
        RegHive hive(QStringLiteral("HIVE"), file.path(), &top);
        AbstractRegKey* const root = hive.root_key();
        auto* outer = static_cast<RegKey*>(root->child(1));
        QCOMPARE(outer->name(), QStringLiteral("Parent"));
        QCOMPARE(Opened::names(outer).size(), 5);
        auto* inner = static_cast<RegKey*>(outer->child(4));
        QCOMPARE(inner->name(), QStringLiteral("Parent"));
        for (int i = 0; i < 3; i++)
            QVERIFY(inner->new_key() >= 0);
        // The outer one still shows five, and the rows behind the new ones are others by now.
        QCOMPARE(outer->child_count(), 5);
        QVERIFY(!outer->delete_key(3));
        QCOMPARE(outer->rename_key(3, QStringLiteral("new name")), -1);
        outer->new_key();
        const testkit::Hive read = file.read();
        for (const char* name : {"Parent\\alpha", "Parent\\Beta", "Parent\\gamma", "Parent\\Zulu"})
            QVERIFY2(read.find(name) != nullptr, name);
    }

    // What the inner object makes takes the outer one's keys to other places; their values are still only theirs.
    void a_key_that_lists_itself_changes_no_value_of_another_key() {
        testkit::HiveLayout two = layout();
        for (testkit::KeyLayout& key : two.root.children[0].children)
            key.set("v", 4, testkit::pattern(4));
        testkit::LaidHive laid = testkit::lay_out(two);
        laid.put32(laid.at("Parent").index, 4 + 8, laid.at("Parent").record);  // for the second of the five
        const HiveOnDisk file(laid.bytes);
        const testkit::Hive before = file.read();
        DummyRegKey top(QStringLiteral("TOP"));
        RegHive hive(QStringLiteral("HIVE"), file.path(), &top);
        auto* outer = static_cast<RegKey*>(hive.root_key()->child(1));
        auto* inner = static_cast<RegKey*>(outer->child(1));
        auto* shown = static_cast<RegKey*>(outer->child(3));
        QCOMPARE(shown->name(), QStringLiteral("Zulu"));
        QVERIFY(inner->new_key() >= 0);
        hive.clear_handle_cache();
        QCOMPARE(thrown<std::runtime_error>(
                     [&] { shown->set_dword_value(QStringLiteral("v"), 99, little_endian_order, 0); }),
                 QStringLiteral("ROpenSubKey failed"));
        QVERIFY(!outer->can_delete_tree(3));
        QVERIFY(testkit::diff(before, file.read()).size() == 1);  // the key that was made
    }

    void a_key_whose_name_holds_a_backslash_deletes_none_that_the_path_would_lead_to() {
        testkit::HiveLayout odd;
        testkit::KeyLayout& parent = odd.root.add("Parent");
        parent.add("a").add("0");
        parent.children[0].add("b").set("v", 4, testkit::pattern(4));
        parent.add("a\\b");
        const HiveOnDisk file(odd);
        const testkit::Bytes before = file.bytes();
        DummyRegKey top(QStringLiteral("TOP"));
        RegHive hive(QStringLiteral("HIVE"), file.path(), &top);
        auto* shown = static_cast<RegKey*>(hive.root_key()->child(0));
        QCOMPARE(shown->child(1)->name(), QStringLiteral("a\\b"));
        QVERIFY(!shown->can_delete_tree(1));
        QVERIFY(!shown->delete_key(1));
        QVERIFY(file.bytes() == before);
    }

    // The sibling's name is another one, which goes on behind a zero.
    void a_rename_beside_a_name_with_a_zero_inside_moves_the_object_to_its_own_place() {
        testkit::HiveLayout odd;
        testkit::KeyLayout& parent = odd.root.add("Parent");
        parent.add("").set("v", 4, {2, 0, 0, 0});
        parent.children[0].name = std::u16string(u"abc\0def", 7);
        parent.add("x").set("v", 4, {1, 0, 0, 0});
        const HiveOnDisk file(odd);
        DummyRegKey top(QStringLiteral("TOP"));
        RegHive hive(QStringLiteral("HIVE"), file.path(), &top);
        auto* shown = static_cast<RegKey*>(hive.root_key()->child(0));
        auto* renamed = static_cast<RegKey*>(shown->child(1));
        const int row = shown->rename_key(1, QStringLiteral("abc"));
        QCOMPARE(row, 0);
        QCOMPARE(shown->child(row), renamed);
        QCOMPARE(renamed->name(), QStringLiteral("abc"));
        QVERIFY(renamed->set_dword_value(QStringLiteral("v"), 99, little_endian_order, 0));
        QCOMPARE(file.stored("Parent\\abc", "v"), QByteArray("\x63\0\0\0", 4));
    }

    void a_link_is_named_in_either_storage() {
        testkit::HiveLayout odd;
        for (const char* name : {"Narrow", "Wide"})
            odd.root.add(name).flags = 0x10;
        odd.root.children[1].wide_name = true;
        const HiveOnDisk file(odd);
        DummyRegKey top(QStringLiteral("TOP"));
        RegHive hive(QStringLiteral("HIVE"), file.path(), &top);
        QCOMPARE(Opened::names(hive.root_key()), QStringList({QStringLiteral("Narrow"), QStringLiteral("Wide")}));
    }

    void a_link_is_named_as_any_other_key_is_data() {
        QTest::addColumn<QString>("name");
        QTest::addColumn<bool>("wide");
        for (const bool wide : {false, true}) {
            const char* const storage = wide ? "UTF-16" : "8 bits";
            QTest::addRow("the longest that is shown, in %s", storage) << QString(512, u'n') << wide;
            QTest::addRow("a longer one, in %s", storage) << QString(513, u'n') << wide;
            QTest::addRow("twice the longest, in %s", storage) << QString(1024, u'n') << wide;
            QTest::addRow("more than twice the longest, in %s", storage) << QString(1100, u'n') << wide;
            QTest::addRow("a zero inside, in %s", storage) << QStringLiteral("one\0two") << wide;
        }
    }

    void a_link_is_named_as_any_other_key_is() {
        QFETCH(const QString, name);
        QFETCH(const bool, wide);
        testkit::HiveLayout odd;
        for (const uint16_t flags : {uint16_t{0}, uint16_t{0x10}}) {
            testkit::KeyLayout& key = odd.root.add("Key").add("");
            key.name = name.toStdU16String();
            key.wide_name = wide;
            key.flags = flags;
            odd.root.children.back().name.push_back(u'0' + static_cast<char16_t>(odd.root.children.size()));
        }
        const HiveOnDisk file(odd);
        DummyRegKey top(QStringLiteral("TOP"));
        RegHive hive(QStringLiteral("HIVE"), file.path(), &top);
        for (int i = 0; i < 2; i++) {
            AbstractRegKey* const key = hive.root_key()->child(i)->child(0);
            if (name.size() <= 512)
                QCOMPARE(key->name(), name);
            else
                QVERIFY_THROWS_EXCEPTION(std::runtime_error, key->name());
        }
    }

    // "Loop" lists itself and a link: a key that is made through the inner one moves the link in the list of both.
    void a_link_does_not_take_the_name_of_the_key_that_stands_in_its_place() {
        testkit::HiveLayout odd;
        testkit::KeyLayout& layout = odd.root.add("Loop");
        layout.add("A");
        layout.add("Symbolic").flags = 0x10;
        testkit::LaidHive laid = testkit::lay_out(odd);
        laid.put32(laid.at("Loop").index, 4, laid.at("Loop").record);
        laid.put32(laid.at("Loop").record, 16, laid.at("Loop").record);
        const HiveOnDisk file(laid.bytes);
        DummyRegKey top(QStringLiteral("TOP"));
        RegHive hive(QStringLiteral("HIVE"), file.path(), &top);
        auto* const loop = static_cast<RegKey*>(hive.root_key()->child(0));
        auto* const inner = static_cast<RegKey*>(loop->child(0));
        AbstractRegKey* const link_key = loop->child(1);
        QCOMPARE(link_key->name(), QStringLiteral("Symbolic"));
        QVERIFY(inner->new_key() >= 0);
        try {
            QCOMPARE(link_key->name(), QStringLiteral("Symbolic"));
        } catch (const std::runtime_error&) {
            // told
        }
    }

    void a_value_whose_name_is_half_a_character_is_the_default_value() {
        testkit::HiveLayout odd;
        odd.root.add("Key").set("b", 1, testkit::text_data("one text"));
        testkit::LaidHive laid = testkit::lay_out(odd);
        laid.put16(laid.at("Key").values[0].record, 16, 0);  // said to be UTF-16
        const HiveOnDisk file(laid.bytes);
        DummyRegKey top(QStringLiteral("TOP"));
        RegHive hive(QStringLiteral("HIVE"), file.path(), &top);
        QCOMPARE(static_cast<RegKey*>(hive.root_key()->child(0))->default_value_position(), 0);
    }

    void a_value_whose_name_goes_on_behind_a_zero_can_be_deleted_and_renamed_but_not_written_as_another() {
        testkit::HiveLayout odd;
        for (const char* name : {"Deleted", "Renamed"}) {
            odd.root.add(name).set("", 4, testkit::pattern(4));
            odd.root.children.back().values[0].name = std::u16string(u"one\0", 4);
        }
        const HiveOnDisk file(odd);
        DummyRegKey top(QStringLiteral("TOP"));
        RegHive hive(QStringLiteral("HIVE"), file.path(), &top);
        auto* deleted = static_cast<RegKey*>(hive.root_key()->child(0));
        auto* renamed = static_cast<RegKey*>(hive.root_key()->child(1));
        QVERIFY(!renamed->set_dword_value(renamed->read_value_without_data(0).name, 99, little_endian_order, 0));
        QVERIFY(renamed->rename_value(0, QStringLiteral("plain")));
        QCOMPARE(file.stored("Renamed", "plain").size(), 4);
        QCOMPARE(renamed->value_count(), 1);
        QVERIFY(deleted->delete_value(0));
        QCOMPARE(deleted->value_count(), 0);
    }

    // The engine finds such a value by what stands before the zero, and no value is renamed to what is found.
    void no_value_is_renamed_to_the_beginning_of_a_name_that_goes_on_behind_a_zero() {
        testkit::HiveLayout odd;
        testkit::KeyLayout& layout = odd.root.add("Key");
        layout.set("", 4, testkit::pattern(4)).name = std::u16string(u"one\0x", 5);
        layout.set("other", 4, testkit::pattern(4));
        const HiveOnDisk file(odd);
        const testkit::Bytes before = file.bytes();
        DummyRegKey top(QStringLiteral("TOP"));
        RegHive hive(QStringLiteral("HIVE"), file.path(), &top);
        auto* key = static_cast<RegKey*>(hive.root_key()->child(0));
        QVERIFY(!key->rename_value(1, QStringLiteral("one")));
        QVERIFY(file.bytes() == before);
        QVERIFY(key->rename_value(1, QStringLiteral("on")));
    }

    void a_dummy_key_has_its_label_no_parent_and_the_children_it_was_given() {
        DummyRegKey top(QStringLiteral("TOP"));
        DummyRegKey other(QStringLiteral("other"));
        QCOMPARE(top.name(), QStringLiteral("TOP"));
        QCOMPARE(top.parent(), nullptr);
        QCOMPARE(top.child_count(), 0);
        QCOMPARE(top.child_number(), 0);
        top.add_child(&other);
        QCOMPARE(top.child_count(), 1);
        QCOMPARE(top.child(0), static_cast<AbstractRegKey*>(&other));
        QCOMPARE(other.parent(), nullptr);
    }

    void a_child_is_made_once() {
        Opened opened;
        RegKey* parent = opened.key(QStringLiteral("Parent"));
        AbstractRegKey* first = parent->child(0);
        QCOMPARE(parent->child(0), first);
        QCOMPARE(first->parent(), static_cast<AbstractRegKey*>(parent));
        QCOMPARE(first->child_number(), 0);
        QCOMPARE(first->child_count(), 1);
    }

    // Each of them has as many subkeys, none of which was asked for.
    void rows_of_keys_that_list_the_same_keys_take_little_memory() {
        constexpr int count = 1500;
        testkit::HiveLayout hive;
        testkit::KeyLayout& parent = hive.root.add("Parent");
        for (int i = 0; i < count; i++)
            parent.add("key" + std::to_string(10000 + i));
        testkit::LaidHive laid = testkit::lay_out(hive);
        for (const testkit::KeyLayout& key : hive.root.children[0].children) {
            const uint32_t record = laid.at("Parent\\" + testkit::utf8(key.name)).record;
            laid.put32(record, 20, count);
            laid.put32(record, 28, laid.at("Parent").index);
        }
        const HiveOnDisk file(laid.bytes);
        DummyRegKey top(QStringLiteral("TOP"));
        RegHive opened(QStringLiteral("HIVE"), file.path(), &top);
        auto* key = static_cast<RegKey*>(opened.root_key()->child(0));
        key->child(0);
        const size_t before = mallinfo2().uordblks;
        for (int i = 0; i < count; i++)
            QCOMPARE(key->child(i)->child_count(), count);
        QVERIFY(mallinfo2().uordblks - before < 10 * laid.bytes.size());  // a sanitizer's memory is not counted
        QVERIFY(key->child(1)->child(2)->parent() == key->child(1));
    }

    // The file is mended behind the program's back: the row that was shown without subkeys stays without, and says so.
    void a_key_that_could_not_be_opened_stays_so() {
        testkit::HiveLayout hive;
        testkit::KeyLayout& bad = hive.root.add("Bad");
        bad.add("one");
        bad.add("two");
        testkit::LaidHive laid = testkit::lay_out(hive);
        const uint64_t signature = testkit::LaidHive::position(laid.at("Bad").record);
        const testkit::Bytes sound = laid.bytes;
        laid.bytes[signature] = 'x';
        const HiveOnDisk file(laid.bytes);
        DummyRegKey top(QStringLiteral("TOP"));
        RegHive opened(QStringLiteral("HIVE"), file.path(), &top);
        auto* shown = static_cast<RegKey*>(opened.root_key()->shown_child(0));
        QCOMPARE(shown->child_count(), 0);
        QFile mended(file.path());
        QVERIFY(mended.open(QIODevice::ReadWrite) && mended.seek(static_cast<qint64>(signature)));
        QCOMPARE(mended.write("n", 1), qint64(1));
        mended.close();
        // The engine's window still has the old byte until it is loaded anew.
        QVERIFY(opened.root_key()->set_dword_value(QStringLiteral("any"), 1, little_endian_order));
        const testkit::Bytes before = file.bytes();
        const std::function<void()> acts[] = {
            [&] { shown->name(); },
            [&] { shown->value_count(); },
            [&] { shown->new_key(); },
            [&] { shown->rename_key(0, QStringLiteral("other")); },
            [&] { shown->delete_key(0); },
            [&] { shown->set_dword_value(QStringLiteral("v"), 1, little_endian_order); },
            [&] { shown->can_delete_tree(0); }};
        for (const auto& act : acts)
            QCOMPARE(thrown<std::runtime_error>(act), QStringLiteral("ROpenSubKey failed"));
        QVERIFY(file.bytes() == before);
    }

    void a_key_that_is_listed_below_itself_is_told() {
        testkit::HiveLayout hive;
        testkit::KeyLayout& outer = hive.root.add("Outer");
        outer.add("Inner").add("leaf");
        testkit::LaidHive laid = testkit::lay_out(hive);
        laid.put32(laid.at("Outer\\Inner").index, 4, laid.at("Outer").record);
        const HiveOnDisk file(laid.bytes);
        DummyRegKey top(QStringLiteral("TOP"));
        RegHive opened(QStringLiteral("HIVE"), file.path(), &top);
        AbstractRegKey* outer_key = opened.root_key()->child(0);
        AbstractRegKey* inner = outer_key->child(0);
        QVERIFY(!opened.root_key()->is_below_itself());
        QVERIFY(!outer_key->is_below_itself());
        QVERIFY(!inner->is_below_itself());
        QCOMPARE(inner->child(0)->name(), QStringLiteral("Outer"));
        QVERIFY(inner->child(0)->is_below_itself());
    }

    void a_child_outside_the_list_is_out_of_range() {
        Opened opened;
        RegKey* parent = opened.key(QStringLiteral("Parent"));
        QCOMPARE(thrown<std::out_of_range>([&] { parent->child(5); }), QStringLiteral("vector::_M_range_check"));
        QCOMPARE(thrown<std::out_of_range>([&] { parent->child(-1); }), QStringLiteral("vector::_M_range_check"));
    }

    void a_key_needs_a_parent_and_a_number() {
        Opened opened;
        QCOMPARE(thrown<std::invalid_argument>([&] { RegKey key(&opened.hive, nullptr, 0); }),
                 QStringLiteral("parent"));
        QCOMPARE(thrown<std::invalid_argument>([&] { RegKey key(&opened.hive, opened.hive.root_key(), -1); }),
                 QStringLiteral("child_number"));
        QCOMPARE(thrown<std::runtime_error>([&] { RegKey key(&opened.hive, opened.hive.root_key(), 99); }),
                 QStringLiteral("ROpenSubKey failed"));
        QCOMPARE(opened.hive.cached_handles(), 0);
    }

    void new_keys_take_the_lowest_free_number() {
        Opened opened;
        RegKey* parent = opened.key(QStringLiteral("Empty"));
        QCOMPARE(parent->new_key(), 0);
        QCOMPARE(parent->child(0)->name(), QStringLiteral("New Key #1"));
        QCOMPARE(parent->new_key(), 1);
        QCOMPARE(parent->new_key(), 2);
        QVERIFY(parent->delete_key(1));
        QCOMPARE(parent->new_key(), 1);
        QCOMPARE(Opened::names(parent), QStringList({QStringLiteral("New Key #1"), QStringLiteral("New Key #2"),
                                                     QStringLiteral("New Key #3")}));
        QCOMPARE(opened.file.faults(), std::string());
    }

    void a_new_key_lands_where_the_order_wants_it() {
        Opened opened;
        RegKey* parent = opened.key(QStringLiteral("Parent"));
        AbstractRegKey* zulu = parent->child(Opened::row(parent, QStringLiteral("Zulu")));
        const int before = zulu->child_number();
        const int row = parent->new_key();
        QCOMPARE(row, Opened::row(parent, QStringLiteral("New Key #1")));
        QCOMPARE(zulu->child_number(), before + 1);
        QCOMPARE(zulu->name(), QStringLiteral("Zulu"));
        QCOMPARE(opened.file.faults(), std::string());
    }

    void a_key_with_subkeys_is_not_deleted() {
        Opened opened;
        RegKey* parent = opened.key(QStringLiteral("Parent"));
        const QStringList before = Opened::names(parent);
        QVERIFY(!parent->delete_key(Opened::row(parent, QStringLiteral("alpha"))));
        QCOMPARE(Opened::names(parent), before);
        QVERIFY(parent->delete_key(Opened::row(parent, QStringLiteral("Beta"))));
        QCOMPARE(parent->child_count(), before.size() - 1);
        QVERIFY(!parent->delete_key(-1));
        QVERIFY(!parent->delete_key(99));
        QVERIFY(opened.file.read().find("Parent\\Beta") == nullptr);
    }

    void names_with_an_underscore_are_found() {
        Opened opened;
        RegKey* parent = opened.key(QStringLiteral("Parent"));
        QVERIFY(parent->rename_key(Opened::row(parent, QStringLiteral("_under")), QStringLiteral("_other")) >= 0);
        QVERIFY(parent->delete_key(Opened::row(parent, QStringLiteral("_other"))));
        QCOMPARE(opened.file.faults(), std::string());
    }

    void a_rename_moves_the_object() {
        Opened opened;
        RegKey* parent = opened.key(QStringLiteral("Parent"));
        const int old_row = Opened::row(parent, QStringLiteral("alpha"));
        AbstractRegKey* alpha = parent->child(old_row);
        const int row = parent->rename_key(old_row, QStringLiteral("omega"));
        QVERIFY(row > old_row);
        QCOMPARE(parent->child(row), alpha);
        QCOMPARE(alpha->name(), QStringLiteral("omega"));
        QCOMPARE(alpha->child(0)->name(), QStringLiteral("inner"));
        QVERIFY(opened.file.read().find("Parent\\omega\\inner") != nullptr);
        QCOMPARE(opened.file.faults(), std::string());
    }

    void a_rename_to_a_siblings_name_is_refused_in_any_case() {
        Opened opened;
        RegKey* parent = opened.key(QStringLiteral("Parent"));
        const testkit::Bytes before = opened.file.bytes();
        const int row = Opened::row(parent, QStringLiteral("alpha"));
        QCOMPARE(parent->rename_key(row, QStringLiteral("BETA")), -1);
        QCOMPARE(parent->rename_key(row, QStringLiteral("ALPHA")), -1);
        QCOMPARE(parent->rename_key(row, QString()), -1);
        QCOMPARE(parent->rename_key(row, QStringLiteral("a\\b")), -1);
        QCOMPARE(parent->rename_key(row, QStringLiteral("\u4e2d")), -1);
        QVERIFY(opened.file.bytes() == before);
    }

    void a_name_of_255_characters_is_the_longest() {
        Opened opened;
        RegKey* parent = opened.key(QStringLiteral("Parent"));
        const testkit::Bytes before = opened.file.bytes();
        const int row = Opened::row(parent, QStringLiteral("alpha"));
        QCOMPARE(parent->rename_key(row, QString(256, QLatin1Char('x'))), -3);
        QVERIFY(opened.file.bytes() == before);
        QVERIFY(parent->rename_key(row, QString(255, QLatin1Char('x'))) >= 0);
        QCOMPARE(Opened::names(parent).filter(QString(255, QLatin1Char('x'))).size(), 1);
    }

    void a_name_in_utf16_is_shown_and_hides_no_other() {
        Opened opened;
        RegKey* parent = opened.key(QStringLiteral("Wide"));
        QCOMPARE(Opened::names(parent), QStringList({QStringLiteral("A"), QStringLiteral("Abc"), QStringLiteral("B")}));
        QVERIFY(!parent->delete_key(1));
        QVERIFY(parent->delete_key(2));
        QVERIFY(parent->delete_key(0));
        QCOMPARE(Opened::names(parent), QStringList({QStringLiteral("Abc")}));
    }

    void below_an_index_root_all_works_but_deletion() {
        Opened opened;
        RegKey* parent = opened.key(QStringLiteral("Rooted"));
        QVERIFY(!parent->delete_key(0));
        QVERIFY(!parent->can_delete_tree(0));
        QVERIFY(parent->new_key() >= 0);
        QVERIFY(parent->rename_key(Opened::row(parent, QStringLiteral("r1")), QStringLiteral("s1")) >= 0);
        QCOMPARE(Opened::names(parent), QStringList({QStringLiteral("New Key #1"), QStringLiteral("r2"),
                                                     QStringLiteral("r3"), QStringLiteral("s1")}));
        QCOMPARE(opened.file.faults(), std::string());
    }

    // The engine refuses to close a hive while one of its handles is open; the hive's end insists that it does not.
    void a_hive_that_was_browsed_closes_its_handles_before_the_root() {
        const HiveOnDisk file(layout());
        for (int i = 0; i < 2; i++) {
            DummyRegKey top(QStringLiteral("TOP"));
            RegHive hive(QStringLiteral("HIVE"), file.path(), &top);
            Opened::names(hive.root_key()->child(1));
            QVERIFY(hive.cached_handles() > 3);
        }
    }

    void a_subtree_is_asked_about_without_a_write() {
        Opened opened;
        const testkit::Bytes before = opened.file.bytes();
        RegKey* parent = opened.key(QStringLiteral("Parent"));
        QVERIFY(parent->can_delete_tree(Opened::row(parent, QStringLiteral("alpha"))));
        QVERIFY(!parent->can_delete_tree(99));
        QVERIFY(opened.file.bytes() == before);
    }
};

QTEST_GUILESS_MAIN(KeyTest)
#include "key_test.moc"
