// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAHaldenServer.h>

#include <kavellaccounts/KADefaults.h>
#include <kavellaccounts/KAExtras.h>

#include "model/settings_reading.h"

namespace {

const QString kServersKey = QStringLiteral("HaldenServers");

QVariantList storedServers()
{
    return KADefaults::shared()->objectForKey(kServersKey).toList();
}

}  // namespace

void KAAddHaldenServer(const QString &server, const QVariant &serviceTypes)
{
    if (server.isNull() || kavell::isNothing(serviceTypes))
        return;
    QVariantList servers = storedServers();
    // One at a time, since entries for one server can hold different values where another program wrote them.
    while (KAExtras::containsDictionaryWithKey(servers, server))
        KAExtras::removeDictionaryWithKey(servers, server);
    servers.append(QVariantMap{{server, serviceTypes}});
    KADefaults::shared()->setObject(servers, kServersKey);
}

void KARemoveHaldenServer(const QString &server)
{
    if (kavell::isNothing(KADefaults::shared()->objectForKey(kServersKey)))
        return;
    QVariantList servers = storedServers();
    while (KAExtras::containsDictionaryWithKey(servers, server))
        KAExtras::removeDictionaryWithKey(servers, server);
    if (servers.isEmpty())
        KADefaults::shared()->removeObjectForKey(kServersKey);
    else
        KADefaults::shared()->setObject(servers, kServersKey);
}

bool KAIsKnownHaldenServer(const QString &server)
{
    return !server.isNull() && KAExtras::containsDictionaryWithKey(storedServers(), server);
}

QVariant KAHaldenServiceTypesForServer(const QString &server)
{
    const std::optional<QVariantMap> entry = KAExtras::dictionaryWithKey(storedServers(), server);
    return entry ? entry->value(server) : QVariant();
}
