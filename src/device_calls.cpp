// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "device_calls.h"

#include <QIODevice>

namespace {

int32_t narrowed(qint64 count) { return count < 0 || count > INT32_MAX ? -1 : static_cast<int32_t>(count); }

}  // namespace

int32_t read_device(void* device, void* buffer, int32_t length) {
    return narrowed(static_cast<QIODevice*>(device)->read(static_cast<char*>(buffer), length));
}

int32_t write_device(void* device, const void* buffer, int32_t length) {
    return narrowed(static_cast<QIODevice*>(device)->write(static_cast<const char*>(buffer), length));
}

int32_t seek_device(void* device, int32_t offset, int32_t whence) {
    auto* file = static_cast<QIODevice*>(device);
    qint64 target = offset;
    if (whence == 1)
        target += file->pos();
    else if (whence == 2)
        target += file->size();
    else if (whence != 0)
        return -1;
    return narrowed(target) >= 0 && file->seek(target) ? narrowed(target) : -1;
}
