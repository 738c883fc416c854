// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAPluginManager.h>

#include <array>

#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KADataPlugin.h>
#include <kavellaccounts/KADecisionTrace.h>
#include <kavellaccounts/KAFieldList.h>
#include <kavellaccounts/KAProvider.h>

#include "model/configuration.h"
#include "model/mail_exchange.h"
#include "plugins/KAPluginManager_p.h"

KAPluginManager *gSharedKAPluginManager = nullptr;

namespace {

/// Two texts that belong together, looked up by position.
struct Pair {
    const QString &first;
    const QString &second;
};

const std::array<Pair, 13> kPluginsOfProviders{{
    {kKAProviderYahoo, kKAYahooPluginID},
    {kKAProviderGoogle, kKAGooglePluginID},
    {kKAProviderNimbrel, kKANimbrelPluginID},
    {kKAProviderFacebook, kKAFacebookPluginID},
    {kKAProviderExchange, kKAExchangePluginID},
    {kKAProviderMail, kKAMailPluginID},
    {kKAProviderParlex, kKAChatPluginID},
    {kKAProviderCardell, kKAContactsPluginID},
    {kKAProviderTidewell, kKACalendarPluginID},
    {kKAProviderTest, kKATestPluginID},
    {kKAProviderAOL, kKAAOLPluginID},
    {kKAProviderHaldenServer, kKAHaldenServerPluginID},
    {kKAProviderQuillane, kKAQuillanePluginID},
}};

/// Data plug-ins and the applications that they serve. The test plug-in stands in for mail, and comes behind the mail
/// plug-in so that mail maps back to that one only.
const std::array<Pair, 5> kApplicationsOfPlugins{{
    {kKAMailPluginID, kKAMailAppID},
    {kKATestPluginID, kKAMailAppID},
    {kKACalendarPluginID, kKATidewellAppID},
    {kKAChatPluginID, kKAParlexAppID},
    {kKAContactsPluginID, kKACardellAppID},
}};

template <size_t Count> QString secondFor(const std::array<Pair, Count> &table, const QString &first)
{
    for (const Pair &row : table) {
        if (row.first == first)
            return row.second;
    }
    return {};
}

template <size_t Count> QString firstFor(const std::array<Pair, Count> &table, const QString &second)
{
    for (const Pair &row : table) {
        if (row.second == second)
            return row.first;
    }
    return {};
}

}  // namespace

KAPluginManager *KAPluginManager::shared()
{
    if (!gSharedKAPluginManager)
        gSharedKAPluginManager = new KAPluginManager;
    return gSharedKAPluginManager;
}

std::optional<QStringList> KAPluginManager::servicesForDomain(const QString &domain)
{
    const QString pluginID = pluginIDForDomain(domain);
    KAPlugin *const plugin = pluginID.isNull() ? nullptr : pluginWithIdentifier(pluginID);
    const std::shared_ptr<KAProvider> provider = plugin ? plugin->provider() : nullptr;
    return provider ? std::optional(provider->serviceTypesProvided()) : std::nullopt;
}

QString KAPluginManager::pluginIDForDomain(const QString &domain, KADecisionTrace *trace)
{
    if (domain.isNull())
        return {};
    const QString claimed = KADecisionTrace::noting(trace, "domains of the plug-ins", domain, [&] {
        for (KAAListPlugin *plugin : allAListPlugins()) {
            if (plugin->supportsDomain(domain))
                return plugin->identifier();
        }
        return QString();
    });
    if (!claimed.isNull())
        return claimed;
    return KADecisionTrace::noting(trace, "mail exchangers: hosted mail", domain, [&] {
        const bool hosted = kavell::mailIsServedBy(domain, kavell::configuration::kGoogleHostedMailDomain);
        return hosted ? kKAGooglePluginID : QString();
    });
}

QString KAPluginManager::pluginIDForProviderID(const QString &providerType) const
{
    return secondFor(kPluginsOfProviders, providerType);
}

QString KAPluginManager::pluginIDForAppBundleID(const QString &appBundleID) const
{
    return firstFor(kApplicationsOfPlugins, appBundleID);
}

