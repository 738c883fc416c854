// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Which account-list account does a client application's account belong to? Each kind of data has a matcher that first
// chooses an account-list plug-in by server, address and account type, and then looks a few login names up at that
// plug-in's provider. No matcher ever makes an account.

#include <array>

#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KAAccountSetupInput.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KADecisionTrace.h>
#include <kavellaccounts/KAExtras.h>
#include <kavellaccounts/KAHaldenServer.h>
#include <kavellaccounts/KAPluginManager.h>
#include <kavellaccounts/KAProvider.h>

#include "model/chat_plugins.h"
#include "model/configuration.h"
#include "model/settings_reading.h"

using namespace KAExtras;
using kavell::hasTextForKey;
using kavell::textForKey;

namespace {

using Account = std::shared_ptr<KAAccount>;
using Matcher = Account (KAPluginManager::*)(const QVariantMap &, KADecisionTrace *);

/// The matcher of each data plug-in. The test plug-in stands in for mail.
struct MatcherRow {
    const QString &pluginID;
    Matcher matcher;
};

const std::array<MatcherRow, 5> kMatchers{{
    {kKAMailPluginID, &KAPluginManager::_matchingAlistAccountForMailAccountSettings},
    {kKATestPluginID, &KAPluginManager::_matchingAlistAccountForMailAccountSettings},
    {kKACalendarPluginID, &KAPluginManager::_matchingAlistAccountForCalendarAccountSettings},
    {kKAContactsPluginID, &KAPluginManager::_matchingAlistAccountForContactsAccountSettings},
    {kKAChatPluginID, &KAPluginManager::_matchingAlistAccountForChatAccountSettings},
}};

bool isBrondel(const QString &address, KADecisionTrace *trace)
{
    const QString answer = KADecisionTrace::noting(trace, "kind of online-service account", address, [&] {
        return KAAccount::corvaneIDIsBrondel(address) ? kKAQuillanePluginID : QString();
    });
    return !answer.isNull();
}

bool isKnownServer(const QString &server, KADecisionTrace *trace)
{
    const QString answer = KADecisionTrace::noting(trace, "registered server", server, [&] {
        return KAIsKnownHaldenServer(server) ? kKAHaldenServerPluginID : QString();
    });
    return !answer.isNull();
}

/// Exchange, when the account's type or a path on an Exchange server says so; else null.
QString exchangePluginID(const QVariantMap &settings, const QString &exchangeService, KADecisionTrace *trace)
{
    return KADecisionTrace::noting(trace, "account type", textForKey(settings, KAAccountTypeKey), [&] {
        const bool isExchange = textForKey(settings, KAAccountTypeKey) == exchangeService ||
                                hasTextForKey(settings, KAExchangeInternalPathKey);
        return isExchange ? kKAExchangePluginID : QString();
    });
}

bool hasHaldenServerType(const QVariantMap &settings)
{
    return textForKey(settings, KAAccountTypeKey) == kKAProviderHaldenServer;
}

/// The first account that the plug-in's provider has under one of the login names, in their order; null ones are
/// passed over.
Account lookUp(KAPluginManager &manager, const QString &pluginID, const QStringList &loginNames, KADecisionTrace *trace)
{
    KAPlugin *const plugin = pluginID.isNull() ? nullptr : manager.pluginWithIdentifier(pluginID);
    const std::shared_ptr<KAProvider> provider = plugin ? plugin->provider() : nullptr;
    Account found;
    for (const QString &loginName : loginNames) {
        if (found || loginName.isNull())
            continue;
        (void)KADecisionTrace::noting(trace, "login name at the provider", loginName, [&] {
            found = provider ? provider->accountForLoginName(loginName, false) : nullptr;
            return found ? found->uid() : QString();
        });
    }
    return found;
}

/// What calendar and contacts accounts are matched by; both are found by server first.
struct ServerAccount {
    QString server;
    QString userName;
    QString address;
};

Account lookUpServerAccount(KAPluginManager &manager, QString pluginID, ServerAccount account, KADecisionTrace *trace)
{
    QString loginName = account.userName;
    // Google's accounts go by their address, whoever else lists the server's domain.
    if (serverAddrIsInDomain(account.server, kavell::configuration::kGoogleLabel)) {
        pluginID = kKAGooglePluginID;
        if (account.address.isNull() && !account.userName.isNull())
            account.address = account.userName + u'@' + kavell::configuration::kGoogleMailDomain;
        loginName = account.address;
    }
    return lookUp(manager, pluginID, {loginName, account.address}, trace);
}

}  // namespace

Account KAPluginManager::matchingAListAccountForAccountSettings(const QVariantMap &settings, const QString &pluginID,
                                                                KADecisionTrace *trace)
{
    for (const MatcherRow &row : kMatchers) {
        if (row.pluginID == pluginID)
            return (this->*row.matcher)(settings, trace);
    }
    return nullptr;
}

