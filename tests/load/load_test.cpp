// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Sixteen processes that save, read, remove and reload 2,000 accounts at random for LOAD_SECONDS (20 unless the
// environment says otherwise), while some of them are killed and started anew and a doctor frees what those leave taken.
// Afterwards a judge follows the record of everything that happened (load_judge.h).

#include <chrono>
#include <cstdlib>
#include <map>
#include <memory>
#include <random>
#include <thread>

#include "tests/load/load_judge.h"
#include "tests/store/store_test.h"

using namespace kavell;
using namespace kavell::test;
using namespace std::chrono_literals;

namespace {

using Clock = std::chrono::steady_clock;

constexpr auto kBetweenKills = 100ms;

std::chrono::seconds duration()
{
    const char *seconds = std::getenv("LOAD_SECONDS");
    return std::chrono::seconds(seconds ? std::atoi(seconds) : 20);
}

class Load : public StoreTest {
protected:
    Load() : m_log(mapLoadLog(logPath().c_str())) { EXPECT_TRUE(m_log); }

    ~Load() override { std::filesystem::remove(logPath()); }

    /// On the disk: what five minutes bring is more than some systems have room for in memory.
    static std::string logPath() { return buildPath("load-log-" + std::to_string(getpid())); }

    static std::unique_ptr<ChildProcess> start(const std::string &task, size_t number, int output = STDOUT_FILENO)
    {
        return std::make_unique<ChildProcess>(
            std::vector<std::string>{buildPath("tests/load_worker"), task, std::to_string(number)},
            std::vector<std::string>{std::string(kLoadLogVariable) + "=" + logPath(), "DBUS_SESSION_BUS_ADDRESS="},
            STDIN_FILENO, output, STDERR_FILENO);
    }

    /// Accounts that no worker has had a hand in.
    static void makeAccounts(LoadJudge &judge)
    {
        for (size_t number = 0; number < kLoadAccounts; ++number) {
            const Account account = openAccount(loadLoginName(number));
            setAttribute(account, "kept", integer(static_cast<int64_t>(number)));
            commit(account);
            judge.begin(number, inodeOf(number));
        }
    }

    static uint64_t inodeOf(size_t account)
    {
        struct stat status {};
        return stat(fileOf(loadLoginName(account)).c_str(), &status) == 0 ? status.st_ino : 0;
    }

    void startWatchers()
    {
        for (size_t number = 0; number < kLoadWatchers; ++number) {
            int ends[2];
            ASSERT_EQ(pipe2(ends, O_CLOEXEC), 0);
            m_watchers.push_back(start("watch", number, ends[1]));
            close(ends[1]);
            char ready[6];
            ASSERT_EQ(::read(ends[0], ready, sizeof ready), 6);
            close(ends[0]);
        }
    }

    /// Runs the doctor again and again until all is over.
    void startDoctor()
    {
        m_doctor = std::make_unique<ChildProcess>([this] {
            while (!m_log->isSilent)
                (void)runProgram({buildPath("bin/kavell-accounts"), "doctor", "--repair"});
            return 0;
        });
    }

    /// Lets the workers work, and kills one now and then. Which processes were killed, and how many events there were when
    /// they were certainly dead.
    std::map<int32_t, uint64_t> runWorkers()
    {
        std::vector<std::unique_ptr<ChildProcess>> workers;
        for (size_t number = 0; number < kLoadWorkers; ++number)
            workers.push_back(start("work", number));
        std::map<int32_t, uint64_t> killed;
        std::mt19937 random(std::random_device{}());
        for (const auto end = Clock::now() + duration(); Clock::now() < end;) {
            std::this_thread::sleep_for(kBetweenKills);
            const size_t number = random() % kLoadWorkers;
            const pid_t process = workers[number]->pid();
            workers[number]->signal(SIGKILL);
            if (workers[number]->wait() == 128 + SIGKILL)
                killed[process] = m_log->count;
            workers[number] = start("work", number);
        }
        m_log->isOver = true;
        for (const auto &worker : workers)
            EXPECT_EQ(worker->wait(), 0);
        m_log->isSilent = true;
        for (const auto &watcher : m_watchers)
            EXPECT_EQ(watcher->wait(), 0);
        EXPECT_EQ(m_doctor->wait(), 0);
        return killed;
    }

    /// The killed processes by the number of the event behind which they have written no other.
    std::map<uint64_t, int32_t> silencesOf(const std::map<int32_t, uint64_t> &killed) const
    {
        std::map<int32_t, uint64_t> latest;
        for (uint64_t number = 0; number < m_log->count; ++number) {
            const LoadEntry &entry = m_log->entries[number];
            if (entry.event != LoadEvent::Unused && killed.contains(entry.process))
                latest[entry.process] = number;
        }
        std::map<uint64_t, int32_t> silences;
        for (const auto &[process, number] : latest)
            silences[number] = process;
        return silences;
    }

