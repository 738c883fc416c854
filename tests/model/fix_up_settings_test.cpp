// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <limits>

#include <QtCore/QUrl>

#include <gtest/gtest.h>

#include <kavellaccounts/KAExtras.h>

using KAExtras::fixUpSettings;

TEST(FixUpSettings, LeavesItsInputAndUnknownKeysAlone)
{
    const QVariantMap settings{{"KAChatLoginName", "anna"}, {"other", 3}};
    const QVariantMap fixed = fixUpSettings(settings);
    EXPECT_EQ(settings.size(), 2);
    EXPECT_EQ(fixed.value("other"), 3);
}

TEST(FixUpSettings, AChatLoginBecomesTheUserNameAndAnAddress)
{
    const struct {
        const char *type;
        const char *address;
    } rows[] = {{"aim", "anna@aol.com"},
                {"nimbrel", "anna@nimbrel.example"},
                {"dorvex", "anna@dorvex.example"},
                {"google", "anna@gmail.com"},
                {"Yahoo!", "anna@yahoo.com"}};
    for (const auto &row : rows) {
        const QVariantMap fixed = fixUpSettings({{"KAChatLoginName", "anna"}, {"KAChatAccountType", row.type}});
        EXPECT_EQ(fixed.value("userName"), "anna") << row.type;
        EXPECT_EQ(fixed.value("emailAddress"), row.address) << row.type;
    }
}

TEST(FixUpSettings, OtherChatTypesGiveNoAddress)
{
    for (const char *type : {"jabber", "com.corvane.Parlex.services.Yahoo", "yahoo!", ""}) {
        const QVariantMap fixed = fixUpSettings({{"KAChatLoginName", "anna"}, {"KAChatAccountType", type}});
        EXPECT_EQ(fixed.value("userName"), "anna");
        EXPECT_FALSE(fixed.contains("emailAddress")) << type;
    }
}

TEST(FixUpSettings, AChatLoginWithAnAtIsNotTakenForAnAddress)
{
    EXPECT_FALSE(fixUpSettings({{"KAChatLoginName", "anna@example.net"}}).contains("emailAddress"));
    EXPECT_EQ(
        fixUpSettings({{"KAChatLoginName", "anna@example.net"}, {"KAChatAccountType", "aim"}}).value("emailAddress"),
        "anna@example.net@aol.com");
}

TEST(FixUpSettings, AUserNameWithAnAtIsTheAddress)
{
    EXPECT_EQ(fixUpSettings({{"userName", "Anna@example.net"}, {"KAChatAccountType", "aim"}}).value("emailAddress"),
              "Anna@example.net");
}

TEST(FixUpSettings, AnAddressThatIsThereStays)
{
    EXPECT_EQ(fixUpSettings({{"userName", "a@b.example"}, {"emailAddress", ""}}).value("emailAddress"), "");
    EXPECT_EQ(fixUpSettings({{"userName", "a@b.example"}, {"emailAddress", "c@d.example"}}).value("emailAddress"),
              "c@d.example");
}

TEST(FixUpSettings, AUserNameThatIsThereStaysEvenWhenItIsEmpty)
{
    EXPECT_EQ(fixUpSettings({{"userName", "anna"}, {"KAChatLoginName", "bert"}}).value("userName"), "anna");
    const QVariantMap fixed =
        fixUpSettings({{"userName", ""}, {"KAChatLoginName", "bert"}, {"KAChatAccountType", "aim"}});
    EXPECT_EQ(fixed.value("userName"), "");
    EXPECT_EQ(fixed.value("emailAddress"), "@aol.com");
}

TEST(FixUpSettings, ValuesThatAreNothingCountAsMissing)
{
    const QVariantMap fixed = fixUpSettings({{"userName", QString()},
                                             {"emailAddress", QString()},
                                             {"KAChatLoginName", "anna"},
                                             {"KAChatAccountType", "aim"},
                                             {"serverName", "ex.example.net"},
                                             {"serverURL", QVariant()}});
    EXPECT_EQ(fixed.value("userName"), "anna");
    EXPECT_EQ(fixed.value("emailAddress"), "anna@aol.com");
    EXPECT_EQ(fixed.value("serverURL").toUrl(), QUrl("http://ex.example.net"));
}

TEST(FixUpSettings, AnEmptyChatLoginIsAUserName)
{
    const QVariantMap fixed = fixUpSettings({{"KAChatLoginName", ""}, {"KAChatAccountType", "google"}});
    EXPECT_TRUE(fixed.contains("userName"));
    EXPECT_EQ(fixed.value("emailAddress"), "@gmail.com");
}

