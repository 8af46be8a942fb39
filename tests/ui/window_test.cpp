// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
// The main window: menus, the states of the shared actions, the status text, the splitter's place, damaged
// keys.

#include "failure_report.h"
#include "shared_actions.h"
#include "stage.h"
#include "ui_test.h"
#include "values_proxy_model.h"

#include <QAction>
#include <QActionGroup>
#include <QHeaderView>
#include <QLabel>
#include <QLineEdit>
#include <QMenu>
#include <QMenuBar>
#include <QSplitter>
#include <QStatusBar>
#include <QStyledItemDelegate>
#include <QTextDocument>

namespace {

QMenu* menu_of(const QWidget& bar_or_menu, const QString& title) {
    for (QAction* action : bar_or_menu.actions()) {
        if (action->menu() && action->text() == title)
            return action->menu();
    }
    return nullptr;
}

QAction* action_of(const QMenu& menu, const QString& text) {
    for (QAction* action : menu.actions()) {
        if (action->text() == text)
            return action;
    }
    return nullptr;
}

}  // namespace

class WindowTest : public QObject {
    Q_OBJECT

private slots:
    void before_anything_is_selected_only_the_window_s_own_actions_are_enabled();
    void every_slot_stands_a_missing_model();
    void menus();
    void the_views_are_set_up();
    void actions_by_depth_data();
    void actions_by_depth();
    void actions_by_value_data();
    void actions_by_value();
    void an_emptied_selection_gives_the_actions_back_to_the_key();
    void the_status_follows_a_rename_of_the_current_key_only();
    void a_name_like_markup_stands_in_the_status_as_it_is();
    void refresh_sorts_by_name();
    void no_row_is_current_after_the_key_changed();
    void the_splitter_fills_the_window_data();
    void the_splitter_fills_the_window();
    void a_long_path_does_not_widen_the_window();
    void both_ends_of_a_long_path_are_seen();
    void a_path_that_fits_is_painted_as_it_is();
    void neither_view_can_be_dragged_shut();
    void columns_start_wide_enough();
    void a_damaged_key_is_told_once_and_its_siblings_stay();
    void an_exception_in_a_slot_is_told_and_the_program_goes_on();
    void what_another_program_asks_for_is_not_laid_to_the_current_key();
    void a_name_like_markup_is_told_as_it_is();
    void many_failures_share_a_box();
    void rows_that_come_into_sight_bring_no_endless_row_of_boxes();
    void the_model_may_go_before_the_window();
    void the_model_may_go_while_a_name_is_typed();
    void a_name_of_many_lines_takes_one();
};

void WindowTest::before_anything_is_selected_only_the_window_s_own_actions_are_enabled() {
    const MainWindow window;
    const SharedActions& actions = shared_actions();
    for (const QAction* action : actions.new_action_group->actions())
        QVERIFY2(!action->isEnabled(), qPrintable(action->text()));
    QVERIFY(!actions.delete_action->isEnabled());
    QVERIFY(!actions.rename_action->isEnabled());
    const QMenu& edit_menu = *menu_of(*window.menuBar(), QStringLiteral("&Edit"));
    QVERIFY(action_of(edit_menu, QStringLiteral("Find..."))->isEnabled());
    QVERIFY(action_of(edit_menu, QStringLiteral("Find next"))->isEnabled());
    const QMenu& view_menu = *menu_of(*window.menuBar(), QStringLiteral("&View"));
    QVERIFY(action_of(view_menu, QStringLiteral("Refresh"))->isEnabled());
    const QMenu& file_menu = *menu_of(*window.menuBar(), QStringLiteral("&File"));
    QVERIFY(action_of(file_menu, QStringLiteral("Exit"))->isEnabled());
    QCOMPARE(window.windowTitle(), QStringLiteral("Registry Editor"));
}

