// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT

// hive_dump FILE: one JSON object a line for every key and value, a key before its values and children.
// hive_dump --diff A B: what tells two hives apart, one line each; status 1 when something does.
// hive_dump --check FILE: the checker's faults, one line each; status 1 when there are any. Leaked cells are
// counted on the last line.
#include "../hive_checker.h"
#include "../hive_reader.h"

#include <cstdio>
#include <cstring>
#include <exception>

using namespace testkit;

namespace {

std::string quoted(const std::u16string& text) {
    std::string out = "\"";
    for (char c : utf8(text)) {
        const auto byte = static_cast<unsigned char>(c);
        char escape[8];
        if (c == '"' || c == '\\') {
            out += '\\';
            out += c;
        } else if (byte < 0x20 || byte == 0x7F) {
            snprintf(escape, sizeof escape, "\\u%04x", byte);
            out += escape;
        } else {
            out += c;
        }
    }
    return out + '"';
}

int dump(const std::string& path) {
    const Hive hive = read_hive(read_file(path));
    for (const FlatKey& flat : flatten(hive)) {
        const std::string where = quoted(flat.path);
        printf("{\"kind\":\"key\",\"path\":%s,\"name\":%s,\"subkeys\":%zu,\"values\":%zu}\n", where.c_str(),
               quoted(flat.key->name).c_str(), flat.key->children.size(), flat.key->values.size());
        for (const Value& value : flat.key->values)
            printf("{\"kind\":\"value\",\"path\":%s,\"name\":%s,\"type\":%u,\"data\":%s}\n", where.c_str(),
                   quoted(value.name).c_str(), value.type,
                   value.readable ? ('"' + hex(value.data) + '"').c_str() : "null");
    }
    for (const std::string& complaint : hive.complaints)
        fprintf(stderr, "%s\n", complaint.c_str());
    return hive.sound_root ? 0 : 1;
}

int show_diff(const std::string& before, const std::string& after) {
    const std::vector<std::string> lines = diff(read_file(before), read_file(after));
    for (const std::string& line : lines)
        printf("%s\n", line.c_str());
    return lines.empty() ? 0 : 1;
}

int check(const std::string& path) {
    const CheckResult result = check_hive(read_file(path));
    printf("%sleaks: %zu values, %zu keys, %zu others\n", result.text().c_str(), result.leaks.values.size(),
           result.leaks.keys.size(), result.leaks.others.size());
    return result.faults.empty() ? 0 : 1;
}

}  // namespace

int main(int argc, char** argv) {
    try {
        if (argc == 2 && argv[1][0] != '-')
            return dump(argv[1]);
        if (argc == 4 && strcmp(argv[1], "--diff") == 0)
            return show_diff(argv[2], argv[3]);
        if (argc == 3 && strcmp(argv[1], "--check") == 0)
            return check(argv[2]);
    } catch (const std::exception& error) {
        fprintf(stderr, "hive_dump: %s\n", error.what());
        return 2;
    }
    fprintf(stderr, "usage: hive_dump FILE | --diff A B | --check FILE\n");
    return 2;
}
