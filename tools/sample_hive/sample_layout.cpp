// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
// Lays a tree of keys and values out as the bytes of a hive file.

#include "sample_layout.h"

#include <algorithm>
#include <array>
#include <cstddef>
#include <utility>

namespace {

using Bytes = std::vector<std::uint8_t>;

constexpr std::size_t base_block_size = 4096;
constexpr std::size_t bin_unit = 4096;
constexpr std::size_t bin_header_size = 32;
constexpr std::size_t segment_size = 16344;
constexpr std::uint32_t none = 0xFFFFFFFF;
constexpr std::uint64_t written_at = 0x01D9'0000'0000'0000;  // one fixed time, so that each sample is the same

constexpr std::uint16_t flag_root = 0x000C;  // the root, which cannot be deleted
constexpr std::uint16_t flag_name_8_bit = 0x0020;

void put16(Bytes& bytes, std::size_t at, std::uint16_t number) {
    bytes[at] = static_cast<std::uint8_t>(number);
    bytes[at + 1] = static_cast<std::uint8_t>(number >> 8);
}

void put32(Bytes& bytes, std::size_t at, std::uint32_t number) {
    put16(bytes, at, static_cast<std::uint16_t>(number));
    put16(bytes, at + 2, static_cast<std::uint16_t>(number >> 16));
}

void put64(Bytes& bytes, std::size_t at, std::uint64_t number) {
    put32(bytes, at, static_cast<std::uint32_t>(number));
    put32(bytes, at + 4, static_cast<std::uint32_t>(number >> 32));
}

void put_signature(Bytes& bytes, std::size_t at, const char* signature) {
    for (; *signature != 0; ++signature) {
        bytes[at++] = static_cast<std::uint8_t>(*signature);
    }
}

void put_bytes(Bytes& bytes, std::size_t at, const Bytes& source) {
    std::copy(source.begin(), source.end(), bytes.begin() + static_cast<std::ptrdiff_t>(at));
}

Bytes utf16(const std::u16string& text) {
    Bytes bytes(text.size() * 2);
    for (std::size_t i = 0; i < text.size(); ++i) {
        put16(bytes, i * 2, static_cast<std::uint16_t>(text[i]));
    }
    return bytes;
}

bool fits_8_bits(const std::u16string& text) {
    return std::all_of(text.begin(), text.end(), [](char16_t unit) { return unit <= 0xFF; });
}

// The name as it is stored: 8 bits a character where they suffice.
Bytes stored_name(const std::u16string& name) {
    return fits_8_bits(name) ? Bytes(name.begin(), name.end()) : utf16(name);
}

// Latin letters of the first 256 characters: the sample's other names have no lower case.
char16_t upper(char16_t unit) {
    const bool lower = (unit >= u'a' && unit <= u'z') || (unit >= 0xE0 && unit <= 0xFE && unit != 0xF7);
    return lower ? static_cast<char16_t>(unit - 0x20) : unit;
}

std::u16string upper(std::u16string text) {
    std::transform(text.begin(), text.end(), text.begin(), [](char16_t unit) { return upper(unit); });
    return text;
}

// Cells laid one after another into bins; a cell that does not fit the open bin starts the next one.
class Cells {
public:
    // The offset of a new cell for a record of this size, all zero.
    std::uint32_t allocate(std::size_t record_size) {
        const std::size_t size = (record_size + 4 + 7) / 8 * 8;
        if (bin_end - next < size) {
            open_bin(size);
        }
        const std::size_t cell = next;
        put32(bytes, cell, 0u - static_cast<std::uint32_t>(size));
        next += size;
        return static_cast<std::uint32_t>(cell);
    }

    std::uint32_t add(const Bytes& record) {
        const std::uint32_t cell = allocate(record.size());
        put_bytes(bytes, cell + 4, record);
        return cell;
    }

    void set32(std::uint32_t cell, std::size_t field, std::uint32_t number) { put32(bytes, cell + 4 + field, number); }

    // Every bin, the last one closed.
    Bytes finish() {
        close_bin();
        return std::move(bytes);
    }

private:
    void close_bin() {
        if (next < bin_end) {
            put32(bytes, next, static_cast<std::uint32_t>(bin_end - next));  // positive: free
        }
        next = bin_end;
    }

    void open_bin(std::size_t cell_size) {
        close_bin();
        const std::size_t start = bin_end;
        const std::size_t size = (cell_size + bin_header_size + bin_unit - 1) / bin_unit * bin_unit;
        bin_end = start + size;
        bytes.resize(bin_end);
        put_signature(bytes, start, "hbin");
        put32(bytes, start + 4, static_cast<std::uint32_t>(start));
        put32(bytes, start + 8, static_cast<std::uint32_t>(size));
        put64(bytes, start + 20, start == 0 ? written_at : 0);
        next = start + bin_header_size;
    }

