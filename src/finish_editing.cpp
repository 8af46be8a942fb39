// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "finish_editing.h"

#include <QAbstractItemDelegate>
#include <QAbstractItemView>
#include <QApplication>
#include <QPointer>

namespace {

void finish_editors_of(const QAbstractItemView& view) {
    QAbstractItemDelegate* delegate = view.itemDelegate();
    // The views put nothing but editors into their viewports. One that is closed is hidden until it is deleted.
    for (QWidget* child : view.viewport()->findChildren<QWidget*>(QString(), Qt::FindDirectChildrenOnly)) {
        const QPointer<QWidget> editor = child;
        if (!delegate || child->isHidden()) {
            continue;
        }
        // By the delegate's signals, as when the editor loses the keyboard: it need not have it now.
        emit delegate->commitData(editor);
        if (editor) {
            emit delegate->closeEditor(editor, QAbstractItemDelegate::NoHint);
        }
    }
}

}  // namespace

void finish_editing(const QWidget& part) {
    if (const auto* view = qobject_cast<const QAbstractItemView*>(&part)) {
        finish_editors_of(*view);
    }
    for (const QAbstractItemView* view : part.findChildren<QAbstractItemView*>()) {
        finish_editors_of(*view);
    }
}

bool may_change_rows(const QWidget& part) {
    if (QApplication::activeModalWidget()) {
        return false;
    }
    finish_editing(*part.window());
    return true;
}
