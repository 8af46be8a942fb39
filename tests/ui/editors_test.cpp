// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
// The editors of one value: what they show, what Ok writes, and that every other way out writes nothing. Those for
// numbers leave the writing to whom they are opened by: for what is written then see values_view_test.

#include "edit_dialogs.h"
#include "edit_number_dialog.h"
#include "ui_test.h"

#include <QAbstractButton>
#include <QAccessible>
#include <QDialogButtonBox>
#include <QLabel>
#include <QLineEdit>
#include <QRadioButton>
#include <QStandardItemModel>
#include <QTextBlock>
#include <QTextEdit>
#include <QTextLayout>

namespace {

class NotingModel : public QStandardItemModel {
public:
    NotingModel() : QStandardItemModel(1, 3) {}

    bool setData(const QModelIndex& index, const QVariant& value, int role) override {
        indexes.append(index);
        written.append(value);
        roles.append(role);
        return false;
    }

    QModelIndexList indexes;
    QVariantList written;
    QList<int> roles;
};

enum Editor { StringEditor, BinaryEditor, MultiStringEditor, DwordEditor, QwordEditor };

void run(Editor editor, NotingModel& model, const QVariant& data) {
    const QString name = QStringLiteral("the name");
    const QModelIndex index = model.index(0, 2);
    switch (editor) {
    case StringEditor:
        edit_string(model, name, data.toString(), index);
        return;
    case BinaryEditor:
        edit_binary(model, name, data.toByteArray(), index);
        return;
    case MultiStringEditor:
        edit_multi_string(model, name, data.toStringList(), index);
        return;
    case DwordEditor: {
        EditDwordDialog dialog(name);
        dialog.set_value(data.toUInt());
        if (dialog.exec() == QDialog::Accepted)
            model.setData(index, QVariant(dialog.value()), Qt::DisplayRole);
        return;
    }
    case QwordEditor: {
        EditQwordDialog dialog(name);
        dialog.set_value(data.toULongLong());
        if (dialog.exec() == QDialog::Accepted)
            model.setData(index, QVariant(dialog.value()), Qt::DisplayRole);
        return;
    }
    }
}

QWidget* data_field(const QWidget& dialog) {
    if (auto* text = dialog.findChild<QTextEdit*>())
        return text;
    for (QLineEdit* edit : dialog.findChildren<QLineEdit*>()) {
        if (!edit->isReadOnly())
            return edit;
    }
    return nullptr;
}

void set_text(const QWidget& dialog, const QString& text) {
    if (auto* edit = dialog.findChild<QTextEdit*>()) {
        edit->selectAll();
        edit->insertPlainText(text);
        return;
    }
    // Typed, as far as the validator is concerned.
    auto* edit = qobject_cast<QLineEdit*>(data_field(dialog));
    edit->selectAll();
    edit->insert(text);
}

QStringList lines(std::initializer_list<const char*> texts) {
    QStringList list;
    for (const char* text : texts)
        list.append(QString::fromUtf8(text));
    return list;
}

void add_editors() {
    QTest::addColumn<int>("editor");
    QTest::addColumn<QVariant>("data");
    QTest::addColumn<QString>("typed");
    QTest::addColumn<QVariant>("stored");
    QTest::newRow("string") << int(StringEditor) << QVariant(QStringLiteral("old")) << "new"
                            << QVariant(QStringLiteral("new"));
    QTest::newRow("binary") << int(BinaryEditor) << QVariant(QByteArray("\x01\x02")) << "0A0b"
                            << QVariant(QByteArray("\x0a\x0b"));
    QTest::newRow("multi-string") << int(MultiStringEditor) << QVariant(lines({"a", "b"})) << "c\n\nd"
                                  << QVariant(lines({"c", "", "d"}));
    QTest::newRow("dword") << int(DwordEditor) << QVariant(7U) << "DEADBEEF" << QVariant(3735928559U);
    QTest::newRow("qword") << int(QwordEditor) << QVariant(qulonglong(7)) << "ffffffffffffffff"
                           << QVariant(qulonglong(18446744073709551615ULL));
}

}  // namespace

