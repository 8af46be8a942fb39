// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT

// What is named, deleted or given a menu is in sight then, wherever the tree or the table was scrolled to and whatever
// branch was closed.
#include "shared_actions.h"
#include "stage.h"
#include "ui_test.h"

#include <QContextMenuEvent>
#include <QLineEdit>
#include <QScrollBar>
#include <QWheelEvent>
#include <QWindow>

namespace {

const QString root = QStringLiteral("MACHINE\\SYSTEM");
const QString services = root + QStringLiteral("\\Services");
const QString disk = services + QStringLiteral("\\Disk");

testkit::HiveLayout many_rows() {
    testkit::HiveLayout layout;
    testkit::KeyLayout& key = layout.root.add("Services");
    for (const char* name : {"Beep", "Dhcp", "Disk", "EventLog"}) {
        key.add(name);
        key.set(std::string("v of ") + name, 4, testkit::pattern(4));
    }
    for (int i = 10; i < 70; i++) {
        key.add("k" + std::to_string(i));
        key.set("w" + std::to_string(i), 4, testkit::pattern(4));
    }
    return layout;
}

// A row of the tree or of the table that is current, and its view, which has the keyboard.
struct CurrentRow {
    CurrentRow(Stage& shown, bool in_table) : stage(shown) {
        stage.keys->expand(stage.key(services));
        if (in_table) {
            stage.select_value(services, QStringLiteral("v of Disk"));
            view = stage.values;
        } else {
            stage.select_key(disk);
            view = stage.keys;
        }
        stage.return_to(*view);
    }

    QString name() const { return view->currentIndex().data().toString(); }

    // By its wheel, until the row has gone.
    void scroll_away() const {
        const QPoint middle = view->viewport()->rect().center();
        for (int turns = 0; is_in_sight(); turns++) {
            QVERIFY(turns < 100);
            QWheelEvent turn(middle, view->viewport()->mapToGlobal(middle), {}, {0, -120}, Qt::NoButton, {},
                             Qt::NoScrollPhase, false);
            QCoreApplication::sendEvent(view->viewport(), &turn);
        }
    }

    // By a click on the arrow of the branch that the key stands in.
    void close_its_branch() const {
        const QRect branch = stage.keys->visualRect(stage.key(services));
        QTest::mouseClick(stage.keys->viewport(), Qt::LeftButton, {},
                          QPoint(branch.left() - stage.keys->indentation() / 2, branch.center().y()));
        QVERIFY(!stage.keys->isExpanded(stage.key(services)));
        QVERIFY(!is_in_sight());
    }

    void hide(const QString& how) const {
        if (how == QStringLiteral("closed"))
            close_its_branch();
        else if (how == QStringLiteral("scrolled"))
            scroll_away();
    }

    bool is_in_sight() const {
        const QRect row = view->visualRect(view->currentIndex());
        const QRect all = view->viewport()->rect();
        return !row.isEmpty() && all.contains(row.left() + 1, row.top()) && all.contains(row.left() + 1, row.bottom());
    }

    // And highlighted.
    bool is_seen() const { return is_in_sight() && view->selectionModel()->isSelected(view->currentIndex()); }

    Stage& stage;
    QAbstractItemView* view;
};

QLineEdit* editor_in(const QAbstractItemView& view) {
    for (QLineEdit* editor : view.viewport()->findChildren<QLineEdit*>()) {
        if (!editor->isHidden())
            return editor;
    }
    return nullptr;
}

// As the window system sends it, without a place: the window asks the widget that has the keyboard for one.
void press_menu_key(const Stage& stage) {
    QContextMenuEvent event(QContextMenuEvent::Keyboard, QPoint(), QPoint());
    QCoreApplication::sendEvent(stage.window.windowHandle(), &event);
}

void add_hidden_rows() {
    QTest::addColumn<bool>("in_table");
    QTest::addColumn<QString>("hidden");
    QTest::newRow("a key in a closed branch") << false << "closed";
    QTest::newRow("a key that was scrolled away") << false << "scrolled";
    QTest::newRow("a value that was scrolled away") << true << "scrolled";
}

}  // namespace

