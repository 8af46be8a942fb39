// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "catalogue.h"

#include <cstring>

namespace hostile {

using testkit::base_block_bytes;
using testkit::lay_out;
using testkit::pattern;

namespace {

Bytes first_bytes(size_t count) {
    Bytes bytes = lay_out(stage()).bytes;
    bytes.resize(count);
    return bytes;
}

// A hive's log: its base block, and behind it the pages that were to be written.
Bytes log_of(const char* mark, uint32_t kind, size_t head_bytes) {
    const Bytes hive = lay_out(stage()).bytes;
    Bytes bytes(hive.begin(), hive.begin() + 512);
    testkit::set32(bytes, 28, kind);
    testkit::set32(bytes, 508, testkit::base_checksum(bytes));
    bytes.resize(head_bytes, 0xFF);
    memcpy(bytes.data() + 512, mark, 4);
    bytes.insert(bytes.end(), hive.begin() + base_block_bytes, hive.end());
    return bytes;
}

// Three bins, the root and its list of subkeys in the first one.
HiveLayout three_bins() {
    HiveLayout layout;
    layout.root.add("Near").set("v", 4, pattern(4));
    layout.root.add("Wide").set("first", 3, pattern(3000));
    layout.root.add("Zone").set("second", 3, pattern(3000, 5));
    return layout;
}

void add_sizes(List& list) {
    for (const uint32_t size :
         {0U, 1U, 100U, 4000U, 4100U, 8200U, 0x7FFFF000U, 0x80000000U, 0x80001000U, 0xFFFFF000U, 0xFFFFFFFFU}) {
        list.add("bins_size_" + std::to_string(size), Readable::no, {""}, [size](Damage& d) {
            d.hive.put_base(40, size);
            d.hive.fix_checksum();
        });
    }
    list.add("bins_size_larger_than_the_file", Readable::no, {""}, [](Damage& d) {
        d.hive.put_base(40, testkit::get32(d.hive.bytes, 40) + 4096);
        d.hive.fix_checksum();
    });
    list.add("bins_size_without_the_last_bin_with_free_space_alone", Readable::whole, {}, [](Damage& d) {
        d.hive.put_base(40, testkit::get32(d.hive.bytes, 40) - 4096);
        d.hive.fix_checksum();
    });
    list.add_on(three_bins, "bins_size_smaller_than_the_bins_present", Readable::partly, {"Wide|", "Zone", "Wide"},
                [](Damage& d) {
                    // The list of the root's subkeys, laid last, moves to the first bin.
                    const uint32_t list_cell = d.at("").index;
                    d.result.unsettled = d.result.affected;
                    d.hive.put_base(40, 4096);
                    d.hive.fix_checksum();
                    // What the cut-off bins hold is not the hive's any more, and a bin that is added goes
                    // over it.
                    if (list_cell >= 4096) {
                        uint32_t free = 32;
                        while (d.hive.cell_size(free) < 0)
                            free += static_cast<uint32_t>(-d.hive.cell_size(free));
                        const int32_t size = -d.hive.cell_size(list_cell);
                        const int32_t rest = d.hive.cell_size(free) - size;
                        memcpy(d.hive.bytes.data() + 4096 + free, d.hive.bytes.data() + 4096 + list_cell,
                               static_cast<size_t>(size));
                        d.hive.set_cell_size(free + static_cast<uint32_t>(size), rest);
                        d.hive.put32(d.at("").record, 28, free);
                    }
                });
}

void add_roots(List& list) {
    const auto root_at = [&](const std::string& name, const std::function<uint32_t(Damage&)>& where) {
        list.add("root_" + name, Readable::no, {""}, [where](Damage& d) {
            d.hive.put_base(36, where(d));
            d.hive.fix_checksum();
        });
    };
    root_at("offset_0", [](Damage&) { return 0U; });
    for (const uint32_t inside : {4U, 8U, 16U, 24U, 28U})
        root_at("inside_a_bin_header_at_" + std::to_string(inside), [inside](Damage&) { return inside; });
    for (const uint32_t off : {1U, 2U, 4U, 7U})
        root_at("misaligned_by_" + std::to_string(off), [off](Damage& d) { return d.at("").record + off; });
    root_at("at_the_end", [](Damage& d) { return testkit::get32(d.hive.bytes, 40); });
    root_at("past_the_end", [](Damage&) { return 0x00800000U; });
    root_at("far_past_the_end", [](Damage&) { return 0x7FFFFFF8U; });
    root_at("negative", [](Damage&) { return 0x80000020U; });
    root_at("all_ones", [](Damage&) { return none; });
    root_at("in_a_free_cell", [](Damage& d) { return d.free_space(); });
    root_at("in_the_middle_of_a_free_cell", [](Damage& d) {
        // A whole key record stands there, with a size word before it.
        const uint32_t cell = d.free_space() + 64;
        const uint32_t root = d.at("").record;
        memcpy(d.hive.bytes.data() + 4096 + cell, d.hive.bytes.data() + 4096 + root, 88);
        return cell;
    });
    root_at("at_its_own_cell_marked_free", [](Damage& d) {
        d.hive.mark_free(d.at("").record);
        return d.at("").record;
    });
    root_at("at_a_security_record", [](Damage& d) { return d.hive.security[0]; });
    root_at("at_a_value", [](Damage& d) { return d.at("Alpha").values[0].record; });
    root_at("at_a_list_of_values", [](Damage& d) { return d.at("Alpha").value_list; });
    root_at("at_an_index", [](Damage& d) { return d.at("").index; });
}

// Bytes behind the last bin. What looks like a bin there is none.
void add_bytes_behind(List& list) {
    for (const size_t count : {1U, 511U, 512U, 4095U, 4096U, 9000U}) {
        list.add("bytes_behind_the_last_bin_" + std::to_string(count), Readable::whole, {}, [count](Damage& d) {
            const Bytes more = pattern(count);
            d.hive.bytes.insert(d.hive.bytes.end(), more.begin(), more.end());
        });
    }
    list.add("a_whole_bin_behind_the_last_one", Readable::whole, {}, [](Damage& d) {
        const uint32_t end = testkit::get32(d.hive.bytes, 40);
        Bytes bin(d.hive.bytes.end() - 4096, d.hive.bytes.end());
        testkit::set32(bin, 4, end);
        d.hive.bytes.insert(d.hive.bytes.end(), bin.begin(), bin.end());
    });
}

}  // namespace

void add_file_and_base_block(List& list) {
    list.add_bytes("empty_file", Readable::no, [] { return Bytes(); });
    for (const size_t count : {1U, 3U, 4U, 5U, 36U, 44U, 511U, 512U, 4095U})
        list.add_bytes("file_of_" + std::to_string(count) + "_bytes", Readable::no,
                       [count] { return first_bytes(count); });
    list.add_bytes("base_block_and_no_bin", Readable::no, [] { return first_bytes(4096); });
    list.add_bytes("base_block_and_part_of_a_bin_header", Readable::no, [] { return first_bytes(4096 + 31); });
    list.add_bytes("base_block_that_says_that_there_is_no_bin", Readable::no, [] {
        Bytes bytes = first_bytes(4096);
        testkit::set32(bytes, 40, 0);
        testkit::set32(bytes, 508, testkit::base_checksum(bytes));
        return bytes;
    });
    list.add("other_signature", Readable::no, {""}, [](Damage& d) { d.hive.bytes[3] = 'F'; });
    list.add_bytes("text_file", Readable::no, [] {
        Bytes text;
        while (text.size() < 9000)
            for (const char c : std::string("Windows Registry Editor Version 5.00\r\n"))
                text.push_back(static_cast<uint8_t>(c));
        return text;
    });
    list.add_bytes("log_of_dirty_pages", Readable::no, [] { return log_of("DIRT", 1, 1024); });
    list.add_bytes("log_of_entries", Readable::no, [] { return log_of("HvLE", 6, 552); });
    list.add_bytes("log_of_entries_as_long_as_a_base_block", Readable::no, [] {
        Bytes bytes = log_of("HvLE", 6, 4096);
        memcpy(bytes.data() + 4096, "HvLE", 4);
        return bytes;
    });
    add_sizes(list);
    add_roots(list);
    add_bytes_behind(list);
}

}  // namespace hostile
