// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Searches of a whole hive through the key tree's model, against a plain walk of the same hive through the engine.
#include "hive_file.h"
#include "walk.h"

#include "reg_key.h"
#include "reg_model.h"

#include <benchmark/benchmark.h>

#include <QCoreApplication>
#include <QFile>
#include <QTemporaryDir>

#include <cstdio>
#include <cstdlib>

namespace {

// A copy of the large real hive where there is one, else a made one: the editor writes to what it opens.
class LargeCopy {
public:
    LargeCopy() : path_(directory_.filePath(QStringLiteral("hive"))) {
        const QString real = QStringLiteral(TALLOWFEN_HIVES "/software-7");
        if (QFile::exists(real) && QFile::copy(real, path_)) {
            QFile::setPermissions(path_, QFile::ReadOwner | QFile::WriteOwner);
            return;
        }
        bench::HiveFile made(path_.toStdString(), bench::HiveFile::Empty);
        RegistryKey* root = made.open();
        bench::make_branches(root, 100, 300);
        RCloseKey(root);
    }

    const QString& path() const { return path_; }

private:
    QTemporaryDir directory_;
    QString path_;
};

const LargeCopy& large() {
    static const LargeCopy copy;
    return copy;
}

void PlainWalk(benchmark::State& state) {
    bench::HiveFile file(large().path().toStdString());
    RegistryKey* root = file.open();
    bench::Walk walk;
    for (auto _ : state)
        walk.key(root);
    RCloseKey(root);
}
BENCHMARK(PlainWalk)->Unit(benchmark::kMillisecond);

// The argument is the mode: keys, values or both. The first search makes the key objects, which all later ones find.
void SearchAbsent(benchmark::State& state) {
    RegModel model;
    model.add_hive(QStringLiteral("TOP/HIVE"), large().path());
    const RegModel::FindMode mode = RegModel::FindMode(static_cast<int>(state.range(0)));
    for (auto _ : state) {
        model.begin_find(model.index(0, 0));
        if (model.find(QStringLiteral("no such name anywhere"), mode, Qt::MatchContains).key.isValid())
            std::abort();
    }
}
BENCHMARK(SearchAbsent)->Arg(1)->Arg(2)->Arg(3)->Unit(benchmark::kMillisecond);

// One key with as many values as the argument says.
void SearchInOneKey(benchmark::State& state) {
    const QTemporaryDir directory;
    const QString path = directory.filePath(QStringLiteral("hive"));
    {
        bench::HiveFile made(path.toStdString(), bench::HiveFile::Empty);
        RegistryKey* root = made.open();
        RegistryKey* key = nullptr;
        if (RCreateKey(root, "Key", &key, nullptr) != R_SUCCESS)
            std::abort();
        bench::make_values(key, static_cast<int>(state.range(0)));
        RCloseKey(key);
        RCloseKey(root);
    }
    RegModel model;
    model.add_hive(QStringLiteral("TOP/HIVE"), path);
    for (auto _ : state) {
        model.begin_find(model.index(0, 0));
        if (model.find(QStringLiteral("absent"), RegModel::FindValues, Qt::MatchContains).key.isValid())
            std::abort();
    }
}
BENCHMARK(SearchInOneKey)->Arg(10000)->Arg(20000)->Unit(benchmark::kMillisecond);

} // namespace

BENCHMARK_MAIN();
