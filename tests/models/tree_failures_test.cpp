// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Changes of keys through the tree that fail at every point where the file cannot be written or memory may run out:
// nothing but what the change names reads otherwise, and model and view show what whoever opens the file then is shown,
// and go on as it does.
#include "failing.h"
#include "searched.h"

#include "reg_key.h"

#include <QRegularExpression>
#include <QStyledItemDelegate>
#include <QTest>
#include <QTreeView>

#include <map>
#include <stdexcept>
#include <vector>

namespace {

void fill(testkit::KeyLayout& key) {
    key.set("number", 4, testkit::pattern(4));
    key.set("text", 1, testkit::text_data("some text in a cell of its own"));
}

testkit::HiveLayout layout(bool is_full) {
    testkit::HiveLayout hive;
    hive.no_free_space = is_full;
    testkit::KeyLayout& parent = hive.root.add("Parent");
    fill(parent);
    for (const char* name : {"alpha", "middle", "zulu"})
        fill(parent.add(name));
    testkit::KeyLayout& branch = parent.add("branch");
    fill(branch);
    testkit::KeyLayout& one = branch.add("one");
    fill(one);
    fill(one.add("deep 1"));
    one.add("deep 2");
    fill(branch.add("two"));
    testkit::KeyLayout& rooted = hive.root.add("Rooted");
    rooted.per_leaf = 3;
    for (const char* name : {"a1", "a2", "a3", "m1", "m2", "m3", "z1"})
        fill(rooted.add(name));
    fill(hive.root.add("Services").add("other"));
    return hive;
}

struct Change {
    const char* name;
    const char* key;                // that is renamed or removed, or given a subkey
    const char* new_name;           // null: it is removed; empty: it gets a subkey
    bool is_one_call = true;        // of the engine
    bool is_in_two_leaves = false;  // of an index root

    Outcome make(RegModel& model) const {
        const QModelIndex index =
            key_below(model, QModelIndex(), QStringLiteral("TOP/HIVE/") + QString::fromLatin1(key));
        if (!index.isValid())
            return Outcome::absent;
        bool done = false;
        try {
            if (new_name == nullptr)
                done = model.removeRows(index.row(), 1, index.parent());
            else if (*new_name == '\0')
                done = model.new_key(index) >= 0;
            else
                done = model.setData(index, QString::fromLatin1(new_name), Qt::EditRole);
        } catch (const std::exception&) {
            return Outcome::thrown;
        }
        return done ? Outcome::done : Outcome::refused;
    }
};

const Change removal_of_a_tree = {"a tree is removed", "Parent/branch", nullptr, false};

const Change changes[] = {
    removal_of_a_tree,
    {"a key is removed", "Parent/middle", nullptr},
    {"a new key", "Parent", ""},
    {"a first subkey", "Parent/alpha", ""},
    {"a new key below an index root", "Rooted", ""},
    {"a rename that moves", "Parent/alpha", "november"},
    {"a rename that moves a tree", "Parent/branch", "zz"},
    {"a rename in place", "Parent/zulu", "zulu and more"},
    {"a rename in a tree", "Parent/branch/two", "a"},
    {"a rename into another leaf", "Rooted/a2", "m15", true, true},
    {"a rename out of a leaf of one", "Rooted/z1", "a15", true, true},
};

// The model's keys in the tree's order, each with its values.
void list_keys(const RegModel& model, const QModelIndex& parent, const QString& path, QStringList& all) {
    for (int row = 0; row < model.rowCount(parent); row++) {
        const QModelIndex index = model.index(row, 0, parent);
        const QString below = path + QLatin1Char('/') + index.data(Qt::AccessibleTextRole).toString();
        all.append(below);
        if (RegKey* const key = RegModel::editable_key(index)) {
            try {
                for (int i = 0; i < key->value_count(); i++)
                    all.append(below + QStringLiteral(" : ") + key->value_name(i).value_or(QStringLiteral("?")));
            } catch (const std::runtime_error& failure) {
                all.append(below + QStringLiteral(" : ") + QString::fromLatin1(failure.what()));
            }
        }
        list_keys(model, index, below, all);
    }
}

QStringList keys_of(const RegModel& model) {
    QStringList all;
    list_keys(model, QModelIndex(), QString(), all);
    return all;
}

// The rows that a view has to show, in its order.
void list_rows(const QTreeView& view, const QModelIndex& parent, QModelIndexList& all) {
    for (int row = 0; row < view.model()->rowCount(parent); row++) {
        const QModelIndex index = view.model()->index(row, 0, parent);
        all.append(index);
        if (view.isExpanded(index))
            list_rows(view, index, all);
    }
}

// A model of a file that outlives it.
struct Opened {
    HiveOnDisk& file;
    RegModel model;

