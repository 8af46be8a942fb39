// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "catalogue.h"

#include <cstring>

namespace hostile {

using testkit::base_block_bytes;
using testkit::LaidHive;
using testkit::pattern;

namespace {

// Size words that no cell can have: the bin's cells no longer follow one another, and such a hive is not
// opened.
void add_sizes(List& list) {
    const auto sized = [&](const std::string& name, const std::function<int32_t(int32_t)>& size) {
        const auto put = [size](LaidHive& hive, uint32_t cell) {
            hive.set_cell_size(cell, size(hive.cell_size(cell)));
        };
        list.add("used_cell_" + name, Readable::no, {""},
                 [put](Damage& d) { put(d.hive, d.at("Alpha").values[3].data); });
        list.add("free_cell_" + name, Readable::no, {""}, [put](Damage& d) { put(d.hive, d.free_space()); });
    };
    for (const int32_t size : {0, 1, 2, 3, 4, 5, 6, 7, -1, -2, -3, -4, -5, -6, -7}) {
        const std::string number = size < 0 ? "minus_" + std::to_string(-size) : std::to_string(size);
        sized("of_size_" + number, [size](int32_t) { return size; });
    }
    sized("of_size_80000000", [](int32_t) { return INT32_MIN; });
    sized("of_size_7FFFFFFF", [](int32_t) { return INT32_MAX; });
    sized("of_size_7FFFFFF8", [](int32_t) { return 0x7FFFFFF8; });
    sized("4_too_long", [](int32_t size) { return size < 0 ? size - 4 : size + 4; });
    sized("past_the_end_of_its_bin", [](int32_t) { return -4096; });
    sized("free_past_the_end_of_its_bin", [](int32_t) { return 4096; });
    sized("past_the_end_of_the_file", [](int32_t) { return -0x00100000; });
}

// Every field that leads to a cell, and the places that stop being readable when it does not: none where nothing is
// read through it. Those of big data stand with the rest of it, and those that lead to nothing below.
struct Reference {
    std::string name;
    List::Places affected;
    std::function<uint64_t(Damage&)> field;   // where it stands in the file
    std::function<uint32_t(Damage&)> holder;  // the cell of the record that it stands in
};

std::vector<Reference> references() {
    const auto in = [](const std::function<uint32_t(Damage&)>& holder, uint32_t field) {
        return [holder, field](Damage& d) { return LaidHive::position(holder(d), field); };
    };
    const auto alpha = [](Damage& d) { return d.at("Alpha").record; };
    const auto raw = [](Damage& d) { return d.at("Alpha").values[3].record; };
    const auto values = [](Damage& d) { return d.at("Alpha").value_list; };
    const auto index = [](Damage& d) { return d.at("Alpha").index; };
    const auto roots = [](Damage& d) { return d.at("Beta").index; };
    const auto beta_leaf = [](Damage& d) { return d.at("Beta").leaves[1]; };
    const auto inner = [](Damage& d) { return d.at("Alpha\\Inner").record; };
    const auto moons = [](Damage& d) { return d.hive.security[2]; };
    return {
        {"class", {"Alpha="}, in(alpha, 48), alpha},
        {"value_list", {"Alpha|"}, in(alpha, 40), alpha},
        {"value_entry", {"Alpha|"}, in(values, 12), values},
        {"value_data", {"Alpha|Raw"}, in(raw, 8), raw},
        {"index", {"Alpha\\"}, in(alpha, 28), alpha},
        {"index_entry", {"Alpha\\"}, in(index, 4), index},
        {"leaf_of_a_root", {"Beta\\"}, in(roots, 8), roots},
        {"entry_of_a_leaf_of_a_root", {"Beta\\"}, in(beta_leaf, 4), beta_leaf},
        {"security", {"Alpha="}, in(alpha, 44), alpha},
        {"parent", {}, in(inner, 16), inner},
        {"security_next", {}, in(moons, 4), moons},
        {"security_previous", {}, in(moons, 8), moons},
    };
}

const char* const over_data = "in_the_middle_of_a_used_cell";

// Where a field must not lead, and whether a change to something else may show there.
struct Target {
    std::string name;
    bool unsettled;
    std::function<uint32_t(Damage&, const Reference&)> offset;
};

std::vector<Target> targets() {
    const auto number = [](uint32_t n) { return [n](Damage&, const Reference&) { return n; }; };
    return {
        {"0", false, number(0)},
        {"inside_a_bin_header", false, number(16)},
        {"minus_1", false, number(none)},
        {"negative", false, number(0x80000020)},
        {"past_the_end", true, [](Damage& d, const Reference&) { return testkit::get32(d.hive.bytes, 40) + 32; }},
        {"far_past_the_end", false, number(0x7FFFFFF8)},
        {"at_a_free_cell", true, [](Damage& d, const Reference&) { return d.free_space(); }},
        {"in_the_middle_of_a_free_cell", true,
         [](Damage& d, const Reference& reference) {
             // The very record stands there once more, as if in use: what the bin's cells say is what counts.
             const uint32_t copy = d.free_space() + 128;
             const uint32_t old = testkit::get32(d.hive.bytes, reference.field(d));
             const auto size = static_cast<size_t>(-d.hive.cell_size(old));
             memcpy(d.hive.bytes.data() + base_block_bytes + copy, d.hive.bytes.data() + base_block_bytes + old, size);
             return copy;
         }},
        {over_data, false,
         [](Damage& d, const Reference& reference) {
             const uint32_t copy = d.at("Alpha").values[4].data + 8;
             const uint32_t old = testkit::get32(d.hive.bytes, reference.field(d));
             const auto size = std::min<size_t>(static_cast<size_t>(-d.hive.cell_size(old)), 88);
             memcpy(d.hive.bytes.data() + base_block_bytes + copy, d.hive.bytes.data() + base_block_bytes + old, size);
             d.hive.set_cell_size(copy, -static_cast<int32_t>(size));
             d.result.affected.push_back("Alpha|Same");
             return copy;
         }},
        {"misaligned", false,
         [](Damage& d, const Reference& reference) { return testkit::get32(d.hive.bytes, reference.field(d)) + 4; }},
        {"at_its_own_record", false, [](Damage& d, const Reference& reference) { return reference.holder(d); }},
        {"at_a_record_of_another_kind", true,
         [](Damage& d, const Reference& reference) {
             return reference.name.compare(0, 8, "security") == 0 ? d.at("Zeta").record : d.hive.security[1];
         }},
    };
}

// The same in a key without subkeys: what it leads to must not go with it when it is deleted.
std::vector<Reference> references_of_a_leaf() {
    const auto moon = [](Damage& d) { return d.at("Gamma\\moon").record; };
    const auto field = [&](const std::string& name, uint32_t at, const std::function<void(Damage&)>& claim) {
        return Reference{"moon_" + name,
                         {"Gamma\\moon"},
                         [=](Damage& d) {
                             claim(d);
                             return LaidHive::position(moon(d), at);
                         },
                         moon};
    };
    return {
        field("class", 48, [moon](Damage& d) { d.hive.put16(moon(d), 74, 16); }),
        field("value_list", 40, [moon](Damage& d) { d.hive.put32(moon(d), 36, 2); }),
        field("index_of_no_subkeys", 28, [](Damage&) {}),
        field("security", 44, [](Damage&) {}),
    };
}

void add_references(List& list, const std::vector<Reference>& all) {
    for (const Reference& reference : all) {
        for (const Target& target : targets()) {
            const bool unseen = reference.affected.empty() && target.name != over_data;
            const Readable readable = unseen ? Readable::whole : Readable::partly;
            list.add(reference.name + "_" + target.name, readable, reference.affected, [reference, target](Damage& d) {
                if (target.unsettled)
                    d.result.unsettled = reference.affected;
                const uint32_t offset = target.offset(d, reference);
                testkit::set32(d.hive.bytes, reference.field(d), offset);
            });
        }
    }
}

void add_references_of_a_leaf(List& list) {
    for (const Reference& reference : references_of_a_leaf()) {
        const auto leads_to = [&](const std::string& name, const std::function<uint32_t(Damage&)>& offset) {
            // A list of subkeys is not looked at where there are none, and a list of values that is not there
            // has none.
            const bool class_of_a_key = reference.name == "moon_class" && name == "at_another_key";
            const bool no_values =
                reference.name == "moon_value_list" && (name == "at_a_free_cell" || name == "far_past_the_end");
            const bool unseen = reference.name == "moon_index_of_no_subkeys" || no_values ||
                                (reference.name == "moon_class" && !class_of_a_key);
            list.add(reference.name + "_" + name, unseen ? Readable::whole : Readable::partly,
                     unseen ? List::Places{} : reference.affected, [=](Damage& d) {
                         const uint64_t field = reference.field(d);
                         d.result.unsettled = reference.affected;
                         d.result.lies = no_values;
                         testkit::set32(d.hive.bytes, field, offset(d));
                     });
        };
        leads_to("at_another_key", [](Damage& d) { return d.at("Zeta").record; });
        leads_to("at_a_free_cell", [](Damage& d) { return d.free_space(); });
        leads_to("far_past_the_end", [](Damage&) { return 0x7FFFFFF8U; });
        if (reference.name == "moon_class")
            continue;
        leads_to("at_a_value_of_another_key", [](Damage& d) { return d.at("Gamma").values[0].record; });
        leads_to("at_the_index_of_another_key", [](Damage& d) { return d.at("Alpha").index; });
        leads_to("at_its_own_record", [](Damage& d) { return d.at("Gamma\\moon").record; });
        if (reference.name != "moon_security")
            leads_to("at_a_security_record", [](Damage& d) { return d.hive.security[0]; });
    }
}

// One cell that two records lead to: reading is as the records say, and a change of one may show in the
// other.
void add_shared_cells(List& list) {
    list.add("one_data_cell_for_two_values", Readable::partly, {"Alpha|Same"},
             [](Damage& d) { d.hive.put32(d.at("Alpha").values[4].record, 8, d.at("Alpha").values[3].data); },
             {"Alpha|Raw", "Alpha|Same"});
    // The list that the record is not made for finds none there, once it has been deleted in the other.
    list.add("one_value_record_in_the_lists_of_two_keys", Readable::partly, {"Gamma|"},
             [](Damage& d) { d.hive.put32(d.at("Gamma").value_list, 0, d.at("Alpha").values[1].record); },
             {"Alpha|Text", "Gamma|Text", "Alpha|?", "Gamma|?"});
    list.add("one_value_list_for_two_keys", Readable::partly, {"Gamma|"},
             [](Damage& d) {
                 d.hive.put32(d.at("Gamma").record, 36, 5);
                 d.hive.put32(d.at("Gamma").record, 40, d.at("Alpha").value_list);
             },
             {"Alpha|", "Gamma|"});
    list.add("one_index_for_two_keys", Readable::partly, {"Gamma\\"},
             [](Damage& d) { d.hive.put32(d.at("Gamma").record, 28, d.at("Alpha").index); }, {"Alpha\\", "Gamma\\"});
    list.add("one_class_for_two_keys", Readable::partly, {"Zeta"}, [](Damage& d) {
        d.hive.put16(d.at("Zeta").record, 74, 10);
        d.hive.put32(d.at("Zeta").record, 48, d.at("Alpha").class_cell);
    });
    list.add("one_record_for_two_keys", Readable::partly, {"Gamma\\moon", "Gamma\\Inner"},
             [](Damage& d) {
                 // Gamma's index is sorted: leaf, moon, _under.
                 d.hive.put32(d.at("Gamma").index, 12, d.at("Alpha\\Inner").record);
             },
             {"Alpha\\Inner", "Gamma\\Inner", "Gamma\\?"});
    list.add("a_value_whose_data_is_a_key", Readable::partly, {"Alpha|Raw"}, [](Damage& d) {
        d.result.unsettled = {"Alpha|Raw"};
        d.hive.put32(d.at("Alpha").values[3].record, 4, 76);
        d.hive.put32(d.at("Alpha").values[3].record, 8, d.at("Zeta").record);
    });
    list.add("a_value_whose_data_is_its_own_record", Readable::partly, {"Alpha|Raw"}, [](Damage& d) {
        d.hive.put32(d.at("Alpha").values[3].record, 4, 8);
        d.hive.put32(d.at("Alpha").values[3].record, 8, d.at("Alpha").values[3].record);
    });
}

// Where free space lies, and how much of it there is.
void add_free_space(List& list) {
    list.add("free_cells_side_by_side", Readable::whole, {}, [](Damage& d) {
        uint32_t cell = d.free_space();
        int32_t rest = d.hive.cell_size(cell);
        for (const int32_t size : {8, 8, 16, 24, 8, 64}) {
            d.hive.set_cell_size(cell, size);
            cell += static_cast<uint32_t>(size);
            rest -= size;
        }
        d.hive.set_cell_size(cell, rest);
    });
    list.add("free_space_in_cells_of_8_bytes_alone", Readable::whole, {}, [](Damage& d) {
        const uint32_t cell = d.free_space();
        const int32_t size = d.hive.cell_size(cell);
        for (int32_t at = 0; at < size; at += 8)
            d.hive.set_cell_size(cell + static_cast<uint32_t>(at), 8);
    });
    const auto full = [] {
        HiveLayout layout = stage();
        layout.free_bytes = 0;
        layout.no_free_space = true;
        return layout;
    };
    list.add_on(full, "no_free_space_at_all", Readable::whole, {}, [](Damage&) {});
    list.add("free_cell_that_takes_in_a_used_one", Readable::partly, {"Zeta", "Beta\\b5", "Beta\\b4"}, [](Damage& d) {
        d.result.unsettled = {"Beta\\", "Zeta"};
        // The key before Zeta's record, freed with all that lies between them.
        const uint32_t from = d.at("Beta\\b4").record;
        const uint32_t to = d.at("Beta\\b5").record;
        d.hive.set_cell_size(from, static_cast<int32_t>(to - from) - d.hive.cell_size(to));
    });
    list.add("key_record_marked_free", Readable::partly, {"Alpha\\Third"}, [](Damage& d) {
        d.result.unsettled = {"Alpha\\"};
        d.hive.mark_free(d.at("Alpha\\Third").record);
    });
}

}  // namespace

void add_cells(List& list) {
    add_sizes(list);
    add_references(list, references());
    add_references_of_a_leaf(list);
    add_shared_cells(list);
    add_free_space(list);
}

}  // namespace hostile
