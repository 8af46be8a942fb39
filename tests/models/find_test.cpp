// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "hive_on_disk.h"
#include "real_hives.h"
#include "searched.h"

#include "reg_key.h"
#include "reg_model.h"
#include "values_model.h"
#include "values_proxy_model.h"

#include <QTest>

#include <malloc.h>

#include <algorithm>
#include <random>
#include <utility>
#include <vector>

namespace {

testkit::HiveLayout layout() {
    testkit::HiveLayout hive;
    testkit::KeyLayout& software = hive.root.add("Software");
    software.set("Zed", 4, testkit::pattern(4));
    software.set("alpha", 4, testkit::pattern(4));
    testkit::KeyLayout& run = software.add("RunOnce");
    run.set("", 1, testkit::text_data("x"));
    run.set("run it", 1, testkit::text_data("x"));
    software.add("MyServiceA");
    software.add("MyServiceAB");
    hive.root.add("prerun");
    return hive;
}

QStringList list(std::initializer_list<const char*> names) {
    QStringList all;
    for (const char* name : names)
        all.append(QLatin1String(name));
    return all;
}

// What the search has to find in a hive, in its order, by the tests' own reader: each key's name, then the names of its
// values as the table sorts them, then its subkeys.
void expect_below(const testkit::Key& key, const QString& path, int depth, const QString& term, QStringList& hits) {
    const auto matches = [&](const QString& name) { return name.contains(term, Qt::CaseInsensitive); };
    const QString own = depth == 0 ? QStringLiteral("HIVE") : QString::fromStdU16String(key.name);
    if (matches(own))
        hits.append(path);
    QStringList names;
    bool has_default = false;
    for (const testkit::Value& value : key.values) {
        has_default = has_default || value.name.empty();
        if (!value.name.empty())
            names.append(QString::fromStdU16String(value.name));
    }
    Q_UNUSED(has_default);
    std::stable_sort(names.begin(), names.end(),
                     [](const QString& a, const QString& b) { return a.compare(b, Qt::CaseInsensitive) < 0; });
    names.prepend(QStringLiteral("(Default)"));
    for (int row = 0; depth > 0 && row < names.size(); row++) {
        if (matches(names[row]))
            hits.append(path + QStringLiteral(" : %1").arg(row));
    }
    for (const testkit::Key& child : key.children)
        expect_below(child, path + QLatin1Char('/') + QString::fromStdU16String(child.name), depth + 1, term, hits);
}

// The walk without anything done ahead or kept between two hits: each place of the search asks the model and a table
// of its own for what is there.
class LiteralWalk {
public:
    explicit LiteralWalk(const RegModel& model) : model_(model) { places_.push_back({model.index(0, 0), -1}); }

    // As Searched tells a hit; nothing at the end.
    QString next(const QString& term, RegModel::FindMode mode) {
        while (!places_.empty()) {
            const auto [key, row] = places_.back();
            places_.pop_back();
            const bool in_key = row < 0 && mode.testFlag(RegModel::FindKeys);
            if (row < 0)
                push_all(key, mode.testFlag(RegModel::FindValues));
            if ((in_key && matches(key.data(), term)) || (row >= 0 && matches(shown_name(key, row), term)))
                return Searched::text_of({key, row});
        }
        return QString();
    }

private:
    static bool matches(const QVariant& name, const QString& term) {
        return name.toString().contains(term, Qt::CaseInsensitive);
    }

    static QVariant shown_name(const QModelIndex& key, int row) {
        ValuesModel source(RegModel::editable_key(key));
        ValuesProxyModel table;
        table.setSourceModel(&source);
        table.sort(0, Qt::AscendingOrder);
        return table.index(row, 0).data();
    }

