// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// A hive in a real file for the benchmarks: the callbacks of one file, with counts, and an empty hive to begin with.
#pragma once

#include <tallowfen/registry.h>

#include <cstdint>
#include <memory>
#include <string>

namespace bench {

struct Device;

struct Counts {
    uint64_t reads = 0;
    uint64_t bytes_read = 0;
    uint64_t writes = 0;
    uint64_t bytes_written = 0;
};

// An open file behind the engine's callbacks. Closed, and deleted where it was a scratch one, by the destructor.
class HiveFile {
public:
    // An empty hive in a scratch file: one bin, a root key with its security record.
    HiveFile();
    // The same in a file of that name, which stays.
    enum New { Empty };
    HiveFile(const std::string& path, New);
    // A file that is there, opened for reading alone.
    explicit HiveFile(const std::string& path);
    ~HiveFile();
    HiveFile(const HiveFile&) = delete;
    HiveFile& operator=(const HiveFile&) = delete;

    // Opens the hive; ends the program with a message when it cannot be opened.
    RegistryKey* open();
    // Reads the whole file once in blocks of 16 KiB through the callbacks.
    void read_once();
    int64_t size() const;

    Counts counts;

private:
    RegistryIo io();

    int fd_ = -1;
    bool writable_ = false;
    std::unique_ptr<Device> device_;  // what the callbacks are handed
};

}  // namespace bench
