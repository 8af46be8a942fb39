// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "values_proxy_model.h"

#include "reg_key.h"
#include "value_order.h"
#include "value_text.h"
#include "values_model.h"

#include <QIcon>
#include <QScopedValueRollback>

#include <algorithm>
#include <exception>
#include <stdexcept>

ValuesProxyModel::ValuesProxyModel() : default_name_(tr("(Default)")) {}

RegKey* ValuesProxyModel::key() const {
    const auto* values = qobject_cast<const ValuesModel*>(sourceModel());
    return values != nullptr ? values->key() : nullptr;
}

bool ValuesProxyModel::has_key() const { return key() != nullptr; }

// Asked of the key after it got a value or lost one: what happened to a row does not say whether an unnamed value is
// left.
void ValuesProxyModel::ask_for_default() {
    RegKey* const shown = key();
    unnamed_ = shown != nullptr ? shown->default_value_position() : -1;
    synthetic_default_ = shown != nullptr && unnamed_ < 0;
}

void ValuesProxyModel::setSourceModel(QAbstractItemModel* source) {
    beginResetModel();
    if (sourceModel() != nullptr)
        disconnect(sourceModel(), nullptr, this, nullptr);
    QAbstractProxyModel::setSourceModel(source);
    if (source != nullptr) {
        connect(source, &QAbstractItemModel::rowsInserted, this, &ValuesProxyModel::on_rows_inserted);
        connect(source, &QAbstractItemModel::dataChanged, this, &ValuesProxyModel::on_data_changed);
    }
    mapping_.clear();
    synthetic_default_ = false;
    unnamed_ = -1;
    try {
        ask_for_default();
    } catch (...) {
        endResetModel();
        throw;
    }
    endResetModel();
}

QModelIndex ValuesProxyModel::index(int row, int column, const QModelIndex& parent) const {
    if (row < 0 || column < 0 || parent.isValid() || row >= rowCount() || column >= columnCount())
        return QModelIndex();
    return createIndex(row, column, static_cast<quintptr>(row));
}

QModelIndex ValuesProxyModel::parent(const QModelIndex& /*index*/) const { return QModelIndex(); }

int ValuesProxyModel::rowCount(const QModelIndex& parent) const {
    return sourceModel() == nullptr || parent.isValid() ? 0 : sourceModel()->rowCount() + offset();
}

int ValuesProxyModel::columnCount(const QModelIndex& /*parent*/) const {
    return sourceModel() != nullptr ? sourceModel()->columnCount() : 0;
}

bool ValuesProxyModel::hasChildren(const QModelIndex& parent) const { return rowCount(parent) > 0; }

QVariant ValuesProxyModel::headerData(int section, Qt::Orientation orientation, int role) const {
    return sourceModel() != nullptr ? sourceModel()->headerData(section, orientation, role) : QVariant();
}

int ValuesProxyModel::source_row(int row) const {
    const int position = row - offset();
    const auto place = static_cast<size_t>(position);
    return position >= 0 && place < mapping_.size() ? mapping_[place] : position;
}

QModelIndex ValuesProxyModel::mapToSource(const QModelIndex& proxy_index) const {
    if (!proxy_index.isValid() || sourceModel() == nullptr || is_synthetic(proxy_index.row()))
        return QModelIndex();
    return sourceModel()->index(source_row(proxy_index.row()), proxy_index.column());
}

QModelIndex ValuesProxyModel::mapFromSource(const QModelIndex& source_index) const {
    if (!source_index.isValid())
        return QModelIndex();
    const auto found = std::find(mapping_.begin(), mapping_.end(), source_index.row());
    const int position = found != mapping_.end() ? static_cast<int>(found - mapping_.begin()) : source_index.row();
    return index(position + offset(), source_index.column());
}

// What a screen reader says, which is what is shown; the toolkit would take bytes for text, and lists for nothing. It
// asks through parts that lose memory when an exception passes them.
QVariant ValuesProxyModel::spoken_data(const QModelIndex& index) const {
    try {
        const QVariant datum = data(index, Qt::DisplayRole);
        if (datum.isValid())
            return value_text(datum);
        if (index.column() != ValuesModel::NameColumn)
            return QVariant();
    } catch (const std::exception&) {
        // said below
    }
    return unreadable_text();
}

