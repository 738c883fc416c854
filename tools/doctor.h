// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What the doctor finds, and the examinations that find it. Each examination reports into one Findings; with `repair`
// it mends what it may and says so. One thread.

#ifndef KAVELL_TOOLS_DOCTOR_H
#define KAVELL_TOOLS_DOCTOR_H

#include <functional>
#include <optional>
#include <set>
#include <string>
#include <vector>

#include "tools/account_access.h"

namespace kavell::tools {

enum class Weight {
    Problem,  ///< something is wrong
    Note,     ///< worth knowing, and nothing is wrong
};

struct Finding {
    std::string kind;  ///< for scripts: "stuck-lock", "damaged-file", …
    Weight weight = Weight::Problem;
    std::string path;      ///< the file it is about, or empty
    std::string sentence;  ///< what is the matter, and the way out
    bool canMend = false;  ///< whether --repair, which was not asked for, would try to
    bool mended = false;
};

struct Findings {
    bool repair = false;
    std::vector<Finding> all;
    /// Accounts that must not be opened, because that would wait without an end or change something.
    std::set<Address> untouchable;

    void problem(std::string kind, std::string path, std::string sentence);
    void note(std::string kind, std::string path, std::string sentence);
    /// A problem that --repair mends: `mend` is called with it, and its answer is reported.
    void mendable(std::string kind, std::string path, const std::string &sentence, const std::function<bool()> &mend);
};

/// Semaphores whose holder is dead, or that are held for long.
void examineLocks(const std::vector<Address> &accounts, Findings &findings);

/// Opens an account to look at it. Where a lock was taken since the locks were examined, by a program that was killed or
/// is slow, that is a finding of its own; none when the account cannot be opened for that reason.
[[nodiscard]] std::optional<OpenedAccount> openForExamination(const Address &address, Findings &findings);

/// Permissions of directories and files, files left over or kept, and entries that are no accounts but look like it.
void examineDirectories(Findings &findings);

/// Data files that cannot be read or understood. Opening an account finishes its interrupted save.
void examineContents(const std::vector<Address> &accounts, Findings &findings);

/// Accounts without secrets and secrets without accounts.
void examineSecrets(const std::vector<Address> &accounts, Findings &findings);

}  // namespace kavell::tools

#endif
