// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "main_window.h"

#include "elided_label.h"
#include "failure_report.h"
#include "finish_editing.h"
#include "keys_view.h"
#include "shared_actions.h"
#include "value_text.h"
#include "values_model.h"
#include "values_proxy_model.h"
#include "values_view.h"

#include <QAction>
#include <QActionGroup>
#include <QApplication>
#include <QCoreApplication>
#include <QEvent>
#include <QHeaderView>
#include <QKeyEvent>
#include <QLabel>
#include <QMenu>
#include <QMenuBar>
#include <QSplitter>
#include <QStatusBar>

MainWindow::MainWindow(QWidget* parent, Qt::WindowFlags flags)
    : QMainWindow(parent, flags), key_delegate(this), value_delegate(this),
      values_proxy(std::make_unique<ValuesProxyModel>()) {
    setWindowTitle(QCoreApplication::applicationName());
    make_views();
    status_label = new ElidedLabel(QString(), this);
    // A path that is wider than the window is cut, and must not widen the window.
    status_label->setMinimumWidth(1);
    // Key names are data: what looks like markup in one is shown as it is.
    status_label->setTextFormat(Qt::PlainText);
    // Whatever letters a name has, the bar keeps its height.
    status_label->setAlignment(Qt::AlignLeft | Qt::AlignTop);
    statusBar()->addWidget(status_label, 0);
    connect(values_table, &QAbstractItemView::activated, this,
            qOverload<const QModelIndex&>(&MainWindow::value_selected));
    connect(values_table, &QAbstractItemView::clicked, this,
            qOverload<const QModelIndex&>(&MainWindow::value_selected));
    connect(&find_watcher, &QFutureWatcherBase::finished, this, &MainWindow::show_find_result);
    // A program that ends by another way than this window must not leave a search behind, either.
    connect(qApp, &QCoreApplication::aboutToQuit, this, &MainWindow::end_search);
    connect(qApp, &QCoreApplication::aboutToQuit, this, [this] { finish_editing(*this); });
    // Later: the table is told of other rows when it has done asking for these.
    connect(values_table, &ValuesView::row_count_failed, this, &MainWindow::let_go_of_lost_key, Qt::QueuedConnection);
    make_menus();
    menuBar()->installEventFilter(this);
    statusBar()->installEventFilter(this);
}

MainWindow::~MainWindow() {
    // The base class takes the keyboard from its widgets, when the rest of the window is gone.
    disconnect(qApp, &QApplication::focusChanged, this, nullptr);
    // The key model is gone, and with it the key behind the rows: an open name editor is closed without it.
    values_proxy->setSourceModel(nullptr);
    // The view must not ask a proxy that is destroyed before it.
    values_table->setModel(nullptr);
}

void MainWindow::make_views() {
    // Placed by hand in resizeEvent, and not the central widget.
    splitter = new QSplitter(this);
    splitter->setAccessibleName(QStringLiteral("splitter"));
    keys_tree = new KeysView(splitter);
    keys_tree->setAccessibleName(QStringLiteral("keys_tree"));
    values_table = new ValuesView(splitter);
    values_table->setAccessibleName(QStringLiteral("values_table"));
    values_table->setSelectionBehavior(QAbstractItemView::SelectItems);
    values_table->setSelectionMode(QAbstractItemView::SingleSelection);
    values_table->setShowGrid(false);
    values_table->setEditTriggers(QAbstractItemView::EditKeyPressed);
    values_table->setContextMenuPolicy(Qt::CustomContextMenu);
    values_table->verticalHeader()->setVisible(false);
    // What a command asks about is seen: neither view can be dragged shut, and keep the keyboard.
    splitter->setChildrenCollapsible(false);
    // The values take the larger share, and what the window grows by.
    splitter->setStretchFactor(0, 0);
    splitter->setStretchFactor(1, 1);
    splitter->setSizes({220, 420});
    setTabOrder(keys_tree, values_table);
}

