// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The process-wide registry of plug-ins: finds bundles (".kaplugin") in the directories of VESK_FRAMEWORK_PATH and then
// in /System/Library/KavellAccounts, makes one plug-in object for each bundle identifier, and answers which plug-in
// serves a domain, a provider type or an application, and which account-list account a client's account belongs to.
//
// Nothing is read before the first question. Each question that lists plug-ins searches the directories again, so that a
// bundle added meanwhile is found; a registered plug-in is never replaced or removed. A bundle that cannot be loaded
// costs one line in the log ("com.corvane.kavellaccounts") and is skipped. Registered plug-ins live on the main thread
// and are handed out as plain pointers that stay valid.
//
// Any thread may ask, after the first `shared`. Caches of application names and icons belong to the main thread.

#ifndef KAVELLACCOUNTS_KAPLUGINMANAGER_H
#define KAVELLACCOUNTS_KAPLUGINMANAGER_H

#include <compare>
#include <memory>
#include <mutex>
#include <optional>
#include <string>

#include <QtCore/QHash>
#include <QtCore/QList>
#include <QtCore/QString>
#include <QtCore/QStringList>
#include <QtCore/QVariantMap>

#include <kavellaccounts/KAExport.h>
#include <kavellaccounts/KAObject.h>

class KAAListPlugin;
class KAAccount;
class KAAccountSetupInput;
class KAAccountSetupResult;
class KAApplication;
class KABundle;
class KADataPlugin;
class KADecisionTrace;
class KAPlugin;
class KAProvider;

class KAVELL_ACCOUNTS_EXPORT KAPluginManager : public KAObject {
public:
    /// The one manager, which is never released. The first call must not be raced.
    [[nodiscard]] static KAPluginManager *shared();

    KAPluginManager();
    ~KAPluginManager() override;

    /// @name Domains, providers, applications. Null for what nobody claims
    /// @{

    /// The service types of the plug-in that serves a domain; null when no plug-in does.
    [[nodiscard]] std::optional<QStringList> servicesForDomain(const QString &domain);

    /// The account-list plug-in that serves a domain, else kKAGooglePluginID for one whose mail Google hosts, which is
    /// a DNS lookup of up to half a second.
    [[nodiscard]] QString pluginIDForDomain(const QString &domain, KADecisionTrace *trace = nullptr);
    [[nodiscard]] QString pluginIDForProviderID(const QString &providerType) const;
    [[nodiscard]] QString pluginIDForAppBundleID(const QString &appBundleID) const;
    [[nodiscard]] QString appBundleIDForPluginID(const QString &pluginID) const;

    /// The provider that the provider type's plug-in has set.
    [[nodiscard]] std::shared_ptr<KAProvider> providerOfType(const QString &providerType);
    /// @}

    /// @name Which account-list account does a client application's account belong to? Never makes an account; null
    /// when there is none. May block on DNS lookups of half a second each
    /// @{

    /// By the application's settings and the data plug-in that it is served by.
    [[nodiscard]] std::shared_ptr<KAAccount> matchingAListAccountForAccountSettings(const QVariantMap &settings,
                                                                                    const QString &pluginID,
                                                                                    KADecisionTrace *trace = nullptr);

    /// By what is being set up. `discoveredResult` is not looked at.
    [[nodiscard]] std::shared_ptr<KAAccount>
    matchingAListAccountForSetupInput(const std::shared_ptr<KAAccountSetupInput> &input,
                                      const std::shared_ptr<KAAccountSetupResult> &discoveredResult);

    [[nodiscard]] std::shared_ptr<KAAccount>
    _matchingAlistAccountForMailAccountSettings(const QVariantMap &settings, KADecisionTrace *trace = nullptr);
    [[nodiscard]] std::shared_ptr<KAAccount>
    _matchingAlistAccountForCalendarAccountSettings(const QVariantMap &settings, KADecisionTrace *trace = nullptr);
    [[nodiscard]] std::shared_ptr<KAAccount>
    _matchingAlistAccountForContactsAccountSettings(const QVariantMap &settings, KADecisionTrace *trace = nullptr);
    [[nodiscard]] std::shared_ptr<KAAccount>
    _matchingAlistAccountForChatAccountSettings(const QVariantMap &settings, KADecisionTrace *trace = nullptr);
    /// @}

    /// @name Accounts by UID, over the providers of all plug-ins; null when there is none
    /// @{
    [[nodiscard]] std::shared_ptr<KAAccount> aListAccountContainingChildUID(const QString &childUID);
    [[nodiscard]] std::optional<QVariantMap> childAccountWithUID(const QString &childUID);
    [[nodiscard]] std::shared_ptr<KAAccount> accountWithUID(const QString &uid);
    /// @}

    /// @name Services to plug-ins and applications
    /// @{

    /// Plug-ins whose provider offers one of the services, in the order of presentation (KAPluginIDCompare).
    [[nodiscard]] QList<KAAListPlugin *> aListPluginsSupportingServices(const QStringList &services);

    /// The same, in no particular order.
    [[nodiscard]] QList<KADataPlugin *> dataPluginsSupportingServices(const QStringList &services);

