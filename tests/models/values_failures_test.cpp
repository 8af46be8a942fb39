// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Changes of values that the engine gives up at every point where memory may run out or the file cannot be read:
// whether nothing was changed, half of it was, or the key cannot be read any more, models and view agree with the key
// afterwards.
#include "alloc_faults.h"
#include "file_faults.h"
#include "shown_values.h"

#include <QRegularExpression>
#include <QSet>
#include <QTest>

#include <functional>
#include <stdexcept>
#include <utility>

namespace {

testkit::HiveLayout layout() {
    testkit::HiveLayout hive;
    testkit::KeyLayout& bare = hive.root.add("Bare");
    for (const char* name : {"gamma", "Beta", "alpha"})
        bare.set(name, 1, testkit::text_data("some text in a cell of its own"));
    testkit::KeyLayout& full = hive.root.add("Full");
    for (const char* name : {"gamma", "", "alpha"})
        full.set(name, 1, testkit::text_data("some text in a cell of its own"));
    testkit::KeyLayout& wide = hive.root.add("Wide");
    // As much data as makes the engine go to the file often.
    for (int i = 0; i < 60; i++)
        wide.set("value " + std::to_string(i), 3, testkit::pattern(3000)).wide_name = true;
    testkit::KeyLayout with_default = wide;
    with_default.name = u"With default";
    with_default.set("", 1, testkit::text_data("is set"));
    testkit::KeyLayout default_amid = with_default;  // not what is read last
    default_amid.name = u"With default amid others";
    std::swap(default_amid.values[30], default_amid.values.back());
    hive.root.children.push_back(with_default);
    hive.root.children.push_back(default_amid);
    return hive;
}

enum Key { Bare, Full, Wide, WithDefault, WithDefaultAmid };

// As if so many other keys were read that the key has to be opened again for everything.
class ForgottenModel : public ValuesModel {
public:
    ForgottenModel(RegKey* key, RegHive& hive) : ValuesModel(key), hive_(hive) {}

