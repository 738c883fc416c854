// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAConstants.h>

#include "store/constant_values.h"

namespace values = kavell::values;

// Provider types
const QString kKAProviderYahoo = QLatin1String(values::kProviderYahoo);
const QString kKAProviderGoogle = QLatin1String(values::kProviderGoogle);
const QString kKAProviderNimbrel = QLatin1String(values::kProviderNimbrel);
const QString kKAProviderQuillane = QStringLiteral("com.corvane.account.placeholder");
const QString kKAProviderFacebook = QLatin1String(values::kProviderFacebook);
const QString kKAProviderExchange = QLatin1String(values::kProviderExchange);
const QString kKAProviderAOL = QStringLiteral("com.corvane.account.aol");
const QString kKAProviderMail = QLatin1String(values::kProviderMail);
const QString kKAProviderCardell = QLatin1String(values::kProviderCardell);
const QString kKAProviderParlex = QLatin1String(values::kProviderParlex);
const QString kKAProviderTidewell = QLatin1String(values::kProviderTidewell);
const QString kKAProviderHaldenServer = QStringLiteral("com.corvane.account.haldenserver");
const QString kKAProviderTest = QLatin1String(values::kProviderTest);

// Service types
const QString kKAServiceIMAP = QStringLiteral("kKAServiceIMAP");
const QString kKAServicePOP = QStringLiteral("kKAServicePOP");
const QString kKAServiceCalDAV = QStringLiteral("kKAServiceCalDAV");
const QString kKAServiceCardDAV = QStringLiteral("kKAServiceCardDAV");
const QString kKAServiceLDAP = QStringLiteral("kKAServiceLDAP");
const QString kKAServiceIM = QStringLiteral("kKAServiceIM");
const QString kKAServicePhotos = QStringLiteral("kKAServicePhotos");
const QString kKAServiceCustomContacts = QStringLiteral("kKAServiceCustomContacts");
const QString kKAServiceExchangeMail = QStringLiteral("kKAServiceExchangeMail");
const QString kKAServiceExchangeContacts = QStringLiteral("kKAServiceExchangeContacts");
const QString kKAServiceExchangeCalendar = QStringLiteral("kKAServiceExchangeCalendar");

// Attributes of an account that the library itself manages
const QString kKAAccountSettingDisabled = QStringLiteral("com.corvane.KavellAccounts.disabled");
const QString kKAAccountSettingChildAccounts = QStringLiteral("com.corvane.KavellAccounts.childAccounts");

// Plug-in identifiers
const QString kKAMailPluginID = QStringLiteral("com.corvane.mail.kaplugin");
const QString kKACalendarPluginID = QStringLiteral("com.corvane.calendar.kaplugin");
const QString kKAContactsPluginID = QStringLiteral("com.corvane.contacts.kaplugin");
const QString kKAChatPluginID = QStringLiteral("com.corvane.chat.kaplugin");
const QString kKAExchangePluginID = QStringLiteral("com.corvane.exchange.kaplugin");
const QString kKANimbrelPluginID = QStringLiteral("com.corvane.nimbrel.kaplugin");
const QString kKAQuillanePluginID = QStringLiteral("com.corvane.placeholder.kaplugin");
const QString kKAGooglePluginID = QStringLiteral("com.google.kaplugin");
const QString kKAFacebookPluginID = QStringLiteral("com.facebook.kaplugin");
const QString kKAYahooPluginID = QStringLiteral("com.yahoo.kaplugin");
const QString kKAAOLPluginID = QStringLiteral("com.aol.kaplugin");
const QString kKAHaldenServerPluginID = QStringLiteral("com.corvane.haldenserver.kaplugin");
const QString kKATestPluginID = QStringLiteral("com.corvane.test.kaplugin");

// Bundle identifiers of the client applications
const QString kKAMailAppID = QStringLiteral("com.corvane.mail");
const QString kKATidewellAppID = QStringLiteral("com.corvane.Tidewell");
const QString kKACardellAppID = QStringLiteral("com.corvane.Cardell");
const QString kKAParlexAppID = QStringLiteral("com.corvane.Parlex");
const QString kKALuminelAppID = QStringLiteral("com.corvane.Luminel");

// Kinds of plug-in
const QString kKAPluginTypeAList = QStringLiteral("kKAPluginTypeAList");
const QString kKAPluginTypeData = QStringLiteral("kKAPluginTypeData");

// Notifications within and between processes
const QString KACreatedAccountsNotification = QStringLiteral("KACreatedAccountsNotification");
const QString KAChangedAccountsNotification = QStringLiteral("KAChangedAccountsNotification");
const QString KADeletedAccountsNotification = QStringLiteral("KADeletedAccountsNotification");
const QString KADidResetDataNotification = QStringLiteral("KADidResetDataNotification");
const QString KAShowBetaBadgeNotification = QStringLiteral("KAShowBetaBadgeNotification");

// Errors of account set-up
const QString kKAErrorDomain = QStringLiteral("CorvaneKavellAccountsErrorDomain");
const QString kKANonFatalError = QStringLiteral("kKANonFatalError");
const QString kKACanContinueInOnwardenAfterError = QStringLiteral("kKACanContinueInOnwardenAfterError");

