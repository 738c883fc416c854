// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Creators in programs without an application object, and in programs that end while a creator waits. Each test runs in a
// process of its own.

#include <kavellaccounts/KAAccountCreator.h>

#include <atomic>
#include <cstdlib>
#include <future>
#include <thread>

#include <QtCore/QCoreApplication>
#include <QtCore/QThreadPool>

#include <gtest/gtest.h>

#include "tests/support/scripted_data_plugin.h"

namespace {

using kavell::test::ScriptedDataPlugin;

const QVariantMap kSettings{{"emailAddress", "ada@zorbo.example"}};
const auto kResult = std::make_shared<KAAccountSetupResult>();
std::atomic<int> messages = 0;

void countMessage(QtMsgType, const QMessageLogContext &, const QString &)
{
    ++messages;
}

/// Has the plug-in report from another thread, a while after it was asked; whether the account was made.
bool createInConsoleProgram()
{
    ScriptedDataPlugin plugin(nullptr);
    std::thread reporter;
    plugin.onStart = [&](const ScriptedDataPlugin::Input &input) {
        reporter = std::thread([&, input] {
            for (int update = 0; update < 1000; ++update)
                plugin.accountSetupUpdate(input, update);
            plugin.accountSetupDidFinish(input, kResult);
        });
    };
    plugin.onCreate = [](const auto &, const auto &, KAError *) {
        return QStringLiteral("uid");
    };
    const auto creator = KAMailAccountCreator::initWithSettings(kSettings, &plugin);
    const bool created = creator->create();
    reporter.join();
    return created && creator->createdAccountUID() == "uid";
}

[[noreturn]] void createAndExit()
{
    qInstallMessageHandler(countMessage);
    const bool created = createInConsoleProgram();
    std::_Exit(created && messages == 0 ? 0 : 1);
}

/// The plug-in never reports. Ends with 0 when the application object could go all the same.
[[noreturn]] void endWhileACreatorWaits()
{
    ScriptedDataPlugin plugin(nullptr);
    std::atomic<bool> started = false;
    plugin.onStart = [&](const ScriptedDataPlugin::Input &) {
        started = true;
    };
    bool created = true;
    QString reason;
    std::promise<void> done;  // what the application object waits for, told in a way that the thread sanitizer sees
    {
        int count = 1;
        char name[] = "console";
        char *arguments[] = {name, nullptr};
        const QCoreApplication application(count, arguments);
        QThreadPool::globalInstance()->start([&] {
            const auto creator = KAMailAccountCreator::initWithSettings(kSettings, &plugin);
            created = creator->create();
            reason = creator->failureReason();
            done.set_value();
        });
        while (!started)
            std::this_thread::yield();
    }
    done.get_future().wait();
    const bool ended = reason == "The program ended while the plug-in looked for the account.";
    std::_Exit(!created && ended ? 0 : 1);
}

/// The plug-in is kept busy on behalf of another creator until the application object is gone.
[[noreturn]] void endWhileACreatorWaitsForItsTurn()
{
    ScriptedDataPlugin plugin(nullptr);
    std::promise<void> busy;
    std::promise<void> ended;
    plugin.onStart = [&](const ScriptedDataPlugin::Input &) {
        busy.set_value();
        ended.get_future().wait();
    };
    const auto first = KAMailAccountCreator::initWithSettings(kSettings, &plugin);
    const auto second = KAMailAccountCreator::initWithSettings(kSettings, &plugin);
    bool created = true;
    std::promise<void> done;
    std::thread worker;
    {
        int count = 1;
        char name[] = "console";
        char *arguments[] = {name, nullptr};
        const QCoreApplication application(count, arguments);
        worker = std::thread([&] { static_cast<void>(first->create()); });
        busy.get_future().wait();
        QThreadPool::globalInstance()->start([&] {
            created = second->create();
            done.set_value();
        });
    }
    ended.set_value();
    worker.join();
    done.get_future().wait();
    const QString reason = "The plug-in or the program ended before the turn of this account came.";
    std::_Exit(!created && second->failureReason() == reason ? 0 : 1);
}

TEST(AccountCreatorDeathTest, WithoutAnApplicationObjectTheReportIsWaitedForWithoutAnyWarning)
{
    EXPECT_EXIT(createAndExit(), testing::ExitedWithCode(0), "");
}

TEST(AccountCreatorDeathTest, AnEndingProgramDoesNotWaitForAPluginThatNeverReports)
{
    EXPECT_EXIT(endWhileACreatorWaits(), testing::ExitedWithCode(0), "");
}

TEST(AccountCreatorDeathTest, AnEndingProgramDoesNotWaitForACreatorsTurn)
{
    EXPECT_EXIT(endWhileACreatorWaitsForItsTurn(), testing::ExitedWithCode(0), "");
}

}  // namespace

int main(int argc, char *argv[])
{
    testing::InitGoogleTest(&argc, argv);
    GTEST_FLAG_SET(death_test_style, "threadsafe");
    return RUN_ALL_TESTS();
}
