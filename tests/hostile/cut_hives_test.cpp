// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Hives cut short, at every step of 512 bytes and at every byte of the last bin: what lies before the cut reads as in
// the whole hive, and they are changed where they open.
#include "changes.h"
#include "real_hives.h"
#include "scene.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <map>
#include <stdexcept>

namespace hostile {

namespace {

using testkit::Item;
using testkit::MemoryFile;
using testkit::Snapshot;

// Where the last of the cells ends that each key and value of a sound hive is read from.
class Ends {
public:
    explicit Ends(const Bytes& whole) : whole_(whole) { add_key(testkit::read_hive(whole).root, "", 0); }

    uint64_t of(const std::string& place) const { return ends_.at(place); }

private:
    uint32_t field(uint32_t cell, uint32_t at) const { return testkit::get32(whole_, LaidHive::position(cell, at)); }
    uint32_t size_of(uint32_t cell) const {
        return static_cast<uint32_t>(-static_cast<int32_t>(testkit::get32(whole_, LaidHive::position(cell) - 4)));
    }
    uint64_t behind(uint64_t end, uint32_t cell) const {
        return std::max(end, LaidHive::position(cell) - 4 + size_of(cell));
    }
    void note(const std::string& place, uint64_t end) {
        uint64_t& noted = ends_[place];
        noted = std::max(noted, end);
    }

    void add_key(const testkit::Key& key, const std::string& place, uint64_t end) {
        end = behind(end, key.offset);
        const bool has_class = testkit::get16(whole_, LaidHive::position(key.offset, 74)) > 0;
        note(place, behind(has_class ? behind(end, field(key.offset, 48)) : end, key.security));
        const uint64_t list = key.values.empty() ? end : behind(end, field(key.offset, 40));
        for (const testkit::Value& value : key.values)
            note(place + "|" + testkit::utf8(value.name), behind_value(list, value));
        const uint64_t index = key.children.empty() ? end : behind_index(end, field(key.offset, 28));
        for (const testkit::Key& child : key.children) {
            const std::string name = testkit::utf8(child.name);
            add_key(child, place.empty() ? name : place + "\\" + name, index);
        }
    }
    uint64_t behind_index(uint64_t end, uint32_t index) const {
        end = behind(end, index);
        const bool is_root = testkit::get16(whole_, LaidHive::position(index)) == 0x6972;
        for (uint32_t i = 0; is_root && i < testkit::get16(whole_, LaidHive::position(index, 2)); i++)
            end = behind(end, field(index, 4 + 4 * i));
        return end;
    }
    uint64_t behind_value(uint64_t end, const testkit::Value& value) const {
        end = behind(end, value.offset);
        if (value.is_inline || value.size == 0)
            return end;
        const uint32_t data = field(value.offset, 8);
        end = behind(end, data);
        if (size_of(data) - 4 >= value.size)
            return end;
        const uint32_t list = field(data, 4);
        end = behind(end, list);
        for (uint32_t i = 0; i < testkit::get16(whole_, LaidHive::position(data, 2)); i++)
            end = behind(end, field(list, 4 * i));
        return end;
    }

    const Bytes& whole_;
    std::map<std::string, uint64_t> ends_;
};

// A hive that is to be cut, and what it holds.
struct Whole {
    Bytes bytes;
    Snapshot snapshot;
    Ends ends;