    Opened(HiveOnDisk& at, const testkit::Bytes& bytes) : file(at) {
        file.put(bytes);
        model.add_hive(QStringLiteral("TOP/HIVE"), file.path());
    }
};

// Asks for no names: as in the program, a key that cannot be read is no failure of the view.
class RowDelegate : public QStyledItemDelegate {
public:
    QSize sizeHint(const QStyleOptionViewItem&, const QModelIndex&) const override { return {100, 20}; }
};

// How many rows each key has by what the model has told since all were listed. A view asks again and would not notice.
class RowsTold {
public:
    explicit RowsTold(const RegModel& model) : model_(model) {
        count(QModelIndex());
        QObject::connect(&model, &QAbstractItemModel::rowsInserted, &model,
                         [this](const QModelIndex& parent, int first, int last) {
                             rows_[parent.internalPointer()] += last - first + 1;
                         });
        QObject::connect(&model, &QAbstractItemModel::rowsRemoved, &model,
                         [this](const QModelIndex& parent, int first, int last) {
                             rows_[parent.internalPointer()] -= last - first + 1;
                         });
    }

    bool agree(const QModelIndex& parent = QModelIndex()) const {
        const auto told = rows_.find(parent.internalPointer());
        const int rows = model_.rowCount(parent);
        bool agrees = rows == (told != rows_.end() ? told->second : 0);
        for (int row = 0; row < rows && agrees; row++)
            agrees = agree(model_.index(row, 0, parent));
        return agrees;
    }

private:
    void count(const QModelIndex& parent) {
        const int rows = model_.rowCount(parent);
        rows_[parent.internalPointer()] = rows;
        for (int row = 0; row < rows; row++)
            count(model_.index(row, 0, parent));
    }

    const RegModel& model_;
    std::map<const void*, int> rows_;
};

struct Shown {
    Opened hive;
    RowsTold rows_told{hive.model};
    RowDelegate delegate;
    QTreeView view;

    Shown(HiveOnDisk& file, const testkit::Bytes& bytes, const QString& current) : hive(file, bytes) {
        view.setItemDelegate(&delegate);
        view.setModel(&hive.model);
        view.expandAll();
        view.setCurrentIndex(key_below(hive.model, hive.model.index(0, 0, hive.model.index(0, 0)), current));
        hive.model.begin_find(hive.model.index(0, 0));  // a search that waits at the first key has to follow
    }

    RegModel& model() { return hive.model; }

    // What the view has that the model has not, or the other way round.
    QString wrong_view(const QString& current, const QString& removed) const {
        if (!rows_told.agree())
            return QStringLiteral("rows were told of that are not there, or not of ones that are");
        QModelIndexList rows;
        list_rows(view, QModelIndex(), rows);
        QModelIndex shown = hive.model.index(0, 0);
        for (const QModelIndex& row : rows) {
            if (shown != row)
                return QStringLiteral("the view's row ") + path_of(shown) + QStringLiteral(" should be ") +
                       path_of(row);
            shown = view.indexBelow(shown);
        }
        if (shown.isValid())
            return QStringLiteral("the view has more rows");
        // The toolkit looks for another current row only among the siblings of the one that goes.
        const bool went_along = !removed.isEmpty() && current.startsWith(removed + QLatin1Char('/'));
        if (!rows.contains(view.currentIndex()) && !(went_along && !view.currentIndex().isValid()))
            return QStringLiteral("the current row");
        return QString();
    }
};

WholeChange undisturbed(const Change& change, HiveOnDisk& file, bool is_full) {
    const testkit::Bytes before = testkit::lay_out(layout(is_full)).bytes;
    Opened opened(file, before);
    if (change.make(opened.model) != Outcome::done)
        qFatal("the change cannot be made");
    return {before, file.bytes()};
}

// What is shown and not so.
QString difference(const QStringList& shown, const QStringList& wanted, bool may_be_unread) {
    if (shown == wanted)
        return QString();
    if (!may_be_unread) {
        for (qsizetype i = 0; i < std::min(shown.size(), wanted.size()); i++) {
            if (shown[i] != wanted[i])
                return shown[i] + QStringLiteral(" should be ") + wanted[i];
        }
        return QStringLiteral("%1 places should be %2").arg(shown.size()).arg(wanted.size());
    }
    for (const QString& place : shown) {
        if (!wanted.contains(place) && !place.contains(QStringLiteral("(cannot be read)")))
            return place;
    }
    return QString();
}

struct Attempt {
    const Change& change;
    const WholeChange& whole;
    QString current;
    Fails way;
    HiveOnDisk& file;
    HiveOnDisk& other_file;  // for whoever opens it then

