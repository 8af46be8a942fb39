// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// What the user waits for in the window: large keys expanded, shown and scrolled, long data painted.
#include "scratch_hive.h"
#include "sizes.h"
#include "walk.h"

#include "application.h"
#include "keys_view.h"
#include "main_window.h"
#include "reg_model.h"
#include "values_view.h"

#include <benchmark/benchmark.h>

#include <QEvent>
#include <QLoggingCategory>
#include <QScrollBar>

#include <cstdio>
#include <cstdlib>
#include <map>
#include <memory>
#include <string>

namespace {

using bench::ScratchHive;

// The tree's model, counting what the view asks it.
class CountingModel : public RegModel {
public:
    QVariant data(const QModelIndex& index, int role) const override {
        data_calls++;
        return RegModel::data(index, role);
    }
    QModelIndex index(int row, int column, const QModelIndex& parent = QModelIndex()) const override {
        index_calls++;
        return RegModel::index(row, column, parent);
    }

    mutable int64_t data_calls = 0;
    mutable int64_t index_calls = 0;
};

class PaintCounter : public QObject {
public:
    bool eventFilter(QObject*, QEvent* event) override {
        paints += event->type() == QEvent::Paint ? 1 : 0;
        return false;
    }

    int paints = 0;
};

// The program's window over a hive, shown, the tree expanded to the hive's root.
class OpenWindow {
public:
    explicit OpenWindow(const ScratchHive& hive) {
        window_.resize(640, 480);
        model.add_hive(QStringLiteral("TOP/HIVE"), QString::fromStdString(hive.path()));
        window_.set_model(&model);
        keys = window_.findChild<KeysView*>();
        values = window_.findChild<ValuesView*>();
        window_.show();
        keys->expand(model.index(0, 0));
        keys->expand(root());
        QCoreApplication::processEvents();
    }

    QModelIndex root() const { return model.index(0, 0, model.index(0, 0)); }
    // A key below the root.
    QModelIndex key(int row) const { return model.index(row, 0, root()); }

