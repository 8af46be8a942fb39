// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// What the user types to get to a row by its name: letters that follow each other soon belong together.
#pragma once

#include <QElapsedTimer>
#include <QString>

class TypeAhead {
public:
    // `typed` is not empty.
    void add(const QString& typed);
    // What a row's name is to begin with.
    QString wanted() const { return is_repeated() ? typed_.left(1) : typed_; }
    // One letter, once or again and again, goes from match to match; more letters may mean the current row still.
    bool is_repeated() const { return typed_.count(typed_[0]) == typed_.size(); }

private:
    QString typed_;
    QElapsedTimer since_typed_;
};
