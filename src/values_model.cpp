// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "values_model.h"

#include "reg_key.h"

#include <QIcon>

#include <algorithm>
#include <stdexcept>

namespace {

// A hundred rows, and fewer where they are large: a damaged hive can have many values share the data of one.
constexpr qsizetype most_cached_rows = 100;
constexpr qsizetype most_cached_bytes = 64000 << 10;
constexpr qsizetype least_cost = most_cached_bytes / most_cached_rows;

// About the memory that a datum takes, which for a list of short strings is many times what is stored.
qsizetype memory_of(const QVariant& data) {
    constexpr qsizetype character = sizeof(QChar);
    if (data.typeId() == QMetaType::QByteArray)
        return data.toByteArray().capacity();
    if (data.typeId() == QMetaType::QString)
        return data.toString().capacity() * character;
    qsizetype bytes = 0;
    if (data.typeId() == QMetaType::QStringList) {
        const QStringList list = data.toStringList();
        bytes = list.capacity() * static_cast<qsizetype>(sizeof(QString));
        for (const QString& text : list)
            bytes += text.capacity() * character;
    }
    return bytes;
}

// Whether an editor hands back what it was given. A list without strings comes back as empty ones, which would be
// stored as none.
bool is_same_data(const QVariant& old, const QVariant& given) {
    if (old.typeId() == QMetaType::QStringList && old.toStringList().isEmpty())
        return given.toStringList().join(QString()).isEmpty();
    return old == given;
}

}  // namespace

ValuesModel::ValuesModel(RegKey* key, QObject* parent)
    : QAbstractTableModel(parent), key_(key), cache_(most_cached_bytes) {}

QString ValuesModel::default_name() { return tr("(Default)"); }

int ValuesModel::rowCount(const QModelIndex& parent) const {
    return key_ == nullptr || parent.isValid() ? 0 : key_->value_count();
}

int ValuesModel::columnCount(const QModelIndex& /*parent*/) const { return ColumnCount; }

QVariant ValuesModel::headerData(int section, Qt::Orientation /*orientation*/, int role) const {
    if (role != Qt::DisplayRole)
        return QVariant();
    switch (section) {
    case NameColumn:
        return tr("Name", "column title");
    case TypeColumn:
        return tr("Type", "column title");
    case DataColumn:
        return tr("Data", "column title");
    default:
        return QVariant();
    }
}

Qt::ItemFlags ValuesModel::flags(const QModelIndex& index) const {
    if (!index.isValid())
        return Qt::NoItemFlags;
    // Data is edited through dialogs, so only names can be selected and edited in place.
    if (index.column() == NameColumn)
        return Qt::ItemIsSelectable | Qt::ItemIsEditable | Qt::ItemIsEnabled;
    return Qt::ItemIsEnabled;
}

RegValue ValuesModel::lookup(int row) const {
    if (const RegValue* cached = cache_.object(row))
        return *cached;
    std::unique_ptr<RegValue> value = key_->read_value(row);
    if (value == nullptr)
        value = std::make_unique<RegValue>(key_->read_value_without_data(row));
    RegValue found = *value;
    // The row asked for last is kept, however large it is.
    cache_.insert(row, value.release(), std::clamp(memory_of(found.data), least_cost, most_cached_bytes));
    return found;
}

QVariant ValuesModel::data(const QModelIndex& index, int role) const {
    if (!index.isValid() || key_ == nullptr)
        return QVariant();
    if (role == Qt::DisplayRole || role == Qt::EditRole) {
        // A name needs no data read: a sort asks for every one.
        if (index.column() == NameColumn) {
            const RegValue* cached = cache_.object(index.row());
            const std::optional<QString> name = cached != nullptr ? cached->name : key_->value_name(index.row());
            if (!name.has_value())
                return QVariant();
            return name->isEmpty() ? default_name() : *name;
        }
        const RegValue value = lookup(index.row());
        if (index.column() == DataColumn)
            return value.data;
        const QString type = type_name(value.type);
        return type.isNull() ? QVariant() : QVariant(type);
    }
    if (role == Qt::DecorationRole && index.column() == NameColumn) {
        const quint32 type = lookup(index.row()).type;
        const bool is_text = type == REG_SZ || type == REG_EXPAND_SZ || type == REG_MULTI_SZ;
        return QIcon(is_text ? QStringLiteral(TALLOWFEN_SHARE_DIR "type_string.ico")
                             : QStringLiteral(TALLOWFEN_SHARE_DIR "type_binary.ico"));
    }
    return QVariant();
}

bool ValuesModel::setData(const QModelIndex& index, const QVariant& value, int /*role*/) {
    if (!index.isValid() || key_ == nullptr || index.row() >= rowCount())
        return false;
    if (index.column() == NameColumn) {
        if (!value.canConvert<QString>() || !rename(index.row(), value.toString()))
            return false;
        emit dataChanged(index, this->index(rowCount() - 1, NameColumn));
        return true;
    }
    if (index.column() != DataColumn)
        return false;
    // What is compared and stored is what the file has now; and an attempt that failed may have changed something too.
    const auto shown = take_shown();
    bool stored = false;
    try {
        stored = store(index.row(), value);
    } catch (...) {
        cache_.clear();
        announce_others(shown, -1);
        throw;
    }
    cache_.clear();
    if (stored)
        emit dataChanged(index, index);
    announce_others(shown, stored ? index.row() : -1);
    return stored;
}

