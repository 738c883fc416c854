// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Where the user's session bus listens. Used by the module's connections and by the bus mirror, which must know without
// loading the module. Any thread may call.

#ifndef KAVELL_PLATFORM_SERVICES_SESSION_BUS_ADDRESS_H
#define KAVELL_PLATFORM_SERVICES_SESSION_BUS_ADDRESS_H

#include <cstdlib>
#include <string>
#include <sys/stat.h>

namespace kavell {

/// The address, or nothing when there is no session bus. A bus is never started: one that nobody else uses would reach
/// nobody and stay behind.
[[nodiscard]] inline std::string sessionBusAddress()
{
    if (const char *address = secure_getenv("DBUS_SESSION_BUS_ADDRESS"); address && *address) {
        // "autolaunch:" would start a bus; it names none that stands.
        return std::string(address).starts_with("autolaunch:") ? std::string() : address;
    }
    const char *directory = secure_getenv("XDG_RUNTIME_DIR");
    if (!directory || directory[0] != '/')
        return {};
    const std::string path = std::string(directory) + "/bus";
    struct stat status {};
    return ::stat(path.c_str(), &status) == 0 && S_ISSOCK(status.st_mode) ? "unix:path=" + path : std::string();
}

}  // namespace kavell

#endif
