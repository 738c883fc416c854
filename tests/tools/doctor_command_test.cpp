// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <chrono>
#include <fcntl.h>
#include <gmock/gmock.h>
#include <memory>
#include <nlohmann/json.hpp>
#include <sys/stat.h>

#include "platform/data_file.h"
#include "platform/redo_record.h"
#include "tests/support/redo_records.h"
#include "tests/tools/client_fixture.h"
#include "tests/tools/semaphore_holder.h"

namespace kavell::test {

using Json = nlohmann::json;

class DoctorCommand : public ClientTest {
protected:
    void SetUp() override
    {
        ClientTest::SetUp();
        run({"add", "google", "anna", "a=1"});
        run({"list"});  // makes the file's own semaphore
        m_path = dataFilePath(googleType, "anna");
    }

    /// The kinds of the problems that the doctor reports, in order, and those that it mended with a "+".
    static std::vector<std::string> problems(const ProgramResult &result)
    {
        std::vector<std::string> kinds;
        const Json report = Json::parse(result.output);
        for (const Json &finding : report["findings"])
            if (finding["weight"] == "problem")
                kinds.push_back((finding["mended"].get<bool>() ? "+" : "") + finding["kind"].get<std::string>());
        return kinds;
    }

    /// The doctor finds exactly this without changing anything, mends it, and then finds nothing.
    void expectMended(const std::string &kind)
    {
        const std::string before = everythingOnDisk();
        const ProgramResult found = client({"doctor", "--json"});
        EXPECT_EQ(found.status, 1);
        EXPECT_THAT(problems(found), testing::ElementsAre(kind));
        EXPECT_EQ(everythingOnDisk(), before);

        const ProgramResult mended = client({"doctor", "--repair", "--json"});
        EXPECT_EQ(mended.status, 0) << mended.output;
        EXPECT_THAT(problems(mended), testing::ElementsAre("+" + kind));

        const ProgramResult after = client({"doctor", "--json"});
        EXPECT_EQ(after.status, 0);
        EXPECT_THAT(problems(after), testing::IsEmpty());
    }

    static mode_t modeOf(const std::string &path)
    {
        struct stat status {};
        return stat(path.c_str(), &status) == 0 ? status.st_mode & 07777U : 0;
    }

