// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// The key tree: its context menu, and the key commands of the shared actions.
#pragma once

#include "type_ahead.h"

#include <QTreeView>

class RegModel;

class KeysView : public QTreeView {
    Q_OBJECT

public:
    explicit KeysView(QWidget* parent);

    void setModel(QAbstractItemModel* model) override;

    // The index of the same key at the row where it stands now; invalid where its parent does not list it any more. The
    // key object must still be there.
    static QModelIndex index_now(const QModelIndex& key);

    // Asked before a press of the mouse takes the keyboard from the editor of a name. Ends the naming; where that
    // moves the rows, the key that was pressed becomes current, and true says that the press has done its work. The
    // same is said then of the moves with the button held, of its release, and of a double click that follows.
    bool take_mouse_from_naming(const QMouseEvent& event);

    // Highlights the current row, opens what it stands in and brings its name into sight.
    void show_current();

    // Moves to the next shown key whose name begins with what is being typed; passes over those without a name.
    void keyboardSearch(const QString& typed) override;

public slots:
    void show_keys_context_menu(QPoint point);
    void run_new_key_action(bool checked);
    void run_delete_key_action(bool checked);
    void run_rename_key_action(bool checked);

protected:
    bool event(QEvent* event) override;
    QItemSelectionModel::SelectionFlags selectionCommand(const QModelIndex& index, const QEvent* event) const override;
    void keyPressEvent(QKeyEvent* event) override;
    void mousePressEvent(QMouseEvent* event) override;
    void paintEvent(QPaintEvent* event) override;

private:
    void follow_highlight();
    bool take_press_from_naming(const QMouseEvent& press);
    void make_key(RegModel& keys);
    void delete_key();
    bool confirm_remove();
    void expand_below(const QModelIndex& top);
    bool select_if_named(const QModelIndex& key, const QString& beginning);

    // The press that asks for the next context menu was meant for a row that has moved away.
    bool menu_is_stale_ = false;
    // The button of the last press, where it ended a naming and moved the rows.
    Qt::MouseButton taken_button_ = Qt::NoButton;
    TypeAhead typed_;
};
