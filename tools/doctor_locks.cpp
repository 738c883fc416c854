// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <chrono>
#include <fstream>
#include <map>
#include <thread>

#include "tools/doctor.h"
#include "tools/files.h"
#include "tools/semaphore_repair.h"
#include "tools/text.h"

namespace kavell::tools {

namespace {

/// How long a living holder may take before it is worth a word. A save takes milliseconds.
constexpr std::chrono::seconds patience{2};

/// How often an account is tried whose lock is found taken again and again.
constexpr int mostAttempts = 3;

/// A set and the accounts that share it: keys are made of a few bits of a file's inode, so files do collide.
struct SharedSet {
    SemaphoreReport report;
    std::vector<Address> accounts;
    bool isOfMissingFiles = false;
};

std::map<int, SharedSet> setsOfFiles(const std::vector<Address> &accounts)
{
    std::map<int, SharedSet> sets;
    for (const Address &address : accounts)
        if (const auto report = inspectSemaphore(dataFileOf(address))) {
            sets[report->id].report = *report;
            sets[report->id].accounts.push_back(address);
        }
    return sets;
}

std::map<int, SharedSet> allSets(const std::vector<Address> &accounts)
{
    std::map<int, SharedSet> sets = setsOfFiles(accounts);
    if (const auto report = inspectSemaphore({})) {
        sets[report->id].report = *report;
        sets[report->id].isOfMissingFiles = true;
    }
    for (const int id : setsLikeThoseIn(dataRoot())) {
        const auto report = sets.contains(id) ? std::nullopt : inspectSemaphoreSet(id);
        if (report && report->state != SemaphoreState::Free)
            sets[id].report = *report;
    }
    return sets;
}

std::string subjectOf(const SharedSet &set)
{
    std::string subject = !set.accounts.empty()  ? set.accounts.front().text()
                          : set.isOfMissingFiles ? "accounts that were just being added"
                                                 : "an account that was removed";
    if (set.accounts.size() > 1)
        subject += " and " + std::to_string(set.accounts.size() - 1) + " more";
    return subject;
}

/// "process 123 (name)".
std::string processText(pid_t process)
{
    if (process == 0)
        return "a process of another container";
    std::string name;
    std::ifstream command("/proc/" + std::to_string(process) + "/comm");
    std::getline(command, name);
    return "process " + std::to_string(process) + (name.empty() ? "" : " (" + escaped(name) + ")");
}

/// Gives a living holder the time to finish.
SemaphoreReport afterPatience(SemaphoreReport report)
{
    const auto end = std::chrono::steady_clock::now() + patience;
    const auto mayEnd = [&] {
        return report.state == SemaphoreState::Held || report.state == SemaphoreState::NeverReady;
    };
    while (mayEnd() && std::chrono::steady_clock::now() < end) {
        std::this_thread::sleep_for(std::chrono::milliseconds(10));
        if (const auto again = inspectSemaphoreSet(report.id))
            report = *again;
    }
    return report;
}

void examineSet(SharedSet &set, Findings &findings)
{
    const SemaphoreReport report = afterPatience(set.report);
    const std::string path = set.accounts.empty() ? std::string() : dataFileOf(set.accounts.front());
    const std::string lock = "the lock of " + subjectOf(set);
    const size_t before = findings.all.size();
    const auto mend = [&] {
        return repairSemaphore(report, dataRoot());
    };
    if (report.state == SemaphoreState::Held)
        findings.problem("held-lock", path,
                         lock + " is held by " + processText(report.lastOperator) +
                             ", and everyone else waits for it; let that finish, or end it and run this again");
    else if (report.state == SemaphoreState::HeldByDead)
        findings.mendable("stuck-lock", path,
                          lock + " was left taken by process " + std::to_string(report.lastOperator) +
                              ", which is dead, and everyone waits for it",
                          mend);
    else if (report.state == SemaphoreState::NeverReady)
        findings.mendable("unready-lock", path,
                          lock + " was made by a process that ended before it was ready, and everyone waits for it",
                          mend);
    else if (report.state == SemaphoreState::AdmitsSeveral)
        findings.mendable("open-lock", path, lock + " lets " + std::to_string(report.value) + " programs in at once",
                          mend);
    else if (report.state == SemaphoreState::Refused)
        findings.problem("foreign-lock", path,
                         lock +
                             " was made by another user, so that nothing is read or saved here; have that user or "
                             "the administrator remove it by 'ipcrm -s " +
                             std::to_string(report.id) + "' when no program uses it");
    const bool stuck = report.state != SemaphoreState::Free && report.state != SemaphoreState::AdmitsSeveral;
    if (stuck && !(findings.all.size() > before && findings.all.back().mended))
        findings.untouchable.insert(set.accounts.begin(), set.accounts.end());
}

}  // namespace

void examineLocks(const std::vector<Address> &accounts, Findings &findings)
{
    std::map<int, SharedSet> sets = allSets(accounts);
    for (auto &[id, set] : sets)
        examineSet(set, findings);
}

std::optional<OpenedAccount> openForExamination(const Address &address, Findings &findings)
{
    for (int attempt = 0; attempt < mostAttempts && !findings.untouchable.contains(address); ++attempt) {
        const QuietStandardError quiet;
        OpenedAccount account = openAccount(address, Patience::Bounded);
        if (!account.wasBrokenOff)
            return account;
        std::map<int, SharedSet> sets = setsOfFiles({address});
        for (auto &[id, set] : sets)
            examineSet(set, findings);
    }
    return std::nullopt;
}

}  // namespace kavell::tools
