// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The account as a face of its record: making it, the record's attributes, password and pending changes, volatile
// attributes. What is asked about accounts is in KAAccountQuestions.cpp, the side store in KAAccountStoredValues.cpp,
// child accounts and settings in KAAccountChildren.cpp, the choice of a plug-in in KAAccountIdentification.cpp.

#include <kavellaccounts/KAAccount.h>

#include <kavellaccounts/CSKavellAccountConstants.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KAFieldList.h>
#include <kavellaccounts/KANimbrelAccount.h>

#include "model/new_record.h"
#include "model/settings_reading.h"
#include "platform/qt/value_conversion.h"

using namespace kavell;

std::shared_ptr<KAAccount> KAAccount::accountWithProviderType(const QString &providerType, const QString &loginName)
{
    if (providerType == kKAProviderNimbrel)
        return KANimbrelAccount::initWithProviderType(providerType, loginName);
    return initWithProviderType(providerType, loginName);
}

std::shared_ptr<KAAccount> KAAccount::accountWithCSKavellAccount(CSKavellAccountRef account)
{
    // Compared as the store has it: a provider's list makes an object for each of its accounts.
    const auto providerType = adopt(_CSKavellAccountCopyProviderType(account));
    if (!providerType)
        return nullptr;
    if (CSKavellEqual(providerType.get(), kCSKavellAccountProviderNimbrel))
        return KANimbrelAccount::initWithCSKavellAccount(account);
    return initWithCSKavellAccount(account);
}

bool KAAccount::useLocalStorage()
{
    return false;
}

std::shared_ptr<KAAccount> KAAccount::initWithCSKavellAccount(CSKavellAccountRef account)
{
    return std::shared_ptr<KAAccount>(new KAAccount(account));
}

std::shared_ptr<KAAccount> KAAccount::initWithProviderType(const QString &providerType, const QString &loginName)
{
    const auto record = newRecord(providerType, loginName);
    return record ? initWithCSKavellAccount(record.get()) : nullptr;
}

KAAccount::KAAccount(CSKavellAccountRef account) : _accountRef(retain(account))
{
}

KAAccount::~KAAccount() = default;

CSKavellAccountRef KAAccount::accountRef() const
{
    return _accountRef.get();
}

QString KAAccount::provider() const
{
    return toQString(adopt(_CSKavellAccountCopyProviderType(accountRef())).get());
}

QString KAAccount::loginName() const
{
    return toQString(adopt(_CSKavellAccountCopyLoginName(accountRef())).get());
}

QString KAAccount::uid() const
{
    return toQString(adopt(_CSKavellAccountCopyUUIDString(accountRef())).get());
}

void KAAccount::setUID(const QString &uid)
{
    if (const auto entry = toStoreEntry(uid, QStringLiteral("uid")))
        _CSKavellAccountSetUUIDString(accountRef(), static_cast<CSKavellStringRef>(entry->object.get()));
}

QString KAAccount::fullName() const
{
    const auto name = adopt(_CSKavellAccountCopyProviderAttribute(accountRef(), kCSKavellAccountUserFullName));
    return textOf(toVariant(name.get()));
}

void KAAccount::setFullName(const QString &fullName)
{
    setProviderAttribute(fullName, toQString(kCSKavellAccountUserFullName));
}

QString KAAccount::nickname() const
{
    return fullName();
}

void KAAccount::setNickname(const QString &nickname)
{
    setProviderAttribute(nickname, toQString(kCSKavellAccountUserNickname));
}

QVariantMap KAAccount::providerAttributes() const
{
    return toVariantMap(adopt(_CSKavellAccountCopyProviderAttributes(accountRef())).get());
}

void KAAccount::setProviderAttributes(const QVariantMap &attributes)
{
    if (const auto dictionary = toStoreDictionary(attributes))
        _CSKavellAccountSetProviderAttributes(accountRef(), dictionary->get());
}

void KAAccount::removeAllProviderAttributes()
{
    _CSKavellAccountRemoveAllProviderAttributes(accountRef());
}