class EditorsTest : public QObject {
    Q_OBJECT

private slots:
    void the_layout_data() { add_editors(); }
    void the_layout();
    void ok_writes_data() { add_editors(); }
    void ok_writes();
    void return_writes_data() { add_editors(); }
    void return_writes();
    void leaving_writes_nothing_data();
    void leaving_writes_nothing();
    void ok_alone_gives_back_what_was_stored_data();
    void ok_alone_gives_back_what_was_stored();
    void the_binary_field_takes_digits_only_data();
    void the_binary_field_takes_digits_only();
    void a_megabyte_in_hexadecimal();
    void the_base_switch_converts_data();
    void the_base_switch_converts();
    void what_an_assistive_program_puts_in_is_stored_as_it_is_shown_data();
    void what_an_assistive_program_puts_in_is_stored_as_it_is_shown();
    void return_held_down_does_not_answer_data() { add_editors(); }
    void return_held_down_does_not_answer();
    void a_long_text_of_a_list_stands_on_one_line();
    void what_stands_beside_an_edited_line_stays_data();
    void what_stands_beside_an_edited_line_stays();
    void an_empty_number_is_zero();
    void a_line_made_by_shift_return_is_a_line();
    void a_line_beside_a_separator_is_a_line();
    void an_emptied_list_is_one_empty_text();
    void zeros_are_left_out();
};

void EditorsTest::the_layout() {
    QFETCH(int, editor);
    QFETCH(QVariant, data);
    NotingModel model;
    DialogHand hand;
    hand.then([&](QWidget* dialog) {
        QCOMPARE(dialog->parentWidget(), nullptr);
        QStringList labels;
        for (const QLabel* label : dialog->findChildren<QLabel*>())
            labels.append(label->text());
        QCOMPARE(labels, lines({"Value name:", "Value data:"}));
        const QLineEdit* name = nullptr;
        for (const QLineEdit* edit : dialog->findChildren<QLineEdit*>())
            name = edit->isReadOnly() ? edit : name;
        QVERIFY(name);
        QCOMPARE(name->text(), QStringLiteral("the name"));
        // What is typed goes to the data at once.
        QCOMPARE(QApplication::focusWidget(), data_field(*dialog));
        const auto* buttons = dialog->findChild<QDialogButtonBox*>();
        QCOMPARE(buttons->orientation(), Qt::Horizontal);
        QCOMPARE(buttons->standardButtons(), QDialogButtonBox::Ok | QDialogButtonBox::Cancel);
        // Wider it may be, taller not.
        QCOMPARE(dialog->width(), 360);
        QCOMPARE(dialog->maximumHeight(), dialog->height());
        QVERIFY(dialog->maximumWidth() > 10000);
        press(*dialog, QDialogButtonBox::Cancel);
    });
    run(static_cast<Editor>(editor), model, data);
    QVERIFY(hand.is_done());
}

void EditorsTest::ok_writes() {
    QFETCH(int, editor);
    QFETCH(QVariant, data);
    QFETCH(QString, typed);
    QFETCH(QVariant, stored);
    NotingModel model;
    DialogHand hand;
    hand.then([&](QWidget* dialog) {
        set_text(*dialog, typed);
        press(*dialog, QDialogButtonBox::Ok);
    });
    run(static_cast<Editor>(editor), model, data);
    QVERIFY(hand.is_done());
    QCOMPARE(model.written, QVariantList{stored});
    QCOMPARE(model.roles, QList<int>{Qt::DisplayRole});
    QCOMPARE(model.indexes, QModelIndexList{model.index(0, 2)});
}

