// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "editor_dialog.h"

#include <QKeyEvent>

void EditorDialog::keyPressEvent(QKeyEvent* event) {
    if (!event->isAutoRepeat()) {
        QDialog::keyPressEvent(event);
    }
}