    Bytes bytes;
    std::size_t next = 0;
    std::size_t bin_end = 0;
};

// Owner and group are the administrators; they may do everything, everybody else nothing.
Bytes security_descriptor() {
    const Bytes administrators = {1, 2, 0, 0, 0, 0, 0, 5, 0x20, 0, 0, 0, 0x20, 2, 0, 0};
    Bytes descriptor(20 + 2 * administrators.size() + 8 + 8 + administrators.size());
    descriptor[0] = 1;
    put16(descriptor, 2, 0x8004);  // self-relative, with an access list
    put32(descriptor, 4, 20);
    put32(descriptor, 8, 36);
    put32(descriptor, 16, 52);
    put_bytes(descriptor, 20, administrators);
    put_bytes(descriptor, 36, administrators);
    descriptor[52] = 2;
    put16(descriptor, 54, static_cast<std::uint16_t>(8 + 8 + administrators.size()));
    put16(descriptor, 56, 1);
    descriptor[61] = 2;  // inherited by subkeys
    put16(descriptor, 62, static_cast<std::uint16_t>(8 + administrators.size()));
    put32(descriptor, 64, 0x000F003F);  // full access to a key
    put_bytes(descriptor, 68, administrators);
    return descriptor;
}

class SampleLayout {
public:
    Bytes lay_out(SampleKey& root, const std::u16string& file_name) {
        // The root's record stands first, as its offset is what the base block leads to.
        const std::uint32_t root_cell = cells.allocate(76 + stored_name(root.name).size());
        const Bytes descriptor = security_descriptor();
        security = cells.allocate(20 + descriptor.size());
        fill_key(root, root_cell, none, flag_root);
        fill_security(descriptor);
        Bytes bins = cells.finish();
        patch(bins);
        return with_base_block(bins, root_cell, file_name);
    }

private:
    struct Record {
        std::uint32_t cell;
        Bytes bytes;
    };

    void fill_key(SampleKey& key, std::uint32_t cell, std::uint32_t parent, std::uint16_t flags) {
        ++key_count;
        const Bytes name = stored_name(key.name);
        Bytes record(76 + name.size());
        put_signature(record, 0, "nk");
        put16(record, 2, static_cast<std::uint16_t>(flags | (fits_8_bits(key.name) ? flag_name_8_bit : 0)));
        put64(record, 4, written_at);
        put32(record, 16, parent);
        put32(record, 20, static_cast<std::uint32_t>(key.subkeys.size()));
        put32(record, 28, none);
        put32(record, 32, none);
        put32(record, 36, static_cast<std::uint32_t>(key.values.size()));
        put32(record, 40, none);
        put32(record, 44, security);
        put32(record, 48, none);
        if (!key.class_name.empty()) {
            const Bytes class_name = utf16(key.class_name);
            put32(record, 48, cells.add(class_name));
            put16(record, 74, static_cast<std::uint16_t>(class_name.size()));
        }
        put16(record, 72, static_cast<std::uint16_t>(name.size()));
        put_bytes(record, 76, name);
        add_values(key, record);
        add_subkeys(key, cell, record);
        records.push_back({cell, record});
    }

    void add_values(const SampleKey& key, Bytes& record) {
        if (key.values.empty()) {
            return;
        }
        Bytes list(key.values.size() * 4);
        std::size_t longest_name = 0;
        std::size_t largest_data = 0;
        for (std::size_t i = 0; i < key.values.size(); ++i) {
            put32(list, i * 4, add_value(key.values[i]));
            longest_name = std::max(longest_name, key.values[i].name.size() * 2);
            largest_data = std::max(largest_data, key.values[i].data.size());
        }
        put32(record, 40, cells.add(list));
        put32(record, 60, static_cast<std::uint32_t>(longest_name));
        put32(record, 64, static_cast<std::uint32_t>(largest_data));
    }

    std::uint32_t add_value(const SampleValue& value) {
        const Bytes name(value.name.begin(), value.name.end());
        Bytes record(20 + name.size());
        put_signature(record, 0, "vk");
        put16(record, 2, static_cast<std::uint16_t>(name.size()));
        put32(record, 12, value.type);
        put16(record, 16, name.empty() ? 0 : 1);
        put_bytes(record, 20, name);
        const auto size = static_cast<std::uint32_t>(value.data.size());
        if (size <= 4) {
            put32(record, 4, size | 0x80000000);
            put_bytes(record, 8, value.data);
        } else {
            put32(record, 4, size);
            put32(record, 8, size > segment_size ? add_big_data(value.data) : cells.add(value.data));
        }
        return cells.add(record);
    }

    std::uint32_t add_big_data(const Bytes& data) {
        const std::size_t count = (data.size() + segment_size - 1) / segment_size;
        Bytes list(count * 4);
        for (std::size_t i = 0; i < count; ++i) {
            const auto first = data.begin() + static_cast<std::ptrdiff_t>(i * segment_size);
            const auto length = std::min(segment_size, data.size() - i * segment_size);
            put32(list, i * 4, cells.add(Bytes(first, first + static_cast<std::ptrdiff_t>(length))));
        }
        Bytes record(8);
        put_signature(record, 0, "db");
        put16(record, 2, static_cast<std::uint16_t>(count));
        put32(record, 4, cells.add(list));
        return cells.add(record);
    }

