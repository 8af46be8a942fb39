// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "scene.h"

#include "reg_hive.h"
#include "reg_key.h"

#include <QFile>
#include <QLabel>
#include <QLineEdit>
#include <QStatusBar>
#include <QTest>
#include <QtEndian>

namespace {

constexpr int block = 4096;
constexpr int root_cell = 0x20;
constexpr int security_cell = 0x78;
constexpr int free_cell = 0xa8;

class Bytes {
public:
    explicit Bytes(int size) : m_bytes(size, '\0') {}
    void text(int at, const char* text) { m_bytes.replace(at, static_cast<int>(qstrlen(text)), text); }
    void number16(int at, quint16 value) { qToLittleEndian(value, m_bytes.data() + at); }
    void number32(int at, quint32 value) { qToLittleEndian(value, m_bytes.data() + at); }
    quint32 number32(int at) const { return qFromLittleEndian<quint32>(m_bytes.constData() + at); }
    const QByteArray& all() const { return m_bytes; }

private:
    QByteArray m_bytes;
};

void lay_out_root(Bytes& hive) {
    const int cell = block + root_cell;
    hive.number32(cell, static_cast<quint32>(-(security_cell - root_cell)));
    const int key = cell + 4;
    hive.text(key, "nk");
    hive.number16(key + 2, 0x2c);
    for (int offset : {16, 28, 32, 40, 48}) {
        hive.number32(key + offset, 0xffffffff);
    }
    hive.number32(key + 44, security_cell);
    hive.number16(key + 72, 4);
    hive.text(key + 76, "ROOT");
}

QByteArray empty_hive() {
    Bytes hive(2 * block);
    hive.text(0, "regf");
    hive.number32(4, 1);
    hive.number32(8, 1);
    hive.number32(20, 1);
    hive.number32(24, 3);
    hive.number32(32, 1);
    hive.number32(36, root_cell);
    hive.number32(40, block);
    hive.number32(44, 1);
    quint32 checksum = 0;
    for (int at = 0; at < 508; at += 4) {
        checksum ^= hive.number32(at);
    }
    hive.number32(508, checksum);
    hive.text(block, "hbin");
    hive.number32(block + 8, block);
    lay_out_root(hive);
    const int security = block + security_cell;
    hive.number32(security, static_cast<quint32>(-(free_cell - security_cell)));
    hive.text(security + 4, "sk");
    hive.number32(security + 8, security_cell);
    hive.number32(security + 12, security_cell);
    hive.number32(security + 16, 1);
    hive.number32(security + 20, 20);
    hive.number32(block + free_cell, block - free_cell);
    return hive.all();
}

RegKey& add_key(RegKey& parent, const char* name) {
    const int row = parent.rename_key(parent.new_key(), QString::fromLatin1(name));
    return *static_cast<RegKey*>(parent.child(row));
}

bool add_values(RegKey& key) {
    return key.set_string_value(QStringLiteral("text"), QStringLiteral("hello"), 1) &&
           key.set_string_value(QStringLiteral("Path"), QStringLiteral("%A%"), 2) &&
           key.set_binary_value(QStringLiteral("bytes"), QByteArray("\x01\x02"), 3) &&
           key.set_dword_value(QStringLiteral("dword"), 42, little_endian_order) &&
           key.set_dword_value(QStringLiteral("reversed"), 258, big_endian_order) &&
           key.set_multi_string_value(QStringLiteral("list"), {QStringLiteral("a"), QStringLiteral("b")}) &&
           key.set_qword_value(QStringLiteral("qword"), 43) &&
           // Eight bytes are no DWORD: its data cannot be read.
           key.set_binary_value(QStringLiteral("unreadable"), QByteArray(8, 'x'), 4);
}

} // namespace

