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
#include <set>
#include <stdexcept>
#include <string>

namespace {

constexpr uint type_string = 1;
constexpr uint type_binary = 3;

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

// What change_until_killed does, one change after the other, and what there is afterwards. Every second key and value
// that it made goes again.
constexpr int steps_of_a_round = 7;

QString text_of(const char* what, int number) { return QString::fromLatin1(what) + QString::number(number); }

bool change_once(const Opened& open, int step) {
    RegKey* const alpha = open.alpha();
    const int round = step / steps_of_a_round;
    const bool goes = round % 2 == 1;
    const auto row_of = [&](const QString& name) {
        int row = 0;
        while (open.parent->child(row)->name() != name)
            row++;
        return row;
    };
    const QString key = text_of("key ", round);
    switch (step % steps_of_a_round) {
    case 0:
        return alpha->set_dword_value(text_of("value ", round), static_cast<uint>(round), little_endian_order);
    case 1:
        return alpha->rename_value(alpha->value_count() - 1, text_of("renamed ", round));
    case 2:
        return open.parent->new_key() >= 0;
    case 3:
        return open.parent->rename_key(row_of(QStringLiteral("New Key #1")), key) >= 0;
    case 4:
        return static_cast<RegKey*>(open.parent->child(row_of(key)))
            ->set_binary_value(QStringLiteral("v"), QByteArray(50, 'n'), type_binary);
    case 5:
        return !goes || alpha->delete_value(alpha->value_count() - 1);
    default:
        return !goes || open.parent->delete_key(row_of(key));
    }
}

// "NAME" of a key, "KEY|NAME" of a value, of what change_until_killed makes.
std::set<std::string> made_by(int steps) {
    std::set<std::string> made;
    for (int step = 0; step < steps; step++) {
        const std::string number = std::to_string(step / steps_of_a_round);
        const bool goes = step / steps_of_a_round % 2 == 1;
        switch (step % steps_of_a_round) {
        case 0:
            made.insert("alpha|value " + number);
            break;
        case 1:
            made.erase("alpha|value " + number);
            made.insert("alpha|renamed " + number);
            break;
        case 2:
            made.insert("New Key #1");
            break;
        case 3:
            made.erase("New Key #1");
            made.insert("key " + number);
            break;
        case 4:
            made.insert("key " + number + "|v");
            break;
        case 5:
            if (goes)
                made.erase("alpha|renamed " + number);
            break;
        default:
            if (goes) {
                made.erase("key " + number);
                made.erase("key " + number + "|v");
            }
        }
    }
    return made;
}

// What is there beside some_keys(), in the same form; what does not read as it was stored has "?" behind it.
std::set<std::string> made_in(const testkit::Hive& hive) {
    std::set<std::string> made;
    for (const testkit::Key& key : hive.find("Parent")->children) {
        const std::string name = testkit::utf8(key.name);
        if (name != "alpha" && name != "beta" && name != "gamma")
            made.insert(name);
        for (const testkit::Value& value : key.values) {
            const std::string value_name = testkit::utf8(value.name);
            const size_t blank = value_name.find(' ');
            if (blank == std::string::npos && name.find(' ') == std::string::npos)
                continue;  // was there before
            testkit::Bytes stored(50, 'n');
            if (name == "alpha") {
                stored.assign(4, 0);
                testkit::set32(stored, 0, static_cast<uint32_t>(std::stoul(value_name.substr(blank + 1))));
            }
            made.insert(name + "|" + value_name + (value.data == stored ? "" : "?"));
        }
    }
    return made;
}

// The rules that a change which was stopped may leave broken.
bool may_be_left(const std::string& rule) {
    return rule == "count" || rule == "parent" || rule == "references" || rule == "ring";
}

// A byte goes into the pipe after each change.
[[noreturn]] void change_until_killed(const QString& path, int pipe) {
    const Opened open(path);
    for (int step = 0;; step++) {
        if (!change_once(open, step) || write(pipe, "", 1) != 1)
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
    for (int i = 0; i < key->child_count(); i++)
        attempt([&] { troubles += browse(static_cast<RegKey*>(key->child(i))); });
    return troubles;
}

QStringList names_below(RegKey* key) {
    QStringList names;
    for (int i = 0; i < key->child_count(); i++)
        names.append(key->child(i)->name());
    return names;
}

}  // namespace

class FileTest : public QObject {
    Q_OBJECT

private slots:
    void another_process_sees_every_byte_of_a_change_when_the_call_returns() {
        const HiveOnDisk file(some_keys());
        Opened open(file.path());
        const std::vector<std::function<bool()>> changes = {
            [&] { return open.alpha()->set_dword_value(QStringLiteral("number"), 77, little_endian_order); },
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
        for (const int wanted : {1, 2, 3, 4, 5, 6, 7, 13, 14, 100, 701, 1500}) {
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

            // The change that was stopped has left the one, the other, or for a time both.
            const std::set<std::string> before = made_by(finished);
            const std::set<std::string> after = made_by(finished + 1);
            const std::set<std::string> found = made_in(file.read());
            for (const std::string& made : before)
                QVERIFY2(found.count(made) != 0 || after.count(made) == 0, made.c_str());
            for (const std::string& made : found)
                QVERIFY2(before.count(made) != 0 || after.count(made) != 0, made.c_str());
            for (const testkit::Fault& fault : testkit::check_hive(file.bytes()).faults)
                QVERIFY2(may_be_left(fault.rule), (fault.rule + ": " + fault.text).c_str());
            QCOMPARE(file.stored("Parent\\beta", "bytes").size(), 900);
            Opened again(file.path());
            QVERIFY(browse(again.hive.root_key()).isEmpty());
            QVERIFY(again.alpha()->set_dword_value(QStringLiteral("after"), 1, little_endian_order));
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
                QVERIFY(open.alpha()->set_dword_value(QStringLiteral("number"), static_cast<uint>(room),
                                                      little_endian_order));
            }
            QVERIFY2(file.faults().empty(), file.faults().c_str());
            QCOMPARE(file.stored("Parent\\alpha", "new"), QByteArrayLiteral("?"));
            QCOMPARE(file.stored("Parent\\beta", "bytes"), before);
        }
        Opened open(file.path());
        QVERIFY(open.alpha()->set_binary_value(QStringLiteral("new"), QByteArray(50000, 'n'), type_binary));
        QCOMPARE(file.stored("Parent\\alpha", "new"), QByteArray(50000, 'n'));
    }

