// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "operations.h"

#include "hive_reader.h"
#include "real_hives.h"

#include <algorithm>
#include <cstdio>
#include <stdexcept>

namespace testkit {

namespace {

using Change = std::function<int32_t(RegistryKey*)>;

std::string below(const std::string& path, const std::string& name) { return path.empty() ? name : path + "\\" + name; }

std::string first_component(const std::string& path) { return path.substr(0, path.find('\\')); }

Operation remove_value(const std::string& what, const std::string& path, const std::string& name) {
    return {what, path, [name](RegistryKey* key) { return RDeleteValue(key, name.c_str()); }, {path + "|" + name}};
}

Operation remove_key(const std::string& what, const std::string& path, const std::string& name) {
    return {what, path, [name](RegistryKey* key) { return RDeleteKey(key, name.c_str()); }, {below(path, name)}};
}

Operation set_text(const std::string& what, const std::string& path, const std::string& name, size_t characters) {
    const Change change = [=](RegistryKey* key) {
        const std::string text(characters, 't');
        return RSetValueExA(key, name.c_str(), 1, text.c_str(), static_cast<uint32_t>(text.size()) + 1);
    };
    return {what, path, change, {path + "|" + name}};
}

void fill(KeyLayout& key) {
    key.set("inline", 4, pattern(4));
    key.set("middle", 3, pattern(40));
    key.set("large", 3, pattern(120));
    key.set("last", 1, text_data("text"));
}

}  // namespace

Operation create(const std::string& what, const std::string& path, const std::string& name) {
    const Change change = [name](RegistryKey* key) {
        Handle made;
        return RCreateKey(key, name.c_str(), made.out(), nullptr);
    };
    return {what, path, change, {below(path, first_component(name))}};
}

Operation set(const std::string& what, const std::string& path, const std::string& name, uint32_t type, size_t size) {
    const Change change = [=](RegistryKey* key) {
        const Bytes data = pattern(size, 77);
        return RSetValueExW(key, name.c_str(), type, data.data(), static_cast<uint32_t>(data.size()));
    };
    return {what, path, change, {path + "|" + name}};
}

Operation rename(const std::string& what, const std::string& path, const std::string& old_name,
                 const std::string& name) {
    const Change change = [=](RegistryKey* key) {
        Handle subkey;
        uint32_t position = 0;
        const int32_t status = ROpenKeyEx(key, old_name.c_str(), subkey.out(), &position);
        subkey.reset();
        return status == R_SUCCESS ? RRenameKey(key, position, name.c_str()) : status;
    };
    return {what, path, change, {below(path, old_name), below(path, name)}};
}

HiveLayout operation_layout(Leaf leaf) {
    HiveLayout layout;
    layout.leaf = leaf;
    layout.security_records = 3;
    KeyLayout& flat = layout.root.add("Flat");
    flat.class_name = u"Flat class";
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
    KeyLayout& single = layout.root.add("Single");
    single.per_leaf = 1;
    for (const char* name : {"a", "b", "c", "d", "e"})
        single.add(name);
    KeyLayout& guarded = layout.root.add("Guarded");
    guarded.add("alone").security = 1;
    guarded.add("other").security = 2;
    layout.root.add("Emptied").add("gone");
    KeyLayout& plain = layout.root.add("Simple");
    plain.own_leaf = true;
    plain.leaf = Leaf::plain;
    for (const char* name : {"p1", "p2", "p3"})
        plain.add(name);
    KeyLayout& segments = layout.root.add("Segments");
    segments.set("big", 3, pattern(40000)).storage = Storage::big;
    segments.set("small", 3, pattern(30));
    return layout;
}

Bytes operation_hive(Leaf leaf) {
    Scene scene(operation_layout(leaf));
    if (scene.Delete("Emptied\\gone") != R_SUCCESS)
        throw std::logic_error("the leaf is not emptied");
    return scene.bytes();
}

int32_t Operation::run(RegistryKey* root) const {
    Handle handle;
    const int32_t status = ROpenKey(root, key.c_str(), handle.out());
    return status == R_SUCCESS ? change(handle.get()) : status;
}

std::vector<Operation> operations() {
    return {
        create("first subkey of a key", "Flat\\alpha", "new"),
        create("subkey into a full leaf", "Flat", "betb"),
        create("subkey ahead of all", "Parent\\branch", "a"),
        create("subkey below an index root", "Rooted", "m25"),
        create("subkey in an index leaf", "Simple", "p25"),
        create("first subkey into an emptied leaf", "Emptied", "new"),
        create("path of three", "Flat\\beta", "x\\y\\z"),
        set("new inline value", "Flat\\alpha", "new", 4, 4),
        set("new value with a cell", "Flat\\alpha", "new", 3, 200),
        set("first value of a key", "Flat", "new", 3, 60),
        set("new value that needs a bin", "Flat\\alpha", "new", 3, 20000),
        set("default value", "Flat\\alpha", "", 3, 60),
        set_text("text in 8 bits", "Flat\\alpha", "last", 60),
        set("value made larger", "Flat\\alpha", "middle", 3, 300),
        set("value made smaller", "Flat\\alpha", "large", 3, 50),
        set("value of the same size", "Flat\\alpha", "large", 3, 120),
        set("value of another type", "Flat\\alpha", "large", 1, 120),
        set("value made inline", "Flat\\alpha", "large", 4, 4),
        set("inline value made larger", "Flat\\alpha", "inline", 3, 64),
        set("value in segments replaced", "Segments", "big", 3, 900),
        set("value in segments replaced by a larger one", "Segments", "big", 3, 50000),
        remove_value("value in segments removed", "Segments", "big"),
        remove_value("first value removed", "Flat\\alpha", "inline"),
        remove_value("middle value removed", "Flat\\alpha", "middle"),
        remove_value("last value removed", "Flat\\alpha", "last"),
        remove_value("only value removed", "Parent\\other", "v"),
        remove_key("key deleted", "Flat", "beta"),
        remove_key("key deleted by a path", "Parent", "branch\\three"),
        remove_key("last user of a security record deleted", "Guarded", "alone"),
        remove_key("last key of a leaf deleted", "Flat", "gamma"),
        remove_key("key in an index leaf deleted", "Simple", "p2"),
        rename("key renamed down", "Flat", "alpha", "zeta"),
        rename("key renamed up", "Flat", "gamma", "aaa"),
        rename("key with subkeys renamed", "Parent", "branch", "zweig"),
        rename("renamed into another leaf", "Rooted", "a2", "m15"),
        rename("renamed out of a leaf of one", "Rooted", "z1", "a15"),
        rename("renamed out of a leaf of one among others", "Single", "a", "cc"),
    };
}

namespace {

// Names that the calls take as they are shown.
bool is_plain(const std::u16string& name) {
    return !name.empty() && std::all_of(name.begin(), name.end(), [](char16_t c) { return c > 0x20 && c < 0x7F; });
}

std::string narrow(const std::u16string& text) { return std::string(text.begin(), text.end()); }

bool is_plain_key(const Key& key) { return key.name_8bit && is_plain(key.name); }

// Chooses what the changes are made on: for each kind the first that will do.
class Choice {
public:
    explicit Choice(const Hive& hive) {
        for (const Key& child : hive.root.children)
            walk(child, "");
    }

