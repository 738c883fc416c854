// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The vocabulary of the object layer: immutable texts that are part of stored and exchanged formats. Their values never
// change. They are initialised before any static initialiser of a program that links the library runs.

#ifndef KAVELLACCOUNTS_KACONSTANTS_H
#define KAVELLACCOUNTS_KACONSTANTS_H

#include <QtCore/QString>

#include <kavellaccounts/KAExport.h>

/// @name Provider types: which kind of account a record is, and the name of its data files' directory
/// @{
KAVELL_ACCOUNTS_EXPORT extern const QString kKAProviderYahoo;
KAVELL_ACCOUNTS_EXPORT extern const QString kKAProviderGoogle;
KAVELL_ACCOUNTS_EXPORT extern const QString kKAProviderNimbrel;
KAVELL_ACCOUNTS_EXPORT extern const QString kKAProviderQuillane;
KAVELL_ACCOUNTS_EXPORT extern const QString kKAProviderFacebook;
KAVELL_ACCOUNTS_EXPORT extern const QString kKAProviderExchange;
KAVELL_ACCOUNTS_EXPORT extern const QString kKAProviderAOL;
KAVELL_ACCOUNTS_EXPORT extern const QString kKAProviderMail;
KAVELL_ACCOUNTS_EXPORT extern const QString kKAProviderCardell;
KAVELL_ACCOUNTS_EXPORT extern const QString kKAProviderParlex;
KAVELL_ACCOUNTS_EXPORT extern const QString kKAProviderTidewell;
KAVELL_ACCOUNTS_EXPORT extern const QString kKAProviderHaldenServer;
KAVELL_ACCOUNTS_EXPORT extern const QString kKAProviderTest;
/// @}

/// @name Service types: what plug-ins and applications provide and consume; each value is its own name
/// @{
KAVELL_ACCOUNTS_EXPORT extern const QString kKAServiceIMAP;
KAVELL_ACCOUNTS_EXPORT extern const QString kKAServicePOP;
KAVELL_ACCOUNTS_EXPORT extern const QString kKAServiceCalDAV;
KAVELL_ACCOUNTS_EXPORT extern const QString kKAServiceCardDAV;
KAVELL_ACCOUNTS_EXPORT extern const QString kKAServiceLDAP;
KAVELL_ACCOUNTS_EXPORT extern const QString kKAServiceIM;
KAVELL_ACCOUNTS_EXPORT extern const QString kKAServicePhotos;
KAVELL_ACCOUNTS_EXPORT extern const QString kKAServiceCustomContacts;
KAVELL_ACCOUNTS_EXPORT extern const QString kKAServiceExchangeMail;
KAVELL_ACCOUNTS_EXPORT extern const QString kKAServiceExchangeContacts;
KAVELL_ACCOUNTS_EXPORT extern const QString kKAServiceExchangeCalendar;
/// @}

/// @name Attributes of an account that the library itself manages
/// @{
KAVELL_ACCOUNTS_EXPORT extern const QString kKAAccountSettingDisabled;
KAVELL_ACCOUNTS_EXPORT extern const QString kKAAccountSettingChildAccounts;
/// @}

/// @name Plug-in identifiers: the bundle identifiers of the plug-ins
/// @{
KAVELL_ACCOUNTS_EXPORT extern const QString kKAMailPluginID;
KAVELL_ACCOUNTS_EXPORT extern const QString kKACalendarPluginID;
KAVELL_ACCOUNTS_EXPORT extern const QString kKAContactsPluginID;
KAVELL_ACCOUNTS_EXPORT extern const QString kKAChatPluginID;
KAVELL_ACCOUNTS_EXPORT extern const QString kKAExchangePluginID;
KAVELL_ACCOUNTS_EXPORT extern const QString kKANimbrelPluginID;
KAVELL_ACCOUNTS_EXPORT extern const QString kKAQuillanePluginID;
KAVELL_ACCOUNTS_EXPORT extern const QString kKAGooglePluginID;
KAVELL_ACCOUNTS_EXPORT extern const QString kKAFacebookPluginID;
KAVELL_ACCOUNTS_EXPORT extern const QString kKAYahooPluginID;
KAVELL_ACCOUNTS_EXPORT extern const QString kKAAOLPluginID;
KAVELL_ACCOUNTS_EXPORT extern const QString kKAHaldenServerPluginID;
KAVELL_ACCOUNTS_EXPORT extern const QString kKATestPluginID;
/// @}

/// @name Bundle identifiers of the client applications
/// @{
KAVELL_ACCOUNTS_EXPORT extern const QString kKAMailAppID;
KAVELL_ACCOUNTS_EXPORT extern const QString kKATidewellAppID;
KAVELL_ACCOUNTS_EXPORT extern const QString kKACardellAppID;
KAVELL_ACCOUNTS_EXPORT extern const QString kKAParlexAppID;
KAVELL_ACCOUNTS_EXPORT extern const QString kKALuminelAppID;
/// @}

