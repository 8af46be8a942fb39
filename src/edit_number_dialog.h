// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// The modal editors for 32-bit and 64-bit numbers, in hexadecimal or decimal.
#pragma once

#include <QDialog>

class QLineEdit;
class QRadioButton;
class QValidator;

class EditNumberDialog : public QDialog {
    Q_OBJECT
    Q_PROPERTY(bool is_hexadecimal READ is_hexadecimal)

public:
    // `bits` is 32 or 64; anything above 32 selects the 64-bit rules.
    EditNumberDialog(const QString& value_name, int bits);

    bool is_hexadecimal() const;

public slots:
    void mode_changed(bool hex);

protected:
    // Rewrites the text, a number in `from_base`, in `to_base` (10 or 16; any other leaves it). An empty or
    // unparsable text counts as 0.
    virtual void convert_text(int from_base, int to_base) = 0;

    int base() const { return is_hexadecimal() ? 16 : 10; }

    QLineEdit* data_edit;

private:
    QLayout* make_data_row();

    QRadioButton* hex_button;
    QValidator* hex_validator;
    QValidator* dec_validator;
};

class EditDwordDialog : public EditNumberDialog {
    Q_OBJECT

public:
    explicit EditDwordDialog(const QString& value_name);

    void set_value(quint32 number);
    quint32 value() const;

protected:
    void convert_text(int from_base, int to_base) override;
};

class EditQwordDialog : public EditNumberDialog {
    Q_OBJECT

public:
    explicit EditQwordDialog(const QString& value_name);

    void set_value(quint64 number);
    quint64 value() const;

protected:
    void convert_text(int from_base, int to_base) override;
};
