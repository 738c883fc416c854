// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/qt/main_thread.h"

#include <atomic>
#include <cstdlib>
#include <future>
#include <stdexcept>
#include <thread>

#include <QtCore/QCoreApplication>
#include <QtCore/QThread>
#include <QtCore/QThreadPool>
#include <QtTest/QTest>

#include <gtest/gtest.h>

namespace {

/// While it lives, the program has an application object.
struct Application {
    int count = 1;
    char name[8] = "program";
    char *arguments[2] = {name, nullptr};
    QCoreApplication application{count, arguments};
};

bool isReady(const std::future<QThread *> &future)
{
    return QTest::qWaitFor([&] { return future.wait_for(std::chrono::seconds(0)) == std::future_status::ready; },
                           10000);
}

QThread *threadOfWork()
{
    QThread *thread = nullptr;
    kavell::runOnMainThread([&] { thread = QThread::currentThread(); });
    return thread;
}

TEST(MainThreadTest, TheMainThreadsOwnWorkRunsAtOnce)
{
    const Application application;
    EXPECT_EQ(threadOfWork(), QThread::currentThread());
}

TEST(MainThreadTest, WorkOfAnotherThreadRunsOnTheMainOneAndIsWaitedFor)
{
    const Application application;
    auto thread = std::async(std::launch::async, threadOfWork);
    ASSERT_TRUE(isReady(thread));
    EXPECT_EQ(thread.get(), QThread::currentThread());
}

TEST(MainThreadTest, WhatTheWorkThrowsComesThrough)
{
    const Application application;
    auto thread = std::async(std::launch::async, [] {
        kavell::runOnMainThread([] { throw std::runtime_error("no"); });
        return QThread::currentThread();
    });
    ASSERT_TRUE(isReady(thread));
    EXPECT_THROW(thread.get(), std::runtime_error);
}

/// Ends with 0 when the application object can go though it comes to no work any more.
[[noreturn]] void endBeforeTheWork()
{
    std::atomic<bool> asks = false;
    std::atomic<bool> returned = false;
    {
        const Application application;
        QThreadPool::globalInstance()->start([&] {
            kavell::runOnMainThread([&] { asks = true; });
            kavell::runOnMainThread([] {});
            returned = true;
        });
        while (!asks)
            QCoreApplication::processEvents();
        // The second has most likely been asked for by then; if not, this shows less, but nothing wrong.
        std::this_thread::sleep_for(std::chrono::milliseconds(20));
    }
    std::_Exit(returned ? 0 : 1);
}

TEST(MainThreadDeathTest, AnEndingProgramIsNotHeldUpByWorkThatItNoLongerComesTo)
{
    EXPECT_EXIT(endBeforeTheWork(), testing::ExitedWithCode(0), "");
}

}  // namespace

int main(int argc, char *argv[])
{
    testing::InitGoogleTest(&argc, argv);
    GTEST_FLAG_SET(death_test_style, "threadsafe");
    return RUN_ALL_TESTS();
}
