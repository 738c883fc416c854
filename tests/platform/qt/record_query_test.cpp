// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/qt/record_query.h"

#include <chrono>
#include <condition_variable>
#include <cstdlib>
#include <memory>
#include <mutex>
#include <string>
#include <thread>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "platform/qt/query_queue.h"
#include "tests/support/dns_server.h"

using namespace std::chrono_literals;
using kavell::RecordAnswer;
using kavell::RecordQuery;
using kavell::test::DnsServer;
using testing::ElementsAre;

namespace {

constexpr auto kBound = 10s;

/// The answers of one question, kept for as long as the test looks at them.
class Asked {
public:
    explicit Asked(const std::string &name)
        : m_query(RecordQuery::start(name, kavell::kRecordTypeMX, kavell::kRecordClassIN,
                                     [this](const RecordAnswer &answer) { take(answer); }))
    {
        if (m_query) {
            EXPECT_EQ(m_query->attach(kavell::QueryQueue::shared()), 0);
        }
    }

    [[nodiscard]] bool isAsked() const { return m_query != nullptr; }
    void giveUp() { m_query.reset(); }

    [[nodiscard]] bool waitForBatch(std::chrono::milliseconds bound = kBound)
    {
        std::unique_lock lock(m_mutex);
        return m_changed.wait_for(lock, bound,
                                  [this] { return !m_flags.empty() && !(m_flags.back() & kavell::kRecordMoreComing); });
    }

    [[nodiscard]] const std::vector<uint32_t> &flags() const { return m_flags; }
    [[nodiscard]] const std::vector<int32_t> &errors() const { return m_errors; }
    [[nodiscard]] const std::vector<std::string> &data() const { return m_data; }
    [[nodiscard]] const std::vector<std::string> &names() const { return m_names; }

private:
    void take(const RecordAnswer &answer)
    {
        const std::lock_guard lock(m_mutex);
        m_flags.push_back(answer.flags);
        m_errors.push_back(answer.error);
        m_data.emplace_back(answer.data);
        m_names.emplace_back(answer.fullName);
        m_changed.notify_all();
    }

    std::mutex m_mutex;
    std::condition_variable m_changed;
    std::vector<uint32_t> m_flags;
    std::vector<int32_t> m_errors;
    std::vector<std::string> m_data;
    std::vector<std::string> m_names;
    std::unique_ptr<RecordQuery> m_query;  // last: its end waits for a callback that uses the others
};

TEST(RecordQueryTest, AllAnswersOfABatchButTheLastSayThatMoreAreComing)
{
    DnsServer server;
    for (const char *host : {"a.example", "b.example", "c.example"})
        server.addMailExchanger("batch.example", 10, host);
    Asked asked("batch.example");
    ASSERT_TRUE(asked.waitForBatch());
    EXPECT_THAT(asked.flags(), ElementsAre(3, 3, 2));
    EXPECT_THAT(asked.errors(), ElementsAre(0, 0, 0));
    EXPECT_THAT(asked.names(), ElementsAre("batch.example", "batch.example", "batch.example"));
}

TEST(RecordQueryTest, AnAnswerIsThePreferenceAndTheNameInWireForm)
{
    DnsServer server;
    server.addMailExchanger("data.example", 258, "mx.example");
    Asked asked("data.example");
    ASSERT_TRUE(asked.waitForBatch());
    EXPECT_THAT(asked.data(), ElementsAre(std::string("\1\2\2mx\7example\0", 14)));
}

TEST(RecordQueryTest, ANameThatDoesNotExistIsOneAnswerWithAnError)
{
    DnsServer server;
    Asked asked("missing.example");
    ASSERT_TRUE(asked.waitForBatch());
    EXPECT_THAT(asked.errors(), ElementsAre(-65538));
    EXPECT_THAT(asked.data(), ElementsAre(""));
}

TEST(RecordQueryTest, ANameWithoutRecordsIsOneAnswerWithAnError)
{
    DnsServer server;
    server.addEmpty("empty.example");
    Asked asked("empty.example");
    ASSERT_TRUE(asked.waitForBatch());
    EXPECT_THAT(asked.errors(), ElementsAre(-65554));
}

TEST(RecordQueryTest, ANameWithANULIsNotAsked)
{
    EXPECT_FALSE(Asked(std::string("a\0b.example", 11)).isAsked());
}

TEST(RecordQueryTest, ASilentServerIsAskedTwiceWithinHalfASecond)
{
    DnsServer server;
    server.neverAnswer("twice.example");
    Asked asked("twice.example");
    EXPECT_FALSE(asked.waitForBatch(500ms));
    asked.giveUp();
    EXPECT_EQ(server.queryCount("twice.example"), 2);
}

TEST(RecordQueryTest, TheSecondServerIsAskedWhenTheFirstIsSilent)
{
    DnsServer silent;
    silent.neverAnswer("second.example");
    DnsServer server;
    server.addMailExchanger("second.example", 10, "mx.example");
    setenv("KAVELL_DNS_SERVERS", (silent.address() + "," + server.address()).c_str(), 1);
    Asked asked("second.example");
    EXPECT_TRUE(asked.waitForBatch(500ms));
    EXPECT_THAT(asked.errors(), ElementsAre(0));
    EXPECT_EQ(silent.queryCount("second.example"), 1);
}

TEST(RecordQueryTest, NoAnswerComesAfterTheQueryIsGone)
{
    DnsServer server;
    server.addMailExchanger("gone.example", 10, "mx.example");
    server.delay("gone.example", 50ms);
    server.addMailExchanger("later.example", 10, "mx.example");
    server.delay("later.example", 150ms);
    Asked gone("gone.example");
    while (server.queryCount("gone.example") == 0)
        std::this_thread::yield();
    gone.giveUp();
    Asked later("later.example");
    ASSERT_TRUE(later.waitForBatch());
    EXPECT_TRUE(gone.flags().empty());
}

TEST(RecordQueryTest, AQueryMayEndInItsOwnCallback)
{
    DnsServer server;
    server.addMailExchanger("own.example", 10, "a.example");
    server.addMailExchanger("own.example", 20, "b.example");
    std::mutex mutex;
    std::condition_variable changed;
    int calls = 0;
    bool attached = false;
    std::unique_ptr<RecordQuery> query;
    query = RecordQuery::start("own.example", kavell::kRecordTypeMX, kavell::kRecordClassIN, [&](const RecordAnswer &) {
        std::unique_lock lock(mutex);
        changed.wait(lock, [&] { return attached; });
        ++calls;
        query.reset();
        changed.notify_all();
    });
    ASSERT_EQ(query->attach(kavell::QueryQueue::shared()), 0);
    {
        std::unique_lock lock(mutex);
        attached = true;
        changed.notify_all();
        ASSERT_TRUE(changed.wait_for(lock, kBound, [&] { return calls > 0; }));
    }
    server.addMailExchanger("after.example", 10, "a.example");
    Asked after("after.example");
    ASSERT_TRUE(after.waitForBatch());
    EXPECT_EQ(calls, 1);
}

}  // namespace
