// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Hands out and takes back cells, and appends a bin when no free cell is large enough. Works in the file directly.
#pragma once

#include "store.h"

namespace engine {

// The size of a cell for n bytes of data: its size word added, rounded up to 8.
constexpr uint32_t cell_size_for(uint32_t n) { return (n + 11) & ~7U; }

// A cell for n bytes of data, marked as used; its old bytes are still in it. none on failure.
CellOffset allocate(Store& store, uint32_t n);
// Frees a cell in use and joins the free cells of its bin that lie side by side. false, with nothing written, for
// anything else; also when a read or a write fails, the cell then being free or not.
bool free_cell(Store& store, CellOffset offset);

}  // namespace engine
