// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// What is shown, and cannot be read any more or again: who hears of it, of which key, and how often.
#include "failure_report.h"
#include "reg_key.h"
#include "shared_actions.h"
#include "stage.h"
#include "ui_test.h"

#include <QAction>
#include <QActionGroup>
#include <QApplication>
#include <QCheckBox>
#include <QFile>
#include <QHeaderView>
#include <QLineEdit>
#include <QRegularExpression>
#include <QTest>

namespace {

const QString system_path = QStringLiteral("MACHINE\\SYSTEM");
const QString alpha = system_path + QStringLiteral("\\Alpha");
const QString row_of_alpha = system_path + QStringLiteral("\\#0");  // where its name cannot be read
const QString beta = system_path + QStringLiteral("\\Beta");

QString told(const QString& key, const char* reason) {
    return QStringLiteral("The key \"%1\" cannot be read: %2").arg(key, QLatin1String(reason));
}

// More keys than handles are kept, and more data than the engine keeps of the file.
testkit::HiveLayout large() {
    testkit::HiveLayout layout;
    testkit::KeyLayout& key = layout.root.add("Alpha");
    key.set("number", 4, testkit::pattern(4));
    key.set("text", 1, testkit::text_data("hello"));
    key.add("Deep");
    layout.root.add("Beta").add("Below");
    layout.root.add("Filler").set("much", 3, testkit::pattern(40000));
    for (int i = 0; i < 150; i++)
        layout.root.add("k" + std::to_string(i));
    return layout;
}

// As when the user has been elsewhere in the tree for long.
void forget_everything(const Stage& stage) {
    const QModelIndex hive = stage.key(system_path);
    for (int row = 0; row < stage.model->rowCount(hive); row++) {
        try {
            stage.model->index(row, 0, hive).data();
            RegKey* key = RegModel::editable_key(stage.model->index(row, 0, hive));
            if (key->value_count() == 1)
                key->read_value(0);
        } catch (const std::exception&) {
            // The damaged one.
        }
    }
}

// The key cannot be read any more. What its row in the tree throws has been told.
void lose_alpha(const Stage& stage, Scene& scene) {
    FailureReport::instance().mark_told(row_of_alpha, QStringLiteral("ROpenSubKey failed"));
    scene.damage_key("Alpha");
    forget_everything(stage);
}

void put_back(const Scene& scene, const QByteArray& bytes) {
    QFile file(scene.file());
    QVERIFY(file.open(QIODevice::ReadWrite));
    QCOMPARE(file.write(bytes), bytes.size());
}

// Counts the paints that a widget is asked for.
class PaintCount : public QObject {
public:
    explicit PaintCount(QWidget* widget) { widget->installEventFilter(this); }
    bool eventFilter(QObject* watched, QEvent* event) override {
        paints += event->type() == QEvent::Paint ? 1 : 0;
        return QObject::eventFilter(watched, event);
    }

    int paints = 0;
};

}  // namespace

class LostKeyTest : public QObject {
    Q_OBJECT

private slots:
    // Nothing has been told yet.
    void init() { delete &FailureReport::instance(); }

    // The window system makes a window active, and so the table, past the application's own net.
    void a_table_whose_key_is_lost_is_emptied() {
        Scene scene(large());
        const QByteArray sound = scene.bytes();
        Stage stage(scene);
        stage.select_value(alpha, QStringLiteral("number"));
        QVERIFY(shared_actions().rename_action->isEnabled());
        lose_alpha(stage, scene);
        stage.keys->setFocus();
        // A branch was opened last.
        FailureReport::instance().set_current_key(beta);
        DialogHand hand;
        hand.then_press(QMessageBox::Ok);
        stage.values->setFocus();
        QVERIFY(!shared_actions().rename_action->isEnabled());
        QTRY_VERIFY(hand.is_done());
        QCOMPARE(hand.text, told(alpha, "ROpenSubKey failed"));
        QTRY_COMPARE(stage.values->model()->rowCount(), 0);
        QVERIFY(!shared_actions().new_action_group->isEnabled());
        QVERIFY(!shared_actions().delete_action->isEnabled());
        QVERIFY(hand.nothing_comes());

        // Asked again, it answers again.
        for (int i = 0; i < 2; i++) {
            stage.return_to(*stage.keys);
            hand.then_press(QMessageBox::Ok);
            QTest::keySequence(&stage.window, QKeySequence(QKeySequence::Refresh));
            QTRY_VERIFY(hand.is_done());
            QCOMPARE(hand.text, told(row_of_alpha, "ROpenSubKey failed"));
            QVERIFY(hand.nothing_comes());
        }
        put_back(scene, sound);
        forget_everything(stage);
        stage.return_to(*stage.keys);
        QTest::keySequence(&stage.window, QKeySequence(QKeySequence::Refresh));
        QCOMPARE(stage.value_names(),
                 QStringList({QStringLiteral("(Default)"), QStringLiteral("number"), QStringLiteral("text")}));
        QVERIFY(shared_actions().new_action_group->isEnabled());
        QCOMPARE(scene.bytes(), sound);

        // And lost once more, it is told once more.
        lose_alpha(stage, scene);
        hand.then_press(QMessageBox::Ok);
        stage.values->viewport()->repaint();
        QTRY_VERIFY(hand.is_done());
        QCOMPARE(hand.text, told(alpha, "ROpenSubKey failed"));
        QTRY_COMPARE(stage.values->model()->rowCount(), 0);
    }

