// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "file_faults.h"

#include <sys/file.h>
#include <sys/stat.h>
#include <sys/syscall.h>
#include <unistd.h>

namespace testkit {

namespace {

ReadFaults* present_reads = nullptr;
WriteFaults* present_writes = nullptr;
LockFaults* present_locks = nullptr;

// Pipes and what wakes a thread go on working.
bool is_regular(int file) {
    struct stat status = {};
    return fstat(file, &status) == 0 && S_ISREG(status.st_mode);
}

}  // namespace

bool FileFaults::strikes() {
    calls_++;
    return nth_ > 0 && (lasting_ ? calls_ >= nth_ : calls_ == nth_);
}

ReadFaults::ReadFaults(int nth, bool lasting) : FileFaults(nth, lasting) { present_reads = this; }

ReadFaults::~ReadFaults() { present_reads = nullptr; }

WriteFaults::WriteFaults(int nth, bool lasting, int error, bool is_short)
    : FileFaults(nth, lasting), error_(error), is_short_(is_short) {
    present_writes = this;
}

WriteFaults::~WriteFaults() { present_writes = nullptr; }

ssize_t WriteFaults::taken(size_t size) {
    const bool fails = strikes() || is_rest_;
    is_rest_ = false;
    if (!fails)
        return static_cast<ssize_t>(size);
    if (!is_short_ || size < 2)
        return -1;
    is_short_ = false;
    is_rest_ = true;
    return static_cast<ssize_t>(size / 2);
}

LockFaults::LockFaults(int error) : error_(error) { present_locks = this; }

LockFaults::~LockFaults() { present_locks = nullptr; }

int LockFaults::refuse() {
    tried_++;
    return error_;
}

}  // namespace testkit

// In place of the C library's, for the toolkit's files too.
extern "C" {

ssize_t read(int file, void* buffer, size_t size) {
    if (testkit::present_reads != nullptr && testkit::present_reads->strikes()) {
        errno = EIO;
        return -1;
    }
    return syscall(SYS_read, file, buffer, size);
}

ssize_t write(int file, const void* buffer, size_t size) {
    testkit::WriteFaults* const faults = testkit::present_writes;
    const ssize_t taken = faults != nullptr && testkit::is_regular(file) ? faults->taken(size) : ssize_t(size);
    if (taken < 0) {
        errno = faults->error();
        return -1;
    }
    return syscall(SYS_write, file, buffer, static_cast<size_t>(taken));
}

int flock(int file, int operation) noexcept {
    if (testkit::present_locks != nullptr) {
        errno = testkit::present_locks->refuse();
        return -1;
    }
    return static_cast<int>(syscall(SYS_flock, file, operation));
}

}  // extern "C"
