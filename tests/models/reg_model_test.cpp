// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "hive_on_disk.h"

#include "reg_key.h"
#include "reg_model.h"
#include "searched.h"

#include <QAbstractItemModelTester>
#include <QSignalSpy>
#include <QTest>

namespace {

testkit::HiveLayout layout() {
    testkit::HiveLayout hive;
    testkit::KeyLayout& control = hive.root.add("Control");
    testkit::KeyLayout& branch = control.add("branch");
    testkit::KeyLayout& deep = branch.add("deep");
    deep.add("deeper").add("deepest");
    branch.add("other").set("v", 4, testkit::pattern(4));
    control.add("leaf");
    control.add("zz");
    control.add("rooted").per_leaf = 1;
    control.children.back().add("x");
    hive.root.add("Services");
    return hive;
}

struct Mounted {
    HiveOnDisk file{layout()};
    RegModel model;

    Mounted() { model.add_hive(QStringLiteral("MACHINE/SYSTEM"), file.path()); }

    QModelIndex at(const QString& path) { return key_below(model, QModelIndex(), path); }
    QStringList names(const QModelIndex& parent) {
        QStringList all;
        for (int row = 0; row < model.rowCount(parent); row++)
            all.append(model.index(row, 0, parent).data().toString());
        return all;
    }
};

const QString control = QStringLiteral("MACHINE/SYSTEM/Control");

}  // namespace

class RegModelTest : public QObject {
    Q_OBJECT

private slots:
    void the_model_is_one_that_views_can_rely_on() {
        Mounted mounted;
        const QAbstractItemModelTester tester(&mounted.model, QAbstractItemModelTester::FailureReportingMode::QtTest);
        mounted.at(control + QStringLiteral("/branch/deep/deeper"));
        const QModelIndex zz = mounted.at(control + QStringLiteral("/zz"));
        QVERIFY(mounted.model.setData(zz, QStringLiteral("zzz"), Qt::EditRole));
        QVERIFY(mounted.model.removeRows(zz.row(), 1, zz.parent()));
        // No new key here: only the hive knows the row that it gets, so the model announces a row that is there
        // already, which the tester objects to.
    }

    void two_groups_with_two_hives_each() {
        const HiveOnDisk files[4] = {HiveOnDisk(layout()), HiveOnDisk(layout()), HiveOnDisk(layout()),
                                     HiveOnDisk(layout())};
        RegModel model;
        model.add_hive(QStringLiteral("ONE/A"), files[0].path());
        model.add_hive(QStringLiteral("TWO/B"), files[1].path());
        model.add_hive(QStringLiteral("ONE/C/ignored"), files[2].path());
        model.add_hive(QStringLiteral("//TWO//D"), files[3].path());
        QCOMPARE(model.rowCount(), 2);
        const QModelIndex two = model.index(1, 0);
        QCOMPARE(two.data().toString(), QStringLiteral("TWO"));
        QCOMPARE(model.rowCount(two), 2);
        const QModelIndex d = model.index(1, 0, two);
        QCOMPARE(d.data().toString(), QStringLiteral("D"));
        // A group's row is its place among the groups, also as its hives' parent.
        QCOMPARE(d.parent(), two);
        QCOMPARE(d.parent().row(), 1);
        QCOMPARE(model.index(0, 0, d).data().toString(), QStringLiteral("Control"));
        QCOMPARE(model.index(0, 0, d).parent(), d);
    }

    void a_mount_name_needs_two_parts() {
        RegModel model;
        QVERIFY(!RegModel::is_mount_name(QStringLiteral("SYSTEM")));
        QVERIFY(!RegModel::is_mount_name(QStringLiteral("/SYSTEM/")));
        QVERIFY(RegModel::is_mount_name(QStringLiteral("A/B")));
        QVERIFY_THROWS_EXCEPTION(std::out_of_range, model.add_hive(QStringLiteral("SYSTEM"), QString()));
        QCOMPARE(model.rowCount(), 0);
    }

    void a_hive_root_shows_its_mount_name() {
        Mounted mounted;
        const QModelIndex root = mounted.at(QStringLiteral("MACHINE/SYSTEM"));
        QVERIFY(root.isValid());
        QCOMPARE(static_cast<AbstractRegKey*>(root.internalPointer())->name(), QString());
        QCOMPARE(mounted.model.data(root, Qt::EditRole).toString(), QStringLiteral("SYSTEM"));
        QVERIFY(!mounted.model.data(root, Qt::ToolTipRole).isValid());
        QVERIFY(!mounted.model.data(QModelIndex(), Qt::DisplayRole).isValid());
        QCOMPARE(mounted.model.columnCount(), 1);
    }

