// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Every system call of the vault's operations fails in turn (fault_injector.h says in which ways). After each: a status
// that says what became of it, the vault on the disk as before or as after, as the status has it, no descriptor left
// open, and a next change that succeeds.

#include <set>
#include <sstream>

#include "tests/faults/fault_injector.h"
#include "tests/platform/credential_fixture.h"

namespace kavell::test {

namespace {

constexpr const char *kService = "com.corvane.account.mail";

class VaultFaults : public CredentialTest {
protected:
    void SetUp() override
    {
        CredentialTest::SetUp();
        setenv("KAVELL_CREDENTIAL_STORE", "vault", 1);
        givePassphrase("correct horse");
        openStore();
        CredentialItem item;
        ASSERT_EQ(m_store->add(kService, "ada", std::string(5000, 'a'), item), CredentialStatus::stored);
        ASSERT_EQ(m_store->add(kService, "ben", "b", m_ben), CredentialStatus::stored);
        m_before = readFile(vaultPath());
    }

    void TearDown() override
    {
        m_store.reset();
        CredentialTest::TearDown();
    }

    /// As a new process has it: without a key.
    void openStore()
    {
        useCredentialStoreForTesting(nullptr);
        m_store = defaultCredentialStore();
        ASSERT_NE(m_store, nullptr);
    }

    /// Reads an item while a call fails: its secret whole or not at all, with nothing left open and nothing changed.
    CredentialStatus readWhileFailing(FaultInjector &injector)
    {
        const size_t descriptors = countOpenDescriptors();
        CredentialStatus status = CredentialStatus::absent;
        Secret secret;
        {
            const Observation observation(injector);
            status = m_store->readSecret(m_ben, secret);
        }
        EXPECT_EQ(secret.view(), status == CredentialStatus::stored ? "b" : "");
        if (status != CredentialStatus::stored) {
            EXPECT_FALSE(injector.fault().isPassing(injector.failed()->kind));
        }
        EXPECT_EQ(countOpenDescriptors(), descriptors);
        EXPECT_EQ(readFile(vaultPath()), m_before);
        return status;
    }

    /// Every item with the length of its secret.
    std::string observe()
    {
        std::vector<CredentialItem> items;
        if (const CredentialStatus status = m_store->list(items); status != CredentialStatus::stored)
            return std::string("a vault that is ") + credentialStatusName(status);
        std::ostringstream found;
        for (const CredentialItem &item : items) {
            Secret secret;
            EXPECT_EQ(m_store->readSecret(item, secret), CredentialStatus::stored);
            found << item.accountName << ":" << secret.view().size() << " ";
        }
        return found.str();
    }

    /// Runs a change with each fault: it is done, or says that it failed and leaves the vault as it was.
    void checkChange(const std::string &after, const std::function<CredentialStatus()> &change)
    {
        forEachFault({}, [&](FaultInjector &injector) {
            writeFile(vaultPath(), m_before);
            const size_t descriptors = countOpenDescriptors();
            CredentialStatus status = CredentialStatus::absent;
            {
                const Observation observation(injector);
                status = change();
            }
            if (status == CredentialStatus::stored) {
                EXPECT_EQ(observe(), after);
            } else {
                EXPECT_EQ(status, CredentialStatus::failed);
                EXPECT_EQ(readFile(vaultPath()), m_before);
                EXPECT_FALSE(injector.fault().isPassing(injector.failed()->kind));
            }
            EXPECT_EQ(countOpenDescriptors(), descriptors);
            expectNextChange();
        });
    }

    /// The next change, without a fault, goes through and leaves nothing beside the vault.
    void expectNextChange()
    {
        const std::string before = observe();
        CredentialItem item;
        EXPECT_EQ(m_store->add(kService, "later", "on", item), CredentialStatus::stored);
        EXPECT_EQ(observe(), before + "later:2 ");
        std::set<std::string> names;
        for (const auto &entry : std::filesystem::directory_iterator(std::filesystem::path(vaultPath()).parent_path()))
            names.insert(entry.path().filename());
        EXPECT_EQ(names, (std::set<std::string>{"vault", "vault.lock"}));
    }

