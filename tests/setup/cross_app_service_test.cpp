// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The cross-application set-up on a machine with the maker's online service: accounts of its newer kind, whose names begin
// with "brondel".

#include <kavellaccounts/KACrossAppSetupViewController.h>

#include <functional>

#include "tests/setup/cross_app_fixture.h"
#include "tests/setup/online_service_calls.h"

using namespace kavell::test;

namespace {

const QString kName = "brondel@nimbrel.example";
const QString kMailAddress = "brondel@nimbrel.example/mail/address";
const QString kNoService = "*** Warning: Couldn't determine service ID in _accountIsEnabledForApp.";

class CrossAppWithOnlineService : public CrossAppTest {
protected:
    void SetUp() override
    {
        CrossAppTest::SetUp();
        addListPlugin({.identifier = kKAQuillanePluginID,
                       .providerType = kKAProviderQuillane,
                       .serviceTypes = {"kKAServiceIMAP", "kKAServiceCalDAV", "kKAServiceCardDAV"}});
        addListPlugin({.identifier = kKANimbrelPluginID,
                       .providerType = kKAProviderNimbrel,
                       .serviceTypes = {"kKAServiceIM"},
                       .domains = {"nimbrel.example"}});
        onlineServiceVariable<bool>("testServiceEnabled") = false;
        takeOnlineServiceCalls();
    }

