// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "catalogue.h"

namespace hostile {

using testkit::KeyLayout;
using testkit::Leaf;

namespace {

constexpr uint16_t fast = 0x666C;
constexpr uint16_t hash = 0x686C;
constexpr uint16_t plain = 0x696C;
constexpr uint16_t root_of_leaves = 0x6972;

void add_counts(List& list) {
    const auto counted = [&](const std::string& name, Readable readable, uint16_t count) {
        list.add("index_count_" + name, readable, {"Alpha\\"}, [count](Damage& d) {
            d.result.lies = true;
            d.keep(d.at("Alpha").index);
            d.hive.put16(d.at("Alpha").index, 2, count);
        });
    };
    counted("0", Readable::partly, 0);
    counted("one_below", Readable::partly, 2);
    counted("past_its_cell", Readable::whole, 7);
    counted("of_65535", Readable::whole, 65535);
    list.add("index_cut_by_its_cell", Readable::partly, {"Alpha\\"}, [](Damage& d) {
        d.keep(d.at("Alpha").index);
        d.cut_cell(d.at("Alpha").index, 16);
    });
    list.add("index_of_8_bytes", Readable::partly, {"Alpha\\"}, [](Damage& d) {
        d.keep(d.at("Alpha").index);
        d.cut_cell(d.at("Alpha").index, 8);
    });
    list.add("root_of_leaves_with_count_65535", Readable::whole, {"Beta\\"}, [](Damage& d) {
        d.result.lies = true;
        d.keep(d.at("Beta").index);
        d.hive.put16(d.at("Beta").index, 2, 65535);
    });
    list.add("leaf_below_a_root_with_count_65535", Readable::whole, {"Beta\\"}, [](Damage& d) {
        d.result.lies = true;
        d.keep(d.at("Beta").leaves[0]);
        d.hive.put16(d.at("Beta").leaves[0], 2, 65535);
    });
}

void add_signatures(List& list) {
    for (const auto& [name, signature] :
         std::vector<std::pair<std::string, uint16_t>>{{"zz", 0x7A7A}, {"zeros", 0}, {"lg", 0x676C}, {"LF", 0x464C}}) {
        list.add("index_of_unknown_signature_" + name, Readable::partly, {"Alpha\\"},
                 [signature = signature](Damage& d) {
                     d.keep(d.at("Alpha").index);
                     d.hive.put16(d.at("Alpha").index, 0, signature);
                 });
    }
    // Entries of 8 bytes read as such of 4, and the other way round.
    list.add("fast_leaf_that_is_called_plain", Readable::partly, {"Alpha\\"},
             [](Damage& d) { d.hive.put16(d.at("Alpha").index, 0, plain); });
    list.add("leaf_of_the_other_kind_than_the_roots", Readable::partly, {"Alpha\\"},
             [](Damage& d) { d.hive.put16(d.at("Alpha").index, 0, fast); });
    list.add("leaf_that_is_called_a_root", Readable::partly, {"Alpha\\"}, [](Damage& d) {
        d.keep(d.at("Alpha").index);
        d.hive.put16(d.at("Alpha").index, 0, root_of_leaves);
    });
    list.add("root_of_leaves_that_is_called_a_leaf", Readable::partly, {"Beta\\"},
             [](Damage& d) { d.hive.put16(d.at("Beta").index, 0, plain); });
}

// Names that the three rules of sorting put in three orders.
std::function<HiveLayout()> ordered(const std::vector<std::string>& names, Leaf leaf) {
    return [names, leaf] {
        HiveLayout layout;
        layout.leaf = leaf == Leaf::plain ? Leaf::hash : leaf;
        layout.free_bytes = 600;
        KeyLayout& alpha = layout.root.add("Alpha");
        alpha.own_leaf = true;
        alpha.leaf = leaf;
        alpha.sorted = false;
        for (const std::string& name : names)
            alpha.add(name).set("v", 1, testkit::text_data(name));
        layout.root.add("Zeta");
        add_left_alone(layout);
        return layout;
    };
}

void add_orders(List& list) {
    const std::vector<std::pair<std::string, std::vector<std::string>>> orders{
        {"unsorted", {"m", "b", "z", "a", "y", "_c"}},
        {"descending", {"z", "y", "m", "c", "b", "a"}},
        {"sorted_lower_cased", {"_a", "a", "AB", "a_c", "abd", "z"}},
        {"sorted_by_bytes", {"AB", "Z", "_a", "a", "abd", "z_"}},
        {"sorted_by_length", {"z", "bb", "aaa", "zzzz", "aaaaa"}},
        {"sorted_with_bytes_above_7F_first", {"\xC4", "\xFF", "a", "b", "z"}},
    };
    for (const auto& [name, names] : orders) {
        list.add_on(ordered(names, Leaf::hash), "hash_leaf_" + name, Readable::whole, {}, [](Damage&) {});
        list.add_on(ordered(names, Leaf::fast), "fast_leaf_" + name, Readable::whole, {}, [](Damage&) {});
        list.add_on(ordered(names, Leaf::plain), "plain_leaf_" + name, Readable::whole, {}, [](Damage&) {});
    }
    list.add_on(ordered({"a", "b", "c"}, Leaf::fast), "fast_leaf_with_wrong_hints", Readable::whole, {}, [](Damage& d) {
        d.hive.put32(d.at("Alpha").index, 8, 0x7A7A7A7A);
        d.hive.put32(d.at("Alpha").index, 16, 0);
        d.hive.put32(d.at("Alpha").index, 24, none);
    });
    list.add_on(ordered({"a", "b", "c"}, Leaf::hash), "hash_leaf_with_wrong_hashes", Readable::whole, {},
                [](Damage& d) {
                    d.hive.put32(d.at("Alpha").index, 8, 0x12345678);
                    d.hive.put32(d.at("Alpha").index, 16, 0);
                    d.hive.put32(d.at("Alpha").index, 24, none);
                });
}

void add_roots(List& list) {
    const auto beta = [&](const std::string& name, Readable readable, const List::Change& damage,
                          const List::Places& shared = {}) {
        list.add("ri_" + name, readable, {"Beta\\"}, damage, shared);
    };
    beta("points_to_itself", Readable::partly, [](Damage& d) {
        d.keep(d.at("Beta").index);
        d.hive.put32(d.at("Beta").index, 4, d.at("Beta").index);
    });
    beta("points_to_itself_alone", Readable::partly, [](Damage& d) {
        d.keep(d.at("Beta").index);
        for (uint32_t entry = 0; entry < 3; entry++)
            d.hive.put32(d.at("Beta").index, 4 + 4 * entry, d.at("Beta").index);
    });
    beta("in_an_ri", Readable::partly, [](Damage& d) {
        const uint32_t inner = d.add_cell(8);
        d.keep(inner);
        d.keep(d.at("Beta").index);
        d.hive.put16(inner, 0, root_of_leaves);
        d.hive.put16(inner, 2, 1);
        d.hive.put32(inner, 4, d.at("Beta").leaves[1]);
        d.hive.put32(d.at("Beta").index, 8, inner);
    });
    beta("points_to_a_key", Readable::partly, [](Damage& d) {
        d.keep(d.at("Beta").index);
        d.hive.put32(d.at("Beta").index, 8, d.at("Beta\\b3").record);
    });
    beta("has_no_entries", Readable::partly, [](Damage& d) {
        d.keep(d.at("Beta").index);
        d.hive.put16(d.at("Beta").index, 2, 0);
    });
    beta("has_no_entries_and_the_key_no_subkeys", Readable::partly, [](Damage& d) {
        d.hive.put16(d.at("Beta").index, 2, 0);
        d.hive.put32(d.at("Beta").record, 20, 0);
    });
    beta("points_to_an_empty_leaf", Readable::partly, [](Damage& d) {
        d.hive.put16(d.at("Beta").leaves[1], 2, 0);
        d.hive.put32(d.at("Beta").record, 20, 3);
    });
    beta("points_to_an_empty_leaf_first", Readable::partly, [](Damage& d) {
        d.hive.put16(d.at("Beta").leaves[0], 2, 0);
        d.hive.put32(d.at("Beta").record, 20, 3);
    });
    beta("points_to_an_empty_leaf_last", Readable::partly, [](Damage& d) {
        d.hive.put16(d.at("Beta").leaves[2], 2, 0);
        d.hive.put32(d.at("Beta").record, 20, 4);
    });
    beta("points_to_an_empty_leaf_of_the_other_kind_last", Readable::partly, [](Damage& d) {
        d.hive.put16(d.at("Beta").leaves[2], 0, fast);
        d.hive.put16(d.at("Beta").leaves[2], 2, 0);
        d.hive.put32(d.at("Beta").record, 20, 4);
    });
    beta("points_to_empty_leaves_alone", Readable::partly, [](Damage& d) {
        for (const uint32_t leaf : d.at("Beta").leaves)
            d.hive.put16(leaf, 2, 0);
        d.hive.put32(d.at("Beta").record, 20, 0);
    });
    beta("points_to_one_leaf_twice", Readable::partly,
         [](Damage& d) { d.hive.put32(d.at("Beta").index, 8, d.at("Beta").leaves[0]); }, {"Beta\\b1", "Beta\\b2"});
    beta("points_to_a_plain_leaf_and_hash_leaves", Readable::whole, [](Damage& d) {
        const uint32_t leaf = d.at("Beta").leaves[1];
        d.hive.put32(leaf, 8, d.hive.get32(leaf, 12));
        d.hive.put16(leaf, 0, plain);
    });
    // The hive's own kind alone is read; leaves of the other are not.
    beta("points_to_fast_and_hash_leaves", Readable::partly,
         [](Damage& d) { d.hive.put16(d.at("Beta").leaves[1], 0, fast); });
    beta("is_the_index_of_the_root_key", Readable::partly,
         [](Damage& d) {
             d.hive.put32(d.at("Alpha").record, 28, d.at("Beta").index);
             d.hive.put32(d.at("Alpha").record, 20, 5);
             d.result.affected = {"Alpha\\"};
         },
         {"Alpha\\", "Beta\\"});
}

// What a new or renamed key in the place of another may be called.
List::Places with_new_names(const std::string& key, List::Places places) {
    for (const char* name : {"Made here", "New name", "!first", "b2a", "?"})
        places.push_back(key + "\\" + name);
    return places;
}

// Beta's root leads to Alpha's leaf. Alpha keeps it whatever is done in Beta; a change in Alpha may take it from Beta,
// which then lists no more than what stands ahead of it.
void add_roots_over_a_leaf_of_another_key(List& list) {
    for (const uint32_t slot : {0U, 1U}) {
        for (const bool counted : {true, false}) {
            const std::string name = std::string("ri_whose_") + (slot == 0 ? "first" : "second") +
                                     "_leaf_is_another_keys" + (counted ? "" : "_and_its_count_its_own");
            list.add(name, Readable::partly, {"Beta\\"}, [=](Damage& d) {
                d.hive.put32(d.at("Beta").index, 4 + 4 * slot, d.at("Alpha").index);
                if (counted)
                    d.hive.put32(d.at("Beta").record, 20, 6);
                List::Places behind{"Beta\\Inner", "Beta\\Other", "Beta\\Third", "Beta\\b5"};
                if (slot == 0)
                    behind.insert(behind.end(), {"Beta\\b3", "Beta\\b4"});
                d.result.shows_in.push_back({"Alpha\\", with_new_names("Beta", behind)});
                for (const char* key : {"Inner", "Other", "Third"})
                    d.listed_twice(std::string("Alpha\\") + key, std::string("Beta\\") + key);
            });
        }
    }
}

void add_one_leaf_in_two_roots(List& list) {
    const auto two_roots = [] {
        HiveLayout layout = stage();
        KeyLayout& delta = layout.root.add("Delta");
        delta.per_leaf = 2;
        for (const char* name : {"d1", "d2", "d3", "d4"})
            delta.add(name);
        return layout;
    };
    list.add_on(two_roots, "one_leaf_in_the_roots_of_two_keys", Readable::partly, {"Delta\\"}, [](Damage& d) {
        d.hive.put32(d.at("Delta").index, 8, d.at("Beta").leaves[1]);
        d.result.shows_in.push_back({"Beta\\", with_new_names("Delta", {"Delta\\b3", "Delta\\b4"})});
        for (const char* key : {"b3", "b4"})
            d.listed_twice(std::string("Beta\\") + key, std::string("Delta\\") + key);
    });
}

std::function<HiveLayout()> long_leaf(int count) {
    return [count] {
        HiveLayout layout;
        KeyLayout& alpha = layout.root.add("Alpha");
        for (int i = 0; i < count; i++)
            alpha.add("k" + std::to_string(i));
        add_left_alone(layout);
        return layout;
    };
}

}  // namespace

void add_subkey_indexes(List& list) {
    add_counts(list);
    add_signatures(list);
    add_orders(list);
    add_roots(list);
    add_roots_over_a_leaf_of_another_key(list);
    add_one_leaf_in_two_roots(list);
    list.add_on(
        long_leaf(65534), "leaf_of_65534_entries", Readable::whole, {}, [](Damage&) {}, {}, true);
    list.add_on(
        long_leaf(65535), "leaf_of_65535_entries", Readable::whole, {}, [](Damage&) {}, {}, true);
    list.add("index_of_the_root_key_of_unknown_signature", Readable::no, {""},
             [](Damage& d) { d.hive.put16(d.at("").index, 0, 0x7A7A); });
    list.add("index_of_the_root_key_called_a_root_of_leaves", Readable::no, {""},
             [](Damage& d) { d.hive.put16(d.at("").index, 0, root_of_leaves); });
    list.add("index_of_the_root_key_of_the_other_kind", Readable::whole, {}, [](Damage& d) {
        // All leaves of a hive are of the kind that its root's is.
        d.hive.put16(d.at("").index, 0, hash);
    });
}

}  // namespace hostile
