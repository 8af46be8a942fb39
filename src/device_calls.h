// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// The engine's callbacks over a QIODevice, which is what `device` points to. They return bytes moved, or the position
// reached; -1 for a failure, and for a number that int32_t does not hold.
#pragma once

#include <cstdint>

int32_t read_device(void* device, void* buffer, int32_t length);
int32_t write_device(void* device, const void* buffer, int32_t length);
// `whence` as in lseek: 0 from the beginning, 1 from where the device stands, 2 from its end.
int32_t seek_device(void* device, int32_t offset, int32_t whence);
