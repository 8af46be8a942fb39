// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT

#include "hive_checker.h"
#include "hive_reader.h"
#include "real_hives.h"

#include <gtest/gtest.h>

using namespace testkit;

namespace {

TEST(SupportReal, every_sound_hive_has_the_counts_that_its_index_says) {
    for (const RealHive& real : real_hives()) {
        SCOPED_TRACE(real.name);
        const Hive hive = read_hive(read_file(real.path));
        const Totals totals = count(hive);
        EXPECT_EQ(totals.keys, real.keys);
        EXPECT_EQ(totals.values, real.values);
        for (size_t i = 0; i < hive.complaints.size() && i < 5; i++)
            printf("%s: %s\n", real.name.c_str(), hive.complaints[i].c_str());
    }
}

TEST(SupportReal, the_checker_reaches_every_key_and_value_of_a_sound_hive) {
    for (const RealHive& real : real_hives()) {
        SCOPED_TRACE(real.name);
        const CheckResult result = check_hive(read_file(real.path));
        EXPECT_EQ(result.keys, real.keys);
        EXPECT_EQ(result.values, real.values);
        printf("%s: %zu faults at rest, %zu cells that nothing leads to\n", real.name.c_str(), result.faults.size(),
               result.leaks.count());
    }
}

}  // namespace
