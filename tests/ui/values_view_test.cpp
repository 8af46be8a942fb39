// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
// The values table: which editor opens for which data, values made, named and deleted, and the context menus.

#include "reg_key.h"
#include "shared_actions.h"
#include "stage.h"
#include "ui_test.h"

#include <QDialogButtonBox>
#include <QLineEdit>
#include <QStyledItemDelegate>
#include <QTextEdit>

namespace {

const QString alpha = QStringLiteral("MACHINE\\SYSTEM\\Alpha");
const QString deep = QStringLiteral("MACHINE\\SYSTEM\\Alpha\\Deep");
const QString beta = QStringLiteral("MACHINE\\SYSTEM\\Beta");

// A value of the current key as the stage's model holds it, by name; fresh from the hive.
std::unique_ptr<RegValue> stored(Stage& stage, const QString& name) {
    RegKey* key = RegModel::editable_key(stage.keys->currentIndex());
    for (int i = 0; i < key->value_count(); ++i) {
        auto value = key->read_value(i);
        if (value && value->name == name) {
            return value;
        }
    }
    return nullptr;
}

void double_click(Stage& stage, const QModelIndex& index) {
    stage.values->scrollTo(index);
    const QPoint point = stage.values->visualRect(index).center();
    QTest::mouseClick(stage.values->viewport(), Qt::LeftButton, {}, point);
    QTest::mouseDClick(stage.values->viewport(), Qt::LeftButton, {}, point);
}

QString shown_in(const QWidget& dialog) {
    if (const auto* text = dialog.findChild<QTextEdit*>()) {
        return text->toPlainText();
    }
    for (const QLineEdit* edit : dialog.findChildren<QLineEdit*>()) {
        if (!edit->isReadOnly()) {
            return edit->text();
        }
    }
    return QStringLiteral("no field");
}

QString name_in(const QWidget& dialog) {
    for (const QLineEdit* edit : dialog.findChildren<QLineEdit*>()) {
        if (edit->isReadOnly()) {
            return edit->text();
        }
    }
    return QStringLiteral("no name");
}

void press(const QWidget& dialog, QDialogButtonBox::StandardButton button) {
    QTest::mouseClick(dialog.findChild<QDialogButtonBox*>()->button(button), Qt::LeftButton);
}

}  // namespace

class ValuesViewTest : public QObject {
    Q_OBJECT

private slots:
    void the_editor_follows_the_data_data();
    void the_editor_follows_the_data();
    void a_cancelled_number_is_not_written();
    void data_that_cannot_be_edited_is_told();
    void other_columns_open_nothing();
    void return_opens_the_editor_and_enter_does_not();
    void return_in_a_name_ends_the_name_only();
    void saving_the_value_that_is_not_set_makes_it();
    void the_context_menu_of_a_value();
    void edit_of_the_context_menu();
    void the_context_menu_of_everything_else_data();
    void the_context_menu_of_everything_else();
    void the_key_entry_makes_a_key();
    void a_new_value_is_named_in_place_data();
    void a_new_value_is_named_in_place();
    void a_value_that_cannot_be_made_is_told();
    void deletion_asks_data();
    void deletion_asks();
    void deleting_the_default_value_leaves_it_unset();
    void a_rename_in_place();
    void a_rename_to_another_value_s_name_is_told();
    void actions_of_the_other_view_do_nothing_here();
    void a_refused_edit_is_told_data();
    void a_refused_edit_is_told();
    void a_refused_creation_is_told_data();
    void a_refused_creation_is_told();
    void a_refused_deletion_is_told_and_keeps_the_row();
    void the_first_value_beside_the_unset_default_can_be_renamed();
    void no_bytes_show_as_such();
};

