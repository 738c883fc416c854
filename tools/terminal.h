// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Questions to the person at the terminal. They are asked on the controlling terminal, not on standard input or output,
// which may be redirected. One thread; blocks until the answer comes.

#ifndef KAVELL_TOOLS_TERMINAL_H
#define KAVELL_TOOLS_TERMINAL_H

#include <string>

namespace kavell::tools {

/// Whether the answer begins with "y"; anything else, the end of input included, is no.
[[nodiscard]] bool confirm(const std::string &question);

/// The password, typed twice without being echoed. Refuses two that differ. A signal that ends the program while it is
/// being typed restores the echo first.
[[nodiscard]] std::string askForNewPassword(const std::string &account);

/// Overwrites the text's memory before it is given back.
void wipe(std::string &secret) noexcept;

}  // namespace kavell::tools

#endif