    int rowCount(const QModelIndex& parent = QModelIndex()) const override {
        const int rows = ValuesModel::rowCount(parent);
        hive_.clear_handle_cache();
        return rows;
    }

private:
    RegHive& hive_;
};

// When the key's handle is dropped, so that the key has to be opened again.
enum class Drops { never, amid_the_change, after_the_removal };

struct Outcomes {
    int done = 0;
    int refused = 0;
    int thrown = 0;
    int half_done = 0;    // not done, but there are more rows than before
    int half_thrown = 0;  // of those, the ones that were thrown
    QString wrong;
};

struct Attempt {
    int key;
    int current;  // row of the table
    std::function<bool(Shown&)> change;
    bool is_insertion = false;
    Drops drops = Drops::never;
    bool fails_reads = false;  // not requests for memory
};

void drop_handles(Shown& shown, Drops when) {
    const auto drop = [&] { shown.hive.clear_handle_cache(); };
    if (when == Drops::amid_the_change) {
        QObject::connect(&shown.source, &QAbstractItemModel::rowsAboutToBeInserted, &shown.view, drop);
        QObject::connect(&shown.source, &QAbstractItemModel::rowsAboutToBeRemoved, &shown.view, drop);
    } else if (when == Drops::after_the_removal) {
        QObject::connect(&shown.proxy, &QAbstractItemModel::rowsRemoved, &shown.view, drop);
    }
}

// Makes an attempt on a hive of its own, letting the nth request for memory or read fail, alone or with all that
// follow it. Whether one failed.
bool fails_at(int nth, bool lasting, const Attempt& attempt, Outcomes& outcomes) {
    HiveOnDisk file(layout());
    Shown shown(file, attempt.key);
    shown.view.setCurrentIndex(shown.proxy.index(attempt.current, 0));
    const int rows = shown.source.rowCount();
    const QStringList names = shown.names();
    drop_handles(shown, attempt.drops);
    bool failed = false;
    int* outcome = &outcomes.refused;
    {
        const testkit::AllocationFaults faults(attempt.fails_reads ? 0 : static_cast<uint64_t>(nth), lasting);
        const testkit::ReadFaults read_faults(attempt.fails_reads ? nth : 0, lasting);
        try {
            if (attempt.change(shown))
                outcome = &outcomes.done;
        } catch (const std::exception&) {
            outcome = &outcomes.thrown;
        }
        failed = attempt.fails_reads ? read_faults.failed() : faults.failed();
    }
    QString wrong = shown.wrong(attempt.is_insertion);
    const int more_rows = shown.source.rowCount() - rows;
    // The toolkit counts the rows once more after it has said that some come, and stops there if they cannot be
    // counted.
    if (attempt.drops != Drops::amid_the_change && shown.of_the_source.open + shown.of_the_table.open != 0)
        wrong += QStringLiteral(" rows told of by half");
    if (outcome != &outcomes.done && !attempt.is_insertion && more_rows == 0 && shown.names() != names)
        wrong += QStringLiteral(" the order of what stayed");
    if (outcome != &outcomes.done && more_rows > 0) {
        outcomes.half_thrown += outcome == &outcomes.thrown ? 1 : 0;
        outcome = &outcomes.half_done;
    }
    ++*outcome;
    if (!wrong.isEmpty())
        outcomes.wrong += QStringLiteral("number %1%2: %3\n")
                              .arg(nth)
                              .arg(lasting ? QStringLiteral(" and all after") : QString(), wrong);
    return failed;
}

// Gives the table's model its source while the nth read fails, alone or with all that follow it. Whether one did.
bool shown_while_reads_fail(ValuesProxyModel& proxy, Shown& shown, int nth, bool lasting) {
    const testkit::ReadFaults faults(nth, lasting);
    try {
        proxy.setSourceModel(&shown.source);
    } catch (const std::runtime_error&) {
        // not shown at all then
    }
    return faults.failed();
}

bool name_it_delta(Shown& shown) {
    return shown.proxy.setData(shown.proxy.index(1, 0), QStringLiteral("delta"), Qt::EditRole);
}

// Ends where nothing is left to fail. Where handles are dropped and memory stays out, the views that hear of the rows
// cannot ask the key either, and throw; where the file stays unreadable, nobody can count the rows: nothing can be
// said of them then.
void run_through(const Attempt& attempt, Outcomes& outcomes) {
    for (const bool lasting : {false, true}) {
        if (lasting && (attempt.drops != Drops::never || attempt.fails_reads))
            continue;
        for (int nth = 1; fails_at(nth, lasting, attempt, outcomes); nth++)
            continue;
    }
}

}  // namespace

class ValuesFailuresTest : public QObject {
    Q_OBJECT

private slots:
    void init() { QTest::failOnWarning(QRegularExpression(QStringLiteral("."))); }

    // What was stored under the new name and could not be taken away under the old one is there twice.
    void a_rename() {
        Outcomes outcomes;
        for (const int current : {1, 3})
            run_through({Bare, current, name_it_delta}, outcomes);
        QCOMPARE(outcomes.wrong, QString());
        QVERIFY(outcomes.done > 0);
        QVERIFY(outcomes.refused > 0);
        QVERIFY(outcomes.half_done > 0);
    }

    void a_rename_in_a_file_that_cannot_be_read_data() {
        QTest::addColumn<int>("key");
        QTest::addColumn<bool>("is_half_done");  // in the one, what was stored lies beside what is asked for then
        QTest::newRow("the default value made up") << static_cast<int>(Wide) << true;
        QTest::newRow("the default value stored") << static_cast<int>(WithDefaultAmid) << false;
    }

    // Here the engine may store the new name and then not say any more what the old one is.
    void a_rename_in_a_file_that_cannot_be_read() {
        QFETCH(const int, key);
        QFETCH(const bool, is_half_done);
        Outcomes outcomes;
        run_through({key, 1, name_it_delta, false, Drops::never, true}, outcomes);
        QCOMPARE(outcomes.wrong, QString());
        QVERIFY(outcomes.done > 0);
        QVERIFY(outcomes.refused > 0);
        QVERIFY(outcomes.thrown > 0);
        QCOMPARE(outcomes.half_thrown > 0, is_half_done);
    }

