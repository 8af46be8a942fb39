// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT

// What the hand and the eye take for one thing stays one: the row under the pointer, the row that is highlighted, the
// text that is shown.
#include "failure_report.h"
#include "shared_actions.h"
#include "stage.h"
#include "ui_test.h"
#include "values_model.h"

#include <QAction>
#include <QApplication>
#include <QClipboard>
#include <QHelpEvent>
#include <QLineEdit>
#include <QMetaEnum>
#include <QMouseEvent>
#include <QRegularExpression>
#include <QScrollBar>
#include <QStyledItemDelegate>
#include <QTest>
#include <QToolTip>
#include <QWindow>

namespace {

const QString alpha = QStringLiteral("MACHINE\\SYSTEM\\Alpha");

testkit::HiveLayout many_keys() {
    testkit::HiveLayout layout;
    testkit::KeyLayout& services = layout.root.add("Services");
    for (const char* name : {"Beep", "Dhcp", "Disk", "EventLog", "Ntfs", "cdrom"})
        services.add(name).add("Parameters");
    services.add("*").set("v", 4, testkit::pattern(4));
    services.add("-x");
    for (int i = 10; i < 60; i++)
        services.add("k" + std::to_string(i));
    return layout;
}

const QString services = QStringLiteral("MACHINE\\SYSTEM\\Services");

// As the application object asks it, before the press goes anywhere.
bool is_taken(KeysView& keys, QPoint point, Qt::MouseButton button = Qt::LeftButton) {
    const QPointF global = keys.viewport()->mapToGlobal(point);
    return keys.take_mouse_from_naming(QMouseEvent(QEvent::MouseButtonPress, point, global, button, button, {}));
}

QString below(const char* name) { return services + QLatin1Char('\\') + QLatin1String(name); }

}  // namespace

class GesturesTest : public QObject {
    Q_OBJECT

private slots:
    // A tree that scrolls while the button goes down has another row under the pointer than the one that was pressed.
    void a_right_press_on_a_row_that_is_cut_off_is_about_that_row() {
        const Scene scene(many_keys());
        Stage stage(scene);
        stage.keys->expand(stage.key(services));
        stage.select_key(services);
        stage.keys->verticalScrollBar()->setValue(0);
        const int row_height = stage.keys->visualRect(stage.key(services)).height();
        // The window ends in the midst of a row.
        int missing = 0;
        QModelIndex cut;
        for (int height = stage.window.height(); missing == 0; height -= row_height / 3) {
            stage.window.resize(stage.window.width(), height);
            QCoreApplication::processEvents();
            const int bottom = stage.keys->viewport()->height() - 2;
            cut = stage.keys->indexAt(QPoint(60, bottom));
            QVERIFY(cut.isValid());
            missing = stage.keys->visualRect(cut).bottom() > bottom + 2 ? 1 : 0;
        }
        const QPoint pressed(stage.keys->visualRect(cut).left() + 20, stage.keys->viewport()->height() - 2);
        QCOMPARE(stage.keys->indexAt(pressed), cut);
        QTest::mousePress(stage.keys->viewport(), Qt::RightButton, {}, pressed);
        QCOMPARE(stage.keys->currentIndex(), cut);
        QCOMPARE(stage.keys->indexAt(pressed), cut);
    }

    // The naming ends before the press, and the rows that it moves are not what was pressed.
    void a_press_that_ends_a_naming_is_about_the_key_that_stood_there_data() {
        QTest::addColumn<Qt::MouseButton>("button");
        QTest::newRow("left") << Qt::LeftButton;
        QTest::newRow("right") << Qt::RightButton;
    }

    void a_press_that_ends_a_naming_is_about_the_key_that_stood_there() {
        QFETCH(Qt::MouseButton, button);
        const Scene scene(many_keys());
        Stage stage(scene);
        stage.keys->expand(stage.key(services));
        stage.select_key(below("cdrom"));
        stage.keys->setFocus();
        shared_actions().rename_action->trigger();
        auto* editor = stage.keys->viewport()->findChild<QLineEdit*>();
        QVERIFY(editor);
        editor->setText(QStringLiteral("Zzz"));
        const QModelIndex meant = stage.key(below("EventLog"));
        const QPoint point = stage.keys->visualRect(meant).center();
        QVERIFY(is_taken(*stage.keys, point, button));
        QCOMPARE(stage.status(), below("EventLog"));
        QVERIFY(stage.keys->indexAt(point) != stage.keys->currentIndex());
        QVERIFY(stage.key(below("Zzz")).isValid());
        // The menu that comes with a right press would stand over another key. The next is one that was asked for.
        if (button == Qt::RightButton)
            QVERIFY(!with_context_menu(*stage.keys, point, [](QMenu&) {}));
        QVERIFY(with_context_menu(*stage.keys, point, [](QMenu&) {}));
    }

