// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
// The program's entry, run as a process: usage, exit codes, what is mounted, and what is told when a file is
// no hive.

#include "application.h"
#include "stage.h"

#include <QFile>
#include <QProcess>
#include <QTest>

#include <cerrno>
#include <csignal>
#include <fcntl.h>
#include <functional>
#include <sys/file.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

namespace {

struct Ended {
    int status = -1;
    bool crashed = false;
    QString out;
    QString err;
};

// Runs the program until it ends. The first line of standard error is the debug line of the translations,
// which comes whatever the arguments are.
Ended run(const QStringList& arguments, const QMap<QString, QString>& variables = {},
          const std::function<void()>& in_child = {}, const QString& program = QStringLiteral(TALLOWFEN_PROGRAM)) {
    QProcess process;
    process.setChildProcessModifier(in_child);
    QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
    environment.insert(QStringLiteral("QT_QPA_PLATFORM"), QStringLiteral("offscreen"));
    environment.insert(QStringLiteral("QT_PLUGIN_PATH"), QStringLiteral(PRESSER_PLUGIN_PATH));
    environment.insert(QStringLiteral("QT_QPA_GENERIC_PLUGINS"), QStringLiteral("presser"));
    for (auto it = variables.cbegin(); it != variables.cend(); ++it)
        environment.insert(it.key(), it.value());
    process.setProcessEnvironment(environment);
    process.start(program, arguments);
    Ended ended;
    if (!process.waitForFinished(30000)) {
        process.kill();
        process.waitForFinished();
        ended.err = QStringLiteral("did not end: ") + process.errorString();
        return ended;
    }
    ended.crashed = process.exitStatus() == QProcess::CrashExit;
    ended.status = process.exitCode();
    ended.out = QString::fromLocal8Bit(process.readAllStandardOutput());
    ended.err = QString::fromLocal8Bit(process.readAllStandardError());
    return ended;
}

// Standard error without the line of the translations and the toolkit's own remarks.
QString told(const Ended& ended) {
    QStringList lines = ended.err.split(QLatin1Char('\n'));
    lines.removeIf([](const QString& line) {
        return line.startsWith(QStringLiteral(TALLOWFEN_SHARE_DIR)) ||
               line.startsWith(QStringLiteral("QStandardPaths")) ||
               line.startsWith(QStringLiteral("This plugin does not"));
    });
    return lines.join(QLatin1Char('\n'));
}

const QString usage = QStringLiteral("usage: tallowfen [NAME FILE ...]\n");
const QString tops = QStringLiteral("MACHINE/SYSTEM");

// Something is said of such a hive when it is opened.
void close_improperly(testkit::LaidHive& hive) { hive.put_base(8, 0x7f); }

}  // namespace

class EntryTest : public QObject {
    Q_OBJECT

private slots:
    void wrong_arguments_give_the_usage_line_data();
    void wrong_arguments_give_the_usage_line();
    void a_hibernated_system_is_told_data();
    void a_hibernated_system_is_told();
    void a_name_without_two_parts_mounts_nothing_data();
    void a_name_without_two_parts_mounts_nothing();
    void pairs_are_mounted_in_order();
    void a_hive_that_was_not_closed_properly_is_told();
    void no_message_goes_into_a_hive_where_the_standard_streams_are_closed_data();
    void no_message_goes_into_a_hive_where_the_standard_streams_are_closed();
    void a_write_that_nothing_takes_fails_and_does_not_end_the_program();
    void the_event_loop_s_result_is_the_exit_status();
    void the_translation_line();
    void a_file_that_is_no_hive_ends_the_program_data();
    void a_file_that_is_no_hive_ends_the_program();
    void a_path_that_is_no_text_names_no_other_file();
};

void EntryTest::wrong_arguments_give_the_usage_line_data() {
    QTest::addColumn<QStringList>("arguments");
    const QString file = QStringLiteral("/nowhere");
    QTest::newRow("none") << QStringList();
    QTest::newRow("a lone NAME") << QStringList{tops};
    QTest::newRow("another option") << QStringList{QStringLiteral("--hibernate")};
    QTest::newRow("an unpaired NAME") << QStringList{tops, file, QStringLiteral("A/B")};
    QTest::newRow("--hibernated and two more")
        << QStringList{QStringLiteral("--hibernated"), file, QStringLiteral("A/B")};
}

void EntryTest::wrong_arguments_give_the_usage_line() {
    QFETCH(QStringList, arguments);
    const Ended ended = run(arguments);
    QVERIFY2(!ended.crashed, qPrintable(ended.err));
    QCOMPARE(ended.status, 1);
    QCOMPARE(told(ended), usage);
    QCOMPARE(ended.out, QString());
}

void EntryTest::a_hibernated_system_is_told_data() {
    QTest::addColumn<QString>("argument");
    QTest::newRow("--hibernated") << "--hibernated";
    QTest::newRow("what begins with it") << "--hibernatedX";
}

