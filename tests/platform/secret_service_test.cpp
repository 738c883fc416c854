// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The Secret Service as a credential store, against a real keyring daemon on a bus of each test's own.

#include "tests/platform/credential_fixture.h"

#include <csignal>
#include <map>

namespace kavell::test {

namespace {

class SecretServiceTest : public CredentialTest {
protected:
    void SetUp() override
    {
        CredentialTest::SetUp();
        m_bus = std::make_unique<PrivateBus>(scratchPath("run/test-bus"));
        m_keyring = std::make_unique<Keyring>();
        m_store = defaultCredentialStore();
        ASSERT_NE(m_store, nullptr);
        ASSERT_EQ(m_store->name(), "secret-service");
    }

    void TearDown() override
    {
        m_store.reset();
        m_keyring.reset();
        m_bus.reset();
        CredentialTest::TearDown();
    }

    /// Adds an item that must come about.
    CredentialItem added(const char *account = "paul", const char *secret = "s3cret")
    {
        CredentialItem item;
        EXPECT_EQ(m_store->add("com.example.mail", account, secret, item), CredentialStatus::stored);
        return item;
    }

    std::string secretOf(const CredentialItem &item)
    {
        Secret secret;
        EXPECT_EQ(m_store->readSecret(item, secret), CredentialStatus::stored);
        return std::string(secret.view());
    }

