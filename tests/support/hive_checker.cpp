// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "hive_checker.h"

#include <algorithm>
#include <map>
#include <set>

namespace testkit {
namespace {

constexpr size_t most_faults = 200;

struct Cell {
    uint64_t position = 0;  // of the record, behind the size word
    uint32_t room = 0;      // 0: no such cell
};

struct Index {
    std::vector<uint32_t> keys;
    std::vector<std::pair<char, uint32_t>> marks;  // 'f' hint, 'h' hash, 'i' none
};

class Checker {
public:
    Checker(const Bytes& bytes, CheckResult& result) : bytes_(bytes), result_(result) {}

    void run() {
        if (!check_base())
            return;
        check_bins();
        walk_keys();
        check_security();
        collect_leaks();
    }

private:
    void fault(const char* rule, uint32_t offset, const std::string& text) {
        if (result_.faults.size() < most_faults)
            result_.faults.push_back({rule, offset, text});
    }

    bool check_base() {
        if (bytes_.size() < base_block_bytes || get32(bytes_, 0) != 0x66676572) {
            fault("base", 0, "no base block");
            return false;
        }
        if (get32(bytes_, 508) != base_checksum(bytes_))
            fault("checksum", 0, "the base block's checksum is wrong");
        size_ = get32(bytes_, 40);
        if (size_ > bytes_.size() - base_block_bytes) {
            fault("base", 0, "the file is shorter than its bins");
            size_ = static_cast<uint32_t>(bytes_.size() - base_block_bytes) & ~7U;
        }
        state_.assign(size_ / 8 + 1, 0);
        return true;
    }

    void check_bins() {
        uint64_t bin = 0;
        while (bin < size_) {
            const uint64_t at = base_block_bytes + bin;
            const uint32_t size = get32(bytes_, at + 8);
            if (get32(bytes_, at) != 0x6E696268 || get32(bytes_, at + 4) != bin)
                return fault("bins", static_cast<uint32_t>(bin), "no bin here, or one that says it is elsewhere");
            if (size == 0 || size % 4096 != 0 || size > size_ - bin)
                return fault("bins", static_cast<uint32_t>(bin), "a bin of size " + std::to_string(size));
            check_cells(static_cast<uint32_t>(bin), size);
            bin += size;
        }
    }

    void check_cells(uint32_t bin, uint32_t size) {
        uint32_t at = 32;
        while (at < size) {
            const auto word = static_cast<int32_t>(get32(bytes_, base_block_bytes + uint64_t{bin} + at));
            const uint32_t length = word < 0 ? 0U - static_cast<uint32_t>(word) : static_cast<uint32_t>(word);
            if (length == 0 || length % 8 != 0 || length > size - at)
                return fault("cells", bin + at, "a cell of size " + std::to_string(word));
            state_[(bin + at) / 8] = word < 0 ? used : unused;
            at += length;
        }
    }

    // The cell at an offset, when it is one in use. again: it may have been reached before.
    Cell reach(uint32_t offset, const char* what, uint32_t from, bool again = false) {
        if (offset >= size_ || offset % 8 != 0 || state_[offset / 8] == 0) {
            fault("reach", from, std::string(what) + " leads to no cell: " + std::to_string(offset));
            return {};
        }
        uint8_t& state = state_[offset / 8];
        if (state == unused) {
            fault("free", from, std::string(what) + " leads to a free cell: " + std::to_string(offset));
            return {};
        }
        if (state == reached && !again) {
            fault("twice", from, std::string(what) + " is reached twice: " + std::to_string(offset));
            return {};
        }
        state = reached;
        const uint64_t position = base_block_bytes + uint64_t{offset};
        return {position + 4, (0U - get32(bytes_, position)) - 4};
    }

    Cell record(uint32_t offset, const char* signature, uint32_t least, uint32_t from, bool again = false) {
        const Cell cell = reach(offset, signature, from, again);
        if (cell.room == 0)
            return {};
        if (cell.room < least || bytes_[cell.position] != static_cast<uint8_t>(signature[0]) ||
            bytes_[cell.position + 1] != static_cast<uint8_t>(signature[1])) {
            fault("record", from, std::string("no ") + signature + " record at " + std::to_string(offset));
            return {};
        }
        return cell;
    }

