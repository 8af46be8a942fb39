// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "kinship.h"

namespace engine {

namespace {

uint32_t times_listed(Store& store, const SubkeyIndex& index, CellOffset key) {
    OffsetBatch batch = {};
    uint32_t times = 0;
    for (uint32_t i = 0; i < index.total; i++)
        times += subkey_at(store, index, i, batch) == key ? 1U : 0U;
    return times;
}

// Whether the way up from a key by what its record and its parents' say leads to the root past the given parent, each
// on it listing the one below.
bool reaches_root_past(Store& store, CellOffset parent, const KeyView& key) {
    CellOffset below = key.offset();
    CellOffset above = cell_offset(key.record.parent);
    if (above == parent)
        return false;
    for (uint32_t level = 0; level < depth_limit; level++) {
        KeyView upper;
        SubkeyIndex index;
        if (!read_key(store, above, upper))
            return false;
        if (!load_key_index(store, upper.record, index))
            return true;
        const bool lists = times_listed(store, index, below) > 0;
        free_index(index);
        if (!lists || above == store.root)
            return lists;
        below = above;
        above = cell_offset(upper.record.parent);
    }
    return false;
}

}  // namespace

// A wrong parent in the record alone does no harm and is passed over: a rename that was cut short leaves some.
bool has_other_parent(Store& store, CellOffset parent, const KeyView& key) {
    const uint32_t failed = store.failed_reads;
    return key.offset() == store.root || reaches_root_past(store, parent, key) || store.failed_reads != failed;
}

bool belongs_elsewhere(Store& store, CellOffset parent, const SubkeyIndex& index, const KeyView& key) {
    const uint32_t failed = store.failed_reads;
    return times_listed(store, index, key.offset()) > 1 || store.failed_reads != failed ||
           has_other_parent(store, parent, key);
}

}  // namespace engine
