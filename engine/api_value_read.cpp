// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "handle.h"
#include "text_out.h"
#include "value_data.h"

#include <cstring>

using namespace engine;

namespace {

// Finds the index-th value's record. 259 past the end, -1 when it cannot be read.
int32_t find_enumerated(RegistryKey* key, uint32_t index, const ValueView*& value) {
    if (!is_key(key))
        return R_FAILED;
    if (index >= key->info->value_count)
        return R_NO_MORE_ITEMS;
    value = listed_value(*key, index);
    return value != nullptr ? R_SUCCESS : R_FAILED;
}

int32_t give_value_name_8bit(Store& store, const ValueView& value, char* name, uint32_t* name_size) {
    if (name_size == nullptr)
        return R_SUCCESS;
    const uint32_t length = value.record.name_length;
    if (name != nullptr && *name_size > 0) {
        const uint32_t copied = length < *name_size - 1 ? length : *name_size - 1;
        if (!read_part(store, value.cell, sizeof(ValueRecord), name, copied))
            return R_FAILED;
        name[copied] = '\0';
        convert_in_place(c2local_ptr, name, copied);
    }
    *name_size = length;
    return R_SUCCESS;
}

bool is_single_text(uint32_t type) { return type == 1 || type == 2 || type == 6; }
constexpr uint32_t type_multi_text = 7;

// Data as an "A" call hands it out: what does not fit is left out, never reported.
int32_t give_data_8bit(Store& store, const ValueView& value, void* data, uint32_t* data_size) {
    if (data_size == nullptr)
        return R_SUCCESS;
    const uint32_t size = value.size();
    if (data == nullptr || *data_size == 0) {
        *data_size = size;
        return R_SUCCESS;
    }
    const uint32_t room = *data_size;
    const uint32_t type = value.record.type;
    const bool text = is_single_text(type) || type == type_multi_text;
    if (value.is_inline() || !text) {
        const int32_t status = read_plain_data(store, value, data, size < room ? size : room);
        if (status == R_SUCCESS)
            *data_size = size;
        return status;
    }
    const uint32_t units = size / 2;
    const uint32_t wanted = room <= units ? room - 1 : units;
    const Block bytes(wanted * 2);
    if (bytes.bytes == nullptr)
        return R_NOT_ENOUGH_MEMORY;
    const int32_t status = read_plain_data(store, value, bytes.bytes, wanted * 2);
    if (status != R_SUCCESS)
        return status;
    auto* out = static_cast<char*>(data);
    uint32_t done = narrow(bytes.bytes, out, wanted);
    while (type == type_multi_text && done < wanted) {
        out[done++] = '\0';  // the zero that ended one string; the next begins behind it
        done += narrow(bytes.bytes + 2 * done, out + done, wanted - done);
    }
    out[done] = '\0';
    *data_size = units;
    return R_SUCCESS;
}

int32_t give_value_name_wide(Store& store, const ValueView& value, uint16_t* name, uint32_t* name_size) {
    if (name_size == nullptr)
        return R_SUCCESS;
    const uint32_t stored = value.record.name_length;
    const uint32_t length = value.wide() ? stored : stored * 2;
    if (name == nullptr) {
        *name_size = length + 2;
        return R_SUCCESS;
    }
    if (length + 1 >= *name_size) {
        *name_size = length + 2;
        return R_BUFFER_OVERFLOW;
    }
    if (!copy_name_wide(store, value.cell, sizeof(ValueRecord), stored, value.wide(), name))
        return R_FAILED;
    name[length / 2] = 0;
    *name_size = length;
    return R_SUCCESS;
}

int32_t give_data(Store& store, const ValueView& value, void* data, uint32_t* data_size) {
    if (data_size == nullptr)
        return R_SUCCESS;
    const uint32_t size = value.size();
    if (data == nullptr || size > *data_size) {
        *data_size = size;
        return data == nullptr ? R_SUCCESS : R_MORE_DATA;
    }
    const int32_t status = read_data(store, value, data);
    if (status == R_SUCCESS)
        *data_size = size;
    return status;
}

// 2 is said only of a name that no record can have: a caller may go on to store a value of that name.
int32_t missing_status(int32_t position) { return position == no_value ? R_FILE_NOT_FOUND : R_FAILED; }

}  // namespace

int32_t REnumValueA(RegistryKey* key, uint32_t index, char* name, uint32_t* name_size, uint32_t* out_type, void* data,
                    uint32_t* data_size) {
    const ValueView* value = nullptr;
    int32_t status = find_enumerated(key, index, value);
    if (status == R_SUCCESS)
        status = give_value_name_8bit(*key->store, *value, name, name_size);
    if (status != R_SUCCESS)
        return status;
    if (out_type != nullptr)
        *out_type = value->record.type;
    return give_data_8bit(*key->store, *value, data, data_size);
}

int32_t REnumValueW(RegistryKey* key, uint32_t index, uint16_t* name, uint32_t* name_size, uint32_t* out_type,
                    void* data, uint32_t* data_size) {
    const ValueView* value = nullptr;
    int32_t status = find_enumerated(key, index, value);
    if (status == R_SUCCESS)
        status = give_value_name_wide(*key->store, *value, name, name_size);
    if (status != R_SUCCESS)
        return status;
    if (out_type != nullptr)
        *out_type = value->record.type;
    return give_data(*key->store, *value, data, data_size);
}

int32_t RFindValueA(RegistryKey* key, const char* name) {
    if (!is_key(key))
        return R_FAILED;
    const int32_t position = position_of_value(*key->store, current_values(*key), name);
    return position >= 0 ? position : int32_t{R_FAILED};
}

int32_t RQueryValueExA(RegistryKey* key, const char* name, uint32_t* out_type, void* data, uint32_t* data_size) {
    if (!is_key(key))
        return R_INVALID_HANDLE;
    const int32_t position = position_of_value(*key->store, current_values(*key), name);
    if (position < 0)
        return missing_status(position);
    return REnumValueA(key, static_cast<uint32_t>(position), nullptr, nullptr, out_type, data, data_size);
}

int32_t RQueryValueExW(RegistryKey* key, const char* name, uint32_t* out_type, void* data, uint32_t* data_size) {
    if (!is_key(key))
        return R_INVALID_HANDLE;
    const int32_t position = position_of_value(*key->store, current_values(*key), name);
    if (position < 0)
        return missing_status(position);
    return REnumValueW(key, static_cast<uint32_t>(position), nullptr, nullptr, out_type, data, data_size);
}