    // Lets the events of a gesture be handled, and makes sure that the view was painted for it.
    template <typename Gesture>
    void painted(QAbstractItemView* view, const Gesture& gesture) {
        PaintCounter counter;
        view->viewport()->installEventFilter(&counter);
        gesture();
        QCoreApplication::processEvents();
        if (counter.paints == 0) {
            std::fputs("the view was not painted\n", stderr);
            std::exit(1);
        }
    }

private:
    MainWindow window_;

public:
    // Goes before the window, as in the program.
    CountingModel model;
    KeysView* keys;
    ValuesView* values;
};

// One hive for each size: making a large one takes longer than what is measured on it.
const ScratchHive& hive_with_subkeys(int count) {
    static std::map<int, ScratchHive> hives;
    return hives.try_emplace(count, [count](RegistryKey* root) { bench::make_key_with_subkeys(root, "Key", count); })
        .first->second;
}

const ScratchHive& hive_with_values(int count) {
    static std::map<int, ScratchHive> hives;
    return hives.try_emplace(count, [count](RegistryKey* root) { bench::make_key_with_values(root, "Key", count); })
        .first->second;
}

// From the gesture to the first paint; the subkeys' objects are made by it.
void ExpandKey(benchmark::State& state) {
    const ScratchHive& hive = hive_with_subkeys(static_cast<int>(state.range(0)));
    for (auto _ : state) {
        state.PauseTiming();
        {
            OpenWindow window(hive);
            const QModelIndex key = window.key(0);
            window.model.data_calls = 0;
            state.ResumeTiming();
            window.painted(window.keys, [&] { window.keys->expand(key); });
            state.PauseTiming();
            state.counters["data/op"] = static_cast<double>(window.model.data_calls);
        }
        state.ResumeTiming();
    }
}
BENCHMARK(ExpandKey)->ArgsProduct(bench::sizes({6250, 12500, 25000, 50000}))->Unit(benchmark::kMillisecond);

// To the last subkey and back to the first, painted at both ends.
void ScrollKeys(benchmark::State& state) {
    OpenWindow window(hive_with_subkeys(static_cast<int>(state.range(0))));
    window.painted(window.keys, [&] { window.keys->expand(window.key(0)); });
    window.model.data_calls = 0;
    window.model.index_calls = 0;
    QScrollBar* const bar = window.keys->verticalScrollBar();
    for (auto _ : state) {
        window.painted(window.keys, [&] { bar->setValue(bar->maximum()); });
        window.painted(window.keys, [&] { bar->setValue(0); });
    }
    const auto times = static_cast<double>(state.iterations());
    state.counters["data/op"] = static_cast<double>(window.model.data_calls) / times;
    state.counters["index/op"] = static_cast<double>(window.model.index_calls) / times;
    state.counters["rows"] = 2.0 * window.keys->viewport()->height() / window.keys->visualRect(window.key(0)).height();
}
BENCHMARK(ScrollKeys)->ArgsProduct(bench::sizes({25000, 50000}))->Unit(benchmark::kMicrosecond);

// From the selection of a key to the first paint of its values.
void ShowValues(benchmark::State& state) {
    const ScratchHive& hive = hive_with_values(static_cast<int>(state.range(0)));
    for (auto _ : state) {
        state.PauseTiming();
        {
            OpenWindow window(hive);
            const QModelIndex key = window.key(0);
            state.ResumeTiming();
            window.painted(window.values, [&] { window.keys->setCurrentIndex(key); });
            state.PauseTiming();
        }
        state.ResumeTiming();
    }
}
BENCHMARK(ShowValues)->ArgsProduct(bench::sizes({2500, 5000, 10000, 20000}))->Unit(benchmark::kMillisecond);

// A hive with one key, whose one value has so many bytes of letters.
ScratchHive hive_with_long_value(int type, int64_t size) {
    std::string data;
    while (static_cast<int64_t>(data.size()) < size)
        data += std::string("ab c").substr(data.size() / 2 % 4, 1) + '\0';
    return ScratchHive([&](RegistryKey* root) {
        RegistryKey* key = nullptr;
        bench::check(RCreateKey(root, "Key", &key, nullptr), "create");
        bench::check(
            RSetValueExW(key, "Value", static_cast<uint32_t>(type), data.data(), static_cast<uint32_t>(data.size())),
            "set");
        RCloseKey(key);
    });
}

// Type and size of the one value's data, which the table has read already.
void PaintRow(benchmark::State& state) {
    const ScratchHive hive = hive_with_long_value(static_cast<int>(state.range(0)), state.range(1));
    OpenWindow window(hive);
    window.painted(window.values, [&] { window.keys->setCurrentIndex(window.key(0)); });
    for (auto _ : state)
        window.painted(window.values, [&] { window.values->viewport()->repaint(); });
}
BENCHMARK(PaintRow)->ArgsProduct({{1, 3, 7}, {1 << 10, 1 << 20}})->Unit(benchmark::kMicrosecond);

// The same with the data to be read: from the selection of the key to the paint.
void ShowLongValue(benchmark::State& state) {
    const ScratchHive hive = hive_with_long_value(static_cast<int>(state.range(0)), state.range(1));
    OpenWindow window(hive);
    const QModelIndex key = window.key(0);
    for (auto _ : state) {
        state.PauseTiming();
        window.keys->setCurrentIndex(window.root());
        QCoreApplication::processEvents();
        state.ResumeTiming();
        window.painted(window.values, [&] { window.keys->setCurrentIndex(key); });
    }
}
BENCHMARK(ShowLongValue)->ArgsProduct({{1, 3, 7}, {1 << 10, 1 << 20}})->Unit(benchmark::kMicrosecond);

}  // namespace

int main(int argc, char** argv) {
    qputenv("QT_QPA_PLATFORM", "offscreen");
    // The platform warns of each window that it cannot hint at sizes.
    QLoggingCategory::setFilterRules(QStringLiteral("default.warning=false"));
    Application application(argc, argv);
    benchmark::Initialize(&argc, argv);
    if (benchmark::ReportUnrecognizedArguments(argc, argv))
        return 1;
    benchmark::RunSpecifiedBenchmarks();
    benchmark::Shutdown();
    return 0;
}
