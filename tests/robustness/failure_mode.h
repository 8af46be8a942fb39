// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// In what way a call of the file fails, as the parameter of a test that tries each.
#pragma once

#include "memory_file.h"

#include <ostream>

namespace testkit {

struct FailureMode {
    const char* name;
    MemoryFile::Call call;
    bool lasting;
    bool shortened;
};

inline void PrintTo(const FailureMode& mode, std::ostream* out) { *out << mode.name; }

}  // namespace testkit
