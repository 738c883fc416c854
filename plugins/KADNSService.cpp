// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KADNSService.h>

#include <algorithm>
#include <mutex>
#include <utility>

#include <QtCore/QHash>
#include <QtCore/QStringDecoder>

#include <kavellaccounts/KAFieldList.h>

#include "platform/qt/log.h"
#include "platform/qt/query_queue.h"
#include "platform/qt/record_query.h"
#include "plugins/KADNSServiceNames_p.h"
#include "plugins/KADNSService_p.h"

namespace {

constexpr int kWaitMilliseconds = 500;
constexpr qsizetype kUsualServers = 16;
constexpr char kEscape = '\\';

/// The answers of the process by the domain's exact text. Empty ones are kept, too: a domain whose servers did not
/// answer in time is not waited for again.
struct ResultsCache {
    std::mutex mutex;
    QHash<QString, QStringList> results;
};

ResultsCache &gResultsCache()
{
    static auto *const cache = new ResultsCache;  // never destroyed: threads may still ask while the process ends
    return *cache;
}

}  // namespace

QString KADNSServiceHostOfMailExchanger(std::string_view data)
{
    constexpr size_t preferenceBytes = 2;
    if (data.empty())  // no record, only the news that there is none
        return {};
    KADNSServiceWireName name{};
    // The length is 16 bits wide and wraps for a record that is shorter than its preference; what is not there is not
    // copied, which leaves the root's name.
    const size_t announced = std::min<size_t>(static_cast<uint16_t>(data.size() - preferenceBytes), name.size());
    const std::string_view rest = data.substr(std::min(preferenceBytes, data.size()));
    std::copy_n(rest.begin(), std::min(announced, rest.size()), name.begin());

    KADNSServiceNameText text{};
    const char *end = _KADNSServiceConvertDomainNameToCString_withescape(name, text, kEscape);
    if (!end)
        return {};
    QStringDecoder decoder(QStringDecoder::Utf8, QStringDecoder::Flag::Stateless);
    const QString host = decoder.decode(QByteArrayView(text.data(), end));
    return decoder.hasError() ? QString() : host.toLower();
}

std::shared_ptr<KADNSService> KADNSService::initWithServerAddress(const QString &serverAddress)
{
    return std::shared_ptr<KADNSService>(new KADNSService(serverAddress));
}

KADNSService::KADNSService(const QString &serverAddress)
    : _serverAddress(serverAddress), _semaphore(std::make_shared<QSemaphore>(0))
{
}

KADNSService::~KADNSService() = default;

QString KADNSService::serverAddress() const
{
    return _serverAddress;
}

void KADNSService::setServerAddress(const QString &serverAddress)
{
    _serverAddress = serverAddress;
}

QStringList KADNSService::mailServers() const
{
    return _mailServers;
}

void KADNSService::setMailServers(const QStringList &mailServers)
{
    _mailServers = mailServers;
}

bool KADNSService::useCache() const
{
    return _useCache;
}

void KADNSService::setUseCache(bool useCache)
{
    _useCache = useCache;
}

std::shared_ptr<QSemaphore> KADNSService::semaphore() const
{
    return _semaphore;
}

void KADNSService::beginQuerySync()
{
    if (!_serverAddress.contains(QLatin1Char('.')))
        return;
    ResultsCache &cache = gResultsCache();
    if (_useCache) {
        const std::lock_guard lock(cache.mutex);
        if (const auto hit = cache.results.constFind(_serverAddress); hit != cache.results.constEnd()) {
            _mailServers = *hit;
            return;
        }
    }
    const auto keptAlive = shared_from_this();
    query();
    if (_useCache) {
        const std::lock_guard lock(cache.mutex);
        cache.results.insert(_serverAddress, _mailServers);
    }
}

void KADNSService::query()
{
    // An object asks once: its semaphore goes with the query.
    const std::shared_ptr<QSemaphore> semaphore = std::exchange(_semaphore, nullptr);
    if (!semaphore)
        return;
    _mailServers.reserve(kUsualServers);
    const auto query_callback = [this, &semaphore](const kavell::RecordAnswer &answer) {
        const QString host = KADNSServiceHostOfMailExchanger(answer.data);
        if (!host.isEmpty() && !_mailServers.contains(host))
            _mailServers.append(host);
        if (!(answer.flags & kavell::kRecordMoreComing))
            semaphore->release();
    };
    const auto query = kavell::RecordQuery::start(_serverAddress.toStdString(), kavell::kRecordTypeMX,
                                                  kavell::kRecordClassIN, query_callback);
    if (!query)
        return;
    if (const int error = query->attach(kavell::QueryQueue::shared())) {
        kavell::log(QStringLiteral("*** DNSServiceSetDispatchQueue returned error %1").arg(error));
        return;
    }
    static_cast<void>(semaphore->tryAcquire(1, kWaitMilliseconds));
}

bool KADNSService::hasMailHost(const QString &text) const
{
    if (text.isNull())
        return false;
    const QString inside = QLatin1Char('.') + text;
    return std::any_of(_mailServers.begin(), _mailServers.end(),
                       [&](const QString &server) { return server.startsWith(text) || server.contains(inside); });
}

void KADNSService::describeFields(KAFieldList &fields) const
{
    fields.add("_serverAddress", _serverAddress);
    fields.add("_mailServers", _mailServers);
    fields.add("_semaphore", _semaphore);
    fields.add("_useCache", _useCache);
    KAObject::describeFields(fields);
}
