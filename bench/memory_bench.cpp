// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// What stays allocated while the large hive is open and all of it was visited.
#include "hive_file.h"
#include "scratch_hive.h"
#include "walk.h"

#include "reg_model.h"

#include <benchmark/benchmark.h>

#include <malloc.h>

#include <cstdlib>
#include <memory>

namespace {

// Bytes that malloc has handed out and not got back, its own heads included.
double allocated() {
    const struct mallinfo2 now = mallinfo2();
    return static_cast<double>(now.uordblks + now.hblkhd);
}

// The engine alone: the root handle stays open, the others were closed behind the walk.
void EngineMemory(benchmark::State& state) {
    for (auto _ : state) {
        bench::HiveFile file(bench::large_copy().path());
        bench::Walk walk;
        const double before = allocated() - walk.buffers();
        RegistryKey* root = file.open();
        state.counters["openB"] = allocated() - before - walk.buffers();
        walk.key(root);
        state.counters["walkedB"] = allocated() - before - walk.buffers();
        state.counters["fileB"] = static_cast<double>(file.size());
        RCloseKey(root);
    }
}
BENCHMARK(EngineMemory)->Iterations(1)->Unit(benchmark::kMillisecond);

// Counts the keys as a view reaches them.
int64_t visit(const RegModel& model, const QModelIndex& key) {
    int64_t keys = 1;
    for (int row = 0; row < model.rowCount(key); row++)
        keys += visit(model, model.index(row, 0, key));
    return keys;
}

// A hive's objects, with every key visited; the 100 handles that the hive keeps open at most are among them.
void ObjectMemory(benchmark::State& state) {
    for (auto _ : state) {
        RegModel model;
        model.add_hive(QStringLiteral("TOP/HIVE"), QString::fromStdString(bench::large_copy().path()));
        const double before = allocated();
        const auto keys = static_cast<double>(visit(model, model.index(0, 0)));
        state.counters["keys"] = keys;
        state.counters["B/key"] = (allocated() - before) / keys;
    }
}
BENCHMARK(ObjectMemory)->Iterations(1)->Unit(benchmark::kMillisecond);

}  // namespace

BENCHMARK_MAIN();
