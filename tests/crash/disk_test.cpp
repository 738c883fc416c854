// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The model of a disk itself: which states a power cut may leave and which not, and that a careless writer is caught.

#include "tests/crash/disk.h"

#include <cstdio>
#include <cstdlib>
#include <fcntl.h>
#include <gtest/gtest.h>
#include <memory>
#include <set>
#include <sys/stat.h>
#include <unistd.h>

#include "tests/crash/recorder.h"
#include "tests/support/process.h"

namespace kavell::test {

namespace {

using Kind = DiskOperation::Kind;
using Texts = std::set<std::string>;

constexpr Node kFile = 1, kOther = 2;

std::string sectors(std::string_view letters)
{
    std::string text;
    for (const char letter : letters)
        text += std::string(Disk::kSector, letter == '0' ? '\0' : letter);
    return text;
}

DiskState withFile(const std::string &contents)
{
    DiskState state;
    state.files["file"] = {kFile, contents, 0600};
    return state;
}

DiskOperation writing(size_t offset, std::string bytes)
{
    return {.kind = Kind::Write, .node = kFile, .offset = offset, .bytes = std::move(bytes)};
}

/// All that may stand in a file; "(none)" where it is not there.
Texts contentsOf(const Disk &disk, const std::string &path = "file")
{
    Texts texts;
    std::mt19937_64 random(1);
    disk.forEachState(100000, random, [&](const DiskState &state) {
        const auto file = state.files.find(path);
        texts.insert(file == state.files.end() ? "(none)" : file->second.contents);
    });
    return texts;
}

/// Every set of names that may stand in the directory.
Texts namesIn(const Disk &disk)
{
    Texts all;
    std::mt19937_64 random(1);
    disk.forEachState(100000, random, [&](const DiskState &state) {
        std::string names;
        for (const auto &[path, file] : state.files)
            names += path + " ";
        all.insert(names);
    });
    return all;
}

TEST(DiskTest, AWriteIsThereOrNotSectorBySector)
{
    Disk disk(withFile(sectors("aaa")));
    disk.apply(writing(512, sectors("bb")));
    EXPECT_EQ(contentsOf(disk), (Texts{sectors("aaa"), sectors("aba"), sectors("aab"), sectors("abb")}));
}

TEST(DiskTest, ASyncMakesItCertain)
{
    for (const Kind kind : {Kind::SyncFile, Kind::SyncData}) {
        Disk disk(withFile(sectors("aa")));
        disk.apply(writing(0, sectors("bbb")));
        disk.apply({.kind = kind, .node = kFile});
        EXPECT_EQ(contentsOf(disk), Texts{sectors("bbb")});
    }
}

TEST(DiskTest, AnotherFilesSyncDoesNot)
{
    Disk disk(withFile(sectors("a")));
    disk.apply({.kind = Kind::MakeFile, .node = kOther, .name = "other", .mode = 0600});
    disk.apply(writing(0, sectors("b")));
    disk.apply({.kind = Kind::SyncFile, .node = kOther});
    EXPECT_EQ(contentsOf(disk), (Texts{sectors("a"), sectors("b")}));
}

TEST(DiskTest, TwoWritesOfASectorLeaveAnyVersion)
{
    Disk disk(withFile(sectors("a")));
    disk.apply(writing(0, sectors("b")));
    disk.apply(writing(0, sectors("c")));
    EXPECT_EQ(contentsOf(disk), (Texts{sectors("a"), sectors("b"), sectors("c")}));
}

TEST(DiskTest, AGrowingFileMayHaveItsSizeWithoutItsBytes)
{
    Disk disk(withFile(sectors("a")));
    disk.apply(writing(512, sectors("bb")));
    EXPECT_EQ(contentsOf(disk), (Texts{sectors("a"), sectors("a0"), sectors("ab"), sectors("a00"), sectors("ab0"),
                                       sectors("a0b"), sectors("abb")}));
}

TEST(DiskTest, AShrinkingFileMayHaveLostItsEndBeforeItIsShorter)
{
    Disk disk(withFile(sectors("ab")));
    disk.apply({.kind = Kind::Resize, .node = kFile, .offset = 512});
    EXPECT_EQ(contentsOf(disk), (Texts{sectors("ab"), sectors("a0"), sectors("a")}));
}

TEST(DiskTest, PermissionsWaitForASyncOfTheWholeFile)
{
    Disk disk(withFile("a"));
    disk.apply({.kind = Kind::ChangeMode, .node = kFile, .mode = 0644});
    std::mt19937_64 random(1);
    const auto modesOf = [&] {
        std::set<mode_t> modes;
        disk.forEachState(10, random, [&](const DiskState &state) { modes.insert(state.files.at("file").mode); });
        return modes;
    };
    disk.apply({.kind = Kind::SyncData, .node = kFile});
    EXPECT_EQ(modesOf(), (std::set<mode_t>{0600, 0644}));
    disk.apply({.kind = Kind::SyncFile, .node = kFile});
    EXPECT_EQ(modesOf(), (std::set<mode_t>{0644}));
}

TEST(DiskTest, NamesComeAndGoInAnyOrderUntilTheirDirectoryIsSynced)
{
    Disk disk(withFile("a"));
    disk.apply({.kind = Kind::MakeFile, .node = kOther, .name = "other", .mode = 0600});
    disk.apply({.kind = Kind::RemoveName, .node = kFile, .name = "file"});
    EXPECT_EQ(namesIn(disk), (Texts{"file ", "file other ", "", "other "}));
    disk.apply({.kind = Kind::SyncFile, .node = kOther});
    EXPECT_EQ(namesIn(disk), (Texts{"file ", "file other ", "", "other "}));
    disk.apply({.kind = Kind::SyncDirectory});
    EXPECT_EQ(namesIn(disk), Texts{"other "});
}

TEST(DiskTest, ARenameHappensAsAWhole)
{
    Disk disk(withFile("a"));
    disk.apply({.kind = Kind::Rename, .node = kFile, .name = "file", .newName = "new"});
    EXPECT_EQ(namesIn(disk), (Texts{"file ", "new "}));
}

TEST(DiskTest, WhatStandsInADirectoryIsThereOnlyIfTheDirectoryIs)
{
    Disk disk(DiskState{});
    disk.apply({.kind = Kind::MakeDirectory, .name = "directory"});
    disk.apply({.kind = Kind::MakeFile, .node = kFile, .directory = "directory", .name = "file", .mode = 0600});
    disk.apply({.kind = Kind::SyncDirectory, .directory = "directory"});
    EXPECT_EQ(namesIn(disk), (Texts{"", "directory/file "}));
    disk.apply({.kind = Kind::SyncDirectory});
    EXPECT_EQ(namesIn(disk), Texts{"directory/file "});
}

TEST(DiskTest, TooManyStatesArePickedAtRandomBetweenTheExtremes)
{
    Disk disk(withFile(sectors(std::string(64, 'a'))));
    disk.apply(writing(0, sectors(std::string(64, 'b'))));
    Texts texts;
    std::mt19937_64 random(1);
    disk.forEachState(50, random, [&](const DiskState &state) { texts.insert(state.files.at("file").contents); });
    EXPECT_TRUE(texts.contains(sectors(std::string(64, 'a'))));
    EXPECT_TRUE(texts.contains(sectors(std::string(64, 'b'))));
    EXPECT_TRUE(texts.contains(sectors(std::string(32, 'a') + std::string(32, 'b'))));
    EXPECT_TRUE(texts.contains(sectors(std::string(32, 'a') + "b" + std::string(31, 'a'))));
    EXPECT_GT(texts.size(), 150u);
}

/// Real calls in a scratch directory.
class Writer : public testing::Test {
protected:
    Writer()
    {
        const std::string scratch = std::string(std::getenv("TMPDIR")) + "/writer";
        m_watched = std::make_unique<WatchedDirectory>(scratch + "/files", scratch + "/anchors");
        writeFile(path("file"), "before");
        m_start = m_watched->look();
    }

