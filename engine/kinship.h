// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Whether a list that leads to a key is the one that the key belongs to. In a damaged hive more than one may lead to
// it.
#pragma once

#include "subkey_index.h"

namespace engine {

// Whether a key that is listed under parent has its place elsewhere too: it is the hive's root, it stands in the index
// twice, or its own record names another parent that lists it, and that is reached from the root in the same way.
// Taking such a key away here would take it from there as well. Also true where memory runs out or the device fails a
// read, since nobody knows then; a parent whose record is damaged reaches no root.
bool belongs_elsewhere(Store& store, CellOffset parent, const SubkeyIndex& index, const KeyView& key);
// The same, but a key that stands in the index twice passes: for a caller that looks at each entry anyway.
bool has_other_parent(Store& store, CellOffset parent, const KeyView& key);

// What is known of stray parents: keys that a record names as its parent though another key lists it. Holds while
// nothing above those changes.
struct StrayParents {
    // The last one, and whether it is in the tree: of many subkeys that name it only the first is asked the whole way.
    CellOffset last = CellOffset::none;
    bool is_reached = false;
    uint64_t looked_at = 0;  // entries of lists on all ways up, a level counting as some
};
// The same for many subkeys in turn. Also true once more was looked at than a few strays ask for: a hostile hive may
// lead each subkey another long way up.
bool has_other_parent(Store& store, CellOffset parent, const KeyView& key, StrayParents& strays);

// Whether the subkey at a position below index.total says that the list it stands in may be another key's than
// parent's: it has another parent, or cannot be read.
bool may_be_anothers(Store& store, CellOffset parent, const SubkeyIndex& index, uint32_t position);

}  // namespace engine