void EntryTest::a_hibernated_system_is_told() {
    QFETCH(QString, argument);
    const Ended ended = run({argument}, {{QStringLiteral("LC_ALL"), QStringLiteral("C")}});
    QCOMPARE(ended.status, 2);
    QCOMPARE(told(ended), QString());
    QCOMPARE(ended.out,
             QStringLiteral("box: Hibernation Detected\n"
                            "text: Your system is in hibernate mode. Therefore the registry cannot be edited. Please "
                            "restart your system and exit the hibernate mode or contact Zenta Support\n"
                            "icon: critical\nbuttons: 1024\nparent: none\n"));
}

void EntryTest::a_name_without_two_parts_mounts_nothing_data() {
    QTest::addColumn<QString>("name");
    QTest::newRow("no slash") << "SYSTEM";
    QTest::newRow("nothing behind the slash") << "SYSTEM/";
    QTest::newRow("nothing before it") << "/SYSTEM";
    QTest::newRow("empty") << "";
    // With a file behind it, this is a NAME like any other.
    QTest::newRow("--hibernated with a file") << "--hibernated";
}

void EntryTest::a_name_without_two_parts_mounts_nothing() {
    QFETCH(QString, name);
    const Scene scene;
    const QByteArray before = scene.bytes();
    // Behind a pair that is right, and in front of a file that could not be opened.
    const Ended ended = run({tops, scene.file(), name, QStringLiteral("/nowhere")});
    QVERIFY2(!ended.crashed, qPrintable(ended.err));
    QCOMPARE(ended.status, 1);
    QCOMPARE(told(ended), QStringLiteral("tallowfen: %1: a name has the form TOP/HIVE\n").arg(name));
    QCOMPARE(ended.out, QString());
    QCOMPARE(scene.bytes(), before);
}

void EntryTest::pairs_are_mounted_in_order() {
    const Scene first;
    const Scene second;
    const Scene third;
    const Ended ended = run({QStringLiteral("B/ONE"), first.file(), QStringLiteral("A/TWO"), second.file(),
                             QStringLiteral("B/THREE/more"), third.file()},
                            {{QStringLiteral("PRESSER_EXIT"), QStringLiteral("0")}});
    QVERIFY2(!ended.crashed, qPrintable(ended.err));
    QCOMPARE(ended.status, 0);
    QCOMPARE(told(ended), QString());
    QCOMPARE(ended.out, QStringLiteral("window: Registry Editor\nsize: 640 x 480\n"
                                       "group: B\nhive: ONE\nhive: THREE\ngroup: A\nhive: TWO\n"
                                       "style: QStatusBar::item { border: 0px solid black }\n"));
}

void EntryTest::a_hive_that_was_not_closed_properly_is_told() {
    const Scene scene(testkit::HiveLayout(), close_improperly);
    const QByteArray before = scene.bytes();
    const Ended ended = run({tops, scene.file()}, {{QStringLiteral("PRESSER_EXIT"), QStringLiteral("0")}});
    QCOMPARE(ended.status, 0);
    QCOMPARE(told(ended),
             QStringLiteral("warning: %1 was not closed properly; Windows may replay its logs over changes\n")
                 .arg(scene.file()));
    QCOMPARE(scene.bytes(), before);
}

void EntryTest::no_message_goes_into_a_hive_where_the_standard_streams_are_closed_data() {
    QTest::addColumn<QList<int>>("closed");
    QTest::newRow("all") << QList<int>{STDIN_FILENO, STDOUT_FILENO, STDERR_FILENO};
    QTest::newRow("output and error") << QList<int>{STDOUT_FILENO, STDERR_FILENO};
    QTest::newRow("error") << QList<int>{STDERR_FILENO};
}

// The number of a closed stream goes to the next file that is opened.
void EntryTest::no_message_goes_into_a_hive_where_the_standard_streams_are_closed() {
    QFETCH(QList<int>, closed);
    const Scene scene(testkit::HiveLayout(), close_improperly);
    const QByteArray before = scene.bytes();
    const Ended ended = run({tops, scene.file()}, {{QStringLiteral("PRESSER_EXIT"), QStringLiteral("0")}}, [&] {
        for (const int stream : closed)
            close(stream);
    });
    QVERIFY2(!ended.crashed, qPrintable(ended.err));
    QCOMPARE(ended.status, 0);
    QCOMPARE(scene.bytes(), before);
}