void ValuesViewTest::the_editor_follows_the_data_data() {
    QTest::addColumn<QString>("name");
    QTest::addColumn<QString>("title");
    QTest::addColumn<QString>("shown");
    QTest::addColumn<QString>("typed");
    QTest::addColumn<QVariant>("data");
    QTest::addColumn<quint32>("type");
    const auto list = [](const char* a, const char* b) {
        return QVariant(QStringList{QString::fromLatin1(a), QString::fromLatin1(b)});
    };
    QTest::newRow("string") << "text"
                            << "Edit String"
                            << "hello"
                            << "<b>x</b>" << QVariant(QStringLiteral("<b>x</b>")) << 1U;
    QTest::newRow("expandable") << "Path"
                                << "Edit String"
                                << "%A%"
                                << "%B%" << QVariant(QStringLiteral("%B%")) << 2U;
    QTest::newRow("bytes") << "bytes"
                           << "Edit Binary Value"
                           << "0102"
                           << "0A0b" << QVariant(QByteArray("\x0a\x0b")) << 3U;
    QTest::newRow("list") << "list"
                          << "Edit Multi-String"
                          << "a\nb"
                          << "c\nd" << list("c", "d") << 7U;
    QTest::newRow("32 bits") << "dword"
                             << "Edit DWORD (32-bit) Value"
                             << "2a"
                             << "ffffffff" << QVariant(4294967295U) << 4U;
    QTest::newRow("32 bits, big-endian") << "reversed"
                                         << "Edit DWORD (32-bit) Value"
                                         << "102"
                                         << "1" << QVariant(1U) << 5U;
    QTest::newRow("64 bits") << "qword"
                             << "Edit QWORD (64-bit) Value"
                             << "2b"
                             << "1234567890abcdef" << QVariant(qulonglong(0x1234567890abcdefULL)) << 11U;
}

void ValuesViewTest::the_editor_follows_the_data() {
    QFETCH(QString, name);
    QFETCH(QString, title);
    QFETCH(QString, shown);
    QFETCH(QString, typed);
    QFETCH(QVariant, data);
    QFETCH(quint32, type);
    const Scene scene;
    Stage stage(scene);
    stage.select_key(alpha);
    DialogHand hand;
    hand.then([&](QWidget* dialog) {
        QCOMPARE(dialog->windowTitle(), title);
        QCOMPARE(name_in(*dialog), name);
        QCOMPARE(shown_in(*dialog), shown);
        QWidget* field = QApplication::focusWidget();
        QVERIFY(field);
        QTest::keyClick(field, Qt::Key_A, Qt::ControlModifier);
        for (const QChar c : typed) {
            if (c == QLatin1Char('\n')) {
                QTest::keyClick(field, Qt::Key_Return);
            } else {
                QTest::keyClick(field, c.toLatin1());
            }
        }
        press(*dialog, QDialogButtonBox::Ok);
    });
    double_click(stage, stage.value(name));
    QVERIFY(hand.is_done());
    const auto value = stored(stage, name);
    QVERIFY(value);
    QCOMPARE(value->data, data);
    QCOMPARE(value->type, type);
}

void ValuesViewTest::a_cancelled_number_is_not_written() {
    const Scene scene;
    Stage stage(scene);
    stage.select_key(alpha);
    const QByteArray before = scene.bytes();
    for (const char* name : {"dword", "qword", "text", "bytes", "list"}) {
        DialogHand hand;
        hand.then([&](QWidget* dialog) {
            QTest::keyClicks(QApplication::focusWidget(), QStringLiteral("1"));
            press(*dialog, QDialogButtonBox::Cancel);
        });
        double_click(stage, stage.value(QString::fromLatin1(name)));
        QVERIFY(hand.is_done());
    }
    QCOMPARE(scene.bytes(), before);
}

void ValuesViewTest::data_that_cannot_be_edited_is_told() {
    const Scene scene;
    Stage stage(scene);
    stage.select_key(alpha);
    DialogHand hand;
    hand.then_press(QMessageBox::Ok);
    double_click(stage, stage.value(QStringLiteral("unreadable")));
    QVERIFY(hand.is_done());
    QCOMPARE(hand.icon, QMessageBox::Critical);
    QCOMPARE(hand.title, QStringLiteral("Registry Editor"));
    QCOMPARE(hand.text, QStringLiteral("Data type cannot be edited yet"));
    QCOMPARE(hand.parent, stage.values);
}

void ValuesViewTest::other_columns_open_nothing() {
    const Scene scene;
    Stage stage(scene);
    stage.select_key(alpha);
    for (int column : {1, 2}) {
        double_click(stage, stage.value(QStringLiteral("text"), column));
        QCoreApplication::processEvents();
        QCOMPARE(QApplication::activeModalWidget(), nullptr);
        QVERIFY(!stage.values->findChild<QLineEdit*>());
    }
}

