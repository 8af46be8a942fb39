// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "catalogue.h"

namespace hostile {

using testkit::pattern;
using testkit::Storage;
using testkit::text_data;
using testkit::ValueLayout;

namespace {

constexpr uint32_t count_field = 36;
constexpr uint32_t list_field = 40;
constexpr uint32_t size_field = 4;
constexpr uint32_t data_inline = 0x80000000;

void add_lists(List& list) {
    for (const uint32_t count : {6U, 100U, 0x3FFFFFFFU, 0x40000000U, 0x7FFFFFFFU, 0xFFFFFFFFU}) {
        list.add("value_list_shorter_than_a_count_of_" + std::to_string(count), Readable::whole, {},
                 [count](Damage& d) {
                     d.result.lies = true;
                     d.keep(d.at("Alpha").value_list);
                     d.hive.put32(d.at("Alpha").record, count_field, count);
                 });
        list.add("value_count_of_" + std::to_string(count) + "_without_a_list", Readable::whole, {},
                 [count](Damage& d) {
                     d.result.lies = true;
                     d.hive.put32(d.at("Zeta").record, count_field, count);
                 });
        list.add("value_count_of_" + std::to_string(count) + "_with_a_list_at_0", Readable::whole, {},
                 [count](Damage& d) {
                     d.result.lies = true;
                     d.hive.put32(d.at("Zeta").record, count_field, count);
                     d.hive.put32(d.at("Zeta").record, list_field, 0);
                 });
    }
    list.add("value_list_cut_by_its_cell", Readable::partly, {"Alpha|"}, [](Damage& d) {
        d.keep(d.at("Alpha").value_list);
        d.cut_cell(d.at("Alpha").value_list, 16);
    });
    list.add("value_count_below_its_list", Readable::partly, {"Alpha|"},
             [](Damage& d) { d.hive.put32(d.at("Alpha").record, count_field, 2); });
    list.add("value_count_0_with_a_list", Readable::partly, {"Alpha|"},
             [](Damage& d) { d.hive.put32(d.at("Alpha").record, count_field, 0); });
    list.add("value_list_where_one_stands_twice", Readable::partly, {"Alpha|"},
             [](Damage& d) { d.hive.put32(d.at("Alpha").value_list, 16, d.at("Alpha").values[1].record); },
             {"Alpha|Text"});
    list.add("value_list_of_one_alone", Readable::partly, {"Alpha|"},
             [](Damage& d) {
                 for (uint32_t slot = 0; slot < 5; slot++)
                     d.hive.put32(d.at("Alpha").value_list, 4 * slot, d.at("Alpha").values[3].record);
             },
             {"Alpha|Raw"});
    list.add("value_list_with_a_key_in_it", Readable::partly, {"Alpha|"},
             [](Damage& d) { d.hive.put32(d.at("Alpha").value_list, 8, d.at("Zeta").record); });
    list.add("value_list_of_nothing_but_itself", Readable::partly, {"Alpha|"}, [](Damage& d) {
        for (uint32_t slot = 0; slot < 5; slot++)
            d.hive.put32(d.at("Alpha").value_list, 4 * slot, d.at("Alpha").value_list);
    });
}

void add_records(List& list) {
    const auto record = [&](const std::string& name, const std::function<void(Damage&, uint32_t)>& damage) {
        list.add("value_record_" + name, Readable::partly, {"Alpha|"}, [damage](Damage& d) {
            const uint32_t cell = d.at("Alpha").values[1].record;
            d.keep(cell);
            damage(d, cell);
        });
    };
    record("of_another_signature", [](Damage& d, uint32_t cell) { d.hive.put16(cell, 0, 0x6B77); });
    record("of_4_bytes", [](Damage& d, uint32_t cell) { d.cut_cell(cell, 8); });
    record("of_12_bytes", [](Damage& d, uint32_t cell) { d.cut_cell(cell, 16); });
    record("that_ends_before_its_name", [](Damage& d, uint32_t cell) { d.cut_cell(cell, 24); });
    for (const uint16_t length : {uint16_t{9}, uint16_t{256}, uint16_t{16384}, uint16_t{65535}})
        record("with_a_name_of_" + std::to_string(length) + "_bytes_past_its_cell",
               [length](Damage& d, uint32_t cell) { d.hive.put16(cell, 2, length); });
    record("free", [](Damage& d, uint32_t cell) {
        d.result.unsettled = {"Alpha|"};
        d.result.untouchable.clear();
        d.hive.mark_free(cell);
    });
}

// Alpha with one value more, of any kind.
std::function<HiveLayout()> with_value(const ValueLayout& value) {
    return [value] {
        HiveLayout layout = stage();
        layout.root.children[0].values.push_back(value);
        return layout;
    };
}

ValueLayout value_of(uint32_t type, const Bytes& data, Storage storage = Storage::fitting) {
    ValueLayout value;
    value.name = u"Odd";
    value.type = type;
    value.data = data;
    value.storage = storage;
    return value;
}

ValueLayout named(const std::u16string& name, bool wide) {
    ValueLayout value = value_of(3, pattern(12));
    value.name = name;
    value.wide_name = wide;
    return value;
}

void add_names(List& list) {
    const auto with = [&](const std::string& what, const std::u16string& name, bool wide,
                          const List::Places& shared = {}) {
        list.add_on(
            with_value(named(name, wide)), "value_name_" + what, Readable::whole, {}, [](Damage&) {}, shared);
    };
    with("in_utf16", u"\u0416\u4E2D", true);
    with("in_utf16_that_8_bits_could_carry", u"wide", true);
    with("in_utf16_whose_bytes_begin_like_another", u"T", true);
    // Its bytes are those of "Text" and a zero.
    with("in_utf16_whose_bytes_are_those_of_another", std::u16string({char16_t{0x6554}, char16_t{0x7478}}), true);
    with("in_utf16_that_is_anothers", u"Text", true, {"Alpha|Text"});
    with("in_utf16_with_half_a_pair", std::u16string({u'm', char16_t{0xD800}}), true);
    with("with_a_zero_byte", std::u16string(u"Te\0xt", 5), false);
    with("that_is_anothers_with_a_zero_byte_behind", std::u16string(u"Text\0", 5), false, {"Alpha|Text"});
    with("of_a_zero_byte", std::u16string(1, u'\0'), false, {"Alpha|"});
    with("with_bytes_above_7F", u"\u00C4\u00E4", false);
    with("with_a_backslash", u"a\\b", false);
    with("of_another_in_another_case", u"TEXT", false);
    with("of_another", u"Text", false, {"Alpha|Text"});
    with("empty_for_the_second_time", u"", false, {"Alpha|"});
    with("empty_in_utf16", u"", true, {"Alpha|"});
    with("of_1000_characters", std::u16string(1000, u'n'), false);
    list.add_on(with_value(named(u"wide", true)), "value_name_of_odd_length_in_utf16", Readable::partly, {"Alpha|"},
                [](Damage& d) { d.hive.put16(d.at("Alpha").values[5].record, 2, 7); });
}

void add_sizes(List& list) {
    const auto sized = [&](const std::string& name, uint32_t size, Readable readable = Readable::partly) {
        list.add("value_of_size_" + name, readable, {"Alpha|Raw"}, [size](Damage& d) {
            d.keep(d.at("Alpha").values[3].data);
            d.result.untouchable.clear();
            d.hive.put32(d.at("Alpha").values[3].record, size_field, size);
        });
    };
    sized("7FFFFFFF", 0x7FFFFFFF);
    sized("7FFFFFF0", 0x7FFFFFF0);
    sized("100000", 0x100000);
    sized("1_more_than_its_cell", 101 + 4);
    sized("0_without_the_inline_bit", 0);
    sized("0_with_the_inline_bit", data_inline);
    sized("4_with_the_inline_bit_over_an_offset", data_inline | 4);
    sized("5_inline", data_inline | 5);
    sized("8_inline", data_inline | 8);
    sized("100_inline", data_inline | 100);
    sized("7FFFFFFF_inline", none);
    list.add("value_data_marked_free", Readable::partly, {"Alpha|Raw"}, [](Damage& d) {
        d.result.unsettled = {"Alpha|Raw"};
        d.hive.mark_free(d.at("Alpha").values[3].data);
    });
}

// Data that is not what its type says: read as it is stored.
void add_types(List& list) {
    const auto typed = [&](const std::string& name, uint32_t type, const Bytes& data,
                           Storage storage = Storage::fitting) {
        list.add_on(with_value(value_of(type, data, storage)), name, Readable::whole, {}, [](Damage&) {});
    };
    for (const uint32_t type : {4U, 5U}) {
        const std::string name = type == 4 ? "dword_of_" : "big_endian_dword_of_";
        for (const size_t size : {0U, 1U, 3U, 5U, 8U})
            typed(name + std::to_string(size) + "_bytes", type, pattern(size));
    }
    for (const size_t size : {0U, 4U, 7U, 9U})
        typed("qword_of_" + std::to_string(size) + "_bytes", 11, pattern(size));
    typed("dword_in_a_cell_of_its_own", 4, pattern(4), Storage::cell);
    for (const uint32_t type : {1U, 2U, 6U}) {
        const std::string name = "text_of_type_" + std::to_string(type);
        typed(name + "_of_odd_size", type, {'a', 0, 'b', 0, 'c'});
        typed(name + "_of_one_byte", type, {'a'});
        typed(name + "_without_its_zero", type, {'a', 0, 'b', 0, 'c', 0});
        typed(name + "_with_text_after_it", type, {'a', 0, 0, 0, 'b', 0, 'c', 0, 0, 0});
        typed(name + "_of_no_bytes", type, {});
        typed(name + "_with_half_a_pair", type, {0x00, 0xD8, 'x', 0, 0, 0});
    }
    typed("multi_string_without_its_zeros", 7, {'a', 0, 'b', 0, 'c', 0});
    typed("multi_string_with_one_zero", 7, {'a', 0, 'b', 0, 0, 0});
    typed("multi_string_of_odd_size", 7, {'a', 0, 0, 0, 'b', 0, 0, 0, 0});
    typed("multi_string_of_no_bytes", 7, {});
    typed("multi_string_of_one_byte", 7, {'a'});
    typed("multi_string_with_empty_strings", 7, {0, 0, 'a', 0, 0, 0, 0, 0, 'b', 0, 0, 0, 0, 0});
    for (const uint32_t type : {0U, 8U, 9U, 10U, 12U, 13U, 99U, 0x7FFFFFFFU, 0xFFFF0012U, 0xFFFFFFFFU})
        typed("value_of_type_" + std::to_string(type), type, pattern(9));
}

}  // namespace

void add_values(List& list) {
    add_lists(list);
    add_records(list);
    add_names(list);
    add_sizes(list);
    add_types(list);
}

}  // namespace hostile
