// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Which account-list account a calendar or contacts account belongs to: both are found by their server first.

#include <gtest/gtest.h>

#include <kavellaccounts/KAHaldenServer.h>

#include "tests/plugins/matching_fixture.h"

namespace {

class MatchingCalendars : public kavell::test::MatchingTest {};
class MatchingContacts : public kavell::test::MatchingTest {};

}  // namespace

// Calendars

TEST_F(MatchingCalendars, ThePluginIsChosenByTheServer)
{
    addListPlugin(kKAYahooPluginID, kKAProviderYahoo, {"zorbo.example"});
    addAccount(kKAProviderYahoo, "anna");
    EXPECT_EQ(calendar({{"serverAddress", "DAV.zorbo.example/calendars"}, {"userName", "anna"}}),
              "anna at com.corvane.account.yahoo");
    EXPECT_EQ(calendar({{"serverAddress", "dav.other.example"}, {"userName", "anna"}}), "none");
    EXPECT_EQ(calendar({{"emailAddress", "anna@zorbo.example"}, {"userName", "anna"}}), "none");
}

TEST_F(MatchingCalendars, TheDomainOfTheServerIsAskedForWithoutThePath)
{
    EXPECT_EQ(calendar({{"serverAddress", "DAV.Paths1.example/calendars"}, {"userName", "anna"}}), "none");
    EXPECT_EQ(nameServer().queries(), std::vector<std::string>{"dav.paths1.example"});
}

TEST_F(MatchingCalendars, AUserNameThatIsAnAddressIsTriedInPartThenWhole)
{
    addListPlugin(kKAYahooPluginID, kKAProviderYahoo, {"zorbo.example"});
    const QVariantMap settings{{"serverAddress", "dav.zorbo.example"},
                               {"userName", "anna@zorbo.example"},
                               {"emailAddress", "bert@zorbo.example"}};
    addAccount(kKAProviderYahoo, "bert@zorbo.example");
    EXPECT_EQ(calendar(settings), "none");
    addAccount(kKAProviderYahoo, "anna@zorbo.example");
    EXPECT_EQ(calendar(settings), "anna@zorbo.example at com.corvane.account.yahoo");
    addAccount(kKAProviderYahoo, "anna");
    EXPECT_EQ(calendar(settings), "anna at com.corvane.account.yahoo");
}

TEST_F(MatchingCalendars, TheAddressIsTriedAfterTheUserName)
{
    addListPlugin(kKAYahooPluginID, kKAProviderYahoo, {"zorbo.example"});
    const QVariantMap settings{
        {"serverAddress", "dav.zorbo.example"}, {"userName", "anna"}, {"emailAddress", "bert@zorbo.example"}};
    addAccount(kKAProviderYahoo, "bert@zorbo.example");
    EXPECT_EQ(calendar(settings), "bert@zorbo.example at com.corvane.account.yahoo");
    addAccount(kKAProviderYahoo, "anna");
    EXPECT_EQ(calendar(settings), "anna at com.corvane.account.yahoo");
}

TEST_F(MatchingCalendars, AServerThatNobodyClaimsMayBeRegistered)
{
    addListPlugin(kKAHaldenServerPluginID, kKAProviderHaldenServer);
    addListPlugin(kKAExchangePluginID, kKAProviderExchange);
    addAccount(kKAProviderHaldenServer, "anna");
    addAccount(kKAProviderExchange, "anna");
    KAAddHaldenServer("dav.work.example", QStringList{kKAServiceCalDAV});
    const QVariantMap settings{{"serverAddress", "dav.work.example"},
                               {"userName", "anna"},
                               {"KAAccountTypeKey", "kKAServiceExchangeCalendar"}};
    EXPECT_EQ(calendar(settings), "anna at com.corvane.account.haldenserver");
    KARemoveHaldenServer("dav.work.example");
    EXPECT_EQ(calendar(settings), "anna at com.corvane.account.exchange");
}

TEST_F(MatchingCalendars, TheTypeOfTheServerProductIsNotLookedAt)
{
    addListPlugin(kKAHaldenServerPluginID, kKAProviderHaldenServer);
    addAccount(kKAProviderHaldenServer, "anna");
    EXPECT_EQ(calendar({{"serverAddress", "dav.work.example"},
                        {"userName", "anna"},
                        {"KAAccountTypeKey", "com.corvane.account.haldenserver"}}),
              "none");
}

TEST_F(MatchingCalendars, ARegisteredServerInAClaimedDomainBelongsToTheClaimant)
{
    addListPlugin(kKAYahooPluginID, kKAProviderYahoo, {"zorbo.example"});
    addListPlugin(kKAHaldenServerPluginID, kKAProviderHaldenServer);
    addAccount(kKAProviderYahoo, "anna");
    addAccount(kKAProviderHaldenServer, "anna");
    KAAddHaldenServer("dav.zorbo.example", QStringList{kKAServiceCalDAV});
    EXPECT_EQ(calendar({{"serverAddress", "dav.zorbo.example"}, {"userName", "anna"}}),
              "anna at com.corvane.account.yahoo");
}

