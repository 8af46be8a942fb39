// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// What the fuzz targets do with an input, apart from the fuzzer: also run over the kept corpus by every build.
#pragma once

#include "memory_file.h"

#include <cstddef>
#include <cstdint>

namespace fuzz {

// Opens the input as a hive and reads all of it through the engine.
void walk_input(const uint8_t* data, size_t size);
// The last 64 bytes of the input are a list of changes, the rest a hive to make them in. A hive that the checker finds
// sound before must be so afterwards: the program ends otherwise.
void edit_input(const uint8_t* data, size_t size);

constexpr size_t script_size = 64;

// Reads everything below an open key: at most as many keys as a hive of so many bytes can hold.
void read_everything(RegistryKey* root, size_t hive_size);

}  // namespace fuzz
