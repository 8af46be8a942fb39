// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// A tree is deleted key by key, leaves first, after one question whether all of it can go. In every hive of the
// catalogue the answer is kept: a tree that may go does go, whole. What each step does to the rest is looked at where
// single changes are.
#include "catalogue.h"
#include "changes.h"
#include "scene.h"

#include <gtest/gtest.h>

#include <algorithm>

namespace hostile {

namespace {

using testkit::FoundKey;
using testkit::Handle;
using testkit::Scene;
using testkit::Snapshot;

// Deletes the subkey at a position with all below it, as the key tree does: by its name, after its own subkeys.
int32_t delete_tree(RegistryKey* parent, uint32_t position) {
    {
        Handle key;
        uint32_t subkeys = 0;
        int32_t status = ROpenSubKey(parent, position, key.out());
        if (status == R_SUCCESS)
            status = RQueryInfoKeyW(key.get(), nullptr, nullptr, nullptr, nullptr, &subkeys, nullptr, nullptr, nullptr,
                                    nullptr, nullptr, nullptr, nullptr);
        while (status == R_SUCCESS && subkeys > 0)
            status = delete_tree(key.get(), --subkeys);
        if (status != R_SUCCESS)
            return status;
    }
    char name[600] = {};
    uint32_t size = sizeof name - 1;
    const int32_t status = REnumKeyExA(parent, position, name, &size, nullptr, nullptr, nullptr);
    return status == R_SUCCESS ? RDeleteKey(parent, name) : status;
}

// Opens the key at the end of a way from the root.
Handle follow(Scene& scene, const std::vector<uint32_t>& way) {
    Handle key;
    for (const uint32_t position : way) {
        Handle next;
        if (ROpenSubKey(key ? key.get() : scene.root(), position, next.out()) != R_SUCCESS)
            return {};
        key = std::move(next);
    }
    return key;
}

uint32_t subkey_count(RegistryKey* key) {
    uint32_t count = 0;
    EXPECT_EQ(RQueryInfoKeyW(key, nullptr, nullptr, nullptr, nullptr, &count, nullptr, nullptr, nullptr, nullptr,
                             nullptr, nullptr, nullptr),
              R_SUCCESS);
    return count;
}

class Trees : public testing::TestWithParam<size_t> {};

TEST_P(Trees, that_may_be_deleted_are_deleted_whole) {
    const Entry& entry = catalogue()[GetParam()];
    if (entry.readable == Readable::no || entry.large)
        return;
    const Case hive = entry.make();
    const Bytes& bytes = hive.bytes;
    size_t deleted = 0;
    Scene first(bytes);
    ASSERT_TRUE(first.is_open());
    const Snapshot before = take_snapshot(first.root(), judged_limits(bytes.size()));
    ASSERT_EQ(first.Close(), R_SUCCESS);
    for (const FoundKey& found : before.keys) {
        if (found.way.size() < 2)
            continue;  // nothing is deleted through the root's handle
        Scene scene(bytes);
        std::vector<uint32_t> way = found.way;
        const uint32_t position = way.back();
        way.pop_back();
        {
            Handle parent = follow(scene, way);
            ASSERT_TRUE(parent) << found.place;
            if (RCheckDeleteTree(parent.get(), position) != R_SUCCESS) {
                EXPECT_TRUE(scene.Untouched());
                continue;
            }
            const uint32_t subkeys = subkey_count(parent.get());
            EXPECT_EQ(delete_tree(parent.get(), position), R_SUCCESS) << found.place;
            EXPECT_EQ(subkey_count(parent.get()), subkeys - 1) << found.place;
            deleted++;
        }
        ASSERT_TRUE(scene.Reopen()) << found.place;
        const Snapshot after = take_snapshot(scene.root(), judged_limits(bytes.size()));
        const auto times = [&](const Snapshot& snapshot) {
            return std::count_if(snapshot.keys.begin(), snapshot.keys.end(),
                                 [&](const FoundKey& key) { return key.place == found.place; });
        };
        EXPECT_LT(times(after), times(before)) << found.place;
    }
    EXPECT_TRUE(deleted > 0 || entry.readable == Readable::partly || hive.lies);
}

std::string name_of(const testing::TestParamInfo<size_t>& row) {
    std::string name = catalogue()[row.param].name;
    std::replace_if(
        name.begin(), name.end(), [](char c) { return !isalnum(static_cast<unsigned char>(c)); }, '_');
    return name;
}

INSTANTIATE_TEST_SUITE_P(Catalogue, Trees, testing::Range(size_t{0}, catalogue().size()), name_of);

// One key below another, down to the deepest that there may be, and one more.
TEST(DeepTree, of_512_levels_may_be_deleted_and_is) {
    Scene scene(case_of("keys_512_deep").bytes);
    ASSERT_TRUE(scene.is_open());
    {
        Handle top = scene.OpenKey("k");
        ASSERT_TRUE(top);
        EXPECT_EQ(RCheckDeleteTree(top.get(), 0), R_SUCCESS);
        EXPECT_TRUE(scene.Untouched());
        EXPECT_EQ(delete_tree(top.get(), 0), R_SUCCESS);
    }
    EXPECT_EQ(scene.Check(), "");
    EXPECT_EQ(scene.Read().root.children.at(0).children.size(), 0U);
}

TEST(DeepTree, that_goes_deeper_is_not_deleted_from_wherever_it_is_asked) {
    for (const char* name : {"keys_513_deep", "keys_10000_deep"}) {
        SCOPED_TRACE(name);
        Scene scene(case_of(name).bytes);
        ASSERT_TRUE(scene.is_open());
        std::vector<uint32_t> way;
        for (uint32_t level = 1; level < 512; level++) {
            way.push_back(0);
            if (level > 2 && level < 509 && level % 100 != 0)
                continue;
            Handle parent = follow(scene, way);
            ASSERT_TRUE(parent) << level;
            EXPECT_EQ(RCheckDeleteTree(parent.get(), 0), R_FAILED) << level;
        }
        EXPECT_TRUE(scene.Untouched());
    }
}

}  // namespace

}  // namespace hostile