    struct Visit {
        uint32_t offset;
        uint32_t parent;
        uint32_t depth;
    };

    void walk_keys() {
        std::vector<Visit> stack{{get32(bytes_, 36), none, 0}};
        while (!stack.empty()) {
            const Visit visit = stack.back();
            stack.pop_back();
            check_key(visit, stack);
        }
    }

    void check_key(const Visit& visit, std::vector<Visit>& stack) {
        const uint32_t offset = visit.offset;
        const Cell cell = record(offset, "nk", 76, visit.parent);
        if (cell.room == 0)
            return;
        result_.keys++;
        const uint64_t p = cell.position;
        if (cell.room - 76 < get16(bytes_, p + 72))
            fault("name", offset, "the key's name is longer than its cell");
        if (visit.parent != none && get32(bytes_, p + 16) != visit.parent)
            fault("parent", offset, "the key's parent is " + std::to_string(get32(bytes_, p + 16)));
        if (visit.depth > 512)
            fault("depth", offset, "a key deeper than 512");
        check_class(offset, p);
        count_security(offset, get32(bytes_, p + 44));
        check_values(offset, p);
        check_subkeys(visit, p, stack);
    }

    void check_class(uint32_t offset, uint64_t p) {
        const uint32_t at = get32(bytes_, p + 48);
        const uint16_t length = get16(bytes_, p + 74);
        if (at == none)
            return;
        if (length == 0 && (at >= size_ || at % 8 != 0 || state_[at / 8] != used))
            return;  // a class of no length is no class
        const Cell cell = reach(at, "class", offset, true);
        if (cell.room != 0 && cell.room < length)
            fault("class", offset, "the class is longer than its cell");
    }

    void count_security(uint32_t offset, uint32_t security) {
        if (security == none)
            return fault("security", offset, "a key without security record");
        if (++security_[security] == 1)
            record(security, "sk", 20, offset, true);
    }

    void check_values(uint32_t offset, uint64_t p) {
        const uint32_t count = get32(bytes_, p + 36);
        if (count == 0)
            return;
        const Cell list = reach(get32(bytes_, p + 40), "value list", offset);
        if (list.room / 4 < count)
            return fault("count", offset, "the value list is shorter than its count");
        std::set<std::u16string> names;
        for (uint32_t i = 0; i < count; i++)
            check_value(offset, p, get32(bytes_, list.position + uint64_t{i} * 4), names);
    }

    void check_value(uint32_t key, uint64_t key_position, uint32_t offset, std::set<std::u16string>& names) {
        const Cell cell = record(offset, "vk", 20, key);
        if (cell.room == 0)
            return;
        result_.values++;
        const uint64_t p = cell.position;
        const uint16_t length = get16(bytes_, p + 2);
        const bool narrow = (get16(bytes_, p + 16) & 1) != 0;
        if (cell.room - 20 < length)
            return fault("name", offset, "the value's name is longer than its cell");
        const std::u16string name = text(p + 20, length, narrow);
        if (!names.insert(upper(name)).second)
            fault("name", offset, "two values of one name");
        if (get32(bytes_, key_position + 60) < name.size() * 2)
            fault("maximum", key, "the longest value name is too low");
        check_data(key, key_position, offset, p);
    }

    void check_data(uint32_t key, uint64_t key_position, uint32_t offset, uint64_t p) {
        const uint32_t size = get32(bytes_, p + 4) & 0x7FFFFFFF;
        const bool is_inline = (get32(bytes_, p + 4) & 0x80000000) != 0;
        const uint32_t at = get32(bytes_, p + 8);
        if (get32(bytes_, key_position + 64) < size)
            fault("maximum", key, "the largest data is too low");
        if (is_inline && size > 4)
            return fault("data", offset, "inline data of " + std::to_string(size) + " bytes");
        if (is_inline || size == 0)
            return;
        const Cell cell = reach(at, "data", offset);
        if (cell.room == 0 || cell.room >= size)
            return;
        if (cell.room < 8 || bytes_[cell.position] != 'd' || bytes_[cell.position + 1] != 'b')
            return fault("data", offset, "data larger than its cell");
        check_segments(offset, cell, size);
    }

