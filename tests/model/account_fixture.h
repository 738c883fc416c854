// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What the tests of accounts and providers share: a home and preferences that start empty for each test, and short ways
// to make accounts. One thread.

#ifndef KAVELL_TESTS_MODEL_ACCOUNT_FIXTURE_H
#define KAVELL_TESTS_MODEL_ACCOUNT_FIXTURE_H

#include <cstdlib>
#include <filesystem>
#include <memory>
#include <ostream>
#include <string>

#include <QtCore/QString>

#include <gtest/gtest.h>
#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KADefaults.h>

#include "tests/support/process.h"

/// So that a failed comparison reads well.
inline void PrintTo(const QString &text, std::ostream *stream)
{
    *stream << (text.isNull() ? "(null)" : '"' + text.toStdString() + '"');
}

namespace kavell::test {

class AccountTest : public testing::Test {
protected:
    void SetUp() override
    {
        std::string pattern = (std::filesystem::temp_directory_path() / "accounts-XXXXXX").string();
        ASSERT_NE(mkdtemp(pattern.data()), nullptr);
        m_home = pattern;
        setenv("HOME", m_home.c_str(), 1);
        setenv("XDG_CONFIG_HOME", (m_home + "/config").c_str(), 1);
        ASSERT_TRUE(KADefaults::shared()->synchronize());
    }

    void TearDown() override { std::filesystem::remove_all(m_home); }

    [[nodiscard]] std::string homePath(const std::string &relative) const { return m_home + "/" + relative; }

    /// A new account, in no provider's list.
    [[nodiscard]] static std::shared_ptr<KAAccount> newAccount(const QString &loginName = QStringLiteral("ada"),
                                                               const QString &providerType = kKAProviderMail)
    {
        auto account = KAAccount::accountWithProviderType(providerType, loginName);
        EXPECT_TRUE(account);
        return account;
    }

    static void commit(const std::shared_ptr<KAAccount> &account)
    {
        _CSKavellAccountCommitChanges(account->accountRef());
    }

private:
    std::string m_home;
};

/// With a vault as credential store, which a program chooses once for its life: whoever reads or sets a password is to
/// be one of these.
class AccountWithVaultTest : public AccountTest {
protected:
    void SetUp() override
    {
        AccountTest::SetUp();
        const std::string passphrase = homePath("passphrase");
        writeFile(passphrase, "correct horse\n");
        std::filesystem::permissions(passphrase, std::filesystem::perms::owner_read);
        setenv("KAVELL_CREDENTIAL_STORE", "vault", 1);
        setenv("KAVELL_VAULT_PASSPHRASE_FILE", passphrase.c_str(), 1);
        setenv("XDG_DATA_HOME", homePath("data").c_str(), 1);
    }
};

}  // namespace kavell::test

#endif
