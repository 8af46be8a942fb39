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

namespace {

constexpr int frames_between_stop_checks = 10;
// A key takes at least its record and its cell's size word in the file.
constexpr qint64 smallest_key = 80;

qint64 most_keys(const RegHive& hive) { return 1 + hive.file_size() / smallest_key; }

// Every kind of match ignores case. The low four bits of the flags say which kind.
bool matches(const QString& text, const QString& term, int kind) {
    if (kind == Qt::MatchWildcard)
        return QRegExp(term, Qt::CaseInsensitive, QRegExp::Wildcard).exactMatch(text);
    if (kind == Qt::MatchFixedString)
        return QString::compare(text, term, Qt::CaseInsensitive) == 0;
    return text.indexOf(term, 0, Qt::CaseInsensitive) != -1;
}

// The shown value names of the key that the search is at: read and sorted once for all of its values.
class CurrentNames {
public:
    const std::vector<QString>& of(RegKey* key) {
        if (key != key_) {
            names_ = shown_value_names(*key, ValuesModel::default_name());
            key_ = key;
        }
        return names_;
    }

private:
    RegKey* key_ = nullptr;
    std::vector<QString> names_;
};

// Passes a lock where one thread leaves data to another.
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

void RegModel::begin_find(const QModelIndex& start) {
    search_.clear();
    if (start.isValid())
        search_.push_back({start, -1});
    keys_left_.clear();
    for (const auto& hive : hives_) {
        const qint64 most = most_keys(*hive);
        keys_left_[hive.get()] = {2 * most, most};
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

// What a key leads to, so that its values come first, then its subkeys, then its later siblings.
void RegModel::push_key_frames(const Frame& frame, FindMode mode) {
    const AbstractRegKey* const visited = key_of(frame.key);
    const auto* const in_hive = dynamic_cast<const RegKey*>(visited);
    bool goes_on = true;
    bool goes_down = !visited->is_below_itself();
    if (in_hive != nullptr) {
        KeysLeft& left = keys_left_[in_hive->hive()];
        left.to_visit--;
        left.to_descend--;
        // A hive's root is listed in its group, whose other hives have nothing to do with it.
        goes_on = left.to_visit > 0 || in_hive == in_hive->hive()->root_key();
        goes_down = goes_down && left.to_descend > 0;
    }
    const QModelIndex sibling = goes_on ? index(frame.key.row() + 1, 0, parent(frame.key)) : QModelIndex();
    if (sibling.isValid())
        search_.push_back({sibling, -1});
    const QModelIndex child = goes_down ? index(0, 0, frame.key) : QModelIndex();
    if (child.isValid())
        search_.push_back({child, -1});
    RegKey* const key = mode.testFlag(FindValues) ? editable_key(frame.key) : nullptr;
    if (key == nullptr)
        return;
    const int rows = key->value_count() + (key->has_default_value() ? 0 : 1);
    for (int row = rows - 1; row >= 0; row--)
        search_.push_back({frame.key, row});
}

RegModel::FindResult RegModel::find(const QVariant& term, RegModel::FindMode mode, Qt::MatchFlags flags) {
    const QString text = term.toString();
    const int kind = static_cast<int>(flags) & 0xF;
    CurrentNames names;
    // The stack is the worker's from here on and goes back at the end. The pool orders the two ends already, but in
    // code that the thread sanitizer cannot see.
    const HandOver hand_over(&mutex_);
    int counter = 1;
    while (!search_.empty()) {
        const Frame frame = search_.back();
        search_.pop_back();
        searched_ = frame.key;
        if (frame.value < 0) {
            push_key_frames(frame, mode);
            if (mode.testFlag(FindKeys) && matches(data(frame.key, Qt::DisplayRole).toString(), text, kind))
                return {frame.key, -1};
        } else if (mode.testFlag(FindValues)) {
            const std::vector<QString>& shown = names.of(editable_key(frame.key));
            const auto row = static_cast<size_t>(frame.value);
            if (row < shown.size() && matches(shown[row], text, kind))
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
    const HandOver hand_over(&mutex_);
    return searched_;
}

// The stack must never lead to a key that is gone.
void RegModel::forget_frames_below(const AbstractRegKey* key) {
    const auto is_below = [&](const Frame& frame) {
        for (const AbstractRegKey* up = key_of(frame.key); up != nullptr; up = up->parent()) {
            if (up == key)
                return true;
        }
        return false;
    };
    // A deleted key's frame stands for its later siblings too; its successor takes that over.
    for (Frame& frame : search_) {
        if (key_of(frame.key) != key || frame.value >= 0)
            continue;
        const QModelIndex next = index(frame.key.row() + 1, 0, parent(frame.key));
        if (next.isValid())
            frame.key = next;
    }
    search_.erase(std::remove_if(search_.begin(), search_.end(), is_below), search_.end());
}

void RegModel::renumber_frames() {
    for (Frame& frame : search_) {
        if (frame.key.isValid())
            frame.key = index_of(key_of(frame.key));
    }
}