void WindowTest::every_slot_stands_a_missing_model() {
    MainWindow window;
    window.update_statusbar();
    window.update_statusbar(QModelIndex(), QModelIndex());
    window.refresh_views();
    window.value_selected(QModelIndex());
    window.value_selected(QModelIndex(), QModelIndex());
    window.show_find_result();
    auto* keys = static_cast<KeysView*>(by_accessible_name(window, QStringLiteral("keys_tree")));
    auto* values = static_cast<ValuesView*>(by_accessible_name(window, QStringLiteral("values_table")));
    window.show();
    QVERIFY(QTest::qWaitForWindowActive(&window));
    for (QWidget* view : std::initializer_list<QWidget*>{keys, values}) {
        view->setFocus();
        keys->run_new_key_action(false);
        keys->run_delete_key_action(false);
        keys->run_rename_key_action(false);
        keys->show_keys_context_menu(QPoint(5, 5));
        values->value_double_clicked(QModelIndex());
        values->run_new_value_action(shared_actions().new_string_action);
        values->run_delete_value_action(false);
        values->run_rename_value_action(false);
        QTest::keyClick(view, Qt::Key_Return);
        QTest::keyClick(view, Qt::Key_F2);
    }
    DialogHand hand;
    hand.then([](QWidget* dialog) { QTest::keyClick(dialog, Qt::Key_Return); });
    window.find_next();
    QVERIFY(hand.is_done());
    window.reload_values(QModelIndex());
    QCOMPARE(values->model()->rowCount(), 0);
    window.set_model(nullptr);
}

void WindowTest::menus() {
    const MainWindow window;
    QStringList titles;
    for (const QAction* action : window.menuBar()->actions())
        titles.append(action->text());
    QCOMPARE(titles.join(QLatin1Char(' ')), QStringLiteral("&File &Edit &View"));
    const QMenu& edit_menu = *menu_of(*window.menuBar(), QStringLiteral("&Edit"));
    QCOMPARE(texts_of(edit_menu).join(QLatin1Char('|')), QStringLiteral("&New|-|Delete|Rename|-|Find...|Find next"));
    const QMenu& new_menu = *menu_of(edit_menu, QStringLiteral("&New"));
    QCOMPARE(texts_of(new_menu).join(QLatin1Char('|')),
             QStringLiteral("Key|-|String Value|Binary Value|DWORD (32-bit) Value|QWORD (64-bit) Value|"
                            "Multi-String Value|Expandable String Value"));
    QCOMPARE(action_of(edit_menu, QStringLiteral("Delete")), shared_actions().delete_action);
    QCOMPARE(shared_actions().delete_action->shortcut(), QKeySequence(QKeySequence::Delete));
    QVERIFY(shared_actions().rename_action->shortcut().isEmpty());
    QCOMPARE(action_of(edit_menu, QStringLiteral("Find..."))->shortcut(), QKeySequence(QKeySequence::Find));
    QCOMPARE(action_of(edit_menu, QStringLiteral("Find next"))->shortcuts(),
             QKeySequence::keyBindings(QKeySequence::FindNext));
    const QMenu& view_menu = *menu_of(*window.menuBar(), QStringLiteral("&View"));
    QCOMPARE(action_of(view_menu, QStringLiteral("Refresh"))->shortcuts(),
             QKeySequence::keyBindings(QKeySequence::Refresh));
    const QMenu& file_menu = *menu_of(*window.menuBar(), QStringLiteral("&File"));
    QVERIFY(action_of(file_menu, QStringLiteral("Exit"))->shortcut().isEmpty());
}

