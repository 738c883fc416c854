// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The notification centre: within one process and between real ones.

#include <chrono>
#include <csignal>
#include <sched.h>
#include <sys/mount.h>
#include <sys/wait.h>
#include <thread>
#include <unistd.h>

#include "tests/store/store_test.h"

using namespace kavell;
using namespace kavell::test;

namespace {

using Clock = std::chrono::steady_clock;
using Observer = Ref<CSKavellNotificationObserverRef>;
using Notification = Ref<CSKavellNotificationRef>;

bool post(std::string_view name, const Ref<CSKavellDictionaryRef> &information = nullptr)
{
    return CSKavellNotificationPost(text(name).get(), nullptr, information.get());
}

Observer observe(std::string_view name)
{
    return adopt(CSKavellNotificationObserverCreate(text(name).get()));
}

/// The next notification, waited for with a bound.
Notification nextOf(const Observer &observer, int milliseconds = 10000)
{
    Notification notification;
    while (!(notification = adopt(CSKavellNotificationObserverCopyNext(observer.get())))) {
        pollfd waiting{CSKavellNotificationObserverGetFileDescriptor(observer.get()), POLLIN, 0};
        if (poll(&waiting, 1, milliseconds) == 0)
            return nullptr;
    }
    return notification;
}

/// The number that a test put into a notification; -1 for none.
int64_t numberOf(const Notification &notification)
{
    const auto information = CSKavellNotificationGetUserInformation(notification.get());
    const auto number = cast<CSKavellNumberRef>(valueOf(information, "number"), CSKavellNumberGetTypeID());
    return number ? CSKavellNumberGetInt64(number) : -1;
}

/// What a child exits with when the system does not let it do what the test needs.
constexpr int kSkipped = 255;

/// Ends a child's body with its line, so that the parent can say which check failed.
#define ASSERT_OR_RETURN(condition)                                                                                    \
    do {                                                                                                               \
        if (!(condition))                                                                                              \
            return __LINE__ % 255;                                                                                     \
    } while (false)

/// A pipe between a test and its child: each side says one byte when it has come so far.
class Signal {
public:
    Signal()
    {
        if (pipe(m_ends) != 0)
            std::abort();
    }
    ~Signal()
    {
        close(m_ends[0]);
        close(m_ends[1]);
    }
    Signal(const Signal &) = delete;
    Signal &operator=(const Signal &) = delete;

    void give() const { EXPECT_EQ(write(m_ends[1], "x", 1), 1); }
    [[nodiscard]] bool take() const
    {
        pollfd waiting{m_ends[0], POLLIN, 0};
        char byte;
        return poll(&waiting, 1, 30000) == 1 && read(m_ends[0], &byte, 1) == 1;
    }

private:
    int m_ends[2];
};

std::string meetingDirectory()
{
    return std::string(std::getenv("XDG_RUNTIME_DIR")) + "/kavell-accounts";
}

size_t socketCount()
{
    size_t count = 0;
    if (std::filesystem::exists(meetingDirectory())) {
        for ([[maybe_unused]] const auto &entry : std::filesystem::directory_iterator(meetingDirectory()))
            ++count;
    }
    return count;
}

/// Children are forked, so these tests run without the bus, whose copies a thread sends.
class CSKavellNotificationTest : public testing::Test {
protected:
    CSKavellNotificationTest() { unsetenv("DBUS_SESSION_BUS_ADDRESS"); }
};

}  // namespace

TEST_F(CSKavellNotificationTest, DeliversNameObjectAndUserInformation)
{
    const Observer observer = observe("a name");
    const auto information = dictionary({{"text", text("<&> caf\xC3\xA9")},
                                         {"number", integer(-5)},
                                         {"nested", dictionary({{"list", array({boolean(true), date(5)})}})}});
    EXPECT_TRUE(CSKavellNotificationPost(text("a name").get(), text("an object").get(), information.get()));
    const Notification notification = nextOf(observer);
    ASSERT_TRUE(notification);
    EXPECT_EQ(CSKavellGetTypeID(notification.get()), CSKavellNotificationGetTypeID());
    EXPECT_TRUE(same(CSKavellNotificationGetName(notification.get()), text("a name").get()));
    EXPECT_TRUE(same(CSKavellNotificationGetObject(notification.get()), text("an object").get()));
    EXPECT_TRUE(same(CSKavellNotificationGetUserInformation(notification.get()), information.get()));
    EXPECT_FALSE(adopt(CSKavellNotificationObserverCopyNext(observer.get())));
}

