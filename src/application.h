// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// The application object that meets exceptions from damaged keys, and what start-up needs around it.
#pragma once

#include <QApplication>
#include <QPointer>
#include <QString>

class QKeyEvent;
class QTranslator;

// An exception that leaves an event handler is told to the user and ends there; the program goes on. Return held down
// answers only the window that it was pressed in, and not the question or editor that it has opened.
class Application : public QApplication {
    Q_OBJECT

public:
    Application(int& argc, char** argv);

    bool notify(QObject* receiver, QEvent* event) override;

private:
    bool is_held_from_elsewhere(const QWidget& receiver, const QKeyEvent& key);

    QPointer<QWidget> return_pressed_in_;
};

// Loads the program's translation from the share directory and the toolkit's own for the same locale: the system's
// locale where there is a file for it, else en_US. Writes the directory and the locale to the debug channel.
void load_translations(QTranslator& program, QTranslator& toolkit);

// Before anything is opened. Fills what is missing of the three standard streams with /dev/null, since a hive that got
// the number of one would have messages written into it. And ignores the signals of a write past the file size limit or
// into a closed pipe, which would end the program in the middle of a change: the write fails, as on a full disk.
void prepare_process();

// From here on an exception that nobody catches is told in one line on standard error before it ends the program.
void install_terminate_handler();

// The hive file that is being opened, for that line; empty when none is.
void set_file_being_opened(const QString& file);