void WindowTest::the_views_are_set_up() {
    const Scene scene;
    Stage stage(scene);
    QCOMPARE(stage.keys->contextMenuPolicy(), Qt::CustomContextMenu);
    QCOMPARE(stage.keys->editTriggers(), QAbstractItemView::EditTriggers(QAbstractItemView::EditKeyPressed));
    QVERIFY(stage.keys->isHeaderHidden());
    QVERIFY(stage.keys->uniformRowHeights());
    QCOMPARE(stage.keys->textElideMode(), Qt::ElideNone);
    QCOMPARE(stage.keys->header()->sectionResizeMode(0), QHeaderView::ResizeToContents);
    QVERIFY(!stage.keys->header()->stretchLastSection());
    QCOMPARE(stage.values->contextMenuPolicy(), Qt::CustomContextMenu);
    QCOMPARE(stage.values->editTriggers(), QAbstractItemView::EditTriggers(QAbstractItemView::EditKeyPressed));
    QCOMPARE(stage.values->selectionBehavior(), QAbstractItemView::SelectItems);
    QCOMPARE(stage.values->selectionMode(), QAbstractItemView::SingleSelection);
    QVERIFY(!stage.values->showGrid());
    QVERIFY(stage.values->verticalHeader()->isHidden());
    const auto* splitter = qobject_cast<QSplitter*>(by_accessible_name(stage.window, QStringLiteral("splitter")));
    QVERIFY(splitter);
    QCOMPARE(splitter->widget(0), stage.keys);
    QCOMPARE(splitter->widget(1), stage.values);
    QCOMPARE(stage.window.centralWidget(), nullptr);
}

void WindowTest::actions_by_depth_data() {
    QTest::addColumn<QString>("path");
    QTest::addColumn<bool>("new_value");
    QTest::addColumn<bool>("new_key");
    QTest::addColumn<bool>("change");
    QTest::addColumn<int>("rows");
    QTest::newRow("depth 0, a group") << "MACHINE" << false << false << false << 0;
    QTest::newRow("depth 1, a hive's root") << "MACHINE\\SYSTEM" << false << false << false << 0;
    QTest::newRow("depth 2") << "MACHINE\\SYSTEM\\Alpha" << true << true << false << 9;
    QTest::newRow("depth 3") << "MACHINE\\SYSTEM\\Alpha\\Deep" << true << true << true << 3;
    QTest::newRow("depth 4") << "MACHINE\\SYSTEM\\Alpha\\Deep\\Deeper" << true << true << true << 1;
}

void WindowTest::actions_by_depth() {
    QFETCH(QString, path);
    QFETCH(bool, new_value);
    QFETCH(bool, new_key);
    QFETCH(bool, change);
    QFETCH(int, rows);
    const Scene scene;
    Stage stage(scene);
    // From a key where everything is enabled and from one where nothing is.
    for (const QString& before : {QStringLiteral("MACHINE\\SYSTEM\\Alpha\\Leaf"), QStringLiteral("MACHINE")}) {
        stage.select_key(before);
        stage.select_key(path);
        QCOMPARE(stage.keys->currentIndex(), stage.key(path));
        QCOMPARE(stage.status(), path);
        const SharedActions& actions = shared_actions();
        QCOMPARE(actions.new_action_group->isEnabled(), new_value);
        QCOMPARE(actions.new_string_action->isEnabled(), new_value);
        QCOMPARE(actions.new_expand_string_action->isEnabled(), new_value);
        QCOMPARE(actions.new_key_action->isEnabled(), new_key);
        QCOMPARE(actions.delete_action->isEnabled(), change);
        QCOMPARE(actions.rename_action->isEnabled(), change);
        QCOMPARE(stage.values->model()->rowCount(), rows);
    }
}

void WindowTest::actions_by_value_data() {
    QTest::addColumn<QString>("name");
    QTest::addColumn<bool>("renamable");
    QTest::newRow("the made-up default value") << "(Default)" << false;
    QTest::newRow("a value") << "text" << true;
    QTest::newRow("a value that cannot be read") << "unreadable" << true;
}

