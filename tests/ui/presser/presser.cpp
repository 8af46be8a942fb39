// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
// A plugin that the toolkit loads into the program under test (QT_QPA_GENERIC_PLUGINS=presser): it stands for
// the person at the screen. It writes what comes up to standard output and answers it: a message box with its
// button, the main window by quitting.

#include <QApplication>
#include <QGenericPlugin>
#include <QLabel>
#include <QMainWindow>
#include <QMessageBox>
#include <QPushButton>
#include <QTimer>
#include <QTreeView>

#include <cstdio>

namespace {

void tell(const char* what, const QString& text) {
    std::printf("%s: %s\n", what, qPrintable(text));
    std::fflush(stdout);
}

void tell_window(const QMainWindow& window) {
    tell("window", window.windowTitle());
    std::printf("size: %d x %d\n", window.width(), window.height());
    const auto* tree = window.findChild<QTreeView*>();
    const QAbstractItemModel& keys = *tree->model();
    for (int top = 0; top < keys.rowCount(); top++) {
        const QModelIndex group = keys.index(top, 0);
        tell("group", group.data().toString());
        for (int row = 0; row < keys.rowCount(group); row++)
            tell("hive", keys.index(row, 0, group).data().toString());
    }
    tell("style", qApp->styleSheet());
}

class Presser : public QObject {
public:
    Presser() {
        connect(&timer_, &QTimer::timeout, this, &Presser::look);
        timer_.start(5);
    }

private:
    void look() {
        if (auto* box = qobject_cast<QMessageBox*>(QApplication::activeModalWidget())) {
            tell("box", box->windowTitle());
            tell("text", box->text());
            tell("icon", box->icon() == QMessageBox::Critical ? QStringLiteral("critical") : QStringLiteral("other"));
            tell("buttons", QString::number(box->standardButtons()));
            tell("parent", box->parentWidget() ? QStringLiteral("some") : QStringLiteral("none"));
            timer_.stop();
            box->button(QMessageBox::Ok)->click();
            return;
        }
        for (const QWidget* widget : QApplication::topLevelWidgets()) {
            const auto* window = qobject_cast<const QMainWindow*>(widget);
            if (window && window->isVisible()) {
                timer_.stop();
                tell_window(*window);
                QCoreApplication::exit(qEnvironmentVariableIntValue("PRESSER_EXIT"));
                return;
            }
        }
    }

    QTimer timer_;
};

class PresserPlugin : public QGenericPlugin {
    Q_OBJECT
    Q_PLUGIN_METADATA(IID QGenericPluginFactoryInterface_iid FILE "presser.json")

public:
    QObject* create(const QString& /*name*/, const QString& /*text*/) override { return new Presser; }
};

}  // namespace

#include "presser.moc"
