// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Questions to the machine's DNS-SD service. The functions of its library are defined here, in the program, which the
// linker prefers to the library's: so the service fails, hangs and answers as each test wants it.

#include <atomic>
#include <chrono>
#include <condition_variable>
#include <cstdint>
#include <cstdlib>
#include <deque>
#include <dns_sd.h>
#include <functional>
#include <mutex>
#include <pthread.h>
#include <string>
#include <sys/eventfd.h>
#include <thread>
#include <unistd.h>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <kavellaccounts/KADNSService.h>

#include "platform/qt/query_queue.h"
#include "platform/qt/record_query.h"
#include "tests/support/dns_server.h"
#include "tests/support/log_capture.h"

using namespace std::chrono_literals;
using kavell::RecordAnswer;
using kavell::RecordQuery;

namespace {

using Clock = std::chrono::steady_clock;

/// Far more than anything here takes that does not hang.
constexpr auto kBound = 10s;

struct ServiceAnswer {
    std::string data;
    DNSServiceFlags flags = kDNSServiceFlagsAdd;
    DNSServiceErrorType error = kDNSServiceErr_NoError;
};

/// What the service does, and what was asked of it. Every test has a fresh one.
struct FakeService {
    std::mutex mutex;
    std::condition_variable changed;
    std::deque<ServiceAnswer> answers;  ///< of every question, one for each result that is processed
    DNSServiceErrorType startError = kDNSServiceErr_NoError;
    DNSServiceErrorType processError = kDNSServiceErr_NoError;
    bool hangsInStart = false;
    bool hangsInDeallocation = false;
    bool released = false;  ///< ends all hanging
    std::vector<std::string> asked;
    int open = 0;

    [[nodiscard]] std::vector<std::string> names()
    {
        const std::lock_guard lock(mutex);
        return asked;
    }

    void hangIf(bool condition, std::unique_lock<std::mutex> &lock)
    {
        if (condition)
            changed.wait(lock, [this] { return released; });
    }

    [[nodiscard]] bool waitUntil(const std::function<bool()> &condition)
    {
        std::unique_lock lock(mutex);
        return changed.wait_for(lock, kBound, condition);
    }
};

FakeService *service = nullptr;

class RecordQueryServiceTest : public testing::Test {
protected:
    RecordQueryServiceTest() { service = &m_service; }

    /// No thread may be left that uses this test's service.
    ~RecordQueryServiceTest() override
    {
        {
            const std::lock_guard lock(m_service.mutex);
            m_service.released = true;
            m_service.startError = kDNSServiceErr_Unknown;
        }
        m_service.changed.notify_all();
        // The services' queue serves one after the other: when it answers this question, it is through with the others.
        std::atomic<bool> answered{false};
        const auto last = start("last.local", [&](const RecordAnswer &) {
            answered = true;
            m_service.changed.notify_all();
        });
        EXPECT_TRUE(m_service.waitUntil([&] { return answered && m_service.open == 0; }));
    }

    [[nodiscard]] static std::unique_ptr<RecordQuery> start(const std::string &name, kavell::RecordCallback callback)
    {
        auto query = RecordQuery::start(name, kavell::kRecordTypeMX, kavell::kRecordClassIN, std::move(callback));
        if (query) {
            EXPECT_EQ(query->attach(kavell::QueryQueue::shared()), 0);
        }
        return query;
    }

    FakeService m_service;
};

std::string mailExchanger(std::string_view host)
{
    return std::string("\0\12", 2) + kavell::test::DnsServer::wireName(host);
}

std::chrono::milliseconds since(Clock::time_point begin)
{
    return std::chrono::duration_cast<std::chrono::milliseconds>(Clock::now() - begin);
}

QStringList mailServersOf(const QString &domain)
{
    const auto lookUp = KADNSService::initWithServerAddress(domain);
    lookUp->beginQuerySync();
    return lookUp->mailServers();
}

}  // namespace

struct _DNSServiceRef_t {
    int descriptor;
    DNSServiceQueryRecordReply callback;
    void *context;
    std::string name;
    std::deque<ServiceAnswer> answers;
};

DNSServiceErrorType DNSServiceQueryRecord(DNSServiceRef *reference, DNSServiceFlags flags, uint32_t interfaceIndex,
                                          const char *name, uint16_t type, uint16_t recordClass,
                                          DNSServiceQueryRecordReply callback, void *context)
{
    std::unique_lock lock(service->mutex);
    EXPECT_EQ(flags, 0U);
    EXPECT_EQ(interfaceIndex, 0U);
    EXPECT_EQ(type, 15);
    EXPECT_EQ(recordClass, 1);
    service->asked.emplace_back(name);
    service->changed.notify_all();
    service->hangIf(service->hangsInStart, lock);
    if (service->startError)
        return service->startError;
    *reference = new _DNSServiceRef_t{eventfd(0, EFD_CLOEXEC), callback, context, name, service->answers};
    if (!service->answers.empty() || service->processError)
        eventfd_write((*reference)->descriptor, 1);
    ++service->open;
    return kDNSServiceErr_NoError;
}

