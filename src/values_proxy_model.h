// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// What stands between a ValuesModel and the table: sorted by name, and with a row for the unnamed value always.
#pragma once

#include <QAbstractProxyModel>
#include <QHash>

#include <functional>
#include <vector>

class RegKey;

// When the key has no unnamed value, row 0 is a synthetic one for it; every other row maps to a source row. Positions
// behind the sorted ones (values added since) map to themselves, which keeps a new value at the bottom until the next
// sort. Throws what its source and the key throw, setSourceModel() and rowCount() too.
class ValuesProxyModel : public QAbstractProxyModel {
    Q_OBJECT

public:
    ValuesProxyModel();

    // A model reset. The source is not owned.
    void setSourceModel(QAbstractItemModel* source) override;

    QModelIndex index(int row, int column, const QModelIndex& parent = QModelIndex()) const override;
    QModelIndex parent(const QModelIndex& index) const override;
    int rowCount(const QModelIndex& parent = QModelIndex()) const override;
    int columnCount(const QModelIndex& parent = QModelIndex()) const override;
    bool hasChildren(const QModelIndex& parent = QModelIndex()) const override;
    QVariant headerData(int section, Qt::Orientation orientation, int role) const override;
    QModelIndex mapToSource(const QModelIndex& proxy_index) const override;
    QModelIndex mapFromSource(const QModelIndex& source_index) const override;
    QVariant data(const QModelIndex& index, int role) const override;
    Qt::ItemFlags flags(const QModelIndex& index) const override;
    // The data of the synthetic row creates the unnamed value.
    bool setData(const QModelIndex& index, const QVariant& value, int role) override;
    bool removeRows(int row, int count, const QModelIndex& parent = QModelIndex()) override;
    // Reads every row anew and orders them by name, ascending, whatever is asked for.
    void sort(int column, Qt::SortOrder order) override;

    // Creates a value of a type; it is the last row until the next sort.
    bool add_value(int type);
    bool has_key() const;

public slots:
    void on_rows_inserted(const QModelIndex& parent, int first, int last);
    void on_data_changed(const QModelIndex& first, const QModelIndex& last);

private:
    RegKey* key() const;
    int offset() const { return synthetic_default_ ? 1 : 0; }
    bool is_synthetic(int row) const { return synthetic_default_ && row == 0; }
    int source_row(int row) const;
    void ask_for_default();
    void find_default_again();
    QVariant spoken_data(const QModelIndex& index) const;
    bool change_source(const std::function<bool()>& change);
    bool make_default(const QModelIndex& index, const QVariant& value);
    bool give_way_to_default();
    int rows_now(int otherwise) const;  // otherwise: where the key cannot say
    void announce_layout();
    bool arrange(const std::function<void()>& move_indexes);
    bool order_rows();
    QHash<int, QString> names_of_held_rows() const;
    void move_held_rows(const QHash<int, QString>& names_before, int renamed, const QString& new_name);
    void note_moved_to_end(int row);
    bool remove_from_source(int row, int source);
    void end_removal(int row, int source, int rows_before);

    std::vector<int> mapping_;  // source row by position; empty until the first sort
    bool synthetic_default_ = false;
    int unnamed_ = -1;  // source row of the unnamed value
    // Reads as ValuesModel::default_name() in every language; a test of the translations sees to it.
    QString default_name_;
    bool is_source_quiet_ = false;  // what the source says of its rows is not passed on
};