    void push_all(const QModelIndex& key, bool with_values) {
        for (const QModelIndex& next : {model_.index(key.row() + 1, 0, key.parent()), model_.index(0, 0, key)}) {
            if (next.isValid())
                places_.push_back({next, -1});
        }
        RegKey* const shown = with_values ? RegModel::editable_key(key) : nullptr;
        if (shown == nullptr)
            return;
        for (int row = shown->value_count() - (shown->has_default_value() ? 1 : 0); row >= 0; row--)
            places_.push_back({key, row});
    }

    const RegModel& model_;
    std::vector<std::pair<QModelIndex, int>> places_;
};

// Keys of up to three subkeys and six values, some of them with a value named like the unnamed one is shown.
void grow(testkit::KeyLayout& key, int depth, std::mt19937& random) {
    const auto below = [&](unsigned end) { return static_cast<unsigned>(random() % end); };
    for (char letter = 'a'; letter < static_cast<char>('a' + static_cast<char>(below(4))); letter++) {
        testkit::KeyLayout& child = key.add(std::string(1, letter) + "n");
        const unsigned values = below(6);
        for (unsigned i = 0; i < values; i++) {
            const std::string name = std::string(1, static_cast<char>('a' + below(26))) + std::to_string(i) + "n";
            child.set(i == 0 && below(2) == 0 ? std::string() : name, 4, testkit::pattern(4));
        }
        if (below(3) == 0)
            child.set("(Default)", 4, testkit::pattern(4));
        if (depth < 3)
            grow(child, depth + 1, random);
    }
}

}  // namespace

class FindTest : public QObject {
    Q_OBJECT

private slots:
    void a_substring_is_found_in_any_case() {
        QCOMPARE(Searched(layout()).all(QStringLiteral("run"), RegModel::FindKeys),
                 list({"TOP/HIVE/prerun", "TOP/HIVE/Software/RunOnce"}));
    }

    void a_whole_string_is_no_part_of_a_longer_one() {
        Searched searched(layout());
        QCOMPARE(searched.all(QStringLiteral("run"), RegModel::FindKeys, Qt::MatchFixedString), QStringList());
        QCOMPARE(searched.all(QStringLiteral("RUNONCE"), RegModel::FindKeys, Qt::MatchFixedString),
                 list({"TOP/HIVE/Software/RunOnce"}));
    }

    void a_wildcard_pattern_matches_the_whole_name() {
        Searched searched(layout());
        QCOMPARE(searched.all(QStringLiteral("*service?"), RegModel::FindKeys, Qt::MatchWildcard),
                 list({"TOP/HIVE/Software/MyServiceA"}));
        QCOMPARE(searched.all(QStringLiteral("service?"), RegModel::FindKeys, Qt::MatchWildcard), QStringList());
    }

    void the_default_value_is_in_every_key_that_shows_values() {
        QCOMPARE(Searched(layout()).all(QStringLiteral("(Default)"), RegModel::FindValues),
                 list({"TOP/HIVE/prerun : 0", "TOP/HIVE/Software : 0", "TOP/HIVE/Software/MyServiceA : 0",
                       "TOP/HIVE/Software/MyServiceAB : 0", "TOP/HIVE/Software/RunOnce : 0"}));
    }

    void a_key_comes_before_its_values() {
        QCOMPARE(Searched(layout()).all(QStringLiteral("run"), RegModel::FindKeys | RegModel::FindValues),
                 list({"TOP/HIVE/prerun", "TOP/HIVE/Software/RunOnce", "TOP/HIVE/Software/RunOnce : 1"}));
    }

    void a_hit_without_a_value_has_the_row_minus_one() {
        Searched searched(layout());
        searched.model.begin_find(searched.model.index(0, 0));
        const RegModel::FindResult hit =
            searched.model.find(QStringLiteral("HIVE"), RegModel::FindKeys, Qt::MatchContains);
        QCOMPARE(path_of(hit.key), QStringLiteral("TOP/HIVE"));
        QCOMPARE(hit.value_row, -1);
    }

