// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Long random sessions against a model of what a key holds, the bytes checked after every step of a short one.
// TALLOWFEN_WALK_STEPS makes them longer than the short ones of every test run.
#include "operations.h"
#include "real_hives.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <fstream>
#include <iterator>
#include <memory>
#include <optional>
#include <random>

namespace {

using namespace testkit;

std::string upper(std::string text) {
    for (char& c : text)
        c = c >= 'a' && c <= 'z' ? static_cast<char>(c - 32) : c;
    return text;
}

struct NoCase {
    bool operator()(const std::string& a, const std::string& b) const { return upper(a) < upper(b); }
};

// What the walk believes a key to hold.
struct Model {
    std::map<std::string, std::unique_ptr<Model>, NoCase> keys;
    std::map<std::string, std::pair<uint32_t, Bytes>, NoCase> values;
};

constexpr uint32_t inline_size = 4;

class Walk {
public:
    Walk(Bytes start, uint32_t seed) : scene_(std::move(start)), random_(seed) {
        EXPECT_EQ(scene_.Create("Walk"), R_SUCCESS);
        scene_.MarkBase();
        base_leaks_ = scene_.Examine().leaks.count();
    }

    // One step; what went wrong, or nothing.
    std::string step() {
        pick();
        const int32_t status = act();
        return status != R_SUCCESS ? log_.back() + ": status " + std::to_string(status) : std::string();
    }

    // What the checker finds wrong with the file's bytes, or nothing.
    std::string check() {
        const CheckResult now = scene_.Examine();
        const std::string broken = scene_.Check(leaks_);
        if (!broken.empty())
            return log_.back() + ": " + broken;
        if (now.leaks.count() != base_leaks_ + leaks_)
            return log_.back() + ": " + std::to_string(now.leaks.count() - base_leaks_) + " cells out of reach, not " +
                   std::to_string(leaks_);
        return std::string();
    }

    // Compares all that the walk made with the model, the file being opened afresh.
    std::string compare() {
        const Hive hive = scene_.Read();
        const Key* key = hive.find("Walk");
        return key == nullptr ? "the key is gone" : compare(*key, model_, "Walk");
    }

    const std::vector<std::string>& log() const { return log_; }

private:
    uint32_t below(uint32_t n) { return static_cast<uint32_t>(random_()) % n; }

    std::string name(uint32_t most) {
        static const std::string letters = "abcXYZ019_^`[]{} \xC4\xE4";
        std::string text;
        for (uint32_t i = 0, length = 1 + below(most); i < length; i++)
            text += letters[below(static_cast<uint32_t>(letters.size()))];
        return text;
    }

    template <typename Map>
    std::string any(const Map& map) {
        auto chosen = map.begin();
        std::advance(chosen, below(static_cast<uint32_t>(map.size())));
        return chosen->first;
    }

    // Where the next step happens: the walk's key, a child of it or a grandchild.
    void pick() {
        path_ = "Walk";
        here_ = &model_;
        while (!here_->keys.empty() && below(3) == 0) {
            const std::string child = any(here_->keys);
            here_ = here_->keys[child].get();
            path_ += "\\" + child;
        }
    }

    int32_t act() {
        const uint32_t choice = below(100);
        if (choice < 35)
            return create();
        if (choice < 65)
            return set();
        if (choice < 75)
            return here_->values.empty() ? set() : delete_value();
        if (here_->keys.empty())
            return create();
        return choice < 88 ? rename() : delete_key();
    }

    int32_t create() {
        const std::string child = name(8);
        log_.push_back("create " + path_ + "\\" + child);
        uint32_t disposition = 9;
        const int32_t status = scene_.Create(path_ + "\\" + child, &disposition);
        const bool was_there = here_->keys.count(child) != 0;
        if (status == R_SUCCESS && disposition != (was_there ? 1U : 0U))
            return R_FAILED;
        if (!was_there)
            here_->keys[child] = std::make_unique<Model>();
        return status;
    }

    int32_t set() {
        static const size_t sizes[] = {0, 1, 3, 4, 5, 8, 9, 60, 100, 700, 5000, 16343, 16344, 16345};
        const std::string value = below(12) == 0 ? std::string() : name(3);
        const Bytes data = pattern(sizes[below(std::size(sizes))], static_cast<uint8_t>(random_()));
        const uint32_t type = below(13);
        log_.push_back("set " + path_ + " : " + value + " (" + std::to_string(data.size()) + " bytes)");
        const auto old = here_->values.find(value);
        // A data cell stays allocated when its value goes inline.
        if (old != here_->values.end() && old->second.second.size() > inline_size && data.size() <= inline_size)
            leaks_++;
        const int32_t status = scene_.Set(path_, value, type, data);
        if (old != here_->values.end())
            old->second = {type, data};
        else
            here_->values[value] = {type, data};
        return status;
    }

    int32_t delete_value() {
        const std::string value = any(here_->values);
        log_.push_back("delete " + path_ + " : " + value);
        // The data cell of a removed value stays allocated, and the list's when no value is left.
        leaks_ += here_->values[value].second.size() > inline_size ? 1U : 0U;
        leaks_ += here_->values.size() == 1 ? 1U : 0U;
        here_->values.erase(value);
        return scene_.DeleteValue(path_, value);
    }

