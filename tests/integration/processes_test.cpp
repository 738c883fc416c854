// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What real processes promise each other through one account: changes of different keys survive, no reader sees a torn
// file, no watcher misses a change, and nothing is lost but what was saved between another's re-read and its write.

#include <algorithm>
#include <fcntl.h>
#include <map>
#include <memory>
#include <optional>
#include <sys/mman.h>
#include <unistd.h>

#include "tests/integration/hold_recorder.h"
#include "tests/store/store_test.h"

using namespace kavell;
using namespace kavell::test;

namespace {

using Processes = StoreTest;

std::string probe()
{
    return buildPath("tests/store_probe");
}

/// A probe that runs beside the test, its output at hand.
class RunningProbe {
public:
    explicit RunningProbe(std::vector<std::string> arguments, const std::vector<std::string> &environment = {})
    {
        arguments.insert(arguments.begin(), probe());
        int ends[2];
        if (pipe2(ends, O_CLOEXEC) != 0)
            std::abort();
        m_output = ends[0];
        m_process = std::make_unique<ChildProcess>(arguments, environment, STDIN_FILENO, ends[1], STDERR_FILENO);
        close(ends[1]);
    }
    ~RunningProbe() { close(m_output); }
    RunningProbe(const RunningProbe &) = delete;
    RunningProbe &operator=(const RunningProbe &) = delete;

    /// The next line that it prints; none at its end or when nothing comes for a long time.
    [[nodiscard]] std::optional<std::string> line()
    {
        std::string text;
        char character;
        pollfd waiting{m_output, POLLIN, 0};
        while (poll(&waiting, 1, 60000) == 1 && read(m_output, &character, 1) == 1) {
            if (character == '\n')
                return text;
            text += character;
        }
        return std::nullopt;
    }
    [[nodiscard]] pid_t pid() const { return m_process->pid(); }
    [[nodiscard]] int wait() { return m_process->wait(std::chrono::seconds(250)); }

private:
    int m_output = -1;
    std::unique_ptr<ChildProcess> m_process;
};

/// Starts a watcher of so many notifications and waits until it listens.
std::unique_ptr<RunningProbe> startWatcher(int count, const std::vector<std::string> &environment = {})
{
    auto watcher =
        std::make_unique<RunningProbe>(std::vector<std::string>{"watch", std::to_string(count)}, environment);
    EXPECT_EQ(watcher->line(), "ready");
    return watcher;
}

}  // namespace

TEST_F(Processes, TwoThatChangeDifferentKeysOneAfterTheOtherBothSurvive)
{
    ASSERT_EQ(runProgram({probe(), "set", "ada", "first", "1"}).status, 0);
    const Account longLived = openAccount("ada");
    setAttribute(longLived, "mine", integer(3));
    ASSERT_EQ(runProgram({probe(), "set", "ada", "second", "2"}).status, 0);
    commit(longLived);
    ASSERT_EQ(runProgram({probe(), "set", "ada", "first", "4"}).status, 0);
    EXPECT_TRUE(same(attributes(openAccount("ada")),
                     dictionary({{"first", integer(4)}, {"second", integer(2)}, {"mine", integer(3)}})));
}

TEST_F(Processes, AReaderNeverSeesATornFileWhileAWriterGrowsAndShrinksIt)
{
    commit(openAccount("ada"));
    const Account account = openAccount("ada");
    RunningProbe writer({"resize", "ada", "1500"});
    StandardErrorCapture capture;
    const std::string uuid = uuidOf(account);
    int64_t changes = 0;
    std::optional<int64_t> last;
    // Until the last save of the writer is seen.
    for (bool isRunning = true; isRunning;) {
        ASSERT_TRUE(CSKavellAccountLoadData(account.get())) << capture.take();
        ASSERT_EQ(uuidOf(account), uuid);
        const Value length = attribute(account, "length"), value = attribute(account, "text");
        ASSERT_EQ(bool(length), bool(value));
        if (length) {
            const auto expected =
                CSKavellNumberGetInt64(cast<CSKavellNumberRef>(length.get(), CSKavellNumberGetTypeID()));
            ASSERT_EQ(toStdString(cast<CSKavellStringRef>(value.get(), CSKavellStringGetTypeID())),
                      std::string(static_cast<size_t>(expected), 'x'));
            changes += last != expected;
            last = expected;
        }
        isRunning = kill(writer.pid(), 0) == 0 && last != 1499 * 7919 % 20011;
    }
    EXPECT_EQ(writer.wait(), 0);
    EXPECT_EQ(capture.take(), "");
    EXPECT_GT(changes, 10);
}

