// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "keys_view.h"

#include "failure_report.h"
#include "finish_editing.h"
#include "reg_model.h"
#include "shared_actions.h"

#include <QAction>
#include <QCoreApplication>
#include <QHeaderView>
#include <QMenu>
#include <QMessageBox>
#include <QMouseEvent>

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
    // A long name widens the column and brings a scroll bar instead of being cut.
    setTextElideMode(Qt::ElideNone);
    if (header()->count() > 0) {
        header()->setSectionResizeMode(0, QHeaderView::ResizeToContents);
    }
    header()->setStretchLastSection(false);
}

QModelIndex KeysView::in_place(const QModelIndex& key) {
    const QAbstractItemModel* model = key.model();
    if (!model || model->index(key.row(), 0, key.parent()) == key) {
        return key;
    }
    const QModelIndex parent = key.parent();
    for (int row = 0; row < model->rowCount(parent); ++row) {
        const QModelIndex sibling = model->index(row, 0, parent);
        if (sibling.internalPointer() == key.internalPointer()) {
            return sibling;
        }
    }
    return {};
}

void KeysView::show_keys_context_menu(QPoint point) {
    const QModelIndex index = indexAt(point);
    if (!index.isValid() || index.column() != 0) {
        return;
    }
    const SharedActions& actions = shared_actions();
    QMenu menu;
    menu.addMenu(tr("New", "menu title"))->addAction(actions.new_key_action);
    menu.addAction(actions.delete_action);
    menu.addAction(actions.rename_action);
    menu.exec(viewport()->mapToGlobal(point));
}

void KeysView::run_new_key_action(bool /*checked*/) {
    auto* keys = qobject_cast<RegModel*>(model());
    if (!keys || !may_change_rows(*this)) {
        return;
    }
    const QModelIndex current = currentIndex();
    if (!current.isValid()) {
        return;
    }
    const int row = keys->new_key(current);
    if (row < 0) {
        tell_refused(tr("The key could not be created."));
        return;
    }
    const QModelIndex created = keys->index(row, 0, current);
    setCurrentIndex(created);
    edit(created);
}

void KeysView::run_delete_key_action(bool /*checked*/) {
    // The values table answers the same action.
    if (!hasFocus() || !model() || !may_change_rows(*this)) {
        return;
    }
    // What is deleted is the key that was asked about.
    const QPersistentModelIndex asked = currentIndex();
    if (!asked.isValid() || !confirm_remove()) {
        return;
    }
    const QModelIndex current = in_place(asked);
    if (!current.isValid()) {
        return;
    }
    const QPersistentModelIndex parent = current.parent();
    const int row = current.row();
    const int rows = model()->rowCount(parent);
    const bool was_expanded = isExpanded(current);
    if (model()->removeRows(row, 1, parent)) {
        return;
    }
    // A removal that was announced and then refused has moved the selection to a neighbour.
    if (model()->rowCount(parent) == rows) {
        const QModelIndex kept = model()->index(row, 0, parent);
        setCurrentIndex(kept);
        setExpanded(kept, was_expanded);
    }
    tell_refused(tr("The key could not be deleted."));
}

bool KeysView::confirm_remove() {
    return QMessageBox::question(this, tr("Confirm Key Removal"),
                                 tr("Are you sure you want to delete this key and its subkeys?"),
                                 QMessageBox::Yes | QMessageBox::No) == QMessageBox::Yes;
}

void KeysView::run_rename_key_action(bool /*checked*/) {
    if (!hasFocus() || !may_change_rows(*this)) {
        return;
    }
    const QModelIndex current = currentIndex();
    if (!current.isValid()) {
        return;
    }
    setCurrentIndex(current);
    edit(current);
}

void KeysView::mousePressEvent(QMouseEvent* event) {
    // A branch is opened without becoming current: what it throws is about this key.
    const QModelIndex index = indexAt(event->position().toPoint());
    if (index.isValid()) {
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

void KeysView::tell_refused(const QString& text) {
    QMessageBox::critical(this, QCoreApplication::applicationName(), text, QMessageBox::Ok);
}
