// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// The keys that the tree shows: nodes of a hive, and the named groups above the hives.
#pragma once

#include "reg_value.h"

#include <QString>

#include <atomic>
#include <memory>
#include <mutex>
#include <optional>
#include <vector>

class RegHive;
struct RegistryKey;

// A node of the key tree: a link to its parent and a slot for each child, filled when the child is first asked for.
// The slots of a hive's keys are read by the search's thread while the window paints, so they are only touched under
// the hive's engine lock; a group above the hives has no lock, and changes only before the window is shown.
class AbstractRegKey {
public:
    virtual ~AbstractRegKey();  // frees the slots' storage, never what they point to

    // The child in a slot; the base neither checks nor creates.
    virtual AbstractRegKey* child(int i);
    virtual QString name() = 0;
    // The child in a slot, for a row that is shown: where it cannot be opened, an object without subkeys stands for
    // it, which throws when it is asked for anything, so that one damaged record does not hide its siblings. It goes on
    // doing so should the key open later: its row has been shown without subkeys.
    virtual AbstractRegKey* shown_child(int i) { return child(i); }
    // Whether a damaged hive lists this key below itself: one of the keys above it is the same.
    virtual bool is_below_itself() const { return false; }

    AbstractRegKey* parent() const { return parent_; }
    int child_count() const;
    // Position among the parent's children: 0 without a parent, -1 when the parent does not list this key.
    int child_number() const;
    // Appends a slot. The key's own link to its parent is left as it is.
    void add_child(AbstractRegKey* key);
    // Says where the parent lists this key, to spare child_number() the first search.
    void set_number_hint(size_t number) { number_hint_ = number; }

protected:
    explicit AbstractRegKey(AbstractRegKey* parent) : parent_(parent) {}
    // The slots, laid out when a child is first asked for: in a damaged hive many keys may list the same many subkeys.
    std::vector<AbstractRegKey*>& laid_out();

    AbstractRegKey* parent_;  // null at the top; not owned
    size_t slot_count_ = 0;
    std::vector<AbstractRegKey*> children_;  // empty until laid_out() is called, then of slot_count_

private:
    std::unique_lock<std::recursive_mutex> lock_children() const;
    // The lock that guards the children: the hive's, null for a group.
    virtual std::recursive_mutex* children_lock() const { return nullptr; }

    // Where the parent listed this key last; checked before it is believed. Written by the search's thread too.
    mutable std::atomic<size_t> number_hint_ = 0;
};

// A key of a hive. Holds no engine handle: every operation asks the hive for it anew, under the hive's locks.
// std::runtime_error("ROpenSubKey failed") comes out of any operation whose key cannot be opened any more.
class RegKey : public AbstractRegKey {
public:
    // A hive's root key. Opens nothing: the hive calls reload() once its own handle is there.
    RegKey(RegHive* hive, AbstractRegKey* parent);
    // The child_number-th subkey of parent. Opens its handle and counts its subkeys.
    // std::invalid_argument("parent") for null, std::invalid_argument("child_number") for a negative number.
    RegKey(RegHive* hive, AbstractRegKey* parent, int child_number);
    ~RegKey() override;
    RegKey(const RegKey&) = delete;
    RegKey& operator=(const RegKey&) = delete;

    // The i-th subkey, made when it is first asked for. std::out_of_range("vector::_M_range_check") outside the list.
    AbstractRegKey* child(int i) override;
    // std::runtime_error("RQueryInfoKeyW failed") when the engine cannot say.
    QString name() override;
    AbstractRegKey* shown_child(int i) override;
    bool is_below_itself() const override;

    // Brings the number of slots up to the engine's count. Surplus objects are dropped from the list, not deleted:
    // views may still have indexes to them, and nothing frees them any more.
    void reload();
    int value_count();
    // The position of the unnamed value, -1 when there is none.
    int default_value_position();
    bool has_default_value() { return default_value_position() >= 0; }

