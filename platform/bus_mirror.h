// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Sends a copy of each posted notification to the session bus, off the poster's path. Used by the notification centre;
// any thread may call.

#ifndef KAVELL_PLATFORM_BUS_MIRROR_H
#define KAVELL_PLATFORM_BUS_MIRROR_H

#include <kavellaccounts/CSKavellDictionary.h>
#include <kavellaccounts/CSKavellString.h>

namespace kavell {

/// Queues a copy of a notification for the session bus and returns at once; nothing happens when no session bus stands
/// (one is never started). A worker thread of this process sends it; at the process's end the queue gets a short,
/// bounded time to drain. `object` and `userInformation` may be none.
void mirrorToSessionBus(CSKavellStringRef name, CSKavellStringRef object,
                        CSKavellDictionaryRef userInformation) noexcept;

}  // namespace kavell

#endif
