// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Reads of the hive's file that fail while a key is made, renamed or deleted: afterwards no object of the tree stands
// for another key than before, and a single failure leaves tree and file agreeing. And while a value is made or
// renamed: no other value takes harm.
#include "file_faults.h"
#include "hive_on_disk.h"
#include "sanitized.h"

#include "reg_hive.h"
#include "reg_key.h"

#include <QTest>

#include <algorithm>
#include <map>
#include <stdexcept>

namespace {

// As many keys and as much data as make the engine go to the file often. One has the name that a new one gets, and its
// list of values far off.
testkit::Bytes content() {
    testkit::HiveLayout hive;
    testkit::KeyLayout& parent = hive.root.add("Parent");
    parent.add("New Key #1");
    for (int i = 0; i < 60; i++)
        parent.add("p" + std::to_string(100 + 2 * i)).set("v", 3, testkit::pattern(3000));
    const HiveOnDisk file(testkit::lay_out(hive).bytes);
    DummyRegKey top(QStringLiteral("TOP"));
    RegHive mounted(QStringLiteral("HIVE"), file.path(), &top);
    auto* key = static_cast<RegKey*>(mounted.root_key()->child(0)->child(0));
    for (int i = 0; i < 16; i++)
        key->set_binary_value(QStringLiteral("v%1").arg(i), QByteArray(30000, 'v'), REG_BINARY, RegKey::new_value);
    return file.bytes();
}

struct Operation {
    const char* name;
    int (*run)(RegKey* parent);
};

constexpr int renamed_row = 2;

const Operation operations[] = {
    {"new", [](RegKey* parent) { return parent->new_key(); }},
    {"rename", [](RegKey* parent) { return parent->rename_key(renamed_row, QStringLiteral("p999")); }},
    {"delete", [](RegKey* parent) { return parent->delete_key(5) ? 0 : -1; }},
};

// What a run whose nth read fails found; empty when all is well.
QString try_with(const HiveOnDisk& file, const Operation& operation, int nth, bool lasting, int& reads) {
    DummyRegKey top(QStringLiteral("TOP"));
    RegHive hive(QStringLiteral("HIVE"), file.path(), &top);
    auto* parent = static_cast<RegKey*>(hive.root_key()->child(0));
    std::map<AbstractRegKey*, QString> names;
    for (int i = 0; i < parent->child_count(); i++)
        names[parent->child(i)] = parent->child(i)->name();
    AbstractRegKey* const renamed = parent->child(renamed_row);
    static_cast<RegKey*>(parent->child(parent->child_count() - 1))->read_value(0);  // the window is elsewhere

    bool done = false;
    {
        const testkit::ReadFaults faults(nth, lasting);
        try {
            done = operation.run(parent) >= 0;
        } catch (const std::runtime_error&) {
            // the key cannot be opened, and nothing was done
        }
        reads = faults.reads();
    }
    if (nth == 0 && !done)
        return QStringLiteral("refused without a failed read");
    hive.clear_handle_cache();

    const testkit::Hive disk = file.read();
    if (!lasting && static_cast<size_t>(parent->child_count()) != disk.find("Parent")->children.size())
        return QStringLiteral("the tree has another number of keys than the file");
    if (disk.find("Parent\\New Key #1") == nullptr)
        return QStringLiteral("a key that was there is gone");
    for (int i = 0; i < parent->child_count(); i++) {
        AbstractRegKey* const key = parent->shown_child(i);
        QString name;
        try {
            name = key->name();
        } catch (const std::runtime_error&) {
            if (!lasting)
                return names[key] + QStringLiteral(" cannot be opened any more");
            continue;  // told, not taken for another
        }
        const bool may_differ = key == renamed && name == QStringLiteral("p999");
        if (names.count(key) != 0 && names[key] != name && !may_differ)
            return names[key] + QStringLiteral(" stands for ") + name;
    }
    return QString();
}

constexpr int moved_value = 45;

// Values before and behind the ones whose names the operations ask for, at a place of their own in the list.
testkit::HiveLayout values_around(int place) {
    testkit::HiveLayout hive;
    testkit::KeyLayout& wide = hive.root.add("Wide");
    for (int i = 0; i < 60; i++) {
        if (i == place) {
            wide.set("", 1, testkit::text_data("is set"));
            wide.set("target", 3, testkit::pattern(3000, 7));
            wide.set("New Value #1", 3, testkit::pattern(2000, 9));
        }
        wide.set("value " + std::to_string(i), 3, testkit::pattern(3000));
    }
    return hive;
}

struct ValueOperation {
    const char* name;
    const char* named;  // the value that it may change or make, besides a new one
    bool (*run)(RegKey* key, int index);
};

const ValueOperation value_operations[] = {
    {"rename", "value 45", [](RegKey* key, int index) { return key->rename_value(index, QStringLiteral("target")); }},
    {"new", "New Value #2",
     [](RegKey* key, int) {
         const QString name = key->new_value_name();
         return !name.isNull() && key->set_binary_value(name, QByteArray(), REG_BINARY, RegKey::new_value);
     }},
    {"default", "New Value #2",
     [](RegKey* key, int) {
         return key->set_string_value(QString(), QStringLiteral("typed"), REG_SZ, RegKey::new_value);
     }},
};

// Two values of one name with other data between and around them, so that the engine goes to the file for each.
testkit::Bytes two_values_of_one_name() {
    testkit::HiveLayout hive;
    hive.root.add("Wide");
    const HiveOnDisk file(testkit::lay_out(hive).bytes);
    DummyRegKey top(QStringLiteral("TOP"));
    RegHive mounted(QStringLiteral("HIVE"), file.path(), &top);
    auto* key = static_cast<RegKey*>(mounted.root_key()->child(0));
    for (const auto& [name, size] : {std::pair("a", 30000), std::pair("dup", 3000), std::pair("b", 60000),
                                     std::pair("dup2", 3001), std::pair("c", 30000)})
        key->set_binary_value(QLatin1String(name), QByteArray(size, 'v'), REG_BINARY, RegKey::new_value);
    testkit::Bytes bytes = file.bytes();
    const testkit::Hive laid = testkit::read_hive(bytes);
    const uint32_t second = laid.find("Wide")->values[3].offset;
    testkit::set16(bytes, testkit::LaidHive::position(second, 2), 3);
    return bytes;
}

// Two keys of one name in a list without order, told apart by the names of their values.
testkit::Bytes two_keys_of_one_name() {
    testkit::HiveLayout hive;
    testkit::KeyLayout& wide = hive.root.add("Wide");
    wide.sorted = false;
    int number = 0;
    for (const char* name : {"zz", "mm", "dup", "aa", "yy", "bb", "vv", "cc", "xx", "ww", "dup"})
        wide.add(name).set(std::to_string(number++), 3, testkit::pattern(20000));
    return testkit::lay_out(hive).bytes;
}

struct NamesakeOperation {
    const char* name;
    testkit::Bytes (*content)();
    void (*run)(RegKey* key);
    bool (*has_the_other)(const testkit::Key& key);  // the one that is not pointed at, as it was
};

bool has_value_of(const testkit::Key& key, size_t size) {
    return std::any_of(key.values.begin(), key.values.end(), [size](const testkit::Value& value) {
        return value.name == u"dup" && value.data == testkit::Bytes(size, 'v');
    });
}

bool has_key_with(const testkit::Key& key, const std::u16string& value) {
    return std::any_of(key.children.begin(), key.children.end(), [&value](const testkit::Key& child) {
        return child.name == u"dup" && child.values.size() == 1 && child.values[0].name == value;
    });
}

const NamesakeOperation namesake_operations[] = {
    {"delete the first value", two_values_of_one_name, [](RegKey* key) { key->delete_value(1); },
     [](const testkit::Key& key) { return has_value_of(key, 3001); }},
    {"delete the second value", two_values_of_one_name, [](RegKey* key) { key->delete_value(3); },
     [](const testkit::Key& key) { return has_value_of(key, 3000); }},
    {"rename the first value", two_values_of_one_name,
     [](RegKey* key) { key->rename_value(1, QStringLiteral("fresh")); },
     [](const testkit::Key& key) { return has_value_of(key, 3001); }},
    {"set the first value", two_values_of_one_name,
     [](RegKey* key) { key->set_binary_value(QStringLiteral("dup"), QByteArray(9, 'n'), REG_BINARY, 1); },
     [](const testkit::Key& key) { return has_value_of(key, 3001); }},
    {"delete the first key", two_keys_of_one_name, [](RegKey* key) { key->delete_key(2); },
     [](const testkit::Key& key) { return has_key_with(key, u"10"); }},
    {"delete the second key", two_keys_of_one_name, [](RegKey* key) { key->delete_key(10); },
     [](const testkit::Key& key) { return has_key_with(key, u"2"); }},
};

// A key listed below two parents, with its list of values far off.
testkit::Bytes key_listed_twice() {
    testkit::HiveLayout hive;
    hive.root.add("First").add("Twice listed").set("old", 3, testkit::pattern(40000));
    hive.root.add("Second").add("other");
    hive.root.add("Third");
    testkit::LaidHive laid = testkit::lay_out(hive);
    laid.put32(laid.at("Second").index, 4, laid.at("First\\Twice listed").record);
    const HiveOnDisk file(laid.bytes);
    DummyRegKey top(QStringLiteral("TOP"));
    RegHive mounted(QStringLiteral("HIVE"), file.path(), &top);
    const auto child = [](AbstractRegKey* key, int i) { return static_cast<RegKey*>(key->child(i)); };
    child(mounted.root_key(), 2)->set_binary_value(QStringLiteral("far"), QByteArray(60000, 'v'), REG_BINARY);
    for (int i = 0; i < 30; i++)
        child(child(mounted.root_key(), 0), 0)->set_dword_value(QStringLiteral("v%1").arg(i), 7, little_endian_order);
    return file.bytes();
}

// The values of the key but one.
std::map<std::string, testkit::Bytes> values_but(const testkit::Hive& hive, const std::string& left_out) {
    std::map<std::string, testkit::Bytes> values;
    for (const testkit::Value& value : hive.find("Wide")->values) {
        if (testkit::utf8(value.name) != left_out)
            values[testkit::utf8(value.name)] = value.data;
    }
    return values;
}

}  // namespace

