// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// The values table: its context menus, new, delete and rename, and the editor that fits each kind of data.
#pragma once

#include <QTableView>

class QAction;

class ValuesView : public QTableView {
    Q_OBJECT

public:
    explicit ValuesView(QWidget* parent);

public slots:
    void value_double_clicked(QModelIndex index);
    void show_values_context_menu(QPoint point);
    void run_new_value_action(QAction* action);
    void run_delete_value_action(bool checked);
    void run_rename_value_action(bool checked);

protected:
    void keyPressEvent(QKeyEvent* event) override;
    void paintEvent(QPaintEvent* event) override;
    bool viewportEvent(QEvent* event) override;

private:
    void size_columns(int old_count, int new_count);
    void make_current(const QModelIndex& index);
    QString cut_text(const QModelIndex& index) const;
    void edit_value(const QModelIndex& index);
    // False when what was entered could not be stored.
    bool edit_dword(const QString& value_name, quint32 number, const QPersistentModelIndex& data_index);
    bool edit_qword(const QString& value_name, quint64 number, const QPersistentModelIndex& data_index);
};
