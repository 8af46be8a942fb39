// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "hive_reader.h"

#include <algorithm>
#include <unordered_set>

namespace testkit {
namespace {

constexpr uint32_t deepest = 520;  // levels; Windows makes 512
constexpr uint32_t segment_bytes = 16344;

// Where a record lies in the file and how many bytes its cell leaves it.
struct Place {
    uint64_t position = 0;
    uint64_t room = 0;
    bool ok = false;
};

class Reader {
public:
    Reader(const Bytes& bytes, Hive& hive)
        : bytes_(bytes), hive_(hive), end_(base_block_bytes + uint64_t{get32(bytes, 40)}),
          data_budget_(bytes.size() * 4), entry_budget_(bytes.size()) {
        end_ = std::min<uint64_t>(end_, bytes.size());
    }

    void read() {
        if (get32(bytes_, 0) != 0x66676572)
            return complain("no regf signature", 0);
        hive_.sound_root = read_key(get32(bytes_, 36), 0, hive_.root);
    }

private:
    void complain(const std::string& text, uint32_t offset) {
        if (hive_.complaints.size() < 1000)
            hive_.complaints.push_back(text + " at " + std::to_string(offset));
    }

    Place place(uint32_t offset) const {
        if (offset >= 0x80000000 || offset % 8 != 0)
            return {};
        const uint64_t position = base_block_bytes + uint64_t{offset};
        if (position + 4 > end_)
            return {};
        const int64_t size = -int64_t{static_cast<int32_t>(get32(bytes_, position))};
        if (size < 8 || static_cast<uint64_t>(size) > end_ - position)
            return {};
        return {position + 4, static_cast<uint64_t>(size) - 4, true};
    }
    bool is(const Place& at, const char* signature) const {
        return at.ok && at.room >= 2 && bytes_[at.position] == static_cast<uint8_t>(signature[0]) &&
               bytes_[at.position + 1] == static_cast<uint8_t>(signature[1]);
    }
    Bytes slice(uint64_t position, uint64_t n) const {
        const auto first = bytes_.begin() + static_cast<std::ptrdiff_t>(position);
        return Bytes(first, first + static_cast<std::ptrdiff_t>(n));
    }
    static std::u16string decode(const Bytes& stored, bool narrow) {
        std::u16string text;
        if (narrow)
            for (uint8_t byte : stored)
                text += static_cast<char16_t>(byte);
        else
            for (size_t i = 0; i + 1 < stored.size(); i += 2)
                text += static_cast<char16_t>(stored[i] | stored[i + 1] << 8);
        return text;
    }

    bool read_key(uint32_t offset, uint32_t depth, Key& key) {
        const Place at = place(offset);
        const uint64_t p = at.position;
        if (!is(at, "nk") || at.room < 76 || at.room - 76 < get16(bytes_, p + 72)) {
            complain("no key", offset);
            return false;
        }
        if (depth > deepest || !seen_.insert(offset).second) {
            complain("key met twice or too deep", offset);
            return false;
        }
        key.offset = offset;
        key.flags = get16(bytes_, p + 2);
        key.time = get32(bytes_, p + 4) | uint64_t{get32(bytes_, p + 8)} << 32;
        key.parent = get32(bytes_, p + 16);
        key.security = get32(bytes_, p + 44);
        key.name_8bit = (key.flags & 0x20) != 0;
        key.stored_name = slice(p + 76, get16(bytes_, p + 72));
        key.name = decode(key.stored_name, key.name_8bit);
        read_class(get32(bytes_, p + 48), get16(bytes_, p + 74), key);
        read_values(get32(bytes_, p + 40), get32(bytes_, p + 36), key);
        if (get32(bytes_, p + 20) != 0)
            read_index(get32(bytes_, p + 28), get32(bytes_, p + 20), depth, key);
        return true;
    }

    void read_class(uint32_t offset, uint32_t length, Key& key) {
        if (offset == none || length == 0)
            return;
        const Place at = place(offset);
        if (!at.ok || at.room < length)
            return complain("no class", offset);
        key.class_name = decode(slice(at.position, length), false);
    }

    void read_values(uint32_t offset, uint32_t claimed, Key& key) {
        if (claimed == 0)
            return;
        const Place list = place(offset);
        if (!list.ok)
            return complain("no value list", offset);
        uint64_t count = claimed;
        if (count > list.room / 4) {
            complain("value list shorter than its count", offset);
            count = list.room / 4;
        }
        for (uint64_t i = 0; i < count && spend_entry(); i++) {
            Value value;
            if (read_value(get32(bytes_, list.position + i * 4), value))
                key.values.push_back(std::move(value));
        }
    }

    bool read_value(uint32_t offset, Value& value) {
        const Place at = place(offset);
        const uint64_t p = at.position;
        if (!is(at, "vk") || at.room < 20 || at.room - 20 < get16(bytes_, p + 2)) {
            complain("no value", offset);
            return false;
        }
        value.offset = offset;
        value.name_8bit = (get16(bytes_, p + 16) & 1) != 0;
        value.stored_name = slice(p + 20, get16(bytes_, p + 2));
        value.name = decode(value.stored_name, value.name_8bit);
        value.type = get32(bytes_, p + 12);
        value.is_inline = (get32(bytes_, p + 4) & 0x80000000) != 0;
        value.size = get32(bytes_, p + 4) & 0x7FFFFFFF;
        if (value.size > data_budget_) {
            complain("data larger than the file can hold", offset);
            return true;
        }
        data_budget_ -= value.size;
        read_data(p + 8, value);
        if (!value.readable)
            complain("data unreadable", offset);
        return true;
    }

