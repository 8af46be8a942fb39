// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Breaks fields of records and mends what an input is turned away for: signature, size and bin headers, which the
// engine wants, and the checksum, which the checker does.
#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <random>
#include <vector>

extern "C" size_t LLVMFuzzerMutate(uint8_t* data, size_t size, size_t max_size);

namespace {

constexpr size_t base_size = 4096;
constexpr size_t bin_step = 4096;
constexpr size_t bin_header = 32;

uint32_t get(const uint8_t* data, size_t at, size_t bytes = 4) {
    uint32_t n = 0;
    for (size_t i = 0; i < bytes; i++)
        n |= static_cast<uint32_t>(data[at + i]) << (8 * i);
    return n;
}

void put(uint8_t* data, size_t at, uint32_t n, size_t bytes = 4) {
    for (size_t i = 0; i < bytes; i++)
        data[at + i] = static_cast<uint8_t>(n >> (8 * i));
}

struct Field {
    size_t at;
    size_t bytes;  // 2 or 4
};

// A field of a record, at random: any 2 or 4 bytes of a used cell, but not its size; now and then the root key's
// offset. Where no used cell is found, any of the file behind the base block.
Field choose_field(const uint8_t* data, size_t size, std::mt19937& random) {
    constexpr size_t root_offset = 36;
    const size_t width = random() % 2 == 0 ? 4 : 2;
    if (random() % 64 == 0)
        return {root_offset, 4};
    std::vector<Field> cells;  // what a used cell holds, and how much
    size_t bin_end = base_size;
    for (size_t at = base_size; at + bin_header < size;) {
        if (at >= bin_end) {
            bin_end = at + get(data, at + 8);
            at += bin_header;
            continue;
        }
        const auto head = static_cast<int32_t>(get(data, at));
        const auto length = static_cast<size_t>(std::abs(int64_t{head}));
        if (length < 8 || length > size - at)
            break;
        if (head < 0)
            cells.push_back({at + 4, length - 4});
        at += length;
    }
    if (cells.empty())
        return {base_size + width * (random() % ((size - base_size) / width)), width};
    const Field cell = cells[random() % cells.size()];
    return {cell.at + width * (random() % (cell.bytes / width)), width};
}

// Puts a number that such fields go wrong with, or another record's offset, into a field.
void break_field(uint8_t* data, size_t size, std::mt19937& random) {
    static const uint32_t numbers[] = {0,      1,       2,          3,          7,          8,
                                       0xFFFF, 0x10000, 0x7FFFFFFF, 0x80000000, 0x80000004, 0xFFFFFFFF};
    if (size < base_size + 64)
        return;
    const Field field = choose_field(data, size, random);
    uint32_t number = 0;
    switch (random() % 4) {
    case 0:
        number = numbers[random() % (sizeof numbers / sizeof numbers[0])];
        break;
    case 1:
        number = static_cast<uint32_t>(8 * (random() % ((size - base_size) / 8)));
        break;
    case 2:
        number = get(data, field.at, field.bytes) + (random() % 2 == 0 ? 1U : 0xFFFFFFFFU);
        break;
    default: {
        const Field other = choose_field(data, size, random);
        number = get(data, other.at, other.bytes);
        break;
    }
    }
    put(data, field.at, number, field.bytes);
}

void mend(uint8_t* data, size_t size) {
    if (size < base_size + bin_step)
        return;
    memcpy(data, "regf", 4);
    size_t bin = 0;
    while (base_size + bin + bin_step <= size) {
        uint8_t* header = data + base_size + bin;
        uint32_t bin_size = get(header, 8);
        if (bin_size == 0 || bin_size % bin_step != 0 || bin_size > size - base_size - bin)
            bin_size = bin_step;
        memcpy(header, "hbin", 4);
        put(header, 4, static_cast<uint32_t>(bin));
        put(header, 8, bin_size);
        bin += bin_size;
    }
    put(data, 40, static_cast<uint32_t>(bin));
    uint32_t sum = 0;
    for (size_t i = 0; i < 508; i += 4)
        sum ^= get(data, i);
    put(data, 508, sum == 0xFFFFFFFF ? 0xFFFFFFFE : sum == 0 ? 1 : sum);
}

}  // namespace

extern "C" size_t LLVMFuzzerCustomMutator(uint8_t* data, size_t size, size_t max_size, unsigned int seed) {
    std::mt19937 random(seed);
    if (random() % 8 == 0)
        size = LLVMFuzzerMutate(data, size, max_size);
    else
        for (unsigned int n = 1 + static_cast<unsigned int>(random()) % 3; n > 0; n--)
            break_field(data, size, random);
    if (random() % 16 != 0)
        mend(data, size);
    return size;
}
