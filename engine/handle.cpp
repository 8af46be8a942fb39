// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "handle.h"

#include <cstdlib>
#include <cstring>

namespace engine {

namespace {

// Bytes of the class that are really there: a class that leads nowhere, or past its cell, is no class.
uint32_t class_bytes(Store& store, const KeyRecord& record, Cell& cell) {
    const uint32_t length = record.class_length;
    const CellOffset offset = cell_offset(record.class_name);
    if (length == 0 || offset == CellOffset::none || !find_used_cell(store, offset, cell) || length > cell.room())
        return 0;
    return length;
}

void copy_record(KeyInfo& info, const KeyView& key) {
    const KeyRecord& record = key.record;
    info.signature = record.signature;
    info.flags = record.flags;
    info.last_write = {record.time_low, record.time_high};
    info.parent = cell_offset(record.parent);
    info.own = key.offset();
    info.security = cell_offset(record.security);
    info.longest_class = record.longest_class;
    info.name_length = record.name_length;
}

// The record's copy with name and class. null: memory ran out, or (damaged set) the bytes cannot be read.
KeyInfo* copy_key(Store& store, const KeyView& key, bool& damaged) {
    Cell class_cell = {};
    const uint32_t name_length = key.record.name_length;
    const uint32_t class_length = class_bytes(store, key.record, class_cell);
    auto* info = static_cast<KeyInfo*>(calloc(1, sizeof(KeyInfo) + name_length + 1 + class_length));
    if (info == nullptr)
        return nullptr;
    copy_record(*info, key);
    auto* bytes = reinterpret_cast<uint8_t*>(info + 1);
    memcpy(bytes, key.name, key.kept);
    damaged = name_length > key.kept && !read_part(store, key.cell, sizeof(KeyRecord), bytes, name_length);
    if (!damaged && class_length > 0 && read_part(store, class_cell, 0, bytes + name_length + 1, class_length))
        info->class_length = static_cast<uint16_t>(class_length);
    if (damaged) {
        free(info);
        return nullptr;
    }
    return info;
}

// Reads what the key's record says of its values. The first offsets come along, while the window is there. failed: the
// store's failed reads before the record was read.
void take_values(RegistryKey& handle, Store& store, const KeyRecord& record, uint32_t failed) {
    handle.values = find_value_list(store, record);
    // What the device has failed to deliver is asked for again.
    handle.values_generation = store.failed_reads == failed ? store.generation : store.generation - 1;
    handle.recent_position = UINT32_MAX;
    handle.value_offsets.first = 0;
    handle.value_offsets.count = values_at(store, handle.values, 0, handle.value_offsets.offsets, OffsetBatch::most);
}

// The same of its subkeys. false when memory ran out.
bool take_index(RegistryKey& handle, Store& store, const KeyRecord& record, uint32_t failed) {
    handle.subkeys.count = 0;
    if (!load_key_index(store, record, handle.index))
        return false;
    if (store.failed_reads != failed)
        handle.index.generation--;
    handle.subkeys.first = 0;
    handle.subkeys.count = subkeys_at(store, handle.index, 0, handle.subkeys.offsets, OffsetBatch::most);
    return true;
}

// A record to read the lists by: the counts that the handle knows, and the places where the lists lie by now, since one
// that was moved through another handle has left its cell to whatever came next. After a change of its own that the
// handle could not take in, the record's counts. Where the record cannot be read, the lists lie nowhere.
KeyRecord snapshot(RegistryKey& handle) {
    KeyRecord record = {};
    record.subkey_count = handle.info->subkey_count;
    record.subkey_index = raw(CellOffset::none);
    record.value_count = handle.info->value_count;
    record.value_list = raw(CellOffset::none);
    if (handle.counts_are_old && record.value_count == 0)
        record.value_count = 1;  // there may be one by now, which must not pass for none
    KeyView key;
    if (read_key(*handle.store, handle.info->own, key)) {
        record.subkey_index = key.record.subkey_index;
        record.value_list = key.record.value_list;
        if (key.record.value_count < record.value_count || handle.counts_are_old)
            record.value_count = key.record.value_count;
        if (handle.counts_are_old && handle.depth < depth_limit)
            record.subkey_count = key.record.subkey_count;
    }
    return record;
}

}  // namespace

uint32_t handle_flags(const KeyInfo& info) {
    uint32_t flags = 0;
    if ((info.flags & key_is_link) != 0)
        flags = R_HANDLE_LINK;
    else if ((info.flags & key_is_root) == 0)
        flags = R_HANDLE_KEY;
    return info.wide() ? flags | R_HANDLE_UTF16_NAME : flags;
}

int32_t fill_handle(RegistryKey& handle, Store& store, CellOffset offset, uint32_t depth) {
    const uint32_t failed = store.failed_reads;
    KeyView key;
    if (!read_key(store, offset, key))
        return R_FAILED;
    bool damaged = false;
    handle.info = copy_key(store, key, damaged);
    if (handle.info == nullptr)
        return damaged ? R_FAILED : R_NOT_ENOUGH_MEMORY;
    const bool indexed = take_index(handle, store, key.record, failed);
    if (indexed)
        take_values(handle, store, key.record, failed);
    // Lists that the device did not deliver would pass for empty ones.
    if (!indexed || store.failed_reads != failed) {
        free_index(handle.index);
        free(handle.info);
        handle.info = nullptr;
        handle.index = {};
        return indexed ? R_FAILED : R_NOT_ENOUGH_MEMORY;
    }
    handle.store = &store;
    handle.depth = depth;
    take_counts(handle, key.record);
    return R_SUCCESS;
}

int32_t open_handle(Store& store, CellOffset offset, uint32_t depth, RegistryKey** out) {
    auto* handle = static_cast<RegistryKey*>(calloc(1, sizeof(RegistryKey)));
    if (handle == nullptr)
        return R_NOT_ENOUGH_MEMORY;
    const int32_t status = fill_handle(*handle, store, offset, depth);
    if (status != R_SUCCESS) {
        free(handle);
        return status;
    }
    handle->flags = handle_flags(*handle->info);
    store.open_handles++;
    *out = handle;
    return R_SUCCESS;
}

void free_handle(RegistryKey* handle) {
    free_index(handle->index);
    free(handle->info);
    free(handle);
}

bool current_index(RegistryKey& handle) {
    if (handle.index.generation == handle.store->generation)
        return true;
    free_index(handle.index);
    const uint32_t failed = handle.store->failed_reads;
    return take_index(handle, *handle.store, snapshot(handle), failed);
}

ValueList& current_values(RegistryKey& handle) {
    if (handle.values_generation != handle.store->generation) {
        const uint32_t failed = handle.store->failed_reads;
        take_values(handle, *handle.store, snapshot(handle), failed);
    }
    return handle.values;
}

CellOffset listed_subkey(RegistryKey& handle, uint32_t position) {
    return subkey_at(*handle.store, handle.index, position, handle.subkeys);
}

const ValueView* listed_value(RegistryKey& handle, uint32_t position) {
    const ValueList& list = current_values(handle);
    if (position == handle.recent_position)
        return &handle.recent_value;
    OffsetBatch& batch = handle.value_offsets;
    if (!batch.holds(position)) {
        batch.first = position;
        batch.count = values_at(*handle.store, list, position, batch.offsets, OffsetBatch::most);
        if (batch.count == 0)
            return nullptr;
    }
    handle.recent_position = UINT32_MAX;
    if (!read_value(*handle.store, batch.offsets[position - batch.first], handle.recent_value))
        return nullptr;
    handle.recent_position = position;
    return &handle.recent_value;
}

void take_counts(RegistryKey& handle, const KeyRecord& record) {
    KeyInfo& info = *handle.info;
    const uint32_t listed = record.subkey_count < handle.index.total ? record.subkey_count : handle.index.total;
    info.subkey_count = handle.depth < depth_limit ? listed : 0;
    info.value_count = handle.values.count;
    info.longest_subkey = record.longest_subkey;
    info.longest_value = record.longest_value;
    info.largest_data = record.largest_data;
}

bool reread_counts(RegistryKey& handle) {
    handle.counts_are_old = true;
    const uint32_t failed = handle.store->failed_reads;
    KeyView key;
    if (!read_key(*handle.store, handle.info->own, key))
        return false;
    free_index(handle.index);
    if (!take_index(handle, *handle.store, key.record, failed))
        return false;
    take_values(handle, *handle.store, key.record, failed);
    if (handle.store->failed_reads != failed)
        return false;
    take_counts(handle, key.record);
    handle.counts_are_old = false;
    return true;
}

const char* skip_separators(const char* path) {
    while (*path == '\\')
        path++;
    return path;
}

uint32_t component_length(const char* path) {
    const char* end = strchr(path, '\\');
    return static_cast<uint32_t>(end != nullptr ? static_cast<size_t>(end - path) : strlen(path));
}

int32_t follow_path(RegistryKey& from, const char* path, PathEnd& end) {
    Store& store = *from.store;
    path = skip_separators(path);
    if (*path == '\0')
        return R_INVALID_PARAMETER;
    if (!current_index(from))
        return R_NOT_ENOUGH_MEMORY;
    end = {CellOffset::none, from.info->own, 0, from.depth};
    SubkeyIndex own = {};  // of the key that the path has come to, below the first
    const SubkeyIndex* index = &from.index;
    int32_t status = R_SUCCESS;
    while (*path != '\0') {
        const uint32_t length = component_length(path);
        const Name name = {reinterpret_cast<const uint8_t*>(path),
                           length < longest_key_name ? length : longest_key_name, false};
        KeyView key;
        if (end.depth == depth_limit ||
            find_subkey(store, *index, end.key, name, compare_signed, end.position, key) != Lookup::found) {
            status = R_PATH_NOT_FOUND;
            break;
        }
        end.parent = end.key;
        end.key = key.offset();
        end.depth++;
        path = skip_separators(path + length);
        if (*path == '\0')
            break;
        free_index(own);
        if (!load_key_index(store, key.record, own)) {
            status = R_NOT_ENOUGH_MEMORY;
            break;
        }
        index = &own;
    }
    free_index(own);
    return status;
}

}  // namespace engine
