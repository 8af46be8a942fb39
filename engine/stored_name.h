// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// A caller's name or path, copied and passed through c2ansi_ptr, as it is stored or looked up for a change.
#pragma once

#include "names.h"

#include <tallowfen/registry.h>

#include <cstdlib>
#include <cstring>

namespace engine {

class StoredName {
public:
    explicit StoredName(const char* name) : copy_(strdup(name)) {
        if (copy_ != nullptr)
            convert_in_place(c2ansi_ptr, copy_, static_cast<uint32_t>(strlen(copy_)));
    }
    StoredName(const StoredName&) = delete;
    StoredName& operator=(const StoredName&) = delete;
    ~StoredName() { free(copy_); }

    // null when memory ran out.
    const char* text() const { return copy_; }

private:
    char* copy_;
};

}  // namespace engine
