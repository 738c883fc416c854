// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Sends notifications to the session bus as the signal "Posted". Made for the bus mirror's worker thread.

#ifndef KAVELL_PLATFORM_SERVICES_BUS_SENDER_H
#define KAVELL_PLATFORM_SERVICES_BUS_SENDER_H

#include "platform/services_module.h"

namespace kavell {

/// A sender, owned by the caller. It connects with the first signal, and again when the bus has gone meanwhile.
[[nodiscard]] BusSender *makeBusSender();

}  // namespace kavell

#endif
