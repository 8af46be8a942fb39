// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "allocator.h"
#include "handle.h"
#include "kinship.h"
#include "leaf_edit.h"
#include "security.h"
#include "stored_name.h"
#include "subkey_change.h"
#include "tree_check.h"

#include <cstdlib>
#include <cstring>

using namespace engine;

namespace {

// Makes every missing component of a path. offset and depth are those of the last one, made says whether it was
// missing.
bool create_path(RegistryKey& key, const char* path, CellOffset& offset, uint32_t& depth, bool& made) {
    made = false;
    offset = key.info->own;
    depth = key.depth;
    for (path = skip_separators(path); *path != '\0'; path = skip_separators(path)) {
        const uint32_t length = component_length(path);
        const Name name = {reinterpret_cast<const uint8_t*>(path), length, false};
        if (depth == depth_limit)
            return false;
        CellOffset next = CellOffset::none;
        const Inserted inserted = insert_subkey(*key.store, offset, name, true, next);
        if (inserted == Inserted::failed)
            return false;
        made = inserted == Inserted::created;
        offset = next;
        depth++;
        path += length;
    }
    return true;
}

// Frees the emptied leaf that a key without subkeys may still have. Anything else that it leads to may be another's.
void free_index_cell(Store& store, const KeyRecord& key) {
    const CellOffset offset = cell_offset(key.subkey_index);
    SubkeyIndex index = {};
    if (static_cast<int32_t>(offset) > 0 && load_index(store, offset, index) && index.whole && index.total == 0 &&
        !index.is_root)
        free_leaf(store, offset);
    free_index(index);
}

// Frees what a key owned that nothing leads to any more. Of its values' records only the first, third, fifth and so on,
// as deleting by ascending position from a list that closes up behind each would: which cells a deletion frees is kept
// so on purpose, and every hive written here agrees. The rest, and all data cells, stay allocated.
void free_key(Store& store, const KeyView& key, const KeyView& parent) {
    ValueList values = find_value_list(store, key.record);
    if (values.count > 0 && is_record(store, values.cell))
        values.count = 0;  // another's cell, whatever it leads to
    for (uint32_t i = 0; i < values.count; i += 2) {
        ValueView value;
        const CellOffset offset = value_at(store, values, i);
        if (read_value(store, offset, value))
            free_cell(store, offset);
    }
    free_index_cell(store, key.record);
    if (values.count > 0)
        free_cell(store, values.cell.offset);
    const CellOffset security = cell_offset(key.record.security);
    drop_security_reference(store, security, security == cell_offset(parent.record.security));
    // Another list may have led to this key as well: what takes its cell need not stand in order there.
    if (store.sorted_key != parent.offset())
        store.sorted_key = CellOffset::none;
    free_cell(store, key.offset());
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
        status = check_own_lists(store, key);
    if (status == R_SUCCESS && remove_entry(store, end.parent, parent.record, index, end.position) != Outcome::written)
        status = R_FAILED;
    free_index(index);
    if (status == R_SUCCESS)
        free_key(store, key, parent);
    if (end.parent == handle.info->own)
        reread_counts(handle);
    return status;
}

}  // namespace

int32_t RCreateKey(RegistryKey* key, const char* path, RegistryKey** out, uint32_t* out_disposition) {
    if (out == nullptr)
        return R_INVALID_PARAMETER;
    *out = nullptr;
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
    bool made;
    const bool created = create_path(*key, stored.text(), offset, depth, made);
    reread_counts(*key);
    if (!created)
        return R_INVALID_PARAMETER;
    if (out_disposition != nullptr)
        *out_disposition = made ? 0 : 1;
    const int32_t status = open_handle(*key->store, offset, depth, out);
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
    const CellOffset meant = subkey->info->own;
    RCloseKey(subkey);
    const StoredName stored(new_name);
    if (stored.text() == nullptr)
        return R_NOT_ENOUGH_MEMORY;
    const int32_t status = rename_subkey(*key->store, key->info->own, index, meant, name_of(stored.text()));
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
    // follow_path cuts a component that is too long; a deletion must not take a key that merely begins like it.
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
    return check_tree(*key->store, key->info->own, key->depth, index);
}
