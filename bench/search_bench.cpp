// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Searches of a whole hive through the key tree's model, against a plain walk of the same hive through the engine.
#include "hive_file.h"
#include "scratch_hive.h"
#include "sizes.h"
#include "walk.h"

#include "reg_key.h"
#include "reg_model.h"

#include <benchmark/benchmark.h>

#include <cstdlib>

namespace {

void PlainWalk(benchmark::State& state) {
    bench::HiveFile file(bench::large_copy().path());
    RegistryKey* root = file.open();
    bench::Walk walk;
    for (auto _ : state)
        walk.key(root);
    RCloseKey(root);
}
BENCHMARK(PlainWalk)->Unit(benchmark::kMillisecond);

void search_absent(RegModel& model, RegModel::FindMode mode) {
    model.begin_find(model.index(0, 0));
    if (model.find(QStringLiteral("no such name anywhere"), mode, Qt::MatchContains).key.isValid())
        std::abort();
}

// The argument is the mode: keys, values or both. The first search makes the key objects.
void FirstSearch(benchmark::State& state) {
    const auto mode = RegModel::FindMode(static_cast<int>(state.range(0)));
    for (auto _ : state) {
        state.PauseTiming();
        {
            RegModel model;
            model.add_hive(QStringLiteral("TOP/HIVE"), QString::fromStdString(bench::large_copy().path()));
            state.ResumeTiming();
            search_absent(model, mode);
            state.PauseTiming();
        }
        state.ResumeTiming();
    }
}
BENCHMARK(FirstSearch)->Arg(1)->Arg(2)->Arg(3)->Unit(benchmark::kMillisecond);

// The same in a tree whose key objects are there.
void SearchAgain(benchmark::State& state) {
    const auto mode = RegModel::FindMode(static_cast<int>(state.range(0)));
    RegModel model;
    model.add_hive(QStringLiteral("TOP/HIVE"), QString::fromStdString(bench::large_copy().path()));
    search_absent(model, RegModel::FindKeys);
    for (auto _ : state)
        search_absent(model, mode);
}
BENCHMARK(SearchAgain)->Arg(1)->Arg(2)->Arg(3)->Unit(benchmark::kMillisecond);

// One key with as many values as the argument says.
void SearchInOneKey(benchmark::State& state) {
    const auto count = static_cast<int>(state.range(0));
    const bench::ScratchHive hive([&](RegistryKey* root) { bench::make_key_with_values(root, "Key", count); });
    RegModel model;
    model.add_hive(QStringLiteral("TOP/HIVE"), QString::fromStdString(hive.path()));
    for (auto _ : state)
        search_absent(model, RegModel::FindValues);
}
BENCHMARK(SearchInOneKey)->ArgsProduct(bench::sizes({2500, 5000, 10000, 20000}))->Unit(benchmark::kMillisecond);

}  // namespace

BENCHMARK_MAIN();
