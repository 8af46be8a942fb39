// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// A hive of its own in a model, and searches of it.
#pragma once

#include "hive_on_disk.h"

#include "reg_model.h"

#include <QStringList>

inline QString path_of(const QModelIndex& index) {
    QStringList names;
    for (QModelIndex up = index; up.isValid(); up = up.parent())
        names.prepend(up.data(Qt::AccessibleTextRole).toString());
    return names.join(QLatin1Char('/'));
}

// The key at a path, its names parted by slashes; invalid when there is none.
inline QModelIndex key_below(const RegModel& model, const QModelIndex& start, const QString& path) {
    QModelIndex here = start;
    const QStringList names = path.split(QLatin1Char('/'));
    for (const QString& name : names) {
        QModelIndex found;
        for (int row = 0; row < model.rowCount(here); row++) {
            // Also beside a key that cannot be read.
            if (model.index(row, 0, here).data(Qt::AccessibleTextRole).toString() == name)
                found = model.index(row, 0, here);
        }
        here = found;
    }
    return here;
}

struct Searched {
    HiveOnDisk file;
    RegModel model;

    template <typename Contents>  // a layout or bytes
    explicit Searched(const Contents& contents) : file(contents) {
        model.add_hive(QStringLiteral("TOP/HIVE"), file.path());
    }

    // The key at a path below the hive's root.
    QModelIndex at(const QString& path) { return key_below(model, model.index(0, 0, model.index(0, 0)), path); }

    // "PATH" or "PATH : ROW".
    static QString text_of(const RegModel::FindResult& hit) {
        return path_of(hit.key) + (hit.value_row < 0 ? QString() : QStringLiteral(" : %1").arg(hit.value_row));
    }

    void begin() { model.begin_find(model.index(0, 0)); }

    // The hits from where the search is to its end.
    QStringList rest(const QString& term, RegModel::FindMode mode, Qt::MatchFlags flags = Qt::MatchContains) {
        QStringList hits;
        for (;;) {
            const RegModel::FindResult hit = model.find(term, mode, flags);
            if (!hit.key.isValid())
                return hits;
            hits.append(text_of(hit));
        }
    }

    // Every hit of a search from the first group on.
    QStringList all(const QString& term, RegModel::FindMode mode, Qt::MatchFlags flags = Qt::MatchContains) {
        begin();
        return rest(term, mode, flags);
    }
};
