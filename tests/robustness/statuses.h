// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// The statuses that a call may give.
#pragma once

#include <cstdint>

namespace testkit {

inline bool is_in_table(int32_t status) {
    for (const int32_t known : {0, 2, 3, 6, 8, 87, 111, 123, 145, 234, 259, 1003, 1013, 1015, 1016, 2404, -1}) {
        if (status == known)
            return true;
    }
    return false;
}

}  // namespace testkit
