// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// The ways in which a change of the file is made to fail at its nth step, and what a failed change may leave there.
#pragma once

#include "alloc_faults.h"
#include "file_faults.h"
#include "hive_reader.h"

#include <QString>

#include <algorithm>
#include <optional>
#include <string>
#include <vector>

enum class Fails { no_write, one_write, short_write, writes_from_there_on, one_request, requests_from_there_on };

constexpr Fails all_ways[] = {Fails::one_write, Fails::short_write, Fails::writes_from_there_on, Fails::one_request,
                              Fails::requests_from_there_on};

inline QString text_of(Fails way) {
    switch (way) {
    case Fails::no_write:
        return QStringLiteral("nothing");
    case Fails::one_write:
        return QStringLiteral("one write");
    case Fails::short_write:
        return QStringLiteral("half of a write");
    case Fails::writes_from_there_on:
        return QStringLiteral("all writes from one on");
    case Fails::one_request:
        return QStringLiteral("one request for memory");
    case Fails::requests_from_there_on:
        return QStringLiteral("all requests for memory from one on");
    }
    return QString();
}

// Lets the nth write of a file or request for memory fail while it lives.
class Failing {
public:
    Failing(Fails way, int nth) : is_of_memory_(way == Fails::one_request || way == Fails::requests_from_there_on) {
        if (is_of_memory_)
            memory_.emplace(static_cast<uint64_t>(nth), way == Fails::requests_from_there_on);
        else
            writes_.emplace(way == Fails::no_write ? 0 : nth, way == Fails::writes_from_there_on, ENOSPC,
                            way == Fails::short_write);
    }

    bool failed() const { return is_of_memory_ ? memory_->failed() : writes_->failed(); }

private:
    bool is_of_memory_;
    std::optional<testkit::AllocationFaults> memory_;
    std::optional<testkit::WriteFaults> writes_;
};

// A change as it goes undisturbed.
struct WholeChange {
    WholeChange(const testkit::Bytes& start, const testkit::Bytes& end)
        : bytes(start), before(testkit::read_hive(start)), after(testkit::read_hive(end)),
          wanted(testkit::diff(before, after)) {}

    // What reads otherwise than before the change and is not part of it: of what the change names, part may be done. A
    // parent's count that is one higher than its list is no harm where it may be.
    QString harm(const testkit::Hive& now, bool may_miscount) const {
        QString text;
        for (const std::string& complaint : now.complaints) {
            if (!may_miscount || complaint.rfind("subkey count differs from its index", 0) != 0)
                text += QString::fromStdString(complaint) + QLatin1Char('\n');
        }
        for (const std::string& line : testkit::diff(before, now)) {
            if (std::find(wanted.begin(), wanted.end(), line) == wanted.end())
                text += QString::fromStdString(line) + QLatin1Char('\n');
        }
        return text;
    }

    testkit::Bytes bytes;
    testkit::Hive before;
    testkit::Hive after;
    std::vector<std::string> wanted;
};

enum class Outcome { done, refused, thrown, absent };

// How attempts at changes ended, and the same changes made again.
struct Tally {
    int done = 0;
    int refused = 0;
    int thrown = 0;
    int half_done = 0;
    int done_again = 0;
    int refused_again = 0;

    // Counts an attempt. Where what was said of it is not what the file has, a text that tells so.
    QString count(const WholeChange& whole, Outcome outcome, bool has_failed, const testkit::Hive& now) {
        const bool is_before = testkit::diff(whole.before, now).empty();
        const bool is_after = testkit::diff(whole.after, now).empty();
        done += outcome == Outcome::done ? 1 : 0;
        refused += outcome == Outcome::refused ? 1 : 0;
        thrown += outcome == Outcome::thrown ? 1 : 0;
        half_done += !is_before && !is_after ? 1 : 0;
        if (outcome == Outcome::done && !is_after)
            return QStringLiteral("is said to be done");
        if (!has_failed && outcome != Outcome::done)
            return QStringLiteral("is not done");
        return QString();
    }
};
