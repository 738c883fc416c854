// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What a crash can leave beside a data file, and what the next reader, writer or deletion makes of it.

#include "platform/data_file.h"

#include <cstdlib>
#include <filesystem>
#include <gtest/gtest.h>
#include <sys/stat.h>

#include "platform/redo_record.h"
#include "tests/support/process.h"
#include "tests/support/redo_records.h"

using namespace kavell;
using namespace kavell::test;

namespace {

constexpr std::string_view kOld = "the old contents, as they were";
constexpr std::string_view kNew = "the NEW contents, and somewhat longer ones";

bool isIntactAlways(std::string_view) noexcept
{
    return true;
}

class DataFile : public testing::Test {
protected:
    DataFile() { std::filesystem::create_directories(m_directory); }
    ~DataFile() override { std::filesystem::remove_all(m_directory); }

    [[nodiscard]] static ino_t inodeOf(const std::string &path)
    {
        struct stat status {};
        stat(path.c_str(), &status);
        return status.st_ino;
    }

    [[nodiscard]] ino_t inode() const { return inodeOf(m_path); }

    void leaveRecord(ino_t inodeInRecord, std::optional<std::string_view> oldContents = kOld)
    {
        RedoRecord record;
        record.inode = inodeInRecord;
        record.oldContents = oldContents;
        record.newContents = kNew;
        writeFile(m_recordPath, encodeRedoRecord(record));
    }

    [[nodiscard]] std::string read() const
    {
        FileContents contents;
        return readDataFile(m_path.c_str(), contents) == FileRead::Done ? std::string(contents.view()) : "(failed)";
    }

    [[nodiscard]] bool hasRecord() const { return std::filesystem::exists(m_recordPath); }
    [[nodiscard]] bool hasVoidRecord() const { return isVoidRecordAt(m_recordPath); }

