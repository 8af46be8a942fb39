// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// The data of one value: in its record, in a cell, or in the segments of big data.
#pragma once

#include "records.h"

namespace engine {

// Reads all of the value's data, value.size() bytes, as stored. 0, 1003, 1015 or 1016 as REnumValueW gives them.
int32_t read_data(Store& store, const ValueView& value, void* buffer);
// The same for data that lies in the record or in one cell; 1003 otherwise.
int32_t read_plain_data(Store& store, const ValueView& value, void* buffer, uint32_t length);

}  // namespace engine
