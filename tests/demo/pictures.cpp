// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Pictures of what a person sees: the pane, the sheet of the example plug-in, the table of applications, the certificate
// panel. docs/make_pictures runs it in a scratch home, once for each way to look at it.
//
//     pictures PREFIX [dark]        writes PREFIX-pane.png and so on

#include <QtCore/QTimer>
#include <QtWidgets/QLabel>
#include <QtWidgets/QStyle>
#include <QtWidgets/QStyleFactory>

#include <kavellaccounts/CSKavellAccount.h>
#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KAAppTableController.h>
#include <kavellaccounts/KACertificatePanel.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KAPluginManager.h>
#include <kavellaccounts/KAProvider.h>
#include <kavellaccounts/KASheetWindow.h>

#include "pane/background.h"
#include "pane/pane_window.h"
#include "pane/texts.h"
#include "tests/demo/screen.h"

namespace {

using namespace kavell::demo;

const QString kZorboType = QStringLiteral("com.corvane.account.testing");
constexpr QSize kTableSize{480, 240};
QString prefix;

void save(QWidget *widget, const char *name)
{
    const QString file = QStringLiteral("%1-%2.png").arg(prefix, QLatin1String(name));
    require(widget->grab().save(file), qPrintable(file + QStringLiteral(" is written")));
    std::printf("%s\n", qPrintable(file));
}

/// As desktops with a dark theme hand it to programs.
QPalette darkPalette()
{
    const QColor window(0x2b, 0x2b, 0x2b), base(0x1e, 0x1e, 0x1e), text(0xee, 0xee, 0xee), highlight(0x2f, 0x6f, 0x8f);
    QPalette palette(text, window, window.lighter(), window.darker(), window.lighter(), text, Qt::white, base, window);
    palette.setColor(QPalette::Highlight, highlight);
    palette.setColor(QPalette::HighlightedText, Qt::white);
    palette.setColor(QPalette::ToolTipBase, QColor(0x4a, 0x45, 0x2a));
    palette.setColor(QPalette::ToolTipText, text);
    for (const QPalette::ColorRole role : {QPalette::Text, QPalette::WindowText, QPalette::ButtonText})
        palette.setColor(QPalette::Disabled, role, text.darker());
    return palette;
}

std::shared_ptr<KAAccount> makeAccount(const QString &type, const QString &loginName, const QString &description)
{
    auto account = KAAccount::accountWithProviderType(type, loginName);
    account->setProviderAttribute(loginName, KAMailEmailAddressKey);
    account->setProviderAttribute(description.isEmpty() ? QVariant() : description, KAMailAccountDescriptionKey);
    account->setFullName(QStringLiteral("Ada Example"));
    for (const QString &pluginID : {kKAMailPluginID, kKACalendarPluginID}) {
        const QString uid = account->uid() + pluginID;
        account->addChildAccountDict(KAAccount::childDictionaryWithSettings({}, uid, pluginID), uid);
    }
    _CSKavellAccountCommitChanges(account->accountRef());
    return account;
}

/// A pane that has come to rest.
std::unique_ptr<kavell::pane::PaneWindow> openPane()
{
    auto pane = std::make_unique<kavell::pane::PaneWindow>();
    bool isSettled = false;
    QObject::connect(pane.get(), &kavell::pane::PaneWindow::settled, [&] { isSettled = true; });
    pane->show();
    waitFor([&] { return isSettled; }, "the pane comes to rest");
    return pane;
}

QWidget *sheet()
{
    const QWidgetList windows = QApplication::topLevelWidgets();
    for (QWidget *window : windows) {
        if (qobject_cast<KASheetWindow *>(window) && window->isVisible())
            return window;
    }
    return nullptr;
}

void showSheet(KAAListPlugin &zorbo)
{
    QWidget window;
    window.show();
    zorbo.createAccountInWindow(&window);
    type("addressField", QStringLiteral("bert@zorbo.example"));
    type("fullNameField", QStringLiteral("Bert Example"));
    type("passwordField", QStringLiteral("wrong"));
    save(sheet(), "sheet-sign-in");
    click("signInContinue");
    waitFor([] { return visible<QWidget>("validationView") != nullptr; }, "the password is tried");
    save(sheet(), "sheet-validation");
    waitFor([] { return visible<QLineEdit>("passwordField") != nullptr; }, "the password is refused");
    save(sheet(), "sheet-refused");
    type("passwordField", QStringLiteral("right"));
    click("signInContinue");
    waitFor([] { return checkBoxOf(kKAParlexAppID) != nullptr; }, "the applications are offered");
    save(sheet(), "sheet-applications");
    click("appSelectionCancel");
}

void showTable(KAAListPlugin &zorbo, const std::shared_ptr<KAAccount> &account, const char *name)
{
    const auto table = KAAppTableController::initWithAccount(account, &zorbo);
    table->view()->resize(kTableSize);
    table->view()->show();
    waitFor([] { return checkBoxOf(kKAParlexAppID) != nullptr; }, "the table's rows");
    table->startProgressForApp(table->appAtRow(1));
    QTest::qWait(50);
    save(table->view(), name);
}

void showCertificatePanel()
{
    const QList<QSslCertificate> chain = QSslCertificate::fromPath(qEnvironmentVariable("KAVELL_PICTURE_CERTIFICATE"));
    require(!chain.isEmpty(), "there is a certificate");
    QTimer::singleShot(300, [] {
        QWidget *const panel = QApplication::activeModalWidget();
        require(panel, "the certificate panel is shown");
        save(panel, "certificate-panel");
        panel->close();
    });
    const KAError error(QStringLiteral("NetworkError"), -1202,
                        {{KAError::failingURLKey, QUrl(QStringLiteral("https://imap.zorbo.example/"))},
                         {KAError::peerCertificateChainKey, QVariant::fromValue(chain)}});
    (void)KAShowCertificatePanelForError(error, qtTrId("PANE_TITLE"));
}

}  // namespace

int main(int argc, char *argv[])
{
    QApplication application(argc, argv);
    QApplication::setStyle(QStyleFactory::create(QStringLiteral("Fusion")));
    const QStringList arguments = QApplication::arguments();
    require(arguments.size() >= 2, "the first argument is where the pictures go");
    prefix = arguments[1];
    if (arguments.value(2) == QLatin1String("dark"))
        QApplication::setPalette(darkPalette());
    kavell::pane::installTexts(application);
    auto *const zorbo = qobject_cast<KAAListPlugin *>(KAPluginManager::shared()->pluginWithIdentifier(kKATestPluginID));
    require(zorbo, "the example plug-in is installed");

    save(openPane().get(), "pane-empty");
    const auto account = makeAccount(kZorboType, QStringLiteral("ada@zorbo.example"), QStringLiteral("Ada at work"));
    makeAccount(kZorboType, QStringLiteral("ada.lovelace.the.first.programmer@mathematics.zorbo.example"), QString());
    makeAccount(kKAProviderGoogle, QStringLiteral("ada@gmail.com"), QString());
    auto off = makeAccount(kKAProviderYahoo, QStringLiteral("ada@yahoo.com"), QString());
    off->setAccountEnabled(false);
    _CSKavellAccountCommitChanges(off->accountRef());
    save(openPane().get(), "pane");
    showSheet(*zorbo);
    showTable(*zorbo, account, "table");
    account->setProviderAttribute(true, QStringLiteral("KAConflictsWithAerwyn"));
    showTable(*zorbo, account, "table-conflict");
    showCertificatePanel();
    kavell::pane::letBackgroundWorkFinish();
    return EXIT_SUCCESS;
}
