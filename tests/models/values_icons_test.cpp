// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Which icon stands beside the values of which type.
#include "hive_on_disk.h"

#include "reg_hive.h"
#include "reg_key.h"
#include "values_model.h"
#include "values_proxy_model.h"

#include <QIcon>
#include <QImage>
#include <QTest>

namespace {

QImage image_in(const QIcon& icon) { return icon.pixmap(16).toImage(); }

QImage icon_file(const char* name) {
    return image_in(QIcon(QStringLiteral(TALLOWFEN_SHARE_DIR) + QLatin1String(name)));
}

QImage icon_at(const QModelIndex& index) { return image_in(index.data(Qt::DecorationRole).value<QIcon>()); }

}  // namespace

class ValuesIconsTest : public QObject {
    Q_OBJECT

private slots:
    void the_two_icons_differ() {
        QVERIFY(!icon_file("type_string.ico").isNull());
        QVERIFY(!icon_file("type_binary.ico").isNull());
        QVERIFY(icon_file("type_string.ico") != icon_file("type_binary.ico"));
    }

    void a_type_has_its_icon_data() {
        QTest::addColumn<uint>("type");
        QTest::addColumn<bool>("is_text");
        for (const uint type : {0U, 1U, 2U, 3U, 4U, 5U, 6U, 7U, 8U, 9U, 10U, 11U, 12U, 99U, 0xFFFFFFFFU})
            QTest::addRow("type %u", type) << type << (type == 1 || type == 2 || type == 7);
    }

    void a_type_has_its_icon() {
        QFETCH(uint, type);
        QFETCH(bool, is_text);
        testkit::HiveLayout hive;
        hive.root.add("Key").set("value", type, testkit::pattern(8));
        const HiveOnDisk file(hive);
        DummyRegKey top(QStringLiteral("TOP"));
        RegHive opened(QStringLiteral("HIVE"), file.path(), &top);
        ValuesModel model(static_cast<RegKey*>(opened.root_key()->child(0)));
        const QImage expected = icon_file(is_text ? "type_string.ico" : "type_binary.ico");
        QCOMPARE(icon_at(model.index(0, 0)), expected);
        for (const int column : {1, 2})
            QVERIFY(!model.index(0, column).data(Qt::DecorationRole).isValid());
        // Through the table's model, below the row that is made up.
        ValuesProxyModel table;
        table.setSourceModel(&model);
        table.sort(0, Qt::AscendingOrder);
        QCOMPARE(icon_at(table.index(1, 0)), expected);
        QCOMPARE(icon_at(table.index(0, 0)), icon_file("type_string.ico"));
        for (const int column : {1, 2})
            QVERIFY(!table.index(0, column).data(Qt::DecorationRole).isValid());
    }
};

QTEST_MAIN(ValuesIconsTest)
#include "values_icons_test.moc"
