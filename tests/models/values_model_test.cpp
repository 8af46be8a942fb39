// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "hive_on_disk.h"

#include "reg_hive.h"
#include "reg_key.h"
#include "values_model.h"
#include "values_proxy_model.h"

#include <QAbstractItemModelTester>
#include <QSignalSpy>
#include <QTest>

namespace {

testkit::HiveLayout layout() {
    testkit::HiveLayout hive;
    testkit::KeyLayout& key = hive.root.add("Key");
    key.set("", 1, testkit::text_data("default"));
    key.set("(Default)", 4, testkit::pattern(4));
    key.set("reversed", 5, {0, 0, 1, 2});
    key.set("bytes", 3, testkit::pattern(3));
    key.set("bad", 4, testkit::pattern(8));
    key.set("odd type", 99, testkit::pattern(3));
    key.set("list", 7, testkit::text_data("one"));
    key.set("qword", 11, testkit::pattern(8));
    return hive;
}

struct Opened {
    HiveOnDisk file{layout()};
    DummyRegKey top{QStringLiteral("TOP")};
    RegHive hive{QStringLiteral("HIVE"), file.path(), &top};
    RegKey* key = static_cast<RegKey*>(hive.root_key()->child(0));
    ValuesModel model{key};

    QString text(int row, int column) { return model.index(row, column).data().toString(); }
};

}  // namespace

class ValuesModelTest : public QObject {
    Q_OBJECT

private slots:
    void the_model_is_one_that_views_can_rely_on() {
        Opened opened;
        const QAbstractItemModelTester tester(&opened.model, QAbstractItemModelTester::FailureReportingMode::QtTest);
        QVERIFY(opened.model.add_value(1));
        QVERIFY(opened.model.removeRows(0, 1));
    }

    void a_model_without_a_key_has_no_rows() {
        ValuesModel model(nullptr);
        QCOMPARE(model.rowCount(), 0);
        QCOMPARE(model.columnCount(), 3);
        QVERIFY(!model.add_value(1));
        QVERIFY(!model.removeRows(0, 1));
    }

    void columns_have_their_titles() {
        Opened opened;
        for (const Qt::Orientation orientation : {Qt::Horizontal, Qt::Vertical}) {
            QCOMPARE(opened.model.headerData(0, orientation, Qt::DisplayRole).toString(), QStringLiteral("Name"));
            QCOMPARE(opened.model.headerData(1, orientation, Qt::DisplayRole).toString(), QStringLiteral("Type"));
            QCOMPARE(opened.model.headerData(2, orientation, Qt::DisplayRole).toString(), QStringLiteral("Data"));
        }
        QVERIFY(!opened.model.headerData(3, Qt::Horizontal, Qt::DisplayRole).isValid());
        QVERIFY(!opened.model.headerData(0, Qt::Horizontal, Qt::EditRole).isValid());
    }

    void the_unnamed_value_reads_like_one_that_is_named_so() {
        Opened opened;
        QCOMPARE(opened.text(0, 0), QStringLiteral("(Default)"));
        QCOMPARE(opened.text(1, 0), QStringLiteral("(Default)"));
        QCOMPARE(opened.text(0, 1), QStringLiteral("REG_SZ"));
        QCOMPARE(opened.text(1, 1), QStringLiteral("REG_DWORD"));
    }

    void data_comes_as_its_own_type() {
        Opened opened;
        QCOMPARE(opened.model.index(2, 2).data(), QVariant(258U));
        QCOMPARE(opened.model.index(3, 2).data().typeId(), int(QMetaType::QByteArray));
        QCOMPARE(opened.model.index(6, 2).data().typeId(), int(QMetaType::QStringList));
        QCOMPARE(opened.model.index(7, 2).data().typeId(), int(QMetaType::ULongLong));
        QVERIFY(!opened.model.index(5, 1).data().isValid());
        QVERIFY(!opened.model.data(QModelIndex(), Qt::DisplayRole).isValid());
        QVERIFY(!opened.model.data(opened.model.index(0, 0), Qt::ToolTipRole).isValid());
    }

    void only_names_are_editable() {
        Opened opened;
        QCOMPARE(opened.model.flags(opened.model.index(0, 0)),
                 Qt::ItemIsSelectable | Qt::ItemIsEditable | Qt::ItemIsEnabled);
        QCOMPARE(opened.model.flags(opened.model.index(0, 1)), Qt::ItemFlags(Qt::ItemIsEnabled));
        QCOMPARE(opened.model.flags(opened.model.index(0, 2)), Qt::ItemFlags(Qt::ItemIsEnabled));
    }

