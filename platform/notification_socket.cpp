// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/notification_socket.h"

#include <array>
#include <chrono>
#include <cstdio>
#include <cstring>
#include <dirent.h>
#include <fcntl.h>
#include <memory>
#include <sys/epoll.h>
#include <sys/random.h>
#include <sys/socket.h>
#include <sys/stat.h>
#include <sys/un.h>
#include <thread>

#include "platform/home_directory.h"

namespace kavell {

namespace {

constexpr std::string_view kDirectoryName = "/kavell-accounts";
constexpr std::string_view kObserverPrefix = "observer-";
constexpr auto kLongestPost = std::chrono::milliseconds(90);
constexpr auto kRetryPause = std::chrono::milliseconds(1);
constexpr size_t kMostWaiting = 256;

using Clock = std::chrono::steady_clock;

/// The directory where observers and posters meet; empty, with errno, when there is none.
std::string meetingDirectory()
{
    std::string directory = runtimeDirectory();
    if (!directory.empty())
        directory += kDirectoryName;
    return directory;
}

/// The address of a socket in an open directory. Through the descriptor, because an address has room for 107 bytes only
/// and a runtime directory may be longer.
sockaddr_un addressIn(int directory, const char *name) noexcept
{
    sockaddr_un address{};
    address.sun_family = AF_UNIX;
    std::snprintf(address.sun_path, sizeof address.sun_path, "/proc/self/fd/%d/%.70s", directory, name);
    return address;
}

bool isSameUser(int connection) noexcept
{
    ucred peer{};
    socklen_t length = sizeof peer;
    return getsockopt(connection, SOL_SOCKET, SO_PEERCRED, &peer, &length) == 0 && peer.uid == geteuid();
}

enum class Delivery { Done, Full, Gone };

/// Tries once to leave the message with one observer.
Delivery deliver(int directory, const char *name, std::string_view message) noexcept
{
    const FileDescriptor connection(socket(AF_UNIX, SOCK_SEQPACKET | SOCK_NONBLOCK | SOCK_CLOEXEC, 0));
    const sockaddr_un address = addressIn(directory, name);
    const int connected = withoutInterruption(
        [&] { return connect(connection.get(), reinterpret_cast<const sockaddr *>(&address), sizeof address); });
    if (connected != 0)
        return errno == ECONNREFUSED || errno == ENOENT ? Delivery::Gone : Delivery::Full;
    // Somebody else's socket in this directory is nobody's observer.
    if (!isSameUser(connection.get()))
        return Delivery::Done;
    const ssize_t sent = withoutInterruption(
        [&] { return send(connection.get(), message.data(), message.size(), MSG_NOSIGNAL | MSG_DONTWAIT); });
    return sent == static_cast<ssize_t>(message.size()) || errno == EPIPE || errno == ECONNRESET ? Delivery::Done
                                                                                                 : Delivery::Full;
}

/// Tries until the observer has the message or the deadline has passed; sweeps away a socket that nobody listens on.
bool deliverBefore(Clock::time_point deadline, int directory, const char *name, std::string_view message)
{
    for (;;) {
        const Delivery delivery = deliver(directory, name, message);
        if (delivery == Delivery::Gone)
            unlinkat(directory, name, 0);
        if (delivery != Delivery::Full)
            return true;
        if (Clock::now() >= deadline)
            return false;
        std::this_thread::sleep_for(kRetryPause);
    }
}

struct DirectoryCloser {
    void operator()(DIR *directory) const noexcept { closedir(directory); }
};

/// A name that no observer had before, so that a poster that sweeps a dead one's away cannot hit a living one.
std::string uniqueName()
{
    uint64_t random = 0;
    if (getrandom(&random, sizeof random, 0) != sizeof random)
        random = static_cast<uint64_t>(Clock::now().time_since_epoch().count());
    std::array<char, 64> name;
    std::snprintf(name.data(), name.size(), "observer-%d-%016llx", getpid(), static_cast<unsigned long long>(random));
    return name.data();
}

bool watch(int poll, int descriptor) noexcept
{
    epoll_event event{};
    event.events = EPOLLIN;
    event.data.fd = descriptor;
    return epoll_ctl(poll, EPOLL_CTL_ADD, descriptor, &event) == 0;
}

}  // namespace

bool postToSockets(std::string_view message)
{
    if (message.size() > kLargestMessage)
        return false;
    const std::string path = meetingDirectory();
    const std::unique_ptr<DIR, DirectoryCloser> directory(path.empty() ? nullptr : opendir(path.c_str()));
    // Where nobody has ever observed there is no directory, and all of nobody has the message.
    if (!directory)
        return path.empty() || errno == ENOENT;
    const auto deadline = Clock::now() + kLongestPost;
    bool hasAll = true;
    while (const dirent *entry = readdir(directory.get())) {
        if (std::string_view(entry->d_name).starts_with(kObserverPrefix))
            hasAll = deliverBefore(deadline, dirfd(directory.get()), entry->d_name, message) && hasAll;
    }
    return hasAll;
}

NotificationSocket::~NotificationSocket()
{
    // A forked child has a copy of this object, but the socket is its parent's.
    if (!m_path.empty() && m_owner == getpid())
        unlink(m_path.c_str());
}

bool NotificationSocket::open()
{
    const std::string path = meetingDirectory();
    if (path.empty() || (mkdir(path.c_str(), 0700) != 0 && errno != EEXIST))
        return false;
    const FileDescriptor directory(::open(path.c_str(), O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC));
    m_listener = FileDescriptor(socket(AF_UNIX, SOCK_SEQPACKET | SOCK_NONBLOCK | SOCK_CLOEXEC, 0));
    m_poll = FileDescriptor(epoll_create1(EPOLL_CLOEXEC));
    if (!directory || !m_listener || !m_poll)
        return false;
    const std::string name = uniqueName(), hiddenName = "." + name;
    const sockaddr_un address = addressIn(directory.get(), hiddenName.c_str());
    // The name appears only when the socket listens: until then a poster would take it for a dead one.
    const bool isListening =
        bind(m_listener.get(), reinterpret_cast<const sockaddr *>(&address), sizeof address) == 0 &&
        listen(m_listener.get(), SOMAXCONN) == 0 && watch(m_poll.get(), m_listener.get());
    if (!isListening || renameat(directory.get(), hiddenName.c_str(), directory.get(), name.c_str()) != 0) {
        unlinkat(directory.get(), hiddenName.c_str(), 0);
        return false;
    }
    m_path = path + "/" + name;
    m_owner = getpid();
    return true;
}

NotificationSocket::Taken NotificationSocket::takeMessage(int connection, std::string &message)
{
    message.resize(kLargestMessage);
    const ssize_t length =
        withoutInterruption([&] { return recv(connection, message.data(), message.size(), MSG_DONTWAIT | MSG_TRUNC); });
    if (length < 0 && (errno == EAGAIN || errno == EWOULDBLOCK))
        return Taken::NotYet;
    if (length <= 0 || length > static_cast<ssize_t>(kLargestMessage))
        return Taken::Nothing;
    message.resize(static_cast<size_t>(length));
    return Taken::Message;
}

bool NotificationSocket::receiveFromListener(std::string &message)
{
    for (;;) {
        FileDescriptor connection(withoutInterruption(
            [&] { return accept4(m_listener.get(), nullptr, nullptr, SOCK_CLOEXEC | SOCK_NONBLOCK); }));
        if (!connection)
            return false;
        if (!isSameUser(connection.get()))
            continue;
        const Taken taken = takeMessage(connection.get(), message);
        if (taken == Taken::Message)
            return true;
        // A poster between its connect and its send; the message comes, and the descriptor is then readable.
        if (taken != Taken::NotYet || !watch(m_poll.get(), connection.get()))
            continue;
        // Whoever has kept silent for so long will not speak any more.
        if (m_waiting.size() >= kMostWaiting)
            m_waiting.erase(m_waiting.begin());
        m_waiting.push_back(std::move(connection));
    }
}

bool NotificationSocket::receive(std::string &message)
{
    // Connections that came earlier go first.
    for (auto connection = m_waiting.begin(); connection != m_waiting.end();) {
        const Taken taken = takeMessage(connection->get(), message);
        if (taken == Taken::NotYet) {
            ++connection;
            continue;
        }
        connection = m_waiting.erase(connection);
        if (taken == Taken::Message)
            return true;
    }
    return m_listener && receiveFromListener(message);
}

}  // namespace kavell
