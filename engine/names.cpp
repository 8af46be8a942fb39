// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "names.h"

#include <tallowfen/registry.h>

#include <cstring>

char (*toupper_ptr)(char) = nullptr;
char (*c2ansi_ptr)(char) = nullptr;
char (*c2local_ptr)(char) = nullptr;
char (*wc2mb_ptr)(uint16_t) = nullptr;
uint16_t (*mb2wc_ptr)(char) = nullptr;

namespace engine {

namespace {

uint16_t widened(uint8_t c) { return mb2wc_ptr != nullptr ? mb2wc_ptr(static_cast<char>(c)) : c; }

char narrowed(uint16_t unit) {
    return wc2mb_ptr != nullptr ? wc2mb_ptr(unit) : static_cast<char>(static_cast<uint8_t>(unit));
}

uint16_t upper_unit(const Name& name, uint32_t i) {
    if (name.wide) {
        const uint16_t unit = name.unit(i);
        return unit < 0x80 ? static_cast<uint8_t>(upper(static_cast<char>(unit))) : unit;
    }
    return widened(static_cast<uint8_t>(upper(static_cast<char>(name.bytes[i]))));
}

uint8_t lower_ascii(uint8_t c) { return c >= 'A' && c <= 'Z' ? static_cast<uint8_t>(c + ('a' - 'A')) : c; }

int order(uint32_t a, uint32_t b) { return a < b ? -1 : a > b ? 1 : 0; }

// How the characters of two names at one place compare, upper-cased. Two bytes are compared as such: several may be
// widened to one unit.
int compare_at(const Name& a, const Name& b, uint32_t i) {
    if (a.wide || b.wide)
        return order(upper_unit(a, i), upper_unit(b, i));
    if (a.bytes[i] == b.bytes[i])
        return 0;
    return order(static_cast<uint8_t>(upper(static_cast<char>(a.bytes[i]))),
                 static_cast<uint8_t>(upper(static_cast<char>(b.bytes[i]))));
}

}  // namespace

uint16_t Name::unit(uint32_t i) const {
    if (!wide)
        return widened(bytes[i]);
    return static_cast<uint16_t>(bytes[2 * i] | bytes[2 * i + 1] << 8);
}

Name name_of(const char* text) {
    return {reinterpret_cast<const uint8_t*>(text), static_cast<uint32_t>(strlen(text)), false};
}

char upper(char c) {
    if (toupper_ptr != nullptr)
        return toupper_ptr(c);
    return c >= 'a' && c <= 'z' ? static_cast<char>(c - ('a' - 'A')) : c;
}

int compare_signed(const Name& searched, const Name& stored) {
    if (stored.wide)
        return compare_upper(searched, stored);
    const uint32_t common = searched.length < stored.length ? searched.length : stored.length;
    for (uint32_t i = 0; i < common; i++) {
        const auto a = static_cast<signed char>(upper(static_cast<char>(searched.bytes[i])));
        const auto b = static_cast<signed char>(upper(static_cast<char>(stored.bytes[i])));
        if (a != b)
            return a < b ? -1 : 1;
    }
    return order(searched.length, stored.length);
}

int compare_index(const Name& searched, const Name& stored) {
    if (stored.wide)
        return compare_upper(searched, stored);
    const uint32_t common = searched.length < stored.length ? searched.length : stored.length;
    for (uint32_t i = 0; i < common; i++) {
        const int difference = order(lower_ascii(searched.bytes[i]), lower_ascii(stored.bytes[i]));
        if (difference != 0)
            return difference;
    }
    return order(searched.length, stored.length);
}

int compare_upper(const Name& a, const Name& b) {
    const uint32_t common = a.characters() < b.characters() ? a.characters() : b.characters();
    for (uint32_t i = 0; i < common; i++) {
        const int difference = compare_at(a, b, i);
        if (difference != 0)
            return difference;
    }
    return order(a.characters(), b.characters());
}

bool same_name(const Name& a, const Name& b) {
    if (a.characters() != b.characters())
        return false;
    // From the end: the names under one key often begin alike and differ in a number behind.
    for (uint32_t i = a.characters(); i-- > 0;) {
        if (compare_at(a, b, i) != 0)
            return false;
    }
    return true;
}

uint32_t leaf_hint(uint32_t leaf_signature, const Name& name) {
    if (leaf_signature == sig_hash_leaf) {
        uint32_t hash = 0;
        for (uint32_t i = 0; i < name.length; i++) {
            const auto c = static_cast<signed char>(upper(static_cast<char>(name.bytes[i])));
            hash = hash * 37 + static_cast<uint32_t>(static_cast<int32_t>(c));
        }
        return hash;
    }
    Le32 hint = {};
    memcpy(hint.bytes, name.bytes, name.length < sizeof hint ? name.length : sizeof hint);
    return hint;
}

uint32_t convert_in_place(char (*hook)(char), char* text, uint32_t count) {
    uint32_t done = 0;
    for (; done < count && text[done] != 0; done++) {
        if (hook != nullptr)
            text[done] = hook(text[done]);
    }
    return done;
}

uint32_t narrow(const uint8_t* src, char* dst, uint32_t count) {
    for (uint32_t i = 0; i < count; i++) {
        const auto unit = static_cast<uint16_t>(src[2 * i] | src[2 * i + 1] << 8);
        if (unit == 0)
            return i;
        dst[i] = narrowed(unit);
    }
    return count;
}

uint32_t widen(const uint8_t* src, uint8_t* dst, uint32_t count) {
    for (uint32_t i = 0; i < count; i++) {
        if (src[i] == 0)
            return i;
        const uint16_t unit = widened(src[i]);
        dst[2 * i] = static_cast<uint8_t>(unit);
        dst[2 * i + 1] = static_cast<uint8_t>(unit >> 8);
    }
    return count;
}

}  // namespace engine
