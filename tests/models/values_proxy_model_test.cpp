// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "hive_on_disk.h"

#include "reg_hive.h"
#include "reg_key.h"
#include "values_model.h"
#include "values_proxy_model.h"

#include <QAbstractItemModelTester>
#include <QHeaderView>
#include <QRegularExpression>
#include <QSignalSpy>
#include <QTableView>
#include <QTest>

namespace {

testkit::HiveLayout layout() {
    testkit::HiveLayout hive;
    testkit::KeyLayout& bare = hive.root.add("Bare");
    for (const char* name : {"gamma", "Beta", "alpha"})
        bare.set(name, 4, testkit::pattern(4));
    hive.root.add("Empty");
    testkit::KeyLayout& full = hive.root.add("Full");
    full.set("b", 4, testkit::pattern(4));
    full.set("", 1, testkit::text_data("set"));
    full.set("(Default)", 4, testkit::pattern(4));
    full.set("A", 4, testkit::pattern(4));
    return hive;
}

struct Shown {
    HiveOnDisk file;
    DummyRegKey top{QStringLiteral("TOP")};
    RegHive hive{QStringLiteral("HIVE"), file.path(), &top};
    std::unique_ptr<ValuesModel> source;
    ValuesProxyModel proxy;
    QTableView view;

    explicit Shown(int key, const testkit::HiveLayout& shown = layout())
        : file(shown), source(new ValuesModel(static_cast<RegKey*>(hive.root_key()->child(key)))) {
        proxy.setSourceModel(source.get());
        proxy.sort(0, Qt::AscendingOrder);
        // As the window has it.
        view.setSelectionBehavior(QAbstractItemView::SelectItems);
        view.setSelectionMode(QAbstractItemView::SingleSelection);
        view.setModel(&proxy);
    }
    ~Shown() { view.setModel(nullptr); }

    // The current row, where it is also the one that is selected.
    int current() const {
        const QModelIndexList selected = view.selectionModel()->selectedIndexes();
        return selected == QModelIndexList{view.currentIndex()} ? view.currentIndex().row() : -1;
    }

    QStringList names() {
        QStringList all;
        for (int row = 0; row < proxy.rowCount(); row++)
            all.append(proxy.index(row, 0).data().toString());
        return all;
    }
};

enum Key { Bare, Empty, Full };

QStringList list(std::initializer_list<const char*> names) {
    QStringList all;
    for (const char* name : names)
        all.append(QLatin1String(name));
    return all;
}

}  // namespace

class ValuesProxyModelTest : public QObject {
    Q_OBJECT

private slots:
    // A damaged value can show what belongs to others, which any change may free.
    void a_row_is_read_again_after_any_change_data() {
        QTest::addColumn<int>("change");
        QTest::newRow("new values") << 0;
        QTest::newRow("a value renamed") << 1;
    }

    void a_row_is_read_again_after_any_change() {
        QFETCH(int, change);
        testkit::HiveLayout hive;
        testkit::KeyLayout& key = hive.root.add("Key");
        key.set("a", 3, testkit::pattern(8));
        key.set("b", 4, testkit::pattern(4));
        testkit::LaidHive laid = testkit::lay_out(hive);
        const auto& places = laid.at("Key");
        // The data of the first is the list of both, or the record of the second.
        constexpr uint32_t data_field = 8;
        laid.put32(places.values.at(0).record, data_field,
                   change == 0 ? places.value_list : places.values.at(1).record);
        const HiveOnDisk file(laid.bytes);
        DummyRegKey top(QStringLiteral("TOP"));
        RegHive opened(QStringLiteral("HIVE"), file.path(), &top);
        ValuesModel model(static_cast<RegKey*>(opened.root_key()->child(0)));
        QVERIFY(model.index(0, ValuesModel::DataColumn).data().isValid());
        if (change == 0) {
            QVERIFY(model.add_value(REG_DWORD));
            QVERIFY(model.add_value(REG_DWORD));
        } else {
            QVERIFY(model.setData(model.index(1, ValuesModel::NameColumn), QStringLiteral("c"), Qt::EditRole));
        }
        QVERIFY(!model.index(0, ValuesModel::DataColumn).data().isValid());
    }

