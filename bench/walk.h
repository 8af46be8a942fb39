// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// What several benchmarks do with a hive through the engine: fill it, and read all of it.
#pragma once

#include <tallowfen/registry.h>

#include <cstdint>
#include <vector>

namespace bench {

// Ends the program with a message unless the status is success.
void check(int32_t status, const char* what);

// Makes branches of keys, some 100,000 keys in all, every one with three values.
void make_large(RegistryKey* root);
// Makes a key with so many subkeys, or values, and nothing else.
void make_key_with_subkeys(RegistryKey* parent, const char* name, int count);
void make_key_with_values(RegistryKey* parent, const char* name, int count);

// Opens each key, queries it, reads every value's name and data, as the program's objects do.
class Walk {
public:
    void key(RegistryKey* handle);

    uint64_t keys = 0;
    uint64_t values = 0;

    // Bytes of the walk's own buffers.
    double buffers() const { return static_cast<double>(name_.capacity() * 2 + data_.capacity()); }

private:
    void value(RegistryKey* handle, uint32_t i);

    std::vector<uint16_t> name_ = std::vector<uint16_t>(17000);
    std::vector<char> data_ = std::vector<char>(4096);
};

}  // namespace bench
