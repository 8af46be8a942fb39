// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "fuzz_hive.h"

#include <vector>

namespace fuzz {

namespace {

constexpr size_t smallest_key = 80;
constexpr uint32_t name_units = 300;

class Reader {
public:
    explicit Reader(size_t hive_size) : keys_left_(hive_size / smallest_key + 1), data_(hive_size) {}

    void key(RegistryKey* handle) {
        if (keys_left_ == 0)
            return;
        keys_left_--;
        uint16_t name[name_units];
        uint32_t name_size = sizeof name;
        uint16_t class_name[16];
        uint32_t class_size = sizeof class_name;
        uint32_t subkeys = 0;
        uint32_t values = 0;
        uint32_t security = 0;
        RQueryInfoKeyW(handle, name, &name_size, class_name, &class_size, &subkeys, nullptr, nullptr, &values, nullptr,
                       nullptr, &security, nullptr);
        subkeys = 0;
        values = 0;
        RQueryInfoKeyA(handle, nullptr, nullptr, nullptr, nullptr, &subkeys, nullptr, nullptr, &values, nullptr,
                       nullptr, nullptr, nullptr);
        for (uint32_t i = 0; i < values; i++)
            value(handle, i);
        for (uint32_t i = 0; i < subkeys; i++)
            child(handle, i);
    }

private:
    void value(RegistryKey* handle, uint32_t i) {
        uint16_t wide_name[name_units];
        uint32_t wide_size = sizeof wide_name;
        uint32_t type = 0;
        uint32_t size = 0;
        if (REnumValueW(handle, i, wide_name, &wide_size, &type, nullptr, &size) != R_SUCCESS || size > data_.size())
            return;
        uint32_t room = size;
        REnumValueW(handle, i, nullptr, nullptr, nullptr, data_.data(), &room);
        char name[name_units];
        uint32_t name_size = sizeof name;
        room = static_cast<uint32_t>(data_.size());
        REnumValueA(handle, i, name, &name_size, &type, data_.data(), &room);
        // Looking up by name costs a walk over the list, so not for each of many.
        if (i < 16)
            RFindValueA(handle, name);
    }

    void child(RegistryKey* handle, uint32_t i) {
        char name[name_units] = {};
        uint32_t name_size = sizeof name - 1;
        char class_name[16];
        uint32_t class_size = sizeof class_name;
        RegistryTime time;
        REnumKeyExA(handle, i, name, &name_size, class_name, &class_size, &time);
        RegistryKey* by_name = nullptr;
        if (i < 16 && name[0] != '\0')
            ROpenKey(handle, name, &by_name);
        if (by_name != nullptr)
            RCloseKey(by_name);
        RegistryKey* opened = nullptr;
        if (ROpenSubKey(handle, i, &opened) == R_SUCCESS) {
            key(opened);
            RCloseKey(opened);
        }
    }

    size_t keys_left_;
    std::vector<uint8_t> data_;
};

} // namespace

void read_everything(RegistryKey* root, size_t hive_size) { Reader(hive_size).key(root); }

} // namespace fuzz
