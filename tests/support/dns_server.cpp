// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tests/support/dns_server.h"

#include <algorithm>
#include <arpa/inet.h>
#include <array>
#include <cctype>
#include <cstdlib>
#include <netinet/in.h>
#include <poll.h>
#include <stdexcept>
#include <sys/eventfd.h>
#include <sys/socket.h>
#include <unistd.h>

namespace kavell::test {

namespace {

using Clock = std::chrono::steady_clock;

constexpr size_t kHeaderBytes = 12;
constexpr uint16_t kTypeCNAME = 5;
constexpr uint16_t kTypeMX = 15;
constexpr uint16_t kClassIN = 1;
constexpr uint16_t kResponse = 0x8180;
constexpr uint16_t kTruncated = 0x0200;
constexpr uint16_t kNoSuchName = 3;
constexpr uint16_t kPointerToQuestion = 0xC000 + kHeaderBytes;

std::string number16(unsigned value)
{
    return {static_cast<char>(value >> 8), static_cast<char>(value)};
}

std::string recordBytes(uint16_t type, std::string_view data)
{
    std::string bytes = number16(kPointerToQuestion) + number16(type) + number16(kClassIN);
    bytes += number16(0) + number16(300) + number16(static_cast<unsigned>(data.size()));
    return bytes.append(data);
}

std::string plainName(std::string_view name)
{
    if (name.ends_with('.'))
        name.remove_suffix(1);
    std::string plain(name);
    std::transform(plain.begin(), plain.end(), plain.begin(), [](unsigned char c) { return std::tolower(c); });
    return plain;
}

/// A loopback socket on the port (0: any); negative when the port is taken.
int boundSocket(int type, uint16_t port)
{
    const int descriptor = socket(AF_INET, type | SOCK_CLOEXEC, 0);
    sockaddr_in address{};
    address.sin_family = AF_INET;
    address.sin_port = htons(port);
    address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
    if (bind(descriptor, reinterpret_cast<const sockaddr *>(&address), sizeof address) == 0)
        return descriptor;
    close(descriptor);
    return -1;
}

uint16_t portOf(int descriptor)
{
    sockaddr_in address{};
    socklen_t length = sizeof address;
    getsockname(descriptor, reinterpret_cast<sockaddr *>(&address), &length);
    return ntohs(address.sin_port);
}

}  // namespace

struct DnsServer::Delayed {
    Clock::time_point due;
    sockaddr_in to;
    std::string reply;
};

DnsServer::DnsServer()
{
    // A port that is free for datagrams can be taken for streams.
    for (int attempt = 0; attempt < 100 && m_streamSocket < 0; ++attempt) {
        if (m_datagramSocket >= 0)
            close(m_datagramSocket);
        m_datagramSocket = boundSocket(SOCK_DGRAM, 0);
        m_port = portOf(m_datagramSocket);
        m_streamSocket = boundSocket(SOCK_STREAM, m_port);
    }
    if (m_streamSocket < 0 || listen(m_streamSocket, 16) != 0)
        throw std::runtime_error("no free loopback port");
    m_stopDescriptor = eventfd(0, EFD_CLOEXEC);
    setenv("KAVELL_DNS_SERVERS", address().c_str(), 1);
    m_thread = std::thread(&DnsServer::run, this);
}

DnsServer::~DnsServer()
{
    eventfd_write(m_stopDescriptor, 1);
    m_thread.join();
    unsetenv("KAVELL_DNS_SERVERS");
    for (const int descriptor : {m_datagramSocket, m_streamSocket, m_stopDescriptor})
        close(descriptor);
}

std::string DnsServer::address() const
{
    return "127.0.0.1:" + std::to_string(m_port);
}

DnsServer::Entry &DnsServer::entry(std::string_view domain)
{
    return m_entries[plainName(domain)];
}

std::string DnsServer::wireName(std::string_view name)
{
    std::string wire;
    while (!name.empty()) {
        const std::string_view label = name.substr(0, name.find('.'));
        wire += static_cast<char>(label.size());
        wire.append(label);
        name.remove_prefix(std::min(label.size() + 1, name.size()));
    }
    return wire + '\0';
}

void DnsServer::addMailExchanger(std::string_view domain, uint16_t preference, std::string_view host)
{
    addMailExchangerBytes(domain, preference, wireName(host));
}

void DnsServer::addMailExchangerBytes(std::string_view domain, uint16_t preference, std::string_view wire)
{
    const std::lock_guard lock(m_mutex);
    entry(domain).records.push_back({kTypeMX, number16(preference).append(wire)});
}

void DnsServer::addAlias(std::string_view domain, std::string_view target)
{
    const std::lock_guard lock(m_mutex);
    entry(domain).alias = plainName(target);
}

void DnsServer::addEmpty(std::string_view domain)
{
    const std::lock_guard lock(m_mutex);
    entry(domain);
}

void DnsServer::setRawReply(std::string_view domain, std::string_view bytesAfterIdentifier)
{
    const std::lock_guard lock(m_mutex);
    entry(domain).rawReply = bytesAfterIdentifier;
}

void DnsServer::neverAnswer(std::string_view domain)
{
    const std::lock_guard lock(m_mutex);
    entry(domain).silent = true;
}

void DnsServer::delay(std::string_view domain, std::chrono::milliseconds delay)
{
    const std::lock_guard lock(m_mutex);
    entry(domain).delay = delay;
}

void DnsServer::truncateDatagrams(std::string_view domain)
{
    const std::lock_guard lock(m_mutex);
    entry(domain).truncated = true;
}

void DnsServer::flood(std::string_view domain, int datagrams)
{
    const std::lock_guard lock(m_mutex);
    entry(domain).flood = datagrams;
}

std::vector<std::string> DnsServer::queries() const
{
    const std::lock_guard lock(m_mutex);
    return m_queries;
}

int DnsServer::queryCount(std::string_view domain) const
{
    const std::lock_guard lock(m_mutex);
    const std::string name = plainName(domain);
    return static_cast<int>(std::count(m_queries.begin(), m_queries.end(), name) +
                            std::count(m_queries.begin(), m_queries.end(), name + "/tcp"));
}

bool DnsServer::readQuestion(std::string_view message, Question &question)
{
    size_t at = kHeaderBytes;
    while (at < message.size() && message[at] != 0) {
        const size_t length = static_cast<unsigned char>(message[at]);
        question.name.append(question.name.empty() ? "" : ".").append(message.substr(at + 1, length));
        at += 1 + length;
    }
    if (at + 5 > message.size())
        return false;
    question.name = plainName(question.name);
    question.bytes = message.substr(kHeaderBytes, at + 5 - kHeaderBytes);
    return true;
}

void DnsServer::appendRecords(std::string &reply, uint16_t &count, const Entry &entry) const
{
    if (!entry.alias.empty()) {
        reply += recordBytes(kTypeCNAME, wireName(entry.alias));
        ++count;
        if (const auto target = m_entries.find(entry.alias); target != m_entries.end())
            appendRecords(reply, count, target->second);
    }
    for (const Record &record : entry.records) {
        reply += recordBytes(record.type, record.data);
        ++count;
    }
}

std::string DnsServer::replyTo(std::string_view message, const Question &question, const Entry *entry,
                               bool stream) const
{
    const std::string identifier(message.substr(0, 2));
    if (entry && !entry->rawReply.empty())
        return identifier + entry->rawReply;
    std::string records;
    uint16_t count = 0;
    const bool truncated = entry && entry->truncated && !stream;
    if (entry && !truncated)
        appendRecords(records, count, *entry);
    const unsigned flags = kResponse | (truncated ? kTruncated : 0U) | (entry ? 0U : kNoSuchName);
    return identifier + number16(flags) + number16(1) + number16(count) + number16(0) + number16(0) + question.bytes +
           records;
}

void DnsServer::answerDatagram()
{
    std::array<char, 1500> buffer{};
    sockaddr_in from{};
    socklen_t length = sizeof from;
    const ssize_t received =
        recvfrom(m_datagramSocket, buffer.data(), buffer.size(), 0, reinterpret_cast<sockaddr *>(&from), &length);
    Question question;
    const std::string_view message(buffer.data(), static_cast<size_t>(std::max<ssize_t>(received, 0)));
    if (!readQuestion(message, question))
        return;
    const std::lock_guard lock(m_mutex);
    m_queries.push_back(question.name);
    const auto found = m_entries.find(question.name);
    const Entry *entry = found == m_entries.end() ? nullptr : &found->second;
    if (entry && entry->silent)
        return;
    for (int sent = 0; entry && sent < entry->flood; ++sent)
        sendto(m_datagramSocket, buffer.data() + 2, 40, 0, reinterpret_cast<const sockaddr *>(&from), length);
    if (entry && entry->flood > 0)
        return;
    const auto delay = entry ? entry->delay : std::chrono::milliseconds(0);
    m_delayed.push_back({Clock::now() + delay, from, replyTo(message, question, entry, false)});
}

void DnsServer::answerStream()
{
    const int connection = accept4(m_streamSocket, nullptr, nullptr, SOCK_CLOEXEC);
    if (connection < 0)
        return;
    const timeval bound{1, 0};
    setsockopt(connection, SOL_SOCKET, SO_RCVTIMEO, &bound, sizeof bound);
    std::array<char, 1500> buffer{};
    size_t received = 0;
    while (received < 2 ||
           received < 2U + static_cast<unsigned char>(buffer[0]) * 256U + static_cast<unsigned char>(buffer[1])) {
        const ssize_t more = recv(connection, buffer.data() + received, buffer.size() - received, 0);
        if (more <= 0)
            break;
        received += static_cast<size_t>(more);
    }
    Question question;
    const std::string_view message = std::string_view(buffer.data(), received).substr(std::min<size_t>(2, received));
    if (readQuestion(message, question)) {
        const std::lock_guard lock(m_mutex);
        m_queries.push_back(question.name + "/tcp");
        const auto found = m_entries.find(question.name);
        const std::string reply = replyTo(message, question, found == m_entries.end() ? nullptr : &found->second, true);
        const std::string framed = number16(static_cast<unsigned>(reply.size())) + reply;
        send(connection, framed.data(), framed.size(), MSG_NOSIGNAL);
    }
    close(connection);
}

void DnsServer::run()
{
    for (;;) {
        int timeOut = -1;
        {
            const std::lock_guard lock(m_mutex);
            const auto now = Clock::now();
            std::erase_if(m_delayed, [&](const Delayed &one) {
                if (one.due > now) {
                    const auto left = std::chrono::ceil<std::chrono::milliseconds>(one.due - now).count();
                    timeOut = timeOut < 0 ? static_cast<int>(left) : std::min(timeOut, static_cast<int>(left));
                    return false;
                }
                sendto(m_datagramSocket, one.reply.data(), one.reply.size(), 0,
                       reinterpret_cast<const sockaddr *>(&one.to), sizeof one.to);
                return true;
            });
        }
        std::array<pollfd, 3> descriptors = {
            {{m_stopDescriptor, POLLIN, 0}, {m_datagramSocket, POLLIN, 0}, {m_streamSocket, POLLIN, 0}}};
        if (poll(descriptors.data(), descriptors.size(), timeOut) < 0)
            continue;
        if (descriptors[0].revents)
            return;
        if (descriptors[1].revents)
            answerDatagram();
        if (descriptors[2].revents)
            answerStream();
    }
}

}  // namespace kavell::test
