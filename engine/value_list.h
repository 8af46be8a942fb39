// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// The values of one key: its list of value records, finding, storing and removing them.
#pragma once

#include "records.h"

namespace engine {

struct ValueList {
    Cell cell;       // the list's; undefined when there is no list
    uint32_t count;  // as many as the cell can hold, at most the record's own count
    bool whole;      // count is the record's own: the list may be changed
};

// Reads where the key's list lies and what it can hold.
ValueList find_value_list(Store& store, const KeyRecord& key);
// The i-th value record's offset; none when it cannot be read.
CellOffset value_at(Store& store, const ValueList& list, uint32_t i);
// The offsets of up to most value records from the i-th on; returns how many were read.
uint32_t values_at(Store& store, const ValueList& list, uint32_t i, CellOffset* offsets, uint32_t most);
constexpr int32_t no_value = -1;
constexpr int32_t unreadable_value = -2;
// Position of the value of that name, which value then is; no_value when there is none, unreadable_value when there may
// be one among records that cannot be read. begun, when given, receives the position of the first value whose name goes
// on behind a zero byte after that name, or no_value; it is left alone where the name is found or a slot cannot be
// read.
int32_t find_value(Store& store, const ValueList& list, const Name& name, ValueView& value, int32_t* begun = nullptr);

// The same for a name from a call, null being the empty one: the value that has it, else the first whose name it
// begins, unless a record that cannot be read may be the one.
int32_t position_of_value(Store& store, const ValueList& list, const char* name);

struct NewValue {
    Name name;
    uint32_t type;
    const void* data;
    uint32_t size;  // bytes
};

enum class Stored { failed, replaced, added };

// Stores a value in the key and brings key, its record, up to what the file holds.
Stored store_value(Store& store, CellOffset key_offset, KeyRecord& key, const NewValue& value);
// Removes the value at a position of the key's list; brings key up to what the file holds. 0, -1 refused or damaged,
// 8 without memory, 1003 a failed write.
int32_t remove_value(Store& store, CellOffset key_offset, KeyRecord& key, uint32_t position);

}  // namespace engine
