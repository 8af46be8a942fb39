// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "changes.h"

#include "alloc_faults.h"
#include "hive_checker.h"
#include "scene.h"

#include <algorithm>
#include <cstring>
#include <ctime>
#include <map>

namespace hostile {

using testkit::base_block_bytes;
using testkit::covers;
using testkit::FoundKey;
using testkit::Handle;
using testkit::Item;
using testkit::MemoryFile;
using testkit::pattern;
using testkit::Snapshot;

namespace {

constexpr uint32_t data_type = 3;
constexpr uint8_t data_seed = 77;
const std::string new_name = "Made here";
const std::string new_key_name = "New name";
const std::string name_before_all = "!first";
constexpr size_t many_subkeys = 4;         // an index of so many gets new names at its beginning and in its middle, too
constexpr uint32_t base_head_bytes = 512;  // what a change may write of the base block
constexpr uint32_t bin_header_bytes = 32;

// Text in UTF-8 as the 8-bit text that a call takes, ended at the first zero; false when 8 bits do not carry
// it.
bool as_8bit(const std::string& text, std::string& narrow) {
    narrow.clear();
    for (size_t i = 0; i < text.size(); i++) {
        const auto byte = static_cast<uint8_t>(text[i]);
        if (byte == 0)
            return true;
        if (byte < 0x80)
            narrow += text[i];
        else if ((byte & 0xFC) == 0xC0 && i + 1 < text.size())
            narrow += static_cast<char>((byte & 3) << 6 | (static_cast<uint8_t>(text[++i]) & 0x3F));
        else
            return false;
    }
    return true;
}

std::string below(const std::string& place, const std::string& name) {
    return place.empty() ? name : place + "\\" + name;
}

std::string upper_cased(std::string text) {
    for (char& c : text)
        c = c >= 'a' && c <= 'z' ? static_cast<char>(c - 32) : c;
    return text;
}

bool any_covers(const std::vector<std::string>& places, const std::string& other) {
    return std::any_of(places.begin(), places.end(),
                       [&](const std::string& place) { return covers(upper_cased(place), upper_cased(other)); });
}

// ---- what is written where
// ----------------------------------------------------------------------------------------

// Sees each write as it happens and holds it against the cells as they were before it.
class Watch {
public:
    Watch(MemoryFile& file, const std::vector<Range>& untouchable)
        : file_(file), untouchable_(untouchable), shadow_(file.bytes) {
        file_.on_write = [this](uint64_t position, uint64_t length) { see(position, length); };
    }
    ~Watch() { file_.on_write = nullptr; }
    Watch(const Watch&) = delete;
    Watch& operator=(const Watch&) = delete;

    const std::string& problems() const { return problems_; }

private:
    void see(uint64_t position, uint64_t length) {
        const uint64_t end = position + length;
        for (const Range& range : untouchable_) {
            if (position < range.end && end > range.begin)
                tell("a damaged structure was written to", position, length);
        }
        if (!is_one_unit(position, end))
            tell("a write is not within one cell or header", position, length);
        if (end > shadow_.size())
            shadow_.resize(end);
        memcpy(shadow_.data() + position, file_.bytes.data() + position, length);
    }

    bool is_one_unit(uint64_t position, uint64_t end) const {
        if (position < base_block_bytes)
            return end <= base_head_bytes;
        const uint64_t bins_end = base_block_bytes + uint64_t{testkit::get32(shadow_, 40)};
        if (position >= bins_end || position >= shadow_.size())
            return true;  // where a bin is being appended, or a file that was cut short made longer
        uint64_t bin = base_block_bytes;
        while (bin + testkit::get32(shadow_, bin + 8) <= position)
            bin += testkit::get32(shadow_, bin + 8);
        if (position < bin + bin_header_bytes)
            return end <= bin + bin_header_bytes;
        for (uint64_t cell = bin + bin_header_bytes;;) {
            const auto word = static_cast<int32_t>(testkit::get32(shadow_, cell));
            const uint64_t next = cell + static_cast<uint64_t>(std::abs(int64_t{word}));
            if (position < next)
                return end <= next;
            if (word == 0)
                return false;
            cell = next;
        }
    }

    void tell(const char* what, uint64_t position, uint64_t length) {
        problems_ += std::string(what) + ": " + std::to_string(length) + " bytes at " + std::to_string(position) + "\n";
    }

