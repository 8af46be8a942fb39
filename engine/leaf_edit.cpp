// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "leaf_edit.h"

#include "allocator.h"
#include "kinship.h"

#include <cassert>
#include <cstring>

namespace engine {

namespace {

constexpr auto head_size = static_cast<uint32_t>(sizeof(IndexHead));

// A leaf's bytes in memory, with room for one entry more.
struct LeafBytes {
    Block block;
    uint32_t entry_size;
    uint32_t count;

    explicit LeafBytes(const Leaf& leaf)
        : block(leaf.used() + leaf.entry_size()), entry_size(leaf.entry_size()), count(leaf.count) {}

    uint32_t used() const { return head_size + count * entry_size; }
    uint8_t* entry(uint32_t i) { return block.bytes + head_size + i * entry_size; }
    void insert(uint32_t at, const LeafEntry& entry_bytes) {
        assert(at <= count);
        memmove(entry(at + 1), entry(at), (count - at) * entry_size);
        memcpy(entry(at), &entry_bytes, entry_size);
        set_count(count + 1);
    }
    void remove(uint32_t at) {
        assert(at < count);
        memmove(entry(at), entry(at + 1), (count - at - 1) * entry_size);
        set_count(count - 1);
    }
    void set_count(uint32_t n) {
        count = n;
        IndexHead head;
        memcpy(&head, block.bytes, sizeof head);
        head.count = static_cast<uint16_t>(n);
        memcpy(block.bytes, &head, sizeof head);
    }
};

bool read_leaf_bytes(Store& store, const Leaf& leaf, LeafBytes& bytes) {
    return bytes.block.bytes != nullptr && read_part(store, leaf.cell, 0, bytes.block.bytes, leaf.used());
}

LeafEntry entry_for(uint32_t signature, CellOffset key, const Name& name) {
    LeafEntry entry;
    entry.key = raw(key);
    entry.hint = leaf_hint(signature, name);
    return entry;
}

Outcome write_leaf(Store& store, const Leaf& leaf, const LeafBytes& now, const LeafBytes& before) {
    const uint32_t length = now.used() > before.used() ? now.used() : before.used();
    return rewrite_at(store, record_position(leaf.cell.offset), now.block.bytes, before.block.bytes, length);
}

// The leaf that a new entry goes to. At the border of two leaves the second is taken, unless it is full.
uint32_t leaf_for_new(const SubkeyIndex& index, uint32_t position) {
    const uint32_t holding = leaf_holding(index, position);
    const bool at_border = position == index.leaf(holding).first && holding > 0;
    return at_border && index.leaf(holding).count >= leaf_limit ? holding - 1 : holding;
}

// Whether a leaf stands in the index twice, or may be another key's, which its first entry says.
bool is_shared(Store& store, CellOffset parent, const SubkeyIndex& index, uint32_t number) {
    const Leaf& leaf = index.leaf(number);
    for (uint32_t i = 0; i < index.leaf_count; i++) {
        if (i != number && index.leaf(i).cell.offset == leaf.cell.offset)
            return true;
    }
    return leaf.count > 0 && may_be_anothers(store, parent, index, leaf.first);
}

// A longer copy of a leaf, with half as many entries again to spare so that it is not moved for each; none on failure.
CellOffset place_leaf(Store& store, const LeafBytes& bytes) {
    const uint32_t wanted = bytes.count + bytes.count / 2;
    const uint32_t capacity = wanted < leaf_limit ? wanted : leaf_limit;
    const CellOffset cell = allocate(store, head_size + capacity * bytes.entry_size);
    if (cell == CellOffset::none ||
        write_at(store, sig_none, record_position(cell), bytes.block.bytes, bytes.used()) == bytes.used())
        return cell;
    free_cell(store, cell);
    return CellOffset::none;
}

Outcome set_root_entry(Store& store, const SubkeyIndex& index, uint32_t leaf, CellOffset now) {
    Le32 after;
    Le32 before;
    after = raw(now);
    before = raw(index.leaf(leaf).cell.offset);
    const uint32_t skip = head_size + leaf * static_cast<uint32_t>(sizeof after);
    return rewrite_at(store, record_position(index.cell.offset) + skip, &after, &before, sizeof after);
}

// Changes the parent's record back after what followed it failed. The entry is not in the list either way.
Outcome take_back(Store& store, CellOffset parent_offset, KeyRecord& parent, const KeyRecord& before) {
    rewrite_key(store, parent_offset, parent, before);
    return Outcome::unchanged;
}

// The first subkey: into the emptied leaf that the key still has, or into a new one.
Outcome add_first(Store& store, CellOffset parent_offset, KeyRecord& parent, const KeyRecord& changed, CellOffset key,
                  const Name& name) {
    struct {
        IndexHead head;
        LeafEntry entry;
    } bytes;
    bytes.head.signature = static_cast<uint16_t>(leaf_signature(store));
    bytes.head.count = 1;
    bytes.entry = entry_for(leaf_signature(store), key, name);

    SubkeyIndex left = {};
    const CellOffset kept = cell_offset(parent.subkey_index);
    Cell cell;
    if (kept != CellOffset::none && find_used_cell(store, kept, cell) && !load_index(store, kept, left))
        return Outcome::unchanged;
    const bool reusable =
        left.whole && !left.is_root && left.leaf_count == 1 && left.total == 0 && left.cell.room() >= sizeof bytes;
    free_index(left);
    const CellOffset leaf = reusable ? kept : allocate(store, sizeof bytes);
    if (leaf == CellOffset::none)
        return Outcome::unchanged;
    Outcome outcome = Outcome::unchanged;
    if (write_at(store, sig_none, record_position(leaf), &bytes, sizeof bytes) == sizeof bytes) {
        KeyRecord linked = changed;
        linked.subkey_index = raw(leaf);
        outcome = rewrite_key(store, parent_offset, parent, linked);
    }
    if (outcome == Outcome::unchanged && !reusable)
        free_cell(store, leaf);
    else if (outcome == Outcome::unchanged) {
        // Emptied again, so that the leaf can serve the next one.
        bytes.head.count = 0;
        write_at(store, sig_none, record_position(leaf), &bytes.head, sizeof bytes.head);
    }
    return outcome;
}

// Writes a leaf that has grown: in its place, or as a longer copy that the root or the parent then leads to.
Outcome add_to_leaf(Store& store, CellOffset parent_offset, KeyRecord& parent, const KeyRecord& changed,
                    const SubkeyIndex& index, uint32_t number, const LeafBytes& now) {
    const Leaf& leaf = index.leaf(number);
    const KeyRecord unchanged = parent;
    if (leaf.cell.room() >= now.used()) {
        const LeafBytes before(leaf);
        if (before.block.bytes == nullptr || !read_part(store, leaf.cell, 0, before.block.bytes, now.used()))
            return Outcome::unchanged;
        const Outcome counted = rewrite_key(store, parent_offset, parent, changed);
        if (counted != Outcome::written)
            return Outcome::unchanged;
        const Outcome outcome = write_leaf(store, leaf, now, before);
        return outcome == Outcome::unchanged ? take_back(store, parent_offset, parent, unchanged) : outcome;
    }
    const CellOffset longer = place_leaf(store, now);
    if (longer == CellOffset::none)
        return Outcome::unchanged;
    KeyRecord linked = changed;
    if (!index.is_root)
        linked.subkey_index = raw(longer);
    Outcome outcome = rewrite_key(store, parent_offset, parent, linked);
    if (index.is_root && outcome == Outcome::written) {
        outcome = set_root_entry(store, index, number, longer);
        if (outcome == Outcome::unchanged)
            take_back(store, parent_offset, parent, unchanged);
    }
    if (outcome == Outcome::written)
        free_leaf(store, leaf.cell.offset);
    else if (outcome == Outcome::unchanged)
        free_cell(store, longer);
    return outcome;
}

// A root's entries are offsets, as an "li" leaf's are.
Leaf root_as_leaf(const SubkeyIndex& index) {
    Leaf root = {};
    root.cell = index.cell;
    root.signature = sig_index_leaf;
    root.count = index.leaf_count;
    return root;
}

// One entry that goes out of its leaf; an emptied leaf of a root goes out of the root, since no other reader expects
// one. Takes its memory when it is made, so that it can be made before a change that it has to follow.
class Removal {
public:
    Removal(const SubkeyIndex& index, uint32_t position)
        : empties_(index.is_root && index.leaf(leaf_holding(index, position)).count == 1),
          leaf_(index.leaf(leaf_holding(index, position))), list_(empties_ ? root_as_leaf(index) : leaf_),
          at_(empties_ ? leaf_holding(index, position) : position - leaf_.first), now_(list_), before_(list_) {}

