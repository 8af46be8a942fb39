// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "contents.h"

namespace testkit {

namespace {

// A name as it stands in an entry of a Contents: 8-bit characters as they are, others by number.
std::string shown(const uint16_t* units, size_t count) {
    std::string text;
    for (size_t i = 0; i < count; i++)
        text += units[i] < 0x100 ? std::string(1, static_cast<char>(units[i]))
                                 : "<" + std::to_string(units[i]) + ">";
    return text;
}

class Reading {
public:
    explicit Reading(Contents& out) : out_(out) {}

    void key(RegistryKey* handle, const std::string& path) {
        put(path, "key");
        uint32_t subkeys = 0;
        uint32_t values = 0;
        if (RQueryInfoKeyA(handle, nullptr, nullptr, nullptr, nullptr, &subkeys, nullptr, nullptr, &values,
                           nullptr, nullptr, nullptr, nullptr) != R_SUCCESS)
            why += path + ": cannot be queried\n";
        for (uint32_t i = 0; i < values; i++)
            value(handle, path, i);
        for (uint32_t i = 0; i < subkeys; i++) {
            Handle child;
            uint16_t name[512];
            uint32_t size = sizeof name;
            if (ROpenSubKey(handle, i, child.out()) != R_SUCCESS ||
                RQueryInfoKeyW(child.get(), name, &size, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr,
                               nullptr, nullptr, nullptr, nullptr) != R_SUCCESS) {
                why += path + ": subkey " + std::to_string(i) + " cannot be opened\n";
                continue;
            }
            const std::string text = shown(name, size / 2);
            key(child.get(), path.empty() ? text : path + "\\" + text);
        }
    }

    std::string why;

private:
    void value(RegistryKey* handle, const std::string& path, uint32_t i) {
        uint16_t name[1024];
        uint32_t name_size = sizeof name;
        uint32_t type = 0;
        uint32_t size = 0;
        if (REnumValueW(handle, i, name, &name_size, &type, nullptr, &size) != R_SUCCESS) {
            why += path + ": value " + std::to_string(i) + " cannot be read\n";
            return;
        }
        const std::string place = path + "|" + shown(name, name_size / 2);
        std::string data(size + 1, '\0');
        uint32_t room = size;
        if (REnumValueW(handle, i, nullptr, nullptr, nullptr, data.data(), &room) != R_SUCCESS)
            why += place + ": its data cannot be read\n";
        data.resize(size);
        put(place, std::to_string(type) + ":" + data);
    }

    void put(const std::string& place, const std::string& what) {
        if (!out_.emplace(place, what).second)
            why += place + " is there twice\n";
    }

    Contents& out_;
};

} // namespace

Contents contents(RegistryKey* key, const std::string& path, std::string& why) {
    Contents all;
    Reading reading(all);
    reading.key(key, path);
    why = reading.why;
    return all;
}

Contents contents(const Bytes& bytes, std::string& why) {
    MemoryFile file(bytes);
    file.read_only = true;
    const RegistryIo io = file.io();
    RegistryKey* root = ROpenHive(&io);
    if (root == nullptr) {
        why = "the hive does not open";
        return {};
    }
    Contents all = contents(root, "", why);
    if (RCloseKey(root) != R_SUCCESS)
        why += "the hive does not close";
    return all;
}

} // namespace testkit
