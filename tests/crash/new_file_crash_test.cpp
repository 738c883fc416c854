// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A new data file beside the redo record of an earlier one: after a crash, where both inodes have the same number, and
// while the earlier one is removed; and a new file's time.

#include <cerrno>
#include <cstdlib>
#include <filesystem>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <vector>

#include "platform/data_file.h"
#include "platform/redo_record.h"
#include "tests/faults/system_calls.h"
#include "tests/support/process.h"

namespace kavell::test {

namespace {

/// Leaves the record of an earlier life beside the first file that is synced, of its number and over what it holds, and
/// keeps any record from being deleted, as a crash would. The record is as long as it was, or so many bytes.
class EarlierLife : public SystemCallObserver {
public:
    EarlierLife(std::string recordPath, std::string_view contents, size_t length = std::string::npos)
        : m_recordPath(std::move(recordPath)), m_contents(contents), m_length(length)
    {
    }

    long onCall(SystemCall &call, const std::function<long()> &make) override
    {
        if (call.kind == CallKind::Unlink && call.path == m_recordPath)
            return 0;
        struct stat status {};
        if (call.kind == CallKind::SyncData && m_inode == 0 && fstat(call.descriptor, &status) == 0) {
            m_inode = status.st_ino;
            writeFile(m_recordPath,
                      encodeRedoRecord({m_inode, m_contents, "the contents of an earlier life"}).substr(0, m_length));
        }
        return make();
    }

    /// The number that the record is of; 0 before it is left.
    [[nodiscard]] ino_t inode() const { return m_inode; }

private:
    const std::string m_recordPath;
    const std::string_view m_contents;
    const size_t m_length;
    ino_t m_inode = 0;
};

bool isIntactAlways(std::string_view) noexcept
{
    return true;
}

/// A disk that takes no bytes of the observed thread; and another program, which makes a file and begins to save it
/// once the earlier one is gone.
class MadeMeanwhile : public SystemCallObserver {
public:
    explicit MadeMeanwhile(std::string path) : m_path(std::move(path)) {}

    long onCall(SystemCall &call, const std::function<long()> &make) override
    {
        if (call.kind == CallKind::Write) {
            errno = EIO;
            return -1;
        }
        struct stat status {};
        if (call.kind == CallKind::SyncFile && !std::filesystem::exists(m_path)) {
            writeFile(m_path, "contents");
            EXPECT_EQ(stat(m_path.c_str(), &status), 0);
            m_record = encodeRedoRecord({status.st_ino, "contents", "CONTENTS"});
            writeFile(siblingPath(m_path, kRedoRecordPrefix), m_record);
        }
        return make();
    }

    [[nodiscard]] const std::string &record() const { return m_record; }

private:
    const std::string m_path;
    std::string m_record;
};

/// Notes which of two calls came first.
class TimeAndName : public SystemCallObserver {
public:
    long onCall(SystemCall &call, const std::function<long()> &make) override
    {
        if (call.kind == CallKind::SetTimes || call.kind == CallKind::Rename)
            m_calls.push_back(call.kind);
        return make();
    }

    [[nodiscard]] const std::vector<CallKind> &calls() const { return m_calls; }

private:
    std::vector<CallKind> m_calls;
};

TEST(NewFile, HasATimeOfItsOwnBeforeItHasItsName)
{
    // Not that of the kernel's tick: a program knows its own save by the time, also where another one removes the file and
    // makes it anew within the tick.
    const std::string path = std::string(std::getenv("TMPDIR")) + "/time/ada.plist";
    std::filesystem::create_directories(std::filesystem::path(path).parent_path());
    TimeAndName timeAndName;
    {
        const Observation observation(timeAndName);
        EXPECT_TRUE(writeDataFile(path.c_str(), "contents", isIntactAlways));
    }
    EXPECT_EQ(timeAndName.calls(), (std::vector<CallKind>{CallKind::SetTimes, CallKind::Rename}));
}

TEST(NewFileCrash, ARemovalLeavesTheRecordOfAFileThatIsMadeMeanwhile)
{
    const std::string path = std::string(std::getenv("TMPDIR")) + "/removed/ada.plist";
    const std::string recordPath = siblingPath(path, kRedoRecordPrefix);
    struct stat status {};
    writeFile(path, "before");
    ASSERT_EQ(stat(path.c_str(), &status), 0);
    writeFile(recordPath, encodeRedoRecord({status.st_ino, "before", "BEFORE"}));
    MadeMeanwhile madeMeanwhile(path);
    {
        const Observation observation(madeMeanwhile);
        EXPECT_TRUE(removeDataFile(path.c_str()));
    }
    EXPECT_NE(madeMeanwhile.record(), "");
    EXPECT_EQ(readFile(recordPath), madeMeanwhile.record());
}

TEST(NewFileCrash, ARecordOfAnEarlierLifeIsVoidForANewFileOfTheSameNumber)
{
    constexpr std::string_view kContents = "the contents as they were once before";
    const std::string directory = std::string(std::getenv("TMPDIR")) + "/new-file";
    const std::string path = directory + "/ada.plist";
    std::filesystem::create_directories(directory);
    EarlierLife earlierLife(siblingPath(path, kRedoRecordPrefix), kContents);
    {
        const Observation observation(earlierLife);
        EXPECT_TRUE(writeDataFile(path.c_str(), kContents, isIntactAlways));
    }
    EXPECT_NE(earlierLife.inode(), 0U);
    FileContents contents;
    EXPECT_EQ(readDataFile(path.c_str(), contents), FileRead::Done);
    EXPECT_EQ(contents.view(), kContents);
    EXPECT_EQ(std::distance(std::filesystem::directory_iterator(directory), {}), 1);
}

TEST(NewFileCrash, AVoidRecordOfAnEarlierLifeIsOfAnotherNumberThanANewFile)
{
    // What it says of names is not true of the new file, and that it is void may not be on the disk.
    const std::string directory = std::string(std::getenv("TMPDIR")) + "/new-file-beside-void-record";
    const std::string path = directory + "/ada.plist";
    std::filesystem::create_directories(directory);
    EarlierLife earlierLife(siblingPath(path, kRedoRecordPrefix), "contents", kVoidRecordLength);
    {
        const Observation observation(earlierLife);
        EXPECT_TRUE(writeDataFile(path.c_str(), "contents", isIntactAlways));
    }
    struct stat status {};
    ASSERT_EQ(stat(path.c_str(), &status), 0);
    EXPECT_NE(earlierLife.inode(), 0U);
    EXPECT_NE(status.st_ino, earlierLife.inode());
}

}  // namespace

}  // namespace kavell::test
