// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// Every hive of the catalogue through the models, as a window uses them: the tree opened, every value read, a search
// for what is not there brought to its end, changes tried next to the damage. What cannot be opened throws, as the
// models do, and can be named; the rest goes on being readable.
#include "catalogue.h"
#include "hive_on_disk.h"
#include "snapshot.h"

#include "failure_report.h"
#include "reg_key.h"
#include "reg_model.h"
#include "value_order.h"
#include "values_model.h"
#include "values_proxy_model.h"

#include <QTest>

#include <malloc.h>

#include <algorithm>
#include <fstream>
#include <set>

namespace {

using hostile::Case;
using hostile::Entry;
using hostile::Readable;
using testkit::Item;

constexpr int deepest = 7;      // rows of the tree, the group and the mount included
constexpr int most_keys = 400;  // in a hive that leads round in a ring

// The hive in a file of its own, mounted.
struct Mounted {
    explicit Mounted(const testkit::Bytes& bytes) : file(bytes) {
        model.add_hive(QStringLiteral("TOP/HIVE"), file.path());
    }

    HiveOnDisk file;
    RegModel model;
    int thrown = 0;   // by a model
    int unnamed = 0;  // of these, at keys for which there was no name

    // Runs what a view or an editor would, and counts what comes out of it.
    template <typename Call>
    void meet(const QModelIndex& key, const Call& call) {
        try {
            call();
        } catch (const std::exception&) {
            thrown++;
            unnamed += key_path_of(key).isEmpty() ? 1 : 0;
        }
    }
};

void read_values(Mounted& mounted, const QModelIndex& index) {
    mounted.meet(index, [&] {
        RegKey* const key = RegModel::editable_key(index);
        if (key == nullptr)
            return;
        ValuesModel values(key);
        ValuesProxyModel sorted;
        sorted.setSourceModel(&values);
        sorted.sort(0, Qt::AscendingOrder);
        for (int row = 0; row < sorted.rowCount(); row++) {
            for (int column = 0; column < sorted.columnCount(); column++)
                mounted.meet(index, [&] { sorted.index(row, column).data(Qt::DisplayRole); });
        }
    });
}

// All keys that the tree shows, each with its name and its values asked for.
std::vector<QPersistentModelIndex> read_tree(Mounted& mounted) {
    std::vector<QPersistentModelIndex> found;
    std::vector<std::pair<QModelIndex, int>> stack{{QModelIndex(), 0}};
    while (!stack.empty() && found.size() < most_keys) {
        const QModelIndex parent = stack.back().first;
        const int depth = stack.back().second;
        stack.pop_back();
        for (int row = 0; row < mounted.model.rowCount(parent) && found.size() < most_keys; row++) {
            QModelIndex child;
            mounted.meet(parent, [&] { child = mounted.model.index(row, 0, parent); });
            if (!child.isValid())
                continue;
            found.emplace_back(child);
            mounted.meet(child, [&] { mounted.model.data(child, Qt::DisplayRole); });
            mounted.meet(child, [&] { mounted.model.flags(child); });
            read_values(mounted, child);
            if (depth < deepest)
                stack.emplace_back(child, depth + 1);
        }
    }
    return found;
}

// The search ends, whatever it meets; true when it found nothing.
bool search_in_vain(Mounted& mounted) {
    const QModelIndex top = mounted.model.index(0, 0);
    mounted.model.begin_find(top);
    const RegModel::FindMode mode(RegModel::FindKeys | RegModel::FindValues);
    const size_t most = mounted.file.bytes().size() + 100;
    for (size_t i = 0; i < most; i++) {
        try {
            return !mounted.model.find(QStringLiteral("no such name"), mode, Qt::MatchContains).key.isValid();
        } catch (const std::exception&) {
            mounted.thrown++;  // the search goes on behind the key that it stood at
        }
    }
    return false;
}

void change_values(Mounted& mounted, const QModelIndex& index) {
    RegKey* const key = RegModel::editable_key(index);
    if (key == nullptr)
        return;
    ValuesModel values(key);
    mounted.meet(index, [&] { values.add_value(REG_DWORD); });
    int rows = 0;
    mounted.meet(index, [&] { rows = std::min(values.rowCount(), 8); });
    for (int row = rows - 1; row >= 0; row--) {
        mounted.meet(index, [&] { values.setData(values.index(row, 2), QStringLiteral("7"), Qt::EditRole); });
        mounted.meet(
            index, [&] { values.setData(values.index(row, 0), QStringLiteral("Renamed %1").arg(row), Qt::EditRole); });
        mounted.meet(index, [&] { values.removeRows(row, 1); });
    }
}

void change_key(Mounted& mounted, const QModelIndex& index) {
    change_values(mounted, index);
    mounted.meet(index, [&] { mounted.model.new_key(index); });
    mounted.meet(index, [&] { mounted.model.setData(index, QStringLiteral("Renamed"), Qt::EditRole); });
    mounted.meet(index, [&] { mounted.model.removeRows(index.row(), 1, index.parent()); });
}

// The key below the mount that a key is, or is below.
QModelIndex top_of(const Mounted& mounted, QModelIndex key) {
    const QModelIndex mount = mounted.model.index(0, 0, mounted.model.index(0, 0));
    while (key.isValid() && key.parent() != mount)
        key = key.parent();
    return key;
}

bool shows_key_below_mount(const Mounted& mounted, const QString& name) {
    const QModelIndex mount = mounted.model.index(0, 0, mounted.model.index(0, 0));
    return !mounted.model.match(mounted.model.index(0, 0, mount), Qt::DisplayRole, name, 1, Qt::MatchExactly).isEmpty();
}

// Every change to every key but one below the mount and what is below that. The deepest first, so that what is deleted
// takes none of the others along.
void change_all_but(Mounted& mounted, const std::vector<QPersistentModelIndex>& keys, const QString& left_alone) {
    for (auto key = keys.rbegin(); key != keys.rend(); ++key) {
        const QModelIndex top = top_of(mounted, *key);
        QString name;
        mounted.meet(top, [&] { name = top.data().toString(); });
        if (key->isValid() && top.isValid() && name != left_alone)
            change_key(mounted, *key);
    }
}

// What the engine reads of one key of a file, and of all below it, but for some places.
std::vector<Item> items_of(const testkit::Bytes& bytes, const std::string& key,
                           const std::vector<std::string>& without) {
    testkit::MemoryFile file(bytes);
    file.read_only = true;
    const RegistryIo io = file.io();
    RegistryKey* root = ROpenHive(&io);
    if (root == nullptr)
        return {};
    testkit::WalkLimits limits = testkit::limits_for(bytes.size());
    limits.depth = 3;
    testkit::Snapshot snapshot = take_snapshot(root, limits);
    RCloseKey(root);
    std::erase_if(snapshot.items, [&](const Item& item) {
        return !testkit::covers(key, item.place) ||
               std::any_of(without.begin(), without.end(),
                           [&](const std::string& place) { return testkit::covers(place, item.place); });
    });
    return snapshot.items;
}

// A key with so many values of that type, which all lead to the same cell of zeros.
testkit::Bytes hive_of_shared_zeros(int values, uint32_t type, uint32_t size) {
    testkit::HiveLayout hive;
    testkit::KeyLayout& key = hive.root.add("Key");
    for (int i = 0; i < values; i++)
        key.set("v" + std::to_string(i), type, testkit::Bytes(i == 0 ? size : 8)).storage = testkit::Storage::cell;
    testkit::LaidHive laid = testkit::lay_out(hive);
    const uint32_t data = laid.at("Key").values[0].data;
    for (const testkit::ValuePlaces& value : laid.at("Key").values) {
        laid.put32(value.record, 4, size);
        laid.put32(value.record, 8, data);
    }
    return laid.bytes;
}

size_t memory_in_use() {
    const struct mallinfo2 info = mallinfo2();
    return info.uordblks + info.hblkhd;
}

// A figure of /proc/self/status in bytes: addresses in use (VmSize), or the most that ever were (VmPeak). What is asked
// for and given back between two looks shows there, whether it was written to or not.
size_t addresses(const char* figure) {
    std::ifstream status("/proc/self/status");
    for (std::string name; status >> name; status.ignore(1000, '\n')) {
        size_t kilobytes = 0;
        if (name == std::string(figure) + ":" && status >> kilobytes)
            return kilobytes << 10;
    }
    qFatal("/proc/self/status has no %s", figure);
}

// A heap of a thread takes 128 MiB of addresses for a moment, and a sanitizer keeps what was freed.
constexpr size_t spare_addresses = size_t{256} << 20;

// Notes how much memory is in use whenever it is asked.
class WatchedModel : public ValuesModel {
public:
    using ValuesModel::ValuesModel;

