// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAAccountCreator.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KAExtras.h>
#include <kavellaccounts/KAProvider.h>

#include "model/configuration.h"
#include "model/settings_reading.h"

namespace {

/// The chat service of each provider that has one of its own.
struct ServiceOfProvider {
    const QString &providerType;
    const QString &accountType;
};

const ServiceOfProvider kServices[] = {
    {kKAProviderNimbrel, KAChatAcctTypeNimbrel},     {kKAProviderYahoo, KAChatAcctTypeYahoo},
    {kKAProviderGoogle, KAChatAcctTypeGoogle},       {kKAProviderAOL, KAChatAcctTypeAIM},
    {kKAProviderHaldenServer, KAChatAcctTypeJabber},
};

}  // namespace

std::shared_ptr<KAParlexAccountCreator>
KAParlexAccountCreator::initWithSettings(const std::optional<QVariantMap> &settings, KADataPlugin *plugin)
{
    return owned(new KAParlexAccountCreator(settings, plugin));
}

KAParlexAccountCreator::~KAParlexAccountCreator() = default;

std::shared_ptr<KAAccountSetupInput> KAParlexAccountCreator::_input() const
{
    const auto input = std::make_shared<KAChatAccountSetupInput>();
    fillIn(*input, KAMailAccountDescriptionKey);
    const QString loginName = settingsText(KAChatLoginNameKey);
    input->setLoginName(loginName.isNull() ? settingsText(KACalendarUserNameKey) : loginName);
    input->setAccountType(settingsText(KAChatAccountTypeKey));
    input->setServerName(settingsText(KAChatServerKey));
    input->setServerPort(kavell::integerForKey(settings(), KAChatServerPortKey));
    input->setUseSSL(kavell::isTrueForKey(settings(), KAChatUseSSLKey));
    input->setUseKerberosV5(kavell::isTrueForKey(settings(), KAChatUseKerberosV5Key));

    const QString address = settingsText(KAMailEmailAddressKey);
    if (isBareName(input->loginName()) && providerIs(kKAProviderGoogle))
        input->setLoginName(address);
    for (const ServiceOfProvider &service : kServices) {
        if (providerIs(service.providerType))
            input->setAccountType(service.accountType);
    }
    if (providerIs(kKAProviderNimbrel)) {
        // Addresses of the older mail domain chat at the older service, under the user's bare name as all do there.
        if (address.contains(kavell::configuration::kDorvexMailDomain))
            input->setAccountType(KAChatAcctTypeDorvex);
        input->setLoginName(KAExtras::emailUserName(input->loginName()));
    }
    return input;
}