    /// The applications that use the services, each once, in the order of their first service, which `outServices`
    /// (must be given) receives at the same place.
    [[nodiscard]] QList<std::shared_ptr<KAApplication>> applicationsForServices(const QStringList &services,
                                                                                QStringList *outServices);
    [[nodiscard]] QList<std::shared_ptr<KAApplication>> applicationsForServices(const QStringList &services);
    [[nodiscard]] std::shared_ptr<KAApplication> applicationForService(const QString &service);

    [[nodiscard]] std::shared_ptr<KAApplication> cardellApp();
    [[nodiscard]] std::shared_ptr<KAApplication> luminelApp();  ///< always null: photos are deliberately not offered
    [[nodiscard]] std::shared_ptr<KAApplication> parlexApp();
    [[nodiscard]] std::shared_ptr<KAApplication> tidewellApp();
    [[nodiscard]] std::shared_ptr<KAApplication> mailApp();

    /// A new object for a known application, with the name and icon path that the platform gave when it was first
    /// asked; null for an unknown one.
    [[nodiscard]] std::shared_ptr<KAApplication> applicationWithBundleID(const QString &bundleID);

    void setCachedImagePath(const QString &imagePath, const QString &appBundleID);
    [[nodiscard]] QString cachedImagePathForApp(const QString &appBundleID) const;
    void setCachedDisplayName(const QString &displayName, const QString &appBundleID);
    [[nodiscard]] QString cachedDisplayNameForApp(const QString &appBundleID) const;
    /// @}

    /// @name Plug-ins
    /// @{

    /// Searches no directory once the identifier is registered.
    [[nodiscard]] KAPlugin *pluginWithIdentifier(const QString &identifier);
    [[nodiscard]] QList<KAAListPlugin *> allAListPlugins();
    [[nodiscard]] QList<KADataPlugin *> allDataPlugins();
    [[nodiscard]] QList<KAPlugin *> allPlugins();

    /// Searches the directories for these plug-ins, or for all of them when `identifiers` is null; nothing is searched
    /// when all are registered, an empty list included.
    void loadPlugins(const std::optional<QStringList> &identifiers);

    /// The search itself, which loadPlugins calls under the registry's lock. What escapes from it, from a subclass's
    /// too, ends the load with a line in the log.
    virtual void _loadPlugins(const std::optional<QStringList> &identifiers);
    void _loadPluginAtPath(const QString &path, const std::optional<QStringList> &identifiers);

    /// A plug-in of any bundle, outside the registry and without pluginDidLoad; the caller owns it. Null, with a line in
    /// the log, when it cannot be made.
    [[nodiscard]] std::unique_ptr<KAPlugin> createKAPluginAtPath(const QString &path);
    [[nodiscard]] std::unique_ptr<KAPlugin> _createPluginFromBundle(const std::shared_ptr<KABundle> &bundle);

    /// What became of one bundle, or of one directory, that a search met.
    struct BundleReport {
        enum class Outcome {
            Registered,      ///< the plug-in of this bundle is in the registry
            Shadowed,        ///< another bundle with this identifier came first
            WrongExtension,  ///< ".kaplugin" in another case of letters
            NoBundle,        ///< no readable information dictionary
            NoIdentifier,
            UnsupportedVersion,
            NotLoaded,           ///< the code could not be loaded
            NoObject,            ///< the code has no factory for the principal class, or that made nothing
            Threw,               ///< the rest of its directory was given up
            DirectoryMissing,    ///< nothing is at the path of the directory
            DirectoryNotListed,  ///< the directory cannot be listed, or its path is no URL path
        };
        QString path;
        QString identifier;  ///< null when it has none
        Outcome outcome;
        QString reason;  ///< a sentence for people; null for Registered
    };

    /// Searches all directories and says what was found where, in the order of the search. For tools that explain.
    [[nodiscard]] QList<BundleReport> surveyBundles();
    /// @}

    void describeFields(KAFieldList &fields) const override;

private:
    struct Search;

    template <typename Plugin> QList<Plugin *> _allPluginsForClass();
    template <typename Plugin> QList<Plugin *> pluginsSupportingServices(const QStringList &services);
    BundleReport loadBundle(const QString &path, const std::optional<QStringList> &identifiers);
    void surveyDirectory(const std::string &path, QList<BundleReport> &reports);

    mutable std::recursive_mutex m_registryLock;
    QHash<QString, KAPlugin *> _plugins;
    QHash<QString, QString> _cachedDisplayNames;
    QHash<QString, QString> _cachedImagePaths;
    std::unique_ptr<Search> m_search;
};

/// The order in which account-list plug-ins are shown: Quillane, Exchange, Nimbrel, Google, Yahoo, AOL, then all others
/// by identifier without regard to case. The context is ignored. Any thread.
[[nodiscard]] KAVELL_ACCOUNTS_EXPORT std::weak_ordering KAPluginIDCompare(const QString &first, const QString &second,
                                                                          void *context = nullptr);

/// Deletes whatever is at "~/Library/Kavell Accounts/V1/PROVIDER TYPE" and posts KADidResetDataNotification, with the
/// provider type as its object, to all processes. Done on the main thread; a call on another waits for that. What is no
/// single name (null, empty, ".", "..", or with "/" or a NUL in it) would reach the data of others: it is refused with a
/// line in the log.
KAVELL_ACCOUNTS_EXPORT void KAResetDataForProviderID(const QString &providerType);

#endif
