// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The desktop's Secret Service (gnome-keyring, KWallet, KeePassXC) as a credential store, spoken to over D-Bus as
// https://specifications.freedesktop.org/secret-service/ describes it. Made once per process; any thread may use it.

#ifndef KAVELL_PLATFORM_SERVICES_SECRET_SERVICE_H
#define KAVELL_PLATFORM_SERVICES_SECRET_SERVICE_H

#include "platform/credential_store.h"

namespace kavell {

/// The store, owned by the caller. Connects with the first question, and again after the bus or the service has gone.
[[nodiscard]] CredentialStore *makeSecretService();

}  // namespace kavell

#endif
