// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAAccountCreator.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KAProvider.h>

std::shared_ptr<KATidewellAccountCreator>
KATidewellAccountCreator::initWithSettings(const std::optional<QVariantMap> &settings, KADataPlugin *plugin)
{
    return owned(new KATidewellAccountCreator(settings, plugin));
}

KATidewellAccountCreator::~KATidewellAccountCreator() = default;

std::shared_ptr<KAAccountSetupInput> KATidewellAccountCreator::_input() const
{
    const auto input = std::make_shared<KACalDAVAccountSetupInput>();
    fillIn(*input, KACalendarAccountDescriptionKey);
    input->setUserName(settingsText(KACalendarUserNameKey));
    input->setEmailAddress(settingsText(KACalendarEmailAddressKey));
    if (isBareName(input->userName()) && providerIs(kKAProviderGoogle))
        input->setUserName(input->emailAddress());
    if (provider())
        input->setServerAddress(provider()->rootHost());
    return input;
}
