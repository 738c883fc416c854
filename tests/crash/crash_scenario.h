// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A crash at every moment of something that a program does. The steps of a scenario are run once and recorded; then
// each state that a crash may leave is made real, one after the other, and opened by the code under test.
//
//     CrashScenario scenario(watched, observe, proceed);
//     scenario.start("no account");
//     scenario.step("create", [] { … commit … }, "round 1");
//     scenario.step("change", [] { … commit … }, "round 2");
//     scenario.checkPowerCuts();
//
// What is observed must be what was there before the step that the crash fell into, or after it; once a step has
// returned, only what is after it. That holds for:
//
//     checkPowerCuts                the power fails at any moment, and the disk is left as disk.h says
//     checkKills                    the program dies at any moment, and the system lives on
//     checkPowerCutsWhileRecovering the power fails again while what the first cut left is put in order
//     checkPowerCutsAfterKills      a program dies, another one saves over what it left, and then the power fails
//     checkPowerCutsAfterFaults     a system call fails, whatever the program makes of it, and the power fails too
//     checkSavesAfterFaults         the same, but the program saves once more, and then the power fails
//
// How many states: CRASH_STATES=number in the environment is the most that are tried for one moment and one outcome of
// the directories before they are picked at random (default below); CRASH_SEED=number repeats a run. Both are printed.

#ifndef KAVELL_TESTS_CRASH_CRASH_SCENARIO_H
#define KAVELL_TESTS_CRASH_CRASH_SCENARIO_H

#include <functional>
#include <random>
#include <string>
#include <unordered_set>
#include <vector>

#include "tests/crash/disk.h"
#include "tests/crash/recorder.h"
#include "tests/faults/fault_injector.h"

namespace kavell::test {

class CrashScenario {
public:
    /// Opens what stands in the directory as a new process would, and says in one line what it finds. Whatever is not
    /// as it should be makes another line.
    using Observe = std::function<std::string()>;
    /// Saves something more over what `found` describes; what is to be found then.
    using Proceed = std::function<std::string(const std::string &found)>;

    CrashScenario(WatchedDirectory &directory, Observe observe, Proceed proceed);
    /// Prints how many states were checked.
    ~CrashScenario();

    /// Takes what stands in the directory as certainly on the disk, and found as `found`.
    void start(const std::string &found);

    /// Does the next thing, after which `found` is to be found.
    void step(const std::string &name, const std::function<void()> &act, const std::string &found,
              Refusal refusal = Refusal::Nothing);

    /// The four that follow.
    void checkEverything();
    void checkPowerCuts();
    void checkKills();
    void checkPowerCutsWhileRecovering();
    void checkPowerCutsAfterKills();
    /// Does something else from the start on, after which `found` is to be found or what was there before.
    void checkPowerCutsAfterFaults(const std::function<void()> &act, const std::string &found);
    void checkSavesAfterFaults(const std::function<void()> &act);

private:
    struct Step {
        std::string name;
        size_t end;  ///< how many operations were recorded when it had returned
        std::string found;
    };
    /// A moment right after a number of operations.
    struct Moment {
        size_t operations;
        std::vector<std::string> allowed;
    };

    [[nodiscard]] Moment momentAfter(size_t operations) const;
    [[nodiscard]] Disk diskAfter(size_t operations) const;
    [[nodiscard]] bool isBeforeSync(size_t operations) const;
    void forEachCut(const std::function<void(const Moment &, const DiskState &)> &visit);
    void forEachKill(const std::function<void(const Moment &, const Disk &)> &visit);
    void checkRecovery(const Moment &moment, const DiskState &state);
    void checkCutsOf(Disk disk, const std::vector<DiskOperation> &operations, bool isAtEndOnly,
                     const std::vector<std::string> &allowed, const std::string &what);
    [[nodiscard]] bool isNew(const DiskState &state, const std::vector<std::string> &allowed);
    [[nodiscard]] std::string observeState(const DiskState &state);
    void forEachFaultOf(const std::function<void()> &act,
                        const std::function<void(const FaultInjector &, const Recorder &)> &visit);
    void check(const Moment &moment, const DiskState &state, const std::string &what);
    void report(const Moment &moment, const DiskState &state, const std::string &what, const std::string &found);

    WatchedDirectory &m_directory;
    const Observe m_observe;
    const Proceed m_proceed;
    const size_t m_most;
    const uint64_t m_seed;
    std::mt19937_64 m_random;
    DiskState m_start;
    std::vector<Step> m_steps;
    std::vector<DiskOperation> m_operations;
    std::unordered_set<uint64_t> m_seen;
    size_t m_checked = 0;
    size_t m_failures = 0;
};

}  // namespace kavell::test

#endif
