// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Key handles: a copy of the key's record as it was when the handle was made, with what its lists can hold.
#pragma once

#include "subkey_index.h"
#include "value_list.h"

namespace engine {

// The copy of a key's record. The name, a zero byte, and the class (UTF-16 as stored) lie behind it in one block.
struct KeyInfo {
    uint16_t signature;
    uint16_t flags;
    RegistryTime last_write;
    CellOffset parent;
    CellOffset own;
    uint32_t subkey_count;  // cut to what the index can hold
    uint32_t value_count;   // cut to what the list can hold
    CellOffset security;
    uint32_t longest_subkey;  // bytes, as the other lengths
    uint32_t longest_class;
    uint32_t longest_value;
    uint32_t largest_data;
    uint16_t name_length;
    uint16_t class_length;

    const uint8_t* name() const { return reinterpret_cast<const uint8_t*>(this + 1); }
    const uint8_t* class_name() const { return name() + name_length + 1; }
    bool wide() const { return (flags & key_name_8bit) == 0; }
};

}  // namespace engine

struct RegistryKey {
    uint32_t flags;
    engine::Store* store;
    engine::KeyInfo* info;

    uint32_t depth;  // levels below the root
    // What was read of the key's lists; read anew once the hive has been written to.
    engine::SubkeyIndex index;
    engine::OffsetBatch subkeys;
    engine::ValueList values;
    engine::OffsetBatch value_offsets;
    engine::ValueView recent_value;  // the value asked for last: its name and its data are asked for in turn
    uint32_t recent_position;        // UINT32_MAX when there is none
    uint32_t values_generation;      // the store's when the list was read; one less where it is to be read again
    // The record could not be read after a change through this handle: the next call reads it and takes its counts.
    bool counts_are_old;
};

namespace engine {

// Fills a zeroed handle from the record at an offset. 0, -1 for a damaged record, 8 without memory.
int32_t fill_handle(RegistryKey& handle, Store& store, CellOffset offset, uint32_t depth);
// A new handle for the subkey at an offset, counted as open. Status as fill_handle's; *out is set with 0 alone.
int32_t open_handle(Store& store, CellOffset offset, uint32_t depth, RegistryKey** out);
// The flags that a subkey's handle gets.
uint32_t handle_flags(const KeyInfo& info);
// Frees the handle and what it owns; the hive stays.
void free_handle(RegistryKey* handle);

// The handle's index and list, read anew when anything was written since. false when memory ran out.
bool current_index(RegistryKey& handle);
ValueList& current_values(RegistryKey& handle);
// The offset of the subkey at a position, after current_index; none when it cannot be read.
CellOffset listed_subkey(RegistryKey& handle, uint32_t position);
// The value at a position of the list, null when its record cannot be read. Valid until the next call on the handle.
const ValueView* listed_value(RegistryKey& handle, uint32_t position);
// Brings counts, offsets and maxima of a handle up to its key's record.
void take_counts(RegistryKey& handle, const KeyRecord& record);
// The same, reading the record. Where that fails, the next call on the handle tries again.
bool reread_counts(RegistryKey& handle);
// Whether it is a key's handle: what every call asks first. May read the record, see counts_are_old.
inline bool is_key(RegistryKey* key) {
    if (key == nullptr || key->info == nullptr)
        return false;
    if (key->counts_are_old)
        reread_counts(*key);
    return true;
}

// Where a path leads.
struct PathEnd {
    CellOffset parent;
    CellOffset key;
    uint32_t position;  // of the key in its parent's index
    uint32_t depth;
};

// Follows a path down from a handle. 0, 3 when a component is not there or cannot be read, 8 without memory, 87 no
// component.
int32_t follow_path(RegistryKey& from, const char* path, PathEnd& end);
// Skips backslashes.
const char* skip_separators(const char* path);
// The length of the first component, in characters.
uint32_t component_length(const char* path);

}  // namespace engine
