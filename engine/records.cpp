// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "records.h"

#include <cstdlib>
#include <cstring>

namespace engine {

Block::Block(uint32_t size) : bytes(static_cast<uint8_t*>(malloc(size == 0 ? 1 : size))) {}
Block::~Block() { free(bytes); }

Name KeyView::searchable() const {
    Name whole = {name, kept, wide()};
    if (kept < record.name_length)
        return whole;
    while (!whole.wide && whole.length > 0 && whole.bytes[whole.length - 1] == 0)
        whole.length--;
    return whole;
}

bool read_key(Store& store, CellOffset offset, KeyView& key) {
    if (!find_used_cell(store, offset, key.cell))
        return false;
    // Record and name lie together at the head of the view, so one read fetches both.
    static_assert(offsetof(KeyView, name) == sizeof(KeyRecord));
    constexpr uint32_t most = sizeof(KeyRecord) + key_name_kept;
    const uint32_t wanted = key.cell.room() < most ? key.cell.room() : most;
    const uint32_t count = read_at(store, sig_key, record_position(offset), &key, wanted);
    if (count < sizeof(KeyRecord))
        return false;
    const uint32_t length = key.record.name_length;
    key.kept = length < key_name_kept ? length : key_name_kept;
    // What the cell has behind the name may be cut off with the file's end.
    return length <= key.cell.room() - sizeof(KeyRecord) && count - sizeof(KeyRecord) >= key.kept;
}

Outcome rewrite_key(Store& store, CellOffset offset, KeyRecord& key, const KeyRecord& changed) {
    if (memcmp(&key, &changed, sizeof key) == 0)
        return Outcome::written;
    const Outcome outcome = rewrite_at(store, record_position(offset), &changed, &key, sizeof key);
    if (outcome == Outcome::written)
        key = changed;
    return outcome;
}

bool read_value(Store& store, CellOffset offset, ValueView& value) {
    return find_used_cell(store, offset, value.cell) && value.cell.room() >= sizeof(ValueRecord) &&
           read_at(store, sig_value, record_position(offset), &value.record, sizeof value.record) ==
               sizeof value.record &&
           value.record.name_length <= value.cell.room() - sizeof(ValueRecord);
}

Outcome rewrite_value(Store& store, const ValueView& value, const ValueRecord& changed) {
    return rewrite_at(store, record_position(value.cell.offset), &changed, &value.record, sizeof changed);
}

namespace {

// Compares the first length bytes of the stored name; buffer has room for them.
Named compare_name(Store& store, const ValueView& value, const Name& name, uint32_t length, uint8_t* buffer) {
    if (!read_part(store, value.cell, sizeof(ValueRecord), buffer, length))
        return Named::unreadable;
    if (!same_name(name, {buffer, length, value.wide()}))
        return Named::otherwise;
    return length == value.record.name_length ? Named::so : Named::begun;
}

}  // namespace

Named compare_value(Store& store, CellOffset offset, const Name& name, bool tell_begun, ValueView& value) {
    if (!read_value(store, offset, value))
        return Named::unreadable;
    uint32_t length = value.record.name_length;
    if (value.name_characters() != name.characters()) {
        uint8_t behind = 0;
        if (!tell_begun || value.wide() || length < name.length)
            return Named::otherwise;
        if (!read_part(store, value.cell, static_cast<uint32_t>(sizeof(ValueRecord)) + name.length, &behind, 1))
            return Named::unreadable;
        if (behind != 0)
            return Named::otherwise;
        length = name.length;
    }
    uint8_t few[512];
    if (length <= sizeof few)
        return compare_name(store, value, name, length, few);
    const Block many(length);
    if (many.bytes == nullptr) {
        store.failed_reads++;
        return Named::unreadable;
    }
    return compare_name(store, value, name, length, many.bytes);
}

namespace {

// The signature of the record in the cell that an offset leads to, 0 where it leads to none.
uint32_t signature_at(Store& store, CellOffset offset) {
    Cell cell;
    Le16 signature;
    if (!find_used_cell(store, offset, cell) || !read_part(store, cell, 0, &signature, sizeof signature))
        return 0;
    return signature;
}

// One of an index's first entries leads to a key, a root's to a leaf.
bool is_index_record(Store& store, const Cell& cell, const IndexHead& head) {
    constexpr uint32_t few = 16;
    Le32 entries[2 * few];
    const uint32_t per_entry = head.signature == sig_index_leaf || head.signature == sig_index_root ? 1 : 2;
    const uint32_t in_cell = (cell.room() - static_cast<uint32_t>(sizeof head)) / (per_entry * 4);
    uint32_t count = head.count < in_cell ? head.count : in_cell;
    count = count < few ? count : few;
    if (!read_part(store, cell, sizeof head, entries, count * per_entry * 4))
        return false;
    for (uint32_t i = 0; i < count; i++) {
        const uint32_t below = signature_at(store, cell_offset(entries[i * per_entry]));
        if (head.signature == sig_index_root ? is_leaf_signature(below) : below == sig_key)
            return true;
    }
    return false;
}

// It has a neighbour in the ring, or a descriptor of the only revision there is.
bool is_security_record(Store& store, const Cell& cell) {
    SecurityRecord record;
    if (!read_part(store, cell, 0, &record, sizeof record))
        return false;
    if (signature_at(store, cell_offset(record.next)) == sig_security ||
        signature_at(store, cell_offset(record.previous)) == sig_security)
        return true;
    uint8_t revision = 0;
    return record.descriptor_length > 0 && record.descriptor_length <= cell.room() - sizeof record &&
           read_part(store, cell, sizeof record, &revision, sizeof revision) && revision == 1;
}

bool is_value_record(Store& store, const Cell& cell) {
    ValueView value;
    Cell data;
    return read_value(store, cell.offset, value) && (value.record.flags <= value_name_8bit || value.is_inline() ||
                                                     find_used_cell(store, cell_offset(value.record.data), data));
}

// Every key but a root has a name.
bool is_key_record(Store& store, const Cell& cell) {
    KeyView key;
    return read_key(store, cell.offset, key) &&
           (key.record.name_length > 0 || signature_at(store, cell_offset(key.record.parent)) == sig_key);
}

bool has_form_of_record(Store& store, const Cell& cell) {
    IndexHead head;
    if (!read_part(store, cell, 0, &head, sizeof head))
        return false;
    switch (head.signature) {
    case sig_key:
        return is_key_record(store, cell);
    case sig_value:
        return is_value_record(store, cell);
    case sig_security:
        return is_security_record(store, cell);
    case sig_index_root:
        return is_index_record(store, cell, head);
    default:
        return is_leaf_signature(head.signature) && is_index_record(store, cell, head);
    }
}

}  // namespace

bool is_root_or_its_index(Store& store, CellOffset offset) {
    KeyView root;
    // Where the root cannot be read now, nobody knows.
    return offset == store.root || !read_key(store, store.root, root) ||
           offset == cell_offset(root.record.subkey_index);
}

bool is_record(Store& store, const Cell& cell) {
    const uint32_t failed = store.failed_reads;
    return is_root_or_its_index(store, cell.offset) || has_form_of_record(store, cell) || store.failed_reads != failed;
}

}  // namespace engine
