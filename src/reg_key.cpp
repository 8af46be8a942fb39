// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "reg_key.h"

#include "reg_hive.h"
#include "stored_text.h"

#include <QtEndian>

#include <tallowfen/registry.h>

#include <algorithm>
#include <array>
#include <cstdio>
#include <cstring>
#include <stdexcept>

namespace {

constexpr int longest_new_name = 255;         // characters, as Windows has it
constexpr uint32_t longest_shown_name = 512;  // characters; a key with a longer one counts as unreadable

// One byte more than the engine is told of, preset to zero: a name that fills the buffer comes without a terminator.
using NameBuffer = std::array<char, 513>;
constexpr uint32_t name_room = NameBuffer().size() - 1;

// `size` receives the name's length in bytes.
int32_t subkey_name(RegistryKey* handle, uint32_t index, NameBuffer& name, uint32_t& size) {
    name.fill('\0');
    size = name_room;
    return REnumKeyInfoA(handle, index, name.data(), &size, nullptr, nullptr, nullptr, nullptr);
}

uint32_t subkey_count(RegistryKey* handle) {
    uint32_t count = 0;
    if (RQueryInfoKeyW(handle, nullptr, nullptr, nullptr, nullptr, &count, nullptr, nullptr, nullptr, nullptr, nullptr,
                       nullptr, nullptr) != R_SUCCESS)
        throw std::runtime_error("RQueryInfoKeyW failed");
    return count;
}

// Where the index-th subkey lies; UINT32_MAX when it cannot be opened.
uint32_t subkey_offset(RegistryKey* handle, int index) {
    RegistryKey* subkey = nullptr;
    if (ROpenSubKey(handle, static_cast<uint32_t>(index), &subkey) != R_SUCCESS)
        return UINT32_MAX;
    const uint32_t offset = RKeyOffset(subkey);
    RCloseKey(subkey);
    return offset;
}

// The position that the engine's own look-up finds a name at, -1 when it finds none.
int position_by_path(RegistryKey* handle, const char* name) {
    RegistryKey* found = nullptr;
    uint32_t position = 0;
    const int32_t status = ROpenKeyEx(handle, name, &found, &position);
    if (found != nullptr)
        RCloseKey(found);
    return status == R_SUCCESS ? static_cast<int>(position) : -1;
}

}  // namespace

AbstractRegKey::~AbstractRegKey() = default;

AbstractRegKey* AbstractRegKey::child(int i) { return laid_out()[static_cast<size_t>(i)]; }

std::vector<AbstractRegKey*>& AbstractRegKey::laid_out() {
    children_.resize(slot_count_, nullptr);
    return children_;
}

std::unique_lock<std::recursive_mutex> AbstractRegKey::lock_children() const {
    std::recursive_mutex* const lock = children_lock();
    return lock != nullptr ? std::unique_lock(*lock) : std::unique_lock<std::recursive_mutex>();
}

int AbstractRegKey::child_count() const {
    const auto locker = lock_children();
    return static_cast<int>(slot_count_);
}

int AbstractRegKey::child_number() const {
    if (parent_ == nullptr)
        return 0;
    const auto locker = parent_->lock_children();
    const auto& siblings = parent_->children_;
    // Views ask for this over and over; a key with 50,000 siblings is not to be searched for each time.
    const size_t hint = number_hint_;
    if (hint < siblings.size() && siblings[hint] == this)
        return static_cast<int>(hint);
    const auto found = std::find(siblings.begin(), siblings.end(), this);
    if (found == siblings.end())
        return -1;
    const auto number = static_cast<int>(found - siblings.begin());
    number_hint_ = static_cast<size_t>(number);
    return number;
}

void AbstractRegKey::add_child(AbstractRegKey* key) {
    const auto locker = lock_children();
    laid_out().push_back(key);
    slot_count_++;
}

RegKey::RegKey(RegHive* hive, AbstractRegKey* parent) : AbstractRegKey(parent), hive_(hive) {}

RegKey::RegKey(RegHive* hive, AbstractRegKey* parent, int child_number) : AbstractRegKey(parent), hive_(hive) {
    if (parent == nullptr)
        throw std::invalid_argument("parent");
    if (child_number < 0)
        throw std::invalid_argument("child_number");
    const RegHive::Dialogue dialogue(hive_);
    try {
        refresh_children(hive_->open_child_handle(this, static_cast<RegKey*>(parent), child_number));
    } catch (...) {
        // The destructor will not run, and the cache must not know an object that never was.
        hive_->forget_handle(this);
        throw;
    }
}