TEST_F(CSKavellNotificationTest, ObjectAndUserInformationMayBeNone)
{
    const Observer observer = observe("a name");
    EXPECT_TRUE(post("a name"));
    const Notification notification = nextOf(observer);
    ASSERT_TRUE(notification);
    EXPECT_EQ(CSKavellNotificationGetObject(notification.get()), nullptr);
    ASSERT_NE(CSKavellNotificationGetUserInformation(notification.get()), nullptr);
    EXPECT_EQ(CSKavellDictionaryGetCount(CSKavellNotificationGetUserInformation(notification.get())), 0u);
}

TEST_F(CSKavellNotificationTest, AnObserverGetsOnlyTheNameItAskedFor)
{
    const Observer named = observe("mine"), all = adopt(CSKavellNotificationObserverCreate(nullptr));
    EXPECT_TRUE(post("other"));
    EXPECT_TRUE(post("mine"));
    EXPECT_EQ(toStringView(CSKavellNotificationGetName(nextOf(named).get())), "mine");
    EXPECT_FALSE(adopt(CSKavellNotificationObserverCopyNext(named.get())));
    EXPECT_EQ(toStringView(CSKavellNotificationGetName(nextOf(all).get())), "other");
    EXPECT_EQ(toStringView(CSKavellNotificationGetName(nextOf(all).get())), "mine");
}

TEST_F(CSKavellNotificationTest, OnlyWhatIsPostedAfterItsCreationReachesAnObserver)
{
    EXPECT_TRUE(post("a name"));
    const Observer observer = observe("a name");
    EXPECT_FALSE(adopt(CSKavellNotificationObserverCopyNext(observer.get())));
}

TEST_F(CSKavellNotificationTest, AnObserversDescriptorIsReadableExactlyWhileSomethingWaits)
{
    const Observer observer = observe("a name");
    pollfd waiting{CSKavellNotificationObserverGetFileDescriptor(observer.get()), POLLIN, 0};
    EXPECT_EQ(poll(&waiting, 1, 0), 0);
    EXPECT_TRUE(post("a name"));
    EXPECT_EQ(poll(&waiting, 1, 0), 1);
    EXPECT_TRUE(nextOf(observer));
    EXPECT_FALSE(adopt(CSKavellNotificationObserverCopyNext(observer.get())));
    EXPECT_EQ(poll(&waiting, 1, 0), 0);
}

TEST_F(CSKavellNotificationTest, NoneOperandsAnswerNoneOrFalse)
{
    EXPECT_FALSE(CSKavellNotificationPost(nullptr, text("object").get(), nullptr));
    EXPECT_EQ(CSKavellNotificationObserverGetFileDescriptor(nullptr), -1);
    EXPECT_FALSE(adopt(CSKavellNotificationObserverCopyNext(nullptr)));
    EXPECT_EQ(CSKavellNotificationGetName(nullptr), nullptr);
    EXPECT_EQ(CSKavellNotificationGetObject(nullptr), nullptr);
    EXPECT_EQ(CSKavellNotificationGetUserInformation(nullptr), nullptr);
}

TEST_F(CSKavellNotificationTest, WhatAPropertyListCannotHoldIsNotPosted)
{
    const Observer observer = observe("a name");
    EXPECT_FALSE(post("a name", dictionary({{"uuid", Value(adopt(CSKavellUUIDCreate()))}})));
    EXPECT_FALSE(adopt(CSKavellNotificationObserverCopyNext(observer.get())));
}

