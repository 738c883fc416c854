// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// One system call after the other fails: an action is run once to count its calls, and then once for each call and each
// way in which it can fail.
//
//     forEachFault({}, [&](FaultInjector &injector) { … prepare, run under an Observation of it, check … });
//
// Ways to fail: each of six errors for every call; for reads and writes also fewer bytes than were asked for, with or
// without an error behind them; and a disk that from some call on takes nothing any more, or is gone altogether. A
// release of a semaphore is done nevertheless and only said to have failed: a semaphore that really stays held would
// stop the program, by contract.

#ifndef KAVELL_TESTS_FAULTS_FAULT_INJECTOR_H
#define KAVELL_TESTS_FAULTS_FAULT_INJECTOR_H

#include <cerrno>
#include <cstdint>
#include <functional>
#include <string>
#include <vector>

#include "tests/faults/system_calls.h"

namespace kavell::test {

struct Fault {
    enum class Form {
        Error,          ///< the call fails
        Half,           ///< it moves half of the bytes
        OneByte,        ///< it moves one byte
        HalfThenError,  ///< it moves half of the bytes, and the same call fails when it is made again
        ReadOnly,       ///< from here on every call that changes the disk fails
        Gone,           ///< from here on every call on files fails
    };
    size_t number = SIZE_MAX;  ///< which call, from 0
    Form form = Form::Error;
    int error = 0;

    /// Whether nothing is lost by it but time: a program that makes the call again gets on.
    [[nodiscard]] bool isPassing(CallKind kind) const;
    [[nodiscard]] bool isLasting() const { return form == Form::ReadOnly || form == Form::Gone; }
};

class FaultInjector : public SystemCallObserver {
public:
    struct SeenCall {
        CallKind kind;
        std::string path;
        short change = 0;
        bool isFailed = false;
    };

    explicit FaultInjector(const Fault &fault, bool canRenameWithoutReplacing = true)
        : m_fault(fault), m_canRenameWithoutReplacing(canRenameWithoutReplacing)
    {
    }

    long onCall(SystemCall &call, const std::function<long()> &make) override;

    [[nodiscard]] const Fault &fault() const { return m_fault; }

    /// The calls so far.
    [[nodiscard]] const std::vector<SeenCall> &calls() const { return m_calls; }

    /// The call that failed first; none when there was no such call.
    [[nodiscard]] const SeenCall *failed() const;

    /// Whether a call of this kind had been made when the fault came.
    [[nodiscard]] bool cameAfter(CallKind kind) const;

    /// For messages.
    [[nodiscard]] std::string description() const;

private:
    [[nodiscard]] bool strikes(const SystemCall &call, size_t number);

    const Fault m_fault;
    const bool m_canRenameWithoutReplacing;
    std::vector<SeenCall> m_calls;
};

/// What the runs of an action have in common.
struct FaultRuns {
    /// As on a file system that does not know how to rename a file unless the new name is taken.
    bool canRenameWithoutReplacing = true;
    /// What a call that fails fails with.
    std::vector<int> errors = {ENOSPC, EIO, EDQUOT, EACCES, EMFILE, EINTR};
    /// Whether the runs leave no memory behind them, which is then looked at.
    bool leaveNothing = true;
};

/// Runs the action without a fault and then with each one; prints how many runs these were.
void forEachFault(const FaultRuns &runs, const std::function<void(FaultInjector &)> &run);

/// How many descriptors this process has open.
[[nodiscard]] size_t countOpenDescriptors();

}  // namespace kavell::test

#endif