class ReadFaultTest : public QObject {
    Q_OBJECT

private slots:
    void no_object_stands_for_another_key_afterwards_data() {
        QTest::addColumn<int>("operation");
        QTest::addColumn<bool>("lasting");
        for (int i = 0; i < 3; i++) {
            for (const bool lasting : {false, true})
                QTest::addRow("%s, %s", operations[i].name, lasting ? "from there on" : "once") << i << lasting;
        }
    }

    void no_object_stands_for_another_key_afterwards() {
        QFETCH(const int, operation);
        QFETCH(const bool, lasting);
        const testkit::Bytes bytes = content();
        // Most of the reads come before anything is written: few of those will do.
        constexpr int close = 60;
        int total = 1;
        for (int nth = 0; nth <= total; nth += nth > 0 && nth + close < total ? 9 : 1) {
            const HiveOnDisk file(bytes);
            int reads = 0;
            const QString found = try_with(file, operations[operation], nth, lasting, reads);
            QVERIFY2(found.isEmpty(), qPrintable(QStringLiteral("read %1: ").arg(nth) + found));
            if (nth == 0)
                total = reads;
        }
        QVERIFY(total > 10);
    }

    // The engine names it by what its parent's list leads to, for which it goes to the file.
    void a_link_whose_name_cannot_be_read_is_not_shown_without_one() {
        testkit::HiveLayout hive;
        hive.root.add("Link").flags = 0x10;
        testkit::KeyLayout& other = hive.root.add("Other");
        for (int i = 0; i < 10; i++)
            other.set("v" + std::to_string(i), 3, testkit::pattern(3000));
        const HiveOnDisk file(hive);
        DummyRegKey top(QStringLiteral("TOP"));
        RegHive opened(QStringLiteral("HIVE"), file.path(), &top);
        AbstractRegKey* const link = opened.root_key()->child(0);
        const auto read_elsewhere = [&] { static_cast<RegKey*>(opened.root_key()->child(1))->read_value(9); };
        QCOMPARE(link->name(), QStringLiteral("Link"));
        int thrown = 0;
        bool failed = true;
        for (int nth = 1; failed; nth++) {
            read_elsewhere();
            const testkit::ReadFaults faults(nth);
            try {
                QCOMPARE(link->name(), QStringLiteral("Link"));
            } catch (const std::runtime_error& failure) {
                QCOMPARE(failure.what(), "RQueryInfoKeyW failed");
                thrown++;
            }
            failed = faults.failed();
        }
        QVERIFY(thrown > 0);
        QCOMPARE(link->name(), QStringLiteral("Link"));
    }