    void a_big_endian_number_stays_one() {
        Opened opened;
        QVERIFY(opened.model.setData(opened.model.index(2, 2), QVariant(0x01020304U), Qt::DisplayRole));
        QCOMPARE(opened.file.stored("Key", "reversed"), QByteArray("\1\2\3\4", 4));
        QCOMPARE(opened.file.stored_type("Key", "reversed"), 5);
        QCOMPARE(opened.model.index(2, 2).data(), QVariant(0x01020304U));
    }

    void a_value_that_cannot_be_read_is_shown_and_can_go() {
        Opened opened;
        const testkit::Bytes before = opened.file.bytes();
        QCOMPARE(opened.text(4, 0), QStringLiteral("bad"));
        QCOMPARE(opened.text(4, 1), QStringLiteral("REG_DWORD"));
        QVERIFY(!opened.model.index(4, 2).data().isValid());
        QVERIFY(!opened.model.setData(opened.model.index(4, 2), QVariant(1U), Qt::DisplayRole));
        QVERIFY(opened.file.bytes() == before);
        QVERIFY(opened.model.removeRows(4, 1));
        QCOMPARE(opened.file.stored("Key", "bad"), QByteArrayLiteral("?"));
    }

    void storing_what_is_shown_keeps_the_stored_bytes_data() {
        QTest::addColumn<uint>("type");
        QTest::addColumn<QByteArray>("stored");
        const auto row = [](const char* name, uint type, const char* hex) {
            QTest::newRow(name) << type << QByteArray::fromHex(hex);
        };
        row("text behind a zero", 1, "6100000064000000");
        row("text of an odd size", 1, "61006200000007");
        row("no text", 1, "");
        row("text without its zero", 2, "61006200");
        row("a link without its zero", 6, "61006200");
        row("an empty string in the middle", 7, "610000000000620000000000");
        row("a list without its last zero", 7, "6100000062000000");
        row("no list", 7, "");
        row("a short number", 4, "0506");
        row("a short number, high byte first", 5, "0506");
        row("a short number of 64 bits", 11, "050607");
        row("bytes", 3, "00");
        row("no bytes", 3, "");
    }

    void storing_what_is_shown_keeps_the_stored_bytes() {
        QFETCH(uint, type);
        QFETCH(QByteArray, stored);
        testkit::HiveLayout hive;
        hive.root.add("Key").set("value", type, testkit::Bytes(stored.begin(), stored.end()));
        const HiveOnDisk file(hive);
        DummyRegKey top(QStringLiteral("TOP"));
        RegHive opened(QStringLiteral("HIVE"), file.path(), &top);
        ValuesModel model(static_cast<RegKey*>(opened.root_key()->child(0)));
        const QModelIndex cell = model.index(0, ValuesModel::DataColumn);
        const testkit::Bytes before = file.bytes();
        QVERIFY(model.setData(cell, cell.data(), Qt::DisplayRole));
        QVERIFY(file.bytes() == before);
        // An editor makes one empty line of a list without strings.
        if (type == 7 && stored.isEmpty()) {
            QVERIFY(model.setData(cell, QStringList{QString()}, Qt::DisplayRole));
            QVERIFY(file.bytes() == before);
        }
    }

    void other_data_replaces_what_the_bytes_said_beside_it() {
        testkit::HiveLayout hive;
        hive.root.add("Key").set("list", 7, {'a', 0, 0, 0, 0, 0, 'b', 0, 0, 0, 0, 0});
        const HiveOnDisk file(hive);
        DummyRegKey top(QStringLiteral("TOP"));
        RegHive opened(QStringLiteral("HIVE"), file.path(), &top);
        ValuesModel model(static_cast<RegKey*>(opened.root_key()->child(0)));
        const QModelIndex cell = model.index(0, ValuesModel::DataColumn);
        QCOMPARE(cell.data().toStringList(), QStringList({QStringLiteral("a"), QString(), QStringLiteral("b")}));
        // Without the empty string, and then with one where none can be stored.
        QVERIFY(model.setData(cell, QStringList({QStringLiteral("a"), QStringLiteral("b")}), Qt::DisplayRole));
        QCOMPARE(file.stored("Key", "list"), QByteArray("a\0\0\0b\0\0\0\0\0", 10));
        QVERIFY(
            model.setData(cell, QStringList({QStringLiteral("a"), QString(), QStringLiteral("c")}), Qt::DisplayRole));
        QCOMPARE(file.stored("Key", "list"), QByteArray("a\0\0\0c\0\0\0\0\0", 10));
    }

