// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The example account-list plug-in turning an account on and off for client applications, whose data plug-ins are the
// examples that keep accounts in files.

#include <gmock/gmock.h>

#include <kavellaccounts/CSKavellAccountConstants.h>
#include <kavellaccounts/CSKavellNotification.h>
#include <kavellaccounts/Ref.h>

#include "tests/integration/zorbo_fixture.h"

namespace kavell::test {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::SizeIs;
using testing::UnorderedElementsAre;

class ZorboSwitch : public ZorboTest {
protected:
    void SetUp() override
    {
        ZorboTest::SetUp();
        m_observation = KANotificationCenter::shared().addObserver(
            KAChangedAccountsNotification, [this](const KANotification &notification) {
                m_ended += notification.object.value<QList<std::shared_ptr<KAAccount>>>();
            });
    }

    void TearDown() override
    {
        m_observation.reset();
        ZorboTest::TearDown();
    }

    /// Gives an order and waits until it has been carried out.
    void turn(bool on, const QString &appBundleID, const std::shared_ptr<KAAccount> &account)
    {
        const qsizetype before = m_ended.size();
        zorbo().setEnabled(on, application(appBundleID), account, window());
        ASSERT_TRUE(endsAfter(before + 1));
        EXPECT_EQ(m_ended.last(), account);
    }

    [[nodiscard]] bool endsAfter(qsizetype orders)
    {
        return runUntil([&] { return m_ended.size() >= orders; });
    }

    [[nodiscard]] static std::shared_ptr<KAApplication> application(const QString &appBundleID)
    {
        return KAPluginManager::shared()->applicationWithBundleID(appBundleID);
    }

    /// What the message boxes on the screen say.
    [[nodiscard]] static QStringList messages()
    {
        QStringList texts;
        for (const QWidget *candidate : QApplication::topLevelWidgets()) {
            const auto *const box = qobject_cast<const QMessageBox *>(candidate);
            if (box && box->isVisible())
                texts += box->text();
        }
        return texts;
    }