    std::unique_ptr<PrivateBus> m_bus;
    std::unique_ptr<Keyring> m_keyring;
    std::shared_ptr<CredentialStore> m_store;
};

TEST_F(SecretServiceTest, AnItemThatWasNeverAddedIsAbsent)
{
    CredentialItem item;
    EXPECT_EQ(m_store->find("com.example.mail", "nobody", item), CredentialStatus::absent);
    EXPECT_EQ(m_store->resolve("0123456789abcdef0123456789abcdef", item), CredentialStatus::absent);
    EXPECT_TRUE(item.identifier.empty());
}

TEST_F(SecretServiceTest, AnAddedItemIsFoundByItsNamesAndGivesItsSecret)
{
    const CredentialItem item = added("päul@exämple.org", "pässwörd with blanks ");
    CredentialItem found;
    ASSERT_EQ(m_store->find("com.example.mail", "päul@exämple.org", found), CredentialStatus::stored);
    EXPECT_EQ(found.identifier, item.identifier);
    EXPECT_EQ(found.storeName, "secret-service");
    EXPECT_EQ(found.identifier.size(), 32u);
    EXPECT_EQ(secretOf(found), "pässwörd with blanks ");
    CredentialItem other;
    EXPECT_EQ(m_store->find("com.example.chat", "päul@exämple.org", other), CredentialStatus::absent);
}

TEST_F(SecretServiceTest, AReplacedSecretIsReadBackThroughTheSameItem)
{
    const CredentialItem item = added();
    EXPECT_EQ(m_store->replaceSecret(item, "other"), CredentialStatus::stored);
    EXPECT_EQ(secretOf(item), "other");
}

TEST_F(SecretServiceTest, AddingTheSameNamesAgainChangesTheOneItem)
{
    const CredentialItem first = added("paul", "one");
    const CredentialItem second = added("paul", "two");
    EXPECT_EQ(second.identifier, first.identifier);
    EXPECT_EQ(secretOf(first), "two");
}

TEST_F(SecretServiceTest, ADeletedItemIsAbsentAlsoWhenItsPathIsUsedAgain)
{
    const CredentialItem item = added();
    EXPECT_EQ(m_store->remove(item), CredentialStatus::stored);
    added("mary", "other secret");
    CredentialItem found;
    Secret secret;
    EXPECT_EQ(m_store->resolve(item.identifier, found), CredentialStatus::absent);
    EXPECT_EQ(m_store->readSecret(item, secret), CredentialStatus::absent);
    EXPECT_EQ(m_store->replaceSecret(item, "x"), CredentialStatus::absent);
    EXPECT_EQ(m_store->remove(item), CredentialStatus::absent);
}

TEST_F(SecretServiceTest, TheListHoldsEveryItemOfThisLibraryAndNoOther)
{
    added("paul");
    added("mary");
    std::vector<CredentialItem> items;
    ASSERT_EQ(m_store->list(items), CredentialStatus::stored);
    ASSERT_EQ(items.size(), 2u);
    std::map<std::string, std::string> names;
    for (const CredentialItem &item : items)
        names[item.accountName] = item.serviceName;
    EXPECT_EQ(names, (std::map<std::string, std::string>{{"mary", "com.example.mail"}, {"paul", "com.example.mail"}}));
}

TEST_F(SecretServiceTest, AReferenceStillResolvesAfterTheServiceRestarts)
{
    const CredentialItem item = added("paul", "kept");
    EXPECT_EQ(secretOf(item), "kept");
    m_keyring->kill();
    CredentialItem found;
    EXPECT_EQ(m_store->resolve(item.identifier, found), CredentialStatus::unreachable);
    m_keyring = std::make_unique<Keyring>();

    ASSERT_EQ(m_store->resolve(item.identifier, found), CredentialStatus::stored);
    EXPECT_EQ(found.serviceName, "com.example.mail");
    EXPECT_EQ(found.accountName, "paul");
    // The session for secrets went with the old daemon; a new one must be opened unasked.
    EXPECT_EQ(secretOf(found), "kept");
    EXPECT_EQ(m_store->replaceSecret(found, "changed"), CredentialStatus::stored);
}

TEST_F(SecretServiceTest, ProcessesThatAddTheSameNamesAtOnceMakeOneItem)
{
    constexpr int kProcesses = 8;
    const int nothing = open("/dev/null", O_RDWR | O_CLOEXEC);
    std::vector<std::unique_ptr<ChildProcess>> children;
    for (int index = 0; index < kProcesses; ++index)
        children.push_back(std::make_unique<ChildProcess>(std::vector<std::string>{buildPath("tests/credential_client"),
                                                                                   "add", "com.example.mail", "paul",
                                                                                   "secret " + std::to_string(index)},
                                                          std::vector<std::string>{}, nothing, nothing, STDERR_FILENO));
    for (const auto &child : children)
        EXPECT_EQ(child->wait(), 0);
    close(nothing);
    std::vector<CredentialItem> items;
    ASSERT_EQ(m_store->list(items), CredentialStatus::stored);
    ASSERT_EQ(items.size(), 1u);
    EXPECT_EQ(secretOf(items.front()).substr(0, 7), "secret ");
}

TEST_F(SecretServiceTest, ALockedCollectionSaysLockedAndNeverAbsent)
{
    const CredentialItem item = added();
    Keyring::lock();
    CredentialItem found;
    Secret secret;
    EXPECT_EQ(m_store->resolve(item.identifier, found), CredentialStatus::stored);
    EXPECT_EQ(m_store->readSecret(item, secret), CredentialStatus::locked);
    EXPECT_EQ(m_store->replaceSecret(item, "x"), CredentialStatus::locked);
    EXPECT_EQ(m_store->remove(item), CredentialStatus::locked);
    EXPECT_EQ(m_store->add("com.example.mail", "paul", "x", found), CredentialStatus::locked);
    EXPECT_EQ(m_store->add("com.example.mail", "mary", "x", found), CredentialStatus::locked);
}

TEST_F(SecretServiceTest, ACollectionThatWasNeverUnlockedSaysLockedAndNeverAbsent)
{
    const CredentialItem item = added();
    m_keyring->kill();
    m_keyring = std::make_unique<Keyring>(false);
    CredentialItem found;
    Secret secret;
    EXPECT_EQ(m_store->resolve(item.identifier, found), CredentialStatus::stored);
    EXPECT_EQ(found.identifier, item.identifier);
    EXPECT_EQ(m_store->readSecret(item, secret), CredentialStatus::locked);
    EXPECT_EQ(m_store->add("com.example.mail", "paul", "x", found), CredentialStatus::locked);
    EXPECT_EQ(m_store->find("com.example.mail", "paul", found), CredentialStatus::locked);
    std::vector<CredentialItem> items;
    EXPECT_EQ(m_store->list(items), CredentialStatus::locked);
}

TEST_F(SecretServiceTest, UnlockingWithoutADisplayEndsSoonWithNothingUnlocked)
{
    const CredentialItem item = added();
    EXPECT_EQ(m_store->unlock(nullptr), CredentialStatus::stored);
    Keyring::lock();
    const Stopwatch watch;
    const CredentialStatus status = m_store->unlock(nullptr);
    EXPECT_TRUE(status == CredentialStatus::locked || status == CredentialStatus::refused)
        << credentialStatusName(status);
    const CredentialStatus itemStatus = m_store->unlock(&item);
    EXPECT_TRUE(itemStatus == CredentialStatus::locked || itemStatus == CredentialStatus::refused)
        << credentialStatusName(itemStatus);
    EXPECT_LT(watch.elapsed(), 5s);
}

TEST_F(SecretServiceTest, ARunningServiceThatHangsIsUnreachableWithinTheBoundAndWorksAgainAfterwards)
{
    const CredentialItem item = added("paul", "kept");
    setenv("KAVELL_CREDENTIAL_TIMEOUT", "300", 1);
    m_keyring->signal(SIGSTOP);
    const Stopwatch watch;
    CredentialItem found;
    Secret secret;
    EXPECT_EQ(m_store->find("com.example.mail", "paul", found), CredentialStatus::unreachable);
    EXPECT_EQ(m_store->find("com.example.mail", "nobody", found), CredentialStatus::unreachable);
    EXPECT_EQ(m_store->readSecret(item, secret), CredentialStatus::unreachable);
    EXPECT_EQ(m_store->unlock(nullptr), CredentialStatus::unreachable);
    EXPECT_EQ(m_store->add("com.example.mail", "mary", "x", found), CredentialStatus::unreachable);
    EXPECT_LT(watch.elapsed(), 4s);
    m_keyring->signal(SIGCONT);
    unsetenv("KAVELL_CREDENTIAL_TIMEOUT");
    EXPECT_EQ(secretOf(item), "kept");
}

TEST_F(SecretServiceTest, AServiceThatHangsFromTheStartIsChosenAllTheSame)
{
    m_keyring->signal(SIGSTOP);
    setenv("KAVELL_CREDENTIAL_TIMEOUT", "300", 1);
    useCredentialStoreForTesting(nullptr);
    const std::shared_ptr<CredentialStore> store = defaultCredentialStore();
    ASSERT_NE(store, nullptr);
    EXPECT_EQ(store->name(), "secret-service");
    CredentialItem found;
    EXPECT_EQ(store->find("com.example.mail", "paul", found), CredentialStatus::unreachable);
    m_keyring->signal(SIGCONT);
}

TEST_F(SecretServiceTest, AStoppedBusIsUnreachableWithinTheBound)
{
    added();
    setenv("KAVELL_CREDENTIAL_TIMEOUT", "300", 1);
    m_bus->signal(SIGSTOP);
    const Stopwatch watch;
    CredentialItem found;
    EXPECT_EQ(m_store->find("com.example.mail", "paul", found), CredentialStatus::unreachable);
    // A fresh store must connect first, which a stopped bus lets begin and never end.
    useCredentialStoreForTesting(nullptr);
    const std::shared_ptr<CredentialStore> fresh = defaultCredentialStore();
    ASSERT_NE(fresh, nullptr);
    EXPECT_EQ(fresh->name(), "secret-service");
    EXPECT_EQ(fresh->find("com.example.mail", "paul", found), CredentialStatus::unreachable);
    EXPECT_LT(watch.elapsed(), 3s);
    m_bus->signal(SIGCONT);
}

TEST_F(SecretServiceTest, ABusThatDiesLeavesTheHostAliveAndTheNextOneIsUsed)
{
    const CredentialItem item = added("paul", "kept");
    m_bus->kill();
    CredentialItem found;
    EXPECT_EQ(m_store->find("com.example.mail", "paul", found), CredentialStatus::unreachable);
    EXPECT_EQ(m_store->find("com.example.mail", "nobody", found), CredentialStatus::unreachable);
    m_keyring.reset();
    m_bus.reset();
    m_bus = std::make_unique<PrivateBus>(scratchPath("run/test-bus"));
    m_keyring = std::make_unique<Keyring>();
    EXPECT_EQ(secretOf(item), "kept");
}

TEST_F(SecretServiceTest, AReferenceIntoADeadServiceIsNeverLookedUpInTheVault)
{
    const CredentialItem item = added();
    m_keyring->kill();
    givePassphrase("correct horse");
    std::string storeName;
    std::string identifier;
    ASSERT_TRUE(parsePersistentReference(persistentReference(item), storeName, identifier));
    EXPECT_EQ(storeName, "secret-service");
    useCredentialStoreForTesting(nullptr);
    ASSERT_EQ(defaultCredentialStore()->name(), "vault");
    const std::shared_ptr<CredentialStore> its = credentialStoreNamed(storeName);
    ASSERT_NE(its, nullptr);
    EXPECT_EQ(its->name(), "secret-service");
    CredentialItem found;
    EXPECT_EQ(its->resolve(identifier, found), CredentialStatus::unreachable);
}

TEST_F(SecretServiceTest, AccessListsAreUnsupported)
{
    const CredentialItem item = added();
    CredentialAccess access;
    EXPECT_EQ(m_store->readAccess(item, access), CredentialStatus::unsupported);
    EXPECT_EQ(m_store->writeAccess(item, access), CredentialStatus::unsupported);
}

TEST_F(SecretServiceTest, AProcessForkedFromAUserOfTheBusIsToldSoAtOnce)
{
    added();
    ChildProcess child([&] {
        const Stopwatch watch;
        CredentialItem found;
        const CredentialStatus status = m_store->find("com.example.mail", "paul", found);
        return status == CredentialStatus::unreachable && watch.elapsed() < 1s ? 0 : 1;
    });
    EXPECT_EQ(child.wait(), 0);
}

}  // namespace

}  // namespace kavell::test
