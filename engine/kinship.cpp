// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "kinship.h"

namespace engine {

namespace {

// A level's record may lie anywhere, and takes about as long to get at as this many entries side by side.
constexpr uint32_t level_in_entries = 256;

// How many entries the ways up from all subkeys of one change may take: some milliseconds' worth, and the hive's size.
bool is_used_up(const Store& store, const StrayParents& strays) {
    return strays.looked_at > (uint64_t{1} << 22) + static_cast<uint32_t>(store.bins_size);
}

bool is_listed(Store& store, const SubkeyIndex& index, CellOffset key, uint64_t& looked_at) {
    OffsetBatch batch = {};
    uint32_t i = 0;
    while (i < index.total && subkey_at(store, index, i, batch) != key)
        i++;
    looked_at += i;
    return i < index.total;
}

// Whether a key lists another. Also true where memory runs out.
bool lists(Store& store, CellOffset above, CellOffset below, uint64_t& looked_at) {
    KeyView upper;
    SubkeyIndex index;
    if (!read_key(store, above, upper))
        return false;
    if (!load_key_index(store, upper.record, index))
        return true;
    looked_at += level_in_entries + index.leaf_count;
    const bool listed = is_listed(store, index, below, looked_at);
    free_index(index);
    return listed;
}

// Whether a key is in the tree: the way up by what the records say leads to the root, each on it listing the one below.
// The records come first, since most strays end there, or go round in a ring: a list takes far longer to look through.
// Also true where that cannot be known.
bool is_reached(Store& store, CellOffset key, uint64_t& looked_at) {
    const uint32_t failed = store.failed_reads;
    CellOffset way[depth_limit];
    uint32_t levels = 0;
    for (CellOffset at = key; levels == 0 || way[levels - 1] != store.root;) {
        KeyView view;
        if (levels == depth_limit || !read_key(store, at, view))
            return store.failed_reads != failed;
        way[levels++] = at;
        looked_at += level_in_entries;
        at = cell_offset(view.record.parent);
    }
    uint32_t level = 1;
    while (level < levels && lists(store, way[level], way[level - 1], looked_at))
        level++;
    return level == levels || store.failed_reads != failed;
}

uint32_t times_listed(Store& store, const SubkeyIndex& index, CellOffset key) {
    OffsetBatch batch = {};
    uint32_t times = 0;
    for (uint32_t i = 0; i < index.total; i++)
        times += subkey_at(store, index, i, batch) == key ? 1U : 0U;
    return times;
}

}  // namespace

// A wrong parent in the record alone does no harm and is passed over: a rename that was cut short leaves some.
bool has_other_parent(Store& store, CellOffset parent, const KeyView& key, StrayParents& strays) {
    const CellOffset above = cell_offset(key.record.parent);
    if (key.offset() == store.root || above == parent)
        return key.offset() == store.root;
    if (is_used_up(store, strays))
        return true;
    const uint32_t failed = store.failed_reads;
    if (strays.last != above) {
        strays.is_reached = is_reached(store, above, strays.looked_at);
        strays.last = above;
    }
    return (strays.is_reached && lists(store, above, key.offset(), strays.looked_at)) || store.failed_reads != failed;
}

bool has_other_parent(Store& store, CellOffset parent, const KeyView& key) {
    StrayParents strays;
    return has_other_parent(store, parent, key, strays);
}

bool may_be_anothers(Store& store, CellOffset parent, const SubkeyIndex& index, uint32_t position) {
    KeyView subkey;
    return !read_key(store, subkey_at(store, index, position), subkey) || has_other_parent(store, parent, subkey);
}

bool belongs_elsewhere(Store& store, CellOffset parent, const SubkeyIndex& index, const KeyView& key) {
    const uint32_t failed = store.failed_reads;
    return times_listed(store, index, key.offset()) > 1 || store.failed_reads != failed ||
           has_other_parent(store, parent, key);
}

}  // namespace engine