    // The press has moved the rows: the pointer stands on another key than the one that was meant, also while the
    // button is held, and when it goes down again at once.
    void a_gesture_that_ends_a_naming_is_about_the_key_that_stood_there_data() {
        QTest::addColumn<QString>("gesture");
        QTest::newRow("a click") << "click";
        QTest::newRow("a click that moves") << "drag";
        QTest::newRow("a double click") << "double click";
    }

    void a_gesture_that_ends_a_naming_is_about_the_key_that_stood_there() {
        QFETCH(const QString, gesture);
        const Scene scene(many_keys());
        Stage stage(scene);
        stage.keys->expand(stage.key(services));
        stage.select_key(below("Beep"));
        stage.return_to(*stage.keys);
        // The mouse's own way, by the window.
        QWindow* const window = stage.window.windowHandle();
        const auto middle_of = [&](const char* name) {
            return stage.keys->viewport()->mapTo(&stage.window,
                                                 stage.keys->visualRect(stage.key(below(name))).center());
        };
        QTest::keyClick(stage.keys, Qt::Key_F2);
        stage.keys->viewport()->findChild<QLineEdit*>()->setText(QStringLiteral("zz"));
        const QPoint point = middle_of("Dhcp");
        if (gesture == QStringLiteral("double click")) {
            QTest::mouseDClick(window, Qt::LeftButton, {}, point);
        } else {
            QTest::mousePress(window, Qt::LeftButton, {}, point);
            QCOMPARE(stage.status(), below("Dhcp"));
            if (gesture == QStringLiteral("drag")) {
                QTest::mouseMove(window, point + QPoint(1, 0));
                QTest::mouseMove(window, middle_of("k10"));
            }
            QTest::mouseRelease(window, Qt::LeftButton, {}, point);
        }
        QVERIFY(stage.key(below("zz")).isValid());
        QVERIFY(middle_of("Dhcp") != point);
        const auto is_current = [&](const char* name) {
            return stage.keys->selectionModel()->selectedIndexes() == QModelIndexList{stage.key(below(name))} &&
                   stage.status() == below(name);
        };
        QVERIFY2(is_current("Dhcp"), qPrintable(stage.status()));
        QVERIFY(!stage.keys->isExpanded(stage.keys->indexAt(stage.keys->viewport()->mapFrom(&stage.window, point))));

        // And it is over: the mouse that passes selects nothing, and what is pressed next is pressed.
        QTest::mouseMove(window, middle_of("k10"));
        QVERIFY(is_current("Dhcp"));
        QTest::mouseClick(window, Qt::LeftButton, {}, middle_of("EventLog"));
        QVERIFY(is_current("EventLog"));
        QTest::mouseMove(window, middle_of("k10"));
        QVERIFY(is_current("EventLog"));
        QTest::mouseDClick(window, Qt::LeftButton, {}, middle_of("EventLog"));
        QVERIFY(stage.keys->isExpanded(stage.key(below("EventLog"))));
    }

    void an_arrow_key_that_ends_a_naming_leads_to_the_key_that_stood_there_data() {
        QTest::addColumn<Qt::Key>("key");
        for (const Qt::Key key : {Qt::Key_Down, Qt::Key_Up, Qt::Key_PageDown})
            QTest::addRow("%s", QMetaEnum::fromType<Qt::Key>().valueToKey(key)) << key;
    }

    void an_arrow_key_that_ends_a_naming_leads_to_the_key_that_stood_there() {
        QFETCH(const Qt::Key, key);
        const Scene scene(many_keys());
        Stage stage(scene);
        stage.keys->expand(stage.key(services));
        stage.select_key(below("Disk"));
        stage.return_to(*stage.keys);
        const int scrolled_to = stage.keys->verticalScrollBar()->value();
        QTest::keyClick(stage.keys, key);
        const QString meant = stage.status();
        QVERIFY(meant != below("Disk"));
        stage.select_key(below("Disk"));
        stage.keys->verticalScrollBar()->setValue(scrolled_to);
        QTest::keyClick(stage.keys, Qt::Key_F2);
        auto* editor = stage.keys->viewport()->findChild<QLineEdit*>();
        QVERIFY(editor);
        editor->setText(QStringLiteral("zz"));
        QTest::keyClick(editor, key);
        QTRY_VERIFY(stage.key(below("zz")).isValid());
        QCOMPARE(stage.status(), meant);
        QCOMPARE(stage.keys->selectionModel()->selectedIndexes(), QModelIndexList{stage.key(meant)});
    }

