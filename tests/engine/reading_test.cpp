// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT

// Enumerating and querying: one row of a table for each sentence of the contract, buffers one below, at and
// above need.
#include "scene.h"

#include <cstring>
#include <gtest/gtest.h>

using namespace testkit;

namespace {

HiveLayout tree() {
    HiveLayout layout;
    KeyLayout& key = layout.root.add("Alpha");
    key.class_name = u"Klass";
    key.time = 0x0123456789ABCDEF;
    key.set("Text", 1, text_data("hello"));
    key.set("", 4, {0x78, 0x56, 0x34, 0x12});
    key.set("Multi", 7, [] {
        Bytes data = text_data("ab");
        const Bytes more = text_data("cde");
        data.insert(data.end(), more.begin(), more.end());
        data.insert(data.end(), 2, 0);
        return data;
    }());
    key.set("Raw", 3, pattern(50));
    key.set("Big", 3, pattern(40000)).storage = Storage::big;
    key.set("Wide", 1, text_data("w")).wide_name = true;
    key.set("Odd", 0xFFFF0012, pattern(3));
    key.add("One");
    KeyLayout& wide = layout.root.add("Wide");
    wide.wide_name = true;
    return layout;
}

class Reading : public testing::Test {
protected:
    Reading() : scene(tree()), key(scene.OpenKey("Alpha")) {}
    ~Reading() override { EXPECT_TRUE(scene.Untouched()); }
    Scene scene;
    Handle key;
};

struct Room {
    const char* rule;
    uint32_t room;
    int32_t status;
    uint32_t size;
    const char* text;  // what the buffer of '#' begins with
};

class KeyNameRoom : public Reading, public testing::WithParamInterface<Room> {};

TEST_P(KeyNameRoom, is_as_the_contract_says) {
    const Room& row = GetParam();
    char name[20];
    memset(name, '#', sizeof name);
    uint32_t size = row.room;
    EXPECT_EQ(REnumKeyExA(scene.root(), 0, name, &size, nullptr, nullptr, nullptr), row.status);
    EXPECT_EQ(size, row.size);
    EXPECT_EQ(std::string(name, 7), std::string(row.text, 7));
}

INSTANTIATE_TEST_SUITE_P(REnumKeyExA, KeyNameRoom,
                         testing::Values(Room{"none", 0, 0, 6, "#######"},
                                         Room{"one_below", 4, R_BUFFER_OVERFLOW, 4, "Alph###"},
                                         Room{"exact", 5, 0, 5, "Alpha##"}, Room{"one_above", 6, 0, 5, "Alpha\0#"},
                                         Room{"ample", 20, 0, 5, "Alpha\0#"}),
                         [](const auto& row) { return row.param.rule; });

class OwnNameRoom : public Reading, public testing::WithParamInterface<Room> {};

TEST_P(OwnNameRoom, is_as_the_contract_says) {
    const Room& row = GetParam();
    char name[20];
    memset(name, '#', sizeof name);
    uint32_t size = row.room;
    uint32_t class_size = 0;
    uint32_t subkeys = 99;
    uint32_t values = 99;
    EXPECT_EQ(RQueryInfoKeyA(key.get(), name, &size, nullptr, &class_size, &subkeys, nullptr, nullptr, &values, nullptr,
                             nullptr, nullptr, nullptr),
              row.status);
    EXPECT_EQ(size, row.size);
    // A name that was cut keeps nothing else back.
    EXPECT_EQ(class_size, 10U);
    EXPECT_EQ(subkeys, 1U);
    EXPECT_EQ(values, 7U);
    EXPECT_EQ(std::string(name, 7), std::string(row.text, 7));
}

INSTANTIATE_TEST_SUITE_P(RQueryInfoKeyA, OwnNameRoom,
                         testing::Values(Room{"none", 0, 0, 5, "#######"},
                                         Room{"one_below", 4, R_BUFFER_OVERFLOW, 4, "Alph###"},
                                         Room{"exact", 5, 0, 5, "Alpha##"}, Room{"one_above", 6, 0, 5, "Alpha\0#"}),
                         [](const auto& row) { return row.param.rule; });

class OwnWideNameRoom : public Reading, public testing::WithParamInterface<Room> {};

TEST_P(OwnWideNameRoom, is_as_the_contract_says) {
    const Room& row = GetParam();
    uint16_t name[20];
    std::fill(std::begin(name), std::end(name), uint16_t{'#'});
    uint32_t size = row.room;
    EXPECT_EQ(RQueryInfoKeyW(key.get(), name, &size, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr,
                             nullptr, nullptr, nullptr),
              row.status);
    EXPECT_EQ(size, row.size);
    for (size_t i = 0; i < 7; i++)
        EXPECT_EQ(name[i], static_cast<uint16_t>(row.text[i])) << i;
}

INSTANTIATE_TEST_SUITE_P(RQueryInfoKeyW, OwnWideNameRoom,
                         testing::Values(Room{"none", 0, 0, 12, "#######"},
                                         Room{"one_below", 9, R_BUFFER_OVERFLOW, 9, "#######"},
                                         Room{"exact", 10, 0, 10, "Alpha##"},
                                         Room{"one_byte_to_spare", 11, 0, 10, "Alpha##"},
                                         Room{"two_bytes_to_spare", 12, 0, 10, "Alpha\0#"}),
                         [](const auto& row) { return row.param.rule; });

class ValueNameRoom : public Reading, public testing::WithParamInterface<Room> {};

TEST_P(ValueNameRoom, is_as_the_contract_says) {
    const Room& row = GetParam();
    uint16_t name[20];
    std::fill(std::begin(name), std::end(name), uint16_t{'#'});
    uint32_t size = row.room;
    EXPECT_EQ(REnumValueW(key.get(), 0, name, &size, nullptr, nullptr, nullptr), row.status);
    EXPECT_EQ(size, row.size);
    for (size_t i = 0; i < 7; i++)
        EXPECT_EQ(name[i], static_cast<uint16_t>(row.text[i])) << i;
}

INSTANTIATE_TEST_SUITE_P(REnumValueW, ValueNameRoom,
                         testing::Values(Room{"none", 0, R_BUFFER_OVERFLOW, 10, "#######"},
                                         Room{"without_terminator", 8, R_BUFFER_OVERFLOW, 10, "#######"},
                                         Room{"one_below", 9, R_BUFFER_OVERFLOW, 10, "#######"},
                                         Room{"exact", 10, 0, 8, "Text\0##"}, Room{"ample", 40, 0, 8, "Text\0##"}),
                         [](const auto& row) { return row.param.rule; });

class ValueNameRoomA : public Reading, public testing::WithParamInterface<Room> {};

TEST_P(ValueNameRoomA, is_cut_and_never_refused) {
    const Room& row = GetParam();
    char name[20];
    memset(name, '#', sizeof name);
    uint32_t size = row.room;
    EXPECT_EQ(REnumValueA(key.get(), 0, name, &size, nullptr, nullptr, nullptr), row.status);
    EXPECT_EQ(size, row.size);
    EXPECT_EQ(std::string(name, 7), std::string(row.text, 7));
}

INSTANTIATE_TEST_SUITE_P(REnumValueA, ValueNameRoomA,
                         testing::Values(Room{"none", 0, 0, 4, "#######"}, Room{"one", 1, 0, 4, "\0######"},
                                         Room{"exact", 4, 0, 4, "Tex\0###"}, Room{"one_above", 5, 0, 4, "Text\0##"}),
                         [](const auto& row) { return row.param.rule; });

struct DataRow {
    const char* rule;
    const char* name;
    uint32_t room;
    int32_t status;
    uint32_t size;
};

class DataRoom : public Reading, public testing::WithParamInterface<DataRow> {};

TEST_P(DataRoom, is_as_the_contract_says) {
    const DataRow& row = GetParam();
    Bytes data(50000, 0xEE);
    uint32_t size = row.room;
    uint32_t type = 99;
    EXPECT_EQ(RQueryValueExW(key.get(), row.name, &type, data.data(), &size), row.status);
    EXPECT_EQ(size, row.size);
    const Hive hive = scene.Read();
    const Value* value = find_value(*hive.find("Alpha"), row.name);
    const bool same = value != nullptr && std::equal(value->data.begin(), value->data.end(), data.begin());
    EXPECT_EQ(same, row.status == 0);
    if (row.status != 0) {
        EXPECT_EQ(data, Bytes(50000, 0xEE));
    }
}

INSTANTIATE_TEST_SUITE_P(
    RQueryValueExW, DataRoom,
    testing::Values(DataRow{"text_one_below", "text", 11, R_MORE_DATA, 12}, DataRow{"text_exact", "text", 12, 0, 12},
                    DataRow{"text_one_above", "TEXT", 13, 0, 12}, DataRow{"dword_one_below", "", 3, R_MORE_DATA, 4},
                    DataRow{"dword_exact", "", 4, 0, 4}, DataRow{"big_one_below", "Big", 39999, R_MORE_DATA, 40000},
                    DataRow{"big_exact", "Big", 40000, 0, 40000}, DataRow{"wide_name", "wide", 100, 0, 4},
                    DataRow{"unknown_type", "Odd", 3, 0, 3}, DataRow{"missing", "None", 100, R_FILE_NOT_FOUND, 100}),
    [](const auto& row) { return row.param.rule; });

TEST_F(Reading, without_a_name_buffer_the_room_for_the_name_comes_back_in_bytes) {
    uint32_t size = 0;
    EXPECT_EQ(REnumValueW(key.get(), 0, nullptr, &size, nullptr, nullptr, nullptr), 0);
    EXPECT_EQ(size, 10U);  // "Text" and a final zero
}

TEST_F(Reading, a_value_that_is_not_there_gives_2_in_8_bits_too) {
    uint32_t type = 99;
    char data[4] = {};
    uint32_t size = sizeof data;
    EXPECT_EQ(RQueryValueExA(key.get(), "None", &type, data, &size), R_FILE_NOT_FOUND);
    EXPECT_EQ(type, 99U);
    EXPECT_EQ(size, sizeof data);
}

TEST_F(Reading, without_a_data_buffer_the_stored_size_comes_back) {
    uint32_t size = 1;
    EXPECT_EQ(RQueryValueExW(key.get(), "Big", nullptr, nullptr, &size), 0);
    EXPECT_EQ(size, 40000U);
    size = 1;
    EXPECT_EQ(RQueryValueExA(key.get(), "Text", nullptr, nullptr, &size), 0);
    EXPECT_EQ(size, 12U);
}

TEST_F(Reading, a_dword_is_in_its_record) {
    uint32_t dword = 0;
    uint32_t size = 4;
    uint32_t type = 0;
    EXPECT_EQ(RQueryValueExW(key.get(), "", &type, &dword, &size), 0);
    EXPECT_EQ(dword, 0x12345678U);
    EXPECT_EQ(type, 4U);
}

TEST_F(Reading, text_comes_out_in_8_bits_and_is_cut_to_the_buffer) {
    char text[20];
    memset(text, '#', sizeof text);
    uint32_t size = sizeof text;
    EXPECT_EQ(RQueryValueExA(key.get(), "Text", nullptr, text, &size), 0);
    EXPECT_EQ(size, 6U);
    EXPECT_STREQ(text, "hello");
    memset(text, '#', sizeof text);
    size = 4;
    EXPECT_EQ(RQueryValueExA(key.get(), "Text", nullptr, text, &size), 0);
    EXPECT_EQ(size, 6U);
    EXPECT_EQ(std::string(text, 5), std::string("hel\0#", 5));
}

TEST_F(Reading, every_string_of_a_multi_string_comes_out) {
    char text[20];
    memset(text, '#', sizeof text);
    uint32_t size = sizeof text;
    EXPECT_EQ(RQueryValueExA(key.get(), "Multi", nullptr, text, &size), 0);
    EXPECT_EQ(size, 8U);
    EXPECT_EQ(std::string(text, 8), std::string("ab\0cde\0\0", 8));
}

TEST_F(Reading, raw_data_of_an_A_call_is_cut_and_its_whole_size_told) {
    Bytes data(20, 0xEE);
    uint32_t size = 10;
    EXPECT_EQ(RQueryValueExA(key.get(), "Raw", nullptr, data.data(), &size), 0);
    EXPECT_EQ(size, 50U);
    const Bytes expected = pattern(50);
    EXPECT_TRUE(std::equal(data.begin(), data.begin() + 10, expected.begin()));
    EXPECT_EQ(data[10], 0xEE);
}

TEST_F(Reading, an_A_call_does_not_read_big_data) {
    Bytes data(50000);
    uint32_t size = 50000;
    EXPECT_EQ(RQueryValueExA(key.get(), "Big", nullptr, data.data(), &size), R_CAN_NOT_COMPLETE);
}

TEST(Values, text_that_an_A_call_cannot_read_gives_1003) {
    LaidHive hive = lay_out(tree());
    const ValuePlaces text = hive.at("Alpha").values[0];
    hive.mark_free(text.data);
    Scene scene(hive.bytes);
    const Handle key = scene.OpenKey("Alpha");
    for (const uint32_t room : {1U, 5U, 100U}) {
        Bytes data(100, 0xEE);
        uint32_t size = room;
        EXPECT_EQ(RQueryValueExA(key.get(), "Text", nullptr, data.data(), &size), R_CAN_NOT_COMPLETE);
        EXPECT_EQ(size, room);
        EXPECT_EQ(data, Bytes(100, 0xEE));
        // Its length stands in its record.
        EXPECT_EQ(RQueryValueExA(key.get(), "Text", nullptr, nullptr, &size), 0);
        EXPECT_EQ(size, 12U);
    }
}

TEST_F(Reading, an_index_at_or_past_the_end_gives_259) {
    for (uint32_t index : {7U, 8U, none}) {
        EXPECT_EQ(REnumValueA(key.get(), index, nullptr, nullptr, nullptr, nullptr, nullptr), R_NO_MORE_ITEMS);
        EXPECT_EQ(REnumValueW(key.get(), index, nullptr, nullptr, nullptr, nullptr, nullptr), R_NO_MORE_ITEMS);
    }
    for (uint32_t index : {1U, none}) {
        EXPECT_EQ(REnumKeyExA(key.get(), index, nullptr, nullptr, nullptr, nullptr, nullptr), R_NO_MORE_ITEMS);
        EXPECT_EQ(REnumKeyInfoA(key.get(), index, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr),
                  R_NO_MORE_ITEMS);
    }
}

TEST_F(Reading, a_null_key_has_its_own_status_in_each_call) {
    uint32_t size = 0;
    EXPECT_EQ(REnumKeyInfoA(nullptr, 0, nullptr, &size, nullptr, nullptr, nullptr, nullptr), R_FAILED);
    EXPECT_EQ(REnumKeyExA(nullptr, 0, nullptr, &size, nullptr, nullptr, nullptr), R_FAILED);
    EXPECT_EQ(REnumValueA(nullptr, 0, nullptr, nullptr, nullptr, nullptr, nullptr), R_FAILED);
    EXPECT_EQ(REnumValueW(nullptr, 0, nullptr, nullptr, nullptr, nullptr, nullptr), R_FAILED);
    EXPECT_EQ(RFindValueA(nullptr, "Text"), -1);
    EXPECT_EQ(RQueryValueExA(nullptr, "Text", nullptr, nullptr, nullptr), R_INVALID_HANDLE);
    EXPECT_EQ(RQueryValueExW(nullptr, "Text", nullptr, nullptr, nullptr), R_INVALID_HANDLE);
    EXPECT_EQ(RQueryInfoKeyA(nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr,
                             nullptr, nullptr, nullptr),
              R_INVALID_HANDLE);
    EXPECT_EQ(RQueryInfoKeyW(nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr,
                             nullptr, nullptr, nullptr),
              R_INVALID_HANDLE);
}

TEST_F(Reading, every_output_may_be_null) {
    EXPECT_EQ(REnumKeyInfoA(scene.root(), 0, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr), 0);
    EXPECT_EQ(REnumValueA(key.get(), 0, nullptr, nullptr, nullptr, nullptr, nullptr), 0);
    EXPECT_EQ(REnumValueW(key.get(), 0, nullptr, nullptr, nullptr, nullptr, nullptr), 0);
    EXPECT_EQ(RQueryInfoKeyA(key.get(), nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr,
                             nullptr, nullptr, nullptr),
              0);
}

TEST_F(Reading, the_numbers_of_a_key_are_its_records) {
    uint32_t subkeys = 0, subkey = 0, longest_class = 0, values = 0, value = 0, data = 0, security = 99;
    RegistryTime time{};
    EXPECT_EQ(RQueryInfoKeyW(key.get(), nullptr, nullptr, nullptr, nullptr, &subkeys, &subkey, &longest_class, &values,
                             &value, &data, &security, &time),
              0);
    EXPECT_EQ(subkeys, 1U);
    EXPECT_EQ(subkey, 3U);  // "One"
    EXPECT_EQ(longest_class, 0U);
    EXPECT_EQ(values, 7U);
    EXPECT_EQ(value, 5U);  // "Multi"
    EXPECT_EQ(data, 40000U);
    EXPECT_EQ(security, 4U);  // a descriptor of 24 bytes
    EXPECT_EQ(time.low, 0x89ABCDEFU);
    EXPECT_EQ(time.high, 0x01234567U);
}

TEST_F(Reading, a_class_comes_as_stored_and_without_a_buffer_its_size) {
    uint32_t size = 0;
    RQueryInfoKeyA(key.get(), nullptr, nullptr, nullptr, &size, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr,
                   nullptr, nullptr);
    EXPECT_EQ(size, 10U);
    size = 0;
    RQueryInfoKeyW(key.get(), nullptr, nullptr, nullptr, &size, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr,
                   nullptr, nullptr);
    EXPECT_EQ(size, 12U);
    char16_t text[8] = u"#######";
    size = sizeof text;
    RQueryInfoKeyW(key.get(), nullptr, nullptr, text, &size, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr,
                   nullptr, nullptr);
    EXPECT_EQ(size, 10U);
    EXPECT_EQ(std::u16string(text), u"Klass");
}

TEST_F(Reading, an_enumerated_class_comes_in_8_bits) {
    uint32_t size = 0;
    EXPECT_EQ(REnumKeyExA(scene.root(), 0, nullptr, nullptr, nullptr, &size, nullptr), 0);
    EXPECT_EQ(size, 6U);
    char text[8] = "#######";
    size = sizeof text;
    EXPECT_EQ(REnumKeyExA(scene.root(), 0, nullptr, nullptr, text, &size, nullptr), 0);
    EXPECT_EQ(size, 5U);
    EXPECT_STREQ(text, "Klass");
    size = 99;
    EXPECT_EQ(REnumKeyExA(key.get(), 0, nullptr, nullptr, nullptr, &size, nullptr), 0);
    EXPECT_EQ(size, 0U);
}

TEST_F(Reading, a_key_named_in_utf16_gives_123_and_its_bytes) {
    char name[20] = {};
    uint32_t size = sizeof name;
    EXPECT_EQ(REnumKeyExA(scene.root(), 1, name, &size, nullptr, nullptr, nullptr), R_INVALID_NAME);
    EXPECT_EQ(size, 8U);
    EXPECT_EQ(std::string(name, 8), std::string("W\0i\0d\0e\0", 8));
    Handle wide;
    ASSERT_EQ(ROpenSubKey(scene.root(), 1, wide.out()), 0);
    size = sizeof name;
    uint32_t values = 99;
    EXPECT_EQ(RQueryInfoKeyA(wide.get(), name, &size, nullptr, nullptr, nullptr, nullptr, nullptr, &values, nullptr,
                             nullptr, nullptr, nullptr),
              R_INVALID_NAME);
    EXPECT_EQ(values, 0U);
    // One byte more, not one character: kept as callers know it.
    size = 0;
    EXPECT_EQ(RQueryInfoKeyW(wide.get(), nullptr, &size, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr,
                             nullptr, nullptr, nullptr),
              0);
    EXPECT_EQ(size, 9U);
}

TEST_F(Reading, the_root_has_no_name_to_show) {
    char name[20] = "######";
    uint32_t size = sizeof name;
    EXPECT_EQ(RQueryInfoKeyA(scene.root(), name, &size, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr,
                             nullptr, nullptr, nullptr),
              0);
    EXPECT_EQ(size, 0U);
    EXPECT_STREQ(name, "");
}

TEST_F(Reading, a_value_is_found_by_name_whatever_its_case) {
    EXPECT_EQ(RFindValueA(key.get(), "tEXT"), 0);
    EXPECT_EQ(RFindValueA(key.get(), ""), 1);
    EXPECT_EQ(RFindValueA(key.get(), nullptr), 1);
    EXPECT_EQ(RFindValueA(key.get(), "WIDE"), 5);
    EXPECT_EQ(RFindValueA(key.get(), "W"), -1);
    EXPECT_EQ(RFindValueA(key.get(), "Texts"), -1);
}

struct DamagedData {
    const char* rule;
    void (*apply)(LaidHive&, const ValuePlaces&);
    int32_t status;
};

class Damaged : public testing::TestWithParam<DamagedData> {};

TEST_P(Damaged, big_data_gives) {
    LaidHive hive = lay_out(tree());
    GetParam().apply(hive, hive.at("Alpha").values[4]);
    Scene scene(hive.bytes);
    Handle key = scene.OpenKey("Alpha");
    Bytes data(70000);
    auto size = static_cast<uint32_t>(data.size());
    EXPECT_EQ(RQueryValueExW(key.get(), "Big", nullptr, data.data(), &size), GetParam().status);
    EXPECT_TRUE(scene.Untouched());
}

INSTANTIATE_TEST_SUITE_P(
    Rows, Damaged,
    testing::Values(
        DamagedData{"no_db_record", [](LaidHive& h, const ValuePlaces& p) { h.put16(p.data, 0, 1); },
                    R_CAN_NOT_COMPLETE},
        DamagedData{"free_record", [](LaidHive& h, const ValuePlaces& p) { h.mark_free(p.data); }, R_CAN_NOT_COMPLETE},
        DamagedData{"more_than_the_segments_hold",
                    [](LaidHive& h, const ValuePlaces& p) { h.put32(p.record, 4, 60000); }, R_REGISTRY_CORRUPT},
        DamagedData{"no_segments", [](LaidHive& h, const ValuePlaces& p) { h.put16(p.data, 2, 0); },
                    R_REGISTRY_CORRUPT},
        DamagedData{"list_shorter_than_its_count", [](LaidHive& h, const ValuePlaces& p) { h.put16(p.data, 2, 65535); },
                    R_REGISTRY_IO_FAILED},
        DamagedData{"inline_of_five_bytes", [](LaidHive& h, const ValuePlaces& p) { h.put32(p.record, 4, 0x80000005); },
                    R_CAN_NOT_COMPLETE}),
    [](const auto& row) { return row.param.rule; });

// Whoever hears that there is no value of a name may go on to store one.
TEST(Values, one_that_could_not_be_read_is_never_said_to_be_missing) {
    HiveLayout layout;
    KeyLayout& key = layout.root.add("Top");
    const std::u16string longer(u"name\0x", 6);
    key.set("", 3, pattern(40)).name = longer;
    for (int i = 0; i < 300; i++)
        key.set("other" + std::to_string(i), 3, pattern(40));
    key.set("name", 4, {1, 2, 3, 4});
    Scene scene(layout);
    const Bytes before = scene.bytes();
    bool failed = true;
    for (uint64_t nth = 1; failed; nth++) {
        ASSERT_TRUE(scene.Reopen());
        Handle handle = scene.OpenKey("Top");
        const MemoryFile::Failure failure = {.call = MemoryFile::Call::read, .nth = nth};
        scene.file().arm(failure);
        const int32_t position = RFindValueA(handle.get(), "name");
        EXPECT_TRUE(position == 301 || (scene.file().failed() && position == -1)) << nth << ": " << position;
        scene.file().arm(failure);
        EXPECT_NE(RQueryValueExA(handle.get(), "name", nullptr, nullptr, nullptr), R_FILE_NOT_FOUND) << nth;
        EXPECT_NE(RQueryValueExW(handle.get(), "name", nullptr, nullptr, nullptr), R_FILE_NOT_FOUND) << nth;
        scene.file().arm(failure);
        const bool deleted = RDeleteValue(handle.get(), "name") == 0;
        failed = scene.file().failed();
        scene.file().disarm();
        const Hive now = scene.Read();
        EXPECT_EQ(now.find("Top")->values.size(), deleted ? 301U : 302U) << nth;
        EXPECT_EQ(now.find("Top")->values.at(0).name, longer) << nth;
        handle.reset();
        ASSERT_EQ(scene.Close(), 0);
        scene.file().bytes = before;
    }
}

}  // namespace
