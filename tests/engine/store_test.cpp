// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT

// White-box: the store's window and the allocator, which the calls of the public header show only by their
// effects.
#include "allocator.h"
#include "handle.h"
#include "scene.h"

#include <gtest/gtest.h>

using namespace testkit;

namespace {

engine::Store& store_of(Scene& scene) { return *scene.root()->store; }

// Sizes of a bin's cells, negative for used ones, from the bin's first.
std::vector<int32_t> cells(const Bytes& bytes, uint32_t bin) {
    std::vector<int32_t> sizes;
    const uint32_t end = bin + get32(bytes, 4096 + uint64_t{bin} + 8);
    for (uint32_t at = bin + 32; at < end;) {
        sizes.push_back(static_cast<int32_t>(get32(bytes, 4096 + uint64_t{at})));
        at += static_cast<uint32_t>(std::abs(sizes.back()));
    }
    return sizes;
}

TEST(Allocator, a_cell_is_the_data_and_four_bytes_rounded_up_to_eight) {
    EXPECT_EQ(engine::cell_size_for(1), 8U);
    EXPECT_EQ(engine::cell_size_for(4), 8U);
    EXPECT_EQ(engine::cell_size_for(5), 16U);
    EXPECT_EQ(engine::cell_size_for(12), 16U);
    EXPECT_EQ(engine::cell_size_for(13), 24U);
}

TEST(Allocator, a_request_of_4084_bytes_on_a_full_hive_appends_a_bin_of_8192) {
    HiveLayout layout;
    layout.no_free_space = true;
    Scene scene(layout);
    const uint32_t before = get32(scene.bytes(), 40);
    EXPECT_EQ(raw(engine::allocate(store_of(scene), 4084)), before + 32);
    EXPECT_EQ(get32(scene.bytes(), 4096 + uint64_t{before} + 8), 8192U);
    EXPECT_EQ(get32(scene.bytes(), 40), before + 8192);
    EXPECT_EQ(scene.Check(1), "");
}

TEST(Allocator, a_request_of_4052_bytes_on_a_full_hive_appends_a_bin_of_4096) {
    HiveLayout layout;
    layout.no_free_space = true;
    Scene scene(layout);
    const uint32_t before = get32(scene.bytes(), 40);
    engine::allocate(store_of(scene), 4052);  // a cell of 4056, and 36
    EXPECT_EQ(get32(scene.bytes(), 4096 + uint64_t{before} + 8), 4096U);
    EXPECT_EQ(scene.Check(1), "");
}

TEST(Allocator, a_new_bin_holds_x_and_its_size_and_the_first_bin_the_size_of_all) {
    HiveLayout layout;
    layout.no_free_space = true;
    Scene scene(layout);
    const uint32_t bin = get32(scene.bytes(), 40);
    engine::allocate(store_of(scene), 8);
    for (uint32_t i = 12; i < 28; i++)
        EXPECT_EQ(scene.bytes()[4096 + bin + i], 0x78);
    EXPECT_EQ(get32(scene.bytes(), 4096 + uint64_t{bin} + 28), 4096U);
    EXPECT_EQ(get32(scene.bytes(), 4096 + 28), bin + 4096);
    EXPECT_EQ(get32(scene.bytes(), 508), base_checksum(scene.bytes()));
}

TEST(Allocator, a_new_bin_goes_over_the_bytes_behind_the_last_one) {
    HiveLayout layout;
    layout.no_free_space = true;
    layout.after_bins = pattern(10000);
    Scene scene(layout);
    const uint32_t bin = get32(scene.bytes(), 40);
    const size_t length = scene.bytes().size();
    EXPECT_EQ(raw(engine::allocate(store_of(scene), 8)), bin + 32);
    EXPECT_EQ(scene.bytes().size(), length);
    EXPECT_EQ(scene.Check(1), "");
}

TEST(Allocator, a_file_that_grows_ends_at_most_511_bytes_behind_its_bins) {
    for (size_t extra : {0U, 1U, 511U, 512U, 700U, 4095U, 4096U, 4097U}) {
        HiveLayout layout;
        layout.no_free_space = true;
        layout.after_bins = pattern(extra);
        Scene scene(layout);
        engine::allocate(store_of(scene), 8);
        const size_t end = base_block_bytes + get32(scene.bytes(), 40);
        EXPECT_GE(scene.bytes().size(), end);
        EXPECT_LE(scene.bytes().size(), end + 511) << extra;
        EXPECT_EQ(scene.Check(1), "");
    }
}

// Four cells of 24 in a bin of their own, all in use, and the rest of it free: [24][24][24][24][rest free].
struct Row {
    explicit Row(Scene& scene) : bin(get32(scene.bytes(), 40) - 4096) {
        for (uint32_t& place : cell)
            place = raw(engine::allocate(store_of(scene), 20));
    }
    uint32_t bin;
    uint32_t cell[4];
};

class AllocatorRow : public testing::Test {
protected:
    static HiveLayout layout() {
        HiveLayout layout;
        layout.no_free_space = true;
        layout.free_bytes = 1000;
        return layout;
    }
    AllocatorRow() : scene(layout()), row(scene) {}
    bool free_cell(uint32_t offset) { return engine::free_cell(store_of(scene), engine::cell_offset(offset)); }
    std::vector<int32_t> sizes() const { return cells(scene.bytes(), row.bin); }