    // Delete and Rename are about the current row, which shows by its highlight.
    void the_current_row_keeps_its_highlight() {
        const Scene scene;
        Stage stage(scene);
        stage.keys->expand(stage.key(alpha));
        stage.select_value(alpha + QStringLiteral("\\Deep"), QStringLiteral("b"));
        for (QAbstractItemView* view :
             {static_cast<QAbstractItemView*>(stage.keys), static_cast<QAbstractItemView*>(stage.values)}) {
            stage.return_to(*view);
            const QModelIndexList current{view->currentIndex()};
            QCOMPARE(view->selectionModel()->selectedIndexes(), current);
            QTest::mouseClick(view->viewport(), Qt::LeftButton, Qt::ControlModifier,
                              view->visualRect(view->currentIndex()).center());
            QCOMPARE(view->selectionModel()->selectedIndexes(), current);
            QTest::keyClick(view, Qt::Key_Space, Qt::ControlModifier);
            QCOMPARE(view->selectionModel()->selectedIndexes(), current);
            QTest::mouseClick(view->viewport(), Qt::LeftButton, {},
                              view->viewport()->rect().bottomLeft() + QPoint(5, -5));
            QCOMPARE(view->selectionModel()->selectedIndexes(), current);
            QCOMPARE(view->currentIndex(), current.first());
        }
    }

    // As an assistive program does it.
    void a_key_that_is_selected_becomes_current() {
        const Scene scene;
        Stage stage(scene);
        stage.select_key(alpha + QStringLiteral("\\Deep"));
        const QModelIndex key = stage.key(alpha + QStringLiteral("\\Zeta"));
        stage.keys->selectionModel()->select(key, QItemSelectionModel::ClearAndSelect);
        QTRY_COMPARE(stage.keys->currentIndex(), key);
        QCOMPARE(stage.status(), alpha + QStringLiteral("\\Zeta"));
    }

    // Letters that take no room leave an empty cell, which must say that there is more.
    void a_text_that_a_cell_cuts_is_whole_in_its_tip_whatever_room_its_letters_take() {
        testkit::HiveLayout layout;
        testkit::KeyLayout& run = layout.root.add("Run");
        testkit::Bytes narrow;
        for (int i = 0; i < 300; i++)
            narrow.insert(narrow.end(), {0x0b, 0x20});  // U+200B
        const testkit::Bytes behind = testkit::text_data("C:\\evil.exe");
        narrow.insert(narrow.end(), behind.begin(), behind.end());
        run.set("narrow", 1, narrow);
        run.set("short", 1, testkit::text_data("x"));
        run.set("bytes", 3, testkit::Bytes(334, 0xab));
        const Scene scene(layout);
        Stage stage(scene);
        stage.select_key(QStringLiteral("MACHINE\\SYSTEM\\Run"));
        stage.values->setColumnWidth(ValuesModel::DataColumn, 400);
        const auto tip_of = [&](const char* name) {
            const QPoint point =
                stage.values->visualRect(stage.value(QLatin1String(name), ValuesModel::DataColumn)).center();
            QHelpEvent asked(QEvent::ToolTip, point, stage.values->viewport()->mapToGlobal(point));
            QApplication::sendEvent(stage.values->viewport(), &asked);
            return QToolTip::isVisible() ? QToolTip::text() : QString();
        };
        QCOMPARE(tip_of("short"), QString());
        const QString tip = tip_of("narrow");
        QVERIFY2(tip.contains(QStringLiteral("C:\\evil.exe")), qPrintable(tip));
        // One that is cut as well says so, and does not end in half a byte as if that were all.
        QVERIFY(!tip.contains(QChar(0x2026)));
        const QString bytes = tip_of("bytes");
        QVERIFY2(bytes.contains(QStringLiteral("a\u2026")), qPrintable(bytes.right(30)));
    }