    void check_segments(uint32_t offset, const Cell& big, uint32_t size) {
        const uint32_t count = get16(bytes_, big.position + 2);
        const Cell list = reach(get32(bytes_, big.position + 4), "segment list", offset);
        if (list.room / 4 < count)
            return fault("data", offset, "the segment list is shorter than its count");
        uint64_t total = 0;
        for (uint32_t i = 0; i < count; i++)
            total += std::min(16344U, reach(get32(bytes_, list.position + i * 4), "segment", offset).room);
        if (total < size)
            fault("data", offset, "the segments hold less than the data's size");
    }

    void check_subkeys(const Visit& visit, uint64_t p, std::vector<Visit>& stack) {
        const uint32_t count = get32(bytes_, p + 20);
        const uint32_t at = get32(bytes_, p + 28);
        if (count == 0 && at == none)
            return;
        Index index;
        list_index(visit.offset, at, 0, index);
        if (index.keys.size() != count)
            fault("count", visit.offset,
                  "subkey count " + std::to_string(count) + ", index " + std::to_string(index.keys.size()));
        std::u16string last;
        for (size_t i = 0; i < index.keys.size(); i++) {
            const std::u16string name = check_entry(visit.offset, p, index, i);
            if (i != 0 && !(last < name))
                fault("order", index.keys[i], utf8(last) + " stands before " + utf8(name));
            last = name;
            stack.push_back({index.keys[i], visit.offset, visit.depth + 1});
        }
    }

    // Checks one entry against its key's name, and the parent's longest name; gives the name upper-cased.
    std::u16string check_entry(uint32_t parent, uint64_t parent_position, const Index& index, size_t i) {
        const uint32_t key = index.keys[i];
        const uint64_t p = base_block_bytes + uint64_t{key} + 4;
        if (key >= size_ || !holds(bytes_, p, 76) || !holds(bytes_, p + 76, get16(bytes_, p + 72)))
            return {};
        const bool narrow = (get16(bytes_, p + 2) & 0x20) != 0;
        const uint16_t length = get16(bytes_, p + 72);
        const std::u16string name = text(p + 76, length, narrow);
        // The field's upper half is Windows's own: flags, in most keys of a hive since Vista.
        if (get16(bytes_, parent_position + 52) < name.size() * 2)
            fault("maximum", parent, "the longest subkey name is too low");
        const auto [kind, mark] = index.marks[i];
        if (kind == 'f' && narrow && mark != hint(name))
            fault("hint", key, "wrong hint of " + utf8(name));
        if (kind == 'h' && mark != hash(name, false) && mark != hash(name, true))
            fault("hash", key, "wrong hash of " + utf8(name));
        return upper(name);
    }

    static uint32_t hint(const std::u16string& name) {
        uint32_t word = 0;
        for (size_t i = 0; i < 4 && i < name.size(); i++)
            word |= static_cast<uint32_t>(name[i] & 0xFF) << (8 * i);
        return word;
    }
    // is_signed: units above 0x7F of 8-bit names count as negative, as the engine writes them; Windows folds
    // them and counts them as they are.
    static uint32_t hash(const std::u16string& name, bool is_signed) {
        uint32_t sum = 0;
        for (char16_t unit : upper(name)) {
            uint32_t n = unit;
            if (is_signed && n > 0x7F && n < 0x100)
                n |= 0xFFFFFF00;
            else if (!is_signed && n >= 0xE0 && n < 0xFF && n != 0xF7)
                n -= 0x20;
            sum = sum * 37 + n;
        }
        return sum;
    }