QString KAPluginManager::appBundleIDForPluginID(const QString &pluginID) const
{
    return secondFor(kApplicationsOfPlugins, pluginID);
}

std::shared_ptr<KAProvider> KAPluginManager::providerOfType(const QString &providerType)
{
    const QString pluginID = pluginIDForProviderID(providerType);
    KAPlugin *const plugin = pluginID.isNull() ? nullptr : pluginWithIdentifier(pluginID);
    return plugin ? plugin->provider() : nullptr;
}

KAPlugin *KAPluginManager::pluginWithIdentifier(const QString &identifier)
{
    if (identifier.isNull())
        return nullptr;
    loadPlugins(QStringList{identifier});
    const std::lock_guard lock(m_registryLock);
    return _plugins.value(identifier);
}

template <typename Plugin> QList<Plugin *> KAPluginManager::_allPluginsForClass()
{
    loadPlugins(std::nullopt);
    const std::lock_guard lock(m_registryLock);
    QList<Plugin *> plugins;
    plugins.reserve(_plugins.size());
    for (KAPlugin *plugin : std::as_const(_plugins)) {
        if (auto *wanted = qobject_cast<Plugin *>(plugin))
            plugins += wanted;
    }
    return plugins;
}

QList<KAAListPlugin *> KAPluginManager::allAListPlugins()
{
    return _allPluginsForClass<KAAListPlugin>();
}

QList<KADataPlugin *> KAPluginManager::allDataPlugins()
{
    return _allPluginsForClass<KADataPlugin>();
}

QList<KAPlugin *> KAPluginManager::allPlugins()
{
    return _allPluginsForClass<KAPlugin>();
}

void KAPluginManager::setCachedImagePath(const QString &imagePath, const QString &appBundleID)
{
    if (!imagePath.isNull())  // the cache takes no missing value
        _cachedImagePaths.insert(appBundleID, imagePath);
}

QString KAPluginManager::cachedImagePathForApp(const QString &appBundleID) const
{
    return _cachedImagePaths.value(appBundleID);
}

void KAPluginManager::setCachedDisplayName(const QString &displayName, const QString &appBundleID)
{
    if (!displayName.isNull())
        _cachedDisplayNames.insert(appBundleID, displayName);
}

QString KAPluginManager::cachedDisplayNameForApp(const QString &appBundleID) const
{
    return _cachedDisplayNames.value(appBundleID);
}

void KAPluginManager::describeFields(KAFieldList &fields) const
{
    const std::lock_guard lock(m_registryLock);
    // A copy: a plug-in that is asked for its description may ask for others, which may be loaded then.
    const auto registered = _plugins;
    QVariantMap plugins;
    for (auto plugin = registered.begin(); plugin != registered.end(); ++plugin)
        plugins.insert(plugin.key(), plugin.value()->description());
    const auto texts = [](const QHash<QString, QString> &cache) {
        QVariantMap map;
        for (auto entry = cache.begin(); entry != cache.end(); ++entry)
            map.insert(entry.key(), entry.value());
        return map;
    };
    fields.add("_plugins", plugins);
    fields.add("_cachedDisplayNames", texts(_cachedDisplayNames));
    fields.add("_cachedImagePaths", texts(_cachedImagePaths));
    KAObject::describeFields(fields);
}

std::weak_ordering KAPluginIDCompare(const QString &first, const QString &second, void *)
{
    static const std::array<QString, 6> sOrderedIDs{kKAQuillanePluginID, kKAExchangePluginID, kKANimbrelPluginID,
                                                    kKAGooglePluginID,   kKAYahooPluginID,    kKAAOLPluginID};
    constexpr int kUnlisted = 100;
    const auto priority = [](const QString &identifier) {
        const auto *const found = std::find(sOrderedIDs.begin(), sOrderedIDs.end(), identifier);
        return found == sOrderedIDs.end() ? kUnlisted : static_cast<int>(found - sOrderedIDs.begin());
    };
    const auto order = priority(first) <=> priority(second);
    if (order != 0)
        return order;
    return first.compare(second, Qt::CaseInsensitive) <=> 0;
}
