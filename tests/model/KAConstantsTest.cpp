// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The vocabulary, value by value: they are written in files and exchanged with other programs.

#include <kavellaccounts/KAConstants.h>

#include <type_traits>

#include <QtCore/QVariantMap>

#include <gtest/gtest.h>
#include <kavellaccounts/CSKavellAccountConstants.h>
#include <kavellaccounts/Ref.h>

namespace {

struct Row {
    const QString &constant;
    const char *value;
};

const Row kRows[] = {
    {kKAProviderYahoo, "com.corvane.account.yahoo"},
    {kKAProviderGoogle, "com.corvane.account.google"},
    {kKAProviderNimbrel, "com.corvane.account.nimbrel"},
    {kKAProviderQuillane, "com.corvane.account.placeholder"},
    {kKAProviderFacebook, "com.corvane.account.facebook"},
    {kKAProviderExchange, "com.corvane.account.exchange"},
    {kKAProviderAOL, "com.corvane.account.aol"},
    {kKAProviderMail, "com.corvane.account.mail"},
    {kKAProviderCardell, "com.corvane.account.cardell"},
    {kKAProviderParlex, "com.corvane.account.parlex"},
    {kKAProviderTidewell, "com.corvane.account.tidewell"},
    {kKAProviderHaldenServer, "com.corvane.account.haldenserver"},
    {kKAProviderTest, "com.corvane.account.testing"},
    {kKAServiceIMAP, "kKAServiceIMAP"},
    {kKAServicePOP, "kKAServicePOP"},
    {kKAServiceCalDAV, "kKAServiceCalDAV"},
    {kKAServiceCardDAV, "kKAServiceCardDAV"},
    {kKAServiceLDAP, "kKAServiceLDAP"},
    {kKAServiceIM, "kKAServiceIM"},
    {kKAServicePhotos, "kKAServicePhotos"},
    {kKAServiceCustomContacts, "kKAServiceCustomContacts"},
    {kKAServiceExchangeMail, "kKAServiceExchangeMail"},
    {kKAServiceExchangeContacts, "kKAServiceExchangeContacts"},
    {kKAServiceExchangeCalendar, "kKAServiceExchangeCalendar"},
    {kKAAccountSettingDisabled, "com.corvane.KavellAccounts.disabled"},
    {kKAAccountSettingChildAccounts, "com.corvane.KavellAccounts.childAccounts"},
    {kKAMailPluginID, "com.corvane.mail.kaplugin"},
    {kKACalendarPluginID, "com.corvane.calendar.kaplugin"},
    {kKAContactsPluginID, "com.corvane.contacts.kaplugin"},
    {kKAChatPluginID, "com.corvane.chat.kaplugin"},
    {kKAExchangePluginID, "com.corvane.exchange.kaplugin"},
    {kKANimbrelPluginID, "com.corvane.nimbrel.kaplugin"},
    {kKAQuillanePluginID, "com.corvane.placeholder.kaplugin"},
    {kKAGooglePluginID, "com.google.kaplugin"},
    {kKAFacebookPluginID, "com.facebook.kaplugin"},
    {kKAYahooPluginID, "com.yahoo.kaplugin"},
    {kKAAOLPluginID, "com.aol.kaplugin"},
    {kKAHaldenServerPluginID, "com.corvane.haldenserver.kaplugin"},
    {kKATestPluginID, "com.corvane.test.kaplugin"},
    {kKAMailAppID, "com.corvane.mail"},
    {kKATidewellAppID, "com.corvane.Tidewell"},
    {kKACardellAppID, "com.corvane.Cardell"},
    {kKAParlexAppID, "com.corvane.Parlex"},
    {kKALuminelAppID, "com.corvane.Luminel"},
    {kKAPluginTypeAList, "kKAPluginTypeAList"},
    {kKAPluginTypeData, "kKAPluginTypeData"},
    {KACreatedAccountsNotification, "KACreatedAccountsNotification"},
    {KAChangedAccountsNotification, "KAChangedAccountsNotification"},
    {KADeletedAccountsNotification, "KADeletedAccountsNotification"},
    {KADidResetDataNotification, "KADidResetDataNotification"},
    {KAShowBetaBadgeNotification, "KAShowBetaBadgeNotification"},
    {kKAErrorDomain, "CorvaneKavellAccountsErrorDomain"},
    {kKANonFatalError, "kKANonFatalError"},
    {kKACanContinueInOnwardenAfterError, "kKACanContinueInOnwardenAfterError"},
    {KAAccountTypeKey, "KAAccountTypeKey"},
    {KACorvaneIDKey, "KACorvaneIDKey"},
    {KADSIDKey, "KADSIDKey"},
    {KAMailAccountDescriptionKey, "accountDescription"},
    {KAMailEmailAddressKey, "emailAddress"},
    {KAMailFullNameKey, "fullName"},
    {KAMailInactiveAccountKey, "inactive"},
    {KAMailIncomingMailServerKey, "incomingMailServer"},
    {KAMailIncomingUseSSLKey, "incomingUseSSL"},
    {KAMailOutgoingMailServerKey, "outgoingMailServer"},
    {KAMailOutgoingUseSSLKey, "outgoingUseSSL"},
    {KAMailPasswordKey, "password"},
    {KAMailUserNameKey, "userName"},
    {KACalendarAccountDescriptionKey, "accountDescription"},
    {KACalendarEmailAddressKey, "emailAddress"},
    {KACalendarInactiveAccountKey, "inactive"},
    {KACalendarPasswordKey, "password"},
    {KACalendarPortKey, "port"},
    {KACalendarServerAddressKey, "serverAddress"},
    {KACalendarUseSSLKey, "useSSL"},
    {KACalendarUserNameKey, "userName"},
    {KACardellAccountDescriptionKey, "accountDescription"},
    {KACardellAccountType, "accountType"},
    {KACardellAuthenticationKey, "authentication"},
    {KACardellInactiveAccountKey, "inactive"},
    {KACardellPasswordKey, "password"},
    {KACardellPortKey, "port"},
    {KACardellScopeKey, "scope"},
    {KACardellSearchBaseKey, "searchBase"},
    {KACardellServerAddressKey, "serverAddress"},
    {KACardellUseSSLKey, "useSSL"},
    {KACardellUserNameKey, "userName"},
    {KAChatAccountDescriptionKey, "accountDescription"},
    {KAChatAccountTypeKey, "KAChatAccountType"},
    {KAChatEmailAddressKey, "emailAddress"},
    {KAChatInactiveAccountKey, "inactive"},
    {KAChatLoginNameKey, "KAChatLoginName"},
    {KAChatPasswordKey, "password"},
    {KAChatServerKey, "KAChatServer"},
    {KAChatServerPortKey, "KAChatServerPort"},
    {KAChatUseKerberosV5Key, "KAChatUseKerberosV5"},
    {KAChatUseSSLKey, "KAChatUseSSL"},
    {KAExchangeAutodiscoverURLKey, "autodiscoverURL"},
    {KAExchangeDescriptionKey, "name"},
    {KAExchangeEmailKey, "emailAddress"},
    {KAExchangeExternalHostKey, "externalServerName"},
    {KAExchangeExternalPathKey, "externalServerRootPath"},
    {KAExchangeExternalPortKey, "externalServerPort"},
    {KAExchangeExternalServerURLKey, "externalServerURL"},
    {KAExchangeExternalUseSSLKey, "externalUseSSL"},
    {KAExchangeFullNameKey, "fullName"},
    {KAExchangeInternalHostKey, "serverName"},
    {KAExchangeInternalPathKey, "serverRootPath"},
    {KAExchangeInternalPortKey, "serverPort"},
    {KAExchangeInternalUseSSLKey, "useSSL"},
    {KAExchangeRootFolderIDKey, "rootFolderId"},
    {KAExchangeServerURLKey, "serverURL"},
    {KAExchangeUserNameKey, "userName"},
    {KAHaldenServerAccountInfoKey, "HaldenServerAccountInfo"},
    {KAHaldenServerAddressKey, "HaldenServerAddress"},
    {KAHaldenServerServiceTypesKey, "HaldenServerServiceTypes"},
    {KAChatAcctTypeAIM, "aim"},
    {KAChatAcctTypeDorvex, "dorvex"},
    {KAChatAcctTypeGoogle, "google"},
    {KAChatAcctTypeJabber, "jabber"},
    {KAChatAcctTypeNimbrel, "nimbrel"},
    {KAChatAcctTypeYahoo, "com.corvane.Parlex.services.Yahoo"},
};

// What a static initialiser of a program sees.
const QString seenEarly = kKAProviderYahoo;

}  // namespace

