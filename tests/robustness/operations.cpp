// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "operations.h"

#include <algorithm>

namespace testkit {

namespace {

using Change = std::function<int32_t(RegistryKey*)>;

// The change made on the key at a path.
Change in(const std::string& path, Change change) {
    return [path, change = std::move(change)](RegistryKey* root) {
        Handle key;
        const int32_t status = ROpenKey(root, path.c_str(), key.out());
        return status == R_SUCCESS ? change(key.get()) : status;
    };
}

Change create(const std::string& path, const std::string& name) {
    return in(path, [name](RegistryKey* key) {
        Handle made;
        return RCreateKey(key, name.c_str(), made.out(), nullptr);
    });
}

Change set(const std::string& path, const std::string& name, uint32_t type, size_t size) {
    return in(path, [=](RegistryKey* key) {
        const Bytes data = pattern(size, 77);
        return RSetValueExW(key, name.c_str(), type, data.data(), static_cast<uint32_t>(data.size()));
    });
}

Change remove_value(const std::string& path, const std::string& name) {
    return in(path, [name](RegistryKey* key) { return RDeleteValue(key, name.c_str()); });
}

Change remove_key(const std::string& path, const std::string& name) {
    return in(path, [name](RegistryKey* key) { return RDeleteKey(key, name.c_str()); });
}

Change rename(const std::string& path, const std::string& old_name, const std::string& name) {
    return in(path, [=](RegistryKey* key) {
        Handle subkey;
        uint32_t position = 0;
        const int32_t status = ROpenKeyEx(key, old_name.c_str(), subkey.out(), &position);
        subkey.reset();
        return status == R_SUCCESS ? RRenameKey(key, position, name.c_str()) : status;
    });
}

void fill(KeyLayout& key) {
    key.set("inline", 4, pattern(4));
    key.set("middle", 3, pattern(40));
    key.set("large", 3, pattern(120));
    key.set("last", 1, text_data("text"));
}

} // namespace

HiveLayout operation_layout(Leaf leaf) {
    HiveLayout layout;
    layout.leaf = leaf;
    KeyLayout& flat = layout.root.add("Flat");
    for (const char* name : {"alpha", "beta", "delta", "gamma"})
        fill(flat.add(name));
    KeyLayout& parent = layout.root.add("Parent");
    KeyLayout& branch = parent.add("branch");
    fill(branch);
    for (const char* name : {"one", "three", "two"})
        branch.add(name);
    parent.add("other").set("v", 4, pattern(4));
    KeyLayout& rooted = layout.root.add("Rooted");
    rooted.per_leaf = 3;
    for (const char* name : {"a1", "a2", "a3", "m1", "m2", "m3", "z1"})
        fill(rooted.add(name));
    KeyLayout& plain = layout.root.add("Simple");
    plain.own_leaf = true;
    plain.leaf = Leaf::plain;
    for (const char* name : {"p1", "p2", "p3"})
        plain.add(name);
    return layout;
}

std::vector<Operation> operations() {
    return {
        {"first subkey of a key", create("Flat\\alpha", "new"), {"Flat\\alpha\\new"}},
        {"subkey into a full leaf", create("Flat", "betb"), {"Flat\\betb"}},
        {"subkey ahead of all", create("Parent\\branch", "a"), {"Parent\\branch\\a"}},
        {"subkey below an index root", create("Rooted", "m25"), {"Rooted\\m25"}},
        {"subkey in an index leaf", create("Simple", "p25"), {"Simple\\p25"}},
        {"path of three", create("Flat\\beta", "x\\y\\z"), {"Flat\\beta\\x"}},
        {"new inline value", set("Flat\\alpha", "new", 4, 4), {"Flat\\alpha|new"}},
        {"new value with a cell", set("Flat\\alpha", "new", 3, 200), {"Flat\\alpha|new"}},
        {"first value of a key", set("Flat", "new", 3, 60), {"Flat|new"}},
        {"new value that needs a bin", set("Flat\\alpha", "new", 3, 20000), {"Flat\\alpha|new"}},
        {"value made larger", set("Flat\\alpha", "middle", 3, 300), {"Flat\\alpha|middle"}},
        {"value made smaller", set("Flat\\alpha", "large", 3, 50), {"Flat\\alpha|large"}},
        {"value of the same size", set("Flat\\alpha", "large", 3, 120), {"Flat\\alpha|large"}},
        {"value of another type", set("Flat\\alpha", "large", 1, 120), {"Flat\\alpha|large"}},
        {"value made inline", set("Flat\\alpha", "large", 4, 4), {"Flat\\alpha|large"}},
        {"inline value made larger", set("Flat\\alpha", "inline", 3, 64), {"Flat\\alpha|inline"}},
        {"first value removed", remove_value("Flat\\alpha", "inline"), {"Flat\\alpha|inline"}},
        {"middle value removed", remove_value("Flat\\alpha", "middle"), {"Flat\\alpha|middle"}},
        {"last value removed", remove_value("Flat\\alpha", "last"), {"Flat\\alpha|last"}},
        {"only value removed", remove_value("Parent\\other", "v"), {"Parent\\other|v"}},
        {"key deleted", remove_key("Flat", "beta"), {"Flat\\beta"}},
        {"last key of a leaf deleted", remove_key("Flat", "gamma"), {"Flat\\gamma"}},
        {"key in an index leaf deleted", remove_key("Simple", "p2"), {"Simple\\p2"}},
        {"key renamed down", rename("Flat", "alpha", "zeta"), {"Flat\\alpha", "Flat\\zeta"}},
        {"key renamed up", rename("Flat", "gamma", "aaa"), {"Flat\\gamma", "Flat\\aaa"}},
        {"key with subkeys renamed", rename("Parent", "branch", "zweig"), {"Parent\\branch", "Parent\\zweig"}},
        {"renamed into another leaf", rename("Rooted", "a2", "m15"), {"Rooted\\a2", "Rooted\\m15"}},
        {"renamed out of a leaf of one", rename("Rooted", "z1", "a15"), {"Rooted\\z1", "Rooted\\a15"}},
    };
}

namespace {

constexpr uint32_t name_room = 600;

class Reading {
public:
    explicit Reading(Contents& out) : out_(out) {}

