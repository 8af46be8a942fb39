// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "contents.h"

#include "snapshot.h"

namespace testkit {

namespace {

// No list of a hive that these tests make or take leads round in a ring.
constexpr WalkLimits no_limits = {UINT64_MAX, UINT64_MAX, UINT64_MAX, UINT32_MAX};

// A place below the root as one below the key at a path.
std::string placed(const std::string& path, const std::string& place) {
    const bool below = !path.empty() && !place.empty() && place.front() != '|' && place.front() != '\\';
    return below ? path + "\\" + place : path + place;
}

}  // namespace

Contents contents(RegistryKey* key, const std::string& path, std::string& why) {
    Contents all;
    const Snapshot snapshot = take_snapshot(key, no_limits);
    if (snapshot.unreadable > 0)
        why += path + ": " + std::to_string(snapshot.unreadable) + " keys or values cannot be read\n";
    for (const Item& item : snapshot.items) {
        if (!all.emplace(placed(path, item.place), item.what).second)
            why += placed(path, item.place) + " is there twice\n";
    }
    return all;
}

Contents contents(const Bytes& bytes, std::string& why) {
    why.clear();
    MemoryFile file(bytes);
    file.read_only = true;
    const RegistryIo io = file.io();
    RegistryKey* root = ROpenHive(&io);
    if (root == nullptr) {
        why = "the hive does not open";
        return {};
    }
    Contents all = contents(root, "", why);
    if (RCloseKey(root) != R_SUCCESS)
        why += "the hive does not close";
    return all;
}

}  // namespace testkit