void WindowTest::actions_by_value() {
    QFETCH(QString, name);
    QFETCH(bool, renamable);
    const Scene scene;
    Stage stage(scene);
    const SharedActions& actions = shared_actions();
    stage.select_key(QStringLiteral("MACHINE\\SYSTEM\\Alpha"));
    QVERIFY(!actions.delete_action->isEnabled());
    const QRect cell = stage.values->visualRect(stage.value(name));
    stage.values->scrollTo(stage.value(name));
    QTest::mouseClick(stage.values->viewport(), Qt::LeftButton, {}, cell.center());
    QVERIFY(actions.delete_action->isEnabled());
    QCOMPARE(actions.rename_action->isEnabled(), renamable);
    // By keyboard as well, and back.
    stage.select_key(QStringLiteral("MACHINE\\SYSTEM\\Beta"));
    stage.select_key(QStringLiteral("MACHINE\\SYSTEM\\Alpha"));
    stage.values->setCurrentIndex(stage.value(name));
    QVERIFY(actions.delete_action->isEnabled());
    QCOMPARE(actions.rename_action->isEnabled(), renamable);
}

void WindowTest::an_emptied_selection_gives_the_actions_back_to_the_key() {
    const Scene scene;
    Stage stage(scene);
    stage.select_key(QStringLiteral("MACHINE\\SYSTEM\\Alpha"));
    stage.values->setCurrentIndex(stage.value(QStringLiteral("text")));
    stage.values->setCurrentIndex(QModelIndex());
    QVERIFY(!shared_actions().delete_action->isEnabled());
    QVERIFY(!shared_actions().rename_action->isEnabled());
}

void WindowTest::the_status_follows_a_rename_of_the_current_key_only() {
    const Scene scene;
    Stage stage(scene);
    const QString leaf = QStringLiteral("MACHINE\\SYSTEM\\Alpha\\Leaf");
    stage.select_key(leaf);
    auto* label = stage.window.statusBar()->findChild<QLabel*>();
    label->setText(QStringLiteral("mark"));
    const QModelIndex other = stage.key(QStringLiteral("MACHINE\\SYSTEM\\Alpha\\Zeta"));
    emit stage.model->dataChanged(other, other);
    QCOMPARE(label->text(), QStringLiteral("mark"));
    emit stage.model->dataChanged(stage.key(leaf), stage.key(leaf));
    QCOMPARE(label->text(), leaf);

    // In place, and to another place among the siblings.
    QVERIFY(stage.model->setData(stage.key(leaf), QStringLiteral("Lear"), Qt::EditRole));
    QCOMPARE(stage.status(), QStringLiteral("MACHINE\\SYSTEM\\Alpha\\Lear"));
    stage.keys->setFocus();
    stage.keys->run_rename_key_action(false);
    stage.press_in_editor(QStringLiteral("zz"), Qt::Key_Return);
    QTRY_COMPARE(stage.subkeys(QStringLiteral("MACHINE\\SYSTEM\\Alpha")).join(QLatin1Char(' ')),
                 QStringLiteral("Deep Zeta zz"));
    QTRY_COMPARE(stage.keys->currentIndex().data(Qt::DisplayRole).toString(), QStringLiteral("zz"));
    QTRY_COMPARE(stage.status(), QStringLiteral("MACHINE\\SYSTEM\\Alpha\\zz"));
    // Without the signals of a rename, the new layout alone brings the path up to date.
    label->setText(QStringLiteral("mark"));
    emit stage.model->layoutChanged();
    QCOMPARE(label->text(), QStringLiteral("MACHINE\\SYSTEM\\Alpha\\zz"));
}

void WindowTest::a_name_like_markup_stands_in_the_status_as_it_is() {
    const Scene scene;
    Stage stage(scene);
    stage.select_key(QStringLiteral("MACHINE\\SYSTEM\\Alpha\\Leaf"));
    QVERIFY(stage.model->setData(stage.keys->currentIndex(), QStringLiteral("<b>L</b>&R"), Qt::EditRole));
    stage.window.update_statusbar();
    auto* label = stage.window.statusBar()->findChild<QLabel*>();
    QCOMPARE(label->text(), QStringLiteral("MACHINE\\SYSTEM\\Alpha\\<b>L</b>&R"));
    QCOMPARE(label->textFormat(), Qt::PlainText);
    QTextDocument tip;
    QVERIFY(Qt::mightBeRichText(label->toolTip()));
    tip.setHtml(label->toolTip());
    QCOMPARE(tip.toPlainText(), label->text());
}

