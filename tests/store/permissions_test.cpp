// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What a user may not do: files and directories without the permissions that a read or a save needs, and a full disk.
// The administrator may do everything, so this program becomes an ordinary user first.

#include <csignal>
#include <grp.h>
#include <sys/ipc.h>
#include <sys/resource.h>
#include <sys/sem.h>
#include <unistd.h>

#include "platform/redo_record.h"
#include "tests/store/store_test.h"

using namespace kavell;
using namespace kavell::test;

namespace {

constexpr uid_t kOrdinaryUser = 65534;

class Permissions : public StoreTest {
protected:
    Permissions() { writeFile(fileOf("ada"), accountFile("<key>a</key><integer>1</integer>")); }
    ~Permissions() override
    {
        // The next test empties the home, for which it must be able to enter the directory.
        chmod(providerDirectory().c_str(), 0700);
    }

    static void setPermissions(const std::string &path, mode_t mode) { ASSERT_EQ(chmod(path.c_str(), mode), 0); }

    /// Leaves a replacement of 11 by 22 that was cut off in between, with its record. What stands in the file.
    static std::string putTornFile()
    {
        const auto contentsOf = [](const std::string &number) {
            return accountFile("<key>a</key><integer>" + number + "</integer>");
        };
        const std::string torn = contentsOf("21"), oldContents = contentsOf("11"), newContents = contentsOf("22");
        writeFile(fileOf("ada"), torn);
        struct stat status {};
        EXPECT_EQ(stat(fileOf("ada").c_str(), &status), 0);
        writeFile(siblingPath(fileOf("ada"), kRedoRecordPrefix),
                  encodeRedoRecord({status.st_ino, oldContents, newContents}));
        return torn;
    }

    /// Commits a change that must fail with the save message, be announced and stay pending.
    static void expectSaveFails(const Account &account)
    {
        Notifications notifications;
        StandardErrorCapture capture;
        commit(account);
        EXPECT_EQ(capture.take(), kSaveMessage);
        EXPECT_TRUE(hasPendingChanges(account));
        EXPECT_EQ(notifications.takeLoginNames(), (Names{"ada"}));
    }
};

}  // namespace

TEST_F(Permissions, AFileThatMayNotBeReadLeavesTheRecordSilently)
{
    const Account account = openAccount("ada");
    writeFile(fileOf("ada"), accountFile("<key>a</key><integer>2</integer>"));
    setPermissions(fileOf("ada"), 0000);
    StandardErrorCapture capture;
    EXPECT_TRUE(CSKavellAccountLoadData(account.get()));
    EXPECT_EQ(capture.take(), "");
    EXPECT_TRUE(same(attribute(account, "a"), integer(1)));
}

TEST_F(Permissions, AReplacementWhoseRecordMayNotBeDeletedIsReadWhole)
{
    putTornFile();
    setPermissions(providerDirectory(), 0500);
    StandardErrorCapture capture;
    for (int time = 0; time < 2; ++time)
        EXPECT_TRUE(same(attribute(openAccount("ada"), "a"), integer(22)));
    EXPECT_EQ(capture.take(), "");
}

TEST_F(Permissions, AReplacementThatMayNotBeFinishedIsReadWhole)
{
    const std::string torn = putTornFile();
    setPermissions(fileOf("ada"), 0400);
    StandardErrorCapture capture;
    EXPECT_TRUE(same(attribute(openAccount("ada"), "a"), integer(22)));
    EXPECT_EQ(capture.take(), "");
    EXPECT_EQ(readFile(fileOf("ada")), torn);
}

TEST_F(Permissions, AReplacementWhoseRecordMayNotBeReadLeavesTheRecordSilently)
{
    const Account account = openAccount("ada");
    putTornFile();
    setPermissions(siblingPath(fileOf("ada"), kRedoRecordPrefix), 0000);
    StandardErrorCapture capture;
    EXPECT_TRUE(CSKavellAccountLoadData(account.get()));
    EXPECT_TRUE(same(attribute(account, "a"), integer(1)));
    setPermissions(fileOf("ada"), 0400);
    EXPECT_TRUE(CSKavellAccountLoadData(account.get()));
    EXPECT_TRUE(same(attribute(account, "a"), integer(1)));
    EXPECT_EQ(capture.take(), "");
}

