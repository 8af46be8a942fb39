// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Key and value records: reading them with their names, and writing back their fixed parts.
#pragma once

#include "names.h"
#include "store.h"

namespace engine {

// Bytes of a key's name that a search looks at: 260 units of UTF-16, one more than a component of a path has, so that a
// name that is cut here equals none that can be asked for.
constexpr uint32_t key_name_kept = 520;

// A key record with the beginning of its name.
struct KeyView {
    KeyRecord record;
    uint8_t name[key_name_kept];
    uint32_t kept;  // bytes of the name that are in name
    Cell cell;

    CellOffset offset() const { return cell.offset; }
    bool wide() const { return (record.flags & key_name_8bit) == 0; }
    // The name for compares. Trailing zero bytes of an 8-bit name do not count.
    Name searchable() const;
};

// Reads a key record; false unless record and name lie inside a cell in use.
bool read_key(Store& store, CellOffset offset, KeyView& key);
// Writes the fixed 76 bytes over what the file holds, which is what key says; the name stays. key follows.
Outcome rewrite_key(Store& store, CellOffset offset, KeyRecord& key, const KeyRecord& changed);

// A value record without its name.
struct ValueView {
    ValueRecord record;
    Cell cell;

    uint32_t size() const { return record.size & ~data_inline; }
    bool is_inline() const { return (record.size & data_inline) != 0; }
    bool wide() const { return (record.flags & value_name_8bit) == 0 && record.name_length != 0; }
    uint32_t name_characters() const { return wide() ? record.name_length / 2U : record.name_length; }
};

// Reads a value record; false unless record and name lie inside a cell in use.
bool read_value(Store& store, CellOffset offset, ValueView& value);
// Writes the fixed 20 bytes over what the file holds; the name stays.
Outcome rewrite_value(Store& store, const ValueView& value, const ValueRecord& changed);
// This name; this name, a zero byte and more; another one; nobody knows.
enum class Named { so, begun, otherwise, unreadable };
// Reads the value at an offset and says whether it has this name, case ignored; an empty name is the default value's.
// tell_begun: also whether it is an 8-bit name that goes on behind a zero byte after this one.
Named compare_value(Store& store, CellOffset offset, const Name& name, bool tell_begun, ValueView& value);

// A memory block that frees itself.
struct Block {
    uint8_t* bytes = nullptr;

    Block() = default;
    explicit Block(uint32_t size);  // bytes is null when memory ran out; never null for size 0
    Block(const Block&) = delete;
    Block& operator=(const Block&) = delete;
    ~Block();
};

// Whether the cell holds the root key or the index of its subkeys, without which the hive does not open. Also true
// where the root cannot be read, since nobody knows then.
bool is_root_or_its_index(Store& store, CellOffset offset);

// Whether the cell holds a record, judged by its signature and one more trait. A record that is damaged in another one
// still counts, and the root's two do however they look. Plain data can pass for a record by chance; what takes it for
// another's then merely leaves it alone. Also true where the device fails a read, since nobody knows then.
bool is_record(Store& store, const Cell& cell);

}  // namespace engine
