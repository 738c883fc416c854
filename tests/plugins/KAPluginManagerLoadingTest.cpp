// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAPluginManager.h>

#include <thread>

#include <gmock/gmock.h>

#include <QtCore/QCoreApplication>

#include <kavellaccounts/KAAListPlugin.h>
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

TEST_F(Loading, UnsetVariableFindsNothingAndSaysNothing)
{
    qunsetenv("VESK_FRAMEWORK_PATH");
    EXPECT_THAT(manager.allPlugins(), IsEmpty());
    EXPECT_THAT(log.messages(), IsEmpty());
}

TEST_F(Loading, PluginIsLoadedOnceAndToldOnce)
{
    search(kBundles + "/good");
    KAPlugin *const plugin = manager.pluginWithIdentifier(kExampleID);
    ASSERT_TRUE(plugin);
    EXPECT_EQ(manager.pluginWithIdentifier(kExampleID), plugin);
    EXPECT_THAT(manager.allAListPlugins(), ElementsAre(plugin));
    EXPECT_THAT(manager.allDataPlugins(), IsEmpty());
    EXPECT_EQ(plugin->property("didLoadCount").toInt(), 1);
    EXPECT_THAT(log.messages(), IsEmpty());
}

TEST_F(Loading, FirstDirectoryWinsSilently)
{
    const QString a = directory("a");
    const QString b = directory("b");
    link("good/ExampleList.kaplugin", a + "/Copy.kaplugin");
    link("good/ExampleList.kaplugin", b + "/ExampleList.kaplugin");
    search(a + ':' + b);
    EXPECT_EQ(manager.pluginWithIdentifier(kExampleID)->bundle()->bundlePath(), a + "/Copy.kaplugin");
    EXPECT_EQ(manager.allPlugins().size(), 1);
    EXPECT_THAT(log.messages(), IsEmpty());
}

TEST_F(Loading, PluginThatLetGoOfItsBundleStaysRegistered)
{
    const QString b = directory("b");
    search(kBundles + "/good");
    KAPlugin *const plugin = manager.pluginWithIdentifier(kExampleID);
    ASSERT_TRUE(plugin);
    plugin->setBundle(nullptr);
    link("good/ExampleList.kaplugin", b + "/ExampleList.kaplugin");
    search(b);
    EXPECT_THAT(manager.allPlugins(), ElementsAre(plugin));
    EXPECT_THAT(log.messages(), IsEmpty());
}

TEST_F(Loading, EmptyListSearchesNothing)
{
    search(kBundles + "/Version0");
    manager.loadPlugins(QStringList());
    EXPECT_THAT(log.messages(), IsEmpty());
    manager.loadPlugins(std::nullopt);
    EXPECT_EQ(log.messages().size(), 1);
}

TEST_F(Loading, ExtensionInCapitalsIsNotLoaded)
{
    link("good/ExampleList.kaplugin", directory("a") + "/ExampleList.KAPLUGIN");
    search(scratch.filePath("a"));
    EXPECT_THAT(identifiers(), IsEmpty());
}

TEST_F(Loading, DirectoryWithABlankContributesNothing)
{
    link("good/ExampleList.kaplugin", directory("with blank") + "/ExampleList.kaplugin");
    search(scratch.filePath("with blank"));
    EXPECT_THAT(identifiers(), IsEmpty());
}

TEST_F(Loading, BundleAddedMeanwhileIsFoundByTheNextQuestion)
{
    search(directory("a"));
    EXPECT_THAT(identifiers(), IsEmpty());
    link("good/ExampleList.kaplugin", scratch.filePath("a/ExampleList.kaplugin"));
    EXPECT_THAT(identifiers(), ElementsAre(kExampleID));
}

TEST_F(Loading, UnsupportedVersionsAreLoggedAndSkipped)
{
    const QStringList names{"Version0", "Version-3", "Versiontext", "Version0.9"};
    const QStringList found{"0", "-3", "0", "0"};
    for (int index = 0; index < names.size(); ++index) {
        const QString path = kBundles + '/' + names[index];
        search(path);
        EXPECT_THAT(identifiers(), IsEmpty());
        EXPECT_EQ(log.messages().value(index),
                  QStringLiteral("*** Unsupported plugin version: %1/%2.kaplugin. Min version: 1. Found version: %3")
                      .arg(path, names[index], found[index]));
    }
}

TEST_F(Loading, VersionThatIsATextIsTheNumberThatItBeginsWith)
{
    search(kBundles + "/Version2abc");
    EXPECT_THAT(identifiers(), ElementsAre("com.corvane.version.kaplugin"));
    EXPECT_THAT(log.messages(), IsEmpty());
}

