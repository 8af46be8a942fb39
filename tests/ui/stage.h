// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// A small hive of every kind of value, and the program's window over it.
#pragma once

#include "hive_bytes.h"
#include "keys_view.h"
#include "main_window.h"
#include "reg_model.h"
#include "reg_value.h"
#include "values_view.h"

#include <QString>
#include <QTemporaryDir>

#include <functional>
#include <memory>

// A hive file that the engine had no hand in.
//
//   SYSTEM            mounted as MACHINE/SYSTEM
//     Alpha           depth 2; one value of each kind, no default value
//       Deep          depth 3; a default value and two more
//         Deeper      depth 4
//       Leaf
//       Zeta
//     Beta
class Scene {
public:
    Scene();
    // `change` may damage the bytes.
    explicit Scene(const testkit::HiveLayout& layout, const std::function<void(testkit::LaidHive&)>& change = {});

    QString file() const { return directory_.filePath(QStringLiteral("hive")); }
    // Writes the file anew with the signature of one key's record overwritten.
    void damage_key(const std::string& path);
    // The same for one value of a key, by its place in the key's list.
    void damage_value(const std::string& path, size_t place);
    QByteArray bytes() const;
    testkit::Bytes file_bytes() const;

private:
    void write(const testkit::Bytes& all) const;

    testkit::LaidHive laid_;
    QTemporaryDir directory_;
};

// The window over a scene, shown and active, as the program's entry makes it.
class Stage {
public:
    explicit Stage(const Scene& scene, std::unique_ptr<RegModel> key_model = std::make_unique<RegModel>());

    // The key at a path of names below the invisible root; invalid when there is none.
    QModelIndex key(const QString& path) const;
    void select_key(const QString& path) const { keys->setCurrentIndex(key(path)); }
    // Makes the first value of that name the current one of its key's table, which gets the keyboard.
    void select_value(const QString& key_path, const QString& name) const {
        select_key(key_path);
        values->setFocus();
        values->setCurrentIndex(value(name));
    }
    // The row of the values table with this name, -1 when there is none.
    int value_row(const QString& name) const;
    QModelIndex value(const QString& name, int column = 0) const;
    QString cell(int row, int column) const;
    QString status() const;
    // The names of the shown values, top to bottom.
    QStringList value_names() const;
    QStringList subkeys(const QString& path) const;
    // The keyboard back to a view after a dialog: the offscreen platform activates no window by itself.
    void return_to(QWidget& view);
    void press_in_editor(const QString& text, Qt::Key key) const;

    // In the order of the program's entry: the model goes before the window.
    MainWindow window;
    std::unique_ptr<RegModel> model;
    KeysView* keys;
    ValuesView* values;
};

// A value of the current key as the stage's model holds it, by name; fresh from the hive.
std::unique_ptr<RegValue> stored(const Stage& stage, const QString& name);

// On a cell of the values table, wherever it is scrolled to.
void double_click(const Stage& stage, const QModelIndex& index);

// The widget below `parent` with this accessible name.
QWidget* by_accessible_name(const QWidget& parent, const QString& name);
