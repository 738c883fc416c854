// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "model/configuration.h"

namespace kavell::configuration {

// Accounts of Google's own mail are at this domain.
const QString kGoogleMailDomain = QStringLiteral("gmail.com");
// The exchangers of domains that Google hosts carry names in this domain.
const QString kGoogleHostedMailDomain = QStringLiteral("googlemail.com");
// The exchangers' other names lie here.
const QString kGoogleMailExchangerDomain = QStringLiteral("google.com");
// Calendar and contacts servers of Google: "www.google.com", "google.com".
const QString kGoogleLabel = QStringLiteral("google.");

const QString kYahooMailDomain = QStringLiteral("yahoo.com");
// Also the national services: "caldav.calendar.yahoo.co.jp".
const QString kYahooLabel = QStringLiteral("yahoo.");
const QString kAOLMailDomain = QStringLiteral("aol.com");
const QString kAOLLabel = QStringLiteral("aol.");

// The maker's older online service; its users have the same name at the current one.
const QString kDorvexMailDomain = QStringLiteral("dorvex.example");
const QString kDorvexLabel = QStringLiteral("dorvex.");
// The maker's current online service.
const QString kNimbrelMailDomain = QStringLiteral("nimbrel.example");
const QString kNimbrelLabel = QStringLiteral("nimbrel.");
// The maker's newest online service, aerwyn.example, which has no mail domain of its own.
const QString kAerwynLabel = QStringLiteral("aerwyn.");
// The host that members' pages of the current service are served from.
const QString kNimbrelMemberHost = QStringLiteral("member.nimbrel.example");

// Second-level domain of Japanese companies, where services differ.
const QString kJapaneseCommercialSuffix = QStringLiteral(".co.jp");

// Searched for plug-ins last, after the directories that the environment names.
const QString kSystemPluginDirectory = QStringLiteral("/System/Library/KavellAccounts");
// The library's own domain of the user's preferences.
const QString kPreferencesDomain = QStringLiteral("com.corvane.kavellaccounts");

}  // namespace kavell::configuration
