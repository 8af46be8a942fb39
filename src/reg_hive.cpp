// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "reg_hive.h"

#include "device_calls.h"
#include "reg_key.h"

#include <QFileInfo>

#include <tallowfen/registry.h>

#include <sys/file.h>
#include <sys/stat.h>

#include <cassert>
#include <cerrno>
#include <cstdio>
#include <cstring>
#include <set>
#include <stdexcept>
#include <utility>

namespace {

constexpr int most_handles = 100;

using FileIdentity = std::pair<dev_t, ino_t>;

// The files that hives of this process have open. An advisory lock says the same where the file system knows locks.
std::set<FileIdentity>& open_files() {
    static std::set<FileIdentity> files;
    return files;
}

FileIdentity identity(const QFile& file) {
    struct stat status = {};
    if (fstat(file.handle(), &status) != 0 || !S_ISREG(status.st_mode))
        throw std::runtime_error("Cannot open file");
    return {status.st_dev, status.st_ino};
}

}  // namespace

KeyHandleHolder::~KeyHandleHolder() {
    const std::lock_guard locker(*hive_->api_mutex());
    RCloseKey(handle_);
}

RegHive::Dialogue::Dialogue(RegHive* hive) : hive_(hive) {
    hive_->cache_mutex_.lock();
    hive_->api_mutex_.lock();
}

RegHive::Dialogue::~Dialogue() {
    hive_->api_mutex_.unlock();
    hive_->cache_mutex_.unlock();
}

RegHive::RegHive(const QString& name, const QString& path, AbstractRegKey* parent)
    : name_(name), file_(path), handle_cache_(most_handles) {
    open_file();
    try {
        load();
        warn_if_dirty();
        root_ = std::make_unique<RegKey>(this, parent);
        root_->reload();
    } catch (...) {
        if (root_handle_ != nullptr)
            RCloseKey(root_handle_);
        open_files().erase(identity(file_));
        throw;
    }
}

// Handles before the hive, the hive before the keys: the engine keeps a hive open while one of its handles is.
RegHive::~RegHive() {
    clear_handle_cache();
    {
        const std::lock_guard locker(api_mutex_);
        [[maybe_unused]] const int32_t closed = RCloseKey(root_handle_);
        assert(closed == R_SUCCESS);
    }
    root_.reset();
    struct stat status = {};
    if (fstat(file_.handle(), &status) == 0)
        open_files().erase({status.st_dev, status.st_ino});
}

void RegHive::open_file() {
    // The kind of file is asked first: opening a pipe or a device can do something already.
    if (!QFileInfo(file_).isFile() ||
        !file_.open(QIODevice::ReadWrite | QIODevice::Unbuffered | QIODevice::ExistingOnly))
        throw std::runtime_error("Cannot open file");
    const FileIdentity file = identity(file_);
    // Network file systems that make byte ranges of the lock may answer EACCES.
    const bool locked_elsewhere =
        flock(file_.handle(), LOCK_EX | LOCK_NB) != 0 && (errno == EWOULDBLOCK || errno == EACCES);
    if (locked_elsewhere || !open_files().insert(file).second)
        throw std::runtime_error("Cannot open file");
}

// Windows numbers a hive's writes in two places; where they differ it has changes waiting in its logs.
void RegHive::warn_if_dirty() {
    constexpr qint64 sequence_numbers = 4;  // bytes from the file's beginning: two numbers of four bytes
    char numbers[8];
    if (file_.seek(sequence_numbers) && file_.read(numbers, sizeof numbers) == static_cast<qint64>(sizeof numbers) &&
        std::memcmp(numbers, numbers + 4, 4) != 0)
        std::fprintf(stderr, "warning: %s was not closed properly; Windows may replay its logs over changes\n",
                     qPrintable(file_.fileName()));
}

void RegHive::load() {
    const RegistryIo io = {static_cast<QIODevice*>(&file_), seek_device, read_device, write_device};
    root_handle_ = ROpenHive(&io);
    if (root_handle_ == nullptr)
        throw std::runtime_error("Cannot load hive");
}

RegistryKey* RegHive::key_handle(const RegKey* key) {
    const std::lock_guard locker(cache_mutex_);
    if (key == root_.get())
        return root_handle_;
    if (const KeyHandleHolder* holder = handle_cache_.object(key))
        return holder->handle();
    if (key->stands_in_)
        throw std::runtime_error("ROpenSubKey failed");
    return open_child_handle(key, static_cast<const RegKey*>(key->parent()), key->child_number());
}

RegistryKey* RegHive::open_child_handle(const RegKey* key, const RegKey* parent, int index) {
    const std::lock_guard locker(cache_mutex_);
    RegistryKey* parent_handle = key_handle(parent);
    RegistryKey* handle = nullptr;
    {
        const std::lock_guard api(api_mutex_);
        if (index < 0 || ROpenSubKey(parent_handle, static_cast<uint32_t>(index), &handle) != R_SUCCESS)
            throw std::runtime_error("ROpenSubKey failed");
        // After a failed read, or in a damaged hive, the parent's list may have moved under its slots.
        if (key->offset_ != UINT32_MAX && (key->offset_ != RKeyOffset(handle) || has_left(key))) {
            RCloseKey(handle);
            throw std::runtime_error("ROpenSubKey failed");
        }
    }
    handle_cache_.insert(key, new KeyHandleHolder(this, handle), 1);
    return handle;
}

void RegHive::clear_handle_cache() {
    const std::lock_guard locker(cache_mutex_);
    handle_cache_.clear();
}

void RegHive::forget_other_handles(const RegKey* key) {
    const std::lock_guard locker(cache_mutex_);
    const QList<const RegKey*> cached = handle_cache_.keys();
    for (const RegKey* other : cached) {
        if (other != key && other->offset_ == key->offset_)
            handle_cache_.remove(other);
    }
}

void RegHive::note_freed(uint32_t offset) { freed_[offset] = ++times_freed_; }

// Whether the key that an object was made for has left the cell that it was found in.
bool RegHive::has_left(const RegKey* key) const {
    const auto found = freed_.find(key->offset_);
    return found != freed_.end() && found->second > key->freed_before_;
}

void RegHive::forget_handle(const RegKey* key) {
    const std::lock_guard locker(cache_mutex_);
    handle_cache_.remove(key);
}
