// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/file_semaphore.h"

#include <cerrno>
#include <mutex>
#include <sys/ipc.h>
#include <sys/sem.h>

namespace kavell {

namespace {

/// The argument of semctl, which the caller defines (semctl(2)).
union SemaphoreArgument {
    int value;
    semid_ds *status;
    unsigned short *values;
};

/// The first set of a fresh IPC namespace has the identifier 0, which marks "none yet" in a record and is never used. A
/// private set, made and removed once, takes it out of the way of every file's set.
void spendIdentifierZero() noexcept
{
    static std::once_flag once;
    std::call_once(once, [] {
        const int set = semget(IPC_PRIVATE, 1, 0600);
        if (set >= 0)
            semctl(set, 0, IPC_RMID);
    });
}

bool operateOnSemaphore(int32_t semaphoreID, short change) noexcept
{
    sembuf operation{0, change, 0};
    return semop(semaphoreID, &operation, 1) == 0;
}

}  // namespace

std::optional<int32_t> obtainFileSemaphore(const char *path) noexcept
{
    spendIdentifierZero();
    // The failure value is a key like any other, deliberately unchecked: records of files that do not exist yet meet in
    // it.
    const key_t key = path ? ftok(path, 0) : -1;
    int set = semget(key, 0, 0);
    if (set >= 0)
        return set;
    set = semget(key, 1, IPC_CREAT | IPC_EXCL | 0600);
    if (set < 0 && errno == EEXIST)
        set = semget(key, 0, 0);
    if (set < 0)
        return std::nullopt;
    SemaphoreArgument argument{.value = 1};
    semctl(set, 0, SETVAL, argument);
    return set;
}

bool takeFileSemaphore(int32_t semaphoreID) noexcept
{
    return operateOnSemaphore(semaphoreID, -1);
}

bool giveFileSemaphore(int32_t semaphoreID) noexcept
{
    return operateOnSemaphore(semaphoreID, +1);
}

}  // namespace kavell
