// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The accounts that the cross-application set-up makes, at once and on a worker.

#include <kavellaccounts/KACrossAppSetupViewController.h>

#include <future>
#include <thread>

#include <QtCore/QThreadPool>

#include "tests/setup/cross_app_fixture.h"

using namespace kavell::test;

namespace {

using Outcome = Controller::ApplicationOutcome;
using State = Outcome::State;

/// Notes what it is told.
class Delegate : public QObject {
    Q_OBJECT

public:
    Q_INVOKABLE void controllerDidSave(KACrossAppSetupViewController *controller, bool saved, void *contextInfo)
    {
        ++calls;
        lastController = controller;
        lastSaved = saved;
        lastContext = contextInfo;
        thread = QThread::currentThread();
    }

    int calls = 0;
    KACrossAppSetupViewController *lastController = nullptr;
    bool lastSaved = false;
    void *lastContext = nullptr;
    QThread *thread = nullptr;
};

/// Has other methods only.
class OtherDelegate : public QObject {
    Q_OBJECT

public:
    Q_INVOKABLE void didCreate(KACrossAppSetupViewController *, bool, void *) { ++calls; }
    Q_INVOKABLE void controllerDidSave(KACrossAppSetupViewController *, bool) { ++calls; }

    int calls = 0;
};

class CrossAppCreation : public CrossAppTest {
protected:
    void SetUp() override
    {
        CrossAppTest::SetUp();
        addProvider();
        addAllDataPlugins();
    }

    ScriptedDataPlugin &dataPlugin(const QString &identifier)
    {
        return *static_cast<ScriptedDataPlugin *>(
            qobject_cast<KADataPlugin *>(KAPluginManager::shared()->pluginWithIdentifier(identifier)));
    }

    /// With its view up.
    std::shared_ptr<Controller> fromMail(const QVariantMap &settings = kAda)
    {
        return shownFrom(kKAMailAppID, settings);
    }

    std::shared_ptr<Controller> shownFrom(const QString &source, const QVariantMap &settings = kAda)
    {
        const auto controller = Controller::initWithSettings(settings, source);
        view = controller->view();
        EXPECT_TRUE(view);
        view->show();
        return controller;
    }

    /// Leaves only these ticked.
    void tickOnly(const QStringList &titles)
    {
        for (QCheckBox *box : checkboxes(view)) {
            if (!titles.contains(box->text()))
                click(box);
        }
    }

