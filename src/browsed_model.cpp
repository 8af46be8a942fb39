// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "browsed_model.h"

#include "failure_report.h"
#include "reg_key.h"

#include <QCoreApplication>
#include <QThread>

#include <algorithm>
#include <stdexcept>
#include <string>

// Not among its parent's children, so the engine is never asked about it: every operation on it throws as an
// unopened key does.
class BrowsedModel::UnreadableKey : public RegKey {
public:
    explicit UnreadableKey(RegKey* parent_key) : RegKey(parent_key->hive(), parent_key) {}

    QString name() override { return BrowsedModel::tr("(cannot be read)"); }
};

BrowsedModel::BrowsedModel(QObject* parent) : RegModel(parent) {}

// The stand-ins go while their hives are still there.
BrowsedModel::~BrowsedModel() = default;

QModelIndex BrowsedModel::index(int row, int column, const QModelIndex& parent) const {
    const bool is_search = QThread::currentThread() != thread();
    // A search asks for the first child and for the next sibling: it is given the next that can be opened.
    for (int next = row;; ++next) {
        try {
            return RegModel::index(next, column, parent);
        } catch (const std::exception& failure) {
            report(next, parent, failure);
        }
        if (!is_search) {
            return unreadable_index(row, column, parent);
        }
    }
}

Qt::ItemFlags BrowsedModel::flags(const QModelIndex& index) const {
    return is_unreadable(index) ? Qt::ItemIsSelectable | Qt::ItemIsEnabled : RegModel::flags(index);
}

void BrowsedModel::report(int row, const QModelIndex& parent, const std::exception& failure) const {
    const QString path = key_path_of(parent) + QStringLiteral("\\#%1").arg(row);
    const std::string reason = failure.what();
    // Boxes belong to the window's thread.
    QMetaObject::invokeMethod(
        qApp, [path, reason] { FailureReport::instance().report(path, std::runtime_error(reason)); },
        Qt::AutoConnection);
}

QModelIndex BrowsedModel::unreadable_index(int row, int column, const QModelIndex& parent) const {
    // Only a hive's keys fail to open, so the parent is one.
    auto* parent_key = static_cast<RegKey*>(static_cast<AbstractRegKey*>(parent.internalPointer()));
    std::unique_ptr<UnreadableKey>& key = m_unreadable[{parent_key, row}];
    if (!key) {
        key = std::make_unique<UnreadableKey>(parent_key);
    }
    return createIndex(row, column, static_cast<AbstractRegKey*>(key.get()));
}

bool BrowsedModel::is_unreadable(const QModelIndex& index) const {
    return std::any_of(m_unreadable.cbegin(), m_unreadable.cend(), [&](const auto& entry) {
        return static_cast<const AbstractRegKey*>(entry.second.get()) == index.internalPointer();
    });
}