    void a_sort_reads_every_row_again() {
        Shown shown(Full);
        const QModelIndex datum = shown.proxy.index(shown.proxy.rowCount() - 1, ValuesModel::DataColumn);
        QCOMPARE(datum.siblingAtColumn(0).data().toString(), QStringLiteral("b"));
        const QVariant before = datum.data();
        // What else has the key may change it.
        ValuesModel other(shown.source->key());
        QVERIFY(other.setData(other.index(0, ValuesModel::DataColumn), 7U, Qt::DisplayRole));
        QCOMPARE(datum.data(), before);
        shown.proxy.sort(0, Qt::AscendingOrder);
        QCOMPARE(datum.data(), QVariant(7U));
    }

    void the_model_is_one_that_views_can_rely_on() {
        Shown shown(Bare);
        const QAbstractItemModelTester tester(&shown.proxy, QAbstractItemModelTester::FailureReportingMode::QtTest);
        QVERIFY(shown.proxy.setData(shown.proxy.index(1, 0), QStringLiteral("delta"), Qt::EditRole));
        QVERIFY(shown.proxy.removeRows(2, 1));
    }

    void what_is_spoken_of_a_value_is_what_is_shown() {
        testkit::HiveLayout hive;
        testkit::KeyLayout& key = hive.root.add("Key");
        key.set("bytes", 3, {0x01, 0xAB, 0x00});
        key.set("empty", 3, {});
        key.set("list", 7, testkit::text_data(std::string("a\0b\0", 4)));
        key.set("number", 4, {42, 0, 0, 0});
        key.set("text", 1, testkit::text_data("as it is"));
        Shown shown(0, hive);
        ValuesProxyModel& proxy = shown.proxy;
        QStringList spoken;
        for (int row = 0; row < proxy.rowCount(); row++)
            spoken.append(proxy.index(row, 2).data(Qt::AccessibleTextRole).toString());
        QCOMPARE(spoken, QStringList({QStringLiteral("(value not set)"), QStringLiteral("01 ab 00"),
                                      QStringLiteral("(zero-length binary value)"), QStringLiteral("a b"),
                                      QStringLiteral("0x0000002a (42)"), QStringLiteral("as it is")}));
        QCOMPARE(proxy.index(1, 0).data(Qt::AccessibleTextRole).toString(), QStringLiteral("bytes"));
        QCOMPARE(proxy.index(1, 1).data(Qt::AccessibleTextRole).toString(), QStringLiteral("REG_BINARY"));
    }

    // The engine finds such a value by what stands before the zero: here by nothing, the default value's name.
    void the_default_is_made_beside_a_value_whose_name_begins_with_a_zero() {
        for (const bool is_wide : {false, true}) {
            testkit::HiveLayout hive;
            testkit::ValueLayout& hidden = hive.root.add("Key").set("", 4, testkit::pattern(4));
            hidden.name = std::u16string(u"\0run", 4);
            hidden.wide_name = is_wide;
            Shown shown(0, hive);
            ValuesProxyModel& proxy = shown.proxy;
            QVERIFY(proxy.setData(proxy.index(0, 2), QStringLiteral("typed"), Qt::EditRole));
            QCOMPARE(proxy.index(0, 2).data().toString(), QStringLiteral("typed"));
            QCOMPARE(shown.source->rowCount(), 2);
            QCOMPARE(shown.file.stored_type("Key", std::string("\0run", 4)), 4);
            QCOMPARE(shown.file.stored_type("Key", ""), 1);
        }
    }

