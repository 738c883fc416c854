// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The child accounts of an account-list account, kept in one provider attribute: a dictionary from the UID that a
// client application knows its account by to the child's settings.

#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KADataPlugin.h>
#include <kavellaccounts/KAPluginManager.h>

#include "model/settings_reading.h"

using kavell::textForKey;

namespace {

const QString kUIDKey = QStringLiteral("uid");
const QString kPluginIDKey = QStringLiteral("pluginID");

bool isDictionary(const QVariant &value)
{
    return value.metaType().id() == QMetaType::QVariantMap;
}

/// The children by UID; nothing for an account that never had one.
std::optional<QVariantMap> childrenOf(const KAAccount &account)
{
    const QVariant children = account.providerAttributeForKey(kKAAccountSettingChildAccounts);
    return isDictionary(children) ? std::optional(children.toMap()) : std::nullopt;
}

/// Whether a child belongs to the plug-in. One without a plug-in identifier belongs to nobody, which differs from an
/// empty identifier.
bool belongsTo(const QVariant &child, const QString &pluginID)
{
    const QString own = textForKey(child.toMap(), kPluginIDKey);
    return !own.isNull() && !pluginID.isNull() && own == pluginID;
}

/// Whether the client application keeps the child's account inactive. Only its plug-in knows; one that is not loaded is
/// not asked.
bool isInactive(const QString &pluginID, const QString &uid)
{
    auto *const plugin = qobject_cast<KADataPlugin *>(KAPluginManager::shared()->pluginWithIdentifier(pluginID));
    return plugin && kavell::isTrueForKey(plugin->settingsForAccountUID(uid), KAMailInactiveAccountKey);
}

}  // namespace

QVariantMap KAAccount::childDictionaryWithSettings(const QVariantMap &settings, const QString &uid,
                                                   const QString &pluginID)
{
    QVariantMap child;
    if (!uid.isNull()) {
        child.insert(kUIDKey, uid);
        if (!pluginID.isNull())
            child.insert(kPluginIDKey, pluginID);
    }
    // Password and inactive flag stay with the client application. A setting called "uid" or "pluginID" wins.
    for (auto setting = settings.begin(); setting != settings.end(); ++setting) {
        const bool staysBehind = setting.key() == KAMailInactiveAccountKey || setting.key() == KAMailPasswordKey;
        if (!staysBehind && !kavell::isNothing(setting.value()))
            child.insert(setting.key(), setting.value());
    }
    return child;
}

void KAAccount::addChildAccountDict(const QVariantMap &child, const QString &accountUID)
{
    if (accountUID.isNull())
        return;
    QVariantMap children = childrenOf(*this).value_or(QVariantMap());
    const QString pluginID = textForKey(child, kPluginIDKey);
    children.removeIf([&](const auto &entry) { return belongsTo(entry.value(), pluginID); });
    children.insert(accountUID, child);
    setProviderAttribute(children, kKAAccountSettingChildAccounts);
    commitPendingChanges();
}

std::optional<QVariantMap> KAAccount::childAccountWithPluginID(const QString &pluginID) const
{
    for (const QVariantMap &child : allChildAccounts()) {
        if (belongsTo(child, pluginID))
            return child;
    }
    return std::nullopt;
}

std::optional<QVariantMap> KAAccount::childAccountWithUID(const QString &uid) const
{
    const std::optional<QVariantMap> children = childrenOf(*this);
    const QVariant child = children && !uid.isNull() ? children->value(uid) : QVariant();
    return isDictionary(child) ? std::optional(child.toMap()) : std::nullopt;
}

QList<QVariantMap> KAAccount::allChildAccounts() const
{
    QList<QVariantMap> all;
    for (const QVariant &child : childrenOf(*this).value_or(QVariantMap())) {
        if (isDictionary(child))
            all += child.toMap();
    }
    return all;
}

void KAAccount::removeChildAccountWithUID(const QString &uid)
{
    std::optional<QVariantMap> children = childrenOf(*this);
    if (!children)
        return;
    if (!uid.isNull())
        children->remove(uid);
    setProviderAttribute(*children, kKAAccountSettingChildAccounts);
    commitPendingChanges();
}

std::optional<QStringList> KAAccount::enabledApplications(bool includeInactive) const
{
    if (provider() == kKAProviderQuillane)
        return std::nullopt;
    const std::optional<QVariantMap> children = childrenOf(*this);
    if (!children)
        return std::nullopt;
    QStringList applications;
    for (auto child = children->begin(); child != children->end(); ++child) {
        const QString pluginID = textForKey(child.value().toMap(), kPluginIDKey);
        const QString application = KAPluginManager::shared()->appBundleIDForPluginID(pluginID);
        if (!includeInactive && isInactive(pluginID, child.key()))
            continue;
        if (!application.isNull() && !applications.contains(application))
            applications += application;
    }
    return applications;
}
