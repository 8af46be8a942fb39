// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT

// White-box: compares, hints and hashes; then the character hooks as the calls show them, and the checksum's
// edges.
#include "names.h"
#include "scene.h"

#include <gtest/gtest.h>

using namespace testkit;

namespace {

int signed_order(const char* a, const char* b) {
    return engine::compare_signed(engine::name_of(a), engine::name_of(b));
}

TEST(Names, case_is_ignored_and_the_longer_is_greater) {
    EXPECT_EQ(signed_order("abc", "ABC"), 0);
    EXPECT_EQ(signed_order("", ""), 0);
    EXPECT_LT(signed_order("", "a"), 0);
    EXPECT_GT(signed_order("a", ""), 0);
    EXPECT_LT(signed_order("abc", "ABCD"), 0);
    EXPECT_GT(signed_order("b", "ABCD"), 0);
}

TEST(Names, bytes_above_7F_come_before_letters_in_the_terminated_compare) {
    EXPECT_LT(signed_order("\xC4", "A"), 0);
    EXPECT_GT(engine::compare_upper(engine::name_of("\xC4"), engine::name_of("A")), 0);
}

TEST(Names, an_underscore_stands_behind_letters_upper_cased_and_before_them_lower_cased) {
    EXPECT_GT(engine::compare_upper(engine::name_of("_"), engine::name_of("a")), 0);
    EXPECT_LT(engine::compare_index(engine::name_of("_"), engine::name_of("A")), 0);
}

TEST(Names, the_hash_of_ab_is_2471_in_any_case_and_bytes_above_7F_count_as_negative) {
    for (const char* name : {"AB", "ab", "aB"})
        EXPECT_EQ(engine::leaf_hint(engine::sig_hash_leaf, engine::name_of(name)), 2471U);
    EXPECT_EQ(engine::leaf_hint(engine::sig_hash_leaf, engine::name_of("\xC4")), 0xFFFFFFC4U);
}

TEST(Names, the_hint_is_the_first_four_bytes_as_stored) {
    EXPECT_EQ(engine::leaf_hint(engine::sig_fast_leaf, engine::name_of("abCDe")), 0x44436261U);
    EXPECT_EQ(engine::leaf_hint(engine::sig_fast_leaf, engine::name_of("ab")), 0x00006261U);
}

TEST(Names, a_stored_name_with_trailing_zero_bytes_is_found_without_them) {
    HiveLayout layout;
    layout.root.add("Alpha");
    layout.root.children[0].name += u'\0';
    layout.root.add("Beta");
    Scene scene(layout);
    EXPECT_TRUE(scene.OpenKey("Alpha"));
    uint32_t disposition = 9;
    EXPECT_EQ(scene.Create("alpha", &disposition), 0);
    EXPECT_EQ(disposition, 1U);
    EXPECT_TRUE(scene.Untouched());
}

TEST(Names, a_value_name_counts_up_to_its_first_zero_byte_unless_another_value_has_just_that_name) {
    HiveLayout layout;
    KeyLayout& key = layout.root.add("Key");
    for (const std::u16string& name :
         {std::u16string(u"one\0", 4), std::u16string(u"two\0x", 5), std::u16string(u"two"),
          std::u16string(u"wide\0", 5), std::u16string(u"\0z", 2)}) {
        key.set("", 3, pattern(8));
        key.values.back().name = name;
        key.values.back().wide_name = name.starts_with(u"wide");
    }
    Scene scene(layout);
    Handle handle = scene.OpenKey("Key");
    EXPECT_EQ(RFindValueA(handle.get(), "ONE"), 0);
    EXPECT_EQ(RFindValueA(handle.get(), "two"), 2);
    EXPECT_EQ(RFindValueA(handle.get(), "wide"), -1);
    EXPECT_EQ(RFindValueA(handle.get(), ""), 4);
    EXPECT_EQ(RFindValueA(handle.get(), "on"), -1);
    EXPECT_EQ(RDeleteValue(handle.get(), "one"), 0);
    EXPECT_EQ(RDeleteValue(handle.get(), "two"), 0);
    EXPECT_EQ(RFindValueA(handle.get(), "two"), 0);
    // To store goes by the whole name: a value is added.
    EXPECT_EQ(RSetValueExW(handle.get(), "two", 3, "data", 4), 0);
    EXPECT_EQ(RFindValueA(handle.get(), "two"), 3);
}

// Puts the hooks back.
struct Hooks {
    ~Hooks() {
        toupper_ptr = nullptr;
        c2ansi_ptr = nullptr;
        c2local_ptr = nullptr;
        wc2mb_ptr = nullptr;
        mb2wc_ptr = nullptr;
    }
};

TEST(Hooks, are_null_until_the_program_sets_them) {
    EXPECT_EQ(toupper_ptr, nullptr);
    EXPECT_EQ(c2ansi_ptr, nullptr);
    EXPECT_EQ(c2local_ptr, nullptr);
    EXPECT_EQ(wc2mb_ptr, nullptr);
    EXPECT_EQ(mb2wc_ptr, nullptr);
}

TEST(Hooks, upper_casing_decides_what_is_one_name) {
    const Hooks back;
    HiveLayout layout;
    layout.root.add("\xC4");
    Scene scene(layout);
    EXPECT_FALSE(scene.OpenKey("\xE4"));
    toupper_ptr = [](char c) { return c == '\xE4' ? '\xC4' : c >= 'a' && c <= 'z' ? static_cast<char>(c - 32) : c; };
    EXPECT_TRUE(scene.OpenKey("\xE4"));
}

TEST(Hooks, names_are_converted_before_they_are_stored_and_after_they_are_read) {
    const Hooks back;
    Scene scene;
    c2ansi_ptr = [](char c) { return c == '1' ? 'x' : c; };
    EXPECT_EQ(scene.Create("k1"), 0);
    EXPECT_EQ(scene.Set("kx", "v1", 1, text_data("a")), 0);
    const Hive hive = scene.Read();
    ASSERT_NE(hive.find("kx"), nullptr);
    EXPECT_NE(find_value(*hive.find("kx"), "vx"), nullptr);
    EXPECT_EQ(scene.Check(), "");
    c2local_ptr = [](char c) { return c == 'x' ? '2' : c; };
    Handle key = scene.OpenKey("kx");
    char name[8] = {};
    uint32_t size = sizeof name;
    EXPECT_EQ(REnumValueA(key.get(), 0, name, &size, nullptr, nullptr, nullptr), 0);
    EXPECT_STREQ(name, "v2");
    EXPECT_EQ(scene.DeleteValue("kx", "v1"), 0);
}

TEST(Hooks, text_goes_through_the_hooks_both_ways) {
    const Hooks back;
    Scene scene;
    EXPECT_EQ(scene.Create("k"), 0);
    Handle key = scene.OpenKey("k");
    mb2wc_ptr = [](char c) { return static_cast<uint16_t>(c == '\x80' ? 0x20AC : static_cast<unsigned char>(c)); };
    wc2mb_ptr = [](uint16_t unit) { return unit == 0x20AC ? '\x80' : static_cast<char>(unit); };
    EXPECT_EQ(RSetValueExA(key.get(), "\x80", 1, "\x80z", 3), 0);
    const Hive hive = scene.Read();
    EXPECT_EQ(hive.find("k")->values.at(0).data, (Bytes{0xAC, 0x20, 'z', 0, 0, 0}));
    char text[8] = {};
    uint32_t size = sizeof text;
    EXPECT_EQ(RQueryValueExA(key.get(), "\x80", nullptr, text, &size), 0);
    EXPECT_STREQ(text, "\x80z");
    uint16_t name[8] = {};
    size = sizeof name;
    EXPECT_EQ(REnumValueW(key.get(), 0, name, &size, nullptr, nullptr, nullptr), 0);
    EXPECT_EQ(name[0], 0x20AC);
}

TEST(Hooks, two_names_that_are_widened_alike_are_still_two) {
    const Hooks back;
    HiveLayout layout;
    layout.root.add("\xC4").set("\xC4", 4, {1, 0, 0, 0});
    layout.root.add("\xD6").set("here", 4, {1, 0, 0, 0});
    Scene scene(layout);
    mb2wc_ptr = [](char c) { return static_cast<uint16_t>(static_cast<unsigned char>(c) < 0x80 ? c : 0xFFFD); };
    Handle first = scene.OpenKey("\xC4");
    Handle second = scene.OpenKey("\xD6");
    EXPECT_EQ(RFindValueA(first.get(), "\xD6"), -1);
    EXPECT_EQ(RFindValueA(second.get(), "here"), 0);
    EXPECT_EQ(scene.Set("\xC4", "\xD6", 4, {2, 0, 0, 0}), 0);
    first = scene.OpenKey("\xC4");
    EXPECT_EQ(RFindValueA(first.get(), "\xC4"), 0);
    EXPECT_EQ(RFindValueA(first.get(), "\xD6"), 1);
    uint32_t disposition = 9;
    EXPECT_EQ(scene.Create("\xDC", &disposition), 0);
    EXPECT_EQ(disposition, 0U);
    EXPECT_EQ(scene.Check(), "");
}

class Checksum : public testing::TestWithParam<std::pair<uint32_t, uint32_t>> {};

TEST_P(Checksum, of_a_base_block_whose_words_give) {
    HiveLayout layout;
    layout.no_free_space = true;
    LaidHive hive = lay_out(layout);
    const uint32_t size = get32(hive.bytes, 40);
    uint32_t sum = size ^ (size + 4096);  // what the append will change
    for (uint32_t position = 0; position < 508; position += 4)
        sum ^= get32(hive.bytes, position);
    hive.put_base(200, sum ^ GetParam().first);
    hive.fix_checksum();
    Scene scene(hive.bytes);
    ASSERT_TRUE(scene.is_open());
    EXPECT_EQ(scene.Create("New"), 0);
    EXPECT_EQ(get32(scene.bytes(), 40), size + 4096);
    EXPECT_EQ(get32(scene.bytes(), 508), GetParam().second);
    EXPECT_EQ(scene.Check(), "");
}

INSTANTIATE_TEST_SUITE_P(Words, Checksum,
                         testing::Values(std::pair{0U, 1U}, std::pair{0xFFFFFFFFU, 0xFFFFFFFEU},
                                         std::pair{0x12345678U, 0x12345678U}, std::pair{1U, 1U}));

TEST(BaseBlock, an_append_keeps_every_byte_but_size_and_checksum) {
    HiveLayout layout;
    layout.no_free_space = true;
    LaidHive hive = lay_out(layout);
    for (uint32_t position = 48; position < 508; position += 4)
        hive.put_base(position, position * 2654435761U);
    hive.fix_checksum();
    for (size_t position = 512; position < 4096; position++)
        hive.bytes[position] = static_cast<uint8_t>(position);
    Scene scene(hive.bytes);
    ASSERT_TRUE(scene.is_open());
    EXPECT_EQ(scene.Create("New"), 0);
    for (size_t position = 0; position < 4096; position++)
        if ((position < 40 || position >= 44) && (position < 508 || position >= 512)) {
            EXPECT_EQ(scene.bytes()[position], hive.bytes[position]) << position;
        }
}

TEST(Depth, a_key_lies_at_most_512_levels_below_the_root) {
    Scene scene;
    std::string path = "k";
    for (int level = 1; level < 512; level++)
        path += "\\k";
    EXPECT_EQ(scene.Create(path), 0);
    EXPECT_EQ(scene.Check(), "");
    const Bytes before = scene.bytes();
    EXPECT_EQ(scene.Create(path + "\\k"), R_INVALID_PARAMETER);
    EXPECT_EQ(scene.bytes(), before);
}

TEST(Leaf, of_65535_entries_takes_no_other) {
    HiveLayout layout;
    for (int i = 0; i < 65534; i++)
        layout.root.add("k" + std::to_string(i));
    Scene scene(layout);
    ASSERT_TRUE(scene.is_open());
    EXPECT_EQ(scene.Create("last"), 0);
    EXPECT_EQ(scene.Check(), "");
    const Bytes before = scene.bytes();
    EXPECT_EQ(scene.Create("one more"), R_INVALID_PARAMETER);
    EXPECT_EQ(scene.bytes(), before);
}

TEST(Leaf, of_65535_entries_takes_none_from_another_leaf) {
    HiveLayout layout;
    KeyLayout& many = layout.root.add("many");
    for (int i = 0; i < 65535; i++)
        many.add("k" + std::to_string(i));
    many.add("z");
    many.per_leaf = 65535;
    Scene scene(layout);
    ASSERT_TRUE(scene.is_open());
    EXPECT_EQ(scene.Rename("many\\z", "a"), R_FAILED);
    EXPECT_TRUE(scene.Untouched());
    EXPECT_EQ(scene.Rename("many\\z", "y"), 0);
    EXPECT_EQ(scene.Check(), "");
}

}  // namespace