    void a_full_disk_refuses_new_keys_and_names_and_harms_nothing() {
        testkit::HiveLayout layout = some_keys();
        layout.no_free_space = true;
        const testkit::Bytes start = testkit::lay_out(layout).bytes;
        const std::vector<std::function<bool(const Opened&)>> changes = {
            [](const Opened& open) { return open.parent->new_key() >= 0; },
            [](const Opened& open) { return open.parent->rename_key(1, QStringLiteral("zeta")) >= 0; },
            [](const Opened& open) { return open.alpha()->rename_value(1, QStringLiteral("title")); },
        };
        for (const auto& change : changes) {
            const HiveOnDisk tried(start);
            const Opened open(tried.path());
            for (const qint64 room : {qint64(0), qint64(1), qint64(100), qint64(512), qint64(4095)}) {
                {
                    const SizeLimit limit(static_cast<qint64>(start.size()) + room);
                    QVERIFY(!change(open));
                }
                QCOMPARE(testkit::diff(start, tried.bytes()), std::vector<std::string>());
                QVERIFY2(tried.faults().empty(), tried.faults().c_str());
                QVERIFY(browse(open.hive.root_key()).isEmpty());
                QCOMPARE(names_below(open.parent),
                         QStringList({QStringLiteral("alpha"), QStringLiteral("beta"), QStringLiteral("gamma")}));
                QCOMPARE(open.alpha()->value_count(), 3);
            }
            // A bin, and what the zeros ahead of it may reach beyond it where they were cut off before.
            const SizeLimit limit(static_cast<qint64>(start.size()) + 4096 + 511);
            QVERIFY(change(open));
            QVERIFY2(tried.faults().empty(), tried.faults().c_str());
        }
    }

    void a_file_that_shrinks_while_it_is_open_is_told_and_not_made_up_with_zeros() {
        testkit::HiveLayout layout = some_keys();
        layout.root.children[0].set("bytes", 3, testkit::pattern(40000));  // more than is read ahead
        const testkit::LaidHive laid = testkit::lay_out(layout);
        const auto whole = static_cast<qint64>(laid.bytes.size());
        qsizetype told = 0;
        for (qint64 size = whole - 512; size >= 0; size -= 512) {
            const HiveOnDisk file(laid.bytes);
            Opened open(file.path());
            QVERIFY(browse(open.hive.root_key()).isEmpty());
            QCOMPARE(truncate(QFile::encodeName(file.path()).constData(), size), 0);
            open.hive.clear_handle_cache();
            const QStringList troubles = browse(open.hive.root_key());
            told += troubles.size();
            for (const QString& trouble : troubles)
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
        QVERIFY(told > 0);
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