void EntryTest::a_write_that_nothing_takes_fails_and_does_not_end_the_program() {
    const QTemporaryDir directory;
    const QByteArray path = QFile::encodeName(directory.filePath(QStringLiteral("file")));
    const pid_t child = fork();
    if (child == 0) {
        prepare_process();
        const rlimit limit = {16, 16};
        const int file = open(path.constData(), O_CREAT | O_WRONLY, 0600);
        const bool limited = setrlimit(RLIMIT_FSIZE, &limit) == 0 && pwrite(file, "x", 1, 15) == 1;
        int ends[2];
        const bool refused = pipe(ends) == 0 && close(ends[0]) == 0 && write(ends[1], "x", 1) == -1 && errno == EPIPE;
        _exit(refused && limited && pwrite(file, "x", 1, 16) == -1 && errno == EFBIG ? 0 : 1);
    }
    int status = -1;
    QCOMPARE(waitpid(child, &status, 0), child);
    QVERIFY(WIFEXITED(status));
    QCOMPARE(WEXITSTATUS(status), 0);
}

void EntryTest::the_event_loop_s_result_is_the_exit_status() {
    const Scene scene;
    const Ended ended = run({tops, scene.file()}, {{QStringLiteral("PRESSER_EXIT"), QStringLiteral("7")}});
    QCOMPARE(ended.status, 7);
}

void EntryTest::the_translation_line() {
    // Directory and locale as one text, without quotes. A locale that has no file of its own falls back.
    const Ended ended = run({}, {{QStringLiteral("LC_ALL"), QStringLiteral("xx_YY.UTF-8")}});
    const QStringList lines = ended.err.split(QLatin1Char('\n'));
    QVERIFY2(lines.contains(QStringLiteral(TALLOWFEN_SHARE_DIR "en_US")), qPrintable(ended.err));
}

void EntryTest::a_file_that_is_no_hive_ends_the_program_data() {
    QTest::addColumn<QString>("kind");
    QTest::addColumn<QString>("reason");
    QTest::newRow("missing") << "missing"
                             << "Cannot open file";
    QTest::newRow("a directory") << "directory"
                                 << "Cannot open file";
    QTest::newRow("locked by another program") << "locked"
                                               << "Cannot open file";
    QTest::newRow("named twice") << "twice"
                                 << "Cannot open file";
    QTest::newRow("empty") << "empty"
                           << "Cannot load hive";
    QTest::newRow("text") << "text"
                          << "Cannot load hive";
    QTest::newRow("cut short") << "cut"
                               << "Cannot load hive";
}

void EntryTest::a_file_that_is_no_hive_ends_the_program() {
    QFETCH(QString, kind);
    QFETCH(QString, reason);
    const Scene sound;
    const QTemporaryDir directory;
    const QString path = directory.filePath(QStringLiteral("f\u00fcr mich"));
    QFile file(kind == QStringLiteral("locked") || kind == QStringLiteral("twice") ? sound.file() : path);
    if (kind == QStringLiteral("empty") || kind == QStringLiteral("text") || kind == QStringLiteral("cut")) {
        QVERIFY(file.open(QIODevice::WriteOnly));
        file.write(kind == QStringLiteral("cut")
                       ? sound.bytes().left(4000)
                       : QByteArray(kind == QStringLiteral("text") ? "no hive\n" : "").repeated(1000));
        file.close();
    } else if (kind == QStringLiteral("locked")) {
        QVERIFY(file.open(QIODevice::ReadWrite));
        QCOMPARE(flock(file.handle(), LOCK_EX | LOCK_NB), 0);
    }
    const QString shown = kind == QStringLiteral("directory") ? directory.path() : file.fileName();
    QStringList arguments{tops, shown};
    if (kind == QStringLiteral("twice"))
        arguments << QStringLiteral("A/B") << shown;
    const QByteArray before = sound.bytes();
    const Ended ended = run(arguments, {{QStringLiteral("LC_ALL"), QStringLiteral("C.UTF-8")}});
    // Nobody catches it: the program is ended by the uncaught exception, without a window.
    QVERIFY(ended.crashed);
    QCOMPARE(ended.status, SIGABRT);
    QCOMPARE(told(ended), QStringLiteral("tallowfen: %1: %2\n").arg(shown, reason));
    QCOMPARE(ended.out, QString());
    QCOMPARE(sound.bytes(), before);
}

void EntryTest::a_path_that_is_no_text_names_no_other_file() {
    const Scene scene;
    const QTemporaryDir directory;
    // What the path becomes where the byte that is no character is replaced.
    const QString other = directory.filePath(QStringLiteral("J\ufffdrg"));
    QVERIFY(QFile::copy(scene.file(), other));
    const Ended ended = run({QStringLiteral("-c"), QStringLiteral("exec \"$0\" A/B \"$1/J$(printf '\\366')rg\""),
                             QStringLiteral(TALLOWFEN_PROGRAM), directory.path()},
                            {{QStringLiteral("PRESSER_EXIT"), QStringLiteral("0")}}, {}, QStringLiteral("/bin/sh"));
    QVERIFY(ended.crashed);
    QCOMPARE(ended.status, SIGABRT);
    QCOMPARE(told(ended), QStringLiteral("tallowfen: %1: Cannot open file\n").arg(other));
}

QTEST_GUILESS_MAIN(EntryTest)
#include "entry_test.moc"