void ValuesViewTest::return_opens_the_editor_and_enter_does_not() {
    const Scene scene;
    Stage stage(scene);
    stage.select_key(alpha);
    stage.values->setFocus();
    stage.values->setCurrentIndex(stage.value(QStringLiteral("dword")));
    QTest::keyClick(stage.values, Qt::Key_Enter);
    QCoreApplication::processEvents();
    QCOMPARE(QApplication::activeModalWidget(), nullptr);
    DialogHand hand;
    QString title;
    hand.then([&](QWidget* dialog) {
        title = dialog->windowTitle();
        QTest::keyClick(dialog, Qt::Key_Escape);
    });
    QTest::keyClick(stage.values, Qt::Key_Return);
    QVERIFY(hand.is_done());
    QCOMPARE(title, QStringLiteral("Edit DWORD (32-bit) Value"));
}

void ValuesViewTest::return_in_a_name_ends_the_name_only() {
    const Scene scene;
    Stage stage(scene);
    stage.select_key(alpha);
    stage.values->setFocus();
    stage.values->setCurrentIndex(stage.value(QStringLiteral("dword")));
    shared_actions().rename_action->trigger();
    stage.press_in_editor(QStringLiteral("renamed"), Qt::Key_Return);
    QTRY_VERIFY(stored(stage, QStringLiteral("renamed")));
    QTRY_VERIFY(stage.values->hasFocus());
    QCOMPARE(QApplication::activeModalWidget(), nullptr);
}

void ValuesViewTest::saving_the_value_that_is_not_set_makes_it() {
    const Scene scene;
    Stage stage(scene);
    stage.select_key(beta);
    QCOMPARE(stage.value_names().size(), 1);
    DialogHand hand;
    hand.then([&](QWidget* dialog) {
        QCOMPARE(dialog->windowTitle(), QStringLiteral("Edit String"));
        QCOMPARE(name_in(*dialog), QStringLiteral("(Default)"));
        QCOMPARE(shown_in(*dialog), QString());
        press(*dialog, QDialogButtonBox::Ok);
    });
    double_click(stage, stage.values->model()->index(0, 0));
    QVERIFY(hand.is_done());
    const auto value = stored(stage, QString());
    QVERIFY(value);
    QCOMPARE(value->data, QVariant(QString()));
    QCOMPARE(value->type, 1U);
    QCOMPARE(stage.value_names(), QStringList{QStringLiteral("(Default)")});
    QCOMPARE(stage.cell(0, 2), QString());
}

void ValuesViewTest::the_context_menu_of_a_value() {
    const Scene scene;
    Stage stage(scene);
    stage.select_key(alpha);
    const QPoint point = stage.values->visualRect(stage.value(QStringLiteral("text"))).center();
    QVERIFY(with_context_menu(*stage.values, point, [](QMenu& menu) {
        QCOMPARE(texts_of(menu).join(QLatin1Char(' ')), QStringLiteral("Edit Delete Rename"));
        QCOMPARE(menu.actions()[1], shared_actions().delete_action);
        QCOMPARE(menu.actions()[2], shared_actions().rename_action);
        QCOMPARE(menu.parentWidget(), nullptr);
    }));
    QCOMPARE(QApplication::activeModalWidget(), nullptr);
}

void ValuesViewTest::edit_of_the_context_menu() {
    const Scene scene;
    Stage stage(scene);
    stage.select_key(alpha);
    // Of the row that was clicked, whatever row is current.
    stage.values->setCurrentIndex(stage.value(QStringLiteral("dword")));
    const QPoint point = stage.values->visualRect(stage.value(QStringLiteral("bytes"))).center();
    QString name;
    DialogHand hand;
    hand.then([&](QWidget* dialog) {
        name = name_in(*dialog);
        QTest::keyClick(dialog, Qt::Key_Escape);
    });
    QVERIFY(with_context_menu(*stage.values, point, [](QMenu& menu) {
        QTest::mouseClick(&menu, Qt::LeftButton, {}, menu.actionGeometry(menu.actions()[0]).center());
    }));
    QVERIFY(hand.is_done());
    QCOMPARE(name, QStringLiteral("bytes"));
}

