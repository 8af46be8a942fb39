// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// The one top-level window: the key tree, the values of the current key, the menus, the status bar and the search.
#pragma once

#include "delegates.h"
#include "reg_model.h"

#include <QFuture>
#include <QFutureWatcher>
#include <QMainWindow>
#include <QPointer>

#include <memory>

class KeysView;
class QDialog;
class QLabel;
class QSplitter;
class RegKey;
class ValuesModel;
class ValuesProxyModel;
class ValuesView;

class MainWindow : public QMainWindow {
    Q_OBJECT

public:
    explicit MainWindow(QWidget* parent = nullptr, Qt::WindowFlags flags = Qt::WindowFlags());
    // Leaves the key model alone: it is gone by then.
    ~MainWindow() override;

    // Called once. `model` is not owned and must live until the event loop has ended; null leaves the tree empty.
    void set_model(RegModel* model);

public slots:
    void update_statusbar();
    void update_statusbar(const QModelIndex& top_left, const QModelIndex& bottom_right);
    void reload_values(const QModelIndex& current);
    void reload_values(const QModelIndex& current, const QModelIndex& previous);
    void value_selected(const QModelIndex& current);
    void value_selected(const QModelIndex& current, const QModelIndex& previous);
    void refresh_views();
    void show_find_dialog();
    void find_next();
    void show_find_result();

protected:
    void closeEvent(QCloseEvent* event) override;
    void resizeEvent(QResizeEvent* event) override;
    void keyPressEvent(QKeyEvent* event) override;
    // Follows the menu bar and the status bar, whose heights change without a resize of the window.
    bool eventFilter(QObject* watched, QEvent* event) override;

private:
    void make_views();
    void make_menus();
    void place_splitter();
    void show_status(const QModelIndex& key);  // and notes for failures that it is the shown one
    void show_values_of(const QModelIndex& key);
    void set_values_source(RegKey* key);
    void let_go_of_lost_key();
    void set_key_actions(const QModelIndex& key);
    void start_search(const QModelIndex& start);
    void show_hit(const RegModel::FindResult& hit);
    void end_search();

    QSplitter* splitter = nullptr;
    KeysView* keys_tree = nullptr;
    ValuesView* values_table = nullptr;
    QLabel* status_label = nullptr;
    KeyDelegate key_delegate;
    ValueDelegate value_delegate;
    // Destroyed from the last one on: the source model, then the proxy over it.
    std::unique_ptr<ValuesProxyModel> values_proxy;
    std::unique_ptr<ValuesModel> values_source;
    QDialog* search_dialog = nullptr;  // null but while it is open; deletes itself
    QString find_term;
    RegModel::FindMode find_mode = RegModel::FindKeys;
    Qt::MatchFlags find_flags = Qt::MatchContains;
    QFuture<RegModel::FindResult> find_future;
    QFutureWatcher<RegModel::FindResult> find_watcher;
    bool can_find_next = false;
    QPointer<RegModel> key_model;  // null before set_model, and once the model is gone
};