TEST_F(MatchingCalendars, AServerInAClaimedDomainIsNotDecidedByTypeOrPath)
{
    addListPlugin(kKAYahooPluginID, kKAProviderYahoo, {"zorbo.example"});
    addListPlugin(kKAExchangePluginID, kKAProviderExchange);
    addAccount(kKAProviderExchange, "anna");
    EXPECT_EQ(calendar({{"serverAddress", "dav.zorbo.example"},
                        {"userName", "anna"},
                        {"serverRootPath", "/EWS"},
                        {"KAAccountTypeKey", "kKAServiceExchangeCalendar"}}),
              "none");
}

TEST_F(MatchingCalendars, TypeAndPathMarkAnExchangeAccount)
{
    addListPlugin(kKAExchangePluginID, kKAProviderExchange);
    addAccount(kKAProviderExchange, "anna");
    EXPECT_EQ(calendar({{"userName", "anna"}, {"KAAccountTypeKey", "kKAServiceExchangeCalendar"}}),
              "anna at com.corvane.account.exchange");
    EXPECT_EQ(calendar({{"userName", "anna"}, {"serverRootPath", "/EWS"}}), "anna at com.corvane.account.exchange");
    EXPECT_EQ(calendar({{"userName", "anna"}, {"KAAccountTypeKey", "kKAServiceExchangeMail"}}), "none");
    EXPECT_EQ(calendar({{"userName", "anna"}, {"serverRootPath", ""}}), "none");
}

TEST_F(MatchingCalendars, AServerOfGoogleIsGooglesWhoeverListsIt)
{
    addListPlugin(kKAYahooPluginID, kKAProviderYahoo, {"google.com"});
    addListPlugin(kKAGooglePluginID, kKAProviderGoogle);
    addAccount(kKAProviderYahoo, "anna@zorbo.example");
    addAccount(kKAProviderGoogle, "anna@zorbo.example");
    EXPECT_EQ(calendar({{"serverAddress", "www.google.com/calendar"},
                        {"userName", "anna"},
                        {"emailAddress", "anna@zorbo.example"}}),
              "anna@zorbo.example at com.corvane.account.google");
}

TEST_F(MatchingCalendars, AtGoogleTheUserNameIsNoLoginName)
{
    addListPlugin(kKAGooglePluginID, kKAProviderGoogle);
    addAccount(kKAProviderGoogle, "anna");
    EXPECT_EQ(calendar({{"serverAddress", "www.google.com"}, {"userName", "anna"}}), "none");
    EXPECT_EQ(
        calendar({{"serverAddress", "www.google.com"}, {"userName", "anna"}, {"emailAddress", "anna@zorbo.example"}}),
        "none");
}

TEST_F(MatchingCalendars, AnAccountOfGoogleWithoutAddressIsAtItsMailDomain)
{
    addListPlugin(kKAGooglePluginID, kKAProviderGoogle);
    addAccount(kKAProviderGoogle, "anna@gmail.com");
    EXPECT_EQ(calendar({{"serverAddress", "www.google.com"}, {"userName", "anna"}}),
              "anna@gmail.com at com.corvane.account.google");
    EXPECT_EQ(calendar({{"serverAddress", "www.google.com"}, {"userName", "anna"}, {"emailAddress", ""}}), "none");
    EXPECT_EQ(calendar({{"serverAddress", "www.google.com"}}), "none");
}

// Contacts

TEST_F(MatchingContacts, TheDomainOfTheServerIsAskedForWithoutThePath)
{
    EXPECT_EQ(contacts({{"serverAddress", "DAV.Paths2.example/contacts"}, {"userName", "anna"}}), "none");
    EXPECT_EQ(nameServer().queries(), std::vector<std::string>{"dav.paths2.example"});
}

TEST_F(MatchingContacts, TheUserNameIsTakenWhole)
{
    addListPlugin(kKAYahooPluginID, kKAProviderYahoo, {"zorbo.example"});
    const QVariantMap settings{{"serverAddress", "dav.zorbo.example"}, {"userName", "anna@zorbo.example"}};
    addAccount(kKAProviderYahoo, "anna");
    EXPECT_EQ(contacts(settings), "none");
    addAccount(kKAProviderYahoo, "anna@zorbo.example");
    EXPECT_EQ(contacts(settings), "anna@zorbo.example at com.corvane.account.yahoo");
}

TEST_F(MatchingContacts, TheAddressIsTriedAfterTheUserName)
{
    addListPlugin(kKAYahooPluginID, kKAProviderYahoo, {"zorbo.example"});
    const QVariantMap settings{
        {"serverAddress", "dav.zorbo.example"}, {"userName", "anna"}, {"emailAddress", "bert@zorbo.example"}};
    addAccount(kKAProviderYahoo, "bert@zorbo.example");
    EXPECT_EQ(contacts(settings), "bert@zorbo.example at com.corvane.account.yahoo");
    addAccount(kKAProviderYahoo, "anna");
    EXPECT_EQ(contacts(settings), "anna at com.corvane.account.yahoo");
}

