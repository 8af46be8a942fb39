// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// The values of one key as a table, in the order of the key's own list.
#pragma once

#include "reg_value.h"

#include <QAbstractTableModel>
#include <QCache>

#include <functional>
#include <utility>
#include <vector>

class RegKey;

// Whatever asks the key throws, rowCount() too: std::runtime_error where the key cannot be opened,
// std::invalid_argument("index") where a value's record cannot be read. Who meets that: docs/architecture.md.
class ValuesModel : public QAbstractTableModel {
    Q_OBJECT

public:
    enum Column { NameColumn, TypeColumn, DataColumn, ColumnCount };

    // `key` may be null, which gives an empty table; it must outlive the model.
    explicit ValuesModel(RegKey* key, QObject* parent = nullptr);

    RegKey* key() const { return key_; }
    // The text that stands for the unnamed value.
    static QString default_name();

    int rowCount(const QModelIndex& parent = QModelIndex()) const override;
    int columnCount(const QModelIndex& parent = QModelIndex()) const override;
    QVariant headerData(int section, Qt::Orientation orientation, int role) const override;
    Qt::ItemFlags flags(const QModelIndex& index) const override;
    // The data column gives the value's QVariant as it is; the delegate makes the text. A value whose data cannot be
    // read has an invalid variant there, and cannot be edited.
    QVariant data(const QModelIndex& index, int role) const override;
    // The name column renames, the data column stores new data under the type that the value has. The role is not
    // looked at.
    bool setData(const QModelIndex& index, const QVariant& value, int role) override;
    // One row at a time.
    bool removeRows(int row, int count, const QModelIndex& parent = QModelIndex()) override;

    // Whether removeRows could delete the row's value.
    bool can_remove(int row) const;
    // Makes a value with a generated name and empty data, at the end. The signals of an inserted row come also for a
    // type that makes nothing; callers pass only the six types of the "New" menu, which all can be made.
    bool add_value(int type);
    // Makes the unnamed value, as text; false where there may be one.
    bool add_default_value(const QString& data);

    // Empties the cache, so that every row is read anew. Until then rows whose data could not be read are kept too: in
    // a damaged hive many values can lead to one long datum, and each paint would read all of it for each of them.
    void forget_rows() { cache_.clear(); }

    // Bytes that the cached rows count for: each its data's memory, but at least a hundredth of what the cache may hold
    // and at most all of it.
    qsizetype cached_bytes() const { return cache_.totalCost(); }

private:
    RegValue lookup(int row) const;
    bool store(int row, const QVariant& value);
    bool rename(int row, const QString& name);
    bool insert_at_end(const std::function<bool()>& make);
    bool make_empty(const QString& name, int type);
    int rows_now(int otherwise) const;  // otherwise: where the key cannot say
    void announce_new_rows(int before);
    std::vector<std::pair<int, RegValue>> take_shown();
    void announce_others(const std::vector<std::pair<int, RegValue>>& shown, int told);

    RegKey* key_;
    // The rows used last. A value whose data cannot be read stands here with an invalid variant.
    mutable QCache<int, RegValue> cache_;
};
