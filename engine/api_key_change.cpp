// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "allocator.h"
#include "handle.h"
#include "kinship.h"
#include "leaf_edit.h"
#include "security.h"
#include "stored_name.h"
#include "subkey_change.h"

#include <cstdlib>
#include <cstring>

using namespace engine;

namespace {

// Makes every missing component of a path. offset and depth are those of the last one.
bool create_path(RegistryKey& key, const char* path, CellOffset& offset, uint32_t& depth) {
    offset = key.info->own;
    depth = key.depth;
    for (path = skip_separators(path); *path != '\0'; path = skip_separators(path)) {
        const uint32_t length = component_length(path);
        const Name name = {reinterpret_cast<const uint8_t*>(path), length, false};
        if (depth == depth_limit)
            return false;
        CellOffset next = CellOffset::none;
        if (insert_subkey(*key.store, offset, name, true, next) == Inserted::failed)
            return false;
        offset = next;
        depth++;
        path += length;
    }
    return true;
}

// Frees a list's cell that only the key referred to. One that a key without entries still names is freed when it is
// an emptied leaf; anything else there may be another's.
void free_index_cell(Store& store, const KeyRecord& key) {
    const CellOffset offset = cell_offset(key.subkey_index);
    SubkeyIndex index = {};
    if (static_cast<int32_t>(offset) > 0 && load_index(store, offset, index) && index.whole && index.total == 0 &&
        !index.is_root)
        free_leaf(store, offset);
    free_index(index);
}

// Frees what a key owned that nothing leads to any more. Of its values' records every other one goes, beginning with
// the first, as when each was removed by its place in a list that closes up; the rest, and all data cells, stay
// allocated.
void free_key(Store& store, const KeyView& key, CellOffset parent) {
    const ValueList values = find_value_list(store, key.record);
    for (uint32_t i = 0; i < values.count; i += 2) {
        ValueView value;
        const CellOffset offset = value_at(store, values, i);
        if (read_value(store, offset, value))
            free_cell(store, offset);
    }
    free_index_cell(store, key.record);
    if (values.count > 0 && !is_record(store, values.cell))
        free_cell(store, values.cell.offset);
    drop_security_reference(store, cell_offset(key.record.security));
    // Another list may have led to this key as well: what takes its cell need not stand in order there.
    if (store.sorted_key != parent)
        store.sorted_key = CellOffset::none;
    free_cell(store, key.offset());
}

// Whether the key's own lists are such that it can be deleted once it has no subkeys.
int32_t check_lists(Store& store, const KeyView& key) {
    return find_value_list(store, key.record).whole && is_own_cell(store, key.offset()) ? R_SUCCESS : R_FAILED;
}

// In turn, and what a stop after each leaves:
//   the entry taken out of the list, the parent's count: the key is gone, with all that it held;
//   its cells freed, the security record's count lowered: fewer cells out of reach.
int32_t delete_at(RegistryKey& handle, const PathEnd& end) {
    Store& store = *handle.store;
    KeyView key;
    KeyView parent;
    SubkeyIndex index;
    if (!read_key(store, end.key, key) || !read_key(store, end.parent, parent))
        return R_FAILED;
    if (key.record.subkey_count != 0)
        return R_KEY_HAS_CHILDREN;
    if (!load_key_index(store, parent.record, index))
        return R_NOT_ENOUGH_MEMORY;
    int32_t status = R_FAILED;
    if (index.is_root || end.position >= index.total || belongs_elsewhere(store, end.parent, index, key))
        status = R_PATH_NOT_FOUND;
    else if (index.whole && index.total == parent.record.subkey_count &&
             subkey_at(store, index, end.position) == end.key)
        status = check_lists(store, key);
    if (status == R_SUCCESS && !remove_subkey(store, end.parent, parent.record, index, end.position))
        status = R_FAILED;
    free_index(index);
    if (status == R_SUCCESS)
        free_key(store, key, end.parent);
    if (end.parent == handle.info->own)
        reread_counts(handle);
    return status;
}

// One level of the walk that RCheckDeleteTree makes.
struct Level {
    KeyView key;
    SubkeyIndex children;
    uint32_t next;  // the child to look at
};

// Whether a path can lead to a key of this name.
bool is_component(const Name& name) {
    return name.length > 0 && name.length <= longest_key_name && memchr(name.bytes, '\\', name.length) == nullptr &&
           memchr(name.bytes, '\0', name.length) == nullptr;
}

// Whether the entry at a position can be deleted by its name: stored in 8 bits, fit for a path, and met first by it.
int32_t check_entry(Store& store, const Level& parent, uint32_t position, KeyView& key) {
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
        where != position || has_other_parent(store, parent.key.offset(), key))
        return R_PATH_NOT_FOUND;
    return check_lists(store, key);
}

bool enter(Store& store, Level& level) {
    level.next = 0;
    return load_key_index(store, level.key.record, level.children);
}

