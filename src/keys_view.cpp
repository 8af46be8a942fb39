// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "keys_view.h"

#include "current_row.h"
#include "failure_report.h"
#include "finish_editing.h"
#include "reg_model.h"
#include "shared_actions.h"

#include <QAction>
#include <QApplication>
#include <QHeaderView>
#include <QKeyEvent>
#include <QMenu>
#include <QMessageBox>
#include <QMouseEvent>
#include <QScrollBar>
#include <QStyle>

#include <deque>
#include <utility>

namespace {

bool stands_below(const QModelIndex& key, const QModelIndex& top) {
    QModelIndex step = key.parent();
    while (step.isValid() && step != top)
        step = step.parent();
    return step.isValid();
}

}  // namespace

KeysView::KeysView(QWidget* parent) : QTreeView(parent) {
    setContextMenuPolicy(Qt::CustomContextMenu);
    setEditTriggers(QAbstractItemView::EditKeyPressed);
    setHeaderHidden(true);
    setUniformRowHeights(true);
    const SharedActions& actions = shared_actions();
    connect(this, &QWidget::customContextMenuRequested, this, &KeysView::show_keys_context_menu);
    connect(actions.new_key_action, &QAction::triggered, this, &KeysView::run_new_key_action);
    connect(actions.delete_action, &QAction::triggered, this, &KeysView::run_delete_key_action);
    connect(actions.rename_action, &QAction::triggered, this, &KeysView::run_rename_key_action);
}

void KeysView::setModel(QAbstractItemModel* model) {
    QTreeView::setModel(model);
    // Queued: where the current row changes too, the selection comes first.
    connect(selectionModel(), &QItemSelectionModel::selectionChanged, this, &KeysView::follow_highlight,
            Qt::QueuedConnection);
    // A long name widens the column and brings a scroll bar instead of being cut.
    setTextElideMode(Qt::ElideNone);
    if (header()->count() > 0)
        header()->setSectionResizeMode(0, QHeaderView::ResizeToContents);
    header()->setStretchLastSection(false);
}

QModelIndex KeysView::index_now(const QModelIndex& key) {
    const QAbstractItemModel* model = key.model();
    if (!model || model->index(key.row(), 0, key.parent()) == key)
        return key;
    const QModelIndex parent = key.parent();
    for (int row = 0; row < model->rowCount(parent); row++) {
        const QModelIndex sibling = model->index(row, 0, parent);
        if (sibling.internalPointer() == key.internalPointer())
            return sibling;
    }
    return {};
}

// What a command is about is seen before it asks for a name or an answer, and so is what a search has found: also where
// its branch was closed, or the tree was scrolled.
void KeysView::show_current() {
    const QModelIndex current = currentIndex();
    if (!current.isValid())
        return;
    QScrollBar& sideways = *horizontalScrollBar();
    const int before = sideways.value();
    setCurrentIndex(current);
    // What was opened for it may need the bar to scroll sideways, which takes the room of a row.
    updateGeometries();
    scrollTo(current);
    // The tree's own scrolling goes to its edge, and the name of a deep key can begin beyond the other.
    sideways.setValue(before);
    const int all = viewport()->width();
    const QRect row = visualRect(current);
    const QSize size(qMin(sizeHintForIndex(current).width(), all), row.height());
    const QRect name = QStyle::alignedRect(layoutDirection(), Qt::AlignLeft, size, row);
    const int beyond = qMin(name.left(), 0) + qMax(name.left() + name.width() - all, 0);
    sideways.setValue(sideways.value() + (isRightToLeft() ? -beyond : beyond));
}

bool KeysView::event(QEvent* event) {
    if (!is_menu_key(*event) || !currentIndex().isValid())
        return QTreeView::event(event);
    if (end_editing_before_change(*this)) {
        meet_failures(this, key_path_of(currentIndex()), [this] {
            show_current();
            ask_for_menu_over_current(*this);
        });
    }
    return true;
}

QItemSelectionModel::SelectionFlags KeysView::selectionCommand(const QModelIndex& index, const QEvent* event) const {
    return keeping_highlight(QTreeView::selectionCommand(index, event), index, event);
}