void ValuesViewTest::the_context_menu_of_everything_else_data() {
    QTest::addColumn<int>("column");
    QTest::newRow("the type") << 1;
    QTest::newRow("the data") << 2;
    QTest::newRow("empty space") << -1;
}

void ValuesViewTest::the_context_menu_of_everything_else() {
    QFETCH(int, column);
    const Scene scene;
    Stage stage(scene);
    stage.select_key(alpha);
    const QPoint point =
        column < 0 ? QPoint(20, stage.values->viewport()->height() - 5)
                   : stage.values->visualRect(stage.value(QStringLiteral("text"), column)).topLeft() + QPoint(5, 5);
    QVERIFY(with_context_menu(*stage.values, point, [](QMenu& menu) {
        QCOMPARE(texts_of(menu), QStringList{QStringLiteral("New")});
        QCOMPARE(texts_of(*menu.actions()[0]->menu()).join(QLatin1Char('|')),
                 QStringLiteral("Key|-|String Value|Binary Value|DWORD (32-bit) Value|QWORD (64-bit) Value|"
                                "Multi-String Value|Expandable String Value"));
        QCOMPARE(menu.actions()[0]->menu()->actions()[0], shared_actions().new_key_action);
    }));
}

void ValuesViewTest::the_key_entry_makes_a_key() {
    const Scene scene;
    Stage stage(scene);
    stage.select_key(beta);
    stage.values->setFocus();
    const QPoint below(20, stage.values->viewport()->height() - 5);
    QVERIFY(with_context_menu(*stage.values, below,
                              [](QMenu& menu) { menu.actions()[0]->menu()->actions()[0]->trigger(); }));
    QCOMPARE(stage.subkeys(beta), QStringList{QStringLiteral("New Key #1")});
    stage.select_key(beta);
    QCOMPARE(stage.value_names().size(), 1);
}

void ValuesViewTest::a_new_value_is_named_in_place_data() {
    QTest::addColumn<QAction*>("action");
    QTest::addColumn<quint32>("type");
    QTest::addColumn<QVariant>("data");
    const SharedActions& actions = shared_actions();
    QTest::newRow("string") << actions.new_string_action << 1U << QVariant(QString());
    QTest::newRow("expandable") << actions.new_expand_string_action << 2U << QVariant(QString());
    QTest::newRow("binary") << actions.new_binary_action << 3U << QVariant(QByteArray(""));
    QTest::newRow("dword") << actions.new_dword_action << 4U << QVariant(0U);
    // The two zeros of an empty list read as one empty text.
    QTest::newRow("multi-string") << actions.new_multi_string_action << 7U << QVariant(QStringList{QString()});
    QTest::newRow("qword") << actions.new_qword_action << 11U << QVariant(qulonglong(0));
}

void ValuesViewTest::a_new_value_is_named_in_place() {
    QFETCH(QAction*, action);
    QFETCH(quint32, type);
    QFETCH(QVariant, data);
    const Scene scene;
    Stage stage(scene);
    stage.select_key(deep);
    // Not gated by the focus.
    stage.keys->setFocus();
    action->trigger();
    const int last = stage.values->model()->rowCount() - 1;
    QCOMPARE(stage.values->currentIndex(), stage.values->model()->index(last, 0));
    QCOMPARE(qobject_cast<QLineEdit*>(QApplication::focusWidget())->text(), QStringLiteral("New Value #1"));
    stage.press_in_editor(QStringLiteral("AAA"), Qt::Key_Return);
    QTRY_VERIFY(stored(stage, QStringLiteral("AAA")));
    const auto value = stored(stage, QStringLiteral("AAA"));
    QCOMPARE(value->type, type);
    QCOMPARE(value->data, data);
    // It keeps its row until the next sort.
    QCOMPARE(stage.value_names().join(QLatin1Char(' ')), QStringLiteral("(Default) A b AAA"));
    stage.window.refresh_views();
    QCOMPARE(stage.value_names().join(QLatin1Char(' ')), QStringLiteral("(Default) A AAA b"));
}

