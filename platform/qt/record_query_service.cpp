// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Record queries through the machine's DNS-SD service, for the names that multicast serves.
//
// Each call of the service's library may wait for a daemon that does not answer: it connects, asks and takes its
// question back by messages whose replies it waits for, up to 25 seconds each. So one thread of its own makes these
// calls, and neither the caller nor the queue of the answers waits for it:
//
//     caller's thread      makeServiceQuery, destruction
//     QueryQueue::services ServiceConversation: every call of the library    ─┐ ServiceMailbox
//     the answers' queue   ServiceQuery: runs the callback                   <┘

#include <algorithm>
#include <atomic>
#include <chrono>
#include <cstdlib>
#include <dns_sd.h>
#include <mutex>
#include <optional>
#include <sys/eventfd.h>
#include <unistd.h>
#include <utility>

#include "platform/qt/record_query_back_end.h"

namespace kavell {

namespace {

using Clock = std::chrono::steady_clock;

/// The service hands over the records of one reply one by one and marks none of them as the last. A record is followed
/// by others of its batch when they come within this time.
constexpr std::chrono::milliseconds kBatchPause{10};

/// An answer with what it points to.
struct KeptAnswer {
    RecordAnswer answer;
    std::string fullName;
    std::string data;
};

/// Answers on their way from the thread that speaks with the service to the queue on which callbacks run.
class ServiceMailbox {
public:
    ServiceMailbox() : m_descriptor(eventfd(0, EFD_CLOEXEC | EFD_NONBLOCK)) {}
    ~ServiceMailbox()
    {
        if (m_descriptor >= 0)
            ::close(m_descriptor);
    }
    ServiceMailbox(const ServiceMailbox &) = delete;
    ServiceMailbox &operator=(const ServiceMailbox &) = delete;

    /// Readable while there are answers; negative when the process has no descriptor left.
    [[nodiscard]] int descriptor() const { return m_descriptor; }

    void put(KeptAnswer answer)
    {
        const std::lock_guard lock(m_mutex);
        m_answers.push_back(std::move(answer));
        eventfd_write(m_descriptor, 1);
    }

    [[nodiscard]] std::vector<KeptAnswer> takeAll()
    {
        const std::lock_guard lock(m_mutex);
        eventfd_t count = 0;
        eventfd_read(m_descriptor, &count);
        return std::exchange(m_answers, {});
    }

    /// Nobody reads the answers any more.
    void close() { m_closed = true; }
    [[nodiscard]] bool isClosed() const { return m_closed; }

private:
    const int m_descriptor;
    std::mutex m_mutex;
    std::vector<KeptAnswer> m_answers;
    std::atomic<bool> m_closed{false};
};

/// Asks the service and puts its answers into the mailbox. The queue of services makes all the calls and frees it.
class ServiceConversation final : public QuerySource {
public:
    ServiceConversation(std::shared_ptr<ServiceMailbox> mailbox, std::string name, uint16_t type, uint16_t recordClass)
        : m_mailbox(std::move(mailbox)), m_name(std::move(name)), m_type(type), m_class(recordClass)
    {
    }
    ~ServiceConversation() override
    {
        if (m_service)
            DNSServiceRefDeallocate(m_service);
    }

    int appendDescriptors(std::vector<pollfd> &descriptors) override;
    void process(const pollfd *descriptors, size_t count) override;
    [[nodiscard]] bool isDone() const override { return m_failed || m_mailbox->isClosed(); }

private:
    static void answered(DNSServiceRef service, DNSServiceFlags flags, uint32_t interfaceIndex,
                         DNSServiceErrorType error, const char *fullName, uint16_t type, uint16_t recordClass,
                         uint16_t length, const void *data, uint32_t timeToLive, void *conversation);
    void take(KeptAnswer answer);
    void fail(DNSServiceErrorType error);
    void passOnHeld(uint32_t moreComing);
    [[nodiscard]] std::chrono::milliseconds pauseLeft() const;