    std::vector<Operation> operations;

private:
    void walk(const Key& key, const std::string& parent) {
        if (!is_plain_key(key))
            return;
        const std::string path = below(parent, narrow(key.name));
        take_values(key, path);
        take_subkeys(key, path);
        for (const Key& child : key.children)
            walk(child, path);
    }

    bool is_new(const std::string& what) {
        return std::none_of(operations.begin(), operations.end(),
                            [&](const Operation& made) { return made.name == what; });
    }

    template <typename Make, typename... Arguments>
    void add(Make make, const std::string& what, const Arguments&... arguments) {
        if (is_new(what))
            operations.push_back(make(what, arguments...));
    }

    void take_values(const Key& key, const std::string& path) {
        if (key.values.empty())
            add(set, "first value of a key", path, "first", 3U, size_t{40});
        if (key.values.size() > 1) {
            add(set, "new inline value", path, "added", 4U, size_t{4});
            add(set, "new value that needs a bin", path, "added", 3U, size_t{20000});
        }
        for (const Value& value : key.values) {
            if (!value.name_8bit || !is_plain(value.name) || !value.readable)
                continue;
            const std::string name = narrow(value.name);
            const bool segmented = value.size > 16344;
            const std::string kind = segmented ? "long value " : value.is_inline ? "inline value " : "value ";
            add(set, kind + "made larger", path, name, 3U, value.data.size() + 200);
            add(set, kind + "made inline", path, name, 4U, size_t{4});
            add(set, kind + "of the same size", path, name, value.type, value.data.size());
            add(remove_value, kind + "removed", path, name);
        }
    }

    void take_subkeys(const Key& key, const std::string& path) {
        add(create, key.children.empty() ? "first subkey" : "another subkey", path, "m new");
        for (const Key& child : key.children) {
            if (!is_plain_key(child))
                continue;
            const std::string name = narrow(child.name);
            const bool is_leaf = child.children.empty();
            add(rename, is_leaf ? "key renamed" : "key with subkeys renamed", path, name, "m other");
            if (is_leaf)
                add(remove_key, child.values.empty() ? "empty key deleted" : "key with values deleted", path, name);
        }
    }
};

}  // namespace

namespace {

bool is_named(const Operation& operation, const std::string& place) {
    return std::any_of(operation.named.begin(), operation.named.end(), [&](const std::string& name) {
        const bool begins = place.compare(0, name.size(), name) == 0;
        return begins && (place.size() == name.size() || place[name.size()] == '\\' || place[name.size()] == '|');
    });
}

bool holds(const Contents& contents, const std::string& place, const std::string& what) {
    const auto found = contents.find(place);
    return found != contents.end() && found->second == what;
}

}  // namespace

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

std::vector<Operation> operations_on(const Bytes& hive) { return Choice(read_hive(hive)).operations; }

std::vector<std::pair<std::string, Bytes>> small_real_hives() {
    constexpr size_t wanted = 3;
    std::vector<std::pair<std::string, Bytes>> hives;
    for (const RealHive& hive : real_hives()) {
        if (hive.name == "bcd" || hive.name == "sam-2016" || hive.name == "big-data")
            hives.emplace_back(hive.name, read_file(hive.path));
    }
    if (hives.size() < wanted)
        std::printf("[ LEFT OUT ] %zu of %zu small real hives\n", wanted - hives.size(), wanted);
    return hives;
}

}  // namespace testkit
