// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// All that a hive holds as the engine's calls show it, sound or damaged, in a form in which two states can be
// compared.
#pragma once

#include "memory_file.h"

#include <compare>

namespace testkit {

// A place is the path of a key ("" the root, "A\B" below), with "|NAME" behind it for a value. What cannot be
// opened or read stands at "PATH\?" or "PATH|?". Places may occur more than once.
struct Item {
    std::string place;
    std::string what;  // class, time and security for a key; type and data, or why there are none, for a value

    auto operator<=>(const Item&) const = default;
};

// A key and the way there: positions in the lists from the root down.
struct FoundKey {
    std::string place;
    std::vector<uint32_t> way;
    std::vector<std::string> values;  // their names, in the order of the list; "?" for one that cannot be read
    std::vector<uint32_t> damaged;    // positions of the subkeys that cannot be opened
};

struct Snapshot {
    std::vector<Item> items;     // sorted
    std::vector<FoundKey> keys;  // in the order of the walk
    size_t unreadable = 0;       // how many items could not be read
    bool complete = true;        // false: a limit ended the walk
};

// What ends a walk over lists that lead round in a ring.
struct WalkLimits {
    uint64_t keys;
    uint64_t values;
    uint64_t data_bytes;
    uint32_t depth;
};

// As many keys and values, and a few times as much data, as a file of that size can hold.
WalkLimits limits_for(size_t file_size);

Snapshot take_snapshot(RegistryKey* root, const WalkLimits& limits);

// Asks for the same things by every call that reads: in 8 bits and 16, by position and by name, and whether
// keys can be deleted.
void ask_everything(RegistryKey* root, const WalkLimits& limits);

// Whether a place is at or below another ("A" covers "A", "A\B" and "A|v"; "A|" covers the values of A
// alone).
bool covers(const std::string& place, const std::string& other);

}  // namespace testkit
