// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// The order in which the values of a key are shown: the unnamed one first, then by name, case ignored.
#pragma once

#include <QString>

#include <functional>
#include <optional>
#include <vector>

class RegKey;

// The names of so many rows, as name_of gives them. Equal ones share one text: a damaged list can lead to one value
// many thousand times, and its name may be long. is_stopped is asked now and then; nothing when it says so.
std::optional<std::vector<QString>> names_of_rows(
    int rows, const std::function<QString(int)>& name_of,
    const std::function<bool()>& is_stopped = [] { return false; });

// Source rows in the order of their shown names, default_name being the one that comes first. Names that differ only
// in case keep no defined order among themselves, but the same names always come out the same. The row of the unnamed
// value (-1: none) is the first in any case.
std::vector<int> rows_by_name(const std::vector<QString>& names, const QString& default_name, int unnamed);

// The names of a key's values as the table shows them from row 0 on, with default_name for the unnamed value, whether
// the key has one or the table makes one up. Nothing when is_stopped says so.
std::optional<std::vector<QString>> shown_value_names(RegKey& key, const QString& default_name,
                                                      const std::function<bool()>& is_stopped);
