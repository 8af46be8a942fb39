// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// The N-th read, write, seek or allocation of a change fails, for every N until none does.
#include "alloc_faults.h"
#include "failure_mode.h"
#include "operations.h"
#include "sanitized.h"
#include "statuses.h"

#include <gtest/gtest.h>

namespace {

using namespace testkit;
using Call = MemoryFile::Call;

// Changes that need a key's cell, a value's, a list's and a new bin: where each goes shows what the engine
// remembers.
std::vector<int32_t> probe(RegistryKey* root) {
    Handle key;
    std::vector<int32_t> statuses = {RCreateKey(root, "Probe", key.out(), nullptr)};
    for (const uint32_t size : {8U, 60U, 700U, 9000U}) {
        const Bytes data = pattern(size);
        const std::string name = "v" + std::to_string(size);
        statuses.push_back(RSetValueExW(key.get(), name.c_str(), 3, data.data(), size));
    }
    return statuses;
}

struct Expectation {
    Operation operation;
    Bytes start;
    CheckResult checked;  // the start
    Contents before;
    Contents after;
};

// The operations with what they do undisturbed.
std::vector<Expectation> expectations(const Bytes& start, const std::vector<Operation>& operations) {
    std::vector<Expectation> all;
    for (const Operation& operation : operations) {
        SCOPED_TRACE(operation.name);
        Expectation expected{operation, start, check_hive(start), {}, {}};
        std::string why;
        expected.before = contents(start, why);
        EXPECT_EQ(why, "");
        Scene scene(start);
        EXPECT_EQ(operation.run(scene.root()), R_SUCCESS);
        expected.after = contents(scene.bytes(), why);
        EXPECT_EQ(why, "");
        EXPECT_TRUE(expected.before != expected.after);
        all.push_back(std::move(expected));
    }
    return all;
}

std::vector<Expectation> made_expectations() { return expectations(operation_hive(Leaf::hash), operations()); }

// What is left of the change names the probe too.
Operation with_probe(const Operation& operation) {
    Operation both = operation;
    both.named.push_back("Probe");
    return both;
}

// What the live handles say against what the file says to whoever opens it now.
void compare_with_file(const Expectation& expected, Scene& scene, RegistryKey* handle) {
    std::string why;
    std::string fresh_why;
    EXPECT_EQ(contents(scene.root(), "", why), contents(scene.bytes(), fresh_why)) << why << fresh_why;
    EXPECT_EQ(why, fresh_why);

    Scene fresh(scene.bytes());
    ASSERT_TRUE(fresh.is_open());
    const std::string& path = expected.operation.key;
    const Handle same = fresh.OpenKey(path);
    ASSERT_TRUE(same);
    EXPECT_EQ(contents(handle, path, why), contents(same.get(), path, fresh_why)) << "the handle of the call";
    EXPECT_EQ(why, fresh_why);
}

// Whoever changes the hive next, through the live handles or a fresh opening, stores the same.
void compare_next_changes(const Expectation& expected, Scene& scene) {
    Scene fresh(scene.bytes());
    ASSERT_TRUE(fresh.is_open());
    const std::vector<int32_t> statuses = probe(scene.root());
    EXPECT_EQ(statuses, probe(fresh.root()));
    EXPECT_EQ(statuses, std::vector<int32_t>(statuses.size(), R_SUCCESS)) << "after the failure";
    EXPECT_TRUE(scene.bytes() == fresh.bytes()) << "the next changes go to other places than after a fresh opening";
    EXPECT_EQ(harm(with_probe(expected.operation), expected.before, nullptr, scene.bytes()), "");
}

void check_outcome(const Expectation& expected, Scene& scene, Handle& handle, int32_t status, bool lasting) {
    EXPECT_TRUE(is_in_table(status)) << "status " << status;
    EXPECT_EQ(harm(expected.operation, expected.before, nullptr, scene.bytes()), "");
    if (status == R_SUCCESS) {
        std::string why;
        EXPECT_EQ(contents(scene.bytes(), why), expected.after) << why;
        // A security record may say one key too many, which only keeps it longer. Where nothing can be written any
        // more, it may be out of its ring on one side, and a count be one above its list.
        for (const Fault& fault : new_faults(expected.checked, scene.Examine())) {
            const bool unfinished = fault.rule == "ring" || fault.rule == "count";
            EXPECT_TRUE(fault.rule == "references" || (unfinished && lasting)) << fault.text;
        }
    }
    compare_with_file(expected, scene, handle.get());
    compare_next_changes(expected, scene);
    handle.reset();
    EXPECT_EQ(scene.Close(), R_SUCCESS);
}

// Fails the calls of each change in turn, under a sanitizer every third; gives how often one failed.
uint64_t sweep(const std::vector<Expectation>& all, const FailureMode& mode) {
    constexpr uint64_t step = is_sanitized ? 3 : 1;
    uint64_t struck_times = 0;
    for (const Expectation& expected : all) {
        for (uint64_t nth = 1;; nth += step) {
            SCOPED_TRACE(expected.operation.name + ", call " + std::to_string(nth));
            Scene scene(expected.start);
            Handle handle = scene.OpenKey(expected.operation.key);
            scene.file().arm({mode.call, nth, mode.lasting, mode.shortened});
            const int32_t status = expected.operation.change(handle.get());
            const bool struck = scene.file().failed();
            scene.file().disarm();
            check_outcome(expected, scene, handle, status, mode.lasting);
            if (testing::Test::HasFailure())
                return struck_times;
            if (!struck) {
                EXPECT_EQ(status, R_SUCCESS);
                break;
            }
            struck_times++;
        }
    }
    return struck_times;
}

class Faults : public testing::TestWithParam<FailureMode> {};

TEST_P(Faults, NothingElseIsHarmed) {
    const std::vector<Expectation> all = made_expectations();
    EXPECT_GT(sweep(all, GetParam()), all.size());
}

TEST_P(Faults, NothingElseIsHarmedInRealHives) {
    auto hives = small_real_hives();
    if (is_sanitized && hives.size() > 1) {  // one will do to show what the sanitizers see
        std::printf("[ LEFT OUT ] %zu of %zu small real hives\n", hives.size() - 1, hives.size());
        hives.resize(1);
    }
    for (const auto& [name, bytes] : hives) {
        SCOPED_TRACE(name);
        const std::vector<Expectation> all = expectations(bytes, operations_on(bytes));
        EXPECT_GE(all.size(), 7U);
        EXPECT_GT(sweep(all, GetParam()), all.size());
    }
}

INSTANTIATE_TEST_SUITE_P(Calls, Faults,
                         testing::Values(FailureMode{"ReadOnce", Call::read, false, false},
                                         FailureMode{"ReadFromThereOn", Call::read, true, false},
                                         FailureMode{"ReadShort", Call::read, false, true},
                                         FailureMode{"ReadShortFromThereOn", Call::read, true, true},
                                         FailureMode{"WriteOnce", Call::write, false, false},
                                         FailureMode{"WriteFromThereOn", Call::write, true, false},
                                         FailureMode{"WriteShort", Call::write, false, true},
                                         FailureMode{"WriteShortFromThereOn", Call::write, true, true},
                                         FailureMode{"SeekOnce", Call::seek, false, false},
                                         FailureMode{"SeekFromThereOn", Call::seek, true, false}),
                         [](const auto& mode) { return mode.param.name; });

// The same with requests for memory.
uint64_t sweep_allocations(const std::vector<Expectation>& all, bool lasting) {
    uint64_t struck_times = 0;
    for (const Expectation& expected : all) {
        for (uint64_t nth = 1;; nth++) {
            SCOPED_TRACE(expected.operation.name + ", allocation " + std::to_string(nth));
            Scene scene(expected.start);
            Handle handle = scene.OpenKey(expected.operation.key);
            int32_t status = 0;
            bool struck = false;
            {
                const AllocationFaults faults(nth, lasting);
                status = expected.operation.change(handle.get());
                struck = faults.failed();
            }
            check_outcome(expected, scene, handle, status, lasting);
            if (testing::Test::HasFailure())
                return struck_times;
            if (!struck) {
                EXPECT_EQ(status, R_SUCCESS);
                break;
            }
            struck_times++;
        }
    }
    return struck_times;
}

class AllocationFaultSweep : public testing::TestWithParam<bool> {};

TEST_P(AllocationFaultSweep, NothingElseIsHarmed) {
    const std::vector<Expectation> all = made_expectations();
    EXPECT_GT(sweep_allocations(all, GetParam()), all.size());
}

TEST_P(AllocationFaultSweep, NothingElseIsHarmedInRealHives) {
    for (const auto& [name, bytes] : small_real_hives()) {
        SCOPED_TRACE(name);
        const std::vector<Expectation> all = expectations(bytes, operations_on(bytes));
        EXPECT_GT(sweep_allocations(all, GetParam()), all.size());
    }
}

INSTANTIATE_TEST_SUITE_P(Once, AllocationFaultSweep, testing::Values(false, true),
                         [](const auto& mode) { return mode.param ? "FromThereOn" : "Once"; });

// The walk that follows a write finds out what is free in the bin. When it fails, that is made up for later,
// or the next change would append a bin although there is room.
TEST(FailedWalk, TheBinsFreeSpaceIsUsedAgain) {
    HiveLayout layout;  // all that is free lies in a bin of its own
    layout.root.add("Key").set("inline", 4, pattern(4));
    layout.no_free_space = true;
    layout.free_bytes = 2000;
    for (uint64_t nth = 1;; nth++) {
        SCOPED_TRACE(nth);
        Scene scene(layout);
        const Handle key = scene.OpenKey("Key");
        scene.file().arm({Call::read, nth, true, false});
        const Bytes data = pattern(40);
        RSetValueExW(key.get(), "first", 3, data.data(), 40);
        const bool struck = scene.file().failed();
        scene.file().disarm();
        const size_t size = scene.bytes().size();
        EXPECT_EQ(scene.Set("Key", "second", 3, data), R_SUCCESS);
        EXPECT_EQ(scene.bytes().size(), size);
        if (!struck) {
            EXPECT_GT(nth, 1U);
            break;
        }
    }
}

// A key is made, and then there is no memory to read the parent's list again: the parent's handle shows it
// all the same.
TEST(FailedAllocation, AHandleCountsTheKeyThatItMade) {
    for (uint64_t nth = 1;; nth++) {
        SCOPED_TRACE(nth);
        Scene scene(operation_hive(Leaf::hash));
        Handle key = scene.OpenKey("Rooted");
        const size_t before = subkey_names(key.get()).size();
        bool struck = false;
        {
            const AllocationFaults faults(nth);
            Handle made;
            RCreateKey(key.get(), "m25", made.out(), nullptr);
            struck = faults.failed();
        }
        const bool is_there = static_cast<bool>(scene.OpenKey("Rooted\\m25"));
        EXPECT_EQ(subkey_names(key.get()).size(), before + (is_there ? 1 : 0));
        if (!struck) {
            EXPECT_GT(nth, 1U);
            break;
        }
    }
}

// The caller would take the name for free, and store over the value.
TEST(FailedAllocation, AHandleThatCouldNotTakeInItsValueDoesNotSayThatItIsNotThere) {
    bool stored_and_not_taken_in = false;
    for (uint64_t nth = 1, struck = 1; struck != 0; nth++) {
        SCOPED_TRACE(nth);
        Scene scene(operation_hive(Leaf::hash));
        const Handle key = scene.OpenKey("Rooted");  // its index takes memory
        const Bytes data = pattern(40);
        int32_t stored = R_FAILED;
        int32_t found = R_FAILED;
        {
            const AllocationFaults faults(nth, true);
            stored = RSetValueExW(key.get(), "fresh", 3, data.data(), 40);
            found = RQueryValueExA(key.get(), "fresh", nullptr, nullptr, nullptr);
            struck = faults.failed() ? 1 : 0;
        }
        if (stored == R_SUCCESS) {
            EXPECT_NE(found, R_FILE_NOT_FOUND);
            stored_and_not_taken_in = stored_and_not_taken_in || struck != 0;
        }
    }
    EXPECT_TRUE(stored_and_not_taken_in);
}

// The same where it is the first value, and nothing can be read any more.
TEST(FailedRead, DoesNotHideTheFirstValueFromTheHandleThatStoredIt) {
    HiveLayout layout;
    layout.root.add("Top");
    layout.root.add("Zzz").set("far", 3, pattern(240000));
    const Bytes start = lay_out(layout).bytes;
    bool stored_and_not_taken_in = false;
    bool struck = true;
    for (uint64_t nth = 1; struck; nth++) {
        SCOPED_TRACE(nth);
        Scene scene(start);
        const Handle key = scene.OpenKey("Top");
        const Bytes data = pattern(40);
        scene.file().arm({Call::read, nth, true, false});
        const int32_t stored = RSetValueExW(key.get(), "fresh", 3, data.data(), 40);
        const int32_t found = RQueryValueExW(key.get(), "fresh", nullptr, nullptr, nullptr);
        struck = scene.file().failed();
        if (stored == R_SUCCESS) {
            EXPECT_NE(found, R_FILE_NOT_FOUND);
            stored_and_not_taken_in = stored_and_not_taken_in || struck;
        }
    }
    EXPECT_TRUE(stored_and_not_taken_in);
}

// A name too long for the stack takes memory to compare.
TEST(FailedAllocation, LeavesTheSecondOfTwoValuesOfOneLongNameAlone) {
    const std::string name(600, 'n');
    HiveLayout layout;
    KeyLayout& top = layout.root.add("Top");
    top.set(name, 3, pattern(100, 5));
    top.set(name.substr(1) + "m", 3, pattern(100, 9));
    LaidHive laid = lay_out(layout);
    laid.bytes[LaidHive::position(laid.at("Top").values[1].record, 20) + name.size() - 1] = 'n';
    for (const bool is_removal : {true, false}) {
        bool struck = true;
        for (uint64_t nth = 1; struck; nth++) {
            SCOPED_TRACE(nth);
            Scene scene(laid.bytes);
            const Handle key = scene.OpenKey("Top");
            {
                const AllocationFaults faults(nth);
                if (is_removal)
                    RDeleteValue(key.get(), name.c_str());
                else
                    RSetValueExW(key.get(), name.c_str(), 3, "new", 3);
                struck = faults.failed();
            }
            const Hive hive = scene.Read();
            const auto& values = hive.find("Top")->values;
            EXPECT_TRUE(std::any_of(values.begin(), values.end(),
                                    [](const Value& value) { return value.data == pattern(100, 9); }));
            EXPECT_TRUE(struck || nth > 1);
        }
    }
}

// What is refused, or there already, stays so when a failed read hides why: no second key of one name, no key gone that
// has subkeys.
TEST(FailedRead, LetsNothingPassThatIsRefused) {
    const std::vector<Operation> refused = {
        {"a key that is there",
         "Rooted",
         [](RegistryKey* key) {
             Handle made;
             uint32_t disposition = 0;
             const int32_t status = RCreateKey(key, "m2", made.out(), &disposition);
             return status == R_SUCCESS && disposition == 1 ? int32_t{R_FAILED} : status;
         },
         {}},
        {"a sibling's name", "Flat", [](RegistryKey* key) { return RRenameKey(key, 0, "gamma"); }, {}},
        {"a sibling's name in another leaf", "Rooted", [](RegistryKey* key) { return RRenameKey(key, 0, "z1"); }, {}},
        {"a key with subkeys", "Parent", [](RegistryKey* key) { return RDeleteKey(key, "branch"); }, {}},
        {"a key below an index root", "Rooted", [](RegistryKey* key) { return RDeleteKey(key, "m2"); }, {}},
        {"a value that is not there", "Flat\\alpha", [](RegistryKey* key) { return RDeleteValue(key, "none"); }, {}},
    };
    const Bytes start = operation_hive(Leaf::hash);
    for (const Operation& operation : refused) {
        for (const bool lasting : {false, true}) {
            for (uint64_t nth = 1;; nth++) {
                SCOPED_TRACE(operation.name + ", read " + std::to_string(nth));
                Scene scene(start);
                scene.file().arm({Call::read, nth, lasting, false});
                const int32_t status = operation.run(scene.root());
                const bool struck = scene.file().failed();
                scene.file().disarm();
                EXPECT_NE(status, R_SUCCESS);
                EXPECT_TRUE(is_in_table(status)) << status;
                EXPECT_TRUE(scene.Untouched());
                if (!struck)
                    break;
            }
        }
    }
}

// A hive of this layout after the values were set in the key at the path, one after the other: its list of values moves
// away from the key.
Bytes with_values(const HiveLayout& layout, const std::string& path,
                  const std::vector<std::pair<std::string, Bytes>>& values) {
    Scene scene(layout);
    for (const auto& [name, data] : values)
        EXPECT_EQ(scene.Set(path, name, 3, data), R_SUCCESS);
    return scene.bytes();
}

// Runs a call with each of its reads failing, once and from there on, and then asks what it left.
void with_each_read_failing(const Bytes& start, const std::function<void(RegistryKey* top)>& run,
                            const std::function<void(Scene& scene)>& look) {
    for (const bool lasting : {false, true}) {
        bool struck = true;
        for (uint64_t nth = 1; struck; nth++) {
            SCOPED_TRACE((lasting ? "from read " : "read ") + std::to_string(nth));
            Scene scene(start);
            const Handle top = scene.OpenKey("Top");
            scene.file().arm({Call::read, nth, lasting, false});
            run(top.get());
            struck = scene.file().failed();
            scene.file().disarm();
            look(scene);
            EXPECT_TRUE(struck || nth > 1);
        }
    }
}

// The caller would take the key for its own, and give it another name or take it away again.
TEST(FailedRead, DoesNotTellAKeyForMadeThatWasThere) {
    HiveLayout layout;
    layout.root.add("Top").add("There");
    std::vector<std::pair<std::string, Bytes>> values;
    for (int i = 0; i < 16; i++)
        values.emplace_back("v" + std::to_string(i), pattern(30000));
    uint32_t disposition = 9;
    with_each_read_failing(
        with_values(layout, "Top\\There", values),
        [&disposition](RegistryKey* top) {
            Handle made;
            disposition = 9;
            RCreateKey(top, "There", made.out(), &disposition);
        },
        [&disposition](Scene& scene) {
            EXPECT_NE(disposition, 0U);
            EXPECT_TRUE(scene.Untouched());
        });
}

// The first of two values of one name is the one that is met. Where its record cannot be read, nobody knows.
TEST(FailedRead, LeavesTheSecondOfTwoValuesOfOneNameAlone) {
    HiveLayout layout;
    layout.root.add("Top");
    const Bytes second = pattern(3000, 9);
    Bytes start = with_values(
        layout, "Top",
        {{"a", pattern(30000)}, {"dup", pattern(3000, 5)}, {"b", pattern(60000)}, {"dup2", second}, {"c", pattern(9)}});
    const Hive laid = read_hive(start);
    for (const Value& value : laid.find("Top")->values) {
        if (value.name == u"dup2")
            set16(start, LaidHive::position(value.offset, 2), 3);
    }
    const auto look = [&second](Scene& scene) {
        const Hive hive = scene.Read();
        const auto& values = hive.find("Top")->values;
        EXPECT_TRUE(std::any_of(values.begin(), values.end(),
                                [&](const Value& value) { return value.name == u"dup" && value.data == second; }));
    };
    with_each_read_failing(
        start, [](RegistryKey* top) { RDeleteValue(top, "dup"); }, look);
    with_each_read_failing(
        start, [](RegistryKey* top) { RSetValueExW(top, "dup", 3, "new", 3); }, look);
}

// The same for keys in a list without order. Of the first one, values "v2", no read must make the second, "v10".
TEST(FailedRead, LeavesTheSecondOfTwoKeysOfOneNameAlone) {
    HiveLayout layout;
    KeyLayout& top = layout.root.add("Top");
    top.sorted = false;
    int number = 0;
    for (const char* name : {"zz", "mm", "dup", "aa", "yy", "bb", "vv", "cc", "xx", "ww", "dup"})
        top.add(name).set("v" + std::to_string(number++), 3, pattern(20000));
    const auto look = [](Scene& scene) {
        const Hive hive = scene.Read();
        const auto& keys = hive.find("Top")->children;
        EXPECT_TRUE(std::any_of(keys.begin(), keys.end(), [](const Key& key) {
            return key.name == u"dup" && key.values.size() == 1 && key.values[0].name == u"v10";
        }));
    };
    with_each_read_failing(
        lay_out(layout).bytes, [](RegistryKey* key) { RDeleteKey(key, "dup"); }, look);
}

// A key that its list has twice is not deleted: what is below it would be, and then it itself refused.
TEST(FailedRead, DoesNotLetATreeBeDeletedThatItsListHasTwice) {
    HiveLayout layout;
    KeyLayout& top = layout.root.add("Top");
    for (const char* name : {"a", "b", "c", "d"})
        top.add(name).set("far", 3, pattern(40000));
    top.children[0].add("child").set("far", 3, pattern(40000));
    LaidHive laid = lay_out(layout);
    laid.put32(laid.at("Top").index, 12, laid.at("Top\\a").record);
    for (const uint32_t position : {0U, 1U}) {
        int32_t status = R_FAILED;
        with_each_read_failing(
            laid.bytes,
            [&](RegistryKey* key) {
                Handle last;
                ROpenKey(key, "d", last.out());
                status = RCheckDeleteTree(key, position);
            },
            [&status](Scene&) { EXPECT_NE(status, R_SUCCESS); });
    }
}

// In a damaged hive a value's data may lead to a record or a list. A failed read must not make that pass for data.
TEST(FailedRead, LetsNothingPassForDataThatIsNone) {
    HiveLayout layout;
    layout.root.add("Alpha").set("Raw", 3, pattern(100));
    layout.root.children.back().set("step", 3, pattern(40000)).storage = Storage::cell;
    KeyLayout& other = layout.root.add("Other");
    for (const char* name : {"a", "b", "c"})
        other.set(name, 3, pattern(30));
    other.set("big", 3, pattern(40000)).storage = Storage::big;
    other.add("child");
    const LaidHive laid = lay_out(layout);
    const KeyPlaces& places = laid.at("Other");
    const Operation operation = set("value", "Alpha", "Raw", 3, 8);
    for (const uint32_t target : {places.record, places.value_list, places.index, places.values[0].record,
                                  places.values[3].data, laid.at("").index, laid.security[0]}) {
        LaidHive hive = laid;
        hive.put32(hive.at("Alpha").values[0].record, 8, target);
        hive.put32(hive.at("Alpha").values[0].record, 4, 8);
        std::string why;
        const Contents before = contents(hive.bytes, why);
        EXPECT_TRUE(before.count("Other|big") == 1);
        for (const bool lasting : {false, true}) {
            for (uint64_t nth = 1;; nth++) {
                SCOPED_TRACE(std::to_string(target) + ", read " + std::to_string(nth));
                Scene scene(hive.bytes);
                Handle key = scene.OpenKey("Alpha");
                scene.file().arm({Call::read, nth, lasting, false});
                const int32_t status = operation.change(key.get());
                const bool struck = scene.file().failed();
                scene.file().disarm();
                EXPECT_EQ(harm(operation, before, nullptr, scene.bytes()), "") << status;
                if (!struck) {
                    EXPECT_EQ(status, R_SUCCESS);
                    break;
                }
            }
        }
    }
}

// The same of a list of values that is another key's index.
TEST(FailedRead, LetsNoIndexPassForAListOfValues) {
    HiveLayout layout;
    layout.root.add("Alpha").set("step", 3, pattern(40000)).storage = Storage::cell;
    KeyLayout& other = layout.root.add("Other");
    for (const char* name : {"a", "b", "c"})
        other.add(name).set("v", 3, pattern(30));
    LaidHive hive = lay_out(layout);
    const uint32_t index = hive.at("Other").index;
    hive.put32(index, 4, hive.at("Other\\a").values[0].record);
    hive.put32(hive.at("Alpha").record, 36, 5);
    hive.put32(hive.at("Alpha").record, 40, index);
    for (const bool lasting : {false, true}) {
        for (uint64_t nth = 1;; nth++) {
            SCOPED_TRACE("read " + std::to_string(nth));
            Scene scene(hive.bytes);
            const Handle key = scene.OpenKey("Alpha");
            ASSERT_EQ(RFindValueA(key.get(), "v"), 1);
            scene.file().arm({Call::read, nth, lasting, false});
            EXPECT_NE(RDeleteValue(key.get(), "v"), R_SUCCESS);
            const bool struck = scene.file().failed();
            scene.file().disarm();
            EXPECT_TRUE(scene.Untouched());
            if (!struck)
                break;
        }
    }
}

// A full disk: no bin can be appended, what needs one is refused, the hive still opens, and takes it once there is
// room.
TEST(FullDisk, RefusesWhatNeedsABinAndKeepsTheHive) {
    HiveLayout layout = operation_layout(Leaf::hash);
    layout.no_free_space = true;
    const Bytes start = lay_out(layout).bytes;
    const std::vector<Operation> all = {
        set("value", "Flat\\alpha", "new", 3, 20000),
        create("key", "Flat", "new"),
        create("path", "Flat", "x\\y\\z"),
        rename("key renamed", "Flat", "alpha", "a name that is longer"),
        rename("key with subkeys renamed", "Parent", "branch", "a name that is longer"),
        set("value made larger", "Flat\\alpha", "middle", 3, 300),
    };
    for (const Expectation& expected : expectations(start, all)) {
        SCOPED_TRACE(expected.operation.name);
        const Operation& operation = expected.operation;
        for (uint64_t room = 0; room < 24576; room += 512) {
            SCOPED_TRACE(room);
            Scene scene(start);
            scene.file().capacity = start.size() + room;
            const int32_t status = operation.run(scene.root());
            EXPECT_TRUE(is_in_table(status)) << status;
            EXPECT_EQ(harm(operation, expected.before, nullptr, scene.bytes()), "");
            EXPECT_TRUE(room >= 4096 || status != R_SUCCESS);
            scene.file().capacity = 0x7FFFFFFF;
            if (status != R_SUCCESS) {
                EXPECT_EQ(operation.run(scene.root()), R_SUCCESS);
            }
            std::string why;
            EXPECT_EQ(contents(scene.bytes(), why), expected.after) << why;
            EXPECT_EQ(scene.Close(), R_SUCCESS);
        }
    }
}

}  // namespace
