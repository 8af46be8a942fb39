// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// What the modal editors of a value have in common. Return held down, which has opened the editor, does not answer it.
#pragma once

#include <QDialog>

class EditorDialog : public QDialog {
    Q_OBJECT

protected:
    void keyPressEvent(QKeyEvent* event) override;
};
