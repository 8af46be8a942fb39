// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "reg_model.h"

#include "reg_hive.h"
#include "reg_key.h"
#include "value_text.h"

#include <QIcon>
#include <QScopeGuard>
#include <QStringList>

#include <algorithm>
#include <stdexcept>

namespace {

constexpr int editable_ancestors = 3;  // above a key that can be renamed and deleted: group, root, key

QStringList split_mount_name(const QString& name) { return name.split(QLatin1Char('/'), Qt::SkipEmptyParts); }

}  // namespace

RegModel::RegModel(QObject* parent) : QAbstractItemModel(parent) {}

RegModel::~RegModel() = default;

bool RegModel::is_mount_name(const QString& name) { return split_mount_name(name).size() >= 2; }

void RegModel::add_hive(const QString& name, const QString& file) {
    const QStringList parts = split_mount_name(name);
    if (parts.size() < 2)
        throw std::out_of_range("a mount name has the form TOP/HIVE");
    const auto found =
        std::find_if(top_level_.begin(), top_level_.end(), [&](const auto& key) { return key->name() == parts[0]; });
    AbstractRegKey* top = found != top_level_.end() ? found->get() : nullptr;
    if (top == nullptr) {
        top_level_.push_back(std::make_unique<DummyRegKey>(parts[0]));
        top = top_level_.back().get();
    }
    hives_.push_back(std::make_unique<RegHive>(parts[1], file, top));
    top->add_child(hives_.back()->root_key());
}

AbstractRegKey* RegModel::key_of(const QModelIndex& index) {
    return static_cast<AbstractRegKey*>(index.internalPointer());
}

int RegModel::row_of(const AbstractRegKey* key) const {
    if (key->parent() != nullptr)
        return key->child_number();
    const auto found =
        std::find_if(top_level_.begin(), top_level_.end(), [&](const auto& top) { return top.get() == key; });
    return static_cast<int>(found - top_level_.begin());
}

QModelIndex RegModel::index_of(AbstractRegKey* key) const { return createIndex(row_of(key), 0, key); }

QModelIndex RegModel::index(int row, int column, const QModelIndex& parent) const {
    if (!hasIndex(row, column, parent))
        return QModelIndex();
    AbstractRegKey* const key =
        parent.isValid() ? key_of(parent)->shown_child(row) : top_level_[static_cast<size_t>(row)].get();
    return key != nullptr ? createIndex(row, column, key) : QModelIndex();
}

QModelIndex RegModel::parent(const QModelIndex& index) const {
    AbstractRegKey* const up = index.isValid() ? key_of(index)->parent() : nullptr;
    return up != nullptr ? index_of(up) : QModelIndex();
}

int RegModel::rowCount(const QModelIndex& parent) const {
    if (parent.column() > 0)
        return 0;
    return parent.isValid() ? key_of(parent)->child_count() : static_cast<int>(top_level_.size());
}

int RegModel::columnCount(const QModelIndex& /*parent*/) const { return 1; }

// What a screen reader says, which is what is shown. It asks through parts of the toolkit that lose memory when an
// exception passes them.
QVariant RegModel::spoken_name(const QModelIndex& index) const {
    try {
        return data(index, Qt::DisplayRole);
    } catch (const std::runtime_error&) {
        return unreadable_text();
    }
}

QVariant RegModel::data(const QModelIndex& index, int role) const {
    if (!index.isValid())
        return QVariant();
    if (role == Qt::AccessibleTextRole)
        return spoken_name(index);
    if (role == Qt::DecorationRole)
        return QIcon::fromTheme(QStringLiteral("folder"), QIcon());
    if (role != Qt::DisplayRole && role != Qt::EditRole)
        return QVariant();
    AbstractRegKey* const key = key_of(index);
    const bool is_hive_root = key->parent() != nullptr && key->parent()->parent() == nullptr;
    if (is_hive_root) {
        for (const auto& hive : hives_) {
            if (hive->root_key() == key)
                return hive->name();
        }
    }
    return key->name();
}

int RegModel::key_depth(const QModelIndex& index) const {
    int depth = 0;
    for (QModelIndex up = index.parent(); up.isValid() && depth < editable_ancestors; up = up.parent())
        depth++;
    return depth;
}

