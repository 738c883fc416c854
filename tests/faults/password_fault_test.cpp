// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// An account's password over a vault of which every system call fails in turn (fault_injector.h says in which ways):
// the password is set, or the message says why not and the old one stays.

#include <gmock/gmock.h>

#include "tests/faults/fault_injector.h"
#include "tests/platform/credential_fixture.h"
#include "tests/store/store_test.h"

namespace kavell::test {

namespace {

constexpr std::string_view kToken = "com.corvane.account.CofferelToken";
constexpr std::string_view kModifyMessage = "Error: failed to modify existing cofferel entry\n";
constexpr std::string_view kAddMessages = "Error: failed to add cofferel entry for kavell account\n"
                                          "Error: failed to create new cofferel entry\n";

class PasswordFaults : public CredentialTest {
protected:
    void SetUp() override
    {
        CredentialTest::SetUp();
        setenv("KAVELL_CREDENTIAL_STORE", "vault", 1);
        givePassphrase("correct horse");
        const Account account = openAccount("ada");
        ASSERT_TRUE(adopt(_CSKavellAccountSetPassword(account.get(), text("old").get())));
        m_token = attribute(account, kToken);
        m_before = readFile(vaultPath());
    }

    /// The account as it is before each run: with its password, and knowing where that is or not.
    Account freshAccount(bool hasToken)
    {
        writeFile(vaultPath(), m_before);
        const Account account = openAccount("ada");
        if (hasToken)
            setAttribute(account, kToken, m_token);
        return account;
    }

    /// The password that is in the vault, whoever asks.
    std::string password()
    {
        const Account account = openAccount("ada");
        setAttribute(account, kToken, m_token);
        const auto found = adopt(_CSKavellAccountCopyPassword(account.get()));
        return found ? toStdString(found.get()) : "(none)";
    }

    static bool isWhereItIsWritten(const FaultInjector::SeenCall *failed)
    {
        return failed && (failed->kind == CallKind::Write || failed->kind == CallKind::SyncFile ||
                          failed->kind == CallKind::Rename);
    }

    /// What setting a password came to.
    struct Setting {
        bool isSet = false;
        std::string said;
    };

    /// Sets the password "new" with a fault, which may leave no descriptor open.
    static Setting setPassword(FaultInjector &injector, const Account &account)
    {
        StandardErrorCapture errors;
        const size_t descriptors = countOpenDescriptors();
        Setting setting;
        {
            const Observation observation(injector);
            setting.isSet = static_cast<bool>(adopt(_CSKavellAccountSetPassword(account.get(), text("new").get())));
        }
        setting.said = errors.take();
        EXPECT_EQ(countOpenDescriptors(), descriptors);
        return setting;
    }

    void checkSetting(bool hasToken, std::string_view message)
    {
        forEachFault({}, [&](FaultInjector &injector) {
            const Account account = freshAccount(hasToken);
            const auto [isSet, said] = setPassword(injector, account);
            EXPECT_EQ(password(), isSet ? "new" : "old");
            if (isSet) {
                EXPECT_EQ(said, "");
                EXPECT_TRUE(same(attribute(account, kToken), m_token));
            } else {
                EXPECT_FALSE(injector.fault().isPassing(injector.failed()->kind));
                // A store that stays locked fails without a word, and a reference that cannot be followed is none.
                EXPECT_THAT(said, testing::AnyOf("", kModifyMessage, kAddMessages));
                if (isWhereItIsWritten(injector.failed())) {
                    EXPECT_EQ(said, message);
                }
            }
        });
    }

    Value m_token;
    std::string m_before;
};

TEST_F(PasswordFaults, AKnownPasswordIsReplacedOrTheMessageSaysWhyNot)
{
    checkSetting(true, kModifyMessage);
}

TEST_F(PasswordFaults, APasswordFoundByItsNamesIsReplacedOrTheMessagesSayWhyNot)
{
    checkSetting(false, kAddMessages);
}

TEST_F(PasswordFaults, APasswordThatNeedsANewVaultIsSetOrTheMessagesSayWhyNot)
{
    // Each run makes keys, which takes a while; the other errors end as these do.
    forEachFault({.errors = {EIO, EINTR}}, [&](FaultInjector &injector) {
        std::filesystem::remove(vaultPath());
        useCredentialStoreForTesting(nullptr);
        const Account account = openAccount("ada");
        const auto [isSet, said] = setPassword(injector, account);
        const auto found = adopt(_CSKavellAccountCopyPassword(account.get()));
        EXPECT_EQ(found ? toStdString(found.get()) : "(none)", isSet ? "new" : "(none)");
        if (isSet) {
            EXPECT_EQ(said, "");
        } else {
            EXPECT_FALSE(attribute(account, kToken));
            EXPECT_FALSE(injector.fault().isPassing(injector.failed()->kind));
            EXPECT_THAT(said, testing::AnyOf("", kAddMessages));
            EXPECT_TRUE(adopt(_CSKavellAccountSetPassword(account.get(), text("next").get())));
        }
    });
}

TEST_F(PasswordFaults, ReadingGivesThePasswordOrNoneWithoutAWord)
{
    forEachFault({}, [&](FaultInjector &injector) {
        const Account account = freshAccount(true);
        StandardErrorCapture errors;
        Ref<CSKavellStringRef> found;
        {
            const Observation observation(injector);
            found = adopt(_CSKavellAccountCopyPassword(account.get()));
        }
        EXPECT_EQ(errors.take(), "");
        if (found) {
            EXPECT_EQ(toStdString(found.get()), "old");
        } else {
            EXPECT_FALSE(injector.fault().isPassing(injector.failed()->kind));
        }
        EXPECT_EQ(password(), "old");
    });
}

TEST_F(PasswordFaults, RemovingForgetsThePasswordWhateverBecomesOfTheItem)
{
    forEachFault({}, [&](FaultInjector &injector) {
        const Account account = freshAccount(true);
        StandardErrorCapture errors;
        {
            const Observation observation(injector);
            _CSKavellAccountRemovePassword(account.get());
        }
        EXPECT_EQ(errors.take(), "");
        EXPECT_FALSE(attribute(account, kToken));
        const std::string left = password();
        EXPECT_THAT(left, testing::AnyOf("(none)", "old"));
        if (!injector.failed() || injector.fault().isPassing(injector.failed()->kind)) {
            EXPECT_EQ(left, "(none)");
        }
    });
}

}  // namespace

}  // namespace kavell::test
