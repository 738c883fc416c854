// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// An account's password in a store that fails where no real store can be made to: the messages, and what is under the
// account's lock.

#include <functional>
#include <future>

#include "tests/store/account_credentials.h"

namespace kavell::test {

namespace {

/// A store of at most one item that answers as it is told.
class ScriptedStore final : public CredentialStore {
public:
    std::string_view name() const noexcept override { return "vault"; }
    CredentialStatus probe() override { return CredentialStatus::stored; }
    CredentialStatus unlock(const CredentialItem *) override
    {
        ++unlocks;
        return unlocking;
    }
    CredentialStatus find(std::string_view, std::string_view, CredentialItem &found) override
    {
        duringSearch();
        found = finding == CredentialStatus::stored ? item : found;
        return finding;
    }
    CredentialStatus resolve(std::string_view, CredentialItem &resolved) override
    {
        resolved = resolving == CredentialStatus::stored ? item : resolved;
        return resolving;
    }
    CredentialStatus list(std::vector<CredentialItem> &) override { return CredentialStatus::failed; }
    CredentialStatus add(std::string_view, std::string_view, std::string_view, CredentialItem &added) override
    {
        ++additions;
        added = adding == CredentialStatus::stored ? item : added;
        return adding;
    }
    CredentialStatus readSecret(const CredentialItem &, Secret &read) override
    {
        read = Secret(secret);
        return CredentialStatus::stored;
    }
    CredentialStatus replaceSecret(const CredentialItem &, std::string_view) override
    {
        duringReplacement();
        return replacing;
    }
    CredentialStatus remove(const CredentialItem &) override { return CredentialStatus::stored; }
    CredentialStatus readAccess(const CredentialItem &, CredentialAccess &) override
    {
        return CredentialStatus::unsupported;
    }
    CredentialStatus writeAccess(const CredentialItem &, const CredentialAccess &) override
    {
        return CredentialStatus::unsupported;
    }

    CredentialItem item{"vault", "0123456789abcdef0123456789abcdef", kMailType, "paul"};
    std::string secret = "secret";
    CredentialStatus unlocking = CredentialStatus::stored;
    CredentialStatus finding = CredentialStatus::absent;
    CredentialStatus resolving = CredentialStatus::stored;
    CredentialStatus adding = CredentialStatus::stored;
    CredentialStatus replacing = CredentialStatus::stored;
    std::function<void()> duringSearch = [] {
    };
    std::function<void()> duringReplacement = [] {
    };
    int additions = 0;
    int unlocks = 0;
};

class FailingStoreTest : public CredentialsTestBase {
protected:
    void SetUp() override
    {
        CredentialsTestBase::SetUp();
        useCredentialStoreForTesting(m_store);
    }

    /// Gives the account a reference that the store can be told to resolve.
    static Account referringAccount()
    {
        const Account account = openAccount();
        setToken(account, adopt(CSKavellDataCreate("vault:0123456789abcdef0123456789abcdef", 38)).get());
        _CSKavellAccountCommitChanges(account.get());
        return account;
    }