QVariant ValuesProxyModel::data(const QModelIndex& index, int role) const {
    if (!index.isValid() || sourceModel() == nullptr)
        return QVariant();
    if (role == Qt::AccessibleTextRole)
        return spoken_data(index);
    if (!is_synthetic(index.row()))
        return sourceModel()->data(mapToSource(index), role);
    if (role == Qt::DisplayRole) {
        switch (index.column()) {
        case ValuesModel::NameColumn:
            return default_name_;
        case ValuesModel::TypeColumn:
            return type_name(REG_SZ);
        case ValuesModel::DataColumn:
            return QVariant::fromValue(ValueNotSet{});
        default:
            return QVariant();
        }
    }
    if (role == Qt::DecorationRole && index.column() == ValuesModel::NameColumn)
        return QIcon(QStringLiteral(TALLOWFEN_SHARE_DIR "type_string.ico"));
    return QVariant();
}

Qt::ItemFlags ValuesProxyModel::flags(const QModelIndex& index) const {
    if (!index.isValid() || sourceModel() == nullptr)
        return Qt::NoItemFlags;
    if (index.row() > 0)
        return sourceModel()->flags(mapToSource(index));
    // The unnamed value, synthetic or real, can never be renamed.
    if (index.column() == ValuesModel::NameColumn)
        return Qt::ItemIsSelectable | Qt::ItemIsEnabled;
    return Qt::ItemIsEnabled;
}

bool ValuesProxyModel::setData(const QModelIndex& index, const QVariant& value, int role) {
    if (!index.isValid() || sourceModel() == nullptr)
        return false;
    if (is_synthetic(index.row()))
        return make_default(index, value);
    const bool is_rename = index.column() == ValuesModel::NameColumn;
    // As flags() says of it.
    if (is_rename && source_row(index.row()) == unnamed_)
        return false;
    const int rows = rowCount();
    const QVariant name = is_rename ? data(index, Qt::DisplayRole) : QVariant();
    const QHash<int, QString> held = is_rename ? names_of_held_rows() : QHash<int, QString>();
    if (!change_source([&] { return sourceModel()->setData(mapToSource(index), value, role); })) {
        // A rename that failed may have moved the value to the end of its list, beside the one of the new name or
        // alone.
        if (is_rename && (rowCount() != rows || data(index, Qt::DisplayRole) != name)) {
            find_default_again();
            arrange([&] { move_held_rows(held, index.row(), value.toString()); });
        }
        return false;
    }
    if (is_rename)
        note_moved_to_end(index.row());
    emit dataChanged(index, index);
    return true;
}

// The synthetic row's place is taken by the unnamed value, which the source has at its end: for this model's rows
// nothing was inserted.
bool ValuesProxyModel::make_default(const QModelIndex& index, const QVariant& value) {
    auto* values = qobject_cast<ValuesModel*>(sourceModel());
    if (index.column() != ValuesModel::DataColumn || values == nullptr)
        return false;
    const int values_before = values->rowCount();
    const bool added = change_source([&] {
        const bool made = values->add_default_value(value.toString());
        if (made || values->rowCount() > values_before)
            ask_for_default();
        return made;
    });
    if (!added)
        give_way_to_default();
    sort(ValuesModel::NameColumn, Qt::AscendingOrder);
    if (added)
        emit dataChanged(index, index);
    return added;
}

// A key that could not be read whole when it was asked for its unnamed value may have one all the same: the synthetic
// row goes then.
bool ValuesProxyModel::give_way_to_default() {
    const int position = synthetic_default_ ? key()->default_value_position() : -1;
    if (position < 0)
        return false;
    beginRemoveRows(QModelIndex(), 0, 0);
    synthetic_default_ = false;
    unnamed_ = position;
    endRemoveRows();
    return true;
}

int ValuesProxyModel::rows_now(int otherwise) const {
    try {
        return rowCount();
    } catch (const std::runtime_error&) {
        return otherwise;
    }
}

