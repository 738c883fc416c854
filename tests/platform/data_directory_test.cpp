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
#include <vector>

#include "platform/data_file.h"
#include "platform/redo_record.h"
#include "tests/support/directory_time.h"
#include "tests/support/process.h"

using namespace kavell;
using namespace kavell::test;

namespace {

using Names = std::vector<std::string>;

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

    void letTimePass() const { test::letTimePass(m_path); }

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
    EXPECT_FALSE(directory.hadNoRecordOf("ada.plist"));
    EXPECT_TRUE(directory.isAsListed());
}

TEST_F(DataDirectoryTest, KnowsThatAFileHadNoRecord)
{
    letTimePass();
    const DataDirectory directory(m_path.c_str());
    EXPECT_TRUE(directory.hadNoRecordOf("ada.plist"));
    EXPECT_TRUE(directory.isAsListed());
}

TEST_F(DataDirectoryTest, KnowsOfARecordThatWasThere)
{
    writeFile(recordOf("ada.plist"), "a record");
    letTimePass();
    const DataDirectory directory(m_path.c_str());
    EXPECT_FALSE(directory.hadNoRecordOf("ada.plist"));
    EXPECT_TRUE(directory.hadNoRecordOf("grace.plist"));
}

TEST_F(DataDirectoryTest, IsNotAsListedOnceANameHasComeOrGone)
{
    letTimePass();
    const DataDirectory beforeOneCame(m_path.c_str());
    writeFile(recordOf("ada.plist"), "a record");
    EXPECT_FALSE(beforeOneCame.isAsListed());
    letTimePass();
    const DataDirectory beforeOneWent(m_path.c_str());
    std::filesystem::remove(recordOf("ada.plist"));
    EXPECT_FALSE(beforeOneWent.isAsListed());
}

TEST_F(DataDirectoryTest, IsAsListedWhileTheContentsOfItsFilesChange)
{
    letTimePass();
    const DataDirectory directory(m_path.c_str());
    put("ada.plist");
    EXPECT_TRUE(directory.isAsListed());
}

TEST_F(DataDirectoryTest, IsSureOfNothingOnceItsListingIsDoubted)
{
    letTimePass();
    DataDirectory directory(m_path.c_str());
    directory.doubtListing();
    EXPECT_FALSE(directory.hadNoRecordOf("ada.plist"));
    // Nothing was taken on trust.
    writeFile(recordOf("ada.plist"), "a record");
    EXPECT_TRUE(directory.isAsListed());
}

TEST_F(DataDirectoryTest, IsNotSureWhereTheClockCouldNotTell)
{
    // A name that comes within the tick of an earlier one leaves the directory's time as it is. A busy machine may let the
    // tick pass before the listing.
    for (int attempt = 0; attempt < 1000; ++attempt) {
        put(std::to_string(attempt) + ".plist");
        const DataDirectory directory(m_path.c_str());
        const bool isSure = directory.hadNoRecordOf("ada.plist");
        if (ageOfDirectory(m_path) <= kLongestTick) {
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

TEST_F(DataDirectoryTest, AFoundFileWhoseRecordWasListedIsReadWhole)
{
    const std::string path = m_path + "/ada.plist";
    struct stat status {};
    ASSERT_EQ(stat(path.c_str(), &status), 0);
    writeFile(recordOf("ada.plist"), encodeRedoRecord({status.st_ino, "contents", "CONTENTS"}));
    writeFile(path, "CONTents");
    letTimePass();
    const DataDirectory directory(m_path.c_str());
    FileContents contents;
    EXPECT_EQ(readDataFile(path.c_str(), contents, status.st_size, FoundFile::open(directory, "ada.plist")),
              FileRead::Done);
    EXPECT_EQ(contents.view(), "CONTENTS");
}

}  // namespace
