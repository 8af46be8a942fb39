// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Value data as it is read: painted in a cell, copied, or spoken.
#pragma once

#include <QString>

#include <limits>

class QVariant;

// The text of a datum, of which only the first limit characters need be right.
QString value_text(const QVariant& value, qsizetype limit = std::numeric_limits<qsizetype>::max());

// What stands, and is spoken, in place of a name or datum that cannot be read.
QString unreadable_text();
