// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT

// Creating keys, storing and removing values: what the file holds afterwards, as the independent reader and
// checker see it.
#include "scene.h"

#include <gtest/gtest.h>

using namespace testkit;

namespace {

HiveLayout tree() {
    HiveLayout layout;
    KeyLayout& key = layout.root.add("Alpha");
    key.set("Hundred", 3, pattern(100));
    key.set("Four", 4, {1, 2, 3, 4});
    layout.root.add("Empty");
    return layout;
}

class Changing : public testing::Test {
protected:
    Changing() : scene(tree()) {}
    const Key* find(const std::string& path) {
        hive = scene.Read();
        return hive.find(path);
    }
    uint32_t record_of(const std::string& path) { return find(path)->offset; }
    uint32_t field(const std::string& path, uint32_t offset) {
        return get32(scene.bytes(), 4100 + uint64_t{record_of(path)} + offset);
    }
    Bytes data(const std::string& path, const std::string& name) {
        const Key* key = find(path);
        const Value* value = key == nullptr ? nullptr : find_value(*key, name);
        return value == nullptr ? Bytes{} : value->data;
    }
    Scene scene;
    Hive hive;
};

TEST_F(Changing, every_call_on_a_read_only_hive_gives_1013) {
    scene.Close();
    scene.file().read_only = true;
    ASSERT_TRUE(scene.Open());
    Handle key = scene.OpenKey("Alpha");
    Handle made;
    uint32_t disposition = 9;
    EXPECT_EQ(RCreateKey(key.get(), "New", made.out(), &disposition), R_CANTWRITE);
    EXPECT_EQ(RSetValueExW(key.get(), "v", 1, "ab", 2), R_CANTWRITE);
    EXPECT_EQ(RSetValueExA(key.get(), "v", 1, "ab", 2), R_CANTWRITE);
    EXPECT_EQ(RDeleteValue(key.get(), "Four"), R_CANTWRITE);
    EXPECT_EQ(RRenameKey(scene.root(), 0, "New"), R_CANTWRITE);
    EXPECT_EQ(RDeleteKey(key.get(), "None"), R_CANTWRITE);
    EXPECT_EQ(RCheckDeleteTree(scene.root(), 0), R_CANTWRITE);
    // What is there opens all the same.
    EXPECT_EQ(RCreateKey(scene.root(), "Alpha", made.out(), &disposition), 0);
    EXPECT_EQ(disposition, 1U);
    EXPECT_TRUE(scene.Untouched());
}

TEST_F(Changing, a_null_key_is_refused_by_every_call) {
    const Handle open = scene.OpenKey("Alpha");
    RegistryKey* made = open.get();
    EXPECT_EQ(RCreateKey(nullptr, "New", &made, nullptr), R_FAILED);
    EXPECT_EQ(made, nullptr);
    EXPECT_EQ(RCloseHive(scene.root()), R_DEVICE_IN_USE) << "a handle that stood in the output was closed";
    EXPECT_EQ(RCreateKey(scene.root(), "New", nullptr, nullptr), R_INVALID_PARAMETER);
    EXPECT_EQ(RSetValueExW(nullptr, "v", 1, "ab", 2), R_INVALID_HANDLE);
    EXPECT_EQ(RSetValueExA(nullptr, "v", 1, "ab", 2), R_INVALID_HANDLE);
    EXPECT_EQ(RDeleteValue(nullptr, "v"), R_INVALID_HANDLE);
    EXPECT_EQ(RRenameKey(nullptr, 0, "x"), R_INVALID_HANDLE);
    EXPECT_EQ(RDeleteKey(nullptr, "x"), R_INVALID_HANDLE);
    EXPECT_EQ(RCheckDeleteTree(nullptr, 0), R_INVALID_HANDLE);
    EXPECT_TRUE(scene.Untouched());
}

TEST_F(Changing, data_that_no_hive_has_room_for_is_refused_without_a_look_at_it) {
    const Handle key = scene.OpenKey("Alpha");
    for (const uint32_t size : {0x3FFFFFFFU, 0x7FFFF000U, 0x7FFFFFFFU, 0x80000000U, 0xFFFFFFFFU}) {
        EXPECT_EQ(RSetValueExA(key.get(), "v", 1, "ab", size), R_FAILED) << size;
        EXPECT_TRUE(scene.Untouched()) << size;
    }
    for (const uint32_t size : {0x7FFFF000U, 0x7FFFFFFFU, 0x80000000U, 0xFFFFFFFFU}) {
        EXPECT_EQ(RSetValueExW(key.get(), "v", 3, "ab", size), R_FAILED) << size;
        EXPECT_TRUE(scene.Untouched()) << size;
    }
}

// ---- creating
// ---------------------------------------------------------------------------------------------------

TEST_F(Changing, creating_what_exists_gives_disposition_1_and_writes_nothing) {
    uint32_t disposition = 9;
    EXPECT_EQ(scene.Create("aLPHA", &disposition), 0);
    EXPECT_EQ(disposition, 1U);
    EXPECT_TRUE(scene.Untouched());
}

TEST_F(Changing, creating_a_path_makes_every_missing_component) {
    uint32_t disposition = 9;
    EXPECT_EQ(scene.Create("\\Alpha\\b\\\\c\\d", &disposition), 0);
    EXPECT_EQ(disposition, 0U);
    EXPECT_EQ(scene.Changes(),
              (std::vector<std::string>{"+ key Alpha\\b", "+ key Alpha\\b\\c", "+ key Alpha\\b\\c\\d"}));
    EXPECT_EQ(scene.Check(), "");
}

TEST_F(Changing, a_path_that_cannot_be_made_gives_87) {
    for (const char* path : {"", "\\", "\\\\\\"})
        EXPECT_EQ(scene.Create(path), R_INVALID_PARAMETER);
    Handle made;
    EXPECT_EQ(RCreateKey(scene.root(), nullptr, made.out(), nullptr), R_INVALID_PARAMETER);
    EXPECT_FALSE(made);
    EXPECT_TRUE(scene.Untouched());
}

TEST_F(Changing, a_name_too_long_to_be_stored_leads_to_no_key_that_begins_like_it) {
    HiveLayout layout;
    layout.root.add(std::string(600, 'm'));
    Scene other(layout);
    for (const size_t length : {260U, 519U, 520U, 521U, 600U}) {
        Handle made;
        EXPECT_EQ(RCreateKey(other.root(), std::string(length, 'm').c_str(), made.out(), nullptr), R_INVALID_PARAMETER);
        EXPECT_FALSE(made);
    }
    EXPECT_TRUE(other.Untouched());
}

TEST_F(Changing, a_new_key_takes_time_class_and_security_from_its_parent) {
    HiveLayout layout = tree();
    layout.security_records = 2;
    layout.root.children[0].security = 1;
    layout.root.children[0].class_name = u"Klass";
    layout.root.children[0].time = 0x1122334455667788;
    Scene other(layout);
    ASSERT_EQ(other.Create("Alpha\\New"), 0);
    const Hive now = other.Read();
    const Key* made = now.find("Alpha\\New");
    ASSERT_NE(made, nullptr);
    EXPECT_EQ(made->time, 0x1122334455667788U);
    EXPECT_EQ(made->class_name, u"Klass");
    const auto class_cell = [&](const Key& key) { return get32(other.bytes(), 4100 + uint64_t{key.offset} + 48); };
    EXPECT_EQ(class_cell(*made), class_cell(*now.find("Alpha")));
    EXPECT_EQ(made->flags, 0x20);
    EXPECT_EQ(made->security, now.find("Alpha")->security);
    EXPECT_EQ(get32(other.bytes(), 4100 + uint64_t{made->offset} + 68), 0xB2B2B2B2U);
    EXPECT_EQ(other.Check(), "");
}

TEST_F(Changing, the_first_subkey_gets_a_leaf_of_the_hives_kind_with_one_entry) {
    for (Leaf leaf : {Leaf::fast, Leaf::hash}) {
        HiveLayout layout = tree();
        layout.leaf = leaf;
        Scene other(layout);
        ASSERT_EQ(other.Create("Empty\\ab"), 0);
        const uint32_t key = other.Read().find("Empty")->offset;
        const uint64_t index = 4100 + uint64_t{get32(other.bytes(), 4100 + uint64_t{key} + 28)};
        EXPECT_EQ(get16(other.bytes(), index), leaf == Leaf::fast ? 0x666C : 0x686C);
        EXPECT_EQ(get16(other.bytes(), index + 2), 1);
        EXPECT_EQ(get32(other.bytes(), index + 8), leaf == Leaf::fast ? 0x6261U : 2471U);
        EXPECT_EQ(other.Check(), "");
    }
}

TEST_F(Changing, new_keys_go_where_upper_cased_order_wants_them_in_every_kind_of_index) {
    for (Leaf leaf : {Leaf::fast, Leaf::hash, Leaf::plain}) {
        for (size_t per_leaf : {0U, 3U}) {
            HiveLayout layout;
            KeyLayout& many = layout.root.add("many");
            layout.leaf = leaf == Leaf::plain ? Leaf::hash : leaf;
            many.own_leaf = true;
            many.leaf = leaf;
            many.per_leaf = per_leaf;
            for (const char* name : {"b", "d", "f", "h", "j", "l", "n"})
                many.add(name);
            Scene other(layout);
            ASSERT_TRUE(other.is_open());
            for (const char* name : {"a", "z", "E", "e_", "_", "[", "^x", "C", "zz", "I", "\xC4", "m`", "aa"}) {
                EXPECT_EQ(other.Create(std::string("many\\") + name), 0) << name;
                EXPECT_EQ(other.Check(), "") << name;
            }
            EXPECT_TRUE(other.Reopen());
            EXPECT_EQ(other.Read().find("many")->children.size(), 20U);
            EXPECT_TRUE(other.OpenKey("MANY\\E_"));
        }
    }
}

TEST_F(Changing, the_handle_sees_the_key_made_through_it) {
    Handle made;
    EXPECT_EQ(RCreateKey(scene.root(), "A longer name", made.out(), nullptr), 0);
    EXPECT_EQ(subkey_names(scene.root()), (std::vector<std::string>{"A longer name", "Alpha", "Empty"}));
    uint32_t longest = 0;
    RQueryInfoKeyA(scene.root(), nullptr, nullptr, nullptr, nullptr, nullptr, &longest, nullptr, nullptr, nullptr,
                   nullptr, nullptr, nullptr);
    EXPECT_EQ(longest, 13U);
}

// Since Vista the field's upper half holds flags, in nine of ten keys of a real hive.
TEST_F(Changing, the_longest_subkey_name_is_raised_beside_the_flags_that_windows_keeps_with_it) {
    constexpr uint32_t flags = 0x00A10000;
    HiveLayout layout;
    layout.root.add("Top").add("one");
    LaidHive laid = lay_out(layout);
    const uint32_t top = laid.at("Top").record;
    laid.put32(top, 52, flags | 2 * 3);
    Scene other(laid.bytes);
    const auto field = [&] { return get32(other.bytes(), LaidHive::position(top, 52)); };
    EXPECT_EQ(other.Create("Top\\fourteen chars"), 0);
    EXPECT_EQ(field(), flags | 2 * 14);
    EXPECT_EQ(other.Rename("Top\\one", "nineteen characters"), 0);
    EXPECT_EQ(field(), flags | 2 * 19);
    EXPECT_EQ(other.Check(), "");
    const Handle key = other.OpenKey("Top");
    uint32_t longest = 0;
    EXPECT_EQ(RQueryInfoKeyA(key.get(), nullptr, nullptr, nullptr, nullptr, nullptr, &longest, nullptr, nullptr,
                             nullptr, nullptr, nullptr, nullptr),
              0);
    EXPECT_EQ(longest, 19U);
}

TEST_F(Changing, five_hundred_keys_grow_the_leaf_and_the_hive) {
    for (int i = 0; i < 500; i++)
        ASSERT_EQ(scene.Create("Empty\\k" + std::to_string((i * 7919) % 1000)), 0);
    EXPECT_EQ(scene.Check(), "");
    EXPECT_EQ(find("Empty")->children.size(), 500U);
    EXPECT_TRUE(scene.Reopen());
}

// ---- storing
// -------------------------------------------------------------------------------------------------------

TEST_F(Changing, the_first_value_gets_a_list_of_8_bytes) {
    EXPECT_EQ(scene.Set("Empty", "One", 4, {1, 0, 0, 0}), 0);
    EXPECT_EQ(get32(scene.bytes(), 4096 + uint64_t{field("Empty", 40)}), static_cast<uint32_t>(-8));
    EXPECT_EQ(scene.Check(), "");
    EXPECT_EQ(scene.Changes(), (std::vector<std::string>{"+ value Empty : One type 4 data 01000000"}));
}

TEST_F(Changing, four_bytes_are_inline_and_five_are_not) {
    EXPECT_EQ(scene.Set("Empty", "four", 3, pattern(4)), 0);
    EXPECT_EQ(scene.Set("Empty", "five", 3, pattern(5)), 0);
    const Key* key = find("Empty");
    EXPECT_EQ(get32(scene.bytes(), 4100 + uint64_t{key->values[0].offset} + 4), 0x80000004U);
    EXPECT_EQ(get32(scene.bytes(), 4100 + uint64_t{key->values[1].offset} + 4), 5U);
    EXPECT_EQ(scene.Check(), "");
}

class DataSizes : public testing::TestWithParam<std::pair<size_t, size_t>> {};

TEST_P(DataSizes, from_one_to_another_reads_back) {
    Scene scene(tree());
    const auto [first, second] = GetParam();
    ASSERT_EQ(scene.Set("Empty", "v", 3, pattern(first)), 0);
    EXPECT_EQ(scene.Check(), "");
    ASSERT_EQ(scene.Set("Empty", "V", 1, pattern(second, 9)), 0);
    // Going inline keeps the old data cell: storing a value frees none. A grown cell is freed.
    EXPECT_EQ(scene.Check(first > 4 && second <= 4 ? 1 : 0), "");
    const Hive hive = scene.Read();
    const Value* value = find_value(*hive.find("Empty"), "v");
    EXPECT_EQ(value->data, pattern(second, 9));
    EXPECT_EQ(value->type, 1U);
    EXPECT_EQ(value->name, u"v");
    EXPECT_EQ(hive.find("Empty")->values.size(), 1U);
}

INSTANTIATE_TEST_SUITE_P(Changing, DataSizes,
                         testing::Values(std::pair{0U, 0U}, std::pair{0U, 5U}, std::pair{4U, 5U}, std::pair{4U, 100U},
                                         std::pair{5U, 4U}, std::pair{100U, 4U}, std::pair{100U, 0U},
                                         std::pair{100U, 50U}, std::pair{100U, 101U}, std::pair{100U, 5000U},
                                         std::pair{20000U, 100000U}, std::pair{100000U, 3U}));

TEST_F(Changing, setting_100_bytes_to_4_keeps_the_old_data_cell) {
    EXPECT_EQ(scene.Set("Alpha", "Hundred", 4, {9, 9, 9, 9}), 0);
    EXPECT_EQ(scene.Check(1), "");
    EXPECT_EQ(data("Alpha", "Hundred"), (Bytes{9, 9, 9, 9}));
}

TEST_F(Changing, growing_from_inline_allocates_and_shrinking_keeps_the_big_cell) {
    EXPECT_EQ(scene.Set("Alpha", "Four", 3, pattern(100)), 0);
    const uint32_t record = find_value(*find("Alpha"), "Four")->offset;
    const uint32_t cell = get32(scene.bytes(), 4100 + uint64_t{record} + 8);
    EXPECT_EQ(scene.Set("Alpha", "Four", 3, pattern(10)), 0);
    EXPECT_EQ(get32(scene.bytes(), 4100 + uint64_t{record} + 8), cell);
    EXPECT_EQ(get32(scene.bytes(), 4096 + uint64_t{cell}), static_cast<uint32_t>(-104));
    EXPECT_EQ(scene.Check(), "");
}

TEST_F(Changing, the_default_value_has_flags_0_and_a_named_one_1) {
    EXPECT_EQ(scene.Set("Empty", "", 1, text_data("x")), 0);
    EXPECT_EQ(scene.Set("Empty", "n", 1, text_data("x")), 0);
    const Key* key = find("Empty");
    EXPECT_EQ(get16(scene.bytes(), 4100 + uint64_t{key->values[0].offset} + 16), 0);
    EXPECT_EQ(get16(scene.bytes(), 4100 + uint64_t{key->values[1].offset} + 16), 1);
}

TEST_F(Changing, the_maxima_follow_names_and_data) {
    EXPECT_EQ(scene.Set("Empty", "abcdefgh", 3, pattern(300)), 0);
    EXPECT_EQ(field("Empty", 60), 16U);
    EXPECT_EQ(field("Empty", 64), 300U);
    EXPECT_EQ(scene.Set("Empty", "abc", 3, pattern(30)), 0);
    EXPECT_EQ(field("Empty", 60), 16U);
    EXPECT_EQ(field("Empty", 64), 300U);
}

TEST_F(Changing, the_maxima_stay_as_they_were_when_a_value_cannot_be_stored) {
    HiveLayout layout = tree();
    layout.no_free_space = true;
    Scene full(layout);
    full.file().capacity = full.bytes().size();
    EXPECT_NE(full.Set("Alpha", "A new value with a long name", 3, pattern(5000)), 0);
    EXPECT_NE(full.Set("Alpha", "Hundred", 3, pattern(5000)), 0);
    const uint32_t record = full.Read().find("Alpha")->offset;
    EXPECT_EQ(get32(full.bytes(), LaidHive::position(record, 60)), 14U);
    EXPECT_EQ(get32(full.bytes(), LaidHive::position(record, 64)), 100U);
    EXPECT_EQ(full.Changes(), std::vector<std::string>());
}

TEST_F(Changing, data_that_fits_its_cell_needs_no_room_on_a_full_disk) {
    HiveLayout layout = tree();
    layout.no_free_space = true;
    Scene full(layout);
    full.file().capacity = full.bytes().size();
    EXPECT_EQ(full.Set("Alpha", "Hundred", 3, pattern(50, 7)), 0);  // shorter
    EXPECT_EQ(full.Set("Alpha", "Hundred", 9, pattern(50, 8)), 0);  // another type
    EXPECT_EQ(full.Check(), "");
    EXPECT_EQ(full.Changes().size(), 1U);
    const Hive now = full.Read();
    EXPECT_EQ(find_value(*now.find("Alpha"), "Hundred")->data, pattern(50, 8));
    EXPECT_EQ(find_value(*now.find("Alpha"), "Hundred")->type, 9U);
    EXPECT_EQ(full.Set("Alpha", "Hundred", 3, pattern(101)), R_FAILED);
}

// What the call says is what the file holds, whichever write fails.
TEST_F(Changing, an_update_that_a_failed_write_cuts_short_says_whether_the_new_data_is_there) {
    for (const bool full : {false, true}) {
        HiveLayout layout = tree();
        layout.no_free_space = full;
        for (uint64_t nth = 1;; nth++) {
            Scene other(layout);
            if (full)
                other.file().capacity = other.bytes().size();
            other.file().arm({MemoryFile::Call::write, nth, false, false});
            const int32_t status = other.Set("Alpha", "Hundred", 3, pattern(50, 7));
            if (!other.file().failed()) {
                EXPECT_GT(nth, 1U);
                break;
            }
            const Hive now = other.Read();
            EXPECT_EQ(find_value(*now.find("Alpha"), "Hundred")->data, status == 0 ? pattern(50, 7) : pattern(100))
                << nth;
        }
    }
}

TEST_F(Changing, data_that_begins_like_a_record_is_updated_in_its_own_cell) {
    for (const std::string signature : {"nk", "vk", "sk", "lf", "lh", "li", "ri", "db"}) {
        HiveLayout layout;
        Bytes stored = pattern(100);
        std::copy(signature.begin(), signature.end(), stored.begin());
        stored[2] = 1;  // as an index it would have one entry
        stored[3] = 0;
        layout.root.add("Key").set("v", 3, stored);
        const LaidHive laid = lay_out(layout);
        Scene other(laid.bytes);
        EXPECT_EQ(other.Set("Key", "v", 3, pattern(100, 7)), 0);
        EXPECT_EQ(other.Check(), "") << signature;
        EXPECT_EQ(get32(other.bytes(), LaidHive::position(laid.at("Key").values[0].record, 8)),
                  laid.at("Key").values[0].data)
            << signature;
        EXPECT_EQ(find_value(*other.Read().find("Key"), "v")->data, pattern(100, 7)) << signature;
    }
}

TEST_F(Changing, two_hundred_values_grow_the_list) {
    for (int i = 0; i < 200; i++) {
        ASSERT_EQ(scene.Set("Empty", "v" + std::to_string(i), 3, pattern(static_cast<size_t>(i))), 0);
        ASSERT_EQ(scene.Check(), "") << i;
    }
    for (int i = 0; i < 200; i++)
        EXPECT_EQ(data("Empty", "v" + std::to_string(i)), pattern(static_cast<size_t>(i)));
}

TEST_F(Changing, text_of_an_A_call_is_widened_and_other_data_is_not) {
    Handle key = scene.OpenKey("Empty");
    EXPECT_EQ(RSetValueExA(key.get(), "text", 1, "ab", 3), 0);
    EXPECT_EQ(RSetValueExA(key.get(), "open", 1, "ab", 2), 0);  // without the zero that ends it
    EXPECT_EQ(RSetValueExA(key.get(), "multi", 7, "ab\0c\0", 5), 0);
    EXPECT_EQ(RSetValueExA(key.get(), "raw", 3, "abcdef", 6), 0);
    EXPECT_EQ(data("Empty", "text"), text_data("ab"));
    EXPECT_EQ(data("Empty", "open"), (Bytes{'a', 0, 'b', 0}));
    EXPECT_EQ(data("Empty", "multi"), (Bytes{'a', 0, 'b', 0, 0, 0, 'c', 0, 0, 0, 0, 0}));
    EXPECT_EQ(data("Empty", "raw"), (Bytes{'a', 'b', 'c', 'd', 'e', 'f'}));
    EXPECT_EQ(scene.Check(), "");
}

TEST_F(Changing, big_data_that_is_set_becomes_one_plain_cell) {
    HiveLayout layout = tree();
    layout.root.children[0].set("Big", 3, pattern(40000)).storage = Storage::big;
    Scene other(layout);
    EXPECT_EQ(other.Set("Alpha", "Big", 3, pattern(30000, 5)), 0);
    const Hive now = other.Read();
    EXPECT_EQ(find_value(*now.find("Alpha"), "Big")->data, pattern(30000, 5));
    EXPECT_EQ(text_of(other.Examine().faults), "");
}

// ---- removing
// ------------------------------------------------------------------------------------------------------

TEST_F(Changing, deleting_the_only_value_sets_the_list_to_none) {
    EXPECT_EQ(scene.Set("Empty", "v", 4, {1, 2, 3, 4}), 0);
    EXPECT_EQ(scene.DeleteValue("Empty", "V"), 0);
    EXPECT_EQ(field("Empty", 36), 0U);
    EXPECT_EQ(field("Empty", 40), none);
    EXPECT_EQ(scene.Check(1), "");  // the list's cell
    EXPECT_EQ(scene.Changes(), std::vector<std::string>{});
}

TEST_F(Changing, deleting_a_value_closes_the_gap_and_keeps_its_data_cell) {
    EXPECT_EQ(scene.DeleteValue("Alpha", "hundred"), 0);
    EXPECT_EQ(scene.Check(1), "");
    EXPECT_EQ(find("Alpha")->values.size(), 1U);
    EXPECT_EQ(data("Alpha", "Four"), (Bytes{1, 2, 3, 4}));
}

TEST_F(Changing, deleting_a_value_that_is_not_there_gives_1003) {
    EXPECT_EQ(scene.DeleteValue("Alpha", "None"), R_CAN_NOT_COMPLETE);
    EXPECT_EQ(scene.DeleteValue("Empty", ""), R_CAN_NOT_COMPLETE);
    EXPECT_TRUE(scene.Untouched());
}

}  // namespace