    // It may have chosen Delete in a menu.
    void return_held_down_does_not_answer_the_question_that_it_has_opened() {
        const Scene scene;
        Stage stage(scene);
        stage.select_key(QStringLiteral("MACHINE\\SYSTEM\\Alpha\\Deep"));
        const QByteArray before = scene.bytes();
        QTest::keyClick(stage.keys, Qt::Key_Return);
        DialogHand hand;
        hand.then([](QWidget* dialog) {
            QAbstractButton* yes = qobject_cast<QMessageBox*>(dialog)->button(QMessageBox::Yes);
            QKeyEvent repeated(QEvent::KeyPress, Qt::Key_Return, Qt::NoModifier, QStringLiteral("\r"), true);
            QApplication::sendEvent(yes, &repeated);
            QVERIFY(dialog->isVisible());
            QTest::keyClick(dialog, Qt::Key_Escape);
        });
        shared_actions().delete_action->trigger();
        QVERIFY(hand.is_done());
        QCOMPARE(scene.bytes(), before);
    }

    // A tip that shows hangs below its view, as an editor does, and what leads away from the row closes editors.
    void a_tip_is_taken_for_no_editor() {
        testkit::HiveLayout layout;
        layout.root.add("Run").set("long", 1, testkit::text_data(std::string(300, 'x')));
        const Scene scene(layout);
        Stage stage(scene);
        stage.select_key(QStringLiteral("MACHINE\\SYSTEM\\Run"));
        const QPoint point =
            stage.values->visualRect(stage.value(QStringLiteral("long"), ValuesModel::DataColumn)).center();
        QHelpEvent asked(QEvent::ToolTip, point, stage.values->viewport()->mapToGlobal(point));
        QApplication::sendEvent(stage.values->viewport(), &asked);
        QVERIFY(QToolTip::isVisible());
        QTest::failOnWarning(QRegularExpression(QStringLiteral("editor")));
        stage.select_key(QStringLiteral("MACHINE\\SYSTEM"));
        QVERIFY(QToolTip::isVisible());
    }

    void a_press_beside_a_naming_that_moves_nothing_goes_on() {
        const Scene scene(many_keys());
        Stage stage(scene);
        stage.keys->expand(stage.key(services));
        const QPoint point = stage.keys->visualRect(stage.key(below("Beep"))).center();
        QVERIFY(!is_taken(*stage.keys, point));
        stage.select_key(below("cdrom"));
        stage.keys->setFocus();
        shared_actions().rename_action->trigger();
        QVERIFY(!is_taken(*stage.keys, point));
        QVERIFY(!stage.keys->viewport()->findChild<QLineEdit*>() ||
                stage.keys->viewport()->findChild<QLineEdit*>()->isHidden());
    }

    // What is typed next is not the next row's.
    void tab_ends_a_naming_where_it_is() {
        for (const Qt::Key key : {Qt::Key_Tab, Qt::Key_Backtab}) {
            const Scene scene(many_keys());
            Stage stage(scene);
            stage.keys->expand(stage.key(services));
            stage.select_key(below("Disk"));
            stage.keys->setFocus();
            shared_actions().rename_action->trigger();
            auto* editor = stage.keys->viewport()->findChild<QLineEdit*>();
            editor->setText(QStringLiteral("Disc"));
            QTest::keyClick(editor, key);
            QTRY_COMPARE(stage.status(), below("Disc"));
            QVERIFY(editor->isHidden());
            for (const QLineEdit* other : stage.keys->viewport()->findChildren<QLineEdit*>())
                QVERIFY(other->isHidden());
        }
        const Scene scene;
        Stage stage(scene);
        stage.select_key(alpha);
        stage.values->setFocus();
        const QModelIndex named = stage.value(QStringLiteral("reversed"));
        stage.values->setCurrentIndex(named);
        shared_actions().rename_action->trigger();
        auto* editor = stage.values->viewport()->findChild<QLineEdit*>();
        editor->setText(QStringLiteral("turned"));
        QTest::keyClick(editor, Qt::Key_Backtab);
        QCOMPARE(stage.values->currentIndex(), stage.value(QStringLiteral("turned")));
    }

    void the_keys_that_open_and_close_branches_select_none() {
        const Scene scene(many_keys());
        Stage stage(scene);
        stage.keys->expand(stage.key(services));
        stage.select_key(below("Beep"));
        for (const Qt::Key key : {Qt::Key_Asterisk, Qt::Key_Minus, Qt::Key_Plus}) {
            QTest::keyClick(stage.keys, key);
            QCOMPARE(stage.status(), below("Beep"));
            QCOMPARE(stage.keys->isExpanded(stage.key(below("Beep"))), key != Qt::Key_Minus);
        }
    }

