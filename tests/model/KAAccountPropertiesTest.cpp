// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Settings dictionaries copied into an account, and the account as one.

#include "tests/model/account_fixture.h"
#include "tests/support/log_capture.h"
#include "tests/support/short_memory.h"

using kavell::test::LogCapture;
using kavell::test::ShortMemory;

namespace {

const QString kChildren = "com.corvane.KavellAccounts.childAccounts";

class KAAccountPropertiesTest : public kavell::test::AccountWithVaultTest {
protected:
    void SetUp() override
    {
        AccountWithVaultTest::SetUp();
        account = newAccount();
    }

    std::shared_ptr<KAAccount> account;
};

/// A value that cannot be read in so little memory.
QVariantMap largeDictionary()
{
    QVariantMap large;
    for (int number = 0; number < 2000; ++number)
        large.insert(QString::number(number), number);
    return large;
}

constexpr size_t kLittle = 4096;

}  // namespace

// Merging and replacing

TEST_F(KAAccountPropertiesTest, MergingSetsWhatTheAccountHasNoValueFor)
{
    account->setProviderAttribute("old", "kept");
    account->setProviderAttribute("", "empty");
    account->mergePropertiesWithSettingDictionary({{"kept", "new"}, {"empty", "new"}, {"added", "new"}});
    EXPECT_EQ(account->providerAttributes(), QVariantMap({{"kept", "old"}, {"empty", ""}, {"added", "new"}}));
}

TEST_F(KAAccountPropertiesTest, MergingPassesOverSettingsThatAreNothing)
{
    account->mergePropertiesWithSettingDictionary({{"null", QString()}, {"invalid", QVariant()}, {"empty", ""}});
    EXPECT_EQ(account->providerAttributes(), QVariantMap({{"empty", ""}}));
}

TEST_F(KAAccountPropertiesTest, ReplacingMakesTheAttributesExactlyTheDictionary)
{
    account->setProviderAttribute("old", "replaced");
    account->setProviderAttribute("old", "removed");
    account->setProviderAttribute(QVariantMap{{"child", QVariantMap()}}, kChildren);
    account->replacePropertiesWithSettingDictionary({{"replaced", "new"}, {"added", 1}});
    EXPECT_EQ(account->providerAttributes(), QVariantMap({{"replaced", "new"}, {"added", 1}}));
}

TEST_F(KAAccountPropertiesTest, ReplacingByNothingRemovesAllAttributes)
{
    account->setProviderAttribute("old", "removed");
    account->replacePropertiesWithSettingDictionary({});
    EXPECT_TRUE(account->providerAttributes().isEmpty());
}

TEST_F(KAAccountPropertiesTest, NothingIsCommitted)
{
    commit(account);
    account->mergePropertiesWithSettingDictionary({{"a", 1}});
    EXPECT_TRUE(account->hasPendingChanges());
    EXPECT_TRUE(newAccount()->providerAttributes().isEmpty());
    commit(account);
    account->replacePropertiesWithSettingDictionary({{"b", 1}});
    EXPECT_TRUE(account->hasPendingChanges());
    account->cancelPendingChanges();
    EXPECT_EQ(account->providerAttributes(), QVariantMap({{"a", 1}}));
}

TEST_F(KAAccountPropertiesTest, AnExceptionEndsMergingIsLoggedAndLeavesWhatWasSet)
{
    account->setProviderAttribute(largeDictionary(), "b");
    const LogCapture log;
    {
        const ShortMemory memory(kLittle);
        account->mergePropertiesWithSettingDictionary({{"a", 1}, {"b", 2}, {"c", 3}});
    }
    EXPECT_EQ(account->providerAttributes(), QVariantMap({{"a", 1}, {"b", largeDictionary()}}));
    EXPECT_EQ(log.messages(), QStringList("*** Caught exception: std::bad_alloc"));
}

TEST_F(KAAccountPropertiesTest, AnExceptionEndsReplacingBeforeAnythingIsMerged)
{
    account->setProviderAttribute(largeDictionary(), "b");
    const LogCapture log;
    {
        const ShortMemory memory(kLittle);
        account->replacePropertiesWithSettingDictionary({{"a", 1}});
    }
    EXPECT_EQ(account->providerAttributes(), QVariantMap({{"b", largeDictionary()}}));
    EXPECT_EQ(log.messages(), QStringList("*** Caught exception: std::bad_alloc"));
}

// Updating

TEST_F(KAAccountPropertiesTest, UpdatingReplacesTheListedKeysAndLeavesTheOthersAlone)
{
    account->setProviderAttributes({{"listed", "old"}, {"missing", "old"}, {"unlisted", "old"}});
    account->updateWithSettingsDict({{"listed", "new"}, {"unlisted", "new"}, {"added", 1}},
                                    {"listed", "missing", "added"});
    EXPECT_EQ(account->providerAttributes(),
              QVariantMap({{"listed", "new"}, {"missing", "old"}, {"unlisted", "old"}, {"added", 1}}));
}

TEST_F(KAAccountPropertiesTest, UpdatingTakesAnEmptyTextForAValueAndANullOneForMissing)
{
    account->setProviderAttributes({{"empty", "old"}, {"null", "old"}});
    account->updateWithSettingsDict({{"empty", ""}, {"null", QString()}}, {"empty", "null"});
    EXPECT_EQ(account->providerAttributes(), QVariantMap({{"empty", ""}, {"null", "old"}}));
}

