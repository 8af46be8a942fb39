// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// The file as it stands after each single write of a change: it opens, and nothing that the change did not
// name differs.
#include "operations.h"

#include <gtest/gtest.h>

namespace {

using namespace testkit;

class Cuts : public testing::TestWithParam<Leaf> {};

void check_every_state(const Bytes& start, const std::vector<Operation>& operations) {
    std::string why;
    const Contents before = contents(start, why);
    ASSERT_EQ(why, "");
    for (const Operation& operation : operations) {
        SCOPED_TRACE(operation.name + " in " + operation.key);
        Scene scene(start);
        scene.file().keep_cuts = true;
        ASSERT_EQ(operation.run(scene.root()), R_SUCCESS);
        const std::vector<Bytes> cuts = std::move(scene.file().cuts);
        ASSERT_FALSE(cuts.empty());
        const Contents after = contents(scene.bytes(), why);
        ASSERT_EQ(why, "");
        ASSERT_NE(before, after);
        for (size_t i = 0; i < cuts.size(); i++)
            EXPECT_EQ(harm(operation, before, &after, cuts[i]), "") << "after write " << i + 1 << " of " << cuts.size();
    }
}

TEST_P(Cuts, EveryStateBetweenTwoWritesIsWhole) { check_every_state(operation_hive(GetParam()), operations()); }

TEST(RealHiveCuts, EveryStateBetweenTwoWritesIsWhole) {
    for (const auto& [name, bytes] : small_real_hives()) {
        SCOPED_TRACE(name);
        check_every_state(bytes, operations_on(bytes));
    }
}

TEST_P(Cuts, EveryStateKeepsBinsAndCellsInOrder) {
    const Bytes start = operation_hive(GetParam());
    for (const Operation& operation : operations()) {
        SCOPED_TRACE(operation.name);
        Scene scene(start);
        scene.file().keep_cuts = true;
        ASSERT_EQ(operation.run(scene.root()), R_SUCCESS);
        for (const Bytes& cut : scene.file().cuts) {
            for (const Fault& fault : check_hive(cut).faults) {
                EXPECT_NE(fault.rule, "bins") << fault.text;
                EXPECT_NE(fault.rule, "cells") << fault.text;
            }
        }
        EXPECT_TRUE(check_hive(scene.bytes()).faults.empty()) << check_hive(scene.bytes()).text();
    }
}

// A value whose size changes goes through a spare cell. Where the disk has room for none, it is written where it is: a
// stop between the two writes leaves the new data under the old size. Nothing else is touched.
TEST(CutsOnAFullDisk, AValueWithoutASpareCellMayBeLeftWithNewDataUnderItsOldSize) {
    HiveLayout layout = operation_layout(Leaf::hash);
    layout.no_free_space = true;
    const Bytes start = lay_out(layout).bytes;
    const Operation operation = set("value made smaller", "Flat\\alpha", "large", 3, 100);
    std::string why;
    const Contents before = contents(start, why);
    Scene scene(start);
    scene.file().capacity = start.size();
    scene.file().keep_cuts = true;
    ASSERT_EQ(operation.run(scene.root()), R_SUCCESS);
    const Contents after = contents(scene.bytes(), why);
    Bytes mixed = pattern(100, 77);
    const Bytes old = pattern(120);
    mixed.insert(mixed.end(), old.begin() + 100, old.end());
    size_t times_mixed = 0;
    for (const Bytes& cut : scene.file().cuts) {
        EXPECT_EQ(harm(operation, before, nullptr, cut), "");
        const Hive hive = read_hive(cut);
        const Value* value = find_value(*hive.find("Flat\\alpha"), "large");
        ASSERT_NE(value, nullptr);
        if (value->data == mixed)
            times_mixed++;
        else
            EXPECT_EQ(harm(operation, before, &after, cut), "");
    }
    EXPECT_EQ(times_mixed, 1U);
}

INSTANTIATE_TEST_SUITE_P(HiveKinds, Cuts, testing::Values(Leaf::fast, Leaf::hash),
                         [](const auto& kind) { return kind.param == Leaf::fast ? "lf" : "lh"; });

}  // namespace
