// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Where the real hives for tests are, and what is known of them.
#pragma once

#include "bytes.h"

namespace testkit {

struct RealHive {
    std::string name;
    std::string path;
    size_t keys = 0;
    size_t values = 0;
};

// The sound hives of the directory named by TALLOWFEN_HIVES, as its INDEX.tsv lists them; prints what is left
// out when there is no such directory.
std::vector<RealHive> real_hives();

}  // namespace testkit
