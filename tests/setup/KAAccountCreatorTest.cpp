// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAAccountCreator.h>

#include <future>
#include <thread>

#include <QtCore/QThreadPool>
#include <QtCore/QTimer>
#include <QtTest/QTest>

#include "tests/setup/creator_fixture.h"

using namespace kavell::test;

namespace {

using KAAccountCreatorTest = CreatorTest;

/// A creator of mail accounts shows the flow of all.
std::shared_ptr<KAMailAccountCreator> mailCreator(KADataPlugin &plugin)
{
    return KAMailAccountCreator::initWithSettings(kSettings, &plugin);
}

KAError someError()
{
    return {kKAErrorDomain, 17};
}

QString fieldOf(const KAAccountCreator &creator, const QString &name)
{
    KAFieldList list;
    creator.describeFields(list);
    for (const KAField &field : list.fields()) {
        if (field.name == name)
            return field.value;
    }
    return {};
}

TEST_F(KAAccountCreatorTest, ADiscoveredAccountIsCreated)
{
    const auto creator = mailCreator(plugin());
    EXPECT_TRUE(creator->create());
    EXPECT_EQ(starts, 1);
    EXPECT_EQ(creations, 1);
    EXPECT_EQ(creator->createdAccountUID(), "uid-1");
    EXPECT_TRUE(creator->failureReason().isNull());
}

TEST_F(KAAccountCreatorTest, ThePluginCreatesFromTheInputAndTheResultItReported)
{
    const auto given = std::make_shared<KAMailAccountSetupResult>();
    plugin().onStart = [&](const Input &input) {
        plugin().accountSetupDidFinish(lastInput = input, given);
    };
    Input input;
    Result created;
    plugin().onCreate = [&](const Input &first, const Result &second, KAError *) {
        input = first;
        created = second;
        return QStringLiteral("uid-2");
    };
    EXPECT_TRUE(mailCreator(plugin())->create());
    EXPECT_EQ(input, lastInput);
    EXPECT_EQ(created, given);
}

TEST_F(KAAccountCreatorTest, TheCreatorIsThePluginsDelegateWhileItWorks)
{
    QObject *delegate = nullptr;
    plugin().onStart = [&](const Input &input) {
        delegate = plugin().delegate();
        plugin().accountSetupDidFinish(lastInput = input, result);
    };
    const auto creator = mailCreator(plugin());
    EXPECT_EQ(plugin().delegate(), nullptr);
    EXPECT_TRUE(creator->create());
    EXPECT_EQ(delegate, creator.get());
}

TEST_F(KAAccountCreatorTest, ADestroyedCreatorLeavesThePluginWithoutADelegate)
{
    static_cast<void>(mailCreator(plugin())->create());
    EXPECT_EQ(plugin().delegate(), nullptr);
    plugin().accountSetupDidFinish(lastInput, result);  // reaches nobody
}

TEST_F(KAAccountCreatorTest, ADestroyedCreatorTakesAwayWhateverDelegateThereIs)
{
    QObject other;
    {
        const auto creator = mailCreator(plugin());
        plugin().setDelegate(&other);
    }
    EXPECT_EQ(plugin().delegate(), nullptr);
}

TEST_F(KAAccountCreatorTest, MessagesFromAnotherThreadNeverReachADestroyedCreator)
{
    std::atomic<bool> stop = false;
    std::thread sender([&, &sending = plugin()] {
        while (!stop)
            sending.accountSetupUpdate(nullptr, 1);
    });
    for (int round = 0; round < 200; ++round) {
        const auto creator = mailCreator(plugin());
        EXPECT_TRUE(creator->create());
    }
    EXPECT_EQ(plugin().delegate(), nullptr);
    stop = true;
    sender.join();
}

/// Keeps whoever sends it news.
class KeepingCreator : public KAAccountCreator {
    Q_OBJECT

public:
    struct Meeting {
        std::promise<void> begun;
        std::promise<void> ended;
    };

    KeepingCreator(KADataPlugin *plugin, Meeting &meeting) : KAAccountCreator(kSettings, plugin), m_meeting(meeting) {}

