// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// A search that goes on after the user has changed the tree or the values: what was still to be visited is visited
// once, and nothing is visited twice.
#include "searched.h"

#include "reg_key.h"
#include "values_model.h"
#include "values_proxy_model.h"

#include <QTest>

#include <map>
#include <random>

namespace {

// Below "Top" first, middle, last and inner keys to rename, with something below most of them.
testkit::HiveLayout tree() {
    testkit::HiveLayout hive;
    testkit::KeyLayout& top = hive.root.add("Top");
    for (const char* name : {"b", "d", "f", "h"}) {
        testkit::KeyLayout& key = top.add(name);
        key.add(std::string(name) + "1");
        key.add(std::string(name) + "2").add("leaf");
    }
    top.add("j");
    hive.root.add("Zone").add("k");
    return hive;
}

// Below "Top" six keys, and in the last of them two values.
testkit::HiveLayout hits() {
    testkit::HiveLayout hive;
    testkit::KeyLayout& top = hive.root.add("Top");
    for (int i = 1; i <= 6; i++)
        top.add("hit " + std::to_string(i));
    for (const char* name : {"hit a", "hit b"})
        top.children.back().set(name, 4, testkit::pattern(4));
    return hive;
}

// The hits below "Top" by their names.
QString names(QStringList found) {
    found.replaceInStrings(QStringLiteral("TOP/HIVE/Top/"), QString());
    return found.join(QLatin1Char(','));
}

const AbstractRegKey* key_of(const QModelIndex& index) {
    return static_cast<const AbstractRegKey*>(index.internalPointer());
}

void collect(const RegModel& model, const QModelIndex& from, QList<QPersistentModelIndex>& keys) {
    keys.append(from);
    for (int row = 0; row < model.rowCount(from); row++)
        collect(model, model.index(row, 0, from), keys);
}

// A search for every key, one at a time, which counts how often each was found.
struct Visit {
    Searched searched{tree()};
    QList<QPersistentModelIndex> keys;  // all that were there at the start
    std::map<const AbstractRegKey*, int> times;

    Visit() {
        collect(searched.model, searched.model.index(0, 0), keys);
        searched.begin();
    }

    bool step() {
        const RegModel::FindResult hit = searched.model.find(QString(), RegModel::FindKeys, Qt::MatchContains);
        if (hit.key.isValid())
            times[key_of(hit.key)]++;
        return hit.key.isValid();
    }

    // Every key of the start that is left has been found once; nothing has been found twice.
    QString wrong() const {
        for (const QPersistentModelIndex& key : keys) {
            const auto found = key.isValid() ? times.find(key_of(key)) : times.end();
            if (key.isValid() && (found == times.end() || found->second != 1))
                return QStringLiteral("%1: %2").arg(path_of(key)).arg(found == times.end() ? 0 : found->second);
        }
        return QString();
    }
};

struct Values {
    Searched searched{hive()};
    ValuesModel source{RegModel::editable_key(searched.at(QStringLiteral("Key")))};
    ValuesProxyModel table;

    Values() {
        table.setSourceModel(&source);
        table.sort(0, Qt::AscendingOrder);
        searched.begin();
    }

    static testkit::HiveLayout hive() {
        testkit::HiveLayout hive;
        testkit::KeyLayout& key = hive.root.add("Key");
        for (const char* name : {"foo 4", "bar", "foo 2", "foo 1", "foo 3"})
            key.set(name, 4, testkit::pattern(4));
        hive.root.add("Later").set("foo", 4, testkit::pattern(4));
        return hive;
    }

    int row(const QString& name) const {
        for (int row = 0; row < table.rowCount(); row++) {
            if (table.index(row, 0).data().toString() == name)
                return row;
        }
        return -1;
    }

    // The name of the next value with "foo" in it, by the row that the table has it at, and where it is.
    QString next() {
        const RegModel::FindResult hit =
            searched.model.find(QStringLiteral("foo"), RegModel::FindValues, Qt::MatchContains);
        if (!hit.key.isValid())
            return QString();
        if (hit.key != searched.at(QStringLiteral("Key")))
            return path_of(hit.key);
        table.sort(0, Qt::AscendingOrder);
        return table.index(hit.value_row, 0).data().toString();
    }

    QString rest() {
        QStringList names;
        for (QString name = next(); !name.isEmpty(); name = next())
            names.append(name);
        return names.join(QStringLiteral(", "));
    }

