// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Which account-list plug-in settings belong to, on a machine with the maker's online service. The test's library calls
// names that begin with "brondel" accounts of the newer kind.

#include <kavellaccounts/KAAListPlugin.h>

#include "tests/model/plugin_fixture.h"

namespace {

const QString kNimbrel = "com.corvane.nimbrel.kaplugin";
const QString kQuillane = "com.corvane.placeholder.kaplugin";
const QString kZorbo = "org.zorbo.kaplugin";

class IdentificationWithTheOnlineService : public kavell::test::AccountWithPluginsTest {
protected:
    void SetUp() override
    {
        AccountWithPluginsTest::SetUp();
        addListPlugin(kNimbrel, "com.corvane.account.nimbrel", {"nimbrel.example"});
        addListPlugin(kZorbo, "com.corvane.account.yahoo", {"zorbo.example"});
    }
};

QString pluginFor(const QVariantMap &settings)
{
    return KAAccount::aListPluginIDForSettings(settings);
}

}  // namespace

TEST_F(IdentificationWithTheOnlineService, TheLibraryTellsTheKindOfAnAccount)
{
    EXPECT_TRUE(KAAccount::corvaneIDIsBrondel("brondel@nimbrel.example"));
    EXPECT_FALSE(KAAccount::corvaneIDIsBrondel("ada@nimbrel.example"));
    EXPECT_FALSE(KAAccount::corvaneIDIsBrondel("absent"));  // of no kind
    EXPECT_FALSE(KAAccount::corvaneIDIsBrondel({}));
}

TEST_F(IdentificationWithTheOnlineService, AtAServerOfTheServiceTheAddressDecides)
{
    EXPECT_EQ(pluginFor({{"serverAddress", "dav.nimbrel.example"}, {"emailAddress", "brondel@nimbrel.example"}}),
              kQuillane);
    EXPECT_EQ(pluginFor({{"serverAddress", "dav.dorvex.example"}, {"emailAddress", "ada@nimbrel.example"}}), kNimbrel);
    EXPECT_EQ(pluginFor({{"KAAccountTypeKey", "com.corvane.account.placeholder"}, {"emailAddress", "brondel@any"}}),
              kQuillane);
    EXPECT_EQ(lookupCount(), 0u);
}

TEST_F(IdentificationWithTheOnlineService, AddressesAreAskedForInLowerCase)
{
    EXPECT_EQ(pluginFor({{"serverAddress", "dav.nimbrel.example"}, {"emailAddress", "Brondel@Nimbrel.example"}}),
              kQuillane);
}

TEST_F(IdentificationWithTheOnlineService, WithoutAnAddressAServerOfTheServiceIsOfTheOlderKind)
{
    EXPECT_EQ(pluginFor({{"serverAddress", "dav.nimbrel.example"}, {"userName", "brondel"}}), kNimbrel);
    EXPECT_EQ(pluginFor({{"serverAddress", "dav.nimbrel.example"}, {"emailAddress", ""}}), kNimbrel);
}

TEST_F(IdentificationWithTheOnlineService, AtItsNewestServersAndForContactsTheAddressIsNotAskedFor)
{
    EXPECT_EQ(pluginFor({{"serverAddress", "dav.aerwyn.example"}, {"emailAddress", "ada@nimbrel.example"}}), kQuillane);
    EXPECT_EQ(pluginFor({{"serverAddress", "dav.nimbrel.example"},
                         {"KAAccountTypeKey", "kKAServiceCardDAV"},
                         {"emailAddress", "ada@nimbrel.example"}}),
              kQuillane);
}

TEST_F(IdentificationWithTheOnlineService, AnAddressOfTheCurrentPluginCanBeOfTheNewerKind)
{
    EXPECT_EQ(pluginFor({{"emailAddress", "Brondel@nimbrel.example"}}), kQuillane);
    EXPECT_EQ(pluginFor({{"emailAddress", "ada@nimbrel.example"}}), kNimbrel);
    EXPECT_EQ(lookupCount(), 0u);
}

TEST_F(IdentificationWithTheOnlineService, OnlyAddressesOfTheCurrentPluginCanBeOfTheNewerKind)
{
    EXPECT_EQ(pluginFor({{"emailAddress", "brondel@zorbo.example"}}), kZorbo);
    EXPECT_EQ(pluginFor({{"serverAddress", "imap.zorbo.example"}, {"emailAddress", "brondel@nimbrel.example"}}),
              kZorbo);
}

TEST_F(IdentificationWithTheOnlineService, ChatIsAlwaysOfTheOlderKind)
{
    EXPECT_EQ(pluginFor({{"KAChatAccountType", "nimbrel"}, {"KAChatLoginName", "brondel"}}), kNimbrel);
}

TEST_F(IdentificationWithTheOnlineService, ThePluginOfAChatAccountIsThatOfItsDerivedAddress)
{
    addListPlugin(kQuillane, "com.corvane.account.placeholder");
    const QVariantMap settings{{"KAChatLoginName", "brondel"}, {"KAChatAccountType", "nimbrel"}};
    ASSERT_TRUE(KAAccount::_pluginForSettings(settings));
    EXPECT_EQ(KAAccount::_pluginForSettings(settings)->identifier(), kQuillane);
    EXPECT_EQ(pluginFor(settings), kNimbrel);  // nothing is derived here
}