    QVariant data(const QModelIndex& index, int role) const override {
        most = std::max(most, memory_in_use());
        return ValuesModel::data(index, role);
    }

    mutable size_t most = 0;
};

}  // namespace

class HostileModelsTest : public QObject {
    Q_OBJECT

private slots:
    void every_hive_data() {
        QTest::addColumn<int>("number");
        int left_out = 0;
        const std::vector<Entry>& all = hostile::catalogue();
        for (size_t i = 0; i < all.size(); i++) {
            if (all[i].large)
                left_out++;
            else
                QTest::newRow(all[i].name.c_str()) << static_cast<int>(i);
        }
        std::printf("[ LEFT OUT ] %d large hives of %zu\n", left_out, all.size());
    }

    void every_hive() {
        QFETCH(int, number);
        const Entry& entry = hostile::catalogue()[static_cast<size_t>(number)];
        const Case hive = entry.make();
        if (entry.readable == Readable::no) {
            QVERIFY_THROWS_EXCEPTION(std::runtime_error, Mounted{hive.bytes});
            return;
        }
        const size_t most = std::max(addresses("VmPeak"), addresses("VmSize") + hive.bytes.size() + spare_addresses);
        Mounted mounted(hive.bytes);
        const std::vector<QPersistentModelIndex> keys = read_tree(mounted);
        QVERIFY(keys.size() >= 2);
        QVERIFY2(addresses("VmPeak") <= most, qPrintable(QString::number(addresses("VmPeak"))));
        QVERIFY(search_in_vain(mounted));
        QVERIFY(mounted.file.bytes() == hive.bytes);
        // A key whose name is longer than the buffer for it cannot be shown.
        const bool too_long =
            entry.name == "key_name_of_600_characters" || entry.name == "key_name_of_700_characters_in_utf16";
        if (entry.readable == Readable::whole)
            QCOMPARE(mounted.thrown > 0, too_long);

        // All that lies in the last bins is cut off there, and the first one does not hold a key for this alone.
        const char* const left_alone =
            entry.name == "bins_size_smaller_than_the_bins_present" ? "Near" : hostile::left_alone;
        const bool shows_none = entry.name == "root_with_a_count_of_0_and_a_list";
        QCOMPARE(shows_key_below_mount(mounted, QString::fromLatin1(left_alone)), !shows_none);
        change_all_but(mounted, keys, QString::fromLatin1(left_alone));
        QCOMPARE(mounted.file.bytes() == hive.bytes, shows_none);
        QCOMPARE(mounted.unnamed, 0);
        compare_untouched(hive, mounted, left_alone);
        Mounted again(mounted.file.bytes());
        QVERIFY(!read_tree(again).empty());
    }