    // "-NAME" deletes a value, "+NAME" makes one, "OLD>NEW" renames one.
    bool change(const QString& what) {
        if (what.startsWith(QLatin1Char('-')))
            return table.removeRows(row(what.mid(1)), 1);
        if (what.startsWith(QLatin1Char('+')))
            return table.add_value(4) && table.setData(table.index(table.rowCount() - 1, 0), what.mid(1), Qt::EditRole);
        const QStringList names = what.split(QLatin1Char('>'));
        return table.setData(table.index(row(names[0]), 0), names[1], Qt::EditRole);
    }
};

}  // namespace

class FindChangesTest : public QObject {
    Q_OBJECT

private slots:
    void a_rename_between_two_hits_data() {
        QTest::addColumn<int>("hits_before");
        QTest::addColumn<QString>("renamed");
        QTest::addColumn<QString>("name");
        QTest::addColumn<QString>("rest");
        const auto row = [](const char* what, int hits, const char* renamed, const char* name, const char* rest) {
            QTest::newRow(what) << hits << QString::fromLatin1(renamed) << QString::fromLatin1(name)
                                << QString::fromLatin1(rest);
        };
        row("nothing", 1, "", "", "hit 2,hit 3,hit 4,hit 5,hit 6");
        row("the next one to the end", 1, "hit 2", "zz hit", "hit 3,hit 4,hit 5,hit 6,zz hit");
        row("the next one to the front", 3, "hit 4", "a hit", "a hit,hit 5,hit 6");
        row("the next one in its place", 1, "hit 2", "hit 2b", "hit 2b,hit 3,hit 4,hit 5,hit 6");
        row("the found one to the end", 1, "hit 1", "zz hit", "hit 2,hit 3,hit 4,hit 5,hit 6");
        row("the found one to behind the next", 2, "hit 2", "hit 3b", "hit 3,hit 4,hit 5,hit 6");
        row("an earlier one to the end", 3, "hit 1", "zz hit", "hit 4,hit 5,hit 6");
        row("an earlier one to before the next", 3, "hit 1", "hit 3b", "hit 4,hit 5,hit 6");
        row("a later one to the front", 2, "hit 5", "a hit", "a hit,hit 3,hit 4,hit 6");
        row("a later one to just before the next", 2, "hit 5", "hit 2b", "hit 2b,hit 3,hit 4,hit 6");
        row("the last one, which is the next, to the front", 5, "hit 6", "a hit", "a hit");
        row("one when all were found", 6, "hit 2", "zz hit", "");
    }

    void a_rename_between_two_hits() {
        QFETCH(int, hits_before);
        QFETCH(QString, renamed);
        QFETCH(QString, name);
        QFETCH(QString, rest);
        Searched searched(hits());
        searched.begin();
        for (int i = 0; i < hits_before; i++)
            QVERIFY(searched.model.find(QStringLiteral("hit"), RegModel::FindKeys, Qt::MatchContains).key.isValid());
        if (!renamed.isEmpty())
            QVERIFY(searched.model.setData(searched.at(QStringLiteral("Top/") + renamed), name, Qt::EditRole));
        QCOMPARE(names(searched.rest(QStringLiteral("hit"), RegModel::FindKeys)), rest);
    }

    // At every moment of a walk, every key that can be renamed, to every place among its siblings.
    void after_any_rename_each_key_is_visited_once() {
        const int all = static_cast<int>(Visit().keys.size());
        int renames = 0;
        for (int moment = 1; moment <= all; moment++) {
            for (int number = 0; number < all; number++) {
                for (const char* name : {"a", "b3", "e", "zz"}) {
                    Visit visit;
                    const QPersistentModelIndex key = visit.keys[number];
                    if (!visit.searched.model.flags(key).testFlag(Qt::ItemIsEditable))
                        break;
                    for (int i = 0; i < moment; i++)
                        QVERIFY(visit.step());
                    const QString old = path_of(key);
                    QVERIFY(visit.searched.model.setData(key, QString::fromLatin1(name), Qt::EditRole));
                    renames++;
                    while (visit.step())
                        continue;
                    QVERIFY2(visit.wrong().isEmpty(), qPrintable(QStringLiteral("%1 to %2 after %3 hits: %4")
                                                                     .arg(old, QLatin1String(name))
                                                                     .arg(moment)
                                                                     .arg(visit.wrong())));
                }
            }
        }
        // All but the group, the root and the two keys below it can be renamed.
        QCOMPARE(renames, all * (all - 4) * 4);
    }

    void after_many_changes_each_key_is_visited_once_data() {
        QTest::addColumn<uint>("seed");
        for (uint seed = 1; seed <= 200; seed++)
            QTest::addRow("seed %u", seed) << seed;
    }