TEST_F(Permissions, AFileThatMayNotBeWrittenFailsTheSave)
{
    const Account account = openAccount("ada");
    setPermissions(fileOf("ada"), 0400);
    const std::string before = readFile(fileOf("ada"));
    setAttribute(account, "b", integer(2));
    expectSaveFails(account);
    EXPECT_EQ(readFile(fileOf("ada")), before);
}

TEST_F(Permissions, ANewFileThatMayNotBeMadeFailsTheSave)
{
    std::filesystem::remove(fileOf("ada"));
    setPermissions(providerDirectory(), 0500);
    const Account account = openAccount("ada");
    expectSaveFails(account);
    EXPECT_FALSE(std::filesystem::exists(fileOf("ada")));
}

TEST_F(Permissions, ADirectoryThatMayNotBeMadeFailsTheSave)
{
    std::filesystem::remove_all(home() + "/Library");
    setPermissions(home(), 0500);
    const Account account = openAccount("ada");
    expectSaveFails(account);
    setPermissions(home(), 0700);
    EXPECT_FALSE(std::filesystem::exists(home() + "/Library"));
}

TEST_F(Permissions, AStatusThatMayNotBeHadIsReportedAndEmptiesTheCommittedSide)
{
    const Account account = openAccount("ada");
    setAttribute(account, "b", integer(2));
    setPermissions(providerDirectory(), 0000);
    StandardErrorCapture capture;
    EXPECT_FALSE(CSKavellAccountLoadData(account.get()));
    EXPECT_EQ(capture.take(), kStatMessage);
    EXPECT_TRUE(same(attributes(account), dictionary({{"b", integer(2)}})));
    EXPECT_EQ(uuidOf(account), kUUID);
    setPermissions(providerDirectory(), 0700);
    EXPECT_TRUE(CSKavellAccountLoadData(account.get()));
    EXPECT_TRUE(same(attributes(account), dictionary({{"a", integer(1)}, {"b", integer(2)}})));
}

TEST_F(Permissions, ADeletionThatFailsIsNotAnnouncedAndClearsTheMark)
{
    const Account account = openAccount("ada");
    _CSKavellAccountRemove(account.get());
    setPermissions(providerDirectory(), 0500);
    Notifications notifications;
    StandardErrorCapture capture;
    commit(account);
    EXPECT_EQ(capture.take(), "");
    EXPECT_EQ(notifications.takeLoginNames(), Names{});
    EXPECT_TRUE(std::filesystem::exists(fileOf("ada")));
    EXPECT_FALSE(hasPendingChanges(account));
}

TEST_F(Permissions, ADirectoryThatMayNotBeListedHasNoAccounts)
{
    setPermissions(providerDirectory(), 0300);
    StandardErrorCapture capture;
    const auto provider = adopt(_CSKavellAccountProviderCreate(nullptr, text(kMail).get()));
    EXPECT_EQ(CSKavellArrayGetCount(adopt(_CSKavellAccountProviderCopyAccounts(provider.get())).get()), 0u);
    EXPECT_EQ(capture.take(), "");
}