// An assistive program selects a row and leaves another current, which the commands are about.
void KeysView::follow_highlight() {
    const QModelIndexList rows = selectionModel()->selectedIndexes();
    if (rows.size() == 1 && rows.first() != currentIndex())
        setCurrentIndex(rows.first());
}

void KeysView::show_keys_context_menu(QPoint point) {
    // A refused name is told before the menu is in the way of the box.
    if (std::exchange(menu_is_stale_, false) || !end_editing_before_change(*this))
        return;
    const QModelIndex index = indexAt(point);
    if (!index.isValid() || index.column() != 0)
        return;
    const SharedActions& actions = shared_actions();
    QMenu menu;
    menu.addMenu(tr("New", "menu title"))->addAction(actions.new_key_action);
    menu.addAction(actions.delete_action);
    menu.addAction(actions.rename_action);
    menu.exec(viewport()->mapToGlobal(point));
}

void KeysView::run_new_key_action(bool /*checked*/) {
    auto* keys = qobject_cast<RegModel*>(model());
    if (keys && end_editing_before_change(*this) && currentIndex().isValid())
        meet_failures(this, key_path_of(currentIndex()), [&] { make_key(*keys); });
}

void KeysView::make_key(RegModel& keys) {
    const QModelIndex current = currentIndex();
    const int row = keys.new_key(current);
    if (row < 0) {
        tell_failure(this, tr("The key could not be created."));
        return;
    }
    const QModelIndex created = keys.index(row, 0, current);
    setCurrentIndex(created);
    show_current();
    edit(created);
}

void KeysView::run_delete_key_action(bool /*checked*/) {
    // The values table answers the same action.
    if (hasFocus() && model() && end_editing_before_change(*this))
        meet_failures(this, key_path_of(currentIndex()), [this] { delete_key(); });
}

void KeysView::delete_key() {
    // What is deleted is the key that was asked about.
    const QPersistentModelIndex asked = currentIndex();
    show_current();
    if (!asked.isValid() || !confirm_remove())
        return;
    const QModelIndex current = index_now(asked);
    if (!current.isValid())
        return;
    // Keys below it go first, and one that is current would pass the place on to another that is going as well.
    if (stands_below(currentIndex(), current))
        setCurrentIndex(current);
    const QPersistentModelIndex parent = current.parent();
    const int row = current.row();
    const int rows = model()->rowCount(parent);
    const bool was_expanded = isExpanded(current);
    // A removal that was announced and then did not come to be has moved the selection to a neighbour.
    const auto return_to_kept = [&] {
        if (model()->rowCount(parent) == rows) {
            const QModelIndex kept = model()->index(row, 0, parent);
            setCurrentIndex(kept);
            setExpanded(kept, was_expanded);
        }
    };
    bool removed = false;
    try {
        removed = model()->removeRows(row, 1, parent);
    } catch (...) {
        return_to_kept();
        throw;
    }
    if (removed)
        return;
    return_to_kept();
    tell_failure(this, tr("The key could not be deleted."));
}

bool KeysView::confirm_remove() {
    return QMessageBox::question(this, tr("Confirm Key Removal"),
                                 tr("Are you sure you want to delete this key and its subkeys?"),
                                 QMessageBox::Yes | QMessageBox::No) == QMessageBox::Yes;
}

void KeysView::run_rename_key_action(bool /*checked*/) {
    if (!hasFocus() || !end_editing_before_change(*this))
        return;
    const QModelIndex current = currentIndex();
    if (!current.isValid())
        return;
    meet_failures(this, key_path_of(current), [&] {
        read_name_ahead(current);
        show_current();
        edit(current);
    });
}

// The tree's own asks every shown key for its name, and ends at the first that cannot be read.
void KeysView::keyboardSearch(const QString& typed) {
    if (!model() || model()->rowCount() == 0 || typed.isEmpty())
        return;
    typed_.add(typed);
    const QString wanted = typed_.wanted();
    const QModelIndex current = currentIndex();
    if (!typed_.is_repeated() && select_if_named(current, wanted))
        return;
    // To the end, and once again from the top: the current key may stand in a closed branch, and not be met.
    for (QModelIndex key = indexBelow(current); key.isValid(); key = indexBelow(key)) {
        if (select_if_named(key, wanted))
            return;
    }
    for (QModelIndex key = model()->index(0, 0); key.isValid() && key != current; key = indexBelow(key)) {
        if (select_if_named(key, wanted))
            return;
    }
}