    void after_many_changes_each_key_is_visited_once() {
        QFETCH(uint, seed);
        Visit visit;
        std::mt19937 random(seed);
        const auto below = [&](size_t end) { return static_cast<size_t>(random() % end); };
        RegModel& model = visit.searched.model;
        int changes = 0;
        while (visit.step()) {
            for (size_t i = below(4); i > 0; i--) {
                const QModelIndex key =
                    visit.keys[static_cast<qsizetype>(below(static_cast<size_t>(visit.keys.size())))];
                if (!key.isValid())
                    continue;
                const std::string name(1 + below(2), static_cast<char>('a' + below(26)));
                switch (below(8)) {
                case 0:
                    // What is deleted must not be mistaken for a key that comes to stand at its address.
                    if (model.flags(key).testFlag(Qt::ItemIsEditable)) {
                        QList<QPersistentModelIndex> gone;
                        collect(model, key, gone);
                        for (const QPersistentModelIndex& one : gone)
                            visit.times.erase(key_of(one));
                        QVERIFY(model.removeRows(key.row(), 1, key.parent()));
                        changes++;
                    }
                    break;
                case 1:
                    changes += model.new_key(key) >= 0 ? 1 : 0;
                    break;
                default:
                    changes += model.setData(key, QString::fromStdString(name), Qt::EditRole) ? 1 : 0;
                }
            }
        }
        QVERIFY(changes > 0);
        QVERIFY2(visit.wrong().isEmpty(), qPrintable(visit.wrong()));
        for (const auto& [key, times] : visit.times)
            QCOMPARE(times, 1);
    }

    void a_search_begun_anew_comes_to_a_key_renamed_amid_the_last_one() {
        Searched searched(hits());
        searched.begin();
        for (int i = 0; i < 3; i++)
            QVERIFY(searched.model.find(QStringLiteral("hit"), RegModel::FindKeys, Qt::MatchContains).key.isValid());
        QVERIFY(
            searched.model.setData(searched.at(QStringLiteral("Top/hit 1")), QStringLiteral("zz hit"), Qt::EditRole));
        QCOMPARE(names(searched.all(QStringLiteral("hit"), RegModel::FindKeys)),
                 QStringLiteral("hit 2,hit 3,hit 4,hit 5,hit 6,zz hit"));
    }

    // The memory of deleted keys that the search would have passed over becomes that of new ones.
    void new_keys_are_visited_after_passed_over_ones_are_deleted() {
        Searched searched(hits());
        RegModel& model = searched.model;
        searched.begin();
        for (int i = 0; i < 3; i++)
            QVERIFY(model.find(QStringLiteral("hit"), RegModel::FindKeys, Qt::MatchContains).key.isValid());
        for (const char* old : {"hit 1", "hit 2", "hit 3"}) {
            const QModelIndex key = searched.at(QStringLiteral("Top/") + QLatin1String(old));
            QVERIFY(model.setData(key, QStringLiteral("zz ") + QLatin1String(old), Qt::EditRole));
        }
        const QModelIndex top = searched.at(QStringLiteral("Top"));
        QCOMPARE(model.rowCount(top), 6);
        for (int i = 0; i < 3; i++)
            QVERIFY(model.removeRows(3, 1, top));
        constexpr int new_keys = 50;
        for (int i = 0; i < new_keys; i++)
            QVERIFY(model.new_key(top) >= 0);
        QCOMPARE(searched.rest(QString(), RegModel::FindKeys).size(), 3 + new_keys);
    }

    // A rename has taken the key away from those that are still to be visited; those around it were.
    void a_deleted_key_with_a_place_of_its_own_leaves_it_to_no_other() {
        Searched searched(hits());
        searched.begin();
        for (int i = 0; i < 3; i++)
            QVERIFY(searched.model.find(QStringLiteral("hit"), RegModel::FindKeys, Qt::MatchContains).key.isValid());
        QVERIFY(
            searched.model.setData(searched.at(QStringLiteral("Top/hit 4")), QStringLiteral("a hit"), Qt::EditRole));
        QVERIFY(searched.model.removeRows(0, 1, searched.at(QStringLiteral("Top"))));
        QCOMPARE(names(searched.rest(QStringLiteral("hit"), RegModel::FindKeys)), QStringLiteral("hit 5,hit 6"));
    }

