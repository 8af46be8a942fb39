// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// The N-th read, seek or allocation of every call that only reads fails: a status says so, nothing is
// written, and the same handles answer as before afterwards.
#include "alloc_faults.h"
#include "failure_mode.h"
#include "operations.h"
#include "statuses.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <map>

namespace {

using namespace testkit;
using Call = MemoryFile::Call;

// Every answer in turn, with its status. What is asked for has a name of its own.
class Transcript {
public:
    // Whatever is added next is asked of this.
    void about(const std::string& what) { about_ = what; }
    void add(const char* call, int32_t status, const std::string& answer = {}) {
        const std::string question = about_ + ": " + call;
        text_ += question + " " + std::to_string(status) + " " + (status == R_SUCCESS ? answer : "") + "\n";
        if (!is_in_table(status))
            strange_ += question + " " + std::to_string(status) + "\n";
        if (status == R_SUCCESS)
            answers_[question] = answer;
    }
    const std::string& text() const { return text_; }
    const std::string& strange() const { return strange_; }  // statuses that no call may give
    // The questions that were answered, and otherwise than there.
    std::string untrue(const Transcript& there) const {
        std::string questions;
        for (const auto& [question, answer] : answers_) {
            const auto known = there.answers_.find(question);
            if (known == there.answers_.end() || known->second != answer)
                questions += question + " " + answer.substr(0, 60) + "\n";
        }
        return questions;
    }

private:
    std::string about_;
    std::string text_;
    std::string strange_;
    std::map<std::string, std::string> answers_;
};

template <typename Buffer>
std::string taken(const Buffer& buffer, uint32_t size) {
    const auto* bytes = reinterpret_cast<const char*>(buffer);
    return std::string(bytes, size) + " (" + std::to_string(size) + ")";
}

void query_key(RegistryKey* key, Transcript& out) {
    char name[600] = {};
    uint16_t wide_name[600] = {};
    char class_name[600] = {};
    uint32_t size = sizeof name;
    uint32_t wide_size = sizeof wide_name;
    uint32_t class_size = sizeof class_name;
    uint32_t n[6] = {};
    RegistryTime time = {};
    int32_t status = RQueryInfoKeyA(key, name, &size, class_name, &class_size, &n[0], &n[1], &n[2], &n[3], &n[4], &n[5],
                                    nullptr, &time);
    out.add("RQueryInfoKeyA", status, taken(name, size) + taken(n, sizeof n));
    uint32_t security = 0;
    status = RQueryInfoKeyW(key, wide_name, &wide_size, nullptr, nullptr, &n[0], &n[1], &n[2], &n[3], &n[4], &n[5],
                            &security, &time);
    out.add("RQueryInfoKeyW", status, taken(wide_name, wide_size) + taken(n, sizeof n) + std::to_string(security));
}

void enumerate_keys(RegistryKey* key, Transcript& out) {
    for (uint32_t i = 0; i < 3; i++) {
        out.about("subkey " + std::to_string(i));
        char name[600] = {};
        char class_name[600] = {};
        uint32_t size = sizeof name;
        uint32_t class_size = sizeof class_name;
        uint32_t subkeys = 0;
        RegistryTime time = {};
        int32_t status = REnumKeyInfoA(key, i, name, &size, &subkeys, class_name, &class_size, &time);
        out.add("REnumKeyInfoA", status, taken(name, size) + std::to_string(subkeys) + taken(class_name, class_size));
        size = sizeof name;
        status = REnumKeyExA(key, i, name, &size, nullptr, nullptr, &time);
        out.add("REnumKeyExA", status, taken(name, size));
        Handle child;
        status = ROpenSubKey(key, i, child.out());
        out.add("ROpenSubKey", status);
        if (status == R_SUCCESS)
            query_key(child.get(), out);
        out.add("RCheckDeleteTree", RCheckDeleteTree(key, i));
    }
}

void enumerate_values(const std::string& handle, RegistryKey* key, Transcript& out) {
    std::vector<char> data(70000);
    const auto room = static_cast<uint32_t>(data.size());  // a call may hand back the size of what did not fit
    for (uint32_t i = 0; i < 4; i++) {
        out.about(handle + ", value " + std::to_string(i));
        char name[600] = {};
        uint16_t wide_name[600] = {};
        uint32_t name_size = sizeof name;
        uint32_t wide_size = sizeof wide_name;
        uint32_t type = 0;
        uint32_t size = room;
        int32_t status = REnumValueA(key, i, name, &name_size, &type, data.data(), &size);
        out.add("REnumValueA", status, taken(name, name_size) + taken(data.data(), std::min(size, room)));
        size = room;
        status = REnumValueW(key, i, wide_name, &wide_size, &type, data.data(), &size);
        out.add("REnumValueW", status, taken(wide_name, wide_size) + taken(data.data(), std::min(size, room)));
        if (status != R_SUCCESS)
            continue;  // the name is not known
        const int32_t position = RFindValueA(key, name);
        out.add("RFindValueA", position < 0 ? -1 : 0, std::to_string(position));
        size = room;
        status = RQueryValueExA(key, name, &type, data.data(), &size);
        out.add("RQueryValueExA", status, taken(data.data(), std::min(size, room)));
        size = room;
        status = RQueryValueExW(key, name, &type, data.data(), &size);
        out.add("RQueryValueExW", status, taken(data.data(), std::min(size, room)));
    }
}

// Two keys of a hive, held open, and every reading call on them.
struct Reader {
    Reader(const Bytes& bytes, std::string where) : scene(bytes), path(std::move(where)), held(scene.OpenKey(path)) {}