    // Makes a subkey "New Key #%i" with the lowest free number; returns its position, negative on failure.
    int new_key();
    // Deletes the index-th subkey, which must have none itself. false: refused, or a read or write failed, and the key
    // is still there.
    bool delete_key(int index);
    // Whether the index-th subkey can be deleted with all below it. Changes nothing.
    bool can_delete_tree(int index);
    // Renames the index-th subkey; returns its new position. -1: refused by the engine (a sibling has the name, or 8
    // bits cannot carry it); -2: renamed, but not found afterwards; -3: longer than 255 characters.
    int rename_key(int index, const QString& new_name);

    // ---- values, by their position in the key's value list ----
    // null: the data cannot be read. std::invalid_argument("index"): not even its name and type can.
    std::unique_ptr<RegValue> read_value(int index);
    // The name and type of a value without its data, whose variant stays invalid; throws as read_value.
    RegValue read_value_without_data(int index);
    // The name alone; nothing when the value's record cannot be read.
    std::optional<QString> value_name(int index);
    // The setters store under a name, making the value when there is none. With an index, the value of that name must
    // be the one at that position; with new_value, there must surely be none. false: refused, for this or by the
    // engine, or 8 bits cannot carry the name.
    bool set_string_value(const QString& name, const QString& text, uint type, int index = any_value);
    bool set_binary_value(const QString& name, const QByteArray& bytes, uint type, int index = any_value);
    bool set_dword_value(const QString& name, uint value, int order, int index = any_value);
    bool set_qword_value(const QString& name, qulonglong value, int index = any_value);
    bool set_multi_string_value(const QString& name, const QStringList& list, int index = any_value);
    // false: no name leads to this value alone, or the engine refused.
    bool delete_value(int index);
    // Whether its name leads to the value at the index, so that it can be deleted. Changes nothing.
    bool can_delete_value(int index);
    // Stores the value under the new name, at the end of the list, and deletes the old one. false: refused (an empty or
    // used name, one above 16,383 characters or that 8 bits cannot carry, data that cannot be read), or a step failed:
    // the value may then stand under both names.
    bool rename_value(int index, const QString& new_name);
    // "New Value #%i" with the lowest number that no value has; null when the engine cannot say.
    QString new_value_name();

    static constexpr int any_value = -1;  // whichever has the name, or a new one
    static constexpr int new_value = -2;

    RegHive* hive() const { return hive_; }

private:
    friend class RegHive;

    std::recursive_mutex* children_lock() const override;
    void refresh_children(RegistryKey* handle);
    void learn_offset(uint32_t offset);
    bool is_shown_at(RegistryKey* handle, int index) const;
    bool agrees_below(int index);
    // Whether there is a slot for each subkey that the engine counts, so that its positions are those of the slots.
    bool slots_agree(RegistryKey* handle) const;
    // Whether the engine, asked anew, counts one subkey less than there are slots; not where it cannot be asked.
    bool lists_one_less() const;
    // The name as the parent's list leads to it.
    QString listed_name();
    int find_child_position(RegistryKey* handle, const QByteArray& name);
    // Moves a slot to where the engine now finds its key by name; returns the new position, -2 when it finds none.
    int move_slot(RegistryKey* handle, int index, const QByteArray& name);
    bool store_value(const QString& name, uint type, const QByteArray& data, int index);

    RegHive* hive_;  // not owned
    // Where the engine found the key, UINT32_MAX when it has not been asked since the key was made. What the parent
    // lists at this object's place is only taken for its key when it lies there.
    uint32_t offset_ = UINT32_MAX;
    bool stands_in_ = false;  // for a key that could not be opened when its row was shown, see shown_child
    int freed_before_ = 0;  // the hive's times_freed_ when the offset was learnt: a later one of its cell means it left
};

// A named group with no hive behind it: the first part of a mount name.
class DummyRegKey : public AbstractRegKey {
public:
    explicit DummyRegKey(const QString& label) : AbstractRegKey(nullptr), label_(label) {}

    QString name() override { return label_; }

private:
    QString label_;
};