RegKey::~RegKey() {
    for (AbstractRegKey* child : children_)
        delete child;
    hive_->forget_handle(this);
}

std::recursive_mutex* RegKey::children_lock() const { return hive_->api_mutex(); }

AbstractRegKey* RegKey::child(int i) {
    const RegHive::Dialogue dialogue(hive_);
    if (static_cast<size_t>(i) >= slot_count_ || i < 0)
        throw std::out_of_range("vector::_M_range_check");
    AbstractRegKey*& slot = laid_out()[static_cast<size_t>(i)];
    if (slot == nullptr) {
        auto made = std::make_unique<RegKey>(hive_, this, i);
        made->set_number_hint(static_cast<size_t>(i));
        slot = made.release();
    }
    return slot;
}

AbstractRegKey* RegKey::shown_child(int i) {
    const RegHive::Dialogue dialogue(hive_);
    try {
        return child(i);
    } catch (const std::runtime_error&) {
        auto unopened = std::make_unique<RegKey>(hive_, this);
        unopened->set_number_hint(static_cast<size_t>(i));
        unopened->stands_in_ = true;
        AbstractRegKey*& slot = children_[static_cast<size_t>(i)];
        slot = unopened.release();
        return slot;
    }
}

bool RegKey::is_below_itself() const {
    const RegHive::Dialogue dialogue(hive_);
    if (offset_ == UINT32_MAX)
        return false;
    for (const RegKey* key = this; key != hive_->root_key();) {
        key = static_cast<const RegKey*>(key->parent());
        if (key->offset_ == offset_)
            return true;
    }
    return false;
}

QString RegKey::name() {
    const RegHive::Dialogue dialogue(hive_);
    RegistryKey* handle = hive_->key_handle(this);
    std::array<uint16_t, longest_shown_name> buffer;
    auto size = static_cast<uint32_t>(sizeof buffer);
    if (RQueryInfoKeyW(handle, buffer.data(), &size, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr,
                       nullptr, nullptr, nullptr) != R_SUCCESS)
        throw std::runtime_error("RQueryInfoKeyW failed");
    // The engine names no key that is a symbolic link; its parent's list does, and a row needs a name.
    if (size == 0 && this != hive_->root_key())
        return listed_name();
    return QString(reinterpret_cast<const QChar*>(buffer.data()), static_cast<qsizetype>(size / 2));
}

QString RegKey::listed_name() {
    RegistryKey* parent = hive_->key_handle(static_cast<RegKey*>(parent_));
    const int position = child_number();
    if (subkey_offset(parent, position) != offset_)  // what stands there now is another key
        throw std::runtime_error("RQueryInfoKeyW failed");
    std::array<char, 2 * longest_shown_name + 1> listed;
    auto size = static_cast<uint32_t>(listed.size());
    const int32_t status = REnumKeyInfoA(parent, static_cast<uint32_t>(position), listed.data(), &size, nullptr,
                                         nullptr, nullptr, nullptr);
    if (status == R_SUCCESS && size <= longest_shown_name)
        return QString::fromLatin1(listed.data(), static_cast<qsizetype>(size));
    if (status != R_INVALID_NAME || size > 2 * longest_shown_name)
        throw std::runtime_error("RQueryInfoKeyW failed");
    QString wide(static_cast<qsizetype>(size / 2), Qt::Uninitialized);  // handed out as stored, in UTF-16
    qFromLittleEndian<char16_t>(listed.data(), wide.size(), wide.data());
    return wide;
}

void RegKey::refresh_children(RegistryKey* handle) {
    slot_count_ = subkey_count(handle);
    if (!children_.empty())
        laid_out();
    learn_offset(RKeyOffset(handle));
}

void RegKey::learn_offset(uint32_t offset) {
    offset_ = offset;
    freed_before_ = hive_->times_freed_;
}

bool RegKey::slots_agree(RegistryKey* handle) const { return slot_count_ == subkey_count(handle); }

void RegKey::reload() {
    const RegHive::Dialogue dialogue(hive_);
    hive_->forget_handle(this);  // it does not see what came about through another one
    refresh_children(hive_->key_handle(this));
}

int RegKey::value_count() {
    const RegHive::Dialogue dialogue(hive_);
    uint32_t count = 0;
    if (RQueryInfoKeyW(hive_->key_handle(this), nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, &count,
                       nullptr, nullptr, nullptr, nullptr) != R_SUCCESS)
        throw std::runtime_error("RQueryInfoKeyW failed");
    const auto values = static_cast<int32_t>(count);
    if (values < 0) {
        char text[64];
        // "keys", though it counts values: one text for any count that is beyond belief.
        std::snprintf(text, sizeof text, "RQueryInfoKeyW claimed there are %li keys", static_cast<long>(values));
        throw std::runtime_error(text);
    }
    return values;
}

