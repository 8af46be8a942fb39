// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "handle.h"
#include "stored_name.h"

#include <cstring>

using namespace engine;

namespace {

constexpr uint32_t longest_name = 65535;  // what a value record's length field can say
constexpr uint32_t type_multi_text = 7;

bool is_single_text(uint32_t type) { return type == 1 || type == 2 || type == 6; }

int32_t store_in(RegistryKey* key, const char* name, uint32_t type, const void* data, uint32_t size) {
    const StoredName stored(name != nullptr ? name : "");
    if (stored.text() == nullptr)
        return R_NOT_ENOUGH_MEMORY;
    const NewValue value = {name_of(stored.text()), type, data, size};
    KeyView view;
    if (value.name.length > longest_name || size > data_inline - 1 || (data == nullptr && size > 0) ||
        !read_key(*key->store, key->info->own, view))
        return R_FAILED;
    const Stored result = store_value(*key->store, key->info->own, view.record, value);
    reread_counts(*key);
    return result == Stored::failed ? R_FAILED : R_SUCCESS;
}

}  // namespace

int32_t RSetValueExW(RegistryKey* key, const char* name, uint32_t type, const void* data, uint32_t size) {
    if (!is_key(key))
        return R_INVALID_HANDLE;
    if (is_read_only(*key->store))
        return R_CANTWRITE;
    return store_in(key, name, type, data, size);
}

int32_t RSetValueExA(RegistryKey* key, const char* name, uint32_t type, const void* data, uint32_t size) {
    if (!is_key(key))
        return R_INVALID_HANDLE;
    if (is_read_only(*key->store))
        return R_CANTWRITE;
    const bool multi = type == type_multi_text;
    if ((!is_single_text(type) && !multi) || data == nullptr)
        return store_in(key, name, type, data, size);
    if (size > highest_end / 2 - 2)
        return R_FAILED;
    const uint32_t wide_size = 2 * size + (multi ? 2 : 0);
    const Block wide(wide_size);
    if (wide.bytes == nullptr)
        return R_NOT_ENOUGH_MEMORY;
    memset(wide.bytes, 0, wide_size);
    const auto* text = static_cast<const uint8_t*>(data);
    for (uint32_t done = 0; done < size; done++)  // string by string: each conversion stops at a zero
        done += widen(text + done, wide.bytes + 2 * done, size - done);
    return store_in(key, name, type, wide.bytes, wide_size);
}

int32_t RDeleteValue(RegistryKey* key, const char* name) {
    if (!is_key(key))
        return R_INVALID_HANDLE;
    if (is_read_only(*key->store))
        return R_CANTWRITE;
    const StoredName stored(name != nullptr ? name : "");
    if (stored.text() == nullptr)
        return R_NOT_ENOUGH_MEMORY;
    // Looked for in the list as it is now: the handle's may be older than a change through another one.
    KeyView view;
    if (!read_key(*key->store, key->info->own, view))
        return R_FAILED;
    const int32_t position = position_of_value(*key->store, find_value_list(*key->store, view.record), stored.text());
    if (position < 0)
        return R_CAN_NOT_COMPLETE;
    const int32_t status = remove_value(*key->store, key->info->own, view.record, static_cast<uint32_t>(position));
    reread_counts(*key);
    return status;
}
