// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
#include "application.h"

#include "failure_report.h"
#include "keys_view.h"
#include "values_view.h"

#include <QDebug>
#include <QFile>
#include <QIcon>
#include <QKeyEvent>
#include <QLibraryInfo>
#include <QLocale>
#include <QMouseEvent>
#include <QTranslator>

#include <csignal>
#include <cstdio>
#include <cstdlib>
#include <exception>

#include <fcntl.h>
#include <unistd.h>

namespace {

const QString share_directory = QStringLiteral(TALLOWFEN_SHARE_DIR);

// Kept as bytes: the terminate handler must not allocate.
QByteArray& file_being_opened() {
    static QByteArray file;
    return file;
}

[[noreturn]] void tell_and_abort() {
    const char* reason = "unknown failure";
    const std::exception_ptr failure = std::current_exception();
    if (failure) {
        try {
            std::rethrow_exception(failure);
        } catch (const std::exception& known) {
            reason = known.what();
            if (file_being_opened().isEmpty())
                std::fprintf(stderr, "tallowfen: %s\n", reason);
            else
                std::fprintf(stderr, "tallowfen: %s: %s\n", file_being_opened().constData(), reason);
        } catch (...) {
            std::fprintf(stderr, "tallowfen: %s\n", reason);
        }
    }
    std::abort();
}

bool is_of_the_mouse(QEvent::Type type) {
    return type == QEvent::MouseButtonPress || type == QEvent::MouseMove || type == QEvent::MouseButtonRelease ||
           type == QEvent::MouseButtonDblClick;
}

bool is_in_values_table(const QObject* part) {
    while (part && !qobject_cast<const ValuesView*>(part))
        part = part->parent();
    return part != nullptr;
}

}  // namespace

Application::Application(int& argc, char** argv) : QApplication(argc, argv) {
    // A bare X session names no icon theme that holds the folder icon of the key tree.
    if (!QIcon::hasThemeIcon(QStringLiteral("folder")))
        QIcon::setThemeName(QStringLiteral("Adwaita"));
    // Where no theme is installed either, the share directory's own folder.png shows. Only from here on: with it the
    // question above would always be answered with yes.
    QIcon::setFallbackSearchPaths(QIcon::fallbackSearchPaths() << share_directory);
}

bool Application::is_held_from_elsewhere(const QWidget& receiver, const QKeyEvent& key) {
    if (key.key() != Qt::Key_Return && key.key() != Qt::Key_Enter)
        return false;
    if (!key.isAutoRepeat())
        return_pressed_in_ = receiver.window();
    return return_pressed_in_ != receiver.window();
}

bool Application::notify(QObject* receiver, QEvent* event) {
    // Asked first: afterwards the receiver may be gone.
    const bool is_gesture = receiver->isWidgetType() || event->type() == QEvent::Shortcut;
    const bool is_in_table = is_in_values_table(receiver);
    if (event->type() == QEvent::KeyPress && receiver->isWidgetType() &&
        is_held_from_elsewhere(*static_cast<QWidget*>(receiver), *static_cast<QKeyEvent*>(event))) {
        return true;
    }
    try {
        // Here, since the toolkit moves the keyboard, which ends a naming, before any filter sees the press.
        if (is_of_the_mouse(event->type()) && receiver->isWidgetType()) {
            auto* keys = qobject_cast<KeysView*>(receiver->parent());
            if (keys && receiver == keys->viewport() &&
                keys->take_mouse_from_naming(*static_cast<QMouseEvent*>(event))) {
                return true;
            }
        }
        return QApplication::notify(receiver, event);
    } catch (const std::exception& failure) {
        FailureReport& report = FailureReport::instance();
        if (is_in_table)
            report.report_at_shown(failure);
        else
            report.report_at_current(failure, is_gesture);
        return true;
    }
}

void load_translations(QTranslator& program, QTranslator& toolkit) {
    QString locale;
    for (const QString& name : {QLocale::system().name(), QStringLiteral("en_US")}) {
        locale = name;
        if (program.load(QStringLiteral("tallowfen_") + name, share_directory))
            break;
    }
    QCoreApplication::installTranslator(&program);
    qDebug().noquote().nospace() << share_directory << locale;

    // Since Qt 5 the texts of the widgets live in "qtbase_"; "qt_" is there only where all of Qt is installed.
    const QString toolkit_directory = QLibraryInfo::path(QLibraryInfo::TranslationsPath);
    if (!toolkit.load(QStringLiteral("qt_") + locale, toolkit_directory)) {
        [[maybe_unused]] const bool loaded = toolkit.load(QStringLiteral("qtbase_") + locale, toolkit_directory);
    }
    QCoreApplication::installTranslator(&toolkit);
}

void prepare_process() {
    for (int stream = STDIN_FILENO; stream <= STDERR_FILENO; stream++) {
        // The lowest free number is taken, and those below are in use by now.
        if (fcntl(stream, F_GETFD) == -1 && open("/dev/null", O_RDWR) != stream)
            std::abort();
    }
    std::signal(SIGXFSZ, SIG_IGN);
    std::signal(SIGPIPE, SIG_IGN);
}

void install_terminate_handler() { std::set_terminate(tell_and_abort); }

void set_file_being_opened(const QString& file) { file_being_opened() = QFile::encodeName(file); }
