// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT

// What a change in a damaged hive once did to keys and values that nobody had named.
#include "scene.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <cstring>

using namespace testkit;

namespace {

HiveLayout tree() {
    HiveLayout layout;
    layout.free_bytes = 600;
    KeyLayout& alpha = layout.root.add("Alpha");
    alpha.set("Text", 1, text_data("hello"));
    alpha.set("Raw", 3, pattern(100));
    alpha.add("Inner");
    alpha.add("Other");
    layout.root.add("Beta").set("v", 3, pattern(40));
    layout.root.add("Gamma").add("leaf");
    return layout;
}

// Copies a used cell to another place, size word and all.
void copy_cell(LaidHive& hive, uint32_t from, uint32_t to) {
    memcpy(hive.bytes.data() + 4096 + to, hive.bytes.data() + 4096 + from, static_cast<size_t>(-hive.cell_size(from)));
}

uint32_t last_bin(const LaidHive& hive) { return get32(hive.bytes, 40) - 4096; }

TEST(Damaged, a_record_that_stands_inside_a_free_cell_is_not_read_since_the_next_cell_goes_over_it) {
    LaidHive hive = lay_out(tree());
    const uint32_t inside = last_bin(hive) + 32 + 64;
    copy_cell(hive, hive.at("Beta").record, inside);
    hive.put32(hive.at("").index, 12, inside);
    Scene scene(hive.bytes);
    ASSERT_TRUE(scene.is_open());
    EXPECT_FALSE(scene.OpenKey("Beta"));
    EXPECT_EQ(scene.Set("Alpha", "Raw", 3, pattern(300)), 0);
    EXPECT_FALSE(scene.OpenKey("Beta"));
}

TEST(Damaged, a_record_that_stands_inside_another_ones_data_is_not_read) {
    LaidHive hive = lay_out(tree());
    const uint32_t inside = hive.at("Alpha").values[1].data + 8;
    copy_cell(hive, hive.at("Alpha\\Other").record, inside);
    hive.put32(hive.at("Alpha").index, 12, inside);
    Scene scene(hive.bytes);
    EXPECT_FALSE(scene.OpenKey("Alpha\\Other"));
    EXPECT_TRUE(scene.OpenKey("Alpha\\Inner"));
}

TEST(Damaged, a_bin_of_2_gigabytes_in_a_short_file_opens_and_takes_a_value) {
    LaidHive hive = lay_out(tree());
    const uint32_t bin = last_bin(hive);
    set32(hive.bytes, 4096 + uint64_t{bin} + 8, 0x7FFF0000 - bin);
    hive.set_cell_size(bin + 32, static_cast<int32_t>(0x7FFF0000 - bin - 32));
    hive.put_base(40, 0x7FFF0000);
    hive.fix_checksum();
    Scene scene(hive.bytes);
    ASSERT_TRUE(scene.is_open());
    EXPECT_EQ(scene.Set("Alpha", "Raw", 3, pattern(9000)), 0);
    ASSERT_TRUE(scene.Reopen());
    const Hive now = scene.Read();
    EXPECT_EQ(find_value(*now.find("Alpha"), "Raw")->size, 9000U);
    EXPECT_LT(scene.bytes().size(), 30000U);
}

TEST(Damaged, renaming_a_subkey_that_is_the_root_is_refused_for_the_hive_would_not_open_again) {
    LaidHive hive = lay_out(tree());
    hive.put32(hive.at("Alpha").index, 4, hive.at("").record);
    Scene scene(hive.bytes);
    Handle key = scene.OpenKey("Alpha");
    EXPECT_EQ(RRenameKey(key.get(), 0, "New"), R_FAILED);
    key.reset();
    EXPECT_TRUE(scene.Untouched());
    EXPECT_TRUE(scene.Reopen());
}

TEST(Damaged, a_key_that_lists_itself_is_not_renamed_out_of_its_place_from_within) {
    LaidHive hive = lay_out(tree());
    hive.put32(hive.at("Alpha").index, 4, hive.at("Alpha").record);
    Scene scene(hive.bytes);
    Handle key = scene.OpenKey("Alpha");
    EXPECT_EQ(RRenameKey(key.get(), 0, "New"), R_FAILED);
    EXPECT_TRUE(scene.Untouched());
    // From its place it can be.
    EXPECT_EQ(RRenameKey(scene.root(), 0, "New"), 0);
    EXPECT_TRUE(scene.OpenKey("New\\Other"));
}

TEST(Damaged, a_key_that_another_one_lists_too_is_deleted_from_its_own_place_alone) {
    LaidHive hive = lay_out(tree());
    hive.put32(hive.at("Gamma").index, 4, hive.at("Alpha\\Other").record);
    Scene scene(hive.bytes);
    EXPECT_EQ(scene.Delete("Gamma\\Other"), R_PATH_NOT_FOUND);
    Handle gamma = scene.OpenKey("Gamma");
    EXPECT_EQ(RCheckDeleteTree(gamma.get(), 0), R_PATH_NOT_FOUND);
    EXPECT_TRUE(scene.Untouched());
    EXPECT_EQ(scene.Delete("Alpha\\Other"), 0);
}

TEST(Damaged, a_key_that_its_list_has_twice_is_neither_deleted_nor_renamed) {
    LaidHive hive = lay_out(tree());
    hive.put32(hive.at("Alpha").index, 12, hive.at("Alpha\\Inner").record);
    Scene scene(hive.bytes);
    EXPECT_EQ(scene.Delete("Alpha\\Inner"), R_PATH_NOT_FOUND);
    EXPECT_EQ(scene.Rename("Alpha\\Inner", "New"), R_FAILED);
    EXPECT_TRUE(scene.Untouched());
}

// A rename that was cut short leaves such.
TEST(Damaged, a_parent_that_is_merely_wrong_keeps_no_key_from_being_renamed_and_deleted) {
    for (const uint32_t parent : {none, 0U, 0x7FFFFFF8U}) {
        LaidHive hive = lay_out(tree());
        hive.put32(hive.at("Alpha\\Other").record, 16, parent);
        Scene scene(hive.bytes);
        EXPECT_EQ(scene.Rename("Alpha\\Other", "New"), 0);
        EXPECT_EQ(scene.Delete("Alpha\\New"), 0);
    }
    LaidHive hive = lay_out(tree());
    hive.put32(hive.at("Alpha\\Other").record, 16, hive.at("Beta").record);
    Scene scene(hive.bytes);
    EXPECT_EQ(scene.Delete("Alpha\\Other"), 0);
}

TEST(Damaged, a_rename_leaves_the_parent_of_what_the_key_merely_lists) {
    LaidHive hive = lay_out(tree());
    hive.put32(hive.at("Gamma").index, 4, hive.at("Alpha\\Other").record);
    Scene scene(hive.bytes);
    EXPECT_EQ(scene.Rename("Gamma", "New"), 0);
    EXPECT_EQ(get32(scene.bytes(), LaidHive::position(hive.at("Alpha\\Other").record, 16)), hive.at("Alpha").record);
}

TEST(Damaged, no_key_is_made_in_a_list_that_is_another_ones) {
    LaidHive hive = lay_out(tree());
    hive.put32(hive.at("Gamma").record, 20, 2);
    hive.put32(hive.at("Gamma").record, 28, hive.at("Alpha").index);
    Scene scene(hive.bytes);
    EXPECT_EQ(scene.Create("Gamma\\New"), R_INVALID_PARAMETER);
    EXPECT_TRUE(scene.Untouched());
    EXPECT_EQ(scene.Create("Alpha\\New"), 0);
}

// A key whose index root leads to three leaves of two.
LaidHive rooted_beside_alpha() {
    HiveLayout layout = tree();
    KeyLayout& rooted = layout.root.add("Rooted");
    rooted.per_leaf = 2;
    for (const char* name : {"a1", "a2", "m1", "m2", "z1", "z2"})
        rooted.add(name);
    return lay_out(layout);
}

// The leaf would be moved to a longer cell, and its old one be freed under the other key.
TEST(Damaged, no_key_is_put_into_a_leaf_of_an_index_root_that_is_another_keys) {
    LaidHive hive = rooted_beside_alpha();
    hive.put32(hive.at("Rooted").index, 8, hive.at("Alpha").index);
    {
        Scene scene(hive.bytes);
        EXPECT_EQ(scene.Create("Rooted\\Jay"), R_INVALID_PARAMETER);
        EXPECT_EQ(scene.Rename("Rooted\\a1", "Jay"), R_FAILED);
        EXPECT_EQ(scene.Rename("Rooted\\z2", "Jay"), R_FAILED);
        EXPECT_TRUE(scene.Untouched());
    }
    Scene scene(hive.bytes);
    EXPECT_EQ(scene.Create("Rooted\\a15"), 0);  // the leaf ahead is the key's own
    EXPECT_EQ(scene.Rename("Rooted\\z2", "z3"), 0);
    EXPECT_EQ(subkey_names(scene.OpenKey("Alpha").get()), (std::vector<std::string>{"Inner", "Other"}));
}

// The leaf would be moved for the root's one entry, and the other lead to a free cell, where the list ends.
TEST(Damaged, no_key_is_put_into_a_leaf_that_an_index_root_has_twice) {
    LaidHive hive = rooted_beside_alpha();
    const KeyPlaces& rooted = hive.at("Rooted");
    hive.put32(rooted.index, 8, rooted.leaves[0]);
    Scene scene(hive.bytes);
    EXPECT_EQ(scene.Create("Rooted\\a"), R_INVALID_PARAMETER);
    EXPECT_EQ(scene.Rename("Rooted\\z2", "a"), R_FAILED);
    EXPECT_TRUE(scene.Untouched());
    EXPECT_EQ(scene.Create("Rooted\\zz"), 0);  // the last leaf stands there once
    EXPECT_TRUE(scene.OpenKey("Rooted\\z1"));
    EXPECT_TRUE(scene.OpenKey("Rooted\\zz"));
}

// Its entries are not read: a key in it would be out of sight.
TEST(Damaged, no_key_is_put_into_an_empty_leaf_of_the_other_kind) {
    LaidHive hive = rooted_beside_alpha();
    const KeyPlaces& rooted = hive.at("Rooted");
    hive.put16(rooted.leaves[2], 0, 0x666C);
    hive.put16(rooted.leaves[2], 2, 0);
    hive.put32(rooted.record, 20, 4);
    Scene scene(hive.bytes);
    EXPECT_EQ(scene.Create("Rooted\\zz"), R_INVALID_PARAMETER);
    EXPECT_EQ(scene.Rename("Rooted\\a1", "zz"), R_FAILED);
    EXPECT_TRUE(scene.Untouched());
    EXPECT_EQ(scene.Create("Rooted\\a15"), 0);  // goes into a leaf that is read
    EXPECT_EQ(scene.Rename("Rooted\\a1", "a0"), 0);
}

// An empty leaf adds nothing to what the root counts. To each of 65,535 the window would go and come back.
TEST(Damaged, an_index_root_is_followed_to_no_more_leaves_than_the_hive_can_hold_keys) {
    constexpr uint32_t entries = 65535;
    Bytes leaf(8);
    set16(leaf, 0, 0x686C);
    Bytes root(4 + 4 * size_t{entries});
    set16(root, 0, 0x6972);
    set16(root, 2, entries);
    HiveLayout layout;
    KeyLayout& key = layout.root.add("Top");
    key.set("leaf", 3, leaf);
    key.set("root", 3, root).storage = Storage::cell;
    LaidHive hive = lay_out(layout);
    const KeyPlaces& top = hive.at("Top");
    for (uint32_t i = 0; i < entries; i++)
        hive.put32(top.values[1].data, 4 + 4 * i, top.values[0].data);
    hive.put32(top.record, 20, 1);
    hive.put32(top.record, 28, top.values[1].data);
    Scene scene(hive.bytes);
    scene.file().disarm();
    EXPECT_TRUE(scene.OpenKey("Top"));
    EXPECT_LT(scene.file().counts().reads, 50U);
    EXPECT_EQ(scene.Create("Top\\New"), R_INVALID_PARAMETER);
    EXPECT_TRUE(scene.Untouched());
}

TEST(Damaged, a_list_has_no_more_values_than_the_hive_can_hold_records) {
    constexpr uint32_t slots = 60000;
    HiveLayout layout;
    layout.root.add("Top").set("list", 3, Bytes(4 * size_t{slots})).storage = Storage::cell;
    LaidHive hive = lay_out(layout);
    const KeyPlaces& top = hive.at("Top");
    for (uint32_t i = 0; i < slots; i++)
        hive.put32(top.values[0].data, 4 * i, top.values[0].record);
    hive.put32(top.record, 36, slots);
    hive.put32(top.record, 40, top.values[0].data);
    Scene scene(hive.bytes);
    const Handle key = scene.OpenKey("Top");
    uint32_t values = 0;
    EXPECT_EQ(RQueryInfoKeyW(key.get(), nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, &values, nullptr,
                             nullptr, nullptr, nullptr),
              0);
    EXPECT_GT(values, 0U);
    EXPECT_LE(values, hive.bytes.size() / 24);  // 24: the smallest cell of a value
    EXPECT_NE(scene.Set("Top", "new", 4, pattern(4)), 0);
    EXPECT_TRUE(scene.Untouched());
}

TEST(Damaged, a_key_made_in_the_list_of_the_root_leaves_the_root_its_list) {
    HiveLayout layout;
    layout.root.add("Loop");
    LaidHive hive = lay_out(layout);
    const KeyPlaces& loop = hive.at("Loop");
    hive.put32(loop.record, 16, 0x4F00);
    hive.put32(loop.record, 20, 1);
    hive.put32(loop.record, 28, hive.at("").index);
    Scene scene(hive.bytes);
    ASSERT_TRUE(scene.is_open());
    for (const char* name : {"a", "b", "c"})
        EXPECT_EQ(scene.Create(std::string("Loop\\") + name), 0);
    EXPECT_TRUE(scene.Reopen());
    EXPECT_TRUE(scene.OpenKey("Loop"));
}

TEST(Damaged, a_path_goes_through_a_key_that_exists_below_a_parent_whose_count_is_wrong) {
    LaidHive hive = lay_out(tree());
    hive.put32(hive.at("").record, 20, 4);
    Scene scene(hive.bytes);
    EXPECT_EQ(scene.Create("New"), R_INVALID_PARAMETER);
    EXPECT_TRUE(scene.Untouched());
    EXPECT_EQ(scene.Create("Gamma\\leaf\\New"), 0);
    EXPECT_EQ(scene.Changes(), (std::vector<std::string>{"+ key Gamma\\leaf\\New"}));
}

TEST(Damaged, data_that_leads_to_a_key_is_moved_and_the_key_stays) {
    for (const size_t size : {5U, 40U, 76U}) {
        LaidHive hive = lay_out(tree());
        hive.put32(hive.at("Alpha").values[1].record, 4, 76);
        hive.put32(hive.at("Alpha").values[1].record, 8, hive.at("Beta").record);
        Scene scene(hive.bytes);
        EXPECT_EQ(scene.Set("Alpha", "Raw", 3, pattern(size, 5)), 0);
        EXPECT_TRUE(scene.OpenKey("Beta"));
        const Hive now = scene.Read();
        EXPECT_EQ(find_value(*now.find("Alpha"), "Raw")->data, pattern(size, 5));
    }
}

// A root without a name, and an index of which the first entries lead nowhere, look like no records.
TEST(Damaged, data_that_leads_to_the_root_or_its_index_is_moved_and_the_hive_opens_again) {
    for (const bool to_index : {false, true}) {
        for (const size_t size : {5U, 76U, 17000U}) {
            HiveLayout layout;
            layout.root.name.clear();
            for (int i = 10; i < 30; i++)
                layout.root.add("k" + std::to_string(i));
            layout.root.add("last").set("Raw", 3, pattern(40));
            LaidHive hive = lay_out(layout);
            const KeyPlaces& root = hive.at("");
            for (uint32_t entry = 0; to_index && entry < 16; entry++)
                hive.put32(root.index, 4 + 8 * entry, none);
            hive.put32(hive.at("last").values[0].record, 4, 60);
            hive.put32(hive.at("last").values[0].record, 8, to_index ? root.index : root.record);
            Scene scene(hive.bytes);
            EXPECT_EQ(scene.Set("last", "Raw", 3, pattern(size, 5)), 0) << to_index << size;
            ASSERT_TRUE(scene.Reopen()) << to_index << size;
            const Handle last = scene.OpenKey("last");
            Bytes data(size);
            auto room = static_cast<uint32_t>(size);
            EXPECT_EQ(RQueryValueExW(last.get(), "Raw", nullptr, data.data(), &room), 0);
            EXPECT_EQ(data, pattern(size, 5));
        }
    }
}

TEST(Damaged, data_that_leads_to_its_own_value_does_not_destroy_it) {
    LaidHive hive = lay_out(tree());
    hive.put32(hive.at("Alpha").values[1].record, 4, 8);
    hive.put32(hive.at("Alpha").values[1].record, 8, hive.at("Alpha").values[1].record);
    Scene scene(hive.bytes);
    EXPECT_EQ(scene.Set("Alpha", "Raw", 3, pattern(8, 5)), 0);
    const Hive now = scene.Read();
    ASSERT_NE(find_value(*now.find("Alpha"), "Raw"), nullptr);
    EXPECT_EQ(find_value(*now.find("Alpha"), "Raw")->data, pattern(8, 5));
}

TEST(Damaged, data_that_leads_to_another_ones_big_data_is_moved_and_the_big_data_stays) {
    for (const size_t size : {5U, 8U, 12U, 100U}) {
        HiveLayout layout;
        KeyLayout& key = layout.root.add("Alpha");
        key.set("Raw", 3, pattern(40));
        key.set("Big", 3, pattern(20000, 9)).storage = Storage::big;
        LaidHive hive = lay_out(layout);
        hive.put32(hive.at("Alpha").values[0].record, 4, 8);
        hive.put32(hive.at("Alpha").values[0].record, 8, hive.at("Alpha").values[1].data);
        Scene scene(hive.bytes);
        EXPECT_EQ(scene.Set("Alpha", "Raw", 3, pattern(size, 5)), 0);
        const Hive now = scene.Read();
        EXPECT_EQ(find_value(*now.find("Alpha"), "Raw")->data, pattern(size, 5));
        EXPECT_EQ(find_value(*now.find("Alpha"), "Big")->data, pattern(20000, 9));
    }
}

// The hint of a leaf's entry happens to be a value's offset.
TEST(Damaged, no_value_is_removed_from_a_list_that_is_an_index_of_keys) {
    LaidHive hive = lay_out(tree());
    const uint32_t index = hive.at("").index;
    hive.put32(index, 8, hive.at("Alpha").values[1].record);
    hive.put32(hive.at("Gamma\\leaf").record, 40, index);
    hive.put32(hive.at("Gamma\\leaf").record, 36, 5);
    Scene scene(hive.bytes);
    const Handle key = scene.OpenKey("Gamma\\leaf");
    ASSERT_EQ(RFindValueA(key.get(), "Raw"), 2);
    EXPECT_EQ(RDeleteValue(key.get(), "Raw"), R_FAILED);
    EXPECT_TRUE(scene.Untouched());
    EXPECT_EQ(scene.Delete("Gamma\\leaf"), 0);
    const Hive now = scene.Read();
    EXPECT_NE(now.find("Beta"), nullptr);
    ASSERT_NE(find_value(*now.find("Alpha"), "Raw"), nullptr);
    EXPECT_EQ(find_value(*now.find("Alpha"), "Raw")->data, pattern(100));
}

// A list of values has no signature.
TEST(Damaged, data_that_leads_to_a_list_of_values_is_moved_and_the_list_stays) {
    for (const char* owner : {"Alpha", "Beta"}) {     // its own key's list, and another's
        for (const uint32_t said : {4U, 5U, 100U}) {  // the size that the damaged record states
            for (const size_t size : {5U, 8U, 16U, 200U}) {
                LaidHive hive = lay_out(tree());
                hive.put32(hive.at("Alpha").values[1].record, 4, said);
                hive.put32(hive.at("Alpha").values[1].record, 8, hive.at(owner).value_list);
                Scene scene(hive.bytes);
                EXPECT_EQ(scene.Set("Alpha", "Raw", 3, pattern(size, 5)), 0);
                const Hive now = scene.Read();
                ASSERT_NE(find_value(*now.find("Alpha"), "Raw"), nullptr);
                EXPECT_EQ(find_value(*now.find("Alpha"), "Raw")->data, pattern(size, 5));
                ASSERT_NE(find_value(*now.find("Alpha"), "Text"), nullptr);
                EXPECT_EQ(find_value(*now.find("Alpha"), "Text")->data, text_data("hello"));
                ASSERT_NE(find_value(*now.find("Beta"), "v"), nullptr);
                EXPECT_EQ(find_value(*now.find("Beta"), "v")->data, pattern(40));
            }
        }
    }
}

// Below A the key mm, which B lists as well, between others that stand in order.
LaidHive listed_twice() {
    HiveLayout layout;
    layout.free_bytes = 600;
    KeyLayout& a = layout.root.add("A");
    for (const char* name : {"z", "y", "mm"})
        a.add(name);
    a.sorted = false;
    KeyLayout& b = layout.root.add("B");
    for (const char* name : {"c", "e", "m", "q", "s"})
        b.add(name);
    LaidHive hive = lay_out(layout);
    hive.put32(hive.at("B").index, 4 + 2 * 8, hive.at("A\\mm").record);
    return hive;
}

TEST(Damaged, a_list_that_another_keys_deletion_has_put_out_of_order_hides_none_of_its_keys) {
    Scene scene(listed_twice().bytes);
    EXPECT_FALSE(scene.OpenKey("B\\zz"));  // looks at the whole list, which is in order so far
    EXPECT_EQ(scene.Delete("A\\mm"), 0);
    for (const char* path : {"B\\c", "B\\e", "B\\q", "B\\s"})
        EXPECT_TRUE(scene.OpenKey(path)) << path;
    // What takes the cell stands in B's list too, out of order.
    EXPECT_EQ(scene.Create("A\\ww"), 0);
    uint32_t disposition = 9;
    EXPECT_EQ(scene.Create("B\\q", &disposition), 0);
    EXPECT_EQ(disposition, 1U);
}

TEST(Damaged, a_list_that_another_keys_rename_has_put_out_of_order_hides_none_of_its_keys) {
    Scene scene(listed_twice().bytes);
    EXPECT_FALSE(scene.OpenKey("B\\zz"));
    Handle a = scene.OpenKey("A");
    EXPECT_EQ(RRenameKey(a.get(), 2, "a name that needs a longer cell than before"), 0);
    for (const char* path : {"B\\c", "B\\e", "B\\q", "B\\s"})
        EXPECT_TRUE(scene.OpenKey(path)) << path;
}

TEST(Damaged, a_key_whose_cells_last_bytes_are_cut_off_with_the_files_end_is_read) {
    HiveLayout layout;
    layout.root.add("Alpha").add("Inner");
    LaidHive hive = lay_out(layout);
    // The key's record goes into the free cell that ends the last bin.
    const uint32_t end = get32(hive.bytes, 40);
    const uint32_t room = 96;
    const uint32_t from = hive.at("Alpha\\Inner").record;
    uint32_t last = end - 4096 + 32;
    while (last + static_cast<uint32_t>(std::abs(hive.cell_size(last))) < end)
        last += static_cast<uint32_t>(std::abs(hive.cell_size(last)));
    const int32_t free_size = hive.cell_size(last);
    ASSERT_GT(free_size, 200);
    hive.set_cell_size(last, free_size - static_cast<int32_t>(room));
    const uint32_t to = end - room;
    hive.set_cell_size(to, -static_cast<int32_t>(room));
    memcpy(hive.bytes.data() + 4100 + to, hive.bytes.data() + 4100 + from, 76 + 5);
    hive.put32(hive.at("Alpha").index, 4, to);
    hive.mark_free(from);
    for (const uint32_t kept : {room - 4, 76U + 6U, 76U + 5U}) {
        Scene scene(Bytes(hive.bytes.begin(), hive.bytes.begin() + 4100 + to + kept));
        EXPECT_TRUE(scene.OpenKey("Alpha\\Inner")) << kept;
    }
    Scene scene(Bytes(hive.bytes.begin(), hive.bytes.begin() + 4100 + to + 76 + 4));
    EXPECT_TRUE(scene.OpenKey("Alpha"));
    EXPECT_FALSE(scene.OpenKey("Alpha\\Inner"));
}

TEST(Damaged, a_security_record_with_too_low_a_count_goes_with_the_last_key_counted_and_nothing_else_does) {
    HiveLayout layout;
    layout.security_records = 2;
    KeyLayout& top = layout.root.add("Top");
    top.add("first").security = 1;
    KeyLayout& second = top.add("second");
    second.security = 1;
    second.set("v", 3, pattern(40));
    LaidHive hive = lay_out(layout);
    hive.put32(hive.security[1], 12, 1);
    Scene scene(hive.bytes);
    EXPECT_EQ(scene.Delete("Top\\first"), 0);
    EXPECT_EQ(scene.Changes(), (std::vector<std::string>{"- key Top\\first"}));
    const Bytes left = scene.bytes();
    EXPECT_EQ(scene.Create("Top\\second\\New"), R_INVALID_PARAMETER);
    EXPECT_EQ(scene.bytes(), left);
    EXPECT_EQ(scene.Delete("Top\\second"), 0);
    EXPECT_EQ(subkey_names(scene.OpenKey("Top").get()), std::vector<std::string>());
}

// A hive that ends in the midst of an index or list of the key "Top": behind so many bytes of a copy, to which the
// field of the key's record leads.
Bytes cut_inside(size_t per_leaf, uint32_t KeyPlaces::*original, uint32_t field, uint32_t bytes) {
    HiveLayout layout;
    KeyLayout& top = layout.root.add("Top");
    top.per_leaf = per_leaf;
    for (const char* name : {"a1", "a2", "m1", "m2", "z1", "z2"})
        top.add(name);
    top.set("first", 4, pattern(4));
    top.set("second", 4, pattern(4));
    layout.free_bytes = 4000;
    LaidHive hive = lay_out(layout);
    const uint32_t last = last_bin(hive) + 32;  // all that is free
    hive.set_cell_size(last, -hive.cell_size(last));
    for (uint32_t i = 0; i < bytes; i += 4)
        hive.put32(last, i, hive.get32(hive.at("Top").*original, i));
    hive.put32(hive.at("Top").record, field, last);
    hive.bytes.resize(LaidHive::position(last) + bytes);
    return hive.bytes;
}

// How many of the first six subkeys can be opened.
int openable(RegistryKey* key) {
    int count = 0;
    for (uint32_t i = 0; i < 6; i++) {
        Handle subkey;
        count += ROpenSubKey(key, i, subkey.out()) == 0 ? 1 : 0;
    }
    return count;
}

TEST(Damaged, what_stands_ahead_of_the_files_end_in_a_list_is_read) {
    Scene root(cut_inside(2, &KeyPlaces::index, 28, 4 + 2 * 4));
    EXPECT_EQ(openable(root.OpenKey("Top").get()), 4);
    Scene leaf(cut_inside(0, &KeyPlaces::index, 28, 4 + 3 * 8));
    EXPECT_EQ(openable(leaf.OpenKey("Top").get()), 3);
    Scene values(cut_inside(0, &KeyPlaces::value_list, 40, 4));
    const Handle top = values.OpenKey("Top");
    char name[16];
    uint32_t size = sizeof name;
    EXPECT_EQ(REnumValueA(top.get(), 0, name, &size, nullptr, nullptr, nullptr), 0);
    EXPECT_NE(REnumValueA(top.get(), 1, name, &size, nullptr, nullptr, nullptr), 0);
}

TEST(Damaged, a_value_that_its_list_has_twice_keeps_its_record_until_both_are_gone) {
    LaidHive hive = lay_out(tree());
    hive.put32(hive.at("Alpha").value_list, 4, hive.at("Alpha").values[0].record);
    Scene scene(hive.bytes);
    EXPECT_EQ(scene.DeleteValue("Alpha", "Text"), 0);
    Handle key = scene.OpenKey("Alpha");
    EXPECT_EQ(RFindValueA(key.get(), "Text"), 0);
    EXPECT_EQ(RDeleteValue(key.get(), "Text"), 0);
    EXPECT_EQ(RFindValueA(key.get(), "Text"), -1);
}

TEST(Damaged, deleting_a_key_whose_list_of_values_is_another_key_leaves_that_key) {
    LaidHive hive = lay_out(tree());
    hive.put32(hive.at("Gamma\\leaf").record, 36, 1);
    hive.put32(hive.at("Gamma\\leaf").record, 40, hive.at("Beta").record);
    Scene scene(hive.bytes);
    EXPECT_EQ(scene.Delete("Gamma\\leaf"), 0);
    EXPECT_TRUE(scene.OpenKey("Beta"));
    const Hive now = scene.Read();
    EXPECT_EQ(find_value(*now.find("Beta"), "v")->data, pattern(40));
}

}  // namespace
