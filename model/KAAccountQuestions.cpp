// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What is asked about an account: enabled, of which kind, equal to another, and its description. Threading as
// KAAccount.

#include <kavellaccounts/KAAccount.h>

#include <algorithm>
#include <iterator>

#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KADescription.h>
#include <kavellaccounts/KAExtras.h>

#include "model/configuration.h"
#include "model/settings_reading.h"

using namespace kavell;

namespace {

// The providers whose accounts the user sees in the account list. Yahoo stands there twice, harmlessly and
// deliberately: it is asked for first and once more.
const QString *const kAListProviders[] = {
    &kKAProviderYahoo,    &kKAProviderGoogle, &kKAProviderNimbrel, &kKAProviderQuillane,     &kKAProviderFacebook,
    &kKAProviderExchange, &kKAProviderYahoo,  &kKAProviderAOL,     &kKAProviderHaldenServer,
};

const QString *const kExchangeServices[] = {
    &kKAServiceExchangeMail,
    &kKAServiceExchangeContacts,
    &kKAServiceExchangeCalendar,
};

template <typename Table> bool isAmong(const Table &table, const QString &text)
{
    return std::any_of(std::begin(table), std::end(table), [&](const QString *row) { return *row == text; });
}

/// Nothing is not the same as anything, nor as nothing.
bool areSame(const QString &first, const QString &second)
{
    return !first.isNull() && !second.isNull() && first == second;
}

const QString kHidden = QStringLiteral("***");

}  // namespace

bool KAAccount::accountIsEnabled() const
{
    const QVariant disabled = providerAttributeForKey(kKAAccountSettingDisabled);
    return !(disabled.metaType().id() == QMetaType::Bool && disabled.toBool());
}

void KAAccount::setAccountEnabled(bool enabled)
{
    if (enabled)
        removeProviderAttributeForKey(kKAAccountSettingDisabled);
    else
        setProviderAttribute(true, kKAAccountSettingDisabled);
}

bool KAAccount::isAList() const
{
    return isAmong(kAListProviders, provider());
}

bool KAAccount::isExchange() const
{
    return isAmong(kExchangeServices, textOf(providerAttributeForKey(KAAccountTypeKey))) ||
           !textOf(providerAttributeForKey(KAExchangeInternalPathKey)).isEmpty();
}

bool KAAccount::enabledForApplication(const QString &appBundleID) const
{
    const auto applications = enabledApplications(false);
    return applications && applications->contains(appBundleID);
}

bool KAAccount::isEqual(const KAAccount &other) const
{
    if (this == &other)
        return true;
    const bool isSameProvider = areSame(provider(), other.provider());
    const QString login = loginName(), otherLogin = other.loginName();
    bool isSameLogin = areSame(login, otherLogin);
    const QString host = KAExtras::emailHostName(login);
    if (host == configuration::kNimbrelMailDomain || host == configuration::kDorvexMailDomain) {
        // One user has the same name at both of the maker's mail domains.
        const QString alternate = KAExtras::otherNimbrelOrDorvexEmail(login);
        if (!alternate.isNull()) {
            isSameLogin = isSameLogin || areSame(alternate, otherLogin);
            if (!isSameLogin)
                return false;
        }
    }
    return isSameProvider && isSameLogin;
}

QString KAAccount::description() const
{
    QVariantMap attributes = providerAttributes();
    if (hasTextForKey(attributes, KAMailPasswordKey))
        attributes.insert(KAMailPasswordKey, kHidden);
    return KAObject::description() + QStringLiteral(" -- uid: ") + KADescription(uid()) +
           QStringLiteral("; loginName: ") + KADescription(loginName()) + QStringLiteral("; provider: ") +
           KADescription(provider()) + QStringLiteral("\n\taccount ID: ") + KADescription(accountIdentifier()) +
           QStringLiteral("\n\tprovider attrs: ") + KADescription(QVariant(attributes));
}
