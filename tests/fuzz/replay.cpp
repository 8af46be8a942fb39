// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// fuzz_replay walk|edit DIRECTORY: runs every kept input through a target.
#include "fuzz_hive.h"

#include <cstdio>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <vector>

int main(int argc, char** argv) {
    if (argc != 3 || (std::strcmp(argv[1], "walk") != 0 && std::strcmp(argv[1], "edit") != 0)) {
        std::fprintf(stderr, "usage: fuzz_replay walk|edit DIRECTORY\n");
        return 2;
    }
    const auto target = std::strcmp(argv[1], "walk") == 0 ? fuzz::walk_input : fuzz::edit_input;
    size_t inputs = 0;
    for (const auto& entry : std::filesystem::directory_iterator(argv[2])) {
        std::ifstream file(entry.path(), std::ios::binary);
        const std::vector<char> bytes((std::istreambuf_iterator<char>(file)), std::istreambuf_iterator<char>());
        std::printf("%s\n", entry.path().filename().c_str());
        std::fflush(stdout);
        target(reinterpret_cast<const uint8_t*>(bytes.data()), bytes.size());
        inputs++;
    }
    std::printf("%zu inputs\n", inputs);
    return inputs > 0 ? 0 : 1;
}
