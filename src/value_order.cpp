// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "value_order.h"

#include "reg_key.h"

#include <algorithm>
#include <numeric>

std::vector<int> rows_by_name(const std::vector<QString>& names, const QString& default_name, int unnamed) {
    std::vector<int> rows(names.size());
    std::iota(rows.begin(), rows.end(), 0);
    const auto before = [&](int a, int b) {
        // Another value may be named like the unnamed one is shown; the unnamed one is the first row all the same.
        if (a == unnamed || b == unnamed)
            return a == unnamed && b != unnamed;
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
    for (int i = 0; i < count; i++) {
        const std::optional<QString> name = key.value_name(i);
        names.push_back(name.has_value() && name->isEmpty() ? default_name : name.value_or(QString()));
    }
    const int unnamed = key.default_value_position();
    std::vector<QString> shown;
    if (unnamed < 0)
        shown.push_back(default_name);
    for (const int row : rows_by_name(names, default_name, unnamed))
        shown.push_back(names[static_cast<size_t>(row)]);
    return shown;
}
