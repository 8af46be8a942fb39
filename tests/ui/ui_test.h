// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// What every test of the user interface starts from: the program's own application object, and a hand for the
// modal dialogs that a call under test opens.
#pragma once

#include "application.h"

#include <QAbstractScrollArea>
#include <QAction>
#include <QApplication>
#include <QContextMenuEvent>
#include <QDialogButtonBox>
#include <QMenu>
#include <QMessageBox>
#include <QPointer>
#include <QPushButton>
#include <QTest>
#include <QTimer>

#include <deque>
#include <functional>
#include <utility>

// Answers the modal dialogs that open one after the other, each by the next step, from inside its event loop. One that
// opens when no step is left fails the test and is closed: it would hold the call under test for good.
class DialogHand {
public:
    using Step = std::function<void(QWidget*)>;

    DialogHand() {
        QObject::connect(&timer_, &QTimer::timeout, &timer_, [this] { look(); });
        timer_.start(1);
    }

    // The "Searching..." dialog, which comes and goes by itself, is left to then_while_searching.
    DialogHand& then(Step step) {
        steps_.push_back({std::move(step), false});
        return *this;
    }

    DialogHand& then_while_searching(Step step) {
        steps_.push_back({std::move(step), true});
        return *this;
    }

    // Waits for a message box, notes what it says and presses a button of it.
    DialogHand& then_press(QMessageBox::StandardButton button) {
        return then([this, button](QWidget* dialog) {
            auto* box = qobject_cast<QMessageBox*>(dialog);
            QVERIFY2(box, dialog->metaObject()->className());
            icon = box->icon();
            title = box->windowTitle();
            text = box->text();
            format = box->textFormat();
            parent = box->parentWidget();
            buttons = box->standardButtons();
            QTest::mouseClick(box->button(button), Qt::LeftButton);
        });
    }

    bool is_done() const { return steps_.empty(); }

    // Lets what is queued come; false when a dialog was or is among it that no step waits for.
    bool nothing_comes() const {
        QCoreApplication::processEvents();
        return !was_surprised_ && !QApplication::activeModalWidget();
    }

    // Of the last box that was pressed.
    QMessageBox::Icon icon = QMessageBox::NoIcon;
    QString title;
    QString text;
    Qt::TextFormat format = Qt::AutoText;
    QWidget* parent = nullptr;
    QMessageBox::StandardButtons buttons;

private:
    void look() {
        QWidget* dialog = QApplication::activeModalWidget();
        if (!dialog || !dialog->isVisible())
            return;
        const bool is_searching = dialog->accessibleName() == QStringLiteral("Searching...");
        if (steps_.empty()) {
            if (!is_searching && !answered_.contains(dialog))
                refuse(*dialog);
            return;
        }
        if ((!answered_.isEmpty() && dialog == answered_.last()) || is_searching != steps_.front().second)
            return;
        answered_.append(dialog);
        const Step step = std::move(steps_.front().first);
        steps_.pop_front();
        // Not from inside the timer's own event: a step may open the next dialog before it returns.
        const QPointer<QWidget> shown = dialog;
        QTimer::singleShot(0, qApp, [step, shown] {
            if (shown)
                step(shown);
        });
    }

    void refuse(QWidget& dialog) {
        was_surprised_ = true;
        const auto* box = qobject_cast<QMessageBox*>(&dialog);
        const QString what = box ? box->text() : dialog.windowTitle();
        QTest::qFail(qPrintable(QStringLiteral("a dialog that no step waits for: ") + what), __FILE__, __LINE__);
        dialog.hide();
    }

    QTimer timer_;
    QList<QPointer<QWidget>> answered_;
    bool was_surprised_ = false;
    std::deque<std::pair<Step, bool>> steps_;  // and whether it is for the search's dialog
};

// Clicks a button of a dialog that has a button box.
inline void press(const QWidget& dialog, QDialogButtonBox::StandardButton button) {
    QTest::mouseClick(dialog.findChild<QDialogButtonBox*>()->button(button), Qt::LeftButton);
}

// Does what asks for a context menu, hands the menu to `act` and closes it; false when no menu came.
inline bool with_menu(const std::function<void()>& ask, const std::function<void(QMenu&)>& act) {
    bool shown = false;
    QTimer timer;
    QObject::connect(&timer, &QTimer::timeout, &timer, [&] {
        auto* menu = qobject_cast<QMenu*>(QApplication::activePopupWidget());
        if (!menu)
            return;
        timer.stop();
        shown = true;
        act(*menu);
        menu->close();
    });
    timer.start(1);
    ask();
    return shown;
}

// The context menu of a view at a point of its viewport.
inline bool with_context_menu(QAbstractScrollArea& view, QPoint point, const std::function<void(QMenu&)>& act) {
    return with_menu(
        [&] {
            QContextMenuEvent event(QContextMenuEvent::Mouse, point, view.viewport()->mapToGlobal(point));
            QCoreApplication::sendEvent(view.viewport(), &event);
        },
        act);
}

// The texts of a menu; "-" for a separator.
inline QStringList texts_of(const QMenu& menu) {
    QStringList texts;
    for (const QAction* action : menu.actions())
        texts.append(action->isSeparator() ? QStringLiteral("-") : action->text());
    return texts;
}

// The widget of a type below `parent` whose text is `text`.
template <typename Widget>
Widget* find_by_text(const QWidget& parent, const QString& text) {
    for (Widget* widget : parent.findChildren<Widget*>()) {
        if (widget->text().remove(QLatin1Char('&')) == text)
            return widget;
    }
    return nullptr;
}

#define UI_TEST_MAIN(TestClass)                                                                                        \
    int main(int argc, char** argv) {                                                                                  \
        Application application(argc, argv);                                                                           \
        QCoreApplication::setApplicationName(QStringLiteral("Registry Editor"));                                       \
        TestClass test;                                                                                                \
        return QTest::qExec(&test, argc, argv);                                                                        \
    }
