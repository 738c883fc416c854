// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAPluginManager.h>

#include <atomic>
#include <filesystem>
#include <thread>

#include <gmock/gmock.h>

#include <QtCore/QCoreApplication>
#include <QtCore/QDeadlineTimer>

#include <kavellaccounts/CSKavellNotification.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/Ref.h>

#include "tests/support/log_capture.h"
#include "tests/support/process.h"

namespace {

using testing::ElementsAre;
using testing::IsEmpty;

const std::string kType = "com.corvane.account.mail";

class ResetData : public testing::Test {
protected:
    static std::string place(const std::string &name)
    {
        return std::string(qgetenv("HOME")) + "/Library/Kavell Accounts/V1/" + name;
    }

    /// The objects of the notifications that have arrived. Those of this process's own posts have when a post returns.
    QStringList announced()
    {
        QStringList objects;
        while (const auto next = kavell::adopt(CSKavellNotificationObserverCopyNext(observer.get()))) {
            objects += QString::fromUtf8(CSKavellStringGetUTF8(CSKavellNotificationGetObject(next.get())));
            EXPECT_EQ(CSKavellDictionaryGetCount(CSKavellNotificationGetUserInformation(next.get())), 0u);
        }
        return objects;
    }

    const kavell::Ref<CSKavellNotificationObserverRef> observer =
        kavell::adopt(CSKavellNotificationObserverCreate(kavell::makeString("KADidResetDataNotification").get()));
    const kavell::test::LogCapture log;
};

TEST_F(ResetData, DeletesTheProvidersDirectoryAndSaysSo)
{
    kavell::test::writeFile(place(kType + "/anna.plist"), "data");
    kavell::test::writeFile(place("com.corvane.account.google/bert.plist"), "data");
    KAResetDataForProviderID(kKAProviderMail);
    EXPECT_FALSE(std::filesystem::exists(place(kType)));
    EXPECT_TRUE(std::filesystem::exists(place("com.corvane.account.google/bert.plist")));
    EXPECT_THAT(announced(), ElementsAre(kKAProviderMail));
}

TEST_F(ResetData, DeletesAFileOfTheBareNameAndNotTheOneWithTheExtension)
{
    kavell::test::writeFile(place(kType), "file");
    kavell::test::writeFile(place(kType + ".plist"), "other");
    KAResetDataForProviderID(kKAProviderMail);
    EXPECT_FALSE(std::filesystem::exists(place(kType)));
    EXPECT_TRUE(std::filesystem::exists(place(kType + ".plist")));
}

TEST_F(ResetData, LeavesWhatALinkPointsAt)
{
    kavell::test::writeFile(place("com.corvane.account.google/bert.plist"), "data");
    std::filesystem::remove_all(place(kType));
    std::filesystem::create_directory_symlink(place("com.corvane.account.google"), place(kType));
    KAResetDataForProviderID(kKAProviderMail);
    EXPECT_FALSE(std::filesystem::is_symlink(place(kType)));
    EXPECT_TRUE(std::filesystem::exists(place("com.corvane.account.google/bert.plist")));
}

TEST_F(ResetData, AnnouncesAProviderWithoutDataToo)
{
    std::filesystem::remove_all(place(kType));
    KAResetDataForProviderID(kKAProviderMail);
    EXPECT_THAT(announced(), ElementsAre(kKAProviderMail));
    EXPECT_THAT(log.messages(), IsEmpty());
}

TEST_F(ResetData, AnotherThreadWaitsForTheMainThreadToDoIt)
{
    kavell::test::writeFile(place(kType + "/anna.plist"), "data");
    std::atomic<bool> returned = false;
    std::thread worker([&] {
        KAResetDataForProviderID(kKAProviderMail);
        returned = true;
    });
    // Until the event loop runs here nothing is done: the call can only be waiting for it.
    EXPECT_TRUE(std::filesystem::exists(place(kType)));
    EXPECT_FALSE(returned);
    const QDeadlineTimer bound(std::chrono::seconds(30));
    while (!returned && !bound.hasExpired())
        QCoreApplication::processEvents(QEventLoop::AllEvents, 100);
    worker.join();
    EXPECT_FALSE(std::filesystem::exists(place(kType)));
    EXPECT_THAT(announced(), ElementsAre(kKAProviderMail));
}

TEST_F(ResetData, RefusesWhatWouldReachTheDataOfOthers)
{
    kavell::test::writeFile(place(kType + "/anna.plist"), "data");
    for (const QString name : {"", ".", "..", "../V1", "a/../com.corvane.account.mail"})
        KAResetDataForProviderID(name);
    KAResetDataForProviderID({});
    EXPECT_TRUE(std::filesystem::exists(place(kType + "/anna.plist")));
    EXPECT_THAT(announced(), IsEmpty());
    ASSERT_EQ(log.messages().size(), 6);
    EXPECT_EQ(log.messages().last(),
              "*** Not resetting the data of provider (null): it is not the name of a provider type");
}

}  // namespace
