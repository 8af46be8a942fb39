// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// One registry value as the models see it, and the table of value types.
#pragma once

#include <QByteArray>
#include <QMetaType>
#include <QString>
#include <QStringList>
#include <QVariant>

// Value types by the number that a hive stores. Any other number is carried as bytes.
enum RegType : quint32 {
    REG_NONE = 0,
    REG_SZ = 1,
    REG_EXPAND_SZ = 2,
    REG_BINARY = 3,
    REG_DWORD = 4,
    REG_DWORD_BIG_ENDIAN = 5,
    REG_LINK = 6,
    REG_MULTI_SZ = 7,
    REG_RESOURCE_LIST = 8,
    REG_FULL_RESOURCE_DESCRIPTOR = 9,
    REG_RESOURCE_REQUIREMENTS_LIST = 10,
    REG_QWORD = 11,
};

// Byte orders of a 32-bit number as it is stored: REG_DWORD and REG_DWORD_BIG_ENDIAN.
constexpr int little_endian_order = 1234;
constexpr int big_endian_order = 4321;

// The name of a type, null for one above REG_QWORD.
QString type_name(quint32 type);

// The data of the default value where a key has none. A type of its own, since a null variant never reaches
// QStyledItemDelegate::displayText.
struct ValueNotSet {};
Q_DECLARE_METATYPE(ValueNotSet)

// Whether a datum says that there is none. No other datum is of a type beyond the toolkit's own.
inline bool is_not_set(const QVariant& data) { return data.typeId() >= QMetaType::User; }

// A value with its data in the toolkit type that its registry type calls for.
struct RegValue {
    RegValue() = default;
    // Text: REG_SZ, REG_EXPAND_SZ and REG_LINK.
    RegValue(const QString& name, const QString& text, quint32 type);
    // Bytes of any other type.
    RegValue(const QString& name, const QByteArray& bytes, quint32 type);
    // A number of 32 bits, as the user sees it; little_endian_order makes it REG_DWORD, any other order
    // REG_DWORD_BIG_ENDIAN.
    RegValue(const QString& name, uint number, int order);
    // A number of 64 bits: REG_QWORD.
    RegValue(const QString& name, qulonglong number);
    // A list of texts: REG_MULTI_SZ.
    RegValue(const QString& name, const QStringList& list);

    QString name;  // empty for the unnamed (default) value
    QVariant data;
    quint32 type = REG_SZ;
};