    [[nodiscard]] std::string path(const std::string &name) const { return m_watched->path() + "/" + name; }

    /// All that may stand in the file after what `write` does.
    Texts contentsAfter(const std::function<void()> &write)
    {
        Recorder recorder(*m_watched);
        {
            const Observation observation(recorder);
            write();
        }
        Disk disk(m_start);
        for (const DiskOperation &operation : recorder.operations())
            disk.apply(operation);
        EXPECT_EQ(disk.latest(), m_watched->look());
        return contentsOf(disk);
    }

    /// Replaces the file by another one, carefully or not.
    void replace(bool isSynced) const
    {
        const FileDescriptor file(open(path("new").c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, 0600));
        EXPECT_EQ(write(file.get(), "after", 5), 5);
        EXPECT_EQ(isSynced ? fsync(file.get()) : 0, 0);
        EXPECT_EQ(std::rename(path("new").c_str(), path("file").c_str()), 0);
    }

    std::unique_ptr<WatchedDirectory> m_watched;
    DiskState m_start;
};

TEST_F(Writer, WhoRenamesWithoutASyncMayLoseBoth)
{
    EXPECT_EQ(contentsAfter([this] { replace(false); }), (Texts{"before", "", std::string(5, '\0'), "after"}));
}

TEST_F(Writer, WhoSyncsBeforeTheRenameHasOneOfThem)
{
    EXPECT_EQ(contentsAfter([this] { replace(true); }), (Texts{"before", "after"}));
}

TEST_F(Writer, WhoSyncsTheDirectoryTooHasTheLaterOne)
{
    const Texts found = contentsAfter([this] {
        replace(true);
        EXPECT_TRUE(syncDirectoryOf(path("file").c_str()));
    });
    EXPECT_EQ(found, Texts{"after"});
}

TEST_F(Writer, StatesAreMadeOnTheSameInodes)
{
    struct stat before {
    }, after{};
    ASSERT_EQ(stat(path("file").c_str(), &before), 0);
    m_watched->make(DiskState{});
    EXPECT_NE(stat(path("file").c_str(), &after), 0);
    m_watched->make(m_start);
    ASSERT_EQ(stat(path("file").c_str(), &after), 0);
    EXPECT_EQ(after.st_ino, before.st_ino);
    EXPECT_EQ(readFile(path("file")), "before");
}

}  // namespace

}  // namespace kavell::test