bool KeysView::select_if_named(const QModelIndex& key, const QString& beginning) {
    try {
        if (!key.data(Qt::DisplayRole).toString().startsWith(beginning, Qt::CaseInsensitive))
            return false;
    } catch (const std::exception&) {
        // Told when it comes into sight.
        return false;
    }
    setCurrentIndex(key);
    return true;
}

// All below a key, the nearest first, and no more keys than the hives have room for: a damaged one can list some of its
// keys again and again.
void KeysView::expand_below(const QModelIndex& top) {
    const auto* keys = qobject_cast<const RegModel*>(model());
    if (!keys || !top.isValid())
        return;
    // One layout for all of them, instead of one for each.
    scheduleDelayedItemsLayout();
    qint64 left = keys->most_keys();
    std::deque<QModelIndex> branches{top};
    while (!branches.empty() && left > 0) {
        const QModelIndex branch = branches.front();
        branches.pop_front();
        try {
            const int rows = keys->rowCount(branch);
            left -= rows;
            if (rows > 0)
                expand(branch);
            for (int row = 0; row < rows; row++)
                branches.push_back(keys->index(row, 0, branch));
        } catch (const std::exception& failure) {
            FailureReport::instance().report(key_path_of(branch), failure);
        }
    }
}

// The keyboard's *, + and - go no further: the tree's own expansion knows no end, and to its type-ahead they are
// letters, which select a registry key whose name begins with one.
void KeysView::keyPressEvent(QKeyEvent* event) {
    switch (event->key()) {
    case Qt::Key_Asterisk:
        expand_below(currentIndex());
        break;
    case Qt::Key_Plus:
        expand(currentIndex());
        break;
    case Qt::Key_Minus:
        collapse(currentIndex());
        break;
    case Qt::Key_F2:
        meet_failures(this, key_path_of(currentIndex()), [&] {
            read_name_ahead(currentIndex());
            show_current();
            QTreeView::keyPressEvent(event);
        });
        return;
    default:
        QTreeView::keyPressEvent(event);
        return;
    }
    event->accept();
}

bool KeysView::take_mouse_from_naming(const QMouseEvent& event) {
    if (event.type() == QEvent::MouseButtonPress) {
        taken_button_ = Qt::NoButton;
        if (take_press_from_naming(event))
            taken_button_ = event.button();
        return taken_button_ != Qt::NoButton;
    }
    // The rows that these would find have moved away under the pointer.
    return taken_button_ != Qt::NoButton && (event.type() == QEvent::MouseMove ? event.buttons().testFlag(taken_button_)
                                                                               : event.button() == taken_button_);
}

bool KeysView::take_press_from_naming(const QMouseEvent& press) {
    const QPoint point = press.position().toPoint();
    menu_is_stale_ = false;
    if (state() != QAbstractItemView::EditingState)
        return false;
    const QPersistentModelIndex pressed = indexAt(point);
    finish_editing(*this);
    if (indexAt(point) == pressed)
        return false;
    setFocus();
    if (pressed.isValid())
        setCurrentIndex(pressed);
    menu_is_stale_ = press.button() == Qt::RightButton;
    return true;
}

void KeysView::mousePressEvent(QMouseEvent* event) {
    const QModelIndex index = indexAt(event->position().toPoint());
    if (index.isValid()) {
        // The context menu's actions are about the current key, so it must be the one that was clicked, also where that
        // was on its branch.
        if (event->button() == Qt::RightButton) {
            // Without scrolling a row that is cut off into sight: the pointer would stand on another one then.
            const bool scrolls = hasAutoScroll();
            setAutoScroll(false);
            setCurrentIndex(index);
            setAutoScroll(scrolls);
        }
        // A branch is opened without becoming current: what that throws is about the key that was pressed.
        FailureReport::instance().set_current_key(key_path_of(index));
    }
    QTreeView::mousePressEvent(event);
}

void KeysView::paintEvent(QPaintEvent* event) {
    // Last net: the tree asks the model for its layout from inside a paint too.
    try {
        QTreeView::paintEvent(event);
    } catch (const std::exception& failure) {
        FailureReport::instance().report_at_current(failure);
    }
}
