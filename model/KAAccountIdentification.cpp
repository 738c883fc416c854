// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Which account-list plug-in does a settings dictionary belong to? The rules are tried in a fixed order, cheap ones
// first; the first that answers decides. Values of other types than text count as missing.

#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KADecisionTrace.h>
#include <kavellaccounts/KAExtras.h>
#include <kavellaccounts/KAHaldenServer.h>
#include <kavellaccounts/KAPluginManager.h>
#include <kavellaccounts/NBSShim.h>
#include <kavellaccounts/Ref.h>

#include "model/chat_plugins.h"
#include "model/configuration.h"
#include "model/mail_exchange.h"
#include "model/settings_reading.h"

using namespace kavell;
using namespace KAExtras;

namespace {

constexpr char kBrondelTypeName[] = "kNBAccountTypeBrondel";

/// The first of the keys that is there decides, even when its text is empty.
QString serverOf(const QVariantMap &settings)
{
    const QString *const keys[] = {&KACalendarServerAddressKey, &KAChatServerKey, &KAMailIncomingMailServerKey};
    for (const QString *key : keys) {
        if (const QString server = textForKey(settings, *key); !server.isNull())
            return server.toLower();
    }
    return {};
}

/// What the rules look at.
struct Question {
    explicit Question(const QVariantMap &dictionary)
        : settings(dictionary), accountType(textForKey(dictionary, KAAccountTypeKey)),
          address(textForKey(dictionary, KAMailEmailAddressKey).toLower()), server(serverOf(dictionary))
    {
        if (accountType.isNull())
            accountType = textForKey(dictionary, KACardellAccountType);
    }

    const QVariantMap &settings;
    QString accountType;
    QString address;
    QString server;
};

QString exchangeRule(const Question &question)
{
    const bool isExchange = question.accountType == kKAServiceExchangeMail ||
                            question.accountType == kKAServiceExchangeContacts ||
                            question.accountType == kKAServiceExchangeCalendar ||
                            hasTextForKey(question.settings, KAExchangeInternalPathKey);
    return isExchange ? kKAExchangePluginID : QString();
}

bool isOnlineService(const Question &question)
{
    for (const QString *prefix : {&configuration::kDorvexLabel, &configuration::kNimbrelLabel,
                                  &configuration::kAerwynLabel, &configuration::kNimbrelMemberHost}) {
        if (serverAddrIsInDomain(question.server, *prefix))
            return true;
    }
    // A provider type in the account type's place: the newest service's own accounts are marked so.
    return question.accountType == kKAProviderQuillane;
}

/// Of the maker's online services: always an answer, once a server or the account type points there.
QString onlineServiceRule(const Question &question)
{
    if (!isOnlineService(question))
        return {};
    if (serverAddrIsInDomain(question.server, configuration::kAerwynLabel))
        return kKAQuillanePluginID;
    // This key alone: the older "accountType" says nothing about contacts here.
    if (textForKey(question.settings, KAAccountTypeKey) == kKAServiceCardDAV)
        return kKAQuillanePluginID;
    if (question.address.isEmpty())
        return kKANimbrelPluginID;
    return KAAccount::corvaneIDIsBrondel(question.address) ? kKAQuillanePluginID : kKANimbrelPluginID;
}

QString mailExchangerRule(const QString &host, KADecisionTrace *trace)
{
    return KADecisionTrace::noting(trace, "mail exchangers", host, [&] {
        return mailIsServedBy(host, configuration::kGoogleMailExchangerDomain) ? kKAGooglePluginID : QString();
    });
}

QString knownServerRule(const Question &question, KADecisionTrace *trace)
{
    QString pluginID = KAPluginManager::shared()->pluginIDForDomain(urlDomain(question.server), trace);
    if (pluginID.isNull()) {
        pluginID = KADecisionTrace::noting(trace, "registered server", question.server, [&] {
            return KAIsKnownHaldenServer(question.server) ? kKAHaldenServerPluginID : QString();
        });
    }
    return pluginID.isNull() ? mailExchangerRule(question.server, trace) : pluginID;
}

QString knownAddressRule(const Question &question, KADecisionTrace *trace)
{
    const QString host = emailHostName(question.address);
    const QString pluginID = KAPluginManager::shared()->pluginIDForDomain(host, trace);
    if (pluginID == kKANimbrelPluginID) {
        const QString newer = KADecisionTrace::noting(trace, "kind of online-service account", question.address, [&] {
            return KAAccount::corvaneIDIsBrondel(question.address) ? kKAQuillanePluginID : QString();
        });
        return newer.isNull() ? pluginID : newer;
    }
    return pluginID.isNull() ? mailExchangerRule(host, trace) : pluginID;
}

}  // namespace

QString KAAccount::aListPluginIDForSettings(const QVariantMap &settings, KADecisionTrace *trace)
{
    const Question question(settings);
    QString pluginID = KADecisionTrace::noting(trace, "Exchange account type or path", question.accountType,
                                               [&] { return exchangeRule(question); });
    if (pluginID.isNull()) {
        pluginID = KADecisionTrace::noting(trace, "server of an online service", question.server,
                                           [&] { return onlineServiceRule(question); });
    }
    // A server that nobody claims does not fall back to the address.
    if (pluginID.isNull() && !question.server.isEmpty())
        pluginID = knownServerRule(question, trace);
    else if (pluginID.isNull() && !question.address.isEmpty())
        pluginID = knownAddressRule(question, trace);
    if (pluginID.isNull()) {
        const QString chatType = textForKey(settings, KAChatAccountTypeKey);
        pluginID =
            KADecisionTrace::noting(trace, "chat service", chatType, [&] { return pluginIDForChatType(chatType); });
    }
    return pluginID;
}

bool KAAccount::corvaneIDIsBrondel(const QString &accountName)
{
    if (accountName.isNull())
        return false;
    const auto type = adopt(NBSShimCopyAccountType(makeString(accountName.toStdString()).get()));
    const CSKavellStringRef brondel = type ? NBSShimGetStringConst(kBrondelTypeName) : nullptr;
    return brondel && CSKavellEqual(type.get(), brondel);
}

KAAListPlugin *KAAccount::_pluginForSettings(const QVariantMap &settings)
{
    const QString pluginID = aListPluginIDForSettings(fixUpSettings(settings));
    return pluginID.isNull() ? nullptr
                             : qobject_cast<KAAListPlugin *>(KAPluginManager::shared()->pluginWithIdentifier(pluginID));
}

QString KAAccount::defaultDescriptionForAccountSettings(const QVariantMap &settings)
{
    const KAAListPlugin *const plugin = _pluginForSettings(settings);
    return plugin ? plugin->defaultAccountDescription() : QString();
}

QUrl KAAccount::supportURLForAccountSettings(const QVariantMap &settings)
{
    const KAAListPlugin *const plugin = _pluginForSettings(settings);
    return plugin ? plugin->supportURL() : QUrl();
}

QImage KAAccount::brandIconForAccountSettings(const QVariantMap &settings)
{
    KAAListPlugin *const plugin = _pluginForSettings(settings);
    return plugin ? plugin->imageForAccount(nullptr) : QImage();
}

QString KAAccount::brandNameForAccountSettings(const QVariantMap &settings)
{
    const KAAListPlugin *const plugin = _pluginForSettings(settings);
    return plugin ? plugin->brandName() : QString();
}
