// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Damaged, odd and hostile hives by name: their bytes, how much of each can be read, and what no change may
// touch.
#pragma once

#include "hive_bytes.h"

#include <functional>

namespace hostile {

using testkit::Bytes;
using testkit::HiveLayout;
using testkit::LaidHive;
using testkit::none;

enum class Readable {
    whole,   // nothing that is there may be missing: the hive is odd, but legal
    partly,  // opens; what is damaged is left out or told by a status, the rest reads as ever
    no,      // must not open
};

struct Range {
    uint64_t begin;  // positions in the file
    uint64_t end;
};

// What a change at or below one place may show at or below others, and not the other way round.
struct Flow {
    std::string from;
    std::vector<std::string> to;
};

struct Case {
    Bytes bytes;
    Bytes intact;  // the same without the damage
    // Places (see Item in snapshot.h) that may read otherwise than in the intact hive; all others read alike.
    std::vector<std::string> affected;
    // Places that lead to the same cells: a change of one of them may show in all of them.
    std::vector<std::string> shared;
    std::vector<Flow> shows_in;
    // Places that lead to where the file has nothing yet: what a change puts there may show in them.
    std::vector<std::string> unsettled;
    // A count or a size lies: nothing is missing for it, but changes that go by it are refused.
    bool lies = false;
    // The file ends too early: what is behind its end may be read once a change has made it longer.
    bool cut_short = false;
    // The damaged structures, which no change may write to.
    std::vector<Range> untouchable;
};

struct Entry {
    std::string name;
    Readable readable;
    bool large;  // takes long to walk: few changes are tried, and the models leave it out
    std::function<Case()> make;
};

// A key below the root of every layout, behind all others: no damage is to it, and no change is tried in it.
extern const char* const left_alone;
void add_left_alone(HiveLayout& layout);

// The hive that most entries damage, of some 8 KB:
//   Alpha      values "", Text, Number, Raw, Same; class "Klass"
//     Inner    value Deep; subkey Deeper, with a value
//     Other    security of its own
//     Third
//   Beta       an "ri" over leaves of two: b1 to b5, b3 with a value
//   Gamma      values List (a multi-string), Eight (8 bytes in a cell)
//     _under
//     leaf
//     moon     security of its own
//   Zeta
//   left_alone
HiveLayout stage();

// The same without free space, and with the data of Alpha's Raw in the last cell: a hive opens where that one alone is
// cut. It is more than a kilobyte long.
Bytes hive_to_cut();

// What an entry's damage works on.
struct Damage {
    LaidHive hive;
    Case result;

    const testkit::KeyPlaces& at(const std::string& path) const { return hive.at(path); }
    // Marks cells as damaged: no change may write to them. Called before the damage, which may be to their
    // size.
    void keep(uint32_t cell);
    void keep_record(const std::string& path) { keep(at(path).record); }
    // A cell in use of its own for a record of that many bytes, taken from the hive's free space.
    uint32_t add_cell(uint32_t record_bytes);
    // Takes the end off a used cell; it becomes a cell of its own, in use, filled with 0xEE.
    void cut_cell(uint32_t cell, uint32_t new_size);
    // A free cell, and one offset in its middle.
    uint32_t free_space() const;
    // Says that a key is listed in two places: what is done inside it in one shows in the other, and whether it is
    // there, and under which name, does not.
    void listed_twice(const std::string& place, const std::string& other);
};

// Collects the entries of one heading.
class List {
public:
    using Change = std::function<void(Damage&)>;
    using Places = std::vector<std::string>;

    // A damaged stage. affected and shared are as in Case; "" stands for everything.
    void add(const std::string& name, Readable readable, const Places& affected, const Change& damage,
             const Places& shared = {});
    // The same with another hive to damage.
    void add_on(const std::function<HiveLayout()>& layout, const std::string& name, Readable readable,
                const Places& affected, const Change& damage, const Places& shared = {}, bool large = false);
    // Bytes made without a layout.
    void add_bytes(const std::string& name, Readable readable, const std::function<Bytes()>& make, bool large = false);

    std::vector<Entry> entries;
};

// One of each heading.
void add_file_and_base_block(List& list);
void add_bins(List& list);
void add_cells(List& list);
void add_keys(List& list);
void add_depths(List& list);
void add_subkey_indexes(List& list);
void add_values(List& list);
void add_big_data(List& list);
void add_security(List& list);

// All of them, made once. Names are unique.
const std::vector<Entry>& catalogue();
// The case of one entry by its name; throws std::out_of_range.
Case case_of(const std::string& name);

}  // namespace hostile
