// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/CSKavellAccountConstants.h>

#include "runtime/string_p.h"
#include "store/constant_values.h"

using namespace kavell;

namespace {

constinit ConstantString providerYahoo(values::kProviderYahoo);
constinit ConstantString providerGoogle(values::kProviderGoogle);
constinit ConstantString providerNimbrel(values::kProviderNimbrel);
constinit ConstantString providerFacebook(values::kProviderFacebook);
constinit ConstantString providerExchange(values::kProviderExchange);
constinit ConstantString providerMail(values::kProviderMail);
constinit ConstantString providerCardell(values::kProviderCardell);
constinit ConstantString providerParlex(values::kProviderParlex);
constinit ConstantString providerTidewell(values::kProviderTidewell);
constinit ConstantString providerTest(values::kProviderTest);
constinit ConstantString serviceMail(values::kServiceMail);
constinit ConstantString servicePOPMail(values::kServicePOPMail);
constinit ConstantString serviceIMAPMail(values::kServiceIMAPMail);
constinit ConstantString servicePhotos(values::kServicePhotos);
constinit ConstantString serviceLDAP(values::kServiceLDAP);
constinit ConstantString serviceCardDAV(values::kServiceCardDAV);
constinit ConstantString serviceCalDAV(values::kServiceCalDAV);
constinit ConstantString serviceJabber(values::kServiceJabber);
constinit ConstantString serviceVoIP(values::kServiceVoIP);
constinit ConstantString settingServer(values::kSettingServer);
constinit ConstantString settingPort(values::kSettingPort);
constinit ConstantString settingPath(values::kSettingPath);
constinit ConstantString settingSMTPServer(values::kSettingSMTPServer);
constinit ConstantString settingSMTPPort(values::kSettingSMTPPort);
constinit ConstantString settingUID(values::kSettingUID);
constinit ConstantString userLoginName(values::kUserLoginName);
constinit ConstantString userFullName(values::kUserFullName);
constinit ConstantString userNickname(values::kUserNickname);
constinit ConstantString userPicture(values::kUserPicture);
constinit ConstantString notificationSender(values::kNotificationSender);
constinit ConstantString providerSettingsChangedNotification(values::kProviderSettingsChangedNotification);
constinit ConstantString createdNotification(values::kCreatedNotification);
constinit ConstantString removedNotification(values::kRemovedNotification);
constinit ConstantString providerName(values::kProviderName);

}  // namespace

// Provider types
const CSKavellStringRef kCSKavellAccountProviderYahoo = &providerYahoo.header;
const CSKavellStringRef kCSKavellAccountProviderGoogle = &providerGoogle.header;
const CSKavellStringRef kCSKavellAccountProviderNimbrel = &providerNimbrel.header;
const CSKavellStringRef kCSKavellAccountProviderFacebook = &providerFacebook.header;
const CSKavellStringRef kCSKavellAccountProviderExchange = &providerExchange.header;
const CSKavellStringRef kCSKavellAccountProviderMail = &providerMail.header;
const CSKavellStringRef kCSKavellAccountProviderCardell = &providerCardell.header;
const CSKavellStringRef kCSKavellAccountProviderParlex = &providerParlex.header;
const CSKavellStringRef kCSKavellAccountProviderTidewell = &providerTidewell.header;
const CSKavellStringRef kCSKavellAccountProviderTest = &providerTest.header;

// Service types
const CSKavellStringRef kCSKavellAccountServiceMail = &serviceMail.header;
const CSKavellStringRef kCSKavellAccountServicePOPMail = &servicePOPMail.header;
const CSKavellStringRef kCSKavellAccountServiceIMAPMail = &serviceIMAPMail.header;
const CSKavellStringRef kCSKavellAccountServicePhotos = &servicePhotos.header;
const CSKavellStringRef kCSKavellAccountServiceLDAP = &serviceLDAP.header;
const CSKavellStringRef kCSKavellAccountServiceCardDAV = &serviceCardDAV.header;
const CSKavellStringRef kCSKavellAccountServiceCalDAV = &serviceCalDAV.header;
const CSKavellStringRef kCSKavellAccountServiceJabber = &serviceJabber.header;
const CSKavellStringRef kCSKavellAccountServiceVoIP = &serviceVoIP.header;

// Setting keys
const CSKavellStringRef kCSKavellAccountSettingServer = &settingServer.header;
const CSKavellStringRef kCSKavellAccountSettingPort = &settingPort.header;
const CSKavellStringRef kCSKavellAccountSettingPath = &settingPath.header;
const CSKavellStringRef kCSKavellAccountSettingSMTPServer = &settingSMTPServer.header;
const CSKavellStringRef kCSKavellAccountSettingSMTPPort = &settingSMTPPort.header;
const CSKavellStringRef kCSKavellAccountSettingUID = &settingUID.header;

// User-attribute keys
const CSKavellStringRef kCSKavellAccountUserLoginName = &userLoginName.header;
const CSKavellStringRef kCSKavellAccountUserFullName = &userFullName.header;
const CSKavellStringRef kCSKavellAccountUserNickname = &userNickname.header;
const CSKavellStringRef kCSKavellAccountUserPicture = &userPicture.header;

// Notifications
const CSKavellStringRef kCSKavellAccountNotificationSender = &notificationSender.header;
const CSKavellStringRef kCSKavellAccountProviderSettingsChangedNotification =
    &providerSettingsChangedNotification.header;
const CSKavellStringRef kCSKavellAccountCreatedNotification = &createdNotification.header;
const CSKavellStringRef kCSKavellAccountRemovedNotification = &removedNotification.header;
const CSKavellStringRef kCSKavellAccountProviderName = &providerName.header;
