// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "scratch_hive.h"

#include "hive_file.h"
#include "sizes.h"
#include "walk.h"

#include <cstdio>
#include <cstdlib>
#include <filesystem>

namespace bench {

namespace {

std::string made_directory() {
    std::string directory = (std::filesystem::temp_directory_path() / "tallowfen-bench.XXXXXX").string();
    if (mkdtemp(directory.data()) == nullptr) {
        std::perror(directory.c_str());
        std::exit(1);
    }
    return directory;
}

}  // namespace

ScratchHive::ScratchHive(const std::string& original) : directory_(made_directory()), path_(directory_ + "/hive") {
    if (original.empty()) {
        make(make_large);
        return;
    }
    std::filesystem::copy_file(original, path_);
    std::filesystem::permissions(path_, std::filesystem::perms::owner_read | std::filesystem::perms::owner_write);
}

ScratchHive::ScratchHive(const std::function<void(RegistryKey* root)>& fill)
    : directory_(made_directory()), path_(directory_ + "/hive") {
    make(fill);
}

ScratchHive::~ScratchHive() {
    std::error_code ignored;
    std::filesystem::remove_all(directory_, ignored);
}

void ScratchHive::make(const std::function<void(RegistryKey* root)>& fill) {
    HiveFile file(path_, HiveFile::Empty);
    RegistryKey* root = file.open();
    fill(root);
    RCloseKey(root);
}

const ScratchHive& large_copy() {
    static const ScratchHive copy(large_hive());
    return copy;
}

}  // namespace bench