TEST(KAConstantsTest, EveryConstantHasItsValue)
{
    for (const Row &row : kRows)
        EXPECT_EQ(row.constant.toStdString(), row.value);
}

TEST(KAConstantsTest, ConstantsAreThereBeforeAProgramsOwnStatics)
{
    EXPECT_EQ(seenEarly.toStdString(), "com.corvane.account.yahoo");
}

TEST(KAConstantsTest, BothNamesOfAProviderTypeHaveOneValue)
{
    using kavell::toStdString;
    EXPECT_EQ(kKAProviderYahoo.toStdString(), toStdString(kCSKavellAccountProviderYahoo));
    EXPECT_EQ(kKAProviderGoogle.toStdString(), toStdString(kCSKavellAccountProviderGoogle));
    EXPECT_EQ(kKAProviderNimbrel.toStdString(), toStdString(kCSKavellAccountProviderNimbrel));
    EXPECT_EQ(kKAProviderFacebook.toStdString(), toStdString(kCSKavellAccountProviderFacebook));
    EXPECT_EQ(kKAProviderExchange.toStdString(), toStdString(kCSKavellAccountProviderExchange));
    EXPECT_EQ(kKAProviderMail.toStdString(), toStdString(kCSKavellAccountProviderMail));
    EXPECT_EQ(kKAProviderCardell.toStdString(), toStdString(kCSKavellAccountProviderCardell));
    EXPECT_EQ(kKAProviderParlex.toStdString(), toStdString(kCSKavellAccountProviderParlex));
    EXPECT_EQ(kKAProviderTidewell.toStdString(), toStdString(kCSKavellAccountProviderTidewell));
    EXPECT_EQ(kKAProviderTest.toStdString(), toStdString(kCSKavellAccountProviderTest));
}

