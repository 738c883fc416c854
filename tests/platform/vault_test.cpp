// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The vault as a credential store: its operations, several processes, and what it does with a wrong passphrase and with
// files that are not as they were written. The passphrase comes from a file here; vault_prompt_test.cpp asks for it.

#include "tests/platform/credential_fixture.h"

#include <sys/file.h>

namespace kavell::test {

namespace {

// Where things stand in the file.
constexpr size_t kVersionOffset = 8;
constexpr size_t kPassesOffset = 12;
constexpr size_t kMemoryOffset = 16;
constexpr size_t kSaltOffset = 24;
constexpr size_t kNonceOffset = 56;
constexpr size_t kBodyOffset = 80;

class VaultTest : public CredentialTest {
protected:
    void SetUp() override
    {
        CredentialTest::SetUp();
        setenv("KAVELL_CREDENTIAL_STORE", "vault", 1);
        givePassphrase("correct horse");
        m_store = defaultCredentialStore();
        ASSERT_NE(m_store, nullptr);
        ASSERT_EQ(m_store->name(), "vault");
    }

    void TearDown() override
    {
        m_store.reset();
        CredentialTest::TearDown();
    }

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

    /// Forgets the key that this process holds, as a new process would.
    void reopen()
    {
        useCredentialStoreForTesting(nullptr);
        m_store = defaultCredentialStore();
    }

    /// Changes one byte of the vault.
    void damage(size_t offset)
    {
        std::string bytes = readFile(vaultPath());
        bytes[offset] = static_cast<char>(bytes[offset] ^ 1);
        writeFile(vaultPath(), bytes);
    }

    /// Shows that no operation answers, and that none touches the file.
    void expectEverythingAnswers(CredentialStatus status, const CredentialItem &item)
    {
        const std::string before = readFile(vaultPath());
        CredentialItem found;
        std::vector<CredentialItem> items;
        Secret secret;
        EXPECT_EQ(m_store->unlock(nullptr), status);
        EXPECT_EQ(m_store->find("com.example.mail", "paul", found), status);
        EXPECT_EQ(m_store->resolve(item.identifier, found), status);
        EXPECT_EQ(m_store->list(items), status);
        EXPECT_EQ(m_store->readSecret(item, secret), status);
        EXPECT_EQ(m_store->replaceSecret(item, "x"), status);
        EXPECT_EQ(m_store->add("com.example.mail", "mary", "x", found), status);
        EXPECT_EQ(m_store->remove(item), status);
        EXPECT_EQ(readFile(vaultPath()), before);
    }

