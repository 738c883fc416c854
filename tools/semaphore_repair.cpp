// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tools/semaphore_repair.h"

#include <array>
#include <cerrno>
#include <csignal>
#include <fcntl.h>
#include <fstream>
#include <sstream>
#include <sys/file.h>
#include <sys/ipc.h>
#include <sys/sem.h>
#include <unistd.h>

#include "tools/files.h"

namespace kavell::tools {

namespace {

/// A semaphore that changes hands faster than it can be looked at so many times is in order.
constexpr int attempts = 100;

/// A pid of 0 belongs to a process in another pid namespace, of which nothing can be known.
bool isDead(pid_t process)
{
    return process > 0 && kill(process, 0) != 0 && errno == ESRCH;
}

/// Whether nobody has ever operated on the set: the kernel then knows no time of it. A process that makes a set gives
/// the semaphore its value with a second call, and may be killed before that.
bool isUntouched(int id)
{
    semid_ds status{};
    return semctl(id, 0, IPC_STAT, &status) == 0 && status.sem_otime == 0;
}

SemaphoreState stateOf(int id, int value, pid_t lastOperator, bool operatorIsDead)
{
    if (value > 1)
        return SemaphoreState::AdmitsSeveral;
    if (value == 1)
        return SemaphoreState::Free;
    if (lastOperator == 0 && isUntouched(id))
        return SemaphoreState::NeverReady;
    return operatorIsDead ? SemaphoreState::HeldByDead : SemaphoreState::Held;
}

/// Gives the semaphore the value that whoever made it did not come to give, unless it has one meanwhile.
bool makeReady(int id)
{
    std::array<sembuf, 2> ready{{{0, 0, IPC_NOWAIT}, {0, 1, 0}}};
    return semop(id, ready.data(), ready.size()) == 0;
}

/// Steps into the dead holder's place and gives the semaphore back as that holder would have. The first operation waits
/// for nothing: it succeeds at once if the value is still 0, and leaves this process, which lives, as the last
/// operator. No value above 1 can come of it, at whatever moment other programs wait, and if this process is killed
/// between the two, the next repair finds a dead holder again.
bool takeOverAndGive(int id)
{
    std::array<sembuf, 3> takeOver{{{0, 0, IPC_NOWAIT}, {0, 1, 0}, {0, -1, 0}}};
    if (semop(id, takeOver.data(), takeOver.size()) != 0)
        return false;
    sembuf give{0, 1, 0};
    return semop(id, &give, 1) == 0;
}

/// Takes the surplus away. Where one of those admitted is still inside, its own release restores the 1.
bool takeSurplus(int id, int value)
{
    sembuf take{0, static_cast<short>(1 - value), IPC_NOWAIT};
    return semop(id, &take, 1) == 0;
}

}  // namespace

std::optional<SemaphoreReport> inspectSemaphoreSet(int id)
{
    // The order counts: a process that was dead before the value was read, and is the last operator after that, has not
    // given the semaphore back, and nobody else has touched it since.
    for (int attempt = 0; attempt < attempts; ++attempt) {
        const pid_t lastOperator = semctl(id, 0, GETPID);
        const bool operatorIsDead = isDead(lastOperator);
        const int value = semctl(id, 0, GETVAL);
        if (lastOperator < 0 || value < 0)
            return std::nullopt;
        if (semctl(id, 0, GETPID) == lastOperator)
            return SemaphoreReport{id, stateOf(id, value, lastOperator, operatorIsDead), value, lastOperator};
    }
    return SemaphoreReport{id, SemaphoreState::Free, 1, 0};
}

std::optional<SemaphoreReport> inspectSemaphore(const std::string &path)
{
    const key_t key = path.empty() ? -1 : ftok(path.c_str(), 0);
    if (key == -1 && !path.empty())
        return std::nullopt;
    const int id = semget(key, 0, 0);
    if (id <= 0)
        return std::nullopt;
    // Anybody may find a set. Asked for with what an operation needs, the kernel looks at the permissions.
    if (semget(key, 0, 0600) < 0 && errno == EACCES)
        return SemaphoreReport{id, SemaphoreState::Refused, 0, 0};
    return inspectSemaphoreSet(id);
}

std::vector<int> setsLikeThoseIn(const std::string &directory)
{
    const key_t model = ftok(directory.c_str(), 0);
    std::ifstream table("/proc/sysvipc/sem");
    std::string line;
    std::getline(table, line);  // the columns' names
    std::vector<int> found;
    while (model != -1 && std::getline(table, line)) {
        long long key = 0;
        int id = 0, semaphores = 0;
        unsigned permissions = 0, owner = 0;
        std::istringstream fields(line);
        fields >> key >> id >> std::oct >> permissions >> std::dec >> semaphores >> owner;
        // The low half of a key is of the inode, the next byte of the device, and the project is 0, which no program's
        // own keys have.
        if (fields && id > 0 && key >> 16 == model >> 16 && permissions == 0600 && semaphores == 1 &&
            owner == geteuid())
            found.push_back(id);
    }
    return found;
}

bool repairSemaphore(const SemaphoreReport &report, const std::string &lockDirectory)
{
    const FileDescriptor directory(open(lockDirectory.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
    if (directory.get() < 0 || !lockWithinBound(directory.get(), LOCK_EX))
        return false;
    const std::optional<SemaphoreReport> before = inspectSemaphoreSet(report.id);
    if (!before || before->state != report.state || before->lastOperator != report.lastOperator)
        return false;
    if (before->state == SemaphoreState::AdmitsSeveral)
        return takeSurplus(report.id, before->value);
    if (before->state == SemaphoreState::NeverReady)
        return makeReady(report.id);
    return before->state == SemaphoreState::HeldByDead && takeOverAndGive(report.id);
}

}  // namespace kavell::tools
