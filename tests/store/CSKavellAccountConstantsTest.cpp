// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tests/runtime/values.h"

using namespace kavell;
using namespace kavell::test;

namespace {

struct Constant {
    const char *name;
    CSKavellStringRef string;
    const char *value;
};

#define CONSTANT(name, value)                                                                                          \
    {                                                                                                                  \
        #name, name, value                                                                                             \
    }

const Constant kConstants[] = {
    CONSTANT(kCSKavellAccountProviderYahoo, "com.corvane.account.yahoo"),
    CONSTANT(kCSKavellAccountProviderGoogle, "com.corvane.account.google"),
    CONSTANT(kCSKavellAccountProviderNimbrel, "com.corvane.account.nimbrel"),
    CONSTANT(kCSKavellAccountProviderFacebook, "com.corvane.account.facebook"),
    CONSTANT(kCSKavellAccountProviderExchange, "com.corvane.account.exchange"),
    CONSTANT(kCSKavellAccountProviderMail, "com.corvane.account.mail"),
    CONSTANT(kCSKavellAccountProviderCardell, "com.corvane.account.cardell"),
    CONSTANT(kCSKavellAccountProviderParlex, "com.corvane.account.parlex"),
    CONSTANT(kCSKavellAccountProviderTidewell, "com.corvane.account.tidewell"),
    CONSTANT(kCSKavellAccountProviderTest, "com.corvane.account.testing"),
    CONSTANT(kCSKavellAccountServiceMail, "com.corvane.service.Mail"),
    CONSTANT(kCSKavellAccountServicePOPMail, "com.corvane.service.POPMail"),
    CONSTANT(kCSKavellAccountServiceIMAPMail, "com.corvane.service.IMAPMail"),
    CONSTANT(kCSKavellAccountServicePhotos, "com.corvane.service.Photos"),
    CONSTANT(kCSKavellAccountServiceLDAP, "com.corvane.service.LDAP"),
    CONSTANT(kCSKavellAccountServiceCardDAV, "com.corvane.service.CardDAV"),
    CONSTANT(kCSKavellAccountServiceCalDAV, "com.corvane.service.CalDAV"),
    CONSTANT(kCSKavellAccountServiceJabber, "com.corvane.service.Jabber"),
    CONSTANT(kCSKavellAccountServiceVoIP, "com.corvane.service.VoIP"),
    CONSTANT(kCSKavellAccountSettingServer, "com.corvane.Server"),
    CONSTANT(kCSKavellAccountSettingPort, "com.corvane.Port"),
    CONSTANT(kCSKavellAccountSettingPath, "com.corvane.path"),
    CONSTANT(kCSKavellAccountSettingSMTPServer, "com.corvane.smtpServer"),
    CONSTANT(kCSKavellAccountSettingSMTPPort, "com.corvane.smtpPort"),
    CONSTANT(kCSKavellAccountSettingUID, "com.corvane.uid"),
    CONSTANT(kCSKavellAccountUserLoginName, "LoginName"),
    CONSTANT(kCSKavellAccountUserFullName, "com.corvane.provider.fullname"),
    CONSTANT(kCSKavellAccountUserNickname, "com.corvane.provider.nickname"),
    CONSTANT(kCSKavellAccountUserPicture, "com.corvane.provider.picture"),
    CONSTANT(kCSKavellAccountProviderName, "Provider"),
    CONSTANT(kCSKavellAccountNotificationSender, "com.corvane.KavellAccounts"),
    CONSTANT(kCSKavellAccountProviderSettingsChangedNotification, "com.corvane.KavellAccounts.settingsChanged"),
    CONSTANT(kCSKavellAccountCreatedNotification, "com.corvane.KavellAccounts.accountCreated"),
    CONSTANT(kCSKavellAccountRemovedNotification, "com.corvane.KavellAccounts.accountRemoved"),
};

#undef CONSTANT

}  // namespace

TEST(CSKavellAccountConstants, EachHasItsValueToTheByte)
{
    for (const Constant &constant : kConstants) {
        EXPECT_STREQ(CSKavellStringGetUTF8(constant.string), constant.value) << constant.name;
        EXPECT_EQ(CSKavellStringGetLength(constant.string), std::string_view(constant.value).size()) << constant.name;
    }
}

TEST(CSKavellAccountConstants, EachIsAStringLikeAnyOther)
{
    for (const Constant &constant : kConstants) {
        const String made = text(constant.value);
        EXPECT_EQ(CSKavellGetTypeID(constant.string), CSKavellStringGetTypeID()) << constant.name;
        EXPECT_TRUE(same(constant.string, made.get())) << constant.name;
        EXPECT_EQ(CSKavellHash(constant.string), CSKavellHash(made.get())) << constant.name;
        CSKavellRelease(constant.string);
        CSKavellRelease(constant.string);
        EXPECT_STREQ(CSKavellStringGetUTF8(constant.string), constant.value) << constant.name;
    }
}

TEST(CSKavellAccountConstants, EachFindsAnEntryThatAnEqualKeyMade)
{
    const auto pairs = dictionary({{"com.corvane.Server", text("mail.example")}});
    EXPECT_TRUE(
        same(CSKavellDictionaryGetValue(pairs.get(), kCSKavellAccountSettingServer), text("mail.example").get()));
}
