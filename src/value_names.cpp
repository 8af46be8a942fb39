// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "value_names.h"

#include "reg_key.h"

#include <algorithm>
#include <numeric>

std::vector<int> rows_by_name(const std::vector<QString>& names, const QString& default_name) {
    std::vector<int> rows(names.size());
    std::iota(rows.begin(), rows.end(), 0);
    const auto before = [&](int a, int b) {
        const QString& first = names[static_cast<size_t>(a)];
        const QString& second = names[static_cast<size_t>(b)];
        // Two rows of the default name are equal both ways: std::sort needs an order that does not contradict itself.
        if (first == default_name || second == default_name)
            return first == default_name && second != default_name;
        return QString::compare(first, second, Qt::CaseInsensitive) < 0;
    };
    std::sort(rows.begin(), rows.end(), before);
    return rows;
}

std::vector<QString> shown_value_names(RegKey& key, const QString& default_name) {
    std::vector<QString> names;
    const int count = key.value_count();
    bool has_default = false;
    for (int i = 0; i < count; i++) {
        const std::optional<QString> name = key.value_name(i);
        const bool is_default = name.has_value() && name->isEmpty();
        has_default = has_default || is_default;
        names.push_back(is_default ? default_name : name.value_or(QString()));
    }
    std::vector<QString> shown;
    if (!has_default)
        shown.push_back(default_name);
    for (const int row : rows_by_name(names, default_name))
        shown.push_back(names[static_cast<size_t>(row)]);
    return shown;
}
