// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "file_faults.h"
#include "hive_on_disk.h"

#include "reg_hive.h"
#include "reg_key.h"

#include <QDir>
#include <QFileInfo>
#include <QTest>

#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include <stdexcept>

namespace {

testkit::HiveLayout many_keys(int count) {
    testkit::HiveLayout layout;
    testkit::KeyLayout& parent = layout.root.add("Parent");
    for (int i = 0; i < count; i++)
        parent.add("Key " + std::to_string(1000 + i)).set("v", 4, testkit::pattern(4));
    return layout;
}

// What the constructor throws for a path; empty when the hive opens.
QString failure(const QString& path) {
    DummyRegKey top(QStringLiteral("TOP"));
    try {
        const RegHive hive(QStringLiteral("HIVE"), path, &top);
    } catch (const std::runtime_error& thrown) {
        return QString::fromLatin1(thrown.what());
    }
    return QString();
}

// Ways to one file: links of both kinds, a path that stays where it is, one below another root.
QStringList other_paths(const QString& path) {
    const QFileInfo file(path);
    const QString soft = path + QStringLiteral("-soft");
    const QString hard = path + QStringLiteral("-hard");
    symlink(QFile::encodeName(path).constData(), QFile::encodeName(soft).constData());
    link(QFile::encodeName(path).constData(), QFile::encodeName(hard).constData());
    return {soft, hard, file.path() + QStringLiteral("/.//") + file.fileName(), QDir::current().relativeFilePath(path),
            QStringLiteral("/proc/self/root") + path};
}

// How many descriptors of this process lead to a file.
int open_descriptors(const QString& path) {
    int count = 0;
    const QString wanted = QFileInfo(path).canonicalFilePath();
    const QFileInfoList entries = QDir(QStringLiteral("/proc/self/fd")).entryInfoList(QDir::AllEntries | QDir::System);
    for (const QFileInfo& entry : entries)
        count += entry.symLinkTarget() == wanted ? 1 : 0;
    return count;
}

}  // namespace

class HiveTest : public QObject {
    Q_OBJECT

private slots:
    void a_missing_file_cannot_be_opened_and_is_not_made() {
        const QTemporaryDir directory;
        const QString path = directory.filePath(QStringLiteral("none"));
        QCOMPARE(failure(path), QStringLiteral("Cannot open file"));
        QVERIFY(!QFile::exists(path));
    }

    void what_is_no_regular_file_cannot_be_opened() {
        const QTemporaryDir directory;
        QCOMPARE(failure(directory.path()), QStringLiteral("Cannot open file"));
        QCOMPARE(failure(QStringLiteral("/dev/null")), QStringLiteral("Cannot open file"));
        const QString pipe = directory.filePath(QStringLiteral("pipe"));
        QCOMPARE(mkfifo(QFile::encodeName(pipe).constData(), 0600), 0);
        QCOMPARE(failure(pipe), QStringLiteral("Cannot open file"));
    }

    void a_file_without_permission_cannot_be_opened_data() {
        QTest::addColumn<int>("permissions");
        QTest::newRow("read-only") << static_cast<int>(QFile::ReadOwner | QFile::ReadOther);
        QTest::newRow("write-only") << static_cast<int>(QFile::WriteOwner | QFile::WriteOther);
        QTest::newRow("none") << 0;
    }
    void a_file_without_permission_cannot_be_opened() {
        QFETCH(int, permissions);
        const HiveOnDisk hive(many_keys(1));
        QFile::setPermissions(QFileInfo(hive.path()).path(), QFile::Permissions(0x7755));
        QFile::setPermissions(hive.path(), QFile::Permissions(permissions));
        // Nothing is forbidden to root, so the test goes on as nobody.
        constexpr uid_t nobody = 65534;
        const uid_t user = geteuid();
        QVERIFY(user != 0 || seteuid(nobody) == 0);
        const QString what = failure(hive.path());
        QCOMPARE(seteuid(user), 0);
        QCOMPARE(what, QStringLiteral("Cannot open file"));
    }

    void a_file_that_is_no_hive_cannot_be_loaded_and_is_closed_again() {
        const HiveOnDisk text(testkit::Bytes(5000, 'x'));
        QCOMPARE(failure(text.path()), QStringLiteral("Cannot load hive"));
        QCOMPARE(open_descriptors(text.path()), 0);
        QVERIFY(text.bytes() == testkit::Bytes(5000, 'x'));
    }

    void a_hive_that_is_open_here_is_not_opened_again_under_another_path() {
        const HiveOnDisk hive(many_keys(1));
        DummyRegKey top(QStringLiteral("TOP"));
        {
            const RegHive open(QStringLiteral("HIVE"), hive.path(), &top);
            QCOMPARE(failure(hive.path()), QStringLiteral("Cannot open file"));
            for (const QString& path : other_paths(hive.path()))
                QCOMPARE(failure(path), QStringLiteral("Cannot open file"));
        }
        for (const QString& path : other_paths(hive.path()))
            QCOMPARE(failure(path), QString());
        QCOMPARE(failure(hive.path()), QString());
    }

