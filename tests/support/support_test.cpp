// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT

// The kit itself: a checker that finds nothing is worth nothing, so each of its rules is broken once.
#include "alloc_faults.h"
#include "file_faults.h"
#include "scene.h"

#include <algorithm>
#include <cstdlib>
#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/file.h>
#include <unistd.h>

using namespace testkit;

namespace {

HiveLayout sample() {
    HiveLayout layout;
    layout.root.class_name = u"Class";
    KeyLayout& a = layout.root.add("Alpha");
    a.set("Text", 1, text_data("hello"));
    a.set("", 4, {1, 2, 3, 4});
    a.add("Inner").set("Big", 3, pattern(40000)).storage = Storage::big;
    KeyLayout& many = layout.root.add("many_keys");
    many.per_leaf = 3;
    for (int i = 0; i < 10; i++)
        many.add("k" + std::to_string(i));
    KeyLayout& wide = layout.root.add("Wide");
    wide.wide_name = true;
    wide.name = u"\u0416\u0436";
    return layout;
}

TEST(Support, a_laid_out_hive_has_no_fault_and_no_leak) {
    for (Leaf leaf : {Leaf::fast, Leaf::hash}) {
        HiveLayout layout = sample();
        layout.leaf = leaf;
        layout.free_bytes = 100;
        layout.security_records = 3;
        layout.root.children[0].security = 1;
        layout.root.children[1].security = 2;
        layout.after_bins = pattern(700);
        const CheckResult result = check_hive(lay_out(layout).bytes);
        EXPECT_EQ(result.text(), "");
        EXPECT_EQ(result.leaks.count(), 0U);
        EXPECT_EQ(result.keys, 15U);
        EXPECT_EQ(result.values, 3U);
    }
}

TEST(Support, the_reader_gives_back_what_was_laid_out) {
    const Hive hive = read_hive(lay_out(sample()).bytes);
    EXPECT_TRUE(hive.complaints.empty());
    EXPECT_EQ(hive.root.class_name, u"Class");
    ASSERT_NE(hive.find("alpha\\INNER"), nullptr);
    EXPECT_EQ(find_value(*hive.find("alpha\\inner"), "big")->data, pattern(40000));
    EXPECT_EQ(find_value(*hive.find("Alpha"), "")->data, (Bytes{1, 2, 3, 4}));
    EXPECT_EQ(hive.find("many_keys")->children.size(), 10U);
    EXPECT_EQ(count(hive).wide_keys, 1U);
}

TEST(Support, no_free_space_leaves_no_free_cell) {
    HiveLayout layout = sample();
    layout.no_free_space = true;
    Scene scene(layout);
    ASSERT_TRUE(scene.is_open());
    EXPECT_EQ(scene.Check(), "");
    const size_t before = scene.bytes().size();
    EXPECT_EQ(scene.Create("New"), 0);
    EXPECT_GT(scene.bytes().size(), before);
    EXPECT_EQ(scene.Check(), "");
}

HiveLayout chain(int keys) {
    HiveLayout layout;
    KeyLayout* last = &layout.root;
    for (int i = 0; i < keys; i++)
        last = &last->add("Below");
    return layout;
}

HiveLayout sample_with_hints() {
    HiveLayout layout = sample();
    layout.leaf = Leaf::fast;
    return layout;
}

TEST(Support, keys_512_deep_are_no_fault) { EXPECT_EQ(check_hive(lay_out(chain(512)).bytes).text(), ""); }

struct Damage {
    const char* rule;
    void (*apply)(LaidHive&);
};

class Broken : public testing::TestWithParam<Damage> {};

TEST_P(Broken, is_found) {
    LaidHive hive = lay_out(sample());
    GetParam().apply(hive);
    const CheckResult result = check_hive(hive.bytes);
    bool found = false;
    for (const Fault& fault : result.faults)
        found = found || fault.rule == GetParam().rule;
    EXPECT_TRUE(found) << result.text();
}

INSTANTIATE_TEST_SUITE_P(
    Rules, Broken,
    testing::Values(Damage{"checksum", [](LaidHive& h) { h.put_base(4, 9); }},
                    Damage{"base", [](LaidHive& h) { h.bytes.resize(h.bytes.size() - 4096); }},
                    Damage{"bins", [](LaidHive& h) { set32(h.bytes, 4100, 4096); }},
                    Damage{"cells", [](LaidHive& h) { h.set_cell_size(h.at("Alpha").record, -12); }},
                    Damage{"free", [](LaidHive& h) { h.mark_free(h.at("Alpha").record); }},
                    Damage{"reach", [](LaidHive& h) { h.put32(h.at("Alpha").record, 40, 44); }},
                    Damage{"twice",
                           [](LaidHive& h) { h.put32(h.at("Alpha").value_list, 4, h.at("Alpha").values[0].record); }},
                    Damage{"record", [](LaidHive& h) { h.put16(h.at("Alpha").record, 0, 0x4141); }},
                    Damage{"name", [](LaidHive& h) { h.put16(h.at("Alpha").record, 72, 400); }},
                    Damage{"parent", [](LaidHive& h) { h.put32(h.at("Alpha").record, 16, 64); }},
                    Damage{"count", [](LaidHive& h) { h.put32(h.at("").record, 20, 2); }},
                    Damage{"maximum", [](LaidHive& h) { h.put32(h.at("Alpha").record, 60, 2); }},
                    Damage{"maximum", [](LaidHive& h) { h.put32(h.at("").record, 52, 2); }},
                    Damage{"maximum", [](LaidHive& h) { h.put32(h.at("Alpha").record, 64, 2); }},
                    Damage{"data", [](LaidHive& h) { h.put32(h.at("Alpha").values[1].record, 4, 0x80000005); }},
                    Damage{"data", [](LaidHive& h) { h.put32(h.at("Alpha\\Inner").values[0].record, 4, 70000); }},
                    Damage{"class", [](LaidHive& h) { h.put16(h.at("").record, 74, 400); }},
                    Damage{"index", [](LaidHive& h) { h.put16(h.at("").index, 0, 0x4141); }},
                    Damage{"hash", [](LaidHive& h) { h.put32(h.at("").index, 8, 5); }},
                    Damage{"hint",
                           [](LaidHive& h) {
                               h = lay_out(sample_with_hints());
                               h.put32(h.at("").index, 8, 5);
                           }},
                    Damage{"depth", [](LaidHive& h) { h = lay_out(chain(513)); }},
                    Damage{"security", [](LaidHive& h) { h.put32(h.at("Alpha").record, 44, none); }},
                    Damage{"security", [](LaidHive& h) { h.put32(h.security[0], 16, 4096); }},
                    Damage{"order",
                           [](LaidHive& h) {
                               const uint32_t leaf = h.at("many_keys").leaves[0];
                               const uint32_t first = h.get32(leaf, 4);
                               h.put32(leaf, 4, h.get32(leaf, 12));
                               h.put32(leaf, 12, first);
                           }},
                    Damage{"references", [](LaidHive& h) { h.put32(h.security[0], 12, 3); }},
                    Damage{"ring", [](LaidHive& h) { h.put32(h.security[0], 8, none); }}),
    [](const auto& row) { return std::to_string(row.index) + "_" + row.param.rule; });

TEST(Support, cells_that_nothing_leads_to_are_counted_by_kind) {
    LaidHive hive = lay_out(sample());
    hive.put32(hive.at("Alpha").record, 36, 0);
    const Leaks leaks = check_hive(hive.bytes).leaks;
    EXPECT_EQ(leaks.values.size(), 2U);
    EXPECT_EQ(leaks.keys.size(), 0U);
    EXPECT_EQ(leaks.others.size(), 2U);  // the list and the text
}

TEST(Support, the_reader_survives_single_changed_bytes_of_a_small_hive) {
    HiveLayout layout;
    layout.root.add("Alpha").set("Text", 1, text_data("hello"));
    layout.root.add("Beta").add("Gamma");
    const Bytes bytes = lay_out(layout).bytes;
    for (size_t i = 0; i < bytes.size(); i += bytes[i] == 0 ? 7U : 1U) {
        for (uint8_t value : {uint8_t{0}, uint8_t{0x7F}, uint8_t{0xFF}}) {
            Bytes changed = bytes;
            changed[i] = value;
            EXPECT_LE(count(read_hive(changed)).keys, 4U);
            check_hive(changed);
        }
    }
}

TEST(Support, a_key_that_lists_itself_is_read_once) {
    LaidHive hive = lay_out(sample());
    hive.put32(hive.at("").index, 4, hive.at("").record);
    const Hive read = read_hive(hive.bytes);
    EXPECT_FALSE(read.complaints.empty());
    EXPECT_FALSE(check_hive(hive.bytes).faults.empty());
}

TEST(Support, diff_names_what_was_added_removed_and_changed) {
    HiveLayout after = sample();
    after.root.children[0].values[0].data = text_data("hullo");
    after.root.children[0].values.pop_back();
    after.root.children[0].set("Fresh", 4, {0, 0, 0, 1});
    after.root.children[1].children.pop_back();
    after.root.add("Zulu");
    const std::vector<std::string> expected{
        "~ value Alpha : Text type 1 data 680065006c006c006f000000 -> type 1 data 680075006c006c006f000000",
        "- value Alpha :  type 4 data 01020304",
        "+ value Alpha : Fresh type 4 data 00000001",
        "- key many_keys\\k9",
        "+ key Zulu",
    };
    std::vector<std::string> lines = diff(lay_out(sample()).bytes, lay_out(after).bytes);
    std::vector<std::string> sorted = expected;
    std::sort(lines.begin(), lines.end());
    std::sort(sorted.begin(), sorted.end());
    EXPECT_EQ(lines, sorted);
}

TEST(Support, the_memory_file_fails_when_told) {
    MemoryFile file(Bytes(100, 1));
    const RegistryIo io = file.io();
    char buffer[50];
    file.arm({MemoryFile::Call::read, 2, false, false});
    EXPECT_EQ(io.read(io.device, buffer, 10), 10);
    EXPECT_EQ(io.read(io.device, buffer, 10), -1);
    EXPECT_EQ(io.read(io.device, buffer, 10), 10);
    file.arm({MemoryFile::Call::write, 1, true, true});
    EXPECT_EQ(io.write(io.device, buffer, 10), 5);
    EXPECT_EQ(io.write(io.device, buffer, 10), 5);
    file.disarm();
    file.capacity = 104;
    EXPECT_EQ(io.seek(io.device, 0, 2), 100);
    EXPECT_EQ(io.write(io.device, buffer, 10), 4);
    EXPECT_EQ(file.bytes.size(), 104U);
}

TEST(Support, an_allocation_fails_when_told) {
    AllocationFaults faults(2);
    void* first = malloc(10);
    void* second = malloc(10);
    void* third = calloc(1, 10);
    EXPECT_NE(first, nullptr);
    EXPECT_EQ(second, nullptr);
    EXPECT_NE(third, nullptr);
    EXPECT_TRUE(faults.failed());
    free(first);
    free(second);
    free(third);
}

TEST(Support, allocations_are_measured) {
    const AllocationFaults faults(0);
    void* volatile first = malloc(1000);  // so that no compiler leaves out what nobody uses
    free(first);
    void* volatile second = malloc(3000);
    second = realloc(second, 5000);
    EXPECT_EQ(faults.largest(), 5000U);
    EXPECT_GE(faults.peak(), 5000U);
    EXPECT_LT(faults.peak(), 6000U);
    free(second);
}

// A file without a name, which goes when the test does.
class File {
public:
    File() {
        char name[] = "/tmp/tallowfen-support-XXXXXX";
        descriptor = mkstemp(name);
        unlink(name);
    }
    ~File() { close(descriptor); }
    File(const File&) = delete;
    File& operator=(const File&) = delete;

