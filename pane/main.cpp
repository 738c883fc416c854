// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// kavell-accounts-pane: the preferences pane of the user's online accounts.

#include <cstdio>
#include <cstdlib>

#include <QtCore/QCommandLineParser>
#include <QtGui/QIcon>
#include <QtWidgets/QApplication>

#include <kavellaccounts/KAPluginManager.h>

#include "pane/pane_window.h"
#include "pane/texts.h"

namespace {

constexpr int kPictureFailed = 2;

/// The platform plug-in ends the program without a word that helps when there is no display.
bool hasDisplay()
{
    return std::getenv("DISPLAY") || std::getenv("WAYLAND_DISPLAY") || std::getenv("QT_QPA_PLATFORM");
}

/// Ends the program with a picture of the window.
void savePicture(kavell::pane::PaneWindow &window, const QString &file)
{
    const bool isSaved = window.grab().save(file);
    if (!isSaved)
        std::fprintf(stderr, "kavell-accounts-pane: The picture cannot be written to %s.\n", qPrintable(file));
    QCoreApplication::exit(isSaved ? EXIT_SUCCESS : kPictureFailed);
}

}  // namespace

int main(int argc, char *argv[])
{
    if (!hasDisplay()) {
        std::fputs("kavell-accounts-pane: There is no display to show a window on. Start it in a desktop session, or, "
                   "to have a picture of it only, with QT_QPA_PLATFORM=offscreen and --picture FILE.\n",
                   stderr);
        return EXIT_FAILURE;
    }
    QApplication application(argc, argv);
    QApplication::setApplicationName(QStringLiteral("kavell-accounts-pane"));
    QApplication::setApplicationVersion(QStringLiteral(KAVELL_VERSION));
    QApplication::setDesktopFileName(QStringLiteral("com.corvane.KavellAccounts.Pane"));
    kavell::pane::installTexts(application);
    QApplication::setWindowIcon(QIcon::fromTheme(QStringLiteral("com.corvane.KavellAccounts.Pane")));

    QCommandLineParser parser;
    parser.setApplicationDescription(qtTrId("PROGRAM_DESCRIPTION"));
    parser.addHelpOption();
    parser.addVersionOption();
    const QCommandLineOption account(QStringLiteral("account"), qtTrId("OPTION_ACCOUNT"), QStringLiteral("LOGIN"));
    const QCommandLineOption picture(QStringLiteral("picture"), qtTrId("OPTION_PICTURE"), QStringLiteral("FILE"));
    parser.addOptions({account, picture});
    parser.process(application);

    (void)KAPluginManager::shared();  // before any other thread asks for it
    kavell::pane::PaneWindow window;
    if (parser.isSet(account))
        window.selectWhenRead(parser.value(account));
    if (parser.isSet(picture)) {
        QObject::connect(&window, &kavell::pane::PaneWindow::settled, &application,
                         [&] { savePicture(window, parser.value(picture)); });
    }
    window.show();
    return QApplication::exec();
}
