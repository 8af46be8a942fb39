// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Lays a tree of keys and values out as the bytes of a hive file. It shares no code with the engine on
// purpose, so that the sample shows what the engine makes of a file that somebody else wrote.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

struct SampleValue {
    std::string name;  // 8-bit characters; empty for the key's default value
    std::uint32_t type = 0;
    std::vector<std::uint8_t> data;
};

struct SampleKey {
    std::u16string name;  // stored in 8 bits where every character fits, in UTF-16 otherwise
    std::vector<SampleValue> values;
    std::vector<SampleKey> subkeys;  // in any order; the layout sorts them
    std::u16string class_name;

    SampleKey& add(std::u16string subkey_name);
    SampleKey& set(std::string value_name, std::uint32_t type, std::vector<std::uint8_t> data);
    SampleKey& set_text(std::string value_name, const std::u16string& text, std::uint32_t type = 1);
    SampleKey& set_texts(std::string value_name, const std::vector<std::u16string>& texts);
    SampleKey& set_dword(std::string value_name, std::uint32_t number);
    SampleKey& set_qword(std::string value_name, std::uint64_t number);
};

// The bytes of a hive whose root key is this one. file_name is what the base block calls the hive.
std::vector<std::uint8_t> lay_out_hive(SampleKey root, const std::u16string& file_name);
