// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
// The values table: which editor opens for which data, what Return does, and the context menus.

#include "shared_actions.h"
#include "stage.h"
#include "ui_test.h"

#include <QDialogButtonBox>
#include <QLineEdit>
#include <QStyledItemDelegate>
#include <QTextEdit>

namespace {

const QString alpha = QStringLiteral("MACHINE\\SYSTEM\\Alpha");
const QString beta = QStringLiteral("MACHINE\\SYSTEM\\Beta");

QString shown_in(const QWidget& dialog) {
    if (const auto* text = dialog.findChild<QTextEdit*>())
        return text->toPlainText();
    for (const QLineEdit* edit : dialog.findChildren<QLineEdit*>()) {
        if (!edit->isReadOnly())
            return edit->text();
    }
    return QStringLiteral("no field");
}

QString name_in(const QWidget& dialog) {
    for (const QLineEdit* edit : dialog.findChildren<QLineEdit*>()) {
        if (edit->isReadOnly())
            return edit->text();
    }
    return QStringLiteral("no name");
}

}  // namespace

class ValuesViewTest : public QObject {
    Q_OBJECT

private slots:
    void the_editor_follows_the_data_data();
    void the_editor_follows_the_data();
    void what_is_cancelled_is_not_written_data();
    void what_is_cancelled_is_not_written();
    void an_emptied_number_is_written_as_zero();
    void data_goes_to_no_other_key_s_value_data();
    void data_goes_to_no_other_key_s_value();
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
            if (c == QLatin1Char('\n'))
                QTest::keyClick(field, Qt::Key_Return);
            else
                QTest::keyClick(field, c.toLatin1());
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

void ValuesViewTest::what_is_cancelled_is_not_written_data() {
    using Step = DialogHand::Step;
    QTest::addColumn<Step>("leave");
    QTest::newRow("Cancel") << Step([](QWidget* dialog) { press(*dialog, QDialogButtonBox::Cancel); });
    QTest::newRow("Escape") << Step([](QWidget* dialog) { QTest::keyClick(dialog, Qt::Key_Escape); });
    QTest::newRow("closed") << Step([](QWidget* dialog) { dialog->close(); });
}

void ValuesViewTest::what_is_cancelled_is_not_written() {
    QFETCH(const DialogHand::Step, leave);
    const Scene scene;
    Stage stage(scene);
    stage.select_key(alpha);
    const QByteArray before = scene.bytes();
    for (const char* name : {"dword", "qword", "text", "bytes", "list"}) {
        DialogHand hand;
        hand.then([&](QWidget* dialog) {
            QTest::keyClicks(QApplication::focusWidget(), QStringLiteral("1"));
            leave(dialog);
        });
        double_click(stage, stage.value(QString::fromLatin1(name)));
        QVERIFY(hand.is_done());
    }
    QCOMPARE(scene.bytes(), before);
}

void ValuesViewTest::an_emptied_number_is_written_as_zero() {
    const Scene scene;
    Stage stage(scene);
    stage.select_key(alpha);
    for (const char* name : {"dword", "qword"}) {
        DialogHand hand;
        hand.then([&](QWidget* dialog) {
            QTest::keyClick(QApplication::focusWidget(), Qt::Key_A, Qt::ControlModifier);
            QTest::keyClick(QApplication::focusWidget(), Qt::Key_Delete);
            QCOMPARE(shown_in(*dialog), QString());
            press(*dialog, QDialogButtonBox::Ok);
        });
        double_click(stage, stage.value(QString::fromLatin1(name)));
        QVERIFY(hand.is_done());
        const auto value = stored(stage, QString::fromLatin1(name));
        QVERIFY(value);
        QCOMPARE(value->data.toULongLong(), 0ULL);
    }
}

void ValuesViewTest::data_goes_to_no_other_key_s_value_data() {
    QTest::addColumn<QString>("name");
    for (const char* name : {"text", "bytes", "list", "dword", "qword"})
        QTest::newRow(name) << QString::fromLatin1(name);
}

void ValuesViewTest::data_goes_to_no_other_key_s_value() {
    QFETCH(QString, name);
    // Two keys with the same values, so that the rows of one fit the other's.
    testkit::HiveLayout hive;
    for (const char* key_name : {"One", "Two"}) {
        testkit::KeyLayout& key = hive.root.add(key_name);
        key.set("text", 1, testkit::text_data("hello"));
        key.set("bytes", 3, {1, 2});
        key.set("dword", 4, {1, 0, 0, 0});
        key.set("list", 7, {'a', 0, 0, 0, 0, 0});
        key.set("qword", 11, {1, 0, 0, 0, 0, 0, 0, 0});
    }
    const Scene scene(hive);
    Stage stage(scene);
    stage.select_key(QStringLiteral("MACHINE\\SYSTEM\\One"));
    const QByteArray before = scene.bytes();
    DialogHand hand;
    hand.then([&](QWidget* dialog) {
        stage.select_key(QStringLiteral("MACHINE\\SYSTEM\\Two"));
        QTest::keyClicks(QApplication::focusWidget(), QStringLiteral("ab"));
        press(*dialog, QDialogButtonBox::Ok);
    });
    hand.then_press(QMessageBox::Ok);
    double_click(stage, stage.value(name));
    QTRY_VERIFY(hand.is_done());
    QCOMPARE(hand.text, QStringLiteral("The value could not be changed."));
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
    const DialogHand hand;
    stage.select_key(alpha);
    for (int column : {1, 2}) {
        double_click(stage, stage.value(QStringLiteral("text"), column));
        QVERIFY(hand.nothing_comes());
        QVERIFY(!stage.values->findChild<QLineEdit*>());
    }
}

void ValuesViewTest::return_opens_the_editor_and_enter_does_not() {
    const Scene scene;
    Stage stage(scene);
    DialogHand hand;
    stage.select_value(alpha, QStringLiteral("dword"));
    QTest::keyClick(stage.values, Qt::Key_Enter);
    QVERIFY(hand.nothing_comes());
    QKeyEvent held_down(QEvent::KeyPress, Qt::Key_Return, Qt::NoModifier, QStringLiteral("\r"), true);
    QApplication::sendEvent(stage.values, &held_down);
    QVERIFY(hand.nothing_comes());
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
    const DialogHand hand;
    stage.select_value(alpha, QStringLiteral("dword"));
    shared_actions().rename_action->trigger();
    stage.press_in_editor(QStringLiteral("renamed"), Qt::Key_Return);
    QTRY_VERIFY(stored(stage, QStringLiteral("renamed")));
    QTRY_VERIFY(stage.values->hasFocus());
    QVERIFY(hand.nothing_comes());
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
    const DialogHand hand;
    stage.select_key(alpha);
    const QPoint point = stage.values->visualRect(stage.value(QStringLiteral("text"))).center();
    QVERIFY(with_context_menu(*stage.values, point, [](QMenu& menu) {
        QCOMPARE(texts_of(menu).join(QLatin1Char(' ')), QStringLiteral("Edit Delete Rename"));
        QCOMPARE(menu.actions()[1], shared_actions().delete_action);
        QCOMPARE(menu.actions()[2], shared_actions().rename_action);
        QCOMPARE(menu.parentWidget(), nullptr);
    }));
    QVERIFY(hand.nothing_comes());
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
