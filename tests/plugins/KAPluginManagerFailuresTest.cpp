// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What one bundle that fails costs: itself, the rest of its directory when it throws, and never the program.

#include <kavellaccounts/KAPluginManager.h>

#include <dirent.h>
#include <stdexcept>
#include <thread>

#include <gmock/gmock.h>

#include <kavellaccounts/KABundle.h>
#include <kavellaccounts/KADataPlugin.h>

#include "plugins/KAPluginManager_p.h"
#include "tests/plugins/loading_fixture.h"

namespace {

using kavell::test::kBundles;
using kavell::test::kExampleID;
using kavell::test::Loading;
using testing::ElementsAre;
using testing::IsEmpty;

class Failing : public Loading {
protected:
    void SetUp() override { search(directory("a")); }

    [[nodiscard]] QString place(const QString &name) const { return scratch.filePath("a/" + name + ".kaplugin"); }
};

/// The names in a directory in its own order, which is the order of loading.
QStringList ownOrder(const QString &path)
{
    QStringList names;
    DIR *const directory = opendir(qUtf8Printable(path));
    while (const dirent *entry = readdir(directory)) {
        if (entry->d_name[0] != '.')
            names += QString::fromUtf8(entry->d_name);
    }
    closedir(directory);
    return names;
}

TEST_F(Failing, BundleWithoutReadableInformationIsSkippedSilently)
{
    kavell::test::writeFile((place("Broken") + "/Contents/Info.plist").toStdString(), "<plist><dict><key>broken");
    QDir().mkpath(place("Empty"));
    kavell::test::writeFile(place("File").toStdString(), "no directory");
    makeBundle(place("Working"), entries("working"));
    EXPECT_THAT(identifiers(), ElementsAre("working"));
    EXPECT_THAT(log.messages(), IsEmpty());
}

TEST_F(Failing, BundleWithoutIdentifierIsSkippedSilently)
{
    makeBundle(place("Nameless"), "<key>KAPluginVersion</key><integer>1</integer>");
    makeBundle(place("Working"), entries("working"));
    EXPECT_THAT(identifiers(), ElementsAre("working"));
    EXPECT_THAT(log.messages(), IsEmpty());
}

TEST_F(Failing, BundleWithoutItsLibraryIsLoggedAndSkipped)
{
    makeBundle(place("Lost"), entries("lost"), "libNoSuchFile.so");
    makeBundle(place("Working"), entries("working"));
    EXPECT_THAT(identifiers(), ElementsAre("working"));
    const QStringList messages = log.messages();
    ASSERT_EQ(messages.size(), 3);
    const QString prefix = "*** dlerror: ";
    ASSERT_TRUE(messages[1].startsWith(prefix));
    const QString reason = messages[1].mid(prefix.size());
    EXPECT_TRUE(reason.contains("libNoSuchFile.so"));
    EXPECT_EQ(messages[0], "*** Loading bundle at path " + place("Lost") + " failed with error: " + reason +
                               "\n{KALocalizedDescription = " + reason + ";}");
    EXPECT_EQ(messages[2], "*** Loading bundle at path " + place("Lost") + " failed");
}

TEST_F(Failing, BundleWhosePrincipalClassIsMissingOrUnknownIsLoggedAndSkipped)
{
    makeBundle(place("Unknown"), entries("unknown", "NobodysClass"));
    makeBundle(place("Working"), entries("working"));
    EXPECT_THAT(identifiers(), ElementsAre("working"));
    EXPECT_THAT(log.messages(), ElementsAre("*** Loading bundle at path " + place("Unknown") + " failed"));
}

TEST_F(Failing, MissingVersionReadsAsNought)
{
    makeBundle(place("Old"), "<key>KABundleIdentifier</key><string>old</string>");
    EXPECT_THAT(identifiers(), IsEmpty());
    EXPECT_THAT(log.messages(),
                ElementsAre("*** Unsupported plugin version: " + place("Old") + ". Min version: 1. Found version: 0"));
}

TEST_F(Failing, VersionWithAFractionCountsWithoutIt)
{
    makeBundle(place("Almost"), entries("almost", "Working", "<real>0.9</real>"));
    makeBundle(place("More"), entries("more", "Working", "<real>1.9</real>"));
    EXPECT_THAT(identifiers(), ElementsAre("more"));
    EXPECT_THAT(log.messages(), ElementsAre("*** Unsupported plugin version: " + place("Almost") +
                                            ". Min version: 1. Found version: 0"));
}

TEST_F(Failing, BundleThatThrowsCostsWhatComesAfterItInItsDirectory)
{
    for (const char *name : {"a", "b", "c"})
        QDir().mkpath(place(name));
    const QStringList order = ownOrder(scratch.filePath("a"));
    ASSERT_EQ(order.size(), 3);
    makeBundle(scratch.filePath("a/" + order[0]), entries("before"));
    makeBundle(scratch.filePath("a/" + order[1]), entries("throwing", "ThrowingInFactory"));
    makeBundle(scratch.filePath("a/" + order[2]), entries("after"));
    search(scratch.filePath("a") + ':' + kBundles + "/good");
    EXPECT_THAT(identifiers(), ElementsAre("before", kExampleID));
    EXPECT_THAT(log.messages(), ElementsAre("*** Caught exception while loading plugin at path " +
                                            scratch.filePath("a") + ":no constructor today"));
}

TEST_F(Failing, BundleThatFailsCostsNothingThatComesAfterIt)
{
    for (const char *name : {"a", "b", "c"})
        QDir().mkpath(place(name));
    const QStringList order = ownOrder(scratch.filePath("a"));
    ASSERT_EQ(order.size(), 3);
    makeBundle(scratch.filePath("a/" + order[0]), entries("nothing", "AnsweringNull"));
    makeBundle(scratch.filePath("a/" + order[1]), entries("lost"), "libNoSuchFile.so");
    makeBundle(scratch.filePath("a/" + order[2]), entries("after"));
    EXPECT_THAT(identifiers(), ElementsAre("after"));
}

TEST_F(Failing, PluginThatThrewIsTriedAgainByTheNextQuestion)
{
    makeBundle(place("Throwing"), entries("throwing", "ThrowingInDidLoad"));
    EXPECT_THAT(identifiers(), IsEmpty());
    EXPECT_THAT(identifiers(), IsEmpty());
    EXPECT_EQ(log.messages().size(), 2);
}

TEST_F(Failing, WhatEscapesTheWholeLoadIsLoggedAndTheLockIsFree)
{
    struct Escaping : KAPluginManager {
        void _loadPlugins(const std::optional<QStringList> &) override { throw std::runtime_error("out of the blue"); }
    } escaping;
    EXPECT_THAT(escaping.allPlugins(), IsEmpty());
    EXPECT_THAT(log.messages(),
                ElementsAre("*** (In -[KAPluginManager loadPlugins:]) Caught exception out of the blue"));
    bool answered = false;
    std::thread([&] { answered = escaping.allPlugins().isEmpty(); }).join();  // would hang on a lock that is held
    EXPECT_TRUE(answered);
}

TEST_F(Failing, PluginMadeOutsideTheRegistryMustHaveIdentifierVersionAndCode)
{
    makeBundle(place("Nameless"), "<key>KAPluginVersion</key><integer>1</integer>");
    EXPECT_FALSE(manager.createKAPluginAtPath(place("Nameless")));
    EXPECT_THAT(log.messages(), IsEmpty());
    makeBundle(place("Old"), entries("old", "Working", "<integer>0</integer>"));
    EXPECT_FALSE(manager.createKAPluginAtPath(place("Old")));
    EXPECT_THAT(log.messages(),
                ElementsAre("*** Unsupported plugin version: " + place("Old") + ". Min version: 1. Found version: 0"));
    makeBundle(place("Unknown"), entries("unknown", "NobodysClass"));
    EXPECT_FALSE(manager.createKAPluginAtPath(place("Unknown")));
    EXPECT_EQ(log.messages().size(), 1);
}

TEST_F(Failing, PluginMadeOutsideTheRegistryWhoseCodeIsMissingIsLoggedWithItsReasonsOnly)
{
    makeBundle(place("Lost"), entries("lost"), "libNoSuchFile.so");
    EXPECT_FALSE(manager.createKAPluginAtPath(place("Lost")));
    const QStringList messages = log.messages();
    ASSERT_EQ(messages.size(), 2);
    EXPECT_TRUE(messages[0].startsWith("*** Loading bundle at path " + place("Lost") + " failed with error: "));
    EXPECT_TRUE(messages[1].startsWith("*** dlerror: "));
}

TEST_F(Failing, ADirectoryWrittenWithASlashAtItsEndNamesItsBundlesWithOne)
{
    makeBundle(place("Old"), entries("old", "Working", "<integer>0</integer>"));
    makeBundle(place("Working"), entries("working"));
    search(scratch.filePath("a") + '/');
    EXPECT_THAT(identifiers(), ElementsAre("working"));
    EXPECT_THAT(log.messages(),
                ElementsAre("*** Unsupported plugin version: " + place("Old") + ". Min version: 1. Found version: 0"));
    for (const auto &report : manager.surveyBundles()) {
        if (report.identifier == "working") {
            EXPECT_EQ(report.outcome, KAPluginManager::BundleReport::Outcome::Registered);
        }
    }
}

TEST_F(Failing, NullPathIsLoggedAsNone)
{
    EXPECT_FALSE(manager.createKAPluginAtPath({}));
    EXPECT_THAT(log.messages(), ElementsAre("*** KAPluginManager couldn't create bundle from path: (null)"));
}

/// Bundles whose plug-in asks the shared registry while it is being made or told.
class Asking : public Failing {
protected:
    Asking()
    {
        delete gSharedKAPluginManager;
        gSharedKAPluginManager = &manager;
    }
    ~Asking() override { gSharedKAPluginManager = nullptr; }
};

TEST_F(Asking, PluginThatAsksTheRegistryWhenToldFindsTheOthersAndNotItself)
{
    makeBundle(place("Asking"), entries("asking", "AskingInDidLoad"));
    makeBundle(place("Working"), entries("working"));
    EXPECT_THAT(identifiers(), ElementsAre("asking", "working"));
    const KAPlugin *const asking = manager.pluginWithIdentifier("asking");
    EXPECT_THAT(asking->property("found").toStringList(), ElementsAre("working"));
    EXPECT_EQ(asking->property("toldCount").toInt(), 1);
    EXPECT_THAT(log.messages(), IsEmpty());
}

}  // namespace
