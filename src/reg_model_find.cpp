// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// The search of RegModel: depth first, each key before its values before its subkeys, resumable after every hit.

#include "reg_hive.h"
#include "reg_key.h"
#include "reg_model.h"
#include "value_order.h"
#include "values_model.h"

#include <QMutexLocker>
#include <QRegExp>

#include <algorithm>
#include <iterator>
#include <numeric>
#include <utility>

namespace {

constexpr int frames_between_stop_checks = 10;

// Bytes that a key or a value takes in the file at least: its record and its cell's size word.
constexpr qint64 smallest_key = 80;
constexpr qint64 smallest_value = 24;

qint64 most_keys_in(const RegHive& hive) { return 1 + hive.file_size() / smallest_key; }

// Every kind of match ignores case. The low four bits of the flags say which kind.
bool matches(const QString& text, const QString& term, int kind) {
    if (kind == Qt::MatchWildcard)
        return QRegExp(term, Qt::CaseInsensitive, QRegExp::Wildcard).exactMatch(text);
    if (kind == Qt::MatchFixedString)
        return QString::compare(text, term, Qt::CaseInsensitive) == 0;
    return text.indexOf(term, 0, Qt::CaseInsensitive) != -1;
}

// Takes a name out of a collection of names that may hold it more than once. false: it does not hold it.
bool take(std::multiset<QString>& names, const QString& name) {
    const auto found = names.find(name);
    if (found == names.end())
        return false;
    names.erase(found);
    return true;
}

// Takes the lock for a moment at either end of a call, so that each thread sees what the other one wrote before.
class HandOver {
public:
    explicit HandOver(QMutex* mutex) : mutex_(mutex) { const QMutexLocker locker(mutex_); }
    ~HandOver() { const QMutexLocker locker(mutex_); }
    HandOver(const HandOver&) = delete;
    HandOver& operator=(const HandOver&) = delete;

private:
    QMutex* mutex_;
};

}  // namespace

qint64 RegModel::most_keys() const {
    return std::accumulate(hives_.begin(), hives_.end(), static_cast<qint64>(top_level_.size()),
                           [](qint64 sum, const auto& hive) { return sum + most_keys_in(*hive); });
}

void RegModel::begin_find(const QModelIndex& start) {
    search_.clear();
    passed_over_.clear();
    value_names_.clear();
    if (start.isValid())
        search_.push_back({start, with_siblings});
    budgets_.clear();
    for (const auto& hive : hives_) {
        const qint64 most = most_keys_in(*hive);
        budgets_[hive.get()] = {2 * most, most, 2 * hive->file_size() / smallest_value};
    }
    // Last, so that the lock hands the stack over to the worker as well.
    const QMutexLocker locker(&mutex_);
    stop_ = false;
}

void RegModel::stop_find() {
    const QMutexLocker locker(&mutex_);
    stop_ = true;
}

bool RegModel::is_stopped() {
    const QMutexLocker locker(&mutex_);
    return stop_;
}

void RegModel::push_next_sibling(const QModelIndex& key) {
    const QModelIndex sibling = index(key.row() + 1, 0, parent(key));
    if (sibling.isValid())
        search_.push_back({sibling, with_siblings});
}

