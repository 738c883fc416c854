// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The values of the store's vocabulary, each defined once. The exported constants are made from them, in C here and in
// the object layer under its own names.

#ifndef KAVELL_STORE_CONSTANT_VALUES_H
#define KAVELL_STORE_CONSTANT_VALUES_H

namespace kavell::values {

// Provider types
inline constexpr char kProviderYahoo[] = "com.corvane.account.yahoo";
inline constexpr char kProviderGoogle[] = "com.corvane.account.google";
inline constexpr char kProviderNimbrel[] = "com.corvane.account.nimbrel";
inline constexpr char kProviderFacebook[] = "com.corvane.account.facebook";
inline constexpr char kProviderExchange[] = "com.corvane.account.exchange";
inline constexpr char kProviderMail[] = "com.corvane.account.mail";
inline constexpr char kProviderCardell[] = "com.corvane.account.cardell";
inline constexpr char kProviderParlex[] = "com.corvane.account.parlex";
inline constexpr char kProviderTidewell[] = "com.corvane.account.tidewell";
inline constexpr char kProviderTest[] = "com.corvane.account.testing";

// Service types
inline constexpr char kServiceMail[] = "com.corvane.service.Mail";
inline constexpr char kServicePOPMail[] = "com.corvane.service.POPMail";
inline constexpr char kServiceIMAPMail[] = "com.corvane.service.IMAPMail";
inline constexpr char kServicePhotos[] = "com.corvane.service.Photos";
inline constexpr char kServiceLDAP[] = "com.corvane.service.LDAP";
inline constexpr char kServiceCardDAV[] = "com.corvane.service.CardDAV";
inline constexpr char kServiceCalDAV[] = "com.corvane.service.CalDAV";
inline constexpr char kServiceJabber[] = "com.corvane.service.Jabber";
inline constexpr char kServiceVoIP[] = "com.corvane.service.VoIP";

// Setting keys
inline constexpr char kSettingServer[] = "com.corvane.Server";
inline constexpr char kSettingPort[] = "com.corvane.Port";
inline constexpr char kSettingPath[] = "com.corvane.path";
inline constexpr char kSettingSMTPServer[] = "com.corvane.smtpServer";
inline constexpr char kSettingSMTPPort[] = "com.corvane.smtpPort";
inline constexpr char kSettingUID[] = "com.corvane.uid";

// User-attribute keys
inline constexpr char kUserLoginName[] = "LoginName";
inline constexpr char kUserFullName[] = "com.corvane.provider.fullname";
inline constexpr char kUserNickname[] = "com.corvane.provider.nickname";
inline constexpr char kUserPicture[] = "com.corvane.provider.picture";

// Notifications
inline constexpr char kNotificationSender[] = "com.corvane.KavellAccounts";
inline constexpr char kProviderSettingsChangedNotification[] = "com.corvane.KavellAccounts.settingsChanged";
inline constexpr char kCreatedNotification[] = "com.corvane.KavellAccounts.accountCreated";
inline constexpr char kRemovedNotification[] = "com.corvane.KavellAccounts.accountRemoved";
inline constexpr char kProviderName[] = "Provider";

}  // namespace kavell::values

#endif
