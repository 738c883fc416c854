// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The whole road of one account, with real plug-ins and real clicks: an address is identified, its account is added in
// the plug-in's sheet, offered to and made in the other applications, found again from their accounts, shown in the
// preferences pane, switched off for one application there, and removed.
//
//     whole_road [PICTURE.png]        the pane's picture goes to the file
//
// VESK_FRAMEWORK_PATH names the directory of the example plug-ins, with Zorbo in the place of the test provider: only
// accounts of the provider types that the library knows are offered from one application to the others. Run it in a scratch home: it makes and removes
// accounts. Ends with 0 when every step did what it should.

#include <cstdio>
#include <cstdlib>
#include <functional>

#include <QtTest/QTest>
#include <QtWidgets/QApplication>
#include <QtWidgets/QCheckBox>
#include <QtWidgets/QLabel>
#include <QtWidgets/QLineEdit>
#include <QtWidgets/QPushButton>

#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KAAppTableRow.h>
#include <kavellaccounts/KAApplication.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KACrossAppSetupViewController.h>
#include <kavellaccounts/KADataPlugin.h>
#include <kavellaccounts/KAPluginManager.h>
#include <kavellaccounts/KAProvider.h>

#include "pane/background.h"
#include "pane/pane_window.h"
#include "pane/texts.h"
#include "tests/demo/screen.h"