void ValuesViewTest::a_value_that_cannot_be_made_is_told() {
    const Scene scene;
    Stage stage(scene);
    // Without a key there is nothing to make and nothing to tell.
    stage.select_key(QStringLiteral("MACHINE"));
    stage.values->run_new_value_action(shared_actions().new_string_action);
    QCOMPARE(QApplication::activeModalWidget(), nullptr);
    // The action that makes keys belongs to the group too.
    stage.select_key(beta);
    stage.values->run_new_value_action(shared_actions().new_key_action);
    QCOMPARE(stage.value_names().size(), 1);
}

void ValuesViewTest::deletion_asks_data() {
    QTest::addColumn<QMessageBox::StandardButton>("answer");
    QTest::addColumn<QString>("left");
    QTest::newRow("yes") << QMessageBox::Yes << "(Default) b";
    QTest::newRow("no") << QMessageBox::No << "(Default) A b";
}

void ValuesViewTest::deletion_asks() {
    QFETCH(QMessageBox::StandardButton, answer);
    QFETCH(QString, left);
    const Scene scene;
    Stage stage(scene);
    stage.select_key(deep);
    stage.values->setFocus();
    stage.values->setCurrentIndex(stage.value(QStringLiteral("A")));
    DialogHand hand;
    hand.then_press(answer);
    QTest::keyClick(stage.values, Qt::Key_Delete);
    QVERIFY(hand.is_done());
    QCOMPARE(hand.icon, QMessageBox::Question);
    QCOMPARE(hand.title, QStringLiteral("Confirm Value Removal"));
    QCOMPARE(hand.text, QStringLiteral("Are you sure you want to delete this value?"));
    QCOMPARE(hand.parent, stage.values);
    QCOMPARE(hand.buttons, QMessageBox::Yes | QMessageBox::No);
    QCOMPARE(stage.value_names().join(QLatin1Char(' ')), left);
    QCOMPARE(stage.values->currentIndex().row(), 1);
    QVERIFY(shared_actions().rename_action->isEnabled());
    // The key itself is where it was.
    QCOMPARE(stage.keys->currentIndex(), stage.key(deep));
}

void ValuesViewTest::deleting_the_default_value_leaves_it_unset() {
    const Scene scene;
    Stage stage(scene);
    stage.select_key(deep);
    stage.values->setFocus();
    stage.values->setCurrentIndex(stage.values->model()->index(0, 0));
    QCOMPARE(stage.cell(0, 2), QStringLiteral("set"));
    DialogHand hand;
    hand.then_press(QMessageBox::Yes);
    shared_actions().delete_action->trigger();
    QVERIFY(!stored(stage, QString()));
    QCOMPARE(stage.value_names().join(QLatin1Char(' ')), QStringLiteral("(Default) A b"));
    QVERIFY(stage.values->model()->index(0, 2).data().typeId() >= QMetaType::User);
    QVERIFY(!shared_actions().rename_action->isEnabled());
    // Deleting what is not set changes nothing and says nothing.
    stage.return_to(*stage.values);
    const QByteArray before = scene.bytes();
    hand.then_press(QMessageBox::Yes);
    shared_actions().delete_action->trigger();
    QVERIFY(hand.is_done());
    QCOMPARE(QApplication::activeModalWidget(), nullptr);
    QCOMPARE(scene.bytes(), before);
}

void ValuesViewTest::a_rename_in_place() {
    const Scene scene;
    Stage stage(scene);
    stage.select_key(deep);
    stage.values->setFocus();
    stage.values->setCurrentIndex(stage.value(QStringLiteral("A")));
    shared_actions().rename_action->trigger();
    stage.press_in_editor(QStringLiteral("zzz"), Qt::Key_Return);
    QTRY_VERIFY(stored(stage, QStringLiteral("zzz")));
    QVERIFY(!stored(stage, QStringLiteral("A")));
    QCOMPARE(stored(stage, QStringLiteral("zzz"))->data, QVariant(2U));
    QCOMPARE(stage.value_names().join(QLatin1Char(' ')), QStringLiteral("(Default) zzz b"));
    // The unnamed value cannot be renamed: no editor opens.
    QTRY_VERIFY(stage.values->hasFocus());
    stage.values->setCurrentIndex(stage.values->model()->index(0, 0));
    QTest::keyClick(stage.values, Qt::Key_F2);
    QVERIFY(stage.values->hasFocus());
}

