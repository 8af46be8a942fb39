// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Reads, writes and locks of files that fail, in the programs that link tallowfen_file_faults: the C library's read(),
// write() and flock() are replaced there.
#pragma once

#include <sys/types.h>

#include <cerrno>
#include <cstddef>

namespace testkit {

// Counts calls, and lets the nth fail: that one alone, or with lasting every one from there on. nth 0: none.
class FileFaults {
public:
    FileFaults(const FileFaults&) = delete;
    FileFaults& operator=(const FileFaults&) = delete;

    bool failed() const { return nth_ > 0 && calls_ >= nth_; }
    // Counts a call and tells whether it fails.
    bool strikes();

protected:
    FileFaults(int nth, bool lasting) : nth_(nth), lasting_(lasting) {}
    ~FileFaults() = default;

    int calls_ = 0;

private:
    int nth_;
    bool lasting_;
};

// While it lives, reads are counted and fail with EIO. One at a time.
class ReadFaults : public FileFaults {
public:
    explicit ReadFaults(int nth, bool lasting = false);
    ~ReadFaults();

    int reads() const { return calls_; }
};

// While it lives, writes to regular files are counted, and fail with the error given. Every write from the nth on that
// fails leaves a file as a stop after the one before does. With is_short the nth takes half of its bytes, as a disk
// does that fills up, and the next one, which asks for the rest, fails. One at a time.
class WriteFaults : public FileFaults {
public:
    explicit WriteFaults(int nth, bool lasting = false, int error = ENOSPC, bool is_short = false);
    ~WriteFaults();

    int writes() const { return calls_; }
    int error() const { return error_; }
    // Counts a write and tells how many of its bytes the file takes; -1 where it fails.
    ssize_t taken(size_t size);

private:
    int error_;
    bool is_short_;
    bool is_rest_ = false;
};

// While it lives, no file can be locked. One at a time.
class LockFaults {
public:
    explicit LockFaults(int error);
    ~LockFaults();
    LockFaults(const LockFaults&) = delete;
    LockFaults& operator=(const LockFaults&) = delete;

    int tried() const { return tried_; }  // how often a lock was asked for
    // Counts an attempt and gives its error.
    int refuse();

private:
    int error_;
    int tried_ = 0;
};

}  // namespace testkit
