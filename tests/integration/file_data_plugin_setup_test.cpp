// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The example data plug-ins while they set an account up: what the delegate is told, on which thread, and what ends it.

#include <chrono>
#include <future>

#include <gmock/gmock.h>

#include <QtCore/QUrl>

#include <kavellaccounts/KAAccountCreator.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KAProvider.h>

#include "tests/integration/data_plugin_fixture.h"

namespace kavell::test {

using testing::ElementsAre;
using testing::IsEmpty;
using namespace std::chrono_literals;

const QString kLooking = QStringLiteral("update Looking for the account’s servers…");

class FileDataPluginSetup : public DataPluginTest {
protected:
    /// Starts a set-up and waits for its end.
    void discover(const std::shared_ptr<KAAccountSetupInput> &input, const QString &identifier = kKAMailPluginID)
    {
        plugin(identifier).setDelegate(&recorder);
        plugin(identifier).startAccountSetupWithInput(input);
        EXPECT_TRUE(runUntil([&] { return recorder.hasEnded(); }));
    }

    /// Lets everything that is queued for this thread run.
    static void runQueuedEvents()
    {
        for (int round = 0; round < 4; ++round)
            QCoreApplication::processEvents();
    }

    SetupRecorder recorder;
};

TEST_F(FileDataPluginSetup, TellsFirstThatItLooksAndThenWhatItFound)
{
    discover(mailInput("carla@zorbo.example"));
    EXPECT_THAT(recorder.messages, ElementsAre(kLooking, QStringLiteral("finish")));
    const auto result = std::dynamic_pointer_cast<KAMailAccountSetupResult>(recorder.result);
    ASSERT_TRUE(result);
    EXPECT_EQ(result->receivingAccount().toString(), "imaps://carla@zorbo.example@imap.zorbo.example");
    EXPECT_FALSE(result->receivingAlreadyExistsInMail());
}

TEST_F(FileDataPluginSetup, StartReturnsBeforeAnythingIsTold)
{
    plugin().setDelegate(&recorder);
    plugin().startAccountSetupWithInput(mailInput("carla@zorbo.example"));
    EXPECT_THAT(recorder.messages, IsEmpty());
    EXPECT_TRUE(runUntil([&] { return recorder.hasEnded(); }));
}

TEST_F(FileDataPluginSetup, FindsTheCalendarsOfAnAddress)
{
    const auto input = std::make_shared<KACalDAVAccountSetupInput>();
    input->setUserName("carla");
    input->setEmailAddress("carla@zorbo.example");
    input->setPassword("secret");
    discover(input, kKACalendarPluginID);
    const auto result = std::dynamic_pointer_cast<KACalDAVAccountSetupResult>(recorder.result);
    ASSERT_TRUE(result);
    EXPECT_EQ(result->url(), QUrl("https://calendar.zorbo.example/calendars/carla/"));
}

TEST_F(FileDataPluginSetup, FindsTheContactsAtAServerThatIsGiven)
{
    const auto input = std::make_shared<KACardDAVAccountSetupInput>();
    input->setUserName("carla");
    input->setServerAddress("people.zorbo.example");
    input->setPassword("secret");
    discover(input, kKAContactsPluginID);
    const auto result = std::dynamic_pointer_cast<KACardDAVAccountSetupResult>(recorder.result);
    ASSERT_TRUE(result);
    EXPECT_EQ(result->url(), QUrl("https://people.zorbo.example/contacts/carla/"));
}

TEST_F(FileDataPluginSetup, FindsADirectory)
{
    const auto input = std::make_shared<KALDAPAccountSetupInput>();
    input->setServerAddress("directory.zorbo.example");
    input->setPassword("secret");
    discover(input, kKAContactsPluginID);
    EXPECT_TRUE(std::dynamic_pointer_cast<KALDAPAccountSetupResult>(recorder.result));
}

TEST_F(FileDataPluginSetup, FindsAChatAccount)
{
    const auto input = std::make_shared<KAChatAccountSetupInput>();
    input->setLoginName("carla@zorbo.example");
    input->setAccountType(KAChatAcctTypeJabber);
    input->setPassword("secret");
    discover(input, kKAChatPluginID);
    const auto result = std::dynamic_pointer_cast<KAChatAccountSetupResult>(recorder.result);
    ASSERT_TRUE(result);
    EXPECT_FALSE(result->isExistingAccount());
}

TEST_F(FileDataPluginSetup, FailsWithoutAnAddress)
{
    discover(mailInput("carla"));
    EXPECT_THAT(recorder.messages, ElementsAre(kLooking, QStringLiteral("fail")));
    EXPECT_EQ(recorder.error.domain(), "CorvaneKavellAccountsErrorDomain");
    EXPECT_EQ(recorder.error.code(), 2);
    EXPECT_EQ(recorder.error.description(),
              "It is not known whose account this is: an address or a user name is missing.");
    EXPECT_FALSE(recorder.error.userInformation().contains(kKANonFatalError));
}

TEST_F(FileDataPluginSetup, FailsWithoutALogin)
{
    const auto input = std::make_shared<KAChatAccountSetupInput>();
    input->setContinueThroughError(true);
    discover(input, kKAChatPluginID);
    EXPECT_EQ(recorder.error.code(), 2);
}

TEST_F(FileDataPluginSetup, FailsForAnInputOfAnotherKindOfData)
{
    discover(std::make_shared<KAChatAccountSetupInput>());
    EXPECT_EQ(recorder.error.description(), "This application cannot use an account of that kind.");
}

TEST_F(FileDataPluginSetup, AMissingPasswordIsAnErrorThatTheAskerMayContinueThrough)
{
    const auto input = mailInput("carla@zorbo.example");
    input->setPassword({});
    discover(input);
    EXPECT_EQ(recorder.error.code(), 4);
    EXPECT_TRUE(recorder.error.userInformation().value(kKANonFatalError).toBool());
    recorder.messages.clear();

    input->setContinueThroughError(true);
    discover(input);
    EXPECT_THAT(recorder.messages, ElementsAre(kLooking, QStringLiteral("finish")));
}

TEST_F(FileDataPluginSetup, AMissingServerIsAnErrorThatTheAskerMayContinueThrough)
{
    const auto input = std::make_shared<KACalDAVAccountSetupInput>();
    input->setUserName("carla");
    input->setPassword("secret");
    discover(input, kKACalendarPluginID);
    EXPECT_EQ(recorder.error.code(), 3);
    recorder.messages.clear();

    input->setContinueThroughError(true);
    discover(input, kKACalendarPluginID);
    const auto result = std::dynamic_pointer_cast<KACalDAVAccountSetupResult>(recorder.result);
    ASSERT_TRUE(result);
    EXPECT_TRUE(result->url().isEmpty());
}

TEST_F(FileDataPluginSetup, NothingIsToldOfACancelledSetup)
{
    const auto input = mailInput("carla@zorbo.example");
    plugin().setDelegate(&recorder);
    plugin().startAccountSetupWithInput(input);
    plugin().cancelAccountSetupForInput(input);
    runQueuedEvents();
    EXPECT_THAT(recorder.messages, IsEmpty());
}

TEST_F(FileDataPluginSetup, CancellingOneSetupLeavesTheOthers)
{
    const auto cancelled = mailInput("carla@zorbo.example");
    plugin().setDelegate(&recorder);
    plugin().startAccountSetupWithInput(cancelled);
    plugin().startAccountSetupWithInput(mailInput("dora@zorbo.example"));
    plugin().cancelAccountSetupForInput(cancelled);
    EXPECT_TRUE(runUntil([&] { return recorder.hasEnded(); }));
    EXPECT_THAT(recorder.messages, ElementsAre(kLooking, QStringLiteral("finish")));
}

TEST_F(FileDataPluginSetup, ADelegateThatIsGoneIsNotTold)
{
    {
        SetupRecorder gone;
        plugin().setDelegate(&gone);
        plugin().startAccountSetupWithInput(mailInput("carla@zorbo.example"));
        plugin().setDelegate(nullptr);
    }
    plugin().setDelegate(&recorder);
    runQueuedEvents();
    EXPECT_THAT(recorder.messages, IsEmpty()) << "the next delegate did not ask";
}

TEST_F(FileDataPluginSetup, AnswersOnTheThreadThatAsked)
{
    std::promise<QThread *> told;  // the thread, none when the set-up failed
    const std::unique_ptr<QThread> worker(QThread::create([&] {
        SetupRecorder own;
        plugin().setDelegate(&own);
        plugin().startAccountSetupWithInput(mailInput("carla@zorbo.example"));
        const bool wasFound = runUntil([&] { return own.hasEnded(); }) && own.result;
        plugin().setDelegate(nullptr);
        told.set_value(wasFound ? own.thread : nullptr);
    }));
    worker->start();
    auto answer = told.get_future();
    ASSERT_EQ(answer.wait_for(20s), std::future_status::ready);  // while this thread runs no events
    EXPECT_EQ(answer.get(), worker.get());
    EXPECT_TRUE(worker->wait(20000));
}

TEST_F(FileDataPluginSetup, SaysThatTheApplicationHasTheAccountAlready)
{
    (void)makeAccount(plugin(), mailInput("carla@zorbo.example"));
    discover(mailInput("carla@zorbo.example"));
    const auto result = std::dynamic_pointer_cast<KAMailAccountSetupResult>(recorder.result);
    ASSERT_TRUE(result);
    EXPECT_TRUE(result->receivingAlreadyExistsInMail());
    EXPECT_TRUE(result->sendingAlreadyExistsInMail());
}

/// Creates an account as the library does for a user who wants it in a second application: on a worker thread, whose
/// events the creator runs while this thread does nothing. The settings of the account that was made.
template <typename Creator> QVariantMap createdBy(KADataPlugin &dataPlugin, const QVariantMap &settings)
{
    std::promise<bool> isMade;
    const std::unique_ptr<QThread> worker(QThread::create([&] {
        bool wasMade = false;
        {
            const auto creator = Creator::initWithSettings(settings, &dataPlugin);
            creator->setProvider(KAProvider::initWithProviderType("com.example.account.zorbo"));
            wasMade = creator->create();
            EXPECT_TRUE(wasMade) << creator->failureReason().toStdString();
        }
        isMade.set_value(wasMade);
    }));
    worker->start();
    auto answer = isMade.get_future();
    const bool wasMade = answer.wait_for(20s) == std::future_status::ready && answer.get();
    EXPECT_TRUE(worker->wait(20000));
    const QStringList uids = dataPlugin.accountUIDs();
    return wasMade && uids.size() == 1 ? dataPlugin.settingsForAccountUID(uids.first()) : QVariantMap();
}

TEST_F(FileDataPluginSetup, TheCreatorOfMailAccountsMakesOne)
{
    const QVariantMap made = createdBy<KAMailAccountCreator>(
        plugin(), {{"emailAddress", "carla@zorbo.example"}, {"accountDescription", "Work"}});
    EXPECT_EQ(made.value("emailAddress").toString(), "carla@zorbo.example");
    EXPECT_EQ(made.value("accountDescription").toString(), "Work");
}

TEST_F(FileDataPluginSetup, TheCreatorsOfTheOtherApplicationsMakeOneEach)
{
    const QVariantMap settings{{"userName", "carla@zorbo.example"}, {"emailAddress", "carla@zorbo.example"}};
    EXPECT_EQ(createdBy<KATidewellAccountCreator>(plugin(kKACalendarPluginID), settings).value("serverAddress"),
              "calendar.zorbo.example");
    EXPECT_EQ(createdBy<KACardellAccountCreator>(plugin(kKAContactsPluginID), settings).value("serverAddress"),
              "contacts.zorbo.example");
    EXPECT_EQ(createdBy<KAParlexAccountCreator>(plugin(kKAChatPluginID), settings).value("KAChatLoginName"),
              "carla@zorbo.example");
}

TEST_F(FileDataPluginSetup, ACreatorIsToldThatAnAccountIsImpossible)
{
    const auto creator = KAMailAccountCreator::initWithSettings(QVariantMap{{"emailAddress", "carla"}}, &plugin());
    creator->setProvider(KAProvider::initWithProviderType("com.example.account.zorbo"));
    EXPECT_FALSE(creator->create());
    EXPECT_THAT(plugin().accountUIDs(), IsEmpty());
}

}  // namespace kavell::test