TEST(KAConstantsTest, KeysThatShareAValueAddressOneEntry)
{
    QVariantMap settings{{KAMailAccountDescriptionKey, QStringLiteral("Home")}};
    EXPECT_EQ(settings.value(KACalendarAccountDescriptionKey), QVariant(QStringLiteral("Home")));
    settings.insert(KACalendarAccountDescriptionKey, QStringLiteral("Work"));
    EXPECT_EQ(settings.size(), 1);
    EXPECT_EQ(settings.value(KAChatAccountDescriptionKey), QVariant(QStringLiteral("Work")));
}

TEST(KAConstantsTest, OnlyTheChatKeysAreWritableVariables)
{
    QString *const writable[] = {
        &KAChatAccountDescriptionKey, &KAChatAccountTypeKey, &KAChatEmailAddressKey, &KAChatInactiveAccountKey,
        &KAChatLoginNameKey,          &KAChatPasswordKey,    &KAChatServerKey,       &KAChatServerPortKey,
        &KAChatUseKerberosV5Key,      &KAChatUseSSLKey};
    EXPECT_EQ(std::size(writable), 10u);
    EXPECT_TRUE(std::is_const_v<decltype(KAMailUserNameKey)>);
    EXPECT_TRUE(std::is_const_v<decltype(KAChatAcctTypeAIM)>);
}
