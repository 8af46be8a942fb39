// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// The N-th read, write, seek or allocation of a change fails, for every N until none does.
#include "alloc_faults.h"
#include "operations.h"

#include <gtest/gtest.h>

namespace {

using namespace testkit;
using Call = MemoryFile::Call;

// The hive still takes a change through the same handles: what the engine remembers agrees with the file.
const Operation& probe() {
    static const Operation made = {
        "probe", [](RegistryKey* root) {
            Handle key;
            return RCreateKey(root, "Probe", key.out(), nullptr);
        },
        {"Probe"}};
    return made;
}

bool is_in_table(int32_t status) {
    for (const int32_t known : {0, 2, 3, 6, 8, 87, 111, 123, 145, 234, 259, 1003, 1013, 1015, 1016, 2404, -1}) {
        if (status == known)
            return true;
    }
    return false;
}

struct Expectation {
    Bytes start;
    Contents before;
    Contents after;
};

Expectation expect(const Operation& operation, Leaf leaf) {
    Expectation all;
    all.start = lay_out(operation_layout(leaf)).bytes;
    std::string why;
    all.before = contents(all.start, why);
    EXPECT_EQ(why, "");
    Scene scene(all.start);
    EXPECT_EQ(operation.run(scene.root()), R_SUCCESS);
    all.after = contents(scene.bytes(), why);
    EXPECT_EQ(why, "");
    return all;
}

void check_outcome(const Operation& operation, const Expectation& expected, Scene& scene, int32_t status) {
    EXPECT_TRUE(is_in_table(status)) << "status " << status;
    EXPECT_EQ(harm(operation, expected.before, nullptr, scene.bytes()), "");
    if (status == R_SUCCESS) {
        std::string why;
        EXPECT_EQ(contents(scene.bytes(), why), expected.after) << why;
    }
    const Operation with_probe = {operation.name, nullptr, [&] {
                                      std::vector<std::string> named = operation.named;
                                      named.push_back("Probe");
                                      return named;
                                  }()};
    EXPECT_EQ(probe().run(scene.root()), R_SUCCESS) << "after the failure";
    EXPECT_EQ(harm(with_probe, expected.before, nullptr, scene.bytes()), "");
    EXPECT_EQ(scene.Close(), R_SUCCESS);
}

struct Mode {
    const char* name;
    Call call;
    bool lasting;
    bool shortened;
};

class Faults : public testing::TestWithParam<Mode> {};

TEST_P(Faults, NothingElseIsHarmed) {
    const Mode mode = GetParam();
    uint64_t sweeps = 0;
    for (const Operation& operation : operations()) {
        const Expectation expected = expect(operation, Leaf::hash);
        for (uint64_t nth = 1;; nth++) {
            SCOPED_TRACE(operation.name + ", call " + std::to_string(nth));
            Scene scene(expected.start);
            scene.file().arm({mode.call, nth, mode.lasting, mode.shortened});
            const int32_t status = operation.run(scene.root());
            const bool struck = scene.file().failed();
            scene.file().disarm();
            check_outcome(operation, expected, scene, status);
            sweeps++;
            if (!struck) {
                EXPECT_EQ(status, R_SUCCESS);
                break;
            }
        }
    }
    EXPECT_GT(sweeps, operations().size());
}

INSTANTIATE_TEST_SUITE_P(Calls, Faults,
                         testing::Values(Mode{"ReadOnce", Call::read, false, false},
                                         Mode{"ReadFromThereOn", Call::read, true, false},
                                         Mode{"ReadShort", Call::read, false, true},
                                         Mode{"WriteOnce", Call::write, false, false},
                                         Mode{"WriteFromThereOn", Call::write, true, false},
                                         Mode{"WriteShort", Call::write, false, true},
                                         Mode{"WriteShortFromThereOn", Call::write, true, true},
                                         Mode{"SeekOnce", Call::seek, false, false},
                                         Mode{"SeekFromThereOn", Call::seek, true, false}),
                         [](const auto& mode) { return mode.param.name; });

class AllocationFaultSweep : public testing::TestWithParam<bool> {};

TEST_P(AllocationFaultSweep, NothingElseIsHarmed) {
    for (const Operation& operation : operations()) {
        const Expectation expected = expect(operation, Leaf::hash);
        for (uint64_t nth = 1;; nth++) {
            SCOPED_TRACE(operation.name + ", allocation " + std::to_string(nth));
            Scene scene(expected.start);
            int32_t status = 0;
            bool struck = false;
            {
                const AllocationFaults faults(nth, GetParam());
                status = operation.run(scene.root());
                struck = faults.failed();
            }
            check_outcome(operation, expected, scene, status);
            if (!struck) {
                EXPECT_EQ(status, R_SUCCESS);
                break;
            }
        }
    }
}

INSTANTIATE_TEST_SUITE_P(Once, AllocationFaultSweep, testing::Values(false, true),
                         [](const auto& mode) { return mode.param ? "FromThereOn" : "Once"; });

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
        const Operation operation = {"value", nullptr, {"Flat\\alpha|new"}};
        EXPECT_EQ(harm(operation, before, nullptr, scene.bytes()), "");
        if (room < 20480) {
            EXPECT_NE(status, R_SUCCESS);
        }
        scene.file().capacity = 0x7FFFFFFF;
        EXPECT_EQ(scene.Set("Flat\\alpha", "new", 3, data), R_SUCCESS);
        EXPECT_EQ(scene.Close(), R_SUCCESS);
    }
}

} // namespace
