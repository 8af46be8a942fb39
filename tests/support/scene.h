// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// A hive in memory under the engine, with verbs over the engine's calls and a check of the bytes after them.
#pragma once

#include "hive_bytes.h"
#include "hive_checker.h"
#include "hive_reader.h"
#include "memory_file.h"

#include <memory>

namespace testkit {

// A key handle that closes itself.
class Handle {
public:
    Handle() = default;
    explicit Handle(RegistryKey* key) : key_(key) {}
    Handle(Handle&& other) noexcept : key_(other.release()) {}
    Handle& operator=(Handle&& other) noexcept;
    ~Handle() { reset(); }

    RegistryKey* get() const { return key_; }
    explicit operator bool() const { return key_ != nullptr; }
    RegistryKey** out() {  // closes what it holds and takes what a call puts there
        reset();
        return &key_;
    }
    RegistryKey* release();
    void reset();

private:
    RegistryKey* key_ = nullptr;
};

// Keys are named by path below the root, "" being the root. Every verb gives the engine's status; one that
// first has to open the key gives the opening's status when that fails. Before Open (the constructors open)
// and after Close the verbs must not be called.
class Scene {
public:
    Scene() : Scene(HiveLayout{}) {}  // a root without anything in it
    explicit Scene(const HiveLayout& layout);
    explicit Scene(Bytes bytes);
    ~Scene();
    Scene(const Scene&) = delete;
    Scene& operator=(const Scene&) = delete;

    bool Open();  // true when a hive is open then
    int32_t Close();
    bool Reopen();
    bool is_open() const { return root_ != nullptr; }
    RegistryKey* root() const { return root_; }
    MemoryFile& file() { return *file_; }
    const Bytes& bytes() const { return file_->bytes; }

    Handle OpenKey(const std::string& path);  // empty when it cannot be opened
    int32_t Create(const std::string& path, uint32_t* disposition = nullptr);
    int32_t Set(const std::string& path, const std::string& name, uint32_t type, const Bytes& data);
    int32_t DeleteValue(const std::string& path, const std::string& name);
    int32_t Rename(const std::string& path, const std::string& new_name);
    int32_t Delete(const std::string& path);

    // What the independent checker finds that was not there when the scene was built, and what leaked since
    // beyond expected_leaks cells; empty when all is well.
    std::string Check(size_t expected_leaks = 0) const;
    CheckResult Examine() const { return check_hive(bytes()); }
    Hive Read() const { return read_hive(bytes()); }
    // The differences from the bytes the scene was built with, or that MarkBase took.
    std::vector<std::string> Changes() const { return diff(base_, bytes()); }
    bool Untouched() const { return base_ == bytes(); }
    void MarkBase();

private:
    std::unique_ptr<MemoryFile> file_;
    RegistryKey* root_ = nullptr;
    Bytes base_;
    CheckResult base_result_;
};

// The names of a hive's keys as the engine enumerates them, in order.
std::vector<std::string> subkey_names(RegistryKey* key);

}  // namespace testkit
