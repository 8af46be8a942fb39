// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "values_view.h"

#include "current_row.h"
#include "delegates.h"
#include "edit_dialogs.h"
#include "edit_number_dialog.h"
#include "failure_report.h"
#include "finish_editing.h"
#include "shared_actions.h"
#include "value_text.h"
#include "values_model.h"
#include "values_proxy_model.h"

#include <QAction>
#include <QActionGroup>
#include <QApplication>
#include <QClipboard>
#include <QHeaderView>
#include <QHelpEvent>
#include <QKeyEvent>
#include <QMenu>
#include <QMessageBox>
#include <QTextDocument>
#include <QToolTip>

#include <limits>

namespace {

constexpr int name_column = ValuesModel::NameColumn;
constexpr int type_column = ValuesModel::TypeColumn;
constexpr int data_column = ValuesModel::DataColumn;

// The registry type that an action of the "new" group creates; -1 for the action that creates a key.
int type_created_by(const QAction* action) {
    const SharedActions& actions = shared_actions();
    if (action == actions.new_string_action)
        return REG_SZ;
    if (action == actions.new_expand_string_action)
        return REG_EXPAND_SZ;
    if (action == actions.new_binary_action)
        return REG_BINARY;
    if (action == actions.new_dword_action)
        return REG_DWORD;
    if (action == actions.new_multi_string_action)
        return REG_MULTI_SZ;
    if (action == actions.new_qword_action)
        return REG_QWORD;
    return -1;
}

// What a cell shows, right in its first `limit` characters at least; data that cannot be read shows nothing.
QString shown_text(const QModelIndex& cell, qsizetype limit = std::numeric_limits<qsizetype>::max()) {
    const QVariant datum = cell.data(Qt::DisplayRole);
    return datum.isValid() ? value_text(datum, limit) : QString();
}

// The name of a row, or what is said where it has none that can be read.
QString spoken_name(const QAbstractItemModel& model, int row) {
    return model.index(row, name_column).data(Qt::AccessibleTextRole).toString();
}

}  // namespace

ValuesView::ValuesView(QWidget* parent) : QTableView(parent) {
    const SharedActions& actions = shared_actions();
    connect(this, &QAbstractItemView::doubleClicked, this, &ValuesView::value_double_clicked);
    connect(this, &QWidget::customContextMenuRequested, this, &ValuesView::show_values_context_menu);
    connect(actions.new_action_group, &QActionGroup::triggered, this, &ValuesView::run_new_value_action);
    connect(actions.delete_action, &QAction::triggered, this, &ValuesView::run_delete_value_action);
    connect(actions.rename_action, &QAction::triggered, this, &ValuesView::run_rename_value_action);
    // Tab leads on to the next widget: inside the table the arrow keys move.
    setTabKeyNavigation(false);
    setHorizontalScrollMode(QAbstractItemView::ScrollPerPixel);
    setWordWrap(false);
    verticalHeader()->setSectionResizeMode(QHeaderView::Fixed);
    verticalHeader()->setDefaultSectionSize(fontMetrics().height() + 6);
    horizontalHeader()->setDefaultAlignment(Qt::AlignLeft | Qt::AlignVCenter);
    horizontalHeader()->setHighlightSections(false);
    connect(horizontalHeader(), &QHeaderView::sectionCountChanged, this, &ValuesView::size_columns);
    horizontalHeader()->viewport()->installEventFilter(this);
}

void ValuesView::size_columns(int old_count, int new_count) {
    if (old_count != 0 || new_count <= data_column)
        return;
    // Wide enough for most names, for the commonest type names and for a line of data; the user widens the rest.
    const int letter = fontMetrics().averageCharWidth();
    setColumnWidth(name_column, letter * 24);
    setColumnWidth(type_column, letter * 20);
    setColumnWidth(data_column, letter * 60);
}

void ValuesView::value_double_clicked(QModelIndex index) {
    if (!index.isValid() || !model() || index.column() != name_column || !end_editing_before_change(*this))
        return;
    meet_failures(this, FailureReport::instance().shown_key(), [&] { edit_value(index); });
}

void ValuesView::edit_value(const QModelIndex& index) {
    const QString name = index.data(Qt::DisplayRole).toString();
    // Should the table show another key's values by the time the editor is left, this leads nowhere.
    const QPersistentModelIndex data_index = model()->index(index.row(), data_column);
    const QVariant datum = data_index.data(Qt::DisplayRole);
    if (is_not_set(datum)) {
        if (!edit_string(*model(), name, QString(), data_index))
            tell_failure(this, tr("The value could not be created."));
        return;
    }
    bool stored = true;
    switch (datum.typeId()) {
    case QMetaType::QString:
        stored = edit_string(*model(), name, datum.toString(), data_index);
        break;
    case QMetaType::QByteArray:
        stored = edit_binary(*model(), name, datum.toByteArray(), data_index);
        break;
    case QMetaType::QStringList:
        stored = edit_multi_string(*model(), name, datum.toStringList(), data_index);
        break;
    case QMetaType::UInt:
        stored = edit_dword(name, datum.toUInt(), data_index);
        break;
    case QMetaType::ULongLong:
        stored = edit_qword(name, datum.toULongLong(), data_index);
        break;
    default:
        tell_failure(this, tr("Data type cannot be edited yet"));
        break;
    }
    if (!stored)
        tell_failure(this, tr("The value could not be changed."));
}

