// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// The values of a key in both models and in views of them, and whether all of these agree.
#pragma once

#include "hive_on_disk.h"

#include "reg_hive.h"
#include "reg_key.h"
#include "values_model.h"
#include "values_proxy_model.h"

#include <QHeaderView>
#include <QSet>
#include <QTableView>

// How often a model has begun to tell of new or lost rows, and not ended; and how many rows it has by what it told.
struct Told {
    int begun = 0;
    int open = 0;
    int rows = 0;

    explicit Told(const QAbstractItemModel& model) {
        const auto begin = [this] {
            begun++;
            open++;
        };
        const auto more = [this](const QModelIndex&, int first, int last) {
            open--;
            rows += last - first + 1;
        };
        const auto fewer = [this](const QModelIndex&, int first, int last) {
            open--;
            rows -= last - first + 1;
        };
        QObject::connect(&model, &QAbstractItemModel::rowsAboutToBeInserted, &model, begin);
        QObject::connect(&model, &QAbstractItemModel::rowsInserted, &model, more);
        QObject::connect(&model, &QAbstractItemModel::rowsAboutToBeRemoved, &model, begin);
        QObject::connect(&model, &QAbstractItemModel::rowsRemoved, &model, fewer);
        QObject::connect(&model, &QAbstractItemModel::modelReset, &model, [this, &model] { rows = model.rowCount(); });
    }
};

// The key at a place below the root of a hive whose file outlives it, in both models.
struct OpenedValues {
    HiveOnDisk& file;
    DummyRegKey top{QStringLiteral("TOP")};
    RegHive hive{QStringLiteral("HIVE"), file.path(), &top};
    RegKey* key;
    ValuesModel source;
    ValuesProxyModel proxy;

    OpenedValues(HiveOnDisk& opened, int number)
        : file(opened), key(static_cast<RegKey*>(hive.root_key()->child(number))), source(key) {}

    void attach() {
        proxy.setSourceModel(&source);
        proxy.sort(0, Qt::AscendingOrder);
    }
};

struct Shown : OpenedValues {
    Told of_the_source{source};  // ahead of model and views, which may throw when they are told
    Told of_the_table{proxy};
    QTableView source_view;
    QTableView view;

    Shown(HiveOnDisk& opened, int number) : OpenedValues(opened, number) {
        attach();
        source_view.setModel(&source);
        view.setModel(&proxy);
    }
    ~Shown() { view.setModel(nullptr); }

    QStringList names() const {
        QStringList all;
        for (int row = 0; row < proxy.rowCount(); row++)
            all.append(proxy.index(row, 0).data().toString());
        return all;
    }

    // What does not agree. A row that was to be inserted is announced by the source whether it comes or not, which is
    // for the table's model to put right.
    QString wrong(bool is_insertion) {
        QStringList names;
        for (int row = 0; row < key->value_count(); row++)
            names.append(key->value_name(row).value_or(QStringLiteral("?")));
        if (!is_insertion && source_view.verticalHeader()->count() != names.size())
            return QStringLiteral("rows of the source");
        for (int row = 0; row < names.size(); row++) {
            if (source.index(row, 0).data().toString() !=
                (names[row].isEmpty() ? QStringLiteral("(Default)") : names[row]))
                return QStringLiteral("a name of the source");
        }
        const int rows = static_cast<int>(names.size()) + (names.contains(QString()) ? 0 : 1);
        if (proxy.rowCount() != rows || view.verticalHeader()->count() != rows)
            return QStringLiteral("rows of the table");
        if (of_the_table.rows != rows)
            return QStringLiteral("rows that the table told of");
        QSet<int> shown;
        for (int row = 0; row < rows; row++)
            shown.insert(proxy.mapToSource(proxy.index(row, 0)).row());
        if (shown.size() != rows)
            return QStringLiteral("a row shown twice");
        if (view.currentIndex().row() < 0 || view.currentIndex().row() >= rows)
            return QStringLiteral("the current row");
        return QString();
    }
};