    // Whether a key may be shown as one that cannot be read, or not at all: where memory stays out, and where a key
    // is left in two leaves.
    bool may_be_unread() const {
        return way == Fails::requests_from_there_on || (way == Fails::writes_from_there_on && change.is_in_two_leaves);
    }
    QString removed() const { return change.new_name == nullptr ? QString::fromLatin1(change.key) : QString(); }
};

// The same change once more: it goes as it goes for whoever opens the file.
QString try_again(const Attempt& attempt, Shown& shown, Opened& fresh, Tally& tally) {
    const testkit::Bytes before = shown.hive.file.bytes();
    const Outcome outcome = attempt.change.make(shown.model());
    const bool is_refused = outcome == Outcome::refused || (outcome == Outcome::absent && attempt.may_be_unread());
    (is_refused ? tally.refused_again : tally.done_again)++;
    if (is_refused && attempt.may_be_unread())
        return testkit::diff(before, shown.hive.file.bytes()).empty() ? QString()
                                                                      : QStringLiteral("is refused, and made");
    if (outcome == Outcome::thrown || outcome != attempt.change.make(fresh.model))
        return QStringLiteral("goes otherwise again, %1").arg(static_cast<int>(outcome));
    for (const std::string& line : testkit::diff(fresh.file.bytes(), shown.hive.file.bytes()))
        return QStringLiteral("is made otherwise again: ") + QString::fromStdString(line);
    const QString other = difference(keys_of(shown.model()), keys_of(fresh.model), attempt.may_be_unread());
    return other.isEmpty() ? shown.wrong_view(attempt.current, attempt.removed())
                           : QStringLiteral("after the next change ") + other;
}

// What the outcome does not say of the file; empty when all is well.
QString wrong_outcome(const Attempt& attempt, Outcome outcome, bool has_failed, const testkit::Hive& now,
                      Tally& tally) {
    const QString wrong = tally.count(attempt.whole, outcome, has_failed, now);
    if (!wrong.isEmpty())
        return wrong;
    const bool is_before = testkit::diff(attempt.whole.before, now).empty();
    const bool is_after = testkit::diff(attempt.whole.after, now).empty();
    const bool is_taken_back =
        attempt.way != Fails::writes_from_there_on && attempt.way != Fails::requests_from_there_on;
    if (is_taken_back && attempt.change.is_one_call && !is_before && !is_after)
        return QStringLiteral("is half done");
    if (is_taken_back && attempt.change.is_one_call && outcome == Outcome::refused && !is_before)
        return QStringLiteral("is said to be refused");
    return QString();
}

// What is wrong after the change failed at its nth step; has_failed tells whether it did.
QString try_change(const Attempt& attempt, int nth, bool& has_failed, Tally& tally) {
    Shown shown(attempt.file, attempt.whole.bytes, attempt.current);
    Outcome outcome = Outcome::refused;
    {
        const Failing failing(attempt.way, nth);
        outcome = attempt.change.make(shown.model());
        has_failed = failing.failed();
    }
    const testkit::Bytes bytes = shown.hive.file.bytes();
    const testkit::Hive now = testkit::read_hive(bytes);
    QString wrong = wrong_outcome(attempt, outcome, has_failed, now, tally);
    const bool may_miscount = attempt.way == Fails::writes_from_there_on || attempt.change.is_in_two_leaves;
    if (wrong.isEmpty())
        wrong = attempt.whole.harm(now, may_miscount);
    if (!wrong.isEmpty())
        return wrong;
    Opened fresh(attempt.other_file, bytes);
    wrong = difference(keys_of(shown.model()), keys_of(fresh.model), attempt.may_be_unread());
    if (wrong.isEmpty())
        wrong = shown.wrong_view(attempt.current, attempt.removed());
    return wrong.isEmpty() && outcome != Outcome::done ? try_again(attempt, shown, fresh, tally) : wrong;
}

}  // namespace

class TreeFailuresTest : public QObject {
    Q_OBJECT

private slots:
    void init() { QTest::failOnWarning(QRegularExpression(QStringLiteral("."))); }

    void tree_and_file_agree_after_a_change_that_failed_data() {
        QTest::addColumn<int>("number");
        QTest::addColumn<bool>("is_full");
        QTest::addColumn<Fails>("way");
        for (const Fails way : all_ways) {
            const bool is_whole_write = way == Fails::one_write || way == Fails::writes_from_there_on;
            for (int i = 0; i < static_cast<int>(std::size(changes)); i++) {
                const bool needs_cells = changes[i].new_name != nullptr;
                for (const bool is_full : {false, true}) {
                    if (is_full && (!needs_cells || !is_whole_write))
                        continue;
                    QTest::addRow("%s, %s fails%s", changes[i].name, qPrintable(text_of(way)),
                                  is_full ? ", no cell free" : "")
                        << i << is_full << way;
                }
            }
        }
    }