    // Whichever of the two stands first in the key's list.
    void a_value_named_like_the_unnamed_one_stays_apart_from_it() {
        testkit::HiveLayout hive;
        testkit::KeyLayout& key = hive.root.add("Key");
        key.set("(Default)", 4, testkit::pattern(4));
        key.set("", 1, testkit::text_data("set"));
        key.set("b", 4, testkit::pattern(4));
        Shown shown(0, hive);
        ValuesProxyModel& proxy = shown.proxy;
        QCOMPARE(proxy.index(0, 1).data().toString(), QStringLiteral("REG_SZ"));
        QVERIFY(!proxy.flags(proxy.index(0, 0)).testFlag(Qt::ItemIsEditable));
        QVERIFY(proxy.flags(proxy.index(1, 0)).testFlag(Qt::ItemIsEditable));
        QVERIFY(proxy.setData(proxy.index(1, 0), QStringLiteral("renamed"), Qt::EditRole));
        QCOMPARE(shown.file.stored("Key", ""), QByteArray("s\0e\0t\0\0\0", 8));
        QCOMPARE(shown.file.stored_type("Key", "renamed"), 4);
        QCOMPARE(proxy.rowCount(), 3);
        proxy.sort(0, Qt::AscendingOrder);
        QCOMPARE(proxy.index(0, 1).data().toString(), QStringLiteral("REG_SZ"));
        QCOMPARE(proxy.index(0, 2).data().toString(), QStringLiteral("set"));
    }

    void a_key_without_an_unnamed_value_gets_a_row_for_it() {
        Shown shown(Bare);
        QCOMPARE(shown.proxy.rowCount(), 4);
        QCOMPARE(shown.proxy.columnCount(), 3);
        QCOMPARE(shown.proxy.index(0, 0).data().toString(), QStringLiteral("(Default)"));
        QCOMPARE(shown.proxy.index(0, 1).data().toString(), QStringLiteral("REG_SZ"));
        QCOMPARE(shown.proxy.index(0, 2).data().metaType(), QMetaType::fromType<ValueNotSet>());
        QVERIFY(!shown.proxy.index(0, 0).data(Qt::EditRole).isValid());
        QVERIFY(!shown.proxy.index(4, 0).isValid());
    }

    void names_are_sorted_without_case_and_the_unnamed_value_first() {
        QCOMPARE(Shown(Bare).names(), list({"(Default)", "alpha", "Beta", "gamma"}));
        Shown full(Full);
        QCOMPARE(full.names(), list({"(Default)", "(Default)", "A", "b"}));
        QCOMPARE(full.proxy.rowCount(), 4);
    }

    void every_sort_is_by_name_ascending() {
        Shown shown(Bare);
        QVERIFY(shown.proxy.setData(shown.proxy.index(1, 0), QStringLiteral("zeta"), Qt::EditRole));
        QCOMPARE(shown.names(), list({"(Default)", "zeta", "Beta", "gamma"}));
        shown.proxy.sort(2, Qt::DescendingOrder);
        QCOMPARE(shown.names(), list({"(Default)", "Beta", "gamma", "zeta"}));
    }

    void rows_map_both_ways() {
        Shown shown(Bare);
        QVERIFY(!shown.proxy.mapToSource(shown.proxy.index(0, 0)).isValid());
        QCOMPARE(shown.proxy.mapToSource(shown.proxy.index(1, 2)), shown.source->index(2, 2));
        QCOMPARE(shown.proxy.mapFromSource(shown.source->index(0, 1)), shown.proxy.index(3, 1));
    }

    void the_first_row_can_never_be_renamed() {
        for (const Key key : {Bare, Full}) {
            Shown shown(key);
            QCOMPARE(shown.proxy.flags(shown.proxy.index(0, 0)), Qt::ItemIsSelectable | Qt::ItemIsEnabled);
            QCOMPARE(shown.proxy.flags(shown.proxy.index(0, 2)), Qt::ItemFlags(Qt::ItemIsEnabled));
            QVERIFY(shown.proxy.flags(shown.proxy.index(2, 0)).testFlag(Qt::ItemIsEditable));
            const QStringList names = shown.names();
            QVERIFY(!shown.proxy.setData(shown.proxy.index(0, 0), QStringLiteral("x"), Qt::EditRole));
            QCOMPARE(shown.names(), names);
        }
    }

    void data_for_the_made_up_row_makes_the_value() {
        Shown shown(Bare);
        QSignalSpy changed(&shown.proxy, &QAbstractItemModel::dataChanged);
        QVERIFY(!shown.proxy.setData(shown.proxy.index(0, 0), QStringLiteral("x"), Qt::EditRole));
        QVERIFY(shown.proxy.setData(shown.proxy.index(0, 2), QStringLiteral("made"), Qt::DisplayRole));
        QCOMPARE(changed.count(), 1);
        QCOMPARE(shown.names(), list({"(Default)", "alpha", "Beta", "gamma"}));
        QCOMPARE(shown.proxy.index(0, 2).data().toString(), QStringLiteral("made"));
        QCOMPARE(shown.file.stored_type("Bare", ""), 1);
        QCOMPARE(shown.view.verticalHeader()->count(), 4);
    }

