// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The identity of an account or of a settings dictionary: "USER@HOST-LABEL".

#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KAExtras.h>
#include <kavellaccounts/KAPluginManager.h>
#include <kavellaccounts/KAProvider.h>

#include "model/settings_reading.h"

using namespace KAExtras;

namespace {

using Keys = std::initializer_list<const QString *>;

/// Forms an identifier from the texts that `valueForKey` finds. The fall-backs stand in for a missing user and a
/// missing server; a settings dictionary has neither, so that what says nothing gets no identity.
template <typename ValueForKey>
QString identifier(ValueForKey &&valueForKey, const QString &userFallback, const QString &serverFallback)
{
    const auto firstPresent = [&](Keys keys) {
        for (const QString *key : keys) {
            if (const QString text = valueForKey(*key); !text.isNull())
                return text;
        }
        return QString();
    };

    QString user = firstPresent({&KAMailEmailAddressKey, &KAMailUserNameKey, &KAChatLoginNameKey});
    if (user.isNull())
        user = userFallback;
    if (user.isNull())
        return {};

    QString server;
    if (user.contains(u'@')) {
        server = emailHostName(user);
        user = emailUserName(user);  // also when nothing stands behind the "@"
    }
    if (server.isNull())
        server = firstPresent({&KAMailIncomingMailServerKey, &KACardellServerAddressKey, &KAChatServerKey});
    if (server.isNull())
        server = serverFallback;
    if (server.contains(u'@'))
        server = emailHostName(server);
    const QString label = server.isNull() ? QString() : KAAccount::_hostLabelForServerAddress(server);
    return label.isNull() ? QString() : user + u'@' + label;
}

}  // namespace

QString KAAccount::accountIdentifier() const
{
    return identifier([&](const QString &key) { return kavell::textOf(providerAttributeForKey(key)); }, loginName(),
                      provider());
}

QString KAAccount::accountIdentifierForSettings(const QVariantMap &settings)
{
    return identifier([&](const QString &key) { return kavell::textForKey(settings, key); }, {}, {});
}

QString KAAccount::_hostLabelForServerAddress(const QString &serverAddress)
{
    const QString domain = urlDomain(serverAddress);
    KAPluginManager *const manager = KAPluginManager::shared();
    const QString pluginID = manager->pluginIDForDomain(domain);
    if (pluginID.isNull())
        return domain;
    const KAPlugin *const plugin = manager->pluginWithIdentifier(pluginID);
    if (!plugin)
        return domain;
    const std::shared_ptr<KAProvider> provider = plugin->provider();
    return provider ? provider->providerType() : QString();
}