    void no_value_but_the_one_named_changes_data() {
        QTest::addColumn<int>("operation");
        QTest::addColumn<int>("place");
        QTest::addColumn<bool>("lasting");
        for (int i = 0; i < 3; i++) {
            for (const int place : {0, 9, 21, 48}) {
                for (const bool lasting : {false, true})
                    QTest::addRow("%s, at %d, %s", value_operations[i].name, place, lasting ? "from there on" : "once")
                        << i << place << lasting;
            }
        }
    }

    void no_value_but_the_one_named_changes() {
        QFETCH(const int, operation);
        QFETCH(const int, place);
        QFETCH(const bool, lasting);
        const ValueOperation& tried = value_operations[operation];
        const testkit::Bytes bytes = testkit::lay_out(values_around(place)).bytes;
        const auto before = values_but(testkit::read_hive(bytes), tried.named);
        const bool is_refused = tried.run != value_operations[1].run;
        bool failed = true;
        int nth = 1;
        for (; failed; nth += testkit::is_sanitized ? 3 : 1) {
            const HiveOnDisk file(bytes);
            DummyRegKey top(QStringLiteral("TOP"));
            RegHive hive(QStringLiteral("HIVE"), file.path(), &top);
            auto* key = static_cast<RegKey*>(hive.root_key()->child(0));
            int index = 0;
            while (key->value_name(index) != QStringLiteral("value %1").arg(moved_value))
                index++;
            for (int i = 0; i < key->value_count(); i++)
                key->value_name(i);  // as a sort does; the engine's window is at the last one then
            bool done = false;
            {
                const testkit::ReadFaults faults(nth, lasting);
                try {
                    done = tried.run(key, index);
                } catch (const std::exception&) {
                    // the key cannot be read, and nothing was done
                }
                failed = faults.failed();
            }
            const auto after = values_but(file.read(), tried.named);
            for (const auto& [name, data] : before)
                QVERIFY2(after.count(name) != 0 && after.at(name) == data,
                         qPrintable(QStringLiteral("read %1: %2").arg(nth).arg(QString::fromStdString(name))));
            QCOMPARE(after.size(), before.size());
            QVERIFY(!is_refused || (!done && file.bytes() == bytes));
            QVERIFY(failed || done != is_refused);
        }
        QVERIFY(nth > 2);
    }

