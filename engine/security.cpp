// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "security.h"

#include "allocator.h"

namespace engine {

namespace {

bool read_security(Store& store, CellOffset offset, SecurityRecord& record) {
    return read_record(store, sig_security, offset, &record, sizeof record) == sizeof record;
}

bool rewrite_security(Store& store, CellOffset offset, const SecurityRecord& before, const SecurityRecord& now) {
    return rewrite_at(store, record_position(offset), &now, &before, sizeof now) == Outcome::written;
}

// Takes the record out of its ring. In turn: the next one's way back, the previous one's way forward; where the two are
// one, both at once. A stop between the two leaves the record reachable from one side; no key refers to it any more.
bool unlink(Store& store, CellOffset self, const SecurityRecord& record) {
    const CellOffset next = cell_offset(record.next);
    const CellOffset previous = cell_offset(record.previous);
    if (next == self || previous == self)
        return false;
    SecurityRecord after = {};   // the next one
    SecurityRecord before = {};  // the previous one
    const bool has_next = static_cast<int32_t>(next) > 0;
    const bool has_previous = static_cast<int32_t>(previous) > 0;
    if ((has_next && (!read_security(store, next, after) || cell_offset(after.previous) != self)) ||
        (has_previous && (!read_security(store, previous, before) || cell_offset(before.next) != self)))
        return false;
    SecurityRecord linked_after = after;
    SecurityRecord linked_before = before;
    linked_after.previous = record.previous;
    linked_before.next = record.next;
    if (has_next && next == previous)
        linked_after.next = record.next;
    if (has_next && !rewrite_security(store, next, after, linked_after))
        return false;
    if (!has_previous || next == previous || rewrite_security(store, previous, before, linked_before))
        return true;
    if (has_next)
        rewrite_security(store, next, linked_after, after);
    return false;
}

}  // namespace

bool add_security_reference(Store& store, CellOffset security) {
    if (static_cast<int32_t>(security) < 0)
        return true;
    SecurityRecord record;
    if (!read_security(store, security, record) || record.references == UINT32_MAX)
        return false;
    SecurityRecord raised = record;
    raised.references = record.references + 1;
    return rewrite_security(store, security, record, raised);
}

void drop_security_reference(Store& store, CellOffset security, bool still_used) {
    SecurityRecord record;
    if (static_cast<int32_t>(security) < 0 || !read_security(store, security, record) || record.references < 1 ||
        (still_used && record.references == 1))
        return;
    if (record.references == 1 && unlink(store, security, record)) {
        free_cell(store, security);
        return;
    }
    SecurityRecord lowered = record;
    lowered.references = record.references - 1;
    rewrite_security(store, security, record, lowered);
}

}  // namespace engine
