// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "handle.h"
#include "text_out.h"
#include "value_data.h"

#include <cstring>

using namespace engine;

namespace {

// The class of an enumerated key, in 8 bits.
int32_t give_class(Store& store, const KeyRecord& record, char* class_name, uint32_t* class_size) {
    if (class_size == nullptr)
        return R_SUCCESS;
    const uint32_t length = record.class_length;
    const uint32_t failed = store.failed_reads;
    Cell cell;
    const bool there = length > 0 && cell_offset(record.class_name) != CellOffset::none &&
                       find_used_cell(store, cell_offset(record.class_name), cell) && length <= cell.room();
    if (store.failed_reads != failed)
        return R_FAILED;
    if (class_name == nullptr || *class_size == 0) {
        *class_size = there ? length / 2 + 1 : 0;
        return R_SUCCESS;
    }
    if (!there)
        return R_SUCCESS;
    const Block bytes(length);
    if (bytes.bytes == nullptr)
        return R_NOT_ENOUGH_MEMORY;
    if (!read_part(store, cell, 0, bytes.bytes, length))
        return R_FAILED;
    const uint32_t room = *class_size;
    const uint32_t characters = length / 2 < room ? length / 2 : room;
    const uint32_t done = narrow(bytes.bytes, class_name, characters);
    if (room > length / 2) {
        *class_size = length / 2;
        class_name[*class_size] = '\0';
    }
    if (done < room)
        class_name[done] = '\0';
    return R_SUCCESS;
}

// The name of an enumerated key, in 8 bits.
int32_t give_name(Store& store, const KeyView& key, char* name, uint32_t* name_size) {
    if (name_size == nullptr)
        return R_SUCCESS;
    const uint32_t length = key.record.name_length;
    if (name == nullptr || *name_size == 0) {
        *name_size = length + 1;
        return R_SUCCESS;
    }
    const uint32_t room = *name_size;
    if (!read_part(store, key.cell, sizeof(KeyRecord), name, length < room ? length : room))
        return R_FAILED;
    if (room > length) {
        name[length] = '\0';
        *name_size = length;
    }
    if (key.wide())
        return R_INVALID_NAME;
    return room < length ? R_BUFFER_OVERFLOW : R_SUCCESS;
}

}  // namespace

int32_t REnumKeyInfoA(RegistryKey* key, uint32_t index, char* name, uint32_t* name_size, uint32_t* out_subkeys,
                      char* class_name, uint32_t* class_size, RegistryTime* out_last_write) {
    if (!is_key(key))
        return R_FAILED;
    if (index >= key->info->subkey_count)
        return R_NO_MORE_ITEMS;
    if (!current_index(*key))
        return R_NOT_ENOUGH_MEMORY;
    KeyView subkey;
    if (!read_key(*key->store, listed_subkey(*key, index), subkey))
        return R_FAILED;
    if (out_subkeys != nullptr)
        *out_subkeys = subkey.record.subkey_count;
    const int32_t named = give_name(*key->store, subkey, name, name_size);
    if (named != R_SUCCESS && named != R_BUFFER_OVERFLOW)
        return named;
    if (out_last_write != nullptr)
        *out_last_write = {subkey.record.time_low, subkey.record.time_high};
    const int32_t classed = give_class(*key->store, subkey.record, class_name, class_size);
    return classed != R_SUCCESS ? classed : named;
}

int32_t REnumKeyExA(RegistryKey* key, uint32_t index, char* name, uint32_t* name_size, char* class_name,
                    uint32_t* class_size, RegistryTime* out_last_write) {
    return REnumKeyInfoA(key, index, name, name_size, nullptr, class_name, class_size, out_last_write);
}