// What a key leads to, so that its values come first, then its subkeys, then its later siblings. false: stopped, the
// stack being as it was with the frame on it.
bool RegModel::push_key_frames(const Frame& frame, FindMode mode) {
    const size_t frames_before = search_.size();
    const AbstractRegKey* const visited = key_of(frame.key);
    const auto* const in_hive = dynamic_cast<const RegKey*>(visited);
    bool goes_on = true;
    bool goes_down = !visited->is_below_itself();
    Budget* const left = in_hive != nullptr ? &budgets_[in_hive->hive()] : nullptr;
    const Budget left_before = left != nullptr ? *left : Budget();
    if (left != nullptr) {
        left->keys--;
        left->subkeys -= in_hive->child_count();
        // A hive's root is listed in its group, whose other hives have nothing to do with it.
        goes_on = left->keys > 0 || in_hive == in_hive->hive()->root_key();
        goes_down = goes_down && left->subkeys >= 0;
    }
    if (goes_on && frame.value == with_siblings)
        push_next_sibling(frame.key);
    const QModelIndex child = goes_down ? index(0, 0, frame.key) : QModelIndex();
    if (child.isValid())
        search_.push_back({child, with_siblings});
    RegKey* const key = mode.testFlag(FindValues) ? editable_key(frame.key) : nullptr;
    if (key == nullptr)
        return true;
    left->values -= key->value_count();
    if (left->values < 0)
        return true;
    // Read and sorted once for all of the key's values.
    auto names = shown_value_names(*key, ValuesModel::default_name(), [this] { return is_stopped(); });
    if (!names.has_value()) {
        search_.erase(search_.begin() + static_cast<std::ptrdiff_t>(frames_before), search_.end());
        search_.push_back(frame);
        *left = left_before;
        return false;
    }
    value_names_ = std::move(*names);
    std::vector<int> rows(value_names_.size());
    std::iota(rows.begin(), rows.end(), 0);
    push_value_frames(frame.key, rows);
    return true;
}

void RegModel::push_value_frames(const QModelIndex& key, const std::vector<int>& rows) {
    for (auto row = rows.rbegin(); row != rows.rend(); ++row)
        search_.push_back({key, *row});
}

// The user may have changed the values of the key that the last hit was in, and with them the rows of the others. What
// was not visited is visited in its row of now, and nothing else is; where a name is new, it may be what became of one
// that is gone and was not visited: then it is visited too, at the price that another new name may be as well. false:
// stopped, with the stack as it was.
bool RegModel::renew_value_frames() {
    if (search_.empty() || search_.back().value < 0)
        return true;
    const QModelIndex key = search_.back().key;
    std::vector<int> awaited_rows;
    for (; !search_.empty() && search_.back().value >= 0; search_.pop_back())
        awaited_rows.push_back(search_.back().value);
    // Without its frames already: should the key throw, the search goes on behind it the next time.
    searched_ = key;
    auto now = shown_value_names(*editable_key(key), ValuesModel::default_name(), [this] { return is_stopped(); });
    if (!now.has_value()) {
        push_value_frames(key, awaited_rows);
        return false;
    }
    push_value_frames(key, *now == value_names_ ? awaited_rows : followed_rows(awaited_rows, *now));
    value_names_ = std::move(*now);
    return true;
}

// Where the awaited rows of value_names_ are in other names. The first row is the unnamed value's, whether there is
// one or not, and stays where it is. Behind it several rows may have one name, in a damaged key: the lower ones were
// visited, and of these the first is the only one that can be deleted, so the awaited ones are looked for from the
// end.
std::vector<int> RegModel::followed_rows(const std::vector<int>& awaited_rows, const std::vector<QString>& now) const {
    std::vector<bool> is_awaited(value_names_.size(), false);
    for (const int row : awaited_rows)
        is_awaited[static_cast<size_t>(row)] = true;
    std::multiset<QString> visited;
    std::multiset<QString> awaited;
    for (size_t row = 1; row < value_names_.size(); row++)
        (is_awaited[row] ? awaited : visited).insert(value_names_[row]);
    std::vector<int> rows;
    std::vector<int> new_names;
    for (size_t row = now.size() - 1; row > 0; row--) {
        if (take(awaited, now[row]))
            rows.push_back(static_cast<int>(row));
        else if (!take(visited, now[row]))
            new_names.push_back(static_cast<int>(row));
    }
    if (is_awaited[0])
        rows.push_back(0);
    if (!awaited.empty())
        rows.insert(rows.end(), new_names.begin(), new_names.end());
    std::sort(rows.begin(), rows.end());
    return rows;
}

