// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// The one set of editing actions that the main menu and both context menus share.
#pragma once

class QAction;
class QActionGroup;
class QMenu;

struct SharedActions {
    QAction* new_key_action;
    QAction* new_string_action;
    QAction* new_binary_action;
    QAction* new_dword_action;
    QAction* new_qword_action;
    QAction* new_multi_string_action;
    QAction* new_expand_string_action;
    QAction* delete_action;
    QAction* rename_action;
    QActionGroup* new_action_group;
};

// The process's set, made by the first call, in the language of that moment, and never freed. Nothing is selected
// then, so all of it starts disabled.
const SharedActions& shared_actions();

// Puts the actions that make a key or value into a menu, in the order that both menus have.
void add_new_actions(QMenu& menu);