TEST_F(Loading, CodeThatTheLoaderRefusesIsLoggedWithItsReason)
{
    const QString path = kBundles + "/MissingSymbol";
    search(path);
    EXPECT_THAT(identifiers(), IsEmpty());
    const QStringList messages = log.messages();
    ASSERT_EQ(messages.size(), 3);
    EXPECT_TRUE(
        messages[0].startsWith("*** Loading bundle at path " + path + "/MissingSymbol.kaplugin failed with error: "));
    EXPECT_TRUE(messages[1].startsWith("*** dlerror: "));
    EXPECT_TRUE(messages[1].contains("kavellTestSymbolThatNobodyDefines"));
    EXPECT_EQ(messages[2], "*** Loading bundle at path " + path + "/MissingSymbol.kaplugin failed");
}

TEST_F(Loading, FactoryThatIsMissingOrAnswersNullCostsOnlyItsBundle)
{
    for (const QString name : {"WithoutFactory", "AnsweringNull"}) {
        const QString place = directory(name);
        link(name + '/' + name + ".kaplugin", place + '/' + name + ".kaplugin");
        link("Working/Working.kaplugin", place + "/Working.kaplugin");
        search(place);
        EXPECT_THAT(identifiers(), ElementsAre("com.corvane.Working.kaplugin"));
        EXPECT_THAT(log.messages(),
                    testing::Contains("*** Loading bundle at path " + place + '/' + name + ".kaplugin failed"));
    }
}

TEST_F(Loading, ExceptionCostsTheRestOfItsDirectoryOnly)
{
    search(kBundles + "/ThrowingInFactory:" + kBundles + "/ThrowingInDidLoad:" + kBundles + "/good");
    EXPECT_THAT(identifiers(), ElementsAre(kExampleID));
    const QStringList messages = log.messages();
    ASSERT_EQ(messages.size(), 2);
    EXPECT_EQ(messages[0], "*** Caught exception while loading plugin at path " + kBundles +
                               "/ThrowingInFactory:no constructor today");
    EXPECT_EQ(messages[1], "*** Caught exception while loading plugin at path " + kBundles +
                               "/ThrowingInDidLoad:exception of type int");
}

TEST_F(Loading, PluginMadeOutsideTheRegistryIsNotTold)
{
    const auto plugin = manager.createKAPluginAtPath(kBundles + "/good/ExampleList.kaplugin");
    ASSERT_TRUE(plugin);
    EXPECT_FALSE(plugin->property("didLoadCount").isValid());
    EXPECT_FALSE(manager.createKAPluginAtPath("/nowhere"));
    EXPECT_THAT(log.messages(), ElementsAre("*** KAPluginManager couldn't create bundle from path: /nowhere"));
}

TEST_F(Loading, PluginLoadedByAWorkerLivesOnTheMainThread)
{
    search(kBundles + "/good");
    KAPlugin *plugin = nullptr;
    std::thread([&] { plugin = manager.pluginWithIdentifier(kExampleID); }).join();
    ASSERT_TRUE(plugin);
    EXPECT_EQ(plugin->thread(), QCoreApplication::instance()->thread());
}

TEST_F(Loading, ThreadsThatAskTogetherGetTheSameObject)
{
    search(kBundles + "/good");
    std::array<KAPlugin *, 8> found{};
    std::vector<std::thread> threads;
    for (KAPlugin *&place : found)
        threads.emplace_back([&] { place = manager.pluginWithIdentifier(kExampleID); });
    for (std::thread &thread : threads)
        thread.join();
    ASSERT_TRUE(found[0]);
    EXPECT_THAT(found, testing::Each(found[0]));
    EXPECT_EQ(found[0]->property("didLoadCount").toInt(), 1);
}

TEST_F(Loading, OneBundleIsLoadedByItsPathUnlessOthersAreAskedFor)
{
    const QString path = kBundles + "/good/ExampleList.kaplugin";
    search("");
    manager._loadPluginAtPath(path, QStringList{"another"});
    EXPECT_THAT(identifiers(), IsEmpty());
    manager._loadPluginAtPath(path, QStringList{"another", kExampleID});
    EXPECT_THAT(identifiers(), ElementsAre(kExampleID));
    manager._loadPluginAtPath(path, std::nullopt);
    EXPECT_EQ(manager.pluginWithIdentifier(kExampleID)->property("didLoadCount").toInt(), 1);
    manager._loadPluginAtPath("/nowhere", std::nullopt);
    EXPECT_THAT(log.messages(), IsEmpty());
}

TEST_F(Loading, TheSharedManagerIsOne)
{
    KAPluginManager *const shared = KAPluginManager::shared();
    ASSERT_TRUE(shared);
    EXPECT_EQ(KAPluginManager::shared(), shared);
    EXPECT_EQ(gSharedKAPluginManager, shared);
}

}  // namespace
