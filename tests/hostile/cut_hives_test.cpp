// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Hives cut short, at every step of 512 bytes and at every byte of the last bin: read, and changed where they
// open.
#include "changes.h"
#include "real_hives.h"
#include "scene.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>

namespace hostile {

namespace {

using testkit::Item;
using testkit::MemoryFile;
using testkit::Snapshot;

struct Tally {
    size_t stride = 1;  // every so many cuts that open, one is also changed
    size_t cuts = 0;
    size_t open = 0;
    size_t changes = 0;
};

// What reaches past the end of the file may be read once a change has made the file longer.
void exempt_what_was_cut_off(const Snapshot& before, Case& hive) {
    for (const Item& item : before.items) {
        if (item.what.find("status ") == std::string::npos)
            continue;
        const size_t mark = item.place.rfind('?');
        hive.unsettled.push_back(mark + 1 == item.place.size() && mark > 0 ? item.place.substr(0, mark) : item.place);
    }
}

// Reads what is left of the hive, and makes one change of all that there are: another one at each cut.
void survive(const Bytes& whole, size_t length, Tally& tally) {
    Case hive;
    hive.bytes = Bytes(whole.begin(), whole.begin() + static_cast<std::ptrdiff_t>(length));
    hive.cut_short = true;
    tally.cuts++;
    MemoryFile file(hive.bytes);
    const RegistryIo io = file.io();
    RegistryKey* root = ROpenHive(&io);
    if (root != nullptr) {
        const Snapshot before = take_snapshot(root, judged_limits(length));
        const bool changes = tally.open++ % tally.stride == 0;
        if (changes)
            ask_everything(root, testkit::limits_for(length));
        ASSERT_EQ(RCloseKey(root), R_SUCCESS);
        if (changes) {
            const std::vector<Change> all = changes_to(before);
            const Change& change = all[tally.changes++ * 37 % all.size()];
            exempt_what_was_cut_off(before, hive);
            EXPECT_EQ(try_change(hive, before, change), "") << "cut at " << length << ": " << change.text();
        }
    }
    EXPECT_EQ(file.counts().writes, 0U);
    EXPECT_TRUE(file.bytes == hive.bytes);
}

// A stride is for hives that take long to read; with TALLOWFEN_HOSTILE_ALL there is none.
void cut_everywhere(const std::string& name, const Bytes& whole, size_t stride = 1) {
    SCOPED_TRACE(name);
    Tally tally;
    tally.stride = std::getenv("TALLOWFEN_HOSTILE_ALL") == nullptr ? stride : 1;
    for (size_t length = 0; length < whole.size(); length += 512)
        survive(whole, length, tally);
    const size_t end = std::min<size_t>(whole.size(), 4096 + size_t{testkit::get32(whole, 40)});
    size_t last_bin = 4096;
    while (last_bin + testkit::get32(whole, last_bin + 8) < end)
        last_bin += testkit::get32(whole, last_bin + 8);
    for (size_t length = last_bin; length < end; length++)
        survive(whole, length, tally);
    std::printf("%s: cut %zu times, opens at %zu of them\n", name.c_str(), tally.cuts, tally.open);
    if (tally.changes < tally.open)
        std::printf("[ LEFT OUT ] a change at %zu of these\n", tally.open - tally.changes);
    EXPECT_GT(tally.cuts, 4000U);
}

TEST(CutShort, a_made_hive_with_free_space_at_its_end) { cut_everywhere("made", lay_out(stage()).bytes); }

TEST(CutShort, a_made_hive_that_is_full) {
    HiveLayout layout = stage();
    layout.free_bytes = 0;
    layout.no_free_space = true;
    cut_everywhere("full", lay_out(layout).bytes);
}

TEST(CutShort, real_hives) {
    for (const testkit::RealHive& real : testkit::real_hives()) {
        if (real.name == "bcd" || real.name == "sam-2016")
            cut_everywhere(real.name, testkit::read_file(real.path), 16);
    }
}

}  // namespace

}  // namespace hostile