    /// Has the judge follow all that happened. What it complains of, with what came before.
    std::string follow(LoadJudge &judge, const std::map<int32_t, uint64_t> &killed) const
    {
        const std::map<uint64_t, int32_t> silences = silencesOf(killed);
        std::multimap<uint64_t, int32_t> deaths;
        for (const auto &[process, number] : killed)
            deaths.emplace(number, process);
        auto death = deaths.begin();
        for (uint64_t number = 0; number < m_log->count; ++number) {
            for (; death != deaths.end() && death->first <= number; ++death)
                judge.died(death->second);
            const std::string complaint = judge.follow(m_log->entries[number]);
            if (!complaint.empty())
                return complaint + "\n" + historyBefore(number);
            if (const auto silence = silences.find(number); silence != silences.end())
                judge.fellSilent(silence->second);
        }
        return {};
    }

    /// The account as a program finds it that comes now.
    static LoadJudge::Outcome outcomeOf(size_t number)
    {
        LoadJudge::Outcome outcome;
        const Account account = openAccount(loadLoginName(number));
        outcome.inode = inodeOf(number);
        for (size_t worker = 0; worker < kLoadWorkers; ++worker) {
            const Value value = attribute(account, loadKey(worker));
            if (const auto found = cast<CSKavellNumberRef>(value.get(), CSKavellNumberGetTypeID()))
                outcome.values[worker] = static_cast<uint32_t>(CSKavellNumberGetInt64(found));
        }
        return outcome;
    }

    /// The latest events of an account up to one of them, for a person who has to find out what went wrong.
    std::string historyBefore(uint64_t last) const
    {
        constexpr size_t kMost = 60;
        std::vector<std::string> lines;
        for (uint64_t number = last + 1; number-- > 0 && lines.size() < kMost;) {
            const LoadEntry &entry = m_log->entries[number];
            if (entry.account != m_log->entries[last].account)
                continue;
            std::string line = std::to_string(number) + " process " + std::to_string(entry.process) + " worker " +
                               std::to_string(entry.worker) + " " + loadEventName(entry.event) +
                               (entry.flag ? "! " : " ") + std::to_string(entry.number) + " inode " +
                               std::to_string(entry.inode) + ":";
            for (uint32_t value : entry.values)
                line += " " + std::to_string(value);
            lines.push_back(std::move(line));
        }
        std::string history;
        for (auto line = lines.rbegin(); line != lines.rend(); ++line)
            history += *line + "\n";
        return history;
    }

    LoadLog *const m_log;

private:
    std::vector<std::unique_ptr<ChildProcess>> m_watchers;
    std::unique_ptr<ChildProcess> m_doctor;
};

bool contains(const std::vector<LoadJudge::Outcome> &outcomes, const LoadJudge::Outcome &found)
{
    return std::any_of(outcomes.begin(), outcomes.end(), [&](const LoadJudge::Outcome &outcome) {
        return outcome.inode == found.inode && outcome.values == found.values;
    });
}

}  // namespace

TEST_F(Load, SixteenProcessesAndTheirKillsLeaveWhatTheirHoldsAllow)
{
    LoadJudge judge;
    makeAccounts(judge);
    startWatchers();
    startDoctor();
    const std::map<int32_t, uint64_t> killed = runWorkers();

    const uint64_t count = m_log->count;
    ASSERT_LT(count, kMostLoadEntries);
    ASSERT_EQ(follow(judge, killed), "");

    for (size_t account = 0; account < kLoadAccounts; ++account) {
        SCOPED_TRACE(loadLoginName(account));
        EXPECT_TRUE(contains(judge.outcomes(account), outcomeOf(account)));
        for (const auto &seen : m_log->notifications) {
            EXPECT_GE(seen[account], judge.leastNotifications(account)) << "a notification was lost";
            EXPECT_LE(seen[account], judge.mostNotifications(account)) << "a notification was made up";
        }
    }
    const auto tally = judge.tally();
    std::printf(
        "%llu events of %zu processes, %zu of them killed: %d saves, %d reads, %d removals, %d creations; %d "
        "values overwritten between another's reading and its writing; %d killed while they held a file, %d redo "
        "records met, settled %d times as before and %d as after\n",
        static_cast<unsigned long long>(count), kLoadWorkers + killed.size(), killed.size(), tally.saves, tally.reads,
        tally.removals, tally.creations, tally.overwritten, tally.killedInHold, tally.recordsMet, tally.settledBefore,
        tally.settledAfter);
    // The accounts must have been fought for, or nothing was shown.
    EXPECT_GT(tally.saves, 1000);
    EXPECT_GT(tally.removals, 10);
    EXPECT_GT(tally.killedInHold, 0);

    (void)runProgram({buildPath("bin/kavell-accounts"), "doctor", "--repair"});
    const ProgramResult doctor = runProgram({buildPath("bin/kavell-accounts"), "doctor"});
    EXPECT_EQ(doctor.status, 0) << doctor.output << doctor.error;
}
