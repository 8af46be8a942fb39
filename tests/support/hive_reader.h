// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Reads a whole hive from its bytes, without the engine: what the tests hold the engine's answers against.
#pragma once

#include "bytes.h"

namespace testkit {

struct Value {
    uint32_t offset = none;  // cell offset of the record
    std::u16string name;     // decoded
    Bytes stored_name;
    bool name_8bit = false;
    uint32_t type = 0;
    uint32_t size = 0;  // stored size without the inline bit
    bool is_inline = false;
    bool readable = false;  // data holds the size's worth of bytes
    Bytes data;             // as stored; segments of big data put together
};

struct Key {
    uint32_t offset = none;  // cell offset of the record
    std::u16string name;     // decoded
    Bytes stored_name;
    bool name_8bit = false;
    uint16_t flags = 0;
    uint32_t parent = none;  // as the record says
    uint64_t time = 0;
    uint32_t security = none;
    std::u16string class_name;
    std::vector<Value> values;  // in list order
    std::vector<Key> children;  // in index order
};

struct Hive {
    bool sound_root = false;  // a root key was read
    Key root;
    std::vector<std::string> complaints;  // what could not be read, one line each

    // The key at a path below the root ("" is the root), names compared with ASCII case ignored; null when
    // not there.
    const Key* find(const std::u16string& path) const;
    const Key* find(const std::string& path) const { return find(widen(path)); }
};

// The value of that name (ASCII case ignored); null when not there.
const Value* find_value(const Key& key, const std::string& name);

// Never crashes, loops or takes more memory than a small multiple of the file's size, whatever the bytes are.
Hive read_hive(const Bytes& bytes);

struct FlatKey {
    std::u16string path;  // "" for the root, "A\B" below
    const Key* key;
};
// Every key of the hive, a key before its children. Points into the hive.
std::vector<FlatKey> flatten(const Hive& hive);

struct Totals {
    size_t keys = 0;  // the root included
    size_t values = 0;
    size_t wide_keys = 0;
};
Totals count(const Hive& hive);

// What tells two hives apart, one line each: "+ key PATH", "- key PATH", "~ key PATH: ...", "+ value PATH :
// NAME ...".
std::vector<std::string> diff(const Hive& before, const Hive& after);
std::vector<std::string> diff(const Bytes& before, const Bytes& after);

}  // namespace testkit
