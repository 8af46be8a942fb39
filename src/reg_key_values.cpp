// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// The values of a key: stored bytes to toolkit values and back.

#include "reg_hive.h"
#include "reg_key.h"
#include "stored_text.h"

#include <QtEndian>

#include <tallowfen/registry.h>

#include <array>
#include <charconv>
#include <cstring>
#include <set>
#include <stdexcept>

namespace {

constexpr int longest_value_name = 16383;  // characters, as Windows has it

struct ValueRecord {
    QString name;
    uint32_t type;
    uint32_t data_size;  // bytes, as stored
};

// What a value's record says without its data. std::invalid_argument("index"): there is none, or it cannot be read.
ValueRecord read_record(RegistryKey* handle, int index) {
    QByteArray buffer(256, '\0');
    uint32_t size = 256;
    ValueRecord found = {};
    const auto ask = [&] {
        return REnumValueW(handle, static_cast<uint32_t>(index), reinterpret_cast<uint16_t*>(buffer.data()), &size,
                           &found.type, nullptr, &found.data_size);
    };
    int32_t status = index < 0 ? int32_t{R_NO_MORE_ITEMS} : ask();
    if (status == R_BUFFER_OVERFLOW) {
        size *= 2;  // bytes; what was handed back is enough already
        buffer.resize(static_cast<qsizetype>(size));
        status = ask();
    }
    if (status != R_SUCCESS)
        throw std::invalid_argument("index");
    found.name = QString(reinterpret_cast<const QChar*>(buffer.constData()), static_cast<qsizetype>(size / 2));
    return found;
}

constexpr QLatin1String new_value_prefix("New Value #");

// The numbers behind the prefix in the names of the first count values, as far as those can be read.
std::set<int> new_value_numbers(RegistryKey* handle, int count) {
    constexpr qsizetype most_digits = 10;
    std::set<int> numbers;
    for (int i = 0; i < count; i++) {
        std::array<uint16_t, new_value_prefix.size() + most_digits + 1> buffer;
        auto size = static_cast<uint32_t>(sizeof buffer);
        if (REnumValueW(handle, static_cast<uint32_t>(i), buffer.data(), &size, nullptr, nullptr, nullptr) != R_SUCCESS)
            continue;  // a longer name among others
        const QStringView name(reinterpret_cast<const QChar*>(buffer.data()), static_cast<qsizetype>(size / 2));
        if (!name.startsWith(new_value_prefix, Qt::CaseInsensitive))
            continue;
        int number = 0;
        const QByteArray digits = name.mid(new_value_prefix.size()).toLatin1();
        if (std::from_chars(digits.begin(), digits.end(), number).ptr == digits.end() && !digits.startsWith('0'))
            numbers.insert(number);
    }
    return numbers;
}

// The data as stored. false when it cannot be read, or is said to be longer than the file.
bool read_bytes(RegHive* hive, RegistryKey* handle, int index, uint32_t size, QByteArray& bytes) {
    if (size > hive->file_size())
        return false;
    bytes.resize(static_cast<qsizetype>(size));
    char nothing = 0;
    void* buffer = size > 0 ? bytes.data() : &nothing;
    return REnumValueW(handle, static_cast<uint32_t>(index), nullptr, nullptr, nullptr, buffer, &size) == R_SUCCESS;
}

// A number of at most sizeof(T) bytes; missing ones read as zero.
template <typename T>
bool read_number(RegistryKey* handle, int index, T& number) {
    uint32_t size = sizeof number;
    std::array<uchar, sizeof number> bytes = {};
    if (REnumValueW(handle, static_cast<uint32_t>(index), nullptr, nullptr, nullptr, bytes.data(), &size) != R_SUCCESS)
        return false;
    number = qFromLittleEndian<T>(bytes.data());
    return true;
}

// All characters that the bytes hold; an odd last byte is none.
QString decode(const QByteArray& bytes) {
    QString text(bytes.size() / 2, Qt::Uninitialized);
    // At once: a long text is read as fast as it is copied.
    qFromLittleEndian<char16_t>(bytes.constData(), text.size(), text.data());
    return text;
}

// The characters before the first zero.
QString decode_string(const QByteArray& bytes) {
    QString text = decode(bytes);
    const qsizetype zero = text.indexOf(QChar(u'\0'));
    if (zero >= 0)
        text.truncate(zero);
    return text;
}

QStringList split_multi_string(const QByteArray& bytes) {
    const QString text = decode(bytes);
    QStringList list;
    for (qsizetype from = 0; from < text.size();) {
        const qsizetype zero = text.indexOf(QChar(u'\0'), from);
        const qsizetype end = zero >= 0 ? zero : text.size();
        list.append(text.mid(from, end - from));
        from = end + 1;
    }
    if (!list.isEmpty() && list.last().isEmpty())
        list.removeLast();
    return list;
}

// UTF-16 as it is stored, with a zero unit behind it.
QByteArray encode(const QString& text) {
    QByteArray bytes(text.size() * 2 + 2, '\0');
    for (qsizetype i = 0; i < text.size(); i++)
        qToLittleEndian(text[i].unicode(), bytes.data() + 2 * i);
    return bytes;
}

bool is_text(uint type) { return type == REG_SZ || type == REG_EXPAND_SZ || type == REG_LINK; }

// The 8-bit name that leads to the value at an index and to no other; null when none does.
QByteArray name_leading_to(RegistryKey* handle, int index) {
    constexpr uint32_t room = 512;
    // One byte more than the engine is told of, preset to zero: a name that fills its room comes without a terminator.
    QByteArray name(room + 1, '\0');
    uint32_t size = room;
    const auto position = static_cast<uint32_t>(index);
    if (REnumValueA(handle, position, name.data(), &size, nullptr, nullptr, nullptr) != R_SUCCESS)
        return QByteArray();
    if (size >= room) {  // cut, or without a terminator
        name = QByteArray(static_cast<qsizetype>(size) + 2, '\0');
        size++;
        if (REnumValueA(handle, position, name.data(), &size, nullptr, nullptr, nullptr) != R_SUCCESS)
            return QByteArray();
    }
    if (RFindValueA(handle, name.constData()) == index)
        return QByteArray(name.constData());
    // A name that is stored in UTF-16, though 8 bits could carry it.
    const StoredText text = stored_text(read_record(handle, index).name);
    return text.fits && RFindValueA(handle, text.bytes.constData()) == index ? text.bytes : QByteArray();
}

// Whether no value of the key has this name, and every record could be asked for its own.
bool is_surely_free(RegistryKey* handle, const char* name) {
    if (RQueryValueExA(handle, name, nullptr, nullptr, nullptr) == R_FILE_NOT_FOUND)
        return true;
    // One whose name goes on behind a zero is found only where every record was read and none has just this name.
    const int32_t position = RFindValueA(handle, name);
    uint32_t size = 0;  // bytes, two a character and two more
    return position >= 0 &&
           REnumValueW(handle, static_cast<uint32_t>(position), nullptr, &size, nullptr, nullptr, nullptr) ==
               R_SUCCESS &&
           size / 2 - 1 > std::strlen(name);
}

}  // namespace

