// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What the cross-application set-up offers: whose account it is, which applications could use it, which have it already.

#include <initializer_list>

#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KAApplication.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KACrossAppSetupViewController.h>
#include <kavellaccounts/KADataPlugin.h>
#include <kavellaccounts/KADescription.h>
#include <kavellaccounts/KAExtras.h>
#include <kavellaccounts/KAPluginManager.h>
#include <kavellaccounts/KAProvider.h>
#include <kavellaccounts/NBSShim.h>
#include <kavellaccounts/Ref.h>

#include "model/settings_reading.h"
#include "platform/qt/log.h"
#include "platform/qt/value_conversion.h"

namespace {

/// Set for an account of the newer online service that has no mail.
const QString kMailDisabledKey = QStringLiteral("mailDisabled");

/// The first of the keys that is there decides, even when its text is empty.
QString firstText(const QVariantMap &settings, std::initializer_list<const QString *> keys)
{
    for (const QString *key : keys) {
        if (const QString text = kavell::textForKey(settings, *key); !text.isNull())
            return text;
    }
    return {};
}

/// What the online service calls the account of an application; none for those that it has nothing for.
CSKavellStringRef serviceOfApp(const QString &appBundleID)
{
    if (appBundleID == kKACardellAppID)
        return NBSShimGetStringConst("kNBServiceIDContacts");
    if (appBundleID == kKATidewellAppID)
        return NBSShimGetStringConst("kNBServiceIDCalendars");
    return nullptr;
}

/// The address at which the newer online service keeps the account's mail; null when it has none.
QString mailAddressOf(CSKavellStringRef account)
{
    const auto address = kavell::adopt(NBSShimServiceCopyProperty(
        account, NBSShimGetStringConst("kNBServiceIDMail"), NBSShimGetStringConst("kNBPropertyMailEmailAddress")));
    return kavell::toQString(kavell::cast<CSKavellStringRef>(address.get(), CSKavellStringGetTypeID()));
}

bool holdsAccount(const KADataPlugin &plugin, const QString &uid)
{
    const std::shared_ptr<KAProvider> provider = plugin.provider();
    return provider && provider->accountWithUID(uid);
}

}  // namespace

QString KACrossAppSetupViewController::_possibleCorvaneIDForSettings(const QVariantMap &settings)
{
    return firstText(settings, {&KACorvaneIDKey, &KAMailEmailAddressKey, &KAMailUserNameKey});
}

int KACrossAppSetupViewController::numberOfAppsNeedingSetup()
{
    if (!initDataIfNeeded())
        return 0;
    int count = 0;
    for (auto application = _apps.begin(); application != _apps.end(); ++application)
        count += !_accountIsEnabledForApp(application.key());
    return count;
}

/// A provider that was found is not looked for again, even when the account then proved to have no identifier; such
/// settings go on with no candidates.
bool KACrossAppSetupViewController::initDataIfNeeded()
{
    return !providerID().isNull() || _initData();
}

bool KACrossAppSetupViewController::_initData()
{
    const QString provider = _providerIDForSettings(settings());
    {
        const std::lock_guard lock(m_mutex);
        _providerID = provider;
    }
    if (provider.isNull())
        return false;
    _accountID = KAAccount::accountIdentifierForSettings(settings());
    if (_accountID.isNull())
        return false;
    if (_isBrondel())
        _fillInBrondelInfo();
    _findAccountsMatchingAccountID(_accountID);
    _findAppsForServices();
    _apps.remove(appBundleID());
    return true;
}

QString KACrossAppSetupViewController::providerID() const
{
    const std::lock_guard lock(m_mutex);
    return _providerID;
}

bool KACrossAppSetupViewController::_isBrondel() const
{
    return providerID() == kKAProviderQuillane;
}

QString KACrossAppSetupViewController::_providerIDForSettings(const QVariantMap &settings)
{
    const QString name = _possibleCorvaneIDForSettings(settings);
    if (!name.isNull() && KAAccount::corvaneIDIsBrondel(name))
        return kKAProviderQuillane;
    const QString address = firstText(
        settings, {&KAMailEmailAddressKey, &KAMailIncomingMailServerKey, &KACardellServerAddressKey, &KAChatServerKey});
    return _providerIDForServerAddress(address.contains(u'@') ? KAExtras::emailHostName(address) : address);
}

