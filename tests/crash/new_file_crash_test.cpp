// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A crash that leaves a new data file beside the redo record of an earlier one, whose inode had the same number.

#include <cerrno>
#include <cstdlib>
#include <filesystem>
#include <gtest/gtest.h>
#include <sys/stat.h>

#include "platform/data_file.h"
#include "platform/redo_record.h"
#include "tests/faults/system_calls.h"
#include "tests/support/process.h"

namespace kavell::test {

namespace {

/// Leaves the record of an earlier life beside the first file that is synced, of its number and over what it holds, and
/// keeps any record from being deleted, as a crash would.
class EarlierLife : public SystemCallObserver {
public:
    EarlierLife(std::string recordPath, std::string_view contents)
        : m_recordPath(std::move(recordPath)), m_contents(contents)
    {
    }

    long onCall(SystemCall &call, const std::function<long()> &make) override
    {
        if (call.kind == CallKind::Unlink && call.path == m_recordPath)
            return 0;
        struct stat status {};
        if (call.kind == CallKind::SyncData && !std::exchange(m_isLeft, true) && fstat(call.descriptor, &status) == 0)
            writeFile(m_recordPath, encodeRedoRecord({status.st_ino, m_contents, "the contents of an earlier life"}));
        return make();
    }

    [[nodiscard]] bool isLeft() const { return m_isLeft; }

private:
    const std::string m_recordPath;
    const std::string_view m_contents;
    bool m_isLeft = false;
};

TEST(NewFileCrash, ARecordOfAnEarlierLifeIsVoidForANewFileOfTheSameNumber)
{
    constexpr std::string_view kContents = "the contents as they were once before";
    const std::string directory = std::string(std::getenv("TMPDIR")) + "/new-file";
    const std::string path = directory + "/ada.plist";
    std::filesystem::create_directories(directory);
    EarlierLife earlierLife(siblingPath(path, kRedoRecordPrefix), kContents);
    {
        const Observation observation(earlierLife);
        EXPECT_TRUE(writeDataFile(path.c_str(), kContents, [](std::string_view) noexcept { return true; }));
    }
    EXPECT_TRUE(earlierLife.isLeft());
    FileContents contents;
    EXPECT_EQ(readDataFile(path.c_str(), contents), FileRead::Done);
    EXPECT_EQ(contents.view(), kContents);
    EXPECT_EQ(std::distance(std::filesystem::directory_iterator(directory), {}), 1);
}

}  // namespace

}  // namespace kavell::test
