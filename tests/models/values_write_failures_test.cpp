// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Changes of values that fail at every point where the file cannot be written or memory may run out: nothing but what
// the change names reads otherwise, and models and view show what whoever opens the file then is shown, and go on as it
// does.
#include "failing.h"
#include "sanitized.h"
#include "shown_values.h"

#include <QRegularExpression>
#include <QTest>

#include <functional>
#include <map>
#include <stdexcept>

namespace {

testkit::HiveLayout layout(bool is_full) {
    testkit::HiveLayout hive;
    hive.no_free_space = is_full;
    testkit::KeyLayout& bare = hive.root.add("Bare");
    for (const char* name : {"gamma", "Beta", "alpha"})
        bare.set(name, 1, testkit::text_data("some text in a cell of its own"));
    hive.root.add("Empty");
    testkit::KeyLayout& full = hive.root.add("Full");
    for (const char* name : {"gamma", "", "alpha", "delta"})
        full.set(name, 1, testkit::text_data("some text in a cell of its own"));
    testkit::KeyLayout& large = hive.root.add("Large");
    large.set("big", 3, testkit::pattern(20000)).storage = testkit::Storage::big;
    large.set("small", 3, testkit::pattern(40));
    testkit::KeyLayout& types = hive.root.add("Types");
    for (const uint32_t type : {0U, 3U, 8U, 9U, 10U})
        types.set("bytes " + std::to_string(type), type, testkit::pattern(40));
    for (const uint32_t type : {1U, 2U, 6U})
        types.set("text " + std::to_string(type), type, testkit::text_data("twenty characters..."));
    types.set("list", 7, {'a', 0, 0, 0, 'b', 0, 0, 0, 0, 0});
    types.set("number", 4, testkit::pattern(4));
    types.set("swapped", 5, testkit::pattern(4));
    types.set("wide", 11, testkit::pattern(8));
    return hive;
}

enum Key { Bare, Empty, Full, Large, Types };

struct Change {
    QString name;
    int key;
    QString value;  // null for a new one
    std::function<bool(ValuesProxyModel&, int row)> run;
    bool is_insertion = false;
    QString new_name = QString();  // of a rename

    Outcome make(ValuesProxyModel& model) const {
        int row = -1;
        for (int i = 0; i < model.rowCount() && row < 0 && !value.isNull(); i++)
            row = model.index(i, ValuesModel::NameColumn).data().toString() == value ? i : -1;
        if (row < 0 && !value.isNull())
            return Outcome::absent;
        try {
            return run(model, row) ? Outcome::done : Outcome::refused;
        } catch (const std::exception&) {
            return Outcome::thrown;
        }
    }