void EditorsTest::return_writes() {
    QFETCH(int, editor);
    QFETCH(QVariant, data);
    QFETCH(QString, typed);
    QFETCH(QVariant, stored);
    NotingModel model;
    DialogHand hand;
    hand.then([&](QWidget* dialog) {
        set_text(*dialog, typed);
        // In a text of several lines Return is a line; Ok takes it from its button.
        QWidget* target = editor == MultiStringEditor
                              ? dialog->findChild<QDialogButtonBox*>()->button(QDialogButtonBox::Ok)
                              : data_field(*dialog);
        target->setFocus();
        QTest::keyClick(target, Qt::Key_Return);
    });
    run(static_cast<Editor>(editor), model, data);
    QVERIFY(hand.is_done());
    QCOMPARE(model.written, QVariantList{stored});
}

void EditorsTest::leaving_writes_nothing_data() {
    QTest::addColumn<int>("editor");
    QTest::addColumn<QString>("way");
    for (int editor : {StringEditor, BinaryEditor, MultiStringEditor, DwordEditor, QwordEditor}) {
        for (const char* way : {"cancel", "close", "escape"})
            QTest::addRow("editor %d, %s", editor, way) << editor << QString::fromLatin1(way);
    }
}

void EditorsTest::leaving_writes_nothing() {
    QFETCH(int, editor);
    QFETCH(QString, way);
    NotingModel model;
    DialogHand hand;
    hand.then([&](QWidget* dialog) {
        set_text(*dialog, QStringLiteral("12"));
        if (way == QStringLiteral("cancel"))
            press(*dialog, QDialogButtonBox::Cancel);
        else if (way == QStringLiteral("close"))
            dialog->close();
        else
            QTest::keyClick(data_field(*dialog), Qt::Key_Escape);
    });
    run(static_cast<Editor>(editor), model, QVariant());
    QVERIFY(hand.is_done());
    QVERIFY(model.written.isEmpty());
}

void EditorsTest::ok_alone_gives_back_what_was_stored_data() {
    QTest::addColumn<int>("editor");
    QTest::addColumn<QVariant>("data");
    const auto text = [](const char* row, const QString& value) {
        QTest::newRow(row) << int(StringEditor) << QVariant(value);
    };
    text("empty text", QStringLiteral(""));
    text("text like markup", QStringLiteral("<b>x</b> &amp; <img src=\"a\">"));
    text("tabs and quotes", QStringLiteral("a\t\"b\" 'c'"));
    text("line ends", QStringLiteral("a\nb\r\nc\rd"));
    text("non-breaking space", QStringLiteral("a\u00a0b"));
    text("line and paragraph separators", QStringLiteral("a\u2028b\u2029c"));
    text("many scripts", QString::fromUtf8("ä ß ☃ é Ж 日本 עברית 😀"));
    text("control characters", QStringLiteral("\u0001\u0007\u001b\u007f"));
    text("an unpaired surrogate", QString(QChar(0xd800)));
    text("more than a line edit takes by default", QString(100000, QLatin1Char('x')));
    for (int size : {0, 1, 4, 5, 100, 16344, 16345})
        QTest::addRow("%d bytes", size) << int(BinaryEditor) << QVariant(QByteArray(size, '\xa5'));
    const auto list = [](const char* row, const QStringList& value) {
        QTest::newRow(row) << int(MultiStringEditor) << QVariant(value);
    };
    list("one text", lines({"a"}));
    list("an empty first text", lines({"", "a"}));
    list("an empty text in the middle", lines({"a", "", "b"}));
    list("texts like markup", lines({"<b>x</b>", "<p>"}));
    list("texts with non-breaking spaces and tabs", lines({"a\u00a0b", "c\td"}));
    list("texts with line ends inside", {QStringLiteral("a\nb"), QStringLiteral("c\rd\u2028e\u2029f")});
    list("two hundred texts", QStringList(200, QStringLiteral("text")));
    for (uint number : {0U, 255U, 4294967295U})
        QTest::addRow("dword %u", number) << int(DwordEditor) << QVariant(number);
    for (qulonglong number : {0ULL, 255ULL, 18446744073709551615ULL})
        QTest::addRow("qword %llu", number) << int(QwordEditor) << QVariant(number);
}

