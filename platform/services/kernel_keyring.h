// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Keeps a key in the kernel for the user's login session, where no file ever holds it. Used by the vault; any thread
// may call; nothing blocks. Containers often forbid all of this: then nothing is kept and nothing is found.

#ifndef KAVELL_PLATFORM_SERVICES_KERNEL_KEYRING_H
#define KAVELL_PLATFORM_SERVICES_KERNEL_KEYRING_H

#include <string>
#include <string_view>

#include "platform/credential_store.h"

namespace kavell {

/// Keeps `bytes` under a name in the user's keyring, for a day at the most; whether it was kept.
bool keepInKernel(const std::string &name, std::string_view bytes);

/// The bytes kept under a name, of the expected length; empty when there are none.
[[nodiscard]] Secret findInKernel(const std::string &name, size_t length);

}  // namespace kavell

#endif
