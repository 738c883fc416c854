// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tools/store_wait.h"

#include <array>
#include <atomic>
#include <cerrno>
#include <chrono>
#include <climits>
#include <csignal>
#include <cstring>
#include <mutex>
#include <pthread.h>
#include <sys/ipc.h>
#include <sys/sem.h>
#include <thread>
#include <unistd.h>

#include "tools/semaphore_repair.h"
#include "tools/text.h"

namespace kavell::tools {

namespace {

using Clock = std::chrono::steady_clock;

constexpr std::chrono::seconds longestWait{2};
constexpr std::array<int, 3> endingSignals{SIGINT, SIGTERM, SIGHUP};

/// The wait that the helper thread watches. Never destroyed: the thread outlives main.
struct Watch {
    std::mutex mutex;
    std::string subject;
    Clock::time_point since;
    std::string dataFile;
    Patience patience = Patience::Endless;
    bool active = false;
    bool announced = false;
    bool brokenOff = false;
};

Watch &watch()
{
    static Watch *const shared = new Watch;
    return *shared;
}

// What the signal handler reads. The path is only written while `inStore` is clear.
std::array<char, PATH_MAX> dataFilePath;
volatile std::sig_atomic_t inStore = 0;
volatile std::sig_atomic_t endAfterwards = 0;
pthread_t mainThread;

/// Whether this process holds the semaphore of a key: it is taken, and the last to operate on it was this process.
bool holdsSemaphore(key_t key)
{
    const int set = semget(key, 0, 0);
    return set > 0 && semctl(set, 0, GETVAL) == 0 && semctl(set, 0, GETPID) == getpid();
}

void endBySignal(int number)
{
    struct sigaction standard = {};
    standard.sa_handler = SIG_DFL;
    sigaction(number, &standard, nullptr);
    raise(number);
}

/// Runs on the main thread, between two of its instructions or after its wait was broken off, so that what it finds out
/// about the semaphore cannot change before it returns. Uses system calls only.
void onEndingSignal(int number)
{
    if (!pthread_equal(pthread_self(), mainThread)) {
        pthread_kill(mainThread, number);
        return;
    }
    const int savedError = errno;
    // A file that did not exist when its record first locked has the semaphore of the key -1.
    if (inStore != 0 && (holdsSemaphore(ftok(dataFilePath.data(), 0)) || holdsSemaphore(-1)))
        endAfterwards = number;
    else
        endBySignal(number);
    errno = savedError;
}

bool isHolderDead(const std::string &dataFile)
{
    const auto report = inspectSemaphore(dataFile);
    return report && report->state == SemaphoreState::HeldByDead;
}

/// Breaks the main thread's wait off, again and again, until the call has returned: it may wait more than once.
void breakOff(Watch &shared)
{
    shared.brokenOff = true;
    pthread_kill(mainThread, SIGUSR1);
}

void watchForWaits()
{
    while (true) {
        std::this_thread::sleep_for(std::chrono::milliseconds(250));
        Watch &shared = watch();
        const std::lock_guard lock(shared.mutex);
        const bool isLong = shared.active && Clock::now() - shared.since >= longestWait;
        if (shared.active && shared.patience == Patience::Bounded && (isLong || isHolderDead(shared.dataFile)))
            breakOff(shared);
        if (!isLong || shared.announced || shared.patience == Patience::Bounded)
            continue;
        shared.announced = true;
        complain("waiting for another program to finish with " + shared.subject +
                 "; if it was killed, run 'kavell-accounts doctor --repair'");
    }
}

/// Installs the handlers and starts the thread, which takes no signals.
void prepareOnce()
{
    static bool prepared = false;
    if (prepared)
        return;
    prepared = true;
    mainThread = pthread_self();
    struct sigaction ending = {};
    ending.sa_handler = onEndingSignal;
    for (const int number : endingSignals) {
        struct sigaction former;
        if (sigaction(number, nullptr, &former) == 0 && former.sa_handler != SIG_IGN)
            sigaction(number, &ending, nullptr);
    }
    // Does nothing; a wait for a semaphore is broken off by it, and nothing else is.
    struct sigaction breaking = {};
    breaking.sa_handler = [](int) {
    };
    breaking.sa_flags = SA_RESTART;
    sigaction(SIGUSR1, &breaking, nullptr);
    sigset_t all;
    sigset_t former;
    sigfillset(&all);
    pthread_sigmask(SIG_SETMASK, &all, &former);
    std::thread(watchForWaits).detach();
    pthread_sigmask(SIG_SETMASK, &former, nullptr);
}

}  // namespace

StoreWait::StoreWait(std::string subject, const std::string &dataFile, Patience patience)
{
    prepareOnce();
    std::strncpy(dataFilePath.data(), dataFile.c_str(), dataFilePath.size() - 1);
    Watch &shared = watch();
    {
        const std::lock_guard lock(shared.mutex);
        shared.subject = std::move(subject);
        shared.since = Clock::now();
        shared.dataFile = dataFile;
        shared.patience = patience;
        shared.active = true;
        shared.announced = shared.brokenOff = false;
    }
    inStore = 1;
}

StoreWait::~StoreWait()
{
    inStore = 0;
    {
        Watch &shared = watch();
        const std::lock_guard lock(shared.mutex);
        shared.active = false;
    }
    if (endAfterwards != 0)
        endBySignal(endAfterwards);
}

bool StoreWait::wasBrokenOff() const
{
    Watch &shared = watch();
    const std::lock_guard lock(shared.mutex);
    return shared.brokenOff;
}

}  // namespace kavell::tools
