// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "bytes.h"

#include <fstream>
#include <iterator>
#include <stdexcept>

namespace testkit {

uint32_t base_checksum(const Bytes& bytes) {
    uint32_t sum = 0;
    for (uint32_t position = 0; position < 508; position += 4)
        sum ^= get32(bytes, position);
    if (sum == 0)
        return 1;
    return sum == 0xFFFFFFFF ? 0xFFFFFFFE : sum;
}

std::string hex(const Bytes& bytes) {
    static const char digits[] = "0123456789abcdef";
    std::string text;
    text.reserve(bytes.size() * 2);
    for (uint8_t byte : bytes) {
        text += digits[byte >> 4];
        text += digits[byte & 15];
    }
    return text;
}

std::string utf8(const std::u16string& text) {
    std::string out;
    for (size_t i = 0; i < text.size(); i++) {
        uint32_t code = text[i];
        const bool high = code >= 0xD800 && code < 0xDC00;
        if (high && i + 1 < text.size() && text[i + 1] >= 0xDC00 && text[i + 1] < 0xE000)
            code = 0x10000 + ((code - 0xD800) << 10) + (text[++i] - 0xDC00U);
        else if (code >= 0xD800 && code < 0xE000)
            code = 0xFFFD;
        const auto tail = [&](int shift) { out += static_cast<char>(0x80 | ((code >> shift) & 0x3F)); };
        if (code < 0x80) {
            out += static_cast<char>(code);
        } else if (code < 0x800) {
            out += static_cast<char>(0xC0 | (code >> 6));
            tail(0);
        } else if (code < 0x10000) {
            out += static_cast<char>(0xE0 | (code >> 12));
            tail(6);
            tail(0);
        } else {
            out += static_cast<char>(0xF0 | (code >> 18));
            tail(12);
            tail(6);
            tail(0);
        }
    }
    return out;
}

std::u16string upper(const std::u16string& text) {
    std::u16string out = text;
    for (char16_t& unit : out)
        if (unit >= u'a' && unit <= u'z')
            unit = static_cast<char16_t>(unit - 32);
    return out;
}

std::u16string widen(const std::string& text) {
    std::u16string out;
    for (char c : text)
        out += static_cast<char16_t>(static_cast<unsigned char>(c));
    return out;
}

Bytes read_file(const std::string& path) {
    std::ifstream file(path, std::ios::binary);
    if (!file)
        throw std::runtime_error("cannot read " + path);
    return Bytes(std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>());
}

}  // namespace testkit
