// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "text_out.h"

#include "names.h"

namespace engine {

void widen_name(const uint8_t* name, uint32_t characters, uint16_t* out) {
    for (uint32_t i = 0; i < characters; i++)
        out[i] = Name{name, characters, false}.unit(i);
}

bool copy_name_wide(Store& store, const Cell& cell, uint32_t skip, uint32_t stored, bool wide, uint16_t* out) {
    if (wide)
        return read_part(store, cell, skip, out, stored);
    uint8_t piece[256];
    for (uint32_t done = 0; done < stored;) {
        const uint32_t rest = stored - done;
        const uint32_t count = rest < sizeof piece ? rest : static_cast<uint32_t>(sizeof piece);
        if (!read_part(store, cell, skip + done, piece, count))
            return false;
        widen_name(piece, count, out + done);
        done += count;
    }
    return true;
}

}  // namespace engine
