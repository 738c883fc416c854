// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Where the vault's passphrase comes from: a file named in the environment, or the person at the controlling terminal.
// Used by the vault; one thread at a time asks at the terminal.

#ifndef KAVELL_PLATFORM_SERVICES_PASSPHRASE_H
#define KAVELL_PLATFORM_SERVICES_PASSPHRASE_H

#include "platform/credential_store.h"
#include "platform/services/deadline.h"

namespace kavell {

/// Whether KAVELL_VAULT_PASSPHRASE_FILE names a file; then nobody is ever asked.
[[nodiscard]] bool hasPassphraseFile();

/// The passphrase from that file, without its last line end. The file must be a regular file of at most 4096 bytes that
/// belongs to the user or to root and gives group and others no permission at all, and not be empty; else locked.
[[nodiscard]] CredentialStatus readPassphraseFile(Secret &passphrase);

/// Asks at the controlling terminal without echo until the deadline: stored; locked when there is no terminal, this
/// process is in its background, or the time is up; refused when the person gave up (Ctrl-C, Ctrl-D, Escape or
/// nothing).
[[nodiscard]] CredentialStatus askForPassphrase(std::string_view question, const Deadline &deadline,
                                                Secret &passphrase);

/// Writes a line to the controlling terminal, if there is one.
void tellAtTerminal(std::string_view text);

}  // namespace kavell

#endif
