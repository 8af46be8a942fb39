// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// The window's search: one walk of the key model on a worker thread behind a modal dialog.

#include "failure_report.h"
#include "find_dialog.h"
#include "finish_editing.h"
#include "keys_view.h"
#include "main_window.h"
#include "values_proxy_model.h"
#include "values_view.h"

#include <QCoreApplication>
#include <QDialog>
#include <QMessageBox>
#include <QUnhandledException>
#include <QtConcurrentRun>

namespace {

// What the task of a future threw; empty when it threw nothing.
QString failure_of(QFuture<RegModel::FindResult> future) {
    try {
        try {
            future.waitForFinished();
        } catch (const QUnhandledException& wrapped) {
            if (!wrapped.exception())
                throw;
            std::rethrow_exception(wrapped.exception());
        }
    } catch (const std::exception& failure) {
        return reason_of(failure);
    }
    return {};
}

}  // namespace

void MainWindow::show_find_dialog() {
    if (!end_editing_before_change(*this))
        return;
    FindRequest request{find_term, find_mode, find_flags};
    if (!ask_find_request(request))
        return;
    find_flags = request.flags;
    find_mode = request.mode;
    find_term = request.term;
    start_search(key_model ? key_model->index(0, 0) : QModelIndex());
}

void MainWindow::find_next() {
    if (can_find_next)
        start_search(QModelIndex());
    else
        show_find_dialog();
}

// Searches as was asked for last. An invalid start goes on where the model's last search stopped.
void MainWindow::start_search(const QModelIndex& start) {
    // First of all: the search's dialog would take the keyboard from an open editor, and its commit would change the
    // tree under the worker's feet.
    if (!key_model || !end_editing_before_change(*this))
        return;
    if (start.isValid()) {
        key_model->begin_find(start);
        can_find_next = true;
    }
    find_future = QtConcurrent::run(&RegModel::find, key_model.data(), QVariant(find_term), find_mode, find_flags);
    find_watcher.setFuture(find_future);
    search_dialog = make_searching_dialog(this);
    // Once it has run, the dialog is gone.
    const int result = search_dialog->exec();
    search_dialog = nullptr;
    if (result == QDialog::Rejected)
        end_search();
}

// Returns when the worker has ended, so that nothing reads a tree that the user changes next.
void MainWindow::end_search() {
    find_future.cancel();
    if (key_model)
        key_model->stop_find();
    [[maybe_unused]] const QString ignored = failure_of(find_future);
    // Whatever it found or threw in the end may still be on its way here; the user has asked not to see it.
    find_watcher.setFuture(QFuture<RegModel::FindResult>());
    can_find_next = false;
}

void MainWindow::show_find_result() {
    const QString failure = failure_of(find_watcher.future());
    if (find_watcher.isCanceled() && failure.isEmpty()) {
        can_find_next = false;
        return;
    }
    if (search_dialog) {
        search_dialog->done(QDialog::Accepted);
        search_dialog = nullptr;
    }
    if (!failure.isEmpty()) {
        // "Find next" goes on behind the key that threw.
        const QString key_path = key_model ? key_path_of(key_model->searched_key()) : QString();
        const QString line = FailureReport::instance().mark_told(key_path, failure);
        tell_failure(this, tr("The search could not go on: %1").arg(line));
        return;
    }
    const RegModel::FindResult hit = find_watcher.future().result();
    if (hit.key.isValid()) {
        show_hit(hit);
        return;
    }
    can_find_next = false;
    QMessageBox::information(this, QCoreApplication::applicationName(), tr("Finished searching."), QMessageBox::Ok);
}

void MainWindow::show_hit(const RegModel::FindResult& hit) {
    const QModelIndex key = KeysView::index_now(hit.key);
    for (QModelIndex step = key; step.isValid(); step = step.parent())
        keys_tree->setExpanded(step, true);
    keys_tree->setCurrentIndex(key);
    keys_tree->show_current();
    if (!values_proxy->has_key()) {
        // Where the key was current already, and had been let go of.
        reload_values(key);
    }
    // What is pressed next is about the hit.
    if (hit.value_row < 0) {
        keys_tree->setFocus();
        return;
    }
    // The row is one of the sorted table, which a value added or renamed since has left unsorted.
    values_proxy->sort(0, Qt::AscendingOrder);
    values_table->setCurrentIndex(values_proxy->index(hit.value_row, 0));
    values_table->show_current();
    values_table->setFocus();
}
