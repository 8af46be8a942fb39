// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "tree_check.h"

#include "handle.h"
#include "kinship.h"

#include <cstdlib>
#include <cstring>

namespace engine {

namespace {

// One level of the walk.
struct Level {
    KeyView key;
    SubkeyIndex children;
    uint32_t next;  // the child to look at
};

// The cells that the keys of a tree own. One that two of them lead to would be freed with the first of them.
class OwnedCells {
public:
    OwnedCells() = default;
    OwnedCells(const OwnedCells&) = delete;
    OwnedCells& operator=(const OwnedCells&) = delete;
    ~OwnedCells() { free(offsets_); }

    // Adds the cells of a key that has passed its own checks. false when memory ran out.
    bool add(const KeyView& key) {
        const bool lists_keys = key.record.subkey_count != 0;
        const bool lists_values = key.record.value_count != 0;
        return add(key.offset()) && (!lists_keys || add(cell_offset(key.record.subkey_index))) &&
               (!lists_values || add(cell_offset(key.record.value_list)));
    }
    bool has_one_twice() {
        if (count_ == 0)
            return false;
        qsort(offsets_, count_, sizeof *offsets_, [](const void* a, const void* b) {
            const CellOffset first = *static_cast<const CellOffset*>(a);
            const CellOffset second = *static_cast<const CellOffset*>(b);
            return first < second ? -1 : int{second < first};
        });
        for (uint32_t i = 1; i < count_; i++) {
            if (offsets_[i] == offsets_[i - 1])
                return true;
        }
        return false;
    }

private:
    bool add(CellOffset offset) {
        if (count_ == room_) {
            const uint32_t room = room_ == 0 ? 64 : 2 * room_;
            auto* grown = static_cast<CellOffset*>(realloc(offsets_, room * sizeof *offsets_));
            if (grown == nullptr)
                return false;
            offsets_ = grown;
            room_ = room;
        }
        offsets_[count_++] = offset;
        return true;
    }

    CellOffset* offsets_ = nullptr;
    uint32_t count_ = 0;
    uint32_t room_ = 0;
};

// Whether a path can lead to a key of this name.
bool is_component(const Name& name) {
    return name.length > 0 && name.length <= longest_key_name && memchr(name.bytes, '\\', name.length) == nullptr &&
           memchr(name.bytes, '\0', name.length) == nullptr;
}

// Whether the entry at a position can be deleted by its name: stored in 8 bits, fit for a path, and met first by it.
int32_t check_entry(Store& store, const Level& parent, uint32_t position, StrayParents& strays, KeyView& key) {
    if (parent.children.is_root)
        return R_PATH_NOT_FOUND;
    if (!read_key(store, subkey_at(store, parent.children, position), key))
        return R_FAILED;
    if (key.wide())
        return R_INVALID_NAME;
    const Name name = key.searchable();
    KeyView met;
    uint32_t where;
    if (!is_component(name) ||
        find_subkey(store, parent.children, parent.key.offset(), name, compare_signed, where, met) != Lookup::found ||
        where != position || has_other_parent(store, parent.key.offset(), key, strays))
        return R_PATH_NOT_FOUND;
    return check_own_lists(store, key);
}

int32_t enter(Store& store, Level& level, OwnedCells& cells) {
    level.next = 0;
    return cells.add(level.key) && load_key_index(store, level.key.record, level.children) ? R_SUCCESS
                                                                                           : R_NOT_ENOUGH_MEMORY;
}

// What stands against the deletion of what is below a level, as far as the level itself tells.
int32_t check_level(const Level& level) {
    if (!level.children.whole || level.children.total != level.key.record.subkey_count)
        return R_FAILED;
    // Nothing is deleted below such a key.
    const bool has_plain_handle = (level.key.record.flags & (key_is_link | key_is_root)) == 0;
    return level.children.total == 0 || has_plain_handle ? R_SUCCESS : R_INVALID_HANDLE;
}

// The walk, with a stack of its own; the hive's size bounds the steps, the depth limit the stack.
int32_t walk(Store& store, Level* levels, uint32_t room, const Level& parent, uint32_t position) {
    auto steps = static_cast<uint32_t>(static_cast<uint32_t>(store.bins_size) / sizeof(KeyRecord));
    OwnedCells cells;
    StrayParents strays;
    int32_t status = check_entry(store, parent, position, strays, levels[0].key);
    if (status == R_SUCCESS)
        status = enter(store, levels[0], cells);
    if (status != R_SUCCESS)
        return status;
    uint32_t depth = 1;
    while (depth > 0 && status == R_SUCCESS) {
        Level& level = levels[depth - 1];
        status = check_level(level);
        if (status == R_SUCCESS && level.next == level.children.total) {
            free_index(level.children);
            depth--;
        } else if (status == R_SUCCESS && (depth == room || steps-- == 0)) {
            status = R_FAILED;
        } else if (status == R_SUCCESS) {
            status = check_entry(store, level, level.next++, strays, levels[depth].key);
            if (status == R_SUCCESS)
                status = enter(store, levels[depth], cells);
            if (status == R_SUCCESS)
                depth++;
        }
    }
    while (depth > 0)
        free_index(levels[--depth].children);
    return status == R_SUCCESS && cells.has_one_twice() ? int32_t{R_PATH_NOT_FOUND} : status;
}

}  // namespace

int32_t check_own_lists(Store& store, const KeyView& key) {
    return find_value_list(store, key.record).whole ? R_SUCCESS : R_FAILED;
}

int32_t check_tree(Store& store, CellOffset parent_offset, uint32_t depth, uint32_t position) {
    const uint32_t room = depth_limit - depth;
    const Block memory(static_cast<uint32_t>((room + 1) * sizeof(Level)));
    if (memory.bytes == nullptr)
        return R_NOT_ENOUGH_MEMORY;
    auto* levels = reinterpret_cast<Level*>(memory.bytes);
    Level& parent = levels[room];  // one more than the walk goes down to
    if (!read_key(store, parent_offset, parent.key))
        return R_FAILED;
    if (!load_key_index(store, parent.key.record, parent.children))
        return R_NOT_ENOUGH_MEMORY;
    int32_t status = room > 0 ? check_level(parent) : int32_t{R_FAILED};
    KeyView key;
    if (status == R_SUCCESS && !read_key(store, subkey_at(store, parent.children, position), key))
        status = R_FAILED;
    if (status == R_SUCCESS && belongs_elsewhere(store, parent_offset, parent.children, key))
        status = R_PATH_NOT_FOUND;
    if (status == R_SUCCESS)
        status = walk(store, levels, room, parent, position);
    free_index(parent.children);
    return status;
}

}  // namespace engine
