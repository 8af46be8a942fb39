// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT

#include "scene.h"

namespace testkit {

Handle& Handle::operator=(Handle&& other) noexcept {
    if (this != &other) {
        reset();
        key_ = other.release();
    }
    return *this;
}

RegistryKey* Handle::release() {
    RegistryKey* key = key_;
    key_ = nullptr;
    return key;
}

void Handle::reset() {
    if (key_ != nullptr)
        RCloseKey(release());
}

Scene::Scene(const HiveLayout& layout) : Scene(lay_out(layout).bytes) {}

Scene::Scene(Bytes bytes) : file_(std::make_unique<MemoryFile>(std::move(bytes))) {
    MarkBase();
    Open();
}

Scene::~Scene() {
    file_->disarm();
    Close();
}

bool Scene::Open() {
    file_->rewind();
    const RegistryIo io = file_->io();
    root_ = ROpenHive(&io);
    return root_ != nullptr;
}

int32_t Scene::Close() {
    if (root_ == nullptr)
        return 0;
    const int32_t status = RCloseKey(root_);
    if (status == 0)
        root_ = nullptr;
    return status;
}

bool Scene::Reopen() { return Close() == 0 && Open(); }

void Scene::MarkBase() {
    base_ = bytes();
    base_result_ = check_hive(base_);
}

namespace {

// The handle for a path: the root itself for "", which stays open.
int32_t with_key(RegistryKey* root, const std::string& path, const std::function<int32_t(RegistryKey*)>& call) {
    if (path.empty())
        return call(root);
    Handle key;
    const int32_t status = ROpenKey(root, path.c_str(), key.out());
    return status != 0 ? status : call(key.get());
}

}  // namespace

Handle Scene::OpenKey(const std::string& path) {
    Handle key;
    if (ROpenKey(root_, path.c_str(), key.out()) != 0)
        key.reset();
    return key;
}

int32_t Scene::Create(const std::string& path, uint32_t* disposition) {
    Handle key;
    return RCreateKey(root_, path.c_str(), key.out(), disposition);
}

int32_t Scene::Set(const std::string& path, const std::string& name, uint32_t type, const Bytes& data) {
    return with_key(root_, path, [&](RegistryKey* key) {
        return RSetValueExW(key, name.c_str(), type, data.data(), static_cast<uint32_t>(data.size()));
    });
}

int32_t Scene::DeleteValue(const std::string& path, const std::string& name) {
    return with_key(root_, path, [&](RegistryKey* key) { return RDeleteValue(key, name.c_str()); });
}

int32_t Scene::Rename(const std::string& path, const std::string& new_name) {
    const size_t split = path.rfind('\\');
    const std::string parent = split == std::string::npos ? "" : path.substr(0, split);
    return with_key(root_, parent, [&](RegistryKey* key) {
        Handle child;
        uint32_t index = 0;
        const std::string name = split == std::string::npos ? path : path.substr(split + 1);
        const int32_t status = ROpenKeyEx(key, name.c_str(), child.out(), &index);
        child.reset();
        return status != 0 ? status : RRenameKey(key, index, new_name.c_str());
    });
}

int32_t Scene::Delete(const std::string& path) {
    const size_t split = path.rfind('\\');
    const std::string parent = split == std::string::npos ? "" : path.substr(0, split);
    const std::string name = split == std::string::npos ? path : path.substr(split + 1);
    // From an ordinary key where there is one: the root's handle deletes nothing.
    return with_key(root_, parent, [&](RegistryKey* key) { return RDeleteKey(key, name.c_str()); });
}

std::string Scene::Check(size_t expected_leaks) const {
    const CheckResult now = check_hive(bytes());
    std::string text = text_of(new_faults(base_result_, now));
    const size_t leaks = now.leaks.count();
    if (leaks != base_result_.leaks.count() + expected_leaks)
        text += "leaks: " + std::to_string(leaks) + " cells, expected " +
                std::to_string(base_result_.leaks.count() + expected_leaks) + "\n";
    return text;
}

std::vector<std::string> subkey_names(RegistryKey* key) {
    std::vector<std::string> names;
    for (uint32_t index = 0;; index++) {
        char name[512] = {};
        uint32_t size = sizeof name;
        const int32_t status = REnumKeyExA(key, index, name, &size, nullptr, nullptr, nullptr);
        if (status == R_NO_MORE_ITEMS)
            return names;
        names.push_back(status == 0 ? name : "status " + std::to_string(status));
    }
}

}  // namespace testkit
