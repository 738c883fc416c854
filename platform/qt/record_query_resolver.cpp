// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Record queries through the machine's resolver configuration, one resolver channel a query.

#include <ares.h>
#include <cerrno>
#include <cstdlib>
#include <sys/socket.h>
#include <sys/uio.h>
#include <unistd.h>

#include "platform/qt/record_query_back_end.h"
#include "platform/qt/record_reply.h"

namespace kavell {

namespace {

/// After how long a server that has not answered is asked again, or the next one is: twice within the half second that
/// a caller waits. The tries together last longer than that, so that giving up is the caller's.
constexpr int kTryMilliseconds = 250;
constexpr int kTries = 3;

/// How many datagrams are read before the other queries of the queue get their turn.
constexpr int kDatagramsPerTurn = 64;

class ResolverQuery final : public RecordQueryBackEnd {
public:
    using RecordQueryBackEnd::RecordQueryBackEnd;
    ~ResolverQuery() override
    {
        cancel();
        if (m_channel)
            ares_destroy(m_channel);
    }

    [[nodiscard]] bool start(const std::string &name, uint16_t type, uint16_t recordClass);
    int appendDescriptors(std::vector<pollfd> &descriptors) override;
    void process(const pollfd *descriptors, size_t count) override;
    [[nodiscard]] bool isDone() const override { return m_answered || isCancelled(); }

private:
    [[nodiscard]] bool makeChannel();
    void take(int status, std::string_view reply);
    static void answered(void *query, int status, int timeOuts, unsigned char *reply, int length);

    static ares_socket_t openSocket(int domain, int type, int protocol, void *query);
    static int closeSocket(ares_socket_t socket, void *query);
    static int connectSocket(ares_socket_t socket, const sockaddr *address, ares_socklen_t length, void *query);
    static ares_ssize_t receive(ares_socket_t socket, void *data, size_t size, int flags, sockaddr *from,
                                ares_socklen_t *length, void *query);
    static ares_ssize_t send(ares_socket_t socket, const iovec *pieces, int count, void *query);

