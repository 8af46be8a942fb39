// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "value_list.h"

#include "allocator.h"

#include <cstring>

namespace engine {

namespace {

constexpr uint32_t slot_size = sizeof(Le32);
// A list up to this many slots grows by one spare slot at a time; a longer one by an eighth of itself, or the time to
// add a value would grow with the number of those there.
constexpr uint32_t single_growth_limit = 1024;

int64_t slot_position(const ValueList& list, uint32_t i) {
    return record_position(list.cell.offset) + int64_t{i} * slot_size;
}

bool write_data(Store& store, CellOffset cell, const NewValue& value) {
    return write_at(store, sig_none, record_position(cell), value.data, value.size) == value.size;
}

// A new cell that holds the value's data; none on failure, nothing then being left allocated.
CellOffset place_data(Store& store, const NewValue& value) {
    const CellOffset cell = allocate(store, value.size);
    if (cell == CellOffset::none || write_data(store, cell, value))
        return cell;
    free_cell(store, cell);
    return CellOffset::none;
}

void put_inline(ValueRecord& record, const NewValue& value) {
    uint8_t bytes[inline_limit] = {};
    if (value.size > 0)
        memcpy(bytes, value.data, value.size);
    memcpy(record.data.bytes, bytes, sizeof bytes);
    record.size = value.size | data_inline;
}

// Writes record with cell as its data, in place of what old has. Where that surely failed, the cell is freed. record
// receives the cell in any case, and is what the file holds only after true.
bool lead_to(Store& store, const ValueView& old, CellOffset cell, ValueRecord& record) {
    record.data = raw(cell);
    const Outcome outcome = rewrite_value(store, old, record);
    if (outcome == Outcome::unchanged)
        free_cell(store, cell);
    return outcome == Outcome::written;
}

// New data in a new cell, to which the record then leads. The old data cell is left as it is.
bool move_data(Store& store, const ValueView& old, ValueRecord record, const NewValue& value) {
    const CellOffset cell = place_data(store, value);
    return cell != CellOffset::none && lead_to(store, old, cell, record);
}

// New data in the data cell that the value has and keeps, and the record after it. What fails is undone.
bool rewrite_in_place(Store& store, const ValueView& old, const ValueRecord& record, const NewValue& value) {
    const int64_t position = record_position(cell_offset(old.record.data));
    Cell cell;
    const Block before(value.size);
    if (before.bytes == nullptr || !find_used_cell(store, cell_offset(old.record.data), cell) ||
        !read_part(store, cell, 0, before.bytes, value.size) ||
        rewrite_at(store, position, value.data, before.bytes, value.size) != Outcome::written)
        return false;
    if (memcmp(&record, &old.record, sizeof record) == 0)
        return true;
    const Outcome outcome = rewrite_value(store, old, record);
    if (outcome == Outcome::unchanged)
        write_at(store, sig_none, position, before.bytes, value.size);
    return outcome == Outcome::written;
}

// The same where size or type change, so that data and record must change together. While the cell is being written,
// the value stands in a spare one. In turn, and what the value reads as after a stop there: spare cell taken and
// written: as before; the record leads to the spare cell: as after; the own cell written: as after; the record leads
// back to it: as after; the spare cell freed. Where the own cell cannot be written, the value stays in the spare one.
// Where none is to be had, as on a full disk, the two are written one after the other.
bool rewrite_data(Store& store, const ValueView& old, const ValueRecord& record, const NewValue& value) {
    const CellOffset spare = place_data(store, value);
    if (spare == CellOffset::none)
        return rewrite_in_place(store, old, record, value);
    ValueView spared = old;
    spared.record = record;
    if (!lead_to(store, old, spare, spared.record))
        return false;
    ValueRecord back = spared.record;
    back.data = old.record.data;
    Outcome outcome = Outcome::unchanged;
    if (write_data(store, cell_offset(back.data), value))
        outcome = rewrite_value(store, spared, back);
    if (outcome == Outcome::written)
        free_cell(store, spare);
    return outcome != Outcome::unknown;
}

// Whether the cell tells where big data lies. Plain data may begin like that by chance, and is then merely moved.
bool is_big_data(Store& store, const Cell& cell) {
    BigDataRecord big;
    Cell list;
    return read_part(store, cell, 0, &big, sizeof big) && big.signature == sig_big_data &&
           find_used_cell(store, cell_offset(big.segment_list), list) && big.segment_count <= list.room() / slot_size;
}

// Whether what a data offset leads to is not the value's data: a record, a list of values (which has no signature, but
// leads to values), or big data's record where the size is one cell's, or the other way round.
bool is_no_data(Store& store, const ValueView& value, const Cell& cell) {
    Le32 first;
    ValueView listed;
    if (is_record(store, cell) ||
        (read_part(store, cell, 0, &first, sizeof first) && read_value(store, cell_offset(first), listed)))
        return true;
    return is_big_data(store, cell) != (value.size() > cell.room());
}

bool replace_value(Store& store, const ValueView& old, const NewValue& value) {
    ValueRecord record = old.record;
    record.type = value.type;
    if (value.size <= inline_limit) {
        // A data cell that the value had stays allocated. Freeing it would be one more write that can fail, for a
        // change that is done; and a damaged hive may have another value's data there.
        put_inline(record, value);
        return rewrite_value(store, old, record) == Outcome::written;
    }
    record.size = value.size;
    const CellOffset data = cell_offset(old.record.data);
    Cell cell;
    // An offset that leads to no cell, or to something else than data, is replaced; what lies there is left alone.
    const uint32_t failed = store.failed_reads;
    const bool leads_elsewhere =
        old.is_inline() || old.size() == 0 || !find_used_cell(store, data, cell) || is_no_data(store, old, cell);
    if (store.failed_reads != failed)
        return false;  // nobody knows what lies there
    if (leads_elsewhere)
        return move_data(store, old, record, value);
    if (cell.room() >= value.size)
        return old.size() == value.size && old.record.type == value.type ? rewrite_in_place(store, old, record, value)
                                                                         : rewrite_data(store, old, record, value);
    if (!move_data(store, old, record, value))
        return false;
    free_cell(store, data);
    return true;
}

// Whether one of the list's first count slots leads to a value.
bool is_listed(Store& store, const ValueList& list, uint32_t count, CellOffset value) {
    CellOffset offsets[256];
    constexpr uint32_t most = sizeof offsets / sizeof offsets[0];
    for (uint32_t i = 0; i < count;) {
        const uint32_t read = values_at(store, list, i, offsets, most < count - i ? most : count - i);
        if (read == 0)
            return true;  // nobody knows
        for (uint32_t slot = 0; slot < read; slot++) {
            if (offsets[slot] == value)
                return true;
        }
        i += read;
    }
    return false;
}

// A new value's record, not yet in any list; none on failure, nothing then being left allocated.
CellOffset place_value(Store& store, const NewValue& value) {
    const uint32_t length = static_cast<uint32_t>(sizeof(ValueRecord)) + value.name.length;
    const Block bytes(length);
    if (bytes.bytes == nullptr)
        return CellOffset::none;
    ValueRecord record = {};
    record.signature = static_cast<uint16_t>(sig_value);
    record.name_length = static_cast<uint16_t>(value.name.length);
    record.type = value.type;
    record.flags = value.name.length > 0 ? value_name_8bit : uint16_t{0};
    CellOffset data = CellOffset::none;
    if (value.size <= inline_limit) {
        put_inline(record, value);
    } else {
        data = place_data(store, value);
        if (data == CellOffset::none)
            return CellOffset::none;
        record.size = value.size;
        record.data = raw(data);
    }
    memcpy(bytes.bytes, &record, sizeof record);
    memcpy(bytes.bytes + sizeof record, value.name.bytes, value.name.length);
    const CellOffset offset = allocate(store, length);
    if (offset != CellOffset::none &&
        write_at(store, sig_value, record_position(offset), bytes.bytes, length) == length)
        return offset;
    if (offset != CellOffset::none)
        free_cell(store, offset);
    if (data != CellOffset::none)
        free_cell(store, data);
    return CellOffset::none;
}

// A cell with the list and room for one more slot at least; the old cell stays as it is.
CellOffset grow_list(Store& store, const ValueList& list) {
    const uint32_t spare = list.count < single_growth_limit ? 2 : 1 + list.count / 8;
    const CellOffset cell = allocate(store, (list.count + spare) * slot_size);
    if (cell == CellOffset::none)
        return cell;
    const uint32_t length = list.count * slot_size;
    const Block slots(length);
    if (slots.bytes != nullptr && read_part(store, list.cell, 0, slots.bytes, length) &&
        write_at(store, sig_none, record_position(cell), slots.bytes, length) == length)
        return cell;
    free_cell(store, cell);
    return CellOffset::none;
}

// The key's record with the longest value name and the largest data not below these.
KeyRecord with_maxima(const KeyRecord& key, uint32_t name_bytes, uint32_t data_size) {
    KeyRecord raised = key;
    if (name_bytes > raised.longest_value)
        raised.longest_value = name_bytes;
    if (data_size > raised.largest_data)
        raised.largest_data = data_size;
    return raised;
}

// Puts the record into the list's next slot, and list and maxima into the key.
Outcome link_value(Store& store, CellOffset key_offset, KeyRecord& key, ValueList list, CellOffset offset,
                   const NewValue& value) {
    const bool moves = list.count == 0 || list.cell.room() < (list.count + 1) * slot_size;
    const CellOffset old = list.cell.offset;
    if (moves) {
        list.cell.offset = list.count == 0 ? allocate(store, slot_size) : grow_list(store, list);
        if (list.cell.offset == CellOffset::none)
            return Outcome::unchanged;
    }
    Le32 slot;
    slot = raw(offset);
    KeyRecord changed = with_maxima(key, 2 * value.name.length, value.size);
    changed.value_count = list.count + 1;
    changed.value_list = raw(list.cell.offset);
    Outcome outcome = Outcome::unchanged;
    if (write_at(store, sig_none, slot_position(list, list.count), &slot, sizeof slot) == sizeof slot)
        outcome = rewrite_key(store, key_offset, key, changed);
    if (moves && outcome == Outcome::unchanged)
        free_cell(store, list.cell.offset);
    if (moves && outcome == Outcome::written && list.count > 0)
        free_cell(store, old);
    return outcome;
}

// Replaces a value's data. The key's largest data is raised ahead of it: it is an upper bound, so a stop behind it
// says nothing untrue. It is lowered again where the value has surely stayed as it was.
bool update_value(Store& store, CellOffset key_offset, KeyRecord& key, const ValueView& old, const NewValue& value) {
    const KeyRecord before = key;
    if (rewrite_key(store, key_offset, key, with_maxima(key, 0, value.size)) != Outcome::written)
        return false;
    if (replace_value(store, old, value))
        return true;
    ValueView now;
    if (read_value(store, old.cell.offset, now) && memcmp(&now.record, &old.record, sizeof now.record) == 0)
        rewrite_key(store, key_offset, key, before);
    return false;
}

}  // namespace

ValueList find_value_list(Store& store, const KeyRecord& key) {
    ValueList list = {};
    const uint32_t claimed = key.value_count;
    if (claimed == 0) {
        list.whole = true;
        return list;
    }
    if (!find_used_cell(store, cell_offset(key.value_list), list.cell))
        return list;
    const uint32_t capacity = list.cell.room() / slot_size;
    // Slots that lead to one value over and over, in a damaged hive, are not taken for more than there can be.
    const uint32_t most = static_cast<uint32_t>(store.bins_size) / (sizeof(ValueRecord) + cell_head_size);
    const uint32_t limit = capacity < most ? capacity : most;
    list.count = claimed < limit ? claimed : limit;
    list.whole = claimed <= limit;
    return list;
}

uint32_t values_at(Store& store, const ValueList& list, uint32_t i, CellOffset* offsets, uint32_t most) {
    uint32_t read = 0;
    while (read < most && i < list.count) {
        Le32 slots[256];
        constexpr uint32_t fits = sizeof slots / slot_size;
        const uint32_t rest = list.count - i < most - read ? list.count - i : most - read;
        uint32_t count = rest < fits ? rest : fits;
        if (!read_part(store, list.cell, i * slot_size, slots, count * slot_size)) {
            count = 1;  // the file may end among them
            if (!read_part(store, list.cell, i * slot_size, slots, slot_size))
                break;
        }
        for (uint32_t slot = 0; slot < count; slot++)
            offsets[read++] = cell_offset(slots[slot]);
        i += count;
    }
    return read;
}

CellOffset value_at(Store& store, const ValueList& list, uint32_t i) {
    CellOffset offset;
    return values_at(store, list, i, &offset, 1) == 1 ? offset : CellOffset::none;
}

int32_t find_value(Store& store, const ValueList& list, const Name& name, ValueView& value, int32_t* begun) {
    // Slots are fetched many at a time, or the window would go to and fro between the list and the records.
    constexpr uint32_t most = 2048;
    CellOffset offsets[most];
    const uint32_t failed = store.failed_reads;
    int32_t missing = list.whole ? no_value : unreadable_value;
    int32_t first_begun = no_value;
    uint32_t position = 0;
    while (position < list.count) {
        const uint32_t count = values_at(store, list, position, offsets, most);
        if (count == 0)
            return unreadable_value;
        for (uint32_t i = 0; i < count; i++) {
            const Named named = compare_value(store, offsets[i], name, begun != nullptr, value);
            if (named == Named::so)  // what the device did not deliver may have been an earlier one of that name
                return store.failed_reads == failed ? static_cast<int32_t>(position + i) : unreadable_value;
            if (named == Named::unreadable)
                missing = unreadable_value;
            if (named == Named::begun && first_begun == no_value)
                first_begun = static_cast<int32_t>(position + i);
        }
        position += count;
    }
    if (begun != nullptr)
        *begun = first_begun;
    return missing;
}

int32_t position_of_value(Store& store, const ValueList& list, const char* name) {
    ValueView value;
    int32_t begun = no_value;
    const int32_t position = find_value(store, list, name_of(name != nullptr ? name : ""), value, &begun);
    return position == no_value ? begun : position;
}

// A new value, in turn: its data cell, its record, its slot in the list (in a longer copy of the list, where that has
// no room), the key's record with count, list and maxima, then the old list is freed. Until the key's record is
// written the value is not there.
Stored store_value(Store& store, CellOffset key_offset, KeyRecord& key, const NewValue& value) {
    const ValueList list = find_value_list(store, key);
    if (!list.whole || !is_used_cell(store, key_offset) || (list.count > 0 && !is_used_cell(store, list.cell.offset)))
        return Stored::failed;
    ValueView old;
    const int32_t position = find_value(store, list, value.name, old);
    // Where a record cannot be read, the name may be there already.
    if (position == unreadable_value)
        return Stored::failed;
    if (position >= 0)
        return update_value(store, key_offset, key, old, value) ? Stored::replaced : Stored::failed;
    const CellOffset offset = place_value(store, value);
    if (offset == CellOffset::none)
        return Stored::failed;
    const Outcome outcome = link_value(store, key_offset, key, list, offset, value);
    if (outcome == Outcome::written)
        return Stored::added;
    // Where it is surely not in the list, record and data go back.
    ValueView placed;
    if (outcome == Outcome::unchanged && read_value(store, offset, placed)) {
        if (!placed.is_inline())
            free_cell(store, cell_offset(placed.record.data));
        free_cell(store, offset);
    }
    return Stored::failed;
}

// In turn, and what a stop after each leaves:
//   the list with the value moved behind the others: every value still there;
//   the key's record with a count one lower: the value gone;
//   the last slot, now spare, as a shift of the list leaves it; the value's record freed, unless it stands in the list
//   a second time. Its data stays allocated.
int32_t remove_value(Store& store, CellOffset key_offset, KeyRecord& key, uint32_t position) {
    const ValueList list = find_value_list(store, key);
    // A slot holds a multiple of 8, which no signature is: a cell that looks like a record is no list.
    if (!list.whole || position >= list.count || !is_used_cell(store, key_offset) ||
        !is_used_cell(store, list.cell.offset) || is_record(store, list.cell))
        return R_FAILED;
    const uint32_t behind = (list.count - position) * slot_size;  // the value's own slot and those after it
    const Block slots(behind);
    const Block before(behind);
    if (slots.bytes == nullptr || before.bytes == nullptr)
        return R_NOT_ENOUGH_MEMORY;
    if (!read_part(store, list.cell, position * slot_size, slots.bytes, behind))
        return R_FAILED;
    memcpy(before.bytes, slots.bytes, behind);
    uint8_t removed[slot_size];
    memcpy(removed, slots.bytes, slot_size);
    const bool was_last = behind == slot_size;
    uint8_t last[slot_size];
    memcpy(last, slots.bytes + behind - slot_size, slot_size);
    if (!was_last) {
        memmove(slots.bytes, slots.bytes + slot_size, behind - slot_size);
        memcpy(slots.bytes + behind - slot_size, removed, slot_size);
        if (rewrite_at(store, slot_position(list, position), slots.bytes, before.bytes, behind) != Outcome::written)
            return R_CAN_NOT_COMPLETE;
    }
    KeyRecord changed = key;
    changed.value_count = list.count - 1;
    if (list.count == 1)
        changed.value_list = raw(CellOffset::none);  // the list's cell stays allocated
    if (rewrite_key(store, key_offset, key, changed) != Outcome::written)
        return R_CAN_NOT_COMPLETE;
    if (!was_last)
        write_at(store, sig_none, slot_position(list, list.count - 1), last, sizeof last);
    Le32 offset;
    memcpy(&offset, removed, sizeof offset);
    ValueView value;
    if (!is_listed(store, list, list.count - 1, cell_offset(offset)) && read_value(store, cell_offset(offset), value))
        free_cell(store, cell_offset(offset));
    return R_SUCCESS;
}

}  // namespace engine
