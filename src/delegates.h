// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// The delegates of the two views: they render value data, commit in-place renames, and let no exception of a
// damaged key pass through a paint.
#pragma once

#include <QStringList>
#include <QStyledItemDelegate>
#include <QTimer>

#include <exception>
#include <limits>

// What the two have in common: a name that was typed in place is written back when it was changed, and one that did
// not come to be is told. The box comes later, from the event loop: after a commit the view goes on with the editor,
// which may not live as long as a box is open.
class NameDelegate : public QStyledItemDelegate {
    Q_OBJECT

public:
    // `main_window` is the parent of the message box and is not owned.
    explicit NameDelegate(QWidget* main_window);

    // Names are longer than the toolkit's editor takes by default; one that it cut would pass for a new name.
    QWidget* createEditor(QWidget* parent, const QStyleOptionViewItem& option, const QModelIndex& index) const override;

    // Tells each name that was refused and not told yet, and returns when the user has seen it. Called by the event
    // loop where nobody did before.
    void tell_refused_names() const;

    // What a row throws is reported here: an exception must not pass a view that paints.
    void paint(QPainter* painter, const QStyleOptionViewItem& option, const QModelIndex& index) const override;
    QSize sizeHint(const QStyleOptionViewItem& option, const QModelIndex& index) const override;

protected:
    // Tab ends a naming as Return does. The toolkit would go on to the name, or another cell, of the next row, which
    // the next thing typed is then taken for.
    bool eventFilter(QObject* editor, QEvent* event) override;
    // Writes the name back; `refusal` is told where the model refuses it. An exception must not pass the view, which
    // would take the editor for one being committed from then on, and commit no other.
    void commit(const QWidget& editor, QAbstractItemModel& model, const QModelIndex& index,
                const QString& refusal) const;
    // What is named when the name was lost to an exception.
    virtual QString path_to_tell(const QModelIndex& index) const = 0;
    // Reports what a row threw as it was laid out or painted.
    virtual void report(const QModelIndex& index, const std::exception& failure) const = 0;

private:
    bool write_back(const QWidget& editor, QAbstractItemModel& model, const QModelIndex& index) const;
    void tell_later(const QString& text) const;

    QWidget* main_window_;
    mutable QStringList pending_refusals_;
    mutable QTimer tell_timer_;
};

class ValueDelegate : public NameDelegate {
    Q_OBJECT

public:
    using NameDelegate::NameDelegate;

    // A cell lays out that many characters of a text at least; what is longer may be cut, and ends in an ellipsis then.
    static constexpr qsizetype shortest_cut = 256;

    // The whole text of a datum, whatever its length; the locale is not used.
    QString displayText(const QVariant& value, const QLocale& locale) const override;
    void setModelData(QWidget* editor, QAbstractItemModel* model, const QModelIndex& index) const override;

protected:
    // Lays out only as much of a long datum as a cell can show: painting a megabyte costs what a line costs. Control
    // characters are made visible.
    void initStyleOption(QStyleOptionViewItem* option, const QModelIndex& index) const override;
    QString path_to_tell(const QModelIndex& index) const override;
    void report(const QModelIndex& index, const std::exception& failure) const override;

private:
    // How many characters displayText need give; fewer than all only while a cell is laid out.
    mutable qsizetype limit_ = std::numeric_limits<qsizetype>::max();
};

class KeyDelegate : public NameDelegate {
    Q_OBJECT

public:
    using NameDelegate::NameDelegate;

    void setModelData(QWidget* editor, QAbstractItemModel* model, const QModelIndex& index) const override;

protected:
    // The name on one line, its control characters made visible.
    void initStyleOption(QStyleOptionViewItem* option, const QModelIndex& index) const override;
    QString path_to_tell(const QModelIndex& index) const override;
    void report(const QModelIndex& index, const std::exception& failure) const override;
};
