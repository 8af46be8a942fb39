// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Changes of values that the engine gives up at every point where memory may run out: whether nothing was changed, half
// of it was, or the key cannot be read any more, models and view agree with the key afterwards.
#include "alloc_faults.h"
#include "hive_on_disk.h"

#include "reg_hive.h"
#include "reg_key.h"
#include "values_model.h"
#include "values_proxy_model.h"

#include <QHeaderView>
#include <QRegularExpression>
#include <QSet>
#include <QTableView>
#include <QTest>

#include <functional>
#include <stdexcept>

namespace {

testkit::HiveLayout layout() {
    testkit::HiveLayout hive;
    testkit::KeyLayout& bare = hive.root.add("Bare");
    for (const char* name : {"gamma", "Beta", "alpha"})
        bare.set(name, 1, testkit::text_data("some text in a cell of its own"));
    testkit::KeyLayout& full = hive.root.add("Full");
    for (const char* name : {"gamma", "", "alpha"})
        full.set(name, 1, testkit::text_data("some text in a cell of its own"));
    return hive;
}

enum Key { Bare, Full };

struct Shown {
    HiveOnDisk file{layout()};
    DummyRegKey top{QStringLiteral("TOP")};
    RegHive hive{QStringLiteral("HIVE"), file.path(), &top};
    RegKey* key;
    ValuesModel source;
    ValuesProxyModel proxy;
    QTableView source_view;
    QTableView view;

    explicit Shown(int number) : key(static_cast<RegKey*>(hive.root_key()->child(number))), source(key) {
        proxy.setSourceModel(&source);
        proxy.sort(0, Qt::AscendingOrder);
        source_view.setModel(&source);
        view.setModel(&proxy);
    }
    ~Shown() { view.setModel(nullptr); }

    // What does not agree. A row that was to be inserted is announced by the source whether it comes or not, which is
    // for the table's model to put right.
    QString wrong(bool is_insertion) {
        QStringList names;
        for (int row = 0; row < key->value_count(); row++)
            names.append(key->value_name(row).value_or(QStringLiteral("?")));
        if (!is_insertion && source_view.verticalHeader()->count() != names.size())
            return QStringLiteral("rows of the source");
        for (int row = 0; row < names.size(); row++) {
            if (source.index(row, 0).data().toString() !=
                (names[row].isEmpty() ? QStringLiteral("(Default)") : names[row]))
                return QStringLiteral("a name of the source");
        }
        const int rows = static_cast<int>(names.size()) + (names.contains(QString()) ? 0 : 1);
        if (proxy.rowCount() != rows || view.verticalHeader()->count() != rows)
            return QStringLiteral("rows of the table");
        QSet<int> shown;
        for (int row = 0; row < rows; row++)
            shown.insert(proxy.mapToSource(proxy.index(row, 0)).row());
        if (shown.size() != rows)
            return QStringLiteral("a row shown twice");
        if (view.currentIndex().row() < 0 || view.currentIndex().row() >= rows)
            return QStringLiteral("the current row");
        return QString();
    }
};

struct Outcomes {
    int done = 0;
    int refused = 0;
    int thrown = 0;
    int half_done = 0;  // not done, but there are more rows than before
    QString wrong;
};

struct Attempt {
    int key;
    int current;  // row of the table
    std::function<bool(Shown&)> change;
    bool is_insertion = false;
    bool drops_handles = false;  // amid the change, so that the key has to be opened again
};

// Makes an attempt on a hive of its own, letting the nth request for memory fail, alone or with all that follow it.
// Whether one failed.
bool fails_at(uint64_t nth, bool lasting, const Attempt& attempt, Outcomes& outcomes) {
    Shown shown(attempt.key);
    shown.view.setCurrentIndex(shown.proxy.index(attempt.current, 0));
    const int rows = shown.source.rowCount();
    if (attempt.drops_handles) {
        const auto drop = [&] { shown.hive.clear_handle_cache(); };
        QObject::connect(&shown.source, &QAbstractItemModel::rowsAboutToBeInserted, &shown.view, drop);
        QObject::connect(&shown.source, &QAbstractItemModel::rowsAboutToBeRemoved, &shown.view, drop);
    }
    bool failed = false;
    int* outcome = &outcomes.refused;
    {
        const testkit::AllocationFaults faults(nth, lasting);
        try {
            if (attempt.change(shown))
                outcome = &outcomes.done;
        } catch (const std::exception&) {
            outcome = &outcomes.thrown;
        }
        failed = faults.failed();
    }
    if (outcome != &outcomes.done && shown.source.rowCount() > rows)
        outcome = &outcomes.half_done;
    ++*outcome;
    const QString wrong = shown.wrong(attempt.is_insertion);
    if (!wrong.isEmpty())
        outcomes.wrong += QStringLiteral("request %1%2: %3\n")
                              .arg(nth)
                              .arg(lasting ? QStringLiteral(" and all after") : QString(), wrong);
    return failed;
}

// Ends where no request is left to fail. Where handles are dropped and memory stays out, the views that hear of the
// rows cannot ask the key either, and throw: nothing can be said of them then.
void run_through(const Attempt& attempt, Outcomes& outcomes) {
    for (const bool lasting : {false, true}) {
        if (lasting && attempt.drops_handles)
            continue;
        for (uint64_t nth = 1; fails_at(nth, lasting, attempt, outcomes); nth++)
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
        for (const int current : {1, 3}) {
            run_through({Bare, current,
                         [](Shown& shown) {
                             return shown.proxy.setData(shown.proxy.index(1, 0), QStringLiteral("delta"), Qt::EditRole);
                         }},
                        outcomes);
        }
        QCOMPARE(outcomes.wrong, QString());
        QVERIFY(outcomes.done > 0);
        QVERIFY(outcomes.refused > 0);
        QVERIFY(outcomes.half_done > 0);
    }

    void a_new_value() {
        Outcomes outcomes;
        for (const bool drops_handles : {false, true}) {
            for (const int current : {0, 3})
                run_through({Bare, current, [](Shown& shown) { return shown.proxy.add_value(1); }, true, drops_handles},
                            outcomes);
        }
        QCOMPARE(outcomes.wrong, QString());
        QVERIFY(outcomes.done > 0);
        QVERIFY(outcomes.refused > 0);
        QVERIFY(outcomes.thrown > 0);
    }

    void the_unnamed_value() {
        Outcomes outcomes;
        const auto set = [](Shown& shown) {
            return shown.proxy.setData(shown.proxy.index(0, 2), QStringLiteral("made"), Qt::EditRole);
        };
        for (const bool drops_handles : {false, true}) {
            for (const int current : {0, 3})
                run_through({Bare, current, set, true, drops_handles}, outcomes);
        }
        QCOMPARE(outcomes.wrong, QString());
        QVERIFY(outcomes.done > 0);
        QVERIFY(outcomes.refused > 0);
        QVERIFY(outcomes.thrown > 0);
    }

    void a_deletion() {
        Outcomes outcomes;
        for (const bool drops_handles : {false, true}) {
            for (const int row : {0, 1, 2})
                run_through(
                    {Full, 2, [row](Shown& shown) { return shown.proxy.removeRows(row, 1); }, false, drops_handles},
                    outcomes);
        }
        QCOMPARE(outcomes.wrong, QString());
        QVERIFY(outcomes.done > 0);
        QVERIFY(outcomes.refused > 0);
        QVERIFY(outcomes.thrown > 0);
    }
};

QTEST_MAIN(ValuesFailuresTest)
#include "values_failures_test.moc"
