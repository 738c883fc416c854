// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A settings dictionary of any contents through fixUpSettings, which only adds what is missing and has nothing to add the
// second time, and through the identification, which answers a plug-in's identifier or nothing, the same one each time.
// The input is written in lines:
//
//     KEY=TEXT    a text       KEY#12     a whole number    KEY*1.5    a real
//     KEY?        true         KEY!       false             KEY~       a null text
//     KEY@TEXT    a URL        KEY&TEXT   data              KEY[TEXT   a list of one text

#include <array>

#include <QtCore/QStringList>
#include <QtCore/QUrl>
#include <QtCore/QVariantMap>

#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KAExtras.h>

#include "model/settings_reading.h"
#include "tests/fuzz/fuzz_target.h"

using kavell::fuzz::require;

namespace {

QVariant valueOf(char form, std::string_view bytes)
{
    const QString text = QString::fromUtf8(bytes.data(), static_cast<qsizetype>(bytes.size()));
    switch (form) {
    case '=':
        return text;
    case '#':
        return text.toLongLong();
    case '*':
        return text.toDouble();
    case '?':
        return true;
    case '!':
        return false;
    case '~':
        return QString();
    case '@':
        return QUrl(text);
    case '&':
        return text.toUtf8();
    default:
        return QVariantList{text};
    }
}

QVariantMap settingsOf(std::string_view lines)
{
    QVariantMap settings;
    while (!lines.empty()) {
        const std::string_view line = kavell::fuzz::takeLine(lines);
        const size_t at = line.find_first_of("=#*?!~@&[");
        if (at != std::string_view::npos)
            settings.insert(QString::fromUtf8(line.data(), static_cast<qsizetype>(at)),
                            valueOf(line[at], line.substr(at + 1)));
    }
    return settings;
}

/// What was there stays, and only these four keys are added.
void checkAdditions(const QVariantMap &settings, const QVariantMap &fixed)
{
    for (auto entry = settings.begin(); entry != settings.end(); ++entry)
        require(kavell::isNothing(*entry) || fixed.value(entry.key()) == *entry, "a value that is there stays");
    const QStringList addable{KAMailUserNameKey, KAMailEmailAddressKey, KAExchangeServerURLKey,
                              KAExchangeExternalServerURLKey};
    for (auto entry = fixed.begin(); entry != fixed.end(); ++entry) {
        if (!kavell::hasValueForKey(settings, entry.key()) && settings.value(entry.key()) != *entry)
            require(addable.contains(entry.key()), "only four keys are added");
    }
    for (const QString &key : {KAExchangeServerURLKey, KAExchangeExternalServerURLKey}) {
        if (kavell::hasValueForKey(settings, key) || !kavell::hasValueForKey(fixed, key))
            continue;
        const QUrl url = fixed.value(key).toUrl();
        require(url.isValid() && (url.scheme() == QLatin1String("http") || url.scheme() == QLatin1String("https")),
                "a server's URL is a web address");
    }
    if (!kavell::hasValueForKey(settings, KAMailEmailAddressKey) &&
        kavell::hasValueForKey(fixed, KAMailEmailAddressKey))
        require(fixed.value(KAMailEmailAddressKey).toString().startsWith(kavell::textForKey(fixed, KAMailUserNameKey)),
                "an address begins with the user's name");
}

/// A chat login is deliberately not taken for an address when it becomes the user name; it is one the next time.
bool isChatLoginWithHost(const QVariantMap &settings)
{
    return !kavell::hasValueForKey(settings, KAMailUserNameKey) &&
           kavell::textForKey(settings, KAChatLoginNameKey).contains(u'@');
}

QString inCapitals(QString text)
{
    for (QChar &letter : text) {
        if (letter >= u'a' && letter <= u'z')
            letter = QChar(letter.unicode() - u'a' + u'A');
    }
    return text;
}

/// Servers and addresses mean the same in capitals.
QVariantMap withCapitals(QVariantMap settings)
{
    for (const QString &key :
         {KACalendarServerAddressKey, QString(KAChatServerKey), KAMailIncomingMailServerKey, KAMailEmailAddressKey}) {
        if (const QString text = kavell::textForKey(settings, key); !text.isNull())
            settings.insert(key, inCapitals(text));
    }
    return settings;
}

void checkIdentification(const QVariantMap &settings)
{
    // No plug-in is installed here, and whose server no one knows is nobody's: the answers that the rules have alone.
    static const QStringList answers{QString(),           kKAExchangePluginID,    kKANimbrelPluginID,
                                     kKAQuillanePluginID, kKAGooglePluginID,      kKAYahooPluginID,
                                     kKAAOLPluginID,      kKAHaldenServerPluginID};
    const QString answer = KAAccount::aListPluginIDForSettings(settings);
    require(answers.contains(answer), "the answer is the identifier of one of the rules");
    require(KAAccount::aListPluginIDForSettings(withCapitals(settings)) == answer,
            "servers and addresses mean the same in capitals");
    QVariantMap exchange = settings;
    exchange.insert(KAExchangeInternalPathKey, QStringLiteral("/exchange"));
    require(KAAccount::aListPluginIDForSettings(exchange) == kKAExchangePluginID,
            "a path on a group-ware server decides before all else");
}

/// Questions to name servers end at once: nobody answers at this port.
bool withoutNameServers()
{
    setenv("KAVELL_DNS_SERVERS", "127.0.0.1:9", 1);
    unsetenv("VESK_FRAMEWORK_PATH");
    return true;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    [[maybe_unused]] static const bool isReady = withoutNameServers();
    const QVariantMap settings = settingsOf(kavell::fuzz::textOf(data, size));
    const QVariantMap fixed = KAExtras::fixUpSettings(settings);
    checkAdditions(settings, fixed);
    const QVariantMap again = KAExtras::fixUpSettings(fixed);
    require(again == fixed || isChatLoginWithHost(settings), "settings that are in order stay as they are");
    require(KAExtras::fixUpSettings(again) == again, "settings are in order after the second time at the latest");
    checkIdentification(settings);
    checkIdentification(fixed);
    return 0;
}
