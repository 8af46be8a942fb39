// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "sizes.h"

#include <cstdlib>
#include <filesystem>

namespace bench {

namespace {

bool is_short() { return std::getenv("TALLOWFEN_BENCH_SHORT") != nullptr; }

}  // namespace

int sized(int count) { return is_short() ? count / 50 : count; }

std::vector<std::vector<int64_t>> sizes(const std::vector<int>& counts) {
    std::vector<int64_t> arguments;
    for (const int count : counts)
        arguments.push_back(sized(count));
    return {arguments};
}

std::string large_hive() {
    if (const char* named = std::getenv("TALLOWFEN_BENCH_HIVE"))
        return named;
    const std::string real = std::string(TALLOWFEN_HIVES) + "/software-7";
    return !is_short() && std::filesystem::exists(real) ? real : std::string();
}

}  // namespace bench
