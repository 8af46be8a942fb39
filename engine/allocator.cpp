// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "allocator.h"

#include <cstring>

namespace engine {

namespace {

constexpr int32_t append_growth = 32;
constexpr int seek_end = 2;

bool write_size(Store& store, int64_t position, int32_t size) {
    Le32 word;
    word = static_cast<uint32_t>(size);
    return write_at(store, sig_none, position, &word, sizeof word) == sizeof word;
}

// Changes the size word of a cell that counts. Half of one would break the bin, so it is put back when it fails.
bool change_size(Store& store, int64_t position, int32_t before, int32_t now) {
    Le32 old_word;
    Le32 word;
    old_word = static_cast<uint32_t>(before);
    word = static_cast<uint32_t>(now);
    return rewrite_at(store, position, &word, &old_word, sizeof word) == Outcome::written;
}

// Makes one free cell of a run that is whole bytes long, by the size word of its first.
bool join(Store& store, int64_t position, uint32_t first, uint32_t whole) {
    return first == whole || change_size(store, position, static_cast<int32_t>(first), static_cast<int32_t>(whole));
}

// The bin whose largest free cell is the smallest that will do, the earliest of equals.
const Bin* choose_bin(const Store& store, uint32_t size) {
    const Bin* best = nullptr;
    for (int32_t i = 0; i < store.bin_count; i++) {
        const Bin& bin = store.bins[i];
        if (bin.largest_free >= size && (best == nullptr || bin.largest_free < best->largest_free))
            best = &bin;
    }
    return best;
}

CellOffset find_free(Store& store, uint32_t size, uint32_t& found_size) {
    refresh_unread_bins(store);
    const Bin* bin = choose_bin(store, size);
    if (bin == nullptr)
        return CellOffset::none;
    const int64_t start = int64_t{base_block_size} + bin->offset;
    BinHeader header;
    if (read_at(store, sig_bin, start, &header, sizeof header) != sizeof header)
        return CellOffset::none;
    uint32_t best = 0;
    uint32_t walked = bin_header_size;
    while (walked < bin->size) {
        int32_t cell;
        uint32_t absolute;
        if (!read_size(store, start + walked, cell) || !is_cell_size(cell, bin->size - walked, absolute))
            return CellOffset::none;
        if (cell > 0 && absolute >= size && (best == 0 || absolute < found_size)) {
            best = walked;
            found_size = absolute;
        }
        walked += absolute;
    }
    return best == 0 ? CellOffset::none : cell_offset(bin->offset + best);
}

void set_checksum(BaseBlock& base) {
    uint8_t bytes[sizeof base];
    memcpy(bytes, &base, sizeof base);
    uint32_t sum = 0;
    for (size_t i = 0; i < offsetof(BaseBlock, checksum); i += sizeof(Le32)) {
        Le32 word;
        memcpy(&word, bytes + i, sizeof word);
        sum ^= word;
    }
    // Windows never stores these two.
    if (sum == 0xFFFFFFFF)
        sum = 0xFFFFFFFE;
    else if (sum == 0)
        sum = 1;
    base.checksum = sum;
}

// The file's length, at which the device then stands. Less than 0 on failure.
int64_t seek_end_of_file(Store& store) { return store.io.seek(store.io.device, 0, seek_end); }

// Makes the file reach to end, by zeros behind the length at which the device stands.
bool lengthen_file(Store& store, int64_t length, int64_t end) {
    constexpr uint32_t block_size = 512;
    const uint8_t zeros[block_size] = {};
    store.window.valid = false;
    for (int64_t reached = length; reached < end; reached += block_size) {
        if (store.io.write(store.io.device, zeros, block_size) != static_cast<int32_t>(block_size))
            return false;
    }
    return true;
}

bool lay_bin(Store& store, const Bin& bin) {
    const int64_t start = int64_t{base_block_size} + bin.offset;
    BinHeader header;
    header.signature = sig_bin;
    header.offset = bin.offset;
    header.size = bin.size;
    memset(header.reserved, 'x', sizeof header.reserved);  // tells a bin that was appended here; Windows has zeros
    header.spare = bin.size;
    return write_at(store, sig_bin, start, &header, sizeof header) == sizeof header &&
           write_size(store, start + bin_header_size, static_cast<int32_t>(bin.size - bin_header_size));
}

// Counts the bins' new size in the base block. True when the file says so afterwards, however the write ended.
bool count_in_base_block(Store& store, uint32_t bins_size) {
    BaseBlock before;
    if (read_at(store, sig_base, 0, &before, sizeof before) != sizeof before)
        return false;
    BaseBlock base = before;
    base.bins_size = bins_size;
    set_checksum(base);
    const Outcome outcome = rewrite_at(store, 0, &base, &before, sizeof base);
    if (outcome != Outcome::unknown)
        return outcome == Outcome::written;
    return read_at(store, sig_base, 0, &base, sizeof base) == sizeof base && base.bins_size == bins_size;
}

bool note_in_first_bin(Store& store, uint32_t bins_size) {
    BinHeader before;
    if (read_at(store, sig_bin, base_block_size, &before, sizeof before) != sizeof before)
        return false;
    BinHeader first = before;
    first.spare = bins_size;
    return rewrite_at(store, base_block_size, &first, &before, sizeof first) == Outcome::written;
}

// Appends a bin with one free cell of at least size bytes. The bin lies behind the last one, over whatever the file
// holds there. In turn, and what a stop after each leaves:
//   zeros behind the file's end, the bin's header, its free cell: bytes after the last bin, which mean nothing;
//   the base block: a hive with one more, empty bin;
//   the first bin's note of the size: the same, complete.
bool append_bin(Store& store, uint32_t size) {
    if (size > highest_end - 2 * bin_alignment)
        return false;
    const uint32_t bin_size = (size + bin_header_size + cell_head_size + bin_alignment - 1) & ~(bin_alignment - 1);
    const Bin bin = {static_cast<uint32_t>(store.bins_size), bin_size, bin_size - bin_header_size, false, true};
    const int64_t start = int64_t{base_block_size} + bin.offset;
    const int64_t end = start + bin.size;
    // Not where the file ends inside the bins, having been cut short: zeros would stand for what was lost there, and
    // the tables be made for what it merely claims.
    const int64_t length = seek_end_of_file(store);
    if (end > highest_end || length < start)
        return false;
    // Room in the tables comes before the bin: one that counts in the file but not in the table could be laid over.
    if (!reserve_bin(store, append_growth) || !reserve_cells(store, bin.offset + int64_t{bin.size}) ||
        !lengthen_file(store, length, end) || !lay_bin(store, bin))
        return false;
    const uint32_t bins_size = bin.offset + bin.size;
    if (!count_in_base_block(store, bins_size))
        return false;
    const bool noted = note_in_first_bin(store, bins_size);
    // The bin counts in the file now, so it must be in the table whatever became of the note.
    Bin& counted = store.bins[store.bin_count++];
    counted = bin;
    refresh_bin(store, counted);
    store.bins_size = static_cast<int32_t>(bins_size);
    return noted && counted.largest_free != 0;
}

}  // namespace

// Marks a free cell as used. In turn: the size word of what is split off (inside the free cell, unseen so far), then
// the cell's own. A stop between the two changes nothing that counts.
CellOffset allocate(Store& store, uint32_t n) {
    if (n > highest_end)
        return CellOffset::none;
    const uint32_t size = cell_size_for(n);
    uint32_t free_size = 0;
    CellOffset offset = find_free(store, size, free_size);
    if (offset == CellOffset::none) {
        if (!append_bin(store, size))
            return CellOffset::none;
        offset = find_free(store, size, free_size);
        if (offset == CellOffset::none)
            return CellOffset::none;
    }
    const uint32_t rest = free_size - size;  // a multiple of 8, as both sizes are
    if (rest != 0 && !write_size(store, cell_position(offset) + size, static_cast<int32_t>(rest)))
        return CellOffset::none;
    if (!change_size(store, cell_position(offset), static_cast<int32_t>(free_size), -static_cast<int32_t>(size)))
        return CellOffset::none;
    return offset;
}

// In turn: the cell's size word turned positive, then one word for every run of free cells, whose first takes the
// others in. The cells tile the bin after each.
bool free_cell(Store& store, CellOffset offset) {
    Cell cell;
    if (!find_used_cell(store, offset, cell))
        return false;
    Bin& held = *bin_of(store, offset);
    const HeldBin holder(store, held);
    const Bin bin = held;
    const auto size_word = static_cast<int32_t>(cell.size);
    if (!change_size(store, cell_position(offset), -size_word, size_word))
        return false;
    const int64_t start = int64_t{base_block_size} + bin.offset;
    uint32_t run = 0;  // where the present run of free cells began, 0 outside one
    uint32_t first = 0;
    uint32_t whole = 0;
    uint32_t walked = bin_header_size;
    while (walked < bin.size) {
        int32_t size;
        uint32_t absolute;
        if (!read_size(store, start + walked, size) || !is_cell_size(size, bin.size - walked, absolute))
            return false;
        if (size < 0) {
            if (run != 0 && !join(store, start + run, first, whole))
                return false;
            run = 0;
        } else if (run == 0) {
            run = walked;
            first = absolute;
            whole = absolute;
        } else {
            whole += absolute;
        }
        walked += absolute;
    }
    return run == 0 || join(store, start + run, first, whole);
}

}  // namespace engine
