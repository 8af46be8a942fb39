// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Changes to the list of a key's subkeys: a new one, one that goes, one that gets another name.
#pragma once

#include "subkey_index.h"

namespace engine {

enum class Inserted { failed, exists, created };

// Makes the subkey of that name under the parent, or finds the one that is there. key receives its offset.
// new_reference: the parent's security record gets one more reference, for the new key.
Inserted insert_subkey(Store& store, CellOffset parent, const Name& name, bool new_reference, CellOffset& key);

// Gives the subkey at a position another name: a new record takes the old one's place. Refused where another key than
// the one that is meant stands there by now. Status as RRenameKey's.
int32_t rename_subkey(Store& store, CellOffset parent, uint32_t position, CellOffset meant, const Name& name);

}  // namespace engine
