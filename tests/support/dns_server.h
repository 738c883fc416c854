// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A name server for tests, on a free loopback port by UDP and TCP. It answers MX questions from a table, keeps a log of
// the questions, and can be told to be silent, late, cut short, or to send any bytes. While it lives, the library's
// look-ups go to it (KAVELL_DNS_SERVERS):
//
//     DnsServer server;
//     server.addMailExchanger("example.net", 10, "mx1.example.com");
//     … KADNSService of "example.net" …
//     EXPECT_EQ(server.queryCount("example.net"), 1);
//
// Names are compared in lower case, without a closing dot. One at a time; any thread may call.

#ifndef KAVELL_TESTS_SUPPORT_DNS_SERVER_H
#define KAVELL_TESTS_SUPPORT_DNS_SERVER_H

#include <chrono>
#include <cstdint>
#include <map>
#include <mutex>
#include <string>
#include <string_view>
#include <thread>
#include <vector>

namespace kavell::test {

class DnsServer {
public:
    DnsServer();
    ~DnsServer();
    DnsServer(const DnsServer &) = delete;
    DnsServer &operator=(const DnsServer &) = delete;

    /// "127.0.0.1:PORT".
    [[nodiscard]] std::string address() const;

    /// One more MX record of a domain. Dots part the host's labels; the last label is followed by the root. Names that
    /// are not in the table do not exist for the server.
    void addMailExchanger(std::string_view domain, uint16_t preference, std::string_view host);

    /// One more MX record whose data, after the preference, are these bytes.
    void addMailExchangerBytes(std::string_view domain, uint16_t preference, std::string_view wireName);

    /// The domain is an alias: its reply has a CNAME record first, and the exchangers are those of the target.
    void addAlias(std::string_view domain, std::string_view target);

    /// Exists, without any record.
    void addEmpty(std::string_view domain);

    /// The whole reply, but for its identifier, which is taken from the question.
    void setRawReply(std::string_view domain, std::string_view bytesAfterIdentifier);

    /// @name How questions about a domain are dealt with
    /// @{
    void neverAnswer(std::string_view domain);
    void delay(std::string_view domain, std::chrono::milliseconds delay);
    void truncateDatagrams(std::string_view domain);     ///< no records by UDP, all by TCP
    void flood(std::string_view domain, int datagrams);  ///< of garbage, in place of an answer
    /// @}

    /// The names asked about so far, repetitions included; those by TCP end in "/tcp".
    [[nodiscard]] std::vector<std::string> queries() const;
    [[nodiscard]] int queryCount(std::string_view domain) const;

    /// A name in wire form.
    [[nodiscard]] static std::string wireName(std::string_view name);

private:
    struct Record {
        uint16_t type;
        std::string data;
    };
    struct Entry {
        std::vector<Record> records;
        std::string alias;
        std::string rawReply;
        std::chrono::milliseconds delay{0};
        int flood = 0;
        bool silent = false;
        bool truncated = false;
    };
    struct Question {
        std::string name;
        std::string bytes;  ///< name, type and class as they were sent
    };
    struct Delayed;
    std::vector<Delayed> m_delayed;

    void run();
    void answerDatagram();
    void answerStream();
    [[nodiscard]] static bool readQuestion(std::string_view message, Question &question);
    [[nodiscard]] std::string replyTo(std::string_view message, const Question &question, const Entry *entry,
                                      bool stream) const;
    void appendRecords(std::string &reply, uint16_t &count, const Entry &entry) const;
    Entry &entry(std::string_view domain);

    int m_datagramSocket = -1;
    int m_streamSocket = -1;
    int m_stopDescriptor = -1;
    uint16_t m_port = 0;
    mutable std::mutex m_mutex;
    std::map<std::string, Entry, std::less<>> m_entries;
    std::vector<std::string> m_queries;
    std::thread m_thread;
};

}  // namespace kavell::test

#endif