void WindowTest::refresh_sorts_by_name() {
    const Scene scene;
    Stage stage(scene);
    stage.select_key(QStringLiteral("MACHINE\\SYSTEM\\Alpha\\Deep"));
    QCOMPARE(stage.value_names().join(QLatin1Char(' ')), QStringLiteral("(Default) A b"));
    QVERIFY(stage.values->model()->setData(stage.value(QStringLiteral("A")), QStringLiteral("c"), Qt::EditRole));
    QCOMPARE(stage.value_names().join(QLatin1Char(' ')), QStringLiteral("(Default) c b"));
    // Whatever the user has asked the table to be sorted by.
    stage.values->model()->sort(2, Qt::DescendingOrder);
    QCOMPARE(stage.value_names().join(QLatin1Char(' ')), QStringLiteral("(Default) b c"));
    QVERIFY(stage.values->model()->setData(stage.value(QStringLiteral("b")), QStringLiteral("d"), Qt::EditRole));
    QCOMPARE(stage.value_names().join(QLatin1Char(' ')), QStringLiteral("(Default) d c"));
    QTest::keySequence(&stage.window, QKeySequence(QKeySequence::Refresh));
    QCOMPARE(stage.value_names().join(QLatin1Char(' ')), QStringLiteral("(Default) c d"));
}

void WindowTest::no_row_is_current_after_the_key_changed() {
    const Scene scene;
    Stage stage(scene);
    stage.select_key(QStringLiteral("MACHINE\\SYSTEM\\Alpha"));
    stage.values->setCurrentIndex(stage.value(QStringLiteral("unreadable")));
    stage.select_key(QStringLiteral("MACHINE\\SYSTEM\\Alpha\\Deep"));
    QVERIFY(!stage.values->currentIndex().isValid());
    QVERIFY(!stage.values->selectionModel()->hasSelection());
    // The new table's selection moves the actions, and the old one's no more: once each.
    stage.values->setCurrentIndex(stage.value(QStringLiteral("A")));
    QVERIFY(shared_actions().rename_action->isEnabled());
    stage.values->setCurrentIndex(stage.value(QStringLiteral("(Default)")));
    QVERIFY(!shared_actions().rename_action->isEnabled());
}

void WindowTest::the_splitter_fills_the_window_data() {
    QTest::addColumn<QSize>("size");
    QTest::newRow("the size at start") << QSize(640, 480);
    QTest::newRow("wide") << QSize(1200, 300);
    QTest::newRow("narrow") << QSize(300, 700);
    QTest::newRow("smaller than its contents") << QSize(50, 50);
}

void WindowTest::the_splitter_fills_the_window() {
    QFETCH(QSize, size);
    const Scene scene;
    Stage stage(scene);
    const QWidget* splitter = by_accessible_name(stage.window, QStringLiteral("splitter"));
    const auto expected = [&] {
        const int top = stage.window.menuBar()->height();
        return QRect(0, top, stage.window.width(), stage.window.height() - top - stage.window.statusBar()->height());
    };
    stage.window.resize(size);
    QTRY_COMPARE(splitter->geometry(), expected());
    // A bar that changes its height moves it as well.
    stage.window.statusBar()->setMinimumHeight(60);
    QTRY_VERIFY(stage.window.statusBar()->height() >= 60);
    QTRY_COMPARE(splitter->geometry(), expected());
    stage.window.resize(size + QSize(40, 40));
    QTRY_COMPARE(splitter->geometry(), expected());
}

