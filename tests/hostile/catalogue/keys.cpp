// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "catalogue.h"

namespace hostile {

using testkit::pattern;

namespace {

constexpr uint32_t flags_field = 2;
constexpr uint32_t parent_field = 16;
constexpr uint32_t count_field = 20;
constexpr uint32_t volatile_count_field = 24;
constexpr uint32_t index_field = 28;
constexpr uint32_t class_field = 48;
constexpr uint32_t name_length_field = 72;
constexpr uint32_t class_length_field = 74;

void add_records(List& list) {
    const List::Places third{"Alpha\\Third"};
    for (const uint32_t room : {4U, 12U, 44U, 68U}) {
        list.add("key_record_of_" + std::to_string(room) + "_bytes", Readable::partly, third, [room](Damage& d) {
            d.keep_record("Alpha\\Third");
            d.cut_cell(d.at("Alpha\\Third").record, room + 4);
        });
    }
    list.add("key_record_that_ends_before_its_name", Readable::partly, third, [](Damage& d) {
        d.keep_record("Alpha\\Third");
        d.cut_cell(d.at("Alpha\\Third").record, 80);
    });
    list.add("key_record_of_another_signature", Readable::partly, third, [](Damage& d) {
        d.keep_record("Alpha\\Third");
        d.hive.put16(d.at("Alpha\\Third").record, 0, 0x6B6D);
    });
    for (const uint16_t length : {uint16_t{9}, uint16_t{256}, uint16_t{4096}, uint16_t{32768}, uint16_t{65535}}) {
        list.add("key_name_of_" + std::to_string(length) + "_bytes_in_a_short_cell", Readable::partly, third,
                 [length](Damage& d) {
                     d.keep_record("Alpha\\Third");
                     d.hive.put16(d.at("Alpha\\Third").record, name_length_field, length);
                 });
    }
    list.add("key_with_an_unknown_flag", Readable::whole, {},
             [](Damage& d) { d.hive.put16(d.at("Alpha\\Third").record, flags_field, 0xF020); });
    list.add("key_that_says_it_is_the_root", Readable::whole, {},
             [](Damage& d) { d.hive.put16(d.at("Alpha\\Third").record, flags_field, 0x2C); });
    list.add("key_that_is_a_link", Readable::whole, {},
             [](Damage& d) { d.hive.put16(d.at("Alpha\\Third").record, flags_field, 0x30); });
    for (const uint32_t count : {1U, 0x7FFFFFFFU, none}) {
        list.add("key_with_" + std::to_string(count) + "_volatile_subkeys", Readable::whole, {}, [count](Damage& d) {
            d.hive.put32(d.at("Alpha").record, volatile_count_field, count);
            d.hive.put32(d.at("Alpha").record, 32, count);
        });
    }
}

// A hive whose key Alpha has a subkey of that name between two others.
std::function<HiveLayout()> named(const std::u16string& name, bool wide) {
    return [name, wide] {
        HiveLayout layout;
        layout.free_bytes = 3000;
        testkit::KeyLayout& alpha = layout.root.add("Alpha");
        alpha.add("AA").set("v", 4, pattern(4));
        testkit::KeyLayout& odd = alpha.add("");
        odd.name = name;
        odd.wide_name = wide;
        odd.set("inside", 3, pattern(30));
        odd.add("below");
        alpha.add("zz");
        add_left_alone(layout);
        return layout;
    };
}

void add_names(List& list) {
    const auto with = [&](const std::string& what, const std::u16string& name, bool wide) {
        list.add_on(named(name, wide), "key_name_" + what, Readable::whole, {}, [](Damage&) {});
    };
    with("of_length_0", u"", false);
    with("of_length_0_in_utf16", u"", true);
    with("of_256_characters", std::u16string(256, u'm'), false);
    with("of_600_characters", std::u16string(600, u'm'), false);
    with("of_256_characters_in_utf16", std::u16string(256, u'm'), true);
    with("of_700_characters_in_utf16", std::u16string(700, u'm'), true);
    with("with_a_zero_byte", std::u16string(u"m\0n", 3), false);
    with("of_a_zero_byte", std::u16string(1, u'\0'), false);
    with("with_a_zero_in_utf16", std::u16string(u"m\0n", 3), true);
    with("that_is_an_earlier_ones_with_a_zero_byte_behind", std::u16string(u"AA\0", 3), false);
    with("with_a_backslash", u"m\\n", false);
    with("of_a_backslash", u"\\", false);
    with("with_a_backslash_in_utf16", u"m\\n", true);
    with("with_half_a_surrogate_pair", std::u16string({u'm', char16_t{0xD800}, u'n'}), true);
    with("with_the_second_half_of_a_pair", std::u16string({char16_t{0xDC00}}), true);
    with("with_bytes_above_7F", u"m\u00C4\u00E4\u00FF", false);
    with("of_bytes_above_7F", u"\u00C4", false);
    with("in_utf16_that_8_bits_could_carry", u"middle", true);
    with("in_utf16_beyond_8_bits", u"\u0416\u4E2D", true);
    list.add_on(named(u"mmm", true), "key_name_of_odd_length_in_utf16", Readable::partly, {"Alpha\\mmm", "Alpha\\mm"},
                [](Damage& d) { d.hive.put16(d.at("Alpha\\mmm").record, name_length_field, 5); });
    list.add_on(named(u"mmm", true), "key_name_of_one_byte_in_utf16", Readable::partly, {"Alpha\\mmm", "Alpha\\"},
                [](Damage& d) { d.hive.put16(d.at("Alpha\\mmm").record, name_length_field, 1); });
    list.add_on(named(u"zz", false), "two_keys_of_one_name", Readable::whole, {}, [](Damage&) {},
                {"Alpha\\zz", "Alpha\\ZZ"});
    list.add_on(named(u"ZZ", false), "two_keys_of_one_name_in_another_case", Readable::whole, {}, [](Damage&) {});
    list.add_on(named(u"zz", true), "two_keys_of_one_name_one_in_utf16", Readable::whole, {}, [](Damage&) {},
                {"Alpha\\zz"});
}

void add_counts(List& list) {
    const auto counted = [&](const std::string& name, uint32_t count) {
        list.add("subkey_count_" + name, Readable::partly, {"Alpha\\"}, [count](Damage& d) {
            d.keep(d.at("Alpha").index);
            d.hive.put32(d.at("Alpha").record, count_field, count);
        });
        list.add("subkey_count_" + name + "_over_an_index_root", Readable::partly, {"Beta\\"}, [count](Damage& d) {
            d.keep(d.at("Beta").index);
            for (const uint32_t leaf : d.at("Beta").leaves)
                d.keep(leaf);
            d.hive.put32(d.at("Beta").record, count_field, count);
        });
    };
    counted("one_below_its_list", 2);
    for (const auto& [name, count] : std::vector<std::pair<std::string, uint32_t>>{
             {"one_above_its_list", 4}, {"of_7FFFFFFF", 0x7FFFFFFF}, {"all_ones", none}}) {
        list.add("subkey_count_" + name, Readable::whole, {}, [count = count](Damage& d) {
            d.result.lies = true;
            d.keep(d.at("Alpha").index);
            d.hive.put32(d.at("Alpha").record, count_field, count);
        });
        list.add("subkey_count_" + name + "_over_an_index_root", Readable::whole, {}, [count = count](Damage& d) {
            d.result.lies = true;
            d.keep(d.at("Beta").index);
            d.hive.put32(d.at("Beta").record, count_field, count == none ? none : count + 2);
        });
    }
    // A key that says it has none is empty, whatever list it still names.
    list.add("subkey_count_0_with_a_list", Readable::partly, {"Alpha\\"},
             [](Damage& d) { d.hive.put32(d.at("Alpha").record, count_field, 0); });
    for (const uint32_t count : {1U, 3U, 0x7FFFFFFFU, none}) {
        list.add("subkey_count_of_" + std::to_string(count) + "_without_a_list", Readable::whole, {},
                 [count](Damage& d) {
                     d.result.lies = true;
                     d.hive.put32(d.at("Zeta").record, count_field, count);
                     d.hive.put32(d.at("Zeta").record, index_field, none);
                 });
    }
    list.add("root_with_a_count_above_its_list", Readable::whole, {}, [](Damage& d) {
        d.result.lies = true;
        d.keep(d.at("").index);
        d.hive.put32(d.at("").record, count_field, 0x10000);
    });
    list.add("root_with_a_count_of_0_and_a_list", Readable::partly, {""},
             [](Damage& d) { d.hive.put32(d.at("").record, count_field, 0); });
}

void add_parents(List& list) {
    const auto parent = [&](const std::string& name, const std::function<uint32_t(Damage&)>& where) {
        list.add("parent_" + name, Readable::whole, {},
                 [where](Damage& d) { d.hive.put32(d.at("Alpha\\Inner").record, parent_field, where(d)); });
    };
    parent("wrong", [](Damage& d) { return d.at("Gamma").record; });
    parent("its_own_subkey", [](Damage& d) { return d.at("Alpha\\Inner\\Deeper").record; });

    const auto ring = [&](const std::string& name, const std::string& key, const std::string& top,
                          uint32_t entry_position) {
        list.add("key_that_lists_" + name, Readable::partly, {top},
                 [=](Damage& d) { d.hive.put32(d.at(key).index, 4 + 8 * entry_position, d.at(top).record); }, {top});
    };
    ring("itself", "Alpha", "Alpha", 0);
    ring("its_parent", "Alpha\\Inner", "Alpha", 0);
    ring("the_root", "Alpha\\Inner", "", 0);
    list.add("key_that_lists_itself_twice", Readable::partly, {"Alpha"},
             [](Damage& d) {
                 d.hive.put32(d.at("Alpha").index, 4, d.at("Alpha").record);
                 d.hive.put32(d.at("Alpha").index, 12, d.at("Alpha").record);
             },
             {"Alpha"});
    list.add("keys_that_list_one_another", Readable::partly, {"Alpha", "Gamma"},
             [](Damage& d) {
                 d.hive.put32(d.at("Alpha").index, 4, d.at("Gamma").record);
                 d.hive.put32(d.at("Gamma").index, 4, d.at("Alpha").record);
             },
             {"Alpha", "Gamma"});
}

void add_classes(List& list) {
    list.add("class_length_without_offset", Readable::whole, {},
             [](Damage& d) { d.hive.put16(d.at("Zeta").record, class_length_field, 20); });
    list.add("class_offset_without_length", Readable::whole, {},
             [](Damage& d) { d.hive.put32(d.at("Zeta").record, class_field, d.at("Alpha").class_cell); });
    for (const uint16_t length : {uint16_t{14}, uint16_t{4096}, uint16_t{65535}}) {
        list.add("class_of_" + std::to_string(length) + "_bytes_past_its_cell", Readable::partly, {"Alpha"},
                 [length](Damage& d) {
                     d.keep(d.at("Alpha").class_cell);
                     d.hive.put16(d.at("Alpha").record, class_length_field, length);
                 });
    }
    list.add("class_of_odd_length", Readable::partly, {"Alpha"},
             [](Damage& d) { d.hive.put16(d.at("Alpha").record, class_length_field, 9); });
}

// A chain of keys, each with one subkey, in one large bin. Laid out by hand: a tree of that depth is not for
// recursion.
Bytes chain(uint32_t depth) {
    constexpr uint32_t key_cell = 88;
    constexpr uint32_t leaf_cell = 16;
    constexpr uint32_t step = key_cell + leaf_cell;
    HiveLayout layout;
    LaidHive base = lay_out(layout);
    const uint64_t needed = 32 + uint64_t{step} * depth + 64;
    const auto bin_size = static_cast<uint32_t>((needed + 4095) & ~uint64_t{4095});
    const uint32_t bin = testkit::get32(base.bytes, 40);
    const uint32_t first = bin + 32;
    const uint32_t root = base.at("").record;
    base.bytes.resize(base.bytes.size() + bin_size, 0);
    const auto word = [&](uint32_t offset, uint32_t n) {
        testkit::set32(base.bytes, testkit::base_block_bytes + uint64_t{offset}, n);
    };
    word(bin, 0x6E696268);
    word(bin + 4, bin);
    word(bin + 8, bin_size);
    for (uint32_t level = 0; level < depth; level++) {
        const uint32_t leaf = first + level * step;
        const uint32_t key = leaf + leaf_cell;
        base.set_cell_size(leaf, -static_cast<int32_t>(leaf_cell));
        base.put16(leaf, 0, 0x666C);
        base.put16(leaf, 2, 1);
        base.put32(leaf, 4, key);
        base.put32(leaf, 8, 'k');
        base.set_cell_size(key, -static_cast<int32_t>(key_cell));
        base.put16(key, 0, 0x6B6E);
        base.put16(key, 2, 0x20);
        base.put32(key, 16, level == 0 ? root : key - step);
        const bool last = level + 1 == depth;
        base.put32(key, count_field, last ? 0 : 1);
        base.put32(key, index_field, last ? none : key + key_cell);
        base.put32(key, 32, none);
        base.put32(key, 40, none);
        base.put32(key, 44, base.security[0]);
        base.put32(key, 48, none);
        base.put16(key, name_length_field, 1);
        base.bytes[LaidHive::position(key, 76)] = 'k';
    }
    const uint32_t end = first + depth * step;
    base.set_cell_size(end, static_cast<int32_t>(bin + bin_size - end));
    base.put32(root, count_field, 1);
    base.put32(root, index_field, first);
    base.put32(base.security[0], 12, depth + 1);
    base.put_base(40, bin + bin_size);
    base.fix_checksum();
    return base.bytes;
}

}  // namespace

void add_keys(List& list) {
    add_records(list);
    add_names(list);
    add_counts(list);
    add_parents(list);
    add_classes(list);
}

void add_depths(List& list) {
    for (const uint32_t depth : {512U, 513U, 10000U, 1000000U})
        list.add_bytes(
            "keys_" + std::to_string(depth) + "_deep", depth == 512 ? Readable::whole : Readable::partly,
            [depth] { return chain(depth); }, true);
}

}  // namespace hostile