QVariant KAAccount::providerAttributeForKey(const QString &key) const
{
    return toVariant(adopt(_CSKavellAccountCopyProviderAttribute(accountRef(), toStoreString(key).get())).get());
}

void KAAccount::setProviderAttribute(const QVariant &value, const QString &key)
{
    if (const auto entry = toStoreEntry(value, key))
        _CSKavellAccountSetProviderAttribute(accountRef(), entry->key.get(), entry->object.get());
}

void KAAccount::removeProviderAttributeForKey(const QString &key)
{
    _CSKavellAccountRemoveProviderAttribute(accountRef(), toStoreString(key).get());
}

QVariantMap KAAccount::attributesForService(const QString &service) const
{
    return toVariantMap(adopt(_CSKavellAccountCopyServiceAttributes(accountRef(), toStoreString(service).get())).get());
}

void KAAccount::setAttributes(const QVariantMap &attributes, const QString &service)
{
    const auto dictionary = toStoreDictionary(attributes);
    const auto serviceID = dictionary ? toStoreKey(service) : std::nullopt;
    if (serviceID)
        _CSKavellAccountSetServiceAttributes(accountRef(), serviceID->get(), dictionary->get());
}

void KAAccount::removeAllAttributesForService(const QString &service)
{
    _CSKavellAccountRemoveAllServiceAttributes(accountRef(), toStoreString(service).get());
}

QVariant KAAccount::attributeForKey(const QString &key, const QString &service) const
{
    const auto value = adopt(
        _CSKavellAccountCopyServiceAttribute(accountRef(), toStoreString(service).get(), toStoreString(key).get()));
    return toVariant(value.get());
}

void KAAccount::setAttribute(const QVariant &value, const QString &key, const QString &service)
{
    const auto entry = toStoreEntry(value, key);
    const auto serviceID = entry ? toStoreKey(service) : std::nullopt;
    if (serviceID)
        _CSKavellAccountSetServiceAttribute(accountRef(), serviceID->get(), entry->key.get(), entry->object.get());
}

void KAAccount::removeAttributeForKey(const QString &key, const QString &service)
{
    _CSKavellAccountRemoveServiceAttribute(accountRef(), toStoreString(service).get(), toStoreString(key).get());
}

QString KAAccount::password() const
{
    return toQString(adopt(_CSKavellAccountCopyPassword(accountRef())).get());
}

bool KAAccount::setPassword(const QString &password)
{
    // What is no whole text would be stored as another password than the one given.
    if (!password.isValidUtf16())
        return false;
    return static_cast<bool>(adopt(_CSKavellAccountSetPassword(accountRef(), toSecretString(password).get())));
}

void KAAccount::removePassword()
{
    _CSKavellAccountRemovePassword(accountRef());
}

CSKavellCofferelItemRef KAAccount::cofferelItem() const
{
    return _CSKavellAccountCopyCofferelItem(accountRef());
}

void KAAccount::setCofferelItem(CSKavellCofferelItemRef item)
{
    _CSKavellAccountSetCofferelItem(accountRef(), item);
}

bool KAAccount::hasPendingChanges() const
{
    return _CSKavellAccountHasPendingChanges(accountRef());
}

void KAAccount::cancelPendingChanges()
{
    _CSKavellAccountCancelChanges(accountRef());
}

// Nothing to do in both: the record is committed by whoever decides when, and removed by its provider.
void KAAccount::commitPendingChanges()
{
}

void KAAccount::removeAccount()
{
}

QVariant KAAccount::volatileAttributeForKey(const QString &key) const
{
    return _private && !key.isNull() ? _private->value(key) : QVariant();
}

void KAAccount::setVolatileAttribute(const QVariant &value, const QString &key)
{
    if (key.isNull())
        return;
    if (!_private)
        _private.emplace();
    if (isNothing(value))
        _private->remove(key);
    else
        _private->insert(key, value);
}

void KAAccount::describeFields(KAFieldList &fields) const
{
    fields.add("_accountRef", _accountRef);
    fields.add("_private", _private);
    KAObject::describeFields(fields);
}
