// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "finish_editing.h"

#include "delegates.h"

#include <QAbstractItemDelegate>
#include <QAbstractItemView>
#include <QApplication>
#include <QPointer>

namespace {

void close_editors_of(const QAbstractItemView& view) {
    QAbstractItemDelegate* delegate = view.itemDelegate();
    // The views put nothing but editors into their viewports, and tips, which are windows. An editor that is closed is
    // hidden until it is deleted.
    for (QWidget* child : view.viewport()->findChildren<QWidget*>(QString(), Qt::FindDirectChildrenOnly)) {
        const QPointer<QWidget> editor = child;
        if (!delegate || child->isHidden() || child->isWindow())
            continue;
        // By the delegate's signals, as when the editor loses the keyboard: it need not have it now.
        emit delegate->commitData(editor);
        if (editor)
            emit delegate->closeEditor(editor, QAbstractItemDelegate::NoHint);
    }
}

QList<const QAbstractItemView*> views_in(const QWidget& part) {
    QList<const QAbstractItemView*> views;
    if (const auto* view = qobject_cast<const QAbstractItemView*>(&part))
        views.append(view);
    for (const QAbstractItemView* view : part.findChildren<QAbstractItemView*>())
        views.append(view);
    return views;
}

}  // namespace

void close_editors(const QWidget& part) {
    for (const QAbstractItemView* view : views_in(part))
        close_editors_of(*view);
}

void finish_editing(const QWidget& part) {
    close_editors(part);
    for (const QAbstractItemView* view : views_in(part)) {
        if (const auto* names = qobject_cast<const NameDelegate*>(view->itemDelegate()))
            names->tell_refused_names();
    }
}

bool end_editing_before_change(const QWidget& part) {
    if (QApplication::activeModalWidget())
        return false;
    finish_editing(*part.window());
    // While a refused name was told, the user may have left the program or something may have opened another dialog.
    return part.window()->isVisible() && !QApplication::activeModalWidget();
}
