// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// What the engine is given to reach a hive's file.
#include "device_calls.h"

#include <QBuffer>
#include <QTest>

#include <cstdint>

namespace {

// A device of any length, of which nothing but the length is there.
class Long : public QIODevice {
public:
    explicit Long(qint64 length) : length_(length) { open(QIODevice::ReadWrite); }
    qint64 size() const override { return length_; }

protected:
    qint64 readData(char*, qint64) override { return -1; }
    qint64 writeData(const char*, qint64) override { return -1; }

private:
    qint64 length_;
};

}  // namespace

class DeviceTest : public QObject {
    Q_OBJECT

private slots:
    void a_seek_counts_from_the_beginning_the_place_or_the_end() {
        QBuffer buffer;
        buffer.setData(QByteArray(100, 'x'));
        QVERIFY(buffer.open(QIODevice::ReadWrite));
        void* const device = static_cast<QIODevice*>(&buffer);
        QCOMPARE(seek_device(device, 10, 0), 10);
        QCOMPARE(seek_device(device, 5, 1), 15);
        QCOMPARE(seek_device(device, -15, 1), 0);
        QCOMPARE(seek_device(device, -1, 2), 99);
        QCOMPARE(seek_device(device, 0, 2), 100);
        QCOMPARE(seek_device(device, 0, 3), -1);
        QCOMPARE(seek_device(device, -1, 0), -1);
        QCOMPARE(buffer.pos(), 100);
        char byte = 0;
        QCOMPARE(read_device(device, &byte, 1), 0);
        QCOMPARE(seek_device(device, 3, 0), 3);
        QCOMPARE(write_device(device, "ab", 2), 2);
        QCOMPARE(buffer.data().mid(3, 2), QByteArrayLiteral("ab"));
    }

    // The engine would take another length for the file's.
    void a_place_that_31_bits_cannot_say_is_not_reached() {
        for (const qint64 length : {qint64{INT32_MAX} + 1, qint64{3} << 30, (qint64{4} << 30) + 8192}) {
            Long device(length);
            QCOMPARE(seek_device(static_cast<QIODevice*>(&device), 0, 2), -1);
        }
        Long device(INT32_MAX);
        QCOMPARE(seek_device(static_cast<QIODevice*>(&device), 0, 2), INT32_MAX);
    }
};

QTEST_GUILESS_MAIN(DeviceTest)
#include "device_test.moc"
