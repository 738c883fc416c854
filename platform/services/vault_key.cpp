// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/services/vault_key.h"

#include <sodium.h>

#include "platform/services/kernel_keyring.h"
#include "platform/services/passphrase.h"

namespace kavell {

namespace {

constexpr int kMostTries = 3;

/// The key's name in the kernel. A vault made anew has another salt, and so another name.
std::string kernelName(const VaultHeader &header)
{
    char digits[2 * sizeof header.salt + 1];
    sodium_bin2hex(digits, sizeof digits, header.salt.data(), header.salt.size());
    return std::string("kavell-accounts:vault:") + digits;
}

}  // namespace

bool VaultKey::findKept(const VaultHeader &header, Secret &key)
{
    const std::lock_guard lock(m_mutex);
    if (!isKeyRight(header, m_key.view()))
        return false;
    key = Secret(m_key.view());
    return true;
}

void VaultKey::keep(const VaultHeader &header, std::string_view key)
{
    {
        const std::lock_guard lock(m_mutex);
        m_key = Secret(key);
    }
    if (!hasPassphraseFile())
        keepInKernel(kernelName(header), key);
}

CredentialStatus VaultKey::tryPassphrase(const VaultHeader &header, std::string_view passphrase, Secret &key)
{
    Secret derived = deriveVaultKey(header, passphrase);
    if (derived.view().empty())
        return CredentialStatus::failed;
    if (!isKeyRight(header, derived.view()))
        return CredentialStatus::refused;
    keep(header, derived.view());
    key = std::move(derived);
    return CredentialStatus::stored;
}

CredentialStatus VaultKey::find(const VaultHeader &header, Secret &key)
{
    if (findKept(header, key))
        return CredentialStatus::stored;
    if (hasPassphraseFile()) {
        Secret passphrase;
        const CredentialStatus status = readPassphraseFile(passphrase);
        return status == CredentialStatus::stored ? tryPassphrase(header, passphrase.view(), key) : status;
    }
    Secret kept = findInKernel(kernelName(header), kVaultKeyLength);
    if (!isKeyRight(header, kept.view()))
        return CredentialStatus::locked;
    const std::lock_guard lock(m_mutex);
    m_key = Secret(kept.view());
    key = std::move(kept);
    return CredentialStatus::stored;
}

CredentialStatus VaultKey::ask(const VaultHeader &header, const Deadline &deadline, Secret &key)
{
    CredentialStatus status = find(header, key);
    if (status != CredentialStatus::locked || hasPassphraseFile())
        return status;
    for (int tries = 0; tries < kMostTries; ++tries) {
        Secret passphrase;
        status = askForPassphrase("Passphrase of the Kavell accounts vault: ", deadline, passphrase);
        if (status != CredentialStatus::stored)
            return status;
        status = tryPassphrase(header, passphrase.view(), key);
        if (status != CredentialStatus::refused)
            return status;
        tellAtTerminal("That is not its passphrase.\n");
    }
    return status;
}

CredentialStatus VaultKey::choosePassphrase(bool mayAsk, const Deadline &deadline, Secret &passphrase)
{
    if (hasPassphraseFile())
        return readPassphraseFile(passphrase);
    if (!mayAsk)
        return CredentialStatus::locked;
    for (int tries = 0; tries < kMostTries; ++tries) {
        Secret first;
        Secret second;
        CredentialStatus status =
            askForPassphrase("Choose a passphrase for a new Kavell accounts vault: ", deadline, first);
        if (status == CredentialStatus::stored)
            status = askForPassphrase("The same passphrase again: ", deadline, second);
        if (status != CredentialStatus::stored)
            return status;
        if (first.view() == second.view()) {
            passphrase = std::move(first);
            return status;
        }
        tellAtTerminal("These two are not the same.\n");
    }
    return CredentialStatus::refused;
}

}  // namespace kavell
