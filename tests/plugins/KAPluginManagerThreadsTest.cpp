// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Many threads with one registry of plug-ins, which is searched and filled by whoever asks first.

#include <atomic>
#include <filesystem>
#include <set>

#include <QtCore/QCoreApplication>
#include <QtCore/QThread>

#include <gmock/gmock.h>

#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KADataPlugin.h>
#include <kavellaccounts/KAPluginManager.h>
#include <kavellaccounts/KAProvider.h>

#include "tests/support/dns_server.h"
#include "tests/support/log_capture.h"
#include "tests/support/plugin_directory.h"
#include "tests/support/threads.h"

using kavell::test::DnsServer;
using kavell::test::LogCapture;
using kavell::test::onThreads;
using kavell::test::PluginDirectory;
using testing::IsEmpty;

namespace {

constexpr int kThreads = 8;

class RegistryThreads : public testing::Test {
protected:
    RegistryThreads()
    {
        plugins.addListPlugin({.identifier = kKAGooglePluginID,
                               .providerType = kKAProviderGoogle,
                               .serviceTypes = {kKAServiceIMAP},
                               .domains = {"zorbo.example"}});
        plugins.addListPlugin({.identifier = kKAYahooPluginID,
                               .providerType = kKAProviderYahoo,
                               .serviceTypes = {kKAServiceIMAP, kKAServiceIM},
                               .domains = {"yarrow"},
                               .exact = false});
        plugins.addDataPlugin(
            {.identifier = kKAMailPluginID, .providerType = kKAProviderMail, .serviceTypes = {kKAServiceIMAP}});
        manager = KAPluginManager::shared();  // whose first call must not be raced
    }

    /// Puts a bundle where the registry does not look, and later, in one step, where it does.
    void addHidden(const QString &identifier)
    {
        plugins.addListPlugin({.identifier = identifier});
        std::filesystem::rename(place(identifier, "kaplugin"), place(identifier, "waiting"));
    }
    void reveal(const QString &identifier)
    {
        std::filesystem::rename(place(identifier, "waiting"), place(identifier, "kaplugin"));
    }

    PluginDirectory plugins;
    KAPluginManager *manager = nullptr;
    const LogCapture log;

private:
    [[nodiscard]] std::filesystem::path place(const QString &identifier, const char *extension) const
    {
        return std::filesystem::path(plugins.path().toStdString()) /
               std::filesystem::path(identifier.toStdString()).replace_extension(extension);
    }
};

}  // namespace

TEST_F(RegistryThreads, AllFirstQuestionsAreAnsweredByTheSameObjects)
{
    std::array<std::set<const KAPlugin *>, kThreads> found;
    onThreads(kThreads, [&](int index) {
        auto &own = found[static_cast<size_t>(index)];
        switch (index % 4) {
        case 0:
            for (const KAPlugin *plugin : manager->allPlugins())
                own.insert(plugin);
            break;
        case 1:
            for (const QString &identifier : {kKAGooglePluginID, kKAYahooPluginID, kKAMailPluginID})
                own.insert(manager->pluginWithIdentifier(identifier));
            break;
        case 2:
            for (const KAPlugin *plugin : manager->aListPluginsSupportingServices({kKAServiceIMAP}))
                own.insert(plugin);
            for (const KAPlugin *plugin : manager->dataPluginsSupportingServices({kKAServiceIMAP}))
                own.insert(plugin);
            break;
        default:
            EXPECT_EQ(manager->surveyBundles().size(), 4);  // with the system's directory, which is missing
            for (const KAPlugin *plugin : manager->allAListPlugins())
                own.insert(plugin);
            for (const KAPlugin *plugin : manager->allDataPlugins())
                own.insert(plugin);
        }
    });
    EXPECT_EQ(found[0].size(), 3U);
    EXPECT_THAT(found, testing::Each(found[0]));
    for (const KAPlugin *plugin : found[0])
        EXPECT_EQ(plugin->thread(), QCoreApplication::instance()->thread());
    EXPECT_THAT(log.messages(), IsEmpty());
}

TEST_F(RegistryThreads, DomainsAreClaimedBeforeAnyoneHasReadTheirFiles)
{
    const DnsServer server;
    onThreads(kThreads, [&](int index) {
        for (int round = 0; round < 20; ++round) {
            EXPECT_EQ(manager->pluginIDForDomain("Mail.Zorbo.Example"), kKAGooglePluginID);
            EXPECT_EQ(manager->pluginIDForDomain(QStringLiteral("d%1.yarrow.example").arg(index)), kKAYahooPluginID);
            EXPECT_EQ(manager->servicesForDomain("zorbo.example"), QStringList{kKAServiceIMAP});
        }
    });
    EXPECT_THAT(server.queries(), IsEmpty());
}