// The cached rows, as they are shown; empties the cache.
std::vector<std::pair<int, RegValue>> ValuesModel::take_shown() {
    std::vector<std::pair<int, RegValue>> shown;
    const QList<int> rows = cache_.keys();
    for (const int row : rows)
        shown.emplace_back(row, *cache_.object(row));
    cache_.clear();
    return shown;
}

// Tells of rows that do not read any more as they were shown: those of a value that was stored by half, and in a
// damaged hive those of values that share their data with the one that was stored. `told` is the row that has been told
// of already, -1 for none.
void ValuesModel::announce_others(const std::vector<std::pair<int, RegValue>>& shown, int told) {
    for (const auto& [row, before] : shown) {
        if (row == told)
            continue;
        bool same = false;
        try {
            const RegValue now = lookup(row);
            same = now.type == before.type && now.data == before.data;
        } catch (const std::exception&) {
            // Whoever shows the row will meet the failure.
        }
        if (!same)
            emit dataChanged(createIndex(row, TypeColumn), createIndex(row, DataColumn));
    }
}

// A renamed value moves to the end of the list, and every row behind it moves up. One that could only be stored under
// its new name, and not be taken away under the old one, is there twice.
bool ValuesModel::rename(int row, const QString& name) {
    const int rows = rowCount();
    bool renamed = false;
    try {
        renamed = key_->rename_value(row, name);
    } catch (...) {
        forget_rows();
        announce_new_rows(rows);
        throw;
    }
    forget_rows();
    announce_new_rows(rows);
    return renamed;
}

int ValuesModel::rows_now(int otherwise) const {
    try {
        return rowCount();
    } catch (const std::runtime_error&) {
        return otherwise;
    }
}

void ValuesModel::announce_new_rows(int before) {
    const int rows = rows_now(before);
    if (rows <= before)
        return;
    beginInsertRows(QModelIndex(), before, rows - 1);
    endInsertRows();
}

bool ValuesModel::store(int row, const QVariant& value) {
    const RegValue old = lookup(row);
    if (!old.data.isValid())
        return false;
    // The bytes may say more than the data that is made of them: text behind a zero, an odd byte, a number too short.
    // They go only when the user puts other data in their place.
    if (is_same_data(old.data, value))
        return true;
    switch (old.type) {
    case REG_SZ:
    case REG_EXPAND_SZ:
    case REG_LINK:
        return key_->set_string_value(old.name, value.toString(), old.type, row);
    case REG_DWORD:
        return key_->set_dword_value(old.name, value.toUInt(), little_endian_order, row);
    case REG_DWORD_BIG_ENDIAN:
        return key_->set_dword_value(old.name, value.toUInt(), big_endian_order, row);
    case REG_MULTI_SZ:
        return key_->set_multi_string_value(old.name, value.toStringList(), row);
    case REG_QWORD:
        return key_->set_qword_value(old.name, value.toULongLong(), row);
    case REG_NONE:
    case REG_BINARY:
    case REG_RESOURCE_LIST:
    case REG_FULL_RESOURCE_DESCRIPTOR:
    case REG_RESOURCE_REQUIREMENTS_LIST:
        return key_->set_binary_value(old.name, value.toByteArray(), old.type, row);
    default:
        return false;
    }
}

bool ValuesModel::can_remove(int row) const {
    return key_ != nullptr && row >= 0 && row < rowCount() && key_->can_delete_value(row);
}

bool ValuesModel::removeRows(int row, int count, const QModelIndex& parent) {
    if (count != 1 || parent.isValid() || !can_remove(row))
        return false;
    const int rows = rowCount();
    const auto end = [&] {
        endRemoveRows();
        if (rows_now(rows) == rows) {
            // The row is still there: whoever heard that it went hears that it came back.
            beginInsertRows(parent, row, row);
            endInsertRows();
        }
    };
    beginRemoveRows(parent, row, row);
    forget_rows();
    bool removed = false;
    try {
        removed = key_->delete_value(row);
    } catch (...) {
        end();
        throw;
    }
    end();
    return removed;
}

bool ValuesModel::insert_at_end(const std::function<bool()>& make) {
    if (key_ == nullptr)
        return false;
    const int row = rowCount();
    beginInsertRows(QModelIndex(), row, row);
    forget_rows();
    bool made = false;
    try {
        made = make();
    } catch (...) {
        endInsertRows();
        throw;
    }
    endInsertRows();
    return made;
}

bool ValuesModel::add_value(int type) {
    return insert_at_end([&] {
        const QString name = key_->new_value_name();
        return !name.isNull() && make_empty(name, type);
    });
}

bool ValuesModel::make_empty(const QString& name, int type) {
    switch (type) {
    case REG_SZ:
    case REG_EXPAND_SZ:
    case REG_LINK:
        return key_->set_string_value(name, QString(), static_cast<uint>(type), RegKey::new_value);
    case REG_BINARY:
        return key_->set_binary_value(name, QByteArray(), REG_BINARY, RegKey::new_value);
    case REG_DWORD:
        return key_->set_dword_value(name, 0, little_endian_order, RegKey::new_value);
    case REG_MULTI_SZ:
        return key_->set_multi_string_value(name, QStringList(), RegKey::new_value);
    case REG_QWORD:
        return key_->set_qword_value(name, 0, RegKey::new_value);
    default:
        return false;
    }
}

bool ValuesModel::add_default_value(const QString& data) {
    return insert_at_end([&] { return key_->set_string_value(QString(), data, REG_SZ, RegKey::new_value); });
}