    Scene scene;
    Row row;
};

TEST_F(AllocatorRow, a_split_of_24_for_a_cell_of_16_leaves_8) {
    free_cell(row.cell[1]);
    EXPECT_EQ(raw(engine::allocate(store_of(scene), 12)), row.cell[1]);
    const std::vector<int32_t> now = sizes();
    EXPECT_EQ(now[1], -16);
    EXPECT_EQ(now[2], 8);
    EXPECT_EQ(scene.Check(4), "");
}

TEST_F(AllocatorRow, an_exact_fit_leaves_nothing) {
    free_cell(row.cell[1]);
    EXPECT_EQ(raw(engine::allocate(store_of(scene), 20)), row.cell[1]);
    EXPECT_EQ(sizes()[1], -24);
    EXPECT_EQ(sizes()[2], -24);
}

TEST_F(AllocatorRow, two_freed_neighbours_become_one) {
    EXPECT_TRUE(free_cell(row.cell[1]));
    EXPECT_TRUE(free_cell(row.cell[2]));
    EXPECT_EQ(sizes()[1], 48);
    EXPECT_EQ(sizes()[2], -24);
    EXPECT_EQ(scene.Check(2), "");
}

TEST_F(AllocatorRow, a_cell_freed_between_two_free_ones_joins_both) {
    free_cell(row.cell[0]);
    free_cell(row.cell[2]);
    free_cell(row.cell[1]);
    EXPECT_EQ(sizes()[0], 72);
    EXPECT_EQ(scene.Check(1), "");
}

TEST_F(AllocatorRow, of_two_fitting_cells_the_smaller_is_taken) {
    engine::allocate(store_of(scene), 20);
    for (const uint32_t cell : {row.cell[0], row.cell[1], row.cell[3]})
        free_cell(cell);
    EXPECT_EQ(sizes()[0], 48);
    EXPECT_EQ(raw(engine::allocate(store_of(scene), 4)), row.cell[3]);
}

TEST_F(AllocatorRow, what_is_no_cell_in_use_is_not_freed) {
    free_cell(row.cell[1]);
    const Bytes before = scene.bytes();
    for (uint32_t offset : {row.cell[1], row.cell[0] + 8, row.cell[0] + 4, row.bin, 0U, none, 0x7FFFFFF8U})
        EXPECT_FALSE(free_cell(offset)) << offset;
    EXPECT_EQ(scene.bytes(), before);
}

TEST_F(AllocatorRow, the_length_of_a_cell_is_absolute_and_a_multiple_of_eight) {
    EXPECT_EQ(engine::cell_length(store_of(scene), engine::cell_offset(row.cell[0])), 24);
    free_cell(row.cell[1]);
    EXPECT_EQ(engine::cell_length(store_of(scene), engine::cell_offset(row.cell[1])), 24);
    scene.file().bytes[4096 + row.cell[0]] = static_cast<uint8_t>(-20);
    const uint8_t nothing = 0;
    // The window is read anew.
    engine::write_at(store_of(scene), engine::sig_none, 4096 + int64_t{row.cell[0]}, &nothing, 0);
    EXPECT_EQ(engine::cell_length(store_of(scene), engine::cell_offset(row.cell[0])), -1);
}

// A bin whose cells are of 8 bytes each, two free ones before each used one. Returns the calls that freeing a used one
// in the middle takes.
uint64_t calls_to_free_among(uint32_t bin_bytes) {
    HiveLayout layout;
    layout.free_bytes = bin_bytes;
    LaidHive hive = lay_out(layout);
    const uint32_t end = get32(hive.bytes, 40);
    uint32_t bin = 0;
    while (bin + get32(hive.bytes, 4096 + uint64_t{bin} + 8) < end)
        bin += get32(hive.bytes, 4096 + uint64_t{bin} + 8);
    uint32_t place = 0;
    for (uint32_t at = bin + 32; at < end; at += 8)
        hive.set_cell_size(at, place++ % 3 == 2 ? -8 : 8);
    Scene scene(hive.bytes);
    scene.file().arm({});
    EXPECT_TRUE(engine::free_cell(store_of(scene), engine::cell_offset(bin + 32 + 8 * 302)));
    EXPECT_EQ(cells(scene.bytes(), bin)[0], 16);
    EXPECT_EQ(cells(scene.bytes(), bin)[200], 40);
    const MemoryFile::Counts& counts = scene.file().counts();
    return counts.reads + counts.writes;
}

TEST(Allocator, freeing_among_small_cells_takes_calls_in_step_with_the_bin_and_not_with_its_square) {
    EXPECT_LT(calls_to_free_among(64 * 1024 - 32), 5 * calls_to_free_among(16 * 1024 - 32));
}

// ---- the window
// ------------------------------------------------------------------------------------------------

class Window : public testing::Test {
protected:
    static HiveLayout layout() {
        HiveLayout layout;
        layout.free_bytes = 60000;
        return layout;
    }
    Window() : scene(layout()) {}
    uint32_t read(int64_t position, uint32_t length) {
        Bytes buffer(length);
        const uint32_t got = engine::read_at(store_of(scene), engine::sig_none, position, buffer.data(), length);
        const auto first = scene.bytes().begin() + static_cast<std::ptrdiff_t>(position);
        EXPECT_TRUE(std::equal(buffer.begin(), buffer.begin() + static_cast<std::ptrdiff_t>(got), first));
        return got;
    }
    Scene scene;
};

TEST_F(Window, twenty_bytes_at_16380_load_the_window_at_12288) {
    store_of(scene).window.valid = false;
    EXPECT_EQ(read(16380, 20), 20U);
    EXPECT_TRUE(store_of(scene).window.valid);
    EXPECT_EQ(store_of(scene).window.start, 12288);
}

TEST_F(Window, a_read_that_no_window_can_hold_goes_past_it) {
    read(4096, 4);
    const int64_t start = store_of(scene).window.start;
    scene.file().arm({});
    EXPECT_EQ(read(4000 + 4096, 13000), 13000U);
    EXPECT_EQ(scene.file().counts().bytes_read, 13000U);
    EXPECT_EQ(store_of(scene).window.start, start);
}

TEST_F(Window, reads_inside_it_do_not_reach_the_file) {
    store_of(scene).window.valid = false;
    read(8192, 4);
    scene.file().arm({});
    EXPECT_EQ(read(8192 + 16380, 4), 4U);
    EXPECT_EQ(scene.file().counts().reads, 0U);
}

TEST_F(Window, a_write_into_it_makes_the_next_read_come_from_the_file) {
    const int64_t place = 8192 + 108;  // near the bin's header, which a write looks at
    for (const uint8_t byte : {uint8_t{0x55}, uint8_t{0x66}}) {
        store_of(scene).window.valid = false;
        read(place, 4);
        EXPECT_EQ(store_of(scene).window.start, 8192);
        EXPECT_EQ(engine::write_at(store_of(scene), engine::sig_none, place + 4, &byte, 1), 1U);
        EXPECT_EQ(scene.bytes()[static_cast<size_t>(place) + 4], byte);
        EXPECT_EQ(read(place, 8), 8U);  // holds what it reads against the file
    }
}

TEST_F(Window, a_record_at_the_very_end_of_the_file_is_read_as_far_as_it_goes) {
    EXPECT_EQ(read(static_cast<int64_t>(scene.bytes().size()) - 10, 20), 10U);
    EXPECT_EQ(engine::read_at(store_of(scene), engine::sig_none, static_cast<int64_t>(scene.bytes().size()) + 5000,
                              nullptr, 4),
              0U);
}

TEST_F(Window, a_key_record_one_byte_too_long_is_written_without_that_byte_and_two_are_refused) {
    const uint32_t root = get32(scene.bytes(), 36);
    const auto first = scene.bytes().begin() + 4100 + static_cast<std::ptrdiff_t>(root);
    Bytes record(first, first + 76 + 4 + 2);  // named ROOT
    const auto write = [&](uint32_t length) {
        return engine::write_at(store_of(scene), engine::sig_key, 4100 + int64_t{root}, record.data(), length);
    };
    scene.file().arm({});
    EXPECT_EQ(write(81), 80U);
    EXPECT_EQ(scene.file().counts().bytes_written, 80U);
    EXPECT_EQ(write(82), 0U);
    EXPECT_EQ(scene.file().counts().bytes_written, 80U);
    EXPECT_EQ(write(76), 76U);
    record[0] = 'x';
    EXPECT_EQ(write(80), 0U);
    EXPECT_TRUE(scene.Untouched());
}

// "vk" records keep the same rule as "nk" records.
TEST_F(Window, a_value_record_one_byte_too_long_is_written_without_that_byte_and_two_are_refused) {
    const int64_t place = static_cast<int64_t>(scene.bytes().size()) - 400;  // in the free cell
    Bytes record(26, 0);
    record[0] = 'v';
    record[1] = 'k';
    record[2] = 4;
    const auto write = [&](uint32_t length) {
        return engine::write_at(store_of(scene), engine::sig_value, place, record.data(), length);
    };
    scene.file().arm({});
    EXPECT_EQ(write(25), 24U);
    EXPECT_EQ(scene.file().counts().bytes_written, 24U);
    EXPECT_EQ(write(26), 0U);
    EXPECT_EQ(scene.file().counts().bytes_written, 24U);
    EXPECT_EQ(write(24), 24U);
}

}  // namespace
