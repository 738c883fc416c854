// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Matching on a machine with the maker's online service: whoever it calls an account of the newer kind is matched there.
// The test's library calls names that begin with "brondel" so.

#include <gtest/gtest.h>

#include "tests/plugins/matching_fixture.h"

namespace {

class MatchingWithTheOnlineService : public kavell::test::MatchingTest {
protected:
    void SetUp() override
    {
        kavell::test::MatchingTest::SetUp();
        addListPlugin(kKANimbrelPluginID, kKAProviderNimbrel, {"nimbrel.example"});
        addListPlugin(kKAQuillanePluginID, kKAProviderQuillane);
        addListPlugin(kKAYahooPluginID, kKAProviderYahoo, {"zorbo.example"});
        for (const QString &provider : {kKAProviderNimbrel, kKAProviderQuillane, kKAProviderYahoo}) {
            for (const char *login : {"anna", "brondel-bert"})
                addAccount(provider, login);
        }
    }
};

}  // namespace

TEST_F(MatchingWithTheOnlineService, MailOfTheNewerKindBelongsToTheNewerPlugin)
{
    EXPECT_EQ(mail({{"emailAddress", "brondel-bert@nimbrel.example"}}),
              "brondel-bert at com.corvane.account.placeholder");
    EXPECT_EQ(mail({{"emailAddress", "anna@nimbrel.example"}}), "anna at com.corvane.account.nimbrel");
    EXPECT_EQ(mail({{"emailAddress", "brondel-bert@zorbo.example"}}), "brondel-bert at com.corvane.account.yahoo");
}

TEST_F(MatchingWithTheOnlineService, TheAddressTellsTheKindOfCalendarsAndNotTheUserName)
{
    QVariantMap settings{{"serverAddress", "dav.nimbrel.example"}, {"userName", "brondel-bert"}};
    EXPECT_EQ(calendar(settings), "brondel-bert at com.corvane.account.nimbrel");
    settings.insert("emailAddress", "brondel-bert@nimbrel.example");
    EXPECT_EQ(calendar(settings), "brondel-bert at com.corvane.account.placeholder");
    EXPECT_EQ(calendar({{"serverAddress", "dav.nimbrel.example"}, {"userName", "brondel-bert@nimbrel.example"}}),
              "brondel-bert at com.corvane.account.placeholder");
}

TEST_F(MatchingWithTheOnlineService, ContactsAreOfTheNewerKindByTypeOrAddress)
{
    QVariantMap settings{{"serverAddress", "dav.nimbrel.example"}, {"userName", "anna"}};
    EXPECT_EQ(contacts(settings), "anna at com.corvane.account.nimbrel");
    settings.insert("emailAddress", "brondel-anna@nimbrel.example");
    EXPECT_EQ(contacts(settings), "anna at com.corvane.account.placeholder");
    settings.remove("emailAddress");
    settings.insert("KAAccountTypeKey", "kKAServiceCardDAV");
    EXPECT_EQ(contacts(settings), "anna at com.corvane.account.placeholder");
}

TEST_F(MatchingWithTheOnlineService, ChatAlwaysBelongsToTheOlderPlugin)
{
    for (const char *type : {"nimbrel", "dorvex"}) {
        EXPECT_EQ(chat({{"KAChatAccountType", type}, {"KAChatLoginName", "brondel-bert"}}),
                  "brondel-bert at com.corvane.account.nimbrel");
    }
}
