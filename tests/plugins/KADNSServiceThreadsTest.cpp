// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Many threads with the look-ups of mail hosts and the cache that they share.

#include <gmock/gmock.h>

#include <kavellaccounts/KADNSService.h>

#include "tests/support/dns_server.h"
#include "tests/support/threads.h"

using kavell::test::DnsServer;
using kavell::test::onThreads;

namespace {

constexpr int kThreads = 12;

// Each test asks about domains of its own, as the cache lives as long as the process.

QStringList serversOf(const QString &domain, bool useCache = true)
{
    const auto service = KADNSService::initWithServerAddress(domain);
    service->setUseCache(useCache);
    service->beginQuerySync();
    return service->mailServers();
}

TEST(KADNSServiceThreads, AllGetTheAnswerThatIsThenInTheCache)
{
    DnsServer server;
    server.addMailExchanger("one.threads.example", 10, "mx1.example.org");
    server.addMailExchanger("one.threads.example", 20, "mx2.example.org");
    const QStringList expected{"mx1.example.org.", "mx2.example.org."};
    onThreads(kThreads, [&](int) {
        for (int round = 0; round < 50; ++round)
            EXPECT_EQ(serversOf("one.threads.example"), expected);
    });
    // Those that asked before the first answer came asked the server, nobody afterwards.
    const int asked = server.queryCount("one.threads.example");
    EXPECT_GE(asked, 1);
    EXPECT_LE(asked, kThreads);
    EXPECT_EQ(serversOf("one.threads.example"), expected);
    EXPECT_EQ(server.queryCount("one.threads.example"), asked);
}

TEST(KADNSServiceThreads, AnswersAreKeptApart)
{
    constexpr int domains = 30;
    DnsServer server;
    const auto domain = [](int number) {
        return QStringLiteral("d%1.apart.example").arg(number);
    };
    const auto host = [](int number) {
        return QStringLiteral("mx%1.example.org").arg(number);
    };
    for (int number = 0; number < domains; ++number)
        server.addMailExchanger(domain(number).toStdString(), 10, host(number).toStdString());
    onThreads(kThreads, [&](int index) {
        for (int step = 0; step < 2 * domains; ++step) {
            const int number = (index * 7 + step) % domains;
            EXPECT_EQ(serversOf(domain(number)), QStringList{host(number) + '.'});
        }
    });
}

TEST(KADNSServiceThreads, ThoseWithTheCacheAndThoseWithoutDoNotDisturbEachOther)
{
    DnsServer server;
    server.addMailExchanger("mixed.example", 10, "mx.example.org");
    onThreads(kThreads, [&](int index) {
        for (int round = 0; round < 15; ++round) {
            EXPECT_EQ(serversOf("mixed.example", index % 2 == 0), QStringList{"mx.example.org."});
            EXPECT_EQ(serversOf("nobody.example", index % 2 == 0), QStringList());
        }
    });
    EXPECT_GE(server.queryCount("mixed.example"), kThreads / 2 * 15);
}

TEST(KADNSServiceThreads, WhatOneChangesInItsListIsNotInTheOthersOrInTheCache)
{
    DnsServer server;
    server.addMailExchanger("list.example", 10, "mx.example.org");
    onThreads(kThreads, [&](int index) {
        const QString own = QStringLiteral("own%1.example.org.").arg(index);
        for (int round = 0; round < 50; ++round) {
            const auto service = KADNSService::initWithServerAddress("list.example");
            service->beginQuerySync();
            EXPECT_EQ(service->mailServers(), QStringList{"mx.example.org."});
            service->setMailServers(service->mailServers() += own);
            EXPECT_TRUE(service->hasMailHost(own));
        }
    });
    EXPECT_EQ(serversOf("list.example"), QStringList{"mx.example.org."});
}

TEST(KADNSServiceThreads, LookUpsThatTimeOutDoNotDelayTheOthersOfTheSameMoment)
{
    DnsServer server;
    server.neverAnswer("silent.example");
    server.addMailExchanger("prompt.example", 10, "mx.example.org");
    onThreads(kThreads, [&](int index) {
        if (index % 2 == 0) {
            EXPECT_EQ(serversOf("silent.example", false), QStringList());
        } else {
            for (int round = 0; round < 5; ++round)
                EXPECT_EQ(serversOf("prompt.example", false), QStringList{"mx.example.org."});
        }
    });
}

}  // namespace
