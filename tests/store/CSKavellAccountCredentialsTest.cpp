// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// An account's password, against a real keyring daemon and the real vault alike.

#include <csignal>

#include "tests/store/account_credentials.h"

namespace kavell::test {

namespace {

/// With each of the real stores, named by the parameter.
class AccountPasswordTest : public CredentialsTestBase, public testing::WithParamInterface<const char *> {
protected:
    void SetUp() override
    {
        CredentialsTestBase::SetUp();
        if (std::string_view(GetParam()) == "secret-service") {
            m_bus = std::make_unique<PrivateBus>(scratchPath("run/test-bus"));
            m_keyring = std::make_unique<Keyring>();
        } else
            givePassphrase("correct horse");
        ASSERT_STREQ(CSKavellCofferelStoreGetName(), GetParam());
    }

    void TearDown() override
    {
        m_keyring.reset();
        m_bus.reset();
        CredentialsTestBase::TearDown();
    }

    std::unique_ptr<PrivateBus> m_bus;
    std::unique_ptr<Keyring> m_keyring;
};

INSTANTIATE_TEST_SUITE_P(RealStores, AccountPasswordTest, testing::Values("secret-service", "vault"),
                         [](const auto &store) {
                             return std::string_view(store.param) == "vault" ? "Vault" : "SecretService";
                         });

TEST_P(AccountPasswordTest, AnAccountWithoutAReferenceHasNoPassword)
{
    const Account account = openAccount();
    EXPECT_EQ(passwordOf(account), "(none)");
    EXPECT_EQ(adopt(_CSKavellAccountCopyCofferelItem(account.get())).get(), nullptr);
    EXPECT_EQ(statusOf(account), kCSKavellCofferelStatusAbsent);
}

TEST_P(AccountPasswordTest, APasswordIsReadBackByARecordThatReadTheCommittedReference)
{
    const Account account = openAccount();
    EXPECT_TRUE(setPassword(account, "pässwörd "));
    EXPECT_EQ(passwordOf(account), "pässwörd ");
    _CSKavellAccountCommitChanges(account.get());
    const Account again = openAccount();
    EXPECT_FALSE(_CSKavellAccountHasPendingChanges(again.get()));
    EXPECT_EQ(passwordOf(again), "pässwörd ");
    EXPECT_EQ(statusOf(again), kCSKavellCofferelStatusStored);
    EXPECT_EQ(CSKavellGetTypeID(tokenOf(again).get()), CSKavellDataGetTypeID());
}

TEST_P(AccountPasswordTest, ThePasswordIsNotInTheDataFile)
{
    const Account account = openAccount();
    EXPECT_TRUE(setPassword(account, "recognisable"));
    _CSKavellAccountCommitChanges(account.get());
    const std::string file = readFile(dataFilePath(kMailType, "paul"));
    EXPECT_NE(file.find(kToken), std::string::npos);
    EXPECT_EQ(file.find("recognisable"), std::string::npos);
}

TEST_P(AccountPasswordTest, TheItemBearsTheProviderTypeTheLoginNameAndTheBytesOfThePassword)
{
    const Item item = setPassword(openAccount("päul"), "pässwörd");
    ASSERT_TRUE(item);
    EXPECT_EQ(toStdString(adopt(CSKavellCofferelItemCopyServiceName(item.get())).get()), kMailType);
    EXPECT_EQ(toStdString(adopt(CSKavellCofferelItemCopyAccountName(item.get())).get()), "päul");
    EXPECT_EQ(secretOf(item), "pässwörd");
}

TEST_P(AccountPasswordTest, AnEmptyOrNonePasswordDeletesTheItemAndTheReferenceAndAnswersNone)
{
    for (const bool isNone : {false, true}) {
        const Account account = savedAccount();
        ASSERT_TRUE(setPassword(account, "secret"));
        _CSKavellAccountCommitChanges(account.get());
        StandardErrorCapture capture;
        EXPECT_FALSE(isNone ? adopt(_CSKavellAccountSetPassword(account.get(), nullptr)) : setPassword(account, ""));
        EXPECT_EQ(capture.take(), "");
        EXPECT_FALSE(tokenOf(account));
        EXPECT_TRUE(_CSKavellAccountHasPendingChanges(account.get()));
        itemInStore("paul", kCSKavellCofferelStatusAbsent);
        _CSKavellAccountCommitChanges(account.get());
    }
}

TEST_P(AccountPasswordTest, RemovingWithoutAReferenceStillMarksTheAccountAsChanged)
{
    const Account account = savedAccount();
    _CSKavellAccountRemovePassword(account.get());
    EXPECT_TRUE(_CSKavellAccountHasPendingChanges(account.get()));
}

TEST_P(AccountPasswordTest, SettingWithAReferenceThatResolvesChangesTheSecretAndLeavesNothingPending)
{
    const Account account = savedAccount();
    ASSERT_TRUE(setPassword(account, "one"));
    _CSKavellAccountCommitChanges(account.get());
    const auto before = tokenOf(account);
    const Item item = setPassword(account, "two");
    EXPECT_TRUE(item);
    EXPECT_EQ(secretOf(item), "two");
    EXPECT_FALSE(_CSKavellAccountHasPendingChanges(account.get()));
    EXPECT_TRUE(CSKavellEqual(before.get(), tokenOf(account).get()));
    EXPECT_EQ(passwordOf(account), "two");
}

TEST_P(AccountPasswordTest, SettingWithoutAReferenceReusesTheItemOfTheSameNames)
{
    const Item first = setPassword(openAccount(), "one");
    const Account account = savedAccount();
    const Item second = setPassword(account, "two");
    ASSERT_TRUE(second);
    EXPECT_TRUE(CSKavellEqual(first.get(), second.get()));
    EXPECT_EQ(secretOf(first), "two");
    EXPECT_TRUE(tokenOf(account));
    EXPECT_TRUE(_CSKavellAccountHasPendingChanges(account.get()));
    CSKavellArrayRef items = nullptr;
    ASSERT_EQ(CSKavellCofferelStoreCopyItems(&items), kCSKavellCofferelStatusStored);
    EXPECT_EQ(CSKavellArrayGetCount(adopt(items).get()), 1u);
}

TEST_P(AccountPasswordTest, DiscardingTheChangesLosesTheReferenceButNotTheItem)
{
    const Account account = savedAccount();
    ASSERT_TRUE(setPassword(account, "secret"));
    EXPECT_TRUE(_CSKavellAccountHasPendingChanges(account.get()));
    _CSKavellAccountCancelChanges(account.get());
    EXPECT_FALSE(tokenOf(account));
    EXPECT_EQ(passwordOf(account), "(none)");
    EXPECT_EQ(secretOf(itemInStore("paul", kCSKavellCofferelStatusStored)), "secret");
}

TEST_P(AccountPasswordTest, AReferenceToADeletedItemIsAbsentAndReplacedByTheNextPassword)
{
    const Account account = savedAccount();
    const Item item = setPassword(account, "one");
    const auto before = tokenOf(account);
    EXPECT_EQ(CSKavellCofferelItemDelete(item.get()), kCSKavellCofferelStatusStored);
    EXPECT_EQ(statusOf(account), kCSKavellCofferelStatusAbsent);
    EXPECT_EQ(passwordOf(account), "(none)");
    ASSERT_TRUE(setPassword(account, "two"));
    EXPECT_FALSE(CSKavellEqual(before.get(), tokenOf(account).get()));
    EXPECT_EQ(passwordOf(account), "two");
}

TEST_P(AccountPasswordTest, AReferenceOfAnotherKindOrFormCountsAsNone)
{
    const Account account = savedAccount();
    for (const auto &token : {Ref<CSKavellTypeRef>(makeString("vault:0123456789abcdef0123456789abcdef")),
                              Ref<CSKavellTypeRef>(adopt(CSKavellDataCreate("nonsense", 8)))}) {
        setToken(account, token.get());
        EXPECT_EQ(statusOf(account), kCSKavellCofferelStatusAbsent);
        EXPECT_FALSE(adopt(_CSKavellAccountCopyCofferelItem(account.get())));
        EXPECT_TRUE(setPassword(account, "secret"));
        EXPECT_EQ(passwordOf(account), "secret");
    }
}

TEST_P(AccountPasswordTest, SettingAnItemStoresItsReferenceAndSettingNoneRemovesIt)
{
    const Item item = setPassword(openAccount("mary"), "hers");
    const Account account = savedAccount();
    _CSKavellAccountSetCofferelItem(account.get(), item.get());
    EXPECT_TRUE(_CSKavellAccountHasPendingChanges(account.get()));
    EXPECT_EQ(passwordOf(account), "hers");
    EXPECT_TRUE(CSKavellEqual(adopt(_CSKavellAccountCopyCofferelItem(account.get())).get(), item.get()));
    _CSKavellAccountSetCofferelItem(account.get(), nullptr);
    EXPECT_FALSE(tokenOf(account));
    EXPECT_EQ(secretOf(item), "hers");
}

TEST_P(AccountPasswordTest, APasswordWithANulIsNotConvertedAndChangesNothing)
{
    const Account account = savedAccount();
    StandardErrorCapture capture;
    EXPECT_FALSE(setPassword(account, std::string_view("a\0b", 3)));
    EXPECT_EQ(capture.take(), "");
    EXPECT_FALSE(_CSKavellAccountHasPendingChanges(account.get()));
    itemInStore("paul", kCSKavellCofferelStatusAbsent);
}

TEST_P(AccountPasswordTest, NoneOperandsAnswerNone)
{
    EXPECT_FALSE(adopt(_CSKavellAccountCopyCofferelItem(nullptr)));
    EXPECT_FALSE(adopt(_CSKavellAccountCopyPassword(nullptr)));
    EXPECT_FALSE(adopt(_CSKavellAccountSetPassword(nullptr, makeString("x").get())));
    _CSKavellAccountRemovePassword(nullptr);
    _CSKavellAccountSetCofferelItem(nullptr, nullptr);
    EXPECT_EQ(_CSKavellAccountGetPasswordStatus(nullptr), kCSKavellCofferelStatusAbsent);
    EXPECT_EQ(CSKavellCofferelStoreFindItem(nullptr, nullptr, nullptr), kCSKavellCofferelStatusAbsent);
    EXPECT_EQ(CSKavellCofferelItemResolve(nullptr, nullptr), kCSKavellCofferelStatusAbsent);
    EXPECT_EQ(CSKavellCofferelItemCopySecret(nullptr, nullptr), kCSKavellCofferelStatusAbsent);
    EXPECT_EQ(CSKavellCofferelItemDelete(nullptr), kCSKavellCofferelStatusAbsent);
    EXPECT_EQ(CSKavellCofferelItemCopyAccess(nullptr, nullptr), kCSKavellCofferelStatusAbsent);
    EXPECT_EQ(CSKavellCofferelItemSetAccess(nullptr, nullptr), kCSKavellCofferelStatusAbsent);
    EXPECT_EQ(CSKavellCofferelItemCopyPersistentReference(nullptr), nullptr);
    EXPECT_EQ(CSKavellCofferelItemCopyServiceName(nullptr), nullptr);
    EXPECT_EQ(CSKavellCofferelItemCopyAccountName(nullptr), nullptr);
    EXPECT_EQ(CSKavellCofferelAccessCreate(nullptr, nullptr), nullptr);
    EXPECT_EQ(CSKavellCofferelAccessGetDescription(nullptr), nullptr);
    EXPECT_EQ(CSKavellCofferelAccessGetGroups(nullptr), nullptr);
}

TEST_P(AccountPasswordTest, AnItemIsResolvedThroughItsPersistentReference)
{
    const Item item = setPassword(openAccount(), "secret");
    const auto reference = adopt(CSKavellCofferelItemCopyPersistentReference(item.get()));
    CSKavellCofferelItemRef resolved = nullptr;
    ASSERT_EQ(CSKavellCofferelItemResolve(reference.get(), &resolved), kCSKavellCofferelStatusStored);
    const Item owned = adopt(resolved);
    EXPECT_TRUE(CSKavellEqual(resolved, item.get()));
    EXPECT_EQ(CSKavellHash(resolved), CSKavellHash(item.get()));
    EXPECT_EQ(secretOf(owned), "secret");
}

TEST_P(AccountPasswordTest, AnAccessObjectIsKeptByTheVaultAndUnsupportedByTheService)
{
    const Item item = setPassword(openAccount(), "secret");
    const auto groups = adopt(CSKavellArrayCreateMutable());
    CSKavellArrayAppendValue(groups.get(), makeString("one").get());
    const auto access = adopt(CSKavellCofferelAccessCreate(makeString("shared").get(), groups.get()));
    CSKavellArrayAppendValue(groups.get(), makeString("too late").get());
    CSKavellCofferelAccessRef kept = nullptr;
    if (std::string_view(GetParam()) != "vault") {
        EXPECT_EQ(CSKavellCofferelItemSetAccess(item.get(), access.get()), kCSKavellCofferelStatusUnsupported);
        EXPECT_EQ(CSKavellCofferelItemCopyAccess(item.get(), &kept), kCSKavellCofferelStatusUnsupported);
        return;
    }
    EXPECT_EQ(CSKavellCofferelItemSetAccess(item.get(), access.get()), kCSKavellCofferelStatusStored);
    ASSERT_EQ(CSKavellCofferelItemCopyAccess(item.get(), &kept), kCSKavellCofferelStatusStored);
    const auto owned = adopt(kept);
    EXPECT_TRUE(CSKavellEqual(kept, access.get()));
    EXPECT_EQ(toStdString(CSKavellCofferelAccessGetDescription(kept)), "shared");
    EXPECT_EQ(CSKavellArrayGetCount(CSKavellCofferelAccessGetGroups(kept)), 1u);
}

class LostStoreTest : public CredentialsTestBase {};

TEST_F(LostStoreTest, APasswordInAServiceThatWentIsUnreachableAndIsNotPutIntoTheVault)
{
    const PrivateBus bus(scratchPath("run/test-bus"));
    Keyring keyring;
    const Account account = savedAccount();
    ASSERT_TRUE(setPassword(account, "secret"));
    _CSKavellAccountCommitChanges(account.get());
    keyring.kill();
    useCredentialStoreForTesting(nullptr);
    givePassphrase("correct horse");
    ASSERT_STREQ(CSKavellCofferelStoreGetName(), "vault");
    StandardErrorCapture capture;
    EXPECT_EQ(statusOf(account), kCSKavellCofferelStatusUnreachable);
    EXPECT_EQ(passwordOf(account), "(none)");
    EXPECT_FALSE(setPassword(account, "other"));
    EXPECT_EQ(capture.take(), "");
    EXPECT_FALSE(_CSKavellAccountHasPendingChanges(account.get()));
    itemInStore("paul", kCSKavellCofferelStatusAbsent);
}

TEST_F(LostStoreTest, ALockedKeyringWithoutADisplayIsLockedAndAnswersNoneSoon)
{
    const PrivateBus bus(scratchPath("run/test-bus"));
    const Keyring keyring;
    const Account account = savedAccount();
    ASSERT_TRUE(setPassword(account, "secret"));
    _CSKavellAccountCommitChanges(account.get());
    Keyring::lock();
    const Stopwatch watch;
    StandardErrorCapture capture;
    EXPECT_EQ(statusOf(account), kCSKavellCofferelStatusLocked);
    EXPECT_EQ(passwordOf(account), "(none)");
    EXPECT_FALSE(setPassword(account, "other"));
    EXPECT_EQ(capture.take(), "");
    EXPECT_LT(watch.elapsed(), 5s);
    EXPECT_FALSE(_CSKavellAccountHasPendingChanges(account.get()));
}

TEST_F(LostStoreTest, AServiceThatHangsIsUnreachableWithinTheBound)
{
    const PrivateBus bus(scratchPath("run/test-bus"));
    const Keyring keyring;
    const Account account = savedAccount();
    ASSERT_TRUE(setPassword(account, "secret"));
    _CSKavellAccountCommitChanges(account.get());
    setenv("KAVELL_CREDENTIAL_TIMEOUT", "200", 1);
    keyring.signal(SIGSTOP);
    const Stopwatch watch;
    EXPECT_EQ(statusOf(account), kCSKavellCofferelStatusUnreachable);
    EXPECT_EQ(passwordOf(account), "(none)");
    EXPECT_FALSE(setPassword(account, "other"));
    EXPECT_LT(watch.elapsed(), 3s);
    keyring.signal(SIGCONT);
    unsetenv("KAVELL_CREDENTIAL_TIMEOUT");
    EXPECT_EQ(passwordOf(account), "secret");
}

TEST_F(LostStoreTest, WithoutAStoreThereIsNoPasswordAndNoMessage)
{
    setenv("KAVELL_CREDENTIAL_STORE", "none", 1);
    const Account account = savedAccount();
    StandardErrorCapture capture;
    EXPECT_STREQ(CSKavellCofferelStoreGetName(), "none");
    EXPECT_FALSE(setPassword(account, "secret"));
    EXPECT_EQ(passwordOf(account), "(none)");
    EXPECT_EQ(CSKavellCofferelStoreUnlock(), kCSKavellCofferelStatusUnreachable);
    EXPECT_EQ(CSKavellCofferelStoreCopyItems(nullptr), kCSKavellCofferelStatusUnreachable);
    EXPECT_EQ(capture.take(), "");
    EXPECT_FALSE(_CSKavellAccountHasPendingChanges(account.get()));
}

}  // namespace

}  // namespace kavell::test
