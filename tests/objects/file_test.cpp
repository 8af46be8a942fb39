// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// The hive's file as others see it: another process while the hive is open, the disk when it is full, whoever cuts the
// file short meanwhile, and whoever comes after the program was killed.
#include "hive_on_disk.h"

#include "reg_hive.h"
#include "reg_key.h"

#include <QProcess>
#include <QTest>

#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include <csignal>
#include <functional>
#include <stdexcept>

namespace {

constexpr uint type_string = 1;
constexpr uint type_binary = 3;
constexpr int dword_order = 4;

testkit::HiveLayout some_keys() {
    testkit::HiveLayout layout;
    testkit::KeyLayout& parent = layout.root.add("Parent");
    for (const char* name : {"alpha", "beta", "gamma"}) {
        testkit::KeyLayout& key = parent.add(name);
        key.set("number", 4, testkit::pattern(4));
        key.set("text", 1, testkit::text_data("as it was"));
        key.set("bytes", 3, testkit::pattern(900));
    }
    return layout;
}

struct Opened {
    explicit Opened(const QString& path) : hive(QStringLiteral("HIVE"), path, &top) {}

    DummyRegKey top{QStringLiteral("TOP")};
    RegHive hive;
    RegKey* parent = static_cast<RegKey*>(hive.root_key()->child(0));
    RegKey* alpha() const { return static_cast<RegKey*>(parent->child(0)); }
};

// What a process of its own reads from the file.
testkit::Bytes seen_by_another_process(const QString& path) {
    QProcess reader;
    reader.start(QStringLiteral("cat"), {path});
    if (!reader.waitForFinished() || reader.exitCode() != 0)
        qFatal("cat cannot read the hive");
    const QByteArray bytes = reader.readAllStandardOutput();
    return testkit::Bytes(bytes.begin(), bytes.end());
}

// The file size that writes may reach, while it lives. Beyond it a write fails as it does on a full disk.
class SizeLimit {
public:
    explicit SizeLimit(qint64 size) : handler_(std::signal(SIGXFSZ, SIG_IGN)) {
        getrlimit(RLIMIT_FSIZE, &before_);
        const rlimit limited = {static_cast<rlim_t>(size), before_.rlim_max};
        if (setrlimit(RLIMIT_FSIZE, &limited) != 0)
            qFatal("the size of files cannot be limited");
    }
    ~SizeLimit() {
        setrlimit(RLIMIT_FSIZE, &before_);
        std::signal(SIGXFSZ, handler_);
    }
    SizeLimit(const SizeLimit&) = delete;
    SizeLimit& operator=(const SizeLimit&) = delete;

private:
    rlimit before_ = {};
    void (*handler_)(int);
};

// Makes values "0", "1", ... and keys beside them until it is killed; a byte goes into the pipe after each value.
[[noreturn]] void change_until_killed(const QString& path, int pipe) {
    const Opened open(path);
    for (uint i = 0;; i++) {
        const bool stored = open.alpha()->set_dword_value(QString::number(i), i, dword_order);
        if (!stored || write(pipe, "", 1) != 1)
            _exit(1);
        if (i % 7 == 0 && open.parent->new_key() < 0)
            _exit(1);
    }
}

// Reads every key and value; what is thrown must be one of the key object's own texts.
QStringList browse(RegKey* key) {
    QStringList troubles;
    const auto attempt = [&](const std::function<void()>& step) {
        try {
            step();
        } catch (const std::runtime_error& failure) {
            troubles.append(QString::fromLatin1(failure.what()));
        } catch (const std::invalid_argument& failure) {
            troubles.append(QString::fromLatin1(failure.what()));
        }
    };
    attempt([&] { key->name(); });
    int values = 0;
    attempt([&] { values = key->value_count(); });
    for (int i = 0; i < values; i++)
        attempt([&] { key->read_value(i); });
    for (int i = 0; i < key->child_count(); i++) {
        attempt([&] { troubles += browse(static_cast<RegKey*>(key->child(i))); });
    }
    return troubles;
}

}  // namespace

