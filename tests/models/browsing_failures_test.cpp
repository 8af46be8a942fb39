// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// One read of the hive's file that fails while the tree is browsed: every key is shown whole afterwards, or says that
// it cannot be read, also to a search.
#include "file_faults.h"
#include "searched.h"

#include "reg_key.h"
#include "values_model.h"
#include "values_proxy_model.h"

#include <QTest>

#include <stdexcept>

namespace {

// As much data as makes the engine go to the file often.
testkit::HiveLayout layout() {
    testkit::HiveLayout hive;
    testkit::KeyLayout& parent = hive.root.add("Parent");
    for (int i = 0; i < 40; i++) {
        testkit::KeyLayout& key = parent.add("p" + std::to_string(100 + i));
        key.set("v", 3, testkit::pattern(3000));
        key.add("sub");
        if (i % 4 == 0)
            key.flags = 0x10;  // a symbolic link, which its parent's list names
    }
    return hive;
}

// Every row below a key is asked for what a view shows.
void browse(const RegModel& model, const QModelIndex& parent) {
    for (int row = 0; row < model.rowCount(parent); row++) {
        try {
            const QModelIndex key = model.index(row, 0, parent);
            model.rowCount(key);
            key.data();
        } catch (const std::runtime_error&) {
            // told
        }
    }
}

}  // namespace

class BrowsingFailuresTest : public QObject {
    Q_OBJECT

private slots:
    void no_key_is_shown_without_its_subkeys() {
        const testkit::Bytes bytes = testkit::lay_out(layout()).bytes;
        int unreadable = 0;
        bool failed = true;
        for (int nth = 1; failed; nth++) {
            Searched searched(bytes);
            RegModel& model = searched.model;
            const QModelIndex parent = searched.at(QStringLiteral("Parent"));
            {
                const testkit::ReadFaults faults(nth);
                browse(model, parent);
                failed = faults.failed();
            }
            int unreadable_here = 0;
            QCOMPARE(model.rowCount(parent), 40);
            for (int row = 0; row < 40; row++) {
                const QModelIndex key = model.index(row, 0, parent);
                if (key.data(Qt::AccessibleTextRole).toString() != QStringLiteral("(cannot be read)")) {
                    QCOMPARE(key.data().toString(), QStringLiteral("p%1").arg(100 + row));
                    QCOMPARE(model.rowCount(key), 1);
                    continue;
                }
                unreadable_here++;
                QVERIFY_THROWS_EXCEPTION(std::runtime_error, key.data());
                QVERIFY_THROWS_EXCEPTION(std::runtime_error, RegModel::editable_key(key)->value_count());
                QVERIFY_THROWS_EXCEPTION(std::runtime_error, model.new_key(key));
            }
            unreadable += unreadable_here;
            searched.begin();
            int thrown = 0;
            int hits = 0;
            for (bool goes_on = true; goes_on;) {
                try {
                    goes_on = model.find(QStringLiteral("sub"), RegModel::FindKeys, Qt::MatchFixedString).key.isValid();
                    hits += goes_on ? 1 : 0;
                } catch (const std::runtime_error&) {
                    thrown++;
                }
            }
            QCOMPARE(thrown, unreadable_here);
            QCOMPARE(hits, 40 - unreadable_here);
        }
        QVERIFY(unreadable > 0);
    }

    void a_hit_is_the_row_that_the_table_shows() {
        testkit::HiveLayout hive;
        testkit::KeyLayout& wide = hive.root.add("Wide");
        for (int i = 0; i < 60; i++)
            wide.set("value " + std::to_string(i), 3, testkit::pattern(3000)).wide_name = true;
        wide.set("", 1, testkit::text_data("is set"));
        const testkit::Bytes bytes = testkit::lay_out(hive).bytes;
        for (const char* name : {"value 0", "value 59", "(Default)"}) {
            const QString term = QString::fromLatin1(name);
            int hits = 0;
            bool failed = true;
            for (int nth = 1; failed; nth++) {
                Searched searched(bytes);
                RegKey* const key = RegModel::editable_key(searched.at(QStringLiteral("Wide")));
                for (int i = 0; i < key->value_count(); i++)
                    key->read_value(i);  // the engine's window is elsewhere then
                searched.begin();
                RegModel::FindResult hit;
                {
                    const testkit::ReadFaults faults(nth);
                    try {
                        hit = searched.model.find(term, RegModel::FindValues, Qt::MatchFixedString);
                    } catch (const std::runtime_error&) {
                        // told
                    }
                    failed = faults.failed();
                }
                if (!hit.key.isValid())
                    continue;
                hits++;
                ValuesModel source(key);
                ValuesProxyModel table;
                table.setSourceModel(&source);
                table.sort(0, Qt::AscendingOrder);
                QCOMPARE(table.index(hit.value_row, 0).data().toString(), term);
            }
            QVERIFY(hits > 2);
        }
    }
};

QTEST_GUILESS_MAIN(BrowsingFailuresTest)
#include "browsing_failures_test.moc"
