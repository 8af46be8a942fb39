// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT

#include "alloc_faults.h"

#include <cstddef>

namespace {

bool active = false;
bool lasting_failure = false;
bool has_failed = false;
uint64_t asked = 0;
uint64_t failing = 0;

bool fails() {
    if (!active)
        return false;
    ++asked;
    const bool now = failing != 0 && (lasting_failure ? asked >= failing : asked == failing);
    has_failed = has_failed || now;
    return now;
}

} // namespace

extern "C" {

void* __real_malloc(size_t size);
void* __real_calloc(size_t count, size_t size);
void* __real_realloc(void* block, size_t size);
void* __wrap_malloc(size_t size);
void* __wrap_calloc(size_t count, size_t size);
void* __wrap_realloc(void* block, size_t size);

void* __wrap_malloc(size_t size) {
    return fails() ? nullptr : __real_malloc(size);
}
void* __wrap_calloc(size_t count, size_t size) {
    return fails() ? nullptr : __real_calloc(count, size);
}
void* __wrap_realloc(void* block, size_t size) {
    return fails() ? nullptr : __real_realloc(block, size);
}

} // extern "C"

namespace testkit {

AllocationFaults::AllocationFaults(uint64_t nth, bool lasting) {
    asked = 0;
    has_failed = false;
    failing = nth;
    lasting_failure = lasting;
    active = true;
}

AllocationFaults::~AllocationFaults() {
    active = false;
}

uint64_t AllocationFaults::allocations() const {
    return asked;
}

bool AllocationFaults::failed() const {
    return has_failed;
}

} // namespace testkit