    // However a rename ended, the value that is current is the one that was. The one that is renamed may be there under
    // its new name alone.
    QString strayed(const Shown& shown, const QString& was_current) const {
        if (new_name.isEmpty())
            return QString();
        const bool is_renamed = was_current == value && !shown.names().contains(value);
        const QString current = shown.view.currentIndex().data().toString();
        return current == (is_renamed ? new_name : was_current) ? QString() : current + QStringLiteral(" is current");
    }
};

Change rename_to(const char* name, const QString& new_name, int key, const QString& value) {
    return {QString::fromLatin1(name),
            key,
            value,
            [=](ValuesProxyModel& model, int row) {
                return model.setData(model.index(row, ValuesModel::NameColumn), new_name, Qt::EditRole);
            },
            false,
            new_name};
}

Change set_data(const QString& name, int key, const QString& value, const QVariant& data) {
    return {name, key, value, [=](ValuesProxyModel& model, int row) {
                return model.setData(model.index(row, ValuesModel::DataColumn), data, Qt::EditRole);
            }};
}

Change remove(const char* name, int key, const QString& value) {
    return {QString::fromLatin1(name), key, value,
            [](ValuesProxyModel& model, int row) { return model.removeRows(row, 1); }};
}

Change add(const char* name, int key, int type) {
    return {QString::fromLatin1(name), key, QString(),
            [=](ValuesProxyModel& model, int) { return model.add_value(type); }, true};
}

const QString default_name = QStringLiteral("(Default)");

std::vector<Change> all_changes() {
    const QString text = QStringLiteral("twenty characters...");
    std::vector<Change> all = {
        rename_to("a rename", QStringLiteral("delta"), Bare, QStringLiteral("alpha")),
        rename_to("a rename to a longer name", QStringLiteral("zulu, which is longer"), Full, QStringLiteral("gamma")),
        rename_to("a rename of a number", QStringLiteral("digits"), Types, QStringLiteral("number")),
        remove("a removal", Full, QStringLiteral("gamma")),
        remove("a removal of the last one", Full, QStringLiteral("delta")),
        remove("a removal of the unnamed one", Full, default_name),
        remove("a removal of a large one", Large, QStringLiteral("big")),
        add("a new text", Bare, REG_SZ),
        add("a first value", Empty, REG_SZ),
        add("a new number", Bare, REG_DWORD),
        add("a new wide number", Bare, REG_QWORD),
        add("new bytes", Bare, REG_BINARY),
        add("a new list", Bare, REG_MULTI_SZ),
        set_data(QStringLiteral("the unnamed value"), Bare, default_name, QStringLiteral("made")),
        set_data(QStringLiteral("the unnamed value as the first"), Empty, default_name, QStringLiteral("made")),
        set_data(QStringLiteral("a number"), Types, QStringLiteral("number"), 7U),
        set_data(QStringLiteral("a swapped number"), Types, QStringLiteral("swapped"), 7U),
        set_data(QStringLiteral("a wide number"), Types, QStringLiteral("wide"), 7ULL),
        set_data(QStringLiteral("a longer list"), Types, QStringLiteral("list"), QStringList(20, text)),
        set_data(QStringLiteral("a shorter list"), Types, QStringLiteral("list"), QStringList{QStringLiteral("a")}),
        set_data(QStringLiteral("large bytes replaced"), Large, QStringLiteral("big"), QByteArray(900, 'n')),
        set_data(QStringLiteral("bytes that need a bin"), Large, QStringLiteral("small"), QByteArray(20000, 'n')),
    };
    for (const int type : {1, 2, 6})
        all.push_back(set_data(QStringLiteral("text %1 longer").arg(type), Types, QStringLiteral("text %1").arg(type),
                               text + text + text));
    all.push_back(set_data(QStringLiteral("a text as long"), Types, QStringLiteral("text 1"), QString(20, u'n')));
    all.push_back(set_data(QStringLiteral("a shorter text"), Types, QStringLiteral("text 1"), QStringLiteral("n")));
    for (const int type : {0, 3, 8, 9, 10})
        all.push_back(set_data(QStringLiteral("bytes %1 more").arg(type), Types, QStringLiteral("bytes %1").arg(type),
                               QByteArray(100, 'n')));
    all.push_back(set_data(QStringLiteral("as many bytes"), Types, QStringLiteral("bytes 3"), QByteArray(40, 'n')));
    all.push_back(set_data(QStringLiteral("four bytes"), Types, QStringLiteral("bytes 3"), QByteArray(4, 'n')));
    return all;
}

const std::vector<Change>& changes() {
    static const std::vector<Change> all = all_changes();
    return all;
}

// Each row as text, in the table's order.
QStringList rows_of(const ValuesProxyModel& model) {
    QStringList rows;
    for (int row = 0; row < model.rowCount(); row++) {
        QStringList cells;
        for (int column = 0; column < ValuesModel::ColumnCount; column++)
            cells.append(model.index(row, column).data(Qt::AccessibleTextRole).toString());
        rows.append(cells.join(QStringLiteral(" | ")));
    }
    return rows;
}

struct Attempt {
    const Change& change;
    const WholeChange& whole;
    int current;  // row of the table, from the end where it is negative
    Fails way;
    HiveOnDisk& file;
    HiveOnDisk& other_file;  // for whoever opens it then
};

// Rows that the table has and whoever opens the file has not, or the other way round, or in another order.
QString difference(const Shown& shown, const OpenedValues& fresh, bool is_in_order) {
    QStringList here = rows_of(shown.proxy);
    QStringList there = rows_of(fresh.proxy);
    if (!is_in_order) {
        here.sort();
        there.sort();
    }
    if (here == there)
        return QString();
    return QStringLiteral("\nshows ") + here.join(QStringLiteral("\n      ")) + QStringLiteral("\ninstead of ") +
           there.join(QStringLiteral("\n      "));
}

// The same change once more: it goes as it goes for whoever opens the file.
QString try_again(const Attempt& attempt, Shown& shown, OpenedValues& fresh, Tally& tally) {
    const Outcome outcome = attempt.change.make(shown.proxy);
    (outcome == Outcome::refused ? tally.refused_again : tally.done_again)++;
    if (outcome == Outcome::thrown || outcome != attempt.change.make(fresh.proxy))
        return QStringLiteral("goes otherwise again, %1").arg(static_cast<int>(outcome));
    for (const std::string& line : testkit::diff(fresh.file.bytes(), shown.file.bytes()))
        return QStringLiteral("is made otherwise again: ") + QString::fromStdString(line);
    const QString other = difference(shown, fresh, false);
    return other.isEmpty() ? shown.wrong(true) : QStringLiteral("after the next change ") + other;
}

// What is wrong after the change failed at its nth step; has_failed tells whether it did.
QString try_change(const Attempt& attempt, int nth, bool& has_failed, Tally& tally) {
    attempt.file.put(attempt.whole.bytes);
    Shown shown(attempt.file, attempt.change.key);
    const int rows = shown.proxy.rowCount();
    shown.view.setCurrentIndex(shown.proxy.index((attempt.current + rows) % rows, 0));
    const QString current = shown.view.currentIndex().data().toString();
    rows_of(shown.proxy);  // what was shown stays in mind
    Outcome outcome = Outcome::refused;
    {
        const Failing failing(attempt.way, nth);
        outcome = attempt.change.make(shown.proxy);
        has_failed = failing.failed();
    }
    const testkit::Bytes bytes = shown.file.bytes();
    const testkit::Hive now = testkit::read_hive(bytes);
    QString wrong = tally.count(attempt.whole, outcome, has_failed, now);
    if (wrong.isEmpty())
        wrong = attempt.whole.harm(now, false);
    if (wrong.isEmpty())
        wrong = shown.wrong(attempt.change.is_insertion || attempt.change.value == default_name);
    if (!wrong.isEmpty())
        return wrong;
    wrong = attempt.change.strayed(shown, current);
    if (!wrong.isEmpty())
        return wrong;
    attempt.other_file.put(bytes);
    OpenedValues fresh(attempt.other_file, attempt.change.key);
    fresh.attach();
    // A row that was renamed, or came, stays where the user sees it until the table is sorted again.
    wrong = difference(shown, fresh, outcome != Outcome::done);
    return wrong.isEmpty() && outcome != Outcome::done ? try_again(attempt, shown, fresh, tally) : wrong;
}

WholeChange undisturbed(const Change& change, HiveOnDisk& file, bool is_full) {
    const testkit::Bytes before = testkit::lay_out(layout(is_full)).bytes;
    file.put(before);
    OpenedValues shown(file, change.key);
    shown.attach();
    if (change.make(shown.proxy) != Outcome::done)
        qFatal("the change cannot be made");
    return {before, file.bytes()};
}

}  // namespace