void MainWindow::make_menus() {
    const SharedActions& actions = shared_actions();
    QMenu* file_menu = menuBar()->addMenu(tr("&File", "menu title"));
    const QAction* exit_action = file_menu->addAction(tr("Exit", "menu item"));
    connect(exit_action, &QAction::triggered, qApp, &QCoreApplication::quit);

    QMenu* edit_menu = menuBar()->addMenu(tr("&Edit", "menu title"));
    add_new_actions(*edit_menu->addMenu(tr("&New", "menu title")));
    edit_menu->addSeparator();
    edit_menu->addAction(actions.delete_action);
    edit_menu->addAction(actions.rename_action);
    edit_menu->addSeparator();
    QAction* find_action = edit_menu->addAction(tr("Find...", "menu item"));
    find_action->setShortcut(QKeySequence::Find);
    connect(find_action, &QAction::triggered, this, &MainWindow::show_find_dialog);
    QAction* find_next_action = edit_menu->addAction(tr("Find next", "menu item"));
    // With every key that the desktop has for it: on some the first is not F3.
    find_next_action->setShortcuts(QKeySequence::FindNext);
    connect(find_next_action, &QAction::triggered, this, &MainWindow::find_next);

    QMenu* view_menu = menuBar()->addMenu(tr("&View", "menu title"));
    QAction* refresh_action = view_menu->addAction(tr("Refresh", "menu item"));
    refresh_action->setShortcuts(QKeySequence::Refresh);
    connect(refresh_action, &QAction::triggered, this, &MainWindow::refresh_views);
    // A key that is clicked again does not become current again, though the actions may be a value's meanwhile.
    connect(qApp, &QApplication::focusChanged, this, [this](QWidget* /*old*/, const QWidget* now) {
        if (now == keys_tree)
            set_key_actions(keys_tree->currentIndex());
        else if (now == values_table)
            value_selected(values_table->currentIndex());
    });
}

void MainWindow::set_model(RegModel* model) {
    key_model = model;
    keys_tree->setModel(model);
    keys_tree->setItemDelegate(&key_delegate);
    if (!model)
        return;
    connect(model, &QAbstractItemModel::layoutChanged, this, qOverload<>(&MainWindow::update_statusbar));
    // A key that got another name can be far from where it stood. Once its index has followed it.
    connect(
        model, &QAbstractItemModel::layoutChanged, keys_tree,
        [this] { keys_tree->scrollTo(keys_tree->currentIndex()); }, Qt::QueuedConnection);
    connect(model, &QAbstractItemModel::dataChanged, this,
            [this](const QModelIndex& top_left, const QModelIndex& bottom_right) {
                update_statusbar(top_left, bottom_right);
            });
    connect(keys_tree->selectionModel(), &QItemSelectionModel::currentChanged, this,
            qOverload<const QModelIndex&, const QModelIndex&>(&MainWindow::reload_values));
}

void MainWindow::show_status(const QModelIndex& key) {
    const QString path = key_path_of(key);
    status_label->setMaximumHeight(status_label->fontMetrics().height());
    status_label->setText(with_visible_controls(path));
    status_label->setAccessibleName(path);
    // Made into a paragraph here, so that the tip takes no name for markup.
    status_label->setToolTip(path.isEmpty() ? path : Qt::convertFromPlainText(path));
    FailureReport::instance().set_shown_key(path);
}

void MainWindow::update_statusbar() { show_status(keys_tree->currentIndex()); }

void MainWindow::update_statusbar(const QModelIndex& top_left, const QModelIndex& /*bottom_right*/) {
    if (top_left == keys_tree->currentIndex())
        update_statusbar();
}

void MainWindow::reload_values(const QModelIndex& current) {
    // The name being typed belongs to a value of the key that goes. A box now would hold up the change of keys, and
    // let another come in between.
    close_editors(*values_table);
    show_status(current);
    place_splitter();
    show_values_of(current);
    if (values_table->selectionModel())
        disconnect(values_table->selectionModel(), nullptr, this, nullptr);
    values_table->setModel(values_proxy.get());
    values_table->setItemDelegate(&value_delegate);
    shared_actions().new_action_group->setEnabled(values_proxy->has_key());
    set_key_actions(current);
    connect(values_table->selectionModel(), &QItemSelectionModel::currentChanged, this,
            qOverload<const QModelIndex&, const QModelIndex&>(&MainWindow::value_selected));
}

void MainWindow::reload_values(const QModelIndex& current, const QModelIndex& /*previous*/) { reload_values(current); }