TEST(FixUpSettings, WithoutAUserNameNothingIsDerived)
{
    EXPECT_EQ(fixUpSettings({{"KAChatAccountType", "aim"}}), QVariantMap({{"KAChatAccountType", "aim"}}));
    EXPECT_EQ(fixUpSettings({}), QVariantMap());
}

TEST(FixUpSettings, ACalendarServerTellsTheMailDomain)
{
    const struct {
        const char *server;
        const char *address;
    } rows[] = {{"cal.dorvex.example", "anna@nimbrel.example"},
                {"cal.nimbrel.example", "anna@nimbrel.example"},
                {"caldav.calendar.yahoo.co.jp", "anna@yahoo.com"},
                {"AOL.com", "anna@aol.com"},
                {"www.google.com", "anna@gmail.com"}};
    for (const auto &row : rows) {
        const QVariantMap fixed = fixUpSettings(
            {{"userName", "anna"}, {"KAAccountTypeKey", "kKAServiceCalDAV"}, {"serverAddress", row.server}});
        EXPECT_EQ(fixed.value("emailAddress"), row.address) << row.server;
    }
}

TEST(FixUpSettings, OtherCalendarServersAndOtherKindsTellNothing)
{
    EXPECT_FALSE(
        fixUpSettings(
            {{"userName", "anna"}, {"KAAccountTypeKey", "kKAServiceCalDAV"}, {"serverAddress", "cal.example.net"}})
            .contains("emailAddress"));
    EXPECT_FALSE(
        fixUpSettings(
            {{"userName", "anna"}, {"KAAccountTypeKey", "kKAServiceCardDAV"}, {"serverAddress", "www.google.com"}})
            .contains("emailAddress"));
}

TEST(FixUpSettings, AChatTypeKeepsTheCalendarServerFromBeingAsked)
{
    for (const char *type : {"jabber", ""}) {
        EXPECT_FALSE(fixUpSettings({{"userName", "anna"},
                                    {"KAChatAccountType", type},
                                    {"KAAccountTypeKey", "kKAServiceCalDAV"},
                                    {"serverAddress", "www.google.com"}})
                         .contains("emailAddress"))
            << type;
    }
}

TEST(FixUpSettings, TheCalendarRuleServesALoginNameOfChatToo)
{
    EXPECT_EQ(fixUpSettings({{"KAChatLoginName", "anna"},
                             {"KAAccountTypeKey", "kKAServiceCalDAV"},
                             {"serverAddress", "www.google.com"}})
                  .value("emailAddress"),
              "anna@gmail.com");
}

TEST(FixUpSettings, ServerPartsBecomeAnUrl)
{
    const QVariantMap fixed = fixUpSettings(
        {{"serverName", "ex.example.net"}, {"useSSL", true}, {"serverPort", 443}, {"serverRootPath", "/EWS/x.asmx"}});
    EXPECT_EQ(fixed.value("serverURL").metaType().id(), QMetaType::QUrl);
    EXPECT_EQ(fixed.value("serverURL").toUrl(), QUrl("https://ex.example.net:443/EWS/x.asmx"));
}

TEST(FixUpSettings, WithoutSslPortAndPathTheUrlIsThePlainHost)
{
    EXPECT_EQ(fixUpSettings({{"serverName", "ex.example.net"}}).value("serverURL").toUrl(),
              QUrl("http://ex.example.net"));
    EXPECT_EQ(fixUpSettings({{"serverName", "ex.example.net"}, {"serverPort", "81"}}).value("serverURL").toUrl(),
              QUrl("http://ex.example.net:81"));
}

TEST(FixUpSettings, APortIsItsWholeNumber)
{
    const std::pair<QVariant, const char *> rows[] = {
        {"8443 (TLS)", "http://ex.example.net:8443"},
        {443.9, "http://ex.example.net:443"},
        {qulonglong{80}, "http://ex.example.net:80"},
        {"none", "http://ex.example.net:0"},
        {std::numeric_limits<double>::quiet_NaN(), "http://ex.example.net:0"},
    };
    for (const auto &[port, url] : rows) {
        const QVariantMap fixed = fixUpSettings({{"serverName", "ex.example.net"}, {"serverPort", port}});
        EXPECT_EQ(fixed.value("serverURL").toUrl(), QUrl(url)) << url;
    }
}

TEST(FixUpSettings, APathIsAppendedAsItStands)
{
    EXPECT_EQ(fixUpSettings({{"serverName", "ex.example.net"}, {"serverRootPath", "EWS"}}).value("serverURL").toUrl(),
              QUrl("http://ex.example.netEWS"));
}