class ValuesWriteFailuresTest : public QObject {
    Q_OBJECT

private slots:
    void init() { QTest::failOnWarning(QRegularExpression(QStringLiteral("."))); }

    void table_and_file_agree_after_a_change_that_failed_data() {
        QTest::addColumn<int>("number");
        QTest::addColumn<bool>("is_full");
        QTest::addColumn<Fails>("way");
        for (const Fails way : all_ways) {
            const bool is_whole_write = way == Fails::one_write || way == Fails::writes_from_there_on;
            for (int i = 0; i < static_cast<int>(changes().size()); i++) {
                const bool is_of_data = changes()[static_cast<size_t>(i)].key == Types;
                // The other ways differ where a list of values grows or moves.
                if (is_of_data && !is_whole_write)
                    continue;
                for (const bool is_full : {false, true}) {
                    if (is_full && (is_of_data || !is_whole_write))
                        continue;
                    QTest::addRow("%s, %s fails%s", qPrintable(changes()[static_cast<size_t>(i)].name),
                                  qPrintable(text_of(way)), is_full ? ", no cell free" : "")
                        << i << is_full << way;
                }
            }
        }
    }

    void table_and_file_agree_after_a_change_that_failed() {
        QFETCH(const int, number);
        QFETCH(const bool, is_full);
        QFETCH(const Fails, way);
        const Change& change = changes()[static_cast<size_t>(number)];
        HiveOnDisk file(testkit::Bytes{});
        HiveOnDisk other_file(testkit::Bytes{});
        const WholeChange whole = undisturbed(change, file, is_full);
        Tally tally;
        bool has_failed = true;
        for (int nth = 1; has_failed; nth += testkit::is_sanitized ? 3 : 1) {
            const int one = nth % 2 == 0 ? 0 : -1;
            for (const int current : change.new_name.isEmpty() ? std::vector{one} : std::vector{0, 1, -1}) {
                const QString wrong =
                    try_change({change, whole, current, way, file, other_file}, nth, has_failed, tally);
                QVERIFY2(wrong.isEmpty(), qPrintable(QStringLiteral("number %1: %2").arg(nth).arg(wrong)));
            }
        }
        QVERIFY(tally.done > 0);
        if (way == Fails::one_request || way == Fails::requests_from_there_on)
            return;  // the change may need none
        QVERIFY(tally.refused > 0);
        QVERIFY(tally.done_again > 0);
    }

