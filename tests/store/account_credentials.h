// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What the tests of an account's password share: short ways to make accounts and to ask about their passwords. One
// thread.

#ifndef KAVELL_TESTS_STORE_ACCOUNT_CREDENTIALS_H
#define KAVELL_TESTS_STORE_ACCOUNT_CREDENTIALS_H

#include <kavellaccounts/KavellStore.h>
#include <kavellaccounts/Ref.h>

#include "tests/platform/credential_fixture.h"
#include "tests/support/standard_error_capture.h"

namespace kavell::test {

using Account = Ref<CSKavellAccountRef>;
using Item = Ref<CSKavellCofferelItemRef>;

inline constexpr const char *kMailType = "com.corvane.account.mail";
inline constexpr const char *kToken = "com.corvane.account.CofferelToken";

inline Account openAccount(const char *loginName = "paul")
{
    return adopt(_CSKavellAccountCreate(nullptr, makeString(kMailType).get(), makeString(loginName).get()));
}

/// An account that stands on disk and has no pending changes.
inline Account savedAccount(const char *loginName = "paul")
{
    const Account account = openAccount(loginName);
    _CSKavellAccountCommitChanges(account.get());
    EXPECT_FALSE(_CSKavellAccountHasPendingChanges(account.get()));
    return account;
}

inline Ref<CSKavellTypeRef> tokenOf(const Account &account)
{
    return adopt(_CSKavellAccountCopyProviderAttribute(account.get(), makeString(kToken).get()));
}

inline void setToken(const Account &account, CSKavellTypeRef token)
{
    _CSKavellAccountSetProviderAttribute(account.get(), makeString(kToken).get(), token);
}

inline Item setPassword(const Account &account, std::string_view password)
{
    return adopt(_CSKavellAccountSetPassword(account.get(), makeString(password).get()));
}

/// The password; "(none)" for none.
inline std::string passwordOf(const Account &account)
{
    const auto password = adopt(_CSKavellAccountCopyPassword(account.get()));
    return password ? toStdString(password.get()) : "(none)";
}

inline CSKavellCofferelStatus statusOf(const Account &account)
{
    return _CSKavellAccountGetPasswordStatus(account.get());
}

inline std::string secretOf(const Item &item)
{
    CSKavellDataRef secret = nullptr;
    EXPECT_EQ(CSKavellCofferelItemCopySecret(item.get(), &secret), kCSKavellCofferelStatusStored);
    const auto owned = adopt(secret);
    return std::string(reinterpret_cast<const char *>(CSKavellDataGetBytes(secret)), CSKavellDataGetLength(secret));
}

/// The item of a login name in the store, or none; with the store's answer.
inline Item itemInStore(const char *loginName, CSKavellCofferelStatus expected)
{
    CSKavellCofferelItemRef item = nullptr;
    EXPECT_EQ(CSKavellCofferelStoreFindItem(makeString(kMailType).get(), makeString(loginName).get(), &item), expected);
    return adopt(item);
}

class CredentialsTestBase : public CredentialTest {
protected:
    void SetUp() override
    {
        CredentialTest::SetUp();
        setenv("HOME", scratchPath("home").c_str(), 1);
        std::filesystem::create_directories(scratchPath("home"));
    }
};

}  // namespace kavell::test

#endif
