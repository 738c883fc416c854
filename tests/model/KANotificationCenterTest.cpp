// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KANotificationCenter.h>

#include <atomic>
#include <memory>
#include <stdexcept>
#include <thread>
#include <vector>

#include <QtCore/QStringList>

#include <gtest/gtest.h>

namespace {

const QString kName = QStringLiteral("name");

/// Appends the names that it hears to a list.
KANotificationCenter::Observer into(QStringList &heard, const QString &prefix = {})
{
    return [&heard, prefix](const KANotification &notification) {
        heard += prefix + notification.name;
    };
}

}  // namespace

TEST(KANotificationCenterTest, AnObserverHearsItsNameOnly)
{
    KANotificationCenter center;
    QStringList heard;
    const auto observation = center.addObserver(kName, into(heard));
    center.post(QStringLiteral("other"));
    center.post(kName);
    EXPECT_EQ(heard, QStringList(kName));
}

TEST(KANotificationCenterTest, AnObserverOfANullNameHearsAll)
{
    KANotificationCenter center;
    QStringList heard;
    const auto observation = center.addObserver(QString(), into(heard));
    center.post(QStringLiteral("one"));
    center.post(QStringLiteral("two"));
    EXPECT_EQ(heard, QStringList({QStringLiteral("one"), QStringLiteral("two")}));
}

TEST(KANotificationCenterTest, ObjectAndInformationArrive)
{
    KANotificationCenter center;
    KANotification received;
    const auto observation =
        center.addObserver(kName, [&](const KANotification &notification) { received = notification; });
    center.post(kName, 7, {{QStringLiteral("key"), true}});
    EXPECT_EQ(received.name, kName);
    EXPECT_EQ(received.object, QVariant(7));
    EXPECT_EQ(received.userInformation, QVariantMap({{QStringLiteral("key"), true}}));
}

TEST(KANotificationCenterTest, ObserversAreCalledInTheOrderInWhichTheyCame)
{
    KANotificationCenter center;
    QStringList heard;
    const auto first = center.addObserver(kName, into(heard, QStringLiteral("1 ")));
    const auto second = center.addObserver(QString(), into(heard, QStringLiteral("2 ")));
    const auto third = center.addObserver(kName, into(heard, QStringLiteral("3 ")));
    center.post(kName);
    EXPECT_EQ(heard, QStringList({QStringLiteral("1 name"), QStringLiteral("2 name"), QStringLiteral("3 name")}));
}

TEST(KANotificationCenterTest, DroppingTheObservationEndsIt)
{
    KANotificationCenter center;
    QStringList heard;
    auto observation = center.addObserver(kName, into(heard));
    observation.reset();
    center.post(kName);
    EXPECT_TRUE(heard.isEmpty());
}

TEST(KANotificationCenterTest, AnObservationMayOutliveItsCenter)
{
    KANotificationCenter::Observation observation;
    {
        KANotificationCenter center;
        observation = center.addObserver(kName, [](const KANotification &) {});
    }
    observation.reset();
    EXPECT_FALSE(observation);
}

TEST(KANotificationCenterTest, AnObserverMayPostAddAndRemove)
{
    KANotificationCenter center;
    QStringList heard;
    KANotificationCenter::Observation own, added;
    own = center.addObserver(kName, [&](const KANotification &) {
        added = center.addObserver(QStringLiteral("inner"), into(heard));
        center.post(QStringLiteral("inner"));
        own.reset();
    });
    center.post(kName);
    center.post(kName);
    EXPECT_EQ(heard, QStringList(QStringLiteral("inner")));
}

TEST(KANotificationCenterTest, AnObserverAddedDuringAPostIsNotCalledByIt)
{
    KANotificationCenter center;
    QStringList heard;
    KANotificationCenter::Observation added;
    const auto first = center.addObserver(kName, [&](const KANotification &) {
        if (!added)
            added = center.addObserver(kName, into(heard));
    });
    center.post(kName);
    EXPECT_TRUE(heard.isEmpty());
    center.post(kName);
    EXPECT_EQ(heard, QStringList(kName));
}

TEST(KANotificationCenterTest, AnExceptionReachesThePosterAndEndsTheRound)
{
    KANotificationCenter center;
    QStringList heard;
    const auto first = center.addObserver(kName, [](const KANotification &) { throw std::runtime_error("thrown"); });
    const auto second = center.addObserver(kName, into(heard));
    EXPECT_THROW(center.post(kName), std::runtime_error);
    EXPECT_TRUE(heard.isEmpty());
}

TEST(KANotificationCenterTest, ObserversAreCalledOnThePostersThread)
{
    KANotificationCenter center;
    std::thread::id called;
    const auto observation =
        center.addObserver(kName, [&](const KANotification &) { called = std::this_thread::get_id(); });
    std::thread::id poster;
    std::thread([&] {
        poster = std::this_thread::get_id();
        center.post(kName);
    }).join();
    EXPECT_EQ(called, poster);
}

TEST(KANotificationCenterTest, ThreadsMayPostAndObserveAtOnce)
{
    KANotificationCenter center;
    std::atomic<int> heard = 0;
    const auto lasting = center.addObserver(kName, [&](const KANotification &) { ++heard; });
    std::vector<std::thread> threads;
    for (int thread = 0; thread < 4; ++thread)
        threads.emplace_back([&] {
            for (int number = 0; number < 250; ++number) {
                const auto passing = center.addObserver(QString(), [](const KANotification &) {});
                center.post(kName);
            }
        });
    for (std::thread &thread : threads)
        thread.join();
    EXPECT_EQ(heard, 1000);
}

TEST(KANotificationCenterTest, TheProcessHasOneCenterOfItsOwn)
{
    EXPECT_EQ(&KANotificationCenter::shared(), &KANotificationCenter::shared());
}
