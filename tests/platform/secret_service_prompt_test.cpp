// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Unlocking by a prompt that somebody sees. A real service shows none without a display, so one of the tests' own does.

#include "tests/platform/credential_fixture.h"

namespace kavell::test {

namespace {

class SecretServicePromptTest : public CredentialTest {
protected:
    void SetUp() override
    {
        CredentialTest::SetUp();
        m_bus = std::make_unique<PrivateBus>(scratchPath("run/test-bus"));
    }

    void TearDown() override
    {
        m_service.reset();
        m_bus.reset();
        CredentialTest::TearDown();
    }

    void startService(const char *behaviour)
    {
        m_service =
            std::make_unique<ChildProcess>(std::vector<std::string>{buildPath("tests/prompting_service"), behaviour},
                                           std::vector<std::string>{}, STDIN_FILENO, STDERR_FILENO, STDERR_FILENO);
        ASSERT_TRUE(waitForOwner("org.freedesktop.secrets"));
    }

    std::unique_ptr<PrivateBus> m_bus;
    std::unique_ptr<ChildProcess> m_service;
};

TEST_F(SecretServicePromptTest, APromptThatIsAnsweredUnlocks)
{
    startService("unlock");
    EXPECT_EQ(defaultCredentialStore()->unlock(nullptr), CredentialStatus::stored);
}

TEST_F(SecretServicePromptTest, APromptThatIsDismissedRefuses)
{
    startService("dismiss");
    EXPECT_EQ(defaultCredentialStore()->unlock(nullptr), CredentialStatus::refused);
}

TEST_F(SecretServicePromptTest, APromptThatNobodyAnswersIsLeftWithinTheBoundByLeavingTheBus)
{
    startService("silent");
    setenv("KAVELL_UNLOCK_TIMEOUT", "300", 1);
    const Stopwatch watch;
    EXPECT_EQ(defaultCredentialStore()->unlock(nullptr), CredentialStatus::locked);
    EXPECT_GE(watch.elapsed(), 300ms);
    EXPECT_LT(watch.elapsed(), 3s);
    // 4: it saw the asker leave; 3 would be a call to dismiss the prompt.
    EXPECT_EQ(m_service->wait(10s), 4);
}

TEST_F(SecretServicePromptTest, AServiceThatDiesDuringItsPromptEndsTheWait)
{
    startService("vanish");
    const Stopwatch watch;
    EXPECT_EQ(defaultCredentialStore()->unlock(nullptr), CredentialStatus::unreachable);
    EXPECT_LT(watch.elapsed(), 10s);
}

TEST_F(SecretServicePromptTest, ABusThatDiesDuringThePromptEndsTheWait)
{
    startService(std::to_string(m_bus->pid()).c_str());
    const Stopwatch watch;
    EXPECT_EQ(defaultCredentialStore()->unlock(nullptr), CredentialStatus::unreachable);
    EXPECT_LT(watch.elapsed(), 10s);
}

}  // namespace

}  // namespace kavell::test
