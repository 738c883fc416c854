// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// How a command ends early: the exit codes that scripts can rely on, and the exception that carries one of them
// together with the sentence for standard error. Thrown by every command, caught in main.cpp only. One thread.

#ifndef KAVELL_TOOLS_FAILURE_H
#define KAVELL_TOOLS_FAILURE_H

#include <stdexcept>
#include <string>

namespace kavell::tools {

/// What the program's exit status means; the manual page has the same list.
enum class ExitCode : int {
    Done = 0,
    Failed = 1,           ///< could not be saved or read, problems left, nothing seen in time
    BadInput = 2,         ///< the words given make no sense, and nothing was changed
    NoSuchAccount = 3,    ///< there is no account of that provider and login name
    CredentialStore = 4,  ///< the credential store is locked, refuses or cannot be reached
};

/// Ends the command with a code and one sentence, which names the thing and the way out.
class Failure : public std::runtime_error {
public:
    Failure(ExitCode code, const std::string &sentence) : std::runtime_error(sentence), m_code(code) {}
    [[nodiscard]] ExitCode code() const noexcept { return m_code; }

private:
    ExitCode m_code;
};

/// Shorthand for the commonest of them.
[[noreturn]] inline void refuse(const std::string &sentence)
{
    throw Failure(ExitCode::BadInput, sentence);
}

}  // namespace kavell::tools

#endif