TEST(FixUpSettings, ExternalPartsBecomeTheExternalUrl)
{
    const QVariantMap fixed = fixUpSettings({{"externalServerName", "out.example.net"},
                                             {"externalUseSSL", true},
                                             {"externalServerPort", 8443},
                                             {"externalServerRootPath", "/EWS"}});
    EXPECT_EQ(fixed.value("externalServerURL").toUrl(), QUrl("https://out.example.net:8443/EWS"));
    EXPECT_FALSE(fixed.contains("serverURL"));
}

TEST(FixUpSettings, TheExternalUrlTakesItsOwnPartsOnly)
{
    const QVariantMap fixed = fixUpSettings({{"serverName", "in.example.net"},
                                             {"useSSL", true},
                                             {"serverPort", 443},
                                             {"serverRootPath", "/in"},
                                             {"externalServerName", "out.example.net"}});
    EXPECT_EQ(fixed.value("serverURL").toUrl(), QUrl("https://in.example.net:443/in"));
    EXPECT_EQ(fixed.value("externalServerURL").metaType().id(), QMetaType::QUrl);
    EXPECT_EQ(fixed.value("externalServerURL").toUrl(), QUrl("http://out.example.net"));
}

TEST(FixUpSettings, AnUrlThatIsThereStays)
{
    EXPECT_EQ(fixUpSettings({{"serverName", "ex.example.net"}, {"serverURL", "mine"}}).value("serverURL"), "mine");
    EXPECT_EQ(fixUpSettings({{"serverName", "ex.example.net"}, {"serverURL", ""}}).value("serverURL"), "");
    EXPECT_EQ(fixUpSettings({{"externalServerName", "ex.example.net"}, {"externalServerURL", "mine"}})
                  .value("externalServerURL"),
              "mine");
}

TEST(FixUpSettings, WithoutAHostThereIsNoUrl)
{
    EXPECT_FALSE(
        fixUpSettings({{"useSSL", true}, {"serverPort", 443}, {"serverRootPath", "/x"}}).contains("serverURL"));
    EXPECT_FALSE(fixUpSettings({{"externalServerPort", 443}}).contains("externalServerURL"));
}

TEST(FixUpSettings, PartsThatMakeNoUrlStoreNothing)
{
    EXPECT_FALSE(fixUpSettings({{"serverName", "ex ample"}}).contains("serverURL"));
    EXPECT_FALSE(fixUpSettings({{"serverName", "ex.example"}, {"serverRootPath", "/a b"}}).contains("serverURL"));
    EXPECT_FALSE(fixUpSettings({{"serverName", "ex.example"}, {"serverPort", 99999}}).contains("serverURL"));
}

TEST(FixUpSettings, FlagsAreReadAsTextToo)
{
    EXPECT_EQ(fixUpSettings({{"serverName", "ex.example"}, {"useSSL", "YES"}}).value("serverURL").toUrl().scheme(),
              "https");
    EXPECT_EQ(fixUpSettings({{"serverName", "ex.example"}, {"useSSL", "no"}}).value("serverURL").toUrl().scheme(),
              "http");
    EXPECT_EQ(fixUpSettings({{"serverName", "ex.example"}, {"useSSL", 1}}).value("serverURL").toUrl().scheme(),
              "https");
}

TEST(FixUpSettings, ValuesOfOtherTypesDoNotHarm)
{
    const QVariantMap fixed = fixUpSettings({{"userName", 7}, {"KAChatAccountType", QVariantList{1}}});
    EXPECT_EQ(fixed.value("userName"), 7);
    EXPECT_FALSE(fixed.contains("emailAddress"));
}

TEST(FixUpSettings, AHostThatIsNoTextCountsAsMissing)
{
    EXPECT_FALSE(fixUpSettings({{"serverName", 7}, {"serverRootPath", "/EWS"}}).contains("serverURL"));
    EXPECT_FALSE(fixUpSettings({{"externalServerName", QVariantList{"ex"}}}).contains("externalServerURL"));
}

TEST(FixUpSettings, APortThatIsNeitherNumberNorTextCountsAsMissing)
{
    for (const QVariant &port :
         {QVariant(QVariantList{443}), QVariant(QVariantMap{{"port", 443}}), QVariant(QString())})
        EXPECT_EQ(fixUpSettings({{"serverName", "ex.example.net"}, {"serverPort", port}}).value("serverURL").toUrl(),
                  QUrl("http://ex.example.net"));
}