    void tree_and_file_agree_after_a_change_that_failed() {
        QFETCH(const int, number);
        QFETCH(const bool, is_full);
        QFETCH(const Fails, way);
        const Change& change = changes[number];
        HiveOnDisk file(testkit::Bytes{});
        HiveOnDisk other_file(testkit::Bytes{});
        const WholeChange whole = undisturbed(change, file, is_full);
        // The key itself, one behind it, and one that goes with it.
        QStringList currents = {QString::fromLatin1(change.key)};
        if (&change == &changes[0])
            currents += {QStringLiteral("Parent/middle"), QStringLiteral("Parent/branch/one/deep 2")};
        Tally tally;
        for (const QString& current : currents) {
            bool has_failed = true;
            for (int nth = 1; has_failed; nth++) {
                const QString wrong =
                    try_change({change, whole, current, way, file, other_file}, nth, has_failed, tally);
                QVERIFY2(wrong.isEmpty(),
                         qPrintable(QStringLiteral("number %1, at %2: %3").arg(nth).arg(current, wrong)));
            }
        }
        QVERIFY(tally.done > 0);
        QVERIFY(tally.refused > 0);
        QVERIFY(tally.done_again > 0);
        QCOMPARE(tally.half_done > 0,
                 !change.is_one_call || (change.is_in_two_leaves && way == Fails::writes_from_there_on));
        if (!change.is_one_call && way == Fails::one_request)
            QVERIFY(tally.thrown > 0);
    }

    // A stop after each write: each key below goes before the one above it, the last of its siblings first.
    void a_tree_is_removed_from_below() {
        HiveOnDisk file(testkit::Bytes{});
        const WholeChange whole = undisturbed(removal_of_a_tree, file, false);
        std::vector<std::string> gone;
        bool has_failed = true;
        for (int nth = 1; has_failed; nth++) {
            Opened opened(file, whole.bytes);
            {
                const Failing failing(Fails::writes_from_there_on, nth);
                removal_of_a_tree.make(opened.model);
                has_failed = failing.failed();
            }
            const testkit::Hive now = file.read();
            size_t missing = 0;
            for (const testkit::FlatKey& flat : testkit::flatten(whole.before)) {
                if (now.find(flat.path) != nullptr)
                    continue;
                missing++;
                const std::string path = testkit::utf8(flat.path);
                if (std::find(gone.begin(), gone.end(), path) == gone.end())
                    gone.push_back(path);
            }
            QCOMPARE(missing, gone.size());
        }
        const std::vector<std::string> in_order = {"Parent\\branch\\two", "Parent\\branch\\one\\deep 2",
                                                   "Parent\\branch\\one\\deep 1", "Parent\\branch\\one",
                                                   "Parent\\branch"};
        QCOMPARE(gone, in_order);
    }

    // A search waits in the branch when its removal stops halfway: what is left of the branch is still searched.
    void a_search_goes_on_with_what_a_failed_removal_leaves() {
        const QStringList order = {QStringLiteral("branch/one"),
                                   QStringLiteral("branch/one/deep 1"),
                                   QStringLiteral("branch/one/deep 2"),
                                   QStringLiteral("branch/two"),
                                   QStringLiteral("middle"),
                                   QStringLiteral("zulu")};
        const testkit::Bytes bytes = testkit::lay_out(layout(false)).bytes;
        const QString parent = QStringLiteral("Parent/");
        int left = 0;
        for (const Fails way : {Fails::one_write, Fails::writes_from_there_on, Fails::one_request}) {
            for (qsizetype visited = 0; visited < 4; visited++) {
                bool has_failed = true;
                for (int nth = 1; has_failed; nth++) {
                    Searched searched(bytes);
                    searched.model.begin_find(searched.at(parent + QStringLiteral("branch")));
                    for (qsizetype i = 0; i <= visited; i++)
                        searched.model.find(QString(), RegModel::FindKeys, Qt::MatchContains);
                    {
                        const Failing failing(way, nth);
                        removal_of_a_tree.make(searched.model);
                        has_failed = failing.failed();
                    }
                    QStringList wanted;
                    for (const QString& key : order.mid(visited)) {
                        if (searched.at(parent + key).isValid())
                            wanted.append(QStringLiteral("TOP/HIVE/") + parent + key);
                    }
                    left += wanted.size() > 2 ? 1 : 0;
                    QCOMPARE(searched.rest(QString(), RegModel::FindKeys), wanted);
                }
            }
        }
        QVERIFY(left > 0);
    }
};

QTEST_MAIN(TreeFailuresTest)
#include "tree_failures_test.moc"
