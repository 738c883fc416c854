// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// An interface file of any bytes: it is read or the reason why not is there, its outlets and actions are wired, and all of
// its widgets go with it.

#include <QtCore/QStringList>
#include <QtWidgets/QApplication>
#include <QtWidgets/QLabel>
#include <QtWidgets/QPushButton>

#include "platform/qt/interface_file.h"
#include "tests/fuzz/fuzz_target.h"

using kavell::fuzz::require;

namespace {

void dropMessage(QtMsgType, const QMessageLogContext &, const QString &)
{
}

QApplication &application()
{
    static int count = 1;
    static char name[] = "fuzz_interface_file";
    static char *arguments[] = {name, nullptr};
    setenv("QT_QPA_PLATFORM", "offscreen", 1);
    static QApplication application(count, arguments);
    qInstallMessageHandler(dropMessage);
    return application;
}

}  // namespace

/// The toolkit's reader forgets some of what it makes for layouts that are wrong, such as the items of a form that have no
/// row and column: a hundred bytes for each. A layout that our loader forgot would be passed over with them; widgets are
/// counted below, and the tests of interface files have the sanitizer look at layouts without this.
extern "C" [[gnu::visibility("default")]] const char *__lsan_default_suppressions()
{
    return "leak:libQt6UiTools\n";
}

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    QApplication &app = application();
    {
        const kavell::fuzz::MemoryFile file(kavell::fuzz::textOf(data, size));
        QString problem;
        const auto interface = kavell::InterfaceFile::load(QString::fromStdString(file.path()), &problem);
        require(static_cast<bool>(interface) == problem.isEmpty(), "a file that cannot be read has a reason");
        if (interface) {
            require(interface->root() && !interface->root()->parent(), "the outermost widget has no parent");
            QObject receiver;
            static_cast<void>(interface->connectActions(&receiver));
            static_cast<void>(interface->view<QPushButton>(QStringLiteral("okButton")));
            QPointer<QLabel> outlet;
            const bool fits = interface->connectOutlet(outlet, QStringLiteral("nameLabel"));
            require(fits || !outlet, "a widget of another class is no outlet");
        }
    }
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
    require(app.allWidgets().isEmpty(), "no widget outlives its file");
    return 0;
}
