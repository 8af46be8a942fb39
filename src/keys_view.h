// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#pragma once

// The key tree: its context menu, and the key commands of the shared actions.

#include <QTreeView>

class KeysView : public QTreeView {
    Q_OBJECT

public:
    explicit KeysView(QWidget* parent);

    void setModel(QAbstractItemModel* model) override;

    // The index of the same key at the row where the key stands now.
    static QModelIndex in_place(const QModelIndex& key);

public slots:
    void show_keys_context_menu(QPoint point);
    void run_new_key_action(bool checked);
    void run_delete_key_action(bool checked);
    void run_rename_key_action(bool checked);

protected:
    void mousePressEvent(QMouseEvent* event) override;
    void paintEvent(QPaintEvent* event) override;

private:
    bool confirm_remove();
    void tell_refused(const QString& text);
};
