// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "hive_bytes.h"

#include <algorithm>

namespace testkit {
namespace {

constexpr uint32_t bin_header_bytes = 32;
constexpr uint32_t segment_bytes = 16344;

class Builder {
public:
    explicit Builder(const HiveLayout& layout) : layout_(layout) { hive_.bytes.assign(base_block_bytes, 0); }

    LaidHive build() {
        for (size_t i = 0; i < std::max<size_t>(layout_.security_records, 1); i++)
            hive_.security.push_back(add_cell(20 + 24));
        const uint32_t root = lay_key(layout_.root, "", none, true);
        write_security();
        close_bin();
        if (layout_.free_bytes != 0)
            add_free_bin(layout_.free_bytes);
        write_base(root);
        hive_.bytes.insert(hive_.bytes.end(), layout_.after_bins.begin(), layout_.after_bins.end());
        return std::move(hive_);
    }

private:
    uint32_t end() const { return static_cast<uint32_t>(hive_.bytes.size()) - base_block_bytes; }

    void open_bin(uint32_t size) {
        bin_ = end();
        bin_size_ = size;
        next_ = bin_ + bin_header_bytes;
        hive_.bytes.resize(hive_.bytes.size() + size, 0);
        const uint64_t at = base_block_bytes + uint64_t{bin_};
        set32(hive_.bytes, at, 0x6E696268);
        set32(hive_.bytes, at + 4, bin_);
        set32(hive_.bytes, at + 8, size);
    }
    // What is left of the bin becomes a free cell, or part of its last cell.
    void close_bin() {
        if (bin_size_ == 0 || next_ == bin_ + bin_size_)
            return;
        const uint32_t rest = bin_ + bin_size_ - next_;
        if (layout_.no_free_space && last_ != none)
            hive_.set_cell_size(last_, hive_.cell_size(last_) - static_cast<int32_t>(rest));
        else
            hive_.set_cell_size(next_, static_cast<int32_t>(rest));
        next_ = bin_ + bin_size_;
    }
    void add_free_bin(uint32_t n) {
        open_bin((n + bin_header_bytes + 4095) & ~4095U);
        last_ = none;
        close_bin();
    }
    // A zeroed cell in use for n bytes.
    uint32_t add_cell(size_t n) {
        const uint32_t size = (static_cast<uint32_t>(n) + 4 + 7) & ~7U;
        if (bin_size_ == 0 || bin_ + bin_size_ - next_ < size) {
            close_bin();
            open_bin(std::max(layout_.bin_size, (size + bin_header_bytes + 4095) & ~4095U));
        }
        last_ = next_;
        next_ += size;
        hive_.set_cell_size(last_, -static_cast<int32_t>(size));
        return last_;
    }
    void put_bytes(uint32_t cell, uint32_t field, const Bytes& data) {
        std::copy(data.begin(), data.end(),
                  hive_.bytes.begin() + static_cast<std::ptrdiff_t>(LaidHive::position(cell, field)));
    }
    static Bytes encode(const std::u16string& text, bool wide) {
        Bytes out;
        for (char16_t unit : text) {
            out.push_back(static_cast<uint8_t>(unit));
            if (wide)
                out.push_back(static_cast<uint8_t>(unit >> 8));
        }
        return out;
    }
    void sign(uint32_t cell, const char* signature) {
        put_bytes(cell, 0, {static_cast<uint8_t>(signature[0]), static_cast<uint8_t>(signature[1])});
    }

    uint32_t lay_key(const KeyLayout& key, const std::string& path, uint32_t parent, bool root) {
        KeyPlaces places;
        const Bytes name = encode(key.name, key.wide_name);
        const uint32_t cell = places.record = add_cell(76 + name.size());
        sign(cell, "nk");
        hive_.put16(cell, 2, static_cast<uint16_t>(key.flags | (key.wide_name ? 0 : 0x20) | (root ? 0x0C : 0)));
        hive_.put32(cell, 4, static_cast<uint32_t>(key.time));
        hive_.put32(cell, 8, static_cast<uint32_t>(key.time >> 32));
        hive_.put32(cell, 16, parent == none ? 0 : parent);
        hive_.put32(cell, 28, none);
        hive_.put32(cell, 32, none);
        hive_.put32(cell, 40, none);
        hive_.put32(cell, 44, hive_.security.at(key.security));
        hive_.put32(cell, 48, none);
        hive_.put16(cell, 72, static_cast<uint16_t>(name.size()));
        put_bytes(cell, 76, name);
        references_[key.security] += 1;
        lay_class(key, cell, places);
        lay_values(key, cell, places);
        lay_children(key, path, cell, places);
        hive_.keys[path] = places;
        return cell;
    }

