// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The semaphores of data files from outside: who holds one, and freeing one whose holder is dead. A holder that is
// killed gives nothing back, and everybody else then waits for ever.
//
// Never makes or removes a set, and never touches the set of id 0, which no data file has. One thread.

#ifndef KAVELL_TOOLS_SEMAPHORE_REPAIR_H
#define KAVELL_TOOLS_SEMAPHORE_REPAIR_H

#include <optional>
#include <string>
#include <sys/types.h>
#include <vector>

namespace kavell::tools {

enum class SemaphoreState {
    Free,
    Held,           ///< by a process that lives, or by one that cannot be seen from here
    HeldByDead,     ///< the last process to operate on it is gone
    NeverReady,     ///< nobody has operated on it, nor given it its first value
    AdmitsSeveral,  ///< its value is above 1, so that it keeps nobody out
    Refused,        ///< somebody else made it, and lets this user neither take it nor look at it
};

struct SemaphoreReport {
    int id = 0;
    SemaphoreState state = SemaphoreState::Free;
    int value = 0;
    pid_t lastOperator = 0;
};

/// The set of a data file; of all data files that did not exist when they were first locked, for an empty path. None
/// when there is no set.
[[nodiscard]] std::optional<SemaphoreReport> inspectSemaphore(const std::string &path);

/// The same of a set already found; none when it is gone.
[[nodiscard]] std::optional<SemaphoreReport> inspectSemaphoreSet(int id);

/// All sets of this user that look like those of data files in the directory's file system, also of files that are gone:
/// an account that is removed and made anew has another set, while programs that have opened it before keep the first.
[[nodiscard]] std::vector<int> setsLikeThoseIn(const std::string &directory);

/// Brings a semaphore that is HeldByDead, NeverReady or AdmitsSeveral to order; false when it was in order meanwhile or cannot
/// be changed. `lockDirectory` is a directory whose flock keeps two repairs from freeing one semaphore twice; waits for
/// the other repair.
[[nodiscard]] bool repairSemaphore(const SemaphoreReport &report, const std::string &lockDirectory);

}  // namespace kavell::tools

#endif
