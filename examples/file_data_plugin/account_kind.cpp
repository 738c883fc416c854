// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "account_kind.h"

#include <algorithm>
#include <array>

#include <QtCore/QUrl>

#include <kavellaccounts/KAAccountSetupInput.h>
#include <kavellaccounts/KAAccountSetupResult.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KAExtras.h>

namespace {

/// The part of an address behind the "@"; null for a text that is no address.
QString domainOf(const QString &address)
{
    const qsizetype at = address.indexOf(u'@');
    return at > 0 && at + 1 < address.size() ? address.mid(at + 1).toLower() : QString();
}

/// The server that is given, else the one that a provider of the domain would have; null without either.
QString serverOf(const QString &given, const char *label, const QString &address)
{
    if (!given.isEmpty())
        return given;
    const QString domain = domainOf(address);
    return domain.isNull() ? QString() : QLatin1String(label) + u'.' + domain;
}

/// Settings have only what is known.
void set(QVariantMap &settings, const QString &key, const QString &text)
{
    if (!text.isEmpty())
        settings.insert(key, text);
}

QUrl homeOf(const QString &server, const char *collection, const QString &userName)
{
    QUrl url;
    url.setScheme(QStringLiteral("https"));
    url.setHost(server);
    url.setPath(QStringLiteral("/%1/%2/").arg(QLatin1String(collection), userName));
    return url;
}

Discovery failed(SetupProblem problem)
{
    return {.problem = problem};
}

Discovery discoverMail(const KAAccountSetupInput *input)
{
    const auto *const mail = dynamic_cast<const KAMailAccountSetupInput *>(input);
    if (!mail)
        return failed(SetupProblem::WrongKind);
    const QString address = mail->emailAddress();
    if (domainOf(address).isNull())
        return failed(SetupProblem::NoAddress);
    const QString incoming = serverOf(mail->autoHostname(), "imap", address);
    const QString outgoing = serverOf(mail->autoDeliveryHostname(), "smtp", address);

    Discovery found;
    set(found.settings, KAMailEmailAddressKey, address);
    set(found.settings, KAMailUserNameKey, mail->userName().isEmpty() ? address : mail->userName());
    set(found.settings, KAMailFullNameKey, mail->fullName());
    set(found.settings, KAMailAccountDescriptionKey, mail->accountDescription());
    set(found.settings, KAMailIncomingMailServerKey, incoming);
    found.settings.insert(KAMailIncomingUseSSLKey, true);
    set(found.settings, KAMailOutgoingMailServerKey, outgoing);
    found.settings.insert(KAMailOutgoingUseSSLKey, true);

    // The client's own objects; only the client looks into them.
    const auto result = std::make_shared<KAMailAccountSetupResult>();
    result->setReceivingAccount(QStringLiteral("imaps://%1@%2").arg(address, incoming));
    result->setSendingAccount(QStringLiteral("smtps://%1@%2").arg(address, outgoing));
    found.result = result;
    return found;
}

Discovery discoverCalendars(const KAAccountSetupInput *input)
{
    const auto *const calendar = dynamic_cast<const KACalDAVAccountSetupInput *>(input);
    if (!calendar)
        return failed(SetupProblem::WrongKind);
    const QString userName = calendar->userName().isEmpty() ? calendar->emailAddress() : calendar->userName();
    if (userName.isEmpty())
        return failed(SetupProblem::NoAddress);
    const QString address = calendar->emailAddress().isEmpty() ? userName : calendar->emailAddress();
    const QString server = serverOf(calendar->serverAddress(), "calendar", address);

    Discovery found{.problem = server.isNull() ? SetupProblem::NoServer : SetupProblem::None};
    set(found.settings, KACalendarUserNameKey, userName);
    set(found.settings, KACalendarEmailAddressKey, domainOf(address).isNull() ? QString() : address);
    set(found.settings, KACalendarAccountDescriptionKey, calendar->accountDescription());
    set(found.settings, KACalendarServerAddressKey, server);
    found.settings.insert(KACalendarUseSSLKey, true);

    const auto result = std::make_shared<KACalDAVAccountSetupResult>();
    if (!server.isNull())
        result->setUrl(homeOf(server, "calendars", userName));
    found.result = result;
    return found;
}

Discovery discoverDirectory(const KALDAPAccountSetupInput &directory)
{
    if (directory.serverAddress().isEmpty() || (directory.authenticate() && directory.userName().isEmpty()))
        return failed(SetupProblem::NoAddress);
    Discovery found;
    set(found.settings, KACardellAccountType, kKAServiceLDAP);
    set(found.settings, KACardellAccountDescriptionKey, directory.accountDescription());
    set(found.settings, KACardellServerAddressKey, directory.serverAddress());
    set(found.settings, KACardellUserNameKey, directory.userName());
    set(found.settings, KACardellSearchBaseKey, directory.searchBase());
    set(found.settings, KACardellScopeKey, directory.scope());
    if (directory.port() != 0)
        found.settings.insert(KACardellPortKey, directory.port());
    // Nobody said whether to use SSL: then it is used.
    found.settings.insert(KACardellUseSSLKey, directory.useSSL().value_or(true));
    found.settings.insert(KACardellAuthenticationKey, directory.authenticate());
    found.result = std::make_shared<KALDAPAccountSetupResult>();
    return found;
}

Discovery discoverContacts(const KAAccountSetupInput *input)
{
    if (const auto *const directory = dynamic_cast<const KALDAPAccountSetupInput *>(input))
        return discoverDirectory(*directory);
    const auto *const contacts = dynamic_cast<const KACardDAVAccountSetupInput *>(input);
    if (!contacts)
        return failed(SetupProblem::WrongKind);
    const QString userName = contacts->userName();
    if (userName.isEmpty())
        return failed(SetupProblem::NoAddress);
    const QString given = contacts->serverAddress().isEmpty() ? contacts->autoHostname() : contacts->serverAddress();
    const QString server = serverOf(given, "contacts", userName);

    Discovery found{.problem = server.isNull() ? SetupProblem::NoServer : SetupProblem::None};
    set(found.settings, KACardellAccountType, kKAServiceCardDAV);
    set(found.settings, KACardellUserNameKey, userName);
    set(found.settings, KAMailEmailAddressKey, domainOf(userName).isNull() ? QString() : userName);
    set(found.settings, KACardellAccountDescriptionKey, contacts->accountDescription());
    set(found.settings, KACardellServerAddressKey, server);
    found.settings.insert(KACardellUseSSLKey, true);

    const auto result = std::make_shared<KACardDAVAccountSetupResult>();
    if (!server.isNull())
        result->setUrl(homeOf(server, "contacts", userName));
    found.result = result;
    return found;
}

Discovery discoverChat(const KAAccountSetupInput *input)
{
    const auto *const chat = dynamic_cast<const KAChatAccountSetupInput *>(input);
    if (!chat)
        return failed(SetupProblem::WrongKind);
    if (chat->loginName().isEmpty())
        return failed(SetupProblem::NoAddress);
    const QString server = serverOf(chat->serverName(), "chat", chat->loginName());

    // Services such as KAChatAcctTypeAIM have one server that their clients know: none is no problem.
    Discovery found;
    set(found.settings, KAChatAccountTypeKey, chat->accountType());
    set(found.settings, KAChatLoginNameKey, chat->loginName());
    set(found.settings, KAChatAccountDescriptionKey, chat->accountDescription());
    set(found.settings, KAChatServerKey, server);
    if (chat->serverPort() != 0)
        found.settings.insert(KAChatServerPortKey, chat->serverPort());
    found.settings.insert(KAChatUseSSLKey, chat->useSSL());
    found.settings.insert(KAChatUseKerberosV5Key, chat->useKerberosV5());

    const auto result = std::make_shared<KAChatAccountSetupResult>();
    result->setAccountObject(QStringLiteral("xmpp:%1").arg(chat->loginName()));
    found.result = result;
    return found;
}

const std::array<AccountKind, 4> &accountKinds()
{
    static const std::array<AccountKind, 4> kinds{{
        {kKAMailPluginID,
         kKAProviderMail,
         {kKAServiceIMAP, kKAServicePOP, kKAServiceExchangeMail},
         {KAMailEmailAddressKey},
         QColor(0x2f, 0x6f, 0xb5),
         discoverMail},
        {kKACalendarPluginID,
         kKAProviderTidewell,
         {kKAServiceCalDAV, kKAServiceExchangeCalendar},
         {KACalendarUserNameKey, KACalendarServerAddressKey},
         QColor(0xb2, 0x3b, 0x3b),
         discoverCalendars},
        {kKAContactsPluginID,
         kKAProviderCardell,
         {kKAServiceCardDAV, kKAServiceLDAP, kKAServiceCustomContacts, kKAServiceExchangeContacts},
         {KACardellAccountType, KACardellUserNameKey, KACardellServerAddressKey, KACardellSearchBaseKey},
         QColor(0x8a, 0x5a, 0x2b),
         discoverContacts},
        {kKAChatPluginID,
         kKAProviderParlex,
         {kKAServiceIM},
         {KAChatAccountTypeKey, KAChatLoginNameKey},
         QColor(0x2e, 0x84, 0x5a),
         discoverChat},
    }};
    return kinds;
}

}  // namespace

bool AccountKind::areSame(const QVariantMap &first, const QVariantMap &second) const
{
    return std::all_of(identity.begin(), identity.end(),
                       [&](const QString &key) { return first.value(key) == second.value(key); });
}

const AccountKind *accountKindOf(const QString &pluginID)
{
    const auto &kinds = accountKinds();
    const auto found =
        std::find_if(kinds.begin(), kinds.end(), [&](const AccountKind &kind) { return kind.pluginID == pluginID; });
    return found == kinds.end() ? nullptr : &*found;
}

void markExisting(KAAccountSetupResult &result)
{
    if (auto *const mail = dynamic_cast<KAMailAccountSetupResult *>(&result)) {
        mail->setReceivingAlreadyExistsInMail(true);
        mail->setSendingAlreadyExistsInMail(true);
    }
    if (auto *const chat = dynamic_cast<KAChatAccountSetupResult *>(&result))
        chat->setIsExistingAccount(true);
}
