// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "hive_on_disk.h"

#include "reg_hive.h"
#include "reg_key.h"

#include <QTest>

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

    // The file is mended behind the program's back: the row that was shown without subkeys stays without.
    void a_key_that_could_not_be_opened_takes_no_new_subkey() {
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
        QCOMPARE(shown->name(), QStringLiteral("Bad"));
        const testkit::Bytes before = file.bytes();
        QVERIFY(shown->new_key() < 0);
        QVERIFY(!shown->delete_key(0));
        QVERIFY(shown->rename_key(0, QStringLiteral("other")) < 0);
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