void ValuesViewTest::a_rename_to_another_value_s_name_is_told() {
    const Scene scene;
    Stage stage(scene);
    stage.select_key(deep);
    stage.values->setFocus();
    stage.values->setCurrentIndex(stage.value(QStringLiteral("A")));
    const QByteArray before = scene.bytes();
    shared_actions().rename_action->trigger();
    DialogHand hand;
    hand.then_press(QMessageBox::Ok);
    stage.press_in_editor(QStringLiteral("b"), Qt::Key_Return);
    QTRY_VERIFY(hand.is_done());
    QCOMPARE(hand.text, QStringLiteral("The specified value name already exists."));
    QCOMPARE(hand.parent, &stage.window);
    QTRY_VERIFY(!stage.values->findChild<QLineEdit*>());
    QCOMPARE(stage.value_names().join(QLatin1Char(' ')), QStringLiteral("(Default) A b"));
    QCOMPARE(scene.bytes(), before);
}

void ValuesViewTest::actions_of_the_other_view_do_nothing_here() {
    const Scene scene;
    Stage stage(scene);
    stage.select_key(alpha);
    stage.values->setCurrentIndex(stage.value(QStringLiteral("text")));
    QVERIFY(shared_actions().delete_action->isEnabled());
    stage.keys->setFocus();
    const QByteArray before = scene.bytes();
    // The tree asks about its key instead; the answer is no.
    DialogHand hand;
    hand.then_press(QMessageBox::No);
    shared_actions().delete_action->trigger();
    QVERIFY(hand.is_done());
    QCOMPARE(hand.title, QStringLiteral("Confirm Key Removal"));
    shared_actions().rename_action->trigger();
    QVERIFY(!stage.values->findChild<QLineEdit*>());
    QCOMPARE(scene.bytes(), before);
}

// A key with a value under a name that 8 bits do not carry, and one of a type without a name.
testkit::HiveLayout odd_values() {
    testkit::HiveLayout hive;
    testkit::KeyLayout& key = hive.root.add("Key");
    testkit::ValueLayout& wide = key.set("wide", 1, testkit::text_data("text"));
    wide.name = u"\u65e5\u672c";
    wide.wide_name = true;
    key.set("odd", 12, {1, 2});
    return hive;
}

const QString odd_key = QStringLiteral("MACHINE\\SYSTEM\\Key");

void ValuesViewTest::a_refused_edit_is_told_data() {
    QTest::addColumn<QString>("name");
    QTest::newRow("a name in UTF-16") << QString::fromUtf8("日本");
    QTest::newRow("a type without a name") << QStringLiteral("odd");
}

void ValuesViewTest::a_refused_edit_is_told() {
    QFETCH(QString, name);
    const Scene scene(odd_values());
    Stage stage(scene);
    stage.select_key(odd_key);
    const QByteArray before = scene.bytes();
    DialogHand hand;
    // Left alone, there is nothing to refuse.
    hand.then([](QWidget* dialog) { press(*dialog, QDialogButtonBox::Ok); });
    double_click(stage, stage.value(name));
    QVERIFY(hand.is_done());
    QCOMPARE(QApplication::activeModalWidget(), nullptr);
    hand.then([](QWidget* dialog) {
        QTest::keyClicks(QApplication::focusWidget(), QStringLiteral("ab"));
        press(*dialog, QDialogButtonBox::Ok);
    });
    hand.then_press(QMessageBox::Ok);
    stage.values->value_double_clicked(stage.value(name));
    QVERIFY(hand.is_done());
    QCOMPARE(hand.icon, QMessageBox::Critical);
    QCOMPARE(hand.title, QStringLiteral("Registry Editor"));
    QCOMPARE(hand.text, QStringLiteral("The value could not be changed."));
    QCOMPARE(hand.parent, stage.values);
    QCOMPARE(scene.bytes(), before);
}

void ValuesViewTest::a_refused_creation_is_told_data() {
    QTest::addColumn<bool>("is_default");
    QTest::newRow("the default value") << true;
    QTest::newRow("a new value") << false;
}

