// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAAccountSetupInput.h>

#include <kavellaccounts/KAFieldList.h>

KAAccountSetupInput::KAAccountSetupInput() : _context(std::make_shared<QVariantMap>())
{
}

KAAccountSetupInput::~KAAccountSetupInput() = default;

void KAAccountSetupInput::describeFields(KAFieldList &fields) const
{
    fields.add("_password", _password);
    fields.add("_description", _description);
    fields.add("_userName", _userName);
    fields.add("_autoconfigDefaults", _autoconfigDefaults);
    fields.add("_context", *_context);
    fields.add("_continueThroughError", _continueThroughError);
    fields.add("_continueWithoutSSL", _continueWithoutSSL);
    KAObject::describeFields(fields);
}

KAMailAccountSetupInput::~KAMailAccountSetupInput() = default;

void KAMailAccountSetupInput::describeFields(KAFieldList &fields) const
{
    fields.add("_emailAddress", _emailAddress);
    fields.add("_fullName", _fullName);
    fields.add("_autoHostname", _autoHostname);
    fields.add("_autoSSLEnabled", _autoSSLEnabled);
    fields.add("_autoSSLOptional", _autoSSLOptional);
    fields.add("_autoEnableSchema", _autoEnableSchema);
    fields.add("_autoEnableHost", _autoEnableHost);
    fields.add("_autoEnablePath", _autoEnablePath);
    fields.add("_autoDeliveryHostname", _autoDeliveryHostname);
    fields.add("_autoDeliverySSL", _autoDeliverySSL);
    fields.add("_autoDeliveryPort", _autoDeliveryPort);
    KAAccountSetupInput::describeFields(fields);
}

KACalDAVAccountSetupInput::~KACalDAVAccountSetupInput() = default;

void KACalDAVAccountSetupInput::describeFields(KAFieldList &fields) const
{
    fields.add("_serverAddress", _serverAddress);
    fields.add("_emailAddress", _emailAddress);
    KAAccountSetupInput::describeFields(fields);
}

KACardDAVAccountSetupInput::~KACardDAVAccountSetupInput() = default;

void KACardDAVAccountSetupInput::describeFields(KAFieldList &fields) const
{
    fields.add("_serverAddress", _serverAddress);
    fields.add("_autoHostname", _autoHostname);
    fields.add("_autoSchema", _autoSchema);
    KAAccountSetupInput::describeFields(fields);
}

KALDAPAccountSetupInput::~KALDAPAccountSetupInput() = default;

void KALDAPAccountSetupInput::describeFields(KAFieldList &fields) const
{
    fields.add("_serverAddress", _serverAddress);
    fields.add("_useSSL", _useSSL ? QVariant(*_useSSL) : QVariant());
    fields.add("_port", _port);
    fields.add("_scope", _scope);
    fields.add("_searchBase", _searchBase);
    fields.add("_authenticate", _authenticate);
    KAAccountSetupInput::describeFields(fields);
}

KAChatAccountSetupInput::~KAChatAccountSetupInput() = default;

void KAChatAccountSetupInput::describeFields(KAFieldList &fields) const
{
    fields.add("_accountType", _accountType);
    fields.add("_loginName", _loginName);
    fields.add("_serverName", _serverName);
    fields.add("_serverPort", _serverPort);
    fields.add("_useSSL", _useSSL);
    fields.add("_useKerberosV5", _useKerberosV5);
    KAAccountSetupInput::describeFields(fields);
}

KAServerAccountSetupInput::~KAServerAccountSetupInput() = default;

void KAServerAccountSetupInput::describeFields(KAFieldList &fields) const
{
    fields.add("_serverName", _serverName);
    fields.add("_serverAddress", _serverAddress);
    fields.add("_enableMail", _enableMail);
    fields.add("_enableJabber", _enableJabber);
    fields.add("_enableCalDAV", _enableCalDAV);
    fields.add("_enableCardDAV", _enableCardDAV);
    fields.add("_enableVPN", _enableVPN);
    KAAccountSetupInput::describeFields(fields);
}