    std::shared_ptr<CredentialStore> m_store;
};

TEST_F(VaultTest, AVaultThatWasNeverMadeHoldsNothing)
{
    CredentialItem item;
    std::vector<CredentialItem> items(1);
    EXPECT_EQ(m_store->find("com.example.mail", "paul", item), CredentialStatus::absent);
    EXPECT_EQ(m_store->resolve("0123456789abcdef0123456789abcdef", item), CredentialStatus::absent);
    EXPECT_EQ(m_store->list(items), CredentialStatus::stored);
    EXPECT_TRUE(items.empty());
    EXPECT_FALSE(std::filesystem::exists(vaultPath()));
}

TEST_F(VaultTest, UnlockingMakesTheVaultOpenToItsOwnerOnly)
{
    const mode_t mask = umask(0);
    EXPECT_EQ(m_store->unlock(nullptr), CredentialStatus::stored);
    umask(mask);
    struct stat status {};
    ASSERT_EQ(stat(vaultPath().c_str(), &status), 0);
    EXPECT_EQ(status.st_mode & 07777, 0600u);
    ASSERT_EQ(stat(scratchPath("data/kavell-accounts").c_str(), &status), 0);
    EXPECT_EQ(status.st_mode & 07777, 0700u);
}

TEST_F(VaultTest, AnAddedItemIsFoundByItsNamesAndGivesItsSecretToALaterProcess)
{
    const CredentialItem item = added("päul@exämple.org", "pässwörd ");
    reopen();
    CredentialItem found;
    ASSERT_EQ(m_store->find("com.example.mail", "päul@exämple.org", found), CredentialStatus::stored);
    EXPECT_EQ(found.identifier, item.identifier);
    EXPECT_EQ(found.identifier.size(), 32u);
    EXPECT_EQ(secretOf(found), "pässwörd ");
    ASSERT_EQ(m_store->resolve(item.identifier, found), CredentialStatus::stored);
    EXPECT_EQ(found.serviceName, "com.example.mail");
    EXPECT_EQ(found.accountName, "päul@exämple.org");
}

TEST_F(VaultTest, AReplacedSecretIsReadBackAndARemovedItemIsAbsent)
{
    const CredentialItem item = added();
    EXPECT_EQ(m_store->replaceSecret(item, "other"), CredentialStatus::stored);
    EXPECT_EQ(secretOf(item), "other");
    EXPECT_EQ(m_store->remove(item), CredentialStatus::stored);
    CredentialItem found;
    Secret secret;
    EXPECT_EQ(m_store->resolve(item.identifier, found), CredentialStatus::absent);
    EXPECT_EQ(m_store->readSecret(item, secret), CredentialStatus::absent);
    EXPECT_EQ(m_store->replaceSecret(item, "x"), CredentialStatus::absent);
    EXPECT_EQ(m_store->remove(item), CredentialStatus::absent);
}

TEST_F(VaultTest, AddingTheSameNamesAgainChangesTheOneItem)
{
    const CredentialItem first = added("paul", "one");
    const CredentialItem second = added("paul", "two");
    std::vector<CredentialItem> items;
    EXPECT_EQ(second.identifier, first.identifier);
    EXPECT_EQ(secretOf(first), "two");
    ASSERT_EQ(m_store->list(items), CredentialStatus::stored);
    EXPECT_EQ(items.size(), 1u);
}

TEST_F(VaultTest, AnItemKeepsItsAccessList)
{
    const CredentialItem item = added();
    CredentialAccess access;
    ASSERT_EQ(m_store->readAccess(item, access), CredentialStatus::stored);
    EXPECT_EQ(access.description, "");
    EXPECT_TRUE(access.groups.empty());
    ASSERT_EQ(m_store->writeAccess(item, {"shared", {"one", "two"}}), CredentialStatus::stored);
    reopen();
    ASSERT_EQ(m_store->readAccess(item, access), CredentialStatus::stored);
    EXPECT_EQ(access.description, "shared");
    EXPECT_EQ(access.groups, (std::vector<std::string>{"one", "two"}));
    EXPECT_EQ(secretOf(item), "s3cret");
}

TEST_F(VaultTest, NothingOfAnItemStandsInTheFileInTheClear)
{
    added("recognisable-account", "recognisable-secret");
    const std::string bytes = readFile(vaultPath());
    EXPECT_EQ(bytes.find("recognisable"), std::string::npos);
    EXPECT_EQ(bytes.find("com.example.mail"), std::string::npos);
    EXPECT_EQ(bytes.substr(0, 8), "KavVault");
}

TEST_F(VaultTest, ProcessesThatAddAtOnceLoseNothing)
{
    constexpr int kProcesses = 6;
    constexpr int kItems = 10;
    const int nothing = open("/dev/null", O_RDWR | O_CLOEXEC);
    std::vector<std::unique_ptr<ChildProcess>> children;
    for (int index = 0; index < kProcesses; ++index)
        children.push_back(std::make_unique<ChildProcess>(
            std::vector<std::string>{buildPath("tests/credential_client"), "add-many", "com.example.mail",
                                     "account " + std::to_string(index) + " ", std::to_string(kItems)},
            std::vector<std::string>{}, nothing, nothing, STDERR_FILENO));
    for (const auto &child : children)
        EXPECT_EQ(child->wait(), 0);
    close(nothing);
    std::vector<CredentialItem> items;
    ASSERT_EQ(m_store->list(items), CredentialStatus::stored);
    EXPECT_EQ(items.size(), static_cast<size_t>(kProcesses * kItems));
}

TEST_F(VaultTest, AWrongPassphraseIsRefusedAndChangesNothing)
{
    const CredentialItem item = added();
    givePassphrase("wrong horse");
    reopen();
    expectEverythingAnswers(CredentialStatus::refused, item);
    givePassphrase("correct horse");
    reopen();
    EXPECT_EQ(secretOf(item), "s3cret");
}

TEST_F(VaultTest, WithoutAPassphraseAndATerminalItIsLocked)
{
    const CredentialItem item = added();
    unsetenv("KAVELL_VAULT_PASSPHRASE_FILE");
    // Without a terminal, whatever this test was started from.
    ChildProcess child([&] {
        setsid();
        reopen();
        expectEverythingAnswers(CredentialStatus::locked, item);
        return HasFailure() ? 1 : 0;
    });
    EXPECT_EQ(child.wait(), 0);
}

TEST_F(VaultTest, APassphraseFileThatOthersMayReadIsNotUsed)
{
    const CredentialItem item = added();
    chmod(scratchPath("passphrase").c_str(), 0640);
    reopen();
    expectEverythingAnswers(CredentialStatus::locked, item);
}

TEST_F(VaultTest, APassphraseFileThatIsMissingEmptyOrNoFileIsNotUsed)
{
    const CredentialItem item = added();
    givePassphrase("");
    reopen();
    expectEverythingAnswers(CredentialStatus::locked, item);
    setenv("KAVELL_VAULT_PASSPHRASE_FILE", scratchPath("missing").c_str(), 1);
    reopen();
    expectEverythingAnswers(CredentialStatus::locked, item);
    ASSERT_EQ(mkfifo(scratchPath("pipe").c_str(), 0600), 0);
    setenv("KAVELL_VAULT_PASSPHRASE_FILE", scratchPath("pipe").c_str(), 1);
    reopen();
    expectEverythingAnswers(CredentialStatus::locked, item);
}

TEST_F(VaultTest, AChangedBodyOrNonceIsDetectedAndNeverWrittenOver)
{
    const CredentialItem item = added();
    const std::string whole = readFile(vaultPath());
    for (const size_t offset : {kBodyOffset, whole.size() - 1, kNonceOffset}) {
        writeFile(vaultPath(), whole);
        damage(offset);
        expectEverythingAnswers(CredentialStatus::failed, item);
    }
    writeFile(vaultPath(), whole);
    EXPECT_EQ(secretOf(item), "s3cret");
}

TEST_F(VaultTest, AChangedSaltOrKeyCheckOpensForNoPassphrase)
{
    const CredentialItem item = added();
    damage(kSaltOffset);
    reopen();
    expectEverythingAnswers(CredentialStatus::refused, item);
}

TEST_F(VaultTest, AnotherVersionAForeignFileAndACutFileAreNeverWrittenOver)
{
    const CredentialItem item = added();
    const std::string whole = readFile(vaultPath());
    damage(kVersionOffset);
    expectEverythingAnswers(CredentialStatus::failed, item);
    for (const std::string &bytes :
         {std::string("my own notes\n"), std::string(), whole.substr(0, 95), whole.substr(0, whole.size() - 1)}) {
        writeFile(vaultPath(), bytes);
        expectEverythingAnswers(CredentialStatus::failed, item);
    }
}

TEST_F(VaultTest, AHeaderThatAsksForMuchWorkOrMemoryIsRefusedAtOnce)
{
    const CredentialItem item = added();
    const std::string whole = readFile(vaultPath());
    for (const size_t offset : {kPassesOffset + 3, kMemoryOffset + 5}) {
        std::string bytes = whole;
        bytes[offset] = 1;
        writeFile(vaultPath(), bytes);
        reopen();
        const Stopwatch watch;
        expectEverythingAnswers(CredentialStatus::failed, item);
        EXPECT_LT(watch.elapsed(), 1s);
    }
}

TEST_F(VaultTest, AnotherHolderOfTheLockMakesAChangeUnreachableWithinTheBound)
{
    const CredentialItem item = added();
    const std::string lockPath = scratchPath("data/kavell-accounts/vault.lock");
    const int lock = open(lockPath.c_str(), O_RDWR | O_CLOEXEC);
    ASSERT_EQ(flock(lock, LOCK_EX | LOCK_NB), 0);
    setenv("KAVELL_CREDENTIAL_TIMEOUT", "200", 1);
    const Stopwatch watch;
    EXPECT_EQ(m_store->replaceSecret(item, "x"), CredentialStatus::unreachable);
    EXPECT_LT(watch.elapsed(), 2s);
    // Reading takes no lock.
    EXPECT_EQ(secretOf(item), "s3cret");
    close(lock);
    EXPECT_EQ(m_store->replaceSecret(item, "x"), CredentialStatus::stored);
}

TEST_F(VaultTest, ALeftoverOfAProcessThatWasKilledIsInNobodysWay)
{
    const CredentialItem item = added();
    writeFile(vaultPath() + ".new", "half a vau");
    EXPECT_EQ(m_store->replaceSecret(item, "other"), CredentialStatus::stored);
    EXPECT_EQ(secretOf(item), "other");
    EXPECT_FALSE(std::filesystem::exists(vaultPath() + ".new"));
}

}  // namespace

}  // namespace kavell::test