// A key whose values cannot be read is told, and shows an empty table: the window must not go on asking it.
void MainWindow::show_values_of(const QModelIndex& key) {
    try {
        set_values_source(RegModel::editable_key(key));
        values_proxy->sort(0, Qt::AscendingOrder);
    } catch (const std::exception& failure) {
        FailureReport::instance().report(key_path_of(key), failure);
        set_values_source(nullptr);
    }
}

// The same for a key that could be read when it was shown; one whose reads fail now and then is kept. Should it be
// shown and lost once more, that is told once more.
void MainWindow::let_go_of_lost_key() {
    try {
        values_proxy->rowCount();
        values_table->viewport()->update();
        values_table->horizontalHeader()->viewport()->update();
    } catch (const std::exception&) {
        close_editors(*values_table);
        set_values_source(nullptr);
        FailureReport::instance().forget(FailureReport::instance().shown_key());
        shared_actions().new_action_group->setEnabled(false);
        set_key_actions(keys_tree->currentIndex());
    }
}

void MainWindow::set_values_source(RegKey* key) {
    auto source = std::make_unique<ValuesModel>(key, nullptr);
    // The old source goes only when the proxy has let go of it, also where the new one's key throws.
    values_source.swap(source);
    values_proxy->setSourceModel(values_source.get());
}

void MainWindow::set_key_actions(const QModelIndex& key) {
    const SharedActions& actions = shared_actions();
    const bool is_editable = key.flags().testFlag(Qt::ItemIsEditable);
    actions.new_key_action->setEnabled(RegModel::editable_key(key) != nullptr);
    actions.delete_action->setEnabled(is_editable);
    actions.rename_action->setEnabled(is_editable);
}

void MainWindow::value_selected(const QModelIndex& current) {
    // The selection of a table that was emptied says nothing about the actions: they are the key's again.
    if (!current.isValid()) {
        set_key_actions(keys_tree->currentIndex());
        return;
    }
    const SharedActions& actions = shared_actions();
    actions.delete_action->setEnabled(true);
    // Here, since the window system makes the window active, and so the table, past Application::notify.
    bool is_editable = false;
    try {
        is_editable = values_proxy->flags(current).testFlag(Qt::ItemIsEditable);
    } catch (const std::exception& failure) {
        FailureReport::instance().report_at_shown(failure);
    }
    actions.rename_action->setEnabled(is_editable);
}

void MainWindow::value_selected(const QModelIndex& current, const QModelIndex& /*previous*/) {
    value_selected(current);
}

void MainWindow::refresh_views() {
    if (!end_editing_before_change(*this))
        return;
    if (!values_proxy->has_key() && keys_tree->currentIndex().isValid()) {
        // The key was let go of. It is asked again, and what it throws is told again.
        FailureReport::instance().forget(key_path_of(keys_tree->currentIndex()));
        reload_values(keys_tree->currentIndex());
        return;
    }
    meet_failures(this, FailureReport::instance().shown_key(), [this] {
        // The proxy leaves the current index at its row; what the user presses next is meant for the value, not for
        // its place.
        const QModelIndex current = values_proxy->mapToSource(values_table->currentIndex());
        values_proxy->sort(0, Qt::AscendingOrder);
        if (current.isValid())
            values_table->setCurrentIndex(values_proxy->mapFromSource(current));
    });
    // A value that became current has taken the actions, which are about what has the keyboard.
    if (keys_tree->hasFocus())
        set_key_actions(keys_tree->currentIndex());
}

void MainWindow::closeEvent(QCloseEvent* event) {
    // A name that is refused is told while there is a window to tell it over.
    finish_editing(*this);
    QMainWindow::closeEvent(event);
}

void MainWindow::resizeEvent(QResizeEvent* event) {
    QMainWindow::resizeEvent(event);
    place_splitter();
}

void MainWindow::keyPressEvent(QKeyEvent* event) { QWidget::keyPressEvent(event); }

bool MainWindow::eventFilter(QObject* watched, QEvent* event) {
    if (event->type() == QEvent::Resize || event->type() == QEvent::Move)
        place_splitter();
    return QMainWindow::eventFilter(watched, event);
}

void MainWindow::place_splitter() {
    const int top = menuBar()->height();
    splitter->setGeometry(0, top, width(), height() - top - statusBar()->height());
}