    void a_new_value() {
        Outcomes outcomes;
        for (const Drops drops : {Drops::never, Drops::amid_the_change}) {
            for (const int current : {0, 3})
                run_through({Bare, current, [](Shown& shown) { return shown.proxy.add_value(1); }, true, drops},
                            outcomes);
        }
        QCOMPARE(outcomes.wrong, QString());
        QVERIFY(outcomes.done > 0);
        QVERIFY(outcomes.refused > 0);
        QVERIFY(outcomes.thrown > 0);
    }

    void a_new_value_of_a_key_that_cannot_be_opened_any_more_is_told_of_whole() {
        int told_whole = 0;
        bool failed = true;
        for (uint64_t nth = 1; failed; nth++) {
            HiveOnDisk file(layout());
            Shown shown(file, Bare);
            ForgottenModel model(shown.key, shown.hive);
            const Told told(model);
            bool thrown = false;
            {
                const testkit::AllocationFaults faults(nth);
                try {
                    model.add_value(1);
                } catch (const std::runtime_error&) {
                    thrown = true;
                }
                failed = faults.failed();
            }
            told_whole += thrown && told.begun == 1 && told.open == 0 ? 1 : 0;
        }
        QVERIFY(told_whole > 0);
    }

    void the_unnamed_value() {
        Outcomes outcomes;
        const auto set = [](Shown& shown) {
            return shown.proxy.setData(shown.proxy.index(0, 2), QStringLiteral("made"), Qt::EditRole);
        };
        for (const Drops drops : {Drops::never, Drops::amid_the_change}) {
            for (const int current : {0, 3})
                run_through({Bare, current, set, true, drops}, outcomes);
        }
        QCOMPARE(outcomes.wrong, QString());
        QVERIFY(outcomes.done > 0);
        QVERIFY(outcomes.refused > 0);
        QVERIFY(outcomes.thrown > 0);
    }

    void one_read_that_fails_makes_up_no_default_value() {
        bool failed = true;
        int nth = 1;
        for (; failed; nth++) {
            HiveOnDisk file(layout());
            Shown shown(file, WithDefault);
            ValuesProxyModel proxy;
            failed = shown_while_reads_fail(proxy, shown, nth, false);
            QCOMPARE(proxy.rowCount(), shown.source.rowCount());
        }
        QVERIFY(nth > 2);
    }

    // Where all reads fail for a while, a key is taken for one without a default value: the made-up row gives way to it
    // when the table is sorted anew.
    void a_default_value_that_could_not_be_read_takes_the_place_of_the_row_made_up_for_it() {
        HiveOnDisk file(layout());
        Shown shown(file, WithDefaultAmid);
        ValuesProxyModel proxy;
        QVERIFY(shown_while_reads_fail(proxy, shown, 1, true));
        const int rows = shown.source.rowCount();
        QCOMPARE(proxy.rowCount(), rows + 1);
        const Told told(proxy);
        QTableView view;
        view.setModel(&proxy);
        proxy.sort(0, Qt::AscendingOrder);
        QCOMPARE(proxy.rowCount(), rows);
        QCOMPARE(view.verticalHeader()->count(), rows);
        QCOMPARE(told.rows, -1);
        QCOMPARE(proxy.index(0, 2).data().toString(), QStringLiteral("is set"));
        QVERIFY(!(proxy.index(0, 0).flags() & Qt::ItemIsEditable));
        QCOMPARE(proxy.index(1, 0).data().toString(), QStringLiteral("value 0"));
    }