    Transcript read() {
        Transcript out;
        const RegistryIo io = scene.file().io();
        scene.file().rewind();
        RegistryKey* other = ROpenHive(&io);
        out.add("ROpenHive", other != nullptr ? R_SUCCESS : R_FAILED);
        if (other != nullptr)
            out.add("RCloseKey", RCloseKey(other));
        Handle again;
        uint32_t position = 0;
        const int32_t status = ROpenKeyEx(scene.root(), path.c_str(), again.out(), &position);
        out.add("ROpenKeyEx", status, std::to_string(position));
        if (status == R_SUCCESS)
            enumerate_values("new handle", again.get(), out);
        out.about("held handle");
        query_key(held.get(), out);
        enumerate_keys(held.get(), out);
        enumerate_values("held handle", held.get(), out);
        return out;
    }

    Scene scene;
    std::string path;
    Handle held;
};

struct Place {
    std::string name;
    Bytes bytes;
    std::string path;
};

// Every cell that a key leads to is far from its record, so that a window does not hold both.
Bytes far_apart() {
    HiveLayout layout;
    KeyLayout& parent = layout.root.add("Far");
    parent.add("a");
    const auto big_step = [](KeyLayout& key) { key.set("step", 3, pattern(20000)).storage = Storage::cell; };
    KeyLayout& steps = layout.root.add("Steps");
    for (const char* name : {"ahead", "class", "index", "list"}) {
        big_step(steps.add(std::string(name) + " step"));
        steps.children.back().add("child").set("v", 3, pattern(60));
        steps.children.back().class_name = u"Klass";
    }
    LaidHive hive = lay_out(layout);
    const uint32_t key = hive.at("Far\\a").record;
    const auto borrow = [&](uint32_t field, uint32_t cell) { hive.put32(key, field, cell); };
    hive.put16(key, 74, 10);
    borrow(48, hive.at("Steps\\class step").class_cell);
    hive.put32(key, 20, 1);
    borrow(28, hive.at("Steps\\index step").index);
    hive.put32(key, 36, 1);
    borrow(40, hive.at("Steps\\list step\\child").value_list);
    return hive.bytes;
}

std::vector<Place> made_places() {
    const Bytes bytes = operation_hive(Leaf::hash);
    std::vector<Place> places = {{"far apart", far_apart(), "Far"}, {"far apart, itself", far_apart(), "Far\\a"}};
    for (const char* path : {"Flat", "Flat\\alpha", "Parent", "Rooted", "Simple", "Segments"})
        places.push_back({path, bytes, path});
    return places;
}

// In real hives, the keys that a change can be made on: they have values, subkeys or both.
std::vector<Place> real_places() {
    std::vector<Place> places;
    for (const auto& [name, bytes] : small_real_hives()) {
        std::string last;
        for (const Operation& operation : operations_on(bytes)) {
            if (operation.key != last)
                places.push_back({name + ": " + operation.key, bytes, operation.key});
            last = operation.key;
        }
    }
    return places;
}

void sweep(const std::vector<Place>& places, const FailureMode& mode) {
    for (const Place& place : places) {
        Reader reader(place.bytes, place.path);
        ASSERT_TRUE(reader.held);
        const Transcript wanted = reader.read();
        for (uint64_t nth = 1;; nth++) {
            SCOPED_TRACE(place.name + ", call " + std::to_string(nth));
            reader.scene.file().arm({mode.call, nth, mode.lasting, mode.shortened});
            const Transcript faulty = reader.read();
            const bool struck = reader.scene.file().failed();
            reader.scene.file().disarm();
            EXPECT_EQ(faulty.strange(), "");
            EXPECT_TRUE(reader.scene.Untouched());
            ASSERT_EQ(reader.read().text(), wanted.text()) << "after the failure";
            EXPECT_EQ(faulty.untrue(wanted), "");
            if (!struck) {
                EXPECT_EQ(faulty.text(), wanted.text());
                EXPECT_GT(nth, 1U);
                break;
            }
        }
    }
}

class ReadingFaults : public testing::TestWithParam<FailureMode> {};

TEST_P(ReadingFaults, HandlesAnswerAsBeforeAfterwards) { sweep(made_places(), GetParam()); }

TEST_P(ReadingFaults, HandlesOfRealHivesAnswerAsBeforeAfterwards) { sweep(real_places(), GetParam()); }

INSTANTIATE_TEST_SUITE_P(Calls, ReadingFaults,
                         testing::Values(FailureMode{"ReadOnce", Call::read, false, false},
                                         FailureMode{"ReadFromThereOn", Call::read, true, false},
                                         FailureMode{"ReadShort", Call::read, false, true},
                                         FailureMode{"ReadShortFromThereOn", Call::read, true, true},
                                         FailureMode{"SeekOnce", Call::seek, false, false},
                                         FailureMode{"SeekFromThereOn", Call::seek, true, false}),
                         [](const auto& mode) { return mode.param.name; });

void sweep_without_memory(const std::vector<Place>& places) {
    for (const Place& place : places) {
        Reader reader(place.bytes, place.path);
        ASSERT_TRUE(reader.held);
        const Transcript wanted = reader.read();
        for (const bool lasting : {false, true}) {
            for (uint64_t nth = 1;; nth++) {
                SCOPED_TRACE(place.name + ", allocation " + std::to_string(nth));
                // Not inside the faults: the transcript itself allocates by other means than malloc of this
                // program.
                Transcript faulty;
                bool struck = false;
                {
                    const AllocationFaults faults(nth, lasting);
                    faulty = reader.read();
                    struck = faults.failed();
                }
                EXPECT_EQ(faulty.strange(), "");
                EXPECT_EQ(faulty.untrue(wanted), "");
                ASSERT_EQ(reader.read().text(), wanted.text()) << "after the failure";
                if (!struck) {
                    EXPECT_GT(nth, 1U);
                    break;
                }
            }
        }
        EXPECT_TRUE(reader.scene.Untouched());
    }
}

TEST(ReadingWithoutMemory, HandlesAnswerAsBeforeAfterwards) { sweep_without_memory(made_places()); }

TEST(ReadingWithoutMemory, HandlesOfRealHivesAnswerAsBeforeAfterwards) { sweep_without_memory(real_places()); }

// One short read is no end of the file: what lies behind it in the window is read all the same.
TEST(ReadingFaults, AShortReadHidesNothingBehindIt) {
    Reader reader(operation_hive(Leaf::hash), "Rooted");
    const std::string wanted = reader.read().text();
    // The first is of the four bytes that every hive begins with; the second fills the window.
    reader.scene.file().arm({Call::read, 2, false, true});
    EXPECT_EQ(reader.read().text(), wanted);
    EXPECT_TRUE(reader.scene.file().failed());
}

// A key whose lists the device fails to deliver would pass for one without values and subkeys.
TEST(ReadingFaults, AKeyWhoseListsTheDeviceFailsToReadIsNotOpenedEmpty) {
    const Bytes bytes = operation_hive(Leaf::hash);
    for (uint64_t nth = 1;; nth++) {
        Scene scene(bytes);
        scene.file().arm({Call::read, nth, false, false});
        const Handle key = scene.OpenKey("Flat\\alpha");
        if (key) {
            uint32_t values = 0;
            RQueryInfoKeyA(key.get(), nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, &values, nullptr,
                           nullptr, nullptr, nullptr);
            EXPECT_EQ(values, 4U) << "read " << nth;
        }
        if (!scene.file().failed()) {
            EXPECT_GT(nth, 1U);
            break;
        }
    }
}

}  // namespace