    void a_hit_after_renames_has_the_row_of_now() {
        Searched searched(hits());
        RegModel& model = searched.model;
        searched.begin();
        const auto next = [&](RegModel::FindModeFlag mode) {
            return model.find(QStringLiteral("hit"), mode, Qt::MatchContains).key;
        };
        const auto rename = [&](const char* old, const char* name) {
            const QModelIndex key = searched.at(QStringLiteral("Top/") + QLatin1String(old));
            return model.setData(key, QString::fromLatin1(name), Qt::EditRole);
        };
        for (int i = 0; i < 3; i++)
            QVERIFY(next(RegModel::FindKeys).isValid());
        QVERIFY(rename("hit 4", "a hit"));
        QVERIFY(rename("hit 1", "0 hit"));
        const QModelIndex alone = next(RegModel::FindKeys);
        QCOMPARE(alone.data().toString(), QStringLiteral("a hit"));
        QCOMPARE(alone.row(), 1);
        // Now with values of a key still to come.
        searched.begin();
        const QModelIndex found = next(RegModel::FindValues);
        QCOMPARE(found.data().toString(), QStringLiteral("hit 6"));
        QCOMPARE(found.row(), 5);
        QVERIFY(rename("0 hit", "zz hit"));
        const QModelIndex again = next(RegModel::FindValues);
        QCOMPARE(again.data().toString(), QStringLiteral("hit 6"));
        QCOMPARE(again.row(), 4);
    }

    void a_new_key_is_visited_where_the_search_still_comes() {
        testkit::HiveLayout hive;
        testkit::KeyLayout& top = hive.root.add("Top");
        top.add("a");
        top.add("z");
        const auto rest = [&](int hits_before) {
            Searched searched(hive);
            searched.begin();
            for (int i = 0; i < hits_before; i++)
                searched.model.find(QString(), RegModel::FindKeys, Qt::MatchContains);
            if (searched.model.new_key(searched.at(QStringLiteral("Top"))) != 1)
                return QStringLiteral("another row");
            QStringList found = searched.rest(QString(), RegModel::FindKeys);
            found.replaceInStrings(QStringLiteral("TOP/HIVE/"), QString());
            return found.join(QLatin1Char(','));
        };
        QCOMPARE(rest(2), QStringLiteral("Top,Top/a,Top/New Key #1,Top/z"));
        QCOMPARE(rest(3), QStringLiteral("Top/a,Top/New Key #1,Top/z"));
        QCOMPARE(rest(4), QStringLiteral("Top/New Key #1,Top/z"));
        QCOMPARE(rest(5), QString());
    }

    void changes_of_values_between_two_hits_data() {
        QTest::addColumn<int>("hits_before");
        QTest::addColumn<QStringList>("changes");
        QTest::addColumn<QString>("rest");
        const auto row = [](const char* what, int hits, std::initializer_list<const char*> changes, const char* rest) {
            QStringList list;
            for (const char* change : changes)
                list.append(QString::fromLatin1(change));
            QTest::newRow(what) << hits << list << QString::fromLatin1(rest);
        };
        const char* const later = "foo 2, foo 3, foo 4, TOP/HIVE/Later";
        row("nothing", 1, {}, later);
        row("the found one is deleted", 1, {"-foo 1"}, later);
        row("the found one is deleted, each time", 2, {"-foo 1", "-foo 2"}, "foo 3, foo 4, TOP/HIVE/Later");
        row("one before it is deleted", 1, {"-bar"}, later);
        row("the next one is deleted", 1, {"-foo 2"}, "foo 3, foo 4, TOP/HIVE/Later");
        row("all of them are deleted", 2, {"-foo 4", "-foo 1", "-foo 3", "-foo 2"}, "TOP/HIVE/Later");
        row("the found one is renamed to the end", 1, {"foo 1>foo 9"}, later);
        row("the found one is renamed to the front", 2, {"foo 2>a foo"}, "foo 3, foo 4, TOP/HIVE/Later");
        row("the next one is renamed to the end", 1, {"foo 2>foo 9"}, "foo 3, foo 4, foo 9, TOP/HIVE/Later");
        row("the next one is renamed to the front", 1, {"foo 2>a foo"}, "a foo, foo 3, foo 4, TOP/HIVE/Later");
        row("one is made before it", 1, {"+a foo"}, later);
        row("one is made behind it", 1, {"+foo 9"}, later);
        row("the found one is renamed and another deleted", 2, {"foo 2>a foo", "-foo 1"},
            "foo 3, foo 4, TOP/HIVE/Later");
        row("after the last one", 4, {"-foo 4", "+foo 9"}, "TOP/HIVE/Later");
    }

    void changes_of_values_between_two_hits() {
        QFETCH(int, hits_before);
        QFETCH(QStringList, changes);
        QFETCH(QString, rest);
        Values values;
        for (int i = 1; i <= hits_before; i++)
            QCOMPARE(values.next(), QStringLiteral("foo %1").arg(i));
        for (const QString& change : changes)
            QVERIFY2(values.change(change), qPrintable(change));
        QCOMPARE(values.rest(), rest);
    }

