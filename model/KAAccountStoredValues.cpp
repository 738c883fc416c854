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

/// Reads what other processes stored since this one looked: all accounts are one value, so that what is written next
/// would go over theirs. Whether the file could be read.
bool readOthers()
{
    return KADefaults::shared()->synchronize();
}

/// Writes at once, unless the file could not even be read: that is in the log once, and the next change tries again.
void storeAccounts(const QVariantMap &accounts, bool canBeRead)
{
    const auto defaults = KADefaults::shared();
    defaults->setObject(accounts, kAccountsKey);
    if (canBeRead)
        defaults->synchronize();
}

}  // namespace

void KAAccount::storeValue(const QVariant &value, const QString &key)
{
    const QString login = loginName();
    if (login.isNull() || key.isNull())
        return;
    const bool canBeRead = readOthers();
    QVariantMap accounts = storedAccounts();
    QVariantMap entry = accounts.value(login).toMap();
    if (isNothing(value))
        entry.remove(key);
    else
        entry.insert(key, value);
    accounts.insert(login, entry);
    // What the preferences would refuse is refused here, in its place among the others, where the log can name the key.
    if (toStoreEntry(accounts, key))
        storeAccounts(accounts, canBeRead);
}

QVariant KAAccount::storedValueForKey(const QString &key) const
{
    return key.isNull() ? QVariant() : storedValues(loginName()).value(key);
}

void KAAccount::removeStoredData()
{
    const QString login = loginName();
    if (login.isNull())
        return;
    const bool canBeRead = readOthers();
    if (!KADefaults::shared()->objectForKey(kAccountsKey).isValid())
        return;
    QVariantMap accounts = storedAccounts();
    accounts.remove(login);
    storeAccounts(accounts, canBeRead);
}

void KAAccount::mergeStoredData()
{
    const QVariantMap entry = storedValues(loginName());
    for (auto stored = entry.begin(); stored != entry.end(); ++stored)
        if (isNothing(providerAttributeForKey(stored.key())))
            setProviderAttribute(stored.value(), stored.key());
}
