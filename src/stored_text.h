// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Names on their way into the engine, which takes 8-bit text.
#pragma once

#include <QByteArray>
#include <QString>

struct StoredText {
    QByteArray bytes;
    bool fits;  // every character is one that 8 bits carry, and none is a zero
};

inline StoredText stored_text(const QString& text) {
    StoredText stored = {text.toLatin1(), true};
    for (const QChar c : text)
        stored.fits = stored.fits && c.unicode() != 0 && c.unicode() <= 0xFF;
    return stored;
}
