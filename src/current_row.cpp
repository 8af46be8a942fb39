// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "current_row.h"

#include <QAbstractItemView>
#include <QContextMenuEvent>

QItemSelectionModel::SelectionFlags keeping_highlight(QItemSelectionModel::SelectionFlags command,
                                                      const QModelIndex& index, const QEvent* event) {
    const bool takes_highlight = command.testFlag(QItemSelectionModel::Deselect) || (event && !index.isValid());
    return takes_highlight ? QItemSelectionModel::NoUpdate : command;
}

bool is_menu_key(const QEvent& event) {
    return event.type() == QEvent::ContextMenu &&
           static_cast<const QContextMenuEvent&>(event).reason() == QContextMenuEvent::Keyboard;
}

void ask_for_menu_over_current(QAbstractItemView& view) {
    const QRect seen = view.visualRect(view.currentIndex()) & view.viewport()->rect();
    if (!seen.isEmpty())
        emit view.customContextMenuRequested(seen.center());
}