Scene::Scene() {
    QFile out(file());
    if (!out.open(QIODevice::WriteOnly) || out.write(empty_hive()) != 2 * block) {
        qFatal("cannot write %s", qPrintable(file()));
    }
    out.close();
    DummyRegKey top(QStringLiteral("top"));
    RegHive hive(QStringLiteral("hive"), file(), &top);
    RegKey& root = *hive.root_key();
    RegKey& alpha = add_key(root, "Alpha");
    RegKey& deep = add_key(alpha, "Deep");
    add_key(deep, "Deeper");
    add_key(alpha, "Leaf");
    add_key(alpha, "Zeta");
    add_key(root, "Beta");
    if (!add_values(alpha) || !deep.set_string_value(QString(), QStringLiteral("set"), 1) ||
        !deep.set_dword_value(QStringLiteral("b"), 1, little_endian_order) ||
        !deep.set_dword_value(QStringLiteral("A"), 2, little_endian_order)) {
        qFatal("cannot fill %s", qPrintable(file()));
    }
}

QByteArray Scene::bytes() const {
    QFile in(file());
    if (!in.open(QIODevice::ReadOnly)) {
        qFatal("cannot read %s", qPrintable(file()));
    }
    return in.readAll();
}

void Scene::damage_key(const QByteArray& name) const {
    constexpr int name_in_record = 76;
    const QByteArray all = bytes();
    // The letters stand in the index of the siblings too.
    qsizetype at = all.indexOf(name) - name_in_record;
    while (at >= 0 && all.mid(at, 2) != "nk") {
        at = all.indexOf(name, at + name_in_record + 1) - name_in_record;
    }
    if (at < 0) {
        qFatal("no key record of this name");
    }
    QFile hive(file());
    if (!hive.open(QIODevice::ReadWrite) || !hive.seek(at) || hive.write("xx") != 2) {
        qFatal("cannot damage %s", qPrintable(file()));
    }
}

Stage::Stage(const Scene& scene) : model(std::make_unique<RegModel>()) {
    window.resize(640, 480);
    model->add_hive(QStringLiteral("MACHINE/SYSTEM"), scene.file());
    window.set_model(model.get());
    keys = static_cast<KeysView*>(by_accessible_name(window, QStringLiteral("keys_tree")));
    values = static_cast<ValuesView*>(by_accessible_name(window, QStringLiteral("values_table")));
    window.show();
    window.activateWindow();
    if (!QTest::qWaitForWindowActive(&window)) {
        qFatal("the window does not become active");
    }
}

QModelIndex Stage::key(const QString& path) const {
    QModelIndex found;
    for (const QString& name : path.split(QLatin1Char('\\'))) {
        const QModelIndex parent = found;
        found = QModelIndex();
        for (int row = 0; row < model->rowCount(parent) && !found.isValid(); ++row) {
            const QModelIndex child = model->index(row, 0, parent);
            if (child.data(Qt::DisplayRole).toString() == name) {
                found = child;
            }
        }
        if (!found.isValid()) {
            return {};
        }
    }
    return found;
}

QStringList Stage::subkeys(const QString& path) const {
    const QModelIndex parent = key(path);
    QStringList names;
    for (int row = 0; row < model->rowCount(parent); ++row) {
        names.append(model->index(row, 0, parent).data(Qt::DisplayRole).toString());
    }
    return names;
}

int Stage::value_row(const QString& name) const {
    return static_cast<int>(value_names().indexOf(name));
}

QModelIndex Stage::value(const QString& name, int column) const {
    return values->model()->index(value_row(name), column);
}

QString Stage::cell(int row, int column) const {
    return values->model()->index(row, column).data(Qt::DisplayRole).toString();
}

QStringList Stage::value_names() const {
    QStringList names;
    const int rows = values->model() ? values->model()->rowCount() : 0;
    for (int row = 0; row < rows; ++row) {
        names.append(cell(row, 0));
    }
    return names;
}

QString Stage::status() const {
    return window.statusBar()->findChild<QLabel*>()->text();
}

void Stage::press_in_editor(const QString& text, Qt::Key key) const {
    auto* editor = qobject_cast<QLineEdit*>(QApplication::focusWidget());
    QVERIFY2(editor, "no editor is open");
    editor->selectAll();
    QTest::keyClicks(editor, text);
    QTest::keyClick(editor, key);
}

QWidget* by_accessible_name(const QWidget& parent, const QString& name) {
    for (QWidget* widget : parent.findChildren<QWidget*>()) {
        if (widget->accessibleName() == name) {
            return widget;
        }
    }
    qFatal("no widget has the accessible name %s", qPrintable(name));
}
