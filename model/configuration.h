// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The outside world's names that the library knows: mail domains and first labels of the large providers and of the
// maker's online services, fixed paths. All of them stand in configuration.cpp and nowhere else. A label is the first
// label of a host name with its closing dot, for KAExtras::serverAddrIsInDomain.

#ifndef KAVELL_MODEL_CONFIGURATION_H
#define KAVELL_MODEL_CONFIGURATION_H

#include <QtCore/QString>

namespace kavell::configuration {

// Google
extern const QString kGoogleMailDomain;           ///< the consumer mail domain
extern const QString kGoogleHostedMailDomain;     ///< the second mail domain, which hosted domains' exchangers lie in
extern const QString kGoogleMailExchangerDomain;  ///< the domain of the mail exchangers
extern const QString kGoogleLabel;

// Yahoo and AOL
extern const QString kYahooMailDomain;
extern const QString kYahooLabel;
extern const QString kAOLMailDomain;
extern const QString kAOLLabel;

// The maker's online services, oldest first
extern const QString kDorvexMailDomain;
extern const QString kDorvexLabel;
extern const QString kNimbrelMailDomain;
extern const QString kNimbrelLabel;
extern const QString kAerwynLabel;
extern const QString kNimbrelMemberHost;  ///< a further host of the current service, tested whole

extern const QString kJapaneseCommercialSuffix;

// Places
extern const QString kSystemPluginDirectory;
extern const QString kPreferencesDomain;
extern const char kOnlineServiceLibraryPath[];  ///< in online_service_path.cpp, fixed when the library is built

}  // namespace kavell::configuration

#endif
