// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "subkey_change.h"

#include "allocator.h"
#include "kinship.h"
#include "leaf_edit.h"
#include "security.h"

#include <cstring>

namespace engine {

namespace {

// A key's record as it is made under a parent.
KeyRecord new_record(CellOffset parent_offset, const KeyRecord& parent, const Name& name) {
    KeyRecord record = {};
    record.signature = static_cast<uint16_t>(sig_key);
    record.flags = key_name_8bit;
    record.time_low = parent.time_low;
    record.time_high = parent.time_high;
    record.parent = raw(parent_offset);
    record.subkey_index = raw(CellOffset::none);
    record.volatile_index = raw(CellOffset::none);
    record.value_list = raw(CellOffset::none);
    record.security = parent.security;
    // One cell for both keys: nothing in the engine changes or frees a class.
    record.class_name = parent.class_name;
    record.class_length = parent.class_length;
    record.work = new_key_work;
    record.name_length = static_cast<uint16_t>(name.length);
    return record;
}

// Writes a record with its name into a cell of its own; none on failure, nothing then being left allocated.
CellOffset place_key(Store& store, const KeyRecord& record, const Name& name) {
    uint8_t bytes[sizeof record + longest_key_name];
    const auto length = static_cast<uint32_t>(sizeof record) + name.length;
    memcpy(bytes, &record, sizeof record);
    memcpy(bytes + sizeof record, name.bytes, name.length);
    const CellOffset offset = allocate(store, length);
    if (offset == CellOffset::none || write_at(store, sig_key, record_position(offset), bytes, length) == length)
        return offset;
    free_cell(store, offset);
    return CellOffset::none;
}

Inserted insert_into(Store& store, const KeyView& parent, const SubkeyIndex& index, const Name& name,
                     bool new_reference, CellOffset& key) {
    if (name.length == 0 || name.length > longest_key_name)
        return Inserted::failed;
    uint32_t position = 0;
    KeyView found;
    const Lookup lookup = find_subkey(store, index, parent.offset(), name, compare_index, position, found);
    if (lookup == Lookup::found) {
        key = found.offset();
        return Inserted::exists;
    }
    // Where a sibling cannot be read, the name may be there already.
    if (!index.whole || index.total != parent.record.subkey_count || lookup == Lookup::unreadable ||
        (index.total > 0 && may_be_anothers(store, parent.offset(), index, 0)) ||
        !place_for_name(store, index, name, position) || !can_grow(store, parent.offset(), index, position))
        return Inserted::failed;

    const CellOffset security = cell_offset(parent.record.security);
    if (new_reference && !add_security_reference(store, security))
        return Inserted::failed;
    key = place_key(store, new_record(parent.offset(), parent.record, name), name);
    KeyRecord record = parent.record;
    Outcome outcome = Outcome::unchanged;
    if (key != CellOffset::none) {
        outcome = add_entry(store, parent.offset(), record, index, position, key, name);
        if (outcome == Outcome::written)
            return Inserted::created;
        if (outcome == Outcome::unchanged)
            free_cell(store, key);
    }
    if (new_reference && outcome == Outcome::unchanged)
        drop_security_reference(store, security, true);
    return Inserted::failed;
}

// Sets the parent of the first count subkeys of the key at own, but for those that it merely lists. Returns how many
// were seen to.
uint32_t set_parents(Store& store, CellOffset own, const SubkeyIndex& children, uint32_t count, CellOffset parent) {
    OffsetBatch batch = {};
    StrayParents strays;
    for (uint32_t i = 0; i < count; i++) {
        KeyView child;
        const CellOffset offset = subkey_at(store, children, i, batch);
        if (!read_key(store, offset, child))
            return i;
        if (has_other_parent(store, own, child, strays))
            continue;
        KeyRecord changed = child.record;
        changed.parent = raw(parent);
        if (rewrite_key(store, offset, child.record, changed) != Outcome::written)
            return i;
    }
    return count;
}

// Puts the renamed record in the old one's place; both are complete. Every child knows the new one already.
Outcome switch_records(Store& store, KeyView& parent, const SubkeyIndex& index, uint32_t position, const Name& name,
                       uint32_t place, CellOffset renamed) {
    KeyRecord changed = parent.record;
    if (2 * name.length > changed.longest_subkey)
        changed.longest_subkey = static_cast<uint16_t>(2 * name.length);
    if (rewrite_key(store, parent.offset(), parent.record, changed) != Outcome::written)
        return Outcome::unchanged;
    return move_entry(store, parent.offset(), parent.record, index, position, place, renamed, name);
}

int32_t rename_record(Store& store, KeyView& parent, const SubkeyIndex& index, uint32_t position,
                      const SubkeyIndex& children, const KeyView& old, const Name& name) {
    uint32_t place = 0;
    if (!place_for_name(store, index, name, place) || !can_move(store, parent.offset(), index, position, place))
        return R_FAILED;
    KeyRecord record = old.record;
    record.flags = static_cast<uint16_t>(record.flags | key_name_8bit);
    record.name_length = static_cast<uint16_t>(name.length);
    const CellOffset renamed = place_key(store, record, name);
    if (renamed == CellOffset::none)
        return R_FAILED;
    const uint32_t set = set_parents(store, old.offset(), children, children.total, renamed);
    Outcome outcome = Outcome::unchanged;
    if (set == children.total)
        outcome = switch_records(store, parent, index, position, name, place, renamed);
    if (outcome == Outcome::written) {
        // A note about the order of the key's own list goes with it; one about another list, which may have led to the
        // old record as well, does not hold for whatever takes its cell.
        if (store.sorted_key == old.offset())
            store.sorted_key = renamed;
        else if (store.sorted_key != parent.offset())
            store.sorted_key = CellOffset::none;
        free_cell(store, old.offset());
    } else if (outcome == Outcome::unchanged) {
        set_parents(store, old.offset(), children, set, old.offset());
        free_cell(store, renamed);
    }
    return outcome == Outcome::written ? R_SUCCESS : R_CAN_NOT_COMPLETE;
}

}  // namespace

// A new subkey, in turn, and what a stop after each leaves:
//   the security record's count: one too high, which only keeps the record longer;
//   the new record in its cell: out of reach;
//   the entry in the list, see add_entry: the key is there.
Inserted insert_subkey(Store& store, CellOffset parent_offset, const Name& name, bool new_reference, CellOffset& key) {
    KeyView parent;
    SubkeyIndex index;
    if (!read_key(store, parent_offset, parent) || !load_key_index(store, parent.record, index))
        return Inserted::failed;
    const Inserted result = insert_into(store, parent, index, name, new_reference, key);
    free_index(index);
    return result;
}

// A rename, in turn, and what a stop after each leaves:
//   the new record in its cell, the children's parents: out of reach, the key still under its old name;
//   the parent's longest name: an upper bound as before;
//   the entry moved, see move_entry: the key under its new name;
//   the old record's cell freed.
int32_t rename_subkey(Store& store, CellOffset parent_offset, uint32_t position, CellOffset meant, const Name& name) {
    KeyView parent;
    KeyView old;
    SubkeyIndex index = {};
    SubkeyIndex children = {};
    int32_t status = R_CAN_NOT_COMPLETE;
    if (read_key(store, parent_offset, parent) && load_key_index(store, parent.record, index)) {
        KeyView sibling;
        uint32_t sibling_position;
        if (!index.whole || index.total != parent.record.subkey_count || subkey_at(store, index, position) != meant ||
            !read_key(store, meant, old) || belongs_elsewhere(store, parent_offset, index, old) ||
            find_subkey(store, index, parent_offset, name, compare_index, sibling_position, sibling) != Lookup::absent)
            status = R_FAILED;
        else if (load_key_index(store, old.record, children))
            status = children.whole && children.total == old.record.subkey_count
                         ? rename_record(store, parent, index, position, children, old, name)
                         : int32_t{R_FAILED};
    }
    free_index(children);
    free_index(index);
    return status;
}

}  // namespace engine
