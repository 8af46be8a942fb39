// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// The values table: its context menus, new, delete and rename, and the editor that fits each kind of data.
#pragma once

#include "type_ahead.h"

#include <QTableView>

class QAction;
class ValuesProxyModel;

class ValuesView : public QTableView {
    Q_OBJECT

public:
    explicit ValuesView(QWidget* parent);

    // Highlights the current row and brings it into sight.
    void show_current();

    // Moves to the next value whose name begins with what is being typed.
    void keyboardSearch(const QString& typed) override;

signals:
    // The key whose values are shown does not say how many it has: nothing was painted.
    void row_count_failed();

public slots:
    void value_double_clicked(QModelIndex index);
    void show_values_context_menu(QPoint point);
    void run_new_value_action(QAction* action);
    void run_delete_value_action(bool checked);
    void run_rename_value_action(bool checked);

protected:
    bool event(QEvent* event) override;
    QItemSelectionModel::SelectionFlags selectionCommand(const QModelIndex& index, const QEvent* event) const override;
    void keyPressEvent(QKeyEvent* event) override;
    void paintEvent(QPaintEvent* event) override;
    bool viewportEvent(QEvent* event) override;
    // Holds back a paint of the header, which asks the key as well, where the key does not say how many values it has.
    bool eventFilter(QObject* watched, QEvent* event) override;

private:
    void size_columns(int old_count, int new_count);
    void make_current(const QModelIndex& index);
    int row_of(const QString& name, int row) const;
    bool check_key();
    void show_new_menu(QPoint point);
    void make_value(ValuesProxyModel& values, int type);
    void delete_value();
    QString cut_text(const QModelIndex& index) const;
    void edit_value(const QModelIndex& index);
    // False when what was entered could not be stored.
    bool edit_dword(const QString& value_name, quint32 number, const QPersistentModelIndex& data_index);
    bool edit_qword(const QString& value_name, quint64 number, const QPersistentModelIndex& data_index);

    TypeAhead typed_;
};
