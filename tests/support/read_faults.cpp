// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "read_faults.h"

#include <sys/syscall.h>
#include <unistd.h>

#include <cerrno>

namespace testkit {

namespace {

ReadFaults* present = nullptr;

}  // namespace

ReadFaults::ReadFaults(int nth, bool lasting) : nth_(nth), lasting_(lasting) { present = this; }

ReadFaults::~ReadFaults() { present = nullptr; }

bool ReadFaults::strikes() {
    reads_++;
    return nth_ > 0 && (lasting_ ? reads_ >= nth_ : reads_ == nth_);
}

}  // namespace testkit

// In place of the C library's, for the toolkit's files too.
extern "C" ssize_t read(int file, void* buffer, size_t size) {
    if (testkit::present != nullptr && testkit::present->strikes()) {
        errno = EIO;
        return -1;
    }
    return syscall(SYS_read, file, buffer, size);
}
