// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// One hive file, opened for editing: file, engine, locks, root key and the cache of key handles.
#pragma once

#include <QCache>
#include <QFile>
#include <QString>

#include <map>
#include <memory>
#include <mutex>

class AbstractRegKey;
class RegHive;
class RegKey;
struct RegistryKey;

// Owns one engine handle; closes it under the hive's lock.
class KeyHandleHolder {
public:
    KeyHandleHolder(RegHive* hive, RegistryKey* handle) : hive_(hive), handle_(handle) {}
    ~KeyHandleHolder();
    KeyHandleHolder(const KeyHandleHolder&) = delete;
    KeyHandleHolder& operator=(const KeyHandleHolder&) = delete;

    RegistryKey* handle() const { return handle_; }

private:
    RegHive* hive_;
    RegistryKey* handle_;
};

// A hive exists only fully opened. The lock order is cache_mutex before api_mutex; both are recursive, since looking up
// a handle goes up from key to key. They are the standard library's, which the thread sanitizer can see into.
class RegHive {
public:
    // Opens the file and loads the hive; its root key hangs below `parent`, which it is not appended to.
    // std::runtime_error("Cannot open file"): missing, no regular file, no permission, locked, or open here already.
    // std::runtime_error("Cannot load hive"): no hive that can be relied on.
    RegHive(const QString& name, const QString& path, AbstractRegKey* parent);
    virtual ~RegHive();
    RegHive(const RegHive&) = delete;
    RegHive& operator=(const RegHive&) = delete;

    RegKey* root_key() const { return root_.get(); }
    QString name() const { return name_; }
    // Bytes of the hive file.
    qint64 file_size() const { return file_.size(); }

    // The engine handle of a key of this hive; opened and cached when it is not there. Valid only while the caller
    // holds both locks, see Dialogue. std::runtime_error("ROpenSubKey failed").
    RegistryKey* key_handle(const RegKey* key);
    // Opens and caches the handle of a key as the index-th subkey of `parent`, whether the parent's object lists it yet
    // or not. Throws as key_handle; also where another key lies there by now.
    RegistryKey* open_child_handle(const RegKey* key, const RegKey* parent, int index);
    void clear_handle_cache();
    // Takes one key's handle out of the cache, when the key object goes.
    void forget_handle(const RegKey* key);
    // Takes the handles of the other objects that stand for the same key out of the cache, after a change of the key:
    // a handle does not see what was done through another one.
    void forget_other_handles(const RegKey* key);
    // Notes that a key has left its cell, which may become another key's: a damaged hive may list it in other places
    // too, and the objects there must not be taken for that other key's.
    void note_freed(uint32_t offset);
    int cached_handles() const { return static_cast<int>(handle_cache_.count()); }

    // Both locks, in their order, for the whole of one operation: no handle is evicted while it is in use.
    class Dialogue {
    public:
        explicit Dialogue(RegHive* hive);
        ~Dialogue();
        Dialogue(const Dialogue&) = delete;
        Dialogue& operator=(const Dialogue&) = delete;

    private:
        RegHive* hive_;
    };

    std::recursive_mutex* api_mutex() { return &api_mutex_; }

private:
    friend class RegKey;

    bool has_left(const RegKey* key) const;
    void open_file();
    void load();
    void warn_if_dirty();

    QString name_;
    QFile file_;
    std::recursive_mutex api_mutex_;    // around every call into the engine for this hive
    std::recursive_mutex cache_mutex_;  // around every use of handle_cache_
    QCache<const RegKey*, KeyHandleHolder> handle_cache_;
    // By cell offset (bytes, as RKeyOffset): times_freed_ when a key left that cell last.
    std::map<uint32_t, int> freed_;
    int times_freed_ = 0;
    std::unique_ptr<RegKey> root_;
    RegistryKey* root_handle_ = nullptr;
};