void WindowTest::a_long_path_does_not_widen_the_window() {
    const Scene scene;
    Stage stage(scene);
    const QModelIndex leaf = stage.key(QStringLiteral("MACHINE\\SYSTEM\\Alpha\\Leaf"));
    QVERIFY(stage.model->setData(leaf, QString(200, QLatin1Char('W')), Qt::EditRole));
    stage.keys->setCurrentIndex(stage.key(QStringLiteral("MACHINE\\SYSTEM\\Alpha")));
    stage.keys->setCurrentIndex(leaf.siblingAtRow(1));
    QVERIFY(stage.status().contains(QStringLiteral("WWWW")));
    QCoreApplication::sendPostedEvents();
    QCoreApplication::processEvents();
    QCOMPARE(stage.window.width(), 640);
    stage.window.resize(500, 400);
    QTRY_COMPARE(stage.window.width(), 500);
}

void WindowTest::both_ends_of_a_long_path_are_seen() {
    const Scene scene;
    Stage stage(scene);
    auto* label = stage.window.statusBar()->findChild<QLabel*>();
    const auto painted = [&](const char* first, const char* last) {
        const QString path = QLatin1String(first) + QString(300, QLatin1Char('w')) + QLatin1String(last);
        label->setText(path);
        QCoreApplication::sendPostedEvents();
        QCoreApplication::processEvents();
        return label->grab().toImage();
    };
    const QImage path = painted("A", "A");
    QCOMPARE(painted("A", "A"), path);
    QVERIFY(painted("A", "M") != path);
    QVERIFY(painted("M", "A") != path);
}

// A tab is wider than a blank, and no reason to cut a path that fits.
void WindowTest::a_path_that_fits_is_painted_as_it_is() {
    const Scene scene;
    Stage stage(scene);
    auto* label = stage.window.statusBar()->findChild<QLabel*>();
    for (const QString& path : {QStringLiteral("a\tb"), QStringLiteral("a&b "), QStringLiteral("MACHINE\\SYSTEM")}) {
        label->setText(path);
        QCoreApplication::sendPostedEvents();
        QCoreApplication::processEvents();
        QLabel plain(path, label->parentWidget());
        plain.setTextFormat(Qt::PlainText);
        plain.setAlignment(label->alignment());
        plain.resize(label->size());
        QCOMPARE(label->grab().toImage(), plain.grab().toImage());
    }
}

void WindowTest::neither_view_can_be_dragged_shut() {
    const Scene scene;
    Stage stage(scene);
    QWidget* handle = stage.window.findChild<QSplitter*>()->handle(1);
    const QPoint grip = handle->rect().center();
    for (const int to : {-1000, 1000}) {
        QTest::mousePress(handle, Qt::LeftButton, {}, grip);
        QTest::mouseMove(handle, grip + QPoint(to, 0));
        QTest::mouseRelease(handle, Qt::LeftButton, {}, grip + QPoint(to, 0));
        // It has moved as far as it goes.
        QVERIFY(to < 0 ? stage.keys->width() < 200 : stage.values->width() < 200);
        QVERIFY(stage.keys->width() > 20);
        QVERIFY(stage.values->width() > 20);
    }
}

void WindowTest::columns_start_wide_enough() {
    const Scene scene;
    Stage stage(scene);
    stage.select_key(QStringLiteral("MACHINE\\SYSTEM\\Alpha"));
    const QFontMetrics metrics = stage.values->fontMetrics();
    QVERIFY(stage.values->columnWidth(0) > metrics.horizontalAdvance(QStringLiteral("SystemPartition")));
    QVERIFY(stage.values->columnWidth(1) > metrics.horizontalAdvance(QStringLiteral("REG_EXPAND_SZ")));
    QVERIFY(stage.values->columnWidth(2) > metrics.horizontalAdvance(QStringLiteral("0x00000000 (4294967295)")));
    // What the user has widened stays, whatever key comes next.
    stage.values->setColumnWidth(0, 333);
    stage.select_key(QStringLiteral("MACHINE\\SYSTEM\\Alpha\\Deep"));
    stage.select_key(QStringLiteral("MACHINE"));
    stage.select_key(QStringLiteral("MACHINE\\SYSTEM\\Alpha"));
    QCOMPARE(stage.values->columnWidth(0), 333);
}

