// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Times of the engine, each to be set against another of the same run: against reading the file once, or N against 2N.
#include "hive_file.h"
#include "sizes.h"
#include "walk.h"

#include <benchmark/benchmark.h>

#include <algorithm>
#include <chrono>
#include <memory>
#include <random>
#include <string>
#include <vector>

namespace {

using bench::check;
using bench::Counts;
using bench::HiveFile;
using bench::Walk;

// The hive that whole-file measures are taken on.
std::unique_ptr<HiveFile> open_large() {
    if (!bench::large_hive().empty())
        return std::make_unique<HiveFile>(bench::large_hive());
    auto file = std::make_unique<HiveFile>();
    RegistryKey* root = file->open();
    bench::make_large(root);
    RCloseKey(root);
    return file;
}

HiveFile& large_file() {
    static const std::unique_ptr<HiveFile> file = open_large();
    return *file;
}

void report(benchmark::State& state, const Counts& counts, double operations) {
    state.counters["reads/op"] = static_cast<double>(counts.reads) / operations;
    state.counters["readB/op"] = static_cast<double>(counts.bytes_read) / operations;
    state.counters["writes/op"] = static_cast<double>(counts.writes) / operations;
    state.counters["writtenB/op"] = static_cast<double>(counts.bytes_written) / operations;
}

void ReadFileOnce(benchmark::State& state) {
    HiveFile& file = large_file();
    file.counts = {};
    for (auto _ : state)
        file.read_once();
    report(state, file.counts, static_cast<double>(state.iterations()));
}
BENCHMARK(ReadFileOnce)->Unit(benchmark::kMillisecond);

void OpenHive(benchmark::State& state) {
    HiveFile& file = large_file();
    file.counts = {};
    for (auto _ : state)
        RCloseKey(file.open());
    report(state, file.counts, static_cast<double>(state.iterations()));
}
BENCHMARK(OpenHive)->Unit(benchmark::kMillisecond);

void WalkAll(benchmark::State& state) {
    HiveFile& file = large_file();
    RegistryKey* root = file.open();
    file.counts = {};
    Walk walk;
    for (auto _ : state)
        walk.key(root);
    RCloseKey(root);
    report(state, file.counts, static_cast<double>(state.iterations()));
    state.counters["keys"] = static_cast<double>(walk.keys) / static_cast<double>(state.iterations());
    state.counters["values"] = static_cast<double>(walk.values) / static_cast<double>(state.iterations());
}
BENCHMARK(WalkAll)->Unit(benchmark::kMillisecond);

std::vector<int> shuffled(int count) {
    std::vector<int> numbers(static_cast<size_t>(count));
    for (int i = 0; i < count; i++)
        numbers[static_cast<size_t>(i)] = i;
    std::mt19937 random(1);
    std::shuffle(numbers.begin(), numbers.end(), random);
    return numbers;
}

constexpr int paths_opened = 10000;

std::string key_name(int i) { return "Key number " + std::to_string(i); }

void create_keys(RegistryKey* parent, const std::vector<int>& numbers) {
    for (const int i : numbers) {
        RegistryKey* key = nullptr;
        check(RCreateKey(parent, key_name(i).c_str(), &key, nullptr), "create");
        RCloseKey(key);
    }
}

// The time of one of 10,000 random paths, with as many siblings as the argument says.
void OpenPath(benchmark::State& state) {
    HiveFile file;
    RegistryKey* root = file.open();
    const auto count = static_cast<int>(state.range(0));
    create_keys(root, shuffled(count));
    std::mt19937 random(2);
    std::vector<std::string> wanted;
    for (int i = 0; i < paths_opened; i++)
        wanted.push_back(key_name(std::uniform_int_distribution(0, count - 1)(random)));
    file.counts = {};
    size_t next = 0;
    for (auto _ : state) {
        RegistryKey* key = nullptr;
        check(ROpenKey(root, wanted[next++].c_str(), &key), "open");
        RCloseKey(key);
    }
    report(state, file.counts, static_cast<double>(state.iterations()));
    RCloseKey(root);
}
BENCHMARK(OpenPath)
    ->ArgsProduct(bench::sizes({250, 1000, 4000, 16000}))
    ->Iterations(paths_opened)
    ->Unit(benchmark::kMicrosecond);

// Creates the argument's number of keys under one key, in random order; the time is that of all.
void CreateKeys(benchmark::State& state) {
    const std::vector<int> numbers = shuffled(static_cast<int>(state.range(0)));
    Counts counts;
    for (auto _ : state) {
        state.PauseTiming();
        {
            HiveFile file;
            RegistryKey* root = file.open();
            file.counts = {};
            state.ResumeTiming();
            create_keys(root, numbers);
            state.PauseTiming();
            counts = file.counts;
            RCloseKey(root);
        }
        state.ResumeTiming();
    }
    report(state, counts, static_cast<double>(numbers.size()));
}
BENCHMARK(CreateKeys)->ArgsProduct(bench::sizes({2000, 4000, 8000, 16000}))->Unit(benchmark::kMillisecond);

void set_values(RegistryKey* key, const std::vector<int>& numbers) {
    const uint32_t data = 1;
    for (const int i : numbers)
        check(RSetValueExW(key, ("Value number " + std::to_string(i)).c_str(), 4, &data, sizeof data), "set");
}

void SetValues(benchmark::State& state) {
    const std::vector<int> numbers = shuffled(static_cast<int>(state.range(0)));
    Counts counts;
    for (auto _ : state) {
        state.PauseTiming();
        {
            HiveFile file;
            RegistryKey* root = file.open();
            file.counts = {};
            state.ResumeTiming();
            set_values(root, numbers);
            state.PauseTiming();
            counts = file.counts;
            RCloseKey(root);
        }
        state.ResumeTiming();
    }
    report(state, counts, static_cast<double>(numbers.size()));
}
BENCHMARK(SetValues)->ArgsProduct(bench::sizes({2000, 4000, 8000, 16000}))->Unit(benchmark::kMillisecond);

// What setting a value costs beside the walk over the list for its name: before each call the same walk is made alone,
// and its time taken off. restUs is what is left of one call, in microseconds.
void SetValuesBesideWalk(benchmark::State& state) {
    const std::vector<int> numbers = shuffled(static_cast<int>(state.range(0)));
    const uint32_t data = 1;
    std::chrono::duration<double, std::micro> rest{};
    for (auto _ : state) {
        HiveFile file;
        RegistryKey* root = file.open();
        rest = {};
        for (const int i : numbers) {
            const std::string name = "Value number " + std::to_string(i);
            const auto start = std::chrono::steady_clock::now();
            benchmark::DoNotOptimize(RFindValueA(root, name.c_str()));
            const auto walked = std::chrono::steady_clock::now();
            check(RSetValueExW(root, name.c_str(), 4, &data, sizeof data), "set");
            const auto end = std::chrono::steady_clock::now();
            rest += (end - walked) - (walked - start);
        }
        RCloseKey(root);
    }
    state.counters["restUs"] = rest.count() / static_cast<double>(numbers.size());
}
BENCHMARK(SetValuesBesideWalk)
    ->ArgsProduct(bench::sizes({4000, 8000, 16000}))
    ->Iterations(1)
    ->Unit(benchmark::kMillisecond);

// The walk over a key's value list for a name that is not there; the time is that of all its records.
void FindMissingValue(benchmark::State& state) {
    HiveFile file;
    RegistryKey* root = file.open();
    set_values(root, shuffled(static_cast<int>(state.range(0))));
    file.counts = {};
    for (auto _ : state)
        benchmark::DoNotOptimize(RFindValueA(root, "not there"));
    report(state, file.counts, static_cast<double>(state.iterations()));
    RCloseKey(root);
}
BENCHMARK(FindMissingValue)->ArgsProduct(bench::sizes({4000, 8000, 16000}))->Unit(benchmark::kMicrosecond);

// Creates and deletes keys in turn; grown is by how much the file became longer, in bytes.
void CreateAndDelete(benchmark::State& state) {
    const int count = bench::sized(10000);
    double grown = 0;
    for (auto _ : state) {
        HiveFile file;
        RegistryKey* root = file.open();
        RegistryKey* parent = nullptr;
        check(RCreateKey(root, "Parent", &parent, nullptr), "create");
        const int64_t before = file.size();
        for (int i = 0; i < count; i++) {
            RegistryKey* key = nullptr;
            check(RCreateKey(parent, key_name(i).c_str(), &key, nullptr), "create");
            RCloseKey(key);
            check(RDeleteKey(parent, key_name(i).c_str()), "delete");
        }
        grown = static_cast<double>(file.size() - before);
        RCloseKey(parent);
        RCloseKey(root);
    }
    state.counters["grownB"] = grown;
    state.counters["keys"] = count;
}
BENCHMARK(CreateAndDelete)->Unit(benchmark::kMillisecond)->Iterations(1);

}  // namespace

BENCHMARK_MAIN();
