// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
// That the key tree has its folder icon on a machine without any icon theme.

#include "application.h"

#include <QIcon>
#include <QTest>

class FolderIconTest : public QObject {
    Q_OBJECT

private slots:
    void no_theme_is_installed() {
        // The offscreen platform looks for themes among the program's resources only, which hold none.
        QCOMPARE(QIcon::themeSearchPaths(), QStringList{QStringLiteral(":/icons")});
    }

    void the_folder_shows_all_the_same() {
        const QIcon folder = QIcon::fromTheme(QStringLiteral("folder"));
        QVERIFY(!folder.isNull());
        for (const int size : {16, 24, 32}) {
            QVERIFY(!folder.pixmap(size).isNull());
            QVERIFY(folder.pixmap(size).toImage().pixelColor(size / 2, size * 2 / 3).alpha() > 0);
        }
    }

    void the_icons_of_the_values_load() {
        for (const char* name : {"type_string.ico", "type_binary.ico"}) {
            const QIcon icon(QStringLiteral(TALLOWFEN_SHARE_DIR) + QLatin1String(name));
            for (const int size : {16, 32, 64})
                QCOMPARE(icon.pixmap(size).size(), QSize(size, size));
        }
    }
};

int main(int argc, char** argv) {
    Application application(argc, argv);
    FolderIconTest test;
    return QTest::qExec(&test, argc, argv);
}

#include "folder_icon_test.moc"
