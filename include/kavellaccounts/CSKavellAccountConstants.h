// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The vocabulary of the account store: provider types, service types, attribute keys and notification names. The values
// are part of the data files and of what programs exchange, and never change. All are constant objects that are never
// freed: they may be used before main, from any thread, and need not be retained.

#ifndef KAVELLACCOUNTS_CSKAVELLACCOUNTCONSTANTS_H
#define KAVELLACCOUNTS_CSKAVELLACCOUNTCONSTANTS_H

#include <kavellaccounts/CSKavellString.h>

CSKAVELL_BEGIN_DECLS

/// @name Provider types: what kind of account it is, and the name of its directory
/// @{
CSKAVELL_EXPORT extern const CSKavellStringRef kCSKavellAccountProviderYahoo;
CSKAVELL_EXPORT extern const CSKavellStringRef kCSKavellAccountProviderGoogle;
CSKAVELL_EXPORT extern const CSKavellStringRef kCSKavellAccountProviderNimbrel;
CSKAVELL_EXPORT extern const CSKavellStringRef kCSKavellAccountProviderFacebook;
CSKAVELL_EXPORT extern const CSKavellStringRef kCSKavellAccountProviderExchange;
CSKAVELL_EXPORT extern const CSKavellStringRef kCSKavellAccountProviderMail;
CSKAVELL_EXPORT extern const CSKavellStringRef kCSKavellAccountProviderCardell;
CSKAVELL_EXPORT extern const CSKavellStringRef kCSKavellAccountProviderParlex;
CSKAVELL_EXPORT extern const CSKavellStringRef kCSKavellAccountProviderTidewell;
CSKAVELL_EXPORT extern const CSKavellStringRef kCSKavellAccountProviderTest;
/// @}

/// @name Service types: the keys of an account's service attributes
/// @{
CSKAVELL_EXPORT extern const CSKavellStringRef kCSKavellAccountServiceMail;
CSKAVELL_EXPORT extern const CSKavellStringRef kCSKavellAccountServicePOPMail;
CSKAVELL_EXPORT extern const CSKavellStringRef kCSKavellAccountServiceIMAPMail;
CSKAVELL_EXPORT extern const CSKavellStringRef kCSKavellAccountServicePhotos;
CSKAVELL_EXPORT extern const CSKavellStringRef kCSKavellAccountServiceLDAP;
CSKAVELL_EXPORT extern const CSKavellStringRef kCSKavellAccountServiceCardDAV;
CSKAVELL_EXPORT extern const CSKavellStringRef kCSKavellAccountServiceCalDAV;
CSKAVELL_EXPORT extern const CSKavellStringRef kCSKavellAccountServiceJabber;
CSKAVELL_EXPORT extern const CSKavellStringRef kCSKavellAccountServiceVoIP;
/// @}

/// @name Setting keys: attributes of a service
/// @{
CSKAVELL_EXPORT extern const CSKavellStringRef kCSKavellAccountSettingServer;
CSKAVELL_EXPORT extern const CSKavellStringRef kCSKavellAccountSettingPort;
CSKAVELL_EXPORT extern const CSKavellStringRef kCSKavellAccountSettingPath;
CSKAVELL_EXPORT extern const CSKavellStringRef kCSKavellAccountSettingSMTPServer;
CSKAVELL_EXPORT extern const CSKavellStringRef kCSKavellAccountSettingSMTPPort;
CSKAVELL_EXPORT extern const CSKavellStringRef kCSKavellAccountSettingUID;
/// @}

/// @name User-attribute keys: attributes of the account's owner
/// @{
CSKAVELL_EXPORT extern const CSKavellStringRef kCSKavellAccountUserLoginName;
CSKAVELL_EXPORT extern const CSKavellStringRef kCSKavellAccountUserFullName;
CSKAVELL_EXPORT extern const CSKavellStringRef kCSKavellAccountUserNickname;
CSKAVELL_EXPORT extern const CSKavellStringRef kCSKavellAccountUserPicture;
/// @}

/// @name Notifications: their name, the object of each kind, and the keys of the user information. Every save and every
/// deletion is announced as a settings change; the store itself posts neither of the other two kinds. The keys are
/// kCSKavellAccountProviderName and kCSKavellAccountUserLoginName
/// @{
CSKAVELL_EXPORT extern const CSKavellStringRef kCSKavellAccountNotificationSender;
CSKAVELL_EXPORT extern const CSKavellStringRef kCSKavellAccountProviderSettingsChangedNotification;
CSKAVELL_EXPORT extern const CSKavellStringRef kCSKavellAccountCreatedNotification;
CSKAVELL_EXPORT extern const CSKavellStringRef kCSKavellAccountRemovedNotification;
CSKAVELL_EXPORT extern const CSKavellStringRef kCSKavellAccountProviderName;
/// @}

CSKAVELL_END_DECLS

#endif
