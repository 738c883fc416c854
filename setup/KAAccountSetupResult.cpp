// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAAccountSetupResult.h>

#include <kavellaccounts/KAFieldList.h>

KAAccountSetupResult::~KAAccountSetupResult() = default;

KAMailAccountSetupResult::~KAMailAccountSetupResult() = default;

void KAMailAccountSetupResult::describeFields(KAFieldList &fields) const
{
    fields.add("_receivingAccount", _receivingAccount);
    fields.add("_sendingAccount", _sendingAccount);
    fields.add("_receivingAlreadyExistsInMail", _receivingAlreadyExistsInMail);
    fields.add("_sendingAlreadyExistsInMail", _sendingAlreadyExistsInMail);
    KAAccountSetupResult::describeFields(fields);
}

QString KAMailAccountSetupResult::description() const
{
    const auto suffix = [](bool exists) {
        return exists ? QStringLiteral(" (exists in Mail)") : QString();
    };
    return QStringLiteral("%1 receiving account: %2%3, sending account: %4%5")
        .arg(KAAccountSetupResult::description(), KADescription(_receivingAccount),
             suffix(_receivingAlreadyExistsInMail), KADescription(_sendingAccount),
             suffix(_sendingAlreadyExistsInMail));
}

KACalDAVAccountSetupResult::~KACalDAVAccountSetupResult() = default;

void KACalDAVAccountSetupResult::describeFields(KAFieldList &fields) const
{
    fields.add("_url", _url);
    KAAccountSetupResult::describeFields(fields);
}

KACardDAVAccountSetupResult::~KACardDAVAccountSetupResult() = default;

void KACardDAVAccountSetupResult::describeFields(KAFieldList &fields) const
{
    fields.add("_url", _url);
    KAAccountSetupResult::describeFields(fields);
}

KALDAPAccountSetupResult::~KALDAPAccountSetupResult() = default;

KAChatAccountSetupResult::~KAChatAccountSetupResult() = default;

void KAChatAccountSetupResult::describeFields(KAFieldList &fields) const
{
    fields.add("_accountObject", _accountObject);
    fields.add("_isExistingAccount", _isExistingAccount);
    fields.add("_error", _error);
    KAAccountSetupResult::describeFields(fields);
}

KAServerAccountSetupResult::~KAServerAccountSetupResult() = default;

void KAServerAccountSetupResult::describeFields(KAFieldList &fields) const
{
    fields.add("_isExistingAccount", _isExistingAccount);
    fields.add("_setupError", _setupError);
    KAAccountSetupResult::describeFields(fields);
}

KAEWSAccountSetupResult::~KAEWSAccountSetupResult() = default;

void KAEWSAccountSetupResult::describeFields(KAFieldList &fields) const
{
    fields.add("_fullName", _fullName);
    fields.add("_email", _email);
    fields.add("_internalHost", _internalHost);
    fields.add("_internalPath", _internalPath);
    fields.add("_internalUseSSL", _internalUseSSL);
    fields.add("_internalPort", _internalPort);
    fields.add("_externalHost", _externalHost);
    fields.add("_externalPath", _externalPath);
    fields.add("_externalUseSSL", _externalUseSSL);
    fields.add("_externalPort", _externalPort);
    fields.add("_internalURL", _internalURL);
    fields.add("_externalURL", _externalURL);
    fields.add("_rootFolderID", _rootFolderID);
    fields.add("_autodiscoverURL", _autodiscoverURL);
    KAAccountSetupResult::describeFields(fields);
}
