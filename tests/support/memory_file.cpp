// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT

#include "memory_file.h"

#include <algorithm>
#include <cstring>
#include <fcntl.h>
#include <stdexcept>
#include <unistd.h>

namespace testkit {

RegistryIo MemoryFile::io() {
    return {this, &MemoryFile::seek, &MemoryFile::read, read_only ? nullptr : &MemoryFile::write};
}

void MemoryFile::arm(const Failure& failure) {
    failure_ = failure;
    counts_ = {};
    failed_ = false;
}

bool MemoryFile::strikes(Call call, uint64_t number) {
    if (failure_.nth == 0 || failure_.call != call)
        return false;
    const bool strikes = failure_.lasting ? number >= failure_.nth : number == failure_.nth;
    failed_ = failed_ || strikes;
    return strikes;
}

int32_t MemoryFile::seek(void* device, int32_t offset, int32_t whence) {
    auto& file = *static_cast<MemoryFile*>(device);
    file.counts_.seeks++;
    if (file.strikes(Call::seek, file.counts_.seeks))
        return -1;
    int64_t from = 0;
    if (whence == 1)
        from = static_cast<int64_t>(file.position_);
    else if (whence == 2)
        from = static_cast<int64_t>(file.bytes.size());
    const int64_t position = from + offset;
    if (position < 0 || position > INT32_MAX)
        return -1;
    file.position_ = static_cast<uint64_t>(position);
    return static_cast<int32_t>(position);
}

int32_t MemoryFile::read(void* device, void* buffer, int32_t length) {
    auto& file = *static_cast<MemoryFile*>(device);
    file.counts_.reads++;
    if (length < 0)
        return -1;
    auto n = static_cast<uint64_t>(length);
    if (file.strikes(Call::read, file.counts_.reads)) {
        if (!file.failure_.shortened)
            return -1;
        n /= 2;
    }
    if (file.position_ >= file.bytes.size())
        return 0;
    n = std::min(n, file.bytes.size() - file.position_);
    if (n != 0)
        memcpy(buffer, file.bytes.data() + file.position_, n);
    file.position_ += n;
    file.counts_.bytes_read += n;
    return static_cast<int32_t>(n);
}

int32_t MemoryFile::write(void* device, const void* buffer, int32_t length) {
    auto& file = *static_cast<MemoryFile*>(device);
    file.counts_.writes++;
    if (length < 0)
        return -1;
    auto n = static_cast<uint64_t>(length);
    if (file.strikes(Call::write, file.counts_.writes)) {
        if (!file.failure_.shortened)
            return -1;
        n /= 2;
    }
    const uint64_t position = file.position_;
    n = std::min(n, file.capacity > position ? file.capacity - position : 0);
    if (position + n > file.bytes.size())
        file.bytes.resize(position + n, 0);
    if (n != 0)
        memcpy(file.bytes.data() + position, buffer, n);
    file.position_ += n;
    file.counts_.bytes_written += n;
    if (file.keep_cuts)
        file.cuts.push_back(file.bytes);
    if (file.on_write)
        file.on_write(position, n);
    return static_cast<int32_t>(n);
}

namespace {

int descriptor(void* device) { return static_cast<int>(reinterpret_cast<intptr_t>(device)); }
int32_t seek_file(void* device, int32_t offset, int32_t whence) {
    return static_cast<int32_t>(::lseek(descriptor(device), offset, whence));
}
int32_t read_file_part(void* device, void* buffer, int32_t length) {
    return static_cast<int32_t>(::read(descriptor(device), buffer, static_cast<size_t>(length)));
}
int32_t write_file_part(void* device, const void* buffer, int32_t length) {
    return static_cast<int32_t>(::write(descriptor(device), buffer, static_cast<size_t>(length)));
}

}  // namespace

FileDevice::FileDevice(const std::string& path, bool writable)
    : fd_(::open(path.c_str(), (writable ? O_RDWR : O_RDONLY) | O_CLOEXEC)), writable_(writable) {
    if (fd_ < 0)
        throw std::runtime_error("cannot open " + path);
}

FileDevice::~FileDevice() { ::close(fd_); }

RegistryIo FileDevice::io() {
    return {reinterpret_cast<void*>(static_cast<intptr_t>(fd_)), seek_file, read_file_part,
            writable_ ? write_file_part : nullptr};
}

}  // namespace testkit