void ValuesViewTest::a_refused_creation_is_told() {
    QFETCH(bool, is_default);
    Scene scene(odd_values());
    // Whether a record that cannot be read has the new value's name cannot be known.
    scene.damage_value("Key", 0);
    Stage stage(scene);
    stage.select_key(odd_key);
    const QByteArray before = scene.bytes();
    stage.values->setCurrentIndex(stage.value(QStringLiteral("odd")));
    const QStringList shown = stage.value_names();
    // The record itself is told too, at a time of its own, and once in all rows of this test.
    QStringList told;
    QTimer presser;
    connect(&presser, &QTimer::timeout, &presser, [&] {
        if (auto* box = qobject_cast<QMessageBox*>(QApplication::activeModalWidget())) {
            told.append(box->text());
            QTest::mouseClick(box->button(QMessageBox::Ok), Qt::LeftButton);
        } else if (QWidget* dialog = QApplication::activeModalWidget()) {
            press(*dialog, QDialogButtonBox::Ok);
        }
    });
    presser.start(1);
    if (is_default) {
        stage.values->value_double_clicked(stage.values->model()->index(0, 0));
    } else {
        shared_actions().new_string_action->trigger();
    }
    QCOMPARE(told.count(QStringLiteral("The value could not be created.")), 1);
    QCOMPARE(stage.value_names(), shown);
    QCOMPARE(stage.values->currentIndex(), stage.value(QStringLiteral("odd")));
    QCOMPARE(scene.bytes(), before);
}

void ValuesViewTest::a_refused_deletion_is_told_and_keeps_the_row() {
    const Scene scene(odd_values());
    Stage stage(scene);
    stage.select_key(odd_key);
    stage.values->setFocus();
    const QModelIndex wide = stage.value(QString::fromUtf8("日本"));
    stage.values->setCurrentIndex(wide);
    const QByteArray before = scene.bytes();
    DialogHand hand;
    hand.then_press(QMessageBox::Yes).then_press(QMessageBox::Ok);
    shared_actions().delete_action->trigger();
    QVERIFY(hand.is_done());
    QCOMPARE(hand.icon, QMessageBox::Critical);
    QCOMPARE(hand.text, QStringLiteral("The value could not be deleted."));
    QCOMPARE(stage.values->currentIndex(), stage.value(QString::fromUtf8("日本")));
    QCOMPARE(stage.values->selectionModel()->selectedIndexes(), QModelIndexList{stage.values->currentIndex()});
    QCOMPARE(scene.bytes(), before);
}

void ValuesViewTest::the_first_value_beside_the_unset_default_can_be_renamed() {
    const Scene scene;
    Stage stage(scene);
    stage.select_key(beta);
    stage.values->setFocus();
    stage.values->setCurrentIndex(stage.values->model()->index(0, 0));
    QVERIFY(!shared_actions().rename_action->isEnabled());
    shared_actions().new_string_action->trigger();
    QVERIFY(shared_actions().rename_action->isEnabled());
    stage.press_in_editor(QStringLiteral("first"), Qt::Key_Return);
    QTRY_VERIFY(stored(stage, QStringLiteral("first")));
    QCOMPARE(stage.values->currentIndex(), stage.value(QStringLiteral("first")));
}

void ValuesViewTest::no_bytes_show_as_such() {
    const Scene scene;
    Stage stage(scene);
    stage.select_key(alpha);
    DialogHand hand;
    hand.then([](QWidget* dialog) {
        qobject_cast<QLineEdit*>(QApplication::focusWidget())->clear();
        press(*dialog, QDialogButtonBox::Ok);
    });
    double_click(stage, stage.value(QStringLiteral("bytes")));
    QVERIFY(hand.is_done());
    QCOMPARE(stored(stage, QStringLiteral("bytes"))->data, QVariant(QByteArray("")));
    const auto* delegate = qobject_cast<const QStyledItemDelegate*>(stage.values->itemDelegate());
    QCOMPARE(delegate->displayText(stage.value(QStringLiteral("bytes"), 2).data(), QLocale()),
             QStringLiteral("(zero-length binary value)"));
}

UI_TEST_MAIN(ValuesViewTest)
#include "values_view_test.moc"