    Q_INVOKABLE void pluginAccountSetupUpdate(KADataPlugin *, const std::shared_ptr<KAAccountSetupInput> &,
                                              const QVariant &)
    {
        Meeting &meeting = m_meeting;
        meeting.begun.set_value();
        meeting.ended.get_future().wait();
    }

private:
    Meeting &m_meeting;
};

TEST_F(KAAccountCreatorTest, ADestroyedCreatorWaitsForItsLastMessageThoughAnotherIsAboutToTakeItsPlace)
{
    KeepingCreator::Meeting meeting;
    ScriptedDataPlugin &sending = plugin();
    auto former = std::make_unique<KeepingCreator>(&sending, meeting);
    EXPECT_TRUE(former->create());
    auto sent = std::async(std::launch::async, [&] { sending.accountSetupUpdate(nullptr, 1); });
    meeting.begun.get_future().wait();

    const auto next = mailCreator(sending);
    auto created = std::async(std::launch::async, [&] { return next->create(); });
    // From then on it is its turn, and it waits to become the delegate.
    ASSERT_TRUE(QTest::qWaitFor([&] { return fieldOf(*next, "_waiting") == "true"; }, 10000));
    auto destroyed = std::async(std::launch::async, [&] { former.reset(); });
    EXPECT_EQ(destroyed.wait_for(std::chrono::milliseconds(100)), std::future_status::timeout);
    meeting.ended.set_value();
    destroyed.get();
    EXPECT_TRUE(created.get());
}

TEST_F(KAAccountCreatorTest, ReportsBeforeTheDiscoveryDoNotCount)
{
    const auto successful = mailCreator(plugin());
    plugin().setDelegate(successful.get());
    plugin().accountSetupDidFail(nullptr, someError());
    EXPECT_TRUE(successful->create());
    EXPECT_TRUE(successful->failureReason().isNull());
    EXPECT_TRUE(successful->failureError().isNull());

    plugin().onStart = [&](const Input &input) {
        plugin().accountSetupDidFail(input, someError());
    };
    const auto failing = mailCreator(plugin());
    plugin().setDelegate(failing.get());
    plugin().accountSetupDidFinish(nullptr, result);
    EXPECT_FALSE(failing->create());
    EXPECT_EQ(creations, 1);
}

/// Tells when it has made its input, after which it waits for its turn.
class TellingCreator : public KAAccountCreator {
public:
    explicit TellingCreator(KADataPlugin *plugin) : KAAccountCreator(kSettings, plugin) {}