    // Another key object, or a write that landed by half, may have changed what a row was shown with.
    void data_is_compared_with_what_the_file_has() {
        Opened opened;
        const QModelIndex cell = opened.model.index(3, ValuesModel::DataColumn);
        const QVariant shown = cell.data();
        QVERIFY(opened.key->set_binary_value(QStringLiteral("bytes"), QByteArrayLiteral("other"), REG_BINARY, 3));
        QVERIFY(opened.model.setData(cell, shown, Qt::EditRole));
        QCOMPARE(opened.file.stored("Key", "bytes"), shown.toByteArray());
    }

    void after_a_refusal_every_row_is_read_again() {
        Opened opened;
        const QModelIndex cell = opened.model.index(3, ValuesModel::DataColumn);
        cell.data();
        opened.text(0, 2);
        QVERIFY(opened.key->set_binary_value(QStringLiteral("bytes"), QByteArrayLiteral("other"), REG_BINARY, 3));
        QSignalSpy changed(&opened.model, &QAbstractItemModel::dataChanged);
        QVERIFY(!opened.model.setData(opened.model.index(5, 2), QByteArrayLiteral("x"), Qt::EditRole));
        QCOMPARE(changed.size(), 1);
        QCOMPARE(changed[0][0].toModelIndex(), opened.model.index(3, ValuesModel::TypeColumn));
        QCOMPARE(changed[0][1].toModelIndex(), cell);
        QCOMPARE(cell.data().toByteArray(), QByteArrayLiteral("other"));
    }

    // In a damaged hive the data of two values may lie in one cell.
    void data_that_two_values_share_changes_in_both_rows_data() {
        QTest::addColumn<bool>("through_the_table");
        QTest::newRow("in the key's own order") << false;
        QTest::newRow("in the table") << true;
    }

    void data_that_two_values_share_changes_in_both_rows() {
        QFETCH(const bool, through_the_table);
        testkit::HiveLayout hive;
        testkit::KeyLayout& key = hive.root.add("Key");
        for (const char* name : {"", "two", "one", "apart"})
            key.set(name, 1, testkit::text_data("as it was"));
        testkit::LaidHive laid = testkit::lay_out(hive);
        const auto& values = laid.at("Key").values;
        laid.put32(values[2].record, 8, values[1].data);
        const HiveOnDisk file(laid.bytes);
        DummyRegKey top(QStringLiteral("TOP"));
        RegHive opened(QStringLiteral("HIVE"), file.path(), &top);
        ValuesModel source(static_cast<RegKey*>(opened.root_key()->child(0)));
        ValuesProxyModel table;
        table.setSourceModel(&source);
        table.sort(0, Qt::AscendingOrder);
        QAbstractItemModel& model = through_the_table ? static_cast<QAbstractItemModel&>(table) : source;
        const auto cell = [&](int row, int column) {
            const QModelIndex index = source.index(row, column);
            return through_the_table ? table.mapFromSource(index) : index;
        };
        for (int row = 0; row < 4; row++)
            QCOMPARE(cell(row, 2).data().toString(), QStringLiteral("as it was"));
        QSignalSpy changed(&model, &QAbstractItemModel::dataChanged);
        const QString now = QStringLiteral("new text!");
        QVERIFY(model.setData(cell(1, 2), now, Qt::EditRole));
        QCOMPARE(cell(1, 2).data().toString(), now);
        QCOMPARE(cell(2, 2).data().toString(), now);
        QCOMPARE(changed.size(), 2);
        QCOMPARE(changed[through_the_table ? 1 : 0][0].toModelIndex(), cell(1, 2));
        QCOMPARE(changed[through_the_table ? 0 : 1][1].toModelIndex(), cell(2, 2));
        // What the other one was shown with before is no longer what is stored.
        QVERIFY(model.setData(cell(2, 2), QStringLiteral("as it was"), Qt::EditRole));
        QCOMPARE(file.stored("Key", "one"), file.stored("Key", ""));
        changed.clear();
        QVERIFY(model.setData(cell(3, 2), now, Qt::EditRole));
        QCOMPARE(changed.size(), 1);
        QCOMPARE(changed[0][0].toModelIndex(), cell(3, 2));
        QCOMPARE(changed[0][1].toModelIndex(), cell(3, 2));
    }

