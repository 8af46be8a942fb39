// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "shared_actions.h"

#include <QAction>
#include <QActionGroup>
#include <QCoreApplication>
#include <QKeySequence>
#include <QMenu>

namespace {

SharedActions make_actions() {
    SharedActions set{};
    set.new_action_group = new QActionGroup(nullptr);
    QActionGroup& group = *set.new_action_group;
    set.new_key_action = group.addAction(QCoreApplication::translate("MainWindow", "Key", "menu item"));
    set.new_string_action = group.addAction(QCoreApplication::translate("MainWindow", "String Value", "menu item"));
    set.new_binary_action = group.addAction(QCoreApplication::translate("MainWindow", "Binary Value", "menu item"));
    set.new_dword_action =
        group.addAction(QCoreApplication::translate("MainWindow", "DWORD (32-bit) Value", "menu item"));
    set.new_qword_action =
        group.addAction(QCoreApplication::translate("MainWindow", "QWORD (64-bit) Value", "menu item"));
    set.new_multi_string_action =
        group.addAction(QCoreApplication::translate("MainWindow", "Multi-String Value", "menu item"));
    set.new_expand_string_action =
        group.addAction(QCoreApplication::translate("MainWindow", "Expandable String Value", "menu item"));
    set.delete_action = new QAction(QCoreApplication::translate("MainWindow", "Delete", "menu item"), nullptr);
    set.delete_action->setShortcut(QKeySequence::Delete);
    set.rename_action = new QAction(QCoreApplication::translate("MainWindow", "Rename", "menu item"), nullptr);

    group.setEnabled(false);
    set.delete_action->setEnabled(false);
    set.rename_action->setEnabled(false);
    return set;
}

}  // namespace

const SharedActions& shared_actions() {
    static const SharedActions the_actions = make_actions();
    return the_actions;
}

void add_new_actions(QMenu& menu) {
    const SharedActions& actions = shared_actions();
    menu.addAction(actions.new_key_action);
    menu.addSeparator();
    for (QAction* action :
         {actions.new_string_action, actions.new_binary_action, actions.new_dword_action, actions.new_qword_action,
          actions.new_multi_string_action, actions.new_expand_string_action}) {
        menu.addAction(action);
    }
}