    void key(RegistryKey* handle, const std::string& path) {
        put(path, "key");
        uint32_t subkeys = 0;
        uint32_t values = 0;
        if (RQueryInfoKeyA(handle, nullptr, nullptr, nullptr, nullptr, &subkeys, nullptr, nullptr, &values, nullptr,
                           nullptr, nullptr, nullptr) != R_SUCCESS)
            why += path + ": cannot be queried\n";
        for (uint32_t i = 0; i < values; i++)
            value(handle, path, i);
        for (uint32_t i = 0; i < subkeys; i++) {
            std::string name(name_room, '\0');
            uint32_t size = name_room;
            Handle child;
            if (REnumKeyExA(handle, i, name.data(), &size, nullptr, nullptr, nullptr) != R_SUCCESS ||
                ROpenSubKey(handle, i, child.out()) != R_SUCCESS)
                why += path + ": subkey " + std::to_string(i) + " cannot be opened\n";
            else
                key(child.get(), path.empty() ? name.c_str() : path + "\\" + name.c_str());
        }
    }

    std::string why;

private:
    void value(RegistryKey* handle, const std::string& path, uint32_t i) {
        std::string name(name_room, '\0');
        uint32_t name_size = name_room;
        uint32_t type = 0;
        uint32_t size = 0;
        if (REnumValueA(handle, i, name.data(), &name_size, &type, nullptr, &size) != R_SUCCESS) {
            why += path + ": value " + std::to_string(i) + " cannot be read\n";
            return;
        }
        std::string data(size + 1, '\0');
        uint32_t room = size;
        if (REnumValueW(handle, i, nullptr, nullptr, nullptr, data.data(), &room) != R_SUCCESS)
            why += path + "|" + name.c_str() + ": its data cannot be read\n";
        data.resize(size);
        put(path + "|" + name.c_str(), std::to_string(type) + ":" + data);
    }

    void put(const std::string& place, const std::string& what) {
        if (!out_.emplace(place, what).second)
            why += place + " is there twice\n";
    }

    Contents& out_;
};

bool is_named(const Operation& operation, const std::string& place) {
    return std::any_of(operation.named.begin(), operation.named.end(), [&](const std::string& prefix) {
        return place.compare(0, prefix.size(), prefix) == 0;
    });
}

bool holds(const Contents& contents, const std::string& place, const std::string& what) {
    const auto found = contents.find(place);
    return found != contents.end() && found->second == what;
}

} // namespace

Contents contents(const Bytes& bytes, std::string& why) {
    Contents all;
    MemoryFile file(bytes);
    file.read_only = true;
    const RegistryIo io = file.io();
    RegistryKey* root = ROpenHive(&io);
    if (root == nullptr) {
        why = "the hive does not open";
        return all;
    }
    Reading reading(all);
    reading.key(root, "");
    why = reading.why;
    if (RCloseKey(root) != R_SUCCESS)
        why += "the hive does not close";
    return all;
}

std::string harm(const Operation& operation, const Contents& before, const Contents* after, const Bytes& bytes) {
    std::string text;
    const Contents now = contents(bytes, text);
    for (const auto& [place, what] : before) {
        if (!is_named(operation, place) && !holds(now, place, what))
            text += place + " is not as it was\n";
    }
    for (const auto& [place, what] : now) {
        if (!is_named(operation, place)) {
            if (before.find(place) == before.end())
                text += place + " has appeared\n";
        } else if (after != nullptr && !holds(before, place, what) && !holds(*after, place, what)) {
            text += place + " is neither as before nor as after\n";
        }
    }
    return text;
}

} // namespace testkit