    std::shared_ptr<CredentialStore> m_store;
    CredentialItem m_ben;
    std::string m_before;
};

TEST_F(VaultFaults, AnAdditionIsDoneOrSaysThatItFailed)
{
    checkChange("ada:5000 ben:1 cid:3 ", [this] {
        CredentialItem item;
        const CredentialStatus status = m_store->add(kService, "cid", "ccc", item);
        EXPECT_EQ(item.identifier.empty(), status != CredentialStatus::stored);
        return status;
    });
}

TEST_F(VaultFaults, AReplacementIsDoneOrSaysThatItFailed)
{
    checkChange("ada:5000 ben:9000 ", [this] { return m_store->replaceSecret(m_ben, std::string(9000, 'B')); });
}

TEST_F(VaultFaults, ARemovalIsDoneOrSaysThatItFailed)
{
    checkChange("ada:5000 ", [this] { return m_store->remove(m_ben); });
}

TEST_F(VaultFaults, ASecretIsReadWholeOrNotAtAll)
{
    forEachFault({}, [&](FaultInjector &injector) {
        const CredentialStatus status = readWhileFailing(injector);
        EXPECT_TRUE(status == CredentialStatus::stored || status == CredentialStatus::failed)
            << credentialStatusName(status);
    });
}

TEST_F(VaultFaults, APassphraseThatCannotBeReadLeavesTheVaultClosed)
{
    forEachFault({}, [&](FaultInjector &injector) {
        openStore();
        const CredentialStatus status = readWhileFailing(injector);
        EXPECT_TRUE(status == CredentialStatus::stored || status == CredentialStatus::failed ||
                    status == CredentialStatus::locked)
            << credentialStatusName(status);
    });
}

TEST_F(VaultFaults, UnlockingMakesAVaultOrNot)
{
    forEachFault({.errors = {EIO, EINTR}}, [&](FaultInjector &injector) {
        std::filesystem::remove(vaultPath());
        openStore();
        const size_t descriptors = countOpenDescriptors();
        CredentialStatus status = CredentialStatus::absent;
        {
            const Observation observation(injector);
            status = m_store->unlock(nullptr);
        }
        EXPECT_EQ(countOpenDescriptors(), descriptors);
        EXPECT_EQ(std::filesystem::exists(vaultPath()), status == CredentialStatus::stored);
        if (status != CredentialStatus::stored) {
            // Without its passphrase nobody can make one.
            EXPECT_TRUE(status == CredentialStatus::failed || status == CredentialStatus::locked)
                << credentialStatusName(status);
            EXPECT_FALSE(injector.fault().isPassing(injector.failed()->kind));
            EXPECT_EQ(m_store->unlock(nullptr), CredentialStatus::stored);
        }
        // With the whole passphrase, not with what was read of it.
        openStore();
        expectNextChange();
    });
}

TEST_F(VaultFaults, UnlockingOpensTheVaultOrLeavesItClosed)
{
    forEachFault({.errors = {EIO, EINTR}}, [&](FaultInjector &injector) {
        openStore();
        const size_t descriptors = countOpenDescriptors();
        CredentialStatus status = CredentialStatus::absent;
        {
            const Observation observation(injector);
            status = m_store->unlock(nullptr);
        }
        EXPECT_EQ(countOpenDescriptors(), descriptors);
        EXPECT_EQ(readFile(vaultPath()), m_before);
        if (status != CredentialStatus::stored) {
            EXPECT_TRUE(status == CredentialStatus::failed || status == CredentialStatus::locked)
                << credentialStatusName(status);
            EXPECT_FALSE(injector.fault().isPassing(injector.failed()->kind));
        }
    });
}

/// Forks a child when a lock has been taken, which lives on with all that this process has open.
class ForkAtLock : public SystemCallObserver {
public:
    long onCall(SystemCall &call, const std::function<long()> &make) override
    {
        const long result = make();
        if (call.kind == CallKind::Lock && result == 0 && !m_child)
            m_child = std::make_unique<ChildProcess>([] { return pause(); });
        return result;
    }

    [[nodiscard]] bool hasForked() const { return m_child != nullptr; }

private:
    std::unique_ptr<ChildProcess> m_child;
};

TEST_F(VaultFaults, AChildThatIsForkedMeanwhileDoesNotKeepTheLock)
{
    setenv("KAVELL_CREDENTIAL_TIMEOUT", "500", 1);
    ForkAtLock forkAtLock;
    {
        const Observation observation(forkAtLock);
        EXPECT_EQ(m_store->replaceSecret(m_ben, "bb"), CredentialStatus::stored);
    }
    EXPECT_TRUE(forkAtLock.hasForked());
    EXPECT_EQ(m_store->replaceSecret(m_ben, "bbb"), CredentialStatus::stored);
    unsetenv("KAVELL_CREDENTIAL_TIMEOUT");
}

TEST_F(VaultFaults, ANewVaultIsMadeOrNot)
{
    // Each run may make a key twice, which takes a while; the other errors end as these do.
    forEachFault({.errors = {EIO, EINTR}}, [&](FaultInjector &injector) {
        std::filesystem::remove(vaultPath());
        openStore();
        const size_t descriptors = countOpenDescriptors();
        CredentialStatus status = CredentialStatus::absent;
        CredentialItem item;
        {
            const Observation observation(injector);
            status = m_store->add(kService, "ada", "one", item);
        }
        if (status == CredentialStatus::stored) {
            // With the whole passphrase, not with what was read of it.
            openStore();
            EXPECT_EQ(observe(), "ada:3 ");
        } else {
            EXPECT_FALSE(std::filesystem::exists(vaultPath()));
            EXPECT_FALSE(injector.fault().isPassing(injector.failed()->kind));
        }
        EXPECT_EQ(countOpenDescriptors(), descriptors);
    });
}

}  // namespace

}  // namespace kavell::test
