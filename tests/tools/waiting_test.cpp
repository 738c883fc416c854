// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <csignal>
#include <fcntl.h>
#include <gmock/gmock.h>
#include <memory>
#include <poll.h>

#include "tests/tools/client_fixture.h"
#include "tests/tools/semaphore_holder.h"

namespace kavell::test {

/// The client waiting for a data file whose semaphore somebody else holds.
class Waiting : public ClientTest {
protected:
    void SetUp() override
    {
        ClientTest::SetUp();
        run({"add", "google", "anna", "a=1"});
        run({"list"});
        m_path = dataFilePath(googleType, "anna");
        ASSERT_EQ(pipe2(m_error, O_CLOEXEC), 0);
        m_nothing = open("/dev/null", O_RDWR | O_CLOEXEC);
    }

    void TearDown() override
    {
        close(m_error[0]);
        close(m_error[1]);
        close(m_nothing);
        ClientTest::TearDown();
    }

    [[nodiscard]] std::unique_ptr<ChildProcess> start(std::vector<std::string> words) const
    {
        return std::make_unique<ChildProcess>(commandLine(std::move(words)), std::vector<std::string>{}, m_nothing,
                                              m_nothing, m_error[1]);
    }

    /// The next line on standard error, within ten seconds.
    [[nodiscard]] std::string errorLine() const
    {
        std::string line;
        pollfd waiting{m_error[0], POLLIN, 0};
        char letter = 0;
        while (poll(&waiting, 1, 10000) > 0 && read(m_error[0], &letter, 1) == 1 && letter != '\n')
            line += letter;
        return line;
    }

    std::string m_path;
    int m_error[2] = {-1, -1};
    int m_nothing = -1;
};

TEST_F(Waiting, IsAnnouncedAfterTwoSecondsAndGoesOnAfterTheRelease)
{
    SemaphoreHolder holder(m_path);
    const auto child = start({"set", "google", "anna", "b=2"});

    EXPECT_EQ(errorLine(), "kavell-accounts: waiting for another program to finish with google anna; if it was killed, "
                           "run 'kavell-accounts doctor --repair'");
    holder.release(m_path);

    EXPECT_EQ(child->wait(), 0);
    EXPECT_THAT(client({"show", "google", "anna"}).output, testing::HasSubstr("  a=1\n  b=2\n"));
}

TEST_F(Waiting, EndsAtOnceOnAnInterrupt)
{
    SemaphoreHolder holder(m_path);
    const std::string before = readFile(m_path);
    for (const std::vector<std::string> &words : std::vector<std::vector<std::string>>{
             {"set", "google", "anna", "b=2"}, {"list"}, {"show", "google", "anna"}}) {
        const auto child = start(words);
        ASSERT_TRUE(awaitWaiters(m_path, 1));
        child->signal(SIGINT);
        EXPECT_EQ(child->wait(std::chrono::seconds(5)), 130) << words[0];
    }
    holder.release(m_path);

    EXPECT_EQ(readFile(m_path), before);
    EXPECT_EQ(semaphoreValue(m_path), 1);
}

TEST_F(Waiting, AnInterruptAtAnyMomentLeavesNoLockTaken)
{
    for (int round = 0; round < 200; ++round) {
        const auto child = start({"set", "google", "anna", "b=" + std::to_string(round)});
        usleep(static_cast<useconds_t>(1000 + round * 40));
        child->signal(SIGINT);
        const int status = child->wait();
        ASSERT_TRUE(status == 0 || status == 130) << status;
        ASSERT_EQ(semaphoreValue(m_path), 1) << "round " << round;
    }
    EXPECT_EQ(client({"show", "google", "anna"}).status, 0);
}

}  // namespace kavell::test