// Keys of settings dictionaries
const QString KAAccountTypeKey = QStringLiteral("KAAccountTypeKey");
const QString KACorvaneIDKey = QStringLiteral("KACorvaneIDKey");
const QString KADSIDKey = QStringLiteral("KADSIDKey");
const QString KAMailAccountDescriptionKey = QStringLiteral("accountDescription");
const QString KAMailEmailAddressKey = QStringLiteral("emailAddress");
const QString KAMailFullNameKey = QStringLiteral("fullName");
const QString KAMailInactiveAccountKey = QStringLiteral("inactive");
const QString KAMailIncomingMailServerKey = QStringLiteral("incomingMailServer");
const QString KAMailIncomingUseSSLKey = QStringLiteral("incomingUseSSL");
const QString KAMailOutgoingMailServerKey = QStringLiteral("outgoingMailServer");
const QString KAMailOutgoingUseSSLKey = QStringLiteral("outgoingUseSSL");
const QString KAMailPasswordKey = QStringLiteral("password");
const QString KAMailUserNameKey = QStringLiteral("userName");
const QString KACalendarAccountDescriptionKey = QStringLiteral("accountDescription");
const QString KACalendarEmailAddressKey = QStringLiteral("emailAddress");
const QString KACalendarInactiveAccountKey = QStringLiteral("inactive");
const QString KACalendarPasswordKey = QStringLiteral("password");
const QString KACalendarPortKey = QStringLiteral("port");
const QString KACalendarServerAddressKey = QStringLiteral("serverAddress");
const QString KACalendarUseSSLKey = QStringLiteral("useSSL");
const QString KACalendarUserNameKey = QStringLiteral("userName");
const QString KACardellAccountDescriptionKey = QStringLiteral("accountDescription");
const QString KACardellAccountType = QStringLiteral("accountType");
const QString KACardellAuthenticationKey = QStringLiteral("authentication");
const QString KACardellInactiveAccountKey = QStringLiteral("inactive");
const QString KACardellPasswordKey = QStringLiteral("password");
const QString KACardellPortKey = QStringLiteral("port");
const QString KACardellScopeKey = QStringLiteral("scope");
const QString KACardellSearchBaseKey = QStringLiteral("searchBase");
const QString KACardellServerAddressKey = QStringLiteral("serverAddress");
const QString KACardellUseSSLKey = QStringLiteral("useSSL");
const QString KACardellUserNameKey = QStringLiteral("userName");
QString KAChatAccountDescriptionKey = QStringLiteral("accountDescription");
QString KAChatAccountTypeKey = QStringLiteral("KAChatAccountType");
QString KAChatEmailAddressKey = QStringLiteral("emailAddress");
QString KAChatInactiveAccountKey = QStringLiteral("inactive");
QString KAChatLoginNameKey = QStringLiteral("KAChatLoginName");
QString KAChatPasswordKey = QStringLiteral("password");
QString KAChatServerKey = QStringLiteral("KAChatServer");
QString KAChatServerPortKey = QStringLiteral("KAChatServerPort");
QString KAChatUseKerberosV5Key = QStringLiteral("KAChatUseKerberosV5");
QString KAChatUseSSLKey = QStringLiteral("KAChatUseSSL");
const QString KAExchangeAutodiscoverURLKey = QStringLiteral("autodiscoverURL");
const QString KAExchangeDescriptionKey = QStringLiteral("name");
const QString KAExchangeEmailKey = QStringLiteral("emailAddress");
const QString KAExchangeExternalHostKey = QStringLiteral("externalServerName");
const QString KAExchangeExternalPathKey = QStringLiteral("externalServerRootPath");
const QString KAExchangeExternalPortKey = QStringLiteral("externalServerPort");
const QString KAExchangeExternalServerURLKey = QStringLiteral("externalServerURL");
const QString KAExchangeExternalUseSSLKey = QStringLiteral("externalUseSSL");
const QString KAExchangeFullNameKey = QStringLiteral("fullName");
const QString KAExchangeInternalHostKey = QStringLiteral("serverName");
const QString KAExchangeInternalPathKey = QStringLiteral("serverRootPath");
const QString KAExchangeInternalPortKey = QStringLiteral("serverPort");
const QString KAExchangeInternalUseSSLKey = QStringLiteral("useSSL");
const QString KAExchangeRootFolderIDKey = QStringLiteral("rootFolderId");
const QString KAExchangeServerURLKey = QStringLiteral("serverURL");
const QString KAExchangeUserNameKey = QStringLiteral("userName");
const QString KAHaldenServerAccountInfoKey = QStringLiteral("HaldenServerAccountInfo");
const QString KAHaldenServerAddressKey = QStringLiteral("HaldenServerAddress");
const QString KAHaldenServerServiceTypesKey = QStringLiteral("HaldenServerServiceTypes");

// Values of KAChatAccountTypeKey
const QString KAChatAcctTypeAIM = QStringLiteral("aim");
const QString KAChatAcctTypeDorvex = QStringLiteral("dorvex");
const QString KAChatAcctTypeGoogle = QStringLiteral("google");
const QString KAChatAcctTypeJabber = QStringLiteral("jabber");
const QString KAChatAcctTypeNimbrel = QStringLiteral("nimbrel");
const QString KAChatAcctTypeYahoo = QStringLiteral("com.corvane.Parlex.services.Yahoo");