void WindowTest::a_damaged_key_is_told_once_and_its_siblings_stay() {
    Scene scene;
    scene.damage_key("Alpha\\Leaf");
    const QByteArray before = scene.bytes();
    Stage stage(scene);
    const QModelIndex alpha = stage.model->index(0, 0, stage.key(QStringLiteral("MACHINE\\SYSTEM")));
    DialogHand hand;
    hand.then_press(QMessageBox::Ok);
    stage.keys->setCurrentIndex(alpha);
    stage.keys->expand(alpha);
    QTRY_VERIFY(hand.is_done());
    QCOMPARE(hand.icon, QMessageBox::Critical);
    QCOMPARE(hand.title, QStringLiteral("Registry Editor"));
    QCOMPARE(hand.text, QStringLiteral("The key \"MACHINE\\SYSTEM\\Alpha\\#1\" cannot be read: ROpenSubKey failed"));

    // The siblings on both sides are there and can be used.
    QCOMPARE(stage.model->rowCount(alpha), 3);
    for (int row : {0, 2}) {
        const QModelIndex sibling = stage.model->index(row, 0, alpha);
        QVERIFY(stage.keys->visualRect(sibling).isValid());
        stage.keys->setCurrentIndex(sibling);
        QCOMPARE(stage.keys->currentIndex(), sibling);
        QVERIFY(stage.values->model()->rowCount() > 0);
    }
    // The damaged one itself shows no values; what it threw was told.
    stage.keys->setCurrentIndex(stage.model->index(1, 0, alpha));
    QCOMPARE(stage.values->model()->rowCount(), 0);
    stage.keys->viewport()->repaint();
    QVERIFY(hand.nothing_comes());
    QCOMPARE(scene.bytes(), before);
}

void WindowTest::an_exception_in_a_slot_is_told_and_the_program_goes_on() {
    DialogHand hand;
    hand.then_press(QMessageBox::Ok);
    FailureReport::instance().set_current_key(QStringLiteral("MACHINE\\there"));
    QTimer::singleShot(0, qApp, [] { throw std::runtime_error("RQueryInfoKeyW failed"); });
    QTRY_VERIFY(hand.is_done());
    QCOMPARE(hand.text, QStringLiteral("The key \"MACHINE\\there\" cannot be read: RQueryInfoKeyW failed"));
    // The same again: told before.
    bool thrown = false;
    QTimer::singleShot(0, qApp, [&] {
        thrown = true;
        throw std::runtime_error("RQueryInfoKeyW failed");
    });
    QTRY_VERIFY(thrown);
    QVERIFY(hand.nothing_comes());
    // Without a key the reason stands alone.
    hand.then_press(QMessageBox::Ok);
    FailureReport::instance().set_current_key(QString());
    QTimer::singleShot(0, qApp, [] { throw std::runtime_error("other"); });
    QTRY_VERIFY(hand.is_done());
    QCOMPARE(hand.text, QStringLiteral("The registry cannot be read: other"));
}

void WindowTest::what_another_program_asks_for_is_not_laid_to_the_current_key() {
    FailureReport::instance().set_current_key(QStringLiteral("asked\\sound"));
    DialogHand hand;
    hand.then_press(QMessageBox::Ok);
    FailureReport::instance().report(QStringLiteral("asked\\damaged"), std::runtime_error("as asked"));
    QTRY_VERIFY(hand.is_done());
    bool thrown = false;
    QTimer::singleShot(0, qApp, [&] {
        thrown = true;
        throw std::runtime_error("as asked");
    });
    QTRY_VERIFY(thrown);
    QVERIFY(hand.nothing_comes());
}

void WindowTest::a_name_like_markup_is_told_as_it_is() {
    DialogHand hand;
    hand.then_press(QMessageBox::Ok);
    FailureReport::instance().report(QStringLiteral("T\\H\\<b>x</b>"), std::runtime_error("gone"));
    QTRY_VERIFY(hand.is_done());
    QCOMPARE(hand.format, Qt::PlainText);
}