TEST_F(CSKavellNotificationTest, DeliversABigDictionary)
{
    const Observer observer = observe("a name");
    const auto information = adopt(CSKavellDictionaryCreateMutable());
    for (int index = 0; index < 500; ++index)
        CSKavellDictionarySetValue(information.get(), text("key " + std::to_string(index)).get(),
                                   text(std::string(60, 'x')).get());
    EXPECT_TRUE(post("a name", information));
    EXPECT_TRUE(same(CSKavellNotificationGetUserInformation(nextOf(observer).get()), information.get()));
}

TEST_F(CSKavellNotificationTest, ReleasingAnObserverRemovesItsSocket)
{
    const size_t before = socketCount();
    {
        const Observer observer = observe("a name");
        EXPECT_EQ(socketCount(), before + 1);
    }
    EXPECT_EQ(socketCount(), before);
    EXPECT_TRUE(post("a name"));
}

TEST_F(CSKavellNotificationTest, WithoutARuntimeDirectoryOfTheirOwnPosterAndObserverStillMeet)
{
    // In a process that sees empty directories of its own where the host has its runtime and temporary files.
    ChildProcess child([] {
        if (unshare(CLONE_NEWNS) != 0 || mount("none", "/", nullptr, MS_REC | MS_PRIVATE, nullptr) != 0 ||
            mount("none", "/run", "tmpfs", 0, nullptr) != 0 || mount("none", "/tmp", "tmpfs", 0, nullptr) != 0)
            return kSkipped;
        ASSERT_OR_RETURN(mkdir("/run/shared", 0755) == 0);
        for (const char *directory : {"", "/nonexistent/for/sure", "/run/shared"}) {
            setenv("XDG_RUNTIME_DIR", directory, 1);
            const Observer observer = observe("a name");
            ASSERT_OR_RETURN(observer);
            ASSERT_OR_RETURN(post("a name"));
            ASSERT_OR_RETURN(nextOf(observer));
        }
        // Nothing of the observers is where others may look.
        ASSERT_OR_RETURN(std::filesystem::is_empty("/run/shared"));
        return 0;
    });
    const int status = child.wait();
    if (status == kSkipped)
        GTEST_SKIP() << "no mount namespace can be made here";
    EXPECT_EQ(status, 0) << "the check before line " << status << " failed (modulo 256)";
}

TEST_F(CSKavellNotificationTest, WithoutAnyDirectoryToMeetInThereIsNoObserverAndPostingIsHarmless)
{
    ChildProcess child([] {
        if (unshare(CLONE_NEWNS) != 0 || mount("none", "/", nullptr, MS_REC | MS_PRIVATE, nullptr) != 0 ||
            mount("none", "/run", "tmpfs", MS_RDONLY, nullptr) != 0 ||
            mount("none", "/tmp", "tmpfs", MS_RDONLY, nullptr) != 0)
            return kSkipped;
        unsetenv("XDG_RUNTIME_DIR");
        errno = 0;
        ASSERT_OR_RETURN(!observe("a name"));
        ASSERT_OR_RETURN(errno != 0);
        post("a name");
        return 0;
    });
    const int status = child.wait();
    if (status == kSkipped)
        GTEST_SKIP() << "no mount namespace can be made here";
    EXPECT_EQ(status, 0) << "the check before line " << status << " failed (modulo 256)";
}

TEST_F(CSKavellNotificationTest, ABurstReachesAnObserverThatIsBusyWithoutLossAndInOrder)
{
    constexpr int kPosts = 1000;
    const Signal ready, posted;
    ChildProcess child([&] {
        const Observer observer = observe("burst");
        ready.give();
        // Busy with something else until all is posted, which is more than a second's worth.
        if (!posted.take())
            return 2;
        for (int number = 0; number < kPosts; ++number) {
            if (numberOf(nextOf(observer)) != number)
                return 3;
        }
        return adopt(CSKavellNotificationObserverCopyNext(observer.get())) ? 4 : 0;
    });
    ASSERT_TRUE(ready.take());
    for (int number = 0; number < kPosts; ++number)
        ASSERT_TRUE(post("burst", dictionary({{"number", integer(number)}}))) << number;
    posted.give();
    EXPECT_EQ(child.wait(), 0);
}