    bool has_memory() const { return now_.block.bytes != nullptr && before_.block.bytes != nullptr; }

    // Once. The list must have as many entries as when the removal was made.
    Outcome write(Store& store) {
        if (!is_used_cell(store, list_.cell.offset) || !read_leaf_bytes(store, list_, now_) ||
            !read_leaf_bytes(store, list_, before_))
            return Outcome::unchanged;
        now_.remove(at_);
        // Only the lowered count's worth is written: behind it the old last entry stays.
        const Outcome outcome =
            rewrite_at(store, record_position(list_.cell.offset), now_.block.bytes, before_.block.bytes, now_.used());
        if (empties_ && outcome == Outcome::written)
            free_leaf(store, leaf_.cell.offset);
        return outcome;
    }
    // Puts the entry back in after a write, where that did not empty a leaf.
    Outcome put_back(Store& store) {
        assert(!empties_);
        return rewrite_at(store, record_position(list_.cell.offset), before_.block.bytes, now_.block.bytes,
                          before_.used());
    }

private:
    bool empties_;
    Leaf leaf_;
    Leaf list_;
    uint32_t at_;
    LeafBytes now_;
    LeafBytes before_;
};

// Whether an entry that moves to a place has it in its own leaf.
bool stays_in_leaf(const SubkeyIndex& index, uint32_t position, uint32_t place) {
    const Leaf& leaf = index.leaf(leaf_holding(index, position));
    return place >= leaf.first && place - leaf.first <= leaf.count;
}

Outcome move_within(Store& store, const Leaf& leaf, uint32_t from, uint32_t to, const LeafEntry& entry) {
    LeafBytes now(leaf);
    LeafBytes before(leaf);
    if (!is_used_cell(store, leaf.cell.offset) || !read_leaf_bytes(store, leaf, now) ||
        !read_leaf_bytes(store, leaf, before))
        return Outcome::unchanged;
    now.remove(from);
    now.insert(to > from ? to - 1 : to, entry);
    return write_leaf(store, leaf, now, before);
}

// Takes the entry that leads to a key out of a root's leaves again, one of which may have moved for it.
bool take_back_key(Store& store, CellOffset root, CellOffset key) {
    SubkeyIndex index;
    if (!load_index(store, root, index))
        return false;
    bool done = false;
    for (uint32_t i = 0; index.whole && i < index.total; i++) {
        if (subkey_at(store, index, i) == key) {
            done = Removal(index, i).write(store) == Outcome::written;
            break;
        }
    }
    free_index(index);
    return done;
}

Outcome move_between(Store& store, CellOffset parent_offset, KeyRecord& parent, const SubkeyIndex& index,
                     uint32_t position, uint32_t place, CellOffset key, const Name& name) {
    if (!can_grow(store, parent_offset, index, place))
        return Outcome::unchanged;
    const uint32_t number = leaf_for_new(index, place);
    const Leaf& target = index.leaf(number);
    const KeyRecord before = parent;
    KeyRecord counted = parent;
    counted.subkey_count = counted.subkey_count + 1;
    LeafBytes now(target);
    // The entry leaves another leaf than the one that it goes to, which alone may move before the removal is written.
    Removal removal(index, position);
    if (!is_used_cell(store, target.cell.offset) || !is_used_cell(store, index.cell.offset) || !removal.has_memory() ||
        !read_leaf_bytes(store, target, now))
        return Outcome::unchanged;
    now.insert(place - target.first, entry_for(target.signature, key, name));
    const Outcome outcome = add_to_leaf(store, parent_offset, parent, counted, index, number, now);
    if (outcome != Outcome::written)
        return outcome;
    const Outcome removed = removal.write(store);
    const bool undone = removed == Outcome::unchanged && take_back_key(store, index.cell.offset, key);
    // Tried again where it fails: with a count above its list the key takes no other subkey.
    for (int attempt = 0; attempt < 2 && (removed == Outcome::written || undone); attempt++) {
        if (rewrite_key(store, parent_offset, parent, before) == Outcome::written)
            break;
    }
    return removed == Outcome::unchanged && !undone ? Outcome::unknown : removed;
}

}  // namespace

void free_leaf(Store& store, CellOffset leaf) {
    if (!is_root_or_its_index(store, leaf))
        free_cell(store, leaf);
}

bool can_grow(Store& store, CellOffset parent, const SubkeyIndex& index, uint32_t position) {
    if (index.leaf_count == 0)
        return true;
    const uint32_t number = leaf_for_new(index, position);
    const Leaf& leaf = index.leaf(number);
    return is_read(store, leaf) && leaf.count < leaf_limit && !is_shared(store, parent, index, number);
}

bool can_move(Store& store, CellOffset parent, const SubkeyIndex& index, uint32_t position, uint32_t place) {
    return stays_in_leaf(index, position, place) || can_grow(store, parent, index, place);
}

Outcome add_entry(Store& store, CellOffset parent_offset, KeyRecord& parent, const SubkeyIndex& index,
                  uint32_t position, CellOffset key, const Name& name) {
    KeyRecord changed = parent;
    changed.subkey_count = changed.subkey_count + 1;
    if (2 * name.length > changed.longest_subkey)
        changed.longest_subkey = static_cast<uint16_t>(2 * name.length);
    if (index.total == 0)
        return add_first(store, parent_offset, parent, changed, key, name);
    const uint32_t number = leaf_for_new(index, position);
    const Leaf& leaf = index.leaf(number);
    LeafBytes now(leaf);
    if (!is_used_cell(store, leaf.cell.offset) || !is_used_cell(store, index.cell.offset) ||
        !read_leaf_bytes(store, leaf, now))
        return Outcome::unchanged;
    now.insert(position - leaf.first, entry_for(leaf.signature, key, name));
    return add_to_leaf(store, parent_offset, parent, changed, index, number, now);
}

Outcome remove_entry(Store& store, CellOffset parent_offset, KeyRecord& parent, const SubkeyIndex& index,
                     uint32_t position) {
    if (index.is_root || position >= index.total)
        return Outcome::unchanged;
    Removal removal(index, position);
    const Outcome outcome = removal.write(store);
    if (outcome != Outcome::written)
        return outcome;
    KeyRecord changed = parent;
    changed.subkey_count = changed.subkey_count - 1;
    const Outcome counted = rewrite_key(store, parent_offset, parent, changed);
    if (counted != Outcome::unchanged)
        return counted;
    // The entry goes back in; if it cannot, the leaf stays without it, whole.
    return removal.put_back(store) == Outcome::written ? Outcome::unchanged : Outcome::unknown;
}

Outcome move_entry(Store& store, CellOffset parent_offset, KeyRecord& parent, const SubkeyIndex& index,
                   uint32_t position, uint32_t place, CellOffset key, const Name& name) {
    const Leaf& leaf = index.leaf(leaf_holding(index, position));
    if (stays_in_leaf(index, position, place))
        return move_within(store, leaf, position - leaf.first, place - leaf.first,
                           entry_for(leaf.signature, key, name));
    return move_between(store, parent_offset, parent, index, position, place, key, name);
}

}  // namespace engine
