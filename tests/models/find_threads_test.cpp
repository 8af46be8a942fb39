// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Searches started and cancelled while a tree view paints, scrolls and expands: for the thread sanitizer above all.
#include "hive_on_disk.h"

#include "reg_model.h"

#include <QTest>
#include <QTreeView>

#include <thread>

class FindThreadsTest : public QObject {
    Q_OBJECT

private slots:
    void fifty_searches_are_cancelled_under_a_painting_tree() {
        testkit::HiveLayout layout;
        for (int i = 0; i < 60; i++) {
            testkit::KeyLayout& key = layout.root.add("Key " + std::to_string(i));
            key.set("value", 4, testkit::pattern(4));
            for (int j = 0; j < 20; j++)
                key.add("sub " + std::to_string(j)).set("v", 1, testkit::text_data("x"));
        }
        const HiveOnDisk file(layout);
        RegModel model;
        model.add_hive(QStringLiteral("TOP/HIVE"), file.path());
        QTreeView view;
        view.setUniformRowHeights(true);
        view.setModel(&model);
        view.resize(300, 400);
        view.show();
        view.expand(model.index(0, 0));
        const QModelIndex root = model.index(0, 0, model.index(0, 0));
        view.expand(root);
        for (int round = 0; round < 50; round++) {
            model.begin_find(model.index(0, 0));
            // A plain thread: the sanitizer sees where it begins and ends, which it cannot see of the toolkit's pool.
            std::thread search([&model] {
                model.find(QStringLiteral("absent"), RegModel::FindKeys | RegModel::FindValues, Qt::MatchContains);
            });
            view.setExpanded(model.index(round, 0, root), true);
            view.scrollTo(model.index((round * 7) % 60, 0, root));
            view.viewport()->repaint();
            QCoreApplication::processEvents();
            if (round % 5 != 0)
                model.stop_find();
            search.join();
        }
        // The next search finds all the same.
        model.begin_find(model.index(0, 0));
        QVERIFY(model.find(QStringLiteral("sub 19"), RegModel::FindKeys, Qt::MatchFixedString).key.isValid());
    }
};

QTEST_MAIN(FindThreadsTest)
#include "find_threads_test.moc"
