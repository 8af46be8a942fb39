// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "catalogue.h"

#include <algorithm>
#include <cstring>

namespace hostile {

using testkit::pattern;
using testkit::Storage;
using testkit::ValuePlaces;

namespace {

constexpr uint32_t data_bytes = 40000;  // three segments, the last one in part

HiveLayout with_segments() {
    HiveLayout layout;
    layout.free_bytes = 9000;  // more than the last segment has to hold
    testkit::KeyLayout& key = layout.root.add("Alpha");
    key.set("Before", 1, testkit::text_data("b"));
    key.set("Big", 3, pattern(data_bytes)).storage = Storage::big;
    key.set("Sound", 3, pattern(20000, 3)).storage = Storage::big;
    key.add("Inner").set("v", 4, pattern(4));
    add_left_alone(layout);
    return layout;
}

struct Field {
    uint32_t cell;
    uint32_t at;
};

// Where the list of the segments and a segment must not lead.
void add_offsets(List& list, const std::string& what, const std::function<Field(const ValuePlaces&)>& field) {
    const auto led_to = [&](const std::string& where, const std::function<uint32_t(Damage&, uint32_t)>& offset) {
        list.add_on(with_segments, "big_data_" + what + "_" + where, Readable::partly, {"Alpha|Big"}, [=](Damage& d) {
            const Field f = field(d.at("Alpha").values[1]);
            d.keep(f.cell);
            d.hive.put32(f.cell, f.at, offset(d, d.hive.get32(f.cell, f.at)));
        });
    };
    led_to("0", [](Damage&, uint32_t) { return 0U; });
    led_to("inside_a_bin_header", [](Damage&, uint32_t) { return 16U; });
    led_to("negative", [](Damage&, uint32_t) { return 0x80000020U; });
    led_to("past_the_end", [](Damage& d, uint32_t) {
        d.result.unsettled = {"Alpha|Big"};
        return testkit::get32(d.hive.bytes, 40) + 32;
    });
    led_to("far_past_the_end", [](Damage&, uint32_t) { return 0x7FFFFFF8U; });
    led_to("misaligned", [](Damage&, uint32_t old) { return old + 4; });
    // The very cell stands there once more, as far as there is room: what the bin's cells say is what counts.
    const auto copied = [](Damage& d, uint32_t old, uint32_t into) {
        constexpr uint32_t skipped = 128;
        const auto room = static_cast<uint32_t>(std::abs(d.hive.cell_size(into))) - skipped;
        const uint32_t size = std::min(static_cast<uint32_t>(-d.hive.cell_size(old)), room);
        memcpy(d.hive.bytes.data() + testkit::base_block_bytes + into + skipped,
               d.hive.bytes.data() + testkit::base_block_bytes + old, size);
        d.hive.set_cell_size(into + skipped, -static_cast<int32_t>(size));
        return into + skipped;
    };
    led_to("in_the_middle_of_a_free_cell", [copied](Damage& d, uint32_t old) {
        d.result.unsettled = {"Alpha|Big"};
        return copied(d, old, d.free_space());
    });
    led_to("in_the_middle_of_a_used_cell", [copied](Damage& d, uint32_t old) {
        d.result.affected.push_back("Alpha|Sound");
        return copied(d, old, d.at("Alpha").values[2].segments[0]);
    });
}

}  // namespace

void add_big_data(List& list) {
    const auto damaged = [&](const std::string& name, const std::function<void(Damage&, const ValuePlaces&)>& damage,
                             Readable readable = Readable::partly) {
        list.add_on(with_segments, "big_data_" + name, readable, {"Alpha|Big"}, [damage](Damage& d) {
            const ValuePlaces places = d.at("Alpha").values[1];
            for (const uint32_t segment : places.segments)
                d.keep(segment);
            damage(d, places);
        });
    };
    for (const uint16_t count : {uint16_t{0}, uint16_t{1}, uint16_t{2}, uint16_t{65535}}) {
        damaged("of_" + std::to_string(count) + "_segments",
                [count](Damage& d, const ValuePlaces& p) { d.hive.put16(p.data, 2, count); });
    }
    damaged("list_shorter_than_the_count", [](Damage& d, const ValuePlaces& p) {
        d.keep(p.segment_list);
        d.cut_cell(p.segment_list, 8);
    });
    damaged("record_cut_by_its_cell", [](Damage& d, const ValuePlaces& p) { d.cut_cell(p.data, 8); });
    damaged("record_of_another_signature", [](Damage& d, const ValuePlaces& p) { d.hive.put16(p.data, 0, 0x6262); });
    damaged("record_free", [](Damage& d, const ValuePlaces& p) {
        d.result.unsettled = d.result.affected;
        d.hive.mark_free(p.data);
    });
    damaged("list_free", [](Damage& d, const ValuePlaces& p) {
        d.result.unsettled = d.result.affected;
        d.hive.mark_free(p.segment_list);
    });
    damaged("list_not_there", [](Damage& d, const ValuePlaces& p) { d.hive.put32(p.data, 4, none); });
    damaged("list_is_the_record", [](Damage& d, const ValuePlaces& p) { d.hive.put32(p.data, 4, p.data); });
    add_offsets(list, "list", [](const ValuePlaces& p) { return Field{p.data, 4}; });
    add_offsets(list, "first_segment", [](const ValuePlaces& p) { return Field{p.segment_list, 0}; });
    add_offsets(list, "last_segment", [](const ValuePlaces& p) { return Field{p.segment_list, 8}; });
    damaged("list_in_the_middle_of_a_segment",
            [](Damage& d, const ValuePlaces& p) { d.hive.put32(p.data, 4, p.segments[0] + 256); });
    list.add_on(with_segments, "big_data_first_segment_free", Readable::partly, {"Alpha|Big"}, [](Damage& d) {
        d.result.unsettled = d.result.affected;
        d.hive.mark_free(d.at("Alpha").values[1].segments[0]);
    });
    list.add_on(with_segments, "big_data_middle_segment_free", Readable::partly, {"Alpha|Big"}, [](Damage& d) {
        d.result.unsettled = d.result.affected;
        d.hive.mark_free(d.at("Alpha").values[1].segments[1]);
    });
    damaged("segment_not_there", [](Damage& d, const ValuePlaces& p) { d.hive.put32(p.segment_list, 4, none); });
    damaged("segment_is_the_list",
            [](Damage& d, const ValuePlaces& p) { d.hive.put32(p.segment_list, 4, p.segment_list); });
    damaged("segment_short", [](Damage& d, const ValuePlaces& p) { d.cut_cell(p.segments[1], 4096); });
    damaged("last_segment_short", [](Damage& d, const ValuePlaces& p) { d.cut_cell(p.segments[2], 64); });
    // Another value's bytes, or the same ones again: what the list says is what is read.
    damaged("segment_repeated",
            [](Damage& d, const ValuePlaces& p) { d.hive.put32(p.segment_list, 4, p.segments[0]); });
    damaged("total_above_the_size", [](Damage& d, const ValuePlaces& p) { d.hive.put32(p.record, 4, 20000); });
    damaged("total_one_byte_above_the_size",
            [](Damage& d, const ValuePlaces& p) { d.hive.put32(p.record, 4, data_bytes - 1); });
    damaged("total_below_the_size", [](Damage& d, const ValuePlaces& p) { d.hive.put32(p.record, 4, 3 * 16344 + 1); });
    damaged("size_far_above_the_file", [](Damage& d, const ValuePlaces& p) { d.hive.put32(p.record, 4, 0x7FFFFFFF); });
    list.add_on(
        with_segments, "big_data_that_shares_a_segment_with_another", Readable::partly, {"Alpha|Big"},
        [](Damage& d) { d.hive.put32(d.at("Alpha").values[1].segment_list, 0, d.at("Alpha").values[2].segments[0]); });
    // The segments and their list stay where they are when the data of one is replaced.
    list.add_on(with_segments, "big_data_that_shares_its_segment_list_with_another", Readable::partly, {"Alpha|Sound"},
                [](Damage& d) { d.hive.put32(d.at("Alpha").values[2].data, 4, d.at("Alpha").values[1].segment_list); });
    list.add_on(with_segments, "big_data_of_two_values_in_one_record", Readable::partly, {"Alpha|Sound"},
                [](Damage& d) {
                    d.hive.put32(d.at("Alpha").values[2].record, 4, data_bytes);
                    d.hive.put32(d.at("Alpha").values[2].record, 8, d.at("Alpha").values[1].data);
                },
                {"Alpha|Big", "Alpha|Sound"});
}

}  // namespace hostile
