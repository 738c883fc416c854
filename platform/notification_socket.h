// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// How messages get from one process of the user to all others that listen, without a daemon: each observer listens on a
// socket of its own in the user's runtime directory, and whoever posts connects to each of them, leaves one message and
// goes. A message waits in the kernel until the observer takes it, also when the poster has ended meanwhile.
//
//     RUNTIME/kavell-accounts/observer-PID-RANDOM     one listening SOCK_SEQPACKET socket per observer
//
// A connection per message, because the kernel lets thousands of them wait for a busy observer but only a few hundred
// messages in one connection (and ten datagrams). A socket whose process is gone refuses connections and is swept away.
// Both ends check that the other is the same user. Posting: any thread; a NotificationSocket: one thread at a time.

#ifndef KAVELL_PLATFORM_NOTIFICATION_SOCKET_H
#define KAVELL_PLATFORM_NOTIFICATION_SOCKET_H

#include <string>
#include <string_view>
#include <vector>

#include "platform/file_io.h"

namespace kavell {

/// The largest message in bytes. What is larger cannot be posted.
inline constexpr size_t kLargestMessage = 64 * 1024;

/// Leaves the message with every observer. Blocks for at most 100 milliseconds, and only while an observer's queue of
/// thousands is full. Whether all observers have it.
[[nodiscard]] bool postToSockets(std::string_view message);

/// An observer's end.
class NotificationSocket {
public:
    NotificationSocket() = default;
    NotificationSocket(NotificationSocket &&) = delete;
    ~NotificationSocket();

    /// Starts to listen; false, with errno, when that cannot be done.
    [[nodiscard]] bool open();

    /// Readable when receive may have something; -1 before open.
    [[nodiscard]] int descriptor() const noexcept { return m_poll.get(); }

    /// Takes the next message that has arrived; false when there is none. Does not block.
    [[nodiscard]] bool receive(std::string &message);

private:
    enum class Taken { Message, Nothing, NotYet };

    [[nodiscard]] static Taken takeMessage(int connection, std::string &message);
    [[nodiscard]] bool receiveFromListener(std::string &message);

    FileDescriptor m_poll;
    FileDescriptor m_listener;
    /// Connections accepted before their message was there.
    std::vector<FileDescriptor> m_waiting;
    std::string m_path;
    pid_t m_owner = 0;  ///< the process that listens
};

}  // namespace kavell

#endif
