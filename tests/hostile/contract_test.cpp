// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Where the contract says what a damaged or odd hive gives, it gives that.
#include "catalogue.h"
#include "scene.h"

#include <gtest/gtest.h>

namespace hostile {

namespace {

using testkit::get32;
using testkit::Handle;
using testkit::Hive;
using testkit::pattern;
using testkit::Scene;

struct Counts {
    uint32_t subkeys = 99;
    uint32_t values = 99;
};

Counts counts_of(RegistryKey* key) {
    Counts counts;
    RQueryInfoKeyW(key, nullptr, nullptr, nullptr, nullptr, &counts.subkeys, nullptr, nullptr, &counts.values, nullptr,
                   nullptr, nullptr, nullptr);
    return counts;
}

int32_t status_of(Scene& scene, const std::string& path, const std::string& value) {
    Handle key = scene.OpenKey(path);
    Bytes data(70000);
    auto size = static_cast<uint32_t>(data.size());
    return RQueryValueExW(key.get(), value.c_str(), nullptr, data.data(), &size);
}

// ---- counts are claims
// ----------------------------------------------------------------------------------------------

struct Cut {
    const char* name;
    const char* key;
    uint32_t subkeys;
    uint32_t values;
    bool of_subkeys;  // which of the two was cut, and cannot be changed
};

class CountCut : public testing::TestWithParam<Cut> {};

TEST_P(CountCut, to_what_the_cells_hold_and_no_change_there) {
    const Cut& cut = GetParam();
    Scene scene(case_of(cut.name).bytes);
    ASSERT_TRUE(scene.is_open());
    {
        Handle key = scene.OpenKey(cut.key);
        ASSERT_TRUE(key);
        EXPECT_EQ(counts_of(key.get()).subkeys, cut.subkeys);
        EXPECT_EQ(counts_of(key.get()).values, cut.values);
        RegistryKey* none_there = nullptr;
        EXPECT_EQ(ROpenSubKey(key.get(), cut.subkeys, &none_there), R_NO_MORE_ITEMS);
        EXPECT_EQ(REnumValueW(key.get(), cut.values, nullptr, nullptr, nullptr, nullptr, nullptr), R_NO_MORE_ITEMS);
    }
    if (cut.of_subkeys)
        EXPECT_EQ(scene.Create(std::string(cut.key) + "\\New"), R_INVALID_PARAMETER);
    else
        EXPECT_EQ(scene.Set(cut.key, "New", 4, pattern(4)), R_FAILED);
    EXPECT_TRUE(scene.Untouched());
}

INSTANTIATE_TEST_SUITE_P(
    Rows, CountCut,
    testing::Values(Cut{"value_list_shorter_than_a_count_of_6", "Alpha", 3, 5, false},
                    Cut{"value_list_shorter_than_a_count_of_1073741823", "Alpha", 3, 5, false},
                    Cut{"value_list_shorter_than_a_count_of_4294967295", "Alpha", 3, 5, false},
                    Cut{"value_list_cut_by_its_cell", "Alpha", 3, 3, false},
                    Cut{"value_count_of_4294967295_without_a_list", "Zeta", 0, 0, false},
                    Cut{"value_count_of_1073741823_without_a_list", "Zeta", 0, 0, false},
                    Cut{"subkey_count_one_above_its_list", "Alpha", 3, 5, true},
                    Cut{"subkey_count_one_below_its_list", "Alpha", 2, 5, true},
                    Cut{"subkey_count_all_ones", "Alpha", 3, 5, true},
                    Cut{"subkey_count_all_ones_over_an_index_root", "Beta", 5, 0, true},
                    Cut{"subkey_count_of_1_without_a_list", "Zeta", 0, 0, true},
                    Cut{"subkey_count_of_4294967295_without_a_list", "Zeta", 0, 0, true},
                    Cut{"index_count_0", "Alpha", 0, 5, true}, Cut{"index_count_past_its_cell", "Alpha", 3, 5, true},
                    Cut{"index_count_of_65535", "Alpha", 3, 5, true}, Cut{"index_cut_by_its_cell", "Alpha", 1, 5, true},
                    Cut{"ri_points_to_itself", "Beta", 0, 0, true}, Cut{"ri_in_an_ri", "Beta", 2, 0, true},
                    Cut{"ri_points_to_a_key", "Beta", 2, 0, true}, Cut{"ri_has_no_entries", "Beta", 0, 0, true}),
    [](const auto& row) { return row.param.name; });

// ---- depth
// ----------------------------------------------------------------------------------------------------------

// How far down a hive of one key below another can be opened.
uint32_t depth_of(Scene& scene, Handle& deepest) {
    RegistryKey* here = scene.root();
    for (uint32_t depth = 0;; depth++) {
        Handle next;
        if (depth > 2000 || ROpenSubKey(here, 0, next.out()) != R_SUCCESS)
            return depth;
        deepest = std::move(next);
        here = deepest.get();
    }
}

class Deep : public testing::TestWithParam<const char*> {};

TEST_P(Deep, goes_down_512_levels_and_no_further) {
    Scene scene(case_of(GetParam()).bytes);
    ASSERT_TRUE(scene.is_open());
    Handle deepest;
    EXPECT_EQ(depth_of(scene, deepest), 512U);
    EXPECT_EQ(counts_of(deepest.get()).subkeys, 0U);
    Handle made;
    EXPECT_EQ(RCreateKey(deepest.get(), "k", made.out(), nullptr), R_INVALID_PARAMETER);
    EXPECT_EQ(RCreateKey(deepest.get(), "new", made.out(), nullptr), R_INVALID_PARAMETER);
    EXPECT_EQ(RSetValueExW(deepest.get(), "v", 4, "abcd", 4), R_SUCCESS);
    deepest.reset();
    EXPECT_EQ(scene.Close(), R_SUCCESS);
}

INSTANTIATE_TEST_SUITE_P(Chains, Deep,
                         testing::Values("keys_512_deep", "keys_513_deep", "keys_10000_deep", "keys_1000000_deep",
                                         "key_that_lists_itself"),
                         [](const auto& row) { return row.param; });

// ---- what is odd but legal
// ------------------------------------------------------------------------------------------

TEST(FreeSpace, that_fits_a_request_exactly_is_taken_whole) {
    for (const int32_t left : {0, 8}) {
        Damage work;
        work.hive = lay_out(stage());
        const uint32_t cell = work.free_space();
        const auto data_size = static_cast<size_t>(work.hive.cell_size(cell) - left - 4);
        Scene scene(work.hive.bytes);
        const size_t length = scene.bytes().size();
        EXPECT_EQ(scene.Set("Alpha", "Raw", 3, pattern(data_size)), R_SUCCESS);
        EXPECT_EQ(scene.bytes().size(), length);
        EXPECT_EQ(static_cast<int32_t>(get32(scene.bytes(), 4096 + uint64_t{cell})),
                  -static_cast<int32_t>(data_size + 4));
        EXPECT_EQ(scene.Check(), "");
    }
}

TEST(FreeSpace, in_cells_of_8_bytes_is_no_room_for_a_record) {
    Scene scene(case_of("free_space_in_cells_of_8_bytes_alone").bytes);
    const uint32_t end = get32(scene.bytes(), 40);
    EXPECT_EQ(scene.Set("Alpha", "Raw", 3, pattern(3900)), R_SUCCESS);
    EXPECT_EQ(get32(scene.bytes(), 40), end + 4096);
    EXPECT_EQ(scene.Check(), "");
}

// The size words of the cells from a position to the end of the file.
std::vector<int32_t> sizes_from(const Bytes& bytes, uint64_t position) {
    std::vector<int32_t> sizes;
    while (position < bytes.size()) {
        sizes.push_back(static_cast<int32_t>(get32(bytes, position)));
        position += static_cast<uint64_t>(std::abs(sizes.back()));
    }
    return sizes;
}

TEST(FreeSpace, side_by_side_becomes_one_when_a_cell_of_its_bin_is_freed) {
    Damage work;
    work.hive = lay_out(stage());
    const uint64_t first = 4096 + uint64_t{work.free_space()};
    Scene scene(case_of("free_cells_side_by_side").bytes);
    EXPECT_EQ(scene.Set("Alpha", "Raw", 3, pattern(2000)), R_SUCCESS);
    EXPECT_EQ(sizes_from(scene.bytes(), first), (std::vector<int32_t>{8, 8, 16, 24, 8, 64, -2008, 1928}));
    // The data keeps its cell, by way of a spare one behind it, which is freed again.
    EXPECT_EQ(scene.Set("Alpha", "Raw", 3, pattern(1900)), R_SUCCESS);
    EXPECT_EQ(sizes_from(scene.bytes(), first), (std::vector<int32_t>{8 + 8 + 16 + 24 + 8 + 64, -2008, 1928}));
    EXPECT_EQ(scene.Check(), "");
}

TEST(FreeSpace, none_at_all_makes_the_hive_grow_by_a_bin) {
    Scene scene(case_of("no_free_space_at_all").bytes);
    const uint32_t end = get32(scene.bytes(), 40);
    EXPECT_EQ(scene.Create("Zeta\\New"), R_SUCCESS);
    EXPECT_EQ(get32(scene.bytes(), 40), end + 4096);
    EXPECT_EQ(scene.Check(), "");
}

TEST(LargeBin, gives_its_room_to_a_large_value) {
    Scene scene(case_of("two_bins_of_a_megabyte").bytes);
    const size_t length = scene.bytes().size();
    EXPECT_EQ(scene.Set("Alpha", "Raw", 3, pattern(900000)), R_SUCCESS);
    EXPECT_EQ(scene.bytes().size(), length);
    EXPECT_EQ(scene.Check(), "");
}

TEST(BehindTheBins, a_new_bin_goes_over_the_bytes_that_look_like_one) {
    Scene scene(case_of("a_whole_bin_behind_the_last_one").bytes);
    const uint32_t end = get32(scene.bytes(), 40);
    EXPECT_EQ(scene.Set("Alpha", "Raw", 3, pattern(5000)), R_SUCCESS);
    EXPECT_EQ(get32(scene.bytes(), 40), end + 8192);
    EXPECT_EQ(get32(scene.bytes(), 4096 + uint64_t{end} + 4), end);
    EXPECT_EQ(get32(scene.bytes(), 4096 + uint64_t{end} + 8), 8192U);
    EXPECT_EQ(scene.bytes().size(), 4096 + size_t{end} + 8192);
    EXPECT_EQ(scene.Check(), "");
    EXPECT_EQ(scene.Changes().size(), 1U);
}

// ---- values
// ---------------------------------------------------------------------------------------------------------

struct ValueStatus {
    const char* name;
    const char* value;
    int32_t status;
};

class ValueOf : public testing::TestWithParam<ValueStatus> {};

TEST_P(ValueOf, gives) {
    Scene scene(case_of(GetParam().name).bytes);
    EXPECT_EQ(status_of(scene, "Alpha", GetParam().value), GetParam().status);
    EXPECT_TRUE(scene.Untouched());
}

INSTANTIATE_TEST_SUITE_P(
    Rows, ValueOf,
    testing::Values(ValueStatus{"value_of_size_7FFFFFFF", "Raw", R_MORE_DATA},
                    ValueStatus{"value_of_size_1_more_than_its_cell", "Raw", R_CAN_NOT_COMPLETE},
                    ValueStatus{"value_of_size_5_inline", "Raw", R_CAN_NOT_COMPLETE},
                    ValueStatus{"value_of_size_0_without_the_inline_bit", "Raw", R_SUCCESS},
                    ValueStatus{"value_of_size_0_with_the_inline_bit", "Raw", R_SUCCESS},
                    ValueStatus{"value_data_minus_1", "Raw", R_CAN_NOT_COMPLETE},
                    ValueStatus{"value_data_at_a_free_cell", "Raw", R_CAN_NOT_COMPLETE},
                    ValueStatus{"value_data_in_the_middle_of_a_free_cell", "Raw", R_CAN_NOT_COMPLETE},
                    ValueStatus{"value_data_misaligned", "Raw", R_CAN_NOT_COMPLETE},
                    ValueStatus{"value_list_with_a_key_in_it", "Raw", R_SUCCESS},
                    // It may be the one asked for, so nobody can say that there is none.
                    ValueStatus{"value_record_of_another_signature", "Text", R_FAILED},
                    ValueStatus{"big_data_of_0_segments", "Big", R_REGISTRY_CORRUPT},
                    ValueStatus{"big_data_of_1_segments", "Big", R_REGISTRY_CORRUPT},
                    ValueStatus{"big_data_of_65535_segments", "Big", R_REGISTRY_IO_FAILED},
                    ValueStatus{"big_data_list_shorter_than_the_count", "Big", R_REGISTRY_IO_FAILED},
                    ValueStatus{"big_data_list_free", "Big", R_REGISTRY_IO_FAILED},
                    ValueStatus{"big_data_first_segment_free", "Big", R_REGISTRY_CORRUPT},
                    ValueStatus{"big_data_segment_short", "Big", R_REGISTRY_CORRUPT},
                    ValueStatus{"big_data_segment_repeated", "Big", R_SUCCESS},
                    ValueStatus{"big_data_total_above_the_size", "Big", R_SUCCESS},
                    ValueStatus{"big_data_total_below_the_size", "Big", R_REGISTRY_CORRUPT}),
    [](const auto& row) { return row.param.name; });

TEST(BigData, whose_list_or_segment_is_no_cell_of_its_own_cannot_be_read) {
    for (const char* target : {"0", "inside_a_bin_header", "negative", "past_the_end", "far_past_the_end", "misaligned",
                               "in_the_middle_of_a_free_cell", "in_the_middle_of_a_used_cell"}) {
        SCOPED_TRACE(target);
        const auto status = [&](const char* field) {
            Scene scene(case_of(std::string("big_data_") + field + "_" + target).bytes);
            return status_of(scene, "Alpha", "Big");
        };
        EXPECT_EQ(status("list"), R_REGISTRY_IO_FAILED);
        EXPECT_EQ(status("first_segment"), R_REGISTRY_CORRUPT);
        EXPECT_EQ(status("last_segment"), R_REGISTRY_CORRUPT);
    }
}

TEST(ValueNames, in_utf16_are_not_taken_for_the_8_bit_name_that_their_bytes_spell) {
    Scene scene(case_of("value_name_in_utf16_whose_bytes_are_those_of_another").bytes);
    Handle key = scene.OpenKey("Alpha");
    EXPECT_EQ(RFindValueA(key.get(), "Text"), 1);
    EXPECT_EQ(RDeleteValue(key.get(), "Text"), R_SUCCESS);
    EXPECT_EQ(RFindValueA(key.get(), "Text"), -1);
    EXPECT_EQ(counts_of(key.get()).values, 5U);
}

TEST(ValueNames, of_two_default_values_each_is_removed_in_turn) {
    Scene scene(case_of("value_name_empty_for_the_second_time").bytes);
    Handle key = scene.OpenKey("Alpha");
    EXPECT_EQ(RFindValueA(key.get(), ""), 0);
    EXPECT_EQ(RDeleteValue(key.get(), ""), R_SUCCESS);
    EXPECT_EQ(RFindValueA(key.get(), ""), 4);
    EXPECT_EQ(RDeleteValue(key.get(), ""), R_SUCCESS);
    EXPECT_EQ(RFindValueA(key.get(), ""), -1);
}

// ---- keys
// -----------------------------------------------------------------------------------------------------------

TEST(KeyRecords, that_cannot_be_read_give_a_status_and_hide_no_sibling) {
    for (const char* name : {"key_record_of_4_bytes", "key_record_of_68_bytes", "key_record_of_another_signature",
                             "key_record_that_ends_before_its_name", "key_name_of_65535_bytes_in_a_short_cell",
                             "key_record_marked_free"}) {
        SCOPED_TRACE(name);
        Scene scene(case_of(name).bytes);
        Handle key = scene.OpenKey("Alpha");
        RegistryKey* opened = nullptr;
        EXPECT_EQ(ROpenSubKey(key.get(), 2, &opened), R_FAILED);
        EXPECT_EQ(opened, nullptr);
        EXPECT_TRUE(scene.OpenKey("Alpha\\Inner"));
        EXPECT_TRUE(scene.OpenKey("Alpha\\Other"));
        EXPECT_EQ(counts_of(key.get()).subkeys, 3U);
        // The name that cannot be read may be the very one.
        EXPECT_NE(scene.Create("Alpha\\New"), R_SUCCESS);
        EXPECT_TRUE(scene.Untouched());
    }
}

TEST(KeyRecords, whose_class_is_not_there_have_none) {
    for (const char* name : {"class_of_14_bytes_past_its_cell", "class_of_65535_bytes_past_its_cell", "class_minus_1",
                             "class_at_a_free_cell", "class_length_without_offset"}) {
        SCOPED_TRACE(name);
        Scene scene(case_of(name).bytes);
        Handle key = scene.OpenKey("class_length_without_offset" == std::string(name) ? "Zeta" : "Alpha");
        uint16_t text[10] = {1, 1, 1};
        uint32_t size = sizeof text;
        EXPECT_EQ(RQueryInfoKeyW(key.get(), nullptr, nullptr, text, &size, nullptr, nullptr, nullptr, nullptr, nullptr,
                                 nullptr, nullptr, nullptr),
                  R_SUCCESS);
        EXPECT_EQ(size, 0U);
    }
}

TEST(KeyOrder, of_whatever_rule_every_key_is_found_and_a_new_one_is_found_again) {
    for (const char* kind : {"hash_leaf_", "fast_leaf_", "plain_leaf_"}) {
        for (const char* order : {"unsorted", "descending", "sorted_lower_cased", "sorted_by_bytes", "sorted_by_length",
                                  "sorted_with_bytes_above_7F_first"}) {
            SCOPED_TRACE(std::string(kind) + order);
            Scene scene(case_of(std::string(kind) + order).bytes);
            Handle key = scene.OpenKey("Alpha");
            for (const std::string& name : testkit::subkey_names(key.get())) {
                EXPECT_TRUE(scene.OpenKey("Alpha\\" + name)) << name;
                uint32_t disposition = 9;
                EXPECT_EQ(scene.Create("Alpha\\" + name, &disposition), R_SUCCESS);
                EXPECT_EQ(disposition, 1U) << "made a second time: " << name;
            }
            key.reset();
            EXPECT_TRUE(scene.Untouched());
            EXPECT_EQ(scene.Create("Alpha\\kk"), R_SUCCESS);
            EXPECT_TRUE(scene.OpenKey("Alpha\\KK"));
        }
    }
}

// ---- security
// -------------------------------------------------------------------------------------------------------

// The ring is left as it is where the record's neighbours do not agree with it.
TEST(Security, record_in_a_broken_ring_is_counted_down_and_stays) {
    std::vector<std::string> names = {"security_next_does_not_point_back", "security_previous_does_not_point_forward",
                                      "security_ring_of_one", "security_ring_of_one_that_the_others_point_into"};
    for (const char* target :
         {"inside_a_bin_header", "past_the_end", "far_past_the_end", "at_a_free_cell", "in_the_middle_of_a_free_cell",
          "in_the_middle_of_a_used_cell", "misaligned", "at_its_own_record", "at_a_record_of_another_kind"}) {
        names.push_back(std::string("security_next_") + target);
        names.push_back(std::string("security_previous_") + target);
    }
    for (const std::string& name : names) {
        SCOPED_TRACE(name);
        Scene scene(case_of(name).bytes);
        const LaidHive laid = lay_out(stage());
        const auto field = [&](size_t which, uint32_t at) {
            return get32(scene.bytes(), LaidHive::position(laid.security[which], at));
        };
        const uint32_t links[] = {field(0, 4), field(0, 8), field(1, 4), field(1, 8)};
        EXPECT_EQ(scene.Delete("Gamma\\moon"), R_SUCCESS);
        EXPECT_EQ(field(0, 4), links[0]);
        EXPECT_EQ(field(0, 8), links[1]);
        EXPECT_EQ(field(1, 4), links[2]);
        EXPECT_EQ(field(1, 8), links[3]);
        EXPECT_EQ(field(2, 12), 0U);
        EXPECT_LT(static_cast<int32_t>(get32(scene.bytes(), 4096 + uint64_t{laid.security[2]})), 0);
    }
}

// An offset of 0 or less is no neighbour: the ring is a list that ends there.
TEST(Security, record_at_the_end_of_a_list_goes_out_of_it) {
    for (const char* target : {"0", "minus_1", "negative"}) {
        SCOPED_TRACE(target);
        const LaidHive laid = lay_out(stage());
        const auto after_deletion = [&](const std::string& field, size_t which, uint32_t at) {
            Scene scene(case_of("security_" + field + "_" + target).bytes);
            const uint32_t end = get32(scene.bytes(), LaidHive::position(laid.security[2], field == "next" ? 4 : 8));
            EXPECT_EQ(scene.Delete("Gamma\\moon"), R_SUCCESS);
            EXPECT_EQ(get32(scene.bytes(), LaidHive::position(laid.security[which], at)), end);
            EXPECT_GT(static_cast<int32_t>(get32(scene.bytes(), 4096 + uint64_t{laid.security[2]})), 0);
        };
        after_deletion("next", 1, 4);
        after_deletion("previous", 0, 8);
    }
}

TEST(Security, count_below_1_or_too_high_frees_nothing) {
    for (const char* name : {"security_count_0", "security_count_too_high", "security_count_all_ones"}) {
        SCOPED_TRACE(name);
        Scene scene(case_of(name).bytes);
        const LaidHive laid = lay_out(stage());
        EXPECT_EQ(scene.Delete("Gamma\\moon"), R_SUCCESS);
        EXPECT_LT(static_cast<int32_t>(get32(scene.bytes(), 4096 + uint64_t{laid.security[2]})), 0);
    }
}

TEST(Security, that_is_none_refuses_a_new_key_and_asks_1003) {
    for (const char* name : {"security_at_no_security_record", "security_record_marked_free",
                             "security_record_with_another_signature", "security_record_cut_by_its_cell"}) {
        SCOPED_TRACE(name);
        Scene scene(case_of(name).bytes);
        Handle key = scene.OpenKey("Gamma\\moon");
        uint32_t size = 0;
        EXPECT_EQ(RQueryInfoKeyA(key.get(), nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr,
                                 nullptr, nullptr, &size, nullptr),
                  R_CAN_NOT_COMPLETE);
        key.reset();
        EXPECT_EQ(scene.Create("Gamma\\moon\\New"), R_INVALID_PARAMETER);
        EXPECT_TRUE(scene.Untouched());
    }
}

}  // namespace

}  // namespace hostile