RegModel::FindResult RegModel::find(const QVariant& term, RegModel::FindMode mode, Qt::MatchFlags flags) {
    const QString text = term.toString();
    const int kind = static_cast<int>(flags) & 0xF;
    // The stack is the worker's from here on and goes back at the end. The pool orders the two ends already, but in
    // code that the thread sanitizer cannot see.
    const HandOver hand_over(&mutex_);
    if (mode.testFlag(FindValues) && !renew_value_frames())
        return {};
    int counter = 1;
    while (!search_.empty()) {
        const Frame frame = search_.back();
        search_.pop_back();
        searched_ = frame.key;
        if (frame.value == with_siblings && passed_over_.erase(key_of(frame.key)) > 0) {
            push_next_sibling(frame.key);
        } else if (frame.value < 0) {
            if (!push_key_frames(frame, mode))
                return {};
            if (mode.testFlag(FindKeys) && matches(data(frame.key, Qt::DisplayRole).toString(), text, kind))
                return {frame.key, -1};
        } else if (mode.testFlag(FindValues)) {
            if (matches(value_names_[static_cast<size_t>(frame.value)], text, kind))
                return {frame.key, frame.value};
        }
        if (counter == frames_between_stop_checks) {
            if (is_stopped())
                return {};
            counter = 0;
        } else {
            counter++;
        }
    }
    return {};
}

QModelIndex RegModel::searched_key() {
    const QMutexLocker locker(&mutex_);
    return searched_;
}

// The frame of a key's children, which stands for one of them and all behind it. There is no other one.
std::vector<RegModel::Frame>::iterator RegModel::sibling_frame(const AbstractRegKey* parent) {
    return std::find_if(search_.begin(), search_.end(), [&](const Frame& frame) {
        return frame.value == with_siblings && key_of(frame.key)->parent() == parent;
    });
}

// The stack must never lead to a key that is gone.
void RegModel::forget_frames_below(const AbstractRegKey* key) {
    const auto is_below = [&](const AbstractRegKey* up) {
        while (up != nullptr && up != key)
            up = up->parent();
        return up == key;
    };
    // A deleted key's frame stands for its later siblings too; its successor takes that over.
    for (Frame& frame : search_) {
        if (key_of(frame.key) != key || frame.value != with_siblings)
            continue;
        const QModelIndex next = index(frame.key.row() + 1, 0, parent(frame.key));
        if (next.isValid())
            frame.key = next;
    }
    const auto is_gone = [&](const Frame& frame) { return is_below(key_of(frame.key)); };
    search_.erase(std::remove_if(search_.begin(), search_.end(), is_gone), search_.end());
    for (auto passed = passed_over_.begin(); passed != passed_over_.end();)
        passed = is_below(*passed) ? passed_over_.erase(passed) : std::next(passed);
}

// The keys from the frame's row on are those still to be visited, and stay so: the frame stands for the first of them
// again. Only the renamed key may have crossed that row.
void RegModel::let_frames_follow_rename(const QModelIndex& moved, int old_row) {
    const QModelIndex parent = this->parent(moved);
    const AbstractRegKey* const key = key_of(moved);
    const auto frame = sibling_frame(key->parent());
    if (frame != search_.end()) {
        const int row = frame->key.row();
        int first = row;
        if (old_row < row && moved.row() >= row)
            first--;
        else if (old_row >= row && moved.row() < row)
            first++;
        const bool is_among_them = moved.row() >= first;
        const bool was_awaited = old_row >= row && passed_over_.erase(key) == 0;
        if (!was_awaited && is_among_them)
            passed_over_.insert(key);
        const QModelIndex start = index(first, 0, parent);
        const bool leaves = was_awaited && !is_among_them;
        frame->key = start.isValid() ? start : moved;
        if (leaves && start.isValid())
            search_.insert(frame + 1, {moved, alone});
        else if (leaves)
            frame->value = alone;
        else if (!start.isValid())
            search_.erase(frame);
    }
    renumber_frames();
}

// A new key is visited where it comes to stand at or behind the first of those that are still to be visited.
void RegModel::let_frames_follow_new_key(const QModelIndex& made) {
    const auto frame = sibling_frame(key_of(made)->parent());
    if (frame != search_.end() && frame->key.row() == made.row())
        frame->key = made;
    renumber_frames();
}

void RegModel::renumber_frames() {
    for (Frame& frame : search_)
        frame.key = index_of(key_of(frame.key));
}