    void deleting_the_unnamed_value_brings_the_made_up_row() {
        Shown shown(Full);
        QCOMPARE(shown.proxy.index(0, 1).data().toString(), QStringLiteral("REG_SZ"));
        QVERIFY(shown.proxy.removeRows(0, 1));
        QCOMPARE(shown.names(), list({"(Default)", "(Default)", "A", "b"}));
        QCOMPARE(shown.proxy.index(0, 2).data().metaType(), QMetaType::fromType<ValueNotSet>());
        QCOMPARE(shown.file.stored("Full", ""), QByteArrayLiteral("?"));
        QCOMPARE(shown.view.verticalHeader()->count(), 4);
    }

    void the_made_up_row_cannot_be_deleted_and_says_so_to_nobody() {
        Shown shown(Bare);
        const testkit::Bytes before = shown.file.bytes();
        QSignalSpy removed(&shown.proxy, &QAbstractItemModel::rowsAboutToBeRemoved);
        for (const int count : {0, 1, 2})
            QVERIFY(shown.proxy.removeRows(0, count));
        QVERIFY(!shown.proxy.removeRows(1, 2));
        QCOMPARE(removed.count(), 0);
        QVERIFY(shown.file.bytes() == before);
        QCOMPARE(shown.proxy.rowCount(), 4);
    }

    void a_new_value_is_last_until_the_next_sort() {
        Shown shown(Bare);
        QVERIFY(shown.proxy.add_value(4));
        QCOMPARE(shown.names(), list({"(Default)", "alpha", "Beta", "gamma", "New Value #1"}));
        QVERIFY(shown.proxy.setData(shown.proxy.index(4, 0), QStringLiteral("aa"), Qt::EditRole));
        QCOMPARE(shown.names(), list({"(Default)", "alpha", "Beta", "gamma", "aa"}));
        shown.proxy.sort(0, Qt::AscendingOrder);
        QCOMPARE(shown.names(), list({"(Default)", "aa", "alpha", "Beta", "gamma"}));
    }

    void a_renamed_value_keeps_its_row_until_the_next_sort() {
        Shown shown(Bare);
        QVERIFY(shown.proxy.setData(shown.proxy.index(1, 0), QStringLiteral("zeta"), Qt::EditRole));
        QCOMPARE(shown.names(), list({"(Default)", "zeta", "Beta", "gamma"}));
        QVERIFY(shown.proxy.setData(shown.proxy.index(2, 2), QVariant(7U), Qt::DisplayRole));
        QCOMPARE(shown.file.stored("Bare", "Beta"), QByteArray("\7\0\0\0", 4));
        shown.proxy.sort(0, Qt::AscendingOrder);
        QCOMPARE(shown.names(), list({"(Default)", "Beta", "gamma", "zeta"}));
    }

    void a_refused_rename_changes_nothing() {
        Shown shown(Bare);
        const testkit::Bytes before = shown.file.bytes();
        QVERIFY(!shown.proxy.setData(shown.proxy.index(1, 0), QStringLiteral("GAMMA"), Qt::EditRole));
        QVERIFY(shown.file.bytes() == before);
        QCOMPARE(shown.names(), list({"(Default)", "alpha", "Beta", "gamma"}));
    }

    // The source's numbers go out as they are, without the row that is made up.
    void inserted_rows_are_announced_with_the_sources_numbers() {
        Shown shown(Bare);
        QSignalSpy inserted(&shown.proxy, &QAbstractItemModel::rowsInserted);
        QVERIFY(shown.proxy.add_value(1));
        QCOMPARE(inserted.count(), 1);
        QCOMPARE(inserted[0][1].toInt(), 3);
        QCOMPARE(inserted[0][2].toInt(), 3);
        QCOMPARE(shown.view.verticalHeader()->count(), 5);
    }