TEST_F(Permissions, ASetThatMayNotBeUsedCountsAsNotTaken)
{
    // The set of the file's key is there and may be found, but its owner lets nobody take it.
    const int set = semget(ftok(fileOf("ada").c_str(), 0), 1, IPC_CREAT | 0600);
    ASSERT_GT(set, 0);
    ASSERT_EQ(semctl(set, 0, SETVAL, 1), 0);
    semid_ds status{};
    ASSERT_EQ(semctl(set, 0, IPC_STAT, &status), 0);
    status.sem_perm.mode = 0;
    ASSERT_EQ(semctl(set, 0, IPC_SET, &status), 0);
    const std::string before = readFile(fileOf("ada"));
    StandardErrorCapture capture;
    const Account account = openAccount("ada");
    EXPECT_FALSE(attribute(account, "a"));
    EXPECT_TRUE(CSKavellAccountLoadData(account.get()));
    setAttribute(account, "b", integer(2));
    Notifications notifications;
    commit(account);
    EXPECT_EQ(capture.take(), "");
    EXPECT_EQ(readFile(fileOf("ada")), before);
    EXPECT_TRUE(hasPendingChanges(account));
    EXPECT_EQ(notifications.takeLoginNames(), (Names{"ada"}));
    semctl(set, 0, IPC_RMID);
}

TEST_F(Permissions, AFullDiskFailsTheSaveAndKeepsTheOldContents)
{
    const Account account = openAccount("ada");
    const std::string before = readFile(fileOf("ada"));
    setAttribute(account, "b", text(std::string(20000, 'x')));
    // A file that may grow no further is what a full disk is to a writer.
    std::signal(SIGXFSZ, SIG_IGN);
    rlimit usual{};
    ASSERT_EQ(getrlimit(RLIMIT_FSIZE, &usual), 0);
    for (rlim_t largest : {500, 4096, 16384}) {
        const rlimit tight{largest, usual.rlim_max};
        ASSERT_EQ(setrlimit(RLIMIT_FSIZE, &tight), 0);
        setAttribute(account, "b", text(std::string(20000, 'x')));
        expectSaveFails(account);
        ASSERT_EQ(setrlimit(RLIMIT_FSIZE, &usual), 0);
        EXPECT_EQ(readFile(fileOf("ada")), before);
        EXPECT_TRUE(same(attributes(openAccount("ada")), dictionary({{"a", integer(1)}})));
    }
    setAttribute(account, "b", integer(2));
    commit(account);
    EXPECT_TRUE(same(attributes(openAccount("ada")), dictionary({{"a", integer(1)}, {"b", integer(2)}})));
}

TEST_F(Permissions, AFullDiskLeavesNoPartOfANewFile)
{
    std::filesystem::remove(fileOf("ada"));
    const Account account = openAccount("ada");
    setAttribute(account, "b", text(std::string(20000, 'x')));
    std::signal(SIGXFSZ, SIG_IGN);
    rlimit usual{};
    ASSERT_EQ(getrlimit(RLIMIT_FSIZE, &usual), 0);
    const rlimit tight{4096, usual.rlim_max};
    ASSERT_EQ(setrlimit(RLIMIT_FSIZE, &tight), 0);
    expectSaveFails(account);
    ASSERT_EQ(setrlimit(RLIMIT_FSIZE, &usual), 0);
    EXPECT_EQ(entriesBeginningWith(""), Names{});
}

namespace {

/// Hands the scratch directories to the ordinary user and becomes that user; false when that fails.
bool becomeOrdinaryUser()
{
    if (geteuid() != 0)
        return true;
    const std::filesystem::path homeDirectory = std::getenv("HOME");
    const std::string runtimeDirectory = std::getenv("XDG_RUNTIME_DIR");
    return chmod(homeDirectory.parent_path().c_str(), 0711) == 0 &&
           chown(homeDirectory.c_str(), kOrdinaryUser, kOrdinaryUser) == 0 &&
           chown(runtimeDirectory.c_str(), kOrdinaryUser, kOrdinaryUser) == 0 && setgroups(0, nullptr) == 0 &&
           setgid(kOrdinaryUser) == 0 && setuid(kOrdinaryUser) == 0;
}

}  // namespace

int main(int argumentCount, char **arguments)
{
    testing::InitGoogleTest(&argumentCount, arguments);
    // The session bus belongs to the user that this program no longer is.
    unsetenv("DBUS_SESSION_BUS_ADDRESS");
    if (!becomeOrdinaryUser()) {
        std::perror("cannot become an ordinary user");
        return 1;
    }
    return RUN_ALL_TESTS();
}
