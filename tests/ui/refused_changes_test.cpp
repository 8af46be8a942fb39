// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT

// Deletions and renames that the file fails at: what is current and highlighted afterwards is what they were about, as
// long as it is there, and not what stands in its place by now.
#include "file_faults.h"
#include "shared_actions.h"
#include "stage.h"
#include "ui_test.h"

#include <QLineEdit>
#include <QStandardItemModel>

#include <optional>

namespace {

const QString alpha = QStringLiteral("MACHINE\\SYSTEM\\Alpha");

testkit::HiveLayout some_values() {
    testkit::HiveLayout layout;
    testkit::KeyLayout& key = layout.root.add("Alpha");
    for (const char* name : {"b", "m", "z"})
        key.set(name, 1, testkit::text_data("text"));
    return layout;
}

testkit::HiveLayout some_keys() {
    testkit::HiveLayout layout;
    testkit::KeyLayout& key = layout.root.add("Alpha");
    for (const char* name : {"a", "b", "c", "d"}) {
        testkit::KeyLayout& child = key.add(name);
        child.set("x", 1, testkit::text_data("text"));
        child.set("y", 1, testkit::text_data("text"));
        child.add("p");
        child.add("q");
    }
    return layout;
}

struct Attempt {
    bool has_failed = false;
    QStringList told;
};

// Deletes what is current. From the Yes on the file's nth read or write fails, until something is told.
template <typename Faults>
Attempt delete_failing_at(int nth, bool lasting) {
    Attempt attempt;
    std::optional<Faults> faults;
    const auto end = [&] {
        attempt.has_failed = attempt.has_failed || (faults && faults->failed());
        faults.reset();
    };
    QTimer presser;
    QObject::connect(&presser, &QTimer::timeout, &presser, [&] {
        auto* box = qobject_cast<QMessageBox*>(QApplication::activeModalWidget());
        if (box && box->icon() == QMessageBox::Question) {
            faults.emplace(nth, lasting);
            QTest::mouseClick(box->button(QMessageBox::Yes), Qt::LeftButton);
        } else if (box) {
            end();
            attempt.told.append(box->text());
            QTest::mouseClick(box->button(QMessageBox::Ok), Qt::LeftButton);
        }
    });
    presser.start(1);
    shared_actions().delete_action->trigger();
    end();
    QCoreApplication::processEvents();
    return attempt;
}

// A table whose last value is not where its name belongs; that one is current.
void make_a_value_a(Stage& stage) {
    stage.select_key(alpha);
    stage.return_to(*stage.values);
    shared_actions().new_string_action->trigger();
    stage.press_in_editor(QStringLiteral("a"), Qt::Key_Return);
    QTRY_VERIFY(stage.values->hasFocus());
    QCOMPARE(stage.value_names().last(), QStringLiteral("a"));
}

QString current_of(const QAbstractItemView& view) {
    const QModelIndex current = view.currentIndex();
    return view.selectionModel()->selectedIndexes() == QModelIndexList{current} ? current.data().toString()
                                                                                : QStringLiteral("not highlighted");
}

using Delete = Attempt (*)(int, bool);

}  // namespace

class RefusedChangesTest : public QObject {
    Q_OBJECT

private slots:
    void a_value_that_is_not_deleted_stays_current_data() {
        QTest::addColumn<bool>("lasting");
        QTest::newRow("a write fails") << false;
        QTest::newRow("all writes from one on fail") << true;
    }

    void a_value_that_is_not_deleted_stays_current() {
        QFETCH(const bool, lasting);
        int kept = 0;
        bool has_failed = true;
        for (int nth = 1; has_failed; nth++) {
            const Scene scene(some_values());
            Stage stage(scene);
            make_a_value_a(stage);
            const Attempt attempt = delete_failing_at<testkit::WriteFaults>(nth, lasting);
            has_failed = attempt.has_failed;
            if (stage.value_names().contains(QStringLiteral("a"))) {
                QVERIFY(!attempt.told.isEmpty());
                QVERIFY2(
                    current_of(*stage.values) == QStringLiteral("a"),
                    qPrintable(QStringLiteral("number %1: %2 is current").arg(nth).arg(current_of(*stage.values))));
                kept++;
            }
        }
        QVERIFY(kept > 0);
    }

