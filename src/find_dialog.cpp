// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "find_dialog.h"

#include "compact_dialog.h"

#include <QCheckBox>
#include <QCoreApplication>
#include <QDialog>
#include <QDialogButtonBox>
#include <QLabel>
#include <QLineEdit>
#include <QProgressBar>
#include <QRadioButton>
#include <QVBoxLayout>

// The window's own texts: all are in its context.

bool ask_find_request(FindRequest& request) {
    QDialog dialog;
    dialog.setWindowTitle(QCoreApplication::translate("MainWindow", "Find", "dialog title"));
    auto* term_label = new QLabel(QCoreApplication::translate("MainWindow", "Search term:"));
    auto* term_edit = new QLineEdit(request.term);
    term_label->setBuddy(term_edit);
    auto* keys_box = new QCheckBox(QCoreApplication::translate("MainWindow", "Find keys"));
    keys_box->setChecked(request.mode.testFlag(RegModel::FindKeys));
    auto* values_box = new QCheckBox(QCoreApplication::translate("MainWindow", "Find values"));
    values_box->setChecked(request.mode.testFlag(RegModel::FindValues));
    // Children of the dialog from the start: only among siblings does checking one uncheck the others.
    auto* substring_button = new QRadioButton(QCoreApplication::translate("MainWindow", "Find substring"), &dialog);
    auto* whole_button = new QRadioButton(QCoreApplication::translate("MainWindow", "Find whole string"), &dialog);
    auto* wildcard_button = new QRadioButton(QCoreApplication::translate("MainWindow", "Use wildcards"), &dialog);
    substring_button->setChecked(true);
    if (request.flags == Qt::MatchFixedString)
        whole_button->setChecked(true);
    else if (request.flags == Qt::MatchWildcard)
        wildcard_button->setChecked(true);
    auto* buttons = new QDialogButtonBox(QDialogButtonBox::Ok | QDialogButtonBox::Cancel, Qt::Horizontal);
    QObject::connect(buttons, &QDialogButtonBox::accepted, &dialog, &QDialog::accept);
    QObject::connect(buttons, &QDialogButtonBox::rejected, &dialog, &QDialog::reject);

    QVBoxLayout layout(&dialog);
    for (QWidget* widget : std::initializer_list<QWidget*>{term_label, term_edit, keys_box, values_box,
                                                           substring_button, whole_button, wildcard_button, buttons}) {
        layout.addWidget(widget);
    }
    make_compact(dialog, *term_edit);
    if (dialog.exec() != QDialog::Accepted)
        return false;

    request.flags = whole_button->isChecked()      ? Qt::MatchFixedString
                    : wildcard_button->isChecked() ? Qt::MatchWildcard
                                                   : Qt::MatchContains;
    request.mode = {};
    request.mode.setFlag(RegModel::FindKeys, keys_box->isChecked());
    request.mode.setFlag(RegModel::FindValues, values_box->isChecked());
    request.term = term_edit->text();
    return true;
}

QDialog* make_searching_dialog(QWidget* parent) {
    auto* dialog = new QDialog(parent);
    dialog->setAttribute(Qt::WA_DeleteOnClose);
    // The comment lacks its closing parenthesis in the translations' files too, where a text is found by it.
    dialog->setWindowTitle(QCoreApplication::translate("MainWindow", "Find", "dialog title (search in progress"));
    dialog->setAccessibleName(QStringLiteral("Searching..."));
    auto* busy = new QProgressBar;
    busy->setRange(0, 0);
    auto* buttons = new QDialogButtonBox(QDialogButtonBox::Cancel, Qt::Horizontal);
    QObject::connect(buttons, &QDialogButtonBox::rejected, dialog, &QDialog::reject);
    auto* layout = new QVBoxLayout(dialog);
    layout->addWidget(new QLabel(QCoreApplication::translate("MainWindow", "Searching...")));
    layout->addWidget(busy);
    layout->addWidget(buttons);
    return dialog;
}