    [[nodiscard]] static QString childUID(const KAAccount &account, const QString &pluginID = kKAMailPluginID)
    {
        return account.childAccountWithPluginID(pluginID).value_or(QVariantMap()).value("uid").toString();
    }

private:
    QList<std::shared_ptr<KAAccount>> m_ended;
    KANotificationCenter::Observation m_observation;
};

TEST_F(ZorboSwitch, OnMakesAnAccountInTheApplication)
{
    installAllDataPlugins();
    const auto account = storedAccount("secret");
    turn(true, kKAMailAppID, account);

    EXPECT_TRUE(account->enabledForApplication(kKAMailAppID));
    const auto child = account->childAccountWithPluginID(kKAMailPluginID);
    ASSERT_TRUE(child);
    EXPECT_EQ(child->value("emailAddress").toString(), "carla@zorbo.example");
    EXPECT_EQ(child->value("incomingMailServer").toString(), "imap.zorbo.example");
    EXPECT_THAT(mailData().accountUIDs(), ElementsAre(child->value("uid").toString()));
    EXPECT_EQ(mailData().settingsForAccountUID(child->value("uid").toString()).value("fullName").toString(),
              "Carla Zorbo");
    EXPECT_THAT(messages(), IsEmpty());
}

TEST_F(ZorboSwitch, WhatWasTurnedOnIsStored)
{
    installAllDataPlugins();
    turn(true, kKAMailAppID, storedAccount());
    ASSERT_THAT(storedAccounts(), SizeIs(1));
    EXPECT_TRUE(storedAccounts().first()->enabledForApplication(kKAMailAppID));
}

TEST_F(ZorboSwitch, AllFourApplicationsCanBeTurnedOn)
{
    installAllDataPlugins();
    const auto account = storedAccount("secret");
    const QStringList applications{kKAMailAppID, kKACardellAppID, kKATidewellAppID, kKAParlexAppID};
    for (const QString &each : applications)
        zorbo().setEnabled(true, application(each), account, window());
    ASSERT_TRUE(endsAfter(4));
    EXPECT_THAT(account->enabledApplications(false).value_or(QStringList()),
                UnorderedElementsAre(kKAMailAppID, kKACardellAppID, kKATidewellAppID, kKAParlexAppID));
    EXPECT_EQ(account->childAccountWithPluginID(kKACalendarPluginID)->value("serverAddress"), "calendar.zorbo.example");
    EXPECT_EQ(account->childAccountWithPluginID(kKAContactsPluginID)->value("serverAddress"), "contacts.zorbo.example");
    EXPECT_EQ(account->childAccountWithPluginID(kKAChatPluginID)->value("KAChatAccountType"), "jabber");
}

TEST_F(ZorboSwitch, AnsweringAtOnceItWorksLater)
{
    installAllDataPlugins();
    const auto account = storedAccount();
    zorbo().setEnabled(true, application(kKAMailAppID), account, window());
    EXPECT_FALSE(account->enabledForApplication(kKAMailAppID));
    ASSERT_TRUE(endsAfter(1));
    EXPECT_TRUE(account->enabledForApplication(kKAMailAppID));
}

TEST_F(ZorboSwitch, OffKeepsTheApplicationsAccountForTheNextOn)
{
    installAllDataPlugins();
    const auto account = storedAccount();
    turn(true, kKAMailAppID, account);
    const QString uid = childUID(*account);

    turn(false, kKAMailAppID, account);
    EXPECT_FALSE(account->enabledForApplication(kKAMailAppID));
    EXPECT_THAT(mailData().accountUIDs(), ElementsAre(uid));

    turn(true, kKAMailAppID, account);
    EXPECT_TRUE(account->enabledForApplication(kKAMailAppID));
    EXPECT_EQ(childUID(*account), uid);
    EXPECT_THAT(mailData().accountUIDs(), ElementsAre(uid));
}

TEST_F(ZorboSwitch, OffAndOnTellEveryProcessWithoutSavingWhatIsNoNews)
{
    installAllDataPlugins();
    const auto account = storedAccount();
    turn(true, kKAMailAppID, account);
    const std::string path = dataFilePath(kZorboProviderType.toStdString(), "carla@zorbo.example");
    const auto saved = std::filesystem::last_write_time(path);
    const auto changes = adopt(CSKavellNotificationObserverCreate(kCSKavellAccountNotificationSender));
    for (const bool on : {false, true}) {
        turn(on, kKAMailAppID, account);
        const auto change = adopt(CSKavellNotificationObserverCopyNext(changes.get()));
        ASSERT_TRUE(change);
        EXPECT_TRUE(CSKavellEqual(CSKavellNotificationGetObject(change.get()),
                                  kCSKavellAccountProviderSettingsChangedNotification));
        EXPECT_EQ(toStringView(static_cast<CSKavellStringRef>(CSKavellDictionaryGetValue(
                      CSKavellNotificationGetUserInformation(change.get()), kCSKavellAccountUserLoginName))),
                  "carla@zorbo.example");
        EXPECT_FALSE(adopt(CSKavellNotificationObserverCopyNext(changes.get())));
    }
    EXPECT_EQ(std::filesystem::last_write_time(path), saved);
}

TEST_F(ZorboSwitch, OffOfWhatIsNotOnChangesNothing)
{
    installAllDataPlugins();
    const auto account = storedAccount();
    turn(false, kKAMailAppID, account);
    EXPECT_THAT(account->allChildAccounts(), IsEmpty());
    EXPECT_THAT(mailData().accountUIDs(), IsEmpty());
    EXPECT_THAT(messages(), IsEmpty());
}

TEST_F(ZorboSwitch, TheLastOfSeveralOrdersStands)
{
    installAllDataPlugins();
    const auto account = storedAccount();
    for (const bool on : {true, false, true, false})
        zorbo().setEnabled(on, application(kKAMailAppID), account, window());
    ASSERT_TRUE(endsAfter(4));
    EXPECT_FALSE(account->enabledForApplication(kKAMailAppID));
    EXPECT_THAT(mailData().accountUIDs(), SizeIs(1));
}

TEST_F(ZorboSwitch, AnAccountThatWasDeletedInTheApplicationIsMadeAnew)
{
    installAllDataPlugins();
    const auto account = storedAccount();
    turn(true, kKAMailAppID, account);
    const QString former = childUID(*account);
    mailData().deleteAccountUID(former);
    turn(true, kKAMailAppID, account);
    EXPECT_NE(childUID(*account), former);
    EXPECT_THAT(account->allChildAccounts(), SizeIs(1));
    EXPECT_THAT(mailData().accountUIDs(), ElementsAre(childUID(*account)));
}

TEST_F(ZorboSwitch, AMissingDataPluginIsSaidAndTheAccountStaysAsItIs)
{
    const auto account = storedAccount();
    turn(true, kKAMailAppID, account);
    EXPECT_THAT(messages(), ElementsAre(application(kKAMailAppID)->displayName() +
                                        " cannot be reached: the plug-in that connects it with your accounts is not "
                                        "installed."));
    EXPECT_FALSE(account->enabledForApplication(kKAMailAppID));
    EXPECT_THAT(account->allChildAccounts(), IsEmpty());
    EXPECT_FALSE(account->hasPendingChanges());
}

TEST_F(ZorboSwitch, AChildWhoseDataPluginIsGoneIsForgotten)
{
    const auto account = storedAccount();
    account->addChildAccountDict(KAAccount::childDictionaryWithSettings({}, "U", kKAMailPluginID), "U");
    commit(account);
    ASSERT_TRUE(account->enabledForApplication(kKAMailAppID));
    turn(false, kKAMailAppID, account);
    EXPECT_FALSE(storedAccounts().first()->enabledForApplication(kKAMailAppID));
    EXPECT_THAT(messages(), SizeIs(1));
}

TEST_F(ZorboSwitch, TheReasonOfTheApplicationIsSaid)
{
    installAllDataPlugins();
    const std::string file = homePath("data/kavell-accounts-example/com.corvane.mail.kaplugin.json");
    std::filesystem::create_directories(file);  // a directory in the file's place
    const auto account = storedAccount();
    turn(true, kKAMailAppID, account);
    ASSERT_THAT(messages(), SizeIs(1));
    EXPECT_THAT(messages().first().toStdString(), HasSubstr("The accounts in " + file + " cannot be read: "));
    EXPECT_FALSE(account->enabledForApplication(kKAMailAppID));
}

TEST_F(ZorboSwitch, WithoutAWindowAProblemIsNoMessage)
{
    const auto account = storedAccount();
    zorbo().setEnabled(true, application(kKAMailAppID), account, nullptr);
    ASSERT_TRUE(endsAfter(1));
    EXPECT_THAT(messages(), IsEmpty());
}

TEST_F(ZorboSwitch, AnAccountThatIsRemovedMeanwhileIsNotBroughtBack)
{
    installAllDataPlugins();
    const auto account = storedAccount();
    turn(true, kKAMailAppID, account);
    const QString uid = childUID(*account);

    zorbo().setEnabled(false, application(kKAMailAppID), account, window());
    KAProvider::initWithProviderType(kZorboProviderType)->removeAccount(account);
    ASSERT_TRUE(endsAfter(2));
    EXPECT_THAT(storedAccounts(), IsEmpty());
    EXPECT_TRUE(mailData().settingsForAccountUID(uid).value(KAMailInactiveAccountKey).toBool());
}

TEST_F(ZorboSwitch, WhatIsMadeForAnAccountThatIsRemovedMeanwhileIsTurnedOff)
{
    installAllDataPlugins();
    const auto account = storedAccount();
    zorbo().setEnabled(true, application(kKAMailAppID), account, window());
    KAProvider::initWithProviderType(kZorboProviderType)->removeAccount(account);
    ASSERT_TRUE(endsAfter(1));
    EXPECT_THAT(storedAccounts(), IsEmpty());
    ASSERT_THAT(mailData().accountUIDs(), SizeIs(1));
    const QString uid = mailData().accountUIDs().first();
    EXPECT_TRUE(mailData().settingsForAccountUID(uid).value(KAMailInactiveAccountKey).toBool());
}

TEST_F(ZorboSwitch, WhatTheSheetAddsIsTurnedOnByTheHost)
{
    installAllDataPlugins();
    std::shared_ptr<KAAccount> created;
    const auto host = KANotificationCenter::shared().addObserver(
        KACreatedAccountsNotification, [&](const KANotification &notification) {
            created = notification.object.value<QList<std::shared_ptr<KAAccount>>>().first();
            const auto selected = notification.userInformation.value("selectedApps");
            for (const auto &each : selected.value<QList<std::shared_ptr<KAApplication>>>())
                zorbo().setEnabled(true, each, created, window());
        });
    openApplications();
    QTest::mouseClick(checkBox(kKAParlexAppID), Qt::LeftButton);
    QTest::mouseClick(checkBox(kKACardellAppID), Qt::LeftButton);
    click("appSelectionOKButton");
    ASSERT_TRUE(endsAfter(2));
    EXPECT_THAT(storedAccounts().first()->enabledApplications(false).value_or(QStringList()),
                UnorderedElementsAre(kKAMailAppID, kKATidewellAppID));
}

}  // namespace kavell::test
