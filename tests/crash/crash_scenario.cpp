// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tests/crash/crash_scenario.h"

#include <algorithm>
#include <cstdlib>
#include <iostream>

#include <gtest/gtest.h>

#include "platform/checksum.h"

namespace kavell::test {

namespace {

// So many states of one scenario are worth reading.
constexpr size_t kMostReports = 3;
constexpr size_t kUsualStates = 800;
// The second cut is tried for so many of the first ones.
constexpr size_t kMostRecoveries = 300;
constexpr size_t kStatesOfARecovery = 40;

uint64_t numberFrom(const char *variable, uint64_t otherwise)
{
    const char *text = std::getenv(variable);
    return text ? std::strtoull(text, nullptr, 10) : otherwise;
}

std::string describe(const DiskState &state)
{
    std::string text;
    for (const auto &[path, file] : state.files)
        text += "  " + path + " #" + std::to_string(file.node) + ", " + std::to_string(file.contents.size()) +
                " bytes, checksum " + std::to_string(checksumOf(file.contents)) + "\n";
    return text;
}

}  // namespace

CrashScenario::CrashScenario(WatchedDirectory &directory, Observe observe, Proceed proceed)
    : m_directory(directory), m_observe(std::move(observe)), m_proceed(std::move(proceed)),
      m_most(numberFrom("CRASH_STATES", kUsualStates)), m_seed(numberFrom("CRASH_SEED", std::random_device()())),
      m_random(m_seed)
{
}

CrashScenario::~CrashScenario()
{
    std::cout << "[   STATES ] " << m_checked << " checked, CRASH_STATES=" << m_most << " CRASH_SEED=" << m_seed
              << "\n";
}

void CrashScenario::start(const std::string &found)
{
    m_start = m_directory.look();
    ASSERT_EQ(m_observe(), found);
    // Looking may have put in order what the first step is to find as it was.
    m_directory.make(m_start);
    m_steps.push_back({"start", 0, found});
}

void CrashScenario::step(const std::string &name, const std::function<void()> &act, const std::string &found,
                         Refusal refusal)
{
    Recorder recorder(m_directory, refusal);
    {
        const Observation observation(recorder);
        act();
    }
    const auto &operations = recorder.operations();
    m_operations.insert(m_operations.end(), operations.begin(), operations.end());
    m_steps.push_back({name, m_operations.size(), found});
    ASSERT_FALSE(operations.empty()) << name;
    // Nothing may have escaped the recorder, or the states are not those of the program.
    const DiskState known = diskAfter(m_operations.size()).latest(), real = m_directory.look();
    ASSERT_EQ(known == real, true) << name << " recorded:\n" << describe(known) << "real:\n" << describe(real);
    ASSERT_EQ(m_observe(), found) << name;
}

CrashScenario::Moment CrashScenario::momentAfter(size_t operations) const
{
    Moment moment{operations, {}};
    for (size_t number = 0; number < m_steps.size(); ++number) {
        if (m_steps[number].end < operations)
            continue;
        if (m_steps[number].end > operations)
            moment.allowed.push_back(m_steps[number - 1].found);
        moment.allowed.push_back(m_steps[number].found);
        break;
    }
    return moment;
}

Disk CrashScenario::diskAfter(size_t operations) const
{
    Disk disk(m_start);
    for (size_t number = 0; number < operations; ++number)
        disk.apply(m_operations[number]);
    return disk;
}

/// Whether what may be on the disk becomes less with the next operation. Between two such moments it only becomes more,
/// so that the later states are all there are.
bool CrashScenario::isBeforeSync(size_t operations) const
{
    return operations == m_operations.size() || m_operations[operations].isSync() ||
           std::any_of(m_steps.begin(), m_steps.end(), [&](const Step &step) { return step.end == operations; });
}

/// Whether this state with these outcomes was not seen before.
bool CrashScenario::isNew(const DiskState &state, const std::vector<std::string> &allowed)
{
    std::string text;
    for (const std::string &directory : state.directories)
        text += directory + '\0';
    for (const auto &[path, file] : state.files)
        text +=
            path + '\0' + std::to_string(file.node) + '\0' + std::to_string(file.mode) + '\0' + file.contents + '\0';
    for (const std::string &found : allowed)
        text += found + '\0';
    return m_seen.insert(checksumOf(text)).second;
}

void CrashScenario::forEachCut(const std::function<void(const Moment &, const DiskState &)> &visit)
{
    for (size_t operations = 0; operations <= m_operations.size(); ++operations) {
        if (!isBeforeSync(operations))
            continue;
        const Moment moment = momentAfter(operations);
        diskAfter(operations).forEachState(m_most, m_random, [&](const DiskState &state) {
            if (m_failures < kMostReports && isNew(state, moment.allowed))
                visit(moment, state);
        });
    }
}

/// A kill may also cut a write off part way; whole sectors stand for all places.
void CrashScenario::forEachKill(const std::function<void(const Moment &, const Disk &)> &visit)
{
    for (size_t operations = 0; operations <= m_operations.size() && m_failures < kMostReports; ++operations) {
        const Disk disk = diskAfter(operations);
        visit(momentAfter(operations), disk);
        if (operations == m_operations.size() || m_operations[operations].kind != DiskOperation::Kind::Write)
            continue;
        for (size_t length = Disk::kSector; length < m_operations[operations].bytes.size(); length += Disk::kSector) {
            Disk torn = disk;
            DiskOperation part = m_operations[operations];
            part.bytes.resize(length);
            torn.apply(part);
            visit({operations, momentAfter(operations + 1).allowed}, torn);
        }
    }
}

std::string CrashScenario::observeState(const DiskState &state)
{
    ++m_checked;
    m_directory.make(state);
    return m_observe();
}

void CrashScenario::report(const Moment &moment, const DiskState &state, const std::string &what,
                           const std::string &found)
{
    ++m_failures;
    std::string text = what + " after these operations:\n";
    for (size_t number = 0; number < moment.operations; ++number)
        text += "  " + m_operations[number].description() + "\n";
    text += "may be found:\n";
    for (const std::string &allowed : moment.allowed)
        text += "  " + allowed + "\n";
    ADD_FAILURE() << text << "was found:\n  " << found << "\nof:\n" << describe(state);
}

void CrashScenario::check(const Moment &moment, const DiskState &state, const std::string &what)
{
    const std::string found = observeState(state);
    if (std::find(moment.allowed.begin(), moment.allowed.end(), found) == moment.allowed.end())
        return report(moment, state, what, found);
    if (const std::string again = m_observe(); again != found)
        return report({moment.operations, {found}}, state, what + ", at the second look,", again);
    const std::string next = m_proceed(found);
    if (const std::string later = m_observe(); later != next)
        report({moment.operations, {next}}, state, what + ", and one more save,", later);
}

void CrashScenario::checkEverything()
{
    checkPowerCuts();
    checkKills();
    checkPowerCutsWhileRecovering();
    checkPowerCutsAfterKills();
}

void CrashScenario::checkPowerCuts()
{
    m_seen.clear();
    forEachCut([&](const Moment &moment, const DiskState &state) { check(moment, state, "After a power cut"); });
}

void CrashScenario::checkKills()
{
    forEachKill([&](const Moment &moment, const Disk &disk) { check(moment, disk.latest(), "After a kill"); });
}

void CrashScenario::checkCutsOf(Disk disk, const std::vector<DiskOperation> &operations, bool isAtEndOnly,
                                const std::vector<std::string> &allowed, const std::string &what)
{
    for (size_t number = 0; number <= operations.size(); ++number) {
        const bool isEnd = number == operations.size();
        if (isEnd || (!isAtEndOnly && operations[number].isSync())) {
            disk.forEachState(kStatesOfARecovery, m_random, [&](const DiskState &state) {
                if (m_failures >= kMostReports || !isNew(state, allowed))
                    return;
                const std::string later = observeState(state);
                if (std::find(allowed.begin(), allowed.end(), later) == allowed.end())
                    report({0, allowed}, state, what, later);
            });
        }
        if (!isEnd)
            disk.apply(operations[number]);
    }
}

/// What was found once must be found again after a cut in the midst of finding it.
void CrashScenario::checkRecovery(const Moment &moment, const DiskState &state)
{
    Recorder recorder(m_directory);
    m_directory.make(state);
    std::string found;
    {
        const Observation observation(recorder);
        found = m_observe();
    }
    if (!recorder.operations().empty())
        checkCutsOf(Disk(state), recorder.operations(), false, {found},
                    "After a second power cut, the first one after " + std::to_string(moment.operations) +
                        " operations,");
}

void CrashScenario::checkPowerCutsWhileRecovering()
{
    m_seen.clear();
    std::vector<std::pair<Moment, DiskState>> cuts;
    forEachCut([&](const Moment &moment, const DiskState &state) { cuts.emplace_back(moment, state); });
    std::shuffle(cuts.begin(), cuts.end(), m_random);
    cuts.resize(std::min(cuts.size(), std::max(kMostRecoveries, m_most)));
    for (const auto &[moment, state] : cuts)
        checkRecovery(moment, state);
}

void CrashScenario::checkPowerCutsAfterKills()
{
    m_seen.clear();
    forEachKill([&](const Moment &moment, const Disk &disk) {
        const std::string found = observeState(disk.latest());
        m_directory.makeAnew(disk.latest());
        Recorder recorder(m_directory);
        std::string next;
        {
            const Observation observation(recorder);
            next = m_proceed(found);
        }
        checkCutsOf(disk, recorder.operations(), true, {next},
                    "After a kill behind " + std::to_string(moment.operations) +
                        " operations, a save and a power cut,");
    });
}

void CrashScenario::forEachFaultOf(const std::function<void()> &act,
                                   const std::function<void(const FaultInjector &, const Recorder &)> &visit)
{
    m_seen.clear();
    // What a call fails with matters to the messages, not to the disk.
    forEachFault({.errors = {EIO}, .leaveNothing = false}, [&](FaultInjector &injector) {
        m_directory.makeAnew(m_start);
        Recorder recorder(m_directory, injector);
        {
            const Observation observation(recorder);
            act();
        }
        // What was said meanwhile is not for the states that follow.
        static_cast<void>(m_observe());
        visit(injector, recorder);
    });
}

void CrashScenario::checkPowerCutsAfterFaults(const std::function<void()> &act, const std::string &found)
{
    forEachFaultOf(act, [&](const FaultInjector &injector, const Recorder &recorder) {
        checkCutsOf(Disk(m_start), recorder.operations(), false, {m_steps.front().found, found},
                    "After " + injector.description() + ", and a power cut,");
    });
}

void CrashScenario::checkSavesAfterFaults(const std::function<void()> &act)
{
    forEachFaultOf(act, [&](const FaultInjector &injector, const Recorder &recorder) {
        Disk disk(m_start);
        for (const DiskOperation &operation : recorder.operations())
            disk.apply(operation);
        const std::string found = observeState(disk.latest());
        // In the directories that the program knows: it may believe that their names are on the disk.
        m_directory.make(disk.latest());
        Recorder next(m_directory);
        std::string later;
        {
            const Observation observation(next);
            later = m_proceed(found);
        }
        checkCutsOf(disk, next.operations(), true, {later},
                    "After " + injector.description() + ", a save, and a power cut,");
    });
}

}  // namespace kavell::test
