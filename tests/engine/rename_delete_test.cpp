// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT

// Renaming and deleting keys: what moves, what is freed, what is refused and then left alone.
#include "scene.h"

#include <gtest/gtest.h>

using namespace testkit;

namespace {

HiveLayout tree() {
    HiveLayout layout;
    layout.security_records = 2;
    KeyLayout& top = layout.root.add("Top");
    KeyLayout& key = top.add("Middle");
    key.class_name = u"Klass";
    key.security = 1;
    key.time = 0x1234;
    for (const char* name : {"v1", "v2", "v3", "v4"})
        key.set(name, 3, pattern(20));
    key.add("Child1").add("Deep");
    key.add("Child2");
    top.add("Alone");
    KeyLayout& full = top.add("Values");
    for (const char* name : {"v1", "v2", "v3", "v4"})
        full.set(name, 4, {1, 2, 3, 4});
    return layout;
}

class Moving : public testing::Test {
protected:
    Moving() : scene(tree()) {}
    Scene scene;
};

TEST_F(Moving, a_rename_changes_the_name_and_nothing_else) {
    const Hive before = scene.Read();
    EXPECT_EQ(scene.Rename("Top\\Middle", "zeta"), 0);
    EXPECT_EQ(scene.Check(), "");
    const Hive after = scene.Read();
    EXPECT_EQ(after.find("Top\\Middle"), nullptr);
    const Key* old_key = before.find("Top\\Middle");
    const Key* key = after.find("Top\\zeta");
    ASSERT_NE(key, nullptr);
    EXPECT_EQ(key->name, u"zeta");
    EXPECT_EQ(key->time, old_key->time);
    EXPECT_EQ(key->flags, old_key->flags);
    EXPECT_EQ(key->class_name, u"Klass");
    EXPECT_EQ(key->security, old_key->security);
    EXPECT_EQ(key->values.size(), 4U);
    EXPECT_EQ(key->children.size(), 2U);
    EXPECT_NE(after.find("Top\\zeta\\Child1\\Deep"), nullptr);
}

TEST_F(Moving, a_rename_to_every_place_among_the_siblings_keeps_the_order) {
    for (const char* name : {"A", "az", "B", "Values2", "zz", "_", "[x", "Middle"}) {
        const std::string present = utf8([&] {
            const Hive hive = scene.Read();
            for (const Key& key : hive.find("Top")->children)
                if (!key.children.empty())
                    return key.name;
            return std::u16string();
        }());
        EXPECT_EQ(scene.Rename("Top\\" + present, name), 0) << name;
        EXPECT_EQ(scene.Check(), "") << name;
    }
    EXPECT_EQ(scene.Changes(), std::vector<std::string>{});
}

struct Refused {
    const char* rule;
    const char* path;
    const char* name;
    int32_t status;
};

class RenameRefused : public testing::TestWithParam<Refused> {};

TEST_P(RenameRefused, writes_nothing) {
    Scene scene(tree());
    EXPECT_EQ(scene.Rename(GetParam().path, GetParam().name), GetParam().status);
    EXPECT_TRUE(scene.Untouched());
}

INSTANTIATE_TEST_SUITE_P(Rows, RenameRefused,
                         testing::Values(Refused{"empty", "Top\\Middle", "", R_INVALID_PARAMETER},
                                         Refused{"a_backslash", "Top\\Middle", "a\\b", R_INVALID_PARAMETER},
                                         Refused{"a_siblings_name", "Top\\Middle", "Alone", R_FAILED},
                                         Refused{"a_siblings_name_in_other_case", "Top\\Middle", "aLONE", R_FAILED},
                                         Refused{"its_own_name", "Top\\Middle", "Middle", R_FAILED},
                                         Refused{"its_own_name_in_other_case", "Top\\Middle", "MIDDLE", R_FAILED}),
                         [](const auto& row) { return row.param.rule; });

TEST_F(Moving, a_rename_past_the_end_gives_3_and_a_null_name_87) {
    EXPECT_EQ(RRenameKey(scene.root(), 1, "x"), R_PATH_NOT_FOUND);
    EXPECT_EQ(RRenameKey(scene.root(), none, "x"), R_PATH_NOT_FOUND);
    EXPECT_EQ(RRenameKey(scene.root(), 0, nullptr), R_INVALID_PARAMETER);
    EXPECT_TRUE(scene.Untouched());
}

TEST_F(Moving, a_key_named_in_utf16_is_renamed_to_a_name_in_8_bits) {
    HiveLayout layout = tree();
    layout.root.children[0].children[0].wide_name = true;
    Scene other(layout);
    Handle top = other.OpenKey("Top");
    EXPECT_EQ(RRenameKey(top.get(), 1, "narrow"), 0);
    EXPECT_EQ(other.Check(), "");
    const Hive now = other.Read();
    ASSERT_NE(now.find("Top\\narrow"), nullptr);
    EXPECT_TRUE(now.find("Top\\narrow")->name_8bit);
}

TEST_F(Moving, a_rename_below_an_index_root_works_in_every_leaf_kind) {
    for (Leaf leaf : {Leaf::fast, Leaf::hash, Leaf::plain}) {
        HiveLayout layout;
        KeyLayout& many = layout.root.add("many");
        layout.leaf = leaf == Leaf::plain ? Leaf::hash : leaf;
        many.own_leaf = true;
        many.leaf = leaf;
        many.per_leaf = 2;
        for (const char* name : {"a", "c", "e", "g", "i", "k"})
            many.add(name).add("below");
        Scene other(layout);
        const std::pair<const char*, const char*> renames[] = {{"many\\a", "z"}, {"many\\k", "b"}, {"many\\e", "d"}};
        for (const auto& [path, name] : renames) {
            EXPECT_EQ(other.Rename(path, name), 0) << path;
            EXPECT_EQ(other.Check(), "") << path;
        }
        EXPECT_NE(other.Read().find("many\\z\\below"), nullptr);
    }
}

TEST_F(Moving, a_deletion_below_an_index_root_gives_3_and_writes_nothing) {
    HiveLayout layout;
    KeyLayout& many = layout.root.add("many");
    many.per_leaf = 2;
    for (const char* name : {"a", "b", "c"})
        many.add(name).set("v", 4, {1, 2, 3, 4});
    Scene other(layout);
    EXPECT_EQ(other.Delete("many\\b"), R_PATH_NOT_FOUND);
    EXPECT_TRUE(other.Untouched());
}

TEST_F(Moving, deleting_a_key_with_four_values_leaves_the_second_and_fourth_allocated) {
    std::vector<uint32_t> records;
    const Hive before = scene.Read();
    for (const Value& value : before.find("Top\\Values")->values)
        records.push_back(value.offset);
    ASSERT_EQ(records.size(), 4U);
    EXPECT_EQ(scene.Delete("Top\\Values"), 0);
    EXPECT_EQ(scene.Check(2), "");
    EXPECT_EQ(scene.Examine().leaks.values, (std::vector<uint32_t>{records[1], records[3]}));
    EXPECT_EQ(scene.Read().find("Top\\Values"), nullptr);
}

class ValuesLeft : public testing::TestWithParam<size_t> {};

TEST_P(ValuesLeft, is_half_rounded_down) {
    HiveLayout layout;
    KeyLayout& top = layout.root.add("Top");
    KeyLayout& key = top.add("Key");
    for (size_t i = 0; i < GetParam(); i++)
        key.set("v" + std::to_string(i), 4, {1, 2, 3, 4});
    Scene scene(layout);
    EXPECT_EQ(scene.Delete("Top\\Key"), 0);
    EXPECT_EQ(scene.Check(GetParam() / 2), "");
}

INSTANTIATE_TEST_SUITE_P(Deleting, ValuesLeft, testing::Range(size_t{0}, size_t{8}));

TEST_F(Moving, a_key_with_a_subkey_gives_145_and_nothing_changes) {
    EXPECT_EQ(scene.Delete("Top\\Middle"), R_KEY_HAS_CHILDREN);
    EXPECT_TRUE(scene.Untouched());
}

TEST_F(Moving, the_roots_handle_deletes_nothing) {
    EXPECT_EQ(RDeleteKey(scene.root(), "Top\\Alone"), R_INVALID_HANDLE);
    EXPECT_TRUE(scene.Untouched());
}

TEST_F(Moving, deleting_what_is_not_there_gives_3) {
    EXPECT_EQ(scene.Delete("Top\\None"), R_PATH_NOT_FOUND);
    Handle top = scene.OpenKey("Top");
    EXPECT_EQ(RDeleteKey(top.get(), ""), R_PATH_NOT_FOUND);
    EXPECT_EQ(RDeleteKey(top.get(), nullptr), R_PATH_NOT_FOUND);
    EXPECT_TRUE(scene.Untouched());
}

TEST_F(Moving, a_deletion_by_a_longer_path_reaches_the_last_component) {
    Handle top = scene.OpenKey("Top");
    EXPECT_EQ(RDeleteKey(top.get(), "\\middle\\Child1\\DEEP"), 0);
    EXPECT_EQ(scene.Changes(), (std::vector<std::string>{"- key Top\\Middle\\Child1\\Deep"}));
    EXPECT_EQ(scene.Check(), "");
}

TEST_F(Moving, a_name_longer_than_a_path_can_tell_apart_deletes_no_key_that_begins_like_it) {
    EXPECT_EQ(scene.Create("Top\\" + std::string(259, 'm')), 0);
    EXPECT_EQ(scene.Create("Top\\" + std::string(259, 'm') + "\\below"), 0);
    Handle top = scene.OpenKey("Top");
    scene.MarkBase();
    EXPECT_EQ(RDeleteKey(top.get(), std::string(260, 'm').c_str()), R_PATH_NOT_FOUND);
    EXPECT_EQ(RDeleteKey(top.get(), "Alone\\"), R_PATH_NOT_FOUND);
    EXPECT_TRUE(scene.Untouched());
    EXPECT_EQ(RDeleteKey(top.get(), (std::string(300, 'm') + "\\below").c_str()), 0);
    EXPECT_EQ(RDeleteKey(top.get(), std::string(259, 'm').c_str()), 0);
}

TEST_F(Moving, the_last_key_of_a_security_record_takes_it_along) {
    HiveLayout layout;
    layout.security_records = 3;
    KeyLayout& top = layout.root.add("Top");
    top.add("Other").security = 2;
    top.add("Own").security = 1;
    Scene other(layout);
    EXPECT_EQ(other.Delete("Top\\Own"), 0);
    EXPECT_EQ(other.Check(), "");
    EXPECT_EQ(other.Delete("Top\\Other"), 0);
    EXPECT_EQ(other.Check(), "");
}

// A count that is too low is believed only as long as the parent does not say otherwise.
TEST_F(Moving, a_security_record_that_the_parent_still_refers_to_stays) {
    HiveLayout layout;
    layout.security_records = 2;
    KeyLayout& top = layout.root.add("Top");
    top.security = 1;
    top.add("one").security = 1;
    LaidHive hive = lay_out(layout);
    hive.put32(hive.security[1], 12, 1);
    Scene other(hive.bytes);
    EXPECT_EQ(other.Delete("Top\\one"), 0);
    EXPECT_EQ(get32(other.bytes(), 4096 + uint64_t{hive.security[1]}),
              get32(hive.bytes, 4096 + uint64_t{hive.security[1]}));
    EXPECT_EQ(get32(other.bytes(), LaidHive::position(hive.security[1], 12)), 1U);
    EXPECT_EQ(other.Create("Top\\two"), 0);
    EXPECT_EQ(other.Delete("Top\\two"), 0);
}

// The record that stood there is gone, and with it what the handle knew: that there are no subkeys.
TEST_F(Moving, an_old_handle_of_a_deleted_key_says_nothing_about_the_order_of_another_keys_list) {
    HiveLayout layout;
    KeyLayout& top = layout.root.add("Top");
    top.add("aa");
    KeyLayout& key = top.add("uu");
    key.sorted = false;
    for (const char* name : {"z", "y", "m", "b"})
        key.add(name);
    Scene other(layout);
    Handle old = other.OpenKey("Top\\aa");
    EXPECT_EQ(other.Delete("Top\\aa"), 0);
    EXPECT_EQ(other.Rename("Top\\uu", "vv"), 0);
    ASSERT_EQ(RKeyOffset(old.get()), RKeyOffset(other.OpenKey("Top\\vv").get()));
    Handle none_there;
    EXPECT_EQ(ROpenKey(old.get(), "none", none_there.out()), R_PATH_NOT_FOUND);
    for (const char* name : {"z", "y", "m", "b"}) {
        uint32_t disposition = 9;
        EXPECT_EQ(other.Create(std::string("Top\\vv\\") + name, &disposition), 0);
        EXPECT_EQ(disposition, 1U) << name;
    }
}

// Each entry is looked for through the whole list. What must not come on top is a way back to the list for each.
TEST_F(Moving, a_list_in_no_order_is_asked_about_without_going_to_and_fro_between_list_and_records) {
    constexpr uint64_t count = 512;
    HiveLayout layout;
    KeyLayout& key = layout.root.add("Top").add("full");
    key.sorted = false;
    for (uint64_t i = count; i > 0; i--)
        key.add("key" + std::to_string(1000 + i));
    Scene other(layout);
    const Handle top = other.OpenKey("Top");
    other.file().disarm();
    EXPECT_EQ(RCheckDeleteTree(top.get(), 0), 0);
    EXPECT_LT(other.file().counts().reads, count * count / 4);
}

// The key "Top\\full" with count subkeys, all of which name the key "Top\\stray" as their parent. That one has the same
// list, and is itself in none: a stop in the midst of a rename leaves as much.
LaidHive subkeys_of_a_stray(uint32_t count) {
    HiveLayout layout;
    KeyLayout& top = layout.root.add("Top");
    top.add("full");
    top.add("stray");
    KeyLayout& full = top.children[0];
    for (uint32_t i = 0; i < count; i++)
        full.add("key" + std::to_string(10000 + i));
    LaidHive hive = lay_out(layout);
    const KeyPlaces& stray = hive.at("Top\\stray");
    hive.put32(stray.record, 20, count);
    hive.put32(stray.record, 28, hive.at("Top\\full").index);
    for (const KeyLayout& key : full.children)
        hive.put32(hive.at("Top\\full\\" + utf8(key.name)).record, 16, stray.record);
    hive.put32(hive.at("Top").record, 20, 1);
    hive.put16(hive.at("Top").index, 2, 1);
    return hive;
}

// The same, but the stray and a subkey that lies far from it are each other's parents. Both end the list: a rename puts
// their parents right when it comes to them.
LaidHive subkeys_of_a_ring(uint32_t count) {
    LaidHive hive = subkeys_of_a_stray(count);
    const auto record = [&hive](uint32_t i) { return hive.at("Top\\full\\key" + std::to_string(10000 + i)).record; };
    const uint32_t middle = count / 2;
    const uint32_t subkey = record(middle);
    const uint32_t stray = hive.at("Top\\stray").record;
    const uint32_t list = hive.at("Top\\full").index;
    hive.put32(subkey, 20, count);
    hive.put32(subkey, 28, list);
    hive.put32(stray, 16, subkey);
    hive.put32(list, 4 + 8 * middle, record(count - 1));
    hive.put32(list, 4 + 8 * (count - 2), stray);
    hive.put32(list, 4 + 8 * (count - 1), subkey);
    return hive;
}

// The key "Top\\full" with count subkeys that name one of two other ones as their parents, by turns. From both of these
// a way of 200 levels leads to the root, every key on it with the list of "full".
LaidHive subkeys_of_two_by_turns(uint32_t count) {
    constexpr uint32_t levels = 200;
    HiveLayout layout;
    KeyLayout& full = layout.root.add("Top").add("full");
    for (uint32_t i = 0; i < count + levels + 2; i++)
        full.add("key" + std::to_string(10000 + i));
    LaidHive hive = lay_out(layout);
    const auto record = [&hive](uint32_t i) { return hive.at("Top\\full\\key" + std::to_string(10000 + i)).record; };
    for (uint32_t i = count; i < count + levels + 2; i++) {
        hive.put32(record(i), 20, count + levels + 2);
        hive.put32(record(i), 28, hive.at("Top\\full").index);
    }
    for (uint32_t i = count + 1; i < count + levels; i++)
        hive.put32(record(i), 16, record(i - 1));
    for (const uint32_t stray : {count + levels, count + levels + 1})
        hive.put32(record(stray), 16, record(count + levels - 1));
    for (uint32_t i = 0; i < count; i++)
        hive.put32(record(i), 16, record(count + levels + i % 2));
    return hive;
}

double reads_to_rename_a_subkey(const LaidHive& hive, uint32_t count) {
    Scene scene(hive.bytes);
    const Handle top = scene.OpenKey("Top");
    scene.file().disarm();
    EXPECT_EQ(RRenameKey(top.get(), 0, "new"), 0);
    return static_cast<double>(scene.file().counts().reads) / count;
}

// Whether a subkey belongs elsewhere is found out on the way up from its parent, through lists as long as its own. One
// of so many keys takes six reads to look through, and the way round the ring one for each of 512 levels.
TEST_F(Moving, of_many_subkeys_with_stray_parents_not_each_is_asked_the_way_up) {
    constexpr uint32_t many = 12000;
    EXPECT_LT(reads_to_rename_a_subkey(subkeys_of_a_stray(many), many), 5);
    constexpr uint32_t few = 600;
    EXPECT_LT(reads_to_rename_a_subkey(subkeys_of_a_ring(few), few), 20);
    constexpr uint32_t some = 2000;
    EXPECT_LT(reads_to_rename_a_subkey(subkeys_of_two_by_turns(some), some), 20);
}

TEST_F(Moving, a_tree_deleted_leaf_by_leaf_is_gone_and_its_place_can_be_used_again) {
    for (const char* path : {"Top\\Middle\\Child1\\Deep", "Top\\Middle\\Child1", "Top\\Middle\\Child2"}) {
        EXPECT_EQ(scene.Delete(path), 0) << path;
        EXPECT_EQ(scene.Check(), "") << path;
    }
    EXPECT_EQ(scene.Delete("Top\\Middle"), 0);
    EXPECT_EQ(scene.Check(2 + 4 + 1), "");  // every other record, the data cells, the class
    EXPECT_EQ(scene.Create("Top\\Middle\\Child1"), 0);
    EXPECT_EQ(scene.Check(2 + 4 + 1), "");
}

TEST_F(Moving, whether_a_tree_can_be_deleted_is_told_without_writing) {
    Handle top = scene.OpenKey("Top");
    EXPECT_EQ(RCheckDeleteTree(top.get(), 1), 0);
    EXPECT_NE(RCheckDeleteTree(top.get(), 9), 0);
    EXPECT_EQ(RCheckDeleteTree(scene.root(), 0), R_INVALID_HANDLE);
    EXPECT_TRUE(scene.Untouched());
}

// Whether the subkey of Top at a position has no subkeys.
bool is_without_children(Scene& scene, uint32_t position) {
    const Hive hive = scene.Read();
    return hive.find("Top")->children.at(position).children.empty();
}

struct Refusing {
    const char* rule;
    std::u16string name;
    uint16_t flags;
    int32_t status;
};

class TreeRefused : public testing::TestWithParam<Refusing> {};

// Each of these is one that RDeleteKey, which goes by path and by its parent's handle, refuses.
TEST_P(TreeRefused, before_anything_is_deleted_wherever_it_stands) {
    for (const bool nested : {false, true}) {
        HiveLayout layout;
        KeyLayout& top = layout.root.add("Top");
        KeyLayout& key = nested ? top.add("Between") : top;
        key.add("first");
        key.children.push_back({});
        key.children.back().name = GetParam().name;
        key.children.back().flags = GetParam().flags;
        key.children.back().add("below").set("v", 4, {1, 2, 3, 4});
        Scene scene(layout);
        ASSERT_TRUE(scene.is_open());
        Handle handle = scene.OpenKey("Top");
        uint32_t position = 0;
        while (!nested && is_without_children(scene, position))
            position++;
        EXPECT_EQ(RCheckDeleteTree(handle.get(), position), GetParam().status);
        EXPECT_TRUE(scene.Untouched());
    }
}

INSTANTIATE_TEST_SUITE_P(Rows, TreeRefused,
                         testing::Values(Refusing{"empty", u"", 0, R_PATH_NOT_FOUND},
                                         Refusing{"longer_than_a_path_tells_apart", std::u16string(260, u'm'), 0,
                                                  R_PATH_NOT_FOUND},
                                         Refusing{"zero_inside", std::u16string(u"m\0n", 3), 0, R_PATH_NOT_FOUND},
                                         Refusing{"backslash", u"first\\n", 0, R_PATH_NOT_FOUND},
                                         Refusing{"backslash_at_the_end", u"m\\", 0, R_PATH_NOT_FOUND},
                                         Refusing{"link", u"link", 0x10, R_INVALID_HANDLE},
                                         Refusing{"marked_as_root", u"root", 0x04, R_INVALID_HANDLE}),
                         [](const auto& row) { return row.param.rule; });

// A cell that two keys of the tree lead to goes with the first of them.
TEST_F(Moving, a_tree_whose_keys_share_a_cell_is_refused_before_anything_is_deleted) {
    HiveLayout layout;
    KeyLayout& top = layout.root.add("Top");
    for (const char* name : {"p", "q"}) {
        KeyLayout& key = top.add("x").add(name);
        key.set("v", 4, {1, 2, 3, 4});
        key.add("below");
        key.add("last");
    }
    top.children[0].children.push_back(top.children[1].children[0]);
    top.children.pop_back();
    const LaidHive sound = lay_out(layout);
    enum class Shared { nothing, values, subkeys, key };
    for (const Shared shared : {Shared::nothing, Shared::values, Shared::subkeys, Shared::key}) {
        LaidHive hive = sound;
        const KeyPlaces& q = hive.at("Top\\x\\q");
        if (shared == Shared::values)
            hive.put32(hive.at("Top\\x\\p").record, 40, q.value_list);
        if (shared == Shared::subkeys)
            hive.put32(hive.at("Top\\x\\p").record, 28, q.index);
        if (shared == Shared::key)
            hive.put32(hive.at("Top\\x").index, 4, q.record);
        Scene other(hive.bytes);
        Handle handle = other.OpenKey("Top");
        EXPECT_EQ(RCheckDeleteTree(handle.get(), 0) == 0, shared == Shared::nothing) << static_cast<int>(shared);
        EXPECT_TRUE(other.Untouched());
    }
    // The same key twice, asked about itself.
    LaidHive hive = sound;
    hive.put32(hive.at("Top\\x").index, 4, hive.at("Top\\x\\q").record);
    Scene other(hive.bytes);
    Handle handle = other.OpenKey("Top\\x");
    EXPECT_EQ(RCheckDeleteTree(handle.get(), 0), R_PATH_NOT_FOUND);
}

// What a handle knows is older than what was done through another one.
TEST_F(Moving, an_old_handle_deletes_the_value_of_the_name_and_renames_the_key_it_lists_or_none) {
    Handle old = scene.OpenKey("Top\\Values");
    for (const char* name : {"v1", "v2"})
        EXPECT_EQ(scene.DeleteValue("Top\\Values", name), 0);
    scene.MarkBase();
    EXPECT_EQ(RFindValueA(old.get(), "v1"), -1);
    EXPECT_EQ(RDeleteValue(old.get(), "v2"), R_CAN_NOT_COMPLETE);
    EXPECT_TRUE(scene.Untouched());
    EXPECT_EQ(RDeleteValue(old.get(), "v4"), 0);
    EXPECT_EQ(scene.Changes().size(), 1U);
    const Hive hive = scene.Read();
    EXPECT_NE(find_value(*hive.find("Top\\Values"), "v3"), nullptr);

    Handle top = scene.OpenKey("Top");
    EXPECT_EQ(scene.Create("Top\\A first one"), 0);
    Handle second = scene.OpenKey("Top");
    EXPECT_EQ(RRenameKey(top.get(), 0, "Renamed"), 0);  // the list is read as it is now
    EXPECT_FALSE(scene.OpenKey("Top\\A first one"));
    EXPECT_TRUE(scene.OpenKey("Top\\Alone"));
}

// The list moves to a longer cell, and another key's takes the old one.
TEST_F(Moving, an_old_handle_reads_its_own_keys_list_wherever_it_is_now) {
    HiveLayout layout;
    layout.leaf = Leaf::hash;
    KeyLayout& key = layout.root.add("Key");
    for (const char* name : {"q", "f", "m"})
        key.add(name);
    key.sorted = false;
    layout.root.add("Other");
    layout.no_free_space = true;
    const uint32_t leaf = lay_out(layout).at("Key").index;
    Scene other(layout);
    Handle old = other.OpenKey("Key");
    EXPECT_EQ(other.Create("Key\\n"), 0);
    EXPECT_EQ(other.Create("Other\\a"), 0);
    ASSERT_EQ(get32(other.bytes(), LaidHive::position(other.Read().find("Other")->offset, 28)), leaf);
    Handle found;
    EXPECT_NE(ROpenKey(old.get(), "a", found.out()), 0);
    EXPECT_NE(ROpenKey(old.get(), "~none~", found.out()), 0);
    for (const char* path : {"Key\\q", "Key\\f", "Key\\m", "Key\\n"}) {
        uint32_t disposition = 9;
        EXPECT_EQ(other.Create(path, &disposition), 0);
        EXPECT_EQ(disposition, 1U) << path;
    }
}

// The record that says where the list is now cannot be read: the old cell, another key's by now, is not asked in its
// place, and once reads succeed the list is the key's own.
TEST_F(Moving, an_old_handle_takes_no_other_keys_lists_for_its_own_after_a_failed_read) {
    HiveLayout layout;
    KeyLayout& key = layout.root.add("Key");
    for (const char* name : {"f", "m", "q"}) {
        key.add(name);
        key.set(name, 3, pattern(3));
    }
    KeyLayout& others = layout.root.add("Other");
    others.add("a");
    others.set("a", 3, pattern(3));
    layout.no_free_space = true;
    const LaidHive laid = lay_out(layout);
    for (uint64_t nth = 1;; nth++) {
        SCOPED_TRACE(nth);
        Scene other(laid.bytes);
        const Handle old = other.OpenKey("Key");
        EXPECT_EQ(other.Set("Key", "n", 3, pattern(3)), 0);
        EXPECT_EQ(other.Create("Key\\n"), 0);
        for (const char* path : {"Other\\b", "Other\\c"})
            EXPECT_EQ(other.Create(path), 0);
        for (const char* name : {"b", "c"})
            EXPECT_EQ(other.Set("Other", name, 3, pattern(3)), 0);
        const uint32_t record = other.Read().find("Other")->offset;
        ASSERT_EQ(get32(other.bytes(), LaidHive::position(record, 28)), laid.at("Key").index);
        ASSERT_EQ(get32(other.bytes(), LaidHive::position(record, 40)), laid.at("Key").value_list);
        EXPECT_EQ(other.Set("", "elsewhere", 3, pattern(40000)), 0);
        std::vector<char> data(40000);
        auto length = static_cast<uint32_t>(data.size());
        EXPECT_EQ(RQueryValueExA(other.root(), "elsewhere", nullptr, data.data(), &length), 0);  // the window is there
        other.file().arm({MemoryFile::Call::read, nth, false, false});
        std::string answers;
        for (const bool faulty : {true, false}) {
            for (uint32_t i = 0; i < 3; i++) {
                char name[100] = "?";
                uint32_t size = sizeof name;
                if (REnumKeyExA(old.get(), i, name, &size, nullptr, nullptr, nullptr) == 0)
                    answers += name;
                size = sizeof name;
                if (REnumValueA(old.get(), i, name, &size, nullptr, nullptr, nullptr) == 0)
                    answers += name;
            }
            if (faulty)
                EXPECT_EQ(answers.find_first_of("abc"), std::string::npos) << answers;
            else
                EXPECT_EQ(answers, "ffmmnq") << nth;
            answers.clear();
        }
        if (!other.file().failed()) {
            EXPECT_GT(nth, 1U);
            break;
        }
    }
}

TEST_F(Moving, a_link_without_subkeys_and_a_name_of_259_characters_can_be_deleted) {
    HiveLayout layout;
    KeyLayout& top = layout.root.add("Top");
    top.add("link").flags = 0x10;
    top.add(std::string(259, 'm')).add("below");
    Scene other(layout);
    Handle handle = other.OpenKey("Top");
    EXPECT_EQ(RCheckDeleteTree(handle.get(), 0), 0);
    EXPECT_EQ(RCheckDeleteTree(handle.get(), 1), 0);
    EXPECT_EQ(RDeleteKey(handle.get(), "link"), 0);
}

TEST_F(Moving, every_cut_of_a_rename_opens_and_keeps_what_it_did_not_name) {
    scene.file().keep_cuts = true;
    EXPECT_EQ(scene.Rename("Top\\Middle", "a longer name than before"), 0);
    ASSERT_FALSE(scene.file().cuts.empty());
    for (const Bytes& cut : scene.file().cuts) {
        Scene stopped(cut);
        ASSERT_TRUE(stopped.is_open());
        EXPECT_TRUE(stopped.OpenKey("Top\\Alone"));
        Handle values = stopped.OpenKey("Top\\Values");
        ASSERT_TRUE(values);
        EXPECT_EQ(RFindValueA(values.get(), "v4"), 3);
        EXPECT_TRUE(stopped.OpenKey("Top\\Middle\\Child1\\Deep") ||
                    stopped.OpenKey("Top\\a longer name than before\\Child1\\Deep"));
    }
}

}  // namespace