bool ValuesView::edit_dword(const QString& value_name, quint32 number, const QPersistentModelIndex& data_index) {
    EditDwordDialog dialog(value_name);
    dialog.setWindowTitle(tr("Edit DWORD (32-bit) Value", "dialog title"));
    dialog.set_value(number);
    return dialog.exec() != QDialog::Accepted ||
           model()->setData(data_index, QVariant(dialog.value()), Qt::DisplayRole);
}

bool ValuesView::edit_qword(const QString& value_name, quint64 number, const QPersistentModelIndex& data_index) {
    EditQwordDialog dialog(value_name);
    dialog.setWindowTitle(tr("Edit QWORD (64-bit) Value", "dialog title"));
    dialog.set_value(number);
    return dialog.exec() != QDialog::Accepted ||
           model()->setData(data_index, QVariant(dialog.value()), Qt::DisplayRole);
}

void ValuesView::keyPressEvent(QKeyEvent* event) {
    if (event->key() == Qt::Key_Return && state() != QAbstractItemView::EditingState) {
        if (!event->isAutoRepeat())
            value_double_clicked(currentIndex());
    } else if (event->matches(QKeySequence::Copy) && currentIndex().isValid()) {
        // As it is shown: the toolkit would take bytes for text, and a list of strings for nothing.
        event->accept();
        meet_failures(this, FailureReport::instance().shown_key(),
                      [this] { QApplication::clipboard()->setText(shown_text(currentIndex())); });
    } else if (event->key() == Qt::Key_F2) {
        meet_failures(this, FailureReport::instance().shown_key(), [&] {
            read_name_ahead(currentIndex());
            show_current();
            QTableView::keyPressEvent(event);
        });
    } else {
        QTableView::keyPressEvent(event);
    }
}

// The table's own reads the data of the rows that it passes, and ends at the first that cannot be read.
void ValuesView::keyboardSearch(const QString& typed) {
    if (!model() || model()->rowCount() == 0 || typed.isEmpty())
        return;
    typed_.add(typed);
    const int rows = model()->rowCount();
    const int first = currentIndex().isValid() ? currentIndex().row() + (typed_.is_repeated() ? 1 : 0) : 0;
    for (int passed = 0; passed < rows; passed++) {
        const QModelIndex value = model()->index((first + passed) % rows, name_column);
        if (value.data(Qt::DisplayRole).toString().startsWith(typed_.wanted(), Qt::CaseInsensitive)) {
            setCurrentIndex(value);
            return;
        }
    }
}

// What a command is about is seen before it asks for a name or an answer.
void ValuesView::show_current() {
    const QModelIndex current = currentIndex();
    setCurrentIndex(current);
    scrollTo(current);
}

bool ValuesView::event(QEvent* event) {
    if (!is_menu_key(*event))
        return QTableView::event(event);
    if (!end_editing_before_change(*this))
        return true;
    if (!currentIndex().isValid()) {
        // The place that comes with it can be over a row, which nobody has pointed at.
        show_new_menu(viewport()->rect().center());
    } else {
        meet_failures(this, FailureReport::instance().shown_key(), [this] {
            show_current();
            ask_for_menu_over_current(*this);
        });
    }
    return true;
}

QItemSelectionModel::SelectionFlags ValuesView::selectionCommand(const QModelIndex& index, const QEvent* event) const {
    return keeping_highlight(QTableView::selectionCommand(index, event), index, event);
}

void ValuesView::show_values_context_menu(QPoint point) {
    // A refused name is told before the menu is in the way of the box.
    if (!end_editing_before_change(*this))
        return;
    const SharedActions& actions = shared_actions();
    const QModelIndex index = indexAt(point);
    QMenu menu;
    if (index.isValid() && index.column() == name_column) {
        const QAction* edit_action = menu.addAction(tr("Edit", "menu title"));
        menu.addAction(actions.delete_action);
        menu.addAction(actions.rename_action);
        const int row = index.row();
        if (menu.exec(viewport()->mapToGlobal(point)) == edit_action)
            value_double_clicked(model()->index(row, name_column));
        return;
    }
    show_new_menu(point);
}

void ValuesView::show_new_menu(QPoint point) {
    QMenu menu;
    add_new_actions(*menu.addMenu(tr("New", "menu title")));
    menu.exec(viewport()->mapToGlobal(point));
}

void ValuesView::run_new_value_action(QAction* action) {
    auto* values = qobject_cast<ValuesProxyModel*>(model());
    const int type = type_created_by(action);
    if (values && type >= 0 && values->has_key() && end_editing_before_change(*this))
        meet_failures(this, FailureReport::instance().shown_key(), [&] { make_value(*values, type); });
}