    ares_channel m_channel = nullptr;
    std::string m_name;
    uint16_t m_type = 0;
    uint16_t m_class = 0;
    int m_datagramsLeft = kDatagramsPerTurn;
    bool m_asked = false;
    bool m_answered = false;
};

bool ResolverQuery::makeChannel()
{
    ares_options options{};
    options.timeout = kTryMilliseconds;
    options.tries = kTries;
    if (ares_init_options(&m_channel, &options, ARES_OPT_TIMEOUTMS | ARES_OPT_TRIES) != ARES_SUCCESS) {
        m_channel = nullptr;
        return false;
    }
    static constexpr ares_socket_functions functions = {openSocket, closeSocket, connectSocket, receive, send};
    ares_set_socket_functions(m_channel, &functions, this);
    const char *servers = secure_getenv("KAVELL_DNS_SERVERS");
    return !servers || ares_set_servers_ports_csv(m_channel, servers) == ARES_SUCCESS;
}

bool ResolverQuery::start(const std::string &name, uint16_t type, uint16_t recordClass)
{
    m_name = name;
    m_type = type;
    m_class = recordClass;
    return makeChannel();
}

int ResolverQuery::appendDescriptors(std::vector<pollfd> &descriptors)
{
    if (isDone())
        return -1;
    if (!m_asked) {
        // Here and not in start, so that an answer that needs no server comes on the queue's thread as well.
        m_asked = true;
        ares_query(m_channel, m_name.c_str(), m_class, m_type, answered, this);
        if (isDone())
            return 0;
    }
    ares_socket_t sockets[ARES_GETSOCK_MAXNUM];
    const int directions = ares_getsock(m_channel, sockets, ARES_GETSOCK_MAXNUM);
    for (int index = 0; index < ARES_GETSOCK_MAXNUM; ++index) {
        const int events = (ARES_GETSOCK_READABLE(directions, index) ? POLLIN : 0) |
                           (ARES_GETSOCK_WRITABLE(directions, index) ? POLLOUT : 0);
        if (events != 0)
            descriptors.push_back({sockets[index], static_cast<short>(events), 0});
    }
    timeval left{};
    if (!ares_timeout(m_channel, nullptr, &left))
        return -1;
    return static_cast<int>(left.tv_sec * 1000 + (left.tv_usec + 999) / 1000);
}

void ResolverQuery::process(const pollfd *descriptors, size_t count)
{
    m_datagramsLeft = kDatagramsPerTurn;
    constexpr int readable = POLLIN | POLLHUP | POLLERR;
    for (size_t index = 0; index < count && !isDone(); ++index) {
        const pollfd &one = descriptors[index];
        if (one.revents != 0)
            ares_process_fd(m_channel, one.revents & readable ? one.fd : ARES_SOCKET_BAD,
                            one.revents & POLLOUT ? one.fd : ARES_SOCKET_BAD);
    }
    if (!isDone())
        ares_process_fd(m_channel, ARES_SOCKET_BAD, ARES_SOCKET_BAD);  // what has timed out
}

void ResolverQuery::answered(void *query, int status, int, unsigned char *reply, int length)
{
    const std::string_view bytes(reinterpret_cast<const char *>(reply), reply ? static_cast<size_t>(length) : 0);
    static_cast<ResolverQuery *>(query)->take(status, bytes);
}

void ResolverQuery::take(int status, std::string_view reply)
{
    m_answered = true;
    RecordAnswer answer;
    answer.fullName = m_name;
    answer.type = m_type;
    answer.recordClass = m_class;
    const auto records = status == ARES_SUCCESS ? recordsOfReply(reply, m_type, m_class) : std::vector<ReplyRecord>();
    if (records.empty()) {
        answer.error = status == ARES_ENOTFOUND                           ? kRecordNoSuchName
                       : status == ARES_SUCCESS || status == ARES_ENODATA ? kRecordNoSuchRecord
                                                                          : kRecordUnknownError;
        deliver(answer);
        return;
    }
    for (const ReplyRecord &record : records) {
        answer.flags = kRecordAdded | (&record == &records.back() ? 0 : kRecordMoreComing);
        answer.data = record.data;
        answer.timeToLive = record.timeToLive;
        deliver(answer);
    }
}

ares_socket_t ResolverQuery::openSocket(int domain, int type, int protocol, void *)
{
    return socket(domain, type | SOCK_NONBLOCK | SOCK_CLOEXEC, protocol);
}

int ResolverQuery::closeSocket(ares_socket_t socket, void *)
{
    return close(socket);
}

int ResolverQuery::connectSocket(ares_socket_t socket, const sockaddr *address, ares_socklen_t length, void *)
{
    return connect(socket, address, length);
}

ares_ssize_t ResolverQuery::receive(ares_socket_t socket, void *data, size_t size, int flags, sockaddr *from,
                                    ares_socklen_t *length, void *query)
{
    // The resolver library reads for as long as something comes.
    auto *self = static_cast<ResolverQuery *>(query);
    if (self->isCancelled() || self->m_datagramsLeft-- <= 0) {
        errno = EAGAIN;
        return -1;
    }
    return recvfrom(socket, data, size, flags, from, length);
}

ares_ssize_t ResolverQuery::send(ares_socket_t socket, const iovec *pieces, int count, void *)
{
    // By sendmsg, which can be told not to raise SIGPIPE in the host program when a server hangs up.
    msghdr message{};
    message.msg_iov = const_cast<iovec *>(pieces);
    message.msg_iovlen = static_cast<size_t>(count);
    return sendmsg(socket, &message, MSG_NOSIGNAL);
}

}  // namespace

std::shared_ptr<RecordQueryBackEnd> makeResolverQuery(const std::string &name, uint16_t type, uint16_t recordClass,
                                                      RecordCallback callback)
{
    auto query = std::make_shared<ResolverQuery>(std::move(callback));
    if (!query->start(name, type, recordClass))
        return nullptr;
    return query;
}

}  // namespace kavell