void WindowTest::many_failures_share_a_box() {
    DialogHand hand;
    hand.then_press(QMessageBox::Ok);
    for (int i = 0; i < 1000; i++)
        FailureReport::instance().report(QStringLiteral("many\\%1").arg(i), std::runtime_error("gone"));
    QTRY_VERIFY(hand.is_done());
    QCOMPARE(hand.text.count(QLatin1Char('\n')), 10);
    QVERIFY(hand.text.endsWith(QStringLiteral("More keys cannot be read: 990")));
    QVERIFY(hand.nothing_comes());
}

void WindowTest::rows_that_come_into_sight_bring_no_endless_row_of_boxes() {
    constexpr int most = 10;
    DialogHand hand;
    for (int i = 0; i < 100; i++) {
        if (i < most)
            hand.then_press(QMessageBox::Ok);
        FailureReport::instance().report_row(QStringLiteral("scrolled\\#%1").arg(i), std::runtime_error("gone"));
        QTRY_VERIFY(hand.is_done());
        QVERIFY(hand.nothing_comes());
    }
    // Another key's subkeys, and another reason, are told.
    hand.then_press(QMessageBox::Ok);
    FailureReport::instance().report_row(QStringLiteral("scrolled\\#1"), std::runtime_error("other"));
    QTRY_VERIFY(hand.is_done());
    hand.then_press(QMessageBox::Ok);
    FailureReport::instance().report_row(QStringLiteral("elsewhere\\#1"), std::runtime_error("gone"));
    QTRY_VERIFY(hand.is_done());
}

void WindowTest::the_model_may_go_before_the_window() {
    const Scene scene;
    Stage stage(scene);
    stage.select_key(QStringLiteral("MACHINE\\SYSTEM\\Alpha"));
    stage.keys->expandAll();
    stage.model.reset();
    // The stage's window goes now, and must leave the keys alone: the sanitizers look on.
}

void WindowTest::the_model_may_go_while_a_name_is_typed() {
    const Scene scene;
    const QByteArray before = scene.bytes();
    {
        Stage stage(scene);
        stage.select_value(QStringLiteral("MACHINE\\SYSTEM\\Alpha"), QStringLiteral("text"));
        shared_actions().rename_action->trigger();
        auto* editor = qobject_cast<QLineEdit*>(QApplication::focusWidget());
        QVERIFY(editor);
        editor->setText(QStringLiteral("other"));
        stage.model.reset();
    }
    QCOMPARE(scene.bytes(), before);
}

void WindowTest::a_name_of_many_lines_takes_one() {
    testkit::HiveLayout hive;
    hive.root.add("Key").add("b" + std::string(200, '\n'));
    const Scene scene(hive);
    Stage stage(scene);
    const QModelIndex key = stage.key(QStringLiteral("MACHINE\\SYSTEM\\Key"));
    stage.keys->setCurrentIndex(key);
    const QSize size = stage.window.size();
    const int height = stage.window.statusBar()->height();
    stage.keys->setCurrentIndex(stage.model->index(0, 0, key));
    QCOMPARE(stage.status(), QStringLiteral("MACHINE\\SYSTEM\\Key\\b") + QString(200, QChar(0x21b5)));
    auto* label = stage.window.statusBar()->findChild<QLabel*>();
    QVERIFY(label->toolTip().contains(QLatin1String("<br")));
    QVERIFY(label->accessibleName().endsWith(QString(200, QLatin1Char('\n'))));
    // A font that has the signs may be taller.
    QCOMPARE(label->maximumHeight(), label->fontMetrics().height());
    QCoreApplication::sendPostedEvents();
    QCoreApplication::processEvents();
    QCOMPARE(stage.window.size(), size);
    QCOMPARE(stage.window.statusBar()->height(), height);
}

UI_TEST_MAIN(WindowTest)
#include "window_test.moc"
