// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Checks a hive's bytes against the format's rules, without the engine: for after a change.
#pragma once

#include "bytes.h"

namespace testkit {

struct Fault {
    std::string rule;     // short and fixed: "bins", "cells", "reach", "parent", "order", "hash", ...
    uint32_t offset = 0;  // cell offset of the record at fault (0 for the file as a whole)
    std::string text;
};

// Cells in use that nothing leads to, told by the record that they begin with. The engine leaves some on
// purpose.
struct Leaks {
    std::vector<uint32_t> values;  // "vk" records
    std::vector<uint32_t> keys;    // "nk" records
    std::vector<uint32_t> others;  // data, lists, indexes, classes

    size_t count() const { return values.size() + keys.size() + others.size(); }
};

struct CheckResult {
    std::vector<Fault> faults;
    Leaks leaks;
    size_t keys = 0;
    size_t values = 0;

    // One line a fault, empty when there is none.
    std::string text() const;
};

// Checked: base block and checksum; bins tile the file's bins area and cells the bins; every reference leads
// to a cell in use of the right kind, each record is reached exactly once (class cells may be shared);
// counts, parents, depths; maxima not below the actual; names of an index in upper-cased order across its
// leaves; hints and hashes; reference counts of security records and their ring. Legal: bytes behind the last
// bin, free cells side by side, an emptied leaf that is still referenced.
CheckResult check_hive(const Bytes& bytes);

// The faults of after that before did not have (by rule and offset): what a change broke in a hive that was
// not flawless to begin with.
std::vector<Fault> new_faults(const CheckResult& before, const CheckResult& after);

std::string text_of(const std::vector<Fault>& faults);

}  // namespace testkit
