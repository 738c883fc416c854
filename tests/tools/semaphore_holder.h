// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The semaphore of a data file in other processes' hands: a child that takes it and keeps it until it is killed. For
// one thread.

#ifndef KAVELL_TESTS_TOOLS_SEMAPHORE_HOLDER_H
#define KAVELL_TESTS_TOOLS_SEMAPHORE_HOLDER_H

#include <csignal>
#include <cstdlib>
#include <string>
#include <sys/ipc.h>
#include <sys/sem.h>
#include <unistd.h>
#include <utility>

#include "tests/support/process.h"

namespace kavell::test {

/// The set of a data file, or -1. The file has been read through the store before, so that the set is there.
inline int semaphoreOf(const std::string &path)
{
    return semget(path.empty() ? -1 : ftok(path.c_str(), 0), 0, 0);
}

inline int semaphoreValue(const std::string &path)
{
    return semctl(semaphoreOf(path), 0, GETVAL);
}

/// Whether so many processes wait for the semaphore within ten seconds. The kernel tells nobody when one begins to
/// wait, so this asks again and again.
[[nodiscard]] inline bool awaitWaiters(const std::string &path, int count)
{
    for (int attempt = 0; attempt < 10000; ++attempt) {
        if (semctl(semaphoreOf(path), 0, GETNCNT) >= count)
            return true;
        usleep(1000);
    }
    return false;
}

/// A process that holds the semaphore of a data file when the constructor returns.
class SemaphoreHolder {
public:
    explicit SemaphoreHolder(const std::string &path)
        : m_ready(makePipe()), m_child([this, path] {
              sembuf take{0, -1, 0};
              if (semop(semaphoreOf(path), &take, 1) != 0 || write(m_ready.second, "x", 1) != 1)
                  return 1;
              while (true)
                  pause();
          })
    {
        char letter = 0;
        if (read(m_ready.first, &letter, 1) != 1)
            std::abort();
    }

    ~SemaphoreHolder()
    {
        close(m_ready.first);
        close(m_ready.second);
    }

    SemaphoreHolder(const SemaphoreHolder &) = delete;
    SemaphoreHolder &operator=(const SemaphoreHolder &) = delete;

    [[nodiscard]] pid_t pid() const { return m_child.pid(); }

    void killIt()
    {
        m_child.signal(SIGKILL);
        (void)m_child.wait();
    }

    /// Gives the semaphore back in the holder's place and ends the holder.
    void release(const std::string &path)
    {
        sembuf give{0, 1, 0};
        semop(semaphoreOf(path), &give, 1);
        killIt();
    }

private:
    static std::pair<int, int> makePipe()
    {
        int ends[2];
        if (pipe(ends) != 0)
            std::abort();
        return {ends[0], ends[1]};
    }

    std::pair<int, int> m_ready;
    ChildProcess m_child;
};

}  // namespace kavell::test

#endif