int RegKey::default_value_position() {
    const RegHive::Dialogue dialogue(hive_);
    RegistryKey* handle = hive_->key_handle(this);
    std::array<uint16_t, 512> name;
    for (uint32_t i = 0;; i++) {
        uint32_t size = 0;
        const auto ask = [&] {
            size = static_cast<uint32_t>(sizeof name);
            return REnumValueW(handle, i, name.data(), &size, nullptr, nullptr, nullptr);
        };
        int32_t status = ask();
        if (status == R_FAILED)  // it may be the one: a failed read that passes is over the second time
            status = ask();
        if (status == R_NO_MORE_ITEMS)
            return -1;
        if (size < sizeof name[0])  // an odd last byte is no character
            return static_cast<int>(i);
    }
}

// The position of the subkey of that name, one that has no slot yet included. Where neither this search nor the
// engine's finds it: -1 if the search came upon what is no name, -2 if it ended.
int RegKey::find_child_position(RegistryKey* handle, const QByteArray& name) {
    int result = -2;
    size_t low = 0;
    // The number of slots, not one less: a key that was just made has no slot yet.
    size_t high = slot_count_;
    while (low <= high) {
        const size_t middle = low + (high - low) / 2;
        NameBuffer listed;
        uint32_t length = 0;
        if (subkey_name(handle, static_cast<uint32_t>(middle), listed, length) != R_SUCCESS) {
            result = -1;
            break;
        }
        const int order = qstricmp(name.constData(), listed.data());
        if (order == 0) {
            // A stored name may go on behind a zero, and is another one then; zeros at its end do not count.
            while (length > 0 && listed[length - 1] == '\0')
                length--;
            if (length == static_cast<uint32_t>(name.size()))
                return static_cast<int>(middle);
            break;
        }
        if (order > 0)
            low = middle + 1;
        else if (middle == 0)
            break;
        else
            high = middle - 1;
    }
    // Lists are in upper-cased order, which this search is not quite in; the engine finds what is there.
    const int position = position_by_path(handle, name.constData());
    return position >= 0 ? position : result;
}

// Whether the subkey at an index is the one that the slot's object shows. Where a damaged hive lists a key below
// itself, two objects stand for one key, and what is made through the one moves what the other shows.
bool RegKey::is_shown_at(RegistryKey* handle, int index) const {
    if (index < 0 || static_cast<size_t>(index) >= slot_count_)
        return false;
    const auto* shown = children_.empty() ? nullptr : static_cast<const RegKey*>(children_[static_cast<size_t>(index)]);
    if (shown == nullptr || shown->offset_ == UINT32_MAX)
        return true;  // nothing was shown
    return subkey_offset(handle, index) == shown->offset_ && !hive_->has_left(shown);
}

int RegKey::new_key() {
    const RegHive::Dialogue dialogue(hive_);
    RegistryKey* handle = hive_->key_handle(this);
    // A key that could not be opened when it was first shown has no slots for what it turns out to hold.
    if (!slots_agree(handle))
        return -1;
    char name[32];
    for (int i = 1;; i++) {
        std::snprintf(name, sizeof name, "New Key #%i", i);
        RegistryKey* made = nullptr;
        uint32_t existed = 1;
        const int32_t status = RCreateKey(handle, name, &made, &existed);
        if (made != nullptr)
            RCloseKey(made);
        // A key that was made but could not be read back is there all the same, and so is one whose last write failed
        // and could not be taken back.
        if (existed == 0 || (status != R_SUCCESS && subkey_count(handle) == slot_count_ + 1))
            break;
        if (status != R_SUCCESS)
            return -1;
    }
    hive_->forget_other_handles(this);
    const int position = find_child_position(handle, name);
    if (position < 0) {
        // What cannot be shown must not be there.
        RDeleteKey(handle, name);
        return position;
    }
    slot_count_ = std::max(slot_count_, static_cast<size_t>(position));  // made through another object, see is_shown_at
    laid_out().insert(children_.begin() + position, nullptr);
    slot_count_++;
    try {
        child(position);
    } catch (const std::runtime_error&) {
        // The key is there, so it gets its row; it is tried again when that is shown.
    }
    return position;
}

