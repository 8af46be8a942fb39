// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Little-endian fields in a vector of bytes, read and written with bounds.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace testkit {

using Bytes = std::vector<uint8_t>;

constexpr uint32_t none = 0xFFFFFFFF;        // a cell offset that leads nowhere
constexpr uint32_t base_block_bytes = 4096;  // where the first bin begins

// Whether n bytes from position lie in bytes.
inline bool holds(const Bytes& bytes, uint64_t position, uint64_t n) {
    return position <= bytes.size() && n <= bytes.size() - position;
}
// A field at a position of the file; 0 where the file does not reach.
inline uint16_t get16(const Bytes& bytes, uint64_t position) {
    if (!holds(bytes, position, 2))
        return 0;
    return static_cast<uint16_t>(bytes[position] | bytes[position + 1] << 8);
}
inline uint32_t get32(const Bytes& bytes, uint64_t position) {
    return get16(bytes, position) | static_cast<uint32_t>(get16(bytes, position + 2)) << 16;
}
// Throws std::out_of_range where the file does not reach.
inline void set16(Bytes& bytes, uint64_t position, uint16_t n) {
    bytes.at(position + 1) = static_cast<uint8_t>(n >> 8);
    bytes[position] = static_cast<uint8_t>(n);
}
inline void set32(Bytes& bytes, uint64_t position, uint32_t n) {
    set16(bytes, position + 2, static_cast<uint16_t>(n >> 16));
    set16(bytes, position, static_cast<uint16_t>(n));
}

// The checksum that belongs over the base block's first 508 bytes.
uint32_t base_checksum(const Bytes& bytes);
// "1a2b" for bytes 0x1A 0x2B.
std::string hex(const Bytes& bytes);
// UTF-16 to UTF-8; an unpaired surrogate becomes U+FFFD.
std::string utf8(const std::u16string& text);
// ASCII letters upper-cased, all else unchanged.
std::u16string upper(const std::u16string& text);
// 8-bit text as units of the same values.
std::u16string widen(const std::string& text);
// A file's bytes; throws std::runtime_error when it cannot be read.
Bytes read_file(const std::string& path);

}  // namespace testkit
