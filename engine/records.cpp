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
    if (count != wanted || wanted < sizeof(KeyRecord))
        return false;
    const uint32_t length = key.record.name_length;
    key.kept = length < key_name_kept ? length : key_name_kept;
    return length <= key.cell.room() - sizeof(KeyRecord);
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

// buffer has room for the value's name; null when memory ran out.
Named compare_name(Store& store, const ValueView& value, const Name& name, uint8_t* buffer) {
    const uint32_t length = value.record.name_length;
    if (buffer == nullptr || !read_part(store, value.cell, sizeof(ValueRecord), buffer, length))
        return Named::unreadable;
    return same_name(name, {buffer, length, value.wide()}) ? Named::so : Named::otherwise;
}

}  // namespace

Named compare_value(Store& store, CellOffset offset, const Name& name, ValueView& value) {
    if (!read_value(store, offset, value))
        return Named::unreadable;
    if (value.name_characters() != name.characters())
        return Named::otherwise;
    const uint32_t length = value.record.name_length;
    uint8_t few[512];
    if (length <= sizeof few)
        return compare_name(store, value, name, few);
    const Block many(length);
    return compare_name(store, value, name, many.bytes);
}

bool is_record(Store& store, const Cell& cell) {
    IndexHead head;
    if (!read_part(store, cell, 0, &head, sizeof head))
        return false;
    const uint32_t rest = cell.room() - static_cast<uint32_t>(sizeof head);
    KeyView key;
    ValueView value;
    switch (head.signature) {
    case sig_key:
        return read_key(store, cell.offset, key);
    case sig_value:
        return read_value(store, cell.offset, value);
    case sig_security:
        return cell.room() >= sizeof(SecurityRecord);
    case sig_fast_leaf:
    case sig_hash_leaf:
        return head.count <= rest / sizeof(LeafEntry);
    case sig_index_leaf:
    case sig_index_root:
        return head.count <= rest / sizeof(Le32);
    default:
        return false;
    }
}

}  // namespace engine
