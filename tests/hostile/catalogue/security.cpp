// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "catalogue.h"

namespace hostile {

namespace {

constexpr uint32_t next_field = 4;
constexpr uint32_t previous_field = 8;
constexpr uint32_t count_field = 12;
constexpr uint32_t length_field = 16;

}  // namespace

// Gamma\moon has the third record to itself: deleting it takes the record out of its ring.
void add_security(List& list) {
    const List::Places moons{"Gamma\\moon"};
    const auto led_to = [&](const std::string& name, const std::function<uint32_t(Damage&)>& where) {
        list.add("security_" + name, Readable::partly, moons,
                 [where](Damage& d) { d.hive.put32(d.at("Gamma\\moon").record, 44, where(d)); });
    };
    led_to("not_there", [](Damage&) { return none; });
    led_to("at_no_security_record", [](Damage& d) {
        d.keep(d.at("Alpha").class_cell);
        return d.at("Alpha").class_cell;
    });
    led_to("at_a_key", [](Damage& d) { return d.at("Zeta").record; });
    led_to("at_the_key_itself", [](Damage& d) { return d.at("Gamma\\moon").record; });
    list.add("security_record_with_another_signature", Readable::partly, moons, [](Damage& d) {
        d.keep(d.hive.security[2]);
        d.hive.put16(d.hive.security[2], 0, 0x6B73 + 1);
    });
    list.add("security_record_marked_free", Readable::partly, moons,
             [](Damage& d) { d.hive.mark_free(d.hive.security[2]); });
    list.add("security_record_cut_by_its_cell", Readable::partly, moons, [](Damage& d) {
        d.keep(d.hive.security[2]);
        d.cut_cell(d.hive.security[2], 16);
    });
    list.add("security_descriptor_longer_than_its_cell", Readable::partly, moons,
             [](Damage& d) { d.hive.put32(d.hive.security[2], length_field, 0x7FFFFFFF); });
    list.add("security_descriptor_of_0_bytes", Readable::partly, moons,
             [](Damage& d) { d.hive.put32(d.hive.security[2], length_field, 0); });

    const auto in_record = [&](const std::string& name, const std::function<void(Damage&, uint32_t)>& damage) {
        list.add("security_" + name, Readable::whole, {}, [damage](Damage& d) { damage(d, d.hive.security[2]); });
    };
    in_record("next_does_not_point_back",
              [](Damage& d, uint32_t) { d.hive.put32(d.hive.security[0], previous_field, d.hive.security[1]); });
    in_record("previous_does_not_point_forward",
              [](Damage& d, uint32_t) { d.hive.put32(d.hive.security[1], next_field, d.hive.security[0]); });
    in_record("ring_of_one", [](Damage& d, uint32_t own) {
        d.hive.put32(own, next_field, own);
        d.hive.put32(own, previous_field, own);
        d.hive.put32(d.hive.security[0], previous_field, d.hive.security[1]);
        d.hive.put32(d.hive.security[1], next_field, d.hive.security[0]);
    });
    in_record("ring_of_one_that_the_others_point_into", [](Damage& d, uint32_t own) {
        d.hive.put32(own, next_field, own);
        d.hive.put32(own, previous_field, own);
    });
    in_record("count_0", [](Damage& d, uint32_t own) { d.hive.put32(own, count_field, 0); });
    in_record("count_too_high", [](Damage& d, uint32_t own) { d.hive.put32(own, count_field, 9); });
    in_record("count_all_ones", [](Damage& d, uint32_t own) {
        d.result.lies = true;
        d.hive.put32(own, count_field, none);
    });
    list.add("security_count_too_low", Readable::whole, {},
             [](Damage& d) { d.hive.put32(d.hive.security[0], count_field, 1); });
}

}  // namespace hostile
