// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "delegates.h"

#include "failure_report.h"
#include "value_text.h"
#include "values_model.h"

#include <QItemEditorFactory>
#include <QKeyEvent>
#include <QLineEdit>
#include <QMetaProperty>
#include <QPointer>
#include <QScopedValueRollback>

#include <algorithm>

namespace {

// In place of a text that cannot be had.
void say_unreadable(QStyleOptionViewItem& option) {
    option.features |= QStyleOptionViewItem::HasDisplay;
    option.text = unreadable_text();
}

}  // namespace

NameDelegate::NameDelegate(QWidget* main_window) : main_window_(main_window) {
    tell_timer_.setSingleShot(true);
    connect(&tell_timer_, &QTimer::timeout, this, &NameDelegate::tell_refused_names);
}

QWidget* NameDelegate::createEditor(QWidget* parent, const QStyleOptionViewItem& option,
                                    const QModelIndex& index) const {
    QWidget* const editor = QStyledItemDelegate::createEditor(parent, option, index);
    if (auto* line = qobject_cast<QLineEdit*>(editor))
        line->setMaxLength(std::numeric_limits<int>::max());
    return editor;
}

void NameDelegate::commit(const QWidget& editor, QAbstractItemModel& model, const QModelIndex& index,
                          const QString& refusal) const {
    try {
        if (!write_back(editor, model, index))
            tell_later(refusal);
    } catch (const std::exception& failure) {
        // Told each time: the user has typed a name that is not there now.
        tell_later(FailureReport::instance().mark_told(path_to_tell(index), reason_of(failure)));
    }
}

void NameDelegate::paint(QPainter* painter, const QStyleOptionViewItem& option, const QModelIndex& index) const {
    try {
        QStyledItemDelegate::paint(painter, option, index);
    } catch (const std::exception& failure) {
        report(index, failure);
    }
}

QSize NameDelegate::sizeHint(const QStyleOptionViewItem& option, const QModelIndex& index) const {
    try {
        return QStyledItemDelegate::sizeHint(option, index);
    } catch (const std::exception& failure) {
        report(index, failure);
        return {};
    }
}

bool NameDelegate::eventFilter(QObject* editor, QEvent* event) {
    const int key = event->type() == QEvent::KeyPress ? static_cast<QKeyEvent*>(event)->key() : 0;
    if (key != Qt::Key_Tab && key != Qt::Key_Backtab)
        return QStyledItemDelegate::eventFilter(editor, event);
    const QPointer<QWidget> widget = qobject_cast<QWidget*>(editor);
    emit commitData(widget);
    if (widget)
        emit closeEditor(widget, NoHint);
    return true;
}

// False when the model refused the editor's text.
bool NameDelegate::write_back(const QWidget& editor, QAbstractItemModel& model, const QModelIndex& index) const {
    QByteArray property = editor.metaObject()->userProperty().name();
    if (property.isEmpty()) {
        const QItemEditorFactory* factory = itemEditorFactory();
        if (!factory)
            factory = QItemEditorFactory::defaultFactory();
        property = factory->valuePropertyName(model.data(index, Qt::EditRole).userType());
    }
    if (property.isEmpty())
        return true;
    const QVariant old_text = model.data(index, Qt::DisplayRole);
    const QVariant new_text = editor.property(property.constData());
    return old_text == new_text || model.setData(index, new_text, Qt::EditRole);
}

void NameDelegate::tell_later(const QString& text) const {
    pending_refusals_.append(text);
    tell_timer_.start(0);
}

void NameDelegate::tell_refused_names() const {
    while (!pending_refusals_.isEmpty())
        tell_failure(main_window_, pending_refusals_.takeFirst());
}

QString ValueDelegate::displayText(const QVariant& value, const QLocale& /*locale*/) const {
    return value_text(value, limit_);
}

void ValueDelegate::setModelData(QWidget* editor, QAbstractItemModel* model, const QModelIndex& index) const {
    commit(*editor, *model, index, tr("The specified value name already exists."));
}

QString ValueDelegate::path_to_tell(const QModelIndex& /*index*/) const {
    return FailureReport::instance().shown_key();
}

void ValueDelegate::report(const QModelIndex& /*index*/, const std::exception& failure) const {
    FailureReport::instance().report_at_shown(failure);
}

void ValueDelegate::initStyleOption(QStyleOptionViewItem* option, const QModelIndex& index) const {
    try {
        // No more characters than half the cell's width in pixels, but at least shortest_cut.
        const qsizetype most = std::max(shortest_cut, qsizetype{option->rect.width() / 2});
        // The base class asks displayText for the text, and takes font, icon and colours from the same index.
        const QScopedValueRollback<qsizetype> cut(limit_, most + 1);
        QStyledItemDelegate::initStyleOption(option, index);
        option->text = with_visible_controls(option->text);
        // Letters that take no room would hide that more follow.
        option->text = shortened(option->text, most);
        // Bytes and numbers have one order, whichever way the rest of the window reads.
        if (index.column() == ValuesModel::DataColumn)
            option->direction = Qt::LeftToRight;
    } catch (const std::exception& failure) {
        say_unreadable(*option);
        report(index, failure);
    }
}

void KeyDelegate::setModelData(QWidget* editor, QAbstractItemModel* model, const QModelIndex& index) const {
    commit(*editor, *model, index, tr("The specified key name already exists."));
}

QString KeyDelegate::path_to_tell(const QModelIndex& index) const { return key_path_of(index); }

void KeyDelegate::report(const QModelIndex& index, const std::exception& failure) const {
    FailureReport::instance().report_row(key_path_of(index), failure);
}

void KeyDelegate::initStyleOption(QStyleOptionViewItem* option, const QModelIndex& index) const {
    try {
        QStyledItemDelegate::initStyleOption(option, index);
        option->text = with_visible_controls(option->text);
    } catch (const std::exception& failure) {
        say_unreadable(*option);
        report(index, failure);
    }
}
