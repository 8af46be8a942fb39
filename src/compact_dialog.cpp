// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "compact_dialog.h"

#include <QDialog>
#include <QLayout>

void make_compact(QDialog& dialog, QWidget& focused) {
    // The layout's own minimum first, so that the height which is then fixed is the one that the dialog has.
    dialog.ensurePolished();
    dialog.layout()->activate();
    dialog.resize(360, 60);
    dialog.setMaximumHeight(dialog.height());
    focused.setFocus();
}