    // The views of two keys: one whose only row is made up, and one with values below it.
    void setting_the_made_up_row_keeps_the_current_row_data() {
        QTest::addColumn<int>("key");
        QTest::addColumn<int>("current");
        QTest::newRow("the only row") << int(Empty) << 0;
        QTest::newRow("the first row") << int(Bare) << 0;
        QTest::newRow("a row between") << int(Bare) << 1;
        QTest::newRow("the last row") << int(Bare) << 3;
    }

    void setting_the_made_up_row_keeps_the_current_row() {
        QFETCH(int, key);
        QFETCH(int, current);
        QTest::failOnWarning(QRegularExpression(QStringLiteral(".")));
        Shown shown(key);
        shown.view.setCurrentIndex(shown.proxy.index(current, 0));
        const QStringList names = shown.names();
        QSignalSpy inserted(&shown.proxy, &QAbstractItemModel::rowsInserted);
        QVERIFY(shown.proxy.setData(shown.proxy.index(0, 2), QStringLiteral("made"), Qt::DisplayRole));
        QCOMPARE(inserted.count(), 0);
        QCOMPARE(shown.names(), names);
        QCOMPARE(shown.current(), current);
        QCOMPARE(shown.view.currentIndex().data().toString(), names[current]);
    }

    void a_value_that_was_not_made_keeps_the_current_row_data() {
        QTest::addColumn<int>("key");
        QTest::addColumn<int>("current");
        QTest::newRow("the only row") << int(Empty) << 0;
        QTest::newRow("a row between") << int(Bare) << 2;
        QTest::newRow("the last row") << int(Bare) << 3;
        QTest::newRow("the last row, none made up") << int(Full) << 3;
    }

    void a_value_that_was_not_made_keeps_the_current_row() {
        QFETCH(int, key);
        QFETCH(int, current);
        QTest::failOnWarning(QRegularExpression(QStringLiteral(".")));
        Shown shown(key);
        shown.view.setCurrentIndex(shown.proxy.index(current, 0));
        QSignalSpy of_the_source(shown.source.get(), &QAbstractItemModel::rowsInserted);
        QSignalSpy layout_changed(&shown.proxy, &QAbstractItemModel::layoutChanged);
        QVERIFY(!shown.proxy.add_value(8));
        QCOMPARE(of_the_source.count(), 1);
        QCOMPARE(layout_changed.count(), 1);
        QCOMPARE(shown.current(), current);
        QCOMPARE(shown.view.verticalHeader()->count(), shown.proxy.rowCount());
    }

    void a_value_that_was_not_made_leaves_the_view_right() {
        Shown shown(Bare);
        QVERIFY(!shown.proxy.add_value(8));
        QCOMPARE(shown.proxy.rowCount(), 4);
        QCOMPARE(shown.names(), list({"(Default)", "alpha", "Beta", "gamma"}));
    }

    void a_null_source_or_key_has_no_rows() {
        ValuesProxyModel proxy;
        QCOMPARE(proxy.rowCount(), 0);
        QCOMPARE(proxy.columnCount(), 0);
        QVERIFY(!proxy.has_key());
        ValuesModel keyless(nullptr);
        proxy.setSourceModel(&keyless);
        QCOMPARE(proxy.rowCount(), 0);
        QVERIFY(!proxy.has_key());
        QVERIFY(!proxy.removeRows(0, 1));
        QVERIFY(!proxy.add_value(1));
        proxy.setSourceModel(nullptr);
        QCOMPARE(proxy.rowCount(), 0);
    }

    void a_new_source_is_a_reset() {
        Shown shown(Bare);
        QSignalSpy reset(&shown.proxy, &QAbstractItemModel::modelReset);
        ValuesModel other(static_cast<RegKey*>(shown.hive.root_key()->child(Empty)));
        shown.view.setCurrentIndex(shown.proxy.index(3, 0));
        shown.proxy.setSourceModel(&other);
        QCOMPARE(reset.count(), 1);
        QCOMPARE(shown.names(), list({"(Default)"}));
        QVERIFY(!shown.view.currentIndex().isValid());
        shown.proxy.setSourceModel(nullptr);
    }
};

QTEST_MAIN(ValuesProxyModelTest)
#include "values_proxy_model_test.moc"
