// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "value_data.h"

#include <cstring>

namespace engine {

namespace {

// Copies inline data, or nothing for a value without data, whose offset means nothing. false: the data is in a cell.
bool copy_inline(const ValueView& value, void* buffer, uint32_t length, int32_t& status) {
    if (!value.is_inline() && value.size() != 0)
        return false;
    status = value.size() <= inline_limit ? R_SUCCESS : R_CAN_NOT_COMPLETE;
    if (status == R_SUCCESS && length > 0)
        memcpy(buffer, value.record.data.bytes, length);
    return true;
}

// Puts the segments of big data together. The list's cell bounds how many segments there can be.
int32_t read_segments(Store& store, const Cell& cell, uint8_t* buffer, uint32_t size) {
    BigDataRecord big;
    if (cell.room() < sizeof big ||
        read_at(store, sig_big_data, record_position(cell.offset), &big, sizeof big) != sizeof big)
        return R_CAN_NOT_COMPLETE;
    const uint32_t count = big.segment_count;
    Cell list;
    if (!find_used_cell(store, cell_offset(big.segment_list), list) || list.room() / sizeof(Le32) < count)
        return R_REGISTRY_IO_FAILED;
    uint32_t done = 0;
    for (uint32_t i = 0; i < count && done < size; i++) {
        Le32 entry;
        Cell segment;
        if (!read_part(store, list, i * static_cast<uint32_t>(sizeof entry), &entry, sizeof entry))
            return R_REGISTRY_IO_FAILED;
        if (!find_used_cell(store, cell_offset(entry), segment))
            break;
        const uint32_t rest = size - done;
        const uint32_t wanted = rest < segment_size ? rest : segment_size;
        const uint32_t there = wanted < segment.room() ? wanted : segment.room();
        if (!read_part(store, segment, 0, buffer + done, there))
            return R_REGISTRY_IO_FAILED;
        done += there;
        if (there < wanted)
            break;
    }
    return done == size ? R_SUCCESS : R_REGISTRY_CORRUPT;
}

}  // namespace

int32_t read_plain_data(Store& store, const ValueView& value, void* buffer, uint32_t length) {
    int32_t status;
    if (copy_inline(value, buffer, length, status))
        return status;
    Cell cell;
    if (!find_used_cell(store, cell_offset(value.record.data), cell) || cell.room() < value.size() ||
        !read_part(store, cell, 0, buffer, length))
        return R_CAN_NOT_COMPLETE;
    return R_SUCCESS;
}

int32_t read_data(Store& store, const ValueView& value, void* buffer) {
    int32_t status;
    if (copy_inline(value, buffer, value.size(), status))
        return status;
    Cell cell;
    if (!find_used_cell(store, cell_offset(value.record.data), cell))
        return R_CAN_NOT_COMPLETE;
    if (cell.room() < value.size())
        return read_segments(store, cell, static_cast<uint8_t*>(buffer), value.size());
    return read_part(store, cell, 0, buffer, value.size()) ? R_SUCCESS : R_REGISTRY_IO_FAILED;
}

}  // namespace engine
