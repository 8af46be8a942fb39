// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// One open hive: the caller's callbacks, the table of bins and the read window. Reading and writing go through it, but
// for the signature that is asked about first and the zeros that lengthen the file.
#pragma once

#include "format.h"

#include <tallowfen/registry.h>

#include <cstring>

namespace engine {

constexpr uint32_t window_size = 16384;
constexpr uint32_t window_alignment = 4096;

// The highest position that a hive's bins may end at: positions are signed 32-bit numbers in the callbacks.
constexpr int64_t highest_end = 0x7FFFF000;

struct Bin {
    uint32_t offset;        // from the first bin
    uint32_t size;          // bytes, header included
    uint32_t largest_free;  // size of the largest free cell, 0 when there is none
    bool unread;            // the last walk failed; it counts as full until one succeeds
    bool mapped;            // its cells are in the cell map
};

struct ReadWindow {
    bool valid;
    int64_t start;    // position in the file, a multiple of 4096
    uint32_t length;  // bytes that the last load delivered
    uint8_t* bytes;   // 16 KiB
};

constexpr uint32_t store_writes_fast_leaves = 2;

struct Store {
    RegistryIo io;
    int32_t bin_count;
    int32_t bin_capacity;
    int32_t bins_size;  // bytes of all bins
    Bin* bins;          // in the order of the file
    CellOffset root;
    CellOffset root_index;
    uint32_t flags;
    int32_t unused;  // -1 from the open on
    int32_t open_handles;
    ReadWindow window;
    // One bit for every 8 bytes of the bins, set where the walk over a bin came by a cell. What lies elsewhere is no
    // cell, however it looks: it is part of one, and goes with it. A bin's share is filled when the bin is first asked
    // for a cell or written to, and follows every write from then on.
    uint8_t* cell_map;
    uint32_t cell_map_size;  // bytes

    const Bin* held_bin;  // not walked again after a write, see HeldBin; mostly null
    int32_t unread_bins;  // how many bins are unread
    // Raised when the device fails, or memory for a name to compare runs out: it tells what could not be read from what
    // is not there.
    uint32_t failed_reads;
    int32_t recent_bin;   // where the last look-up of a cell ended: the next is mostly near
    uint32_t generation;  // raised by every write, so that what was derived from the file can be known for stale
    // The key whose index was last found to be in upper-cased order throughout; none when unknown. Its insertions keep
    // it so. While it holds, a name that a binary search misses is not there, and no scan has to prove it.
    CellOffset sorted_key;
};

// A cell that lies wholly inside one bin.
struct Cell {
    CellOffset offset;
    uint32_t size;  // bytes, size word included
    bool used;

