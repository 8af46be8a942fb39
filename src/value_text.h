// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Value data as it is read: painted in a cell, copied, or spoken.
#pragma once

#include <QString>

#include <limits>

class QVariant;

// The text of a datum. Its first `limit` characters are right; of what stands behind them some may be missing.
QString value_text(const QVariant& value, qsizetype limit = std::numeric_limits<qsizetype>::max());

// The text with a sign in place of each control character and of U+2028 and U+2029, which take no room or end the line,
// and of those that turn the direction of what follows, as in a name that would seem to end in another suffix: in what
// is painted it shows that they are there. Character for character; a tab, which is a gap, stays.
QString with_visible_controls(QString text);

// The text, or where it is longer its first `most` characters and an ellipsis.
QString shortened(const QString& text, qsizetype most);

// What stands, and is spoken, in place of a name or datum that cannot be read.
QString unreadable_text();