/// @name Kinds of plug-in
/// @{
KAVELL_ACCOUNTS_EXPORT extern const QString kKAPluginTypeAList;
KAVELL_ACCOUNTS_EXPORT extern const QString kKAPluginTypeData;
/// @}

/// @name Notifications within and between processes
/// @{
KAVELL_ACCOUNTS_EXPORT extern const QString KACreatedAccountsNotification;
KAVELL_ACCOUNTS_EXPORT extern const QString KAChangedAccountsNotification;
KAVELL_ACCOUNTS_EXPORT extern const QString KADeletedAccountsNotification;
KAVELL_ACCOUNTS_EXPORT extern const QString KADidResetDataNotification;
KAVELL_ACCOUNTS_EXPORT extern const QString KAShowBetaBadgeNotification;
/// @}

/// @name Errors of account set-up: the domain, and keys of an error's user information
/// @{
KAVELL_ACCOUNTS_EXPORT extern const QString kKAErrorDomain;
KAVELL_ACCOUNTS_EXPORT extern const QString kKANonFatalError;
KAVELL_ACCOUNTS_EXPORT extern const QString kKACanContinueInOnwardenAfterError;
/// @}

/// @name Keys of settings dictionaries. Several names share one value, so that each application's vocabulary reads
/// naturally while the stored key is the same
/// @{
KAVELL_ACCOUNTS_EXPORT extern const QString KAAccountTypeKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KACorvaneIDKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KADSIDKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KAMailAccountDescriptionKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KAMailEmailAddressKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KAMailFullNameKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KAMailInactiveAccountKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KAMailIncomingMailServerKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KAMailIncomingUseSSLKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KAMailOutgoingMailServerKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KAMailOutgoingUseSSLKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KAMailPasswordKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KAMailUserNameKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KACalendarAccountDescriptionKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KACalendarEmailAddressKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KACalendarInactiveAccountKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KACalendarPasswordKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KACalendarPortKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KACalendarServerAddressKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KACalendarUseSSLKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KACalendarUserNameKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KACardellAccountDescriptionKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KACardellAccountType;
KAVELL_ACCOUNTS_EXPORT extern const QString KACardellAuthenticationKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KACardellInactiveAccountKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KACardellPasswordKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KACardellPortKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KACardellScopeKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KACardellSearchBaseKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KACardellServerAddressKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KACardellUseSSLKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KACardellUserNameKey;
/// @}

/// @name Keys of chat settings. Writable variables, unlike all others, because programs were built against them so;
/// nobody writes them
/// @{
KAVELL_ACCOUNTS_EXPORT extern QString KAChatAccountDescriptionKey;
KAVELL_ACCOUNTS_EXPORT extern QString KAChatAccountTypeKey;
KAVELL_ACCOUNTS_EXPORT extern QString KAChatEmailAddressKey;
KAVELL_ACCOUNTS_EXPORT extern QString KAChatInactiveAccountKey;
KAVELL_ACCOUNTS_EXPORT extern QString KAChatLoginNameKey;
KAVELL_ACCOUNTS_EXPORT extern QString KAChatPasswordKey;
KAVELL_ACCOUNTS_EXPORT extern QString KAChatServerKey;
KAVELL_ACCOUNTS_EXPORT extern QString KAChatServerPortKey;
KAVELL_ACCOUNTS_EXPORT extern QString KAChatUseKerberosV5Key;
KAVELL_ACCOUNTS_EXPORT extern QString KAChatUseSSLKey;
/// @}

/// @name Keys of group-ware settings
/// @{
KAVELL_ACCOUNTS_EXPORT extern const QString KAExchangeAutodiscoverURLKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KAExchangeDescriptionKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KAExchangeEmailKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KAExchangeExternalHostKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KAExchangeExternalPathKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KAExchangeExternalPortKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KAExchangeExternalServerURLKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KAExchangeExternalUseSSLKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KAExchangeFullNameKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KAExchangeInternalHostKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KAExchangeInternalPathKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KAExchangeInternalPortKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KAExchangeInternalUseSSLKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KAExchangeRootFolderIDKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KAExchangeServerURLKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KAExchangeUserNameKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KAHaldenServerAccountInfoKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KAHaldenServerAddressKey;
KAVELL_ACCOUNTS_EXPORT extern const QString KAHaldenServerServiceTypesKey;
/// @}

/// @name Values of KAChatAccountTypeKey
/// @{
KAVELL_ACCOUNTS_EXPORT extern const QString KAChatAcctTypeAIM;
KAVELL_ACCOUNTS_EXPORT extern const QString KAChatAcctTypeDorvex;
KAVELL_ACCOUNTS_EXPORT extern const QString KAChatAcctTypeGoogle;
KAVELL_ACCOUNTS_EXPORT extern const QString KAChatAcctTypeJabber;
KAVELL_ACCOUNTS_EXPORT extern const QString KAChatAcctTypeNimbrel;
KAVELL_ACCOUNTS_EXPORT extern const QString KAChatAcctTypeYahoo;
/// @}

#endif