    // Rows of one name, of which some were visited.
    void equal_names_stay_apart_after_a_change_data() {
        QTest::addColumn<int>("hits_before");
        QTest::addColumn<QString>("change");
        QTest::addColumn<QString>("rest");
        QTest::newRow("another value is made") << 1 << QStringLiteral("+") << QStringLiteral("1,3,4");
        QTest::newRow("it is made after two hits") << 2 << QStringLiteral("+") << QStringLiteral("3,4");
        QTest::newRow("it is made after three hits") << 3 << QStringLiteral("+") << QStringLiteral("4");
        QTest::newRow("the one like the unnamed one is deleted") << 1 << QStringLiteral("1") << QStringLiteral("1,2");
        QTest::newRow("the unnamed one is deleted") << 1 << QStringLiteral("0") << QStringLiteral("1,2,3");
        QTest::newRow("the found one is deleted") << 3 << QStringLiteral("2") << QStringLiteral("2");
    }

    void equal_names_stay_apart_after_a_change() {
        QFETCH(int, hits_before);
        QFETCH(QString, change);
        QFETCH(QString, rest);
        testkit::HiveLayout hive;
        testkit::KeyLayout& key = hive.root.add("Key");
        for (const char* name : {"", "(Default)", "def", "dfe"})
            key.set(name, 4, testkit::pattern(4));
        testkit::LaidHive laid = testkit::lay_out(hive);
        laid.bytes[testkit::LaidHive::position(laid.at("Key").values[3].record, 21)] = 'e';
        laid.bytes[testkit::LaidHive::position(laid.at("Key").values[3].record, 22)] = 'f';
        Searched searched(laid.bytes);
        ValuesModel source(RegModel::editable_key(searched.at(QStringLiteral("Key"))));
        ValuesProxyModel table;
        table.setSourceModel(&source);
        table.sort(0, Qt::AscendingOrder);
        QCOMPARE(table.rowCount(), 4);
        QCOMPARE(table.index(2, 0).data(), table.index(3, 0).data());
        searched.begin();
        const auto next = [&] {
            return searched.model.find(QStringLiteral("def"), RegModel::FindValues, Qt::MatchContains).value_row;
        };
        for (int hit = 0; hit < hits_before; hit++)
            QCOMPARE(next(), hit);
        if (change == QStringLiteral("+"))
            QVERIFY(table.add_value(4) && table.setData(table.index(4, 0), QStringLiteral("aaa"), Qt::EditRole));
        else
            QVERIFY(table.removeRows(change.toInt(), 1));
        QStringList found;
        for (int row = next(); row >= 0; row = next())
            found.append(QString::number(row));
        QCOMPARE(found.join(QLatin1Char(',')), rest);
    }

    void a_change_after_the_hit_on_the_key_leaves_all_its_values() {
        Values values;
        const auto next = [&] {
            return Searched::text_of(
                values.searched.model.find(QString(), RegModel::FindKeys | RegModel::FindValues, Qt::MatchContains));
        };
        for (QString hit = next(); hit != QStringLiteral("TOP/HIVE/Key"); hit = next())
            QVERIFY(!hit.isEmpty());
        QVERIFY(values.change(QStringLiteral("-foo 2")));
        for (int row = 0; row < 5; row++)
            QCOMPARE(next(), QStringLiteral("TOP/HIVE/Key : %1").arg(row));
        QCOMPARE(next(), QStringLiteral("TOP/HIVE/Later"));
    }

    void the_default_row_is_visited_once_whether_it_is_set_or_not() {
        Values values;
        RegModel& model = values.searched.model;
        const auto next = [&] {
            return Searched::text_of(model.find(QStringLiteral("(def"), RegModel::FindValues, Qt::MatchContains));
        };
        QCOMPARE(next(), QStringLiteral("TOP/HIVE/Key : 0"));
        QVERIFY(values.table.setData(values.table.index(0, 2), QStringLiteral("set"), Qt::EditRole));
        QCOMPARE(next(), QStringLiteral("TOP/HIVE/Later : 0"));
        values.searched.begin();
        QCOMPARE(next(), QStringLiteral("TOP/HIVE/Key : 0"));
        QVERIFY(values.table.removeRows(0, 1));
        QCOMPARE(next(), QStringLiteral("TOP/HIVE/Later : 0"));
    }
};

QTEST_MAIN(FindChangesTest)
#include "find_changes_test.moc"
