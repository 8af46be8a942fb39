// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Entries of a subkey index put in, taken out and moved, in an order of writes that a stop anywhere does no harm to.
#pragma once

#include "subkey_index.h"

namespace engine {

// A key is seen when both its parent's count and the leaf's count reach it. So a count that rises is written to the
// parent first, and one that falls to the leaf first: no other key is ever out of sight.
//
// What comes out of a change says what may be freed. unchanged: no list leads to the key because of it, so the key may
// go again. unknown: one may, and nothing is to be freed.

// Frees a leaf that its key leads to no more. Where the hive's root leads to it as well, in a damaged hive, it stays:
// without it the hive would not open again.
void free_leaf(Store& store, CellOffset leaf);

// Whether a new entry at this position, in the index of the key at parent, has a leaf to go to: its entries
// are read, there is room in its count, and nothing else leads to it. In a damaged hive the index may lead to a leaf
// twice, or to another key's, whose subkeys would go when the leaf is moved.
bool can_grow(Store& store, CellOffset parent, const SubkeyIndex& index, uint32_t position);

// Whether move_entry can put the entry at a position into the leaf of its new place.
bool can_move(Store& store, CellOffset parent, const SubkeyIndex& index, uint32_t position, uint32_t place);

// Puts in an entry for a key that is complete; parent follows what the file holds. In turn:
//   the leaf has room: the parent's count, the leaf;
//   it has none, below a root: a longer copy of the leaf, the parent's count, the root's entry, the old leaf freed;
//   it has none otherwise: a longer copy of the leaf, the parent's record with count and index, the old leaf freed.
Outcome add_entry(Store& store, CellOffset parent_offset, KeyRecord& parent, const SubkeyIndex& index,
                  uint32_t position, CellOffset key, const Name& name);

// Takes an entry out of an index that is a single leaf; unchanged for any other and for a position past its end. In
// turn: the leaf, the parent's count.
Outcome remove_entry(Store& store, CellOffset parent_offset, KeyRecord& parent, const SubkeyIndex& index,
                     uint32_t position);

// Replaces the entry at a position by one for another record of the same key, at the place that its name wants (counted
// with the old entry still in). Within one leaf this is a single write. Between two leaves of a root, in turn: the
// parent's count one up, the new entry, the old one out, the parent's count back; in between the key has both names.
Outcome move_entry(Store& store, CellOffset parent_offset, KeyRecord& parent, const SubkeyIndex& index,
                   uint32_t position, uint32_t place, CellOffset key, const Name& name);

}  // namespace engine
