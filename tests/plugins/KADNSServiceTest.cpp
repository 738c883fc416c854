// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KADNSService.h>

#include <atomic>
#include <chrono>
#include <cstdlib>
#include <memory>
#include <sys/socket.h>
#include <sys/un.h>
#include <thread>
#include <unistd.h>
#include <vector>

#include <QtCore/QDir>

#include <gtest/gtest.h>

#include <kavellaccounts/KAFieldList.h>

#include "platform/qt/query_queue.h"
#include "tests/support/dns_server.h"
#include "tests/support/log_capture.h"

using namespace std::chrono_literals;
using kavell::test::DnsServer;

namespace {

using Clock = std::chrono::steady_clock;

std::shared_ptr<KADNSService> asked(const QString &domain, bool useCache = true)
{
    auto service = KADNSService::initWithServerAddress(domain);
    service->setUseCache(useCache);
    service->beginQuerySync();
    return service;
}

/// How long a look-up of the domain blocks its caller.
std::chrono::milliseconds blockingTime(const QString &domain)
{
    const auto service = KADNSService::initWithServerAddress(domain);
    const auto begin = Clock::now();
    service->beginQuerySync();
    return std::chrono::duration_cast<std::chrono::milliseconds>(Clock::now() - begin);
}

// Each test asks about domains of its own, as the cache lives as long as the process.

TEST(KADNSServiceTest, ANewObjectHasItsDomainAnEmptyListACacheAndASemaphore)
{
    const auto service = KADNSService::initWithServerAddress("Fresh.Example");
    EXPECT_EQ(service->serverAddress(), "Fresh.Example");
    EXPECT_TRUE(service->mailServers().isEmpty());
    EXPECT_TRUE(service->useCache());
    ASSERT_TRUE(service->semaphore());
    EXPECT_EQ(service->semaphore()->available(), 0);
}

TEST(KADNSServiceTest, TheExchangersAreListedInTheOrderOfArrivalWithAClosingDot)
{
    DnsServer server;
    server.addMailExchanger("order.example", 20, "b.mx.example");
    server.addMailExchanger("order.example", 10, "a.mx.example");
    EXPECT_EQ(asked("order.example")->mailServers(), QStringList({"b.mx.example.", "a.mx.example."}));
}

TEST(KADNSServiceTest, ExchangersAreLowerCasedAndListedOnce)
{
    DnsServer server;
    server.addMailExchanger("twice.example", 10, "MX.Example.ORG");
    server.addMailExchanger("twice.example", 20, "mx.example.org");
    EXPECT_EQ(asked("twice.example")->mailServers(), QStringList({"mx.example.org."}));
}

TEST(KADNSServiceTest, TheQueryConsumesTheSemaphore)
{
    DnsServer server;
    EXPECT_FALSE(asked("semaphore.example")->semaphore());
}

TEST(KADNSServiceTest, ADomainOfOneLabelIsNeitherAskedAboutNorCached)
{
    DnsServer server;
    for (const char *domain : {"localhost", ""})
        EXPECT_TRUE(asked(domain)->semaphore()) << domain;
    EXPECT_TRUE(asked(QString())->mailServers().isEmpty());
    EXPECT_TRUE(server.queries().empty());
}

TEST(KADNSServiceTest, ASecondObjectTakesTheFirstOnesResultWithoutAQuery)
{
    DnsServer server;
    server.addMailExchanger("cached.example", 10, "mx.example.org");
    const QStringList first = asked("cached.example")->mailServers();
    const QStringList second = asked("cached.example")->mailServers();
    EXPECT_EQ(second, QStringList({"mx.example.org."}));
    EXPECT_EQ(first.constData(), second.constData());
    EXPECT_EQ(server.queryCount("cached.example"), 1);
}

TEST(KADNSServiceTest, AnAnswerFromTheCacheLeavesTheSemaphore)
{
    DnsServer server;
    static_cast<void>(asked("untouched.example"));
    EXPECT_TRUE(asked("untouched.example")->semaphore());
}

TEST(KADNSServiceTest, ADomainOfTwoPartsIsAskedAboutEvenWhenOneIsEmpty)
{
    DnsServer server;
    server.addMailExchanger("single", 10, "mx.example.org");
    EXPECT_EQ(asked("single.")->mailServers(), QStringList({"mx.example.org."}));
}

TEST(KADNSServiceTest, TheListGivenToAnObjectIsReplacedByTheCachesAndAddedToByAnswers)
{
    DnsServer server;
    server.addMailExchanger("given.example", 10, "mx.example.org");
    const auto service = KADNSService::initWithServerAddress("given.example");
    service->setMailServers({"kept.example.org."});
    service->setUseCache(false);
    service->beginQuerySync();
    EXPECT_EQ(service->mailServers(), QStringList({"kept.example.org.", "mx.example.org."}));
    static_cast<void>(asked("given.example"));
    const auto cached = KADNSService::initWithServerAddress("given.example");
    cached->setMailServers({"kept.example.org."});
    cached->beginQuerySync();
    EXPECT_EQ(cached->mailServers(), QStringList({"mx.example.org."}));
}

TEST(KADNSServiceTest, TheFieldsAreDescribedInTheirOrder)
{
    const auto service = KADNSService::initWithServerAddress("fields.example");
    KAFieldList fields;
    service->describeFields(fields);
    QStringList names;
    for (const KAField &field : fields.fields())
        names += field.name;
    EXPECT_EQ(names, QStringList({"_serverAddress", "_mailServers", "_semaphore", "_useCache"}));
}

TEST(KADNSServiceTest, TheCacheTellsSpellingsOfADomainApart)
{
    DnsServer server;
    server.addMailExchanger("spelt.example", 10, "mx.example.org");
    EXPECT_EQ(asked("spelt.example")->mailServers().size(), 1);
    EXPECT_EQ(asked("Spelt.Example")->mailServers().size(), 1);
    EXPECT_EQ(server.queryCount("spelt.example"), 2);
}

TEST(KADNSServiceTest, AnEmptyResultIsCached)
{
    DnsServer server;
    EXPECT_TRUE(asked("absent.example")->mailServers().isEmpty());
    server.addMailExchanger("absent.example", 10, "mx.example.org");
    EXPECT_TRUE(asked("absent.example")->mailServers().isEmpty());
    EXPECT_EQ(server.queryCount("absent.example"), 1);
}

TEST(KADNSServiceTest, ASilentServerIsWaitedForHalfASecondAndNeverAgain)
{
    DnsServer server;
    server.neverAnswer("silent.example");
    const auto time = blockingTime("silent.example");
    EXPECT_GE(time, 499ms);
    EXPECT_LE(time, 550ms);
    const int queries = server.queryCount("silent.example");
    EXPECT_LE(blockingTime("silent.example"), 50ms);
    EXPECT_EQ(server.queryCount("silent.example"), queries);
}

TEST(KADNSServiceTest, AFloodOfGarbageDoesNotStretchTheTimeLimit)
{
    DnsServer server;
    server.flood("flood.example", 200000);
    EXPECT_LE(blockingTime("flood.example"), 550ms);
}

TEST(KADNSServiceTest, AServerThatDiesMeanwhileIsWaitedForNoLongerThanTheLimit)
{
    auto server = std::make_unique<DnsServer>();
    server->neverAnswer("dies.example");
    std::thread killer([&] {
        while (server->queryCount("dies.example") == 0)
            std::this_thread::sleep_for(1ms);
        server.reset();
    });
    EXPECT_LE(blockingTime("dies.example"), 550ms);
    killer.join();
}

TEST(KADNSServiceTest, ALateAnswerWithinTheLimitCounts)
{
    DnsServer server;
    server.addMailExchanger("late.example", 10, "mx.example.org");
    server.delay("late.example", 300ms);
    EXPECT_EQ(asked("late.example")->mailServers(), QStringList({"mx.example.org."}));
}

TEST(KADNSServiceTest, AnAnswerAfterTheLimitIsNeitherTakenNorCached)
{
    DnsServer server;
    server.addMailExchanger("toolate.example", 10, "mx.example.org");
    server.delay("toolate.example", 700ms);
    server.addMailExchanger("meanwhile.example", 10, "mx.example.org");
    server.delay("meanwhile.example", 400ms);
    const auto service = asked("toolate.example");
    EXPECT_EQ(asked("meanwhile.example")->mailServers().size(), 1);
    EXPECT_TRUE(service->mailServers().isEmpty());
    EXPECT_TRUE(asked("toolate.example")->mailServers().isEmpty());
}

TEST(KADNSServiceTest, AMachineWithoutAResolverHoldsTheTimeLimit)
{
    setenv("KAVELL_DNS_SERVERS", "127.0.0.1:1", 1);
    EXPECT_LE(blockingTime("nobody.example"), 550ms);
    unsetenv("KAVELL_DNS_SERVERS");
}

TEST(KADNSServiceTest, WithoutTheCacheItIsNeitherReadNorWritten)
{
    DnsServer server;
    server.addMailExchanger("uncached.example", 10, "mx.example.org");
    EXPECT_EQ(asked("uncached.example", false)->mailServers().size(), 1);
    EXPECT_EQ(asked("uncached.example", true)->mailServers().size(), 1);
    EXPECT_EQ(asked("uncached.example", false)->mailServers().size(), 1);
    EXPECT_EQ(server.queryCount("uncached.example"), 3);
}

TEST(KADNSServiceTest, AQueryThatCannotBeAskedIsSilentAndItsEmptyResultCached)
{
    const auto time = [] {
        const kavell::test::LogCapture log;
        setenv("KAVELL_DNS_SERVERS", "no.address.of.a.server", 1);
        const auto taken = blockingTime("unaskable.example");
        unsetenv("KAVELL_DNS_SERVERS");
        EXPECT_TRUE(log.messages().isEmpty());
        return taken;
    }();
    EXPECT_LT(time, 400ms);
    DnsServer server;
    server.addMailExchanger("unaskable.example", 10, "mx.example.org");
    EXPECT_TRUE(asked("unaskable.example")->mailServers().isEmpty());
    EXPECT_TRUE(server.queries().empty());
    EXPECT_EQ(asked("unaskable.example", false)->mailServers(), QStringList({"mx.example.org."}));
}

TEST(KADNSServiceTest, AFailureToAttachIsLoggedAndItsEmptyResultCached)
{
    DnsServer server;
    server.addMailExchanger("unattached.example", 10, "mx.example.org");
    kavell::QueryQueue::shared().failAdditionsWith(-65540);
    {
        const kavell::test::LogCapture log;
        EXPECT_TRUE(asked("unattached.example")->mailServers().isEmpty());
        EXPECT_EQ(log.messages(), QStringList({"*** DNSServiceSetDispatchQueue returned error -65540"}));
    }
    kavell::QueryQueue::shared().failAdditionsWith(0);
    EXPECT_TRUE(asked("unattached.example")->mailServers().isEmpty());
    EXPECT_TRUE(server.queries().empty());
}

TEST(KADNSServiceTest, TheExchangersOfAnAliasAreFound)
{
    DnsServer server;
    server.addAlias("alias.example", "target.example");
    server.addMailExchanger("target.example", 10, "mx.example.org");
    EXPECT_EQ(asked("alias.example")->mailServers(), QStringList({"mx.example.org."}));
}

TEST(KADNSServiceTest, CompressedNamesAreExpanded)
{
    DnsServer server;
    // "mail" and a pointer to the question's name, at offset 12.
    server.addMailExchangerBytes("packed.example", 10, std::string("\4mail\xC0\x0C", 7));
    EXPECT_EQ(asked("packed.example")->mailServers(), QStringList({"mail.packed.example."}));
}

TEST(KADNSServiceTest, ATruncatedReplyIsAskedForAgainByStream)
{
    DnsServer server;
    server.truncateDatagrams("long.example");
    server.addMailExchanger("long.example", 10, "mx.example.org");
    EXPECT_EQ(asked("long.example")->mailServers(), QStringList({"mx.example.org."}));
    EXPECT_EQ(server.queries(), (std::vector<std::string>{"long.example", "long.example/tcp"}));
}

TEST(KADNSServiceTest, ADotWithinALabelIsEscaped)
{
    DnsServer server;
    server.addMailExchangerBytes("dotted.example", 10, std::string("\3a.b\3org\0", 9));
    EXPECT_EQ(asked("dotted.example")->mailServers(), QStringList({"a\\.b.org."}));
}

TEST(KADNSServiceTest, BrokenNamesAddNoServer)
{
    DnsServer server;
    const std::string selfPointer("\xC0\x2E", 2);  // the first record's name is at offset 46
    server.addMailExchangerBytes("broken.example", 10, selfPointer);
    server.addMailExchangerBytes("broken.example", 10, std::string("\x7F", 1) + std::string(127, 'a') + '\0');
    server.addMailExchangerBytes("broken.example", 10, std::string("\3abc", 4));
    server.addMailExchangerBytes("broken.example", 10, std::string("\2\xC3\x28\0", 4));
    server.addMailExchanger("broken.example", 10, "good.example.org");
    EXPECT_EQ(asked("broken.example")->mailServers(), QStringList({"good.example.org."}));
}

TEST(KADNSServiceTest, TheRootAsExchangerIsADot)
{
    DnsServer server;
    server.addMailExchanger("null.example", 0, "");
    EXPECT_EQ(asked("null.example")->mailServers(), QStringList({"."}));
}

TEST(KADNSServiceTest, ADomainAsHostMatchesTheExchangersInsideIt)
{
    const auto service = KADNSService::initWithServerAddress("custom.example");
    service->setMailServers({"alt1.aspmx.example.com.", "aspmx2.examplemail.com."});
    EXPECT_TRUE(service->hasMailHost("examplemail.com"));
    EXPECT_TRUE(service->hasMailHost("alt1"));
    EXPECT_FALSE(service->hasMailHost("mail.com"));
    EXPECT_TRUE(service->hasMailHost(""));
    EXPECT_FALSE(service->hasMailHost("ExampleMail.com"));
    EXPECT_FALSE(service->hasMailHost(QString()));
}

TEST(KADNSServiceTest, WithoutServersNoHostMatches)
{
    EXPECT_FALSE(KADNSService::initWithServerAddress("custom.example")->hasMailHost("example"));
}

// The next two go through the machine's own DNS-SD library, which reads the system bus's address once per process.

TEST(KADNSServiceDeathTest, WithoutADaemonALocalNameGivesAnEmptyResultAtOnce)
{
    GTEST_FLAG_SET(death_test_style, "threadsafe");
    const auto lookUp = [] {
        setenv("DBUS_SYSTEM_BUS_ADDRESS", "unix:path=/nonexistent/bus", 1);
        const auto time = blockingTime("nodaemon.local");
        std::_Exit(asked("nodaemon.local")->mailServers().isEmpty() && time < 400ms ? 0 : 1);
    };
    EXPECT_EXIT(lookUp(), testing::ExitedWithCode(0), "^$");
}

TEST(KADNSServiceDeathTest, ABusThatNeverAnswersHoldsALocalNameToTheTimeLimit)
{
    GTEST_FLAG_SET(death_test_style, "threadsafe");
    const auto lookUp = [] {
        // Connecting to a listening socket succeeds; nobody ever answers what is sent there.
        sockaddr_un address{};
        address.sun_family = AF_UNIX;
        const QByteArray path = QDir::tempPath().toLocal8Bit() + "/hung-bus";
        qstrncpy(address.sun_path, path.constData(), sizeof address.sun_path);
        const int bus = socket(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0);
        if (bind(bus, reinterpret_cast<const sockaddr *>(&address), sizeof address) != 0 || listen(bus, 16) != 0)
            std::_Exit(2);
        setenv("DBUS_SYSTEM_BUS_ADDRESS", ("unix:path=" + path).constData(), 1);
        const auto first = blockingTime("hungbus.local");
        const auto second = blockingTime("otherhungbus.local");
        std::_Exit(first >= 499ms && first <= 550ms && second <= 550ms ? 0 : 1);
    };
    EXPECT_EXIT(lookUp(), testing::ExitedWithCode(0), "^$");
}

TEST(KADNSServiceTest, AHungServerDelaysNobodyElse)
{
    DnsServer server;
    server.neverAnswer("hung.example");
    server.addMailExchanger("quick.example", 10, "mx.example.org");
    std::thread hung([] { asked("hung.example"); });
    while (server.queryCount("hung.example") == 0)
        std::this_thread::yield();
    EXPECT_LE(blockingTime("quick.example"), 200ms);
    hung.join();
}

TEST(KADNSServiceTest, ManyThreadsAskAtOnce)
{
    DnsServer server;
    constexpr int threads = 16;
    constexpr int domains = 20;
    for (int domain = 0; domain < domains; ++domain)
        server.addMailExchanger("d" + std::to_string(domain) + ".many.example", 10,
                                "mx" + std::to_string(domain) + ".example.org");
    std::atomic<int> right{0};
    std::vector<std::thread> askers;
    for (int thread = 0; thread < threads; ++thread)
        askers.emplace_back([&] {
            for (int domain = 0; domain < domains; ++domain)
                right += asked(QStringLiteral("d%1.many.example").arg(domain), false)->mailServers() ==
                         QStringList({QStringLiteral("mx%1.example.org.").arg(domain)});
        });
    for (std::thread &asker : askers)
        asker.join();
    EXPECT_EQ(right, threads * domains);
}

}  // namespace