void EditorsTest::ok_alone_gives_back_what_was_stored() {
    QFETCH(int, editor);
    QFETCH(QVariant, data);
    NotingModel model;
    DialogHand hand;
    hand.then([&](QWidget* dialog) { press(*dialog, QDialogButtonBox::Ok); });
    run(static_cast<Editor>(editor), model, data);
    QVERIFY(hand.is_done());
    QCOMPARE(model.written, QVariantList{data});
}

void EditorsTest::the_binary_field_takes_digits_only_data() {
    QTest::addColumn<QString>("typed");
    QTest::addColumn<QString>("text");
    QTest::addColumn<QByteArray>("stored");
    QTest::newRow("both cases") << "0A0b"
                                << "0A0b" << QByteArray::fromHex("0a0b");
    QTest::newRow("blanks and other letters") << "0a g-0b"
                                              << "0a0b" << QByteArray::fromHex("0a0b");
    QTest::newRow("nothing") << ""
                             << "" << QByteArray("");
    // The first digit of an odd number is taken for a low half.
    QTest::newRow("an odd number of digits") << "abc"
                                             << "abc" << QByteArray::fromHex("0abc");
}

void EditorsTest::the_binary_field_takes_digits_only() {
    QFETCH(QString, typed);
    QFETCH(QString, text);
    QFETCH(QByteArray, stored);
    NotingModel model;
    DialogHand hand;
    hand.then([&](QWidget* dialog) {
        auto* edit = qobject_cast<QLineEdit*>(data_field(*dialog));
        QCOMPARE(edit->text(), QStringLiteral("ff"));
        edit->clear();
        QTest::keyClicks(edit, typed);
        QCOMPARE(edit->text(), text);
        press(*dialog, QDialogButtonBox::Ok);
    });
    edit_binary(model, QStringLiteral("n"), QByteArray("\xff"), model.index(0, 2));
    QVERIFY(hand.is_done());
    QCOMPARE(model.written, QVariantList{stored});
}

void EditorsTest::a_megabyte_in_hexadecimal() {
    NotingModel model;
    const QByteArray data(1 << 20, '\x3c');
    DialogHand hand;
    hand.then([&](QWidget* dialog) {
        auto* edit = qobject_cast<QLineEdit*>(data_field(*dialog));
        QCOMPARE(edit->text().size(), 2 << 20);
        edit->end(false);
        // Validated as a whole, and not refused for its length.
        edit->insert(QStringLiteral("0f"));
        edit->insert(QStringLiteral("x"));
        press(*dialog, QDialogButtonBox::Ok);
    });
    edit_binary(model, QStringLiteral("n"), data, model.index(0, 2));
    QVERIFY(hand.is_done());
    QCOMPARE(model.written, QVariantList{data + '\x0f'});
}

void EditorsTest::the_base_switch_converts_data() {
    QTest::addColumn<quint64>("number");
    QTest::addColumn<QString>("hexadecimal");
    QTest::addColumn<QString>("decimal");
    QTest::addColumn<bool>("fits_dword");
    QTest::newRow("255") << quint64(255) << "ff"
                         << "255" << true;
    QTest::newRow("0") << quint64(0) << "0"
                       << "0" << true;
    QTest::newRow("largest of 32 bits") << quint64(4294967295) << "ffffffff"
                                        << "4294967295" << true;
    QTest::newRow("largest of 64 bits") << quint64(18446744073709551615ULL) << "ffffffffffffffff"
                                        << "18446744073709551615" << false;
}

