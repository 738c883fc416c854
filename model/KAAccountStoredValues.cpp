// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The side store of an account: values in the user's preferences, under "Accounts" by login name. Deliberately by
// nothing else, so that accounts of one login name share them whatever their provider. Threading as KAAccount.

#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KADefaults.h>

#include "model/settings_reading.h"
#include "platform/qt/value_conversion.h"

using namespace kavell;

namespace {

const QString kAccountsKey = QStringLiteral("Accounts");

QVariantMap storedAccounts()
{
    return KADefaults::shared()->objectForKey(kAccountsKey).toMap();
}

/// The values stored under a login name; none under a null one, which is not the empty one.
QVariantMap storedValues(const QString &loginName)
{
    return loginName.isNull() ? QVariantMap() : storedAccounts().value(loginName).toMap();
}

void storeAccounts(const QVariantMap &accounts)
{
    const auto defaults = KADefaults::shared();
    defaults->setObject(accounts, kAccountsKey);
    defaults->synchronize();
}

}  // namespace

void KAAccount::storeValue(const QVariant &value, const QString &key)
{
    const QString login = loginName();
    if (login.isNull() || key.isNull())
        return;
    QVariantMap accounts = storedAccounts();
    QVariantMap entry = accounts.value(login).toMap();
    if (isNothing(value))
        entry.remove(key);
    else
        entry.insert(key, value);
    accounts.insert(login, entry);
    // What the preferences would refuse is refused here, in its place among the others, where the log can name the key.
    if (toStoreEntry(accounts, key))
        storeAccounts(accounts);
}

QVariant KAAccount::storedValueForKey(const QString &key) const
{
    return key.isNull() ? QVariant() : storedValues(loginName()).value(key);
}

void KAAccount::removeStoredData()
{
    const QString login = loginName();
    if (login.isNull() || !KADefaults::shared()->objectForKey(kAccountsKey).isValid())
        return;
    QVariantMap accounts = storedAccounts();
    accounts.remove(login);
    storeAccounts(accounts);
}

void KAAccount::mergeStoredData()
{
    const QVariantMap entry = storedValues(loginName());
    for (auto stored = entry.begin(); stored != entry.end(); ++stored)
        if (isNothing(providerAttributeForKey(stored.key())))
            setProviderAttribute(stored.value(), stored.key());
}
