// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The cross-application set-up in programs without a user interface, and in programs that end while it is at work. Each
// test runs in a process of its own.

#include <kavellaccounts/KACrossAppSetupViewController.h>

#include <atomic>
#include <cstdlib>
#include <future>
#include <optional>

#include <QtCore/QThreadPool>
#include <QtWidgets/QApplication>

#include "tests/setup/cross_app_fixture.h"

namespace {

using kavell::test::Controller;
using kavell::test::LogCapture;
using kavell::test::ScriptedDataPlugin;

class Delegate : public QObject {
    Q_OBJECT

public:
    Q_INVOKABLE void controllerDidSave(KACrossAppSetupViewController *, bool saved, void *) { answer.set_value(saved); }

    std::promise<bool> answer;
};

class CrossAppHeadlessDeathTest : public kavell::test::CrossAppTest {
protected:
    void SetUp() override
    {
        CrossAppTest::SetUp();
        addProvider();
    }

    /// Ends with 0 when the questions are answered and the delegate is told without any event loop.
    [[noreturn]] void offerWithoutInterface()
    {
        const LogCapture log;
        const auto controller = Controller::initWithSettings(kavell::test::kAda, kKAMailAppID);
        const bool offered = controller->numberOfAppsNeedingSetup() == 3 && !controller->view();
        const auto delegate = std::make_shared<Delegate>();
        controller->createAccountsWithDelegate(delegate, nullptr, nullptr);
        const bool told = delegate->answer.get_future().get();
        const bool logged = log.messages() == QStringList{"*** Couldn't load nib CrossAppSetup"};
        std::_Exit(offered && told && logged ? 0 : 1);
    }

    /// The plug-in of the contacts client never reports, and its task may not even have begun.
    [[noreturn]] void endWhileAtWork(bool waitForStart)
    {
        std::atomic<bool> started = false;
        auto application = std::make_unique<Application>();
        addDataPlugin(kKAContactsPluginID).onStart = [&](const auto &) {
            started = true;
        };
        auto controller = Controller::initWithSettings(kavell::test::kAda, kKAMailAppID);
        if (!controller->view())
            std::_Exit(2);
        controller->createAccountsWithDelegate(std::make_shared<Delegate>(), nullptr, nullptr);
        while (waitForStart && !started)
            std::this_thread::yield();
        application.reset();
        const auto outcomes = controller->applicationOutcomes();
        controller.reset();
        std::_Exit(outcomes.size() == 3 && outcomes[0].state == Controller::ApplicationOutcome::State::Failed ? 0 : 1);
    }

private:
    struct Application {
        int count = 1;
        char name[8] = "program";
        char *arguments[2] = {name, nullptr};
        QApplication application{count, arguments};
    };
};

TEST_F(CrossAppHeadlessDeathTest, WithoutAnApplicationObjectEverythingButTheViewWorks)
{
    EXPECT_EXIT(offerWithoutInterface(), testing::ExitedWithCode(0), "");
}

TEST_F(CrossAppHeadlessDeathTest, InAConsoleProgramThereIsNoView)
{
    const auto offer = [] {
        int count = 1;
        char name[] = "console";
        char *arguments[] = {name, nullptr};
        const QCoreApplication application(count, arguments);
        const LogCapture log;
        const auto controller = Controller::initWithSettings(kavell::test::kAda, kKAMailAppID);
        const bool offered = controller->numberOfAppsNeedingSetup() == 3 && !controller->view();
        std::_Exit(offered && log.messages() == QStringList{"*** Couldn't load nib CrossAppSetup"} ? 0 : 1);
    };
    EXPECT_EXIT(offer(), testing::ExitedWithCode(0), "");
}

TEST_F(CrossAppHeadlessDeathTest, AProgramEndsThoughAPluginNeverReports)
{
    EXPECT_EXIT(endWhileAtWork(true), testing::ExitedWithCode(0), "");
}

TEST_F(CrossAppHeadlessDeathTest, AProgramEndsThoughTheWorkHasHardlyBegun)
{
    EXPECT_EXIT(endWhileAtWork(false), testing::ExitedWithCode(0), "");
}

}  // namespace

int main(int argc, char *argv[])
{
    testing::InitGoogleTest(&argc, argv);
    GTEST_FLAG_SET(death_test_style, "threadsafe");
    return RUN_ALL_TESTS();
}

#include "cross_app_headless_test.moc"