void EditorsTest::the_base_switch_converts() {
    QFETCH(quint64, number);
    QFETCH(QString, hexadecimal);
    QFETCH(QString, decimal);
    QFETCH(bool, fits_dword);
    const auto check = [&](EditNumberDialog& dialog) {
        auto* edit = qobject_cast<QLineEdit*>(data_field(dialog));
        auto* to_hexadecimal = find_by_text<QRadioButton>(dialog, QStringLiteral("Hexadecimal"));
        auto* to_decimal = find_by_text<QRadioButton>(dialog, QStringLiteral("Decimal"));
        QCOMPARE(edit->text(), hexadecimal);
        QVERIFY(dialog.property("is_hexadecimal").toBool());
        to_decimal->setChecked(true);
        QVERIFY(!dialog.is_hexadecimal());
        QCOMPARE(edit->text(), decimal);
        to_hexadecimal->setChecked(true);
        QCOMPARE(edit->text(), hexadecimal);
        edit->clear();
        to_decimal->setChecked(true);
        QCOMPARE(edit->text(), QStringLiteral("0"));
        edit->clear();
        to_hexadecimal->setChecked(true);
        QCOMPARE(edit->text(), QStringLiteral("0"));
    };
    EditQwordDialog qword(QStringLiteral("n"));
    qword.set_value(number);
    QCOMPARE(qword.value(), number);
    check(qword);
    if (fits_dword) {
        EditDwordDialog dword(QStringLiteral("n"));
        dword.set_value(static_cast<quint32>(number));
        QCOMPARE(dword.value(), static_cast<quint32>(number));
        check(dword);
    }
}

void EditorsTest::what_an_assistive_program_puts_in_is_stored_as_it_is_shown_data() {
    QTest::addColumn<int>("editor");
    QTest::addColumn<QVariant>("data");
    QTest::addColumn<bool>("in_decimal");
    QTest::addColumn<QString>("put_in");
    QTest::addColumn<QVariant>("stored");
    QTest::newRow("text") << int(StringEditor) << QVariant(QStringLiteral("old")) << false << "new "
                          << QVariant(QStringLiteral("new old"));
    QTest::newRow("texts") << int(MultiStringEditor) << QVariant(lines({"a", "b"})) << false << "new\n"
                           << QVariant(lines({"new", "a", "b"}));
    QTest::newRow("bytes") << int(BinaryEditor) << QVariant(QByteArray("\x01")) << false << "0a"
                           << QVariant(QByteArray("\x0a\x01"));
    QTest::newRow("no hexadecimal digits")
        << int(BinaryEditor) << QVariant(QByteArray("\x12")) << false << "0x" << QVariant(QByteArray("\x12"));
    QTest::newRow("an eighth digit") << int(DwordEditor) << QVariant(0xfffffffU) << false << "1"
                                     << QVariant(0x1fffffffU);
    QTest::newRow("a ninth digit") << int(DwordEditor) << QVariant(0xffffffffU) << false << "1"
                                   << QVariant(0xffffffffU);
    QTest::newRow("a seventeenth digit") << int(QwordEditor) << QVariant(0xffffffffffffffffULL) << false << "1"
                                         << QVariant(0xffffffffffffffffULL);
    QTest::newRow("more than 32 bits") << int(DwordEditor) << QVariant(4000000000U) << true << "1"
                                       << QVariant(4000000000U);
    QTest::newRow("a decimal digit") << int(QwordEditor) << QVariant(4000000000ULL) << true << "1"
                                     << QVariant(14000000000ULL);
}

void EditorsTest::what_an_assistive_program_puts_in_is_stored_as_it_is_shown() {
    QFETCH(int, editor);
    QFETCH(QVariant, data);
    QFETCH(bool, in_decimal);
    QFETCH(QString, put_in);
    QFETCH(QVariant, stored);
    NotingModel model;
    DialogHand hand;
    hand.then([&](QWidget* dialog) {
        if (in_decimal)
            find_by_text<QRadioButton>(*dialog, QStringLiteral("Decimal"))->setChecked(true);
        QAccessible::queryAccessibleInterface(data_field(*dialog))->editableTextInterface()->insertText(0, put_in);
        press(*dialog, QDialogButtonBox::Ok);
    });
    run(static_cast<Editor>(editor), model, data);
    QVERIFY(hand.is_done());
    QCOMPARE(model.written, QVariantList{stored});
}

