// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "value_text.h"

#include "reg_value.h"

#include <QCoreApplication>
#include <QStringList>
#include <QVariant>

#include <algorithm>
#include <cstdio>

namespace {

// `bytes` is not empty. A byte takes three characters, the blank behind it included.
QString hexadecimal(const QByteArray& bytes, qsizetype limit) {
    static const char digits[] = "0123456789abcdef";
    const qsizetype count = limit / 3 < bytes.size() ? limit / 3 + 1 : bytes.size();
    QString text(count * 3 - 1, QLatin1Char(' '));
    for (qsizetype i = 0; i < count; i++) {
        const auto byte = static_cast<unsigned char>(bytes[i]);
        text[i * 3] = QLatin1Char(digits[byte >> 4]);
        text[i * 3 + 1] = QLatin1Char(digits[byte & 15]);
    }
    return text;
}

QString joined(const QStringList& strings, qsizetype limit) {
    QString text;
    for (qsizetype i = 0; i < strings.size() && text.size() < limit; i++) {
        if (i > 0)
            text += QLatin1Char(' ');
        text += QStringView(strings[i]).left(std::min(limit, strings[i].size()));
    }
    return text;
}

// Embeddings, overrides and isolates, which make what follows read in another order than it is stored in.
bool turns_direction(QChar c) {
    return (c >= QChar(0x202a) && c <= QChar(0x202e)) || (c >= QChar(0x2066) && c <= QChar(0x2069));
}

}  // namespace

QString value_text(const QVariant& value, qsizetype limit) {
    switch (value.typeId()) {
    case QMetaType::QString:
        return value.toString().left(limit);
    case QMetaType::UInt: {
        char text[32];
        std::snprintf(text, sizeof text, "0x%08x (%u)", value.toUInt(), value.toUInt());
        return QString::fromLatin1(text);
    }
    case QMetaType::ULongLong: {
        char text[64];
        std::snprintf(text, sizeof text, "0x%016llx (%llu)", value.toULongLong(), value.toULongLong());
        return QString::fromLatin1(text);
    }
    case QMetaType::QByteArray: {
        const QByteArray bytes = value.toByteArray();
        return bytes.isEmpty() ? QCoreApplication::translate("MainWindow", "(zero-length binary value)")
                               : hexadecimal(bytes, limit);
    }
    case QMetaType::QStringList:
        return joined(value.toStringList(), limit);
    default:
        break;
    }
    if (is_not_set(value))
        return QCoreApplication::translate("ValueDelegate", "(value not set)");
    // No type that a datum has comes here: a line for developers, on standard output as it is meant to be.
    std::printf("fallback: rendering '%s' as string\n", value.typeName());
    return value.toString();
}

QString with_visible_controls(QString text) {
    // Arrows and U+FFFD: most fonts have them, few the pictures of control characters.
    for (QChar& c : text) {
        if (c == QChar::LineFeed || c == QChar::LineSeparator || c == QChar::ParagraphSeparator)
            c = QChar(0x21b5);
        else if (c == QChar::CarriageReturn)
            c = QChar(0x2190);
        else if ((c != QChar::Tabulation && c.category() == QChar::Other_Control) || turns_direction(c))
            c = QChar::ReplacementCharacter;
    }
    return text;
}

QString shortened(const QString& text, qsizetype most) {
    return text.size() > most ? text.left(most) + QChar(0x2026) : text;
}

QString unreadable_text() { return QCoreApplication::translate("KeyDelegate", "(cannot be read)"); }