    MemoryFile& file_;
    const std::vector<Range>& untouchable_;
    Bytes shadow_;
    std::string problems_;
};

// ---- making a change
// ----------------------------------------------------------------------------------------------

// Opens the key at the end of a way; the root itself stays in the caller's hands.
RegistryKey* follow(RegistryKey* root, const std::vector<uint32_t>& way, Handle& holder) {
    RegistryKey* here = root;
    for (const uint32_t position : way) {
        Handle next;
        if (ROpenSubKey(here, position, next.out()) != R_SUCCESS)
            return nullptr;
        holder = std::move(next);
        here = holder.get();
    }
    return here;
}

int32_t call(RegistryKey* key, const Change& change) {
    Handle made;
    const Bytes data = pattern(change.size, data_seed);
    switch (change.kind) {
    case Kind::create_key:
        return RCreateKey(key, change.name.c_str(), made.out(), nullptr);
    case Kind::set_value:
        return RSetValueExW(key, change.name.c_str(), data_type, data.data(), change.size);
    case Kind::delete_value:
        return RDeleteValue(key, change.name.c_str());
    case Kind::rename_key:
    case Kind::rename_damaged_key:
        return RRenameKey(key, change.position, change.name.c_str());
    case Kind::delete_key:
        return RDeleteKey(key, change.name.c_str());
    }
    return R_FAILED;
}

// ---- judging it
// ---------------------------------------------------------------------------------------------------

std::vector<Item> others(const Snapshot& snapshot, const std::vector<std::string>& exempt) {
    std::vector<Item> kept;
    for (const Item& item : snapshot.items) {
        if (!any_covers(exempt, item.place))
            kept.push_back(item);
    }
    return kept;
}

std::string differences(const std::vector<Item>& before, const std::vector<Item>& after, bool new_ones_count) {
    std::string text;
    std::vector<Item> only;
    std::set_difference(before.begin(), before.end(), after.begin(), after.end(), std::back_inserter(only));
    for (const Item& item : only)
        text += "gone or changed: " + item.place + " (" + item.what.substr(0, 60) + ")\n";
    if (!new_ones_count)
        return text;
    only.clear();
    std::set_difference(after.begin(), after.end(), before.begin(), before.end(), std::back_inserter(only));
    for (const Item& item : only)
        text += "new or changed: " + item.place + " (" + item.what.substr(0, 60) + ")\n";
    return text;
}

int64_t times(const Snapshot& snapshot, const std::string& place) {
    return std::count_if(snapshot.items.begin(), snapshot.items.end(),
                         [&](const Item& item) { return upper_cased(item.place) == upper_cased(place); });
}

// Whether a call that said that it succeeded did what it says.
std::string effect(const Change& change, const Snapshot& before, const Snapshot& after) {
    const auto more = [&](const std::string& place) { return times(after, place) - times(before, place); };
    const std::string& place = change.named.front();
    switch (change.kind) {
    case Kind::create_key:
        return change.way.size() >= judged_depth || more(place) == 1 ? "" : "the key is not there\n";
    case Kind::set_value: {
        const Bytes data = pattern(change.size, data_seed);
        const std::string what =
            "type 3 size " + std::to_string(change.size) + ": " + std::string(data.begin(), data.end());
        const bool there = std::any_of(after.items.begin(), after.items.end(), [&](const Item& item) {
            return upper_cased(item.place) == upper_cased(place) && item.what == what;
        });
        return there ? "" : "the value does not read back\n";
    }
    case Kind::delete_value:
    case Kind::delete_key:
        return more(place) == -1 ? "" : "not one item less, but " + std::to_string(more(place)) + " more\n";
    case Kind::rename_key:
        return more(place) == -1 && more(change.named.back()) == 1 ? "" : "the name did not change\n";
    case Kind::rename_damaged_key:
        return "a key that cannot be opened was renamed\n";
    }
    return "";
}

std::string structure(const Bytes& before, const Bytes& after) {
    std::string text;
    for (const testkit::Fault& fault : new_faults(testkit::check_hive(before), testkit::check_hive(after))) {
        if (fault.rule == "bins" || fault.rule == "cells" || fault.rule == "base" || fault.rule == "checksum")
            text += fault.rule + ": " + fault.text + "\n";
    }
    return text;
}

std::string judge(const Case& hive, const Snapshot& before, const Change& change, int32_t status, MemoryFile& file,
                  bool faulty) {
    file.rewind();
    const RegistryIo io = file.io();
    RegistryKey* root = ROpenHive(&io);
    if (root == nullptr)
        return "the hive does not open any more\n";
    const Snapshot after = take_snapshot(root, judged_limits(file.bytes.size()));
    std::string text = RCloseKey(root) == R_SUCCESS ? "" : "the hive does not close\n";
    const bool shares =
        (status == R_SUCCESS || faulty) && std::any_of(hive.shared.begin(), hive.shared.end(), [&](const auto& place) {
            return any_covers({place}, change.named.front()) || any_covers({change.named.front()}, place);
        });
    std::vector<std::string> exempt = hive.unsettled;
    if (status == R_SUCCESS || faulty)
        exempt.insert(exempt.end(), change.named.begin(), change.named.end());
    if (shares)
        exempt.insert(exempt.end(), hive.shared.begin(), hive.shared.end());
    for (const Flow& flow : hive.shows_in) {
        if ((status == R_SUCCESS || faulty) && any_covers({flow.from}, change.named.front()))
            exempt.insert(exempt.end(), flow.to.begin(), flow.to.end());
    }
    text += differences(others(before, exempt), others(after, exempt), !hive.cut_short);
    const bool settled = !shares && !any_covers(hive.unsettled, change.named.front());
    if (status == R_SUCCESS && settled)
        text += effect(change, before, after);
    return text + structure(hive.bytes, file.bytes);
}

}  // namespace

std::string Change::text() const {
    static const char* const kinds[] = {"create", "set", "delete value", "rename", "rename damaged", "delete subkey"};
    std::string all = std::string(kinds[static_cast<size_t>(kind)]) + " \"" + name + "\" in \"" + place + "\"";
    if (kind == Kind::set_value)
        all += ", " + std::to_string(size) + " bytes";
    if (kind == Kind::rename_key || kind == Kind::rename_damaged_key)
        all += ", subkey " + std::to_string(position);
    return all;
}

double cpu_seconds() {
    timespec now = {};
    clock_gettime(CLOCK_PROCESS_CPUTIME_ID, &now);
    return static_cast<double>(now.tv_sec) + static_cast<double>(now.tv_nsec) / 1e9;
}

double most_seconds(uint64_t file_size) { return 2 + static_cast<double>(file_size) / 1e6; }

testkit::WalkLimits judged_limits(size_t file_size) {
    testkit::WalkLimits limits = testkit::limits_for(file_size);
    limits.depth = judged_depth;
    limits.keys *= 20;  // a ring is walked a few times over before the depth ends it
    return limits;
}

namespace {

void add_values_of(const FoundKey& key, std::vector<Change>& all) {
    struct Asked {
        std::string name;     // as a call takes it, up to a zero
        std::string deleted;  // the value that a deletion by that name is about
    };
    std::vector<Asked> names = {{new_name, new_name}};
    for (const std::string& value : key.values) {
        std::string narrow;
        if (value == "?" || !as_8bit(value, narrow))
            continue;
        const auto same =
            std::find_if(names.begin(), names.end(), [&](const Asked& name) { return name.name == narrow; });
        const bool is_exact = value == testkit::utf8(testkit::widen(narrow));
        if (same == names.end())
            names.push_back({narrow, value});
        else if (is_exact)
            same->deleted = value;  // of two that begin alike the one with just that name
    }
    for (const auto& [name, deleted] : names) {
        const std::vector<std::string> named = {key.place + "|" + testkit::utf8(testkit::widen(name))};
        for (const uint32_t size : {0U, 4U, 5U, 100U, 16344U})
            all.push_back({Kind::set_value, key.way, key.place, name, 0, size, named});
        if (name != new_name)
            all.push_back({Kind::delete_value, key.way, key.place, name, 0, 0, {key.place + "|" + deleted}});
    }
}

// A key's own name.
std::string name_in(const FoundKey& parent, const std::string& place) {
    return place.substr(parent.place.empty() ? 0 : parent.place.size() + 1);
}

// Names for new subkeys: one that goes behind all that the catalogue has and, where they are many, one before them all
// and one behind the second of them.
std::vector<std::string> names_among(const std::vector<std::string>& subkeys, const std::string& last) {
    std::vector<std::string> names = {last};
    if (subkeys.size() < many_subkeys)
        return names;
    names.push_back(name_before_all);
    std::string narrow;
    if (as_8bit(subkeys[1], narrow))
        names.push_back(narrow + "a");
    return names;
}

// The calls on the key's parent that are about the key itself.
void add_key_itself(const FoundKey& key, const FoundKey& parent, const std::vector<std::string>& siblings,
                    std::vector<Change>& all) {
    const uint32_t position = key.way.back();
    for (const std::string& name : names_among(siblings, new_key_name)) {
        const std::string renamed = below(parent.place, testkit::utf8(testkit::widen(name)));
        all.push_back({Kind::rename_key, parent.way, parent.place, name, position, 0, {key.place, renamed}});
    }
    std::string narrow;
    const std::string name = name_in(parent, key.place);
    if (as_8bit(name, narrow) && !narrow.empty())
        all.push_back({Kind::delete_key,
                       parent.way,
                       parent.place,
                       narrow,
                       0,
                       0,
                       {below(parent.place, testkit::utf8(testkit::widen(narrow)))}});
}

std::vector<uint32_t> way_to_parent(const FoundKey& key) { return {key.way.begin(), key.way.end() - 1}; }

}  // namespace

std::vector<Change> changes_to(const Snapshot& snapshot) {
    std::vector<Change> all;
    std::map<std::vector<uint32_t>, std::vector<std::string>> subkeys;  // their names, by the way to the key
    std::map<std::vector<uint32_t>, const FoundKey*> keys;
    for (const FoundKey& key : snapshot.keys) {
        keys[key.way] = &key;
        if (!key.way.empty())
            subkeys[way_to_parent(key)].push_back(name_in(*keys.at(way_to_parent(key)), key.place));
    }
    for (const FoundKey& key : snapshot.keys) {
        if (covers(left_alone, key.place))
            continue;
        for (const std::string& name : names_among(subkeys[key.way], new_name)) {
            const std::string made = below(key.place, testkit::utf8(testkit::widen(name)));
            all.push_back({Kind::create_key, key.way, key.place, name, 0, 0, {made}});
        }
        add_values_of(key, all);
        for (const uint32_t position : key.damaged)
            all.push_back({Kind::rename_damaged_key,
                           key.way,
                           key.place,
                           new_key_name,
                           position,
                           0,
                           {below(key.place, new_key_name)}});
        if (!key.way.empty())
            add_key_itself(key, *keys.at(way_to_parent(key)), subkeys.at(way_to_parent(key)), all);
    }
    return all;
}

namespace {

// What a change may take for each byte of the file and of the data that it is given, and beside that.
constexpr uint64_t calls_spared = 400;
constexpr uint64_t bytes_a_call = 8;
constexpr uint64_t passes = 512;  // a record may cost a window of 16 KiB
constexpr uint64_t spare_bytes = 32U << 10U;

// Whether the calls, reads, memory and time that a hive's opening, a change and its closing took are bounded by the
// file's size.
std::string cost(const MemoryFile& file, const testkit::AllocationFaults& memory, double seconds, uint64_t size) {
    const auto above = [](const char* what, uint64_t taken, uint64_t most) {
        return taken <= most ? "" : std::to_string(taken) + " " + what + " where " + std::to_string(most) + " do\n";
    };
    const testkit::MemoryFile::Counts& counts = file.counts();
    std::string text = above("reads and seeks", counts.reads + counts.seeks, size / bytes_a_call + calls_spared);
    text += above("bytes read", counts.bytes_read, passes * size + spare_bytes);
    text += above("writes", counts.writes, size / 512 + calls_spared);
    text += above("bytes asked for at once", memory.largest(), size + spare_bytes);
    text += above("bytes held", memory.peak(), size + spare_bytes);
    return seconds <= most_seconds(size) ? text : text + std::to_string(seconds) + " seconds\n";
}

}  // namespace

int32_t status_of(const Bytes& bytes, const Change& change) {
    testkit::Scene scene(bytes);
    Handle holder;
    RegistryKey* key = scene.is_open() ? follow(scene.root(), change.way, holder) : nullptr;
    return key != nullptr ? call(key, change) : int32_t{R_FAILED};
}

std::string try_change(const Case& hive, const Snapshot& before, const Change& change,
                       const MemoryFile::Failure& failure, bool* struck) {
    MemoryFile file(hive.bytes);
    const testkit::AllocationFaults memory(0);
    const double began = cpu_seconds();
    const RegistryIo io = file.io();
    RegistryKey* root = ROpenHive(&io);
    if (root == nullptr)
        return "the hive does not open\n";
    int32_t status = R_FAILED;
    std::string text;
    {
        Handle holder;
        RegistryKey* key = follow(root, change.way, holder);
        if (key == nullptr) {
            text = "the key cannot be reached\n";
        } else {
            const Watch watch(file, hive.untouchable);
            if (failure.nth > 0)
                file.arm(failure);
            status = call(key, change);
            if (struck != nullptr)
                *struck = file.failed();
            if (failure.nth > 0)
                file.disarm();
            text = watch.problems();
        }
    }
    if (RCloseKey(root) != R_SUCCESS)
        return text + "the hive does not close\n";
    if (failure.nth == 0)
        text += cost(file, memory, cpu_seconds() - began, hive.bytes.size() + change.size);
    return text + judge(hive, before, change, status, file, failure.nth > 0);
}

}  // namespace hostile
