// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Ends the in-place editors before anything changes, sorts or searches the rows that they stand on.
#pragma once

class QWidget;

// Commits and closes every editor in the views at and below `part`. The toolkit does so only when an editor loses the
// keyboard, which a menu does not take from it; and where a dialog does, it is too late. A name that is refused is
// told from the event loop.
void close_editors(const QWidget& part);

// The same; and a name that is refused is told before this returns.
void finish_editing(const QWidget& part);

// What a command that changes rows asks first: false while a dialog is open, which a screen reader can press menu
// items behind; else the editors in the whole window of `part` are finished, and false when the window was left
// meanwhile.
bool end_editing_before_change(const QWidget& part);
