// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Connections to the session bus that belong to this library alone. Used by the Secret Service and the bus sender; any
// thread may call.
//
// The connection that all of a process shares (g_bus_get) is never touched: it ends the process when the bus dies.

#ifndef KAVELL_PLATFORM_SERVICES_SESSION_BUS_H
#define KAVELL_PLATFORM_SERVICES_SESSION_BUS_H

#include <functional>

#include "platform/services/deadline.h"
#include "platform/services/glib_handles.h"

namespace kavell {

enum class BusState { connected, absent, silent };

/// A fresh connection, in `connection` when connected; absent when there is no bus or nobody listens at its address,
/// silent when it did not take the connection before the deadline.
[[nodiscard]] BusState connectToSessionBus(const Deadline &deadline, SharedConnection &connection);

/// GLib serves all connections from one thread, which does not survive a fork: in the child of a process that has used
/// one, every call would run into its time-out. Whether this is such a child; for it the bus is silent.
[[nodiscard]] bool isForkedFromBusUser();

/// Runs the context until `done` holds or the deadline has passed; whether it came to hold.
[[nodiscard]] bool runUntil(const PrivateContext &context, const Deadline &deadline, const std::function<bool()> &done);

}  // namespace kavell

#endif