TEST_F(CSKavellNotificationTest, WhatAProcessPostsRightBeforeItsEndArrives)
{
    const Observer observer = observe("last words");
    for (int number = 0; number < 50; ++number) {
        ChildProcess child([&] { return post("last words", dictionary({{"number", integer(number)}})) ? 0 : 1; });
        ASSERT_EQ(child.wait(), 0);
        ASSERT_EQ(numberOf(nextOf(observer)), number);
    }
}

TEST_F(CSKavellNotificationTest, EachThreadsPostsArriveInItsOrder)
{
    const Observer observer = observe("threads");
    {
        std::vector<std::jthread> threads;
        for (int thread = 0; thread < 4; ++thread)
            threads.emplace_back([thread] {
                for (int number = 0; number < 200; ++number)
                    EXPECT_TRUE(post("threads", dictionary({{"number", integer(thread * 1000 + number)}})));
            });
        int64_t expected[4] = {0, 1000, 2000, 3000};
        for (int count = 0; count < 800; ++count) {
            const int64_t number = numberOf(nextOf(observer));
            ASSERT_GE(number, 0) << count;
            ASSERT_EQ(number, expected[number / 1000]++);
        }
    }
    EXPECT_FALSE(adopt(CSKavellNotificationObserverCopyNext(observer.get())));
}

TEST_F(CSKavellNotificationTest, AStoppedObserverWithAFullBacklogIsGivenUpOnInBoundedTime)
{
    const Signal ready;
    ChildProcess child([&] {
        const Observer observer = observe("stopped");
        ready.give();
        for (;;)
            pause();
        return 0;
    });
    ASSERT_TRUE(ready.take());
    child.signal(SIGSTOP);
    int delivered = 0;
    auto slowest = Clock::duration::zero();
    for (bool taken = true; taken && delivered < 100000; delivered += taken) {
        const auto start = Clock::now();
        taken = post("stopped");
        slowest = std::max(slowest, Clock::now() - start);
    }
    EXPECT_GE(delivered, 1000);
    EXPECT_LT(delivered, 100000) << "the backlog of a stopped observer has no end";
    EXPECT_LT(slowest, std::chrono::milliseconds(500));

    // Others are reached all the same, and a commit is neither failed nor held up.
    const Observer other = observe("com.corvane.KavellAccounts");
    const Account account = openAccount("stopped observer");
    const auto start = Clock::now();
    commit(account);
    EXPECT_LT(Clock::now() - start, std::chrono::milliseconds(1500));
    EXPECT_FALSE(hasPendingChanges(account));
    EXPECT_TRUE(nextOf(other));
    child.signal(SIGCONT);
}

TEST_F(CSKavellNotificationTest, TheSocketOfAKilledObserverIsSweptAway)
{
    const Signal ready;
    EXPECT_TRUE(post("sweep"));  // those that earlier tests left
    const size_t before = socketCount();
    {
        ChildProcess child([&] {
            const Observer observer = observe("killed");
            ready.give();
            for (;;)
                pause();
            return 0;
        });
        ASSERT_TRUE(ready.take());
        EXPECT_EQ(socketCount(), before + 1);
        child.signal(SIGKILL);
        EXPECT_EQ(child.wait(), 128 + SIGKILL);
    }
    EXPECT_EQ(socketCount(), before + 1);
    EXPECT_TRUE(post("killed"));
    EXPECT_EQ(socketCount(), before);
}

TEST_F(CSKavellNotificationTest, TheMeetingPlaceIsForTheUserOnly)
{
    const Observer observer = observe("a name");
    EXPECT_EQ(permissionsOf(meetingDirectory()), 0700u);
}

TEST_F(CSKavellNotificationTest, AnAddressWhereNoBusStandsCostsACommitNothing)
{
    setenv("DBUS_SESSION_BUS_ADDRESS", "unix:path=/nonexistent/for/sure", 1);
    const Observer observer = observe("com.corvane.KavellAccounts");
    const Account account = openAccount("no bus");
    const auto start = Clock::now();
    commit(account);
    EXPECT_LT(Clock::now() - start, std::chrono::milliseconds(500));
    EXPECT_FALSE(hasPendingChanges(account));
    EXPECT_TRUE(nextOf(observer));
}
