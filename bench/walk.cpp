// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "walk.h"

#include "sizes.h"

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <string>

namespace bench {

void check(int32_t status, const char* what) {
    if (status != R_SUCCESS) {
        std::fprintf(stderr, "%s: status %d\n", what, status);
        std::exit(1);
    }
}

namespace {

void make_keys(RegistryKey* parent, int count) {
    for (int i = 0; i < count; i++) {
        RegistryKey* key = nullptr;
        const std::string name = "Key " + std::to_string(i);
        check(RCreateKey(parent, name.c_str(), &key, nullptr), "create");
        for (int v = 0; v < 3; v++) {
            const std::string data(static_cast<size_t>(10 + 20 * v), 'x');
            check(RSetValueExW(key, ("Value " + std::to_string(v)).c_str(), 3, data.data(),
                               static_cast<uint32_t>(data.size())),
                  "set");
        }
        RCloseKey(key);
    }
}

}  // namespace

void make_large(RegistryKey* root) {
    for (int i = 0; i < 200; i++) {
        RegistryKey* branch = nullptr;
        check(RCreateKey(root, ("Branch " + std::to_string(i)).c_str(), &branch, nullptr), "create");
        make_keys(branch, sized(500));
        RCloseKey(branch);
    }
}

void make_key_with_subkeys(RegistryKey* parent, const char* name, int count) {
    RegistryKey* key = nullptr;
    check(RCreateKey(parent, name, &key, nullptr), "create");
    for (int i = 0; i < count; i++) {
        RegistryKey* made = nullptr;
        check(RCreateKey(key, ("Key number " + std::to_string(i)).c_str(), &made, nullptr), "create");
        RCloseKey(made);
    }
    RCloseKey(key);
}

void make_key_with_values(RegistryKey* parent, const char* name, int count) {
    RegistryKey* key = nullptr;
    check(RCreateKey(parent, name, &key, nullptr), "create");
    const uint32_t data = 1;
    for (int i = 0; i < count; i++)
        check(RSetValueExW(key, ("Value number " + std::to_string(i)).c_str(), 4, &data, sizeof data), "set");
    RCloseKey(key);
}

void Walk::key(RegistryKey* handle) {
    keys++;
    uint32_t subkeys = 0;
    uint32_t values_here = 0;
    uint32_t size = static_cast<uint32_t>(name_.size() * 2);
    check(RQueryInfoKeyW(handle, name_.data(), &size, nullptr, nullptr, &subkeys, nullptr, nullptr, &values_here,
                         nullptr, nullptr, nullptr, nullptr),
          "query");
    for (uint32_t i = 0; i < values_here; i++)
        value(handle, i);
    for (uint32_t i = 0; i < subkeys; i++) {
        RegistryKey* child = nullptr;
        check(ROpenSubKey(handle, i, &child), "open");
        key(child);
        RCloseKey(child);
    }
}

void Walk::value(RegistryKey* handle, uint32_t i) {
    values++;
    uint32_t name_size = static_cast<uint32_t>(name_.size() * 2);
    uint32_t type = 0;
    uint32_t size = 0;
    check(REnumValueW(handle, i, name_.data(), &name_size, &type, nullptr, &size), "value name");
    data_.resize(std::max<size_t>(data_.size(), size));
    uint32_t room = size;
    check(REnumValueW(handle, i, nullptr, nullptr, nullptr, data_.data(), &room), "value data");
}

}  // namespace bench
