// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Where plug-ins are looked for, and when.

#include <kavellaccounts/KAPluginManager.h>

#include <array>
#include <stdexcept>
#include <sys/inotify.h>
#include <unistd.h>

#include <QtCore/QDir>
#include <gmock/gmock.h>

#include <kavellaccounts/KABundle.h>

#include "tests/plugins/loading_fixture.h"

namespace {

using kavell::test::kExampleID;
using kavell::test::Loading;
using testing::ElementsAre;
using testing::IsEmpty;

/// Tells whether a directory was opened, and so listed, since the last question.
class OpenWatch {
public:
    explicit OpenWatch(const QString &path)
    {
        if (inotify_add_watch(m_descriptor, qUtf8Printable(path), IN_OPEN | IN_ONLYDIR) < 0)
            throw std::runtime_error("cannot watch the directory");
    }
    ~OpenWatch() { close(m_descriptor); }
    OpenWatch(const OpenWatch &) = delete;
    OpenWatch &operator=(const OpenWatch &) = delete;

    bool wasOpened()
    {
        // Each event of the directory itself is told before the call that caused it returns.
        std::array<char, 4096> events{};
        return read(m_descriptor, events.data(), events.size()) > 0;
    }

private:
    const int m_descriptor = inotify_init1(IN_NONBLOCK | IN_CLOEXEC);
};

class Searching : public Loading {
protected:
    /// Whether the example plug-in is found in the directory `holder` when the variable names the directory `named`.
    bool finds(const QString &holder, const QString &named)
    {
        const QString place = directory(holder) + "/ExampleList.kaplugin";
        if (!QFile::exists(place))
            link("good/ExampleList.kaplugin", place);
        search(scratch.filePath(named));
        KAPluginManager fresh;
        return fresh.pluginWithIdentifier(kExampleID) != nullptr;
    }
};

TEST_F(Searching, WithoutTheVariableNothingOfTheWorkingDirectoryIsLoaded)
{
    link("good/ExampleList.kaplugin", directory("(null)") + "/ExampleList.kaplugin");
    const QString before = QDir::currentPath();
    ASSERT_TRUE(QDir::setCurrent(scratch.path()));
    unsetenv("VESK_FRAMEWORK_PATH");
    KAPluginManager fresh;
    EXPECT_FALSE(fresh.pluginWithIdentifier(kExampleID));
    QDir::setCurrent(before);
}

TEST_F(Searching, PercentEscapesNameTheDecodedDirectory)
{
    directory("x%41");
    EXPECT_TRUE(finds("xA", "x%41"));
}

TEST_F(Searching, DirectoryWhoseNameLooksLikeAnEscapeIsNotTheOneListed)
{
    EXPECT_FALSE(finds("x%41", "x%41"));
}

TEST_F(Searching, AnEscapedDirectoryIsSkippedWhenNothingIsAtThePathAsItStands)
{
    EXPECT_FALSE(finds("xA", "x%41"));
}

TEST_F(Searching, DirectoryWithAPercentSignThatIsNoEscapeListsNothing)
{
    EXPECT_FALSE(finds("x%zz", "x%zz"));
    EXPECT_FALSE(finds("x%4", "x%4"));
}

TEST_F(Searching, QuestionMarkAndNumberSignEndThePath)
{
    directory("plain?query");
    directory("plain#fragment");
    EXPECT_TRUE(finds("plain", "plain?query"));
    EXPECT_TRUE(finds("plain", "plain#fragment"));
    EXPECT_FALSE(finds("other?query", "other?query"));
}

TEST_F(Searching, DirectoryWithACharacterThatAUrlDoesNotAllowListsNothing)
{
    for (const char *name : {"with blank", "h\xc3\xa4user", "<angle>", "[bracket]", "quote\"", "back\\slash", "a^b"})
        EXPECT_FALSE(finds(QString::fromUtf8(name), QString::fromUtf8(name))) << name;
}

TEST_F(Searching, DirectoryWithTheOddCharactersThatAUrlAllowsIsListed)
{
    EXPECT_TRUE(finds("a-._~!$&'()*+,;=@b", "a-._~!$&'()*+,;=@b"));
}

TEST_F(Searching, EmptyAndMissingPiecesOfTheVariableAreSkipped)
{
    link("good/ExampleList.kaplugin", directory("a") + "/ExampleList.kaplugin");
    search("::/nowhere/at/all:" + scratch.filePath("a") + ':');
    EXPECT_THAT(identifiers(), ElementsAre(kExampleID));
    EXPECT_THAT(log.messages(), IsEmpty());
}

TEST_F(Searching, FileInPlaceOfADirectoryListsNothing)
{
    kavell::test::writeFile(scratch.filePath("file").toStdString(), "no directory");
    search(scratch.filePath("file"));
    EXPECT_THAT(identifiers(), IsEmpty());
    EXPECT_THAT(log.messages(), IsEmpty());
}

TEST_F(Searching, DirectoriesAreSearchedInTheirOrder)
{
    const QString a = directory("a");
    const QString b = directory("b");
    makeBundle(a + "/One.kaplugin", entries("one", "Working", "<integer>0</integer>"));
    makeBundle(b + "/Two.kaplugin", entries("two", "Working", "<integer>0</integer>"));
    search(b + ':' + a);
    manager.loadPlugins(std::nullopt);
    EXPECT_THAT(
        log.messages(),
        ElementsAre("*** Unsupported plugin version: " + b + "/Two.kaplugin. Min version: 1. Found version: 0",
                    "*** Unsupported plugin version: " + a + "/One.kaplugin. Min version: 1. Found version: 0"));
}

TEST_F(Searching, OnlyTheAskedForPluginsAreLoaded)
{
    makeBundle(directory("a") + "/One.kaplugin", entries("one"));
    makeBundle(scratch.filePath("a/Two.kaplugin"), entries("two"));
    makeBundle(scratch.filePath("a/Old.kaplugin"), entries("old", "Working", "<integer>0</integer>"));
    search(scratch.filePath("a"));
    EXPECT_TRUE(manager.pluginWithIdentifier("two"));
    search("");
    EXPECT_THAT(identifiers(), ElementsAre("two"));
    EXPECT_THAT(log.messages(), IsEmpty());
}

TEST_F(Searching, RegisteredPluginIsAnsweredWithoutASearch)
{
    makeBundle(directory("a") + "/One.kaplugin", entries("one"));
    search(scratch.filePath("a"));
    OpenWatch watch(scratch.filePath("a"));
    ASSERT_TRUE(manager.pluginWithIdentifier("one"));
    ASSERT_TRUE(watch.wasOpened());
    EXPECT_TRUE(manager.pluginWithIdentifier("one"));
    manager.loadPlugins(QStringList{"one", "one"});
    manager.loadPlugins(QStringList());
    EXPECT_FALSE(watch.wasOpened());
    manager.loadPlugins(QStringList{"one", "unknown"});
    EXPECT_TRUE(watch.wasOpened());
    (void)manager.allPlugins();
    EXPECT_TRUE(watch.wasOpened());
}

TEST_F(Searching, UnknownIdentifierIsSearchedForEachTime)
{
    search(directory("a"));
    EXPECT_FALSE(manager.pluginWithIdentifier("one"));
    makeBundle(scratch.filePath("a/One.kaplugin"), entries("one"));
    EXPECT_TRUE(manager.pluginWithIdentifier("one"));
}

TEST_F(Searching, RemovedBundleStaysRegistered)
{
    makeBundle(directory("a") + "/One.kaplugin", entries("one"));
    search(scratch.filePath("a"));
    KAPlugin *const plugin = manager.pluginWithIdentifier("one");
    ASSERT_TRUE(plugin);
    ASSERT_TRUE(QDir(scratch.filePath("a/One.kaplugin")).removeRecursively());
    EXPECT_THAT(manager.allPlugins(), ElementsAre(plugin));
}

TEST_F(Searching, BundleThatIsMendedIsLoadedByTheNextQuestion)
{
    makeBundle(directory("a") + "/One.kaplugin", entries("one", "Working", "<integer>0</integer>"));
    search(scratch.filePath("a"));
    EXPECT_THAT(identifiers(), IsEmpty());
    kavell::test::writeFile(scratch.filePath("a/One.kaplugin/Contents/Info.plist").toStdString(),
                            "<plist version=\"1.0\"><dict><key>KABundleExecutable</key><string>libWorking.so</string>" +
                                entries("one") + "</dict></plist>");
    EXPECT_THAT(identifiers(), ElementsAre("one"));
}

TEST_F(Searching, RegisteredPluginIsNotReplacedByAnEarlierDirectory)
{
    const QString b = directory("b");
    makeBundle(b + "/One.kaplugin", entries("one"));
    search(directory("a") + ':' + b);
    KAPlugin *const plugin = manager.pluginWithIdentifier("one");
    makeBundle(scratch.filePath("a/One.kaplugin"), entries("one"));
    EXPECT_THAT(manager.allPlugins(), ElementsAre(plugin));
    EXPECT_EQ(plugin->bundle()->bundlePath(), b + "/One.kaplugin");
}

}  // namespace
