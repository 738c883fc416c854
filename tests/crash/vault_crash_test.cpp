// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A crash at every moment of what a password's vault goes through: it opens as before or as after, whatever the disk
// was left in (crash_scenario.h says what that covers and how to try more).

#include <memory>

#include "tests/crash/crash_scenario.h"
#include "tests/platform/credential_fixture.h"

namespace kavell::test {

namespace {

constexpr const char *kService = "com.corvane.account.mail";

class VaultCrash : public CredentialTest {
protected:
    void SetUp() override
    {
        CredentialTest::SetUp();
        setenv("KAVELL_CREDENTIAL_STORE", "vault", 1);
        givePassphrase("correct horse");
        m_store = defaultCredentialStore();
        ASSERT_NE(m_store, nullptr);
        ASSERT_EQ(m_store->name(), "vault");
        m_watched = std::make_unique<WatchedDirectory>(scratchPath("data"), scratchPath("anchors"));
        m_scenario = std::make_unique<CrashScenario>(
            *m_watched, [this] { return observe(); }, [this](const std::string &found) { return proceed(found); });
    }

    void TearDown() override
    {
        m_scenario.reset();
        m_watched.reset();
        m_store.reset();
        CredentialTest::TearDown();
    }

    /// Every item with its secret, in the vault's order.
    std::string observe()
    {
        std::vector<CredentialItem> items;
        if (const CredentialStatus status = m_store->list(items); status != CredentialStatus::stored)
            return std::string("a vault that is ") + credentialStatusName(status);
        std::string found;
        for (const CredentialItem &item : items) {
            Secret secret;
            if (item.serviceName != kService || m_store->readSecret(item, secret) != CredentialStatus::stored)
                return "an item that cannot be read";
            found += item.accountName + ":" + shortened(secret.view()) + " ";
        }
        return found;
    }

    /// Adds an item, unless that takes a new vault: making the key of one takes a while, so not for every state.
    std::string proceed(const std::string &found)
    {
        if (found.empty() && ++m_newVaults > kMostNewVaults)
            return found;
        add("later", "on");
        return found + "later:on ";
    }

    void add(const std::string &account, const std::string &secret)
    {
        CredentialItem item;
        EXPECT_EQ(m_store->add(kService, account, secret, item), CredentialStatus::stored);
    }

    CredentialItem itemOf(const std::string &account)
    {
        CredentialItem item;
        EXPECT_EQ(m_store->find(kService, account, item), CredentialStatus::stored);
        return item;
    }

    /// A long secret as how often it has its letter; any other as it is.
    static std::string shortened(std::string_view secret)
    {
        const bool isLong = secret.size() > 100 && secret.find_first_not_of(secret.front()) == std::string_view::npos;
        return isLong ? std::to_string(secret.size()) + "x" + secret.front() : std::string(secret);
    }

    void checkEverything()
    {
        m_scenario->checkPowerCutsAfterKills();
        m_scenario->checkPowerCuts();
        m_scenario->checkKills();
        m_scenario->checkPowerCutsWhileRecovering();
    }

    static constexpr int kMostNewVaults = 30;

    std::shared_ptr<CredentialStore> m_store;
    std::unique_ptr<WatchedDirectory> m_watched;
    std::unique_ptr<CrashScenario> m_scenario;
    int m_newVaults = 0;
};

TEST_F(VaultCrash, LeavesANewVaultWholeOrNotThere)
{
    m_scenario->start("");
    m_scenario->step(
        "add", [this] { add("ada", "one"); }, "ada:one ");
    checkEverything();
}

TEST_F(VaultCrash, LeavesAChangedVaultAsBeforeOrAsAfter)
{
    add("ada", "one");
    m_scenario->start("ada:one ");
    m_scenario->step(
        "add", [this] { add("ben", std::string(3000, 'b')); }, "ada:one ben:3000xb ");
    m_scenario->step(
        "replace",
        [this] { EXPECT_EQ(m_store->replaceSecret(itemOf("ada"), std::string(500, 'a')), CredentialStatus::stored); },
        "ada:500xa ben:3000xb ");
    m_scenario->step(
        "remove", [this] { EXPECT_EQ(m_store->remove(itemOf("ben")), CredentialStatus::stored); }, "ada:500xa ");
    checkEverything();
}

TEST_F(VaultCrash, LeavesAVaultAsBeforeOrAsAfterWhereACallFailedToo)
{
    add("ada", "one");
    m_scenario->start("ada:one ");
    const auto tryAdding = [this] {
        CredentialItem item;
        static_cast<void>(m_store->add(kService, "ben", std::string(900, 'b'), item));
    };
    m_scenario->checkPowerCutsAfterFaults(tryAdding, "ada:one ben:900xb ");
    m_scenario->checkSavesAfterFaults(tryAdding);
}

}  // namespace

}  // namespace kavell::test