    void a_hit_in_a_key_that_was_let_go_of_is_shown() {
        Scene scene(large());
        const QByteArray sound = scene.bytes();
        Stage stage(scene);
        stage.select_key(alpha);
        lose_alpha(stage, scene);
        DialogHand hand;
        hand.then_press(QMessageBox::Ok);
        stage.values->viewport()->repaint();
        QTRY_VERIFY(hand.is_done());
        QTRY_COMPARE(stage.values->model()->rowCount(), 0);
        put_back(scene, sound);
        forget_everything(stage);
        hand.then([](QWidget* dialog) {
            dialog->findChild<QLineEdit*>()->setText(QStringLiteral("text"));
            find_by_text<QCheckBox>(*dialog, QStringLiteral("Find values"))->setChecked(true);
            press(*dialog, QDialogButtonBox::Ok);
        });
        stage.window.show_find_dialog();
        QVERIFY(hand.is_done());
        QCOMPARE(stage.status(), alpha);
        QCOMPARE(stage.values->currentIndex(), stage.value(QStringLiteral("text")));
        QVERIFY(stage.values->currentIndex().isValid());
    }

    void nothing_is_painted_of_a_table_whose_key_is_lost() {
        Scene scene(large());
        Stage stage(scene);
        stage.select_key(alpha);
        lose_alpha(stage, scene);
        DialogHand hand;
        hand.then_press(QMessageBox::Ok);
        // An exception that passes a paint event leaves its painter open, which the next one is warned of.
        QTest::failOnWarning(QRegularExpression(QStringLiteral("paint")));
        stage.values->horizontalHeader()->viewport()->repaint();
        stage.values->viewport()->repaint();
        QTRY_VERIFY(hand.is_done());
        QTRY_COMPARE(stage.values->model()->rowCount(), 0);
        stage.window.repaint();
        QVERIFY(hand.nothing_comes());
    }

    void what_was_not_painted_for_a_failure_that_has_passed_is_painted_then() {
        Scene scene(large());
        const QByteArray sound = scene.bytes();
        Stage stage(scene);
        stage.select_key(alpha);
        QCoreApplication::processEvents();
        QWidget* header = stage.values->horizontalHeader()->viewport();
        for (QWidget* part : {header, stage.values->viewport()}) {
            lose_alpha(stage, scene);
            // No box: what one covers is painted again for it.
            FailureReport::instance().mark_told(alpha, QStringLiteral("ROpenSubKey failed"));
            part->repaint();
            put_back(scene, sound);
            forget_everything(stage);
            PaintCount count(part);
            QTRY_VERIFY(count.paints > 0);
            QCOMPARE(stage.values->model()->rowCount(), 3);
        }
    }

    void a_gesture_in_the_table_is_about_the_key_that_it_shows_data() {
        QTest::addColumn<bool>("is_new");
        QTest::newRow("new") << true;
        QTest::newRow("delete") << false;
    }

    // What was pressed last in the tree has nothing to do with it. And no question comes about a row that is not seen.
    void a_gesture_in_the_table_is_about_the_key_that_it_shows() {
        QFETCH(bool, is_new);
        Scene scene(large());
        Stage stage(scene);
        stage.select_value(alpha, QStringLiteral("number"));
        lose_alpha(stage, scene);
        const QByteArray before = scene.bytes();
        FailureReport::instance().set_current_key(beta);
        DialogHand hand;
        hand.then_press(QMessageBox::Ok);
        (is_new ? shared_actions().new_dword_action : shared_actions().delete_action)->trigger();
        QVERIFY(hand.is_done());
        QCOMPARE(hand.text, told(alpha, "ROpenSubKey failed"));
        QVERIFY(hand.nothing_comes());
        QCOMPARE(scene.bytes(), before);
    }

