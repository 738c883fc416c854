// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KAAccountCreator.h>
#include <kavellaccounts/KAConstants.h>

#include "platform/qt/log.h"

std::shared_ptr<KAMailAccountCreator> KAMailAccountCreator::initWithSettings(const std::optional<QVariantMap> &settings,
                                                                             KADataPlugin *plugin)
{
    return owned(new KAMailAccountCreator(settings, plugin));
}

KAMailAccountCreator::~KAMailAccountCreator() = default;

std::shared_ptr<KAAccountSetupInput> KAMailAccountCreator::_input() const
{
    const auto input = std::make_shared<KAMailAccountSetupInput>();
    QString address = settingsText(KAMailEmailAddressKey);
    if (address.isNull()) {
        const KAAListPlugin *const listPlugin = accountListPlugin();
        const QString userName = settingsText(KAMailUserNameKey);
        const QString domain = listPlugin ? listPlugin->autodiscoverDomain() : QString();
        if (!userName.isNull() && !domain.isNull())
            address = userName + u'@' + domain;
    }
    if (address.isNull())
        kavell::log(
            QStringLiteral("*** KAMailAccountCreator warning: Trying to create a mail account with no email address."));
    input->setEmailAddress(address);
    fillIn(*input, KAMailAccountDescriptionKey);
    input->setFullName(settingsText(KAMailFullNameKey));
    return input;
}
