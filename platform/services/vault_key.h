// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The key of the vault: kept in this process, else in the kernel for the login session, else made of the passphrase.
// Used by the vault; any thread may call.
//
// With a passphrase file, that file alone decides: nothing is kept in the kernel and nobody is asked, so that taking
// the file away takes the key away from the next process.

#ifndef KAVELL_PLATFORM_SERVICES_VAULT_KEY_H
#define KAVELL_PLATFORM_SERVICES_VAULT_KEY_H

#include <mutex>

#include "platform/credential_store.h"
#include "platform/services/deadline.h"
#include "platform/services/vault_file.h"

namespace kavell {

class VaultKey {
public:
    /// The key that opens a vault, without asking anyone: stored; locked when it is not at hand; refused when the
    /// passphrase file holds another passphrase.
    [[nodiscard]] CredentialStatus find(const VaultHeader &header, Secret &key);

    /// The same, but asks at the terminal if need be, three times at the most.
    [[nodiscard]] CredentialStatus ask(const VaultHeader &header, const Deadline &deadline, Secret &key);

    /// The passphrase for a vault that is about to be made; from the terminal (typed twice, and only if `mayAsk`) where
    /// there is no passphrase file.
    [[nodiscard]] CredentialStatus choosePassphrase(bool mayAsk, const Deadline &deadline, Secret &passphrase);

    /// The key that a passphrase gives, if it is the header's; then it is kept.
    [[nodiscard]] CredentialStatus tryPassphrase(const VaultHeader &header, std::string_view passphrase, Secret &key);

    /// Keeps the key of a vault, so that it need not be asked for again.
    void keep(const VaultHeader &header, std::string_view key);

private:
    [[nodiscard]] bool findKept(const VaultHeader &header, Secret &key);

    std::mutex m_mutex;  ///< guards m_key; held for no longer than a copy takes
    Secret m_key;
};

}  // namespace kavell

#endif