    void lay_class(const KeyLayout& key, uint32_t cell, KeyPlaces& places) {
        if (key.class_name.empty())
            return;
        const Bytes text = encode(key.class_name, true);
        places.class_cell = add_cell(text.size());
        put_bytes(places.class_cell, 0, text);
        hive_.put32(cell, 48, places.class_cell);
        hive_.put16(cell, 74, static_cast<uint16_t>(text.size()));
    }

    void lay_values(const KeyLayout& key, uint32_t cell, KeyPlaces& places) {
        if (key.values.empty())
            return;
        uint32_t longest = 0;
        uint32_t largest = 0;
        places.value_list = add_cell(key.values.size() * 4);
        for (size_t i = 0; i < key.values.size(); i++) {
            const ValueLayout& value = key.values[i];
            places.values.push_back(lay_value(value));
            hive_.put32(places.value_list, static_cast<uint32_t>(i * 4), places.values.back().record);
            longest = std::max(longest, static_cast<uint32_t>(value.name.size() * 2));
            largest = std::max(largest, static_cast<uint32_t>(value.data.size()));
        }
        hive_.put32(cell, 36, static_cast<uint32_t>(key.values.size()));
        hive_.put32(cell, 40, places.value_list);
        hive_.put32(cell, 60, longest);
        hive_.put32(cell, 64, largest);
    }

    ValuePlaces lay_value(const ValueLayout& value) {
        ValuePlaces places;
        const Bytes name = encode(value.name, value.wide_name);
        const auto size = static_cast<uint32_t>(value.data.size());
        const bool is_inline = value.storage == Storage::fitting && size <= 4;
        places.record = add_cell(20 + name.size());
        sign(places.record, "vk");
        hive_.put16(places.record, 2, static_cast<uint16_t>(name.size()));
        hive_.put32(places.record, 4, is_inline ? size | 0x80000000 : size);
        hive_.put32(places.record, 12, value.type);
        hive_.put16(places.record, 16, value.wide_name || name.empty() ? 0 : 1);
        put_bytes(places.record, 20, name);
        if (is_inline) {
            put_bytes(places.record, 8, value.data);
            return places;
        }
        if (value.storage == Storage::big) {
            lay_segments(value.data, places);
        } else {
            places.data = add_cell(value.data.size());
            put_bytes(places.data, 0, value.data);
        }
        hive_.put32(places.record, 8, places.data);
        return places;
    }

    void lay_segments(const Bytes& data, ValuePlaces& places) {
        const size_t count = (data.size() + segment_bytes - 1) / segment_bytes;
        places.data = add_cell(8);
        places.segment_list = add_cell(count * 4);
        sign(places.data, "db");
        hive_.put16(places.data, 2, static_cast<uint16_t>(count));
        hive_.put32(places.data, 4, places.segment_list);
        for (size_t i = 0; i < count; i++) {
            const size_t first = i * segment_bytes;
            const size_t last = std::min<size_t>(data.size(), first + segment_bytes);
            // A segment's cell has 4 bytes more than it gives to the data.
            const uint32_t segment = add_cell(segment_bytes + 4);
            put_bytes(segment, 0,
                      Bytes(data.begin() + static_cast<std::ptrdiff_t>(first),
                            data.begin() + static_cast<std::ptrdiff_t>(last)));
            hive_.put32(places.segment_list, static_cast<uint32_t>(i * 4), segment);
            places.segments.push_back(segment);
        }
    }

    void lay_children(const KeyLayout& key, const std::string& path, uint32_t cell, KeyPlaces& places) {
        if (key.children.empty())
            return;
        std::vector<const KeyLayout*> order;
        for (const KeyLayout& child : key.children)
            order.push_back(&child);
        if (key.sorted)
            std::stable_sort(order.begin(), order.end(),
                             [](const KeyLayout* a, const KeyLayout* b) { return upper(a->name) < upper(b->name); });
        const Leaf kind = key.own_leaf ? key.leaf : layout_.leaf;
        const size_t per_leaf = key.per_leaf == 0 ? order.size() : key.per_leaf;
        std::vector<uint32_t> offsets;
        uint32_t longest = 0;
        for (const KeyLayout* child : order) {
            const std::string child_path = path.empty() ? utf8(child->name) : path + "\\" + utf8(child->name);
            offsets.push_back(lay_key(*child, child_path, cell, false));
            longest = std::max(longest, static_cast<uint32_t>(child->name.size() * 2));
        }
        for (size_t first = 0; first < order.size(); first += per_leaf)
            places.leaves.push_back(lay_leaf(kind, order, offsets, first, std::min(order.size(), first + per_leaf)));
        places.index = key.per_leaf == 0 ? places.leaves.front() : lay_index_root(places.leaves);
        hive_.put32(cell, 20, static_cast<uint32_t>(order.size()));
        hive_.put32(cell, 28, places.index);
        hive_.put32(cell, 52, longest);
    }