    void read_data(uint64_t field, Value& value) {
        value.readable = value.size == 0;
        if (value.is_inline && value.size <= 4) {
            value.data = slice(field, value.size);
            value.readable = true;
        }
        if (value.is_inline || value.size == 0)
            return;
        const Place at = place(get32(bytes_, field));
        if (at.ok && at.room >= value.size) {
            value.data = slice(at.position, value.size);
            value.readable = true;
        } else if (is(at, "db")) {
            read_segments(at, value);
        }
    }

    void read_segments(const Place& record, Value& value) {
        const Place list = place(get32(bytes_, record.position + 4));
        const uint32_t count = get16(bytes_, record.position + 2);
        if (!list.ok || list.room < count * 4U)
            return;
        for (uint32_t i = 0; i < count && value.data.size() < value.size; i++) {
            const Place segment = place(get32(bytes_, list.position + i * 4));
            const uint64_t n = std::min<uint64_t>(segment_bytes, value.size - value.data.size());
            if (!segment.ok || segment.room < n)
                return;
            const Bytes part = slice(segment.position, n);
            value.data.insert(value.data.end(), part.begin(), part.end());
        }
        value.readable = value.data.size() == value.size;
    }

    void read_index(uint32_t offset, uint32_t claimed, uint32_t depth, Key& key) {
        std::vector<uint32_t> offsets;
        list_index(offset, 0, offsets);
        if (offsets.size() != claimed)
            complain("subkey count differs from its index", key.offset);
        for (uint32_t child_offset : offsets) {
            Key child;
            if (read_key(child_offset, depth + 1, child))
                key.children.push_back(std::move(child));
        }
    }

    // The keys that an index lists. level bounds how far roots nest.
    void list_index(uint32_t offset, int level, std::vector<uint32_t>& offsets) {
        const Place at = place(offset);
        const bool root = is(at, "ri");
        const bool plain = root || is(at, "li");
        const uint32_t width = plain ? 4 : 8;
        if (level > 2 || !(plain || is(at, "lf") || is(at, "lh")) || at.room < 4)
            return complain("no subkey index", offset);
        uint64_t count = get16(bytes_, at.position + 2);
        if (count > (at.room - 4) / width) {
            complain("index shorter than its count", offset);
            count = (at.room - 4) / width;
        }
        for (uint64_t i = 0; i < count && spend_entry(); i++) {
            const uint32_t entry = get32(bytes_, at.position + 4 + i * width);
            if (root)
                list_index(entry, level + 1, offsets);
            else
                offsets.push_back(entry);
        }
    }

    bool spend_entry() {
        if (entry_budget_ == 0)
            return false;
        entry_budget_--;
        return true;
    }

    const Bytes& bytes_;
    Hive& hive_;
    uint64_t end_;
    uint64_t data_budget_;   // bytes of data that may still be copied: values that share data cannot blow up
    uint64_t entry_budget_;  // list entries that may still be followed
    std::unordered_set<uint32_t> seen_;
};

}  // namespace

Hive read_hive(const Bytes& bytes) {
    Hive hive;
    Reader(bytes, hive).read();
    return hive;
}

const Key* Hive::find(const std::u16string& path) const {
    const Key* key = sound_root ? &root : nullptr;
    size_t at = 0;
    while (key != nullptr && at < path.size()) {
        const size_t end = std::min(path.find(u'\\', at), path.size());
        const std::u16string name = upper(path.substr(at, end - at));
        at = end + 1;
        const auto found = std::find_if(key->children.begin(), key->children.end(),
                                        [&](const Key& child) { return upper(child.name) == name; });
        key = found == key->children.end() ? nullptr : &*found;
    }
    return key;
}

const Value* find_value(const Key& key, const std::string& name) {
    const std::u16string wanted = upper(widen(name));
    for (const Value& value : key.values)
        if (upper(value.name) == wanted)
            return &value;
    return nullptr;
}

std::vector<FlatKey> flatten(const Hive& hive) {
    std::vector<FlatKey> list;
    if (!hive.sound_root)
        return list;
    std::vector<FlatKey> stack{{u"", &hive.root}};
    while (!stack.empty()) {
        const FlatKey flat = stack.back();
        stack.pop_back();
        list.push_back(flat);
        const std::vector<Key>& children = flat.key->children;
        for (auto child = children.rbegin(); child != children.rend(); ++child)
            stack.push_back({flat.path.empty() ? child->name : flat.path + u'\\' + child->name, &*child});
    }
    return list;
}

Totals count(const Hive& hive) {
    Totals totals;
    for (const FlatKey& flat : flatten(hive)) {
        totals.keys++;
        totals.values += flat.key->values.size();
        totals.wide_keys += flat.key->name_8bit ? 0 : 1;
    }
    return totals;
}

}  // namespace testkit
