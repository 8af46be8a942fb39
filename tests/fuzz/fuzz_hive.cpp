// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "fuzz_hive.h"

#include "snapshot.h"

void fuzz::read_everything(RegistryKey* root, size_t hive_size) {
    testkit::ask_everything(root, testkit::limits_for(hive_size));
}
