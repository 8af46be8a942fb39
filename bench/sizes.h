// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// How much the benchmarks work on, as the environment that tools/bench sets has it.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace bench {

// A number of keys or values: as given, or a fiftieth where TALLOWFEN_BENCH_SHORT is set. A short run takes seconds
// and shows that everything runs, not how fast.
int sized(int count);

// The same for the arguments of a benchmark, as ArgsProduct takes them.
std::vector<std::vector<int64_t>> sizes(const std::vector<int>& counts);

// The hive that whole-file measures are taken on: the one that TALLOWFEN_BENCH_HIVE names, else software-7 of the
// tests' real ones, which a short run leaves alone. Empty: there is none, and one is to be made.
std::string large_hive();

}  // namespace bench
