// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT

// Opening and closing hives and keys: what is refused, and what is held open.
#include "scene.h"

#include <gtest/gtest.h>

using namespace testkit;

namespace {

HiveLayout tree() {
    HiveLayout layout;
    KeyLayout& a = layout.root.add("Alpha");
    a.add("Inner").add("Leaf");
    layout.root.add("Beta");
    return layout;
}

bool opens(const LaidHive& hive) { return Scene(hive.bytes).is_open(); }

TEST(OpenHive, a_descriptor_that_lacks_what_reading_needs_gives_null) {
    Scene scene;
    EXPECT_EQ(ROpenHive(nullptr), nullptr);
    RegistryIo io = scene.file().io();
    scene.file().rewind();
    io.read = nullptr;
    EXPECT_EQ(ROpenHive(&io), nullptr);
    io = scene.file().io();
    io.seek = nullptr;
    EXPECT_EQ(ROpenHive(&io), nullptr);
}

TEST(OpenHive, a_file_that_does_not_begin_with_regf_is_refused_at_once) {
    LaidHive hive = lay_out(tree());
    hive.bytes[3] = 'g';
    Scene scene(hive.bytes);
    EXPECT_FALSE(scene.is_open());
    EXPECT_EQ(scene.file().counts().bytes_read, 4U);
}

TEST(OpenHive, a_bins_size_that_does_not_end_with_the_last_bin_is_refused) {
    for (uint32_t size : {0U, 1U, 100U, 4000U, 4100U, 8192U, 0x7FFFF000U, 0x80000000U, 0xFFFFF000U, none}) {
        LaidHive hive = lay_out(tree());
        hive.put_base(40, size);
        EXPECT_FALSE(opens(hive)) << size;
    }
}

TEST(OpenHive, a_bin_whose_offset_is_not_its_place_is_refused) {
    LaidHive hive = lay_out(tree());
    set32(hive.bytes, 4100, 4096);
    EXPECT_FALSE(opens(hive));
}

TEST(OpenHive, a_root_index_of_another_kind_than_the_two_leaves_is_refused) {
    HiveLayout layout = tree();
    layout.root.own_leaf = true;
    for (Leaf leaf : {Leaf::fast, Leaf::hash}) {
        layout.root.leaf = leaf;
        EXPECT_TRUE(opens(lay_out(layout)));
    }
    layout.root.leaf = Leaf::plain;
    EXPECT_FALSE(opens(lay_out(layout)));
    layout.root.leaf = Leaf::hash;
    layout.root.per_leaf = 1;
    EXPECT_FALSE(opens(lay_out(layout)));
}

TEST(OpenHive, a_root_without_subkeys_opens_and_makes_lf_leaves) {
    HiveLayout layout;
    layout.leaf = Leaf::hash;
    Scene scene(layout);
    ASSERT_TRUE(scene.is_open());
    EXPECT_EQ(scene.Create("New"), 0);
    const uint32_t root = get32(scene.bytes(), 36);
    const uint32_t leaf = get32(scene.bytes(), 4100 + uint64_t{root} + 28);
    EXPECT_EQ(get16(scene.bytes(), 4100 + uint64_t{leaf}), 0x666C);
    EXPECT_EQ(scene.Check(), "");
}

TEST(OpenHive, a_wrong_checksum_and_differing_sequence_numbers_do_not_matter) {
    LaidHive hive = lay_out(tree());
    hive.put_base(4, 77);
    EXPECT_TRUE(opens(hive));
}

TEST(OpenHive, bytes_behind_the_last_bin_are_legal) {
    HiveLayout layout = tree();
    layout.after_bins = pattern(5000);
    EXPECT_TRUE(opens(lay_out(layout)));
}

TEST(OpenHive, a_root_that_is_no_key_is_refused) {
    const LaidHive good = lay_out(tree());
    for (uint32_t root : {0U, 8U, 36U, none, 0x00100000U, good.security[0], good.at("").index}) {
        LaidHive hive = good;
        hive.put_base(36, root);
        EXPECT_FALSE(opens(hive)) << root;
    }
}

TEST(OpenHive, every_cut_of_the_file_opens_or_is_refused_without_a_fault) {
    const Bytes bytes = lay_out(tree()).bytes;
    for (size_t length = 0; length < bytes.size(); length += length < 5000 ? 1U : 64U) {
        Scene scene(Bytes(bytes.begin(), bytes.begin() + static_cast<std::ptrdiff_t>(length)));
        if (scene.is_open())
            subkey_names(scene.root());
        EXPECT_TRUE(scene.Untouched());
    }
}

TEST(OpenHive, opening_reading_and_closing_writes_nothing) {
    Scene scene(tree());
    scene.OpenKey("Alpha\\Inner");
    EXPECT_EQ(scene.Close(), 0);
    EXPECT_EQ(scene.file().counts().writes, 0U);
}

TEST(Close, the_root_stays_usable_while_a_subkey_is_open) {
    Scene scene(tree());
    Handle key = scene.OpenKey("Alpha");
    ASSERT_TRUE(key);
    EXPECT_EQ(RCloseKey(scene.root()), R_DEVICE_IN_USE);
    EXPECT_EQ(RCloseHive(scene.root()), R_DEVICE_IN_USE);
    EXPECT_EQ(subkey_names(scene.root()), (std::vector<std::string>{"Alpha", "Beta"}));
    EXPECT_EQ(subkey_names(key.get()), (std::vector<std::string>{"Inner"}));
    key.reset();
    EXPECT_EQ(scene.Close(), 0);
}

TEST(Close, what_is_no_root_is_not_closed_as_hive) {
    Scene scene(tree());
    Handle key = scene.OpenKey("Alpha");
    EXPECT_EQ(RCloseKey(nullptr), R_FAILED);
    EXPECT_EQ(RCloseHive(nullptr), R_INVALID_HANDLE);
    EXPECT_EQ(RCloseHive(key.get()), R_INVALID_HANDLE);
}

struct PathRow {
    const char* rule;
    const char* path;
    int32_t status;
    uint32_t index;
};

class OpenPath : public testing::TestWithParam<PathRow> {};

TEST_P(OpenPath, gives) {
    Scene scene(tree());
    RegistryKey* key = nullptr;
    uint32_t index = 99;
    EXPECT_EQ(ROpenKeyEx(scene.root(), GetParam().path, &key, &index), GetParam().status);
    EXPECT_EQ(index, GetParam().status == 0 ? GetParam().index : 99U);
    const int32_t status = GetParam().status;
    EXPECT_EQ(key != nullptr, status == 0 || status == R_PATH_NOT_FOUND);
    if (key != nullptr) {
        EXPECT_EQ(RCloseKey(key), status == 0 ? int32_t{0} : int32_t{R_INVALID_HANDLE});
    }
    EXPECT_EQ(scene.Close(), 0);
}

TEST(OpenKey, backslashes_in_front_of_a_path_lead_to_the_same_key) {
    Scene scene(tree());
    Handle plain = scene.OpenKey("Alpha\\Inner");
    Handle with = scene.OpenKey("\\\\\\Alpha\\Inner");
    ASSERT_TRUE(plain);
    ASSERT_TRUE(with);
    EXPECT_EQ(RKeyOffset(plain.get()), RKeyOffset(with.get()));
}

INSTANTIATE_TEST_SUITE_P(Rows, OpenPath,
                         testing::Values(PathRow{"plain", "Alpha", 0, 0}, PathRow{"second", "Beta", 0, 1},
                                         PathRow{"any_case", "aLPHA\\INNER\\leaf", 0, 0},
                                         PathRow{"leading_backslashes", "\\\\\\Alpha\\Inner", 0, 0},
                                         PathRow{"only_backslashes", "\\\\\\", R_INVALID_PARAMETER, 0},
                                         PathRow{"empty", "", R_INVALID_PARAMETER, 0},
                                         PathRow{"null", nullptr, R_INVALID_PARAMETER, 0},
                                         PathRow{"missing", "Gamma", R_PATH_NOT_FOUND, 0},
                                         PathRow{"missing_below", "Alpha\\Gamma", R_PATH_NOT_FOUND, 0},
                                         PathRow{"prefix", "Alph", R_PATH_NOT_FOUND, 0},
                                         PathRow{"longer", "Alphabet", R_PATH_NOT_FOUND, 0}),
                         [](const auto& row) { return row.param.rule; });

TEST(OpenKey, a_null_key_or_output_has_its_own_status) {
    Scene scene(tree());
    RegistryKey* key = nullptr;
    EXPECT_EQ(ROpenKey(nullptr, "Alpha", &key), R_FAILED);
    EXPECT_EQ(ROpenKeyEx(nullptr, "Alpha", &key, nullptr), R_INVALID_HANDLE);
    EXPECT_EQ(ROpenKey(scene.root(), "Alpha", nullptr), R_INVALID_PARAMETER);
    EXPECT_EQ(ROpenSubKey(scene.root(), 0, nullptr), R_INVALID_PARAMETER);
    key = scene.root();
    EXPECT_EQ(ROpenSubKey(nullptr, 0, &key), R_FAILED);
    EXPECT_EQ(key, nullptr);
}

TEST(OpenSubKey, an_index_at_or_past_the_end_gives_259) {
    Scene scene(tree());
    for (uint32_t index : {2U, 3U, 0x7FFFFFFFU, none}) {
        RegistryKey* key = scene.root();
        EXPECT_EQ(ROpenSubKey(scene.root(), index, &key), R_NO_MORE_ITEMS);
        EXPECT_EQ(key, nullptr);
    }
}

TEST(OpenSubKey, an_entry_that_leads_to_no_key_gives_a_status_and_no_handle) {
    for (uint32_t entry : {none, 0U, 3U, 0x7FFFFFF8U}) {
        LaidHive hive = lay_out(tree());
        hive.put32(hive.at("").index, 4, entry);
        Scene scene(hive.bytes);
        ASSERT_TRUE(scene.is_open());
        RegistryKey* key = nullptr;
        EXPECT_NE(ROpenSubKey(scene.root(), 0, &key), 0) << entry;
        EXPECT_EQ(key, nullptr);
        EXPECT_EQ(ROpenSubKey(scene.root(), 1, &key), 0);
        EXPECT_EQ(RCloseKey(key), 0);
    }
}

TEST(OpenKey, keys_are_found_whatever_rule_their_list_is_sorted_by) {
    const std::vector<std::string> names{"zz", "A_b", "AB", "a^c", "x\xC4y", "[q", "Ab`", "mm"};
    for (bool sorted : {true, false}) {
        HiveLayout layout;
        layout.root.sorted = sorted;
        for (const std::string& name : names)
            layout.root.add(name);
        Scene scene(layout);
        for (const std::string& name : names)
            EXPECT_TRUE(scene.OpenKey(name)) << name;
        EXPECT_FALSE(scene.OpenKey("nn"));
    }
}

TEST(OpenKey, a_sibling_named_in_utf16_hides_none_of_the_others) {
    HiveLayout layout;
    for (const char* name : {"a", "b", "c", "d", "e"})
        layout.root.add(name);
    layout.root.children[2].wide_name = true;
    Scene scene(layout);
    for (const char* name : {"a", "b", "d", "e"})
        EXPECT_TRUE(scene.OpenKey(name)) << name;
}

TEST(OpenKey, a_leaf_of_the_kind_that_the_hive_does_not_use_is_not_read) {
    HiveLayout layout;
    layout.leaf = Leaf::hash;
    KeyLayout& key = layout.root.add("key");
    key.own_leaf = true;
    key.leaf = Leaf::fast;
    key.add("below");
    Scene scene(layout);
    EXPECT_FALSE(scene.OpenKey("key\\below"));
    EXPECT_NE(scene.Create("key\\new"), 0);
    EXPECT_TRUE(scene.Untouched());
}

TEST(OpenKey, keys_below_an_index_root_are_found_in_every_leaf_kind) {
    for (Leaf leaf : {Leaf::fast, Leaf::hash, Leaf::plain}) {
        HiveLayout layout;
        layout.leaf = leaf == Leaf::plain ? Leaf::hash : leaf;
        KeyLayout& many = layout.root.add("many");
        many.own_leaf = true;
        many.leaf = leaf;
        many.per_leaf = 4;
        for (int i = 10; i < 31; i++)
            many.add("k" + std::to_string(i));
        Scene scene(layout);
        ASSERT_TRUE(scene.is_open());
        Handle key = scene.OpenKey("many");
        const std::vector<std::string> names = subkey_names(key.get());
        ASSERT_EQ(names.size(), 21U);
        for (uint32_t i = 0; i < 21; i++) {
            EXPECT_EQ(names[i], "k" + std::to_string(10 + i));
            Handle child;
            uint32_t index = 99;
            EXPECT_EQ(ROpenKeyEx(key.get(), names[i].c_str(), child.out(), &index), 0);
            EXPECT_EQ(index, i);
        }
    }
}

}  // namespace
