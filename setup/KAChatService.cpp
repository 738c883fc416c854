// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAChatService.h>

#include <kavellaccounts/KAFieldList.h>

std::shared_ptr<KAChatService> KAChatService::initWithIdentifier(const QString &identifier)
{
    return std::shared_ptr<KAChatService>(new KAChatService(identifier));
}

KAChatService::KAChatService(const QString &identifier) : _identifier(identifier)
{
}

KAChatService::~KAChatService() = default;

void KAChatService::describeFields(KAFieldList &fields) const
{
    fields.add("_identifier", _identifier);
    fields.add("_displayName", _displayName);
    fields.add("_domainLabel", _domainLabel);
    fields.add("_accountLabel", _accountLabel);
    fields.add("_showUsernameField", _showUsernameField);
    fields.add("_showPasswordField", _showPasswordField);
    fields.add("_showServerHostField", _showServerHostField);
    fields.add("_showServerPortField", _showServerPortField);
    fields.add("_showUseSSLCheckbox", _showUseSSLCheckbox);
    fields.add("_showKerberosCheckbox", _showKerberosCheckbox);
    KAObject::describeFields(fields);
}
