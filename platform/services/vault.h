// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The embedded credential store, for systems without a Secret Service: one encrypted file in the user's data directory
// (vault_file.h draws it). Processes take turns by a lock file and read the vault anew before each change, so none
// loses another's. A file that is damaged, or that is no vault, is never written over. Made once per process; any
// thread may use it.

#ifndef KAVELL_PLATFORM_SERVICES_VAULT_H
#define KAVELL_PLATFORM_SERVICES_VAULT_H

#include "platform/credential_store.h"

namespace kavell {

/// The store, owned by the caller. The file comes into being when the store is first unlocked.
[[nodiscard]] CredentialStore *makeVault();

}  // namespace kavell

#endif