    void every_cut_data() {
        QTest::addColumn<int>("missing");
        for (int missing = 0; missing < 1024; missing += 93)
            QTest::newRow(qPrintable(QStringLiteral("%1 bytes cut off").arg(missing))) << missing;
    }

    // Amid the last cell, which holds the data of a value.
    void every_cut() {
        QFETCH(int, missing);
        Case hive;
        hive.bytes = hostile::hive_to_cut();
        hive.bytes.resize(hive.bytes.size() - static_cast<size_t>(missing));
        Mounted mounted(hive.bytes);
        const std::vector<QPersistentModelIndex> keys = read_tree(mounted);
        {
            const ValuesModel values(key_of_row(mounted, 0));
            const QModelIndexList raw = values.match(values.index(0, 0), Qt::DisplayRole, QStringLiteral("Raw"));
            QCOMPARE(raw.size(), 1);
            QCOMPARE(raw.first().siblingAtColumn(2).data().toByteArray().isEmpty(), missing > 0);
        }
        QVERIFY(search_in_vain(mounted));
        QVERIFY(mounted.file.bytes() == hive.bytes);
        QVERIFY(shows_key_below_mount(mounted, QString::fromLatin1(hostile::left_alone)));
        change_all_but(mounted, keys, QString::fromLatin1(hostile::left_alone));
        QVERIFY(mounted.file.bytes() != hive.bytes);
        QCOMPARE(mounted.unnamed, 0);
        compare_untouched(hive, mounted, hostile::left_alone);
        Mounted again(mounted.file.bytes());
        QVERIFY(!read_tree(again).empty());
    }

