// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// A damaged hive lists a key below two parents, so that two objects stand for it: what is done to it in the one place
// is seen in the other, and once it is gone, no object takes the key that comes to its cell for it.
#include "hive_on_disk.h"

#include "reg_hive.h"
#include "reg_key.h"

#include <QTest>

#include <iterator>
#include <stdexcept>

namespace {

// "Twice" stands below "First", and in the list of "Second" in place of a key of its own. Their names make all cells as
// large as those of new keys.
testkit::LaidHive laid_out() {
    testkit::HiveLayout hive;
    testkit::KeyLayout& twice = hive.root.add("First").add("Twice listed");
    twice.add("child key").set("old", 4, testkit::pattern(4));
    hive.root.add("Second").add("other");
    hive.root.add("Third");
    testkit::LaidHive laid = testkit::lay_out(hive);
    laid.put32(laid.at("Second").index, 4, laid.at("First\\Twice listed").record);
    return laid;
}

struct Opened {
    testkit::LaidHive laid = laid_out();
    HiveOnDisk file{laid.bytes};
    DummyRegKey top{QStringLiteral("TOP")};
    RegHive hive{QStringLiteral("HIVE"), file.path(), &top};

    RegKey* first = child(hive.root_key(), 0);
    RegKey* second = child(hive.root_key(), 1);
    RegKey* third = child(hive.root_key(), 2);

    static RegKey* child(RegKey* key, int i) { return static_cast<RegKey*>(key->child(i)); }

    // Makes new keys and tells whether one of them lies in a cell.
    bool is_taken_by_new_keys(uint32_t cell) {
        for (int i = 0; i < 10; i++)
            third->new_key();
        const testkit::Bytes bytes = file.bytes();
        const size_t record = testkit::LaidHive::position(cell);
        constexpr size_t parent = 16;  // where a key's record says what it belongs to
        return bytes[record] == 'n' && testkit::get32(bytes, record + parent) == laid.at("Third").record;
    }
};

struct Action {
    const char* name;
    bool (*run)(RegKey* key);
};

const Action actions[] = {
    {"store a value",
     [](RegKey* key) { return key->set_dword_value(QStringLiteral("stray"), 7, little_endian_order); }},
    {"delete a value", [](RegKey* key) { return key->delete_value(0); }},
    {"rename a value", [](RegKey* key) { return key->rename_value(0, QStringLiteral("new")); }},
    {"make a key", [](RegKey* key) { return key->new_key() >= 0; }},
    {"rename a key", [](RegKey* key) { return key->rename_key(0, QStringLiteral("new")) >= 0; }},
    {"delete a key", [](RegKey* key) { return key->delete_key(0); }},
    {"read a value", [](RegKey* key) { return key->read_value(0) != nullptr; }},
    {"say its name", [](RegKey* key) { return !key->name().isNull(); }},
};

}  // namespace

class ListedTwiceTest : public QObject {
    Q_OBJECT

private slots:
    void what_is_gone_in_one_place_is_no_other_key_elsewhere_data() {
        QTest::addColumn<int>("action");
        QTest::addColumn<bool>("below");
        QTest::addColumn<bool>("renamed");
        for (int i = 0; i < static_cast<int>(std::size(actions)); i++) {
            QTest::addRow("%s, the key deleted", actions[i].name) << i << false << false;
            QTest::addRow("%s below it, the key deleted", actions[i].name) << i << true << false;
            QTest::addRow("%s, the key renamed", actions[i].name) << i << false << true;
        }
    }

    void what_is_gone_in_one_place_is_no_other_key_elsewhere() {
        QFETCH(const int, action);
        QFETCH(const bool, below);
        QFETCH(const bool, renamed);
        const std::string gone = below ? "First\\Twice listed\\child key" : "First\\Twice listed";
        int taken = 0;
        // How many cells are free beforehand decides where the new keys go.
        for (int made_before = 0; made_before < 6; made_before++) {
            Opened opened;
            RegKey* const twin = Opened::child(opened.second, 0);
            RegKey* const twin_child = Opened::child(twin, 0);
            QCOMPARE(twin_child->value_count(), 1);
            for (int i = 0; i < made_before; i++)
                opened.third->new_key();
            if (renamed) {
                QVERIFY(opened.first->rename_key(0, QStringLiteral("a name that makes another cell of it")) >= 0);
            } else {
                QVERIFY(Opened::child(opened.first, 0)->delete_key(0));
                QVERIFY(opened.first->delete_key(0));
            }
            if (!opened.is_taken_by_new_keys(opened.laid.at(gone).record))
                continue;
            taken++;
            const testkit::Bytes before = opened.file.bytes();
            bool done = false;
            try {
                done = actions[action].run(below ? twin_child : twin);
            } catch (const std::exception& failure) {
                QCOMPARE(failure.what(), "ROpenSubKey failed");
            }
            QVERIFY(!done);
            QVERIFY(opened.file.bytes() == before);
        }
        QVERIFY(taken > 0);
    }

