// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The program runs once for each credential store, which its argument names, since a process chooses its store once.

#include <cstdlib>
#include <string>
#include <sys/stat.h>

#include <QtWidgets/QApplication>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KAHaldenServer.h>
#include <kavellaccounts/Ref.h>

#include "tests/platform/credential_fixture.h"
#include "tests/support/log_capture.h"
#include "tests/support/process.h"

using kavell::adopt;
using kavell::makeString;
using kavell::Ref;
using kavell::toStdString;
using kavell::test::LogCapture;

namespace {

/// The item of a stored password.
Ref<CSKavellCofferelItemRef> storedItem(const char *login)
{
    const auto account = KAAccount::initWithProviderType(kKAProviderMail, QString::fromUtf8(login));
    EXPECT_TRUE(account->setPassword("secret"));
    return adopt(account->cofferelItem());
}

std::vector<std::string> groupsOf(CSKavellCofferelItemRef item)
{
    CSKavellCofferelAccessRef kept = nullptr;
    EXPECT_EQ(CSKavellCofferelItemCopyAccess(item, &kept), kCSKavellCofferelStatusStored);
    const auto access = adopt(kept);
    const CSKavellArrayRef groups = CSKavellCofferelAccessGetGroups(access.get());
    std::vector<std::string> names;
    for (size_t index = 0; index < CSKavellArrayGetCount(groups); ++index)
        names.push_back(toStdString(static_cast<CSKavellStringRef>(CSKavellArrayGetValueAtIndex(groups, index))));
    return names;
}

Ref<CSKavellCofferelAccessRef> accessWithGroups(const char *description, const std::vector<std::string> &names)
{
    const auto groups = adopt(CSKavellArrayCreateMutable());
    for (const std::string &name : names)
        CSKavellArrayAppendValue(groups.get(), makeString(name).get());
    return adopt(CSKavellCofferelAccessCreate(makeString(description).get(), groups.get()));
}

}  // namespace

TEST(VaultAccessGroups, AnAccessObjectTrustsTheSharedGroup)
{
    const LogCapture log;
    const auto access = adopt(KACreateCofferelAccessGroup());
    ASSERT_TRUE(access);
    EXPECT_EQ(toStdString(CSKavellCofferelAccessGetDescription(access.get())), "KavellAccounts Access Group");
    const auto item = storedItem("shared");
    ASSERT_EQ(CSKavellCofferelItemSetAccess(item.get(), access.get()), kCSKavellCofferelStatusStored);
    EXPECT_THAT(groupsOf(item.get()), testing::ElementsAre("KavellAccounts"));
    EXPECT_THAT(log.messages(), testing::IsEmpty());
}

TEST(VaultAccessGroups, AGroupIsAddedBehindTheOthersAndTheDescriptionStays)
{
    const auto item = storedItem("added");
    ASSERT_EQ(CSKavellCofferelItemSetAccess(item.get(), accessWithGroups("Mine", {"first"}).get()),
              kCSKavellCofferelStatusStored);
    EXPECT_EQ(KAAddTrustedAppGroup(item.get(), "second"), 0);
    EXPECT_THAT(groupsOf(item.get()), testing::ElementsAre("first", "second"));
    CSKavellCofferelAccessRef kept = nullptr;
    ASSERT_EQ(CSKavellCofferelItemCopyAccess(item.get(), &kept), kCSKavellCofferelStatusStored);
    EXPECT_EQ(toStdString(CSKavellCofferelAccessGetDescription(adopt(kept).get())), "Mine");
}

TEST(VaultAccessGroups, AnItemWithoutAnAccessObjectIsMinusOne)
{
    const auto item = storedItem("bare");
    EXPECT_EQ(KAAddTrustedAppGroup(item.get(), "KavellAccounts"), -1);
    EXPECT_THAT(groupsOf(item.get()), testing::IsEmpty());
}

TEST(VaultAccessGroups, AnAccessObjectThatTrustsNobodyStaysSo)
{
    const auto item = storedItem("nobody");
    ASSERT_EQ(CSKavellCofferelItemSetAccess(item.get(), accessWithGroups("Mine", {}).get()),
              kCSKavellCofferelStatusStored);
    EXPECT_EQ(KAAddTrustedAppGroup(item.get(), "KavellAccounts"), 0);
    EXPECT_THAT(groupsOf(item.get()), testing::IsEmpty());
}

TEST(SecretServiceAccessGroups, AreNotSupported)
{
    const kavell::test::Keyring keyring;
    const LogCapture log;
    const auto item = storedItem("anna");
    ASSERT_TRUE(item);
    EXPECT_EQ(KAAddTrustedAppGroup(item.get(), "KavellAccounts"), kCSKavellCofferelStatusUnsupported);
    EXPECT_EQ(KACreateCofferelAccessGroup(), nullptr);
    EXPECT_THAT(log.messages(), testing::ElementsAre("Could not create an application group for the KavellAccounts "
                                                     "group.  Error: [unsupported]"));
}

TEST(AccessGroupsWithoutAStore, AreUnreachable)
{
    const LogCapture log;
    EXPECT_EQ(KACreateCofferelAccessGroup(), nullptr);
    EXPECT_THAT(log.messages(), testing::ElementsAre("Could not create an application group for the KavellAccounts "
                                                     "group.  Error: [unreachable]"));
    EXPECT_NE(KAAddTrustedAppGroup(nullptr, "KavellAccounts"), 0);
}

int main(int argc, char *argv[])
{
    testing::InitGoogleTest(&argc, argv);
    const std::string store = argc > 1 ? argv[1] : "none";
    GTEST_FLAG_SET(filter, store == "vault"            ? "VaultAccessGroups.*"
                           : store == "secret-service" ? "SecretServiceAccessGroups.*"
                                                       : "AccessGroupsWithoutAStore.*");
    setenv("KAVELL_CREDENTIAL_STORE", store.c_str(), 1);
    const std::string passphraseFile = std::string(std::getenv("HOME")) + "/passphrase";
    kavell::test::writeFile(passphraseFile, "correct horse");
    chmod(passphraseFile.c_str(), S_IRUSR | S_IWUSR);  // the vault reads no file that others may read
    setenv("KAVELL_VAULT_PASSPHRASE_FILE", passphraseFile.c_str(), 1);
    const QApplication application(argc, argv);
    return RUN_ALL_TESTS();
}
