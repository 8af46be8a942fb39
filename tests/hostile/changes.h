// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Every kind of change on every key and value that can be reached in a hive, each on a fresh copy of it.
#pragma once

#include "catalogue.h"
#include "snapshot.h"

#include <string>
#include <vector>

namespace hostile {

enum class Kind { create_key, set_value, delete_value, rename_key, rename_damaged_key, delete_key };

struct Change {
    Kind kind;
    std::vector<uint32_t> way;       // to the key that the call is made on
    std::string place;               // of that key
    std::string name;                // 8-bit, as the call takes it
    uint32_t position = 0;           // of the subkey, in a rename
    uint32_t size = 0;               // of the data, in a set
    std::vector<std::string> named;  // the places that the call names

    std::string text() const;
};

// How deep the walk goes that a change is judged by.
constexpr uint32_t judged_depth = 6;
testkit::WalkLimits judged_limits(size_t file_size);

// The time that this process has spent, and how much more a hive of some size may take with any optimisation or
// sanitizer: a microsecond a byte, a few times what it does.
double cpu_seconds();
double most_seconds(uint64_t file_size);

// All changes to what a snapshot shows.
std::vector<Change> changes_to(const testkit::Snapshot& snapshot);

// What the call of a change answers, made on a copy of the bytes.
int32_t status_of(const Bytes& bytes, const Change& change);

// Makes the change on a copy of the case's bytes. What was done to anything that the change does not name,
// what was written where nothing may be, a success that is none; empty when all is well.
// A call of the file that fails meanwhile may be given; struck then tells whether it was reached.
std::string try_change(const Case& hive, const testkit::Snapshot& before, const Change& change,
                       const testkit::MemoryFile::Failure& failure = {}, bool* struck = nullptr);

}  // namespace hostile
