// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "hive_reader.h"

#include <map>

namespace testkit {
namespace {

// A second item of the same name gets its own number, so that none hides another.
using Ordinal = std::pair<std::u16string, int>;

std::map<Ordinal, const Key*> keys_by_path(const Hive& hive) {
    std::map<Ordinal, const Key*> map;
    for (const FlatKey& flat : flatten(hive)) {
        int ordinal = 0;
        while (!map.emplace(Ordinal{flat.path, ordinal}, flat.key).second)
            ordinal++;
    }
    return map;
}

std::map<Ordinal, const Value*> values_by_name(const Key& key) {
    std::map<Ordinal, const Value*> map;
    for (const Value& value : key.values) {
        int ordinal = 0;
        while (!map.emplace(Ordinal{value.name, ordinal}, &value).second)
            ordinal++;
    }
    return map;
}

std::string describe(const Value& value) {
    return " type " + std::to_string(value.type) + " data " + (value.readable ? hex(value.data) : "unreadable");
}

bool same(const Value& a, const Value& b) {
    return a.type == b.type && a.size == b.size && a.readable == b.readable && a.data == b.data &&
           a.name_8bit == b.name_8bit;
}

void add_values(const char* sign, const std::string& path, const Key& key, std::vector<std::string>& lines) {
    for (const Value& value : key.values)
        lines.push_back(std::string(sign) + " value " + path + " : " + utf8(value.name) + describe(value));
}

void compare_values(const std::string& path, const Key& before, const Key& after, std::vector<std::string>& lines) {
    const auto old_values = values_by_name(before);
    const auto new_values = values_by_name(after);
    for (const auto& [name, value] : old_values) {
        const auto now = new_values.find(name);
        const std::string what = " value " + path + " : " + utf8(name.first);
        if (now == new_values.end())
            lines.push_back("-" + what + describe(*value));
        else if (!same(*value, *now->second))
            lines.push_back("~" + what + describe(*value) + " ->" + describe(*now->second));
    }
    for (const auto& [name, value] : new_values)
        if (old_values.find(name) == old_values.end())
            lines.push_back("+ value " + path + " : " + utf8(name.first) + describe(*value));
}

void compare_keys(const std::string& path, const Key& before, const Key& after, std::vector<std::string>& lines) {
    if (before.flags != after.flags || before.time != after.time || before.stored_name != after.stored_name)
        lines.push_back("~ key " + path + ": flags, time or stored name");
    if (before.class_name != after.class_name)
        lines.push_back("~ key " + path + ": class " + utf8(before.class_name) + " -> " + utf8(after.class_name));
    compare_values(path, before, after, lines);
}

}  // namespace

std::vector<std::string> diff(const Hive& before, const Hive& after) {
    std::vector<std::string> lines;
    const auto old_keys = keys_by_path(before);
    const auto new_keys = keys_by_path(after);
    for (const auto& [path, key] : old_keys) {
        const auto now = new_keys.find(path);
        const std::string name = utf8(path.first);
        if (now == new_keys.end()) {
            lines.push_back("- key " + name);
            add_values("-", name, *key, lines);
        } else {
            compare_keys(name, *key, *now->second, lines);
        }
    }
    for (const auto& [path, key] : new_keys) {
        if (old_keys.find(path) != old_keys.end())
            continue;
        lines.push_back("+ key " + utf8(path.first));
        add_values("+", utf8(path.first), *key, lines);
    }
    return lines;
}

std::vector<std::string> diff(const Bytes& before, const Bytes& after) {
    return diff(read_hive(before), read_hive(after));
}

}  // namespace testkit
