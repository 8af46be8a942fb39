// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// The reference counts of security records, which keys share.
#pragma once

#include "store.h"

namespace engine {

// One more key refers to the record. An offset below 0 means that there is none, which is fine. false: the record
// cannot be read or written, or its count is at its end.
bool add_security_reference(Store& store, CellOffset security);
// One key fewer. At zero the record is taken out of its ring and freed; one whose count was below 1 already, or whose
// links lead to itself or to no record that leads back, stays where it is. still_used: another key is known to refer
// to it, so that a count of 1 is too low in a damaged hive, and stays.
void drop_security_reference(Store& store, CellOffset security, bool still_used);

}  // namespace engine