    void nothing_found_ends_at_once_when_asked_again() {
        Searched searched(layout());
        QCOMPARE(searched.all(QStringLiteral("absent"), RegModel::FindKeys | RegModel::FindValues), QStringList());
        QVERIFY(!searched.model.find(QStringLiteral("run"), RegModel::FindKeys, Qt::MatchContains).key.isValid());
        QCOMPARE(searched.all(QStringLiteral("run"), {}), QStringList());
    }

    void an_empty_term_matches_every_name() {
        QCOMPARE(Searched(layout()).all(QString(), RegModel::FindKeys).size(), 7);
    }

    // The flag is looked at after the tenth frame, and then after every eleventh.
    void a_stopped_search_ends_within_eleven_frames() {
        testkit::HiveLayout many;
        for (int i = 0; i < 100; i++)
            many.root.add("Key " + std::to_string(100 + i));
        Searched searched(testkit::lay_out(many).bytes);
        searched.model.begin_find(searched.model.index(0, 0));
        searched.model.stop_find();
        QVERIFY(!searched.model.find(QStringLiteral("absent"), RegModel::FindKeys, Qt::MatchContains).key.isValid());
        // Ten frames are gone: the group, the root and eight keys; the flag still stands, so eleven more go each time.
        const auto next = [&] {
            return path_of(searched.model.find(QString(), RegModel::FindKeys, Qt::MatchContains).key);
        };
        QCOMPARE(next(), QStringLiteral("TOP/HIVE/Key 108"));
        QVERIFY(!searched.model.find(QStringLiteral("absent"), RegModel::FindKeys, Qt::MatchContains).key.isValid());
        QCOMPARE(next(), QStringLiteral("TOP/HIVE/Key 119"));
    }

    void a_search_survives_that_its_next_key_is_deleted() {
        Searched searched(layout());
        searched.model.begin_find(searched.model.index(0, 0));
        const auto next = [&] {
            return searched.model.find(QStringLiteral("service"), RegModel::FindKeys, Qt::MatchContains).key;
        };
        const QModelIndex first = next();
        QCOMPARE(path_of(first), QStringLiteral("TOP/HIVE/Software/MyServiceA"));
        QVERIFY(searched.model.removeRows(first.row() + 1, 1, first.parent()));
        QVERIFY(!next().isValid());
    }

    // A key that lists itself over and over: the file's size bounds the walk.
    void a_loop_of_keys_ends() {
        testkit::HiveLayout looped;
        testkit::KeyLayout& key = looped.root.add("Loop");
        key.add("a");
        key.add("b");
        testkit::LaidHive laid = testkit::lay_out(looped);
        const uint32_t loop = laid.at("Loop").record;
        for (const uint32_t entry : {4U, 12U})
            laid.put32(laid.at("Loop").index, entry, loop);
        Searched searched(laid.bytes);
        QVERIFY(searched.all(QStringLiteral("absent"), RegModel::FindKeys | RegModel::FindValues).isEmpty());
    }

    void behind_a_loop_the_walk_goes_on() {
        testkit::HiveLayout looped;
        testkit::KeyLayout& key = looped.root.add("Loop");
        key.add("a");
        key.add("b");
        looped.root.add("Target");
        testkit::LaidHive laid = testkit::lay_out(looped);
        for (const uint32_t entry : {4U, 12U})
            laid.put32(laid.at("Loop").index, entry, laid.at("Loop").record);
        Searched searched(laid.bytes);
        QCOMPARE(searched.all(QStringLiteral("target"), RegModel::FindKeys), list({"TOP/HIVE/Target"}));
    }

