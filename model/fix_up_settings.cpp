// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <array>

#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KAExtras.h>

#include "model/configuration.h"
#include "model/settings_reading.h"

namespace KAExtras {

namespace {

using namespace kavell;

/// The mail domain that the users of a chat service have their address at.
struct ChatMailDomain {
    QLatin1String chatType;
    const QString &mailDomain;
};

/// The mail domain that goes with a calendar server, told by the server's first label.
struct CalendarMailDomain {
    const QString &serverLabel;
    const QString &mailDomain;
};

const std::array<ChatMailDomain, 5> kChatMailDomains{{
    {QLatin1String("aim"), configuration::kAOLMailDomain},
    {QLatin1String("nimbrel"), configuration::kNimbrelMailDomain},
    {QLatin1String("dorvex"), configuration::kDorvexMailDomain},
    {QLatin1String("google"), configuration::kGoogleMailDomain},
    // The literal only: accounts whose type is KAChatAcctTypeYahoo bring an address of their own.
    {QLatin1String("Yahoo!"), configuration::kYahooMailDomain},
}};

const std::array<CalendarMailDomain, 5> kCalendarMailDomains{{
    {configuration::kDorvexLabel, configuration::kNimbrelMailDomain},  // its users have moved to the current service
    {configuration::kNimbrelLabel, configuration::kNimbrelMailDomain},
    {configuration::kYahooLabel, configuration::kYahooMailDomain},
    {configuration::kAOLLabel, configuration::kAOLMailDomain},
    {configuration::kGoogleLabel, configuration::kGoogleMailDomain},
}};

/// The keys of one group-ware server's address, in parts and whole.
struct ServerKeys {
    const QString &host;
    const QString &port;
    const QString &path;
    const QString &useSSL;
    const QString &url;
};

QString mailDomainForChatType(const QString &chatType)
{
    for (const ChatMailDomain &row : kChatMailDomains) {
        if (chatType == row.chatType)
            return row.mailDomain;
    }
    return {};
}

QString mailDomainForCalendarServer(const QString &serverAddress)
{
    for (const CalendarMailDomain &row : kCalendarMailDomains) {
        if (serverAddrIsInDomain(serverAddress, row.serverLabel))
            return row.mailDomain;
    }
    return {};
}

/// The address that the input and the user name tell; null when they tell none. The "@" is looked for in the input's
/// own user name only: a chat login is not taken for an address, whatever it looks like.
QString derivedAddress(const QVariantMap &input, const QString &userName, const QString &chatType)
{
    const QString inputUserName = textForKey(input, KAMailUserNameKey);
    if (inputUserName.contains(u'@'))
        return inputUserName;

    QString mailDomain;
    if (!chatType.isNull())
        mailDomain = mailDomainForChatType(chatType);
    else if (textForKey(input, KAAccountTypeKey) == kKAServiceCalDAV)
        mailDomain = mailDomainForCalendarServer(textForKey(input, KACalendarServerAddressKey));
    return mailDomain.isNull() ? QString() : userName + u'@' + mailDomain;
}

void assembleServerURL(const QVariantMap &input, const ServerKeys &keys, QVariantMap &settings)
{
    const QString host = textForKey(input, keys.host);
    if (host.isNull() || hasValueForKey(input, keys.url))
        return;
    QString text = isTrueForKey(input, keys.useSSL) ? QStringLiteral("https://") : QStringLiteral("http://");
    text += host;
    if (hasNumberForKey(input, keys.port))
        text += u':' + QString::number(integerForKey(input, keys.port));
    text += textForKey(input, keys.path);
    const QUrl url(text, QUrl::StrictMode);
    if (url.isValid())
        settings.insert(keys.url, url);
}

}  // namespace

QVariantMap fixUpSettings(const QVariantMap &settings)
{
    QVariantMap result = settings;
    QString userName = textForKey(result, KAMailUserNameKey);
    const QString chatType = textForKey(result, KAChatAccountTypeKey);

    if (!hasValueForKey(result, KAMailUserNameKey)) {
        userName = textForKey(result, KAChatLoginNameKey);
        if (!userName.isNull())
            result.insert(KAMailUserNameKey, userName);
    }
    if (!hasValueForKey(result, KAMailEmailAddressKey) && !userName.isNull()) {
        const QString address = derivedAddress(settings, userName, chatType);
        if (!address.isNull())
            result.insert(KAMailEmailAddressKey, address);
    }
    assembleServerURL(settings,
                      {KAExchangeInternalHostKey, KAExchangeInternalPortKey, KAExchangeInternalPathKey,
                       KAExchangeInternalUseSSLKey, KAExchangeServerURLKey},
                      result);
    assembleServerURL(settings,
                      {KAExchangeExternalHostKey, KAExchangeExternalPortKey, KAExchangeExternalPathKey,
                       KAExchangeExternalUseSSLKey, KAExchangeExternalServerURLKey},
                      result);
    return result;
}

}  // namespace KAExtras