    const std::shared_ptr<ServiceMailbox> m_mailbox;
    const std::string m_name;
    const uint16_t m_type;
    const uint16_t m_class;
    DNSServiceRef m_service = nullptr;
    bool m_failed = false;
    std::optional<KeptAnswer> m_held;  ///< the latest answer, until it is known whether others follow
    Clock::time_point m_heldSince;
};

int ServiceConversation::appendDescriptors(std::vector<pollfd> &descriptors)
{
    if (isDone())
        return 0;
    if (!m_service) {
        const auto error = DNSServiceQueryRecord(&m_service, 0, 0, m_name.c_str(), m_type, m_class, answered, this);
        if (error != kDNSServiceErr_NoError) {
            m_service = nullptr;
            fail(error);
            return 0;
        }
    }
    descriptors.push_back({DNSServiceRefSockFD(m_service), POLLIN, 0});
    return m_held ? static_cast<int>(pauseLeft().count()) : -1;
}

void ServiceConversation::process(const pollfd *descriptors, size_t count)
{
    if (isDone() || count == 0)
        return;
    if (descriptors->revents != 0) {
        if (const auto error = DNSServiceProcessResult(m_service); error != kDNSServiceErr_NoError)
            fail(error);
    } else if (m_held && pauseLeft().count() == 0) {
        passOnHeld(0);
    }
}

std::chrono::milliseconds ServiceConversation::pauseLeft() const
{
    const auto left = std::chrono::ceil<std::chrono::milliseconds>(m_heldSince + kBatchPause - Clock::now());
    return std::max(left, std::chrono::milliseconds(0));
}

void ServiceConversation::answered(DNSServiceRef, DNSServiceFlags flags, uint32_t, DNSServiceErrorType error,
                                   const char *fullName, uint16_t type, uint16_t recordClass, uint16_t length,
                                   const void *data, uint32_t timeToLive, void *conversation)
{
    KeptAnswer kept{{flags, error, {}, type, recordClass, {}, timeToLive}, fullName ? fullName : "", {}};
    if (data)
        kept.data.assign(static_cast<const char *>(data), length);
    static_cast<ServiceConversation *>(conversation)->take(std::move(kept));
}

void ServiceConversation::take(KeptAnswer answer)
{
    passOnHeld(kRecordMoreComing);
    m_held = std::move(answer);
    m_heldSince = Clock::now();
    if (m_held->answer.error != kDNSServiceErr_NoError)
        passOnHeld(0);
}

void ServiceConversation::passOnHeld(uint32_t moreComing)
{
    if (!m_held)
        return;
    m_held->answer.flags |= moreComing;
    m_mailbox->put(*std::exchange(m_held, std::nullopt));
}

/// The one who waits for an answer learns at once that none will come.
void ServiceConversation::fail(DNSServiceErrorType error)
{
    m_failed = true;
    take({{0, error, {}, m_type, m_class, {}, 0}, m_name, {}});
}

class ServiceQuery final : public RecordQueryBackEnd {
public:
    ServiceQuery(std::shared_ptr<ServiceMailbox> mailbox, RecordCallback callback)
        : RecordQueryBackEnd(std::move(callback)), m_mailbox(std::move(mailbox))
    {
    }
    ~ServiceQuery() override { cancel(); }

    void cancel() override
    {
        RecordQueryBackEnd::cancel();
        m_mailbox->close();
        QueryQueue::services().wake();  // so that it takes the question back
    }

    int appendDescriptors(std::vector<pollfd> &descriptors) override
    {
        if (!isDone())
            descriptors.push_back({m_mailbox->descriptor(), POLLIN, 0});
        return -1;
    }
    void process(const pollfd *descriptors, size_t count) override;
    [[nodiscard]] bool isDone() const override { return isCancelled(); }

private:
    const std::shared_ptr<ServiceMailbox> m_mailbox;
};

void ServiceQuery::process(const pollfd *descriptors, size_t count)
{
    if (isDone() || count == 0 || descriptors->revents == 0)
        return;
    for (KeptAnswer &kept : m_mailbox->takeAll()) {
        kept.answer.fullName = kept.fullName;
        kept.answer.data = kept.data;
        deliver(kept.answer);
    }
}

/// The service's library otherwise scolds its users on the standard error stream.
void silenceServiceLibrary()
{
    static std::once_flag once;
    std::call_once(once, [] { setenv("AVAHI_COMPAT_NOWARN", "1", 0); });
}

}  // namespace

std::shared_ptr<RecordQueryBackEnd> makeServiceQuery(const std::string &name, uint16_t type, uint16_t recordClass,
                                                     RecordCallback callback)
{
    silenceServiceLibrary();
    const auto mailbox = std::make_shared<ServiceMailbox>();
    if (mailbox->descriptor() < 0)
        return nullptr;
    if (QueryQueue::services().add(std::make_shared<ServiceConversation>(mailbox, name, type, recordClass)) != 0)
        return nullptr;
    return std::make_shared<ServiceQuery>(mailbox, std::move(callback));
}

}  // namespace kavell