RegValue RegKey::read_value_without_data(int index) {
    const RegHive::Dialogue dialogue(hive_);
    const ValueRecord found = read_record(hive_->key_handle(this), index);
    RegValue value;
    value.name = found.name;
    value.type = found.type;
    return value;
}

std::optional<QString> RegKey::value_name(int index) {
    const RegHive::Dialogue dialogue(hive_);
    RegistryKey* handle = hive_->key_handle(this);
    try {
        return read_record(handle, index).name;
    } catch (const std::invalid_argument&) {
        return std::nullopt;
    }
}

std::unique_ptr<RegValue> RegKey::read_value(int index) {
    const RegHive::Dialogue dialogue(hive_);
    RegistryKey* handle = hive_->key_handle(this);
    const ValueRecord found = read_record(handle, index);
    if (found.type == REG_DWORD || found.type == REG_DWORD_BIG_ENDIAN) {
        uint number = 0;
        if (!read_number(handle, index, number))
            return nullptr;
        if (found.type == REG_DWORD)
            return std::make_unique<RegValue>(found.name, number, little_endian_order);
        return std::make_unique<RegValue>(found.name, qbswap(number), big_endian_order);
    }
    if (found.type == REG_QWORD) {
        qulonglong number = 0;
        if (!read_number(handle, index, number))
            return nullptr;
        return std::make_unique<RegValue>(found.name, number);
    }
    QByteArray bytes;
    if (!read_bytes(hive_, handle, index, found.data_size, bytes))
        return nullptr;
    if (is_text(found.type))
        return std::make_unique<RegValue>(found.name, decode_string(bytes), found.type);
    if (found.type == REG_MULTI_SZ)
        return std::make_unique<RegValue>(found.name, split_multi_string(bytes));
    return std::make_unique<RegValue>(found.name, bytes, found.type);
}

