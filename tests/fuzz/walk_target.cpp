// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "fuzz_hive.h"

#include <cstdlib>

void fuzz::walk_input(const uint8_t* data, size_t size) {
    testkit::MemoryFile file(testkit::Bytes(data, data + size));
    const testkit::Bytes before = file.bytes;
    const RegistryIo io = file.io();
    RegistryKey* root = ROpenHive(&io);
    if (root == nullptr)
        return;
    read_everything(root, size);
    // Reading writes nothing and leaves no handle open.
    if (RCloseKey(root) != R_SUCCESS || file.bytes != before)
        std::abort();
}