    void add_subkeys(SampleKey& key, std::uint32_t cell, Bytes& record) {
        if (key.subkeys.empty()) {
            return;
        }
        std::sort(key.subkeys.begin(), key.subkeys.end(),
                  [](const SampleKey& a, const SampleKey& b) { return upper(a.name) < upper(b.name); });
        Bytes leaf(4 + key.subkeys.size() * 8);
        put_signature(leaf, 0, "lh");
        put16(leaf, 2, static_cast<std::uint16_t>(key.subkeys.size()));
        std::size_t longest_name = 0;
        for (std::size_t i = 0; i < key.subkeys.size(); ++i) {
            SampleKey& subkey = key.subkeys[i];
            const std::uint32_t subkey_cell = cells.allocate(76 + stored_name(subkey.name).size());
            fill_key(subkey, subkey_cell, cell, 0);
            put32(leaf, 4 + i * 8, subkey_cell);
            put32(leaf, 8 + i * 8, name_hash(subkey.name));
            longest_name = std::max(longest_name, subkey.name.size() * 2);
        }
        put32(record, 28, cells.add(leaf));
        put32(record, 52, static_cast<std::uint32_t>(longest_name));
    }

    static std::uint32_t name_hash(const std::u16string& name) {
        std::uint32_t hash = 0;
        for (const char16_t unit : name) {
            hash = hash * 37 + upper(unit);
        }
        return hash;
    }

    void fill_security(const Bytes& descriptor) {
        Bytes record(20 + descriptor.size());
        put_signature(record, 0, "sk");
        put32(record, 4, security);  // the one record of its ring
        put32(record, 8, security);
        put32(record, 12, key_count);
        put32(record, 16, static_cast<std::uint32_t>(descriptor.size()));
        put_bytes(record, 20, descriptor);
        records.push_back({security, record});
    }

    void patch(Bytes& bins) const {
        for (const Record& record : records) {
            put_bytes(bins, record.cell + 4, record.bytes);
        }
    }

    static Bytes with_base_block(const Bytes& bins, std::uint32_t root_cell, const std::u16string& file_name) {
        Bytes file(base_block_size + bins.size());
        put_signature(file, 0, "regf");
        put32(file, 4, 1);  // both sequence numbers: nothing is waiting in a log
        put32(file, 8, 1);
        put64(file, 12, written_at);
        put32(file, 20, 1);  // version 1.5, the first with data in segments
        put32(file, 24, 5);
        put32(file, 32, 1);
        put32(file, 36, root_cell);
        put32(file, 40, static_cast<std::uint32_t>(bins.size()));
        put32(file, 44, 1);
        put_bytes(file, 48, utf16(file_name.substr(0, 31)));
        std::uint32_t checksum = 0;
        for (std::size_t at = 0; at < 508; at += 4) {
            checksum ^= static_cast<std::uint32_t>(file[at]) | static_cast<std::uint32_t>(file[at + 1]) << 8 |
                        static_cast<std::uint32_t>(file[at + 2]) << 16 | static_cast<std::uint32_t>(file[at + 3]) << 24;
        }
        put32(file, 508, checksum == none ? none - 1 : checksum == 0 ? 1 : checksum);
        put_bytes(file, base_block_size, bins);
        return file;
    }

    Cells cells;
    std::vector<Record> records;  // key and security records, written once everything that they lead to has its place
    std::uint32_t security = none;
    std::uint32_t key_count = 0;
};

}  // namespace

SampleKey& SampleKey::add(std::u16string subkey_name) {
    return subkeys.emplace_back(SampleKey{std::move(subkey_name), {}, {}, {}});
}

SampleKey& SampleKey::set(std::string value_name, std::uint32_t type, std::vector<std::uint8_t> data) {
    values.push_back({std::move(value_name), type, std::move(data)});
    return *this;
}

SampleKey& SampleKey::set_text(std::string value_name, const std::u16string& text, std::uint32_t type) {
    return set(std::move(value_name), type, utf16(text + u'\0'));
}

SampleKey& SampleKey::set_texts(std::string value_name, const std::vector<std::u16string>& texts) {
    std::u16string joined;
    for (const std::u16string& text : texts) {
        joined += text + u'\0';
    }
    return set(std::move(value_name), 7, utf16(joined + u'\0'));
}

SampleKey& SampleKey::set_dword(std::string value_name, std::uint32_t number) {
    Bytes data(4);
    put32(data, 0, number);
    return set(std::move(value_name), 4, data);
}

SampleKey& SampleKey::set_qword(std::string value_name, std::uint64_t number) {
    Bytes data(8);
    put64(data, 0, number);
    return set(std::move(value_name), 11, data);
}

std::vector<std::uint8_t> lay_out_hive(SampleKey root, const std::u16string& file_name) {
    return SampleLayout().lay_out(root, file_name);
}