// Changes the source without passing on what it says of its rows. A change that failed may have left a row all the
// same: it is announced, in this model's own numbers.
bool ValuesProxyModel::change_source(const std::function<bool()>& change) {
    const int rows = rowCount();
    const auto announce_new_rows = [&] {
        const int now = rows_now(rows);
        if (now > rows) {
            beginInsertRows(QModelIndex(), rows, now - 1);
            // A later rename counts with them: they are not sorted, and are in their own places so far.
            for (int row = rows - offset(); !mapping_.empty() && row < now - offset(); row++)
                mapping_.push_back(row);
            endInsertRows();
        }
    };
    bool changed = false;
    try {
        const QScopedValueRollback quiet(is_source_quiet_, true);
        changed = change();
    } catch (...) {
        announce_new_rows();
        throw;
    }
    if (!changed)
        announce_new_rows();
    return changed;
}

// After a rename by half: an unnamed value is there if it was, whatever a failed read makes of the answer.
void ValuesProxyModel::find_default_again() {
    const int position = synthetic_default_ || !has_key() ? -1 : key()->default_value_position();
    unnamed_ = position >= 0 ? position : unnamed_;
}

// After a rename: the source has the value at its end now, and those behind it one row higher. The shown row stays
// where the user sees it until the next sort.
void ValuesProxyModel::note_moved_to_end(int row) {
    const int moved = source_row(row);
    unnamed_ -= unnamed_ > moved ? 1 : 0;
    const auto position = static_cast<size_t>(row - offset());
    if (position >= mapping_.size())
        return;
    int lowered = 0;
    for (int& source : mapping_) {
        if (source > moved) {
            source--;
            lowered++;
        }
    }
    mapping_[position] = moved + lowered;
}

bool ValuesProxyModel::removeRows(int row, int count, const QModelIndex& parent) {
    if (sourceModel() == nullptr || parent.isValid())
        return false;
    // Nothing to remove, however many rows are meant.
    if (is_synthetic(row))
        return true;
    if (count != 1 || row < 0 || row >= rowCount())
        return false;
    auto* values = qobject_cast<ValuesModel*>(sourceModel());
    const int source = source_row(row);
    if (values == nullptr || !values->can_remove(source))
        return false;
    const bool removed = remove_from_source(row, source);
    // One that failed may have moved the value to the end of its list.
    sort(ValuesModel::NameColumn, Qt::AscendingOrder);
    return removed;
}

bool ValuesProxyModel::remove_from_source(int row, int source) {
    const int rows = rowCount();
    // What the source says of a row that stayed after all is not passed on: this model says it itself.
    const QScopedValueRollback quiet(is_source_quiet_, true);
    beginRemoveRows(QModelIndex(), row, row);
    bool removed = false;
    try {
        removed = sourceModel()->removeRows(source, 1);
    } catch (...) {
        end_removal(row, source, rows);
        throw;
    }
    end_removal(row, source, rows);
    return removed;
}

void ValuesProxyModel::end_removal(int row, int source, int rows_before) {
    const bool is_gone = rows_now(rows_before) < rows_before;
    if (is_gone) {
        const auto position = static_cast<size_t>(row - offset());
        if (position < mapping_.size())
            mapping_.erase(mapping_.begin() + static_cast<std::ptrdiff_t>(position));
        for (int& mapped : mapping_)
            mapped -= mapped > source ? 1 : 0;
    }
    endRemoveRows();
    std::exception_ptr failure;
    try {
        ask_for_default();
    } catch (...) {
        failure = std::current_exception();
        // Where the key cannot be asked, the row that went says it, as it does in every key that is not damaged.
        if (is_gone && source <= unnamed_) {
            synthetic_default_ = source == unnamed_;
            unnamed_ = synthetic_default_ ? -1 : unnamed_ - 1;
        }
    }
    if (rows_now(rows_before) == rows_before) {
        // The row is there again: it was refused, or the synthetic row has taken the unnamed value's place.
        beginInsertRows(QModelIndex(), row, row);
        endInsertRows();
    }
    if (failure)
        std::rethrow_exception(failure);
}

// For views that asked while an addition was tried and failed: nothing moved, but all is to be asked again.
void ValuesProxyModel::announce_layout() {
    emit layoutAboutToBeChanged();
    emit layoutChanged();
}