TEST_F(KAAccountPropertiesTest, UpdatingWithoutKeysChangesNothing)
{
    commit(account);
    account->updateWithSettingsDict({{"a", 1}}, {});
    EXPECT_FALSE(account->hasPendingChanges());
}

TEST_F(KAAccountPropertiesTest, TheKnownSettingsAreTwentyThreeKeys)
{
    const QStringList known{"emailAddress",
                            "userName",
                            "accountDescription",
                            "incomingMailServer",
                            "incomingUseSSL",
                            "outgoingMailServer",
                            "outgoingUseSSL",
                            "inactive",
                            "serverAddress",
                            "port",
                            "useSSL",
                            "accountType",
                            "KAAccountTypeKey",
                            "searchBase",
                            "scope",
                            "authentication",
                            "password",
                            "KAChatAccountType",
                            "KAChatLoginName",
                            "KAChatServer",
                            "KAChatServerPort",
                            "KAChatUseSSL",
                            "KAChatUseKerberosV5"};
    ASSERT_EQ(known.size(), 23);
    QVariantMap settings, expected;
    for (const QString &key : known)
        expected.insert(key, "value of " + key);
    settings = expected;
    for (const char *unknown : {"fullName", "KACorvaneIDKey", "KADSIDKey", "serverURL", "name", "rootFolderId"})
        settings.insert(unknown, "unknown");
    account->updateWithKnownSettingsFromDictionary(settings);
    EXPECT_EQ(account->providerAttributes(), expected);
}

TEST_F(KAAccountPropertiesTest, APasswordAmongTheKnownSettingsIsKeptInPlainTextAndMaskedInTheDescription)
{
    account->updateWithKnownSettingsFromDictionary({{"password", "secret"}});
    EXPECT_EQ(account->providerAttributeForKey("password"), QVariant("secret"));
    EXPECT_TRUE(account->description().contains("password = ***;"));
    EXPECT_FALSE(account->description().contains("secret"));
}

// The flat dictionary

TEST_F(KAAccountPropertiesTest, TheFlatDictionaryHasTheAttributesTheProviderAndTheLoginName)
{
    account->setProviderAttribute("ada@example.net", "emailAddress");
    EXPECT_EQ(
        account->dictionaryRepresentationMergedWithChildDict(std::nullopt),
        QVariantMap(
            {{"emailAddress", "ada@example.net"}, {"provider", "com.corvane.account.mail"}, {"loginName", "ada"}}));
}

TEST_F(KAAccountPropertiesTest, TheFlatDictionaryNeverHasTheChildrenAndTheFullNamesOwnKey)
{
    account->addChildAccountDict({{"uid", "child"}}, "child");
    account->setFullName("Ada Lovelace");
    const QVariantMap flat = account->dictionaryRepresentationMergedWithChildDict(std::nullopt);
    EXPECT_FALSE(flat.contains(kChildren));
    EXPECT_FALSE(flat.contains("com.corvane.provider.fullname"));
    EXPECT_EQ(flat.value("fullName"), QVariant("Ada Lovelace"));
}

TEST_F(KAAccountPropertiesTest, TheFullNameReplacesAnAttributeOfThatNameAndItsAbsenceDoesNot)
{
    account->setProviderAttribute("From settings", "fullName");
    EXPECT_EQ(account->dictionaryRepresentationMergedWithChildDict(std::nullopt).value("fullName"),
              QVariant("From settings"));
    account->setFullName("");
    EXPECT_EQ(account->dictionaryRepresentationMergedWithChildDict(std::nullopt).value("fullName"), QVariant(""));
}

TEST_F(KAAccountPropertiesTest, TheAccountsOwnNamesReplaceAttributesCalledLikeThem)
{
    account->setProviderAttributes({{"provider", "?"}, {"loginName", "?"}, {"password", "attribute"}});
    const QVariantMap flat = account->dictionaryRepresentationMergedWithChildDict(std::nullopt);
    EXPECT_EQ(flat.value("provider"), QVariant("com.corvane.account.mail"));
    EXPECT_EQ(flat.value("loginName"), QVariant("ada"));
    EXPECT_EQ(flat.value("password"), QVariant("attribute"));  // none is stored
}

TEST_F(KAAccountPropertiesTest, TheFlatDictionaryHasTheStoredPassword)
{
    account->setProviderAttribute("attribute", "password");
    ASSERT_TRUE(account->setPassword("stored"));
    EXPECT_EQ(account->dictionaryRepresentationMergedWithChildDict(std::nullopt).value("password"), QVariant("stored"));
}

TEST_F(KAAccountPropertiesTest, AChildsSettingsLieOverTheAccounts)
{
    account->setProviderAttributes({{"emailAddress", "account"}, {"port", 1}});
    const QVariantMap child{{"emailAddress", ""}, {"loginName", "child"}, {"fullName", "Child"}, {"null", QString()}};
    EXPECT_EQ(account->dictionaryRepresentationMergedWithChildDict(child),
              QVariantMap({{"emailAddress", ""},
                           {"port", 1},
                           {"provider", "com.corvane.account.mail"},
                           {"loginName", "child"},
                           {"fullName", "Child"}}));
}

TEST_F(KAAccountPropertiesTest, AnEmptyChildAddsNothing)
{
    EXPECT_EQ(account->dictionaryRepresentationMergedWithChildDict(QVariantMap()),
              account->dictionaryRepresentationMergedWithChildDict(std::nullopt));
}
