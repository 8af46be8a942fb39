// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// One of every change that the engine makes, each on a hive laid out for it, and what a hive holds as the engine shows it.
#pragma once

#include "scene.h"

#include <functional>
#include <map>
#include <string>
#include <vector>

namespace testkit {

struct Operation {
    std::string name;
    std::function<int32_t(RegistryKey* root)> run;
    // What the call names, as keys of a Contents begin: everything else must stay as it is.
    std::vector<std::string> named;
};

// A hive with an index of each kind, for the operations to work on.
HiveLayout operation_layout(Leaf leaf);
std::vector<Operation> operations();

// "PATH" for every key, "PATH|NAME" with type and data for every value.
using Contents = std::map<std::string, std::string>;

// Reads the whole hive through the engine. Empty, with why set, when it does not open or something in it cannot be read.
Contents contents(const Bytes& bytes, std::string& why);

// What is not as it was, among what the operation does not name; and, unless after is null, what it does name that is
// neither as before nor as after nor absent. Empty when all is well.
std::string harm(const Operation& operation, const Contents& before, const Contents* after, const Bytes& bytes);

} // namespace testkit