TEST_F(MatchingContacts, TheServerProductIsToldByTheTypeAndNotByTheRegistry)
{
    addListPlugin(kKAHaldenServerPluginID, kKAProviderHaldenServer);
    addAccount(kKAProviderHaldenServer, "anna");
    KAAddHaldenServer("dav.work.example", QStringList{kKAServiceCardDAV});
    QVariantMap settings{{"serverAddress", "dav.work.example"}, {"userName", "anna"}};
    EXPECT_EQ(contacts(settings), "none");
    settings.insert("KAAccountTypeKey", "com.corvane.account.haldenserver");
    EXPECT_EQ(contacts(settings), "anna at com.corvane.account.haldenserver");
}

TEST_F(MatchingContacts, TheTypeOfTheServerProductComesBeforeAPathOnExchange)
{
    addListPlugin(kKAHaldenServerPluginID, kKAProviderHaldenServer);
    addListPlugin(kKAExchangePluginID, kKAProviderExchange);
    addAccount(kKAProviderHaldenServer, "anna");
    addAccount(kKAProviderExchange, "anna");
    EXPECT_EQ(contacts({{"userName", "anna"},
                        {"serverRootPath", "/EWS"},
                        {"KAAccountTypeKey", "com.corvane.account.haldenserver"}}),
              "anna at com.corvane.account.haldenserver");
}

TEST_F(MatchingContacts, AServerInAClaimedDomainIsNotDecidedByTypeOrPath)
{
    addListPlugin(kKAYahooPluginID, kKAProviderYahoo, {"zorbo.example"});
    addListPlugin(kKAHaldenServerPluginID, kKAProviderHaldenServer);
    addListPlugin(kKAExchangePluginID, kKAProviderExchange);
    addAccount(kKAProviderHaldenServer, "anna");
    addAccount(kKAProviderExchange, "anna");
    QVariantMap settings{{"serverAddress", "dav.zorbo.example"}, {"userName", "anna"}, {"serverRootPath", "/EWS"}};
    EXPECT_EQ(contacts(settings), "none");
    settings.insert("KAAccountTypeKey", "com.corvane.account.haldenserver");
    EXPECT_EQ(contacts(settings), "none");
}

TEST_F(MatchingContacts, TypeAndPathMarkAnExchangeAccount)
{
    addListPlugin(kKAExchangePluginID, kKAProviderExchange);
    addAccount(kKAProviderExchange, "anna");
    EXPECT_EQ(contacts({{"userName", "anna"}, {"KAAccountTypeKey", "kKAServiceExchangeContacts"}}),
              "anna at com.corvane.account.exchange");
    EXPECT_EQ(contacts({{"userName", "anna"}, {"serverRootPath", "/EWS"}}), "anna at com.corvane.account.exchange");
    EXPECT_EQ(contacts({{"userName", "anna"}, {"KAAccountTypeKey", "kKAServiceExchangeCalendar"}}), "none");
    EXPECT_EQ(contacts({{"userName", "anna"}, {"serverRootPath", ""}}), "none");
}

TEST_F(MatchingContacts, AServerOfGoogleIsGooglesAndGoesByTheAddress)
{
    addListPlugin(kKAYahooPluginID, kKAProviderYahoo, {"google.com"});
    addListPlugin(kKAGooglePluginID, kKAProviderGoogle);
    addAccount(kKAProviderGoogle, "anna@gmail.com");
    addAccount(kKAProviderGoogle, "bert@zorbo.example");
    EXPECT_EQ(contacts({{"serverAddress", "google.com"}, {"userName", "anna"}}),
              "anna@gmail.com at com.corvane.account.google");
    EXPECT_EQ(contacts({{"serverAddress", "google.com"}, {"userName", "anna"}, {"emailAddress", "bert@zorbo.example"}}),
              "bert@zorbo.example at com.corvane.account.google");
}

TEST_F(MatchingContacts, OnlyTheTypeCardDavMakesTheOnlineServiceTheNewerOne)
{
    addListPlugin(kKANimbrelPluginID, kKAProviderNimbrel, {"nimbrel.example"});
    addListPlugin(kKAQuillanePluginID, kKAProviderQuillane);
    addAccount(kKAProviderNimbrel, "anna");
    addAccount(kKAProviderQuillane, "anna");
    QVariantMap settings{{"serverAddress", "contacts.nimbrel.example"}, {"userName", "anna"}};
    EXPECT_EQ(contacts(settings), "anna at com.corvane.account.nimbrel");
    settings.insert("KAAccountTypeKey", "kKAServiceCardDAV");
    EXPECT_EQ(contacts(settings), "anna at com.corvane.account.placeholder");
    EXPECT_EQ(calendar(settings), "anna at com.corvane.account.nimbrel");
}
