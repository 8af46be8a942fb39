// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "handle.h"

#include <cstdlib>

using namespace engine;

int32_t ROpenSubKey(RegistryKey* key, uint32_t index, RegistryKey** out) {
    if (out == nullptr)
        return R_INVALID_PARAMETER;
    *out = nullptr;
    if (!is_key(key))
        return R_FAILED;
    if (index >= key->info->subkey_count)
        return R_NO_MORE_ITEMS;
    if (!current_index(*key))
        return R_NOT_ENOUGH_MEMORY;
    const CellOffset subkey = listed_subkey(*key, index);
    if (subkey == CellOffset::none)
        return R_NO_MORE_ITEMS;
    return open_handle(*key->store, subkey, key->depth + 1, out);
}

uint32_t RKeyOffset(const RegistryKey* key) {
    return key != nullptr && key->info != nullptr ? raw(key->info->own) : UINT32_MAX;
}

int32_t ROpenKey(RegistryKey* key, const char* path, RegistryKey** out) {
    return key == nullptr ? R_FAILED : ROpenKeyEx(key, path, out, nullptr);
}

int32_t ROpenKeyEx(RegistryKey* key, const char* path, RegistryKey** out, uint32_t* out_index) {
    if (out != nullptr)
        *out = nullptr;
    if (!is_key(key))
        return R_INVALID_HANDLE;
    if (out == nullptr || path == nullptr || *skip_separators(path) == '\0')
        return R_INVALID_PARAMETER;
    auto* handle = static_cast<RegistryKey*>(calloc(1, sizeof(RegistryKey)));
    if (handle == nullptr)
        return R_NOT_ENOUGH_MEMORY;
    *out = handle;  // from here on a failure leaves it there, zeroed
    PathEnd end;
    int32_t status = follow_path(*key, path, end);
    if (status == R_SUCCESS)
        status = fill_handle(*handle, *key->store, end.key, end.depth);
    if (status != R_SUCCESS)
        return status;
    handle->flags = handle_flags(*handle->info);
    key->store->open_handles++;
    if (out_index != nullptr)
        *out_index = end.position;
    return R_SUCCESS;
}
