// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT

#include "alloc_faults.h"

#include <malloc.h>

#include <algorithm>
#include <cstddef>
#include <cstring>

namespace {

bool active = false;
bool lasting_failure = false;
bool has_failed = false;
uint64_t asked = 0;
uint64_t failing = 0;
uint64_t largest_request = 0;
int64_t held = 0;  // negative where more is freed than was taken since the count began
int64_t most_held = 0;

bool fails(size_t size) {
    if (!active)
        return false;
    asked++;
    largest_request = std::max<uint64_t>(largest_request, size);
    const bool now = failing != 0 && (lasting_failure ? asked >= failing : asked == failing);
    has_failed = has_failed || now;
    return now;
}

void* taken(void* block) {
    if (active && block != nullptr) {
        held += static_cast<int64_t>(malloc_usable_size(block));
        most_held = std::max(most_held, held);
    }
    return block;
}

void given_back(void* block) {
    if (active && block != nullptr)
        held -= static_cast<int64_t>(malloc_usable_size(block));
}

}  // namespace

extern "C" {

void* __real_malloc(size_t size);
void* __real_calloc(size_t count, size_t size);
void* __real_realloc(void* block, size_t size);
char* __real_strdup(const char* text);
void __real_free(void* block);
void* __wrap_malloc(size_t size);
void* __wrap_calloc(size_t count, size_t size);
void* __wrap_realloc(void* block, size_t size);
char* __wrap_strdup(const char* text);
void __wrap_free(void* block);

void* __wrap_malloc(size_t size) { return fails(size) ? nullptr : taken(__real_malloc(size)); }
void* __wrap_calloc(size_t count, size_t size) {
    return fails(count * size) ? nullptr : taken(__real_calloc(count, size));
}
void* __wrap_realloc(void* block, size_t size) {
    if (fails(size))
        return nullptr;
    const auto before = active && block != nullptr ? static_cast<int64_t>(malloc_usable_size(block)) : 0;
    void* const moved = __real_realloc(block, size);
    if (moved != nullptr)
        held -= before;
    return taken(moved);
}
char* __wrap_strdup(const char* text) {
    return fails(strlen(text) + 1) ? nullptr : static_cast<char*>(taken(__real_strdup(text)));
}
void __wrap_free(void* block) {
    given_back(block);
    __real_free(block);
}

}  // extern "C"

namespace testkit {

AllocationFaults::AllocationFaults(uint64_t nth, bool lasting) {
    asked = 0;
    largest_request = 0;
    held = 0;
    most_held = 0;
    has_failed = false;
    failing = nth;
    lasting_failure = lasting;
    active = true;
}

AllocationFaults::~AllocationFaults() { active = false; }

uint64_t AllocationFaults::allocations() const { return asked; }

uint64_t AllocationFaults::largest() const { return largest_request; }

uint64_t AllocationFaults::peak() const { return static_cast<uint64_t>(most_held); }

bool AllocationFaults::failed() const { return has_failed; }

}  // namespace testkit
