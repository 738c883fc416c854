// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What an account-list plug-in calls things: its own strings first, then the library's. A look-up that answers the key
// itself found no translation, which means no value here, never the key's text.

#include <array>

#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KAApplication.h>
#include <kavellaccounts/KABundle.h>
#include <kavellaccounts/KAConstants.h>

#include "plugins/data_names.h"

namespace {

struct KeyRow {
    const QString &service;
    const char *key;
};

const std::array<KeyRow, 9> kServiceKeys{{
    {kKAServiceIMAP, "SERVICE_DISPLAY_NAME_MAIL"},
    {kKAServicePOP, "SERVICE_DISPLAY_NAME_MAIL"},
    {kKAServiceExchangeMail, "SERVICE_DISPLAY_NAME_MAIL"},
    {kKAServiceCalDAV, "SERVICE_DISPLAY_NAME_CALENDARS"},
    {kKAServiceExchangeCalendar, "SERVICE_DISPLAY_NAME_CALENDARS"},
    {kKAServiceIM, "SERVICE_DISPLAY_NAME_IM"},
    {kKAServiceCardDAV, "SERVICE_DISPLAY_NAME_CONTACTS"},
    {kKAServiceCustomContacts, "SERVICE_DISPLAY_NAME_CONTACTS"},
    {kKAServiceExchangeContacts, "SERVICE_DISPLAY_NAME_CONTACTS"},
}};

/// The key of a service's name; null for a service without one.
QString serviceKey(const QString &service)
{
    for (const KeyRow &row : kServiceKeys) {
        if (row.service == service)
            return QString::fromLatin1(row.key);
    }
    return {};
}

/// The bundle's text of a key; null when it has none.
QString textInBundle(const std::shared_ptr<KABundle> &bundle, const QString &key)
{
    if (!bundle)
        return {};
    QString text = bundle->localizedString(key);
    return text == key ? QString() : text;
}

}  // namespace

QUrl KAAListPlugin::supportURL() const
{
    const QString text = textInBundle(bundle(), QStringLiteral("SUPPORT_URL"));
    return text.isNull() ? QUrl() : QUrl(text);
}

QString KAAListPlugin::brandName() const
{
    return textInBundle(bundle(), QStringLiteral("BRAND_NAME"));
}

QString KAAListPlugin::defaultAccountDescription() const
{
    return textInBundle(bundle(), QStringLiteral("DEFAULT_ACCOUNT_DESCRIPTION"));
}

QString KAAListPlugin::autodiscoverDomain() const
{
    return textInBundle(bundle(), QStringLiteral("AUTO_DISCOVER_DOMAIN"));
}

QString KAAListPlugin::userNameFieldLabel() const
{
    return textInBundle(bundle(), QStringLiteral("USER_NAME_LABEL"));
}

QString KAAListPlugin::displayNameForApplication(const std::shared_ptr<KAApplication> &application) const
{
    if (!application)
        return {};
    const QString key = kavell::dataNameKey(application->bundleID());
    const QString own = key.isNull() ? QString() : textInBundle(bundle(), key);
    return own.isNull() ? application->displayNameForData() : own;
}

QString KAAListPlugin::serviceDisplayNameForService(const QString &service) const
{
    const QString key = serviceKey(service);
    if (key.isNull())
        return {};
    if (QString own = textInBundle(bundle(), key); !own.isNull())
        return own;
    const QString common = textInBundle(KABundle::libraryBundle(), key);
    const QString brand = brandName();
    return common.isNull() || brand.isNull() ? common : QStringLiteral("%1 %2").arg(brand, common);
}
