// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The semaphore of a data file, looked at with the system's own calls.

#include <atomic>
#include <csignal>
#include <cstddef>
#include <linux/filter.h>
#include <linux/seccomp.h>
#include <sched.h>
#include <sys/file.h>
#include <sys/ipc.h>
#include <sys/prctl.h>
#include <sys/sem.h>
#include <sys/syscall.h>
#include <thread>
#include <unistd.h>

#include "tests/store/store_test.h"

using namespace kavell;
using namespace kavell::test;

namespace {

int setOf(key_t key)
{
    return semget(key, 0, 0);
}

int setOfFile(const std::string &path)
{
    return setOf(ftok(path.c_str(), 0));
}

int valueOf(int set)
{
    return semctl(set, 0, GETVAL);
}

void setValue(int set, int value)
{
    ASSERT_EQ(semctl(set, 0, SETVAL, value), 0);
}

/// Waits, with a bound, until something is so.
template <typename Condition> bool waitUntil(Condition condition)
{
    const auto deadline = std::chrono::steady_clock::now() + std::chrono::seconds(20);
    while (!condition()) {
        if (std::chrono::steady_clock::now() > deadline)
            return false;
        std::this_thread::yield();
    }
    return true;
}

class AccountSemaphore : public StoreTest {
protected:
    AccountSemaphore()
    {
        // Earlier tests' files may have had the same inode and with it the same set.
        removeSet(setOf(-1));
        writeFile(fileOf("ada"), accountFile("<key>a</key><integer>1</integer>"));
        removeSet(setOfFile(fileOf("ada")));
    }
    ~AccountSemaphore() override
    {
        removeSet(setOf(-1));
        removeSet(setOfFile(fileOf("ada")));
    }

    static void removeSet(int set)
    {
        if (set >= 0)
            semctl(set, 0, IPC_RMID);
    }

    /// Another process of this user that saves the attribute meanwhile, so that the next read has something to read.
    void saveByAnother(int value) const
    {
        writeFile(fileOf("ada"), accountFile("<key>a</key><integer>" + std::to_string(value) + "</integer>"));
    }
};

std::atomic<int> handledSignals{0};

/// Interrupts a thread with a signal each time it waits for the semaphore. The signal's handler restarts nothing.
class Interrupter {
public:
    Interrupter(int set, pthread_t waiting)
    {
        handledSignals = 0;
        struct sigaction action {};
        action.sa_handler = [](int) {
            ++handledSignals;
        };
        sigaction(SIGUSR1, &action, &m_before);
        m_thread = std::jthread([this, set, waiting] { interrupt(set, waiting); });
    }
    ~Interrupter() { sigaction(SIGUSR1, &m_before, nullptr); }

    /// Ends it; how many waits were interrupted.
    [[nodiscard]] int stop()
    {
        m_stopped = true;
        m_thread.join();
        return handledSignals;
    }

private:
    static constexpr int kMost = 50;

    void interrupt(int set, pthread_t waiting)
    {
        while (!m_stopped && handledSignals < kMost) {
            const int before = handledSignals;
            if (semctl(set, 0, GETNCNT) == 1 && pthread_kill(waiting, SIGUSR1) == 0)
                waitUntil([&] { return handledSignals > before; });
            std::this_thread::yield();
        }
        // A wait that goes on after so many interruptions would never end: let it through.
        if (!m_stopped)
            semctl(set, 0, SETVAL, 100);
    }

    std::atomic<bool> m_stopped{false};
    struct sigaction m_before {};
    std::jthread m_thread;
};

}  // namespace

TEST_F(AccountSemaphore, IsFoundByTheFilesKeyForTheUserOnlyAndFreeAfterUse)
{
    ASSERT_LT(setOfFile(fileOf("ada")), 0);
    const Account account = openAccount("ada");
    const int set = setOfFile(fileOf("ada"));
    ASSERT_GT(set, 0);
    EXPECT_EQ(valueOf(set), 1);
    semid_ds status{};
    ASSERT_EQ(semctl(set, 0, IPC_STAT, &status), 0);
    EXPECT_EQ(status.sem_perm.mode & 0777, 0600);
    EXPECT_EQ(status.sem_nsems, 1u);
    EXPECT_EQ(status.sem_perm.uid, geteuid());
    setAttribute(account, "b", integer(2));
    commit(account);
    EXPECT_EQ(valueOf(set), 1);
    EXPECT_EQ(semctl(set, 0, GETPID), getpid());
}

TEST_F(AccountSemaphore, AnExistingSetIsUsedAsItIs)
{
    const int set = semget(ftok(fileOf("ada").c_str(), 0), 1, IPC_CREAT | IPC_EXCL | 0600);
    ASSERT_GT(set, 0);
    setValue(set, 5);
    const Account account = openAccount("ada");
    EXPECT_TRUE(same(attribute(account, "a"), integer(1)));
    EXPECT_EQ(setOfFile(fileOf("ada")), set);
    EXPECT_EQ(valueOf(set), 5);
}

