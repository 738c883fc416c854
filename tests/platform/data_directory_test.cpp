// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What a listing of a directory of data files tells of their redo records, which no reader may miss.

#include "platform/data_directory.h"

#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <thread>
#include <vector>

#include "platform/data_file.h"
#include "platform/redo_record.h"
#include "tests/support/process.h"

using namespace kavell;
using namespace kavell::test;

namespace {

using Names = std::vector<std::string>;

constexpr int64_t kSecond = 1'000'000'000;
constexpr int64_t kLongestTick = kSecond / 100;

class DataDirectoryTest : public testing::Test {
protected:
    DataDirectoryTest()
    {
        std::filesystem::create_directories(m_path);
        put("ada.plist");
        put("grace.plist");
    }
    ~DataDirectoryTest() override { std::filesystem::remove_all(m_path); }

    void put(const std::string &name) const { writeFile(m_path + "/" + name, "contents"); }
    [[nodiscard]] std::string recordOf(const std::string &name) const
    {
        return siblingPath(m_path + "/" + name, kRedoRecordPrefix);
    }

    /// How many nanoseconds the directory's time is in the past, as far as the clock of files tells.
    [[nodiscard]] int64_t age() const
    {
        struct stat status {};
        timespec now{};
        EXPECT_EQ(stat(m_path.c_str(), &status), 0);
        EXPECT_EQ(clock_gettime(CLOCK_REALTIME_COARSE, &now), 0);
        return (now.tv_sec - status.st_ctim.tv_sec) * kSecond + (now.tv_nsec - status.st_ctim.tv_nsec);
    }

    /// Waits until the directory's time is older than any tick of that clock.
    void letTimePass() const
    {
        while (age() <= kLongestTick)
            std::this_thread::yield();
    }

    [[nodiscard]] static Names namesIn(const DataDirectory &directory)
    {
        Names names;
        directory.forEachDataFile([&](std::string_view name) { names.emplace_back(name); });
        std::sort(names.begin(), names.end());
        return names;
    }

    std::string m_path = std::string(std::getenv("TMPDIR")) + "/data-directory-test";
};

TEST_F(DataDirectoryTest, ListsTheRegularFilesThatAreNamedSo)
{
    put(".plist");
    put("damaged-0123456789abcdef-20260131T100000Z");
    put("notes.txt");
    std::filesystem::create_directory(m_path + "/directory.plist");
    std::filesystem::create_symlink("ada.plist", m_path + "/link.plist");
    EXPECT_EQ(namesIn(DataDirectory(m_path.c_str())), (Names{"ada.plist", "grace.plist"}));
}

TEST_F(DataDirectoryTest, ListsAFileWhoseNameBeginsLikeThatOfARecord)
{
    put(".redo-ada.plist");
    put(".redo-0123456789abcdef");
    EXPECT_EQ(namesIn(DataDirectory(m_path.c_str())), (Names{".redo-ada.plist", "ada.plist", "grace.plist"}));
}

TEST_F(DataDirectoryTest, HasNothingWhereThereIsNoDirectory)
{
    const DataDirectory directory((m_path + "/missing").c_str());
    EXPECT_EQ(directory.descriptor(), -1);
    EXPECT_EQ(namesIn(directory), Names{});
    EXPECT_FALSE(directory.hasNoRecordOf("ada.plist"));
}

TEST_F(DataDirectoryTest, KnowsThatAFileHasNoRecord)
{
    letTimePass();
    const DataDirectory directory(m_path.c_str());
    EXPECT_TRUE(directory.hasNoRecordOf("ada.plist"));
}

TEST_F(DataDirectoryTest, KnowsOfARecordThatWasThere)
{
    writeFile(recordOf("ada.plist"), "a record");
    letTimePass();
    const DataDirectory directory(m_path.c_str());
    EXPECT_FALSE(directory.hasNoRecordOf("ada.plist"));
    EXPECT_TRUE(directory.hasNoRecordOf("grace.plist"));
}

TEST_F(DataDirectoryTest, IsNotSureOnceANameHasComeOrGone)
{
    letTimePass();
    const DataDirectory beforeOneCame(m_path.c_str());
    writeFile(recordOf("ada.plist"), "a record");
    EXPECT_FALSE(beforeOneCame.hasNoRecordOf("ada.plist"));
    letTimePass();
    const DataDirectory beforeOneWent(m_path.c_str());
    std::filesystem::remove(recordOf("ada.plist"));
    EXPECT_FALSE(beforeOneWent.hasNoRecordOf("grace.plist"));
}

TEST_F(DataDirectoryTest, IsNotSureWhereTheClockCouldNotTell)
{
    // A name that comes within the tick of an earlier one leaves the directory's time as it is. A busy machine may let the
    // tick pass before the listing.
    for (int attempt = 0; attempt < 1000; ++attempt) {
        put(std::to_string(attempt) + ".plist");
        const DataDirectory directory(m_path.c_str());
        const bool isSure = directory.hasNoRecordOf("ada.plist");
        if (age() <= kLongestTick) {
            EXPECT_FALSE(isSure);
            return;
        }
    }
    FAIL() << "the directory was never listed within a tick";
}

TEST(DataDirectoryTimes, TellOfAChangeOnlyOnceTheTickHasPassed)
{
    const timespec changed{100, 500'000'000};
    EXPECT_FALSE(wouldChangeTell(changed, {100, 500'000'000}));
    EXPECT_FALSE(wouldChangeTell(changed, {100, 510'000'000}));
    EXPECT_TRUE(wouldChangeTell(changed, {100, 510'000'001}));
    EXPECT_TRUE(wouldChangeTell(changed, {101, 0}));
}

TEST(DataDirectoryTimes, TellNothingWhereTheClockWasSetBack)
{
    EXPECT_FALSE(wouldChangeTell({100, 500'000'000}, {99, 900'000'000}));
}

TEST(DataDirectoryTimes, TellNothingWhereTheyHaveWholeSecondsOnly)
{
    EXPECT_FALSE(wouldChangeTell({100, 0}, {100, 900'000'000}));
    EXPECT_FALSE(wouldChangeTell({100, 0}, {200, 0}));
}

TEST_F(DataDirectoryTest, AFoundFileThatWasTornSinceTheListingIsReadWhole)
{
    letTimePass();
    const DataDirectory directory(m_path.c_str());
    FoundFile found = FoundFile::open(directory, "ada.plist");
    const std::string path = m_path + "/ada.plist";
    struct stat status {};
    ASSERT_EQ(stat(path.c_str(), &status), 0);
    writeFile(recordOf("ada.plist"), encodeRedoRecord({status.st_ino, "contents", "CONTENTS"}));
    writeFile(path, "CONTents");
    FileContents contents;
    EXPECT_EQ(readDataFile(path.c_str(), contents, status.st_size, std::move(found)), FileRead::Done);
    EXPECT_EQ(contents.view(), "CONTENTS");
}

}  // namespace
