// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#pragma once

// The key model as a window browses it: a key that cannot be opened does not take its siblings from view.

#include "reg_model.h"

#include <map>
#include <memory>
#include <utility>

// A tree view asks for every child when it opens a branch, and is left with half a branch when one of them
// throws. Here such a child is reported and stands as a key without a name, without subkeys and without
// values. A search on its worker thread passes over it.
class BrowsedModel : public RegModel {
    Q_OBJECT

public:
    explicit BrowsedModel(QObject* parent = nullptr);
    ~BrowsedModel() override;

    QModelIndex index(int row, int column, const QModelIndex& parent = QModelIndex()) const override;
    Qt::ItemFlags flags(const QModelIndex& index) const override;

private:
    class UnreadableKey;

    void report(int row, const QModelIndex& parent, const std::exception& failure) const;
    QModelIndex unreadable_index(int row, int column, const QModelIndex& parent) const;
    bool is_unreadable(const QModelIndex& index) const;

    // By parent and row; what stood at a row once may be readable or elsewhere now, so the key itself is
    // always tried first.
    mutable std::map<std::pair<const void*, int>, std::unique_ptr<UnreadableKey>> m_unreadable;
};
