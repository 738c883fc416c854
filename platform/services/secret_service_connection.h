// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Calls to the Secret Service: the connection and the session that secrets travel in, both made when needed and made
// again after a loss; errors turned into statuses; prompts. Used by the Secret Service store; any thread may call.

#ifndef KAVELL_PLATFORM_SERVICES_SECRET_SERVICE_CONNECTION_H
#define KAVELL_PLATFORM_SERVICES_SECRET_SERVICE_CONNECTION_H

#include <mutex>
#include <string>

#include "platform/credential_store.h"
#include "platform/services/deadline.h"
#include "platform/services/glib_handles.h"

namespace kavell {

inline constexpr const char *kSecretServicePath = "/org/freedesktop/secrets";
inline constexpr const char *kSecretServiceInterface = "org.freedesktop.Secret.Service";
inline constexpr const char *kSecretCollectionInterface = "org.freedesktop.Secret.Collection";
inline constexpr const char *kSecretItemInterface = "org.freedesktop.Secret.Item";
inline constexpr const char *kPropertiesInterface = "org.freedesktop.DBus.Properties";

/// The path that stands for no object.
inline constexpr std::string_view kNoObject = "/";

/// One call: where to, and what is expected back.
struct ServiceCall {
    const char *path;
    const char *interface;
    const char *method;
    GVariant *arguments;  ///< floating, taken over by the call
    const char *replyType;
};

class SecretServiceConnection {
public:
    /// Whether somebody owns the service's name, or the bus can start somebody who does: stored, absent, or unreachable
    /// when the bus does not say in time.
    [[nodiscard]] CredentialStatus probe(const Deadline &deadline);

    /// Makes the call and waits for its answer, connecting first if need be. On stored, `reply` holds the answer.
    [[nodiscard]] CredentialStatus call(const ServiceCall &call, const Deadline &deadline, OwnedVariant &reply);

    /// Runs `body` with the path of a session for secrets, opening one if need be; once more with a fresh one when the
    /// service knows the old one no longer, because it has been restarted.
    template <typename Body> [[nodiscard]] CredentialStatus withSession(const Deadline &deadline, Body &&body)
    {
        for (bool isRetry = false;; isRetry = true) {
            std::string path;
            if (const CredentialStatus opened = session(deadline, path); opened != CredentialStatus::stored)
                return opened;
            const CredentialStatus status = body(path);
            if (status == CredentialStatus::stored || isRetry || hasSession())
                return status;
        }
    }

    /// Shows the prompt that an answer named, and waits until the user has dealt with it: stored, refused when it was
    /// dismissed, locked when the time was up. `result` receives what the prompt brought. The prompt belongs to this
    /// connection, which is dropped when the time is up: that tells the service that nobody waits any more, without the
    /// Dismiss call, which brings some services down.
    [[nodiscard]] CredentialStatus prompt(const std::string &path, const Deadline &deadline, OwnedVariant &result);

private:
    [[nodiscard]] CredentialStatus connected(const Deadline &deadline, SharedConnection &connection);
    [[nodiscard]] CredentialStatus session(const Deadline &deadline, std::string &path);
    [[nodiscard]] bool hasSession();
    void forgetSession();
    void drop(const SharedConnection &connection);

    std::mutex m_mutex;  ///< guards the fields; never held while waiting for the service
    SharedConnection m_connection;
    std::string m_session;
};

}  // namespace kavell

#endif
