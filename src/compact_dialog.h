// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// The size that the editors and the question for a search term open in.
#pragma once

class QDialog;
class QWidget;

// Makes a dialog that has its layout 360 pixels wide and just as high as its contents need, a height that stays, and
// gives the keyboard to one of its widgets.
void make_compact(QDialog& dialog, QWidget& focused);
