// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "stage.h"

#include "reg_key.h"

#include <QFile>
#include <QLabel>
#include <QLineEdit>
#include <QStatusBar>
#include <QTest>

namespace {

testkit::Bytes number_data(quint64 number, size_t size) {
    testkit::Bytes data;
    for (size_t i = 0; i < size; i++)
        data.push_back(static_cast<quint8>(number >> (8 * i)));
    return data;
}

testkit::HiveLayout layout() {
    testkit::HiveLayout hive;
    testkit::KeyLayout& alpha = hive.root.add("Alpha");
    alpha.set("text", 1, testkit::text_data("hello"));
    alpha.set("Path", 2, testkit::text_data("%A%"));
    alpha.set("bytes", 3, {1, 2});
    alpha.set("dword", 4, number_data(42, 4));
    alpha.set("reversed", 5, {0, 0, 1, 2});
    alpha.set("list", 7, {'a', 0, 0, 0, 'b', 0, 0, 0, 0, 0});
    alpha.set("qword", 11, number_data(43, 8));
    // Eight bytes are no DWORD: its data cannot be read.
    alpha.set("unreadable", 4, number_data(44, 8));
    testkit::KeyLayout& deep = alpha.add("Deep");
    deep.set("", 1, testkit::text_data("set"));
    deep.set("b", 4, number_data(1, 4));
    deep.set("A", 4, number_data(2, 4));
    deep.add("Deeper");
    alpha.add("Leaf");
    alpha.add("Zeta");
    hive.root.add("Beta");
    return hive;
}

}  // namespace

Scene::Scene() : Scene(layout()) {}

Scene::Scene(const testkit::HiveLayout& layout, const std::function<void(testkit::LaidHive&)>& change)
    : laid_(testkit::lay_out(layout)) {
    if (change)
        change(laid_);
    write(laid_.bytes);
}

void Scene::write(const testkit::Bytes& all) const {
    QFile out(file());
    const auto size = static_cast<qint64>(all.size());
    if (!out.open(QIODevice::WriteOnly) || out.write(reinterpret_cast<const char*>(all.data()), size) != size)
        qFatal("cannot write %s", qPrintable(file()));
}

void Scene::damage_key(const std::string& path) {
    testkit::LaidHive damaged = laid_;
    damaged.put16(damaged.at(path).record, 0, 0x7878);
    write(damaged.bytes);
}

void Scene::damage_value(const std::string& path, size_t place) {
    testkit::LaidHive damaged = laid_;
    damaged.put16(damaged.at(path).values.at(place).record, 0, 0x7878);
    write(damaged.bytes);
}

testkit::Bytes Scene::file_bytes() const {
    const QByteArray all = bytes();
    return testkit::Bytes(all.cbegin(), all.cend());
}

QByteArray Scene::bytes() const {
    QFile in(file());
    if (!in.open(QIODevice::ReadOnly))
        qFatal("cannot read %s", qPrintable(file()));
    return in.readAll();
}

Stage::Stage(const Scene& scene, std::unique_ptr<RegModel> key_model) : model(std::move(key_model)) {
    window.resize(640, 480);
    model->add_hive(QStringLiteral("MACHINE/SYSTEM"), scene.file());
    window.set_model(model.get());
    keys = static_cast<KeysView*>(by_accessible_name(window, QStringLiteral("keys_tree")));
    values = static_cast<ValuesView*>(by_accessible_name(window, QStringLiteral("values_table")));
    window.show();
    window.activateWindow();
    if (!QTest::qWaitForWindowActive(&window))
        qFatal("the window does not become active");
}

QModelIndex Stage::key(const QString& path) const {
    QModelIndex found;
    for (const QString& name : path.split(QLatin1Char('\\'))) {
        const QModelIndex parent = found;
        found = QModelIndex();
        for (int row = 0; row < model->rowCount(parent) && !found.isValid(); row++) {
            const QModelIndex child = model->index(row, 0, parent);
            if (child.data(Qt::DisplayRole).toString() == name)
                found = child;
        }
        if (!found.isValid())
            return {};
    }
    return found;
}

QStringList Stage::subkeys(const QString& path) const {
    const QModelIndex parent = key(path);
    QStringList names;
    for (int row = 0; row < model->rowCount(parent); row++)
        names.append(model->index(row, 0, parent).data(Qt::DisplayRole).toString());
    return names;
}

int Stage::value_row(const QString& name) const { return static_cast<int>(value_names().indexOf(name)); }

QModelIndex Stage::value(const QString& name, int column) const {
    return values->model()->index(value_row(name), column);
}

QString Stage::cell(int row, int column) const {
    return values->model()->index(row, column).data(Qt::DisplayRole).toString();
}

QStringList Stage::value_names() const {
    QStringList names;
    const int rows = values->model() ? values->model()->rowCount() : 0;
    for (int row = 0; row < rows; row++)
        names.append(cell(row, 0));
    return names;
}

QString Stage::status() const { return window.statusBar()->findChild<QLabel*>()->text(); }

void Stage::return_to(QWidget& view) {
    window.activateWindow();
    QVERIFY(QTest::qWaitForWindowActive(&window));
    view.setFocus();
    QVERIFY(view.hasFocus());
}

void Stage::press_in_editor(const QString& text, Qt::Key key) const {
    auto* editor = qobject_cast<QLineEdit*>(QApplication::focusWidget());
    QVERIFY2(editor, "no editor is open");
    editor->selectAll();
    QTest::keyClicks(editor, text);
    QTest::keyClick(editor, key);
}

std::unique_ptr<RegValue> stored(const Stage& stage, const QString& name) {
    RegKey* key = RegModel::editable_key(stage.keys->currentIndex());
    for (int i = 0; i < key->value_count(); i++) {
        auto value = key->read_value(i);
        if (value && value->name == name)
            return value;
    }
    return nullptr;
}

void double_click(const Stage& stage, const QModelIndex& index) {
    stage.values->scrollTo(index);
    const QPoint point = stage.values->visualRect(index).center();
    QTest::mouseClick(stage.values->viewport(), Qt::LeftButton, {}, point);
    QTest::mouseDClick(stage.values->viewport(), Qt::LeftButton, {}, point);
}

QWidget* by_accessible_name(const QWidget& parent, const QString& name) {
    for (QWidget* widget : parent.findChildren<QWidget*>()) {
        if (widget->accessibleName() == name)
            return widget;
    }
    qFatal("no widget has the accessible name %s", qPrintable(name));
}
