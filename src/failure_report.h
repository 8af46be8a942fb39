// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Tells the user what a damaged key did while the window runs: in one box, once per cause, never from inside a paint.
#pragma once

#include <QHash>
#include <QModelIndex>
#include <QObject>
#include <QPair>
#include <QSet>
#include <QString>
#include <QStringList>

#include <exception>
#include <functional>

class FailureReport : public QObject {
    Q_OBJECT

public:
    // The one report of the running application, which owns it.
    static FailureReport& instance();

    // Notes what was caught while the key at `key_path` was used; an empty path means that the key is not known.
    // The box opens from the event loop, so this may be called while painting. A cause (key and reason) that was
    // told before is left out; what comes in while a box is open shares the next one.
    void report(const QString& key_path, const std::exception& failure);

    // The same for a row of the key tree that came into sight, which says itself that it cannot be read: of the rows
    // below one key that are damaged in one way, ten bring a box.
    void report_row(const QString& key_path, const std::exception& failure);

    // The same where nothing says which key it was: the current one is named, unless one below it was told with the
    // same reason, which is then what surfaced again. What did not come from a gesture, as when a screen reader asks
    // for a row's name, need not have to do with the current key: there any key that was told with the reason counts.
    void report_at_current(const std::exception& failure, bool from_gesture = true);

    // The same for the values that are shown: a gesture on another key leaves them where they are, and what they throw
    // is about no key below theirs.
    void report_at_shown(const std::exception& failure);

    // Marks a cause as told and gives its line, for a caller that tells it in a box of its own.
    QString mark_told(const QString& key_path, const QString& reason);

    // What a key throws from here on is told again.
    void forget(const QString& key_path);

    // The key that the user's last gesture was about.
    void set_current_key(const QString& key_path) { current_key_ = key_path; }
    // The key whose values are shown; the gesture that showed them was about it.
    void set_shown_key(const QString& key_path) { current_key_ = shown_key_ = key_path; }
    QString shown_key() const { return shown_key_; }

private:
    explicit FailureReport(QObject* parent);
    void tell_once(const QString& key_path, const QString& reason);
    void show_pending();
    bool is_told_below(const QString& key_path, const QString& reason) const;

    QString current_key_;
    QString shown_key_;
    QSet<QPair<QString, QString>> told_;             // key path and reason
    QHash<QPair<QString, QString>, int> rows_told_;  // path of the key above, and reason
    QStringList pending_;
    bool scheduled_ = false;
};

// What an exception says of itself.
QString reason_of(const std::exception& failure);

// A critical box with the application's name that shows the text letter by letter: a key's name may look like markup.
void tell_failure(QWidget* parent, const QString& text);

// Does what a gesture asked for. What that throws is told each time, with the key that it was about: the user waits
// for something that does not come.
void meet_failures(QWidget* parent, const QString& key_path, const std::function<void()>& gesture);

// Reads what an editor in place at `index` will ask for. What cannot be read throws here, and not from inside the
// toolkit, whose editing loses memory when an exception passes it.
void read_name_ahead(const QModelIndex& index);

// The names from the outermost key down to `index`, joined with backslashes. For a name that cannot be read
// stands the key's place among its siblings, as in "TOP\HIVE\#3": this never throws.
QString key_path_of(const QModelIndex& index);