    std::string m_path;
};

TEST_F(DoctorCommand, FindsNothingWrongWithGoodAccounts)
{
    const ProgramResult result = client({"doctor"});

    EXPECT_EQ(result.status, 0);
    EXPECT_EQ(result.output, "note: the passwords were not examined: the credential store (none) is unreachable\n"
                             "1 account examined, no problems.\n");
}

TEST_F(DoctorCommand, FreesTheLockOfAKilledHolder)
{
    SemaphoreHolder holder(m_path);
    holder.killIt();
    ASSERT_EQ(semaphoreValue(m_path), 0);

    expectMended("stuck-lock");

    EXPECT_EQ(semaphoreValue(m_path), 1);
    EXPECT_EQ(client({"set", "google", "anna", "b=2"}).status, 0);
}

TEST_F(DoctorCommand, SaysWhomEveryoneWaitsFor)
{
    SemaphoreHolder holder(m_path);
    const std::string pid = std::to_string(holder.pid());
    holder.killIt();

    const ProgramResult result = client({"doctor"});

    EXPECT_EQ(result.status, 1);
    EXPECT_THAT(result.output, testing::HasSubstr("problem: the lock of google anna was left taken by process " + pid +
                                                  ", which is dead, and everyone waits for it\n"));
    EXPECT_THAT(result.output, testing::HasSubstr("Run 'kavell-accounts doctor --repair' to mend"));
    EXPECT_EQ(semaphoreValue(m_path), 0);
    (void)client({"doctor", "--repair"});
}

TEST_F(DoctorCommand, NeverTakesALivingHoldersLock)
{
    SemaphoreHolder holder(m_path);

    const ProgramResult result = client({"doctor", "--repair", "--json"});

    EXPECT_EQ(result.status, 1);
    EXPECT_THAT(problems(result), testing::ElementsAre("held-lock"));
    EXPECT_EQ(semaphoreValue(m_path), 0);
    holder.release(m_path);
}

TEST_F(DoctorCommand, FreesTheLockThatNewAccountsShare)
{
    SemaphoreHolder holder("");
    holder.killIt();

    expectMended("stuck-lock");

    EXPECT_EQ(semaphoreValue(""), 1);
    EXPECT_EQ(client({"add", "google", "bob"}).status, 0);
}

TEST_F(DoctorCommand, ReadiesALockWhoseMakerWasKilled)
{
    semctl(semaphoreOf(m_path), 0, IPC_RMID);
    ASSERT_GT(semget(ftok(m_path.c_str(), 0), 1, IPC_CREAT | IPC_EXCL | 0600), 0);  // and no value yet

    expectMended("unready-lock");

    EXPECT_EQ(semaphoreValue(m_path), 1);
    EXPECT_EQ(client({"set", "google", "anna", "b=2"}).status, 0);
}

TEST_F(DoctorCommand, FreesTheLockThatARemovedAccountHad)
{
    SemaphoreHolder holder(m_path);
    const int set = semaphoreOf(m_path);
    // Made anew while the first file still has its inode, so that the second has another.
    const int first = open(m_path.c_str(), O_RDONLY | O_CLOEXEC);
    std::filesystem::remove(m_path);
    run({"add", "google", "anna", "a=1"});
    run({"list"});
    ASSERT_NE(semaphoreOf(m_path), set);
    holder.killIt();

    expectMended("stuck-lock");

    EXPECT_EQ(semctl(set, 0, GETVAL), 1);
    close(first);
}

TEST_F(DoctorCommand, LeavesTheLocksOfOtherPrograms)
{
    const int foreign = semget(ftok(m_path.c_str(), 'x'), 1, IPC_CREAT | IPC_EXCL | 0600);
    ASSERT_GT(foreign, 0);
    sembuf use{0, 1, 0};
    ChildProcess user(
        [&] { return semop(foreign, &use, 1) == 0 && (use.sem_op = -1, semop(foreign, &use, 1)) == 0 ? 0 : 1; });
    ASSERT_EQ(user.wait(), 0);

    EXPECT_EQ(client({"doctor", "--repair"}).status, 0);
    EXPECT_EQ(semctl(foreign, 0, GETVAL), 0);
    semctl(foreign, 0, IPC_RMID);
}

TEST_F(DoctorCommand, WakesThoseWhoWaitAndLetsThemInOneByOne)
{
    SemaphoreHolder holder(m_path);
    holder.killIt();
    std::vector<std::unique_ptr<ChildProcess>> waiting;
    for (int number = 0; number < 8; ++number)
        waiting.push_back(std::make_unique<ChildProcess>([number] {
            return client({"set", "google", "anna", "k" + std::to_string(number) + "=v"}).status;
        }));
    ASSERT_TRUE(awaitWaiters(m_path, 8));

    EXPECT_EQ(client({"doctor", "--repair"}).status, 0);

    for (const auto &child : waiting)
        EXPECT_EQ(child->wait(), 0);
    EXPECT_EQ(semaphoreValue(m_path), 1);
}

TEST_F(DoctorCommand, ManyRepairsAtOnceNeverLetTwoIn)
{
    for (int round = 0; round < 20; ++round) {
        SemaphoreHolder holder(m_path);
        holder.killIt();
        std::vector<std::unique_ptr<ChildProcess>> doctors;
        for (int number = 0; number < 4; ++number)
            doctors.push_back(std::make_unique<ChildProcess>([] { return client({"doctor", "--repair"}).status; }));
        for (const auto &child : doctors)
            (void)child->wait();
        ASSERT_EQ(semaphoreValue(m_path), 1) << "round " << round;
    }
}

TEST_F(DoctorCommand, TakesTheSurplusOfALockThatLetsSeveralIn)
{
    semctl(semaphoreOf(m_path), 0, SETVAL, 3);

    expectMended("open-lock");

    EXPECT_EQ(semaphoreValue(m_path), 1);
}

TEST_F(DoctorCommand, MendsThePermissionsOfAFile)
{
    chmod(m_path.c_str(), 0644);

    expectMended("wrong-permissions");

    EXPECT_EQ(modeOf(m_path), 0600U);
}

TEST_F(DoctorCommand, MendsThePermissionsOfADirectory)
{
    const std::string directory = std::filesystem::path(m_path).parent_path();
    chmod(directory.c_str(), 0755);

    expectMended("wrong-permissions");

    EXPECT_EQ(modeOf(directory), 0700U);
}

TEST_F(DoctorCommand, ReportsADamagedFileAndLeavesIt)
{
    writeFile(dataFilePath(googleType, "bad"), "<plist version=\"1.0\"><dict><key>UUID</key>");
    chmod(dataFilePath(googleType, "bad").c_str(), 0600);
    const std::string before = everythingOnDisk();

    const ProgramResult result = client({"doctor", "--repair", "--json"});

    EXPECT_EQ(result.status, 1);
    EXPECT_THAT(problems(result), testing::ElementsAre("damaged-file"));
    EXPECT_EQ(result.error, "");
    EXPECT_EQ(everythingOnDisk(), before);
}

TEST_F(DoctorCommand, FinishesAnInterruptedSave)
{
    const std::string oldContents = readFile(m_path);
    std::string newContents = oldContents;
    newContents.replace(newContents.find("<string>1</string>"), 18, "<string>2</string>");
    const std::string record = siblingPath(m_path, kRedoRecordPrefix);
    struct stat status {};
    ASSERT_EQ(stat(m_path.c_str(), &status), 0);
    writeFile(record, encodeRedoRecord({status.st_ino, oldContents, newContents}));

    expectMended("unfinished-save");

    EXPECT_FALSE(std::filesystem::exists(record));
    EXPECT_EQ(readFile(m_path), newContents);
}

TEST_F(DoctorCommand, LeavesAFileWhoseRecordIsOfAnEarlierOne)
{
    const std::string contents = readFile(m_path);
    const std::string record = siblingPath(m_path, kRedoRecordPrefix);
    writeFile(record, encodeRedoRecord({1, contents, "new"}));

    expectMended("unfinished-save");

    EXPECT_FALSE(std::filesystem::exists(record));
    EXPECT_EQ(readFile(m_path), contents);
}

TEST_F(DoctorCommand, SaysNothingOfTheVoidRecordThatASaveLeaves)
{
    struct stat status {};
    ASSERT_EQ(stat(m_path.c_str(), &status), 0);
    writeFile(siblingPath(m_path, kRedoRecordPrefix), voidRecordOf(status.st_ino));

    EXPECT_THAT(problems(client({"doctor", "--json"})), testing::IsEmpty());
}

TEST_F(DoctorCommand, RemovesTheVoidRecordOfAFileThatIsGone)
{
    const std::string record = siblingPath(dataFilePath(googleType, "gone"), kRedoRecordPrefix);
    writeFile(record, voidRecordOf(1));

    expectMended("left-over-record");

    EXPECT_FALSE(std::filesystem::exists(record));
}

TEST_F(DoctorCommand, RemovesTheRecordOfASaveWhoseFileIsGone)
{
    const std::string record = siblingPath(dataFilePath(googleType, "gone"), kRedoRecordPrefix);
    writeFile(record, encodeRedoRecord({1, "old", "new"}));

    expectMended("left-over-record");

    EXPECT_FALSE(std::filesystem::exists(record));
}

TEST_F(DoctorCommand, RemovesAnOldTemporaryFileAndLeavesAYoungOne)
{
    const std::string old = siblingPath(dataFilePath(googleType, "old"), kNewFilePrefix);
    const std::string young = siblingPath(dataFilePath(googleType, "young"), kNewFilePrefix);
    writeFile(old, "x");
    writeFile(young, "x");
    std::filesystem::last_write_time(old, std::filesystem::file_time_type::clock::now() - std::chrono::hours(1));

    expectMended("left-over-file");

    EXPECT_FALSE(std::filesystem::exists(old));
    EXPECT_TRUE(std::filesystem::exists(young));
}

TEST_F(DoctorCommand, NotesKeptDamagedCopies)
{
    writeFile(siblingPath(m_path, kDamagedCopyPrefix) + "-20260131T100000Z", "nonsense");

    const ProgramResult result = client({"doctor"});

    EXPECT_EQ(result.status, 0);
    EXPECT_THAT(result.output, testing::ContainsRegex("note: .*/damaged-[0-9a-f]+-20260131T100000Z is a damaged data "
                                                      "file that was kept"));
}

TEST_F(DoctorCommand, ReportsWhatLooksLikeAnAccountAndIsNone)
{
    std::filesystem::create_symlink(m_path, dataFilePath(googleType, "link"));

    EXPECT_THAT(problems(client({"doctor", "--json"})), testing::ElementsAre("no-regular-file"));
}

}  // namespace kavell::test