TEST_F(AccountSemaphore, ARecordThatFirstLockedBeforeItsFileExistedKeepsTheSetOfThatKey)
{
    ASSERT_LT(setOf(-1), 0);
    const Account account = openAccount("new");
    EXPECT_LT(setOf(-1), 0);
    commit(account);
    const int first = setOf(-1);
    ASSERT_GT(first, 0);
    EXPECT_EQ(valueOf(first), 1);
    removeSet(setOfFile(fileOf("new")));
    setAttribute(account, "b", integer(2));
    commit(account);
    writeFile(fileOf("new"), accountFile("<key>c</key><integer>3</integer>"));
    EXPECT_TRUE(CSKavellAccountLoadData(account.get()));
    EXPECT_TRUE(same(attribute(account, "c"), integer(3)));
    EXPECT_LT(setOfFile(fileOf("new")), 0);

    const Account second = openAccount("new");
    EXPECT_GT(setOfFile(fileOf("new")), 0);
    EXPECT_NE(setOfFile(fileOf("new")), first);
    removeSet(setOfFile(fileOf("new")));
}

TEST_F(AccountSemaphore, TheSetIsNeverLookedUpAgain)
{
    const Account account = openAccount("ada");
    removeSet(setOfFile(fileOf("ada")));
    saveByAnother(2);
    StandardErrorCapture capture;
    EXPECT_TRUE(CSKavellAccountLoadData(account.get()));
    EXPECT_TRUE(same(attribute(account, "a"), integer(1)));
    EXPECT_LT(setOfFile(fileOf("ada")), 0);
    EXPECT_EQ(capture.take(), "");
}

TEST_F(AccountSemaphore, AWaitLastsUntilTheSemaphoreCanBeTaken)
{
    const Account account = openAccount("ada");
    const int set = setOfFile(fileOf("ada"));
    saveByAnother(2);
    setValue(set, 0);
    std::atomic<bool> done{false};
    std::jthread reader([&] {
        EXPECT_TRUE(CSKavellAccountLoadData(account.get()));
        done = true;
    });
    ASSERT_TRUE(waitUntil([&] { return semctl(set, 0, GETNCNT) == 1; }));
    EXPECT_FALSE(done);
    setValue(set, 1);
    reader.join();
    EXPECT_TRUE(same(attribute(account, "a"), integer(2)));
    EXPECT_EQ(valueOf(set), 1);
}

TEST_F(AccountSemaphore, AnInterruptedWaitReadsNothingAndIsNotRetried)
{
    const Account account = openAccount("ada");
    const int set = setOfFile(fileOf("ada"));
    saveByAnother(2);
    setValue(set, 0);
    struct sigaction action {
    }, before{};
    action.sa_handler = [](int) {
    };
    ASSERT_EQ(sigaction(SIGUSR1, &action, &before), 0);
    StandardErrorCapture capture;
    {
        Interrupter interrupter(set, pthread_self());
        EXPECT_TRUE(CSKavellAccountLoadData(account.get()));
        EXPECT_EQ(interrupter.stop(), 1);
    }
    EXPECT_EQ(capture.take(), "");
    EXPECT_TRUE(same(attribute(account, "a"), integer(1)));
    EXPECT_EQ(valueOf(set), 0);
}

TEST_F(AccountSemaphore, AnInterruptedWaitWritesNothingKeepsTheChangesAndIsAnnounced)
{
    const Account account = openAccount("ada");
    const int set = setOfFile(fileOf("ada"));
    setAttribute(account, "b", integer(2));
    const std::string before = readFile(fileOf("ada"));
    Notifications notifications;
    setValue(set, 0);
    struct sigaction action {
    }, previous{};
    action.sa_handler = [](int) {
    };
    ASSERT_EQ(sigaction(SIGUSR1, &action, &previous), 0);
    StandardErrorCapture capture;
    {
        Interrupter interrupter(set, pthread_self());
        commit(account);
        EXPECT_EQ(interrupter.stop(), 2);  // the re-read's wait and the write's
    }
    EXPECT_EQ(capture.take(), "");
    EXPECT_EQ(readFile(fileOf("ada")), before);
    EXPECT_TRUE(hasPendingChanges(account));
    EXPECT_EQ(notifications.takeLoginNames(), (Names{"ada"}));
    EXPECT_EQ(valueOf(set), 0);
}

TEST_F(AccountSemaphore, AReleaseThatFailsIsReportedWithoutALineFeed)
{
    const Account account = openAccount("ada");
    const int set = setOfFile(fileOf("ada"));
    saveByAnother(2);
    // Whoever reads takes the semaphore first and the file's own lock then: held here, that stops it in between.
    const int file = open(fileOf("ada").c_str(), O_RDONLY | O_CLOEXEC);
    ASSERT_EQ(flock(file, LOCK_EX), 0);
    StandardErrorCapture capture;
    std::jthread reader([&] { EXPECT_TRUE(CSKavellAccountLoadData(account.get())); });
    EXPECT_TRUE(waitUntil([&] { return valueOf(set) == 0; }));
    removeSet(set);
    close(file);
    reader.join();
    EXPECT_EQ(capture.take(), "Error 22: failed to release Kavell Accounts data lock");
    EXPECT_TRUE(same(attribute(account, "a"), integer(2)));
}

