// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// A laid-out hive in a file of its own, and the file's bytes read afresh by a reader that is not the engine's.
#pragma once

#include "hive_bytes.h"
#include "hive_checker.h"
#include "hive_reader.h"

#include <QByteArray>
#include <QFile>
#include <QTemporaryDir>

#include <string>

class HiveOnDisk {
public:
    explicit HiveOnDisk(const testkit::HiveLayout& layout) : HiveOnDisk(testkit::lay_out(layout).bytes) {}
    explicit HiveOnDisk(const testkit::Bytes& bytes) { put(bytes); }

    // Makes these the file's bytes, while no hive has it open.
    void put(const testkit::Bytes& bytes) {
        QFile file(path());
        const auto size = static_cast<qint64>(bytes.size());
        if (!file.open(QIODevice::ReadWrite) || file.write(reinterpret_cast<const char*>(bytes.data()), size) != size ||
            !file.resize(size))
            qFatal("the hive cannot be written");
    }

    QString path() const { return directory_.filePath(QStringLiteral("hive")); }
    testkit::Bytes bytes() const { return testkit::read_file(path().toStdString()); }
    testkit::Hive read() const { return testkit::read_hive(bytes()); }
    // The stored bytes of a value as the file has them now; "?" where it has no such value.
    QByteArray stored(const std::string& key_path, const std::string& name) const {
        const testkit::Hive hive = read();
        const testkit::Key* key = hive.find(key_path);
        const testkit::Value* value = key != nullptr ? testkit::find_value(*key, name) : nullptr;
        if (value == nullptr)
            return QByteArrayLiteral("?");
        return QByteArray(reinterpret_cast<const char*>(value->data.data()),
                          static_cast<qsizetype>(value->data.size()));
    }
    int stored_type(const std::string& key_path, const std::string& name) const {
        const testkit::Hive hive = read();
        const testkit::Key* key = hive.find(key_path);
        const testkit::Value* value = key != nullptr ? testkit::find_value(*key, name) : nullptr;
        return value == nullptr ? -1 : static_cast<int>(value->type);
    }
    std::string faults() const { return testkit::check_hive(bytes()).text(); }

private:
    QTemporaryDir directory_;
};