    void a_value_that_is_not_renamed_stays_current() {
        int kept = 0;
        int doubled = 0;
        bool has_failed = true;
        for (int nth = 1; has_failed; nth++) {
            const Scene scene(some_values());
            Stage stage(scene);
            stage.select_value(alpha, QStringLiteral("z"));
            stage.return_to(*stage.values);
            QTest::keyClick(stage.values, Qt::Key_F2);
            {
                const testkit::WriteFaults faults(nth);
                auto* editor = qobject_cast<QLineEdit*>(QApplication::focusWidget());
                QVERIFY(editor);
                editor->setText(QStringLiteral("a"));
                DialogHand hand;
                bool is_told = false;
                hand.then([&](QWidget* box) {
                    is_told = true;
                    QTest::keyClick(box, Qt::Key_Return);
                });
                QTest::keyClick(editor, Qt::Key_Return);
                QTRY_VERIFY(is_told ||
                            stage.value_names() == QStringList({QStringLiteral("(Default)"), QStringLiteral("b"),
                                                                QStringLiteral("m"), QStringLiteral("a")}));
                QTRY_VERIFY(!QApplication::activeModalWidget());
                has_failed = faults.failed();
            }
            const QStringList names = stage.value_names();
            const bool is_kept = names.contains(QStringLiteral("z"));
            kept += is_kept ? 1 : 0;
            doubled += is_kept && names.contains(QStringLiteral("a")) ? 1 : 0;
            const QString wanted = is_kept ? QStringLiteral("z") : QStringLiteral("a");
            QVERIFY2(current_of(*stage.values) == wanted,
                     qPrintable(QStringLiteral("number %1: %2 is current of %3")
                                    .arg(nth)
                                    .arg(current_of(*stage.values), names.join(QLatin1Char(' ')))));
        }
        QVERIFY(kept > doubled);
        QVERIFY(doubled > 0);
    }

    void a_key_that_is_not_deleted_stays_current_data() {
        QTest::addColumn<Delete>("deletion");
        QTest::addColumn<bool>("lasting");
        QTest::newRow("a write fails") << &delete_failing_at<testkit::WriteFaults> << false;
        // One that fails alone is tried again.
        QTest::newRow("all reads from one on fail") << &delete_failing_at<testkit::ReadFaults> << true;
    }

    void a_key_that_is_not_deleted_stays_current() {
        QFETCH(const Delete, deletion);
        QFETCH(const bool, lasting);
        int kept = 0;
        bool has_failed = true;
        for (int nth = 1; has_failed; nth++) {
            const Scene scene(some_keys());
            Stage stage(scene);
            const QString b = alpha + QStringLiteral("\\b");
            stage.select_key(b);
            stage.keys->expand(stage.key(b));
            stage.return_to(*stage.keys);
            const Attempt attempt = deletion(nth, lasting);
            has_failed = attempt.has_failed;
            if (stage.key(b).isValid()) {
                QVERIFY(!attempt.told.isEmpty());
                QVERIFY2(current_of(*stage.keys) == QStringLiteral("b"),
                         qPrintable(QStringLiteral("number %1: %2 is current").arg(nth).arg(current_of(*stage.keys))));
                QVERIFY(stage.keys->isExpanded(stage.key(b)));
                kept++;
            }
        }
        QVERIFY(kept > 0);
    }

    void a_value_whose_deletion_throws_stays_current() {
        class ThrowingModel : public QStandardItemModel {
        public:
            using QStandardItemModel::QStandardItemModel;
            bool removeRows(int row, int /*count*/, const QModelIndex& /*parent*/) override {
                insertRow(row, takeRow(row));
                throw std::runtime_error("as asked");
            }
        };
        const Scene scene(some_values());
        Stage stage(scene);
        stage.select_key(alpha);
        ThrowingModel model(3, 3);
        stage.values->setModel(&model);
        for (int row = 0; row < model.rowCount(); row++) {
            stage.return_to(*stage.values);
            stage.values->setCurrentIndex(model.index(row, 0));
            shared_actions().delete_action->setEnabled(true);
            DialogHand hand;
            hand.then_press(QMessageBox::Yes).then_press(QMessageBox::Ok);
            shared_actions().delete_action->trigger();
            QVERIFY(hand.is_done());
            QCOMPARE(hand.text, QStringLiteral("The key \"%1\" cannot be read: as asked").arg(alpha));
            QCOMPARE(stage.values->currentIndex(), model.index(row, 0));
            QCOMPARE(stage.values->selectionModel()->selectedIndexes(), QModelIndexList{model.index(row, 0)});
        }
    }

    // The exception comes out of a removal that was announced; what it says is told all the same.
    void a_key_whose_deletion_throws_stays_current() {
        class ThrowingModel : public RegModel {
        public:
            bool removeRows(int row, int /*count*/, const QModelIndex& parent) override {
                beginRemoveRows(parent, row, row);
                endRemoveRows();
                beginInsertRows(parent, row, row);
                endInsertRows();
                throw std::runtime_error("as asked");
            }
        };
        const Scene scene(some_keys());
        Stage stage(scene, std::make_unique<ThrowingModel>());
        const QString b = alpha + QStringLiteral("\\b");
        stage.select_key(b);
        stage.keys->expand(stage.key(b));
        stage.return_to(*stage.keys);
        DialogHand hand;
        hand.then_press(QMessageBox::Yes).then_press(QMessageBox::Ok);
        shared_actions().delete_action->trigger();
        QVERIFY(hand.is_done());
        QCOMPARE(hand.text, QStringLiteral("The key \"%1\" cannot be read: as asked").arg(b));
        QCOMPARE(current_of(*stage.keys), QStringLiteral("b"));
        QVERIFY(stage.keys->isExpanded(stage.key(b)));
    }
};

UI_TEST_MAIN(RefusedChangesTest)
#include "refused_changes_test.moc"
