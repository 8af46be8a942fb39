// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// The "regf" layout as the engine uses it: every record as a struct of little-endian fields, copied by value.
#pragma once

#include <cstddef>
#include <cstdint>

namespace engine {

// Little-endian fields of alignment 1, so that a record has the file's layout on any machine.
struct Le16 {
    uint8_t bytes[2];

    constexpr operator uint16_t() const { return static_cast<uint16_t>(bytes[0] | bytes[1] << 8); }
    constexpr Le16& operator=(uint16_t n) {
        bytes[0] = static_cast<uint8_t>(n);
        bytes[1] = static_cast<uint8_t>(n >> 8);
        return *this;
    }
};

struct Le32 {
    uint8_t bytes[4];

    constexpr operator uint32_t() const {
        return static_cast<uint32_t>(bytes[0]) | static_cast<uint32_t>(bytes[1]) << 8 |
               static_cast<uint32_t>(bytes[2]) << 16 | static_cast<uint32_t>(bytes[3]) << 24;
    }
    constexpr Le32& operator=(uint32_t n) {
        bytes[0] = static_cast<uint8_t>(n);
        bytes[1] = static_cast<uint8_t>(n >> 8);
        bytes[2] = static_cast<uint8_t>(n >> 16);
        bytes[3] = static_cast<uint8_t>(n >> 24);
        return *this;
    }
};

// The place of a cell, in bytes from the start of the first bin. Never to be mixed with a position in the file, which
// is a plain int64_t here.
enum class CellOffset : int32_t { none = -1 };

constexpr CellOffset cell_offset(uint32_t raw) { return static_cast<CellOffset>(static_cast<int32_t>(raw)); }
constexpr uint32_t raw(CellOffset offset) { return static_cast<uint32_t>(offset); }

constexpr uint32_t base_block_size = 4096;  // the first bin begins here
constexpr uint32_t bin_header_size = 32;
constexpr uint32_t bin_alignment = 4096;
constexpr uint32_t cell_head_size = 4;  // the signed size word in front of every record
constexpr uint32_t cell_alignment = 8;

constexpr int64_t cell_position(CellOffset offset) { return int64_t{base_block_size} + static_cast<int32_t>(offset); }
constexpr int64_t record_position(CellOffset offset) { return cell_position(offset) + cell_head_size; }

// Signatures as they read in little-endian order: one above 32766 stands in four bytes, the others in two.
constexpr uint32_t signature2(char a, char b) {
    return static_cast<uint32_t>(static_cast<uint8_t>(a)) | static_cast<uint32_t>(static_cast<uint8_t>(b)) << 8;
}
constexpr uint32_t signature4(char a, char b, char c, char d) { return signature2(a, b) | signature2(c, d) << 16; }
constexpr uint32_t sig_none = 0;
constexpr uint32_t sig_base = signature4('r', 'e', 'g', 'f');
constexpr uint32_t sig_bin = signature4('h', 'b', 'i', 'n');
constexpr uint32_t sig_key = signature2('n', 'k');
constexpr uint32_t sig_value = signature2('v', 'k');
constexpr uint32_t sig_security = signature2('s', 'k');
constexpr uint32_t sig_big_data = signature2('d', 'b');
constexpr uint32_t sig_fast_leaf = signature2('l', 'f');
constexpr uint32_t sig_hash_leaf = signature2('l', 'h');
constexpr uint32_t sig_index_leaf = signature2('l', 'i');
constexpr uint32_t sig_index_root = signature2('r', 'i');
constexpr uint32_t largest_short_signature = 32766;

constexpr bool is_leaf_signature(uint32_t signature) {
    return signature == sig_fast_leaf || signature == sig_hash_leaf || signature == sig_index_leaf;
}

struct BaseBlock {
    Le32 signature;
    uint8_t before_root[32];
    Le32 root;       // cell offset of the root key
    Le32 bins_size;  // bytes of all bins together
    uint8_t rest[464];
    Le32 checksum;
};
static_assert(sizeof(BaseBlock) == 512);
static_assert(offsetof(BaseBlock, root) == 36);
static_assert(offsetof(BaseBlock, bins_size) == 40);
static_assert(offsetof(BaseBlock, checksum) == 508);

struct BinHeader {
    Le32 signature;
    Le32 offset;  // of this bin, from the first bin
    Le32 size;    // header included
    uint8_t reserved[16];
    Le32 spare;  // in the first bin: the size of all bins
};
static_assert(sizeof(BinHeader) == bin_header_size);
static_assert(offsetof(BinHeader, offset) == 4);
static_assert(offsetof(BinHeader, size) == 8);
static_assert(offsetof(BinHeader, spare) == 28);

constexpr uint16_t key_is_root = 0x0004;
constexpr uint16_t key_is_link = 0x0010;
constexpr uint16_t key_name_8bit = 0x0020;

struct KeyRecord {
    Le16 signature;
    Le16 flags;
    Le32 time_low;
    Le32 time_high;
    Le32 unused;
    Le32 parent;
    Le32 subkey_count;
    Le32 volatile_count;
    Le32 subkey_index;
    Le32 volatile_index;
    Le32 value_count;
    Le32 value_list;
    Le32 security;
    Le32 class_name;
    Le16 longest_subkey;  // bytes, two a character
    Le16 subtree_flags;   // Windows keeps flags of its own here since Vista; 0 in older hives
    Le32 longest_class;   // bytes
    Le32 longest_value;   // bytes, two a character
    Le32 largest_data;    // bytes
    Le32 work;
    Le16 name_length;   // bytes
    Le16 class_length;  // bytes
};
static_assert(sizeof(KeyRecord) == 76);
static_assert(offsetof(KeyRecord, flags) == 2);
static_assert(offsetof(KeyRecord, time_low) == 4);
static_assert(offsetof(KeyRecord, time_high) == 8);
static_assert(offsetof(KeyRecord, parent) == 16);
static_assert(offsetof(KeyRecord, subkey_count) == 20);
static_assert(offsetof(KeyRecord, subkey_index) == 28);
static_assert(offsetof(KeyRecord, volatile_index) == 32);
static_assert(offsetof(KeyRecord, value_count) == 36);
static_assert(offsetof(KeyRecord, value_list) == 40);
static_assert(offsetof(KeyRecord, security) == 44);
static_assert(offsetof(KeyRecord, class_name) == 48);
static_assert(offsetof(KeyRecord, longest_subkey) == 52);
static_assert(offsetof(KeyRecord, subtree_flags) == 54);
static_assert(offsetof(KeyRecord, longest_class) == 56);
static_assert(offsetof(KeyRecord, longest_value) == 60);
static_assert(offsetof(KeyRecord, largest_data) == 64);
static_assert(offsetof(KeyRecord, work) == 68);
static_assert(offsetof(KeyRecord, name_length) == 72);
static_assert(offsetof(KeyRecord, class_length) == 74);
constexpr uint32_t new_key_work = 0xB2B2B2B2;  // no reader looks at it: it marks the keys made here

constexpr uint16_t value_name_8bit = 0x0001;
constexpr uint32_t data_inline = 0x80000000;
constexpr uint32_t inline_limit = 4;

struct ValueRecord {
    Le16 signature;
    Le16 name_length;  // bytes; 0: the default value
    Le32 size;         // bytes of data, with data_inline
    Le32 data;         // cell offset, or the data itself
    Le32 type;
    Le16 flags;
    Le16 spare;
};
static_assert(sizeof(ValueRecord) == 20);
static_assert(offsetof(ValueRecord, name_length) == 2);
static_assert(offsetof(ValueRecord, size) == 4);
static_assert(offsetof(ValueRecord, data) == 8);
static_assert(offsetof(ValueRecord, type) == 12);
static_assert(offsetof(ValueRecord, flags) == 16);

// The fixed part of a security record; the descriptor follows. Of that the first byte, its revision, is read at most.
struct SecurityRecord {
    Le16 signature;
    Le16 reserved;
    Le32 next;
    Le32 previous;
    Le32 references;
    Le32 descriptor_length;
};
static_assert(sizeof(SecurityRecord) == 20);
static_assert(offsetof(SecurityRecord, next) == 4);
static_assert(offsetof(SecurityRecord, previous) == 8);
static_assert(offsetof(SecurityRecord, references) == 12);
static_assert(offsetof(SecurityRecord, descriptor_length) == 16);

struct BigDataRecord {
    Le16 signature;
    Le16 segment_count;
    Le32 segment_list;
};
static_assert(sizeof(BigDataRecord) == 8);
static_assert(offsetof(BigDataRecord, segment_count) == 2);
static_assert(offsetof(BigDataRecord, segment_list) == 4);
constexpr uint32_t segment_size = 16344;

// Head of every subkey index; a leaf's or root's entries follow.
struct IndexHead {
    Le16 signature;
    Le16 count;
};
static_assert(sizeof(IndexHead) == 4);
static_assert(offsetof(IndexHead, count) == 2);

// An entry of "lf" and "lh"; an "li" leaf and an "ri" root hold the offset alone.
struct LeafEntry {
    Le32 key;
    Le32 hint;  // "lf": first four bytes of the name; "lh": hash of the name
};
static_assert(sizeof(LeafEntry) == 8);
static_assert(offsetof(LeafEntry, hint) == 4);
constexpr uint32_t leaf_limit = 65535;  // entries that a leaf's count can say

constexpr uint32_t depth_limit = 512;  // levels below the root, as Windows allows

}  // namespace engine