    // The rename is done, but where its key is now cannot be read: the rows stay in the old order.
    void a_row_that_a_failed_rename_left_behind_deletes_no_other_key() {
        testkit::HiveLayout hive;
        testkit::KeyLayout& parent = hive.root.add("Parent");
        for (const char* name : {"Aa", "Bb", "Cc", "Dd"})
            parent.add(name).set("far", 3, testkit::pattern(40000));
        const testkit::Bytes bytes = testkit::lay_out(hive).bytes;
        bool failed = true;
        int left_behind = 0;
        for (int nth = 1; failed; nth++) {
            for (int then = 1; then < 12; then++) {
                const HiveOnDisk file(bytes);
                DummyRegKey top(QStringLiteral("TOP"));
                RegHive opened(QStringLiteral("HIVE"), file.path(), &top);
                auto* key = static_cast<RegKey*>(opened.root_key()->child(0));
                for (int i = 0; i < 4; i++)
                    key->child(i)->name();
                int row = -1;
                {
                    const testkit::ReadFaults faults(nth, true);
                    try {
                        row = key->rename_key(0, QStringLiteral("Zz"));
                    } catch (const std::exception&) {
                        // nothing was done
                    }
                    failed = faults.failed();
                }
                if (row >= 0 || file.read().find("Parent\\Zz") == nullptr)
                    break;
                left_behind++;
                {
                    const testkit::ReadFaults faults(then);
                    try {
                        key->delete_key(1);
                    } catch (const std::exception&) {
                        // nothing was done
                    }
                }
                QVERIFY(file.read().find("Parent\\Cc") != nullptr);
            }
        }
        QVERIFY(left_behind > 0);
    }