    void keys_are_editable_from_depth_four_on() {
        Mounted mounted;
        const Qt::ItemFlags fixed = Qt::ItemIsSelectable | Qt::ItemIsEnabled;
        QCOMPARE(mounted.model.flags(QModelIndex()), Qt::ItemFlags());
        QCOMPARE(mounted.model.flags(mounted.at(QStringLiteral("MACHINE"))), fixed);
        QCOMPARE(mounted.model.flags(mounted.at(QStringLiteral("MACHINE/SYSTEM"))), fixed);
        QCOMPARE(mounted.model.flags(mounted.at(control)), fixed);
        QCOMPARE(mounted.model.flags(mounted.at(control + QStringLiteral("/leaf"))), fixed | Qt::ItemIsEditable);
        QVERIFY(RegModel::editable_key(mounted.at(QStringLiteral("MACHINE/SYSTEM"))) == nullptr);
        QVERIFY(RegModel::editable_key(mounted.at(control)) != nullptr);
    }

    void groups_roots_and_the_keys_below_roots_are_fixed() {
        Mounted mounted;
        const testkit::Bytes before = mounted.file.bytes();
        RegModel& model = mounted.model;
        for (const QString& path : {QStringLiteral("MACHINE"), QStringLiteral("MACHINE/SYSTEM"), QString(control)}) {
            const QModelIndex index = mounted.at(path);
            QVERIFY(!model.setData(index, QStringLiteral("new"), Qt::EditRole));
            QVERIFY(!model.removeRows(index.row(), 1, index.parent()));
        }
        QCOMPARE(model.new_key(QModelIndex()), -1);
        QCOMPARE(model.new_key(mounted.at(QStringLiteral("MACHINE"))), -2);
        QCOMPARE(model.new_key(mounted.at(QStringLiteral("MACHINE/SYSTEM"))), -2);
        QVERIFY(mounted.file.bytes() == before);
    }

    void a_new_key_is_announced_at_its_row() {
        Mounted mounted;
        const QModelIndex parent = mounted.at(control);
        QSignalSpy about(&mounted.model, &QAbstractItemModel::rowsAboutToBeInserted);
        QSignalSpy inserted(&mounted.model, &QAbstractItemModel::rowsInserted);
        const int row = mounted.model.new_key(parent);
        QCOMPARE(row, 2);
        QCOMPARE(about.count(), 1);
        QCOMPARE(inserted.count(), 1);
        QCOMPARE(inserted[0][0].toModelIndex(), parent);
        QCOMPARE(inserted[0][1].toInt(), row);
        QCOMPARE(inserted[0][2].toInt(), row);
        QCOMPARE(mounted.names(parent)[row], QStringLiteral("New Key #1"));
    }

    void a_rename_that_moves_keeps_persistent_indexes_on_their_keys() {
        Mounted mounted;
        const QModelIndex leaf = mounted.at(control + QStringLiteral("/leaf"));
        const QPersistentModelIndex renamed(leaf);
        const QPersistentModelIndex zz(mounted.at(control + QStringLiteral("/zz")));
        QSignalSpy layout_changed(&mounted.model, &QAbstractItemModel::layoutChanged);
        QSignalSpy data_changed(&mounted.model, &QAbstractItemModel::dataChanged);
        QVERIFY(mounted.model.setData(leaf, QStringLiteral("zzz"), Qt::EditRole));
        QCOMPARE(layout_changed.count(), 1);
        QCOMPARE(data_changed.count(), 0);
        QCOMPARE(renamed.data().toString(), QStringLiteral("zzz"));
        QCOMPARE(renamed.row(), 3);
        QCOMPARE(zz.data().toString(), QStringLiteral("zz"));
        QCOMPARE(zz.row(), 2);
    }

    void a_rename_in_place_changes_data_alone() {
        Mounted mounted;
        const QModelIndex leaf = mounted.at(control + QStringLiteral("/leaf"));
        QSignalSpy layout_changed(&mounted.model, &QAbstractItemModel::layoutChanged);
        QSignalSpy data_changed(&mounted.model, &QAbstractItemModel::dataChanged);
        QVERIFY(mounted.model.setData(leaf, QStringLiteral("leaf2"), Qt::EditRole));
        QCOMPARE(layout_changed.count(), 0);
        QCOMPARE(data_changed.count(), 1);
        QCOMPARE(data_changed[0][0].toModelIndex(), leaf);
        QCOMPARE(data_changed[0][1].toModelIndex(), leaf);
        QVERIFY(!mounted.model.setData(leaf, QStringLiteral("ZZ"), Qt::EditRole));
        QCOMPARE(leaf.data().toString(), QStringLiteral("leaf2"));
    }

