// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "string_lines.h"

#include <QHash>
#include <QTextBlock>
#include <QTextDocument>
#include <QTextEdit>

#include <algorithm>

namespace {

// Not toPlainText of the document: that turns a non-breaking space into a blank.
QStringList lines_of(const QTextBlock& block, bool had_line_separators) {
    const QString text = without_zeros(block.text());
    // Where none was shown, a line separator was pasted, and the user means a new line by it.
    return had_line_separators ? QStringList{text} : text.split(QChar::LineSeparator);
}

bool stands_at(qsizetype place, const QStringList& part, const QStringList& lines) {
    return lines.mid(place, part.size()) == part;
}

}  // namespace

QString without_zeros(QString text) { return text.remove(QChar::Null); }

StringLines::StringLines(const QStringList& strings) : strings_(strings) {
    QTextDocument document;
    for (const QString& string : strings) {
        document.setPlainText(string);
        lines_.append(QStringList());
        for (QTextBlock block = document.begin(); block.isValid(); block = block.next())
            lines_.last() += lines_of(block, true);
    }
}

void StringLines::fill(QTextEdit& edit) const {
    edit.setPlainText(all_lines().join(QLatin1Char('\n')));
    QTextBlock block = edit.document()->begin();
    for (int i = 0; i < lines_.size(); i++) {
        for (qsizetype line = 0; line < lines_[i].size(); line++, block = block.next())
            block.setUserState(i);
    }
}

QStringList StringLines::strings_in(const QTextDocument& document) const {
    const bool had_line_separators = all_lines().join(QString()).contains(QChar::LineSeparator);
    QStringList strings;
    Lines changed;  // since the last string that stands
    int next = 0;   // behind that string
    for (QTextBlock block = document.begin(); block.isValid();) {
        const int shown_for = block.userState();  // -1 for a line that the user has made
        QStringList run;
        do {
            run += lines_of(block, had_line_separators);
            block = block.next();
        } while (block.isValid() && block.userState() == shown_for && shown_for >= 0);
        if (shown_for >= next && run == lines_[shown_for]) {
            strings += strings_between(next, shown_for, changed) + QStringList{strings_[shown_for]};
            changed = {};
            next = shown_for + 1;
        } else {
            changed.texts += run;
            changed.shown_for += QList<int>(run.size(), shown_for);
        }
    }
    return strings + strings_between(next, lines_.size(), changed);
}

// Of the strings from first up to end those whose lines stand at the head or the tail of some lines, and what is
// between them. Return at the beginning of a line makes of the line, not of the new one, another block.
QStringList StringLines::strings_between(qsizetype first, qsizetype end, const Lines& lines) const {
    QStringList head;
    qsizetype from = 0;
    for (; first < end && stands_at(from, lines_[first], lines.texts); first++) {
        head.append(strings_[first]);
        from += lines_[first].size();
    }
    QStringList tail;
    qsizetype to = lines.texts.size();
    for (; first < end; end--) {
        const qsizetype place = to - lines_[end - 1].size();
        if (place < from || !stands_at(place, lines_[end - 1], lines.texts))
            break;
        tail.prepend(strings_[end - 1]);
        to = place;
    }
    const Lines between = {lines.texts.mid(from, to - from), lines.shown_for.mid(from, to - from)};
    return head + strings_among(first, end, between) + tail;
}

// A string for each line, but for lines that stand together as one of the strings from first up to end was shown, at
// least one of them being what was shown for it: the same lines typed anew are lines.
QStringList StringLines::strings_among(qsizetype first, qsizetype end, const Lines& lines) const {
    QHash<QString, QList<qsizetype>> by_first_line;  // those of more than one line: any other is its line
    for (qsizetype i = first; i < end; i++) {
        if (lines_[i].size() > 1)
            by_first_line[lines_[i].first()].append(i);
    }
    QStringList strings;
    for (qsizetype place = 0; place < lines.texts.size();) {
        const QList<qsizetype> alike = by_first_line.value(lines.texts[place]);
        const auto found = std::find_if(alike.cbegin(), alike.cend(), [&](qsizetype string) {
            return string >= first && stands_at(place, lines_[string], lines.texts) &&
                   lines.shown_for.mid(place, lines_[string].size()).contains(static_cast<int>(string));
        });
        if (found == alike.cend()) {
            strings.append(lines.texts[place++]);
            continue;
        }
        strings.append(strings_[*found]);
        place += lines_[*found].size();
        first = *found + 1;
    }
    return strings;
}

QStringList StringLines::all_lines() const {
    QStringList all;
    for (const QStringList& lines : lines_)
        all += lines;
    return all;
}
