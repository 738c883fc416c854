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

/// The key that ftok(path, 0) makes of a file's status, which the caller has at hand: ftok would ask the kernel again.
key_t keyOf(const struct stat &status) noexcept
{
    return static_cast<key_t>((status.st_ino & 0xFFFF) | (status.st_dev & 0xFF) << 16);
}

bool operateOnSemaphore(int32_t semaphoreID, short change) noexcept
{
    sembuf operation{0, change, 0};
    return semop(semaphoreID, &operation, 1) == 0;
}

}  // namespace

std::optional<int32_t> obtainFileSemaphore(const struct stat *status) noexcept
{
    spendIdentifierZero();
    // What ftok answers for a missing file is a key like any other, deliberately: records of files that do not exist yet
    // meet in it.
    const key_t key = status ? keyOf(*status) : -1;
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
