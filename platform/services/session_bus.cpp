// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/services/session_bus.h"

#include <atomic>
#include <csignal>
#include <unistd.h>

#include "platform/services/session_bus_address.h"

namespace kavell {

namespace {

/// The process that first used a connection; 0 before that.
std::atomic<pid_t> busUser{0};

/// Blocks all signals for the calling thread, so that the threads which GLib starts meanwhile never take one of the
/// host's.
class SignalsBlocked {
public:
    SignalsBlocked()
    {
        sigset_t all;
        sigfillset(&all);
        pthread_sigmask(SIG_SETMASK, &all, &m_saved);
    }
    ~SignalsBlocked() { pthread_sigmask(SIG_SETMASK, &m_saved, nullptr); }
    SignalsBlocked(const SignalsBlocked &) = delete;
    SignalsBlocked &operator=(const SignalsBlocked &) = delete;

private:
    sigset_t m_saved{};
};

/// What an attempt has come to. Shared with GLib's callback, which comes even after the attempt was given up.
struct Attempt {
    bool isDone = false;
    Owned<GDBusConnection> connection;
};

void attemptEnded(GObject *, GAsyncResult *result, gpointer data)
{
    const std::unique_ptr<std::shared_ptr<Attempt>> attempt(static_cast<std::shared_ptr<Attempt> *>(data));
    (*attempt)->connection.reset(g_dbus_connection_new_for_address_finish(result, nullptr));
    (*attempt)->isDone = true;
}

/// Closes without waiting: a bus that is stopped must not hold up whoever gives a connection back.
void closeConnection(GDBusConnection *connection)
{
    g_dbus_connection_close(connection, nullptr, nullptr, nullptr);
    g_object_unref(connection);
}

}  // namespace

bool isForkedFromBusUser()
{
    const pid_t user = busUser;
    return user != 0 && user != getpid();
}

bool runUntil(const PrivateContext &context, const Deadline &deadline, const std::function<bool()> &done)
{
    // The timer only wakes the loop, now and then, because not all that ends a wait arrives in this context: a
    // connection tells the context that it was made in when it is closed.
    constexpr int kWakingInterval = 50;
    GSource *timer = g_timeout_source_new(static_cast<guint>(std::min(deadline.remaining() + 1, kWakingInterval)));
    g_source_set_callback(
        timer, [](gpointer) -> gboolean { return G_SOURCE_CONTINUE; }, nullptr, nullptr);
    g_source_attach(timer, context.get());
    while (!done() && !deadline.hasPassed())
        g_main_context_iteration(context.get(), TRUE);
    g_source_destroy(timer);
    g_source_unref(timer);
    return done();
}

BusState connectToSessionBus(const Deadline &deadline, SharedConnection &connection)
{
    const std::string address = sessionBusAddress();
    if (address.empty())
        return BusState::absent;
    if (isForkedFromBusUser())
        return BusState::silent;
    busUser = getpid();
    const SignalsBlocked blocked;
    const PrivateContext context;
    const Owned<GCancellable> cancellable(g_cancellable_new());
    const auto attempt = std::make_shared<Attempt>();
    g_dbus_connection_new_for_address(address.c_str(),
                                      static_cast<GDBusConnectionFlags>(G_DBUS_CONNECTION_FLAGS_AUTHENTICATION_CLIENT |
                                                                        G_DBUS_CONNECTION_FLAGS_MESSAGE_BUS_CONNECTION),
                                      nullptr, cancellable.get(), attemptEnded, new std::shared_ptr<Attempt>(attempt));
    // A bus that is stopped accepts the connection and then says nothing.
    if (!runUntil(context, deadline, [&] { return attempt->isDone; })) {
        g_cancellable_cancel(cancellable.get());
        // Cancelling is quick, but where it is not, the attempt is left to itself.
        const Deadline shortly(std::chrono::milliseconds(100));
        static_cast<void>(runUntil(context, shortly, [&] { return attempt->isDone; }));
        return BusState::silent;
    }
    if (!attempt->connection)
        return BusState::absent;
    g_dbus_connection_set_exit_on_close(attempt->connection.get(), FALSE);
    connection = SharedConnection(attempt->connection.release(), closeConnection);
    return BusState::connected;
}

}  // namespace kavell
