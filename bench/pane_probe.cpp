// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What pane_bench starts and measures from outside: `pane_probe pane` shows the preferences pane, `pane_probe window` an
// empty window of the same toolkit; each ends as soon as what it shows is on the screen.

#include <cstdlib>
#include <cstring>

#include <QtWidgets/QApplication>

#include <kavellaccounts/KAPluginManager.h>

#include "pane/background.h"
#include "pane/pane_window.h"
#include "pane/texts.h"

namespace {

/// Ends the program with the first picture that the window paints.
class EndAfterPainting : public QObject {
protected:
    bool eventFilter(QObject *watched, QEvent *event) override
    {
        if (event->type() == QEvent::Paint)
            QMetaObject::invokeMethod(QCoreApplication::instance(), &QCoreApplication::quit, Qt::QueuedConnection);
        return QObject::eventFilter(watched, event);
    }
};

}  // namespace

int main(int argc, char *argv[])
{
    QApplication application(argc, argv);
    EndAfterPainting end;
    if (argc == 2 && std::strcmp(argv[1], "window") == 0) {
        QWidget window;
        window.installEventFilter(&end);
        window.show();
        return QApplication::exec();
    }
    kavell::pane::installTexts(application);
    (void)KAPluginManager::shared();
    kavell::pane::PaneWindow window;
    QObject::connect(&window, &kavell::pane::PaneWindow::shown, &window, [&] {
        window.installEventFilter(&end);
        window.update();
    });
    window.show();
    const int status = QApplication::exec();
    kavell::pane::letBackgroundWorkFinish();
    return status;
}
