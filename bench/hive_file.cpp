// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "hive_file.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <vector>

namespace bench {

struct Device {
    int fd;
    Counts* counts;
};

namespace {

void put(std::vector<uint8_t>& bytes, size_t at, uint32_t n) {
    for (size_t i = 0; i < 4; i++)
        bytes[at + i] = static_cast<uint8_t>(n >> (8 * i));
}

void put_text(std::vector<uint8_t>& bytes, size_t at, const char* text) {
    memcpy(bytes.data() + at, text, strlen(text));
}

// Base block, one bin, the root key at offset 32, its security record behind it, the rest free.
std::vector<uint8_t> empty_hive() {
    constexpr size_t bin = 4096;
    constexpr size_t root = bin + 32;
    constexpr uint32_t root_size = 88;
    constexpr size_t security = root + root_size;
    constexpr uint32_t security_size = 48;
    constexpr uint32_t none = 0xFFFFFFFF;
    std::vector<uint8_t> bytes(8192);
    put_text(bytes, 0, "regf");
    put(bytes, 36, 32);
    put(bytes, 40, 4096);
    put_text(bytes, bin, "hbin");
    put(bytes, bin + 8, 4096);
    put(bytes, root, 0U - root_size);
    const size_t key = root + 4;
    put_text(bytes, key, "nk");
    put(bytes, key + 2, 0x0024);  // a root, its name in 8 bits
    put(bytes, key + 16, none);
    put(bytes, key + 28, none);
    put(bytes, key + 32, none);
    put(bytes, key + 40, none);
    put(bytes, key + 44, static_cast<uint32_t>(security - bin));
    put(bytes, key + 48, none);
    put(bytes, key + 72, 4);
    put_text(bytes, key + 76, "ROOT");
    put(bytes, security, 0U - security_size);
    put_text(bytes, security + 4, "sk");
    put(bytes, security + 8, static_cast<uint32_t>(security - bin));
    put(bytes, security + 12, static_cast<uint32_t>(security - bin));
    put(bytes, security + 16, 1);
    put(bytes, security + 20, 20);
    const size_t rest = security + security_size;
    put(bytes, rest, static_cast<uint32_t>(bytes.size() - rest));
    return bytes;
}

[[noreturn]] void fail(const char* what) {
    std::perror(what);
    std::exit(1);
}

int32_t seek(void* device, int32_t offset, int32_t whence) {
    return static_cast<int32_t>(lseek(static_cast<Device*>(device)->fd, offset, whence));
}

int32_t read(void* device, void* buffer, int32_t length) {
    auto* file = static_cast<Device*>(device);
    const auto count = static_cast<int32_t>(::read(file->fd, buffer, static_cast<size_t>(length)));
    file->counts->reads++;
    file->counts->bytes_read += static_cast<uint64_t>(count > 0 ? count : 0);
    return count;
}

int32_t write(void* device, const void* buffer, int32_t length) {
    auto* file = static_cast<Device*>(device);
    const auto count = static_cast<int32_t>(::write(file->fd, buffer, static_cast<size_t>(length)));
    file->counts->writes++;
    file->counts->bytes_written += static_cast<uint64_t>(count > 0 ? count : 0);
    return count;
}

}  // namespace

HiveFile::HiveFile() : writable_(true) {
    char path[] = "/tmp/tallowfen-bench.XXXXXX";
    fd_ = mkstemp(path);
    if (fd_ < 0)
        fail(path);
    unlink(path);
    const std::vector<uint8_t> bytes = empty_hive();
    if (::write(fd_, bytes.data(), bytes.size()) != static_cast<ssize_t>(bytes.size()))
        fail(path);
    device_ = std::make_unique<Device>(Device{fd_, &counts});
}

HiveFile::HiveFile(const std::string& path, New)
    : fd_(::open(path.c_str(), O_RDWR | O_CREAT | O_TRUNC | O_CLOEXEC, 0600)), writable_(true) {
    const std::vector<uint8_t> bytes = empty_hive();
    if (fd_ < 0 || ::write(fd_, bytes.data(), bytes.size()) != static_cast<ssize_t>(bytes.size()))
        fail(path.c_str());
    device_ = std::make_unique<Device>(Device{fd_, &counts});
}

HiveFile::HiveFile(const std::string& path) : fd_(::open(path.c_str(), O_RDONLY | O_CLOEXEC)) {
    if (fd_ < 0)
        fail(path.c_str());
    device_ = std::make_unique<Device>(Device{fd_, &counts});
}

HiveFile::~HiveFile() { close(fd_); }

RegistryIo HiveFile::io() { return {device_.get(), seek, read, writable_ ? write : nullptr}; }

RegistryKey* HiveFile::open() {
    lseek(fd_, 0, SEEK_SET);
    const RegistryIo callbacks = io();
    RegistryKey* root = ROpenHive(&callbacks);
    if (root == nullptr) {
        std::fprintf(stderr, "the hive cannot be opened\n");
        std::exit(1);
    }
    return root;
}

void HiveFile::read_once() {
    std::vector<char> block(16384);
    const RegistryIo callbacks = io();
    callbacks.seek(callbacks.device, 0, SEEK_SET);
    while (callbacks.read(callbacks.device, block.data(), static_cast<int32_t>(block.size())) > 0) {
    }
}

int64_t HiveFile::size() const {
    struct stat status;
    return fstat(fd_, &status) == 0 ? status.st_size : -1;
}

}  // namespace bench