    // Another key by the time it is asked of the other object, though it lies where the first one did.
    void a_new_key_in_the_cell_of_one_that_is_gone_is_changed_through_no_old_object() {
        for (const bool renames : {true, false}) {
            Opened opened;
            RegKey* const here = Opened::child(opened.first, 0);
            RegKey* const there = Opened::child(opened.second, 0);
            Opened::child(here, 0);
            Opened::child(there, 0);
            QVERIFY(here->delete_key(0));
            QCOMPARE(here->new_key(), 0);
            const testkit::Bytes before = opened.file.bytes();
            QVERIFY(renames ? there->rename_key(0, QStringLiteral("other")) < 0 : !there->delete_key(0));
            QVERIFY(opened.file.bytes() == before);
        }
    }

    // "Loop" lists "Within", which lists "Loop" and is what its record names as its parent: renaming the inner one
    // leaves the cell that the hive's root leads to.
    void a_key_that_is_renamed_below_itself_is_no_other_key_above_data() {
        QTest::addColumn<int>("action");
        for (int i = 0; i < static_cast<int>(std::size(actions)); i++)
            QTest::newRow(actions[i].name) << i;
    }

    void a_key_that_is_renamed_below_itself_is_no_other_key_above() {
        QFETCH(const int, action);
        int taken = 0;
        for (int made_before = 0; made_before < 6; made_before++) {
            testkit::HiveLayout layout;
            layout.root.add("Loop key #1").set("old", 4, testkit::pattern(4));
            layout.root.children[0].add("Within").add("not listed");
            layout.root.add("Third");
            testkit::LaidHive laid = testkit::lay_out(layout);
            const uint32_t loop = laid.at("Loop key #1").record;
            laid.put32(laid.at("Loop key #1\\Within").index, 4, loop);
            constexpr uint32_t parent = 16;  // where a key's record says what it belongs to
            laid.put32(loop, parent, laid.at("Loop key #1\\Within").record);
            const HiveOnDisk file(laid.bytes);
            DummyRegKey top(QStringLiteral("TOP"));
            RegHive hive(QStringLiteral("HIVE"), file.path(), &top);
            RegKey* const outer = Opened::child(hive.root_key(), 0);
            RegKey* const middle = Opened::child(outer, 0);
            QCOMPARE(Opened::child(middle, 0)->name(), QStringLiteral("Loop key #1"));
            RegKey* const third = Opened::child(hive.root_key(), 1);
            for (int i = 0; i < made_before; i++)
                third->new_key();
            middle->rename_key(0, QStringLiteral("a name that makes another cell of it"));
            for (int i = 0; i < 10; i++)
                third->new_key();
            const testkit::Bytes before = file.bytes();
            const size_t record = testkit::LaidHive::position(loop);
            if (before[record] != 'n' || testkit::get32(before, record + parent) != laid.at("Third").record)
                continue;
            taken++;
            bool done = false;
            try {
                done = actions[action].run(outer);
            } catch (const std::exception& failure) {
                QCOMPARE(failure.what(), "ROpenSubKey failed");
            }
            QVERIFY(!done);
            QVERIFY(file.bytes() == before);
        }
        QVERIFY(taken > 0);
    }

    void values_count_in_both_places() {
        Opened opened;
        RegKey* const one = Opened::child(opened.first, 0);
        RegKey* const twin = Opened::child(opened.second, 0);
        QCOMPARE(one->value_count(), 0);
        QCOMPARE(twin->value_count(), 0);
        QVERIFY(one->set_dword_value(QStringLiteral("v"), 7, little_endian_order));
        QCOMPARE(twin->value_count(), 1);
        QCOMPARE(twin->read_value(0)->data.toUInt(), 7U);
        QVERIFY(twin->delete_value(0));
        QCOMPARE(one->value_count(), 0);
    }

    void keys_made_in_one_place_are_found_in_the_other_after_a_reload() {
        Opened opened;
        RegKey* const one = Opened::child(opened.first, 0);
        RegKey* const twin = Opened::child(opened.second, 0);
        QVERIFY(one->new_key() >= 0);
        // Its rows are those of before, so nothing is done by their numbers.
        QVERIFY(twin->new_key() < 0);
        QVERIFY(!twin->delete_key(0));
        QCOMPARE(twin->child_count(), 1);
        twin->reload();
        QCOMPARE(twin->child_count(), 2);
    }
};

QTEST_GUILESS_MAIN(ListedTwiceTest)
#include "listed_twice_test.moc"
