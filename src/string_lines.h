// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// A list of strings as the lines of a text: one line each, or more where a string has line ends inside. Not all
// characters survive the text widget, so a string that the user leaves alone is known by its lines.
#pragma once

#include <QStringList>

class QTextDocument;
class QTextEdit;

// The text without its zeros, which a clipboard can hold: a value's text ends at its first one, and what is behind it
// would never be seen again.
QString without_zeros(QString text);

class StringLines {
public:
    explicit StringLines(const QStringList& strings);

    // Shows the lines as plain text, each block marked with the string that it belongs to.
    void fill(QTextEdit& edit) const;

    // What the filled document says now: the string that was given where its lines stand together as they were shown,
    // else a string for each line.
    QStringList strings_in(const QTextDocument& document) const;

private:
    // Lines of the text, and for each the string that it was shown for, -1 where the user has made it.
    struct Lines {
        QStringList texts;
        QList<int> shown_for;
    };

    QStringList strings_between(qsizetype first, qsizetype end, const Lines& lines) const;
    QStringList strings_among(qsizetype first, qsizetype end, const Lines& lines) const;
    QStringList all_lines() const;

    QStringList strings_;
    QList<QStringList> lines_;  // of each string
};
