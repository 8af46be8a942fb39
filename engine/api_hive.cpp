// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "handle.h"

#include <cstdlib>
#include <cstring>

using namespace engine;

RegistryKey* ROpenHive(const RegistryIo* io) { return ROpenHiveEx(io, R_HANDLE_HIVE); }

RegistryKey* ROpenHiveEx(const RegistryIo* io, uint32_t handle_flags) {
    if (io == nullptr || io->read == nullptr || io->seek == nullptr)
        return nullptr;
    Le32 signature;
    if (io->read(io->device, &signature, sizeof signature) != static_cast<int32_t>(sizeof signature) ||
        signature != sig_base)
        return nullptr;
    auto* handle = static_cast<RegistryKey*>(calloc(1, sizeof(RegistryKey)));
    if (handle == nullptr)
        return nullptr;
    Store* store = open_store(*io);
    if (store == nullptr || fill_handle(*handle, *store, store->root, 0) != R_SUCCESS) {
        if (store != nullptr)
            free_store(store);
        free(handle);
        return nullptr;
    }
    handle->flags = handle->info->wide() ? handle_flags | R_HANDLE_UTF16_NAME : handle_flags;
    return handle;
}

int32_t RCloseKey(RegistryKey* key) {
    if (key == nullptr)
        return R_FAILED;
    if ((key->flags & (R_HANDLE_LINK | R_HANDLE_KEY)) != 0) {
        key->store->open_handles--;
        free_handle(key);
        return R_SUCCESS;
    }
    if ((key->flags & R_HANDLE_HIVE) != 0)
        return RCloseHive(key);
    // No proper key: what a failed ROpenKeyEx left behind, or a record inside the hive that claims to be its root. Both
    // are let go of, or they would keep the hive open for good.
    if (key->store != nullptr)
        key->store->open_handles--;
    free_handle(key);
    return R_INVALID_HANDLE;
}

int32_t RCloseHive(RegistryKey* root) {
    if (root == nullptr || (root->flags & R_HANDLE_HIVE) == 0)
        return R_INVALID_HANDLE;
    if (root->store->open_handles > 0)
        return R_DEVICE_IN_USE;
    free_store(root->store);
    free_handle(root);
    return R_SUCCESS;
}
