// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "validators.h"

#include <QLineEdit>

#include <algorithm>

namespace {

// parse(&ok) reads the whole text as a number of the validator's width.
template <typename Number, typename Parse>
QValidator::State judge(const QString& input, Number bottom, Number top, Parse parse) {
    if (input.isEmpty())
        return QValidator::Intermediate;
    if (!std::all_of(input.cbegin(), input.cend(), [](QChar c) { return c.isDigit(); }))
        return QValidator::Invalid;
    bool fits = false;
    const Number number = parse(&fits);
    if (!fits)
        return QValidator::Invalid;
    if (number < bottom)
        return QValidator::Intermediate;
    return number > top ? QValidator::Invalid : QValidator::Acceptable;
}

}  // namespace

void take_back_invalid_text(QLineEdit& edit) {
    QObject::connect(&edit, &QLineEdit::textChanged, &edit, [&edit, valid = edit.text()](const QString& text) mutable {
        QString judged = text;
        int position = edit.cursorPosition();
        if (edit.validator()->validate(judged, position) == QValidator::Invalid)
            edit.setText(valid);
        else
            valid = text;
    });
}

UintValidator::UintValidator(quint32 bottom, quint32 top, QObject* parent)
    : QValidator(parent), bottom_(bottom), top_(top) {}

QValidator::State UintValidator::validate(QString& input, int& /*pos*/) const {
    return judge<quint32>(input, bottom_, top_, [&](bool* fits) { return input.toUInt(fits, 10); });
}

Uint64Validator::Uint64Validator(quint64 bottom, quint64 top, QObject* parent)
    : QValidator(parent), bottom_(bottom), top_(top) {}

QValidator::State Uint64Validator::validate(QString& input, int& /*pos*/) const {
    return judge<quint64>(input, bottom_, top_, [&](bool* fits) { return input.toULongLong(fits, 10); });
}
