// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Handing out names in UTF-16.
#pragma once

#include "store.h"

namespace engine {

// Copies the stored bytes of a name, skip bytes into the cell's record, to out as UTF-16, without a terminator.
// stored is the name's length in bytes as it stands; out has room for all of it.
bool copy_name_wide(Store& store, const Cell& cell, uint32_t skip, uint32_t stored, bool wide, uint16_t* out);
// Widens 8-bit characters, zeros among them too.
void widen_name(const uint8_t* name, uint32_t characters, uint16_t* out);

}  // namespace engine
