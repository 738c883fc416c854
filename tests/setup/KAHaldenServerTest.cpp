// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAHaldenServer.h>

#include <gtest/gtest.h>

#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KADefaults.h>

namespace {

QVariant registry()
{
    return KADefaults::shared()->objectForKey("HaldenServers");
}

class HaldenServers : public testing::Test {
protected:
    HaldenServers() { KADefaults::shared()->removeObjectForKey("HaldenServers"); }
};

}  // namespace

TEST_F(HaldenServers, AnAddedServerIsKnownWithItsServices)
{
    KAAddHaldenServer("mail.example.net", QStringList{kKAServiceIMAP});
    EXPECT_TRUE(KAIsKnownHaldenServer("mail.example.net"));
    EXPECT_EQ(KAHaldenServiceTypesForServer("mail.example.net").toStringList(), QStringList{"kKAServiceIMAP"});
    EXPECT_EQ(registry().toList().size(), 1);
}

TEST_F(HaldenServers, AddingAgainReplacesTheEntryAndMovesItToTheEnd)
{
    KAAddHaldenServer("one.example", "a");
    KAAddHaldenServer("two.example", "b");
    KAAddHaldenServer("one.example", "c");
    const QVariantList entries = registry().toList();
    ASSERT_EQ(entries.size(), 2);
    EXPECT_EQ(entries.at(0).toMap(), (QVariantMap{{"two.example", "b"}}));
    EXPECT_EQ(entries.at(1).toMap(), (QVariantMap{{"one.example", "c"}}));
}

TEST_F(HaldenServers, RemovingTheLastServerRemovesTheKey)
{
    KAAddHaldenServer("one.example", "a");
    KAAddHaldenServer("two.example", "b");
    KARemoveHaldenServer("one.example");
    EXPECT_EQ(registry().toList().size(), 1);
    KARemoveHaldenServer("two.example");
    EXPECT_FALSE(registry().isValid());
}

TEST_F(HaldenServers, RemovingFromAnAbsentRegistryChangesNothing)
{
    KARemoveHaldenServer("one.example");
    EXPECT_FALSE(registry().isValid());
}

TEST_F(HaldenServers, RemovingAnUnknownServerKeepsTheOthers)
{
    KAAddHaldenServer("one.example", "a");
    KARemoveHaldenServer("two.example");
    EXPECT_TRUE(KAIsKnownHaldenServer("one.example"));
}

TEST_F(HaldenServers, EveryEntryOfAServerIsRemoved)
{
    KADefaults::shared()->setObject(QVariantList{QVariantMap{{"one.example", "a"}}, QVariantMap{{"one.example", "b"}}},
                                    "HaldenServers");
    KARemoveHaldenServer("one.example");
    EXPECT_FALSE(registry().isValid());
}

TEST_F(HaldenServers, AnUnknownServerHasNoServices)
{
    KAAddHaldenServer("one.example", "a");
    EXPECT_FALSE(KAHaldenServiceTypesForServer("two.example").isValid());
    EXPECT_FALSE(KAIsKnownHaldenServer("ONE.example"));
    EXPECT_FALSE(KAIsKnownHaldenServer({}));
}

TEST_F(HaldenServers, ANullServerOrNullServicesAddNothing)
{
    KAAddHaldenServer({}, "a");
    KAAddHaldenServer("one.example", {});
    EXPECT_FALSE(registry().isValid());
}

TEST_F(HaldenServers, TheDescriptionKeysHaveTheirValues)
{
    EXPECT_EQ(KAHaldenServerAddressKey, "HaldenServerAddress");
    EXPECT_EQ(KAHaldenServerServiceTypesKey, "HaldenServerServiceTypes");
    EXPECT_EQ(KAHaldenServerAccountInfoKey, "HaldenServerAccountInfo");
}
