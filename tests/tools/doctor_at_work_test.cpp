// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What the doctor does about a lock that is taken after it has looked at the locks: nothing may hold it up for long.

#include <gmock/gmock.h>

#include "tests/store/store_test.h"
#include "tests/tools/semaphore_holder.h"
#include "tools/doctor.h"

namespace kavell::test {

using tools::Address;
using tools::Findings;

class DoctorAtWork : public StoreTest {
protected:
    DoctorAtWork()
    {
        commit(openAccount("anna"));
        static_cast<void>(openAccount("anna"));  // makes the file's own semaphore
    }

    /// The next test's file may have this one's inode, and with it the set.
    ~DoctorAtWork() override { semctl(semaphoreOf(m_path), 0, SETVAL, 1); }

    /// The kinds of the findings, those that were mended with a "+".
    [[nodiscard]] std::vector<std::string> kinds() const
    {
        std::vector<std::string> all;
        for (const tools::Finding &finding : m_findings.all)
            all.push_back((finding.mended ? "+" : "") + finding.kind);
        return all;
    }

    const std::string m_path = fileOf("anna");
    const Address m_anna{std::string(kMail), "anna"};
    Findings m_findings;
};

TEST_F(DoctorAtWork, FreesTheLockOfAHolderThatIsKilledMeanwhile)
{
    m_findings.repair = true;
    SemaphoreHolder(m_path).killIt();
    const auto account = openForExamination(m_anna, m_findings);
    ASSERT_TRUE(account);
    EXPECT_TRUE(account->readable);
    EXPECT_THAT(kinds(), testing::ElementsAre("+stuck-lock"));
    EXPECT_EQ(semaphoreValue(m_path), 1);
}

TEST_F(DoctorAtWork, OnlyReportsItWithoutRepair)
{
    SemaphoreHolder(m_path).killIt();
    EXPECT_FALSE(openForExamination(m_anna, m_findings));
    EXPECT_THAT(kinds(), testing::ElementsAre("stuck-lock"));
    EXPECT_EQ(semaphoreValue(m_path), 0);
    EXPECT_TRUE(m_findings.untouchable.contains(m_anna));
}

TEST_F(DoctorAtWork, ReportsALockThatAnotherUserMadeFirst)
{
    // The lock of accounts that are being added has the same key for all users.
    const int set = semaphoreOf("");
    semid_ds status{};
    ASSERT_EQ(semctl(set, 0, IPC_STAT, &status), 0);
    const auto setMode = [&](unsigned short mode) {
        status.sem_perm.mode = mode;
        return semctl(set, 0, IPC_SET, &status);
    };
    ASSERT_EQ(setMode(0), 0);
    // The administrator may use any.
    ChildProcess otherUser([&] {
        if (geteuid() == 0 && setuid(65534) != 0)
            return 2;
        examineLocks({}, m_findings);
        return kinds() == std::vector<std::string>{"foreign-lock"} ? 0 : 1;
    });
    EXPECT_EQ(otherUser.wait(), 0);
    EXPECT_EQ(setMode(0600), 0);
}

TEST_F(DoctorAtWork, GivesALivingHolderUpInTheEnd)
{
    m_findings.repair = true;
    SemaphoreHolder holder(m_path);
    EXPECT_FALSE(openForExamination(m_anna, m_findings));
    EXPECT_THAT(kinds(), testing::ElementsAre("held-lock"));
    EXPECT_EQ(semaphoreValue(m_path), 0);
}

}  // namespace kavell::test
