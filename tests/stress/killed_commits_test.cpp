// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A program killed at any moment of a commit leaves the account as before or as after it, never in between.

#include <algorithm>
#include <chrono>
#include <csignal>
#include <random>
#include <sys/ipc.h>
#include <sys/sem.h>
#include <sys/wait.h>
#include <unistd.h>

#include "tests/store/store_test.h"

using namespace kavell;
using namespace kavell::test;

namespace {

using Clock = std::chrono::steady_clock;

/// Kills forked children, so the whole program runs without the bus, whose copies a thread sends.
class KilledCommits : public StoreTest {
protected:
    KilledCommits() { unsetenv("DBUS_SESSION_BUS_ADDRESS"); }

    /// What the account says of itself: its round, whose text must fit to it.
    struct State {
        int64_t round = -1;
        bool isWhole = false;
    };

    static std::string textOf(int round)
    {
        // Now longer and now shorter than the one before, within one page and over several.
        return std::string(static_cast<size_t>(round) * 7919 % 13001, static_cast<char>('a' + round % 26));
    }

    static void change(const Account &account, int round)
    {
        setAttribute(account, "round", integer(round));
        setAttribute(account, "text", text(textOf(round)));
        _CSKavellAccountSetServiceAttribute(account.get(), kCSKavellAccountServiceMail, text("round").get(),
                                            integer(round).get());
    }

    static State stateOf(const Account &account)
    {
        const Value number = attribute(account, "round");
        if (!number)
            return {};
        State state;
        state.round = CSKavellNumberGetInt64(cast<CSKavellNumberRef>(number.get(), CSKavellNumberGetTypeID()));
        state.isWhole = same(attribute(account, "text"), text(textOf(static_cast<int>(state.round)))) &&
                        same(serviceAttributes(account, kCSKavellAccountServiceMail), dictionary({{"round", number}}));
        return state;
    }

    /// Gives a dead holder's semaphore back, as a repair does.
    static void freeSemaphore(key_t key)
    {
        const int set = semget(key, 0, 0);
        if (set >= 0 && semctl(set, 0, GETVAL) == 0)
            semctl(set, 0, SETVAL, 1);
    }

    void freeSemaphores() const
    {
        freeSemaphore(-1);
        freeSemaphore(ftok(fileOf("ada").c_str(), 0));
    }

    /// Commits the round in a child and kills it after the delay; whether it was killed before it was done.
    [[nodiscard]] bool commitAndKill(int round, std::chrono::nanoseconds delay) const
    {
        int ready[2];
        if (pipe(ready) != 0)
            std::abort();
        const pid_t child = fork();
        if (child == 0) {
            const Account account = openAccount("ada");
            change(account, round);
            if (write(ready[1], "x", 1) == 1)
                commit(account);
            _exit(0);
        }
        char byte;
        EXPECT_EQ(read(ready[0], &byte, 1), 1);
        // A sleep is coarser than a commit.
        const auto until = Clock::now() + delay;
        while (Clock::now() < until) {
        }
        kill(child, SIGKILL);
        int status = 0;
        waitpid(child, &status, 0);
        close(ready[0]);
        close(ready[1]);
        return WIFSIGNALED(status);
    }

    /// How long a commit takes here, from the beginning to the end.
    [[nodiscard]] std::chrono::nanoseconds measureCommit() const
    {
        std::vector<std::chrono::nanoseconds> times;
        const Account account = openAccount("ada");
        for (int round = 0; round < 31; ++round) {
            change(account, round);
            const auto start = Clock::now();
            commit(account);
            times.push_back(Clock::now() - start);
        }
        std::sort(times.begin(), times.end());
        return times[times.size() / 2];
    }
};

/// Moments at which to kill, anywhere in a window from the start of a commit. The window grows while the kills come too
/// early and shrinks while they come too late, so that they meet the commits however fast these are here.
class KillMoments {
public:
    explicit KillMoments(std::chrono::nanoseconds usual)
        : m_random(std::random_device()()), m_window(static_cast<double>(usual.count()))
    {
    }

    [[nodiscard]] std::chrono::nanoseconds next()
    {
        return std::chrono::nanoseconds(
            static_cast<int64_t>(std::uniform_real_distribution<double>(0, m_window)(m_random)));
    }

    void learn(bool wasDone) { m_window *= wasDone ? 0.97 : 1.03; }

private:
    std::mt19937 m_random;
    double m_window;
};

}  // namespace

TEST_F(KilledCommits, LeaveAnExistingFileAsBeforeOrAsAfter)
{
    constexpr int kRounds = 1700;
    KillMoments moments(measureCommit());
    int killed = 0, before = 0, after = 0;
    int64_t last = stateOf(openAccount("ada")).round;
    for (int round = 100; round < 100 + kRounds; ++round) {
        killed += commitAndKill(round, moments.next());
        freeSemaphores();
        StandardErrorCapture capture;
        const Account account = openAccount("ada");
        ASSERT_EQ(capture.take(), "") << round;
        const State state = stateOf(account);
        ASSERT_TRUE(state.isWhole) << round << " shows " << state.round;
        ASSERT_TRUE(state.round == last || state.round == round) << round << " shows " << state.round;
        ++(state.round == round ? after : before);
        moments.learn(state.round == round);
        last = state.round;
    }
    // The kills must have met the commits, or nothing was shown.
    EXPECT_GT(killed, kRounds / 4);
    EXPECT_GT(before, kRounds / 50);
    EXPECT_GT(after, kRounds / 50);
    EXPECT_EQ(entriesBeginningWith("damaged"), Names{});

    const Account account = openAccount("ada");
    change(account, 5000);
    commit(account);
    EXPECT_EQ(stateOf(openAccount("ada")).round, 5000);
    EXPECT_EQ(entriesBesideVoidRecords(), Names{"ada.plist"});
}

TEST_F(KilledCommits, LeaveANewFileWholeOrNotThere)
{
    constexpr int kRounds = 300;
    KillMoments moments(measureCommit());
    int missing = 0, whole = 0;
    for (int round = 100; round < 100 + kRounds; ++round) {
        std::filesystem::remove(fileOf("ada"));
        (void)commitAndKill(round, moments.next());
        freeSemaphores();
        moments.learn(std::filesystem::exists(fileOf("ada")));
        if (!std::filesystem::exists(fileOf("ada"))) {
            ++missing;
            continue;
        }
        ++whole;
        StandardErrorCapture capture;
        const State state = stateOf(openAccount("ada"));
        ASSERT_EQ(capture.take(), "") << round;
        ASSERT_TRUE(state.isWhole) << round;
        ASSERT_EQ(state.round, round);
    }
    EXPECT_GT(missing, kRounds / 50);
    EXPECT_GT(whole, kRounds / 50);
    // What a killed creator left beside the file is no account.
    const auto provider = adopt(_CSKavellAccountProviderCreate(nullptr, text(kMail).get()));
    EXPECT_LE(CSKavellArrayGetCount(adopt(_CSKavellAccountProviderCopyAccounts(provider.get())).get()), 1u);
}