bool RegKey::store_value(const QString& name, uint type, const QByteArray& data, int index) {
    const StoredText stored = stored_text(name);
    // A longer name that is there already stays usable.
    if (!stored.fits || (index < 0 && stored.bytes.size() > longest_value_name))
        return false;
    const RegHive::Dialogue dialogue(hive_);
    RegistryKey* handle = hive_->key_handle(this);
    // Only the value at the index is meant: a name that leads to another one writes nothing.
    if (index >= 0 && RFindValueA(handle, stored.bytes.constData()) != index)
        return false;
    // A record that cannot be read now may have the very name, and be there to be overwritten a moment later.
    if (index == new_value && !is_surely_free(handle, stored.bytes.constData()))
        return false;
    const int32_t status =
        RSetValueExW(handle, stored.bytes.constData(), type, data.constData(), static_cast<uint32_t>(data.size()));
    hive_->forget_other_handles(this);
    return status == R_SUCCESS;
}

bool RegKey::set_string_value(const QString& name, const QString& text, uint type, int index) {
    return store_value(name, type, encode(text), index);
}

bool RegKey::set_binary_value(const QString& name, const QByteArray& bytes, uint type, int index) {
    return store_value(name, type, bytes, index);
}

bool RegKey::set_dword_value(const QString& name, uint value, int order, int index) {
    const bool swapped = order == big_endian_order;
    QByteArray bytes(4, '\0');
    qToLittleEndian(swapped ? qbswap(value) : value, bytes.data());
    return store_value(name, swapped ? REG_DWORD_BIG_ENDIAN : REG_DWORD, bytes, index);
}

bool RegKey::set_qword_value(const QString& name, qulonglong value, int index) {
    QByteArray bytes(8, '\0');
    qToLittleEndian(value, bytes.data());
    return store_value(name, REG_QWORD, bytes, index);
}

bool RegKey::set_multi_string_value(const QString& name, const QStringList& list, int index) {
    QStringList kept = list;
    kept.removeAll(QString());  // an empty string would read as the list's end
    return store_value(name, REG_MULTI_SZ, encode(kept.join(QChar(u'\0')) + QChar(u'\0')), index);
}

bool RegKey::delete_value(int index) {
    const RegHive::Dialogue dialogue(hive_);
    RegistryKey* handle = hive_->key_handle(this);
    if (index < 0)
        return false;
    const QByteArray name = name_leading_to(handle, index);
    if (name.isNull())
        return false;
    const int32_t status = RDeleteValue(handle, name.constData());
    hive_->forget_other_handles(this);
    return status == R_SUCCESS;
}

bool RegKey::can_delete_value(int index) {
    const RegHive::Dialogue dialogue(hive_);
    return index >= 0 && !name_leading_to(hive_->key_handle(this), index).isNull();
}

// The engine has no rename of values: the value is stored again under the new name, which puts it at the end of the
// list, so that the old index still means the old value, which is then deleted.
bool RegKey::rename_value(int index, const QString& new_name) {
    const StoredText stored = stored_text(new_name);
    if (new_name.size() > longest_value_name || new_name.isEmpty() || !stored.fits || index < 0)
        return false;
    const RegHive::Dialogue dialogue(hive_);
    RegistryKey* handle = hive_->key_handle(this);
    // Stricter than store_value: a name that another one goes on behind a zero after is refused as well.
    if (RQueryValueExA(handle, stored.bytes.constData(), nullptr, nullptr, nullptr) != R_FILE_NOT_FOUND ||
        name_leading_to(handle, index).isNull() || read_value(index) == nullptr)
        return false;
    // The bytes go over as they are stored: a record cannot carry text behind a zero, an odd size or a short number.
    const ValueRecord old = read_record(handle, index);
    QByteArray bytes;
    return read_bytes(hive_, handle, index, old.data_size, bytes) &&
           store_value(new_name, old.type, bytes, new_value) && delete_value(index);
}

// Names of the form that new ones get are read in one go, since to ask the engine for each takes a walk over all names.
// It is asked for the first that was not met: a record that cannot be read, say, may have the name.
QString RegKey::new_value_name() {
    const RegHive::Dialogue dialogue(hive_);
    RegistryKey* handle = hive_->key_handle(this);
    const std::set<int> taken = new_value_numbers(handle, value_count());
    for (int i = 1;; i++) {
        if (taken.count(i) != 0)
            continue;
        QString name = new_value_prefix + QString::number(i);
        const int32_t status = RQueryValueExA(handle, name.toLatin1().constData(), nullptr, nullptr, nullptr);
        if (status == R_FILE_NOT_FOUND)
            return name;
        if (status != R_SUCCESS)
            return QString();
    }
}