    std::shared_ptr<ScriptedStore> m_store = std::make_shared<ScriptedStore>();
};

TEST_F(FailingStoreTest, AReferencedSecretThatCannotBeReplacedGivesItsMessageAndNone)
{
    const Account account = referringAccount();
    m_store->replacing = CredentialStatus::failed;
    StandardErrorCapture capture;
    EXPECT_FALSE(setPassword(account, "x"));
    EXPECT_EQ(capture.take(), "Error: failed to modify existing cofferel entry\n");
    EXPECT_FALSE(_CSKavellAccountHasPendingChanges(account.get()));
}

TEST_F(FailingStoreTest, AnAdditionThatFailsGivesTwoMessages)
{
    const Account account = savedAccount();
    m_store->adding = CredentialStatus::failed;
    StandardErrorCapture capture;
    EXPECT_FALSE(setPassword(account, "x"));
    EXPECT_EQ(capture.take(), "Error: failed to add cofferel entry for kavell account\n"
                              "Error: failed to create new cofferel entry\n");
    EXPECT_FALSE(_CSKavellAccountHasPendingChanges(account.get()));
}

TEST_F(FailingStoreTest, AFoundItemThatCannotBeChangedGivesTwoMessagesAndIsNotAddedAgain)
{
    const Account account = savedAccount();
    m_store->finding = CredentialStatus::stored;
    m_store->replacing = CredentialStatus::failed;
    StandardErrorCapture capture;
    EXPECT_FALSE(setPassword(account, "x"));
    EXPECT_EQ(capture.take(), "Error: failed to add cofferel entry for kavell account\n"
                              "Error: failed to create new cofferel entry\n");
    EXPECT_EQ(m_store->additions, 0);
}

TEST_F(FailingStoreTest, ASearchWithoutAnAnswerIsNotTakenForAnEmptyOne)
{
    const Account account = savedAccount();
    m_store->finding = CredentialStatus::unreachable;
    StandardErrorCapture capture;
    EXPECT_FALSE(setPassword(account, "x"));
    EXPECT_EQ(capture.take(), "Error: failed to add cofferel entry for kavell account\n"
                              "Error: failed to create new cofferel entry\n");
    EXPECT_EQ(m_store->additions, 0);
}

TEST_F(FailingStoreTest, AnItemWithoutAReferenceGivesItsMessageAndNone)
{
    const Account account = savedAccount();
    m_store->item.identifier.clear();
    StandardErrorCapture capture;
    EXPECT_FALSE(setPassword(account, "x"));
    EXPECT_EQ(capture.take(), "Error: failed to store persistent cofferel item reference\n");
    EXPECT_FALSE(tokenOf(account));
    EXPECT_FALSE(_CSKavellAccountHasPendingChanges(account.get()));
}

TEST_F(FailingStoreTest, SettingAnItemWithoutAReferenceRemovesTheStoredOne)
{
    const Account account = referringAccount();
    m_store->item.identifier.clear();
    const Item item = adopt(_CSKavellAccountCopyCofferelItem(account.get()));
    ASSERT_TRUE(item);
    _CSKavellAccountSetCofferelItem(account.get(), item.get());
    EXPECT_FALSE(tokenOf(account));
    EXPECT_TRUE(_CSKavellAccountHasPendingChanges(account.get()));
}

TEST_F(FailingStoreTest, AStoreThatStaysLockedAnswersNoneWithoutAMessage)
{
    const Account account = savedAccount();
    for (const CredentialStatus status : {CredentialStatus::locked, CredentialStatus::refused}) {
        m_store->unlocking = status;
        StandardErrorCapture capture;
        EXPECT_FALSE(setPassword(account, "x"));
        EXPECT_EQ(capture.take(), "");
        EXPECT_EQ(m_store->additions, 0);
    }
}

TEST_F(FailingStoreTest, ASecretThatIsNotUTF8IsNoPassword)
{
    const Account account = referringAccount();
    m_store->secret = "\xff\xfe";
    EXPECT_EQ(passwordOf(account), "(none)");
    EXPECT_EQ(statusOf(account), kCSKavellCofferelStatusStored);
}

TEST_F(FailingStoreTest, AskingForTheStatusPromptsNobody)
{
    const Account account = referringAccount();
    m_store->resolving = CredentialStatus::locked;
    EXPECT_EQ(statusOf(account), kCSKavellCofferelStatusLocked);
    EXPECT_EQ(m_store->unlocks, 0);
    EXPECT_EQ(passwordOf(account), "(none)");
    EXPECT_EQ(m_store->unlocks, 1);
}

TEST_F(FailingStoreTest, TheSearchHoldsTheAccountsLock)
{
    const Account account = savedAccount();
    std::future<bool> other;
    bool isWaiting = false;
    m_store->duringSearch = [&] {
        other = std::async(std::launch::async, [&] { return _CSKavellAccountHasPendingChanges(account.get()); });
        isWaiting = other.wait_for(100ms) == std::future_status::timeout;
    };
    EXPECT_TRUE(setPassword(account, "x"));
    EXPECT_TRUE(isWaiting);
    other.get();
}

TEST_F(FailingStoreTest, ReplacingAReferencedSecretDoesNotHoldTheAccountsLock)
{
    const Account account = referringAccount();
    bool wasAnswered = false;
    m_store->duringReplacement = [&] {
        auto other = std::async(std::launch::async, [&] { return _CSKavellAccountHasPendingChanges(account.get()); });
        wasAnswered = other.wait_for(5s) == std::future_status::ready;
    };
    EXPECT_TRUE(setPassword(account, "x"));
    EXPECT_TRUE(wasAnswered);
}

}  // namespace

}  // namespace kavell::test