    explicit Whole(Bytes all) : bytes(std::move(all)), ends(bytes) {
        MemoryFile file(bytes);
        const RegistryIo io = file.io();
        RegistryKey* root = ROpenHive(&io);
        if (root == nullptr)
            throw std::runtime_error("the whole hive does not open");
        snapshot = take_snapshot(root, judged_limits(bytes.size()));
        RCloseKey(root);
    }
    // What lies before a cut with all that leads there.
    std::vector<Item> before(uint64_t cut) const {
        std::vector<Item> kept;
        std::copy_if(snapshot.items.begin(), snapshot.items.end(), std::back_inserter(kept),
                     [&](const Item& item) { return ends.of(item.place) <= cut; });
        return kept;
    }
};

constexpr size_t compared_stride = 16;  // of the cuts that open, so many times fewer are compared with the whole

struct Tally {
    size_t stride = 1;  // every so many cuts that open, one is also changed
    size_t cuts = 0;
    size_t open = 0;
    size_t changes = 0;
    size_t compared = 0;  // items that lay before a cut
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

// What lies before the cut is there, and nothing that the whole hive does not have.
void compare_with_whole(const Whole& whole, const Snapshot& found, size_t length, Tally& tally) {
    const std::vector<Item> expected = whole.before(length);
    tally.compared += expected.size();
    std::vector<Item> missing;
    std::set_difference(expected.begin(), expected.end(), found.items.begin(), found.items.end(),
                        std::back_inserter(missing));
    EXPECT_TRUE(missing.empty()) << "cut at " << length << ": " << missing.front().place;
    for (const Item& item : found.items) {
        const bool is_unread = !item.place.empty() && item.place.back() == '?';
        EXPECT_TRUE(item.what.find("status ") != std::string::npos || is_unread ||
                    std::binary_search(whole.snapshot.items.begin(), whole.snapshot.items.end(), item))
            << "cut at " << length << ": " << item.place;
    }
}

// Reads what is left of the hive, and makes one change of all that there are: another one at each cut.
void survive(const Whole& whole, size_t length, Tally& tally) {
    Case hive;
    hive.bytes = Bytes(whole.bytes.begin(), whole.bytes.begin() + static_cast<std::ptrdiff_t>(length));
    hive.cut_short = true;
    tally.cuts++;
    MemoryFile file(hive.bytes);
    const RegistryIo io = file.io();
    RegistryKey* root = ROpenHive(&io);
    if (root != nullptr) {
        const Snapshot before = take_snapshot(root, judged_limits(length));
        if (tally.open % compared_stride == 0)
            compare_with_whole(whole, before, length, tally);
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
void cut_everywhere(const std::string& name, const Bytes& bytes, size_t stride = 1) {
    SCOPED_TRACE(name);
    const Whole hive(bytes);
    Tally tally;
    tally.stride = std::getenv("TALLOWFEN_HOSTILE_ALL") == nullptr ? stride : 1;
    for (size_t length = 0; length < bytes.size(); length += 512)
        survive(hive, length, tally);
    const size_t end = std::min<size_t>(bytes.size(), 4096 + size_t{testkit::get32(bytes, 40)});
    size_t last_bin = 4096;
    while (last_bin + testkit::get32(bytes, last_bin + 8) < end)
        last_bin += testkit::get32(bytes, last_bin + 8);
    for (size_t length = last_bin; length < end; length++)
        survive(hive, length, tally);
    std::printf("%s: cut %zu times, opens at %zu of them\n", name.c_str(), tally.cuts, tally.open);
    if (tally.changes < tally.open)
        std::printf("[ LEFT OUT ] a change at %zu of these\n", tally.open - tally.changes);
    EXPECT_GT(tally.cuts, 4000U);
    EXPECT_GT(tally.open, 0U);
    EXPECT_GT(tally.changes, 0U);
    EXPECT_GE(tally.compared, tally.open / compared_stride);  // the root key alone where its list is cut
}

TEST(CutShort, a_made_hive_with_free_space_at_its_end) { cut_everywhere("made", lay_out(stage()).bytes); }

TEST(CutShort, a_made_hive_that_is_full) {
    HiveLayout layout = stage();
    layout.free_bytes = 0;
    layout.no_free_space = true;
    cut_everywhere("full", lay_out(layout).bytes);
}

TEST(CutShort, a_made_hive_with_data_at_its_end) { cut_everywhere("data last", hive_to_cut(), 4); }

TEST(CutShort, real_hives) {
    for (const testkit::RealHive& real : testkit::real_hives()) {
        if (real.name == "bcd" || real.name == "sam-2016")
            cut_everywhere(real.name, testkit::read_file(real.path), 16);
    }
}

}  // namespace

}  // namespace hostile
