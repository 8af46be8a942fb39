// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Breaks fields of records and mends what the gate looks at, so that an input gets past it: signature, size, bin
// headers and checksum.
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <random>

extern "C" size_t LLVMFuzzerMutate(uint8_t* data, size_t size, size_t max_size);

namespace {

constexpr size_t base_size = 4096;
constexpr size_t bin_step = 4096;

uint32_t get(const uint8_t* data, size_t at) {
    return static_cast<uint32_t>(data[at]) | static_cast<uint32_t>(data[at + 1]) << 8 |
           static_cast<uint32_t>(data[at + 2]) << 16 | static_cast<uint32_t>(data[at + 3]) << 24;
}

void put(uint8_t* data, size_t at, uint32_t n) {
    for (size_t i = 0; i < 4; i++)
        data[at + i] = static_cast<uint8_t>(n >> (8 * i));
}

// Puts a number that such fields go wrong with, or another record's offset, into a word of a random used cell.
void break_field(uint8_t* data, size_t size, std::mt19937& random) {
    static const uint32_t numbers[] = {0,      1,       2,          3,          7,          8,
                                       0xFFFF, 0x10000, 0x7FFFFFFF, 0x80000000, 0x80000004, 0xFFFFFFFF};
    if (size < base_size + 64)
        return;
    const size_t words = (size - base_size) / 4;
    const size_t at = base_size + 4 * (random() % words);
    switch (random() % 4) {
    case 0:
        put(data, at, numbers[random() % (sizeof numbers / sizeof numbers[0])]);
        break;
    case 1:
        put(data, at, static_cast<uint32_t>(8 * (random() % ((size - base_size) / 8))));
        break;
    case 2:
        put(data, at, get(data, at) + (random() % 2 == 0 ? 1U : 0xFFFFFFFFU));
        break;
    default:
        put(data, at, get(data, base_size + 4 * (random() % words)));
        break;
    }
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