    // As on file systems that know no locks: there a file is known by its device and number alone.
    void a_hive_that_is_open_here_is_not_opened_again_where_files_cannot_be_locked() {
        for (const int error : {ENOLCK, EOPNOTSUPP, EINVAL, ENOSYS}) {
            const testkit::LockFaults no_locks(error);
            const HiveOnDisk hive(many_keys(1));
            const HiveOnDisk another(many_keys(1));
            DummyRegKey top(QStringLiteral("TOP"));
            {
                const RegHive open(QStringLiteral("HIVE"), hive.path(), &top);
                QCOMPARE(failure(hive.path()), QStringLiteral("Cannot open file"));
                for (const QString& path : other_paths(hive.path()))
                    QCOMPARE(failure(path), QStringLiteral("Cannot open file"));
                QCOMPARE(open_descriptors(hive.path()), 1);
                QCOMPARE(failure(another.path()), QString());
            }
            for (const QString& path : other_paths(hive.path()))
                QCOMPARE(failure(path), QString());
            QVERIFY(no_locks.tried() > 3);
        }
    }

    void a_hive_that_could_not_be_loaded_can_be_opened_later_where_files_cannot_be_locked() {
        const testkit::LockFaults no_locks(ENOLCK);
        const HiveOnDisk file(testkit::Bytes(5000, 'x'));
        QCOMPARE(failure(file.path()), QStringLiteral("Cannot load hive"));
        const testkit::Bytes hive = testkit::lay_out(many_keys(1)).bytes;
        QFile opened(file.path());
        QVERIFY(opened.open(QIODevice::ReadWrite | QIODevice::Unbuffered));
        const auto size = static_cast<qint64>(hive.size());
        QCOMPARE(opened.write(reinterpret_cast<const char*>(hive.data()), size), size);
        QCOMPARE(failure(file.path()), QString());
    }

    void a_hive_that_another_program_has_locked_is_not_opened() {
        const HiveOnDisk hive(many_keys(1));
        QFile other(hive.path());
        QVERIFY(other.open(QIODevice::ReadWrite));
        QCOMPARE(flock(other.handle(), LOCK_EX | LOCK_NB), 0);
        QCOMPARE(failure(hive.path()), QStringLiteral("Cannot open file"));
        other.close();
        QCOMPARE(failure(hive.path()), QString());
    }

    void a_lock_that_is_refused_in_either_way_is_another_program_s() {
        for (const int error : {EWOULDBLOCK, EACCES}) {
            const testkit::LockFaults locked(error);
            const HiveOnDisk hive(many_keys(1));
            QCOMPARE(failure(hive.path()), QStringLiteral("Cannot open file"));
            QCOMPARE(locked.tried(), 1);
        }
    }

    void opening_and_closing_changes_no_byte() {
        const HiveOnDisk hive(many_keys(3));
        const testkit::Bytes before = hive.bytes();
        QCOMPARE(failure(hive.path()), QString());
        QVERIFY(hive.bytes() == before);
    }

    void at_most_a_hundred_handles_stay_open() {
        const HiveOnDisk file(many_keys(250));
        DummyRegKey top(QStringLiteral("TOP"));
        RegHive hive(QStringLiteral("HIVE"), file.path(), &top);
        AbstractRegKey* parent = hive.root_key()->child(0);
        for (int i = 0; i < parent->child_count(); i++)
            QCOMPARE(parent->child(i)->name(), QStringLiteral("Key %1").arg(1000 + i));
        QVERIFY(hive.cached_handles() <= 100);
        QVERIFY(hive.cached_handles() > 50);
        // The first ones were closed long ago, and open again by themselves.
        QCOMPARE(parent->child(0)->name(), QStringLiteral("Key 1000"));
        QCOMPARE(static_cast<RegKey*>(parent->child(1))->value_count(), 1);
        QVERIFY(hive.cached_handles() <= 100);
    }

    void the_root_handle_is_never_cached() {
        const HiveOnDisk file(many_keys(1));
        DummyRegKey top(QStringLiteral("TOP"));
        RegHive hive(QStringLiteral("HIVE"), file.path(), &top);
        QCOMPARE(hive.root_key()->child_count(), 1);
        hive.root_key()->reload();
        QCOMPARE(hive.cached_handles(), 0);
        hive.root_key()->child(0);
        QCOMPARE(hive.cached_handles(), 1);
        hive.clear_handle_cache();
        QCOMPARE(hive.cached_handles(), 0);
        QCOMPARE(hive.root_key()->child(0)->name(), QStringLiteral("Parent"));
    }

    void the_hive_reports_the_name_that_it_was_given() {
        const HiveOnDisk file(many_keys(1));
        DummyRegKey top(QStringLiteral("TOP"));
        const RegHive hive(QStringLiteral("SHOWN"), file.path(), &top);
        QCOMPARE(hive.name(), QStringLiteral("SHOWN"));
        QCOMPARE(hive.root_key()->parent(), static_cast<AbstractRegKey*>(&top));
    }

    void a_change_is_in_the_file_when_the_call_returns() {
        const HiveOnDisk file(many_keys(1));
        DummyRegKey top(QStringLiteral("TOP"));
        RegHive hive(QStringLiteral("HIVE"), file.path(), &top);
        auto* key = static_cast<RegKey*>(hive.root_key()->child(0));
        QVERIFY(key->set_dword_value(QStringLiteral("now"), 7, little_endian_order));
        QCOMPARE(file.stored("Parent", "now"), QByteArray("\7\0\0\0", 4));
        QVERIFY(key->new_key() >= 0);
        QVERIFY(file.read().find("Parent\\New Key #1") != nullptr);
    }
};

QTEST_GUILESS_MAIN(HiveTest)
#include "hive_test.moc"
