// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "subkey_index.h"

#include <cassert>
#include <cstdlib>
#include <cstring>

namespace engine {

namespace {

// The smallest cell that a key record can lie in bounds how many keys a hive can list.
uint32_t most_keys(const Store& store) {
    return static_cast<uint32_t>(store.bins_size) / (sizeof(KeyRecord) + cell_head_size);
}

// Reads one leaf's head into leaf; false when it is no leaf. whole goes false when its count is more than fits.
bool read_leaf(Store& store, CellOffset offset, Leaf& leaf, bool& whole) {
    IndexHead head;
    if (!find_used_cell(store, offset, leaf.cell) || !read_part(store, leaf.cell, 0, &head, sizeof head) ||
        !is_leaf_signature(head.signature))
        return false;
    leaf.signature = head.signature;
    leaf.count = head.count;
    const uint32_t capacity = (leaf.cell.room() - static_cast<uint32_t>(sizeof head)) / leaf.entry_size();
    if (leaf.count > capacity) {
        leaf.count = capacity;
        whole = false;
    }
    return true;
}

// How many leaves an index may have beyond one for each key: a damaged root may lead to one empty leaf over and over.
constexpr uint32_t most_empty_leaves = 256;

// Adds a leaf's entries to the index; false when that would be more, or more leaves, than a hive can hold.
bool count_leaf(const Store& store, SubkeyIndex& index, Leaf& leaf) {
    if (leaf.count > most_keys(store) - index.total || index.leaf_count >= index.total + most_empty_leaves)
        return false;
    leaf.first = index.total;
    index.total += leaf.count;
    index.leaf_count++;
    return true;
}

// Reads as many of a root's count entries as there is room for, from the i-th on; where the file ends among them, only
// one. Returns how many were read.
template <uint32_t room>
uint32_t read_entries(Store& store, const Cell& root, uint32_t i, uint32_t count, Le32 (&entries)[room]) {
    const uint32_t rest = count - i < room ? count - i : room;
    const auto skip = static_cast<uint32_t>(sizeof(IndexHead) + i * sizeof entries[0]);
    if (read_part(store, root, skip, entries, rest * static_cast<uint32_t>(sizeof entries[0])))
        return rest;
    return read_part(store, root, skip, entries, sizeof entries[0]) ? 1 : 0;
}

bool load_root(Store& store, uint32_t claimed, SubkeyIndex& index) {
    const uint32_t capacity =
        (index.cell.room() - static_cast<uint32_t>(sizeof(IndexHead))) / static_cast<uint32_t>(sizeof(Le32));
    const uint32_t count = claimed < capacity ? claimed : capacity;
    index.is_root = true;
    index.whole = count == claimed && count > 0;
    if (count == 0)
        return true;
    const uint32_t room = most_keys(store) + most_empty_leaves;
    index.leaves = static_cast<Leaf*>(malloc((count < room ? count : room) * sizeof(Leaf)));
    if (index.leaves == nullptr)
        return false;
    // Many entries at a time, or the window would go to and fro between the root and the leaves.
    Le32 entries[256];
    uint32_t held = 0;
    for (uint32_t i = 0, first = 0; i < count && index.leaf_count < room; i++) {
        if (i == first + held) {
            first = i;
            held = read_entries(store, index.cell, i, count, entries);
        }
        Leaf& leaf = index.leaves[i];
        if (held == 0 || !read_leaf(store, cell_offset(entries[i - first]), leaf, index.whole) ||
            !count_leaf(store, index, leaf)) {
            index.whole = false;
            return true;
        }
    }
    index.whole = index.whole && index.leaf_count == count;
    return true;
}

// Searches by halves in one order.
Lookup search_by(Store& store, const SubkeyIndex& index, const Name& name, NameOrder order, uint32_t& position,
                 KeyView& key) {
    int64_t low = 0;
    int64_t high = int64_t{index.total} - 1;
    while (low <= high) {
        const int64_t middle = (low + high) / 2;
        position = static_cast<uint32_t>(middle);
        if (!read_key(store, subkey_at(store, index, position), key))
            return Lookup::unreadable;
        const Name stored = key.searchable();
        if (same_name(name, stored))
            return Lookup::found;
        if (order(name, stored) > 0)
            low = middle + 1;
        else
            high = middle - 1;
    }
    return Lookup::absent;
}

// Looks at every entry. When the list turns out to be in upper-cased order throughout, that is noted in the store.
Lookup search_each(Store& store, const SubkeyIndex& index, CellOffset parent, const Name& name, uint32_t& position,
                   KeyView& key) {
    KeyView other;
    KeyView* current = &key;
    KeyView* previous = &other;
    OffsetBatch batch = {};
    bool complete = index.whole;
    bool sorted = true;
    for (uint32_t i = 0; i < index.total; i++) {
        if (!read_key(store, subkey_at(store, index, i, batch), *current)) {
            complete = false;
            continue;
        }
        if (same_name(name, current->searchable())) {
            position = i;
            if (current != &key)
                key = *current;
            return Lookup::found;
        }
        // While complete, previous is the entry before this one.
        sorted = sorted && complete && (i == 0 || compare_upper(previous->searchable(), current->searchable()) < 0);
        KeyView* next = previous;
        previous = current;
        current = next;
    }
    // Not for an empty list: an old handle may know that of a key whose cell is another's by now.
    if (sorted && complete && index.total > 0)
        store.sorted_key = parent;
    return complete ? Lookup::absent : Lookup::unreadable;
}

Lookup search_in_turn(Store& store, const SubkeyIndex& index, CellOffset parent, const Name& name, NameOrder order,
                      uint32_t& position, KeyView& key) {
    if (store.sorted_key == parent && parent != CellOffset::none) {
        const Lookup lookup = search_by(store, index, name, compare_upper, position, key);
        if (lookup != Lookup::unreadable)
            return lookup;
        store.sorted_key = CellOffset::none;  // an entry that could be read then cannot now
    }
    if (search_by(store, index, name, order, position, key) == Lookup::found ||
        search_by(store, index, name, compare_upper, position, key) == Lookup::found)
        return Lookup::found;
    return search_each(store, index, parent, name, position, key);
}

}  // namespace

bool load_index(Store& store, CellOffset offset, SubkeyIndex& index) {
    index = {};
    index.generation = store.generation;
    IndexHead head;
    if (!find_used_cell(store, offset, index.cell) || !read_part(store, index.cell, 0, &head, sizeof head))
        return true;
    if (head.signature == sig_index_root) {
        if (load_root(store, head.count, index))
            return true;
        index.generation--;  // never taken for current
        return false;
    }
    index.whole = true;
    if (!read_leaf(store, offset, index.only, index.whole) || !count_leaf(store, index, index.only))
        index.whole = false;
    return true;
}

void free_index(SubkeyIndex& index) {
    free(index.leaves);
    index.leaves = nullptr;
}

bool load_key_index(Store& store, const KeyRecord& key, SubkeyIndex& index) {
    if (key.subkey_count != 0)
        return load_index(store, cell_offset(key.subkey_index), index);
    index = {};
    index.generation = store.generation;
    index.whole = true;
    return true;
}

bool is_read(const Store& store, const Leaf& leaf) {
    return leaf.signature == sig_index_leaf || leaf.signature == leaf_signature(store);
}

uint32_t leaf_holding(const SubkeyIndex& index, uint32_t position) {
    assert(index.leaf_count > 0);
    uint32_t low = 0;
    uint32_t high = index.leaf_count - 1;
    while (low < high) {  // the last leaf that begins at or before the position
        const uint32_t middle = low + (high - low + 1) / 2;
        if (index.leaf(middle).first <= position)
            low = middle;
        else
            high = middle - 1;
    }
    return low;
}

uint32_t subkeys_at(Store& store, const SubkeyIndex& index, uint32_t position, CellOffset* offsets, uint32_t most) {
    if (position >= index.total)
        return 0;
    const Leaf& leaf = index.leaf(leaf_holding(index, position));
    if (!is_read(store, leaf))
        return 0;
    const uint32_t size = leaf.entry_size();
    uint32_t entry = position - leaf.first;
    uint32_t read = 0;
    while (read < most && entry < leaf.count) {
        uint8_t bytes[32 * sizeof(LeafEntry)];
        const uint32_t fits = static_cast<uint32_t>(sizeof bytes) / size;
        const uint32_t rest = leaf.count - entry < most - read ? leaf.count - entry : most - read;
        uint32_t count = rest < fits ? rest : fits;
        const uint32_t skip = static_cast<uint32_t>(sizeof(IndexHead)) + entry * size;
        if (!read_part(store, leaf.cell, skip, bytes, count * size)) {
            count = 1;  // the file may end among them
            if (!read_part(store, leaf.cell, skip, bytes, size))
                break;
        }
        for (uint32_t i = 0; i < count; i++) {
            Le32 key;
            memcpy(&key, bytes + i * size, sizeof key);
            offsets[read++] = cell_offset(key);
        }
        entry += count;
    }
    return read;
}

CellOffset subkey_at(Store& store, const SubkeyIndex& index, uint32_t position) {
    CellOffset offset;
    return subkeys_at(store, index, position, &offset, 1) == 1 ? offset : CellOffset::none;
}

CellOffset subkey_at(Store& store, const SubkeyIndex& index, uint32_t position, OffsetBatch& batch) {
    if (!batch.holds(position)) {
        batch.first = position;
        batch.count = subkeys_at(store, index, position, batch.offsets, OffsetBatch::most);
        if (batch.count == 0)
            return CellOffset::none;
    }
    return batch.offsets[position - batch.first];
}

Lookup find_subkey(Store& store, const SubkeyIndex& index, CellOffset parent, const Name& name, NameOrder order,
                   uint32_t& position, KeyView& key) {
    const uint32_t failed = store.failed_reads;
    const Lookup lookup = search_in_turn(store, index, parent, name, order, position, key);
    // Where the device failed, another key of that name may be the one that is met first.
    return lookup == Lookup::found && store.failed_reads != failed ? Lookup::unreadable : lookup;
}

bool place_for_name(Store& store, const SubkeyIndex& index, const Name& name, uint32_t& position) {
    KeyView key;
    uint32_t low = 0;
    uint32_t high = index.total;
    while (low < high) {  // the first entry that is not before the name
        const uint32_t middle = low + (high - low) / 2;
        if (!read_key(store, subkey_at(store, index, middle), key))
            return false;
        if (compare_upper(key.searchable(), name) < 0)
            low = middle + 1;
        else
            high = middle;
    }
    position = low;
    return true;
}

}  // namespace engine