    void a_type_without_a_name_cannot_be_written() {
        Opened opened;
        QVERIFY(!opened.model.setData(opened.model.index(5, 2), QByteArray("x"), Qt::DisplayRole));
        QVERIFY(!opened.model.setData(opened.model.index(5, 1), QByteArray("x"), Qt::DisplayRole));
    }

    void after_a_rename_every_row_behind_is_read_again() {
        Opened opened;
        for (int row = 0; row < opened.model.rowCount(); row++)
            opened.text(row, 2);
        QSignalSpy changed(&opened.model, &QAbstractItemModel::dataChanged);
        QVERIFY(opened.model.setData(opened.model.index(2, 0), QStringLiteral("moved"), Qt::EditRole));
        QCOMPARE(changed.count(), 1);
        QCOMPARE(changed[0][0].toModelIndex(), opened.model.index(2, 0));
        QCOMPARE(changed[0][1].toModelIndex(), opened.model.index(7, 0));
        // What was cached for a row shows in type and data too.
        ValuesModel afresh(opened.key);
        const char* const names[] = {"(Default)", "(Default)", "bytes", "bad", "odd type", "list", "qword", "moved"};
        for (int row = 0; row < 8; row++) {
            QCOMPARE(opened.text(row, 0), QString::fromLatin1(names[row]));
            for (const int column : {1, 2})
                QCOMPARE(opened.model.index(row, column).data(), afresh.index(row, column).data());
        }
        QCOMPARE(opened.model.index(7, 2).data(), QVariant(258U));
    }

    void two_rows_at_once_are_not_removed() {
        Opened opened;
        const testkit::Bytes before = opened.file.bytes();
        QSignalSpy removed(&opened.model, &QAbstractItemModel::rowsAboutToBeRemoved);
        QVERIFY(!opened.model.removeRows(0, 2));
        QVERIFY(!opened.model.removeRows(99, 1));
        QCOMPARE(removed.count(), 0);
        QVERIFY(opened.file.bytes() == before);
    }

    void values_are_made_empty_data() {
        QTest::addColumn<int>("type");
        QTest::addColumn<QByteArray>("stored");
        QTest::newRow("REG_SZ") << 1 << QByteArray(2, '\0');
        QTest::newRow("REG_EXPAND_SZ") << 2 << QByteArray(2, '\0');
        QTest::newRow("REG_LINK") << 6 << QByteArray(2, '\0');
        QTest::newRow("REG_BINARY") << 3 << QByteArray();
        QTest::newRow("REG_DWORD") << 4 << QByteArray(4, '\0');
        QTest::newRow("REG_MULTI_SZ") << 7 << QByteArray(4, '\0');
        QTest::newRow("REG_QWORD") << 11 << QByteArray(8, '\0');
    }
    void values_are_made_empty() {
        QFETCH(int, type);
        QFETCH(QByteArray, stored);
        Opened opened;
        QSignalSpy inserted(&opened.model, &QAbstractItemModel::rowsInserted);
        QVERIFY(opened.model.add_value(type));
        QCOMPARE(inserted.count(), 1);
        QCOMPARE(inserted[0][1].toInt(), 8);
        QCOMPARE(opened.file.stored("Key", "New Value #1"), stored);
        QCOMPARE(opened.file.stored_type("Key", "New Value #1"), type);
    }

    // The pair of signals comes for a type that makes nothing too; views are told otherwise by whoever asked.
    void a_type_that_makes_nothing_is_announced_all_the_same() {
        Opened opened;
        QSignalSpy inserted(&opened.model, &QAbstractItemModel::rowsInserted);
        QVERIFY(!opened.model.add_value(8));
        QCOMPARE(inserted.count(), 1);
        QCOMPARE(opened.model.rowCount(), 8);
    }

    void more_than_a_hundred_rows_are_shown_right() {
        testkit::HiveLayout many;
        testkit::KeyLayout& key = many.root.add("Key");
        for (int i = 0; i < 300; i++)
            key.set("v" + std::to_string(i), 4, {static_cast<uint8_t>(i), static_cast<uint8_t>(i >> 8), 0, 0});
        const HiveOnDisk file(many);
        DummyRegKey top(QStringLiteral("TOP"));
        RegHive hive(QStringLiteral("HIVE"), file.path(), &top);
        ValuesModel model(static_cast<RegKey*>(hive.root_key()->child(0)));
        for (int round = 0; round < 2; round++) {
            for (int row = 0; row < 300; row++)
                QCOMPARE(model.index(row, 2).data(), QVariant(static_cast<uint>(row)));
        }
    }
};

QTEST_MAIN(ValuesModelTest)
#include "values_model_test.moc"