void ValuesView::make_value(ValuesProxyModel& values, int type) {
    if (!values.add_value(type)) {
        tell_failure(this, tr("The value could not be created."));
        return;
    }
    const QModelIndex created = values.index(values.rowCount() - 1, name_column);
    make_current(created);
    edit(created);
}

// By way of no current index: where the rows have moved it there without a signal, setting it would not be heard, and
// the actions would not follow.
void ValuesView::make_current(const QModelIndex& index) {
    setCurrentIndex(QModelIndex());
    setCurrentIndex(index);
}

void ValuesView::run_delete_value_action(bool /*checked*/) {
    // The key tree answers the same action.
    if (hasFocus() && model() && end_editing_before_change(*this))
        meet_failures(this, FailureReport::instance().shown_key(), [this] { delete_value(); });
}

// Where a value that was in `row` stands by now; `row` again, as long as there is one, where it has gone. The first
// row is the default value's always, and another value may have the name that it is shown with.
int ValuesView::row_of(const QString& name, int row) const {
    const int rows = model()->rowCount();
    if (row > 0 && spoken_name(*model(), row) != name) {
        for (int other = rows - 1; other > 0; other--) {
            if (spoken_name(*model(), other) == name)
                return other;
        }
    }
    return qMin(row, rows - 1);
}

void ValuesView::delete_value() {
    // What is deleted is the value that was asked about. The other cells of its row cannot be highlighted, and do not
    // say which value it is.
    const QPersistentModelIndex asked = currentIndex().siblingAtColumn(name_column);
    if (!asked.isValid())
        return;
    setCurrentIndex(asked);
    show_current();
    if (QMessageBox::question(this, tr("Confirm Value Removal"), tr("Are you sure you want to delete this value?"),
                              QMessageBox::Yes | QMessageBox::No) != QMessageBox::Yes) {
        return;
    }
    if (!asked.isValid())
        return;
    const int row = asked.row();
    const QString name = spoken_name(*model(), row);
    // A removal that was announced and then did not come to be has moved the selection to a neighbour, and the table
    // may have been sorted since.
    const auto return_to_kept = [&] { make_current(model()->index(row_of(name, row), name_column)); };
    bool removed = false;
    try {
        removed = model()->removeRows(row, 1, QModelIndex());
    } catch (...) {
        return_to_kept();
        throw;
    }
    if (!removed) {
        return_to_kept();
        tell_failure(this, tr("The value could not be deleted."));
        return;
    }
    // The current index has moved to a neighbour as the row went, and the table was sorted since: it goes to what
    // stands in the deleted row's place now, also where that is the row of a default value that is no longer set.
    make_current(model()->index(qMin(row, model()->rowCount() - 1), name_column));
}

void ValuesView::run_rename_value_action(bool /*checked*/) {
    if (!hasFocus() || !end_editing_before_change(*this))
        return;
    const QModelIndex current = currentIndex();
    if (!current.isValid())
        return;
    meet_failures(this, FailureReport::instance().shown_key(), [&] {
        read_name_ahead(current);
        show_current();
        edit(current);
    });
}

// Before a paint, which asks for rows and flags where an exception would leave its painter open. false: the key does
// not say how many values it has, which is reported.
bool ValuesView::check_key() {
    try {
        if (model())
            model()->rowCount();
        return true;
    } catch (const std::exception& failure) {
        FailureReport::instance().report_at_shown(failure);
        emit row_count_failed();
        return false;
    }
}

void ValuesView::paintEvent(QPaintEvent* event) {
    if (!check_key())
        return;
    // Last net, should a read fail that has just gone well.
    try {
        QTableView::paintEvent(event);
    } catch (const std::exception& failure) {
        FailureReport::instance().report_at_shown(failure);
    }
}

bool ValuesView::eventFilter(QObject* watched, QEvent* event) {
    if (watched == horizontalHeader()->viewport() && event->type() == QEvent::Paint && !check_key())
        return true;
    return QTableView::eventFilter(watched, event);
}

// The text of a cell that cuts it; of a very long one, the beginning.
QString ValuesView::cut_text(const QModelIndex& index) const {
    constexpr qsizetype longest = 1000;
    const QString shown = shortened(shown_text(index, longest + 1), longest);
    const bool is_cut =
        shown.size() > ValueDelegate::shortest_cut || sizeHintForIndex(index).width() > columnWidth(index.column());
    return is_cut ? shown : QString();
}

bool ValuesView::viewportEvent(QEvent* event) {
    if (event->type() != QEvent::ToolTip)
        return QTableView::viewportEvent(event);
    const auto* help = static_cast<QHelpEvent*>(event);
    QString text;
    try {
        const QModelIndex index = indexAt(help->pos());
        text = index.isValid() ? cut_text(index) : QString();
    } catch (const std::exception& failure) {
        FailureReport::instance().report_at_shown(failure);
    }
    // Made into paragraphs here, so that the tip takes no text for markup.
    QToolTip::showText(help->globalPos(), text.isEmpty() ? text : Qt::convertFromPlainText(text), viewport());
    return true;
}
