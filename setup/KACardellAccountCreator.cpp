// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAAccountCreator.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KAProvider.h>

std::shared_ptr<KACardellAccountCreator>
KACardellAccountCreator::initWithSettings(const std::optional<QVariantMap> &settings, KADataPlugin *plugin)
{
    return owned(new KACardellAccountCreator(settings, plugin));
}

KACardellAccountCreator::~KACardellAccountCreator() = default;

std::shared_ptr<KAAccountSetupInput> KACardellAccountCreator::_input() const
{
    const auto input = std::make_shared<KACardDAVAccountSetupInput>();
    fillIn(*input, KAMailAccountDescriptionKey);
    input->setUserName(settingsText(KACalendarUserNameKey));  // the calendar's key, deliberately
    if (provider())
        input->setServerAddress(provider()->rootHost());
    if (isBareName(input->userName()) && providerIs(kKAProviderGoogle))
        input->setUserName(settingsText(KAMailEmailAddressKey));
    return input;
}
