// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Whether keys can be deleted, asked before anything is: a refusal half-way would leave a branch without its leaves.
#pragma once

#include "subkey_index.h"

namespace engine {

// Whether the key's list of values is whole, without which the key is not deleted. 0, or -1.
int32_t check_own_lists(Store& store, const KeyView& key);

// Walks the subtree of the subkey at a position of the parent and asks of every key what its deletion will ask, by path
// and through its parent's handle. depth: levels of the parent below the root. Status as RCheckDeleteTree's.
int32_t check_tree(Store& store, CellOffset parent, uint32_t depth, uint32_t position);

}  // namespace engine