    void typing_in_the_table_passes_over_what_cannot_be_read() {
        testkit::HiveLayout layout;
        testkit::KeyLayout& key = layout.root.add("Alpha");
        for (const char* name : {"about", "damaged", "query", "quick"})
            key.set(name, 4, testkit::pattern(4));
        layout.root.add("Beta");
        Scene scene(layout);
        scene.damage_value("Alpha", 1);
        DialogHand hand;
        hand.then_press(QMessageBox::Ok);
        for (const int column : {0, 1, 2}) {
            Stage stage(scene);
            stage.select_key(alpha);
            QTRY_VERIFY(hand.is_done());
            FailureReport::instance().set_current_key(beta);
            stage.values->setFocus();
            stage.values->setCurrentIndex(stage.value(QStringLiteral("about"), column));
            QTest::keyClicks(stage.values, QStringLiteral("qui"));
            QCOMPARE(stage.values->currentIndex(), stage.value(QStringLiteral("quick")));
        }
        // One letter again and again goes round.
        Stage stage(scene);
        stage.select_value(alpha, QStringLiteral("about"));
        for (const char* name : {"query", "quick", "query"}) {
            QTest::keyClick(stage.values, Qt::Key_Q);
            QCOMPARE(stage.values->currentIndex(), stage.value(QLatin1String(name)));
        }
        QVERIFY(hand.nothing_comes());
    }

    // What a key below has thrown says nothing of this one.
    void a_damaged_value_is_told_of_a_key_above_one_that_has_another() {
        testkit::HiveLayout layout;
        testkit::KeyLayout& key = layout.root.add("Alpha");
        key.set("damaged", 4, testkit::pattern(4));
        key.add("Deep").set("damaged", 4, testkit::pattern(4));
        const Scene scene(layout, [](testkit::LaidHive& hive) {
            hive.put16(hive.at("Alpha").values.at(0).record, 0, 0x7878);
            hive.put16(hive.at("Alpha\\Deep").values.at(0).record, 0, 0x7878);
        });
        Stage stage(scene);
        for (const QString& shown : {alpha + QStringLiteral("\\Deep"), alpha}) {
            DialogHand hand;
            hand.then_press(QMessageBox::Ok);
            stage.select_key(shown);
            QTRY_VERIFY(hand.is_done());
            QCOMPARE(hand.text, told(shown, "index"));
            QVERIFY(hand.nothing_comes());
        }
    }

    // Its row says nothing of itself, and it was the user who went there.
    void a_damaged_value_is_told_however_many_siblings_have_one() {
        constexpr int siblings = 12;
        testkit::HiveLayout layout;
        for (int i = 0; i < siblings; i++)
            layout.root.add("Key" + std::to_string(i)).set("damaged", 4, testkit::pattern(4));
        const Scene scene(layout, [](testkit::LaidHive& hive) {
            for (int i = 0; i < siblings; i++)
                hive.put16(hive.at("Key" + std::to_string(i)).values.at(0).record, 0, 0x7878);
        });
        Stage stage(scene);
        for (int i = 0; i < siblings; i++) {
            const QString shown = system_path + QStringLiteral("\\Key%1").arg(i);
            DialogHand hand;
            hand.then_press(QMessageBox::Ok);
            stage.select_key(shown);
            QTRY_VERIFY(hand.is_done());
            QCOMPARE(hand.text, told(shown, "index"));
        }
    }

    void a_gesture_at_a_row_that_cannot_be_read_is_answered_each_time_data() {
        QTest::addColumn<QAction*>("action");
        QTest::newRow("Rename") << shared_actions().rename_action;
        QTest::newRow("F2") << static_cast<QAction*>(nullptr);
        QTest::newRow("Delete") << shared_actions().delete_action;
    }

    // The row was shown when its key could not be read, and stands for no key.
    void a_gesture_at_a_row_that_cannot_be_read_is_answered_each_time() {
        QFETCH(QAction*, action);
        Scene scene(large());
        const QByteArray sound = scene.bytes();
        scene.damage_key("Alpha\\Deep");
        Stage stage(scene);
        DialogHand hand;
        hand.then_press(QMessageBox::Ok);
        stage.select_key(alpha);
        stage.keys->expand(stage.key(alpha));
        QTRY_VERIFY(hand.is_done());
        put_back(scene, sound);
        forget_everything(stage);
        stage.keys->setCurrentIndex(stage.model->index(0, 0, stage.key(alpha)));
        for (int i = 0; i < 2; i++) {
            stage.return_to(*stage.keys);
            hand.text.clear();
            if (action == shared_actions().delete_action)
                hand.then_press(QMessageBox::Yes);
            hand.then_press(QMessageBox::Ok);
            if (action)
                action->trigger();
            else
                QTest::keyClick(stage.keys, Qt::Key_F2);
            QVERIFY(hand.is_done());
            QCOMPARE(hand.text, told(alpha + QStringLiteral("\\#0"), "ROpenSubKey failed"));
        }
        QVERIFY(hand.nothing_comes());
        QCOMPARE(scene.bytes(), sound);
    }
};

UI_TEST_MAIN(LostKeyTest)
#include "lost_key_test.moc"