    void what_is_copied_is_what_is_shown() {
        const Scene scene;
        Stage stage(scene);
        stage.select_key(alpha);
        for (int row = 0; row < stage.values->model()->rowCount(); row++) {
            for (int column = 0; column < 3; column++) {
                stage.values->setCurrentIndex(stage.values->model()->index(row, column));
                QApplication::clipboard()->setText(QStringLiteral("before"));
                QTest::keyClick(stage.values, Qt::Key_C, Qt::ControlModifier);
                const QVariant datum = stage.values->currentIndex().data();
                auto* delegate = qobject_cast<QStyledItemDelegate*>(stage.values->itemDelegate());
                QCOMPARE(QApplication::clipboard()->text(), delegate->displayText(datum, QLocale()));
            }
        }
    }

    void a_key_that_is_clicked_again_has_its_actions_back() {
        const Scene scene;
        Stage stage(scene);
        stage.select_value(alpha + QStringLiteral("\\Leaf"), QStringLiteral("(Default)"));
        QVERIFY(!shared_actions().rename_action->isEnabled());
        QTest::mouseClick(stage.keys->viewport(), Qt::LeftButton, {},
                          stage.keys->visualRect(stage.keys->currentIndex()).center());
        stage.keys->setFocus();
        QVERIFY(shared_actions().rename_action->isEnabled());
        stage.values->setFocus();
        QVERIFY(!shared_actions().rename_action->isEnabled());
    }

    void a_key_that_got_another_name_stays_in_sight() {
        const Scene scene(many_keys());
        Stage stage(scene);
        stage.keys->expand(stage.key(services));
        stage.select_key(below("k59"));
        stage.keys->setFocus();
        shared_actions().rename_action->trigger();
        stage.keys->viewport()->findChild<QLineEdit*>()->setText(QStringLiteral("A first one"));
        QTest::keyClick(stage.keys->viewport()->findChild<QLineEdit*>(), Qt::Key_Return);
        QTRY_COMPARE(stage.status(), below("A first one"));
        QTRY_VERIFY(
            stage.keys->viewport()->rect().contains(stage.keys->visualRect(stage.keys->currentIndex()).center()));
    }

    // What was pressed last in the tree has nothing to do with it.
    void what_goes_wrong_in_the_table_is_about_the_key_whose_values_it_shows() {
        testkit::HiveLayout layout;
        testkit::KeyLayout& key = layout.root.add("Alpha");
        key.set("sound", 4, testkit::pattern(4));
        key.set("damaged", 4, testkit::pattern(4));
        key.add("Deep").add("Deeper");
        Scene scene(layout);
        scene.damage_value("Alpha", 1);
        Stage stage(scene);
        DialogHand hand;
        hand.then_press(QMessageBox::Ok);
        stage.select_key(alpha);
        QTRY_VERIFY(hand.is_done());
        QCOMPARE(hand.text, QStringLiteral("The key \"%1\" cannot be read: index").arg(alpha));
        FailureReport::instance().set_current_key(alpha + QStringLiteral("\\Deep"));
        for (int row = 0; row < stage.values->model()->rowCount(); row++) {
            const QPoint point = stage.values->visualRect(stage.values->model()->index(row, 0)).center();
            QHelpEvent asked(QEvent::ToolTip, point, stage.values->viewport()->mapToGlobal(point));
            QApplication::sendEvent(stage.values->viewport(), &asked);
        }
        QVERIFY2(hand.nothing_comes(), "told a second time, of another key");
        // Who asks for a copy or an editor is answered, and keeps what was copied before.
        const QModelIndex damaged = stage.values->model()->index(1, 0);
        QApplication::clipboard()->setText(QStringLiteral("before"));
        stage.values->setCurrentIndex(damaged.siblingAtColumn(1));
        const auto copy = [&] { QTest::keySequence(stage.values, QKeySequence::Copy); };
        const auto open = [&] { stage.values->value_double_clicked(damaged); };
        const auto press = [&] {
            stage.values->setCurrentIndex(damaged);
            QTest::keyClick(stage.values, Qt::Key_F2);
        };
        const auto pick = [&] {
            stage.return_to(*stage.values);
            shared_actions().rename_action->trigger();
        };
        for (const auto& gesture : std::vector<std::function<void()>>{copy, open, press, pick}) {
            hand.text.clear();
            hand.then_press(QMessageBox::Ok);
            gesture();
            QVERIFY(hand.is_done());
            QCOMPARE(hand.text, QStringLiteral("The key \"%1\" cannot be read: index").arg(alpha));
        }
        QCOMPARE(QApplication::clipboard()->text(), QStringLiteral("before"));
    }
};

UI_TEST_MAIN(GesturesTest)
#include "gestures_test.moc"
