// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "type_ahead.h"

#include <QApplication>

void TypeAhead::add(const QString& typed) {
    const bool goes_on = since_typed_.isValid() && since_typed_.elapsed() < QApplication::keyboardInputInterval();
    typed_ = goes_on ? typed_ + typed : typed;
    since_typed_.start();
}
