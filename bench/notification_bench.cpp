// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// From a post, and from the start of a commit, to the callback in another process; and what these are measured against.

#include <benchmark/benchmark.h>

#include <atomic>
#include <chrono>
#include <csignal>
#include <cstdlib>
#include <poll.h>
#include <string>
#include <sys/mman.h>
#include <sys/prctl.h>
#include <sys/socket.h>
#include <sys/wait.h>
#include <unistd.h>

#include "bench/accounts.h"

using namespace kavell;

namespace {

using Clock = std::chrono::steady_clock;

/// Where the other process says how many messages it has received, and when the last one came. The clock is the same in
/// all processes.
struct Receipts {
    std::atomic<int64_t> count{0};
    std::atomic<Clock::rep> last{0};

    void add()
    {
        last.store(Clock::now().time_since_epoch().count(), std::memory_order_relaxed);
        count.fetch_add(1, std::memory_order_release);
    }

    [[nodiscard]] double secondsSince(Clock::time_point start, int64_t expected) const
    {
        while (count.load(std::memory_order_acquire) < expected) {
        }
        return std::chrono::duration<double>(Clock::duration(last.load()) - start.time_since_epoch()).count();
    }
};

/// A forked process that runs a body with the receipts it shares with this one.
class OtherProcess {
public:
    template <typename Body>
    explicit OtherProcess(Body body)
        : m_receipts(new(mmap(nullptr, 4096, PROT_READ | PROT_WRITE, MAP_SHARED | MAP_ANONYMOUS, -1, 0)) Receipts)
    {
        m_pid = fork();
        if (m_pid != 0)
            return;
        prctl(PR_SET_PDEATHSIG, SIGKILL);
        body(*m_receipts);
        _exit(0);
    }

    ~OtherProcess()
    {
        kill(m_pid, SIGKILL);
        waitpid(m_pid, nullptr, 0);
        munmap(m_receipts, 4096);
    }

    [[nodiscard]] const Receipts &receipts() const { return *m_receipts; }

private:
    Receipts *m_receipts;
    pid_t m_pid = -1;
};

void observe(Receipts &receipts)
{
    const auto observer = adopt(CSKavellNotificationObserverCreate(kCSKavellAccountNotificationSender));
    pollfd waiting{CSKavellNotificationObserverGetFileDescriptor(observer.get()), POLLIN, 0};
    receipts.add();
    while (poll(&waiting, 1, -1) > 0) {
        while (adopt(CSKavellNotificationObserverCopyNext(observer.get())))
            receipts.add();
    }
}

Ref<CSKavellAccountRef> savedAccount()
{
    const auto account =
        adopt(_CSKavellAccountCreate(nullptr, kCSKavellAccountProviderTest, makeString("latency").get()));
    bench::fillAccount(account.get(), 1);
    _CSKavellAccountCommitChanges(account.get());
    return account;
}

void change(CSKavellAccountRef account, int64_t number)
{
    _CSKavellAccountSetProviderAttribute(account, kCSKavellAccountUserNickname,
                                         makeString("nick " + std::to_string(1000000 + number)).get());
}

void postToCallback(benchmark::State &state)
{
    OtherProcess other(observe);
    int64_t expected = 1;
    static_cast<void>(other.receipts().secondsSince(Clock::now(), expected));
    for (auto _ : state) {
        const auto start = Clock::now();
        CSKavellNotificationPost(kCSKavellAccountNotificationSender,
                                 kCSKavellAccountProviderSettingsChangedNotification, nullptr);
        state.SetIterationTime(other.receipts().secondsSince(start, ++expected));
    }
}

void commitToCallback(benchmark::State &state)
{
    const auto account = savedAccount();
    OtherProcess other(observe);
    int64_t expected = 1;
    static_cast<void>(other.receipts().secondsSince(Clock::now(), expected));
    for (auto _ : state) {
        change(account.get(), expected);
        const auto start = Clock::now();
        _CSKavellAccountCommitChanges(account.get());
        state.SetIterationTime(other.receipts().secondsSince(start, ++expected));
    }
}

/// The same commit, with nobody to tell.
void commitAlone(benchmark::State &state)
{
    const auto account = savedAccount();
    int64_t number = 0;
    for (auto _ : state) {
        change(account.get(), ++number);
        const auto start = Clock::now();
        _CSKavellAccountCommitChanges(account.get());
        state.SetIterationTime(std::chrono::duration<double>(Clock::now() - start).count());
    }
}

/// One message through a socket pair to a process that waits for it with poll.
void bareMessage(benchmark::State &state)
{
    int ends[2];
    if (socketpair(AF_UNIX, SOCK_SEQPACKET | SOCK_CLOEXEC, 0, ends) != 0)
        std::abort();
    OtherProcess other([&](Receipts &receipts) {
        pollfd waiting{ends[1], POLLIN, 0};
        char buffer[4096];
        receipts.add();
        while (poll(&waiting, 1, -1) > 0 && recv(ends[1], buffer, sizeof buffer, 0) > 0)
            receipts.add();
    });
    const std::string message(420, 'm');
    int64_t expected = 1;
    static_cast<void>(other.receipts().secondsSince(Clock::now(), expected));
    for (auto _ : state) {
        const auto start = Clock::now();
        if (send(ends[0], message.data(), message.size(), 0) < 0)
            state.SkipWithError("send");
        state.SetIterationTime(other.receipts().secondsSince(start, ++expected));
    }
    close(ends[0]);
    close(ends[1]);
}

BENCHMARK(postToCallback)->UseManualTime()->Unit(benchmark::kMicrosecond);
BENCHMARK(commitToCallback)->UseManualTime()->Unit(benchmark::kMicrosecond);
BENCHMARK(commitAlone)->UseManualTime()->Unit(benchmark::kMicrosecond);
BENCHMARK(bareMessage)->UseManualTime()->Unit(benchmark::kMicrosecond);

}  // namespace

BENCHMARK_MAIN();
