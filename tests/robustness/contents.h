// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// What a hive holds as the engine shows it, for comparing before with after.
#pragma once

#include "scene.h"

#include <map>
#include <string>

namespace testkit {

// "PATH" for every key, "PATH|NAME" for every value, each with what a Snapshot says of it.
using Contents = std::map<std::string, std::string>;

// Reads a key and all below it through the engine; path is the key's. What cannot be read is told in why,
// which stays empty otherwise.
Contents contents(RegistryKey* key, const std::string& path, std::string& why);
// The same for a whole hive, opened for it. Empty, with why set, when it does not open.
Contents contents(const Bytes& bytes, std::string& why);

}  // namespace testkit