bool RegKey::delete_key(int index) {
    const RegHive::Dialogue dialogue(hive_);
    RegistryKey* handle = hive_->key_handle(this);
    NameBuffer name = {};
    uint32_t size = name_room;
    // Only the key at this position is meant: a name that leads to another one deletes nothing. One with a backslash
    // is no name to the engine, but a path.
    if (!is_shown_at(handle, index) || !slots_agree(handle) ||
        REnumKeyExA(handle, static_cast<uint32_t>(index), name.data(), &size, nullptr, nullptr, nullptr) != R_SUCCESS ||
        std::strchr(name.data(), '\\') != nullptr || position_by_path(handle, name.data()) != index)
        return false;
    const uint32_t offset = subkey_offset(handle, index);
    if (offset == UINT32_MAX)
        return false;  // the cell that becomes free could not be noted
    const bool is_deleted = RDeleteKey(handle, name.data()) == R_SUCCESS;
    // Where a damaged hive lists the key, or keys below it, in other places too, handles from there would go on leading
    // to cells that become other keys'.
    hive_->clear_handle_cache();
    // One that failed may have gone as far as the list.
    if (!is_deleted && !lists_one_less())
        return false;
    hive_->note_freed(offset);
    const auto slot = laid_out().begin() + index;
    const std::unique_ptr<AbstractRegKey> gone(*slot);
    children_.erase(slot);
    slot_count_--;
    return true;
}

bool RegKey::lists_one_less() const {
    try {
        return subkey_count(hive_->key_handle(this)) + 1 == slot_count_;
    } catch (const std::runtime_error&) {
        return false;
    }
}

bool RegKey::can_delete_tree(int index) {
    const RegHive::Dialogue dialogue(hive_);
    RegistryKey* handle = hive_->key_handle(this);
    return index >= 0 && slots_agree(handle) && is_shown_at(handle, index) &&
           RCheckDeleteTree(handle, static_cast<uint32_t>(index)) == R_SUCCESS && agrees_below(index);
}

// Whether the objects that there are for a subkey and the keys below it show what the engine lists there. Where a
// damaged hive lists one key twice, what was done through one object is not what another one shows.
bool RegKey::agrees_below(int index) {
    const auto position = static_cast<size_t>(index);
    auto* key = position < children_.size() ? static_cast<RegKey*>(children_[position]) : nullptr;
    if (key == nullptr)
        return true;
    RegistryKey* handle = hive_->key_handle(key);
    if (!key->slots_agree(handle))
        return false;
    for (int i = 0; i < static_cast<int>(key->children_.size()); i++) {
        // The handle may have been evicted for those below.
        if (!key->is_shown_at(hive_->key_handle(key), i) || !key->agrees_below(i))
            return false;
    }
    return true;
}

int RegKey::rename_key(int index, const QString& new_name) {
    if (new_name.size() > longest_new_name)
        return -3;
    const StoredText name = stored_text(new_name);
    if (!name.fits || name.bytes.isEmpty() || name.bytes.contains('\\') || index < 0)
        return -1;
    const RegHive::Dialogue dialogue(hive_);
    // The key gets another record and the list another order: handles from before are of no use.
    hive_->clear_handle_cache();
    RegistryKey* handle = hive_->key_handle(this);
    const uint32_t old_offset = subkey_offset(handle, index);
    if (old_offset == UINT32_MAX || !slots_agree(handle) || !is_shown_at(handle, index) ||
        RRenameKey(handle, static_cast<uint32_t>(index), name.bytes.constData()) != R_SUCCESS)
        return -1;
    hive_->note_freed(old_offset);
    const int position = move_slot(handle, index, name.bytes);
    // Where a damaged hive lists the key above itself too, the handle from there would go on leading to its old cell.
    hive_->clear_handle_cache();
    return position;
}

int RegKey::move_slot(RegistryKey* handle, int index, const QByteArray& name) {
    // The key has its new name, so what follows is tried once more where a read fails.
    int position = find_child_position(handle, name);
    if (position < 0)
        position = find_child_position(handle, name);
    if (position < 0)
        return -2;
    AbstractRegKey* renamed = laid_out()[static_cast<size_t>(index)];
    uint32_t offset = subkey_offset(handle, position);
    if (offset == UINT32_MAX)
        offset = subkey_offset(handle, position);
    // Else the old one stays, whose cell the key has left: its object is taken for no other key's.
    if (renamed != nullptr && offset != UINT32_MAX)
        static_cast<RegKey*>(renamed)->learn_offset(offset);
    children_.erase(children_.begin() + index);
    children_.insert(children_.begin() + position, renamed);
    return position;
}