TEST_F(Processes, AWatcherMissesNoChangeWithOrWithoutABus)
{
    const char *bus = std::getenv("DBUS_SESSION_BUS_ADDRESS");
    const std::vector<std::vector<std::string>> environments = {
        {std::string("DBUS_SESSION_BUS_ADDRESS=") + (bus ? bus : "")},
        {"DBUS_SESSION_BUS_ADDRESS="},
        {"DBUS_SESSION_BUS_ADDRESS=unix:path=/nonexistent/for/sure"}};
    for (const auto &environment : environments) {
        SCOPED_TRACE(environment[0]);
        const auto watcher = startWatcher(4 * 50, environment);
        std::vector<std::unique_ptr<RunningProbe>> writers;
        for (const char *name : {"a", "b", "c", "d"})
            writers.push_back(std::make_unique<RunningProbe>(
                std::vector<std::string>{"count", std::string("watched ") + name, "key", "50"}, environment));
        std::map<std::string, int> seen;
        while (const auto line = watcher->line())
            ++seen[*line];
        EXPECT_EQ(seen, (std::map<std::string, int>{
                            {"watched a", 50}, {"watched b", 50}, {"watched c", 50}, {"watched d", 50}}));
        EXPECT_EQ(watcher->wait(), 0);
        for (const auto &writer : writers)
            EXPECT_EQ(writer->wait(), 0);
    }
}

TEST_F(Processes, AWatcherSeesTheChangesOfOneProcessInOrder)
{
    const auto watcher = startWatcher(6);
    for (const char *name : {"x", "y", "x", "z", "y", "x"})
        ASSERT_EQ(runProgram({probe(), "set", name, "key", "1"}).status, 0);
    // The last two change nothing in the file's contents, and are saves all the same.
    Names seen;
    while (const auto line = watcher->line())
        seen.push_back(*line);
    EXPECT_EQ(seen, (Names{"x", "y", "x", "z", "y", "x"}));
    EXPECT_EQ(watcher->wait(), 0);
}

namespace {

/// The shared record of holds, made anew.
class SharedHoldLog {
public:
    explicit SharedHoldLog(const std::string &path)
    {
        writeFile(path, "");
        const int file = open(path.c_str(), O_RDWR | O_CLOEXEC);
        void *memory = MAP_FAILED;
        if (ftruncate(file, sizeof(HoldLog)) == 0)
            memory = mmap(nullptr, sizeof(HoldLog), PROT_READ, MAP_SHARED, file, 0);
        close(file);
        if (memory == MAP_FAILED)
            std::abort();
        m_log = static_cast<const HoldLog *>(memory);
    }
    ~SharedHoldLog() { munmap(const_cast<HoldLog *>(m_log), sizeof(HoldLog)); }
    SharedHoldLog(const SharedHoldLog &) = delete;
    SharedHoldLog &operator=(const SharedHoldLog &) = delete;

    [[nodiscard]] const HoldLog &log() const { return *m_log; }

private:
    const HoldLog *m_log;
};

/// Follows the record of holds, and says where it breaks the contract:
/// - holds do not overlap, and the file changes only inside them;
/// - a hold that changes the file leaves what that process knew last, which is what the file said at the process's
///   latest hold before it, with the process's own next number in it and nothing else changed;
/// - a process that saves without having read may do so only if, when it asked for the file's status, the latest save
///   was its own.
class Judge {
public:
    Judge(const HoldValues &initial, const std::vector<pid_t> &workers) : m_file(initial)
    {
        for (size_t index = 0; index < workers.size(); ++index)
            m_workers[workers[index]].index = index;
    }

    void follow(const HoldLog &log)
    {
        for (uint64_t number = 0; number < log.count && !testing::Test::HasFatalFailure(); ++number) {
            SCOPED_TRACE("event " + std::to_string(number));
            const HoldEntry &entry = log.entries[number];
            ASSERT_TRUE(m_workers.contains(entry.process));
            Worker &worker = m_workers[entry.process];
            switch (entry.event) {
            case HoldEvent::Status:
                status(entry, worker);
                break;
            case HoldEvent::Take:
                take(entry);
                break;
            case HoldEvent::Release:
                release(entry, worker);
                break;
            case HoldEvent::Unused:
                FAIL() << "an event was not written";
            }
        }
    }