QString KACrossAppSetupViewController::_providerIDForServerAddress(const QString &serverAddress)
{
    if (serverAddress.isNull())
        return {};
    KAPluginManager *const manager = KAPluginManager::shared();
    const QString pluginID = manager->pluginIDForDomain(KAExtras::urlDomain(serverAddress.toLower()));
    const KAPlugin *const plugin = pluginID.isNull() ? nullptr : manager->pluginWithIdentifier(pluginID);
    const std::shared_ptr<KAProvider> provider = plugin ? plugin->provider() : nullptr;
    return provider ? provider->providerType() : QString();
}

void KACrossAppSetupViewController::_fillInBrondelInfo()
{
    const QString name = _possibleCorvaneIDForSettings(settings());
    if (name.isNull()) {
        kavell::log(QStringLiteral("*** Couldn't determine Corvane ID"));
        return;
    }
    const auto account = kavell::toStoreString(name);
    NBSShimAccountRefreshLoggedIn(account.get());
    const QString address = mailAddressOf(account.get());
    const std::lock_guard lock(m_mutex);
    _settings.insert(KACorvaneIDKey, name);
    _settings.insert(KAMailEmailAddressKey, address.isNull() ? name : address);
    if (address.isNull())
        _settings.insert(kMailDisabledKey, QStringLiteral("yes"));
}

void KACrossAppSetupViewController::_findAccountsMatchingAccountID(const QString &accountID)
{
    _existingAccounts.clear();
    KAPluginManager *const manager = KAPluginManager::shared();
    const QString sourcePluginID = manager->pluginIDForAppBundleID(appBundleID());
    QList<KADataPlugin *> plugins;
    if (_isBrondel())
        plugins = {qobject_cast<KADataPlugin *>(manager->pluginWithIdentifier(kKAMailPluginID))};
    else
        plugins = manager->allDataPlugins();
    for (KADataPlugin *plugin : std::as_const(plugins)) {
        if (plugin && plugin->identifier() != sourcePluginID)
            findMatchingAccounts(*plugin, accountID);
    }
}

/// A later match for the same application takes the place of an earlier one.
void KACrossAppSetupViewController::findMatchingAccounts(KADataPlugin &plugin, const QString &accountID)
{
    const QString app = KAPluginManager::shared()->appBundleIDForPluginID(plugin.identifier());
    const QStringList uids = plugin.accountUIDs();
    for (const QString &uid : uids) {
        if (holdsAccount(plugin, uid))
            continue;
        const QVariantMap accountSettings = plugin.settingsForAccountUID(uid);
        if (accountSettings.isEmpty())
            kavell::log(QStringLiteral("*** Settings for %1 were empty").arg(KADescription(uid)));
        else if (KAAccount::accountIdentifierForSettings(accountSettings) == accountID && !app.isNull())
            _existingAccounts.insert(app, accountSettings);
    }
}

void KACrossAppSetupViewController::_findAppsForServices()
{
    _apps.clear();
    KAPluginManager *const manager = KAPluginManager::shared();
    const std::shared_ptr<KAProvider> provider = manager->providerOfType(providerID());
    if (!provider)
        return;
    const bool hasMail = !kavell::hasValueForKey(settings(), kMailDisabledKey);
    for (const auto &application : manager->applicationsForServices(provider->serviceTypesProvided())) {
        const QString bundleID = application->bundleID();
        if (isDestination(bundleID) && (hasMail || bundleID != kKAMailAppID))
            _apps.insert(bundleID, application);
    }
}

bool KACrossAppSetupViewController::_accountIsEnabledForApp(const QString &appBundleID) const
{
    if (_isBrondel() && appBundleID != kKAMailAppID) {
        const CSKavellStringRef service = serviceOfApp(appBundleID);
        if (!service) {
            kavell::log(QStringLiteral("*** Warning: Couldn't determine service ID in _accountIsEnabledForApp."));
            return false;
        }
        const QString name = _possibleCorvaneIDForSettings(settings());
        return NBSShimServiceIsEnabled(kavell::toStoreString(name).get(), service);
    }
    const auto existing = _existingAccounts.find(appBundleID);
    return existing != _existingAccounts.end() && !kavell::isTrueForKey(*existing, KAMailInactiveAccountKey);
}
