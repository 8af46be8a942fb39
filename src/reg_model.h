// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// The key tree as an item model, and the search over it. Owns the hives and the groups above them.
#pragma once

#include <QAbstractItemModel>
#include <QMutex>

#include <map>
#include <memory>
#include <set>
#include <vector>

class AbstractRegKey;
class RegHive;
class RegKey;

// Every index carries its key object as internal pointer, in column 0. Levels are fixed: groups, hive roots below them,
// keys below those. Keys directly below a root get new subkeys and show their values; all below them can be renamed and
// deleted as well. data(), the changes and the search throw std::runtime_error where a key cannot be opened. Who meets
// that: docs/architecture.md.
class RegModel : public QAbstractItemModel {
    Q_OBJECT

public:
    enum FindModeFlag {
        FindKeys = 1,    // compare key names
        FindValues = 2,  // compare value names
    };
    Q_DECLARE_FLAGS(FindMode, FindModeFlag)

    struct FindResult {
        QModelIndex key;     // invalid: the walk ended or was stopped without a hit
        int value_row = -1;  // row in the sorted table of the key's values; -1 for a hit on the key itself
    };

    explicit RegModel(QObject* parent = nullptr);
    ~RegModel() override;

    // Mounts a hive under the group and name that "TOP/HIVE" gives. Before any view is attached: no signals.
    // std::out_of_range for a name without two parts; the hive's own exceptions.
    void add_hive(const QString& name, const QString& file);
    // Whether add_hive can split the name.
    static bool is_mount_name(const QString& name);

    QModelIndex index(int row, int column, const QModelIndex& parent = QModelIndex()) const override;
    QModelIndex parent(const QModelIndex& index) const override;
    int rowCount(const QModelIndex& parent = QModelIndex()) const override;
    int columnCount(const QModelIndex& parent = QModelIndex()) const override;
    QVariant data(const QModelIndex& index, int role) const override;
    // Renames a key. The role is not looked at. An index whose row is another key's by now changes nothing.
    bool setData(const QModelIndex& index, const QVariant& value, int role) override;
    Qt::ItemFlags flags(const QModelIndex& index) const override;
    // Deletes one key with all below it, leaves first. A parent whose row is another key's by now loses nothing.
    bool removeRows(int row, int count, const QModelIndex& parent = QModelIndex()) override;
    // Makes a subkey; returns its row. -1: no parent; -2: not under this one; -3: refused.
    int new_key(const QModelIndex& parent);

    // The key behind an index below a hive's root, else null. flags() does not let those directly below it be renamed.
    static RegKey* editable_key(const QModelIndex& index);

    // How many keys the hives have room for. More are met only where a damaged hive lists some again and again.
    qint64 most_keys() const;

    // Begins a search at a key: its subtree and its later siblings with theirs.
    void begin_find(const QModelIndex& start);
    // Makes a running find return early. From any thread.
    void stop_find();
    // Walks on to the next hit. From a worker thread, while nothing changes the tree.
    FindResult find(const QVariant& term, RegModel::FindMode mode, Qt::MatchFlags flags);
    // The key that the search looked at last: where it threw, the one that it threw for. While no find runs.
    QModelIndex searched_key();

private:
    // A place of the search still to be visited: a key, or one row of a key's shown values.
    struct Frame {
        QModelIndex key;
        int value;  // the row, or one of the two below
    };
    static constexpr int with_siblings = -1;  // the key, and its later siblings after it
    static constexpr int alone = -2;          // the key without its siblings: a rename took it away from them

    static AbstractRegKey* key_of(const QModelIndex& index);
    QModelIndex index_of(AbstractRegKey* key) const;
    int row_of(const AbstractRegKey* key) const;
    bool is_current(const QModelIndex& index) const;
    QVariant spoken_name(const QModelIndex& index) const;
    int key_depth(const QModelIndex& index) const;
    bool remove_key(int row, const QModelIndex& parent);
    bool remove_leaf(int row, const QModelIndex& parent);
    void move_persistent_indexes(const QModelIndex& renamed, const QModelIndex& moved);

    void push_next_sibling(const QModelIndex& key);
    bool push_key_frames(const Frame& frame, FindMode mode);
    void push_value_frames(const QModelIndex& key, const std::vector<int>& rows);
    bool renew_value_frames();
    std::vector<int> followed_rows(const std::vector<int>& awaited_rows, const std::vector<QString>& now) const;
    bool is_stopped();
    std::vector<Frame>::iterator sibling_frame(const AbstractRegKey* parent);
    void forget_frames_below(const AbstractRegKey* key);
    void let_frames_follow_rename(const QModelIndex& moved, int old_row);
    void let_frames_follow_new_key(const QModelIndex& made);
    void renumber_frames();

    // Destroyed from the last one on: the hives, then the groups that their root keys hang below.
    std::vector<std::unique_ptr<AbstractRegKey>> top_level_;
    std::vector<std::unique_ptr<RegHive>> hives_;
    std::vector<Frame> search_;  // the last one is visited next
    // Keys that a rename has put among those that a frame stands for, though they were visited or have frames alone.
    std::set<const AbstractRegKey*> passed_over_;
    // The shown value names that the rows of the value frames count in; those frames are one key's, always.
    std::vector<QString> value_names_;
    QModelIndex searched_;  // set by find; the tree may have changed since
    QMutex mutex_;          // guards stop_; held too where the search's stack goes to its thread and back
    bool stop_ = false;
    // How far the search may still go in a hive. A damaged one can list keys and values more often than the file has
    // room for them; what its size allows bounds the walk.
    struct Budget {
        qint64 keys;     // to visit
        qint64 subkeys;  // of the keys that are gone down into
        qint64 values;   // of the keys whose values are visited
    };
    std::map<const RegHive*, Budget> budgets_;
};

Q_DECLARE_OPERATORS_FOR_FLAGS(RegModel::FindMode)
Q_DECLARE_METATYPE(RegModel::FindResult)
