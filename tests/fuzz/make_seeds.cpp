// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// make_fuzz_seeds DIRECTORY: lays out the hives that fuzzing starts from, each with a script of changes behind it.
#include "hive_bytes.h"

#include <cstdio>
#include <fstream>
#include <string>

namespace {

using namespace testkit;

void save(const std::string& directory, const std::string& name, const HiveLayout& layout) {
    Bytes bytes = lay_out(layout).bytes;
    for (uint32_t i = 0; i < 64; i++)
        bytes.push_back(static_cast<uint8_t>(i * 37 + name.size()));
    std::ofstream file(directory + "/" + name, std::ios::binary);
    file.write(reinterpret_cast<const char*>(bytes.data()), static_cast<std::streamsize>(bytes.size()));
}

KeyLayout& fill(KeyLayout& key) {
    for (const char* name : {"alpha", "beta", "gamma", "_under"}) {
        KeyLayout& child = key.add(name);
        child.set("", 1, text_data("default"));
        child.set("number", 4, pattern(4));
        child.set("bytes", 3, pattern(60));
        child.add("leaf");
    }
    return key;
}

}  // namespace

int main(int argc, char** argv) {
    if (argc != 2) {
        std::fprintf(stderr, "usage: make_fuzz_seeds DIRECTORY\n");
        return 2;
    }
    const std::string directory = argv[1];
    HiveLayout hash;
    fill(hash.root);
    save(directory, "hash", hash);
    HiveLayout fast;
    fast.leaf = Leaf::fast;
    fill(fast.root).add("wide").wide_name = true;
    save(directory, "fast", fast);
    HiveLayout rooted;
    rooted.root.add("parent").per_leaf = 2;
    fill(rooted.root.children[0]);
    save(directory, "rooted", rooted);
    HiveLayout big;
    ValueLayout& value = big.root.add("key").set("big", 3, pattern(17000));
    value.storage = Storage::big;
    big.security_records = 2;
    save(directory, "big", big);
    HiveLayout plain;
    plain.root.add("parent").own_leaf = true;
    plain.root.children[0].leaf = Leaf::plain;
    fill(plain.root.children[0]).class_name = u"class";
    save(directory, "plain", plain);
    HiveLayout secured;
    secured.security_records = 3;
    KeyLayout& parent = fill(secured.root.add("parent"));
    for (size_t i = 0; i < parent.children.size(); i++)
        parent.children[i].security = i % 3;
    parent.set("wide", 3, pattern(20)).wide_name = true;
    save(directory, "secured", secured);
    // Roots over leaves of the other two kinds.
    HiveLayout fast_rooted;
    fast_rooted.leaf = Leaf::fast;
    fill(fast_rooted.root.add("parent")).per_leaf = 2;
    KeyLayout& plain_rooted = fill(fast_rooted.root.add("plain"));
    plain_rooted.own_leaf = true;
    plain_rooted.leaf = Leaf::plain;
    plain_rooted.per_leaf = 3;
    save(directory, "fast_rooted", fast_rooted);
    return 0;
}