Qt::ItemFlags RegModel::flags(const QModelIndex& index) const {
    if (!index.isValid())
        return Qt::NoItemFlags;
    const Qt::ItemFlags flags = Qt::ItemIsSelectable | Qt::ItemIsEnabled;
    return key_depth(index) >= editable_ancestors ? flags | Qt::ItemIsEditable : flags;
}

RegKey* RegModel::editable_key(const QModelIndex& index) {
    // Everything below a group is a hive's key.
    return index.parent().parent().isValid() ? static_cast<RegKey*>(key_of(index)) : nullptr;
}

// Whether an index still says where its key is. What acts on a row must not act on another key that has come to it.
bool RegModel::is_current(const QModelIndex& index) const { return row_of(key_of(index)) == index.row(); }

bool RegModel::setData(const QModelIndex& index, const QVariant& value, int /*role*/) {
    const QModelIndex parent = index.parent();
    RegKey* const key = editable_key(parent);
    if (key == nullptr || !is_current(index))
        return false;
    const int old_row = index.row();
    const int row = key->rename_key(old_row, value.toString());
    if (row < 0)
        return false;
    if (row == old_row) {
        emit dataChanged(index, index);
        return true;
    }
    // Announced without layoutAboutToBeChanged and ahead of the index's move, an order that is part of this model's
    // contract: the tree sits directly on it. The persistent indexes are moved by hand for that.
    emit layoutChanged();
    const QModelIndex moved = this->index(row, 0, parent);
    move_persistent_indexes(index, moved);
    let_frames_follow_rename(moved, old_row);
    return true;
}

// The renamed key's index first, then those of the siblings that it passed: a view would follow them to other keys.
void RegModel::move_persistent_indexes(const QModelIndex& renamed, const QModelIndex& moved) {
    const QModelIndexList persistent = persistentIndexList();
    changePersistentIndex(renamed, moved);
    for (const QModelIndex& old : persistent) {
        AbstractRegKey* const key = key_of(old);
        if (key == key_of(moved) || key->parent() != key_of(moved)->parent())
            continue;
        const QModelIndex now = index_of(key);
        if (now.row() != old.row())
            changePersistentIndex(old, now);
    }
}

int RegModel::new_key(const QModelIndex& parent) {
    if (!parent.isValid())
        return -1;
    RegKey* const key = editable_key(parent);
    if (key == nullptr)
        return -2;
    const int row = key->new_key();
    if (row < 0)
        return -3;
    // The key is the one that was meant, also where its index has an old row; views know it by the row of now.
    const QModelIndex current = index_of(key);
    beginInsertRows(current, row, row);
    endInsertRows();
    let_frames_follow_new_key(index(row, 0, current));
    return row;
}

bool RegModel::removeRows(int row, int count, const QModelIndex& parent) {
    RegKey* const key = parent.isValid() ? editable_key(parent) : nullptr;
    if (key == nullptr || !is_current(parent) || count != 1 || row < 0 || row >= key->child_count())
        return false;
    // A refusal half-way would leave a branch without its leaves, so the engine is asked about all of it first.
    if (!key->can_delete_tree(row))
        return false;
    return remove_key(row, parent);
}

// Deletes a key that has no subkeys any more. Where that fails, a search goes on with it as before.
bool RegModel::remove_leaf(int row, const QModelIndex& parent) {
    std::vector<Frame> frames = search_;
    std::set<const AbstractRegKey*> passed_over = passed_over_;
    auto put_back = qScopeGuard([&] {
        search_.swap(frames);
        passed_over_.swap(passed_over);
    });
    forget_frames_below(key_of(index(row, 0, parent)));
    if (!editable_key(parent)->delete_key(row))
        return false;
    put_back.dismiss();
    return true;
}

bool RegModel::remove_key(int row, const QModelIndex& parent) {
    // Found before the signals, since what cannot be opened throws.
    const QModelIndex child = index(row, 0, parent);
    beginRemoveRows(parent, row, row);
    bool removed = true;
    try {
        for (int i = rowCount(child) - 1; i >= 0 && removed; i--)
            removed = remove_key(i, child);
        removed = removed && remove_leaf(row, parent);
    } catch (...) {
        endRemoveRows();
        beginInsertRows(parent, row, row);
        endInsertRows();
        throw;
    }
    endRemoveRows();
    if (!removed) {
        // Still there, so whoever heard that it went hears that it came back.
        beginInsertRows(parent, row, row);
        endInsertRows();
    }
    renumber_frames();
    return removed;
}
