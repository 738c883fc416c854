// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What many processes did to many accounts, in the order in which it happened. Written by load_worker, whose own flock,
// close, stat, unlink and renameat2 stand before the system's; read by the judge (load_judge.h) when all is over.
//
// Every event draws its number from one counter in memory that all processes share. What says that something begins is
// drawn before it begins, and what says that it is over is drawn after it: two holds of one file never interleave, and a
// process that is killed in between leaves the first of the two.

#ifndef KAVELL_TESTS_LOAD_LOAD_LOG_H
#define KAVELL_TESTS_LOAD_LOAD_LOG_H

#include <array>
#include <atomic>
#include <cstddef>
#include <cstdint>
#include <string>
#include <sys/types.h>

namespace kavell::test {

/// The environment of a worker: the file of the shared log.
inline constexpr const char *kLoadLogVariable = "KAVELL_LOAD_LOG";

inline constexpr size_t kLoadWorkers = 16;
inline constexpr size_t kLoadAccounts = 2000;
inline constexpr size_t kLoadWatchers = 2;

/// The attribute of each worker as an account has it; 0 where there is none.
using LoadValues = std::array<uint32_t, kLoadWorkers>;

/// The name of a worker's attribute, and of an account's login. A worker keeps its attribute when it is started anew.
[[nodiscard]] inline std::string loadKey(size_t worker)
{
    return "worker " + std::to_string(worker);
}
[[nodiscard]] inline std::string loadLoginName(size_t account)
{
    return "account " + std::to_string(account);
}

enum class LoadEvent : uint32_t {
    Unused,
    Forgot,      ///< the process has let go of all its records
    WillSave,    ///< a commit of `number` under the worker's key begins
    WillRemove,  ///< a removal begins
    Done,        ///< it has returned; `flag`: without pending changes
    Seen,        ///< what a record says after it was loaded
    Status,      ///< the file's status is about to be queried
    Missing,     ///< and there was no file
    Take,        ///< the file's flock has been taken; `flag`: there is a redo record
    Release,     ///< it is about to be given back; `flag`: there is a redo record
    Creating,    ///< a new file is about to get its name
    Created,     ///< it has it
    Removing,    ///< the file is about to be unlinked; an inode of 0: one that may come until then
    Removed,     ///< it is gone
};

[[nodiscard]] const char *loadEventName(LoadEvent event);

struct LoadEntry {
    LoadEvent event = LoadEvent::Unused;
    bool flag = false;
    bool isForReading = false;  ///< of a take or a release: the file was opened for nothing else
    uint16_t worker = 0;
    uint32_t account = 0;
    int32_t process = 0;
    uint32_t number = 0;
    uint64_t inode = 0;
    LoadValues values{};
};

/// More than fit into five minutes. The file is sparse.
inline constexpr uint64_t kMostLoadEntries = 24'000'000;

/// The shared file, mapped; all zero at first.
struct LoadLog {
    std::atomic<uint64_t> count;
    std::atomic<uint32_t> lastNumber;  ///< of a commit
    std::atomic<bool> isOver;          ///< workers end
    std::atomic<bool> isSilent;        ///< nobody posts any more: watchers take what there is, and end
    std::array<std::array<std::atomic<uint32_t>, kLoadAccounts>, kLoadWatchers> notifications;
    std::array<LoadEntry, kMostLoadEntries> entries;
};

/// Maps the log that a file is; null when that fails. The mapping lasts as long as the process.
[[nodiscard]] LoadLog *mapLoadLog(const char *path);

}  // namespace kavell::test

#endif