    // Keys whose records have the list of values of one: each is found, until there are more than a file can hold.
    void keys_that_share_a_list_of_values_are_not_searched_without_end() {
        constexpr int keys = 100;
        constexpr int values = 300;
        testkit::HiveLayout hive;
        testkit::KeyLayout& parent = hive.root.add("Parent");
        for (int i = 0; i < keys; i++)
            parent.add("key" + std::to_string(1000 + i));
        for (int i = 0; i < values; i++)
            hive.root.children[0].children[0].set("v" + std::to_string(i), 4, testkit::pattern(4));
        testkit::LaidHive laid = testkit::lay_out(hive);
        const testkit::KeyPlaces& first = laid.at("Parent\\key1000");
        for (int i = 1; i < keys; i++) {
            const uint32_t record = laid.at("Parent\\key" + std::to_string(1000 + i)).record;
            laid.put32(record, 36, values);
            laid.put32(record, 40, first.value_list);
        }
        Searched searched(laid.bytes);
        const qsizetype hits = searched.all(QStringLiteral("v"), RegModel::FindValues).size();
        QVERIFY(hits > 2 * values);
        QVERIFY(hits <= static_cast<qsizetype>(2 * laid.bytes.size() / 24));
    }

    // Keys that list all of their siblings and themselves: few of them are gone down into.
    void keys_that_share_a_list_of_keys_do_not_fill_the_memory() {
        constexpr int keys = 1000;
        testkit::HiveLayout hive;
        testkit::KeyLayout& parent = hive.root.add("Parent");
        for (int i = 0; i < keys; i++)
            parent.add("key" + std::to_string(1000 + i));
        testkit::LaidHive laid = testkit::lay_out(hive);
        for (int i = 0; i < keys; i++) {
            const uint32_t record = laid.at("Parent\\key" + std::to_string(1000 + i)).record;
            laid.put32(record, 20, keys);
            laid.put32(record, 28, laid.at("Parent").index);
        }
        Searched searched(laid.bytes);
        const size_t before = mallinfo2().uordblks;
        QVERIFY(searched.all(QStringLiteral("absent"), RegModel::FindKeys).isEmpty());
        QVERIFY(mallinfo2().uordblks - before < 20 * laid.bytes.size());  // a sanitizer's memory is not counted
    }

    // Every key lists the next one twice: without a loop, but with more ways down than any file has keys.
    void a_hive_with_too_many_ways_down_takes_nothing_from_the_next_one() {
        constexpr int levels = 40;
        testkit::HiveLayout ladder;
        testkit::KeyLayout* step = &ladder.root;
        std::string path;
        for (int i = 0; i < levels; i++) {
            step->add("twin");
            step = &step->add("step");
        }
        testkit::LaidHive laid = testkit::lay_out(ladder);
        for (int i = 0; i < levels; i++) {
            const uint32_t index = laid.at(path).index;
            laid.put32(index, 12, laid.get32(index, 4));
            path += path.empty() ? "step" : "\\step";
        }
        Searched searched(laid.bytes);
        const HiveOnDisk second(layout());
        searched.model.add_hive(QStringLiteral("TOP/SECOND"), second.path());
        QCOMPARE(searched.all(QStringLiteral("RunOnce"), RegModel::FindKeys), list({"TOP/SECOND/Software/RunOnce"}));
    }

    // A damaged UTF-16 name of one byte reads as no name, but its value is not the unnamed one.
    void the_row_is_the_table_s_beside_a_name_without_letters() {
        testkit::HiveLayout hive;
        testkit::KeyLayout& key = hive.root.add("Key");
        key.set("alpha", 4, testkit::pattern(4));
        key.set("x", 4, testkit::pattern(4)).wide_name = true;
        key.set("zed", 4, testkit::pattern(4));
        testkit::LaidHive laid = testkit::lay_out(hive);
        laid.put16(laid.at("Key").values[1].record, 2, 1);
        Searched searched(laid.bytes);
        const QStringList hits = searched.all(QStringLiteral("zed"), RegModel::FindValues);
        RegKey* shown = searched.model.editable_key(
            searched.model.index(0, 0, searched.model.index(0, 0, searched.model.index(0, 0))));
        ValuesModel source(shown);
        ValuesProxyModel table;
        table.setSourceModel(&source);
        table.sort(0, Qt::AscendingOrder);
        int row = 0;
        while (row < table.rowCount() && table.index(row, 0).data().toString() != QStringLiteral("zed"))
            row++;
        QCOMPARE(hits, QStringList{QStringLiteral("TOP/HIVE/Key : %1").arg(row)});
    }

