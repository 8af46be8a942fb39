// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// The size that the editors and the question for a search term open in.
#pragma once

class QDialog;
class QWidget;

// Makes a dialog whose layout is set 360 pixels wide, and as high as its contents need and no higher, and gives the
// keyboard to one of its widgets.
void make_compact(QDialog& dialog, QWidget& focused);
