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

TEST_P(Cuts, EveryStateBetweenTwoWritesIsWhole) {
    check_every_state(lay_out(operation_layout(GetParam())).bytes, operations());
}

TEST(RealHiveCuts, EveryStateBetweenTwoWritesIsWhole) {
    for (const auto& [name, bytes] : small_real_hives()) {
        SCOPED_TRACE(name);
        check_every_state(bytes, operations_on(bytes));
    }
}

TEST_P(Cuts, EveryStateKeepsBinsAndCellsInOrder) {
    const Bytes start = lay_out(operation_layout(GetParam())).bytes;
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

INSTANTIATE_TEST_SUITE_P(HiveKinds, Cuts, testing::Values(Leaf::fast, Leaf::hash),
                         [](const auto& kind) { return kind.param == Leaf::fast ? "lf" : "lh"; });

}  // namespace