    void list_index(uint32_t key, uint32_t offset, int level, Index& index) {
        const Cell cell = reach(offset, "index", key);
        if (cell.room < 4)
            return;
        const char first = static_cast<char>(bytes_[cell.position]);
        const char second = static_cast<char>(bytes_[cell.position + 1]);
        const uint32_t count = get16(bytes_, cell.position + 2);
        const bool wide = first == 'l' && (second == 'f' || second == 'h');
        const bool root = first == 'r' && second == 'i';
        if (!wide && !root && !(first == 'l' && second == 'i'))
            return fault("index", key, "no subkey index at " + std::to_string(offset));
        if (root && level > 0)
            return fault("index", key, "an index root below an index root");
        if ((cell.room - 4) / (wide ? 8 : 4) < count)
            return fault("count", key, "an index longer than its cell at " + std::to_string(offset));
        for (uint32_t i = 0; i < count; i++) {
            const uint64_t at = cell.position + 4 + uint64_t{i} * (wide ? 8 : 4);
            if (root) {
                list_index(key, get32(bytes_, at), level + 1, index);
            } else {
                index.keys.push_back(get32(bytes_, at));
                index.marks.push_back({second, wide ? get32(bytes_, at + 4) : 0});
            }
        }
    }

    std::u16string text(uint64_t position, uint32_t length, bool narrow) const {
        std::u16string name;
        if (!holds(bytes_, position, length))
            return name;
        for (uint32_t i = 0; i + (narrow ? 0U : 1U) < length; i += narrow ? 1 : 2)
            name += narrow ? static_cast<char16_t>(bytes_[position + i])
                           : static_cast<char16_t>(get16(bytes_, position + i));
        return name;
    }

    // Every record of the ring is one that keys refer to, as often as it says; neighbours point at each
    // other.
    void check_security() {
        std::vector<uint32_t> open;
        for (const auto& entry : security_)
            open.push_back(entry.first);
        while (!open.empty()) {
            const uint32_t offset = open.back();
            open.pop_back();
            const uint64_t p = base_block_bytes + uint64_t{offset} + 4;
            if (offset >= size_ || state_[offset / 8] != reached)
                continue;  // told already
            if (get32(bytes_, p + 12) != security_[offset])
                fault("references", offset,
                      "security record says " + std::to_string(get32(bytes_, p + 12)) + " keys, there are " +
                          std::to_string(security_[offset]));
            if (get32(bytes_, p + 16) > (0U - get32(bytes_, p - 4)) - 24)
                fault("security", offset, "the descriptor is longer than its cell");
            const uint32_t next = get32(bytes_, p + 4);
            if (security_.find(next) == security_.end()) {
                if (record(next, "sk", 20, offset, true).room == 0)
                    continue;
                security_[next] = 0;
                open.push_back(next);
            }
            if (get32(bytes_, base_block_bytes + uint64_t{next} + 4 + 8) != offset)
                fault("ring", offset, "the next security record does not point back");
        }
    }

    void collect_leaks() {
        for (uint32_t i = 0; i < state_.size(); i++) {
            if (state_[i] != used)
                continue;
            const uint16_t head = get16(bytes_, base_block_bytes + uint64_t{i} * 8 + 4);
            auto& list = head == 0x6B76   ? result_.leaks.values
                         : head == 0x6B6E ? result_.leaks.keys
                                          : result_.leaks.others;
            list.push_back(i * 8);
        }
    }

    static constexpr uint8_t used = 1;
    static constexpr uint8_t unused = 2;
    static constexpr uint8_t reached = 3;

    const Bytes& bytes_;
    CheckResult& result_;
    uint32_t size_ = 0;
    std::vector<uint8_t> state_;             // by cell offset / 8; 0: no cell begins there
    std::map<uint32_t, uint32_t> security_;  // record -> keys that refer to it
};

}  // namespace

CheckResult check_hive(const Bytes& bytes) {
    CheckResult result;
    Checker(bytes, result).run();
    return result;
}

std::vector<Fault> new_faults(const CheckResult& before, const CheckResult& after) {
    std::set<std::pair<std::string, uint32_t>> known;
    for (const Fault& fault : before.faults)
        known.insert({fault.rule, fault.offset});
    std::vector<Fault> added;
    for (const Fault& fault : after.faults)
        if (known.find({fault.rule, fault.offset}) == known.end())
            added.push_back(fault);
    return added;
}

std::string text_of(const std::vector<Fault>& faults) {
    std::string lines;
    for (const Fault& fault : faults)
        lines += fault.rule + " at " + std::to_string(fault.offset) + ": " + fault.text + "\n";
    return lines;
}

std::string CheckResult::text() const { return text_of(faults); }

}  // namespace testkit