    // Its cell could not be noted as free, so that the other object would take the next key there for its own.
    void a_key_deleted_while_a_read_fails_is_no_other_key_elsewhere() {
        const testkit::Bytes bytes = key_listed_twice();
        bool failed = true;
        int taken = 0;
        for (int nth = 1; failed; nth++) {
            const HiveOnDisk file(bytes);
            DummyRegKey top(QStringLiteral("TOP"));
            RegHive hive(QStringLiteral("HIVE"), file.path(), &top);
            const auto child = [](AbstractRegKey* key, int i) { return static_cast<RegKey*>(key->child(i)); };
            RegKey* const first = child(hive.root_key(), 0);
            RegKey* const shown = child(child(hive.root_key(), 1), 0);
            RegKey* const third = child(hive.root_key(), 2);
            first->child(0);
            const testkit::Hive before = file.read();
            const uint32_t cell = before.find("First\\Twice listed")->offset;
            const uint32_t third_cell = before.find("Third")->offset;
            bool deleted = false;
            {
                const testkit::ReadFaults faults(nth);
                try {
                    deleted = first->delete_key(0);
                } catch (const std::exception&) {
                    // nothing was done
                }
                failed = faults.failed();
            }
            QVERIFY(deleted || failed);
            for (int i = 0; i < 40; i++)
                third->new_key();
            if (deleted) {
                // Asked of the bytes: read as a hive, the new key stands where the deleted one is still listed.
                const testkit::Bytes now = file.bytes();
                constexpr size_t parent = 16;  // where a key's record says what it belongs to
                taken += testkit::get32(now, testkit::LaidHive::position(cell) + parent) == third_cell ? 1 : 0;
            }
            bool stored = false;
            try {
                stored = shown->set_dword_value(QStringLiteral("stray"), 1, little_endian_order);
            } catch (const std::exception&) {
                // it is gone
            }
            QVERIFY2(!deleted || !stored, qPrintable(QStringLiteral("read %1").arg(nth)));
        }
        // The cell was another key's by then.
        QVERIFY(taken > 0);
    }

    // To ask for each number would take a walk over all names for each.
    void a_name_for_a_new_value_is_found_in_one_pass() {
        constexpr int count = 3000;
        testkit::HiveLayout hive;
        testkit::KeyLayout& wide = hive.root.add("Wide");
        for (int i = 1; i <= count; i++)
            wide.set("New Value #" + std::to_string(i), 4, testkit::pattern(4));
        const HiveOnDisk file(hive);
        DummyRegKey top(QStringLiteral("TOP"));
        RegHive opened(QStringLiteral("HIVE"), file.path(), &top);
        const testkit::ReadFaults reads(0);
        QCOMPARE(static_cast<RegKey*>(opened.root_key()->child(0))->new_value_name(),
                 QStringLiteral("New Value #3001"));
        QVERIFY(reads.reads() < 1000);
    }

    void nothing_of_the_same_name_goes_instead_data() {
        QTest::addColumn<int>("operation");
        for (int i = 0; i < 6; i++)
            QTest::addRow("%s", namesake_operations[i].name) << i;
    }

    void nothing_of_the_same_name_goes_instead() {
        QFETCH(const int, operation);
        const NamesakeOperation& tried = namesake_operations[operation];
        const testkit::Bytes bytes = tried.content();
        bool failed = true;
        int nth = 1;
        for (; failed; nth++) {
            const HiveOnDisk file(bytes);
            DummyRegKey top(QStringLiteral("TOP"));
            RegHive hive(QStringLiteral("HIVE"), file.path(), &top);
            auto* key = static_cast<RegKey*>(hive.root_key()->child(0));
            for (int i = 0; i < key->child_count(); i++)
                key->child(i)->name();
            for (int i = 0; i < key->value_count(); i++)
                key->value_name(i);
            {
                const testkit::ReadFaults faults(nth);
                try {
                    tried.run(key);
                } catch (const std::exception&) {
                    // it cannot be read, and nothing was done
                }
                failed = faults.failed();
            }
            const testkit::Hive disk = file.read();
            QVERIFY2(tried.has_the_other(*disk.find("Wide")), qPrintable(QStringLiteral("read %1").arg(nth)));
        }
        QVERIFY(nth > 3);
    }
};

QTEST_GUILESS_MAIN(ReadFaultTest)
#include "read_fault_test.moc"
