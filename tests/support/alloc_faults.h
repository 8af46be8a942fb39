// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Makes the N-th malloc, calloc, realloc or strdup of statically linked code fail, and measures what it takes. Works in
// a program that links tallowfen_alloc_faults; operator new is not touched.
#pragma once

#include <cstdint>

namespace testkit {

// Counts allocations while it lives, and lets the nth (1: the next) fail: that one alone, or every one from
// there on. nth 0 only counts. One at a time.
class AllocationFaults {
public:
    explicit AllocationFaults(uint64_t nth, bool lasting = false);
    ~AllocationFaults();
    AllocationFaults(const AllocationFaults&) = delete;
    AllocationFaults& operator=(const AllocationFaults&) = delete;

    uint64_t allocations() const;  // asked for so far
    bool failed() const;           // whether one failed
    uint64_t largest() const;      // bytes of the largest request
    uint64_t peak() const;         // the most bytes that were allocated at one time since the count began
};

}  // namespace testkit
