// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Every hive of the catalogue through the engine's calls: read, and changed next to the damage. Reading takes
// time, calls and memory that the file's size bounds and writes nothing; a change harms nothing that it does
// not name and writes to nothing that is damaged.
#include "alloc_faults.h"
#include "changes.h"
#include "sanitized.h"
#include "scene.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <set>

namespace hostile {

namespace {

using testkit::AllocationFaults;
using testkit::Item;
using testkit::MemoryFile;
using testkit::Snapshot;

// What reading a file may take beside what its size justifies.
constexpr uint64_t spare_bytes = 1U << 20U;
constexpr uint64_t passes = 640;  // three walks; a record is 80 bytes, a window that may be loaded for it 16 KiB

Snapshot snapshot_of(const Bytes& bytes, const testkit::WalkLimits& limits) {
    MemoryFile file(bytes);
    file.read_only = true;
    const RegistryIo io = file.io();
    RegistryKey* root = ROpenHive(&io);
    if (root == nullptr)
        return {};
    Snapshot snapshot = take_snapshot(root, limits);
    EXPECT_EQ(RCloseKey(root), R_SUCCESS);
    return snapshot;
}

// The items outside some places; those that stand for what cannot be read are left out.
std::vector<Item> readable_items(const Snapshot& snapshot, const std::vector<std::string>& without) {
    std::vector<Item> kept;
    for (const Item& item : snapshot.items) {
        const bool marker = item.place.size() > 1 && item.place.back() == '?';
        const bool left_out = std::any_of(without.begin(), without.end(),
                                          [&](const auto& place) { return testkit::covers(place, item.place); });
        if (!marker && !left_out)
            kept.push_back(item);
    }
    return kept;
}

std::string first_difference(const std::vector<Item>& expected, const std::vector<Item>& found) {
    std::vector<Item> only;
    std::set_symmetric_difference(expected.begin(), expected.end(), found.begin(), found.end(),
                                  std::back_inserter(only));
    return only.empty() ? "" : only.front().place + ": " + only.front().what.substr(0, 80);
}

void compare_with_intact(const Entry& entry, const Case& hive) {
    const Snapshot found = snapshot_of(hive.bytes, judged_limits(hive.bytes.size()));
    const Snapshot intact = snapshot_of(hive.intact, judged_limits(hive.intact.size()));
    ASSERT_EQ(intact.unreadable, 0U) << "the hive was damaged before it was damaged";
    std::vector<std::string> affected = hive.affected;
    if (entry.readable == Readable::whole)
        affected.clear();
    EXPECT_EQ(first_difference(readable_items(intact, affected), readable_items(found, affected)), "");
    if (entry.readable == Readable::partly) {
        EXPECT_TRUE(found.unreadable > 0 || intact.items != found.items) << "the damage does not show";
    }
}

class Hives : public testing::TestWithParam<size_t> {
protected:
    static void SetUpTestSuite() { tried_ = left_out_ = 0; }
    static void TearDownTestSuite() {
        if (left_out_ > 0)
            std::printf("[ LEFT OUT ] %zu of %zu changes\n", left_out_, left_out_ + tried_);
    }
    const Entry& entry() const { return catalogue()[GetParam()]; }
    static void count(size_t tried, size_t all) {
        tried_ += tried;
        left_out_ += all - tried;
    }

private:
    static inline size_t tried_ = 0;
    static inline size_t left_out_ = 0;
};

class Reading : public Hives {};

TEST_P(Reading, survives) {
    const Case hive = entry().make();
    const uint64_t size = hive.bytes.size();
    const double began = cpu_seconds();
    MemoryFile file(hive.bytes);
    const RegistryIo io = file.io();
    Snapshot found;
    uint64_t peak = 0;
    uint64_t largest = 0;
    bool opened = false;
    {
        const AllocationFaults measure(0);
        RegistryKey* root = ROpenHive(&io);
        opened = root != nullptr;
        EXPECT_LE(file.counts().bytes_read, 4 * size + spare_bytes);
        if (opened) {
            found = take_snapshot(root, testkit::limits_for(size));
            ask_everything(root, testkit::limits_for(size));
            EXPECT_EQ(RCloseKey(root), R_SUCCESS);
        }
        peak = measure.peak();
        largest = measure.largest();
    }
    EXPECT_EQ(opened, entry().readable != Readable::no);
    EXPECT_LE(file.counts().bytes_read, passes * size + spare_bytes);
    EXPECT_LE(file.counts().reads + file.counts().seeks, size + spare_bytes);
    EXPECT_LE(largest, size + spare_bytes);
    EXPECT_LE(peak, 2 * size + spare_bytes);
    EXPECT_EQ(file.counts().writes, 0U);
    EXPECT_TRUE(file.bytes == hive.bytes);
    EXPECT_LE(cpu_seconds() - began, most_seconds(size));
    if (entry().readable == Readable::whole) {
        EXPECT_EQ(found.unreadable, 0U);
        EXPECT_TRUE(found.complete);
    }
    if (opened && !hive.intact.empty())
        compare_with_intact(entry(), hive);
}

// TALLOWFEN_HOSTILE_ALL tries every change to every hive.
bool all_are_tried() { return std::getenv("TALLOWFEN_HOSTILE_ALL") != nullptr; }

class Changing : public Hives {
protected:
    // Few of the changes of a large hive; of a small one all. Under a sanitizer a fourth of these.
    size_t stride(size_t changes) const {
        constexpr size_t most_to_a_large_one = testkit::is_sanitized ? 1 : 4;
        if (all_are_tried())
            return 1;
        if (entry().large)
            return std::max<size_t>(changes / most_to_a_large_one, 1);
        return testkit::is_sanitized ? 4 : 1;
    }
};

TEST_P(Changing, harms_nothing_that_is_not_named) {
    if (entry().readable == Readable::no)
        return;  // what does not open is not changed: Reading sees to that
    const Case hive = entry().make();
    const Snapshot before = snapshot_of(hive.bytes, judged_limits(hive.bytes.size()));
    const std::vector<Change> all = changes_to(before);
    ASSERT_FALSE(all.empty());
    size_t tried = 0;
    const size_t step = stride(all.size());
    for (size_t i = GetParam() % std::min(step, all.size()); i < all.size(); i += step) {
        EXPECT_EQ(try_change(hive, before, all[i]), "") << all[i].text();
        tried++;
    }
    count(tried, all.size());
}

// What is odd but legal hinders no change that the hive takes without it; a count that lies hinders some.
TEST_P(Changing, is_refused_where_a_count_lies_and_not_for_a_legal_oddity) {
    const Case hive = entry().make();
    if (entry().readable != Readable::whole || entry().large || hive.intact.empty())
        return;
    const std::vector<Change> all = changes_to(snapshot_of(hive.intact, judged_limits(hive.intact.size())));
    const size_t step = stride(all.size());
    size_t refused = 0;
    for (size_t i = 0; i < all.size(); i += step) {
        const int32_t status = status_of(hive.intact, all[i]);
        const bool takes_it = status_of(hive.bytes, all[i]) == status;
        refused += takes_it ? 0 : 1;
        EXPECT_TRUE(takes_it || (hive.lies && status == R_SUCCESS)) << all[i].text();
    }
    // Where a part is tried, those may have been left out.
    EXPECT_TRUE(refused > 0 || !hive.lies || step > 1);
}

class ChangingWithFaults : public Hives {
protected:
    // Of all changes to all hives few are tried: of each hive at least one, under a sanitizer of every second or third.
    static size_t stride(size_t changes) {
        if (all_are_tried())
            return 1;
        return testkit::is_sanitized ? 512 : std::min<size_t>(64, changes);
    }
    // Spread over the strides: hives that are alike stand side by side.
    size_t first(size_t stride) const { return GetParam() * 197 % stride; }
};

// A failed read must not make what is damaged pass for sound.
TEST_P(ChangingWithFaults, harms_nothing_that_is_not_named) {
    if (entry().readable == Readable::no || entry().large)
        return;
    const Case hive = entry().make();
    const Snapshot before = snapshot_of(hive.bytes, judged_limits(hive.bytes.size()));
    const std::vector<Change> all = changes_to(before);
    ASSERT_FALSE(all.empty());
    size_t tried = 0;
    const size_t step = stride(all.size());
    for (size_t i = first(step); i < all.size(); i += step) {
        tried++;
        for (const bool lasting : {false, true}) {
            bool struck = true;
            for (uint64_t nth = 1; struck; nth++) {
                EXPECT_EQ(try_change(hive, before, all[i], {MemoryFile::Call::read, nth, lasting, false}, &struck), "")
                    << all[i].text() << ", read " << nth << (lasting ? " and all after" : "");
            }
        }
    }
    count(tried, all.size());
}

std::string name_of(const testing::TestParamInfo<size_t>& info) {
    std::string name = catalogue()[info.param].name;
    std::replace_if(
        name.begin(), name.end(), [](char c) { return !isalnum(static_cast<unsigned char>(c)); }, '_');
    return name;
}

INSTANTIATE_TEST_SUITE_P(Catalogue, Reading, testing::Range(size_t{0}, catalogue().size()), name_of);
INSTANTIATE_TEST_SUITE_P(Catalogue, ChangingWithFaults, testing::Range(size_t{0}, catalogue().size()), name_of);
INSTANTIATE_TEST_SUITE_P(Catalogue, Changing, testing::Range(size_t{0}, catalogue().size()), name_of);

TEST(Catalogue, names_each_hive_once) {
    std::set<std::string> names;
    for (const Entry& entry : catalogue())
        EXPECT_TRUE(names.insert(entry.name).second) << entry.name;
}

// A judge that finds nothing is worth nothing: each kind of harm is done once.
TEST(Judge, sees_what_a_change_must_not_do) {
    Case hive;
    hive.bytes = lay_out(stage()).bytes;
    const Snapshot before = snapshot_of(hive.bytes, judged_limits(hive.bytes.size()));
    Change change = {Kind::set_value, {0}, "Alpha", "Text", 0, 100, {"Alpha|Text"}};
    EXPECT_EQ(try_change(hive, before, change), "");
    change.named = {"Alpha|Number"};
    EXPECT_NE(try_change(hive, before, change), "");
    change.named = {"Alpha|Text"};
    const LaidHive laid = lay_out(stage());
    const uint64_t record = LaidHive::position(laid.at("Alpha").values[1].record);
    hive.untouchable = {{record, record + 8}};
    EXPECT_NE(try_change(hive, before, change), "");
}

}  // namespace

}  // namespace hostile