namespace {

using namespace kavell::demo;

const QString kAddress = QStringLiteral("carla@zorbo.example");
constexpr QSize kPictureSize{880, 720};

void say(const QString &sentence)
{
    std::printf("  %s\n", qPrintable(sentence));
    std::fflush(stdout);
}

std::shared_ptr<KAAccount> storedAccount()
{
    return KAProvider::initWithProviderType(kKAProviderTest)->accountForLoginName(kAddress, false);
}

template <typename Plugin> Plugin *pluginWithIdentifier(const QString &identifier)
{
    auto *const plugin = qobject_cast<Plugin *>(KAPluginManager::shared()->pluginWithIdentifier(identifier));
    require(plugin, qPrintable(identifier + QStringLiteral(" is installed")));
    return plugin;
}

void identify()
{
    const QString plugin = KAAccount::aListPluginIDForSettings({{KAMailEmailAddressKey, kAddress}});
    require(plugin == kKATestPluginID, "the address is the Zorbo plug-in's");
    say(QStringLiteral("%1 is served by %2").arg(kAddress, plugin));
}

/// The pane's button, the kind of account, and the plug-in's three pages. Only mail is picked there.
void addInTheSheet()
{
    click("addFirstAccount");
    click("continue");
    type("addressField", kAddress);
    type("passwordField", QStringLiteral("correct horse"));
    type("fullNameField", QStringLiteral("Carla Example"));
    click("signInContinue");
    waitFor([] { return checkBoxOf(kKAMailAppID) && visible<QPushButton>("appSelectionOKButton"); },
            "the sheet offers the applications");
    for (const QString &application : {kKACardellAppID, kKATidewellAppID, kKAParlexAppID})
        QTest::mouseClick(checkBoxOf(application), Qt::LeftButton);
    click("appSelectionOKButton");
    waitFor([] { return storedAccount() && storedAccount()->enabledForApplication(kKAMailAppID); },
            "the account is saved, and mail uses it");
    say(QStringLiteral("%1 was added in the plug-in's sheet, for mail").arg(kAddress));
}

/// What the mail program has of the account, as it would hand it in.
QVariantMap settingsOfMail()
{
    auto *const mail = pluginWithIdentifier<KADataPlugin>(kKAMailPluginID);
    const QStringList uids = mail->accountUIDs();
    require(uids.size() == 1, "the mail program has one account");
    QVariantMap settings = mail->settingsForAccountUID(uids.first());
    settings.insert(QStringLiteral("password"), storedAccount()->password());
    return settings;
}

class SetupDelegate : public QObject {
    Q_OBJECT

public:
    Q_INVOKABLE void controllerDidSave(KACrossAppSetupViewController *, bool, void *) { isTold = true; }
    bool isTold = false;
};

void offerToTheOtherApplications()
{
    const auto controller = KACrossAppSetupViewController::initWithSettings(settingsOfMail(), kKAMailAppID);
    require(controller->numberOfAppsNeedingSetup() == 3, "three other applications can use the account");
    controller->view()->show();
    const auto delegate = std::make_shared<SetupDelegate>();
    controller->createAccountsWithDelegate(delegate, nullptr, nullptr);
    waitFor([&] { return delegate->isTold; }, "the accounts are made");
    controller->view()->hide();
    const auto outcomes = controller->applicationOutcomes();
    for (const auto &outcome : outcomes) {
        require(outcome.state == KACrossAppSetupViewController::ApplicationOutcome::State::Done,
                qPrintable(outcome.appBundleID + QStringLiteral(" has the account: ") + outcome.failureReason));
        say(QStringLiteral("made in %1 too").arg(outcome.appBundleID));
    }
}

/// As each application does that finds an account of its own: which account of the list is it? It joins that one. (Chat
/// accounts are told by the kind of their service alone, and a service of the test provider has none.)
void findAgainFromEachApplication()
{
    for (const QString &pluginID : {kKAContactsPluginID, kKACalendarPluginID}) {
        auto *const plugin = pluginWithIdentifier<KADataPlugin>(pluginID);
        const QString uid = plugin->accountUIDs().value(0);
        const QVariantMap settings = plugin->settingsForAccountUID(uid);
        const auto match = KAPluginManager::shared()->matchingAListAccountForAccountSettings(settings, pluginID);
        require(match && match->loginName() == kAddress, qPrintable(pluginID + QStringLiteral(" finds the account")));
        // Opened anew: children are saved together, and the plug-in has saved one since the match was read.
        const auto account = storedAccount();
        account->addChildAccountDict(KAAccount::childDictionaryWithSettings(settings, uid, pluginID), uid);
        _CSKavellAccountCommitChanges(account->accountRef());
        say(QStringLiteral("%1 found %2 from its own settings").arg(plugin->userVisibleProviderName(), kAddress));
    }
}

void showInThePane(QWidget &pane, const QString &picture)
{
    for (const QString &application : {kKAMailAppID, kKACardellAppID, kKATidewellAppID})
        waitFor([&] { return checkBoxOf(application) && checkBoxOf(application)->isChecked(); },
                "the pane shows which applications use the account");
    if (!picture.isEmpty()) {
        require(pane.grab().save(picture), "the picture is written");
        say(QStringLiteral("the pane shows it: %1").arg(picture));
    }
}

void switchOffInThePane()
{
    QTest::mouseClick(checkBoxOf(kKATidewellAppID), Qt::LeftButton);
    waitFor([] { return !storedAccount()->enabledForApplication(kKATidewellAppID); }, "the calendar lets go of it");
    require(storedAccount()->enabledForApplication(kKAMailAppID), "mail still uses it");
    say(QStringLiteral("switched off for the calendar, by its check box in the pane"));
}

void removeInThePane()
{
    click("removeAccount");
    click("agree");
    waitFor([] { return !storedAccount(); }, "the account is gone");
    waitFor([] { return visible<QPushButton>("addFirstAccount") != nullptr; }, "the pane is empty again");
    say(QStringLiteral("removed, after a question, in the pane"));
}

}  // namespace

int main(int argc, char *argv[])
{
    QApplication application(argc, argv);
    kavell::pane::installTexts(application);
    (void)KAPluginManager::shared();
    {
        kavell::pane::PaneWindow pane;
        pane.resize(kPictureSize);
        pane.show();
        identify();
        addInTheSheet();
        offerToTheOtherApplications();
        findAgainFromEachApplication();
        showInThePane(pane, application.arguments().value(1));
        switchOffInThePane();
        removeInThePane();
    }
    kavell::pane::letBackgroundWorkFinish();
    return EXIT_SUCCESS;
}

#include "whole_road.moc"