    void deepest_chain_data() {
        QTest::addColumn<QByteArray>("name");
        QTest::addColumn<bool>("goes");
        QTest::newRow("512 keys: shown and deleted whole") << QByteArray("keys_512_deep") << true;
        QTest::newRow("513 keys: shown down to the limit, none deleted") << QByteArray("keys_513_deep") << false;
    }

    // One key below another.
    void deepest_chain() {
        QFETCH(QByteArray, name);
        QFETCH(bool, goes);
        const testkit::Bytes bytes = hostile::case_of(name.toStdString()).bytes;
        Mounted mounted(bytes);
        const QModelIndex top = mounted.model.index(0, 0, mounted.model.index(0, 0, mounted.model.index(0, 0)));
        QModelIndex bottom = top;
        int levels = 1;
        for (; mounted.model.rowCount(bottom) > 0; levels++)
            bottom = mounted.model.index(0, 0, bottom);
        QCOMPARE(levels, 512);
        QCOMPARE(bottom.data().toString(), QStringLiteral("k"));
        read_values(mounted, bottom);
        mounted.meet(bottom, [&] { mounted.model.new_key(bottom); });
        QCOMPARE(mounted.model.rowCount(bottom), 0);
        QVERIFY(mounted.file.bytes() == bytes);

        QCOMPARE(mounted.model.removeRows(0, 1, top), goes);
        QCOMPARE(mounted.model.rowCount(top), goes ? 0 : 1);
        QCOMPARE(mounted.file.bytes() == bytes, !goes);
        QCOMPARE(mounted.file.read().root.children.at(0).children.empty(), goes);
        const auto faults = testkit::new_faults(testkit::check_hive(bytes), testkit::check_hive(mounted.file.bytes()));
        QCOMPARE(testkit::text_of(faults), std::string());
    }

    // However many values share the data of one, and however much more memory it takes than it is stored in.
    void data_that_many_values_share_is_held_within_bounds() {
        constexpr int count = 40;
        constexpr int strings = 200000;
        Mounted mounted(hive_of_shared_zeros(count, 7, 2 * strings));
        ValuesModel model(key_of_row(mounted, 0));
        const size_t before = memory_in_use();
        qsizetype most = 0;
        for (int row = 0; row < count; row++) {
            QCOMPARE(model.index(row, 2).data().toStringList().size(), strings - 1);
            most = std::max(most, model.cached_bytes());
        }
        constexpr auto of_one = static_cast<qsizetype>(sizeof(QString)) * (strings - 1);
        QVERIFY(model.cached_bytes() >= of_one);
        QVERIFY2(most <= qsizetype{64} << 20, qPrintable(QString::number(most)));
        const size_t more = memory_in_use() - before;
        QVERIFY2(more < size_t{96} << 20, qPrintable(QString::number(more)));
    }

    // A text that ends early was decoded whole.
    void texts_that_many_values_share_are_held_within_bounds() {
        constexpr int count = 40;
        constexpr uint32_t stored = 4000000;
        Mounted mounted(hive_of_shared_zeros(count, 1, stored));
        ValuesModel model(key_of_row(mounted, 0));
        const size_t before = memory_in_use();
        for (int row = 0; row < count; row++)
            QCOMPARE(model.index(row, 2).data().toString(), QString());
        const size_t more = memory_in_use() - before;
        QVERIFY2(more < size_t{96} << 20, qPrintable(QString::number(more)));
    }

