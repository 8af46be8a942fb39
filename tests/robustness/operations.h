// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// One of every change that the engine makes, each on a hive laid out for it or chosen from a real one.
#pragma once

#include "contents.h"

#include <functional>
#include <string>
#include <utility>
#include <vector>

namespace testkit {

struct Operation {
    std::string name;
    std::string key;  // path of the key that the call is made on
    std::function<int32_t(RegistryKey* key)> change;
    // The keys ("PATH", with all below) and values ("PATH|NAME") that the call names: all else must stay as
    // it is.
    std::vector<std::string> named;

    // Opens the key and makes the change.
    int32_t run(RegistryKey* root) const;
};

// A change of one kind by name: below the key at path, or of a value of it.
Operation create(const std::string& what, const std::string& path, const std::string& name);
Operation set(const std::string& what, const std::string& path, const std::string& name, uint32_t type, size_t size);
Operation rename(const std::string& what, const std::string& path, const std::string& old_name,
                 const std::string& name);

// A hive with an index of each kind, for the operations to work on.
HiveLayout operation_layout(Leaf leaf);
// Its bytes, with a key whose list has been emptied.
Bytes operation_hive(Leaf leaf);
std::vector<Operation> operations();
// The same kinds of change where any hive has the keys and values for them.
std::vector<Operation> operations_on(const Bytes& hive);

// Copies of the real hives that are small enough to be read some thousand times; prints by count what is left
// out.
std::vector<std::pair<std::string, Bytes>> small_real_hives();

// What is not as it was, among what the operation does not name; and, unless after is null, what it does name
// that is neither as before nor as after nor absent. Empty when all is well.
std::string harm(const Operation& operation, const Contents& before, const Contents* after, const Bytes& bytes);

}  // namespace testkit