class OutOfSightTest : public QObject {
    Q_OBJECT

private slots:
    void a_name_is_typed_in_sight_data() { add_hidden_rows(); }

    void a_name_is_typed_in_sight() {
        QFETCH(const bool, in_table);
        QFETCH(const QString, hidden);
        for (const bool by_key : {true, false}) {
            const Scene scene(many_rows());
            Stage stage(scene);
            const CurrentRow row(stage, in_table);
            row.hide(hidden);
            if (by_key)
                QTest::keyClick(row.view, Qt::Key_F2);
            else
                shared_actions().rename_action->trigger();
            QLineEdit* editor = editor_in(*row.view);
            QVERIFY(editor);
            QCOMPARE(QApplication::focusWidget(), editor);
            QVERIFY(row.is_seen());
            QVERIFY(row.view->viewport()->rect().contains(editor->geometry().center()));
            QVERIFY(row.view->visualRect(row.view->currentIndex()).contains(editor->geometry().center()));
            QTest::keyClicks(editor, QStringLiteral("named"));
            QTest::keyClick(editor, Qt::Key_Return);
            QTRY_COMPARE(row.name(), QStringLiteral("named"));
        }
    }

    void what_is_asked_about_is_seen_data() { add_hidden_rows(); }

    void what_is_asked_about_is_seen() {
        QFETCH(const bool, in_table);
        QFETCH(const QString, hidden);
        const Scene scene(many_rows());
        Stage stage(scene);
        const CurrentRow row(stage, in_table);
        row.hide(hidden);
        bool was_seen = false;
        DialogHand hand;
        hand.then([&](QWidget* question) {
            was_seen = row.is_seen();
            QTest::keyClick(question, Qt::Key_Escape);
        });
        QTest::keyClick(row.view, Qt::Key_Delete);
        QVERIFY(hand.is_done());
        QVERIFY(was_seen);
    }

    // The keyboard comes to the table by Tab, which makes its first row current without a highlight.
    void what_is_asked_about_is_highlighted_also_where_the_keyboard_has_just_come() {
        const Scene scene(many_rows());
        Stage stage(scene);
        stage.select_key(services);
        stage.return_to(*stage.keys);
        QTest::keyClick(stage.keys, Qt::Key_Tab);
        QVERIFY(stage.values->hasFocus());
        bool was_seen = false;
        DialogHand hand;
        hand.then([&](QWidget* question) {
            was_seen = stage.values->selectionModel()->isSelected(stage.values->currentIndex());
            QTest::keyClick(question, Qt::Key_Escape);
        });
        shared_actions().delete_action->trigger();
        QVERIFY(hand.is_done());
        QVERIFY(was_seen);
    }

    // The cells beside the name become current by a click, but cannot be highlighted.
    void the_name_of_the_value_that_is_asked_about_is_highlighted() {
        const Scene scene(many_rows());
        Stage stage(scene);
        const CurrentRow row(stage, true);
        const QModelIndex name = stage.values->currentIndex();
        for (const int column : {1, 2}) {
            stage.return_to(*stage.values);
            stage.values->setCurrentIndex(name.siblingAtColumn(column));
            QModelIndexList highlighted;
            DialogHand hand;
            hand.then([&](QWidget* question) {
                highlighted = stage.values->selectionModel()->selectedIndexes();
                QTest::keyClick(question, Qt::Key_Escape);
            });
            QTest::keyClick(stage.values, Qt::Key_Delete);
            QVERIFY(hand.is_done());
            QCOMPARE(highlighted, QModelIndexList{name});
            QVERIFY(row.is_seen());
        }
    }

    void the_menu_key_is_about_the_current_row_data() {
        add_hidden_rows();
        QTest::newRow("a key in sight") << false << "no";
        QTest::newRow("a value in sight") << true << "no";
    }