    // Of the write that counts the new value half arrives, and no other then: the value is there though it was refused.
    // The table has it in its last row from then on.
    void a_rename_after_a_new_value_that_was_refused_and_stayed() {
        const auto add_text = [](ValuesProxyModel& model, int) { return model.add_value(REG_SZ); };
        const Change addition = {QStringLiteral("a new text"), Full, QString(), add_text, true};
        const QStringList wanted = {default_name, QStringLiteral("zeta"), QStringLiteral("delta"),
                                    QStringLiteral("gamma"), QStringLiteral("New Value #1")};
        HiveOnDisk file(testkit::Bytes{});
        const WholeChange whole = undisturbed(addition, file, false);
        int stayed = 0;
        bool has_failed = true;
        for (int nth = 1; has_failed; nth++) {
            file.put(whole.bytes);
            Shown shown(file, Full);
            const int rows = shown.source.rowCount();
            Outcome outcome = Outcome::refused;
            {
                const testkit::WriteFaults faults(nth, true, ENOSPC, true);
                outcome = addition.make(shown.proxy);
                has_failed = faults.failed();
            }
            if (outcome != Outcome::refused || shown.source.rowCount() == rows)
                continue;
            stayed++;
            const QModelIndex renamed = shown.proxy.index(1, ValuesModel::NameColumn);
            QVERIFY(shown.proxy.setData(renamed, QStringLiteral("zeta"), Qt::EditRole));
            QCOMPARE(shown.names(), wanted);
        }
        QVERIFY(stayed > 0);
    }

    // A stop after each write: the value is there under the old name, then under both, then under the new one.
    void a_renamed_value_is_made_before_the_old_one_goes() {
        const Change& rename = changes()[0];
        HiveOnDisk file(testkit::Bytes{});
        const WholeChange whole = undisturbed(rename, file, false);
        QStringList states;
        bool has_failed = true;
        for (int nth = 1; has_failed; nth++) {
            file.put(whole.bytes);
            OpenedValues shown(file, rename.key);
            shown.attach();
            {
                const Failing failing(Fails::writes_from_there_on, nth);
                rename.make(shown.proxy);
                has_failed = failing.failed();
            }
            QStringList names;
            for (const char* name : {"alpha", "delta"}) {
                if (file.stored("Bare", name).size() > 1)
                    names.append(QString::fromLatin1(name));
            }
            const QString state = names.join(QLatin1Char('+'));
            if (states.isEmpty() || states.last() != state)
                states.append(state);
        }
        QCOMPARE(states,
                 QStringList({QStringLiteral("alpha"), QStringLiteral("alpha+delta"), QStringLiteral("delta")}));
    }
};

QTEST_MAIN(ValuesWriteFailuresTest)
#include "values_write_failures_test.moc"