    std::string m_directory = std::string(std::getenv("TMPDIR")) + "/data-file-test";
    std::string m_path = m_directory + "/ada.plist";
    std::string m_recordPath = siblingPath(m_path, kRedoRecordPrefix);
};

TEST_F(DataFile, SaysWhichModificationTimeAReplacementGaveTheFile)
{
    writeFile(m_path, kOld);
    FileTime written;
    EXPECT_TRUE(writeDataFile(m_path.c_str(), kNew, isIntactAlways, &written));
    struct stat status {};
    ASSERT_EQ(stat(m_path.c_str(), &status), 0);
    EXPECT_EQ(written, (FileTime{status.st_mtim.tv_sec, status.st_mtim.tv_nsec}));
}

TEST_F(DataFile, SaysWhichModificationTimeANewFileHas)
{
    FileTime written;
    EXPECT_TRUE(writeDataFile(m_path.c_str(), kNew, isIntactAlways, &written));
    struct stat status {};
    ASSERT_EQ(stat(m_path.c_str(), &status), 0);
    EXPECT_EQ(written, (FileTime{status.st_mtim.tv_sec, status.st_mtim.tv_nsec}));
}

TEST_F(DataFile, AReplacementThatHadNotBegunIsFinished)
{
    writeFile(m_path, kOld);
    leaveRecord(inode());
    EXPECT_EQ(read(), kNew);
    EXPECT_EQ(readFile(m_path), kNew);
    EXPECT_FALSE(hasRecord());
}

TEST_F(DataFile, AReplacementTornAtAnyByteIsFinished)
{
    for (size_t torn = 0; torn <= kNew.size(); ++torn) {
        const std::string rest(torn < kOld.size() ? kOld.substr(torn) : "");
        writeFile(m_path, std::string(kNew.substr(0, torn)) + rest);
        leaveRecord(inode());
        EXPECT_EQ(read(), kNew) << torn;
        EXPECT_EQ(readFile(m_path), kNew) << torn;
        EXPECT_FALSE(hasRecord()) << torn;
    }
}

TEST_F(DataFile, AFileThatGrewWithoutItsBytesIsFinished)
{
    std::string grown(kOld);
    grown.resize(kNew.size(), '\0');
    writeFile(m_path, grown);
    leaveRecord(inode());
    EXPECT_EQ(read(), kNew);
}

TEST_F(DataFile, AFileThatWasClearedBeforeItShrankIsFinished)
{
    constexpr std::string_view kShorter = "shorter";
    RedoRecord record;
    writeFile(m_path, std::string(kShorter) + std::string(kOld.size() - kShorter.size(), '\0'));
    record.inode = inode();
    record.oldContents = kOld;
    record.newContents = kShorter;
    writeFile(m_recordPath, encodeRedoRecord(record));
    EXPECT_EQ(read(), kShorter);
    EXPECT_EQ(readFile(m_path), kShorter);
    EXPECT_FALSE(hasRecord());
}

TEST_F(DataFile, AFinishedReplacementIsItsOwnersAlone)
{
    writeFile(m_path, kNew);
    leaveRecord(inode());
    EXPECT_EQ(chmod(m_path.c_str(), 0644), 0);
    EXPECT_EQ(read(), kNew);
    EXPECT_EQ(std::filesystem::status(m_path).permissions(), std::filesystem::perms(0600));
}

TEST_F(DataFile, AFinishedReplacementOnlyLosesItsRecord)
{
    writeFile(m_path, kNew);
    leaveRecord(inode());
    EXPECT_EQ(read(), kNew);
    EXPECT_FALSE(hasRecord());
}

TEST_F(DataFile, WhatAnotherProgramHasWrittenSinceIsKept)
{
    writeFile(m_path, "something else entirely, by an editor");
    leaveRecord(inode());
    EXPECT_EQ(read(), "something else entirely, by an editor");
    EXPECT_FALSE(hasRecord());
}

TEST_F(DataFile, ARecordOfAnotherFileIsNotApplied)
{
    writeFile(m_path, kOld);
    leaveRecord(inode() + 1);
    EXPECT_EQ(read(), kOld);
    EXPECT_FALSE(hasRecord());
}

TEST_F(DataFile, ARecordCutOffAtAnyByteIsNotApplied)
{
    writeFile(m_path, kOld);
    leaveRecord(inode());
    const std::string whole = readFile(m_recordPath);
    for (size_t length = 0; length < whole.size(); ++length) {
        writeFile(m_recordPath, whole.substr(0, length));
        EXPECT_EQ(read(), kOld) << length;
        EXPECT_EQ(hasRecord(), length == 16) << length;
    }
}

TEST_F(DataFile, ARecordOfUnknownOldContentsIsAppliedToWhateverIsThere)
{
    writeFile(m_path, "half of something that was too large to keep");
    leaveRecord(inode(), std::nullopt);
    EXPECT_EQ(read(), kNew);
}

TEST_F(DataFile, AWriterFinishesALeftReplacementBeforeItsOwn)
{
    writeFile(m_path, kOld);
    leaveRecord(inode());
    EXPECT_TRUE(writeDataFile(m_path.c_str(), "the newest", isIntactAlways));
    EXPECT_EQ(readFile(m_path), "the newest");
    EXPECT_TRUE(hasVoidRecord());
}

TEST_F(DataFile, RewritingKeepsTheInodeAndLeavesAVoidRecordBeside)
{
    writeFile(m_path, kOld);
    const ino_t before = inode();
    EXPECT_TRUE(writeDataFile(m_path.c_str(), kNew, isIntactAlways));
    EXPECT_EQ(inode(), before);
    EXPECT_EQ(readFile(m_path), kNew);
    EXPECT_TRUE(hasVoidRecord());
    EXPECT_EQ(std::filesystem::status(m_recordPath).permissions(), std::filesystem::perms(0600));
    EXPECT_EQ(std::distance(std::filesystem::directory_iterator(m_directory), {}), 2);
}

TEST_F(DataFile, RewritingAgainUsesTheSameRecord)
{
    writeFile(m_path, kOld);
    EXPECT_TRUE(writeDataFile(m_path.c_str(), kNew, isIntactAlways));
    const ino_t before = inodeOf(m_recordPath);
    EXPECT_TRUE(writeDataFile(m_path.c_str(), kOld, isIntactAlways));
    EXPECT_EQ(inodeOf(m_recordPath), before);
    EXPECT_TRUE(hasVoidRecord());
    EXPECT_EQ(readFile(m_path), kOld);
}

TEST_F(DataFile, TheVoidRecordThatStaysIsTheFiles)
{
    writeFile(m_path, kOld);
    EXPECT_TRUE(writeDataFile(m_path.c_str(), kNew, isIntactAlways));
    EXPECT_EQ(readFile(m_recordPath), voidRecordOf(inode()));
}

TEST_F(DataFile, TheVoidRecordOfAnotherFileIsNotUsed)
{
    // Nobody knows whether the name of a file that was put in the other's place is on the disk.
    const std::string another = m_directory + "/another";
    writeFile(m_path, kOld);
    writeFile(m_recordPath, voidRecordOf(inode() + 1));
    std::filesystem::create_hard_link(m_recordPath, another);
    EXPECT_TRUE(writeDataFile(m_path.c_str(), kNew, isIntactAlways));
    EXPECT_NE(inodeOf(m_recordPath), inodeOf(another));
    EXPECT_EQ(readFile(m_recordPath), voidRecordOf(inode()));
    EXPECT_EQ(readFile(m_path), kNew);
}

TEST_F(DataFile, ARecordThatIsUsedAgainIsItsOwnersAlone)
{
    writeFile(m_path, kOld);
    EXPECT_TRUE(writeDataFile(m_path.c_str(), kNew, isIntactAlways));
    EXPECT_EQ(chmod(m_recordPath.c_str(), 0644), 0);
    EXPECT_TRUE(writeDataFile(m_path.c_str(), kOld, isIntactAlways));
    EXPECT_EQ(std::filesystem::status(m_recordPath).permissions(), std::filesystem::perms(0600));
}

TEST_F(DataFile, AVoidRecordSaysNothing)
{
    writeFile(m_path, kOld);
    EXPECT_TRUE(writeDataFile(m_path.c_str(), kNew, isIntactAlways));
    writeFile(m_path, "something else entirely, by an editor");
    EXPECT_EQ(read(), "something else entirely, by an editor");
    EXPECT_TRUE(hasVoidRecord());
}

TEST_F(DataFile, DeletingAfterARewriteLeavesNothing)
{
    writeFile(m_path, kOld);
    EXPECT_TRUE(writeDataFile(m_path.c_str(), kNew, isIntactAlways));
    EXPECT_TRUE(removeDataFile(m_path.c_str()));
    EXPECT_TRUE(std::filesystem::is_empty(m_directory));
}

TEST_F(DataFile, ANewFileIsNotTakenForTheOneThatARecordWasLeftFor)
{
    leaveRecord(1, std::nullopt);
    EXPECT_TRUE(writeDataFile(m_path.c_str(), kOld, isIntactAlways));
    EXPECT_EQ(readFile(m_path), kOld);
    EXPECT_EQ(std::distance(std::filesystem::directory_iterator(m_directory), {}), 1);
}

TEST_F(DataFile, DeletingTakesTheRecordAlong)
{
    writeFile(m_path, kOld);
    leaveRecord(inode());
    EXPECT_TRUE(removeDataFile(m_path.c_str()));
    EXPECT_TRUE(std::filesystem::is_empty(m_directory));
}

TEST_F(DataFile, DeletingLeavesAnEmptyDirectoryOfThatNameAlone)
{
    std::filesystem::create_directory(m_path);
    EXPECT_FALSE(removeDataFile(m_path.c_str()));
    EXPECT_TRUE(std::filesystem::is_directory(m_path));
}

TEST_F(DataFile, NonePathsFail)
{
    EXPECT_FALSE(writeDataFile(nullptr, kNew, isIntactAlways));
    EXPECT_FALSE(removeDataFile(nullptr));
}

}  // namespace
