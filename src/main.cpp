// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// The program's entry: translations, the command line, one model over every hive named, one window.

#include "application.h"
#include "main_window.h"
#include "reg_model.h"

#include <QFile>
#include <QMessageBox>
#include <QTranslator>

#include <cstdio>
#include <cstring>
#include <stdexcept>

namespace {

constexpr int exit_usage = 1;
constexpr int exit_hibernated = 2;

void tell_hibernated() {
    QMessageBox::critical(nullptr, QObject::tr("Hibernation Detected"),
                          QObject::tr("Your system is in hibernate mode. Therefore the registry cannot be edited. "
                                      "Please restart your system and exit the hibernate mode or contact Zenta "
                                      "Support"),
                          QMessageBox::Ok, QMessageBox::NoButton);
}

}  // namespace

int main(int argc, char** argv) {
    prepare_process();
    install_terminate_handler();
    Application application(argc, argv);
    QTranslator program_translator;
    QTranslator toolkit_translator;
    load_translations(program_translator, toolkit_translator);

    // Twelve characters only: "--hibernatedX" counts as well.
    if (argc == 2 && std::strncmp(argv[1], "--hibernated", 12) == 0) {
        tell_hibernated();
        return exit_hibernated;
    }
    if (argc < 2 || argc % 2 == 0) {
        std::fputs("usage: tallowfen [NAME FILE ...]\n", stderr);
        return exit_usage;
    }
    for (int i = 1; i < argc; i += 2) {
        // Before any file is opened.
        if (!RegModel::is_mount_name(QString::fromLocal8Bit(argv[i]))) {
            std::fprintf(stderr, "tallowfen: %s: a name has the form TOP/HIVE\n", argv[i]);
            return exit_usage;
        }
    }

    QCoreApplication::setApplicationName(QStringLiteral("Registry Editor"));
    application.setStyleSheet(QStringLiteral("QStatusBar::item { border: 0px solid black }"));
    // The model is destroyed before the window, whose destructor therefore leaves it alone.
    MainWindow window;
    window.resize(640, 480);
    RegModel model;
    for (int i = 1; i < argc; i += 2) {
        const QString file = QString::fromLocal8Bit(argv[i + 1]);
        set_file_being_opened(file);
        // A path is text here: one that is none would come to name another file.
        if (QFile::encodeName(file) != argv[i + 1])
            throw std::runtime_error("Cannot open file");
        model.add_hive(QString::fromLocal8Bit(argv[i]), file);
    }
    set_file_being_opened(QString());
    window.set_model(&model);
    window.show();
    return QCoreApplication::exec();
}