    // However often a list leads to it.
    void one_long_name_is_held_once() {
        constexpr int rows = 2000;
        testkit::HiveLayout hive;
        testkit::KeyLayout& key = hive.root.add("Key");
        for (int i = 0; i < rows; i++)
            key.set(i < 2 ? std::string(65534, 'n') + (i == 0 ? 'a' : 'b') : std::to_string(i), 4, testkit::pattern(4));
        testkit::LaidHive laid = testkit::lay_out(hive);
        const testkit::KeyPlaces& places = laid.at("Key");
        for (uint32_t i = 2; i < rows; i++)
            laid.put32(places.value_list, 4 * i, places.values[i % 2].record);
        Mounted mounted(laid.bytes);
        RegKey* const listed = key_of_row(mounted, 0);
        QCOMPARE(listed->value_count(), rows);
        const auto names = shown_value_names(*listed, ValuesModel::default_name(), [] { return false; });
        QVERIFY(names.has_value());
        QCOMPARE(names->size(), size_t{rows + 1});
        std::set<const QChar*> texts;
        for (const QString& name : *names)
            texts.insert(name.constData());
        QCOMPARE(texts.size(), size_t{3});

        WatchedModel model(listed);
        ValuesProxyModel sorted;
        sorted.setSourceModel(&model);
        const size_t before = memory_in_use();
        sorted.sort(0, Qt::AscendingOrder);
        QVERIFY2(model.most < before + (size_t{16} << 20), qPrintable(QString::number(model.most - before)));
        QVERIFY(sorted.index(rows / 2, 0).data().toString().endsWith(QLatin1Char('a')));
        QVERIFY(sorted.index(rows / 2 + 1, 0).data().toString().endsWith(QLatin1Char('b')));
    }

    // Reading the names of one key may take long.
    void a_search_is_stopped_amid_the_values_of_one_key() {
        testkit::HiveLayout hive;
        testkit::KeyLayout& key = hive.root.add("Key");
        for (int i = 0; i < 1000; i++)
            key.set("v" + std::to_string(i), 4, testkit::pattern(4));
        Mounted mounted(testkit::lay_out(hive).bytes);
        const QModelIndex index = mounted.model.index(0, 0, mounted.model.index(0, 0, mounted.model.index(0, 0)));
        const RegModel::FindMode mode(RegModel::FindKeys | RegModel::FindValues);
        const auto find = [&] { return mounted.model.find(QStringLiteral("Key"), mode, Qt::MatchFixedString).key; };
        mounted.model.begin_find(mounted.model.index(0, 0));
        QCOMPARE(find(), index);
        mounted.model.begin_find(mounted.model.index(0, 0));
        mounted.model.stop_find();
        // What was not visited stays to be visited.
        for (int i = 0; i < 3; i++) {
            QVERIFY(!find().isValid());
            QCOMPARE(mounted.model.searched_key(), index);
        }
    }

private:
    static RegKey* key_of_row(const Mounted& mounted, int row) {
        const QModelIndex mount = mounted.model.index(0, 0, mounted.model.index(0, 0));
        return RegModel::editable_key(mounted.model.index(row, 0, mount));
    }

    // The key below which nothing was changed reads as before, but for what leads elsewhere.
    static void compare_untouched(const Case& hive, const Mounted& mounted, const std::string& left_alone) {
        std::vector<std::string> elsewhere = hive.unsettled;
        elsewhere.insert(elsewhere.end(), hive.shared.begin(), hive.shared.end());
        const std::vector<Item> before = items_of(hive.bytes, left_alone, elsewhere);
        const std::vector<Item> after = items_of(mounted.file.bytes(), left_alone, elsewhere);
        for (const Item& item : before) {
            if (!std::binary_search(after.begin(), after.end(), item))
                QFAIL(("not as it was: " + item.place).c_str());
        }
        if (hive.shared.empty())
            QCOMPARE(after.size(), before.size());
    }
};

QTEST_MAIN(HostileModelsTest)
#include "hostile_models_test.moc"
