// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// A key's subkey index as one flat list over its leaves: entries by position, keys by name.
#pragma once

#include "records.h"

namespace engine {

struct Leaf {
    Cell cell;
    uint32_t signature;
    uint32_t count;  // entries, at most what the cell can hold
    uint32_t first;  // position of the first entry in the whole index

    uint32_t entry_size() const { return signature == sig_index_leaf ? sizeof(Le32) : sizeof(LeafEntry); }
    uint32_t used() const { return static_cast<uint32_t>(sizeof(IndexHead)) + count * entry_size(); }
};

// Offsets that lie side by side in an index or a list, read together: a caller that goes from one item to the next
// then reads the items' records without coming back to the list for each, which the one window would have to follow.
struct OffsetBatch {
    static constexpr uint32_t most = 32;

    uint32_t first;  // position of the first one
    uint32_t count;
    CellOffset offsets[most];

    bool holds(uint32_t position) const { return position >= first && position - first < count; }
};

// What one index held when it was read. Nothing in it outlives a write: see generation.
struct SubkeyIndex {
    Cell cell;  // the key's own index: a leaf, or a root over leaves
    bool is_root;
    bool whole;      // every count was one that its cell can hold, every leaf a leaf
    uint32_t total;  // entries of all leaves
    uint32_t leaf_count;
    uint32_t generation;  // the store's when the index was read; one less where it is to be read again
    Leaf* leaves;         // null for a single leaf, which then stands in only
    Leaf only;

    const Leaf& leaf(uint32_t i) const { return leaves != nullptr ? leaves[i] : only; }
};

// Reads the heads of an index and its leaves. false when memory ran out. A damaged index is cut to what can be relied
// on, and not whole. The leaves are freed with free_index.
bool load_index(Store& store, CellOffset offset, SubkeyIndex& index);
void free_index(SubkeyIndex& index);
// The same for the index of a key's record: an empty whole one where the key has no subkeys.
bool load_key_index(Store& store, const KeyRecord& key, SubkeyIndex& index);

// Whether the entries of a leaf are read: it is an "li", or of the hive's kind.
bool is_read(const Store& store, const Leaf& leaf);
// Which leaf holds a position; the last one for a position at the end. The index must have a leaf.
uint32_t leaf_holding(const SubkeyIndex& index, uint32_t position);
// The key offsets of up to most entries from a position on, as far as its leaf goes; returns how many were read.
uint32_t subkeys_at(Store& store, const SubkeyIndex& index, uint32_t position, CellOffset* offsets, uint32_t most);
// The key offset at a position; none when it cannot be read.
CellOffset subkey_at(Store& store, const SubkeyIndex& index, uint32_t position);

// The same for a caller that goes through the positions in turn, with a batch that was empty at first.
CellOffset subkey_at(Store& store, const SubkeyIndex& index, uint32_t position, OffsetBatch& batch);

// absent is said only when every entry that could be the name was read.
enum class Lookup { found, absent, unreadable };

using NameOrder = int (*)(const Name& searched, const Name& stored);

// Finds a subkey by name in whatever order the list stands. The given order comes first: it is the one by which other
// writers of hives find their way, so where a list has two keys of one name, the one that they would meet is met. Then
// upper-cased order, in which Windows keeps its lists; then each entry, unless the list of this key (its offset is
// parent) is known to be in upper-cased order. found: position and key are set, and the device failed no read on the
// way.
Lookup find_subkey(Store& store, const SubkeyIndex& index, CellOffset parent, const Name& name, NameOrder order,
                   uint32_t& position, KeyView& key);
// Where upper-cased order wants a new name. false when a record on the way cannot be read.
bool place_for_name(Store& store, const SubkeyIndex& index, const Name& name, uint32_t& position);

}  // namespace engine
