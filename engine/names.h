// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Names: the compares that the indexes rest on, the hints in their leaves, and the conversions through the hooks.
#pragma once

#include "format.h"

namespace engine {

// A name as it stands in memory or in a record: 8-bit characters or UTF-16 units. Does not own the bytes.
struct Name {
    const uint8_t* bytes;
    uint32_t length;  // bytes
    bool wide;

    uint32_t characters() const { return wide ? length / 2 : length; }
    uint16_t unit(uint32_t i) const;  // widened through mb2wc_ptr where it is 8 bits
};

Name name_of(const char* text);

// Longest key name, in bytes, that a path can lead to: longer components are cut there, longer names not stored.
constexpr uint32_t longest_key_name = 259;

char upper(char c);

// The order in which a path is followed: upper-cased through toupper_ptr, characters as signed 8-bit numbers (so bytes
// above 0x7F come before all ASCII). A stored UTF-16 name takes its place by its units instead.
int compare_signed(const Name& searched, const Name& stored);
// The order in which a name to be made is looked for: lower-cased as strncasecmp does in the C locale, unsigned.
int compare_index(const Name& searched, const Name& stored);
// The order in which Windows keeps its lists, as far as 8 bits tell: upper-cased units, unsigned. Two 8-bit names are
// compared as bytes; beside a UTF-16 name an 8-bit one is widened.
int compare_upper(const Name& a, const Name& b);
// Whether compare_upper finds no difference.
bool same_name(const Name& a, const Name& b);

// What a leaf of this kind ("lf" or "lh") holds beside a key's offset.
uint32_t leaf_hint(uint32_t leaf_signature, const Name& name);

// Conversions through the hooks: in place, or from src to dst, until the terminating zero or count characters,
// whichever is first. They return the number of characters converted, the zero not among them.
uint32_t convert_in_place(char (*hook)(char), char* text, uint32_t count);
uint32_t narrow(const uint8_t* src, char* dst, uint32_t count);
uint32_t widen(const uint8_t* src, uint8_t* dst, uint32_t count);

}  // namespace engine
