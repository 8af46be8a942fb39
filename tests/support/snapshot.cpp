// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "snapshot.h"

#include "scene.h"

#include <algorithm>

namespace testkit {

namespace {

constexpr size_t smallest_key = 80;      // record and size word
constexpr size_t smallest_value = 4;     // its entry in a list
constexpr uint32_t name_units = 0x8000;  // more than a record can say
constexpr uint32_t deepest = 600;        // more than the engine goes

std::string text_of(const std::vector<uint16_t>& units, uint32_t bytes) {
    return utf8(std::u16string(units.begin(), units.begin() + bytes / 2));
}

class Walk {
public:
    explicit Walk(const WalkLimits& limits) : left_(limits), name_(2 * name_units), other_name_(2 * name_units) {}

    void key(RegistryKey* handle, const std::string& place, std::vector<uint32_t>& way) {
        if (left_.keys == 0) {
            shot_.complete = false;
            return;
        }
        left_.keys--;
        shot_.keys.push_back({place, way, {}, {}});
        const size_t own = shot_.keys.size() - 1;
        uint32_t subkeys = 0;
        uint32_t values = 0;
        put(place, describe(handle, subkeys, values));
        for (uint32_t i = 0; i < values && left_.values > 0; i++)
            shot_.keys[own].values.push_back(value(handle, place, i));
        if (way.size() == left_.depth) {
            shot_.complete = shot_.complete && subkeys == 0;
            return;
        }
        for (uint32_t i = 0; i < subkeys && left_.keys > 0; i++) {
            Handle child;
            const int32_t status = ROpenSubKey(handle, i, child.out());
            way.push_back(i);
            if (status != R_SUCCESS) {
                shot_.keys[own].damaged.push_back(i);
                fail(place + "\\?", status);
            } else {
                const std::string name = name_of(handle, i, child.get());
                key(child.get(), place.empty() ? name : place + "\\" + name, way);
            }
            way.pop_back();
        }
    }

    Snapshot finish() {
        std::sort(shot_.items.begin(), shot_.items.end());
        return std::move(shot_);
    }

private:
    void put(const std::string& place, const std::string& what) { shot_.items.push_back({place, what}); }
    void fail(const std::string& place, int32_t status) {
        shot_.unreadable++;
        put(place, "status " + std::to_string(status));
    }

    // A key that is a link, or says that it is the root, has no name of its own to show: its parent's list
    // has it.
    std::string name_of(RegistryKey* parent, uint32_t i, RegistryKey* handle) {
        const std::string own = own_name(handle);
        char listed[600] = {};
        uint32_t size = sizeof listed - 1;
        if (own.empty() && REnumKeyExA(parent, i, listed, &size, nullptr, nullptr, nullptr) == R_SUCCESS)
            return utf8(widen(listed));
        return own;
    }
    std::string own_name(RegistryKey* handle) {
        uint32_t size = 4 * name_units;
        const int32_t status = RQueryInfoKeyW(handle, name_.data(), &size, nullptr, nullptr, nullptr, nullptr, nullptr,
                                              nullptr, nullptr, nullptr, nullptr, nullptr);
        return status == R_SUCCESS ? text_of(name_, size) : "status " + std::to_string(status);
    }

    std::string describe(RegistryKey* handle, uint32_t& subkeys, uint32_t& values) {
        uint32_t class_size = 2 * name_units;
        RegistryTime time = {};
        std::string text;
        if (RQueryInfoKeyW(handle, nullptr, nullptr, name_.data(), &class_size, &subkeys, nullptr, nullptr, &values,
                           nullptr, nullptr, nullptr, &time) == R_SUCCESS)
            text = "class " + text_of(name_, class_size) + " time " + std::to_string(time.high) + ":" +
                   std::to_string(time.low);
        uint32_t security = 0;
        const int32_t status = RQueryInfoKeyW(handle, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr,
                                              nullptr, nullptr, nullptr, &security, nullptr);
        return text + " security " +
               (status == R_SUCCESS ? std::to_string(security) : "status " + std::to_string(status));
    }

    std::string value(RegistryKey* handle, const std::string& place, uint32_t i) {
        left_.values--;
        uint32_t name_size = 4 * name_units;
        uint32_t type = 0;
        uint32_t size = 0;
        const int32_t status = REnumValueW(handle, i, other_name_.data(), &name_size, &type, nullptr, &size);
        if (status != R_SUCCESS) {
            fail(place + "|?", status);
            return "?";
        }
        const std::string name = text_of(other_name_, name_size);
        const std::string what = "type " + std::to_string(type) + " size " + std::to_string(size) + ": ";
        if (size > left_.data_bytes) {
            shot_.unreadable++;
            put(place + "|" + name, what + "more than the file holds");
            return name;
        }
        left_.data_bytes -= size;
        std::string data(size + 1, '\0');
        uint32_t room = size;
        const int32_t got = REnumValueW(handle, i, nullptr, nullptr, nullptr, data.data(), &room);
        data.resize(got == R_SUCCESS ? size : 0);
        shot_.unreadable += got == R_SUCCESS ? 0 : 1;
        put(place + "|" + name, what + (got == R_SUCCESS ? data : "status " + std::to_string(got)));
        return name;
    }