class FileTest : public QObject {
    Q_OBJECT

private slots:
    void another_process_sees_every_byte_of_a_change_when_the_call_returns() {
        const HiveOnDisk file(some_keys());
        Opened open(file.path());
        const std::vector<std::function<bool()>> changes = {
            [&] { return open.alpha()->set_dword_value(QStringLiteral("number"), 77, dword_order); },
            [&] {
                return open.alpha()->set_string_value(QStringLiteral("text"), QStringLiteral("longer than it was"),
                                                      type_string);
            },
            [&] { return open.alpha()->set_binary_value(QStringLiteral("new"), QByteArray(50000, 'n'), type_binary); },
            [&] { return open.alpha()->set_multi_string_value(QStringLiteral("list"), {QStringLiteral("one")}); },
            [&] { return open.alpha()->rename_value(0, QStringLiteral("renamed")); },
            [&] { return open.alpha()->delete_value(1); },
            [&] { return open.parent->new_key() >= 0; },
            [&] { return open.parent->rename_key(0, QStringLiteral("zeta")) >= 0; },
            [&] { return open.parent->delete_key(0); },
        };
        testkit::Bytes before = file.bytes();
        std::vector<testkit::Bytes> seen;
        for (const auto& change : changes) {
            QVERIFY(change());
            seen.push_back(seen_by_another_process(file.path()));
            QVERIFY(seen.back() != before);
            QVERIFY2(testkit::check_hive(seen.back()).faults.empty(), testkit::check_hive(seen.back()).text().c_str());
            before = seen.back();
        }
        QVERIFY(seen_by_another_process(file.path()) == seen.back());
    }

    void closing_writes_nothing_that_was_missing() {
        const HiveOnDisk file(some_keys());
        testkit::Bytes while_open;
        {
            Opened open(file.path());
            QVERIFY(open.alpha()->set_binary_value(QStringLiteral("new"), QByteArray(50000, 'n'), type_binary));
            while_open = seen_by_another_process(file.path());
        }
        QVERIFY(file.bytes() == while_open);
    }

    void killed_at_any_time_it_has_lost_nothing_finished() {
        for (const int wanted : {1, 2, 10, 100, 700}) {
            const HiveOnDisk file(some_keys());
            int ends[2];
            QCOMPARE(pipe(ends), 0);
            const pid_t child = fork();
            if (child == 0)
                change_until_killed(file.path(), ends[1]);
            QVERIFY(child > 0);
            close(ends[1]);
            int finished = 0;
            char byte;
            while (finished < wanted && read(ends[0], &byte, 1) == 1)
                finished++;
            kill(child, SIGKILL);
            QCOMPARE(waitpid(child, nullptr, 0), child);
            QCOMPARE(finished, wanted);
            while (read(ends[0], &byte, 1) == 1)  // what was finished before the signal came
                finished++;
            close(ends[0]);

            for (int i = 0; i < finished; i++) {
                const auto number = static_cast<uint32_t>(i);
                const QByteArray stored = file.stored("Parent\\alpha", std::to_string(i));
                QCOMPARE(stored, QByteArray(reinterpret_cast<const char*>(&number), sizeof number));
            }
            QCOMPARE(file.stored("Parent\\beta", "bytes").size(), 900);
            Opened again(file.path());
            QVERIFY(again.alpha()->set_dword_value(QStringLiteral("after"), 1, dword_order));
        }
    }

    void a_full_disk_refuses_what_needs_a_bin_and_harms_nothing() {
        const HiveOnDisk file(some_keys());
        const auto whole = static_cast<qint64>(file.bytes().size());
        const QByteArray before = file.stored("Parent\\beta", "bytes");
        for (const qint64 room : {qint64(0), qint64(100), qint64(512), qint64(4096), qint64(20000)}) {
            Opened open(file.path());
            {
                const SizeLimit limit(whole + room);
                QVERIFY(!open.alpha()->set_binary_value(QStringLiteral("new"), QByteArray(50000, 'n'), type_binary));
                // What finds room in the bins that are there is stored all the same.
                QVERIFY(open.alpha()->set_dword_value(QStringLiteral("number"), static_cast<uint>(room), dword_order));
            }
            QVERIFY2(file.faults().empty(), file.faults().c_str());
            QCOMPARE(file.stored("Parent\\alpha", "new"), QByteArrayLiteral("?"));
            QCOMPARE(file.stored("Parent\\beta", "bytes"), before);
        }
        Opened open(file.path());
        QVERIFY(open.alpha()->set_binary_value(QStringLiteral("new"), QByteArray(50000, 'n'), type_binary));
        QCOMPARE(file.stored("Parent\\alpha", "new"), QByteArray(50000, 'n'));
    }

