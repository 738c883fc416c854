// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A program's own system calls, seen and changed by its tests: whoever observes is asked about every call on files,
// semaphores and sockets that the observed thread makes, and makes it, refuses it, or writes it down.
//
//     Observation observation(observer);
//     … code whose calls are observed …
//
// Works by definition: system_calls.cpp defines open, pwrite and their like, and a program's own definition comes
// before a library's, for the libraries that it loads too. So there is nothing to preload, and the sanitizers keep
// their places. What the C library calls inside itself is not seen; what it does there for the code under test (ftok,
// opendir) has calls of its own here. Only the thread that made the observation is observed, and not while it observes.

#ifndef KAVELL_TESTS_FAULTS_SYSTEM_CALLS_H
#define KAVELL_TESTS_FAULTS_SYSTEM_CALLS_H

#include <functional>
#include <string_view>
#include <sys/types.h>

namespace kavell::test {

enum class CallKind {
    Open,
    Read,
    Write,
    Truncate,
    Reserve,
    SyncFile,
    SyncData,
    Status,
    Access,
    ChangeMode,
    SetTimes,
    Lock,
    Rename,
    Link,
    Unlink,
    MakeDirectory,
    RemoveDirectory,
    OpenDirectory,
    ReadDirectory,
    MakeKey,
    GetSemaphore,
    OperateSemaphore,
    MakeSocket,
    Connect,
    Send,
};

/// The name of a kind as the system's call has it.
[[nodiscard]] std::string_view nameOf(CallKind kind);

/// One call with what it was given. What the kind does not have is left as here.
struct SystemCall {
    CallKind kind;
    int descriptor = -1;
    const char *path = nullptr;
    const char *newPath = nullptr;  ///< of Rename and Link
    int flags = 0;                  ///< of Open and Rename
    mode_t mode = 0;                ///< of ChangeMode
    const char *bytes = nullptr;    ///< of Write
    size_t length = 0;              ///< of Read and Write; an observer may make it smaller
    off_t offset = -1;              ///< of Read and Write where they have one, and the size of Truncate
    short change = 0;               ///< of OperateSemaphore
};

class SystemCallObserver {
public:
    virtual ~SystemCallObserver() = default;

    /// In the place of the call: its result, with errno set where it is a failure. `make` makes the call.
    virtual long onCall(SystemCall &call, const std::function<long()> &make) = 0;
};

/// Has this thread's calls observed for as long as it lives. One at a time on a thread.
class Observation {
public:
    explicit Observation(SystemCallObserver &observer);
    ~Observation();
    Observation(const Observation &) = delete;
    Observation &operator=(const Observation &) = delete;
};

}  // namespace kavell::test

#endif
