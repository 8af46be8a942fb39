// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// A hive's file in memory, with every way in which a real one fails; and one over a real file.
#pragma once

#include "bytes.h"

#include <tallowfen/registry.h>

#include <functional>

namespace testkit {

class MemoryFile {
public:
    enum class Call { read, write, seek };

    struct Failure {
        Call call = Call::read;
        uint64_t nth = 0;        // 1: the next one after arm; 0: never
        bool lasting = false;    // every one from there on, else that one alone
        bool shortened = false;  // half the bytes are moved; else -1 and none. A seek always gives -1.
    };

    struct Counts {
        uint64_t reads = 0;
        uint64_t writes = 0;
        uint64_t seeks = 0;
        uint64_t bytes_read = 0;
        uint64_t bytes_written = 0;
    };

    explicit MemoryFile(Bytes content = {}) : bytes(std::move(content)) {}
    MemoryFile(const MemoryFile&) = delete;
    MemoryFile& operator=(const MemoryFile&) = delete;

    // The descriptor for the engine. Its device points here: the file must outlive the hive, and must not
    // move.
    RegistryIo io();
    // Back to position 0, as ROpenHive wants it.
    void rewind() { position_ = 0; }

    // Counts from 0 again and lets the given call fail.
    void arm(const Failure& failure);
    void disarm() { arm({}); }
    const Counts& counts() const { return counts_; }
    bool failed() const { return failed_; }  // whether an armed failure struck since arm

    Bytes bytes;
    bool read_only = false;          // io() gives no write callback
    uint64_t capacity = 0x7FFFFFFF;  // the file cannot grow beyond: a write stops short there
    bool keep_cuts = false;          // a copy of bytes after every write goes to cuts
    std::vector<Bytes> cuts;
    std::function<void(uint64_t position, uint64_t length)> on_write;  // after the bytes have changed

private:
    static int32_t seek(void* device, int32_t offset, int32_t whence);
    static int32_t read(void* device, void* buffer, int32_t length);
    static int32_t write(void* device, const void* buffer, int32_t length);
    bool strikes(Call call, uint64_t number);

    uint64_t position_ = 0;
    Failure failure_;
    Counts counts_;
    bool failed_ = false;
};

// A real file, unbuffered. Throws std::runtime_error when it cannot be opened.
class FileDevice {
public:
    FileDevice(const std::string& path, bool writable);
    ~FileDevice();
    FileDevice(const FileDevice&) = delete;
    FileDevice& operator=(const FileDevice&) = delete;

    RegistryIo io();

private:
    int fd_;
    bool writable_;
};

}  // namespace testkit
