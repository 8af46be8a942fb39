// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// The N-th read, write, seek or allocation of a change fails, for every N until none does.
#include "alloc_faults.h"
#include "failure_mode.h"
#include "operations.h"
#include "statuses.h"

#include <gtest/gtest.h>

namespace {

using namespace testkit;
using Call = MemoryFile::Call;

// Changes that need a key's cell, a value's, a list's and a new bin: where each goes shows what the engine
// remembers.
std::vector<int32_t> probe(RegistryKey* root) {
    Handle key;
    std::vector<int32_t> statuses = {RCreateKey(root, "Probe", key.out(), nullptr)};
    for (const uint32_t size : {8U, 60U, 700U, 9000U}) {
        const Bytes data = pattern(size);
        const std::string name = "v" + std::to_string(size);
        statuses.push_back(RSetValueExW(key.get(), name.c_str(), 3, data.data(), size));
    }
    return statuses;
}

struct Expectation {
    Operation operation;
    Bytes start;
    Contents before;
    Contents after;
};

// The operations with what they do undisturbed.
std::vector<Expectation> expectations(const Bytes& start, const std::vector<Operation>& operations) {
    std::vector<Expectation> all;
    for (const Operation& operation : operations) {
        SCOPED_TRACE(operation.name);
        Expectation expected{operation, start, {}, {}};
        std::string why;
        expected.before = contents(start, why);
        EXPECT_EQ(why, "");
        Scene scene(start);
        EXPECT_EQ(operation.run(scene.root()), R_SUCCESS);
        expected.after = contents(scene.bytes(), why);
        EXPECT_EQ(why, "");
        EXPECT_NE(expected.before, expected.after);
        all.push_back(std::move(expected));
    }
    return all;
}

std::vector<Expectation> made_expectations() {
    return expectations(lay_out(operation_layout(Leaf::hash)).bytes, operations());
}

// What is left of the change names the probe too.
Operation with_probe(const Operation& operation) {
    Operation both = operation;
    both.named.push_back("Probe");
    return both;
}

// What the live handles say against what the file says to whoever opens it now.
void compare_with_file(const Expectation& expected, Scene& scene, RegistryKey* handle) {
    std::string why;
    std::string fresh_why;
    EXPECT_EQ(contents(scene.root(), "", why), contents(scene.bytes(), fresh_why)) << why << fresh_why;
    EXPECT_EQ(why, fresh_why);

    Scene fresh(scene.bytes());
    ASSERT_TRUE(fresh.is_open());
    const std::string& path = expected.operation.key;
    const Handle same = fresh.OpenKey(path);
    ASSERT_TRUE(same);
    EXPECT_EQ(contents(handle, path, why), contents(same.get(), path, fresh_why)) << "the handle of the call";
    EXPECT_EQ(why, fresh_why);
}

// Whoever changes the hive next, through the live handles or a fresh opening, stores the same.
void compare_next_changes(const Expectation& expected, Scene& scene) {
    Scene fresh(scene.bytes());
    ASSERT_TRUE(fresh.is_open());
    const std::vector<int32_t> statuses = probe(scene.root());
    EXPECT_EQ(statuses, probe(fresh.root()));
    EXPECT_EQ(statuses, std::vector<int32_t>(statuses.size(), R_SUCCESS)) << "after the failure";
    EXPECT_TRUE(scene.bytes() == fresh.bytes()) << "the next changes go to other places than after a fresh opening";
    EXPECT_EQ(harm(with_probe(expected.operation), expected.before, nullptr, scene.bytes()), "");
}

void check_outcome(const Expectation& expected, Scene& scene, Handle& handle, int32_t status) {
    EXPECT_TRUE(is_in_table(status)) << "status " << status;
    EXPECT_EQ(harm(expected.operation, expected.before, nullptr, scene.bytes()), "");
    if (status == R_SUCCESS) {
        std::string why;
        EXPECT_EQ(contents(scene.bytes(), why), expected.after) << why;
    }
    compare_with_file(expected, scene, handle.get());
    compare_next_changes(expected, scene);
    handle.reset();
    EXPECT_EQ(scene.Close(), R_SUCCESS);
}

// Fails the calls of each change in turn; gives how often one failed.
uint64_t sweep(const std::vector<Expectation>& all, const FailureMode& mode) {
    uint64_t struck_times = 0;
    for (const Expectation& expected : all) {
        for (uint64_t nth = 1;; nth++) {
            SCOPED_TRACE(expected.operation.name + ", call " + std::to_string(nth));
            Scene scene(expected.start);
            Handle handle = scene.OpenKey(expected.operation.key);
            scene.file().arm({mode.call, nth, mode.lasting, mode.shortened});
            const int32_t status = expected.operation.change(handle.get());
            const bool struck = scene.file().failed();
            scene.file().disarm();
            check_outcome(expected, scene, handle, status);
            if (testing::Test::HasFailure())
                return struck_times;
            if (!struck) {
                EXPECT_EQ(status, R_SUCCESS);
                break;
            }
            struck_times++;
        }
    }
    return struck_times;
}

class Faults : public testing::TestWithParam<FailureMode> {};

TEST_P(Faults, NothingElseIsHarmed) {
    const std::vector<Expectation> all = made_expectations();
    EXPECT_GT(sweep(all, GetParam()), all.size());
}

TEST_P(Faults, NothingElseIsHarmedInRealHives) {
    for (const auto& [name, bytes] : small_real_hives()) {
        SCOPED_TRACE(name);
        const std::vector<Expectation> all = expectations(bytes, operations_on(bytes));
        EXPECT_GE(all.size(), 7U);
        EXPECT_GT(sweep(all, GetParam()), all.size());
    }
}

INSTANTIATE_TEST_SUITE_P(Calls, Faults,
                         testing::Values(FailureMode{"ReadOnce", Call::read, false, false},
                                         FailureMode{"ReadFromThereOn", Call::read, true, false},
                                         FailureMode{"ReadShort", Call::read, false, true},
                                         FailureMode{"ReadShortFromThereOn", Call::read, true, true},
                                         FailureMode{"WriteOnce", Call::write, false, false},
                                         FailureMode{"WriteFromThereOn", Call::write, true, false},
                                         FailureMode{"WriteShort", Call::write, false, true},
                                         FailureMode{"WriteShortFromThereOn", Call::write, true, true},
                                         FailureMode{"SeekOnce", Call::seek, false, false},
                                         FailureMode{"SeekFromThereOn", Call::seek, true, false}),
                         [](const auto& mode) { return mode.param.name; });

class AllocationFaultSweep : public testing::TestWithParam<bool> {};

TEST_P(AllocationFaultSweep, NothingElseIsHarmed) {
    uint64_t struck_times = 0;
    for (const Expectation& expected : made_expectations()) {
        for (uint64_t nth = 1;; nth++) {
            SCOPED_TRACE(expected.operation.name + ", allocation " + std::to_string(nth));
            Scene scene(expected.start);
            Handle handle = scene.OpenKey(expected.operation.key);
            int32_t status = 0;
            bool struck = false;
            {
                const AllocationFaults faults(nth, GetParam());
                status = expected.operation.change(handle.get());
                struck = faults.failed();
            }
            check_outcome(expected, scene, handle, status);
            if (HasFailure())
                return;
            if (!struck) {
                EXPECT_EQ(status, R_SUCCESS);
                break;
            }
            struck_times++;
        }
    }
    EXPECT_GT(struck_times, 0U);
}

INSTANTIATE_TEST_SUITE_P(Once, AllocationFaultSweep, testing::Values(false, true),
                         [](const auto& mode) { return mode.param ? "FromThereOn" : "Once"; });

// The walk that follows a write finds out what is free in the bin. When it fails, that is made up for later,
// or the next change would append a bin although there is room.
TEST(FailedWalk, TheBinsFreeSpaceIsUsedAgain) {
    HiveLayout layout;  // all that is free lies in a bin of its own
    layout.root.add("Key").set("inline", 4, pattern(4));
    layout.no_free_space = true;
    layout.free_bytes = 2000;
    for (uint64_t nth = 1;; nth++) {
        SCOPED_TRACE(nth);
        Scene scene(layout);
        const Handle key = scene.OpenKey("Key");
        scene.file().arm({Call::read, nth, true, false});
        const Bytes data = pattern(40);
        RSetValueExW(key.get(), "first", 3, data.data(), 40);
        const bool struck = scene.file().failed();
        scene.file().disarm();
        const size_t size = scene.bytes().size();
        EXPECT_EQ(scene.Set("Key", "second", 3, data), R_SUCCESS);
        EXPECT_EQ(scene.bytes().size(), size);
        if (!struck) {
            EXPECT_GT(nth, 1U);
            break;
        }
    }
}

// A key is made, and then there is no memory to read the parent's list again: the parent's handle shows it
// all the same.
TEST(FailedAllocation, AHandleCountsTheKeyThatItMade) {
    for (uint64_t nth = 1;; nth++) {
        SCOPED_TRACE(nth);
        Scene scene(lay_out(operation_layout(Leaf::hash)).bytes);
        Handle key = scene.OpenKey("Rooted");
        const size_t before = subkey_names(key.get()).size();
        bool struck = false;
        {
            const AllocationFaults faults(nth);
            Handle made;
            RCreateKey(key.get(), "m25", made.out(), nullptr);
            struck = faults.failed();
        }
        const bool is_there = static_cast<bool>(scene.OpenKey("Rooted\\m25"));
        EXPECT_EQ(subkey_names(key.get()).size(), before + (is_there ? 1 : 0));
        if (!struck) {
            EXPECT_GT(nth, 1U);
            break;
        }
    }
}

// A full disk: the bin cannot be appended, the value is refused, the hive still opens.
TEST(FullDisk, RefusesTheValueAndKeepsTheHive) {
    const Bytes start = lay_out(operation_layout(Leaf::hash)).bytes;
    std::string why;
    const Contents before = contents(start, why);
    for (uint64_t room = 0; room < 24576; room += 512) {
        SCOPED_TRACE(room);
        Scene scene(start);
        scene.file().capacity = start.size() + room;
        const Bytes data = pattern(20000);
        const int32_t status = scene.Set("Flat\\alpha", "new", 3, data);
        const Operation operation = {"value", "Flat\\alpha", nullptr, {"Flat\\alpha|new"}};
        EXPECT_EQ(harm(operation, before, nullptr, scene.bytes()), "");
        if (room < 20480) {
            EXPECT_NE(status, R_SUCCESS);
        }
        scene.file().capacity = 0x7FFFFFFF;
        EXPECT_EQ(scene.Set("Flat\\alpha", "new", 3, data), R_SUCCESS);
        EXPECT_EQ(scene.Close(), R_SUCCESS);
    }
}

}  // namespace
