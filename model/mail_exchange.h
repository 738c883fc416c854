// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Whether a provider receives the mail of a domain. Blocks for up to half a second on a DNS lookup, unless the answer
// is cached (KADNSService.h).

#ifndef KAVELL_MODEL_MAIL_EXCHANGE_H
#define KAVELL_MODEL_MAIL_EXCHANGE_H

#include <kavellaccounts/KADNSService.h>

namespace kavell {

/// Whether one of the domain's mail exchangers lies in the given domain.
[[nodiscard]] inline bool mailIsServedBy(const QString &domain, const QString &exchangerDomain)
{
    const std::shared_ptr<KADNSService> service = KADNSService::initWithServerAddress(domain);
    service->beginQuerySync();
    return service->hasMailHost(exchangerDomain);
}

}  // namespace kavell

#endif
