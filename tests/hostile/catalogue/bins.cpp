// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "catalogue.h"

#include <algorithm>

namespace hostile {

using testkit::base_block_bytes;
using testkit::pattern;

namespace {

HiveLayout large_bin() {
    HiveLayout layout = stage();
    layout.bin_size = 1U << 20U;
    layout.free_bytes = 0;
    return layout;
}

HiveLayout two_large_bins() {
    HiveLayout layout = large_bin();
    layout.free_bytes = (1U << 20U) - 32;
    return layout;
}

}  // namespace

void add_bins(List& list) {
    const auto in_header = [&](const std::string& name, uint32_t field, uint32_t n) {
        list.add("first_bin_" + name, Readable::no, {""},
                 [=](Damage& d) { testkit::set32(d.hive.bytes, base_block_bytes + field, n); });
        list.add("last_bin_" + name, Readable::no, {""},
                 [=](Damage& d) { testkit::set32(d.hive.bytes, d.hive.bytes.size() - 4096 + field, n); });
    };
    in_header("with_another_signature", 0, 0x6E696248);
    in_header("without_signature", 0, 0);
    in_header("that_says_it_is_elsewhere", 4, 0x00100000);
    in_header("that_says_it_is_at_minus_one", 4, none);
    in_header("whose_offset_is_off_by_8", 4, 8);
    for (const uint32_t size :
         {0U, 4U, 32U, 2048U, 4095U, 4100U, 5000U, 0x01000000U, 0x7FFFF000U, 0x80000000U, 0xFFFFF000U, 0xFFFFFFFFU})
        in_header("of_size_" + std::to_string(size), 8, size);
    list.add("last_bin_past_the_data_size", Readable::no, {""}, [](Damage& d) {
        testkit::set32(d.hive.bytes, d.hive.bytes.size() - 4096 + 8, 8192);
        d.hive.bytes.resize(d.hive.bytes.size() + 4096);
    });
    list.add("zeros_for_the_last_bin", Readable::no, {""},
             [](Damage& d) { std::fill(d.hive.bytes.end() - 4096, d.hive.bytes.end(), uint8_t{0}); });
    list.add("zeros_for_the_first_bin", Readable::no, {""},
             [](Damage& d) { std::fill(d.hive.bytes.begin() + 4096, d.hive.bytes.begin() + 8192, uint8_t{0}); });
    list.add("zeros_for_a_further_bin", Readable::no, {""}, [](Damage& d) {
        d.hive.bytes.resize(d.hive.bytes.size() + 4096, 0);
        d.hive.put_base(40, testkit::get32(d.hive.bytes, 40) + 4096);
        d.hive.fix_checksum();
    });
    list.add("two_bins_where_the_header_of_the_first_takes_in_the_second", Readable::no, {""}, [](Damage& d) {
        // The cells no longer tile it: the second one's header stands among them.
        testkit::set32(d.hive.bytes, base_block_bytes + 8, 8192);
    });
    // The file ends within the free cell that the last bin's header makes so large.
    for (const int in_use : {0, 1}) {
        const std::string name =
            in_use == 0 ? "bin_of_two_gigabytes_in_a_file_of_few" : "bin_of_two_gigabytes_in_use_in_a_file_of_few";
        list.add(name, Readable::whole, {}, [in_use](Damage& d) {
            const uint32_t bin = testkit::get32(d.hive.bytes, 40) - 4096;
            const uint32_t size = 0x7FFF0000 - bin;
            const auto cell = static_cast<int32_t>(size - 32);
            testkit::set32(d.hive.bytes, base_block_bytes + uint64_t{bin} + 8, size);
            d.hive.set_cell_size(bin + 32, in_use == 0 ? cell : -cell);
            d.result.lies = in_use == 1;  // no bin goes behind it
            d.hive.put_base(40, bin + size);
            d.hive.fix_checksum();
        });
    }
    list.add_on(large_bin, "bin_of_a_megabyte", Readable::whole, {}, [](Damage&) {});
    list.add_on(two_large_bins, "two_bins_of_a_megabyte", Readable::whole, {}, [](Damage&) {});
}

}  // namespace hostile
