// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "edit_dialogs.h"

#include "compact_dialog.h"
#include "string_lines.h"
#include "validators.h"

#include <QAbstractItemModel>
#include <QCoreApplication>
#include <QDialog>
#include <QDialogButtonBox>
#include <QKeyEvent>
#include <QLabel>
#include <QLineEdit>
#include <QRegularExpressionValidator>
#include <QTextEdit>
#include <QVBoxLayout>

#include <limits>

namespace {

// Takes the caller's widget out of the dialog again, whatever way the dialog is left: the caller owns it, and still
// reads it.
class Loan {
public:
    explicit Loan(QWidget& widget) : widget_(widget) {}
    ~Loan() { widget_.setParent(nullptr); }
    Loan(const Loan&) = delete;
    Loan& operator=(const Loan&) = delete;

private:
    QWidget& widget_;
};

// Lays out an editor around its data widget and runs it; true for Ok.
bool run_editor(const QString& title, const QString& value_name, QWidget& data_widget) {
    QDialog dialog;
    const Loan loan(data_widget);
    dialog.setWindowTitle(title);
    auto* name_edit = new QLineEdit(value_name);
    name_edit->setReadOnly(true);
    auto* buttons = new QDialogButtonBox(QDialogButtonBox::Ok | QDialogButtonBox::Cancel, Qt::Horizontal);
    QObject::connect(buttons, &QDialogButtonBox::accepted, &dialog, &QDialog::accept);
    QObject::connect(buttons, &QDialogButtonBox::rejected, &dialog, &QDialog::reject);
    auto* name_label = new QLabel(QCoreApplication::translate("ValuesView", "Value name:"));
    name_label->setBuddy(name_edit);
    auto* data_label = new QLabel(QCoreApplication::translate("ValuesView", "Value data:"));
    data_label->setBuddy(&data_widget);

    auto* layout = new QVBoxLayout(&dialog);
    layout->addWidget(name_label);
    layout->addWidget(name_edit);
    layout->addWidget(data_label);
    layout->addWidget(&data_widget);
    layout->addWidget(buttons);
    make_compact(dialog, data_widget);
    return dialog.exec() == QDialog::Accepted;
}

// Registry text is longer than a line edit takes by default.
void take_any_length(QLineEdit& edit) { edit.setMaxLength(std::numeric_limits<int>::max()); }

// Shift+Return is a new line as Return is, and not a separator inside of one.
class LinesEdit : public QTextEdit {
protected:
    void keyPressEvent(QKeyEvent* event) override {
        if (event->matches(QKeySequence::InsertLineSeparator)) {
            textCursor().insertBlock();
            ensureCursorVisible();
        } else {
            QTextEdit::keyPressEvent(event);
        }
    }
};

}  // namespace

bool edit_string(QAbstractItemModel& model, const QString& value_name, const QString& data,
                 const QPersistentModelIndex& data_index) {
    QLineEdit edit;
    take_any_length(edit);
    edit.setText(data);
    if (!run_editor(QCoreApplication::translate("ValuesView", "Edit String", "dialog title"), value_name, edit))
        return true;
    // Compared, since the line edit's own mark of a change misses text that an assistive program has put in.
    const QString text = edit.text();
    return model.setData(data_index, text == data ? data : without_zeros(text), Qt::DisplayRole);
}

bool edit_binary(QAbstractItemModel& model, const QString& value_name, const QByteArray& data,
                 const QPersistentModelIndex& data_index) {
    QLineEdit edit;
    take_any_length(edit);
    edit.setText(QString::fromLatin1(data.toHex()));
    // One class of characters and no alternatives: these take a step per digit on the matcher's stack, which runs out
    // at some ten thousand digits.
    edit.setValidator(new QRegularExpressionValidator(QRegularExpression(QStringLiteral("[a-fA-F0-9]*")), &edit));
    take_back_invalid_text(edit);
    if (!run_editor(QCoreApplication::translate("ValuesView", "Edit Binary Value", "dialog title"), value_name, edit))
        return true;
    return model.setData(data_index, QByteArray::fromHex(edit.text().toLatin1()), Qt::DisplayRole);
}

bool edit_multi_string(QAbstractItemModel& model, const QString& value_name, const QStringList& data,
                       const QPersistentModelIndex& data_index) {
    LinesEdit edit;
    edit.setAcceptRichText(false);
    edit.setTabChangesFocus(true);
    // A long line stays one.
    edit.setLineWrapMode(QTextEdit::NoWrap);
    // Plain text, and not line by line: what looks like markup is data, and so is an empty first line.
    const StringLines lines(data);
    lines.fill(edit);
    if (!run_editor(QCoreApplication::translate("ValuesView", "Edit Multi-String", "dialog title"), value_name, edit))
        return true;
    return model.setData(data_index, lines.strings_in(*edit.document()), Qt::DisplayRole);
}
