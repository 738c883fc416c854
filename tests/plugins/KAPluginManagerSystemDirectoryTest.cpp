// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The system's directory of plug-ins, which is searched last. Run below with_system_directory, which puts three bundles
// there: one with the example plug-in's identifier, one of its own, and one of a version that is not supported.

#include <kavellaccounts/KAPluginManager.h>

#include <gmock/gmock.h>

#include <kavellaccounts/KABundle.h>

#include "tests/plugins/loading_fixture.h"

namespace {

using kavell::test::kExampleID;
using kavell::test::Loading;
using testing::ElementsAre;

const QString kSystem = QStringLiteral("/System/Library/KavellAccounts");
const QString kSystemOnlyID = QStringLiteral("com.corvane.systemonly.kaplugin");

QString unsupported(const QString &path)
{
    return "*** Unsupported plugin version: " + path + ". Min version: 1. Found version: 0";
}

class SystemDirectory : public Loading {};

TEST_F(SystemDirectory, IsAllThatIsSearchedWithoutTheVariable)
{
    qunsetenv("VESK_FRAMEWORK_PATH");
    EXPECT_THAT(identifiers(), ElementsAre(kExampleID, kSystemOnlyID));
    EXPECT_EQ(manager.pluginWithIdentifier(kExampleID)->bundle()->bundlePath(), kSystem + "/SystemExample.kaplugin");
    EXPECT_THAT(log.messages(), testing::Each(unsupported(kSystem + "/SystemOld.kaplugin")));
}

TEST_F(SystemDirectory, GivesWayToADevelopmentCopyOfTheSameIdentifier)
{
    makeBundle(directory("a") + "/Copy.kaplugin", entries(kExampleID.toStdString()));
    search(scratch.filePath("a"));
    EXPECT_THAT(identifiers(), ElementsAre(kExampleID, kSystemOnlyID));
    EXPECT_EQ(manager.pluginWithIdentifier(kExampleID)->bundle()->bundlePath(), scratch.filePath("a/Copy.kaplugin"));
}

TEST_F(SystemDirectory, ComesAfterAllDirectoriesOfTheVariable)
{
    const QString a = directory("a");
    const QString b = directory("b");
    makeBundle(a + "/One.kaplugin", entries("one", "Working", "<integer>0</integer>"));
    makeBundle(b + "/Two.kaplugin", entries("two", "Working", "<integer>0</integer>"));
    search(a + ':' + b);
    manager.loadPlugins(std::nullopt);
    EXPECT_THAT(log.messages(), ElementsAre(unsupported(a + "/One.kaplugin"), unsupported(b + "/Two.kaplugin"),
                                            unsupported(kSystem + "/SystemOld.kaplugin")));
}

}  // namespace
