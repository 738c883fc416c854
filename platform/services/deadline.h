// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The moment by which a question must have its answer. Every operation of the stores makes one at its start and hands
// it down, so that many small waits cannot add up to a long one. Safe from any thread.

#ifndef KAVELL_PLATFORM_SERVICES_DEADLINE_H
#define KAVELL_PLATFORM_SERVICES_DEADLINE_H

#include <algorithm>
#include <chrono>
#include <cstdlib>
#include <thread>

namespace kavell {

class Deadline {
public:
    explicit Deadline(std::chrono::milliseconds span) : m_end(std::chrono::steady_clock::now() + span) {}

    /// What is left in milliseconds; 0 when the moment has passed.
    [[nodiscard]] int remaining() const
    {
        const auto left =
            std::chrono::duration_cast<std::chrono::milliseconds>(m_end - std::chrono::steady_clock::now());
        return static_cast<int>(std::max<std::chrono::milliseconds::rep>(left.count(), 0));
    }

    [[nodiscard]] bool hasPassed() const { return remaining() == 0; }

private:
    std::chrono::steady_clock::time_point m_end;
};

/// A number of milliseconds from the environment, within 1 ms and 10 minutes; the default when it is absent or not one.
[[nodiscard]] inline std::chrono::milliseconds millisecondsFromEnvironment(const char *variable, int standard)
{
    const char *text = secure_getenv(variable);
    char *end = nullptr;
    const long value = text ? std::strtol(text, &end, 10) : 0;
    return std::chrono::milliseconds(text && *text && *end == '\0' && value > 0 ? std::min(value, 600'000L) : standard);
}

/// The bound of one question to a store.
[[nodiscard]] inline Deadline credentialDeadline()
{
    return Deadline(millisecondsFromEnvironment("KAVELL_CREDENTIAL_TIMEOUT", 5'000));
}

/// The bound of an unlocking prompt.
[[nodiscard]] inline Deadline unlockDeadline()
{
    return Deadline(millisecondsFromEnvironment("KAVELL_UNLOCK_TIMEOUT", 60'000));
}

/// Asks again and again until `condition` holds or the moment has passed; whether it came to hold. For what the kernel
/// offers no bounded wait for, such as a file lock.
template <typename Condition> [[nodiscard]] bool waitUntil(const Deadline &deadline, Condition &&condition)
{
    using namespace std::chrono_literals;
    for (auto pause = 1ms; !condition(); pause = std::min(pause * 2, 16ms)) {
        if (deadline.hasPassed())
            return false;
        std::this_thread::sleep_for(pause);
    }
    return true;
}

}  // namespace kavell

#endif