Account KAPluginManager::matchingAListAccountForSetupInput(const std::shared_ptr<KAAccountSetupInput> &input,
                                                           const std::shared_ptr<KAAccountSetupResult> &)
{
    QVariantMap settings;
    const auto set = [&](const QString &key, const QString &value) {
        if (!value.isNull())
            settings.insert(key, value);
    };
    const KAAccountSetupInput *const record = input.get();
    if (const auto *mail = dynamic_cast<const KAMailAccountSetupInput *>(record)) {
        if (mail->emailAddress().isNull())
            return nullptr;
        set(KAMailEmailAddressKey, mail->emailAddress());
        return matchingAListAccountForAccountSettings(settings, kKAMailPluginID);
    }
    if (const auto *calendar = dynamic_cast<const KACalDAVAccountSetupInput *>(record)) {
        set(KACalendarServerAddressKey, calendar->serverAddress());
        return matchingAListAccountForAccountSettings(settings, kKACalendarPluginID);
    }
    if (const auto *contacts = dynamic_cast<const KACardDAVAccountSetupInput *>(record)) {
        set(KACardellServerAddressKey, contacts->serverAddress());
        return matchingAListAccountForAccountSettings(settings, kKAContactsPluginID);
    }
    if (const auto *chat = dynamic_cast<const KAChatAccountSetupInput *>(record)) {
        set(KAChatLoginNameKey, chat->loginName());
        set(KAChatAccountTypeKey, chat->accountType());
        return matchingAListAccountForAccountSettings(settings, kKAChatPluginID);
    }
    return nullptr;  // directories, which no account-list account has, among them
}

Account KAPluginManager::_matchingAlistAccountForMailAccountSettings(const QVariantMap &settings,
                                                                     KADecisionTrace *trace)
{
    const QString address = textForKey(settings, KAMailEmailAddressKey);
    QString userName = textForKey(settings, KAMailUserNameKey);
    if (userName.isNull())
        userName = emailUserName(address);
    if (userName.isNull())
        return nullptr;

    const QString server = textForKey(settings, KAMailIncomingMailServerKey);
    QString pluginID = !server.isNull() && isKnownServer(server, trace)
                           ? kKAHaldenServerPluginID
                           : pluginIDForDomain(emailHostName(address), trace);
    if (pluginID == kKANimbrelPluginID && isBrondel(address, trace))
        pluginID = kKAQuillanePluginID;
    if (pluginID.isNull())
        pluginID = hasHaldenServerType(settings) ? kKAHaldenServerPluginID
                                                 : exchangePluginID(settings, kKAServiceExchangeMail, trace);
    const QString nameAtServer = server.isNull() ? QString() : userName + u'@' + server;
    return lookUp(*this, pluginID, {userName, address, nameAtServer}, trace);
}

Account KAPluginManager::_matchingAlistAccountForCalendarAccountSettings(const QVariantMap &settings,
                                                                         KADecisionTrace *trace)
{
    ServerAccount account{textForKey(settings, KACalendarServerAddressKey), textForKey(settings, KACalendarUserNameKey),
                          textForKey(settings, KACalendarEmailAddressKey)};
    if (account.userName.contains(u'@')) {
        account.address = account.userName;
        account.userName = emailUserName(account.address);
    }
    QString pluginID = pluginIDForDomain(urlDomain(account.server), trace);
    if (pluginID == kKANimbrelPluginID && isBrondel(account.address, trace))
        pluginID = kKAQuillanePluginID;
    if (pluginID.isNull())
        pluginID = isKnownServer(account.server, trace) ? kKAHaldenServerPluginID
                                                        : exchangePluginID(settings, kKAServiceExchangeCalendar, trace);
    return lookUpServerAccount(*this, pluginID, account, trace);
}

Account KAPluginManager::_matchingAlistAccountForContactsAccountSettings(const QVariantMap &settings,
                                                                         KADecisionTrace *trace)
{
    const ServerAccount account{textForKey(settings, KACardellServerAddressKey),
                                textForKey(settings, KACardellUserNameKey),
                                textForKey(settings, KAMailEmailAddressKey)};
    QString pluginID = pluginIDForDomain(urlDomain(account.server), trace);
    if (pluginID == kKANimbrelPluginID &&
        (textForKey(settings, KAAccountTypeKey) == kKAServiceCardDAV || isBrondel(account.address, trace)))
        pluginID = kKAQuillanePluginID;
    if (pluginID.isNull())
        pluginID = hasHaldenServerType(settings) ? kKAHaldenServerPluginID
                                                 : exchangePluginID(settings, kKAServiceExchangeContacts, trace);
    return lookUpServerAccount(*this, pluginID, account, trace);
}

Account KAPluginManager::_matchingAlistAccountForChatAccountSettings(const QVariantMap &settings,
                                                                     KADecisionTrace *trace)
{
    const QString chatType = textForKey(settings, KAChatAccountTypeKey);
    const QString pluginID = KADecisionTrace::noting(trace, "chat service", chatType, [&] {
        if (const QString known = kavell::pluginIDForChatType(chatType); !known.isNull())
            return known;
        const bool ownServer =
            hasHaldenServerType(settings) || KAIsKnownHaldenServer(textForKey(settings, KAChatServerKey));
        return ownServer ? kKAHaldenServerPluginID : QString();
    });
    return lookUp(*this, pluginID, {textForKey(settings, KAChatLoginNameKey)}, trace);
}
