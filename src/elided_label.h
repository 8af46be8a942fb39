// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// A line of plain text that says so where it does not fit: the status bar's path.
#pragma once

#include <QLabel>

// Painted with an ellipsis in the middle where it is wider than the label, so that both ends are seen; text() is the
// whole text always.
class ElidedLabel : public QLabel {
    Q_OBJECT

public:
    using QLabel::QLabel;

protected:
    void paintEvent(QPaintEvent* event) override;
};