    void a_file_that_shrinks_while_it_is_open_is_told_and_not_made_up_with_zeros() {
        const testkit::LaidHive laid = testkit::lay_out(some_keys());
        const auto whole = static_cast<qint64>(laid.bytes.size());
        for (qint64 size = whole - 512; size >= 0; size -= 512) {
            const HiveOnDisk file(laid.bytes);
            Opened open(file.path());
            QVERIFY(browse(open.hive.root_key()).isEmpty());
            QCOMPARE(truncate(QFile::encodeName(file.path()).constData(), size), 0);
            open.hive.clear_handle_cache();
            for (const QString& trouble : browse(open.hive.root_key()))
                QVERIFY2(trouble == QLatin1String("ROpenSubKey failed") || trouble == QLatin1String("index") ||
                             trouble == QLatin1String("RQueryInfoKeyW failed"),
                         qPrintable(trouble));
            try {
                open.alpha()->set_binary_value(QStringLiteral("new"), QByteArray(9000, 'n'), type_binary);
                open.parent->new_key();
                open.parent->delete_key(1);
            } catch (const std::runtime_error& failure) {
                QCOMPARE(QString::fromLatin1(failure.what()), QStringLiteral("ROpenSubKey failed"));
            }
            // A record that is still in the read window may be written once more; the bins are not made up with zeros.
            QVERIFY2(static_cast<qint64>(file.bytes().size()) < whole, qPrintable(QString::number(size)));
        }
    }

    void no_hive_grows_past_two_gigabytes() {
        // The second bin is one used cell, up to a page before the highest end that a hive can have.
        constexpr qint64 highest_end = 0x7FFFF000;
        testkit::HiveLayout layout = some_keys();
        layout.no_free_space = true;
        testkit::LaidHive laid = testkit::lay_out(layout);
        const auto first_size = static_cast<uint32_t>(laid.bytes.size() - 4096);
        const auto second_size = static_cast<uint32_t>(highest_end - 4096 - 4096 - first_size);
        laid.put_base(40, first_size + second_size);
        laid.fix_checksum();
        testkit::Bytes head(36);
        std::copy_n("hbin", 4, head.begin());
        testkit::set32(head, 4, first_size);
        testkit::set32(head, 8, second_size);
        testkit::set32(head, 32, 0U - (second_size - 32));
        laid.bytes.insert(laid.bytes.end(), head.begin(), head.end());
        const HiveOnDisk file(laid.bytes);
        QFile sparse(file.path());
        QVERIFY(sparse.resize(4096 + qint64(first_size) + second_size));

        Opened open(file.path());
        QCOMPARE(open.alpha()->value_count(), 3);
        // A page is left, and then nothing.
        QVERIFY(!open.alpha()->set_binary_value(QStringLiteral("large"), QByteArray(5000, 'n'), type_binary));
        QCOMPARE(QFileInfo(file.path()).size(), highest_end - 4096);
        QVERIFY(open.alpha()->set_binary_value(QStringLiteral("last"), QByteArray(3000, 'n'), type_binary));
        QCOMPARE(QFileInfo(file.path()).size(), highest_end);
        QVERIFY(!open.alpha()->set_binary_value(QStringLiteral("more"), QByteArray(3000, 'n'), type_binary));
        QCOMPARE(QFileInfo(file.path()).size(), highest_end);
        QCOMPARE(open.alpha()->value_count(), 4);
        QCOMPARE(open.alpha()->read_value(3)->name, QStringLiteral("last"));
    }
};

QTEST_GUILESS_MAIN(FileTest)
#include "file_test.moc"
