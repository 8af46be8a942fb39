// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "reg_value.h"

#include <array>

QString type_name(quint32 type) {
    static const std::array<QString, 12> names = {
        QStringLiteral("REG_NONE"),
        QStringLiteral("REG_SZ"),
        QStringLiteral("REG_EXPAND_SZ"),
        QStringLiteral("REG_BINARY"),
        QStringLiteral("REG_DWORD"),
        QStringLiteral("REG_DWORD_BIG_ENDIAN"),
        QStringLiteral("REG_LINK"),
        QStringLiteral("REG_MULTI_SZ"),
        QStringLiteral("REG_RESOURCE_LIST"),
        QStringLiteral("REG_FULL_RESOURCE_DESCRIPTOR"),
        QStringLiteral("REG_RESOURCE_REQUIREMENTS_LIST"),
        QStringLiteral("REG_QWORD"),
    };
    return type < names.size() ? names[type] : QString();
}

RegValue::RegValue(const QString& value_name, const QString& text, quint32 value_type)
    : name(value_name), data(text), type(value_type) {}

RegValue::RegValue(const QString& value_name, const QByteArray& bytes, quint32 value_type)
    : name(value_name), data(bytes), type(value_type) {}

RegValue::RegValue(const QString& value_name, uint number, int order)
    : name(value_name), data(number), type(order == little_endian_order ? REG_DWORD : REG_DWORD_BIG_ENDIAN) {}

RegValue::RegValue(const QString& value_name, qulonglong number) : name(value_name), data(number), type(REG_QWORD) {}

RegValue::RegValue(const QString& value_name, const QStringList& list)
    : name(value_name), data(list), type(REG_MULTI_SZ) {}