void EditorsTest::return_held_down_does_not_answer() {
    QFETCH(int, editor);
    QFETCH(QVariant, data);
    NotingModel model;
    DialogHand hand;
    hand.then([&](QWidget* dialog) {
        QKeyEvent repeated(QEvent::KeyPress, Qt::Key_Return, Qt::NoModifier, QStringLiteral("\r"), true);
        QApplication::sendEvent(data_field(*dialog), &repeated);
        QVERIFY(dialog->isVisible());
        if (const auto* text = dialog->findChild<QTextEdit*>()) {
            QCOMPARE(text->toPlainText(), QStringLiteral("a\nb"));
            // Pressed anew it is a line, and held down then, more of them.
            QTest::keyClick(data_field(*dialog), Qt::Key_Return);
            QApplication::sendEvent(data_field(*dialog), &repeated);
            QCOMPARE(text->toPlainText(), QStringLiteral("\n\na\nb"));
        }
        press(*dialog, QDialogButtonBox::Cancel);
    });
    run(static_cast<Editor>(editor), model, data);
    QVERIFY(hand.is_done());
    QVERIFY(model.written.isEmpty());
}

void EditorsTest::a_long_text_of_a_list_stands_on_one_line() {
    NotingModel model;
    DialogHand hand;
    hand.then([&](QWidget* dialog) {
        const auto* edit = dialog->findChild<QTextEdit*>();
        const QTextBlock block = edit->document()->firstBlock();
        QVERIFY(block.layout()->boundingRect().width() > edit->viewport()->width());
        QCOMPARE(block.layout()->lineCount(), 1);
        press(*dialog, QDialogButtonBox::Cancel);
    });
    edit_multi_string(model, QStringLiteral("n"), {QStringLiteral("a text of some words ").repeated(20)},
                      model.index(0, 2));
    QVERIFY(hand.is_done());
}

