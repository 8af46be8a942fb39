// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// What both views do alike so that the row that is current, which Delete and Rename are about, is the one that is seen.
#pragma once

#include <QItemSelectionModel>

class QAbstractItemView;
class QEvent;

// What a view does to its selection, but for what would take the highlight from the current row and leave it current:
// a press on it with Ctrl held, or one beside all rows.
QItemSelectionModel::SelectionFlags keeping_highlight(QItemSelectionModel::SelectionFlags command,
                                                      const QModelIndex& index, const QEvent* event);

// Whether the keyboard asks for a context menu. The place that comes with it is where the current row is laid out, or
// nowhere when it is in a closed branch: not where it is seen.
bool is_menu_key(const QEvent& event);

// Asks for a menu over the current row of a view, which is in sight.
void ask_for_menu_over_current(QAbstractItemView& view);
