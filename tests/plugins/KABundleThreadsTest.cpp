// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Many threads with one bundle, whose information and texts are read by whoever asks first.

#include <atomic>
#include <filesystem>
#include <fstream>

#include <QtCore/QTemporaryDir>

#include <gtest/gtest.h>

#include <kavellaccounts/KABundle.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KAPlugin.h>

#include "tests/support/plugin_directory.h"
#include "tests/support/threads.h"

using kavell::test::onThreads;
using kavell::test::PluginDirectory;

namespace {

constexpr int kThreads = 8;

TEST(KABundleThreads, TextsAreFoundBeforeAnyoneHasReadTheTables)
{
    PluginDirectory plugins;
    plugins.addListPlugin({.identifier = kKAGooglePluginID});
    for (int round = 0; round < 10; ++round) {
        // Described anew, so that nothing is known of it.
        const std::string path = plugins.path().toStdString() + "/" + kKAGooglePluginID.toStdString();
        std::filesystem::last_write_time(path + "/Contents/Info.plist",
                                         std::filesystem::file_time_type() + std::chrono::seconds(round));
        const auto bundle = KABundle::bundleWithPath(QString::fromStdString(path));
        ASSERT_TRUE(bundle);
        onThreads(kThreads, [&](int) {
            EXPECT_EQ(bundle->localizedString("BRAND_NAME"), "Quillmere");
            EXPECT_EQ(bundle->localizedString("NO_SUCH_KEY"), "NO_SUCH_KEY");
            EXPECT_TRUE(bundle->localizedInfoForKey("KABundleName").isNull());
            EXPECT_EQ(KABundle::libraryBundle()->bundleIdentifier(), "com.corvane.kavellaccounts");
        });
    }
}

TEST(KABundleThreads, InformationThatIsReplacedMeanwhileIsTheOldOrTheNew)
{
    const QTemporaryDir directory;
    const std::string contents = directory.path().toStdString() + "/Contents";
    std::filesystem::create_directory(contents);
    const auto describe = [&](const std::string &identifier) {
        std::ofstream(contents + "/new") << "<plist version=\"1.0\"><dict><key>KABundleIdentifier</key><string>"
                                         << identifier << "</string></dict></plist>";
        std::filesystem::rename(contents + "/new", contents + "/Info.plist");
    };
    describe("one");
    std::atomic<bool> isChanging{true};
    onThreads(kThreads, [&](int index) {
        if (index == 0) {
            for (int round = 0; round < 200; ++round)
                describe(round % 2 ? "one" : "the other");
            isChanging = false;
            return;
        }
        while (isChanging) {
            const auto bundle = KABundle::bundleWithPath(directory.path());
            ASSERT_TRUE(bundle);
            const QString identifier = bundle->bundleIdentifier();
            EXPECT_TRUE(identifier == "one" || identifier == "the other") << identifier.toStdString();
            EXPECT_EQ(bundle->infoDictionary().value("KABundleIdentifier").toString(), identifier);
        }
    });
    describe("the last of them");
    EXPECT_EQ(KABundle::bundleWithPath(directory.path())->bundleIdentifier(), "the last of them");
}

TEST(KABundleThreads, CodeIsLoadedByAllAtOnceAndMakesObjectsForEach)
{
    PluginDirectory plugins;
    plugins.addDataPlugin({.identifier = kKAMailPluginID});
    const auto bundle = KABundle::bundleWithPath(plugins.path() + '/' + kKAMailPluginID);
    ASSERT_TRUE(bundle);
    onThreads(kThreads, [&](int) {
        EXPECT_TRUE(bundle->load());
        const auto plugin = bundle->makePrincipalObject(bundle);
        ASSERT_TRUE(plugin);
        EXPECT_EQ(plugin->identifier(), kKAMailPluginID);
    });
}

}  // namespace