    void a_subtree_is_deleted_leaves_first() {
        Mounted mounted;
        const QModelIndex branch = mounted.at(control + QStringLiteral("/branch"));
        mounted.at(control + QStringLiteral("/branch/deep/deeper/deepest"));
        QStringList order;
        connect(&mounted.model, &QAbstractItemModel::rowsRemoved, this,
                [&](const QModelIndex& parent) { order.append(parent.data().toString()); });
        QVERIFY(mounted.model.removeRows(branch.row(), 1, branch.parent()));
        QCOMPARE(order, QStringList({QStringLiteral("branch"), QStringLiteral("deeper"), QStringLiteral("deep"),
                                     QStringLiteral("branch"), QStringLiteral("Control")}));
        QVERIFY(!mounted.names(mounted.at(control)).contains(QStringLiteral("branch")));
        QVERIFY(mounted.file.read().find("Control\\branch") == nullptr);
        QCOMPARE(mounted.file.faults(), std::string());
    }

    void a_subtree_that_cannot_go_whole_stays_whole() {
        Mounted mounted;
        const testkit::Bytes before = mounted.file.bytes();
        const QModelIndex rooted = mounted.at(control + QStringLiteral("/rooted"));
        QSignalSpy removed(&mounted.model, &QAbstractItemModel::rowsAboutToBeRemoved);
        QVERIFY(!mounted.model.removeRows(rooted.row(), 1, rooted.parent()));
        QVERIFY(!mounted.model.removeRows(0, 2, mounted.at(control)));
        QVERIFY(!mounted.model.removeRows(99, 1, mounted.at(control)));
        QCOMPARE(removed.count(), 0);
        QVERIFY(mounted.file.bytes() == before);
        QVERIFY(mounted.names(mounted.at(control)).contains(QStringLiteral("rooted")));
    }

    void an_index_whose_row_is_another_key_s_by_now_changes_nothing() {
        Mounted mounted;
        const QModelIndex leaf = mounted.at(control + QStringLiteral("/leaf"));
        const QModelIndex branch = mounted.at(control + QStringLiteral("/branch"));
        const QModelIndex deep = mounted.at(control + QStringLiteral("/branch/deep"));
        const QPersistentModelIndex followed_leaf(leaf);
        const QPersistentModelIndex followed_branch(branch);
        QVERIFY(mounted.model.setData(branch, QStringLiteral("yy"), Qt::EditRole));
        const testkit::Bytes before = mounted.file.bytes();
        QVERIFY(!mounted.model.setData(leaf, QStringLiteral("new"), Qt::EditRole));
        QVERIFY(!mounted.model.setData(branch, QStringLiteral("new"), Qt::EditRole));
        QVERIFY(!mounted.model.removeRows(deep.row(), 1, branch));
        QVERIFY(mounted.file.bytes() == before);
        // A new key needs no row: it is made in the key that is meant, and announced where that key is now.
        QSignalSpy inserted(&mounted.model, &QAbstractItemModel::rowsInserted);
        QCOMPARE(mounted.model.new_key(branch), 1);
        QCOMPARE(inserted[0][0].toModelIndex(), QModelIndex(followed_branch));
        QVERIFY(mounted.model.removeRows(1, 1, followed_branch));
        // What the model moves goes on working.
        QVERIFY(mounted.model.setData(followed_leaf, QStringLiteral("leaf 2"), Qt::EditRole));
        QVERIFY(mounted.model.setData(followed_branch, QStringLiteral("a"), Qt::EditRole));
        QCOMPARE(followed_branch.row(), 0);
        QVERIFY(mounted.model.removeRows(deep.row(), 1, followed_branch));
        QCOMPARE(mounted.names(followed_branch), QStringList{QStringLiteral("other")});
        QCOMPARE(mounted.names(mounted.at(control)), QStringList({QStringLiteral("a"), QStringLiteral("leaf 2"),
                                                                  QStringLiteral("rooted"), QStringLiteral("zz")}));
    }

    void a_child_that_cannot_be_opened_hides_no_sibling() {
        testkit::LaidHive laid = testkit::lay_out(layout());
        laid.put16(laid.at("Control\\leaf").record, 0, 0x7878);
        const HiveOnDisk file(laid.bytes);
        RegModel model;
        model.add_hive(QStringLiteral("MACHINE/SYSTEM"), file.path());
        const QModelIndex parent = model.index(0, 0, model.index(0, 0, model.index(0, 0)));
        QCOMPARE(model.rowCount(parent), 4);
        QCOMPARE(model.index(0, 0, parent).data().toString(), QStringLiteral("branch"));
        QCOMPARE(model.index(3, 0, parent).data().toString(), QStringLiteral("zz"));
        const QModelIndex damaged = model.index(1, 0, parent);
        QVERIFY(damaged.isValid());
        QCOMPARE(model.rowCount(damaged), 0);
        QVERIFY_THROWS_EXCEPTION(std::runtime_error, model.data(damaged, Qt::DisplayRole));
        // A screen reader is told what is seen, without an exception.
        QCOMPARE(damaged.data(Qt::AccessibleTextRole).toString(), QStringLiteral("(cannot be read)"));
        QCOMPARE(model.index(3, 0, parent).data(Qt::AccessibleTextRole).toString(), QStringLiteral("zz"));
    }
};

QTEST_MAIN(RegModelTest)
#include "reg_model_test.moc"
