// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Validators for unsigned decimal numbers of 32 and 64 bits, since the toolkit's own knows signed ones only; and how a
// line edit keeps to its validator.
#pragma once

#include <QValidator>

class QLineEdit;

// From now on a text that the line edit's validator calls invalid gives way to the one before it; the line edit must
// have a validator. Typed text never gets that far, but what an assistive program puts in is set, which no validator is
// asked about.
void take_back_invalid_text(QLineEdit& edit);

class UintValidator : public QValidator {
    Q_OBJECT

public:
    UintValidator(quint32 bottom, quint32 top, QObject* parent = nullptr);

    State validate(QString& input, int& pos) const override;

private:
    quint32 bottom_;
    quint32 top_;
};

class Uint64Validator : public QValidator {
    Q_OBJECT

public:
    Uint64Validator(quint64 bottom, quint64 top, QObject* parent = nullptr);

    State validate(QString& input, int& pos) const override;

private:
    quint64 bottom_;
    quint64 top_;
};