    static std::shared_ptr<Controller> from(const QString &source, const QVariantMap &settings)
    {
        return Controller::initWithSettings(settings, source);
    }
};

const QVariantMap kBrondel{{"emailAddress", kName}};

TEST_F(CrossAppWithOnlineService, ANameOfTheNewerServiceDecidesBeforeAnyDomain)
{
    const auto controller = from(kKAParlexAppID, kBrondel);
    EXPECT_EQ(shown(controller->view()), QStringList({"Mail", "Contacts", "Calendars"}));
    const auto older = from(kKAMailAppID, {{"emailAddress", "ada@nimbrel.example"}});
    EXPECT_EQ(shown(older->view()), QStringList{"Messages"});
}

TEST_F(CrossAppWithOnlineService, TheNameIsTheFirstOfThreeKeys)
{
    const auto isNewer = [](const QVariantMap &settings) {
        const auto controller = from(kKAParlexAppID, settings);
        static_cast<void>(controller->view());
        return controller->settings().contains("KACorvaneIDKey") && controller->settings() != settings;
    };
    const QString older = "ada@nimbrel.example";
    EXPECT_TRUE(isNewer({{"KACorvaneIDKey", kName}, {"emailAddress", older}}));
    EXPECT_FALSE(isNewer({{"KACorvaneIDKey", older}, {"emailAddress", kName}}));
    EXPECT_TRUE(isNewer({{"emailAddress", kName}, {"userName", older}}));
    EXPECT_FALSE(isNewer({{"emailAddress", older}, {"userName", kName}}));
    EXPECT_TRUE(isNewer({{"userName", kName}}));
}

TEST_F(CrossAppWithOnlineService, NameAndMailAddressComeIntoTheSettings)
{
    const auto controller = from(kKATidewellAppID, {{"userName", kName}});
    EXPECT_EQ(controller->numberOfAppsNeedingSetup(), 2);
    EXPECT_EQ(controller->settings(),
              QVariantMap({{"userName", kName}, {"KACorvaneIDKey", kName}, {"emailAddress", kMailAddress}}));
    EXPECT_EQ(takeOnlineServiceCalls(), QStringList({"refresh " + kName, "copyProperty " + kName + " mail address",
                                                     "isEnabled " + kName + " contacts"}));
}

TEST_F(CrossAppWithOnlineService, WithoutAMailAddressTheNameStandsInAndMailIsNotOffered)
{
    const QString name = "brondel.nomail@nimbrel.example";
    const auto controller = from(kKATidewellAppID, {{"emailAddress", name}});
    EXPECT_EQ(shown(controller->view()), QStringList{"Contacts"});
    EXPECT_EQ(controller->settings(),
              QVariantMap({{"emailAddress", name}, {"KACorvaneIDKey", name}, {"mailDisabled", "yes"}}));
}

TEST_F(CrossAppWithOnlineService, TheIdentifierIsFormedBeforeTheAddressIsKnown)
{
    // A name at the service is no address, and identifies no user among the accounts of applications.
    const auto controller = from(kKATidewellAppID, {{"KACorvaneIDKey", kName}});
    EXPECT_EQ(controller->view(), nullptr);
    EXPECT_EQ(controller->settings(), QVariantMap({{"KACorvaneIDKey", kName}}));
    EXPECT_TRUE(controller->view());
    EXPECT_EQ(shown(controller->view()), QStringList{});
    EXPECT_EQ(takeOnlineServiceCalls(), QStringList{});
}

TEST_F(CrossAppWithOnlineService, ContactsAndCalendarsAreThereWhenTheirServiceIsOn)
{
    onlineServiceVariable<bool>("testServiceEnabled") = true;
    const auto controller = from(kKAMailAppID, kBrondel);
    EXPECT_EQ(shown(controller->view()), QStringList({"Contacts (there)", "Calendars (there)"}));
    EXPECT_EQ(takeOnlineServiceCalls().mid(2),
              QStringList({"isEnabled " + kName + " contacts", "isEnabled " + kName + " calendars"}));
    EXPECT_EQ(controller->numberOfAppsNeedingSetup(), 0);
}

TEST_F(CrossAppWithOnlineService, MailIsThereWhenTheMailClientHasTheAccount)
{
    onlineServiceVariable<bool>("testServiceEnabled") = true;
    ScriptedDataPlugin &mail = addDataPlugin(kKAMailPluginID);
    EXPECT_EQ(shown(from(kKACardellAppID, kBrondel)->view()), QStringList({"Mail", "Calendars (there)"}));
    m_plugins.setSettings(&mail, "uid-1", kBrondel);
    EXPECT_EQ(shown(from(kKACardellAppID, kBrondel)->view()), QStringList({"Mail (there)", "Calendars (there)"}));
}

TEST_F(CrossAppWithOnlineService, OnlyTheMailPluginsAccountsAreSearched)
{
    m_plugins.setSettings(&addDataPlugin(kKAMailPluginID), "mail-uid", {});
    m_plugins.setSettings(&addDataPlugin(kKAContactsPluginID), "contacts-uid", {});
    const LogCapture log;
    EXPECT_EQ(from(kKATidewellAppID, kBrondel)->numberOfAppsNeedingSetup(), 2);
    EXPECT_EQ(log.messages(), QStringList{"*** Settings for mail-uid were empty"});
}

TEST_F(CrossAppWithOnlineService, FromTheMailClientNothingIsSearched)
{
    m_plugins.setSettings(&addDataPlugin(kKAMailPluginID), "mail-uid", {});
    const LogCapture log;
    EXPECT_EQ(from(kKAMailAppID, kBrondel)->numberOfAppsNeedingSetup(), 2);
    EXPECT_EQ(log.messages(), QStringList{});
}

TEST_F(CrossAppWithOnlineService, AMissingConstantIsLoggedAndCountsAsSwitchedOff)
{
    onlineServiceVariable<bool>("testServiceEnabled") = true;
    const WithoutConstant gone("kNBServiceIDContacts");
    const LogCapture log;
    EXPECT_EQ(from(kKAMailAppID, kBrondel)->numberOfAppsNeedingSetup(), 1);
    EXPECT_EQ(log.messages(), QStringList{kNoService});
}

TEST_F(CrossAppWithOnlineService, TickedApplicationsAreSwitchedOnAndMailIsMadeWithTheServicesAddress)
{
    addDataPlugin(kKAMailPluginID);
    addDataPlugin(kKAContactsPluginID);
    const auto controller = from(kKATidewellAppID, kBrondel);
    ASSERT_TRUE(controller->view());
    takeOnlineServiceCalls();
    EXPECT_TRUE(controller->createAccounts());
    EXPECT_EQ(started(), QStringList{kKAMailPluginID});
    ASSERT_TRUE(lastInput<KAMailAccountSetupInput>());
    EXPECT_EQ(lastInput<KAMailAccountSetupInput>()->emailAddress(), kMailAddress);
    EXPECT_EQ(takeOnlineServiceCalls(), QStringList({"isLoggedIn " + kName, "enable " + kName + " contacts"}));
    const auto outcomes = controller->applicationOutcomes();
    EXPECT_EQ(outcomes[0].accountUID, "new-com.corvane.mail.kaplugin");
    EXPECT_EQ(outcomes[1].state, Controller::ApplicationOutcome::State::Done);
    EXPECT_TRUE(outcomes[1].accountUID.isNull());
}

using MailWithOnlineService = CrossAppTest;

TEST_F(MailWithOnlineService, ANameThatIsTakenFromTheSettingsMeanwhileIsLoggedAndNothingIsFilledIn)
{
    addListPlugin({.identifier = kKAQuillanePluginID,
                   .providerType = kKAProviderQuillane,
                   .serviceTypes = {"kKAServiceIMAP"},
                   .domains = {"nimbrel.example"}});
    const QVariantMap nameless{{"KAChatLoginName", "ada@nimbrel.example"}};  // an identifier, but no name
    const auto controller = Controller::initWithSettings(kBrondel, kKATidewellAppID);
    auto &onAccountType = onlineServiceVariable<std::function<void()>>("testOnAccountType");
    onAccountType = [&] {
        controller->setSettings(nameless);
    };
    takeOnlineServiceCalls();
    const LogCapture log;
    EXPECT_EQ(controller->numberOfAppsNeedingSetup(), 1);
    onAccountType = nullptr;
    EXPECT_EQ(log.messages(), QStringList{"*** Couldn't determine Corvane ID"});
    EXPECT_EQ(controller->settings(), nameless);
    EXPECT_EQ(takeOnlineServiceCalls(), QStringList{});
}

using ChatWithOnlineService = CrossAppTest;

TEST_F(ChatWithOnlineService, AnApplicationThatTheServiceHasNothingForIsLoggedAndNeedsSetup)
{
    addListPlugin({.identifier = kKAQuillanePluginID,
                   .providerType = kKAProviderQuillane,
                   .serviceTypes = {"kKAServiceIM"},
                   .domains = {"nimbrel.example"}});
    onlineServiceVariable<bool>("testServiceEnabled") = true;
    const LogCapture log;
    EXPECT_EQ(Controller::initWithSettings(kBrondel, kKAMailAppID)->numberOfAppsNeedingSetup(), 1);
    EXPECT_EQ(log.messages(), QStringList{kNoService});
}

}  // namespace
