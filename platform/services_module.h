// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The module that holds everything which needs D-Bus or libsodium (services/). It is loaded by the first use, so that a
// program that never asks for a password and never posts a notification loads none of that, and is never unloaded,
// because threads of its libraries may be running its code. Used by the credential store and the bus mirror; any thread
// may call.

#ifndef KAVELL_PLATFORM_SERVICES_MODULE_H
#define KAVELL_PLATFORM_SERVICES_MODULE_H

#include <cstdint>
#include <string>
#include <utility>
#include <variant>
#include <vector>

namespace kavell {

class CredentialStore;

/// A notification on its way to the session bus.
struct BusSignal {
    using Value = std::variant<std::string, int64_t, uint64_t, double, bool>;

    std::string name;
    std::string object;
    std::vector<std::pair<std::string, Value>> information;
};

/// Sends notifications as signals. Used by one thread at a time, which it may block for as long as the bus does.
class BusSender {
public:
    virtual ~BusSender() = default;

    /// Sends one signal, connecting first when there is no connection; false when the bus cannot be had.
    [[nodiscard]] virtual bool send(const BusSignal &signal) = 0;

    /// Returns when the bus has taken all that was sent, or has gone.
    virtual void flush() = 0;
};

/// Raised with every change of what crosses the module's border, so that a stale module is refused.
inline constexpr uint32_t kServicesModuleVersion = 1;

/// What the module offers: makers of objects that the caller owns.
struct ServicesModule {
    uint32_t version;
    CredentialStore *(*makeSecretService)();
    CredentialStore *(*makeVault)();
    BusSender *(*makeBusSender)();
};

/// The name and type of the module's one exported function.
inline constexpr const char *kServicesModuleEntry = "kavellServicesModule";
using ServicesModuleEntry = const ServicesModule *();

/// The module, loaded on the first call; null when it is missing or of another version.
[[nodiscard]] const ServicesModule *servicesModule() noexcept;

}  // namespace kavell

#endif