    uint32_t room() const { return size - cell_head_size; }
};

// Opens the store behind io: null when the hive cannot be relied on or memory ran out. Frees what it made.
Store* open_store(const RegistryIo& io);
// Frees the store. Nothing is written.
void free_store(Store* store);

inline bool is_read_only(const Store& store) { return store.io.write == nullptr; }
inline uint32_t leaf_signature(const Store& store) {
    return (store.flags & store_writes_fast_leaves) != 0 ? sig_fast_leaf : sig_hash_leaf;
}

// Reads up to length bytes at a position of the file; returns how many were delivered, 0 on failure or when the bytes
// do not begin with the signature (sig_none: any). A read that cannot lie in one window goes past it and has no
// signature checked.
uint32_t read_at(Store& store, uint32_t signature, int64_t position, void* buffer, uint32_t length);
// Writes length bytes through to the file; returns how many, 0 on failure. The buffer must begin with the signature. A
// key or value record is written with its proper length: one byte more is dropped, more than that is refused.
uint32_t write_at(Store& store, uint32_t signature, int64_t position, const void* buffer, uint32_t length);

// What became of bytes that were to change: they did, they are as before, or nobody knows.
enum class Outcome { written, unchanged, unknown };

// Writes now over before, which is what the file holds there. A write that fails is undone as far as the device lets
// it, so that a caller knows whether what the bytes refer to may be freed.
Outcome rewrite_at(Store& store, int64_t position, const void* now, const void* before, uint32_t length);

// The absolute value of the cell's size word, -1 when it cannot be read or is no multiple of 8.
int32_t cell_length(Store& store, CellOffset offset);
// Looks up the cell at an offset: false unless the walk over its bin's cells, from the first, comes by it.
bool find_cell(Store& store, CellOffset offset, Cell& cell);
// The same for a cell that is in use.
bool find_used_cell(Store& store, CellOffset offset, Cell& cell);
// Whether it is a cell in use: only then may it be written to, freed or replaced.
bool is_used_cell(Store& store, CellOffset offset);

// Reads up to length bytes of the record in a cell in use, never past its end; returns how many, 0 on failure or when
// the bytes do not begin with the signature (sig_none: any).
uint32_t read_record(Store& store, uint32_t signature, CellOffset offset, void* buffer, uint32_t length);
// Reads exactly length bytes, skip bytes into the cell's record.
bool read_part(Store& store, const Cell& cell, uint32_t skip, void* buffer, uint32_t length);

// Finds the bin that holds an offset, its header included; null when none does.
Bin* bin_of(Store& store, CellOffset offset);
// Reads the bin's header and walks its cells; fills bin, and with map the bin's share of the cell map. Returns the end
// of the walk, counted from the first bin, or -1; the map has then changed as far as the walk came.
int64_t scan_bin(Store& store, uint32_t bin_offset, Bin& bin, bool map);
// Reads one size word: false when it cannot be read. The walk over a bin's cells steps with it, so the common case, a
// word inside the window, is kept short.
inline bool read_size(Store& store, int64_t position, int32_t& size) {
    const ReadWindow& window = store.window;
    const int64_t skip = position - window.start;
    Le32 word;
    if (window.valid && skip >= 0 && skip + int64_t{sizeof word} <= window.length)
        memcpy(&word, window.bytes + skip, sizeof word);
    else if (read_at(store, sig_none, position, &word, sizeof word) != sizeof word)
        return false;
    size = static_cast<int32_t>(static_cast<uint32_t>(word));
    return true;
}

// Whether a size word can be a cell's of at most room bytes; gives its absolute value.
inline bool is_cell_size(int32_t size, uint32_t room, uint32_t& absolute) {
    absolute = size < 0 ? 0U - static_cast<uint32_t>(size) : static_cast<uint32_t>(size);
    return absolute != 0 && absolute % cell_alignment == 0 && absolute <= room;
}

// Fills the bin's share of the cell map. Where the walk stops short, the next call tries again.
void map_bin(Store& store, Bin& bin);
// Walks a bin afresh: its largest free cell and, if it has one by now, its share of the cell map. A bin that cannot be
// walked offers nothing to the allocator.
void refresh_bin(Store& store, Bin& bin);
// The same for the bins that could not be walked the last time.
void refresh_unread_bins(Store& store);
// While it lives, writes do not walk that bin afresh; its end does, once. For one change of many size words, none of
// which is asked for in between. No bin may be added meanwhile.
class HeldBin {
public:
    HeldBin(Store& store, Bin& bin) : store_(store), bin_(bin) { store.held_bin = &bin; }
    HeldBin(const HeldBin&) = delete;
    HeldBin& operator=(const HeldBin&) = delete;
    ~HeldBin() {
        store_.held_bin = nullptr;
        refresh_bin(store_, bin_);
    }

private:
    Store& store_;
    Bin& bin_;
};

// Makes room for one more entry in the bin table; false when memory ran out, the table then being as before.
bool reserve_bin(Store& store, int32_t growth);
// Makes room for the cells of bins up to an offset; false when memory ran out.
bool reserve_cells(Store& store, int64_t end);

}  // namespace engine
