// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAProvider.h>

#include <kavellaccounts/CSKavellArray.h>
#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KADescription.h>
#include <kavellaccounts/KAFieldList.h>

#include "model/configuration.h"
#include "platform/qt/value_conversion.h"

using namespace kavell;

namespace {

struct RootHost {
    const QString &providerType;
    const QString &host;
};

const RootHost kRootHosts[] = {
    {kKAProviderYahoo, configuration::kYahooMailDomain},
    {kKAProviderGoogle, configuration::kGoogleMailDomain},
    {kKAProviderNimbrel, configuration::kNimbrelMailDomain},
    {kKAProviderAOL, configuration::kAOLMailDomain},
};

CSKavellAccountRef accountAt(const Ref<CSKavellArrayRef> &records, size_t index)
{
    return static_cast<CSKavellAccountRef>(const_cast<void *>(CSKavellArrayGetValueAtIndex(records.get(), index)));
}

}  // namespace

std::shared_ptr<KAProvider> KAProvider::initWithProviderType(const QString &providerType)
{
    return std::shared_ptr<KAProvider>(new KAProvider(providerType));
}

std::shared_ptr<KAProvider> KAProvider::exchangeProvider()
{
    return initWithProviderType(kKAProviderExchange);
}

std::shared_ptr<KAProvider> KAProvider::facebookProvider()
{
    return initWithProviderType(kKAProviderFacebook);
}

std::shared_ptr<KAProvider> KAProvider::nimbrelProvider()
{
    return initWithProviderType(kKAProviderNimbrel);
}

std::shared_ptr<KAProvider> KAProvider::googleProvider()
{
    return initWithProviderType(kKAProviderGoogle);
}

std::shared_ptr<KAProvider> KAProvider::yahooProvider()
{
    return initWithProviderType(kKAProviderYahoo);
}

KAProvider::KAProvider(const QString &providerType)
    : _providerRef(adopt(_CSKavellAccountProviderCreate(nullptr, toStoreString(providerType).get())))
{
}

KAProvider::~KAProvider() = default;

QString KAProvider::providerType() const
{
    return toQString(adopt(_CSKavellAccountProviderCopyProviderType(_providerRef.get())).get());
}

QStringList KAProvider::serviceTypesProvided() const
{
    return _servicesProvided.value_or(QStringList());
}

void KAProvider::setServiceTypesProvided(const QStringList &serviceTypes)
{
    _servicesProvided = serviceTypes;
}

QString KAProvider::description() const
{
    return KAObject::description() + QStringLiteral(" providerType: ") + KADescription(providerType());
}

QString KAProvider::rootHost() const
{
    const QString type = providerType();
    for (const RootHost &root : kRootHosts)
        if (type == root.providerType)
            return root.host;
    return {};
}

void KAProvider::reloadData()
{
    _CSKavellAccountProviderReloadAccountData(_providerRef.get());
}

QList<std::shared_ptr<KAAccount>> KAProvider::accounts() const
{
    const auto records = adopt(_CSKavellAccountProviderCopyAccounts(_providerRef.get()));
    const size_t count = CSKavellArrayGetCount(records.get());
    QList<std::shared_ptr<KAAccount>> accounts;
    accounts.reserve(static_cast<qsizetype>(count));
    for (size_t index = 0; index < count; ++index)
        accounts.append(KAAccount::accountWithCSKavellAccount(accountAt(records, index)));
    return accounts;
}

void KAProvider::addAccount(const std::shared_ptr<KAAccount> &account)
{
    if (account)
        _CSKavellAccountProviderAddAccount(_providerRef.get(), account->accountRef());
}

void KAProvider::removeAccount(const std::shared_ptr<KAAccount> &account)
{
    if (account)
        _CSKavellAccountProviderRemoveAccount(_providerRef.get(),
                                              adopt(_CSKavellAccountCopyLoginName(account->accountRef())).get());
}

bool KAProvider::hasAccountWithLoginName(const QString &loginName) const
{
    return static_cast<bool>(
        adopt(_CSKavellAccountProviderCopyAccount(_providerRef.get(), toStoreString(loginName).get(), false)));
}

std::shared_ptr<KAAccount> KAProvider::accountForLoginName(const QString &loginName, bool createIfMissing)
{
    if (loginName.isNull())
        return nullptr;
    const auto record =
        adopt(_CSKavellAccountProviderCopyAccount(_providerRef.get(), toStoreString(loginName).get(), createIfMissing));
    return record ? KAAccount::accountWithCSKavellAccount(record.get()) : nullptr;
}

std::shared_ptr<KAAccount> KAProvider::createAccountWithLoginName(const QString &loginName)
{
    return accountForLoginName(loginName, true);
}

std::shared_ptr<KAAccount> KAProvider::accountWithUID(const QString &uid) const
{
    if (uid.isNull())
        return nullptr;
    for (const auto &account : accounts())
        if (account->uid() == uid)
            return account;
    return nullptr;
}

std::shared_ptr<KAAccount> KAProvider::aListAccountContainingChildUID(const QString &childUID) const
{
    for (const auto &account : accounts())
        if (account->childAccountWithUID(childUID))
            return account;
    return nullptr;
}

void KAProvider::describeFields(KAFieldList &fields) const
{
    fields.add("_providerRef", _providerRef);
    fields.add("_servicesProvided", _servicesProvided);
    KAObject::describeFields(fields);
}