    void the_menu_key_is_about_the_current_row() {
        QFETCH(const bool, in_table);
        QFETCH(const QString, hidden);
        const Scene scene(many_rows());
        Stage stage(scene);
        const CurrentRow row(stage, in_table);
        row.hide(hidden);
        const auto look = [&](QMenu& menu) {
            const QString all = texts_of(menu).join(QLatin1Char(' '));
            QCOMPARE(all, in_table ? QStringLiteral("Edit Delete Rename") : QStringLiteral("New Delete Rename"));
            QVERIFY(row.is_seen());
            QCOMPARE(row.view->indexAt(row.view->viewport()->mapFromGlobal(menu.pos())), row.view->currentIndex());
            QCOMPARE(menu.actions()[2], shared_actions().rename_action);
            QVERIFY(menu.actions()[2]->isEnabled());
        };
        QVERIFY(with_menu([&] { press_menu_key(stage); }, look));
    }

    void the_menu_key_makes_new_values_where_none_is_current() {
        const Scene scene(many_rows());
        Stage stage(scene);
        stage.select_key(root);
        stage.return_to(*stage.values);
        stage.values->setCurrentIndex(QModelIndex());
        QStringList all;
        QVERIFY(with_menu([&] { press_menu_key(stage); }, [&](QMenu& menu) { all = texts_of(menu); }));
        QCOMPARE(all, QStringList{QStringLiteral("New")});
    }

    // A row may stand where the window system says that the menu is asked for.
    void the_menu_key_is_about_no_value_where_none_is_current() {
        const Scene scene(many_rows());
        Stage stage(scene);
        const CurrentRow row(stage, true);
        stage.values->setColumnWidth(0, stage.values->width());
        QVERIFY(stage.values->indexAt(stage.values->viewport()->rect().center()).isValid());
        stage.values->setCurrentIndex(QModelIndex());
        QStringList all;
        QVERIFY(with_menu([&] { press_menu_key(stage); }, [&](QMenu& menu) { all = texts_of(menu); }));
        QCOMPARE(all, QStringList{QStringLiteral("New")});
    }

    // The tree's own scrolling goes to its edge, and such a name begins beyond the other.
    void the_name_of_a_deep_key_is_typed_in_sight_data() {
        QTest::addColumn<Qt::LayoutDirection>("direction");
        QTest::newRow("left to right") << Qt::LeftToRight;
        QTest::newRow("right to left") << Qt::RightToLeft;
    }

    void the_name_of_a_deep_key_is_typed_in_sight() {
        QFETCH(const Qt::LayoutDirection, direction);
        constexpr int levels = 25;
        testkit::HiveLayout layout;
        testkit::KeyLayout* step = &layout.root;
        for (int i = 0; i < levels; i++)
            step = &step->add("step");
        const Scene scene(layout);
        Stage stage(scene);
        stage.keys->setLayoutDirection(direction);
        const QString deepest = root + QStringLiteral("\\step").repeated(levels);
        stage.select_key(deepest);
        stage.return_to(*stage.keys);
        const auto is_in_sight = [&] {
            const QWidget* editor = editor_in(*stage.keys);
            const QRect row = stage.keys->visualRect(stage.keys->currentIndex());
            return editor && stage.keys->viewport()->rect().contains(row) && row.contains(editor->geometry().center());
        };
        QScrollBar* sideways = stage.keys->horizontalScrollBar();
        for (const int scrolled_to : {sideways->minimum(), sideways->maximum()}) {
            sideways->setValue(scrolled_to);
            QTest::keyClick(stage.keys, Qt::Key_F2);
            QVERIFY(is_in_sight());
            QTest::keyClick(editor_in(*stage.keys), Qt::Key_Escape);
            QTRY_VERIFY(stage.keys->hasFocus());
        }
        sideways->setValue(sideways->minimum());
        shared_actions().new_key_action->trigger();
        QCOMPARE(stage.status(), deepest + QStringLiteral("\\New Key #1"));
        QVERIFY(is_in_sight());
    }
};

UI_TEST_MAIN(OutOfSightTest)
#include "out_of_sight_test.moc"