    mutable std::promise<void> madeInput;

protected:
    [[nodiscard]] std::shared_ptr<KAAccountSetupInput> _input() const override
    {
        madeInput.set_value();
        return nullptr;
    }
};

TEST_F(KAAccountCreatorTest, ACreatorWhosePluginIsDestroyedBeforeItsTurnFails)
{
    TellingCreator second(&plugin());
    std::future<bool> created;
    plugin().onStart = [&](const Input &) {
        created = std::async(std::launch::async, [&] { return second.create(); });
        second.madeInput.get_future().wait();
        QTimer::singleShot(0, qApp, [&] { destroyPlugin(); });
    };
    const auto first = mailCreator(plugin());
    EXPECT_FALSE(first->create());
    EXPECT_FALSE(created.get());
    EXPECT_EQ(second.failureReason(), "The plug-in or the program ended before the turn of this account came.");
}

TEST_F(KAAccountCreatorTest, AReportedFailureCreatesNothing)
{
    plugin().onStart = [&](const Input &input) {
        plugin().accountSetupDidFail(input, someError());
    };
    const auto creator = mailCreator(plugin());
    EXPECT_FALSE(creator->create());
    EXPECT_EQ(creations, 0);
    EXPECT_EQ(creator->failureError().code(), 17);
    EXPECT_EQ(creator->failureReason(), "The plug-in could not find the account.");
    EXPECT_TRUE(creator->createdAccountUID().isNull());
}

TEST_F(KAAccountCreatorTest, ASuccessWithoutAResultCreatesNothing)
{
    plugin().onStart = [&](const Input &input) {
        plugin().accountSetupDidFinish(input, nullptr);
    };
    const auto creator = mailCreator(plugin());
    EXPECT_FALSE(creator->create());
    EXPECT_EQ(creations, 0);
    EXPECT_EQ(creator->failureReason(), "The plug-in found nothing to make an account of.");
}

TEST_F(KAAccountCreatorTest, TheFirstReportDecides)
{
    plugin().onStart = [&](const Input &input) {
        plugin().accountSetupDidFail(input, someError());
        plugin().accountSetupDidFinish(input, result);
    };
    EXPECT_FALSE(mailCreator(plugin())->create());
    EXPECT_EQ(creations, 0);

    plugin().onStart = [&](const Input &input) {
        plugin().accountSetupDidFinish(lastInput = input, result);
        plugin().accountSetupDidFail(input, someError());
    };
    EXPECT_TRUE(mailCreator(plugin())->create());
}

TEST_F(KAAccountCreatorTest, AnEmptyIdentifierIsAFailure)
{
    for (const QString &uid : {QString(""), QString()}) {
        plugin().onCreate = [&](const Input &, const Result &, KAError *error) {
            *error = someError();
            return uid;
        };
        const auto creator = mailCreator(plugin());
        EXPECT_FALSE(creator->create());
        EXPECT_EQ(creator->failureError().code(), 17);
        EXPECT_EQ(creator->failureReason(), "The plug-in made no account of what it had found.");
        EXPECT_TRUE(creator->createdAccountUID().isNull());
    }
}

TEST_F(KAAccountCreatorTest, OtherMessagesNeitherEndTheWaitNorDoAnything)
{
    plugin().onStart = [&](const Input &input) {
        plugin().accountSetupUpdate(input, "half way");
        plugin().didCreateAccountUID("other");
        plugin().didDeleteAccountUID("other");
        plugin().didChangeAccountUID("other");
        plugin().nbsAccountMigrationFinished(nullptr);
        QTimer::singleShot(0, qApp, [&, input] { plugin().accountSetupDidFinish(lastInput = input, result); });
    };
    const auto creator = mailCreator(plugin());
    EXPECT_TRUE(creator->create());
    EXPECT_EQ(creator->createdAccountUID(), "uid-1");
}

TEST_F(KAAccountCreatorTest, NilSettingsAreLoggedAndNothingIsDone)
{
    const LogCapture log;
    const auto creator = KAMailAccountCreator::initWithSettings(std::nullopt, &plugin());
    EXPECT_FALSE(creator->create());
    EXPECT_EQ(log.messages(), QStringList{"*** KAAccountCreator: _settings was nil"});
    EXPECT_EQ(starts, 0);
    EXPECT_EQ(creator->failureReason(), "There are no settings to make an account of.");
}

TEST_F(KAAccountCreatorTest, AnEmptyDictionaryIsNoNilOne)
{
    EXPECT_TRUE(KATidewellAccountCreator::initWithSettings(QVariantMap(), &plugin())->create());
    EXPECT_EQ(starts, 1);
}

TEST_F(KAAccountCreatorTest, AMissingPluginIsLogged)
{
    const LogCapture log;
    const auto creator = KAMailAccountCreator::initWithSettings(kSettings, nullptr);
    EXPECT_FALSE(creator->create());
    EXPECT_EQ(log.messages(), QStringList{"*** KAAccountCreator: _plugin was nil"});
    EXPECT_EQ(creator->failureReason(), "The application has no plug-in.");
}

TEST_F(KAAccountCreatorTest, WithNeitherSettingsNorPluginTheSettingsAreLogged)
{
    const LogCapture log;
    EXPECT_FALSE(KAMailAccountCreator::initWithSettings(std::nullopt, nullptr)->create());
    EXPECT_EQ(log.messages(), QStringList{"*** KAAccountCreator: _settings was nil"});
}

TEST_F(KAAccountCreatorTest, AFailureLogsNothingElse)
{
    const LogCapture log;
    plugin().onStart = [&](const Input &input) {
        plugin().accountSetupDidFail(input, someError());
    };
    EXPECT_FALSE(mailCreator(plugin())->create());
    EXPECT_EQ(log.messages(), QStringList{});
}

TEST_F(KAAccountCreatorTest, TheBaseClassMakesNoInput)
{
    lastInput = std::make_shared<KAAccountSetupInput>();
    EXPECT_TRUE(KAAccountCreator::initWithSettings(kSettings, &plugin())->create());
    EXPECT_EQ(lastInput, nullptr);
}

TEST_F(KAAccountCreatorTest, WhatThePluginThrowsComesThrough)
{
    plugin().onStart = [](const Input &) {
        throw std::runtime_error("no network");
    };
    const auto creator = mailCreator(plugin());
    EXPECT_THROW(static_cast<void>(creator->create()), std::runtime_error);
}

TEST_F(KAAccountCreatorTest, APluginThatIsDestroyedMeanwhileEndsTheWait)
{
    plugin().onStart = [&](const Input &) {
        QTimer::singleShot(0, qApp, [&] { destroyPlugin(); });
    };
    const auto creator = mailCreator(plugin());
    EXPECT_FALSE(creator->create());
    EXPECT_EQ(creator->failureReason(), "The plug-in was destroyed while it looked for the account.");
}

TEST_F(KAAccountCreatorTest, AReportMayBeAQueuedMessageOnTheCreatingThread)
{
    const auto create = [&] {
        plugin().onStart = [&](const Input &input) {
            lastInput = input;
            // As a plug-in that knows its delegate's thread would send it.
            QMetaObject::invokeMethod(plugin().delegate(), "pluginAccountSetupDidFinish", Qt::QueuedConnection,
                                      Q_ARG(KADataPlugin *, &plugin()),
                                      Q_ARG(std::shared_ptr<KAAccountSetupInput>, input),
                                      Q_ARG(std::shared_ptr<KAAccountSetupResult>, result));
        };
        return mailCreator(plugin())->create();
    };
    EXPECT_TRUE(create());
    EXPECT_TRUE(std::async(std::launch::async, create).get());

    std::promise<bool> inPool;
    QThreadPool::globalInstance()->start([&] { inPool.set_value(create()); });
    EXPECT_TRUE(inPool.get_future().get());

    std::promise<bool> inThread;
    const std::unique_ptr<QThread> thread(QThread::create([&] { inThread.set_value(create()); }));
    thread->start();
    EXPECT_TRUE(inThread.get_future().get());
    thread->wait();
    EXPECT_EQ(creations, 4);
}

TEST_F(KAAccountCreatorTest, ATimerOfThePluginFiresOnTheCreatingThread)
{
    QThread *fired = nullptr;
    plugin().onStart = [&](const Input &input) {
        lastInput = input;
        auto *const timer = new QTimer;
        QObject::connect(timer, &QTimer::timeout, timer, [&, timer, input] {
            fired = QThread::currentThread();
            timer->deleteLater();
            timer->stop();
            plugin().accountSetupDidFinish(input, result);
        });
        timer->start(1);
    };
    QThread *created = nullptr;
    std::promise<bool> answer;
    QThreadPool::globalInstance()->start([&] {
        created = QThread::currentThread();
        answer.set_value(mailCreator(plugin())->create());
    });
    EXPECT_TRUE(answer.get_future().get());
    EXPECT_EQ(fired, created);
    EXPECT_NE(fired, nullptr);
}

TEST_F(KAAccountCreatorTest, AReportMayComeFromAnotherThread)
{
    std::thread reporter;
    const auto create = [&] {
        plugin().onStart = [&](const Input &input) {
            lastInput = input;
            reporter = std::thread([&, input] { plugin().accountSetupDidFinish(input, result); });
        };
        const bool created = mailCreator(plugin())->create();
        reporter.join();
        return created;
    };
    EXPECT_TRUE(create());
    EXPECT_TRUE(std::async(std::launch::async, create).get());
}

TEST_F(KAAccountCreatorTest, EventsOfTheMainThreadRunWhileItWaits)
{
    bool ran = false;
    plugin().onStart = [&](const Input &input) {
        lastInput = input;
        QTimer::singleShot(0, qApp, [&] {
            ran = true;
            QTimer::singleShot(1, qApp, [&] { plugin().accountSetupDidFinish(lastInput, result); });
        });
    };
    EXPECT_TRUE(mailCreator(plugin())->create());
    EXPECT_TRUE(ran);
}

TEST_F(KAAccountCreatorTest, CreatorsOfOnePluginTakeTurns)
{
    // Each discovery is reported from a thread of its own, with a result that names it.
    std::mutex mutex;
    std::vector<std::thread> reporters;
    std::atomic<int> atWork = 0;
    plugin().onStart = [&](const Input &input) {
        EXPECT_EQ(atWork++, 0);
        const std::lock_guard lock(mutex);
        reporters.emplace_back([&, input] {
            const auto found = std::make_shared<KAMailAccountSetupResult>();
            found->setReceivingAccount(std::static_pointer_cast<KAMailAccountSetupInput>(input)->emailAddress());
            plugin().accountSetupDidFinish(input, found);
        });
    };
    plugin().onCreate = [&](const Input &, const Result &found, KAError *) {
        EXPECT_EQ(atWork--, 1);
        return std::static_pointer_cast<KAMailAccountSetupResult>(found)->receivingAccount().toString();
    };
    const auto create = [&](const QString &address) {
        const auto creator = KAMailAccountCreator::initWithSettings(QVariantMap{{"emailAddress", address}}, &plugin());
        return creator->create() && creator->createdAccountUID() == address;
    };
    const auto createMany = [&](const QString &user) {
        int created = 0;
        for (int round = 0; round < 50; ++round)
            created += create(user + QString::number(round));
        return created;
    };
    auto ada = std::async(std::launch::async, createMany, "ada");
    auto bea = std::async(std::launch::async, createMany, "bea");
    EXPECT_EQ(ada.get(), 50);
    EXPECT_EQ(bea.get(), 50);
    for (std::thread &reporter : reporters)
        reporter.join();
}

TEST_F(KAAccountCreatorTest, ACreatorBelowWhichAnotherOfItsPluginWaitsFails)
{
    bool inner = true;
    QString reason;
    plugin().onStart = [&](const Input &input) {
        lastInput = input;
        QTimer::singleShot(0, qApp, [&] {
            const auto creator = mailCreator(plugin());
            inner = creator->create();
            reason = creator->failureReason();
        });
        QTimer::singleShot(1, qApp, [&] { plugin().accountSetupDidFinish(lastInput, result); });
    };
    EXPECT_TRUE(mailCreator(plugin())->create());  // whose delegate the other left alone, coming and going
    EXPECT_FALSE(inner);
    EXPECT_EQ(reason, "The plug-in is at work on another account, which this one would hold up.");
}

/// A pool of one thread for as long as a test runs.
class OneThread {
public:
    OneThread() { QThreadPool::globalInstance()->setMaxThreadCount(1); }
    ~OneThread() { QThreadPool::globalInstance()->setMaxThreadCount(m_former); }

private:
    const int m_former = QThreadPool::globalInstance()->maxThreadCount();
};

TEST_F(KAAccountCreatorTest, APluginMayWorkInAPoolThatIsFullOfWaitingCreators)
{
    const OneThread pool;
    plugin().onStart = [&](const Input &input) {
        lastInput = input;
        QThreadPool::globalInstance()->start([&, input] { plugin().accountSetupDidFinish(input, result); });
    };
    std::promise<bool> answer;
    QThreadPool::globalInstance()->start([&] { answer.set_value(mailCreator(plugin())->create()); });
    std::future<bool> future = answer.get_future();
    ASSERT_EQ(future.wait_for(std::chrono::seconds(30)), std::future_status::ready);
    EXPECT_TRUE(future.get());
}

TEST_F(KAAccountCreatorTest, ThePlaceInThePoolIsTakenBackAfterTheWait)
{
    const OneThread pool;
    std::promise<int> active;
    QThreadPool::globalInstance()->start([&] {
        EXPECT_TRUE(mailCreator(plugin())->create());
        active.set_value(QThreadPool::globalInstance()->activeThreadCount());
    });
    EXPECT_EQ(active.get_future().get(), 1);
}

TEST_F(KAAccountCreatorTest, FieldsAreShownInTheirOrder)
{
    const auto creator = KAMailAccountCreator::initWithSettings(kSettings, &plugin());
    creator->setProvider(provider("com.example.any"));
    creator->setCorvaneID("ada");
    const auto rows = [&] {
        KAFieldList list;
        creator->describeFields(list);
        QStringList texts;
        for (const KAField &field : list.fields())
            texts += field.name + ' ' + field.encoding;
        return texts;
    };
    EXPECT_EQ(rows(), QStringList({"_settings @\"QVariantMap\"", "_plugin @\"KADataPlugin\"",
                                   "_result @\"KAAccountSetupResult\"", "_provider @\"KAProvider\"",
                                   "_corvaneID @\"QString\"", "_waiting c"}));
    KAFieldList list;
    creator->describeFields(list);
    EXPECT_EQ(list.fields()[0].value, "{emailAddress = ada@zorbo.example;}");
    EXPECT_EQ(list.fields()[4].value, "ada");
    EXPECT_EQ(list.fields()[5].value, "false");
    EXPECT_EQ(creator->className(), "KAMailAccountCreator");
}

TEST_F(KAAccountCreatorTest, TheWaitAndTheResultAreSeenInTheFields)
{
    QStringList waiting;
    QStringList results;
    std::shared_ptr<KAAccountCreator> creator = mailCreator(plugin());
    const auto look = [&] {
        waiting += fieldOf(*creator, "_waiting");
        results += fieldOf(*creator, "_result");
    };
    plugin().onStart = [&](const Input &input) {
        look();
        plugin().accountSetupDidFinish(lastInput = input, result);
        look();
    };
    look();
    EXPECT_TRUE(creator->create());
    EXPECT_EQ(waiting, QStringList({"false", "true", "false"}));
    EXPECT_EQ(results, QStringList({"(null)", "(null)", result->description()}));
}

TEST_F(KAAccountCreatorTest, ProviderAndNameAreThoseThatWereSet)
{
    const auto creator = mailCreator(plugin());
    EXPECT_EQ(creator->provider(), nullptr);
    EXPECT_TRUE(creator->corvaneID().isNull());
    const auto google = provider(kKAProviderGoogle);
    creator->setProvider(google);
    creator->setCorvaneID("");
    EXPECT_EQ(creator->provider(), google);
    EXPECT_FALSE(creator->corvaneID().isNull());
}

}  // namespace

#include "KAAccountCreatorTest.moc"
