// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/services/secret_service_connection.h"

#include "platform/services/session_bus.h"

namespace kavell {

namespace {

constexpr const char *kServiceName = "org.freedesktop.secrets";
constexpr const char *kBusInterface = "org.freedesktop.DBus";  // the bus's name and its interface
constexpr const char *kBusPath = "/org/freedesktop/DBus";
constexpr const char *kPromptInterface = "org.freedesktop.Secret.Prompt";

struct ErrorMeaning {
    const char *name;
    CredentialStatus status;
};

// D-Bus names of errors. "absent" for an unknown method is an object that has gone: D-Bus libraries answer so.
constexpr ErrorMeaning kErrorMeanings[] = {
    {"org.freedesktop.Secret.Error.IsLocked", CredentialStatus::locked},
    {"org.freedesktop.Secret.Error.NoSuchObject", CredentialStatus::absent},
    {"org.freedesktop.DBus.Error.UnknownObject", CredentialStatus::absent},
    {"org.freedesktop.DBus.Error.UnknownMethod", CredentialStatus::absent},
    {"org.freedesktop.DBus.Error.NoReply", CredentialStatus::unreachable},
    {"org.freedesktop.DBus.Error.Timeout", CredentialStatus::unreachable},
    {"org.freedesktop.DBus.Error.TimedOut", CredentialStatus::unreachable},
    {"org.freedesktop.DBus.Error.Disconnected", CredentialStatus::unreachable},
    {"org.freedesktop.DBus.Error.ServiceUnknown", CredentialStatus::unreachable},
    {"org.freedesktop.DBus.Error.NameHasNoOwner", CredentialStatus::unreachable},
};

CredentialStatus statusOf(const GError *error)
{
    const OwnedText remote(g_dbus_error_get_remote_error(error));
    // Without a remote name the trouble is this side's: a time-out, or a connection that broke.
    if (!remote)
        return CredentialStatus::unreachable;
    for (const ErrorMeaning &meaning : kErrorMeanings) {
        if (std::string_view(meaning.name) == remote.get())
            return meaning.status;
    }
    const std::string_view name = remote.get();
    return name.starts_with("org.freedesktop.DBus.Error.Spawn.") ? CredentialStatus::unreachable
                                                                 : CredentialStatus::failed;
}

/// What the service's Completed signal says.
struct Completion {
    bool isDone = false;
    bool isDismissed = false;
    bool isServiceGone = false;
    OwnedVariant result;
};

void serviceOwnerChanged(GDBusConnection *, const gchar *, const gchar *, const gchar *, const gchar *,
                         GVariant *parameters, gpointer data)
{
    const char *owner = nullptr;
    if (g_variant_is_of_type(parameters, G_VARIANT_TYPE("(sss)")))
        g_variant_get(parameters, "(&s&s&s)", nullptr, nullptr, &owner);
    if (owner && !*owner)
        static_cast<Completion *>(data)->isServiceGone = true;
}

void promptCompleted(GDBusConnection *, const gchar *, const gchar *, const gchar *, const gchar *,
                     GVariant *parameters, gpointer data)
{
    auto *completion = static_cast<Completion *>(data);
    if (completion->isDone || !g_variant_is_of_type(parameters, G_VARIANT_TYPE("(bv)")))
        return;
    gboolean isDismissed = FALSE;
    GVariant *result = nullptr;
    g_variant_get(parameters, "(bv)", &isDismissed, &result);
    completion->isDismissed = isDismissed != FALSE;
    completion->result.reset(result);
    completion->isDone = true;
}

/// The call with a time-out of what is left, never GLib's own of 25 seconds.
OwnedVariant callBounded(GDBusConnection *connection, const ServiceCall &call, const Deadline &deadline,
                         OwnedError &error, const char *destination = kServiceName)
{
    GError *failure = nullptr;
    const OwnedVariant arguments(g_variant_ref_sink(call.arguments ? call.arguments : g_variant_new("()")));
    OwnedVariant reply(g_dbus_connection_call_sync(
        connection, destination, call.path, call.interface, call.method, arguments.get(),
        G_VARIANT_TYPE(call.replyType), G_DBUS_CALL_FLAGS_NONE, std::max(deadline.remaining(), 1), nullptr, &failure));
    error.reset(failure);
    return reply;
}

}  // namespace

CredentialStatus SecretServiceConnection::connected(const Deadline &deadline, SharedConnection &connection)
{
    if (isForkedFromBusUser())
        return CredentialStatus::unreachable;
    {
        const std::lock_guard lock(m_mutex);
        if (m_connection && !g_dbus_connection_is_closed(m_connection.get())) {
            connection = m_connection;
            return CredentialStatus::stored;
        }
    }
    SharedConnection fresh;
    const BusState state = connectToSessionBus(deadline, fresh);
    if (state != BusState::connected)
        return state == BusState::absent ? CredentialStatus::absent : CredentialStatus::unreachable;
    const std::lock_guard lock(m_mutex);
    // Another thread may have connected meanwhile; its connection is as good, and the session belongs to it.
    if (!m_connection || g_dbus_connection_is_closed(m_connection.get())) {
        m_connection = fresh;
        m_session.clear();
    }
    connection = m_connection;
    return CredentialStatus::stored;
}

void SecretServiceConnection::drop(const SharedConnection &connection)
{
    const std::lock_guard lock(m_mutex);
    if (m_connection == connection) {
        m_connection.reset();
        m_session.clear();
    }
}

CredentialStatus SecretServiceConnection::probe(const Deadline &deadline)
{
    SharedConnection connection;
    if (const CredentialStatus status = connected(deadline, connection); status != CredentialStatus::stored)
        return status;
    OwnedError error;
    const ServiceCall ask{kBusPath, kBusInterface, "NameHasOwner", g_variant_new("(s)", kServiceName), "(b)"};
    if (const OwnedVariant reply = callBounded(connection.get(), ask, deadline, error, kBusInterface)) {
        gboolean isOwned = FALSE;
        g_variant_get(reply.get(), "(b)", &isOwned);
        if (isOwned)
            return CredentialStatus::stored;
    }
    // Not running; the bus may know how to start it. It answers this only for services that it could start.
    const ServiceCall start{kBusPath, kBusInterface, "StartServiceByName", g_variant_new("(su)", kServiceName, 0U),
                            "(u)"};
    if (callBounded(connection.get(), start, deadline, error, kBusInterface))
        return CredentialStatus::stored;
    // An answer, whatever its reason, says that there is no such service; silence says nothing, and neither does a bus
    // that gave up waiting for a service it knows how to start.
    const OwnedText remote(g_dbus_error_get_remote_error(error.get()));
    const std::string_view reason = remote ? remote.get() : "";
    const bool isSilence =
        !remote || reason.ends_with(".NoReply") || reason.ends_with(".TimedOut") || reason.ends_with(".Timeout");
    return isSilence ? CredentialStatus::unreachable : CredentialStatus::absent;
}

CredentialStatus SecretServiceConnection::call(const ServiceCall &call, const Deadline &deadline, OwnedVariant &reply)
{
    SharedConnection connection;
    if (const CredentialStatus status = connected(deadline, connection); status != CredentialStatus::stored) {
        g_variant_unref(g_variant_ref_sink(call.arguments ? call.arguments : g_variant_new("()")));
        return CredentialStatus::unreachable;
    }
    OwnedError error;
    OwnedVariant answer = callBounded(connection.get(), call, deadline, error);
    if (!answer) {
        const OwnedText name(g_dbus_error_get_remote_error(error.get()));
        if (name && std::string_view(name.get()) == "org.freedesktop.Secret.Error.NoSession")
            forgetSession();
        return statusOf(error.get());
    }
    reply = std::move(answer);
    return CredentialStatus::stored;
}

// Secrets travel "plain": the bus is the user's own socket, which only the user and root can read, and either could
// read this process's memory as well. The encrypted form would guard against nobody else.
CredentialStatus SecretServiceConnection::session(const Deadline &deadline, std::string &path)
{
    {
        const std::lock_guard lock(m_mutex);
        if (m_connection && !g_dbus_connection_is_closed(m_connection.get()) && !m_session.empty()) {
            path = m_session;
            return CredentialStatus::stored;
        }
    }
    OwnedVariant reply;
    const CredentialStatus status = call({kSecretServicePath, kSecretServiceInterface, "OpenSession",
                                          g_variant_new("(sv)", "plain", g_variant_new_string("")), "(vo)"},
                                         deadline, reply);
    if (status != CredentialStatus::stored)
        return status;
    const char *opened = nullptr;
    g_variant_get(reply.get(), "(v&o)", nullptr, &opened);
    path = opened;
    const std::lock_guard lock(m_mutex);
    m_session = path;
    return CredentialStatus::stored;
}

bool SecretServiceConnection::hasSession()
{
    const std::lock_guard lock(m_mutex);
    return !m_session.empty();
}

void SecretServiceConnection::forgetSession()
{
    const std::lock_guard lock(m_mutex);
    m_session.clear();
}

CredentialStatus SecretServiceConnection::prompt(const std::string &path, const Deadline &deadline,
                                                 OwnedVariant &result)
{
    SharedConnection connection;
    if (connected(deadline, connection) != CredentialStatus::stored)
        return CredentialStatus::unreachable;
    const PrivateContext context;
    Completion completion;
    const guint subscription =
        g_dbus_connection_signal_subscribe(connection.get(), kServiceName, kPromptInterface, "Completed", path.c_str(),
                                           nullptr, G_DBUS_SIGNAL_FLAGS_NONE, promptCompleted, &completion, nullptr);
    const guint ownerSubscription = g_dbus_connection_signal_subscribe(
        connection.get(), kBusInterface, kBusInterface, "NameOwnerChanged", kBusPath, kServiceName,
        G_DBUS_SIGNAL_FLAGS_NONE, serviceOwnerChanged, &completion, nullptr);
    OwnedError error;
    const ServiceCall show{path.c_str(), kPromptInterface, "Prompt", g_variant_new("(s)", ""), "()"};
    // Showing the prompt is a question like any other; only the user gets the long bound.
    const OwnedVariant shown = callBounded(connection.get(), show, credentialDeadline(), error);
    const bool isOver =
        shown && runUntil(context, deadline, [&] {
            return completion.isDone || completion.isServiceGone || g_dbus_connection_is_closed(connection.get());
        });
    g_dbus_connection_signal_unsubscribe(connection.get(), subscription);
    g_dbus_connection_signal_unsubscribe(connection.get(), ownerSubscription);
    // A signal that was on its way is thrown away here, before `completion` goes.
    while (g_main_context_iteration(context.get(), FALSE)) {
    }
    if (!shown)
        return statusOf(error.get());
    if (!isOver) {
        drop(connection);
        return CredentialStatus::locked;
    }
    if (!completion.isDone)
        return CredentialStatus::unreachable;
    result = std::move(completion.result);
    return completion.isDismissed ? CredentialStatus::refused : CredentialStatus::stored;
}

}  // namespace kavell
