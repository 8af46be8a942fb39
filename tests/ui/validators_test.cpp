// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
// The decimal validators over their ranges, and the hexadecimal patterns of the number editors.

#include "edit_number_dialog.h"
#include "ui_test.h"
#include "validators.h"

#include <QLineEdit>
#include <QRadioButton>

#include <memory>

class ValidatorsTest : public QObject {
    Q_OBJECT

private slots:
    void uint_validator_data();
    void uint_validator();
    void uint64_validator_data();
    void uint64_validator();
    void the_field_refuses_what_does_not_fit_data();
    void the_field_refuses_what_does_not_fit();
};

void ValidatorsTest::uint_validator_data() {
    QTest::addColumn<quint32>("bottom");
    QTest::addColumn<quint32>("top");
    QTest::addColumn<QString>("input");
    QTest::addColumn<QValidator::State>("state");
    const quint32 top = 4294967295U;
    QTest::newRow("empty") << 0U << top << "" << QValidator::Intermediate;
    QTest::newRow("zero") << 0U << top << "0" << QValidator::Acceptable;
    QTest::newRow("leading zeros") << 0U << top << "00042" << QValidator::Acceptable;
    QTest::newRow("the largest") << 0U << top << "4294967295" << QValidator::Acceptable;
    QTest::newRow("one more than the largest") << 0U << top << "4294967296" << QValidator::Invalid;
    QTest::newRow("more than 64 bits") << 0U << top << "99999999999999999999999" << QValidator::Invalid;
    QTest::newRow("a sign") << 0U << top << "-1" << QValidator::Invalid;
    QTest::newRow("a plus") << 0U << top << "+1" << QValidator::Invalid;
    QTest::newRow("a blank") << 0U << top << " 1" << QValidator::Invalid;
    QTest::newRow("a letter") << 0U << top << "1f" << QValidator::Invalid;
    QTest::newRow("a point") << 0U << top << "1.0" << QValidator::Invalid;
    QTest::newRow("below the bottom") << 10U << 20U << "9" << QValidator::Intermediate;
    QTest::newRow("at the bottom") << 10U << 20U << "10" << QValidator::Acceptable;
    QTest::newRow("at the top") << 10U << 20U << "20" << QValidator::Acceptable;
    QTest::newRow("above the top") << 10U << 20U << "21" << QValidator::Invalid;
}

void ValidatorsTest::uint_validator() {
    QFETCH(quint32, bottom);
    QFETCH(quint32, top);
    QFETCH(QString, input);
    QFETCH(QValidator::State, state);
    const UintValidator validator(bottom, top);
    int position = 0;
    QString given = input;
    QCOMPARE(validator.validate(given, position), state);
    QCOMPARE(given, input);
}

void ValidatorsTest::uint64_validator_data() {
    QTest::addColumn<quint64>("bottom");
    QTest::addColumn<quint64>("top");
    QTest::addColumn<QString>("input");
    QTest::addColumn<QValidator::State>("state");
    const quint64 top = 18446744073709551615ULL;
    QTest::newRow("empty") << quint64(0) << top << "" << QValidator::Intermediate;
    QTest::newRow("zero") << quint64(0) << top << "0" << QValidator::Acceptable;
    QTest::newRow("more than 32 bits") << quint64(0) << top << "4294967296" << QValidator::Acceptable;
    QTest::newRow("the largest") << quint64(0) << top << "18446744073709551615" << QValidator::Acceptable;
    QTest::newRow("one more than the largest") << quint64(0) << top << "18446744073709551616" << QValidator::Invalid;
    QTest::newRow("a letter") << quint64(0) << top << "a" << QValidator::Invalid;
    QTest::newRow("below the bottom") << quint64(5000000000) << top << "4999999999" << QValidator::Intermediate;
    QTest::newRow("above the top") << quint64(0) << quint64(5000000000) << "5000000001" << QValidator::Invalid;
}

void ValidatorsTest::uint64_validator() {
    QFETCH(quint64, bottom);
    QFETCH(quint64, top);
    QFETCH(QString, input);
    QFETCH(QValidator::State, state);
    const Uint64Validator validator(bottom, top);
    int position = 0;
    QCOMPARE(validator.validate(input, position), state);
}

void ValidatorsTest::the_field_refuses_what_does_not_fit_data() {
    QTest::addColumn<int>("bits");
    QTest::addColumn<bool>("hexadecimal");
    QTest::addColumn<QString>("typed");
    QTest::addColumn<QString>("text");
    QTest::newRow("8 digits for 32 bits") << 32 << true << "DEADBEEF"
                                          << "DEADBEEF";
    QTest::newRow("the ninth digit") << 32 << true << "123456789"
                                     << "12345678";
    QTest::newRow("16 digits for 64 bits") << 64 << true << "0123456789abcDEF"
                                           << "0123456789abcDEF";
    QTest::newRow("the seventeenth digit") << 64 << true << "0123456789abcdef0"
                                           << "0123456789abcdef";
    QTest::newRow("a prefix") << 32 << true << "0x1g"
                              << "01";
    QTest::newRow("decimal takes no letters") << 32 << false << "1a2"
                                              << "12";
    QTest::newRow("the largest decimal") << 32 << false << "4294967295"
                                         << "4294967295";
    QTest::newRow("one more than it") << 32 << false << "4294967296"
                                      << "429496729";
    QTest::newRow("the largest decimal of 64 bits") << 64 << false << "18446744073709551615"
                                                    << "18446744073709551615";
    QTest::newRow("one more than that") << 64 << false << "18446744073709551616"
                                        << "1844674407370955161";
}

void ValidatorsTest::the_field_refuses_what_does_not_fit() {
    QFETCH(int, bits);
    QFETCH(bool, hexadecimal);
    QFETCH(QString, typed);
    QFETCH(QString, text);
    std::unique_ptr<EditNumberDialog> dialog;
    if (bits == 32)
        dialog = std::make_unique<EditDwordDialog>(QStringLiteral("n"));
    else
        dialog = std::make_unique<EditQwordDialog>(QStringLiteral("n"));
    if (!hexadecimal)
        find_by_text<QRadioButton>(*dialog, QStringLiteral("Decimal"))->setChecked(true);
    QLineEdit* field = nullptr;
    for (QLineEdit* edit : dialog->findChildren<QLineEdit*>()) {
        if (!edit->isReadOnly())
            field = edit;
    }
    QVERIFY(field);
    field->clear();
    QTest::keyClicks(field, typed);
    QCOMPARE(field->text(), text);
}

UI_TEST_MAIN(ValidatorsTest)
#include "validators_test.moc"