// Line ends inside a text make lines of it in the widget.
void EditorsTest::what_stands_beside_an_edited_line_stays_data() {
    using Edit = std::function<void(QTextEdit&)>;
    QTest::addColumn<QStringList>("data");
    QTest::addColumn<QString>("shown");
    QTest::addColumn<Edit>("edit");
    QTest::addColumn<QStringList>("stored");
    const auto go_to = [](QTextEdit& edit, int line) {
        edit.setTextCursor(QTextCursor(edit.document()->findBlockByNumber(line)));
    };
    const auto type = [](QTextEdit& edit, const char* text) {
        for (const char* c = text; *c != 0; c++) {
            if (*c == '\n')
                QTest::keyClick(&edit, Qt::Key_Return);
            else
                QTest::keyClick(&edit, *c);
        }
    };
    const auto type_at = [=](int line, const char* text) {
        return Edit([=](QTextEdit& edit) {
            go_to(edit, line);
            type(edit, text);
        });
    };
    const auto delete_lines = [go_to](int first, int count) {
        return Edit([=](QTextEdit& edit) {
            go_to(edit, first);
            for (int i = 0; i < count; i++)
                QTest::keyClick(&edit, Qt::Key_Down, Qt::ShiftModifier);
            QTest::keyClick(&edit, Qt::Key_Delete);
        });
    };
    const QStringList ends{QStringLiteral("a\r"), QStringLiteral("b")};
    const QString ends_shown = QStringLiteral("a\n\nb");
    QTest::newRow("behind a line end") << ends << ends_shown << type_at(2, "c")
                                       << QStringList{ends[0], QStringLiteral("cb")};
    QTest::newRow("a line end edited") << ends << ends_shown << type_at(1, "c") << lines({"a", "c", "b"});
    QTest::newRow("typed and taken back") << ends << ends_shown << Edit([=](QTextEdit& edit) {
        type_at(1, "c\n")(edit);
        QTest::keyClick(&edit, Qt::Key_Backspace);
        QTest::keyClick(&edit, Qt::Key_Backspace);
    }) << ends;
    QTest::newRow("taken out and put back") << ends << ends_shown << Edit([=](QTextEdit& edit) {
        delete_lines(0, 2)(edit);
        edit.undo();
    }) << ends;
    const QStringList inside{QStringLiteral("x\ry"), QStringLiteral("b"), QStringLiteral("z\u2029\n")};
    const QString inside_shown = QStringLiteral("x\ny\nb\nz\n\n");
    QTest::newRow("a line between") << inside << inside_shown << type_at(2, "c\nd")
                                    << QStringList{inside[0], QStringLiteral("c"), QStringLiteral("db"), inside[2]};
    QTest::newRow("one of two lines") << inside << inside_shown << type_at(1, "c")
                                      << QStringList{QStringLiteral("x"), QStringLiteral("cy"), inside[1], inside[2]};
    const QStringList alike(3, QStringLiteral("a\r"));
    const QString alike_shown = QStringLiteral("a\n\na\n\na\n");
    QTest::newRow("a line made ahead") << alike << alike_shown << Edit([=](QTextEdit& edit) {
        type_at(2, "\n")(edit);
        type_at(2, "c")(edit);
    }) << QStringList{alike[0], QStringLiteral("c"), alike[1], alike[2]};
    QTest::newRow("a line typed ahead") << alike << alike_shown << type_at(2, "c\n")
                                        << QStringList{alike[0], QStringLiteral("c"), alike[1], alike[2]};
    QTest::newRow("on both sides") << alike << alike_shown << Edit([=](QTextEdit& edit) {
        type_at(0, "c")(edit);
        type_at(4, "d")(edit);
    }) << QStringList{QStringLiteral("ca"), QString(), alike[1], QStringLiteral("da"), QString()};
    const QStringList middle{QStringLiteral("x"), QStringLiteral("p\rq"), QStringLiteral("c")};
    const QString middle_shown = QStringLiteral("x\np\nq\nc");
    QTest::newRow("both neighbours taken out") << middle << middle_shown << Edit([=](QTextEdit& edit) {
        delete_lines(0, 1)(edit);
        edit.moveCursor(QTextCursor::End);
        QTest::keyClick(&edit, Qt::Key_Backspace);
        QTest::keyClick(&edit, Qt::Key_Backspace);
    }) << QStringList{middle[1]};
    QTest::newRow("both neighbours edited and a line made ahead")
        << middle << middle_shown << Edit([=](QTextEdit& edit) {
               type_at(0, "y")(edit);
               type_at(1, "\n")(edit);
               type_at(1, "new")(edit);
               type_at(4, "z")(edit);
           })
        << QStringList{QStringLiteral("yx"), QStringLiteral("new"), middle[1], QStringLiteral("zc")};
    QTest::newRow("all typed anew") << middle << middle_shown << Edit([=](QTextEdit& edit) {
        edit.selectAll();
        type(edit, "a\np\nq\nb");
    }) << lines({"a", "p", "q", "b"});
    QTest::newRow("the lines of a string ahead taken out")
        << QStringList{QStringLiteral("a\rb"), QStringLiteral("a"), QStringLiteral("b")} << "a\nb\na\nb"
        << delete_lines(0, 2) << lines({"a", "b"});
}

void EditorsTest::what_stands_beside_an_edited_line_stays() {
    QFETCH(QStringList, data);
    QFETCH(QString, shown);
    QFETCH(const std::function<void(QTextEdit&)>, edit);
    QFETCH(QStringList, stored);
    NotingModel model;
    DialogHand hand;
    hand.then([&](QWidget* dialog) {
        auto* field = dialog->findChild<QTextEdit*>();
        QCOMPARE(field->toPlainText(), shown);
        edit(*field);
        press(*dialog, QDialogButtonBox::Ok);
    });
    edit_multi_string(model, QStringLiteral("n"), data, model.index(0, 2));
    QVERIFY(hand.is_done());
    QCOMPARE(model.written.size(), 1);
    QCOMPARE(model.written[0].toStringList(), stored);
}