    WalkLimits left_;
    Snapshot shot_;
    std::vector<uint16_t> name_;
    std::vector<uint16_t> other_name_;
};

// Every call that reads, the answers not kept.
class Questions {
public:
    explicit Questions(const WalkLimits& limits)
        : left_(limits), name_(0x10001), wide_name_(2 * name_units), data_(0x10000) {}

    void key(RegistryKey* handle, uint32_t depth) {
        if (left_.keys == 0)
            return;
        left_.keys--;
        char name[600] = {};
        uint32_t size = sizeof name - 1;
        uint32_t class_size = sizeof name - 1;
        char class_name[600];
        RQueryInfoKeyA(handle, name, &size, class_name, &class_size, nullptr, nullptr, nullptr, nullptr, nullptr,
                       nullptr, nullptr, nullptr);
        uint32_t subkeys = 0;
        uint32_t values = 0;
        RQueryInfoKeyA(handle, nullptr, nullptr, nullptr, nullptr, &subkeys, nullptr, nullptr, &values, nullptr,
                       nullptr, nullptr, nullptr);
        for (uint32_t i = 0; i < values && left_.values > 0; i++)
            value(handle, i);
        for (uint32_t i = 0; i < subkeys && left_.keys > 0 && depth < left_.depth; i++)
            child(handle, i, depth);
    }

private:
    void value(RegistryKey* handle, uint32_t i) {
        left_.values--;
        const auto most = static_cast<uint32_t>(data_.size());
        uint32_t name_size = 4 * name_units;
        uint32_t type = 0;
        uint32_t room = most;
        REnumValueW(handle, i, wide_name_.data(), &name_size, &type, data_.data(), &room);
        name_size = static_cast<uint32_t>(name_.size() - 1);
        name_[0] = '\0';
        room = most;
        REnumValueA(handle, i, name_.data(), &name_size, &type, data_.data(), &room);
        // Looking up by name costs a walk over the list, so not for each of many.
        if (i >= 16)
            return;
        RFindValueA(handle, name_.data());
        room = most;
        RQueryValueExA(handle, name_.data(), &type, data_.data(), &room);
        room = most;
        RQueryValueExW(handle, name_.data(), &type, data_.data(), &room);
    }

    void child(RegistryKey* handle, uint32_t i, uint32_t depth) {
        char name[600] = {};
        uint32_t size = sizeof name - 1;
        char class_name[600];
        uint32_t class_size = sizeof class_name - 1;
        uint32_t subkeys = 0;
        RegistryTime time;
        REnumKeyInfoA(handle, i, name, &size, &subkeys, class_name, &class_size, &time);
        Handle by_name;
        if (i < 16 && name[0] != '\0')
            ROpenKey(handle, name, by_name.out());
        // The question walks the whole subtree, so it is not asked at every level of a deep one.
        if (i < 16 && depth < 2)
            RCheckDeleteTree(handle, i);
        Handle opened;
        if (ROpenSubKey(handle, i, opened.out()) == R_SUCCESS)
            key(opened.get(), depth + 1);
    }

    WalkLimits left_;
    std::vector<char> name_;
    std::vector<uint16_t> wide_name_;
    Bytes data_;
};

}  // namespace

WalkLimits limits_for(size_t file_size) {
    return {file_size / smallest_key + 1, file_size / smallest_value + 1, 4 * uint64_t{file_size}, deepest};
}

Snapshot take_snapshot(RegistryKey* root, const WalkLimits& limits) {
    Walk walk(limits);
    std::vector<uint32_t> way;
    walk.key(root, "", way);
    return walk.finish();
}

void ask_everything(RegistryKey* root, const WalkLimits& limits) { Questions(limits).key(root, 0); }

bool covers(const std::string& place, const std::string& other) {
    if (place.empty())
        return true;
    if (place.back() == '=')
        return place.compare(0, place.size() - 1, other) == 0;
    if (other.compare(0, place.size(), place) != 0)
        return false;
    const bool ends = place.back() == '|' || place.back() == '\\' || other.size() == place.size();
    return ends || other[place.size()] == '|' || other[place.size()] == '\\';
}

}  // namespace testkit