    // What is typed into the made-up row then must not replace the value that is there.
    void an_unnamed_value_that_could_not_be_read_is_not_overwritten() {
        int misled = 0;
        bool is_misled = true;
        for (int nth = 1; nth == 1 || is_misled; nth++) {
            HiveOnDisk file(layout());
            Shown shown(file, WithDefaultAmid);
            const testkit::Bytes before = shown.file.bytes();
            ValuesProxyModel proxy;
            shown_while_reads_fail(proxy, shown, nth, true);
            const int rows = shown.source.rowCount();
            is_misled = proxy.rowCount() != rows;
            if (!is_misled)
                continue;
            misled++;
            QTableView view;
            view.setModel(&proxy);
            view.setCurrentIndex(proxy.index(0, 2));
            QVERIFY(!proxy.setData(proxy.index(0, 2), QStringLiteral("typed"), Qt::EditRole));
            QVERIFY(shown.file.bytes() == before);
            QCOMPARE(proxy.rowCount(), rows);
            QCOMPARE(view.verticalHeader()->count(), rows);
            QCOMPARE(proxy.index(0, 2).data().toString(), QStringLiteral("is set"));
            QCOMPARE(view.currentIndex().row(), 0);
            QVERIFY(proxy.setData(proxy.index(0, 2), QStringLiteral("typed"), Qt::EditRole));
            QCOMPARE(shown.file.stored("With default amid others", ""), QByteArray("t\0y\0p\0e\0d\0\0\0", 12));
        }
        QVERIFY(misled > 0);
    }

    // The cell is empty until the table is refreshed.
    void data_that_could_not_be_read_is_read_again() {
        int empty = 0;
        bool failed = true;
        for (int nth = 1; failed; nth++) {
            HiveOnDisk file(layout());
            Shown shown(file, Wide);
            const int rows = shown.source.rowCount();
            {
                const testkit::ReadFaults faults(nth);
                for (int row = 0; row < rows; row++) {
                    try {
                        empty += shown.source.index(row, 2).data().isValid() ? 0 : 1;
                    } catch (const std::exception&) {
                        // told
                    }
                }
                failed = faults.failed();
            }
            shown.proxy.sort(0, Qt::AscendingOrder);
            for (int row = 0; row < rows; row++)
                QVERIFY(shown.source.index(row, 2).data().isValid());
        }
        QVERIFY(empty > 0);
    }

    // A screen reader asks through parts of the toolkit that lose memory when an exception passes them.
    void what_cannot_be_read_is_spoken_of_without_an_exception() {
        QSet<QString> spoken;
        for (int column = 0; column < 3; column++) {
            bool failed = true;
            for (int nth = 1; failed; nth++) {
                HiveOnDisk file(layout());
                const Shown shown(file, Wide);
                const QModelIndex cell = shown.proxy.index(2, column);
                const testkit::ReadFaults faults(nth, true);
                const QVariant text = cell.data(Qt::AccessibleTextRole);
                if (text.toString().isEmpty())
                    cell.data(Qt::DisplayRole);  // as the toolkit does
                else
                    spoken.insert(QStringLiteral("%1: %2").arg(column).arg(text.toString().left(16)));
                failed = faults.failed();
            }
        }
        const QSet<QString> expected = {QStringLiteral("0: value 1"),          QStringLiteral("0: (cannot be read)"),
                                        QStringLiteral("1: REG_BINARY"),       QStringLiteral("1: (cannot be read)"),
                                        QStringLiteral("2: 01 08 0f 16 1d 2"), QStringLiteral("2: (cannot be read)")};
        QCOMPARE(spoken, expected);
    }

    void a_deletion() {
        Outcomes outcomes;
        for (const Drops drops : {Drops::never, Drops::amid_the_change}) {
            for (const int row : {0, 1, 2})
                run_through({Full, 2, [row](Shown& shown) { return shown.proxy.removeRows(row, 1); }, false, drops},
                            outcomes);
        }
        QCOMPARE(outcomes.wrong, QString());
        QVERIFY(outcomes.done > 0);
        QVERIFY(outcomes.refused > 0);
        QVERIFY(outcomes.thrown > 0);
    }

    // The value is gone, but whether the unnamed one is left cannot be asked.
    void a_deletion_that_is_not_known_whole() {
        Outcomes outcomes;
        for (const int row : {0, 1, 2})
            run_through({Full, 2, [row](Shown& shown) { return shown.proxy.removeRows(row, 1); }, false,
                         Drops::after_the_removal},
                        outcomes);
        QCOMPARE(outcomes.wrong, QString());
        QVERIFY(outcomes.done > 0);
        QVERIFY(outcomes.refused > 0);
        QVERIFY(outcomes.thrown > 0);
    }
};

QTEST_MAIN(ValuesFailuresTest)
#include "values_failures_test.moc"