void EditorsTest::an_empty_number_is_zero() {
    for (const auto& [editor, base] : {std::pair(DwordEditor, "Hexadecimal"), std::pair(QwordEditor, "Hexadecimal"),
                                       std::pair(DwordEditor, "Decimal"), std::pair(QwordEditor, "Decimal")}) {
        NotingModel model;
        DialogHand hand;
        const QString base_text = QString::fromLatin1(base);
        hand.then([&](QWidget* dialog) {
            find_by_text<QRadioButton>(*dialog, base_text)->setChecked(true);
            qobject_cast<QLineEdit*>(data_field(*dialog))->clear();
            press(*dialog, QDialogButtonBox::Ok);
        });
        run(editor, model, QVariant(5U));
        QVERIFY(hand.is_done());
        QCOMPARE(model.written.size(), 1);
        QCOMPARE(model.written[0].toULongLong(), 0ULL);
    }
}

void EditorsTest::a_line_made_by_shift_return_is_a_line() {
    NotingModel model;
    DialogHand hand;
    hand.then([&](QWidget* dialog) {
        QWidget* field = data_field(*dialog);
        set_text(*dialog, QStringLiteral("a"));
        QTest::keyClick(field, Qt::Key_Return, Qt::ShiftModifier);
        QTest::keyClicks(field, QStringLiteral("b"));
        QTest::keyClick(field, Qt::Key_Return);
        press(*dialog, QDialogButtonBox::Ok);
    });
    edit_multi_string(model, QStringLiteral("n"), {}, model.index(0, 2));
    QVERIFY(hand.is_done());
    QCOMPARE(model.written, QVariantList{lines({"a", "b", ""})});

    // An empty text is a list of one empty string.
    model.written.clear();
    hand.then([&](QWidget* dialog) { press(*dialog, QDialogButtonBox::Ok); });
    edit_multi_string(model, QStringLiteral("n"), {}, model.index(0, 2));
    QCOMPARE(model.written, QVariantList{lines({""})});
}

void EditorsTest::a_line_beside_a_separator_is_a_line() {
    NotingModel model;
    const QStringList data{QStringLiteral("a\u2028b")};
    DialogHand hand;
    hand.then([&](QWidget* dialog) {
        QWidget* field = data_field(*dialog);
        QTest::keyClick(field, Qt::Key_End, Qt::ControlModifier);
        QTest::keyClick(field, Qt::Key_Return, Qt::ShiftModifier);
        QTest::keyClicks(field, QStringLiteral("c"));
        press(*dialog, QDialogButtonBox::Ok);
    });
    edit_multi_string(model, QStringLiteral("n"), data, model.index(0, 2));
    const QStringList wanted{data[0], QStringLiteral("c")};
    QCOMPARE(model.written, QVariantList{wanted});
}

void EditorsTest::an_emptied_list_is_one_empty_text() {
    NotingModel model;
    DialogHand hand;
    hand.then([&](QWidget* dialog) {
        set_text(*dialog, QString());
        press(*dialog, QDialogButtonBox::Ok);
    });
    edit_multi_string(model, QStringLiteral("n"), lines({"a", "b"}), model.index(0, 2));
    QCOMPARE(model.written, QVariantList{lines({""})});
}

void EditorsTest::zeros_are_left_out() {
    NotingModel model;
    const QString pasted = QStringLiteral("a") + QChar(QChar::Null) + QStringLiteral("b");
    for (Editor editor : {StringEditor, MultiStringEditor}) {
        DialogHand hand;
        hand.then([&](QWidget* dialog) {
            set_text(*dialog, pasted);
            press(*dialog, QDialogButtonBox::Ok);
        });
        run(editor, model, QVariant());
    }
    const QVariantList wanted{QStringLiteral("ab"), lines({"ab"})};
    QCOMPARE(model.written, wanted);
}

UI_TEST_MAIN(EditorsTest)
#include "editors_test.moc"
