// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What a survey says of each bundle and directory.

#include <kavellaccounts/KAPluginManager.h>

#include <gmock/gmock.h>

#include "tests/plugins/loading_fixture.h"

namespace {

using kavell::test::Loading;
using Report = KAPluginManager::BundleReport;
using Outcome = Report::Outcome;

class Surveying : public Loading {
protected:
    void SetUp() override { search(directory("a")); }

    [[nodiscard]] QString place(const QString &name) const { return scratch.filePath("a/" + name); }

    /// What is said of a path; of the outcome Registered and without a path when nothing is.
    Report reportOf(const QString &path)
    {
        for (const Report &report : manager.surveyBundles()) {
            if (report.path == path)
                return report;
        }
        ADD_FAILURE() << "nothing is said of " << path.toStdString();
        return {};
    }
};

TEST_F(Surveying, BundleThatIsInOrderIsRegistered)
{
    makeBundle(place("Working.kaplugin"), entries("working"));
    const Report report = reportOf(place("Working.kaplugin"));
    EXPECT_EQ(report.outcome, Outcome::Registered);
    EXPECT_EQ(report.identifier, "working");
    EXPECT_TRUE(report.reason.isNull());
    EXPECT_TRUE(manager.pluginWithIdentifier("working"));
    EXPECT_EQ(reportOf(place("Working.kaplugin")).outcome, Outcome::Registered);
}

TEST_F(Surveying, LaterBundleOfAnIdentifierIsShadowedByTheFirst)
{
    makeBundle(place("First.kaplugin"), entries("working"));
    makeBundle(directory("b") + "/Second.kaplugin", entries("working"));
    search(scratch.filePath("a") + ':' + scratch.filePath("b"));
    const Report report = reportOf(scratch.filePath("b/Second.kaplugin"));
    EXPECT_EQ(report.outcome, Outcome::Shadowed);
    EXPECT_EQ(report.identifier, "working");
    EXPECT_EQ(report.reason, place("First.kaplugin") + " came first.");
}

TEST_F(Surveying, ExtensionInOtherLettersIsTold)
{
    makeBundle(place("Loud.KAPLUGIN"), entries("loud"));
    EXPECT_EQ(reportOf(place("Loud.KAPLUGIN")).outcome, Outcome::WrongExtension);
    EXPECT_FALSE(manager.pluginWithIdentifier("loud"));
}

TEST_F(Surveying, WhatIsNoPluginIsNotTold)
{
    kavell::test::writeFile(place("readme.txt").toStdString(), "text");
    for (const Report &report : manager.surveyBundles())
        EXPECT_NE(report.path, place("readme.txt"));
}

TEST_F(Surveying, BundleWithoutInformationIsNone)
{
    QDir().mkpath(place("Empty.kaplugin"));
    EXPECT_EQ(reportOf(place("Empty.kaplugin")).outcome, Outcome::NoBundle);
    EXPECT_TRUE(reportOf(place("Empty.kaplugin")).identifier.isNull());
}

TEST_F(Surveying, BundleWithoutIdentifierIsTold)
{
    makeBundle(place("Nameless.kaplugin"), "<key>KAPluginVersion</key><integer>1</integer>");
    EXPECT_EQ(reportOf(place("Nameless.kaplugin")).outcome, Outcome::NoIdentifier);
}

TEST_F(Surveying, UnsupportedVersionIsTold)
{
    makeBundle(place("Old.kaplugin"), entries("old", "Working", "<integer>-2</integer>"));
    const Report report = reportOf(place("Old.kaplugin"));
    EXPECT_EQ(report.outcome, Outcome::UnsupportedVersion);
    EXPECT_EQ(report.identifier, "old");
    EXPECT_EQ(report.reason, "KAPluginVersion is -2; at least 1 is needed.");
}

TEST_F(Surveying, CodeThatDoesNotLoadIsToldWithTheLoadersReason)
{
    makeBundle(place("Lost.kaplugin"), entries("lost"), "libNoSuchFile.so");
    const Report report = reportOf(place("Lost.kaplugin"));
    EXPECT_EQ(report.outcome, Outcome::NotLoaded);
    EXPECT_TRUE(report.reason.contains("libNoSuchFile.so"));
}

TEST_F(Surveying, CodeWithoutThePrincipalClassMakesNoObject)
{
    makeBundle(place("Unknown.kaplugin"), entries("unknown", "NobodysClass"));
    EXPECT_EQ(reportOf(place("Unknown.kaplugin")).outcome, Outcome::NoObject);
}

TEST_F(Surveying, BundleThatThrowsIsToldWithWhatItThrew)
{
    makeBundle(place("Throwing.kaplugin"), entries("throwing", "ThrowingInFactory"));
    const Report report = reportOf(place("Throwing.kaplugin"));
    EXPECT_EQ(report.outcome, Outcome::Threw);
    EXPECT_EQ(report.reason, "It threw: no constructor today. The rest of the directory was given up.");
}

TEST_F(Surveying, MissingDirectoryIsTold)
{
    search("/nowhere/at/all");
    EXPECT_EQ(reportOf("/nowhere/at/all").outcome, Outcome::DirectoryMissing);
}

TEST_F(Surveying, UnsetVariableNamesADirectoryThatIsMissing)
{
    qunsetenv("VESK_FRAMEWORK_PATH");
    EXPECT_EQ(reportOf("(null)").outcome, Outcome::DirectoryMissing);
}

TEST_F(Surveying, DirectoryWhosePathIsNoUrlPathIsTold)
{
    search(directory("with blank"));
    const Report report = reportOf(scratch.filePath("with blank"));
    EXPECT_EQ(report.outcome, Outcome::DirectoryNotListed);
    EXPECT_EQ(report.reason, "Its path has a character that a URL does not allow, such as a blank.");
}

TEST_F(Surveying, FileInPlaceOfADirectoryCannotBeListed)
{
    kavell::test::writeFile(scratch.filePath("file").toStdString(), "no directory");
    search(scratch.filePath("file"));
    EXPECT_EQ(reportOf(scratch.filePath("file")).outcome, Outcome::DirectoryNotListed);
}

TEST_F(Surveying, TellsDirectoriesInTheOrderOfTheSearchTheSystemsLast)
{
    search("/nowhere/b:/nowhere/a");
    QStringList paths;
    for (const Report &report : manager.surveyBundles())
        paths += report.path;
    ASSERT_GE(paths.size(), 3);
    EXPECT_EQ(paths[0], "/nowhere/b");
    EXPECT_EQ(paths[1], "/nowhere/a");
    EXPECT_TRUE(paths[2].startsWith("/System/Library/KavellAccounts"));
}

}  // namespace
