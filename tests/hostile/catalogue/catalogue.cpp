// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "catalogue.h"

#include <algorithm>
#include <stdexcept>

namespace hostile {

using testkit::base_block_bytes;
using testkit::KeyLayout;
using testkit::pattern;
using testkit::text_data;

namespace {

void fill_alpha(KeyLayout& alpha) {
    alpha.class_name = u"Klass";
    alpha.set("", 1, text_data("the default"));
    alpha.set("Text", 1, text_data("hello"));
    alpha.set("Number", 4, {1, 2, 3, 4});
    alpha.set("Raw", 3, pattern(100));
    alpha.set("Same", 3, pattern(100, 9));
    KeyLayout& inner = alpha.add("Inner");
    inner.set("Deep", 4, {9, 8, 7, 6});
    inner.add("Deeper").set("v", 1, text_data("x"));
    alpha.add("Other").security = 1;
    alpha.add("Third");
}

}  // namespace

const char* const left_alone = "~";

void add_left_alone(HiveLayout& layout) {
    KeyLayout& key = layout.root.add(left_alone);
    key.set("still", 3, pattern(40, 5));
    key.add("calm").set("v", 4, {5, 6, 7, 8});
}

HiveLayout stage() {
    HiveLayout layout;
    layout.security_records = 3;
    layout.free_bytes = 600;
    fill_alpha(layout.root.add("Alpha"));
    KeyLayout& beta = layout.root.add("Beta");
    beta.per_leaf = 2;
    for (const char* name : {"b1", "b2", "b3", "b4", "b5"})
        beta.add(name);
    beta.children[2].set("v", 3, pattern(20));
    KeyLayout& gamma = layout.root.add("Gamma");
    gamma.set("List", 7, {'a', 0, 0, 0, 'b', 0, 0, 0, 0, 0});
    gamma.set("Eight", 11, pattern(8));
    gamma.add("leaf");
    gamma.add("moon").security = 2;
    gamma.add("_under");
    layout.root.add("Zeta");
    add_left_alone(layout);
    return layout;
}

Bytes hive_to_cut() {
    HiveLayout layout = stage();
    layout.free_bytes = 0;
    LaidHive hive = lay_out(layout);
    const uint32_t end = testkit::get32(hive.bytes, 40);
    uint32_t last = end - layout.bin_size + 32;
    while (hive.cell_size(last) < 0)
        last += static_cast<uint32_t>(-hive.cell_size(last));
    if (last + static_cast<uint32_t>(hive.cell_size(last)) != end)
        throw std::out_of_range("the last bin has no free cell at its end");
    hive.set_cell_size(last, -hive.cell_size(last));
    const uint32_t data_size = end - last - 4;
    const Bytes data = pattern(data_size, 3);
    std::copy(data.begin(), data.end(), hive.bytes.begin() + static_cast<std::ptrdiff_t>(LaidHive::position(last)));
    const uint32_t record = hive.at("Alpha").values[3].record;
    hive.put32(record, 4, data_size);
    hive.put32(record, 8, last);
    return hive.bytes;
}

void Damage::keep(uint32_t cell) {
    const uint64_t begin = base_block_bytes + uint64_t{cell};
    result.untouchable.push_back({begin, begin + static_cast<uint32_t>(-hive.cell_size(cell))});
}

uint32_t Damage::free_space() const {
    const uint32_t end = testkit::get32(hive.bytes, 40);
    uint32_t best = none;
    for (uint32_t bin = 0; bin < end; bin += testkit::get32(hive.bytes, base_block_bytes + uint64_t{bin} + 8)) {
        const uint32_t bin_end = bin + testkit::get32(hive.bytes, base_block_bytes + uint64_t{bin} + 8);
        for (uint32_t cell = bin + 32; cell < bin_end; cell += static_cast<uint32_t>(std::abs(hive.cell_size(cell)))) {
            if (hive.cell_size(cell) > 0 && (best == none || hive.cell_size(cell) > hive.cell_size(best)))
                best = cell;
        }
    }
    if (best == none)
        throw std::out_of_range("the hive has no free cell");
    return best;
}

void Damage::listed_twice(const std::string& place, const std::string& other) {
    for (const char* inside : {"\\", "|"}) {
        result.shows_in.push_back({place + inside, {other}});
        result.shows_in.push_back({other + inside, {place}});
    }
}

uint32_t Damage::add_cell(uint32_t record_bytes) {
    const uint32_t cell = free_space();
    const int32_t size = static_cast<int32_t>((record_bytes + 4 + 7) & ~7U);
    const int32_t rest = hive.cell_size(cell) - size;
    if (rest < 0)
        throw std::out_of_range("the free cell is too small");
    if (rest > 0)
        hive.set_cell_size(cell + static_cast<uint32_t>(size), rest);
    hive.set_cell_size(cell, -size);
    return cell;
}

void Damage::cut_cell(uint32_t cell, uint32_t new_size) {
    const auto old_size = static_cast<uint32_t>(-hive.cell_size(cell));
    const uint32_t rest = old_size - new_size;
    hive.set_cell_size(cell, -static_cast<int32_t>(new_size));
    for (uint32_t i = 4; i < rest; i++)
        hive.bytes.at(base_block_bytes + uint64_t{cell} + new_size + i) = 0xEE;
    hive.set_cell_size(cell + new_size, -static_cast<int32_t>(rest));
}

void List::add(const std::string& name, Readable readable, const Places& affected, const Change& damage,
               const Places& shared) {
    add_on(stage, name, readable, affected, damage, shared);
}

void List::add_on(const std::function<HiveLayout()>& layout, const std::string& name, Readable readable,
                  const Places& affected, const Change& damage, const Places& shared, bool large) {
    entries.push_back({name, readable, large, [=] {
                           Damage work;
                           work.hive = lay_out(layout());
                           work.result.intact = work.hive.bytes;
                           work.result.affected = affected;
                           work.result.shared = shared;
                           damage(work);
                           work.result.bytes = std::move(work.hive.bytes);
                           return std::move(work.result);
                       }});
}

void List::add_bytes(const std::string& name, Readable readable, const std::function<Bytes()>& make, bool large) {
    entries.push_back({name, readable, large, [make] {
                           Case made;
                           made.bytes = make();
                           return made;
                       }});
}

const std::vector<Entry>& catalogue() {
    static const std::vector<Entry> all = [] {
        List list;
        add_file_and_base_block(list);
        add_bins(list);
        add_cells(list);
        add_keys(list);
        add_depths(list);
        add_subkey_indexes(list);
        add_values(list);
        add_big_data(list);
        add_security(list);
        return list.entries;
    }();
    return all;
}

Case case_of(const std::string& name) {
    for (const Entry& entry : catalogue()) {
        if (entry.name == name)
            return entry.make();
    }
    throw std::out_of_range("no hive is named " + name);
}

}  // namespace hostile