// Walks the subtree with a stack of its own; the hive's size bounds the steps, the depth limit the stack.
int32_t check_tree(Store& store, Level* levels, uint32_t room, const Level& parent, uint32_t position) {
    auto steps = static_cast<uint32_t>(static_cast<uint32_t>(store.bins_size) / sizeof(KeyRecord));
    int32_t status = check_entry(store, parent, position, levels[0].key);
    if (status != R_SUCCESS)
        return status;
    if (!enter(store, levels[0]))
        return R_NOT_ENOUGH_MEMORY;
    uint32_t depth = 1;
    while (depth > 0 && status == R_SUCCESS) {
        Level& level = levels[depth - 1];
        if (!level.children.whole || level.children.total != level.key.record.subkey_count) {
            status = R_FAILED;
        } else if (level.children.total > 0 && (level.key.record.flags & (key_is_link | key_is_root)) != 0) {
            status = R_INVALID_HANDLE;  // nothing is deleted below such a key
        } else if (level.next == level.children.total) {
            free_index(level.children);
            depth--;
        } else if (depth == room || steps-- == 0) {
            status = R_FAILED;
        } else {
            status = check_entry(store, level, level.next++, levels[depth].key);
            if (status == R_SUCCESS && enter(store, levels[depth]))
                depth++;
            else if (status == R_SUCCESS)
                status = R_NOT_ENOUGH_MEMORY;
        }
    }
    while (depth > 0)
        free_index(levels[--depth].children);
    return status;
}

}  // namespace

int32_t RCreateKey(RegistryKey* key, const char* path, RegistryKey** out, uint32_t* out_disposition) {
    if (out == nullptr)
        return R_INVALID_PARAMETER;
    const int32_t opened = ROpenKey(key, path, out);
    if (opened == R_SUCCESS) {
        if (out_disposition != nullptr)
            *out_disposition = 1;
        return R_SUCCESS;
    }
    if (*out != nullptr)
        RCloseKey(*out);
    *out = nullptr;
    if (!is_key(key))
        return key == nullptr ? R_FAILED : R_INVALID_HANDLE;
    if (is_read_only(*key->store))
        return R_CANTWRITE;
    if (opened == R_INVALID_PARAMETER || opened == R_NOT_ENOUGH_MEMORY)
        return opened;
    const StoredName stored(path);
    if (stored.text() == nullptr)
        return R_NOT_ENOUGH_MEMORY;
    CellOffset offset;
    uint32_t depth;
    const bool created = create_path(*key, stored.text(), offset, depth);
    reread_counts(*key);
    if (!created)
        return R_INVALID_PARAMETER;
    const int32_t status = open_handle(*key->store, offset, depth, out);
    if (status == R_SUCCESS && out_disposition != nullptr)
        *out_disposition = 0;
    return status == R_FAILED ? int32_t{R_CAN_NOT_COMPLETE} : status;
}

int32_t RRenameKey(RegistryKey* key, uint32_t index, const char* new_name) {
    if (!is_key(key))
        return R_INVALID_HANDLE;
    if (is_read_only(*key->store))
        return R_CANTWRITE;
    if (new_name == nullptr || *new_name == '\0' || strchr(new_name, '\\') != nullptr ||
        strlen(new_name) > longest_key_name)
        return R_INVALID_PARAMETER;
    RegistryKey* subkey;
    const int32_t opened = ROpenSubKey(key, index, &subkey);
    if (opened != R_SUCCESS)
        return opened == R_NOT_ENOUGH_MEMORY ? opened : int32_t{R_PATH_NOT_FOUND};
    RCloseKey(subkey);
    const StoredName stored(new_name);
    if (stored.text() == nullptr)
        return R_NOT_ENOUGH_MEMORY;
    const int32_t status = rename_subkey(*key->store, key->info->own, index, name_of(stored.text()));
    reread_counts(*key);
    return status;
}

int32_t RDeleteKey(RegistryKey* key, const char* path) {
    if (!is_key(key))
        return R_INVALID_HANDLE;
    if (is_read_only(*key->store))
        return R_CANTWRITE;
    if ((key->flags & R_HANDLE_KEY) == 0)
        return R_INVALID_HANDLE;
    if (path == nullptr)
        return R_PATH_NOT_FOUND;
    const StoredName stored(path);
    if (stored.text() == nullptr)
        return R_NOT_ENOUGH_MEMORY;
    // A path is followed by as much of a component as can be told apart; what is deleted has the whole name.
    const char* separator = strrchr(stored.text(), '\\');
    const size_t last = strlen(separator != nullptr ? separator + 1 : stored.text());
    if (last == 0 || last > longest_key_name)
        return R_PATH_NOT_FOUND;
    PathEnd end;
    const int32_t status = follow_path(*key, stored.text(), end);
    if (status == R_NOT_ENOUGH_MEMORY)
        return status;
    return status == R_SUCCESS ? delete_at(*key, end) : int32_t{R_PATH_NOT_FOUND};
}

int32_t RCheckDeleteTree(RegistryKey* key, uint32_t index) {
    if (!is_key(key))
        return R_INVALID_HANDLE;
    if (is_read_only(*key->store))
        return R_CANTWRITE;
    if ((key->flags & R_HANDLE_KEY) == 0)
        return R_INVALID_HANDLE;
    Store& store = *key->store;
    const uint32_t room = depth_limit - key->depth;
    const Block memory(static_cast<uint32_t>((room + 1) * sizeof(Level)));
    if (memory.bytes == nullptr)
        return R_NOT_ENOUGH_MEMORY;
    auto* levels = reinterpret_cast<Level*>(memory.bytes);
    Level& parent = levels[room];
    int32_t status = R_FAILED;
    if (!read_key(store, key->info->own, parent.key))
        return status;
    if (!enter(store, parent))
        return R_NOT_ENOUGH_MEMORY;
    if (parent.children.whole && parent.children.total == parent.key.record.subkey_count && room > 0)
        status = check_tree(store, levels, room, parent, index);
    free_index(parent.children);
    return status;
}
