// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "elided_label.h"

#include <QPainter>
#include <QStyle>

void ElidedLabel::paintEvent(QPaintEvent* event) {
    if (sizeHint().width() <= width()) {
        QLabel::paintEvent(event);
        return;
    }
    QPainter painter(this);
    const QRect room = contentsRect();
    // A tab is measured here by other stops than the label paints it with.
    const QString line = QString(text()).replace(QLatin1Char('\t'), QLatin1Char(' '));
    const QString shown = fontMetrics().elidedText(line, Qt::ElideMiddle, room.width());
    const auto place = static_cast<int>(QStyle::visualAlignment(layoutDirection(), alignment()));
    style()->drawItemText(&painter, room, place, palette(), isEnabled(), shown, foregroundRole());
}