    off_t size() const { return lseek(descriptor, 0, SEEK_END); }

    int descriptor;
};

TEST(Support, a_write_to_a_file_fails_when_told) {
    const File file;
    int ends[2];
    ASSERT_EQ(pipe(ends), 0);
    {
        const WriteFaults faults(2, false, EIO);
        EXPECT_EQ(write(file.descriptor, "12", 2), 2);
        EXPECT_EQ(write(ends[1], "34", 2), 2);
        EXPECT_FALSE(faults.failed());
        errno = 0;
        EXPECT_EQ(write(file.descriptor, "56", 2), -1);
        EXPECT_EQ(errno, EIO);
        EXPECT_TRUE(faults.failed());
        EXPECT_EQ(write(file.descriptor, "789", 3), 3);
        EXPECT_EQ(faults.writes(), 3);
    }
    EXPECT_EQ(file.size(), 5);
    {
        const WriteFaults faults(2, true);
        EXPECT_EQ(write(file.descriptor, "1", 1), 1);
        for (int i = 0; i < 3; i++)
            EXPECT_EQ(write(file.descriptor, "2", 1), -1);
        EXPECT_EQ(errno, ENOSPC);
    }
    EXPECT_EQ(file.size(), 6);
    EXPECT_EQ(write(file.descriptor, "2", 1), 1);
    close(ends[0]);
    close(ends[1]);
}

TEST(Support, a_file_takes_half_of_a_write_when_told) {
    const File file;
    for (const bool lasting : {false, true}) {
        const WriteFaults faults(1, lasting, ENOSPC, true);
        EXPECT_EQ(write(file.descriptor, "12345", 5), 2);
        EXPECT_EQ(write(file.descriptor, "345", 3), -1);
        EXPECT_EQ(write(file.descriptor, "345", 3), lasting ? -1 : 3);
    }
    EXPECT_EQ(file.size(), 7);
    const WriteFaults faults(1, false, ENOSPC, true);
    EXPECT_EQ(write(file.descriptor, "1", 1), -1);  // has no half
}

TEST(Support, reads_and_locks_fail_when_told) {
    const File file;
    EXPECT_EQ(flock(file.descriptor, LOCK_EX | LOCK_NB), 0);
    {
        LockFaults faults(ENOLCK);
        EXPECT_EQ(flock(file.descriptor, LOCK_EX | LOCK_NB), -1);
        EXPECT_EQ(errno, ENOLCK);
        EXPECT_EQ(faults.tried(), 1);
    }
    EXPECT_EQ(flock(file.descriptor, LOCK_EX | LOCK_NB), 0);
    char byte = 0;
    const ReadFaults faults(2);
    EXPECT_EQ(read(file.descriptor, &byte, 1), 0);
    EXPECT_EQ(read(file.descriptor, &byte, 1), -1);
    EXPECT_EQ(errno, EIO);
    EXPECT_EQ(read(file.descriptor, &byte, 1), 0);
}

}  // namespace
