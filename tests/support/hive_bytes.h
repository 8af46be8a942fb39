// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Lays out the bytes of a hive from a description. Shares no code with the engine, so that the two cannot
// agree on one mistake; knows where it put every record, so that a test can damage exactly the field that it
// means.
#pragma once

#include "bytes.h"

#include <map>

namespace testkit {

enum class Storage {
    fitting,  // inline up to 4 bytes, one cell above
    cell,     // a data cell whatever the size
    big,      // a "db" record with segments of 16344 bytes
};

struct ValueLayout {
    std::u16string name;
    uint32_t type = 1;
    Bytes data;
    bool wide_name = false;  // stored in UTF-16
    Storage storage = Storage::fitting;
};

enum class Leaf { fast, hash, plain };  // "lf", "lh", "li"

struct KeyLayout {
    std::u16string name;
    std::vector<ValueLayout> values;
    std::vector<KeyLayout> children;
    bool wide_name = false;  // stored in UTF-16
    uint16_t flags = 0;      // beside 0x20 for an 8-bit name and 0x0C for the root
    uint64_t time = 0x01D0000000000000;
    std::u16string class_name;
    size_t security = 0;    // which of the hive's security records
    bool own_leaf = false;  // leaf, not the hive's kind, holds for this key's index
    Leaf leaf = Leaf::fast;
    size_t per_leaf = 0;  // not 0: an "ri" root over leaves of that many entries
    bool sorted = true;   // children go into the index in upper-cased order, else as given

    // The references hold until the next add or set of the same key.
    KeyLayout& add(const std::string& child_name);
    ValueLayout& set(const std::string& value_name, uint32_t type, const Bytes& data);
};

struct HiveLayout {
    KeyLayout root;
    Leaf leaf = Leaf::hash;
    size_t security_records = 1;
    uint32_t bin_size = 4096;    // least size of a bin; larger where a cell needs it
    bool no_free_space = false;  // the last cell of each bin takes what would be free
    uint32_t free_bytes = 0;     // an extra bin at the end with at least that much free
    Bytes after_bins;            // bytes behind the last bin
    uint32_t first_sequence = 1;
    uint32_t second_sequence = 1;

    HiveLayout() { root.name = u"ROOT"; }
};

struct ValuePlaces {
    uint32_t record = none;
    uint32_t data = none;  // data cell or "db" record
    uint32_t segment_list = none;
    std::vector<uint32_t> segments;
};

struct KeyPlaces {
    uint32_t record = none;
    uint32_t class_cell = none;
    uint32_t value_list = none;
    uint32_t index = none;         // root of the index, or its one leaf
    std::vector<uint32_t> leaves;  // every leaf
    std::vector<ValuePlaces> values;
};

// A laid-out hive. Offsets are cell offsets; a field is counted from the record, 4 bytes into the cell.
struct LaidHive {
    Bytes bytes;
    std::map<std::string, KeyPlaces> keys;  // by path in UTF-8: "" the root, "A\B" below
    std::vector<uint32_t> security;

    const KeyPlaces& at(const std::string& path) const { return keys.at(path); }
    static uint64_t position(uint32_t cell, uint32_t field = 0) { return 4100 + uint64_t{cell} + field; }
    uint16_t get16(uint32_t cell, uint32_t field) const { return testkit::get16(bytes, position(cell, field)); }
    uint32_t get32(uint32_t cell, uint32_t field) const { return testkit::get32(bytes, position(cell, field)); }
    void put16(uint32_t cell, uint32_t field, uint16_t n) { set16(bytes, position(cell, field), n); }
    void put32(uint32_t cell, uint32_t field, uint32_t n) { set32(bytes, position(cell, field), n); }
    int32_t cell_size(uint32_t cell) const {
        return static_cast<int32_t>(testkit::get32(bytes, 4096 + uint64_t{cell}));
    }
    void set_cell_size(uint32_t cell, int32_t size) {
        set32(bytes, 4096 + uint64_t{cell}, static_cast<uint32_t>(size));
    }
    void mark_free(uint32_t cell) { set_cell_size(cell, -cell_size(cell)); }
    // Fields of the base block, by file position; fix_checksum afterwards where it matters.
    void put_base(uint32_t position, uint32_t n) { set32(bytes, position, n); }
    void fix_checksum() { set32(bytes, 508, base_checksum(bytes)); }
};

LaidHive lay_out(const HiveLayout& layout);

// Text as UTF-16 with a final zero, as registry data holds it.
Bytes text_data(const std::string& text);
// n bytes that differ from their neighbours.
Bytes pattern(size_t n, uint8_t seed = 1);

}  // namespace testkit