void ValuesProxyModel::sort(int /*column*/, Qt::SortOrder /*order*/) {
    const bool has_default_twice = arrange([] {});
    if (has_default_twice && give_way_to_default())
        arrange([] {});
}

// Orders the rows, then lets move_indexes move the persistent indexes, between the signals of a new layout. Returns
// what order_rows does.
bool ValuesProxyModel::arrange(const std::function<void()>& move_indexes) {
    emit layoutAboutToBeChanged();
    bool has_default_twice = false;
    try {
        has_default_twice = order_rows();
        move_indexes();
    } catch (...) {
        emit layoutChanged();
        throw;
    }
    emit layoutChanged();
    return has_default_twice;
}

// Reads every name anew and sorts the mapping by them. True: a value reads like the synthetic row; the unnamed one may
// not have been readable when it was asked for.
bool ValuesProxyModel::order_rows() {
    if (auto* values = qobject_cast<ValuesModel*>(sourceModel()))
        values->forget_rows();
    const int rows = sourceModel() != nullptr ? sourceModel()->rowCount() : 0;
    const auto name_of = [this](int row) {
        return sourceModel()->data(sourceModel()->index(row, 0), Qt::DisplayRole).toString();
    };
    std::vector<QString> names;
    try {
        names = names_of_rows(rows, name_of).value();
    } catch (...) {
        mapping_.clear();
        throw;
    }
    mapping_ = rows_by_name(names, default_name_, unnamed_);
    return synthetic_default_ && !names.empty() && names[static_cast<size_t>(mapping_.front())] == default_name_;
}

// What the rows are called that somebody has an index of.
QHash<int, QString> ValuesProxyModel::names_of_held_rows() const {
    QHash<int, QString> names;
    const QModelIndexList persistent = persistentIndexList();
    for (const QModelIndex& held : persistent)
        names.insert(held.row(), spoken_data(index(held.row(), ValuesModel::NameColumn)).toString());
    return names;
}

// A sort that nobody asked for: an index is about the same value after it. One that a rename has got halfway with may
// be there under its new name alone. The first row is the default value's before and after.
void ValuesProxyModel::move_held_rows(const QHash<int, QString>& names_before, int renamed, const QString& new_name) {
    QStringList names;
    for (int row = 0; row < rowCount(); row++)
        names.append(spoken_data(index(row, ValuesModel::NameColumn)).toString());
    const QModelIndexList persistent = persistentIndexList();
    for (const QModelIndex& held : persistent) {
        const QString name = names_before.value(held.row());
        if (held.row() == 0 || names.value(held.row()) == name)
            continue;
        qsizetype row = names.indexOf(name, 1);
        if (row < 0 && held.row() == renamed)
            row = names.indexOf(new_name, 1);
        if (row > 0)
            changePersistentIndex(held, index(static_cast<int>(row), held.column()));
    }
}

bool ValuesProxyModel::add_value(int type) {
    auto* values = qobject_cast<ValuesModel*>(sourceModel());
    if (values == nullptr)
        return false;
    // Announced only once it is there: a view cannot be told that a row did not come, and would have moved its current
    // row past the end for it.
    const int row = values->rowCount();
    const bool added = change_source([&] { return values->add_value(type); });
    if (added) {
        mapping_.push_back(static_cast<int>(mapping_.size()));
        on_rows_inserted(QModelIndex(), row, row);
    } else {
        announce_layout();
    }
    return added;
}

// With the source's row numbers as they are, without the offset: a view asks how many rows there are now, and for all
// of them again; where they were announced does not matter to it.
void ValuesProxyModel::on_rows_inserted(const QModelIndex& /*parent*/, int first, int last) {
    if (is_source_quiet_)
        return;
    beginInsertRows(QModelIndex(), first, last);
    endInsertRows();
}

// Of the row that a change was made to this model says itself what is to be said. Types and data together are what the
// source found changed beside it.
void ValuesProxyModel::on_data_changed(const QModelIndex& first, const QModelIndex& last) {
    if (first.column() == ValuesModel::TypeColumn)
        emit dataChanged(mapFromSource(first), mapFromSource(last));
}
