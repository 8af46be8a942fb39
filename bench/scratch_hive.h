// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// A hive in a directory of its own, for what opens a hive by its file's name and may write to it.
#pragma once

#include <functional>
#include <string>

struct RegistryKey;

namespace bench {

// File and directory go with the object.
class ScratchHive {
public:
    // A copy of a hive; of an empty path a made one of some 100,000 keys.
    explicit ScratchHive(const std::string& original);
    // A made one, whose root key the function fills.
    explicit ScratchHive(const std::function<void(RegistryKey* root)>& fill);
    ~ScratchHive();
    ScratchHive(const ScratchHive&) = delete;
    ScratchHive& operator=(const ScratchHive&) = delete;

    const std::string& path() const { return path_; }

private:
    void make(const std::function<void(RegistryKey* root)>& fill);

    std::string directory_;
    std::string path_;
};

// The copy of the large hive that a whole run shares.
const ScratchHive& large_copy();

}  // namespace bench
