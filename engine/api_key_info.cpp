// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "handle.h"
#include "text_out.h"

#include <cstring>

using namespace engine;

namespace {

// The numbers of RQueryInfoKeyA and RQueryInfoKeyW.
struct Numbers {
    uint32_t* subkeys;
    uint32_t* longest_subkey;
    uint32_t* longest_class;
    uint32_t* values;
    uint32_t* longest_value;
    uint32_t* largest_data;
    uint32_t* security_size;
    RegistryTime* last_write;
};

void give(uint32_t* out, uint32_t n) {
    if (out != nullptr)
        *out = n;
}

int32_t give_numbers(RegistryKey& key, const Numbers& out) {
    const KeyInfo& info = *key.info;
    if (out.security_size != nullptr) {
        SecurityRecord security;
        if (read_record(*key.store, sig_security, info.security, &security, sizeof security) != sizeof security)
            return R_CAN_NOT_COMPLETE;
        // The descriptor's own header is not counted.
        *out.security_size = security.descriptor_length - 20;
    }
    give(out.subkeys, info.subkey_count);
    give(out.longest_subkey, info.longest_subkey / 2);
    give(out.longest_class, info.longest_class);
    give(out.values, info.value_count);
    give(out.longest_value, info.longest_value / 2);
    give(out.largest_data, info.largest_data);
    if (out.last_write != nullptr)
        *out.last_write = info.last_write;
    return R_SUCCESS;
}

// The class as stored, as much as there is room for, ended by as much of a terminator as fits: 1 byte in A calls, 2 in
// W calls.
void give_class(const KeyInfo& info, void* out, uint32_t* size, uint32_t terminator) {
    if (size == nullptr)
        return;
    const uint32_t length = info.class_length;
    if (out == nullptr || *size == 0) {
        *size = terminator == 1 ? length : length + terminator;
        return;
    }
    const uint32_t room = *size;
    memcpy(out, info.class_name(), length < room ? length : room);
    if (room > length) {
        const uint32_t spare = room - length;
        memset(static_cast<uint8_t*>(out) + length, 0, spare < terminator ? spare : terminator);
        *size = length;
    }
}

// A handle that is no ordinary key has no name to show: an empty one where a buffer is given.
bool is_nameless(const RegistryKey& key) { return (key.flags & R_HANDLE_KEY) == 0; }

int32_t give_name_8bit(const RegistryKey& key, char* name, uint32_t* size) {
    if (size == nullptr)
        return R_SUCCESS;
    const KeyInfo& info = *key.info;
    const uint32_t room = name != nullptr ? *size : 0;
    if (is_nameless(key)) {
        if (room > 0)
            name[0] = '\0';
        *size = 0;
        return R_SUCCESS;
    }
    const uint32_t length = info.name_length;
    if (room == 0) {
        *size = length;
        return R_SUCCESS;
    }
    memcpy(name, info.name(), length < room ? length : room);
    if (room > length) {
        name[length] = '\0';
        *size = length;
    }
    if (info.wide())
        return R_INVALID_NAME;
    return room < length ? R_BUFFER_OVERFLOW : R_SUCCESS;
}

int32_t give_name_wide(const RegistryKey& key, uint16_t* name, uint32_t* size) {
    if (size == nullptr)
        return R_SUCCESS;
    const KeyInfo& info = *key.info;
    const uint32_t room = name != nullptr ? *size : 0;
    if (is_nameless(key)) {
        if (room > 1)
            name[0] = 0;
        *size = 0;
        return R_SUCCESS;
    }
    const uint32_t length = info.name_length;
    if (room == 0) {
        // One byte more even for a name stored in UTF-16, where two would be one character: the size that a caller of
        // this function counts on.
        *size = info.wide() ? length + 1 : 2 * (length + 1);
        return R_SUCCESS;
    }
    const uint32_t need = info.wide() ? length : 2 * length;
    if (need > room)
        return R_BUFFER_OVERFLOW;
    if (info.wide())
        memcpy(name, info.name(), length);
    else
        widen_name(info.name(), length, name);
    if (room > need + 1)
        memset(reinterpret_cast<uint8_t*>(name) + need, 0, 2);
    *size = need;
    return R_SUCCESS;
}

}  // namespace

int32_t RQueryInfoKeyA(RegistryKey* key, char* name, uint32_t* name_size, void* class_name, uint32_t* class_size,
                       uint32_t* out_subkeys, uint32_t* out_longest_subkey, uint32_t* out_longest_class,
                       uint32_t* out_values, uint32_t* out_longest_value, uint32_t* out_largest_data,
                       uint32_t* out_security_size, RegistryTime* out_last_write) {
    if (!is_key(key))
        return R_INVALID_HANDLE;
    const int32_t named = give_name_8bit(*key, name, name_size);
    give_class(*key->info, class_name, class_size, 1);
    const int32_t status = give_numbers(*key, {out_subkeys, out_longest_subkey, out_longest_class, out_values,
                                               out_longest_value, out_largest_data, out_security_size, out_last_write});
    return named != R_SUCCESS ? named : status;
}

int32_t RQueryInfoKeyW(RegistryKey* key, uint16_t* name, uint32_t* name_size, void* class_name, uint32_t* class_size,
                       uint32_t* out_subkeys, uint32_t* out_longest_subkey, uint32_t* out_longest_class,
                       uint32_t* out_values, uint32_t* out_longest_value, uint32_t* out_largest_data,
                       uint32_t* out_security_size, RegistryTime* out_last_write) {
    if (!is_key(key))
        return R_INVALID_HANDLE;
    const int32_t status = give_name_wide(*key, name, name_size);
    if (status != R_SUCCESS)
        return status;
    give_class(*key->info, class_name, class_size, 2);
    return give_numbers(*key, {out_subkeys, out_longest_subkey, out_longest_class, out_values, out_longest_value,
                               out_largest_data, out_security_size, out_last_write});
}
