// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// The dialog that asks what to search for, and the one that stays up while a search runs.
#pragma once

#include "reg_model.h"

#include <QString>

class QDialog;
class QWidget;

struct FindRequest {
    QString term;
    RegModel::FindMode mode;
    // One of Qt::MatchContains, Qt::MatchFixedString and Qt::MatchWildcard; no search minds the case.
    Qt::MatchFlags flags;
};

// Shows `request` for the user to change; false, and the request as it was, on anything but Ok.
bool ask_find_request(FindRequest& request);

// The "Searching..." dialog, which deletes itself once it has run. Its only button rejects it.
QDialog* make_searching_dialog(QWidget* parent);