    [[nodiscard]] int savesOf(pid_t process) { return m_workers[process].saves; }
    [[nodiscard]] const HoldValues &file() const { return m_file; }
    [[nodiscard]] int overwritten() const { return m_overwritten; }

private:
    struct Worker {
        size_t index = 0;
        int saves = 0;
        HoldValues known{};         ///< what the file said at its latest hold
        bool hasRead = false;       ///< since its latest save
        bool mayStillKnow = false;  ///< the latest save was its own when it first asked for the status since
        bool hasAsked = false;
    };

    void status(const HoldEntry &entry, Worker &worker)
    {
        // A query inside a save's hold is for the record's own note of the time; one after it begins the next commit.
        if (m_holder == entry.process || worker.hasAsked)
            return;
        worker.hasAsked = true;
        worker.mayStillKnow = m_lastSaver == entry.process;
    }

    void take(const HoldEntry &entry)
    {
        ASSERT_EQ(m_holder, 0) << "two processes hold the semaphore at once";
        m_holder = entry.process;
        ASSERT_EQ(entry.values, m_file) << "the file changed while nobody held the semaphore";
    }

    void release(const HoldEntry &entry, Worker &worker)
    {
        ASSERT_EQ(m_holder, entry.process);
        m_holder = 0;
        if (entry.values == m_file) {
            worker.known = m_file;
            worker.hasRead = true;
            return;
        }
        ASSERT_TRUE(worker.hasRead || worker.mayStillKnow) << "saved without having read what another had saved";
        HoldValues expected = worker.known;
        expected[worker.index] = ++worker.saves;
        ASSERT_EQ(entry.values, expected) << "a change was lost or made up";
        for (size_t index = 0; index < expected.size(); ++index)
            m_overwritten += index != worker.index && expected[index] < m_file[index];
        worker.known = m_file = entry.values;
        worker.hasRead = worker.hasAsked = worker.mayStillKnow = false;
        m_lastSaver = entry.process;
    }

    HoldValues m_file;
    std::map<pid_t, Worker> m_workers;
    pid_t m_holder = 0;
    pid_t m_lastSaver = 0;
    int m_overwritten = 0;
};

}  // namespace

TEST_F(Processes, EightTimesFiveHundredCommitsLoseNothingButWhatFellBetweenReadAndWrite)
{
    constexpr int kCommits = 500;
    commit(openAccount("ada"));
    const std::string uuid = uuidOf(openAccount("ada"));
    const SharedHoldLog shared(home() + "/holds");
    const std::vector<std::string> environment = {std::string(kHoldLogVariable) + "=" + home() + "/holds",
                                                  std::string(kHoldFileVariable) + "=" + fileOf("ada"),
                                                  "DBUS_SESSION_BUS_ADDRESS="};
    std::vector<std::unique_ptr<RunningProbe>> workers;
    std::vector<pid_t> processes;
    for (int worker = 0; worker < kHoldWorkers; ++worker) {
        workers.push_back(std::make_unique<RunningProbe>(
            std::vector<std::string>{"count", "ada", "worker " + std::to_string(worker), std::to_string(kCommits)},
            environment));
        processes.push_back(workers.back()->pid());
    }
    for (const auto &worker : workers)
        ASSERT_EQ(worker->wait(), 0);

    HoldValues nothing;
    nothing.fill(-1);
    Judge judge(nothing, processes);
    ASSERT_GE(shared.log().count, static_cast<uint64_t>(kHoldWorkers) * kCommits * 2);
    judge.follow(shared.log());
    ASSERT_FALSE(HasFailure());
    for (pid_t process : processes)
        EXPECT_EQ(judge.savesOf(process), kCommits);
    RecordProperty("overwritten", judge.overwritten());

    const Account fresh = openAccount("ada");
    EXPECT_EQ(uuidOf(fresh), uuid);
    for (size_t worker = 0; worker < kHoldWorkers; ++worker) {
        const Value found = attribute(fresh, "worker " + std::to_string(worker));
        const int32_t last = judge.file()[worker];
        EXPECT_TRUE(last < 0 ? !found : same(found, integer(last))) << worker;
    }
}