TEST_F(RegistryThreads, SettingsAreIdentifiedAlikeOnAllThreads)
{
    DnsServer server;
    server.addMailExchanger("hosted.example", 10, "aspmx.l.google.com");
    onThreads(kThreads, [&](int) {
        for (int round = 0; round < 20; ++round) {
            EXPECT_EQ(KAAccount::aListPluginIDForSettings({{KAMailEmailAddressKey, "ada@zorbo.example"}}),
                      kKAGooglePluginID);
            EXPECT_EQ(KAAccount::aListPluginIDForSettings({{KAMailEmailAddressKey, "ada@hosted.example"}}),
                      kKAGooglePluginID);
            EXPECT_EQ(KAAccount::aListPluginIDForSettings({{KAMailIncomingMailServerKey, "imap.yarrow.example"}}),
                      kKAYahooPluginID);
            EXPECT_TRUE(KAAccount::aListPluginIDForSettings({{KAMailEmailAddressKey, "ada"}}).isNull());
        }
    });
}

TEST_F(RegistryThreads, BundlesThatAreAddedMeanwhileAreRegisteredOnceAndStay)
{
    constexpr int added = 5;
    const auto identifier = [](int number) {
        return QStringLiteral("org.example.added%1.kaplugin").arg(number);
    };
    for (int number = 0; number < added; ++number)
        addHidden(identifier(number));
    std::array<QList<KAPlugin *>, kThreads> last;
    onThreads(kThreads, [&](int index) {
        qsizetype count = 3;
        for (int round = 0; round < 40 || count < 3 + added; ++round) {
            if (index == 0 && round % 4 == 0 && round / 4 < added)
                reveal(identifier(round / 4));
            const QList<KAPlugin *> all = manager->allPlugins();
            EXPECT_GE(all.size(), count);
            count = all.size();
            last[static_cast<size_t>(index)] = all;
        }
    });
    for (QList<KAPlugin *> &all : last)
        std::sort(all.begin(), all.end());
    EXPECT_THAT(last, testing::Each(last[0]));
    EXPECT_EQ(last[0].size(), 3 + added);
    EXPECT_THAT(log.messages(), IsEmpty());
}

TEST_F(RegistryThreads, APluginsAccountAndProviderAreSetAndReadByAll)
{
    KAPlugin *const plugin = manager->pluginWithIdentifier(kKAGooglePluginID);
    ASSERT_TRUE(plugin);
    const auto google = KAProvider::googleProvider(), yahoo = KAProvider::yahooProvider();
    const auto account = google->createAccountWithLoginName("ada");
    onThreads(kThreads, [&](int index) {
        for (int round = 0; round < 300; ++round) {
            if (index % 2 == 0) {
                plugin->setProvider(round % 2 ? google : yahoo);
                plugin->setAccount(round % 2 ? account : nullptr);
            } else {
                const auto provider = plugin->provider();
                EXPECT_TRUE(provider && !provider->providerType().isNull());
                const auto current = plugin->account();
                EXPECT_TRUE(!current || current == account);
                EXPECT_EQ(plugin->identifier(), kKAGooglePluginID);
            }
        }
    });
}

TEST_F(RegistryThreads, AccountsAreFoundByTheirUIDWhileOthersMakeMore)
{
    const auto provider = manager->providerOfType(kKAProviderGoogle);
    ASSERT_TRUE(provider);
    const auto ada = provider->createAccountWithLoginName("ada");
    const QString uid = ada->uid();
    onThreads(kThreads, [&](int index) {
        for (int round = 0; round < 20; ++round) {
            if (index % 2 == 0) {
                const QString name = QStringLiteral("user %1 %2").arg(index).arg(round);
                EXPECT_TRUE(provider->createAccountWithLoginName(name));
                EXPECT_TRUE(provider->hasAccountWithLoginName(name));
            }
            const auto found = manager->accountWithUID(uid);
            ASSERT_TRUE(found);
            EXPECT_EQ(found->loginName(), "ada");
        }
    });
    EXPECT_EQ(provider->accounts().size(), 1 + kThreads / 2 * 20);
}
