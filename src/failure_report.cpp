// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "failure_report.h"

#include <QApplication>
#include <QMessageBox>
#include <QPointer>

#include <algorithm>

namespace {

// A hive can hold thousands of damaged keys; a box must still fit the screen.
constexpr qsizetype max_lines = 10;

}  // namespace

FailureReport::FailureReport(QObject* parent) : QObject(parent) {}

FailureReport& FailureReport::instance() {
    static QPointer<FailureReport> the_report;
    if (!the_report)
        the_report = new FailureReport(qApp);
    return *the_report;
}

void FailureReport::report(const QString& key_path, const std::exception& failure) {
    tell_once(key_path, reason_of(failure));
}

void FailureReport::report_row(const QString& key_path, const std::exception& failure) {
    const QString reason = reason_of(failure);
    int& told = rows_told_[{key_path.left(key_path.lastIndexOf(QLatin1Char('\\'))), reason}];
    // Rows that join a box still to come are counted in its last line.
    if (told_.contains({key_path, reason}) || (told >= max_lines && pending_.isEmpty()))
        return;
    told++;
    tell_once(key_path, reason);
}

void FailureReport::tell_once(const QString& key_path, const QString& reason) {
    if (told_.contains({key_path, reason}))
        return;
    pending_.append(mark_told(key_path, reason));
    if (!scheduled_) {
        scheduled_ = true;
        QMetaObject::invokeMethod(this, &FailureReport::show_pending, Qt::QueuedConnection);
    }
}

QString FailureReport::mark_told(const QString& key_path, const QString& reason) {
    told_.insert({key_path, reason});
    return key_path.isEmpty() ? tr("The registry cannot be read: %1").arg(reason)
                              : tr("The key \"%1\" cannot be read: %2").arg(key_path, reason);
}

void FailureReport::report_at_current(const std::exception& failure, bool from_gesture) {
    const QString reason = reason_of(failure);
    if (!is_told_below(from_gesture ? current_key_ + QLatin1Char('\\') : QString(), reason))
        report(current_key_, failure);
}

void FailureReport::report_at_shown(const std::exception& failure) { report(shown_key_, failure); }

void FailureReport::forget(const QString& key_path) {
    told_.removeIf([&](const QPair<QString, QString>& told) { return told.first == key_path; });
}

bool FailureReport::is_told_below(const QString& key_path, const QString& reason) const {
    return std::any_of(told_.cbegin(), told_.cend(), [&](const QPair<QString, QString>& told) {
        return told.second == reason && told.first.startsWith(key_path);
    });
}

void FailureReport::show_pending() {
    // What arrives while the box is open waits for the next one instead of stacking boxes.
    while (!pending_.isEmpty()) {
        QStringList lines = pending_.mid(0, max_lines);
        if (pending_.size() > max_lines)
            lines.append(tr("More keys cannot be read: %1").arg(pending_.size() - max_lines));
        pending_.clear();
        tell_failure(QApplication::activeWindow(), lines.join(QLatin1Char('\n')));
    }
    scheduled_ = false;
}

QString reason_of(const std::exception& failure) { return QString::fromLocal8Bit(failure.what()); }

void tell_failure(QWidget* parent, const QString& text) {
    QMessageBox box(QMessageBox::Critical, QCoreApplication::applicationName(), text, QMessageBox::Ok, parent);
    box.setTextFormat(Qt::PlainText);
    box.exec();
}

void meet_failures(QWidget* parent, const QString& key_path, const std::function<void()>& gesture) {
    try {
        gesture();
    } catch (const std::exception& failure) {
        tell_failure(parent, FailureReport::instance().mark_told(key_path, reason_of(failure)));
    }
}

void read_name_ahead(const QModelIndex& index) {
    const QVariant name = index.data(Qt::EditRole);
    const Qt::ItemFlags flags = index.flags();
    if (!name.isValid() && flags.testFlag(Qt::ItemIsEditable)) {
        // A value that cannot be read has no name, and no editor comes for it. What its icon is asked of says why.
        [[maybe_unused]] const QVariant icon = index.data(Qt::DecorationRole);
    }
}

QString key_path_of(const QModelIndex& index) {
    QStringList names;
    QModelIndex step = index;
    while (step.isValid()) {
        try {
            names.prepend(step.data(Qt::DisplayRole).toString());
        } catch (const std::exception&) {
            names.prepend(QStringLiteral("#%1").arg(step.row()));
        }
        try {
            step = step.parent();
        } catch (const std::exception&) {
            step = QModelIndex();
        }
    }
    return names.join(QLatin1Char('\\'));
}
