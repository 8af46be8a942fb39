// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#pragma once

// The delegates of the two views: they render value data, commit in-place renames, and let no exception of a
// damaged key pass through a paint.

#include <QStyledItemDelegate>

#include <limits>

class ValueDelegate : public QStyledItemDelegate {
    Q_OBJECT

public:
    // `main_window` is the parent of the message box and is not owned.
    explicit ValueDelegate(QWidget* main_window);

    // The whole text of a datum, whatever its length; the locale is not used.
    QString displayText(const QVariant& value, const QLocale& locale) const override;
    void setModelData(QWidget* editor, QAbstractItemModel* model, const QModelIndex& index) const override;

    void paint(QPainter* painter, const QStyleOptionViewItem& option, const QModelIndex& index) const override;
    QSize sizeHint(const QStyleOptionViewItem& option, const QModelIndex& index) const override;

protected:
    // Lays out only as much of a long datum as a cell can show: painting a megabyte costs what a line costs.
    void initStyleOption(QStyleOptionViewItem* option, const QModelIndex& index) const override;

private:
    QWidget* m_main_window;
    // How many characters displayText need give; fewer than all only while a cell is laid out.
    mutable qsizetype m_limit = std::numeric_limits<qsizetype>::max();
};

class KeyDelegate : public QStyledItemDelegate {
    Q_OBJECT

public:
    // `main_window` is the parent of the message box and is not owned.
    explicit KeyDelegate(QWidget* main_window);

    void setModelData(QWidget* editor, QAbstractItemModel* model, const QModelIndex& index) const override;

    void paint(QPainter* painter, const QStyleOptionViewItem& option, const QModelIndex& index) const override;
    QSize sizeHint(const QStyleOptionViewItem& option, const QModelIndex& index) const override;

protected:
    void initStyleOption(QStyleOptionViewItem* option, const QModelIndex& index) const override;

private:
    QWidget* m_main_window;
};
