// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "edit_number_dialog.h"

#include "compact_dialog.h"
#include "validators.h"

#include <QDialogButtonBox>
#include <QGroupBox>
#include <QHBoxLayout>
#include <QLabel>
#include <QLineEdit>
#include <QRadioButton>
#include <QRegularExpressionValidator>
#include <QVBoxLayout>

#include <limits>

namespace {

QValidator* make_hex_validator(int bits, QObject* parent) {
    const QString pattern =
        bits > 32 ? QStringLiteral("([a-f]|[A-F]|[0-9]){0,16}") : QStringLiteral("([a-f]|[A-F]|[0-9]){0,8}");
    return new QRegularExpressionValidator(QRegularExpression(pattern), parent);
}

QValidator* make_dec_validator(int bits, QObject* parent) {
    if (bits > 32)
        return new Uint64Validator(0, std::numeric_limits<quint64>::max(), parent);
    return new UintValidator(0, std::numeric_limits<quint32>::max(), parent);
}

}  // namespace

EditNumberDialog::EditNumberDialog(const QString& value_name, int bits)
    : data_edit(new QLineEdit), hex_button(new QRadioButton(tr("Hexadecimal"))),
      hex_validator(make_hex_validator(bits, this)), dec_validator(make_dec_validator(bits, this)) {
    auto* name_edit = new QLineEdit(value_name);
    name_edit->setReadOnly(true);
    auto* name_label = new QLabel(tr("Value name:"));
    name_label->setBuddy(name_edit);
    hex_button->setChecked(true);
    connect(hex_button, &QRadioButton::toggled, this, &EditNumberDialog::mode_changed);
    data_edit->setValidator(hex_validator);
    take_back_invalid_text(*data_edit);
    auto* buttons = new QDialogButtonBox(QDialogButtonBox::Ok | QDialogButtonBox::Cancel, Qt::Horizontal);
    connect(buttons, &QDialogButtonBox::accepted, this, &EditNumberDialog::accept);
    connect(buttons, &QDialogButtonBox::rejected, this, &EditNumberDialog::reject);

    auto* outer = new QVBoxLayout(this);
    outer->addWidget(name_label);
    outer->addWidget(name_edit);
    outer->addLayout(make_data_row());
    outer->addWidget(buttons);
    make_compact(*this, *data_edit);
}

QLayout* EditNumberDialog::make_data_row() {
    auto* data_label = new QLabel(tr("Value data:"));
    data_label->setBuddy(data_edit);
    auto* data_column = new QVBoxLayout;
    data_column->addWidget(data_label);
    data_column->addWidget(data_edit);
    data_column->addStretch();

    auto* base_group = new QGroupBox(tr("Base"));
    auto* base_column = new QVBoxLayout(base_group);
    base_column->addWidget(hex_button);
    base_column->addWidget(new QRadioButton(tr("Decimal")));

    auto* row = new QHBoxLayout;
    row->addLayout(data_column);
    row->addWidget(base_group);
    return row;
}

bool EditNumberDialog::is_hexadecimal() const { return hex_button->isChecked(); }

void EditNumberDialog::mode_changed(bool hex) {
    data_edit->setValidator(hex ? hex_validator : dec_validator);
    if (hex)
        convert_text(10, 16);
    else
        convert_text(16, 10);
}

EditDwordDialog::EditDwordDialog(const QString& value_name) : EditNumberDialog(value_name, 32) {}

void EditDwordDialog::set_value(quint32 number) { data_edit->setText(QString::number(number, 16)); }

quint32 EditDwordDialog::value() const { return data_edit->text().toUInt(nullptr, base()); }

void EditDwordDialog::convert_text(int from_base, int to_base) {
    if (to_base == 16 || to_base == 10)
        data_edit->setText(QString::number(data_edit->text().toUInt(nullptr, from_base), to_base));
}

EditQwordDialog::EditQwordDialog(const QString& value_name) : EditNumberDialog(value_name, 64) {}

void EditQwordDialog::set_value(quint64 number) { data_edit->setText(QString::number(number, 16)); }

quint64 EditQwordDialog::value() const { return data_edit->text().toULongLong(nullptr, base()); }

void EditQwordDialog::convert_text(int from_base, int to_base) {
    if (to_base == 16 || to_base == 10)
        data_edit->setText(QString::number(data_edit->text().toULongLong(nullptr, from_base), to_base));
}
