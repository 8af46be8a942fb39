// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "fuzz_hive.h"
#include "hive_checker.h"

#include <cstdio>
#include <cstdlib>
#include <string>

namespace {

// Takes numbers from the script, zeros when it is at its end.
class Script {
public:
    Script(const uint8_t* bytes, size_t size) : bytes_(bytes), size_(size) {}

    bool at_end() const { return next_ >= size_; }
    uint8_t take() { return at_end() ? uint8_t{0} : bytes_[next_++]; }

private:
    const uint8_t* bytes_;
    size_t size_;
    size_t next_ = 0;
};

std::string subkey_name(RegistryKey* key, uint32_t index) {
    char name[300] = {};
    uint32_t size = sizeof name - 1;
    REnumKeyExA(key, index, name, &size, nullptr, nullptr, nullptr);
    return name;
}

std::string value_name(RegistryKey* key, uint32_t index) {
    char name[300] = {};
    uint32_t size = sizeof name - 1;
    REnumValueA(key, index, name, &size, nullptr, nullptr, nullptr);
    return name;
}

// A name of the script's own, or one that a value of the key has.
std::string chosen_name(RegistryKey* key, uint8_t choice) {
    static const char* const names[] = {"a", "B", "New Key #1", "zz", "_", "m\\n", "control", ""};
    constexpr uint8_t count = sizeof names / sizeof names[0];
    return choice % (2 * count) < count ? names[choice % count] : value_name(key, choice / (2 * count));
}

void change(RegistryKey* key, Script& script) {
    static const uint32_t sizes[] = {0, 1, 4, 5, 16, 100, 4090, 17000};
    static const uint8_t data[17000] = {1, 2, 3};
    const uint8_t what = script.take();
    const std::string chosen = chosen_name(key, script.take());
    const char* const name = chosen.c_str();
    const uint8_t number = script.take();
    RegistryKey* made = nullptr;
    switch (what % 6) {
    case 0:
        RCreateKey(key, name, &made, nullptr);
        break;
    case 1:
        RSetValueExW(key, name, number, data, sizes[number % 8]);
        break;
    case 2:
        RDeleteValue(key, name);
        break;
    case 3:
        RRenameKey(key, number, name);
        break;
    case 4:
        RDeleteKey(key, subkey_name(key, number).c_str());
        break;
    default:
        RCheckDeleteTree(key, number);
        break;
    }
    if (made != nullptr)
        RCloseKey(made);
}

// Makes changes in keys that are reached by going down from the root.
void run_script(RegistryKey* root, Script& script) {
    for (int steps = 0; steps < 16 && !script.at_end(); steps++) {
        RegistryKey* here = root;
        for (int depth = script.take() % 4; depth > 0; depth--) {
            RegistryKey* below = nullptr;
            const int32_t status = ROpenSubKey(here, script.take(), &below);
            if (status != R_SUCCESS)
                break;
            if (here != root)
                RCloseKey(here);
            here = below;
        }
        change(here, script);
        if (here != root)
            RCloseKey(here);
    }
}

}  // namespace

void fuzz::edit_input(const uint8_t* data, size_t size) {
    if (size < script_size)
        return;
    const size_t hive_size = size - script_size;
    testkit::MemoryFile file(testkit::Bytes(data, data + hive_size));
    const RegistryIo io = file.io();
    RegistryKey* root = ROpenHive(&io);
    if (root == nullptr)
        return;
    const bool was_sound = testkit::check_hive(file.bytes).faults.empty();
    Script script(data + hive_size, script_size);
    run_script(root, script);
    read_everything(root, file.bytes.size());
    if (RCloseKey(root) != R_SUCCESS)
        std::abort();
    const testkit::CheckResult after = testkit::check_hive(file.bytes);
    if (was_sound && !after.faults.empty()) {
        std::fprintf(stderr, "a sound hive was broken:\n%s\n", after.text().c_str());
        std::abort();
    }
    file.rewind();
    root = ROpenHive(&io);
    if (root == nullptr) {
        std::fprintf(stderr, "the hive does not open any more\n");
        std::abort();
    }
    RCloseKey(root);
}
