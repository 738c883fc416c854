// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// From services to applications and plug-ins, and from UIDs to accounts.

#include <algorithm>
#include <array>

#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KAApplication.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KADataPlugin.h>
#include <kavellaccounts/KAExtras.h>
#include <kavellaccounts/KAPluginManager.h>
#include <kavellaccounts/KAProvider.h>

#include "platform/qt/workspace.h"

namespace {

using Application = std::shared_ptr<KAApplication>;

/// The application that uses each service.
struct ServiceRow {
    const QString &service;
    Application (KAPluginManager::*application)();
};

const std::array<ServiceRow, 11> kApplicationsOfServices{{
    {kKAServiceIMAP, &KAPluginManager::mailApp},
    {kKAServicePOP, &KAPluginManager::mailApp},
    {kKAServiceExchangeMail, &KAPluginManager::mailApp},
    {kKAServiceCalDAV, &KAPluginManager::tidewellApp},
    {kKAServiceExchangeCalendar, &KAPluginManager::tidewellApp},
    {kKAServiceIM, &KAPluginManager::parlexApp},
    {kKAServicePhotos, &KAPluginManager::luminelApp},
    {kKAServiceCustomContacts, &KAPluginManager::cardellApp},
    {kKAServiceExchangeContacts, &KAPluginManager::cardellApp},
    {kKAServiceCardDAV, &KAPluginManager::cardellApp},
    {kKAServiceLDAP, &KAPluginManager::cardellApp},
}};

/// The name that each known application is found by on the disk.
struct KnownApplication {
    const QString &bundleID;
    const char *name;
};

const std::array<KnownApplication, 5> kKnownApplications{{
    {kKAMailAppID, "Mail"},
    {kKATidewellAppID, "Tidewell"},
    {kKAParlexAppID, "Parlex"},
    {kKALuminelAppID, "Luminel"},
    {kKACardellAppID, "Cardell Book"},
}};

/// What the user knows the application as: what the platform says, else its own name.
QString displayNameOf(const QString &applicationName)
{
    const QString path = kavell::pathForApplication(applicationName);
    const QString name = path.isNull() ? QString() : kavell::displayNameAtPath(path);
    return name.isEmpty() ? applicationName : name;
}

bool providesOneOf(const KAPlugin &plugin, const QStringList &services)
{
    const std::shared_ptr<KAProvider> provider = plugin.provider();
    if (!provider)
        return false;
    const QStringList provided = provider->serviceTypesProvided();
    return std::any_of(services.begin(), services.end(),
                       [&](const QString &service) { return provided.contains(service); });
}

}  // namespace

std::shared_ptr<KAAccount> KAPluginManager::aListAccountContainingChildUID(const QString &childUID)
{
    for (KAAListPlugin *plugin : allAListPlugins()) {
        const std::shared_ptr<KAProvider> provider = plugin->provider();
        if (auto account = provider ? provider->aListAccountContainingChildUID(childUID) : nullptr)
            return account;
    }
    return nullptr;
}

std::optional<QVariantMap> KAPluginManager::childAccountWithUID(const QString &childUID)
{
    for (KAAListPlugin *plugin : allAListPlugins()) {
        const std::shared_ptr<KAProvider> provider = plugin->provider();
        if (!provider)
            continue;
        for (const std::shared_ptr<KAAccount> &account : provider->accounts()) {
            if (auto child = account->childAccountWithUID(childUID))
                return child;
        }
    }
    return std::nullopt;
}

std::shared_ptr<KAAccount> KAPluginManager::accountWithUID(const QString &uid)
{
    for (KAPlugin *plugin : allPlugins()) {
        const std::shared_ptr<KAProvider> provider = plugin->provider();
        if (auto account = provider ? provider->accountWithUID(uid) : nullptr)
            return account;
    }
    return nullptr;
}

template <typename Plugin> QList<Plugin *> KAPluginManager::pluginsSupportingServices(const QStringList &services)
{
    loadPlugins(std::nullopt);
    const std::lock_guard lock(m_registryLock);
    QList<Plugin *> plugins;
    for (KAPlugin *plugin : std::as_const(_plugins)) {
        auto *const wanted = qobject_cast<Plugin *>(plugin);
        if (wanted && providesOneOf(*plugin, services))
            plugins += wanted;
    }
    return plugins;
}

QList<KAAListPlugin *> KAPluginManager::aListPluginsSupportingServices(const QStringList &services)
{
    QList<KAAListPlugin *> plugins = pluginsSupportingServices<KAAListPlugin>(services);
    std::stable_sort(plugins.begin(), plugins.end(), [](const KAAListPlugin *first, const KAAListPlugin *second) {
        return KAPluginIDCompare(first->identifier(), second->identifier()) < 0;
    });
    return plugins;
}

QList<KADataPlugin *> KAPluginManager::dataPluginsSupportingServices(const QStringList &services)
{
    return pluginsSupportingServices<KADataPlugin>(services);
}

QList<Application> KAPluginManager::applicationsForServices(const QStringList &services, QStringList *outServices)
{
    QList<Application> applications;
    QStringList pairedServices;
    for (const QString &service : services) {
        const Application application = applicationForService(service);
        const bool isNew =
            application && std::none_of(applications.begin(), applications.end(), [&](const auto &other) {
                return other->bundleID() == application->bundleID();
            });
        if (isNew) {
            applications += application;
            pairedServices += service;
        }
    }
    *outServices = pairedServices;
    return applications;
}

QList<Application> KAPluginManager::applicationsForServices(const QStringList &services)
{
    QStringList pairedServices;
    return applicationsForServices(services, &pairedServices);
}

Application KAPluginManager::applicationForService(const QString &service)
{
    for (const ServiceRow &row : kApplicationsOfServices) {
        if (row.service == service)
            return (this->*row.application)();
    }
    return nullptr;
}

Application KAPluginManager::cardellApp()
{
    return applicationWithBundleID(kKACardellAppID);
}

Application KAPluginManager::luminelApp()
{
    return nullptr;
}

Application KAPluginManager::parlexApp()
{
    return applicationWithBundleID(kKAParlexAppID);
}

Application KAPluginManager::tidewellApp()
{
    return applicationWithBundleID(kKATidewellAppID);
}

Application KAPluginManager::mailApp()
{
    return applicationWithBundleID(kKAMailAppID);
}

Application KAPluginManager::applicationWithBundleID(const QString &bundleID)
{
    const auto *const known = std::find_if(kKnownApplications.begin(), kKnownApplications.end(),
                                           [&](const KnownApplication &row) { return row.bundleID == bundleID; });
    if (known == kKnownApplications.end())
        return nullptr;
    const QString name = QString::fromUtf8(known->name);
    if (cachedDisplayNameForApp(bundleID).isNull())
        setCachedDisplayName(displayNameOf(name), bundleID);
    if (cachedImagePathForApp(bundleID).isNull())
        setCachedImagePath(KAExtras::iconPathForAppName(name), bundleID);

    Application application = KAApplication::initWithBundleID(bundleID);
    application->setDisplayName(cachedDisplayNameForApp(bundleID));
    application->setImagePath(cachedImagePathForApp(bundleID));
    return application;
}
