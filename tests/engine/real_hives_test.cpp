// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT

// Every key and value of real hives, read through the engine, is what the independent reader finds; and a
// change to a copy changes what it names and nothing else.
#include "real_hives.h"
#include "sanitized.h"
#include "scene.h"

#include <gtest/gtest.h>

#include <cstdio>

using namespace testkit;

namespace {

// The engine's key against the reader's. Reports the first few differences only.
struct Comparer {
    size_t differences = 0;
    size_t keys = 0;
    size_t values = 0;

    void differ(const std::string& what) {
        if (++differences <= 5)
            ADD_FAILURE() << what;
    }

    void compare_name(RegistryKey* parent, uint32_t index, const Key& key) {
        char name[600] = {};
        uint32_t size = sizeof name;
        const int32_t status = REnumKeyExA(parent, index, name, &size, nullptr, nullptr, nullptr);
        if (status != (key.name_8bit ? int32_t{0} : int32_t{R_INVALID_NAME}))
            differ("status " + std::to_string(status) + " at key " + utf8(key.name));
        if (size != key.stored_name.size() ||
            !std::equal(key.stored_name.begin(), key.stored_name.end(), name,
                        [](uint8_t a, char b) { return a == static_cast<uint8_t>(b); }))
            differ("name of key " + utf8(key.name));
    }

    void compare_value(RegistryKey* key, uint32_t index, const Value& value) {
        values++;
        std::vector<uint16_t> name(value.stored_name.size() + 2);
        auto name_size = static_cast<uint32_t>(name.size() * 2);
        uint32_t type = 0;
        uint32_t data_size = value.size;
        Bytes data(value.size + 1);
        const int32_t status = REnumValueW(key, index, name.data(), &name_size, &type, data.data(), &data_size);
        data.resize(data_size);
        const std::u16string text(name.begin(), name.begin() + name_size / 2);
        if ((status == 0) != value.readable)
            return differ("status " + std::to_string(status) + " at value " + utf8(value.name));
        if (status == 0 && (text != value.name || type != value.type || data != value.data))
            differ("value " + utf8(value.name));
    }

    void compare(RegistryKey* handle, const Key& key) {
        keys++;
        uint32_t subkeys = 0;
        uint32_t value_count = 0;
        if (RQueryInfoKeyA(handle, nullptr, nullptr, nullptr, nullptr, &subkeys, nullptr, nullptr, &value_count,
                           nullptr, nullptr, nullptr, nullptr) != 0 ||
            subkeys != key.children.size() || value_count != key.values.size())
            return differ("counts of " + utf8(key.name));
        for (uint32_t i = 0; i < value_count; i++)
            compare_value(handle, i, key.values[i]);
        for (uint32_t i = 0; i < subkeys; i++) {
            compare_name(handle, i, key.children[i]);
            Handle child;
            if (ROpenSubKey(handle, i, child.out()) != 0)
                differ("cannot open " + utf8(key.children[i].name));
            else
                compare(child.get(), key.children[i]);
        }
    }
};

TEST(RealHives, every_key_and_value_reads_as_the_independent_reader_has_it) {
    for (const RealHive& real : real_hives()) {
        SCOPED_TRACE(real.name);
        Scene scene(read_file(real.path));
        ASSERT_TRUE(scene.is_open());
        const Hive hive = scene.Read();
        Comparer comparer;
        comparer.compare(scene.root(), hive.root);
        EXPECT_EQ(comparer.differences, 0U);
        EXPECT_EQ(comparer.keys, real.keys);
        EXPECT_EQ(comparer.values, real.values);
        EXPECT_TRUE(scene.Untouched());
    }
}

TEST(RealHives, every_key_named_in_8_bits_is_found_by_its_path) {
    size_t left_out = 0;
    for (const RealHive& real : real_hives()) {
        if (real.keys > 30000) {  // the smaller ones are enough for look-ups by path
            left_out++;
            continue;
        }
        SCOPED_TRACE(real.name);
        Scene scene(read_file(real.path));
        ASSERT_TRUE(scene.is_open());
        const Hive hive = scene.Read();
        size_t missed = 0;
        for (const FlatKey& flat : flatten(hive)) {
            std::string path;
            bool narrow = !flat.path.empty();
            for (char16_t unit : flat.path) {
                narrow = narrow && unit < 0x100;
                path += static_cast<char>(unit);
            }
            if (!narrow || !flat.key->name_8bit)
                continue;
            if (!scene.OpenKey(path) && ++missed <= 5)
                ADD_FAILURE() << utf8(flat.path);
        }
        EXPECT_EQ(missed, 0U);
    }
    if (left_out > 0)
        printf("[ LEFT OUT ] %zu real hives of more than 30,000 keys\n", left_out);
}

TEST(RealHives, a_key_and_a_value_made_and_removed_leave_all_else_as_it_was) {
    for (const RealHive& real : real_hives()) {
        if (is_sanitized && real.keys > 12000) {  // the checker reads the whole hive after each change
            printf("[ LEFT OUT ] %s, %zu keys\n", real.name.c_str(), real.keys);
            continue;
        }
        SCOPED_TRACE(real.name);
        Scene scene(read_file(real.path));
        ASSERT_TRUE(scene.is_open());
        const Hive hive = scene.Read();
        ASSERT_FALSE(hive.root.children.empty());
        Handle parent;
        ASSERT_EQ(ROpenSubKey(scene.root(), 0, parent.out()), 0);
        Handle made;
        ASSERT_EQ(RCreateKey(parent.get(), "zz test _key", made.out(), nullptr), 0);
        EXPECT_EQ(scene.Check(), "");
        const Bytes data = pattern(5000);
        ASSERT_EQ(RSetValueExW(made.get(), "Value", 3, data.data(), 5000), 0);
        EXPECT_EQ(scene.Check(), "");
        EXPECT_EQ(scene.Changes().size(), 2U);
        made.reset();
        const uint64_t record = 4100 + uint64_t{hive.root.children.front().offset};
        const uint64_t index = 4100 + uint64_t{get32(scene.bytes(), record + 28)};
        if (get16(scene.bytes(), index) == 0x6972) {  // below an index root a key stays
            EXPECT_EQ(RDeleteKey(parent.get(), "zz test _key"), R_PATH_NOT_FOUND);
            EXPECT_EQ(scene.Changes().size(), 2U);
            continue;
        }
        EXPECT_EQ(RDeleteKey(parent.get(), "zz test _key"), 0);
        EXPECT_EQ(scene.Check(1), "");  // the data cell stays
        EXPECT_EQ(scene.Changes(), std::vector<std::string>{});
    }
}

TEST(RealHives, an_insertion_leaves_a_sorted_list_sorted_wherever_it_goes) {
    for (const RealHive& real : real_hives()) {
        if (real.keys > 12000) {  // the checker reads the whole hive after each insertion
            printf("[ LEFT OUT ] %s, %zu keys\n", real.name.c_str(), real.keys);
            continue;
        }
        SCOPED_TRACE(real.name);
        Scene scene(read_file(real.path));
        ASSERT_TRUE(scene.is_open());
        for (const char* name : {"_a", "[b", "^c", "a_", "A`", "Zz_", "m_M", "\\x_[y"}) {
            EXPECT_EQ(scene.Create(name), 0) << name;
            EXPECT_EQ(scene.Check(), "") << name;
        }
    }
}

}  // namespace
