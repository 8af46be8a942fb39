// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Reads of files that fail, in the programs that link tallowfen_read_faults: the C library's read() is replaced there.
#pragma once

namespace testkit {

// While it lives, reads are counted, and the nth fails with EIO; with lasting every one from there on. nth 0: none. One
// at a time.
class ReadFaults {
public:
    explicit ReadFaults(int nth, bool lasting = false);
    ~ReadFaults();
    ReadFaults(const ReadFaults&) = delete;
    ReadFaults& operator=(const ReadFaults&) = delete;

    int reads() const { return reads_; }
    bool failed() const { return nth_ > 0 && reads_ >= nth_; }
    // Counts a read and tells whether it fails.
    bool strikes();

private:
    int nth_;
    bool lasting_;
    int reads_ = 0;
};

}  // namespace testkit