int DNSServiceRefSockFD(DNSServiceRef reference)
{
    return reference->descriptor;
}

DNSServiceErrorType DNSServiceProcessResult(DNSServiceRef reference)
{
    if (service->processError)
        return service->processError;
    const ServiceAnswer answer = reference->answers.front();
    reference->answers.pop_front();
    if (reference->answers.empty()) {
        eventfd_t count = 0;
        eventfd_read(reference->descriptor, &count);
    }
    // Out of a buffer that is gone after the call.
    const std::string data = answer.data;
    reference->callback(reference, answer.flags, 0, answer.error, reference->name.c_str(), 15, 1,
                        static_cast<uint16_t>(data.size()), answer.error ? nullptr : data.data(), 120,
                        reference->context);
    return kDNSServiceErr_NoError;
}

void DNSServiceRefDeallocate(DNSServiceRef reference)
{
    std::unique_lock lock(service->mutex);
    service->hangIf(service->hangsInDeallocation, lock);
    close(reference->descriptor);
    delete reference;
    --service->open;
    service->changed.notify_all();
}

namespace {

TEST_F(RecordQueryServiceTest, LocalNamesAreAskedOfTheService)
{
    kavell::test::DnsServer server;
    m_service.startError = kDNSServiceErr_Unknown;
    for (const char *name : {"local", "host.local", "HOST.Local.", "a.b.LOCAL"})
        static_cast<void>(mailServersOf(QString::fromLatin1(name)));
    EXPECT_THAT(m_service.names(), testing::ElementsAre("host.local", "HOST.Local.", "a.b.LOCAL"));
    EXPECT_TRUE(server.queries().empty());
}

TEST_F(RecordQueryServiceTest, NamesThatOnlyEndLikeLocalOnesAreAskedOfTheResolver)
{
    kavell::test::DnsServer server;
    for (const char *name : {"host.xlocal", "local.example"})
        static_cast<void>(mailServersOf(QString::fromLatin1(name)));
    EXPECT_TRUE(m_service.names().empty());
    EXPECT_EQ(server.queries(), (std::vector<std::string>{"host.xlocal", "local.example"}));
}

TEST_F(RecordQueryServiceTest, AllRecordsOfABatchAreTaken)
{
    m_service.answers = {{mailExchanger("a.local")}, {mailExchanger("b.local")}, {mailExchanger("c.local")}};
    const auto begin = Clock::now();
    EXPECT_EQ(mailServersOf("batch.local"), QStringList({"a.local.", "b.local.", "c.local."}));
    EXPECT_LT(since(begin), 400ms);
}

TEST_F(RecordQueryServiceTest, AllAnswersOfABatchButTheLastSayThatMoreAreComing)
{
    m_service.answers = {{mailExchanger("a.local")}, {mailExchanger("b.local")}};
    std::vector<uint32_t> flags;
    std::vector<std::string> data;
    const auto query = start("flags.local", [&](const RecordAnswer &answer) {
        const std::lock_guard lock(m_service.mutex);
        flags.push_back(answer.flags);
        data.emplace_back(answer.data);
        m_service.changed.notify_all();
    });
    ASSERT_TRUE(m_service.waitUntil([&] { return flags.size() == 2; }));
    EXPECT_THAT(flags, testing::ElementsAre(kavell::kRecordAdded | kavell::kRecordMoreComing, kavell::kRecordAdded));
    EXPECT_THAT(data, testing::ElementsAre(mailExchanger("a.local"), mailExchanger("b.local")));
}

TEST_F(RecordQueryServiceTest, AnswersComeOnTheQueueOfAllAnswers)
{
    m_service.answers = {{mailExchanger("a.local")}};
    std::string thread;
    const auto query = start("thread.local", [&](const RecordAnswer &) {
        char name[16] = "";
        pthread_getname_np(pthread_self(), name, sizeof name);
        const std::lock_guard lock(m_service.mutex);
        thread = name;
        m_service.changed.notify_all();
    });
    ASSERT_TRUE(m_service.waitUntil([&] { return !thread.empty(); }));
    EXPECT_EQ(thread, "kavell.dnsquery");
}

TEST_F(RecordQueryServiceTest, AServiceThatCannotBeAskedGivesAnEmptyResultAtOnceWithoutAMessage)
{
    m_service.startError = kDNSServiceErr_Unknown;
    const kavell::test::LogCapture log;
    const auto begin = Clock::now();
    EXPECT_TRUE(mailServersOf("unasked.local").isEmpty());
    EXPECT_TRUE(mailServersOf("unasked.local").isEmpty());
    EXPECT_LT(since(begin), 400ms);
    EXPECT_TRUE(log.messages().isEmpty());
    EXPECT_EQ(m_service.names().size(), 1U);
}

TEST_F(RecordQueryServiceTest, AServiceThatGoesAwayEndsTheWait)
{
    m_service.processError = kDNSServiceErr_Unknown;
    const auto begin = Clock::now();
    EXPECT_TRUE(mailServersOf("gone.local").isEmpty());
    EXPECT_LT(since(begin), 400ms);
}

TEST_F(RecordQueryServiceTest, TheNewsThatThereIsNoRecordEndsTheWait)
{
    m_service.answers = {{"", 0, kDNSServiceErr_NoSuchRecord}};
    const auto begin = Clock::now();
    EXPECT_TRUE(mailServersOf("norecord.local").isEmpty());
    EXPECT_LT(since(begin), 400ms);
}

TEST_F(RecordQueryServiceTest, ASilentServiceIsWaitedForHalfASecond)
{
    const auto begin = Clock::now();
    EXPECT_TRUE(mailServersOf("silent.local").isEmpty());
    EXPECT_GE(since(begin), 499ms);
    EXPECT_LE(since(begin), 550ms);
}

TEST_F(RecordQueryServiceTest, AServiceThatHangsWhenAskedHoldsUpNobodyBeyondTheLimit)
{
    m_service.hangsInStart = true;
    for (const char *name : {"hung.local", "alsohung.local"}) {
        const auto begin = Clock::now();
        EXPECT_TRUE(mailServersOf(QString::fromLatin1(name)).isEmpty());
        EXPECT_LE(since(begin), 550ms);
    }
    EXPECT_THAT(m_service.names(), testing::ElementsAre("hung.local"));
}

TEST_F(RecordQueryServiceTest, AServiceThatHangsWhenTheQuestionIsTakenBackHoldsUpNobody)
{
    m_service.answers = {{mailExchanger("a.local")}};
    m_service.hangsInDeallocation = true;
    const auto begin = Clock::now();
    EXPECT_EQ(mailServersOf("stuck.local"), QStringList({"a.local."}));
    EXPECT_LT(since(begin), 400ms);
    const auto second = Clock::now();
    EXPECT_TRUE(mailServersOf("afterstuck.local").isEmpty());
    EXPECT_LE(since(second), 550ms);
}

TEST_F(RecordQueryServiceTest, AHungServiceDelaysNoQuestionToTheResolver)
{
    kavell::test::DnsServer server;
    server.addMailExchanger("beside.example", 10, "mx.example.org");
    m_service.hangsInStart = true;
    const auto hung = start("besidehung.local", [](const RecordAnswer &) {});
    ASSERT_TRUE(m_service.waitUntil([&] { return !m_service.asked.empty(); }));
    const auto begin = Clock::now();
    EXPECT_EQ(mailServersOf("beside.example"), QStringList({"mx.example.org."}));
    EXPECT_LT(since(begin), 400ms);
}

TEST_F(RecordQueryServiceTest, AQuestionGivenUpIsTakenBack)
{
    auto query = start("givenup.local", [](const RecordAnswer &) {});
    ASSERT_TRUE(m_service.waitUntil([&] { return m_service.open == 1; }));
    query.reset();
    EXPECT_TRUE(m_service.waitUntil([&] { return m_service.open == 0; }));
}

TEST_F(RecordQueryServiceTest, AQuestionGivenUpBeforeItsTurnIsNotAsked)
{
    m_service.hangsInStart = true;
    const auto first = start("first.local", [](const RecordAnswer &) {});
    ASSERT_TRUE(m_service.waitUntil([&] { return m_service.asked.size() == 1; }));
    start("second.local", [](const RecordAnswer &) {}).reset();
    {
        const std::lock_guard lock(m_service.mutex);
        m_service.released = true;
    }
    m_service.changed.notify_all();
    const auto third = start("third.local", [](const RecordAnswer &) {});
    ASSERT_TRUE(m_service.waitUntil([&] { return m_service.asked.size() >= 2; }));
    EXPECT_THAT(m_service.names(), testing::ElementsAre("first.local", "third.local"));
}

}  // namespace
