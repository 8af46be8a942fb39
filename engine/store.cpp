// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "store.h"

#include <cstdlib>
#include <cstring>

namespace engine {

namespace {

constexpr int32_t first_capacity = 256;
constexpr int32_t open_growth = 64;
constexpr int seek_start = 0;
constexpr int seek_end = 2;
constexpr uint32_t bits = 8;

bool seek_to(const Store& store, int64_t position) {
    if (position < 0 || position > INT32_MAX)
        return false;
    const auto wanted = static_cast<int32_t>(position);
    return store.io.seek(store.io.device, wanted, seek_start) == wanted;
}

// Reads at a position, past the window. A device may deliver the bytes in several pieces; one that claims more than was
// asked for is not believed.
uint32_t read_through(Store& store, int64_t position, void* buffer, uint32_t length) {
    if (length > INT32_MAX)
        return 0;
    if (!seek_to(store, position)) {
        store.failed_reads++;
        return 0;
    }
    uint32_t done = 0;
    while (done < length) {
        const uint32_t rest = length - done;
        const int32_t count =
            store.io.read(store.io.device, static_cast<uint8_t*>(buffer) + done, static_cast<int32_t>(rest));
        if (count < 0 || static_cast<uint32_t>(count) > rest) {
            store.failed_reads++;
            return 0;
        }
        if (count == 0)  // the file's end
            break;
        done += static_cast<uint32_t>(count);
    }
    return done;
}

bool load_window(Store& store, int64_t position) {
    ReadWindow& window = store.window;
    window.valid = false;
    window.start = position - position % window_alignment;
    window.length = read_through(store, window.start, window.bytes, window_size);
    // A window whose load failed is not used again: what it holds is not the file's.
    window.valid = window.length > 0;
    return position - window.start < window.length;
}

bool window_serves(const ReadWindow& window, int64_t position, uint32_t length) {
    return window.valid && position >= window.start && position + length <= window.start + window.length;
}

bool begins_with(uint32_t signature, const void* buffer, uint32_t length) {
    if (signature > largest_short_signature) {
        Le32 word;
        if (length < sizeof word)
            return false;
        memcpy(&word, buffer, sizeof word);
        return word == signature;
    }
    Le16 word;
    if (length < sizeof word)
        return false;
    memcpy(&word, buffer, sizeof word);
    return word == signature;
}

// The length that a record has by its own name length; 0 for records without one and for a mere part of one.
uint32_t proper_length(uint32_t signature, const void* buffer, uint32_t length) {
    if (signature == sig_value && length >= sizeof(ValueRecord)) {
        ValueRecord value;
        memcpy(&value, buffer, sizeof value);
        return static_cast<uint32_t>(sizeof value) + value.name_length;
    }
    if (signature == sig_key && length >= sizeof(KeyRecord)) {
        KeyRecord key;
        memcpy(&key, buffer, sizeof key);
        return static_cast<uint32_t>(sizeof key) + key.name_length;
    }
    return 0;
}

// After a write: the bin that holds the place gets its largest free cell afresh. A place on the border of two bins
// counts for the first, as its end.
void refresh_bin_at(Store& store, int64_t position) {
    const int64_t place = position - base_block_size;
    int32_t low = 0;
    int32_t high = store.bin_count;
    while (low < high) {  // the first bin whose end is not before the place
        const int32_t middle = low + (high - low) / 2;
        if (int64_t{store.bins[middle].offset} + store.bins[middle].size < place)
            low = middle + 1;
        else
            high = middle;
    }
    if (low == store.bin_count || store.bins[low].offset > place || &store.bins[low] == store.held_bin)
        return;
    refresh_bin(store, store.bins[low]);
}

void clear_bits(uint8_t* map, uint32_t from, uint32_t to) {
    while (from < to) {
        const uint32_t first = from % bits;
        const uint32_t count = to - from < bits - first ? to - from : bits - first;
        map[from / bits] = static_cast<uint8_t>(map[from / bits] & ~(((1U << count) - 1) << first));
        from += count;
    }
}

// Notes a cell that the walk came by, and that none begins inside it. false when memory ran out.
bool mark_cell(Store& store, uint32_t offset, uint32_t size) {
    // Only a file that ends before its bins do, and has since been written to behind its end, needs more room here.
    if (!reserve_cells(store, int64_t{offset} + cell_alignment))
        return false;
    const uint32_t unit = offset / cell_alignment;
    const uint32_t most = store.cell_map_size * bits;
    const uint32_t end = unit + size / cell_alignment;
    store.cell_map[unit / bits] = static_cast<uint8_t>(store.cell_map[unit / bits] | 1U << unit % bits);
    clear_bits(store.cell_map, unit + 1, end < most ? end : most);
    return true;
}

bool is_marked(const Store& store, uint32_t offset) {
    const uint32_t unit = offset / cell_alignment;
    return unit / bits < store.cell_map_size && (store.cell_map[unit / bits] >> unit % bits & 1) != 0;
}

bool choose_leaf_kind(Store& store, const KeyRecord& root) {
    store.root_index = cell_offset(root.subkey_index);
    if (root.subkey_count == 0) {
        store.flags |= store_writes_fast_leaves;
        return true;
    }
    IndexHead head;
    if (read_at(store, sig_none, record_position(store.root_index), &head, sizeof head) != sizeof head)
        return false;
    if (head.signature == sig_fast_leaf)
        store.flags |= store_writes_fast_leaves;
    return head.signature == sig_fast_leaf || head.signature == sig_hash_leaf;
}

bool build_bin_table(Store& store) {
    BaseBlock base;
    if (read_at(store, sig_base, 0, &base, sizeof base) != sizeof base)
        return false;
    store.root = cell_offset(base.root);
    const uint32_t bins_size = base.bins_size;
    if (bins_size > highest_end - base_block_size)
        return false;

    KeyRecord root;
    if (static_cast<int32_t>(store.root) < 0 ||
        read_at(store, sig_key, record_position(store.root), &root, sizeof root) != sizeof root ||
        !choose_leaf_kind(store, root))
        return false;

    store.bins = static_cast<Bin*>(calloc(first_capacity, sizeof(Bin)));
    if (store.bins == nullptr)
        return false;
    store.bin_capacity = first_capacity;
    // The file's own length bounds the map: what the base block says may be anything.
    const int64_t there = int64_t{store.io.seek(store.io.device, 0, seek_end)} - base_block_size;
    if (there < 0 || !reserve_cells(store, there < bins_size ? there : int64_t{bins_size}))
        return false;
    int64_t offset = 0;
    while (offset < bins_size) {
        Bin bin = {};
        const int64_t end = scan_bin(store, static_cast<uint32_t>(offset), bin, false);
        if (end < 0 || end > bins_size || !reserve_bin(store, open_growth))
            return false;
        store.bins[store.bin_count++] = bin;
        offset = end;
    }
    store.bins_size = static_cast<int32_t>(bins_size);
    // Root and index must be cells in use, or the next value might be put over them.
    Cell cell;
    return offset == bins_size && find_used_cell(store, store.root, cell) && cell.room() >= sizeof root &&
           (root.subkey_count == 0 || is_used_cell(store, store.root_index));
}

}  // namespace

Store* open_store(const RegistryIo& io) {
    auto* store = static_cast<Store*>(calloc(1, sizeof(Store)));
    if (store == nullptr)
        return nullptr;
    store->io = io;
    store->unused = -1;
    store->sorted_key = CellOffset::none;
    store->window.bytes = static_cast<uint8_t*>(malloc(window_size));
    if (store->window.bytes == nullptr || !build_bin_table(*store)) {
        free_store(store);
        return nullptr;
    }
    return store;
}

void free_store(Store* store) {
    free(store->bins);
    free(store->cell_map);
    free(store->window.bytes);
    free(store);
}

uint32_t read_at(Store& store, uint32_t signature, int64_t position, void* buffer, uint32_t length) {
    if (position < 0)
        return 0;
    if (length > window_size || length + position % window_alignment > window_size)
        return read_through(store, position, buffer, length);
    if (!window_serves(store.window, position, length) && !load_window(store, position))
        return 0;
    const ReadWindow& window = store.window;
    const auto skip = static_cast<uint32_t>(position - window.start);
    if (skip >= window.length)
        return 0;
    const uint32_t available = window.length - skip;
    const uint32_t count = length < available ? length : available;
    memcpy(buffer, window.bytes + skip, count);
    return signature == sig_none || begins_with(signature, buffer, count) ? count : 0;
}

uint32_t write_at(Store& store, uint32_t signature, int64_t position, const void* buffer, uint32_t length) {
    if (signature != sig_none && !begins_with(signature, buffer, length))
        return 0;
    const uint32_t proper = proper_length(signature, buffer, length);
    if (proper != 0 && length > proper) {
        if (length != proper + 1)
            return 0;
        length = proper;  // a terminator behind the name is not stored
    }
    // The bin's cells as they are now: a write that breaks one must not hide the others.
    Bin* const bin = position < base_block_size
                         ? nullptr
                         : bin_of(store, cell_offset(static_cast<uint32_t>(position - base_block_size)));
    if (bin != nullptr && !bin->mapped)
        map_bin(store, *bin);
    ReadWindow& window = store.window;
    if (window.valid && position + length >= window.start && position <= window.start + window_size)
        window.valid = false;
    if (length > INT32_MAX || !seek_to(store, position))
        return 0;
    store.generation++;
    const int32_t count = store.io.write(store.io.device, buffer, static_cast<int32_t>(length));
    // A write that fell short may have reached a size word all the same.
    if (position >= base_block_size)
        refresh_bin_at(store, position);
    return count >= 0 && static_cast<uint32_t>(count) == length ? length : 0;
}

Outcome rewrite_at(Store& store, int64_t position, const void* now, const void* before, uint32_t length) {
    if (write_at(store, sig_none, position, now, length) == length)
        return Outcome::written;
    write_at(store, sig_none, position, before, length);
    const auto* expected = static_cast<const uint8_t*>(before);
    uint8_t piece[512];
    for (uint32_t done = 0; done < length;) {
        const uint32_t rest = length - done;
        const uint32_t count = rest < sizeof piece ? rest : static_cast<uint32_t>(sizeof piece);
        if (read_at(store, sig_none, position + done, piece, count) != count ||
            memcmp(piece, expected + done, count) != 0)
            return Outcome::unknown;
        done += count;
    }
    return Outcome::unchanged;
}

int64_t scan_bin(Store& store, uint32_t bin_offset, Bin& bin, bool map) {
    BinHeader header;
    const int64_t start = int64_t{base_block_size} + bin_offset;
    if (read_at(store, sig_bin, start, &header, sizeof header) != sizeof header || header.offset != bin_offset)
        return -1;
    const uint32_t size = header.size;
    if (size == 0 || size % bin_alignment != 0 || size > highest_end - start)
        return -1;
    bin = {bin_offset, size, 0, false, map};
    uint32_t walked = bin_header_size;
    while (walked < size) {
        int32_t cell;
        uint32_t absolute;
        if (!read_size(store, start + walked, cell) || !is_cell_size(cell, size - walked, absolute) ||
            (map && !mark_cell(store, bin_offset + walked, absolute)))
            return -1;
        if (cell > 0 && absolute > bin.largest_free)
            bin.largest_free = absolute;
        walked += absolute;
    }
    return int64_t{bin_offset} + walked;
}

void map_bin(Store& store, Bin& bin) {
    Bin walked = {};
    bin.mapped = scan_bin(store, bin.offset, walked, true) >= 0;
}

void refresh_bin(Store& store, Bin& bin) {
    store.unread_bins -= bin.unread ? 1 : 0;
    Bin fresh = {};
    bin.unread = scan_bin(store, bin.offset, fresh, bin.mapped) < 0;
    bin.largest_free = bin.unread ? 0 : fresh.largest_free;
    store.unread_bins += bin.unread ? 1 : 0;
}

void refresh_unread_bins(Store& store) {
    for (int32_t i = 0; store.unread_bins > 0 && i < store.bin_count; i++) {
        if (store.bins[i].unread)
            refresh_bin(store, store.bins[i]);
    }
}

bool reserve_bin(Store& store, int32_t growth) {
    if (store.bin_count < store.bin_capacity)
        return true;
    const int32_t capacity = store.bin_capacity + growth;
    auto* grown = static_cast<Bin*>(realloc(store.bins, static_cast<size_t>(capacity) * sizeof(Bin)));
    if (grown == nullptr)
        return false;
    memset(grown + store.bin_capacity, 0, static_cast<size_t>(growth) * sizeof(Bin));
    store.bins = grown;
    store.bin_capacity = capacity;
    return true;
}

bool reserve_cells(Store& store, int64_t end) {
    constexpr int64_t step = cell_alignment * bits;
    const int64_t needed = (end + step - 1) / step;
    if (needed <= store.cell_map_size)
        return true;
    auto* grown = static_cast<uint8_t*>(realloc(store.cell_map, static_cast<size_t>(needed)));
    if (grown == nullptr)
        return false;
    memset(grown + store.cell_map_size, 0, static_cast<size_t>(needed) - store.cell_map_size);
    store.cell_map = grown;
    store.cell_map_size = static_cast<uint32_t>(needed);
    return true;
}

Bin* bin_of(Store& store, CellOffset offset) {
    const auto place = static_cast<int32_t>(offset);
    if (place < 0)
        return nullptr;
    const auto wanted = static_cast<uint32_t>(place);
    const auto holds = [&](const Bin& bin) { return wanted >= bin.offset && wanted - bin.offset < bin.size; };
    if (store.recent_bin < store.bin_count && holds(store.bins[store.recent_bin]))
        return &store.bins[store.recent_bin];
    int32_t low = 0;
    int32_t high = store.bin_count;
    while (low < high) {  // the first bin that begins behind the place
        const int32_t middle = low + (high - low) / 2;
        if (store.bins[middle].offset <= wanted)
            low = middle + 1;
        else
            high = middle;
    }
    if (low == 0 || !holds(store.bins[low - 1]))
        return nullptr;
    store.recent_bin = low - 1;
    return &store.bins[low - 1];
}

int32_t cell_length(Store& store, CellOffset offset) {
    int32_t size;
    if (static_cast<int32_t>(offset) < 0 || !read_size(store, cell_position(offset), size) || size == INT32_MIN ||
        size % static_cast<int32_t>(cell_alignment) != 0)
        return -1;
    return size < 0 ? -size : size;
}

bool find_cell(Store& store, CellOffset offset, Cell& cell) {
    Bin* bin = bin_of(store, offset);
    const uint32_t place = raw(offset);
    if (bin == nullptr || place % cell_alignment != 0)
        return false;
    if (!bin->mapped)
        map_bin(store, *bin);
    if (!is_marked(store, place))
        return false;
    const uint32_t room = bin->size - (place - bin->offset);
    int32_t size;
    if (!read_size(store, cell_position(offset), size) || !is_cell_size(size, room, cell.size))
        return false;
    cell.offset = offset;
    cell.used = size < 0;
    return true;
}

bool find_used_cell(Store& store, CellOffset offset, Cell& cell) { return find_cell(store, offset, cell) && cell.used; }

bool is_used_cell(Store& store, CellOffset offset) {
    Cell cell;
    return find_used_cell(store, offset, cell);
}

uint32_t read_record(Store& store, uint32_t signature, CellOffset offset, void* buffer, uint32_t length) {
    Cell cell;
    if (!find_used_cell(store, offset, cell))
        return 0;
    return read_at(store, signature, record_position(offset), buffer, length < cell.room() ? length : cell.room());
}

bool read_part(Store& store, const Cell& cell, uint32_t skip, void* buffer, uint32_t length) {
    if (skip > cell.room() || length > cell.room() - skip)
        return false;
    return length == 0 || read_at(store, sig_none, record_position(cell.offset) + skip, buffer, length) == length;
}

}  // namespace engine