    int32_t rename() {
        const std::string child = any(here_->keys);
        const std::string now = name(8);
        log_.push_back("rename " + path_ + "\\" + child + " to " + now);
        const int32_t status = scene_.Rename(path_ + "\\" + child, now);
        if (here_->keys.count(now) != 0)
            return status == R_SUCCESS ? R_FAILED : R_SUCCESS;
        std::unique_ptr<Model> moved = std::move(here_->keys[child]);
        here_->keys.erase(child);
        here_->keys[now] = std::move(moved);
        return status;
    }

    int32_t delete_key() {
        const std::string child = any(here_->keys);
        log_.push_back("delete " + path_ + "\\" + child);
        const Model& gone = *here_->keys[child];
        const int32_t status = scene_.Delete(path_ + "\\" + child);
        if (!gone.keys.empty())
            return status == R_KEY_HAS_CHILDREN ? R_SUCCESS : R_FAILED;
        // Every other value record of a deleted key stays allocated, and all of its data cells.
        leaks_ += gone.values.size() / 2;
        for (const auto& [value, content] : gone.values)
            leaks_ += content.second.size() > inline_size ? 1U : 0U;
        here_->keys.erase(child);
        return status;
    }

    static std::string compare(const Key& key, const Model& model, const std::string& path) {
        if (key.children.size() != model.keys.size() || key.values.size() != model.values.size())
            return path + " holds another number of things";
        for (const auto& [name, content] : model.values) {
            const Value* value = find_value(key, name);
            if (value == nullptr || !value->readable || value->type != content.first || value->data != content.second)
                return path + " : " + name + " differs";
        }
        for (const Key& child : key.children) {
            const std::string name(child.stored_name.begin(), child.stored_name.end());
            const auto found = model.keys.find(name);
            if (found == model.keys.end() || found->first != name)
                return path + "\\" + name + " should not be there";
            const std::string differs = compare(child, *found->second, path + "\\" + name);
            if (!differs.empty())
                return differs;
        }
        return std::string();
    }

    Scene scene_;
    std::mt19937 random_;
    Model model_;
    Model* here_ = nullptr;
    std::string path_;
    std::vector<std::string> log_;
    size_t leaks_ = 0;
    size_t base_leaks_ = 0;
};

size_t steps() {
    const char* wanted = std::getenv("TALLOWFEN_WALK_STEPS");
    return wanted != nullptr ? static_cast<size_t>(std::atol(wanted)) : 400;
}

// A walk that went wrong, with its steps up to the one that showed it.
struct Failure {
    std::vector<std::string> steps;
    std::string wrong;
};

constexpr size_t steps_between_looks = 50;

// A key whose names differ in case alone is one key: the model keeps the name that it was made with.
// From the step `thorough` on (the first is 0), file and contents are looked at after each.
std::optional<Failure> first_failure(const Bytes& start, uint32_t seed, size_t thorough) {
    Walk walk(start, seed);
    for (size_t i = 0; i < steps(); i++) {
        std::string wrong = walk.step();
        const bool looks = i >= thorough || (i + 1) % steps_between_looks == 0 || i + 1 == steps();
        // The checker reads the whole file, which a long session makes large.
        if (wrong.empty() && (i < 400 || looks))
            wrong = walk.check();
        if (wrong.empty() && looks)
            wrong = walk.compare();
        if (!wrong.empty())
            return Failure{walk.log(), wrong};
    }
    return std::nullopt;
}

void walk(const Bytes& start, uint32_t seed) {
    const std::optional<Failure> seen = first_failure(start, seed, SIZE_MAX);
    if (!seen)
        return;
    // A seed walks the same way again. What went wrong since the last look shows at its step now.
    const size_t last_look = seen->steps.size() - std::min(seen->steps.size(), steps_between_looks);
    const Failure shortest = first_failure(start, seed, last_look).value_or(*seen);
    std::string list;
    for (const std::string& step : shortest.steps)
        list += step + "\n";
    FAIL() << "seed " << seed << ", step " << shortest.steps.size() << ": " << shortest.wrong
           << "\nThe shortest walk with this seed that shows it:\n"
           << list;
}

TEST(RandomWalk, OnMadeHives) {
    for (const Leaf leaf : {Leaf::fast, Leaf::hash}) {
        for (uint32_t seed = 1; seed <= 4; seed++)
            walk(operation_hive(leaf), seed);
    }
}

TEST(RandomWalk, OnCopiesOfRealHives) {
    size_t walked = 0;
    for (const RealHive& hive : real_hives()) {
        if (hive.name != "bcd" && hive.name != "sam-2016" && hive.name != "amcache-10")
            continue;
        SCOPED_TRACE(hive.name);
        std::ifstream file(hive.path, std::ios::binary);
        const Bytes bytes((std::istreambuf_iterator<char>(file)), std::istreambuf_iterator<char>());
        walk(bytes, static_cast<uint32_t>(++walked));
    }
    std::printf("random walks on %zu real hives of 3\n", walked);
}

}  // namespace
