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

// Makes branches with so many keys each, every key with three values.
void make_branches(RegistryKey* root, int branches, int keys);
// Makes so many values in one key.
void make_values(RegistryKey* key, int count);

// Opens each key, queries it, reads every value's name and data, as the program's objects do.
class Walk {
public:
    void key(RegistryKey* handle);

    uint64_t keys = 0;
    uint64_t values = 0;

private:
    void value(RegistryKey* handle, uint32_t i);

    std::vector<uint16_t> name_ = std::vector<uint16_t>(17000);
    std::vector<char> data_ = std::vector<char>(4096);
};

} // namespace bench
