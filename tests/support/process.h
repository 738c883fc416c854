// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Real processes for tests: a forked child that runs a function, and a program run to its end with its output caught.
// Every wait has a bound; a child that outlives it is killed and reported as a failure.

#ifndef KAVELL_TESTS_SUPPORT_PROCESS_H
#define KAVELL_TESTS_SUPPORT_PROCESS_H

#include <chrono>
#include <functional>
#include <string>
#include <string_view>
#include <sys/types.h>
#include <vector>

namespace kavell::test {

/// A forked child of this process. The destructor kills a child that still runs.
class ChildProcess {
public:
    /// Forks; the child runs `body` and exits with its result, skipping the parent's destructors.
    explicit ChildProcess(const std::function<int()> &body);

    /// Starts a program with the given arguments (argv[0] first) and environment additions ("NAME=value").
    ChildProcess(const std::vector<std::string> &arguments, const std::vector<std::string> &environment,
                 int standardInput, int standardOutput, int standardError);
    ~ChildProcess();
    ChildProcess(const ChildProcess &) = delete;
    ChildProcess &operator=(const ChildProcess &) = delete;

    [[nodiscard]] pid_t pid() const { return m_pid; }

    void signal(int number) const;

    /// The exit status once the child has ended: its exit code, or 128 plus the signal that ended it; -1 when it had to
    /// be killed because `bound` had passed.
    [[nodiscard]] int wait(std::chrono::milliseconds bound = std::chrono::seconds(60));

private:
    pid_t m_pid = -1;
};

/// What became of a program.
struct ProgramResult {
    int status = -1;  ///< as ChildProcess::wait says
    std::string output;
    std::string error;
};

/// Runs a program to its end, feeding it `input`.
[[nodiscard]] ProgramResult runProgram(const std::vector<std::string> &arguments, std::string_view input = {},
                                       const std::vector<std::string> &environment = {},
                                       std::chrono::milliseconds bound = std::chrono::seconds(60));

/// The path of a file of the build tree, such as "bin/kavell-accounts" (the tests run with KAVELL_BUILD_DIR set).
[[nodiscard]] std::string buildPath(std::string_view relative);

/// The path of a file of the source tree.
[[nodiscard]] std::string sourcePath(std::string_view relative);

/// The whole contents of a file; empty when it cannot be read.
[[nodiscard]] std::string readFile(const std::string &path);

/// Writes a file whole, making the directories above it.
void writeFile(const std::string &path, std::string_view contents);

/// The path below the scratch home of an account's data file.
[[nodiscard]] std::string dataFilePath(std::string_view providerType, std::string_view loginName);

}  // namespace kavell::test

#endif
