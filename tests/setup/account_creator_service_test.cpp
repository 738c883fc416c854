// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Creators on a machine with the maker's online service: accounts of its newer kind.

#include <kavellaccounts/KAAListPlugin.h>

#include <future>

#include <QtTest/QTest>

#include "tests/setup/creator_fixture.h"
#include "tests/setup/online_service_calls.h"

using namespace kavell::test;

namespace {

class CreatorWithOnlineService : public CreatorTest {
protected:
    void SetUp() override
    {
        CreatorTest::SetUp();
        takeOnlineServiceCalls();
    }

    /// A creator for an account of the newer service, by a class whose input would be seen.
    std::shared_ptr<KAAccountCreator> creatorFor(const QString &pluginID, const std::optional<QVariantMap> &settings)
    {
        const auto creator = KATidewellAccountCreator::initWithSettings(settings, &plugin(pluginID));
        creator->setProvider(provider(kKAProviderQuillane));
        return creator;
    }

    /// The registered plug-in of the newer service, which warns of moving these services.
    KAPlugin *addWarningPlugin(const QStringList &services, bool answer)
    {
        addListPlugin(kKAQuillanePluginID, kKAProviderQuillane);
        KAPlugin *const listPlugin = KAPluginManager::shared()->pluginWithIdentifier(kKAQuillanePluginID);
        EXPECT_TRUE(listPlugin);
        listPlugin->setProperty("alertServices", services);
        listPlugin->setProperty("alertAnswer", answer);
        return listPlugin;
    }
};

TEST_F(CreatorWithOnlineService, CalendarsAreSwitchedOnAndNoAccountIsMade)
{
    const auto creator = creatorFor(kKACalendarPluginID, QVariantMap());
    creator->setCorvaneID("anna");
    EXPECT_TRUE(creator->create());
    EXPECT_EQ(starts, 0);
    EXPECT_EQ(takeOnlineServiceCalls(), QStringList({"isLoggedIn anna", "enable anna calendars"}));
    EXPECT_TRUE(creator->createdAccountUID().isNull());
    EXPECT_TRUE(creator->failureReason().isNull());
}

TEST_F(CreatorWithOnlineService, ContactsAreSwitchedOnAndNoAccountIsMade)
{
    const auto creator = creatorFor(kKAContactsPluginID, QVariantMap());
    creator->setCorvaneID("anna");
    EXPECT_TRUE(creator->create());
    EXPECT_EQ(starts, 0);
    EXPECT_EQ(takeOnlineServiceCalls(), QStringList({"isLoggedIn anna", "enable anna contacts"}));
}

TEST_F(CreatorWithOnlineService, MailIsMadeLikeAnyOtherAndNothingIsSwitchedOn)
{
    const auto creator = creatorFor(kKAMailPluginID, kSettings);
    EXPECT_TRUE(creator->create());
    EXPECT_EQ(starts, 1);
    EXPECT_EQ(creator->createdAccountUID(), "uid-1");
    EXPECT_EQ(takeOnlineServiceCalls(), QStringList{});
}

TEST_F(CreatorWithOnlineService, ChatHasNoServiceAndIsNotMade)
{
    const auto creator = creatorFor(kKAChatPluginID, QVariantMap());
    creator->setCorvaneID("anna");
    EXPECT_TRUE(creator->create());
    EXPECT_EQ(starts, 0);
    EXPECT_EQ(takeOnlineServiceCalls(), QStringList{"isLoggedIn anna"});
}

TEST_F(CreatorWithOnlineService, OtherProvidersDoNotAskIt)
{
    const auto creator = KATidewellAccountCreator::initWithSettings(kSettings, &plugin(kKACalendarPluginID));
    creator->setProvider(provider(kKAProviderNimbrel));
    creator->setCorvaneID("anna");
    EXPECT_TRUE(creator->create());
    EXPECT_EQ(starts, 1);
    EXPECT_EQ(takeOnlineServiceCalls(), QStringList{});
}

TEST_F(CreatorWithOnlineService, WhoIsNotLoggedInIsLoggedInWithThePassword)
{
    const auto creator = creatorFor(kKACalendarPluginID, QVariantMap{{"password", "right"}});
    creator->setCorvaneID("berta");
    EXPECT_TRUE(creator->create());
    EXPECT_EQ(takeOnlineServiceCalls(),
              QStringList({"isLoggedIn berta", "login berta right", "enable berta calendars"}));
}

TEST_F(CreatorWithOnlineService, AFailedLoginChangesNothing)
{
    const auto creator = creatorFor(kKACalendarPluginID, QVariantMap{{"password", "wrong"}});
    creator->setCorvaneID("berta");
    EXPECT_TRUE(creator->create());
    EXPECT_EQ(takeOnlineServiceCalls(),
              QStringList({"isLoggedIn berta", "login berta wrong", "enable berta calendars"}));
}

TEST_F(CreatorWithOnlineService, WithoutAPasswordNobodyIsLoggedIn)
{
    const auto creator = creatorFor(kKACalendarPluginID, QVariantMap{{"password", QString()}});
    creator->setCorvaneID("berta");
    EXPECT_TRUE(creator->create());
    EXPECT_EQ(takeOnlineServiceCalls(), QStringList({"isLoggedIn berta", "enable berta calendars"}));
}

TEST_F(CreatorWithOnlineService, WhoIsLoggedInIsNotLoggedInAgain)
{
    const auto creator = creatorFor(kKACalendarPluginID, QVariantMap{{"password", "right"}});
    creator->setCorvaneID("anna");
    EXPECT_TRUE(creator->create());
    EXPECT_EQ(takeOnlineServiceCalls(), QStringList({"isLoggedIn anna", "enable anna calendars"}));
}

TEST_F(CreatorWithOnlineService, TheNameIsTheAddressElseTheUserNameOfTheSettings)
{
    const auto byAddress =
        creatorFor(kKACalendarPluginID, QVariantMap{{"emailAddress", "berta@x.example"}, {"userName", "carla"}});
    EXPECT_TRUE(byAddress->create());
    EXPECT_EQ(byAddress->corvaneID(), "berta@x.example");
    const auto byUserName = creatorFor(kKACalendarPluginID, QVariantMap{{"userName", "carla"}});
    EXPECT_TRUE(byUserName->create());
    EXPECT_EQ(byUserName->corvaneID(), "carla");
    EXPECT_EQ(takeOnlineServiceCalls(), QStringList({"isLoggedIn berta@x.example", "enable berta@x.example calendars",
                                                     "isLoggedIn carla", "enable carla calendars"}));
}

TEST_F(CreatorWithOnlineService, TheNameThatWasSetComesFirst)
{
    const auto creator = creatorFor(kKACalendarPluginID, QVariantMap{{"emailAddress", "berta@x.example"}});
    creator->setCorvaneID("anna");
    EXPECT_TRUE(creator->create());
    EXPECT_EQ(creator->corvaneID(), "anna");
}

TEST_F(CreatorWithOnlineService, AnEmptyNameIsAName)
{
    const auto creator = creatorFor(kKACalendarPluginID, QVariantMap{{"emailAddress", "berta@x.example"}});
    creator->setCorvaneID("");
    EXPECT_TRUE(creator->create());
    EXPECT_EQ(takeOnlineServiceCalls(), QStringList({"isLoggedIn ", "enable  calendars"}));
    const auto emptyAddress = creatorFor(kKACalendarPluginID, QVariantMap{{"emailAddress", ""}, {"userName", "carla"}});
    EXPECT_TRUE(emptyAddress->create());
    EXPECT_EQ(takeOnlineServiceCalls(), QStringList({"isLoggedIn ", "enable  calendars"}));
}

TEST_F(CreatorWithOnlineService, WithoutAnyNameItFails)
{
    const LogCapture log;
    const auto creator = creatorFor(kKACalendarPluginID, QVariantMap{{"password", "right"}});
    EXPECT_FALSE(creator->create());
    EXPECT_EQ(log.messages(), QStringList{"*** KAAccountCreator: couldn't determine Corvane ID"});
    EXPECT_EQ(takeOnlineServiceCalls(), QStringList{});
    EXPECT_EQ(creator->failureReason(), "The account's name at the online service is not known.");
}

TEST_F(CreatorWithOnlineService, AServiceWithoutItsConstantIsNotSwitchedOn)
{
    const WithoutConstant gone("kNBServiceIDCalendars");
    const auto creator = creatorFor(kKACalendarPluginID, QVariantMap());
    creator->setCorvaneID("anna");
    EXPECT_TRUE(creator->create());
    EXPECT_EQ(takeOnlineServiceCalls(), QStringList{"isLoggedIn anna"});
}

TEST_F(CreatorWithOnlineService, ARefusedWarningEndsItBeforeAnythingIsSwitchedOn)
{
    KAPlugin *const listPlugin = addWarningPlugin({"kKAServiceCalDAV"}, false);
    const LogCapture log;
    const auto creator = creatorFor(kKACalendarPluginID, QVariantMap());
    creator->setCorvaneID("anna");
    EXPECT_FALSE(creator->create());
    EXPECT_EQ(log.messages(),
              QStringList{"*** Canceled at migration/sync alert for plugin " + kKACalendarPluginID + "."});
    EXPECT_EQ(listPlugin->property("alertsShown").toStringList(), QStringList{"kKAServiceCalDAV"});
    EXPECT_EQ(takeOnlineServiceCalls(), QStringList{});
    EXPECT_EQ(creator->failureReason(), "The user chose not to move to the online service.");
}

TEST_F(CreatorWithOnlineService, AnAcceptedWarningGoesOn)
{
    KAPlugin *const listPlugin = addWarningPlugin({"kKAServiceCardDAV"}, true);
    const auto creator = creatorFor(kKAContactsPluginID, QVariantMap());
    creator->setCorvaneID("anna");
    EXPECT_TRUE(creator->create());
    EXPECT_EQ(listPlugin->property("alertsShown").toStringList(), QStringList{"kKAServiceCardDAV"});
    EXPECT_EQ(takeOnlineServiceCalls(), QStringList({"isLoggedIn anna", "enable anna contacts"}));
}

TEST_F(CreatorWithOnlineService, AWarningThatIsNotDueIsNotShown)
{
    KAPlugin *const listPlugin = addWarningPlugin({"kKAServiceCardDAV"}, false);
    const auto creator = creatorFor(kKACalendarPluginID, QVariantMap());
    creator->setCorvaneID("anna");
    EXPECT_TRUE(creator->create());
    EXPECT_EQ(listPlugin->property("alertsShown").toStringList(), QStringList{});
}

TEST_F(CreatorWithOnlineService, MailAndChatAreNotWarnedOf)
{
    addWarningPlugin({"kKAServiceCalDAV", "kKAServiceCardDAV", "kKAServiceIMAP", "kKAServiceIM"}, false);
    EXPECT_TRUE(creatorFor(kKAMailPluginID, kSettings)->create());
    EXPECT_TRUE(creatorFor(kKAChatPluginID, kSettings)->create());
}

TEST_F(CreatorWithOnlineService, AWorkersWarningIsShownOnTheMainThread)
{
    KAPlugin *const listPlugin = addWarningPlugin({"kKAServiceCalDAV"}, false);
    const KAAccountCreator *created = nullptr;
    plugin(kKACalendarPluginID);
    auto answer = std::async(std::launch::async, [&] {
        const auto creator = creatorFor(kKACalendarPluginID, kSettings);
        created = creator.get();
        return creator->create();
    });
    ASSERT_TRUE(
        QTest::qWaitFor([&] { return answer.wait_for(std::chrono::seconds(0)) == std::future_status::ready; }, 10000));
    EXPECT_FALSE(answer.get());
    EXPECT_EQ(listPlugin->property("alertThread").value<QThread *>(), qApp->thread());
}

TEST_F(CreatorWithOnlineService, NilSettingsComeBeforeTheWarning)
{
    KAPlugin *const listPlugin = addWarningPlugin({"kKAServiceCalDAV"}, false);
    const LogCapture log;
    EXPECT_FALSE(creatorFor(kKACalendarPluginID, std::nullopt)->create());
    EXPECT_EQ(log.messages(), QStringList{"*** KAAccountCreator: _settings was nil"});
    EXPECT_EQ(listPlugin->property("alertsShown").toStringList(), QStringList{});
}

TEST_F(CreatorWithOnlineService, AMissingPluginIsFoundMissingOnlyAfterTheServicesQuestions)
{
    const LogCapture log;
    const auto nameless = KATidewellAccountCreator::initWithSettings(QVariantMap(), nullptr);
    nameless->setProvider(provider(kKAProviderQuillane));
    EXPECT_FALSE(nameless->create());
    const auto named = KATidewellAccountCreator::initWithSettings(QVariantMap{{"password", "right"}}, nullptr);
    named->setProvider(provider(kKAProviderQuillane));
    named->setCorvaneID("berta");
    EXPECT_FALSE(named->create());
    EXPECT_EQ(log.messages(), QStringList({"*** KAAccountCreator: couldn't determine Corvane ID",
                                           "*** KAAccountCreator: _plugin was nil"}));
    EXPECT_EQ(takeOnlineServiceCalls(), QStringList({"isLoggedIn berta", "login berta right"}));
}

}  // namespace