TEST_F(AccountSemaphore, AReleaseThatWouldOverflowIsReportedWithItsErrorNumber)
{
    const Account account = openAccount("ada");
    const int set = setOfFile(fileOf("ada"));
    saveByAnother(2);
    const int file = open(fileOf("ada").c_str(), O_RDONLY | O_CLOEXEC);
    ASSERT_EQ(flock(file, LOCK_EX), 0);
    StandardErrorCapture capture;
    std::jthread reader([&] { EXPECT_TRUE(CSKavellAccountLoadData(account.get())); });
    EXPECT_TRUE(waitUntil([&] { return valueOf(set) == 0; }));
    setValue(set, 32767);
    close(file);
    reader.join();
    EXPECT_EQ(capture.take(), "Error 34: failed to release Kavell Accounts data lock");
}

namespace {

/// Makes semget fail with ENOSPC from now on in this process, as it does when the system has no sets left.
bool refuseSemaphoreSets()
{
    sock_filter program[] = {
        BPF_STMT(BPF_LD | BPF_W | BPF_ABS, offsetof(seccomp_data, nr)),
        BPF_JUMP(BPF_JMP | BPF_JEQ | BPF_K, __NR_semget, 0, 1),
        BPF_STMT(BPF_RET | BPF_K, SECCOMP_RET_ERRNO | ENOSPC),
        BPF_STMT(BPF_RET | BPF_K, SECCOMP_RET_ALLOW),
    };
    const sock_fprog filter{static_cast<unsigned short>(std::size(program)), program};
    return prctl(PR_SET_NO_NEW_PRIVS, 1, 0, 0, 0) == 0 && prctl(PR_SET_SECCOMP, SECCOMP_MODE_FILTER, &filter) == 0;
}

/// Enters an IPC namespace in which no set was ever made.
bool enterFreshNamespace()
{
    return unshare(CLONE_NEWIPC) == 0 || unshare(CLONE_NEWUSER | CLONE_NEWIPC) == 0;
}

/// Runs a part of a test in a process of its own, whose failed expectations fail the test.
void inChild(const std::function<void()> &body)
{
    ChildProcess child([&] {
        // Without a bus it starts no thread, which the thread sanitizer cannot follow in a child of a threaded process.
        unsetenv("DBUS_SESSION_BUS_ADDRESS");
        body();
        return testing::Test::HasFailure() ? 1 : 0;
    });
    EXPECT_EQ(child.wait(), 0);
}

}  // namespace

TEST_F(AccountSemaphore, WithoutASetNothingIsReadOrWrittenAndEachAttemptIsReported)
{
    const std::string before = readFile(fileOf("ada"));
    inChild([&] {
        ASSERT_TRUE(refuseSemaphoreSets());
        StandardErrorCapture capture;
        const Account account = openAccount("ada");
        EXPECT_EQ(capture.take(), kSemaphoreMessage);
        EXPECT_FALSE(attribute(account, "a"));
        EXPECT_TRUE(CSKavellAccountLoadData(account.get()));
        EXPECT_EQ(capture.take(), kSemaphoreMessage);
        setAttribute(account, "b", integer(2));
        Notifications notifications;
        commit(account);
        EXPECT_EQ(capture.take(), std::string(kSemaphoreMessage) + std::string(kSemaphoreMessage));
        EXPECT_TRUE(hasPendingChanges(account));
        EXPECT_EQ(notifications.takeLoginNames(), (Names{"ada"}));
    });
    EXPECT_EQ(readFile(fileOf("ada")), before);
}

TEST_F(AccountSemaphore, ASetWithTheIdentifierZeroIsNeverUsed)
{
    const std::string before = readFile(fileOf("ada"));
    inChild([&] {
        if (!enterFreshNamespace())
            GTEST_SKIP() << "no IPC namespace can be made here";
        const int set = semget(ftok(fileOf("ada").c_str(), 0), 1, IPC_CREAT | IPC_EXCL | 0600);
        ASSERT_EQ(set, 0);
        setValue(set, 1);
        StandardErrorCapture capture;
        const Account account = openAccount("ada");
        EXPECT_FALSE(attribute(account, "a"));
        setAttribute(account, "b", integer(2));
        commit(account);
        EXPECT_TRUE(hasPendingChanges(account));
        EXPECT_EQ(semctl(set, 0, GETPID), getpid());  // by SETVAL only
        EXPECT_EQ(valueOf(set), 1);
    });
    EXPECT_EQ(readFile(fileOf("ada")), before);
}
