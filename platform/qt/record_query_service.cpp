// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Record queries through the machine's DNS-SD service, for the names that multicast serves.

#include <cstdlib>
#include <dns_sd.h>
#include <mutex>

#include "platform/qt/record_query_back_end.h"

namespace kavell {

namespace {

class ServiceQuery final : public RecordQueryBackEnd {
public:
    using RecordQueryBackEnd::RecordQueryBackEnd;
    ~ServiceQuery() override
    {
        cancel();
        if (m_service)
            DNSServiceRefDeallocate(m_service);
    }

    [[nodiscard]] bool start(const std::string &name, uint16_t type, uint16_t recordClass);
    int appendDescriptors(std::vector<pollfd> &descriptors) override;
    void process(const pollfd *descriptors, size_t count) override;
    [[nodiscard]] bool isDone() const override { return m_failed || isCancelled(); }

private:
    static void answered(DNSServiceRef service, DNSServiceFlags flags, uint32_t interfaceIndex,
                         DNSServiceErrorType error, const char *fullName, uint16_t type, uint16_t recordClass,
                         uint16_t length, const void *data, uint32_t timeToLive, void *query);

    DNSServiceRef m_service = nullptr;
    bool m_failed = false;
};

/// The service's library otherwise scolds its users on the standard error stream.
void silenceServiceLibrary()
{
    static std::once_flag once;
    std::call_once(once, [] { setenv("AVAHI_COMPAT_NOWARN", "1", 0); });
}

bool ServiceQuery::start(const std::string &name, uint16_t type, uint16_t recordClass)
{
    silenceServiceLibrary();
    if (DNSServiceQueryRecord(&m_service, 0, 0, name.c_str(), type, recordClass, answered, this)) {
        m_service = nullptr;
        return false;
    }
    return true;
}

int ServiceQuery::appendDescriptors(std::vector<pollfd> &descriptors)
{
    if (!isDone())
        descriptors.push_back({DNSServiceRefSockFD(m_service), POLLIN, 0});
    return -1;
}

void ServiceQuery::process(const pollfd *descriptors, size_t count)
{
    if (isDone() || count == 0 || descriptors->revents == 0)
        return;
    m_failed = DNSServiceProcessResult(m_service) != kDNSServiceErr_NoError;
}

void ServiceQuery::answered(DNSServiceRef, DNSServiceFlags flags, uint32_t, DNSServiceErrorType error,
                            const char *fullName, uint16_t type, uint16_t recordClass, uint16_t length,
                            const void *data, uint32_t timeToLive, void *query)
{
    RecordAnswer answer;
    answer.flags = flags;
    answer.error = error;
    answer.fullName = fullName ? std::string_view(fullName) : std::string_view();
    answer.type = type;
    answer.recordClass = recordClass;
    if (data)
        answer.data = std::string_view(static_cast<const char *>(data), length);
    answer.timeToLive = timeToLive;
    static_cast<ServiceQuery *>(query)->deliver(answer);
}

}  // namespace

std::shared_ptr<RecordQueryBackEnd> makeServiceQuery(const std::string &name, uint16_t type, uint16_t recordClass,
                                                     RecordCallback callback)
{
    auto query = std::make_shared<ServiceQuery>(std::move(callback));
    if (!query->start(name, type, recordClass))
        return nullptr;
    return query;
}

}  // namespace kavell