    uint32_t lay_leaf(Leaf kind, const std::vector<const KeyLayout*>& keys, const std::vector<uint32_t>& offsets,
                      size_t first, size_t last) {
        const uint32_t width = kind == Leaf::plain ? 4 : 8;
        const uint32_t leaf = add_cell(4 + (last - first) * width);
        sign(leaf, kind == Leaf::plain ? "li" : kind == Leaf::hash ? "lh" : "lf");
        hive_.put16(leaf, 2, static_cast<uint16_t>(last - first));
        for (size_t i = first; i < last; i++) {
            const uint32_t field = 4 + static_cast<uint32_t>(i - first) * width;
            hive_.put32(leaf, field, offsets[i]);
            if (kind == Leaf::hash)
                hive_.put32(leaf, field + 4, hash(*keys[i]));
            if (kind == Leaf::fast) {
                Bytes hint = encode(keys[i]->name, keys[i]->wide_name);
                hint.resize(4);
                put_bytes(leaf, field + 4, hint);
            }
        }
        return leaf;
    }
    static uint32_t hash(const KeyLayout& key) {
        uint32_t sum = 0;
        for (char16_t unit : upper(key.name)) {
            const bool negative = !key.wide_name && unit > 0x7F;
            sum = sum * 37 + (negative ? unit | 0xFFFFFF00U : unit);
        }
        return sum;
    }
    uint32_t lay_index_root(const std::vector<uint32_t>& leaves) {
        const uint32_t root = add_cell(4 + leaves.size() * 4);
        sign(root, "ri");
        hive_.put16(root, 2, static_cast<uint16_t>(leaves.size()));
        for (size_t i = 0; i < leaves.size(); i++)
            hive_.put32(root, 4 + static_cast<uint32_t>(i * 4), leaves[i]);
        return root;
    }

    void write_security() {
        const size_t count = hive_.security.size();
        for (size_t i = 0; i < count; i++) {
            const uint32_t cell = hive_.security[i];
            sign(cell, "sk");
            hive_.put32(cell, 4, hive_.security[(i + 1) % count]);
            hive_.put32(cell, 8, hive_.security[(i + count - 1) % count]);
            hive_.put32(cell, 12, references_[i]);
            hive_.put32(cell, 16, 24);
            put_bytes(cell, 20, {1, 0, 4, 0x80});
        }
    }
    void write_base(uint32_t root) {
        Bytes& bytes = hive_.bytes;
        const uint32_t words[][2] = {{0, 0x66676572},
                                     {4, layout_.first_sequence},
                                     {8, layout_.second_sequence},
                                     {20, 1},
                                     {24, 3},
                                     {32, 1},
                                     {36, root},
                                     {40, end()},
                                     {44, 1}};
        for (const auto& word : words)
            set32(bytes, word[0], word[1]);
        hive_.fix_checksum();
    }

    const HiveLayout& layout_;
    LaidHive hive_;
    uint32_t bin_ = 0;
    uint32_t bin_size_ = 0;
    uint32_t next_ = 0;     // where the next cell goes
    uint32_t last_ = none;  // the cell laid last
    std::map<size_t, uint32_t> references_;
};

}  // namespace

KeyLayout& KeyLayout::add(const std::string& child_name) {
    children.emplace_back();
    children.back().name = widen(child_name);
    return children.back();
}

ValueLayout& KeyLayout::set(const std::string& value_name, uint32_t value_type, const Bytes& value_data) {
    values.emplace_back();
    values.back().name = widen(value_name);
    values.back().type = value_type;
    values.back().data = value_data;
    return values.back();
}

LaidHive lay_out(const HiveLayout& layout) { return Builder(layout).build(); }

Bytes text_data(const std::string& text) {
    Bytes data;
    for (char16_t unit : widen(text) + u'\0') {
        data.push_back(static_cast<uint8_t>(unit));
        data.push_back(static_cast<uint8_t>(unit >> 8));
    }
    return data;
}

Bytes pattern(size_t n, uint8_t seed) {
    Bytes data(n);
    for (size_t i = 0; i < n; i++)
        data[i] = static_cast<uint8_t>(seed + i * 7 + i / 256);
    return data;
}

}  // namespace testkit