    QPointer<QWidget> view;
    const std::shared_ptr<Delegate> delegate = std::make_shared<Delegate>();
};

/// A pool of one thread, which is held until `free`.
class BusyPool {
public:
    BusyPool()
    {
        QThreadPool::globalInstance()->setMaxThreadCount(1);
        QThreadPool::globalInstance()->start([held = m_freed.get_future().share()] { held.wait(); });
    }
    ~BusyPool()
    {
        free();
        QThreadPool::globalInstance()->setMaxThreadCount(m_former);
    }
    void free()
    {
        if (!std::exchange(m_isFree, true))
            m_freed.set_value();
    }

private:
    const int m_former = QThreadPool::globalInstance()->maxThreadCount();
    std::promise<void> m_freed;
    bool m_isFree = false;
};

QStringList statesOf(const Controller &controller)
{
    static const QStringList kNames{"not ticked", "already there", "waiting", "in progress", "done", "failed"};
    QStringList texts;
    for (const Outcome &outcome : controller.applicationOutcomes())
        texts += outcome.appBundleID + ": " + kNames[static_cast<int>(outcome.state)];
    return texts;
}

TEST_F(CrossAppCreation, EveryTickedApplicationGetsItsAccountInOrder)
{
    EXPECT_TRUE(fromMail()->createAccounts());
    EXPECT_EQ(started(), QStringList({kKAContactsPluginID, kKACalendarPluginID, kKAChatPluginID}));
}

TEST_F(CrossAppCreation, EachApplicationHasItsPluginAndItsCreator)
{
    const auto makeOnly = [&](const QString &source, const QString &title) {
        const auto controller = shownFrom(source);
        tickOnly({title});
        EXPECT_TRUE(controller->createAccounts());
    };
    makeOnly(kKAParlexAppID, "Mail");
    EXPECT_EQ(started().last(), kKAMailPluginID);
    ASSERT_TRUE(lastInput<KAMailAccountSetupInput>());
    EXPECT_EQ(lastInput<KAMailAccountSetupInput>()->emailAddress(), "ada@zorbo.example");
    makeOnly(kKAMailAppID, "Contacts");
    EXPECT_EQ(started().last(), kKAContactsPluginID);
    ASSERT_TRUE(lastInput<KACardDAVAccountSetupInput>());
    EXPECT_EQ(lastInput<KACardDAVAccountSetupInput>()->serverAddress(), "yahoo.com");
    makeOnly(kKAMailAppID, "Calendars");
    EXPECT_EQ(started().last(), kKACalendarPluginID);
    ASSERT_TRUE(lastInput<KACalDAVAccountSetupInput>());
    EXPECT_EQ(lastInput<KACalDAVAccountSetupInput>()->serverAddress(), "yahoo.com");
    makeOnly(kKAMailAppID, "Messages");
    EXPECT_EQ(started().last(), kKAChatPluginID);
    ASSERT_TRUE(lastInput<KAChatAccountSetupInput>());
    EXPECT_EQ(lastInput<KAChatAccountSetupInput>()->accountType(), "com.corvane.Parlex.services.Yahoo");
    EXPECT_EQ(started().size(), 4);
}

TEST_F(CrossAppCreation, NothingIsMadeForABoxThatIsOffOrDisabled)
{
    m_plugins.setSettings(&dataPlugin(kKACalendarPluginID), "uid-1", kAda);
    const auto controller = fromMail();
    click(checkboxes(view)[0]);
    EXPECT_EQ(shown(view), QStringList({"-Contacts", "Calendars (there)", "Messages"}));
    EXPECT_TRUE(controller->createAccounts());
    EXPECT_EQ(started(), QStringList{kKAChatPluginID});
}

TEST_F(CrossAppCreation, ABoxThatIsTickedAgainCounts)
{
    const auto controller = fromMail();
    tickOnly({});
    click(checkboxes(view)[1]);
    EXPECT_TRUE(controller->createAccounts());
    EXPECT_EQ(started(), QStringList{kKACalendarPluginID});
}

TEST_F(CrossAppCreation, ABoxThatTheHostDisablesOrTicksCountsToo)
{
    const auto controller = fromMail();
    checkboxes(view)[0]->setEnabled(false);
    checkboxes(view)[1]->setChecked(false);
    EXPECT_TRUE(controller->createAccounts());
    EXPECT_EQ(started(), QStringList{kKAChatPluginID});
}

TEST_F(CrossAppCreation, AViewThatIsDisabledAsAWholeStillSaysWhich)
{
    const auto controller = fromMail();
    tickOnly({"Calendars"});
    view->setEnabled(false);
    EXPECT_TRUE(controller->createAccounts());
    EXPECT_EQ(started(), QStringList{kKACalendarPluginID});
}

TEST_F(CrossAppCreation, WithoutAViewThereIsNothingToMake)
{
    const auto controller = Controller::initWithSettings(kAda, kKAMailAppID);
    EXPECT_EQ(controller->numberOfAppsNeedingSetup(), 3);
    EXPECT_TRUE(controller->createAccounts());
    EXPECT_EQ(started(), QStringList{});
    EXPECT_EQ(controller->applicationOutcomes().size(), 0);
}

TEST_F(CrossAppCreation, FailuresDoNotKeepOthersFromBeingMadeAndAreNotTold)
{
    ScriptedDataPlugin &contacts = dataPlugin(kKAContactsPluginID);
    contacts.onStart = [&](const auto &input) {
        contacts.accountSetupDidFail(input, {kKAErrorDomain, 9});
    };
    const auto controller = fromMail();
    EXPECT_TRUE(controller->createAccounts());
    EXPECT_EQ(started(), QStringList({kKACalendarPluginID, kKAChatPluginID}));
}

TEST_F(CrossAppCreation, EachApplicationsOutcomeCanBeReadAfterwards)
{
    ScriptedDataPlugin &contacts = dataPlugin(kKAContactsPluginID);
    contacts.onStart = [&](const auto &input) {
        contacts.accountSetupDidFail(input, {kKAErrorDomain, 9});
    };
    const auto controller = fromMail();
    click(checkboxes(view)[2]);
    EXPECT_EQ(statesOf(*controller), QStringList{});
    EXPECT_TRUE(controller->createAccounts());
    EXPECT_EQ(statesOf(*controller), QStringList({"com.corvane.Cardell: failed", "com.corvane.Tidewell: done",
                                                  "com.corvane.Parlex: not ticked"}));
    const QList<Outcome> outcomes = controller->applicationOutcomes();
    EXPECT_EQ(outcomes[0].failureReason, "The plug-in could not find the account.");
    EXPECT_EQ(outcomes[0].failureError.code(), 9);
    EXPECT_TRUE(outcomes[0].accountUID.isNull());
    EXPECT_EQ(outcomes[1].accountUID, "new-com.corvane.calendar.kaplugin");
    EXPECT_TRUE(outcomes[1].failureReason.isNull());
    EXPECT_TRUE(outcomes[1].failureError.isNull());
}

TEST_F(CrossAppCreation, OutcomesFollowTheCreation)
{
    m_plugins.setSettings(&dataPlugin(kKAContactsPluginID), "uid-1", kAda);
    const auto controller = fromMail();
    QStringList states;
    ScriptedDataPlugin &calendars = dataPlugin(kKACalendarPluginID);
    calendars.onStart = [&](const auto &input) {
        states = statesOf(*controller);
        calendars.accountSetupDidFinish(input, std::make_shared<KAAccountSetupResult>());
    };
    EXPECT_TRUE(controller->createAccounts());
    EXPECT_EQ(states, QStringList({"com.corvane.Cardell: already there", "com.corvane.Tidewell: in progress",
                                   "com.corvane.Parlex: waiting"}));
    EXPECT_EQ(statesOf(*controller), QStringList({"com.corvane.Cardell: already there", "com.corvane.Tidewell: done",
                                                  "com.corvane.Parlex: done"}));
}

TEST_F(CrossAppCreation, AnotherThreadMayAskForAccountsToo)
{
    const auto controller = fromMail();
    auto answer = std::async(std::launch::async, [&] { return controller->createAccounts(); });
    EXPECT_TRUE(answer.get());  // while the main thread runs no events
    EXPECT_EQ(started().size(), 3);
}

TEST_F(CrossAppCreation, TheDelegateIsToldOnTheMainThread)
{
    const auto controller = fromMail();
    int context = 0;
    controller->createAccountsWithDelegate(delegate, "ignored:", &context);
    ASSERT_TRUE(soon([&] { return delegate->calls > 0; }));
    EXPECT_EQ(started().size(), 3);
    EXPECT_EQ(delegate->calls, 1);
    EXPECT_EQ(delegate->lastController, controller.get());
    EXPECT_TRUE(delegate->lastSaved);
    EXPECT_EQ(delegate->lastContext, &context);
    EXPECT_EQ(delegate->thread, qApp->thread());
}

TEST_F(CrossAppCreation, TheDelegateIsToldOfASuccessWhateverHappened)
{
    for (const QString &identifier : {kKAContactsPluginID, kKACalendarPluginID, kKAChatPluginID}) {
        ScriptedDataPlugin &plugin = dataPlugin(identifier);
        plugin.onStart = [&](const auto &input) {
            plugin.accountSetupDidFail(input, {kKAErrorDomain, 1});
        };
    }
    const auto controller = fromMail();
    controller->createAccountsWithDelegate(delegate, nullptr, nullptr);
    ASSERT_TRUE(soon([&] { return delegate->calls > 0; }));
    EXPECT_TRUE(delegate->lastSaved);
    EXPECT_EQ(controller->applicationOutcomes()[2].state, State::Failed);
}

TEST_F(CrossAppCreation, TheAccountsAreMadeOnAThreadOfThePool)
{
    const auto controller = fromMail();
    bool inPool = false;
    ScriptedDataPlugin &calendars = dataPlugin(kKACalendarPluginID);
    calendars.onStart = [&](const auto &input) {
        inPool = QThreadPool::globalInstance()->contains(QThread::currentThread());
        calendars.accountSetupDidFinish(input, std::make_shared<KAAccountSetupResult>());
    };
    controller->createAccountsWithDelegate(delegate, nullptr, nullptr);
    ASSERT_TRUE(soon([&] { return delegate->calls > 0; }));
    EXPECT_TRUE(inPool);
}

TEST_F(CrossAppCreation, ADelegateWithoutTheMethodIsNeverCalledWhateverTheSelector)
{
    const auto other = std::make_shared<OtherDelegate>();
    const auto controller = fromMail();
    controller->createAccountsWithDelegate(other, "didCreate", nullptr);
    // By then its turn on the main thread would have come.
    QThreadPool::globalInstance()->waitForDone();
    QCoreApplication::processEvents();
    EXPECT_EQ(other->calls, 0);
    EXPECT_EQ(started().size(), 3);
}

TEST_F(CrossAppCreation, WithoutADelegateTheAccountsAreMadeAllTheSame)
{
    fromMail()->createAccountsWithDelegate(nullptr, nullptr, nullptr);
    QThreadPool::globalInstance()->waitForDone();
    EXPECT_EQ(started().size(), 3);
}

TEST_F(CrossAppCreation, TheDelegateIsHeldUntilAnotherTakesItsPlace)
{
    const auto controller = fromMail();
    std::weak_ptr<Delegate> held;
    {
        const auto first = std::make_shared<Delegate>();
        held = first;
        controller->createAccountsWithDelegate(first, nullptr, nullptr);
        ASSERT_TRUE(soon([&] { return first->calls > 0; }));
    }
    EXPECT_FALSE(held.expired());
    controller->createAccountsWithDelegate(delegate, nullptr, nullptr);
    EXPECT_TRUE(held.expired());
    ASSERT_TRUE(soon([&] { return delegate->calls > 0; }));
}

TEST_F(CrossAppCreation, ADelegateThatTakesTheOthersPlaceMeanwhileIsToldInItsStead)
{
    BusyPool pool;
    const auto controller = fromMail();
    const auto former = std::make_shared<Delegate>();
    int context = 0;
    controller->createAccountsWithDelegate(former, nullptr, nullptr);
    controller->createAccountsWithDelegate(delegate, nullptr, &context);
    pool.free();
    ASSERT_TRUE(soon([&] { return delegate->calls == 2; }));
    EXPECT_EQ(former->calls, 0);
    EXPECT_EQ(delegate->lastContext, &context);
}

TEST_F(CrossAppCreation, WhatIsTickedIsReadWhenTheWorkerBegins)
{
    BusyPool pool;
    const auto controller = fromMail();
    controller->createAccountsWithDelegate(delegate, nullptr, nullptr);
    tickOnly({"Messages"});
    pool.free();
    ASSERT_TRUE(soon([&] { return delegate->calls > 0; }));
    EXPECT_EQ(started(), QStringList{kKAChatPluginID});
}

TEST_F(CrossAppCreation, AWindowThatIsClosedMeanwhileTakesNoChoiceWithIt)
{
    BusyPool pool;
    const auto controller = fromMail();
    tickOnly({"Messages"});
    controller->createAccountsWithDelegate(delegate, nullptr, nullptr);
    delete view;
    pool.free();
    ASSERT_TRUE(soon([&] { return delegate->calls > 0; }));
    EXPECT_EQ(started(), QStringList{kKAChatPluginID});
}

TEST_F(CrossAppCreation, AMainThreadThatRunsNoEventsDoesNotHoldTheWorkerUp)
{
    fromMail()->createAccountsWithDelegate(delegate, nullptr, nullptr);
    EXPECT_TRUE(QThreadPool::globalInstance()->waitForDone(10000));
    EXPECT_EQ(started().size(), 3);
    EXPECT_EQ(delegate->calls, 0);
}

TEST_F(CrossAppCreation, APluginMayWorkInThePoolThatTheWorkerHolds)
{
    BusyPool pool;
    pool.free();
    ScriptedDataPlugin &calendars = dataPlugin(kKACalendarPluginID);
    calendars.onStart = [&](const auto &input) {
        QThreadPool::globalInstance()->start(
            [&, input] { calendars.accountSetupDidFinish(input, std::make_shared<KAAccountSetupResult>()); });
    };
    const auto controller = fromMail();
    controller->createAccountsWithDelegate(delegate, nullptr, nullptr);
    ASSERT_TRUE(soon([&] { return delegate->calls > 0; }));
    EXPECT_EQ(controller->applicationOutcomes()[1].state, State::Done);
}

TEST_F(CrossAppCreation, TheWorkerKeepsTheControllerAliveAndItsWidgetsGoOnTheMainThread)
{
    auto controller = fromMail();
    const std::weak_ptr<Controller> weak = controller;
    QThread *destroyedOn = nullptr;
    QObject::connect(view, &QObject::destroyed, [&] { destroyedOn = QThread::currentThread(); });
    controller->createAccountsWithDelegate(delegate, nullptr, nullptr);
    controller.reset();
    ASSERT_TRUE(soon([&] { return delegate->calls > 0; }));
    ASSERT_TRUE(soon([&] { return view.isNull(); }));
    EXPECT_TRUE(weak.expired());
    EXPECT_EQ(started().size(), 3);
    EXPECT_EQ(destroyedOn, qApp->thread());
}

TEST_F(CrossAppCreation, TheLastReferenceMayBeDroppedOnAnyThread)
{
    auto controller = fromMail();
    QThread *destroyedOn = nullptr;
    QObject::connect(view, &QObject::destroyed, [&] { destroyedOn = QThread::currentThread(); });
    std::thread([last = std::move(controller)]() mutable { last.reset(); }).join();
    EXPECT_TRUE(view);
    ASSERT_TRUE(soon([&] { return view.isNull(); }));
    EXPECT_EQ(destroyedOn, qApp->thread());
}

TEST_F(CrossAppCreation, AMainThreadMayMakeAccountsItselfWhileAWorkerDoes)
{
    // The worker's plug-in reports once the main thread's own creation has run its event.
    ScriptedDataPlugin &calendars = dataPlugin(kKACalendarPluginID);
    calendars.onStart = [&](const auto &input) {
        QMetaObject::invokeMethod(
            qApp, [&, input] { calendars.accountSetupDidFinish(input, std::make_shared<KAAccountSetupResult>()); },
            Qt::QueuedConnection);
    };
    const auto workers = fromMail();
    tickOnly({"Calendars"});
    workers->createAccountsWithDelegate(delegate, nullptr, nullptr);
    const auto own = fromMail();
    tickOnly({"Messages"});
    ScriptedDataPlugin &chat = dataPlugin(kKAChatPluginID);
    chat.onStart = [&](const auto &input) {
        QMetaObject::invokeMethod(
            qApp, [&, input] { chat.accountSetupDidFinish(input, std::make_shared<KAAccountSetupResult>()); },
            Qt::QueuedConnection);
    };
    EXPECT_TRUE(own->createAccounts());
    EXPECT_EQ(own->applicationOutcomes()[2].state, State::Done);
    ASSERT_TRUE(soon([&] { return delegate->calls > 0; }));
    EXPECT_EQ(workers->applicationOutcomes()[1].state, State::Done);
}

using CrossAppWithoutPlugins = CrossAppTest;

TEST_F(CrossAppWithoutPlugins, AMissingPluginIsLogged)
{
    addProvider();
    const LogCapture log;
    const auto controller = Controller::initWithSettings(kAda, kKACardellAppID);
    ASSERT_TRUE(controller->view());
    EXPECT_TRUE(controller->createAccounts());
    EXPECT_EQ(log.messages(), QStringList({"*** Couldn't find plugin com.corvane.mail.kaplugin",
                                           "*** Couldn't find plugin com.corvane.calendar.kaplugin",
                                           "*** Couldn't find plugin com.corvane.chat.kaplugin"}));
    EXPECT_EQ(controller->applicationOutcomes()[0].state, State::Failed);
    EXPECT_EQ(controller->applicationOutcomes()[0].failureReason,
              "The application's plug-in com.corvane.mail.kaplugin is not installed.");
}

}  // namespace

#include "cross_app_creation_test.moc"