    // The values are looked at again at every hit: those of one name must not be taken for each other.
    void rows_of_one_name_are_found_once_each() {
        for (const bool is_set : {false, true}) {
            testkit::HiveLayout hive;
            testkit::KeyLayout& key = hive.root.add("Key");
            key.set("(Default)", 4, testkit::pattern(4));
            if (is_set)
                key.set("", 4, testkit::pattern(4));
            QCOMPARE(Searched(hive).all(QStringLiteral("(Default)"), RegModel::FindValues),
                     list({"TOP/HIVE/Key : 0", "TOP/HIVE/Key : 1"}));
        }
    }

    void values_without_a_readable_name_are_found_once_each() {
        testkit::HiveLayout hive;
        testkit::KeyLayout& key = hive.root.add("Key");
        for (const char* name : {"a", "b", "c", "d"})
            key.set(name, 4, testkit::pattern(4));
        testkit::LaidHive laid = testkit::lay_out(hive);
        for (size_t value = 0; value < 3; value++)
            laid.put16(laid.at("Key").values[value].record, 0, 0x7878);
        QCOMPARE(
            Searched(laid.bytes).all(QString(), RegModel::FindValues),
            list({"TOP/HIVE/Key : 0", "TOP/HIVE/Key : 1", "TOP/HIVE/Key : 2", "TOP/HIVE/Key : 3", "TOP/HIVE/Key : 4"}));
    }

    void the_hits_are_those_of_a_literal_walk_data() {
        QTest::addColumn<uint>("seed");
        for (uint seed = 1; seed <= 25; seed++)
            QTest::addRow("seed %u", seed) << seed;
    }

    void the_hits_are_those_of_a_literal_walk() {
        QFETCH(uint, seed);
        std::mt19937 random(seed);
        testkit::HiveLayout hive;
        grow(hive.root, 0, random);
        Searched searched(hive);
        for (const RegModel::FindMode mode :
             {RegModel::FindMode(), RegModel::FindMode(RegModel::FindKeys), RegModel::FindMode(RegModel::FindValues),
              RegModel::FindKeys | RegModel::FindValues}) {
            for (const char* letters : {"", "n", "def", "a"}) {
                const QString term = QLatin1String(letters);
                LiteralWalk walk(searched.model);
                searched.begin();
                for (QString expected = QStringLiteral("-"); !expected.isEmpty();) {
                    expected = walk.next(term, mode);
                    QCOMPARE(Searched::text_of(searched.model.find(term, mode, Qt::MatchContains)), expected);
                }
            }
        }
    }

    void a_real_hive_gives_every_name_once_and_in_order() {
        int searched_hives = 0;
        int left_out = 0;
        for (const testkit::RealHive& hive : testkit::real_hives()) {
            if (hive.keys > 3000 || hive.name == "software-nt4") {
                left_out++;
                continue;
            }
            const testkit::Bytes bytes = testkit::read_file(hive.path);
            Searched searched(bytes);
            for (const char* term : {"e", "", "no such name"}) {
                QStringList expected;
                const QString text = QLatin1String(term);
                if (text.isEmpty())
                    expected.append(QStringLiteral("TOP"));
                expect_below(testkit::read_hive(bytes).root, QStringLiteral("TOP/HIVE"), 0, text, expected);
                QStringList found = searched.all(text, RegModel::FindKeys | RegModel::FindValues);
                QCOMPARE(found.size(), expected.size());
                for (int i = 0; i < found.size(); i++)
                    QCOMPARE(found[i], expected[i]);
            }
            searched_hives++;
        }
        qInfo("searched %d real hives, left out %d", searched_hives, left_out);
    }
};

QTEST_MAIN(FindTest)
#include "find_test.moc"
