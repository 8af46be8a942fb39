// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "value_order.h"

#include "reg_key.h"

#include <QHash>
#include <QSet>

#include <algorithm>
#include <numeric>
#include <utility>

namespace {

// Few keys have so many values, so few searches ask more often than between their steps.
constexpr int names_between_stop_checks = 256;

// The place of each name among them all in the order of names: equal ones have the same. Each text is compared with
// others once, however many rows share it.
std::vector<int> ranks(const std::vector<QString>& names, const QString& default_name) {
    QHash<std::pair<const QChar*, qsizetype>, int> numbers;
    std::vector<const QString*> texts;
    std::vector<int> text_of_row;
    text_of_row.reserve(names.size());
    for (const QString& name : names) {
        const auto found = numbers.constFind({name.constData(), name.size()});
        const int number = found != numbers.constEnd() ? *found : static_cast<int>(texts.size());
        if (found == numbers.constEnd()) {
            numbers.insert({name.constData(), name.size()}, number);
            texts.push_back(&name);
        }
        text_of_row.push_back(number);
    }
    const auto before = [&](int a, int b) {
        const QString& first = *texts[static_cast<size_t>(a)];
        const QString& second = *texts[static_cast<size_t>(b)];
        // Two rows of the default name are equal both ways: std::sort needs an order that does not contradict itself.
        if (first == default_name || second == default_name)
            return first == default_name && second != default_name;
        return QString::compare(first, second, Qt::CaseInsensitive) < 0;
    };
    std::vector<int> order(texts.size());
    std::iota(order.begin(), order.end(), 0);
    std::sort(order.begin(), order.end(), before);
    std::vector<int> rank_of_text(texts.size(), 0);
    for (size_t i = 1; i < order.size(); i++)
        rank_of_text[static_cast<size_t>(order[i])] =
            rank_of_text[static_cast<size_t>(order[i - 1])] + (before(order[i - 1], order[i]) ? 1 : 0);
    for (int& text : text_of_row)
        text = rank_of_text[static_cast<size_t>(text)];
    return text_of_row;
}

}  // namespace

std::optional<std::vector<QString>> names_of_rows(int rows, const std::function<QString(int)>& name_of,
                                                  const std::function<bool()>& is_stopped) {
    std::vector<QString> names;
    names.reserve(static_cast<size_t>(rows));
    QSet<QString> known;
    for (int row = 0; row < rows; row++) {
        if (row % names_between_stop_checks == names_between_stop_checks - 1 && is_stopped())
            return std::nullopt;
        names.push_back(*known.insert(name_of(row)));
    }
    return names;
}

std::vector<int> rows_by_name(const std::vector<QString>& names, const QString& default_name, int unnamed) {
    const std::vector<int> rank = ranks(names, default_name);
    std::vector<int> rows(names.size());
    std::iota(rows.begin(), rows.end(), 0);
    std::sort(rows.begin(), rows.end(), [&](int a, int b) {
        // Another value may be named like the unnamed one is shown; the unnamed one is the first row all the same.
        if (a == unnamed || b == unnamed)
            return a == unnamed && b != unnamed;
        return rank[static_cast<size_t>(a)] < rank[static_cast<size_t>(b)];
    });
    return rows;
}

std::optional<std::vector<QString>> shown_value_names(RegKey& key, const QString& default_name,
                                                      const std::function<bool()>& is_stopped) {
    int unnamed = -1;
    const auto name_of = [&](int row) {
        std::optional<QString> name = key.value_name(row);
        if (!name.has_value())  // a failed read that passes must not move the rows
            name = key.value_name(row);
        if (!name.has_value() || !name->isEmpty())
            return name.value_or(QString());
        unnamed = unnamed < 0 ? row : unnamed;
        return default_name;
    };
    const auto names = names_of_rows(key.value_count(), name_of, is_stopped);
    if (!names.has_value())
        return std::nullopt;
    std::vector<QString> shown;
    if (unnamed < 0)
        shown.push_back(default_name);
    for (const int row : rows_by_name(*names, default_name, unnamed))
        shown.push_back((*names)[static_cast<size_t>(row)]);
    return shown;
}
