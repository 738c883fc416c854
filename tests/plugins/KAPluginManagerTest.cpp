// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAPluginManager.h>

#include <gmock/gmock.h>

#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KAApplication.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KADataPlugin.h>
#include <kavellaccounts/KAProvider.h>

#include "tests/support/dns_server.h"
#include "tests/support/plugin_directory.h"

using kavell::test::DnsServer;
using kavell::test::PluginDirectory;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::UnorderedElementsAre;

namespace {

QStringList bundleIDs(const QList<std::shared_ptr<KAApplication>> &applications)
{
    QStringList identifiers;
    for (const auto &application : applications)
        identifiers += application->bundleID();
    return identifiers;
}

template <typename Plugin> QStringList identifiers(const QList<Plugin *> &plugins)
{
    QStringList all;
    for (const auto *plugin : plugins)
        all += plugin->identifier();
    return all;
}

/// An account of the provider that a plug-in in the registry has.
std::shared_ptr<KAAccount> addAccount(const QString &providerType, const QString &login)
{
    return KAPluginManager::shared()->providerOfType(providerType)->createAccountWithLoginName(login);
}

}  // namespace

TEST(KAPluginManager, EachProviderTypeHasItsPlugin)
{
    KAPluginManager *const manager = KAPluginManager::shared();
    const std::pair<QString, QString> rows[] = {
        {"com.corvane.account.yahoo", "com.yahoo.kaplugin"},
        {"com.corvane.account.google", "com.google.kaplugin"},
        {"com.corvane.account.nimbrel", "com.corvane.nimbrel.kaplugin"},
        {"com.corvane.account.facebook", "com.facebook.kaplugin"},
        {"com.corvane.account.exchange", "com.corvane.exchange.kaplugin"},
        {"com.corvane.account.mail", "com.corvane.mail.kaplugin"},
        {"com.corvane.account.parlex", "com.corvane.chat.kaplugin"},
        {"com.corvane.account.cardell", "com.corvane.contacts.kaplugin"},
        {"com.corvane.account.tidewell", "com.corvane.calendar.kaplugin"},
        {"com.corvane.account.testing", "com.corvane.test.kaplugin"},
        {"com.corvane.account.aol", "com.aol.kaplugin"},
        {"com.corvane.account.haldenserver", "com.corvane.haldenserver.kaplugin"},
        {"com.corvane.account.placeholder", "com.corvane.placeholder.kaplugin"},
    };
    for (const auto &[provider, plugin] : rows)
        EXPECT_EQ(manager->pluginIDForProviderID(provider), plugin);
    EXPECT_TRUE(manager->pluginIDForProviderID("com.corvane.account.unknown").isNull());
    EXPECT_TRUE(manager->pluginIDForProviderID({}).isNull());
}

TEST(KAPluginManager, DataPluginsServeApplicationsAndTheTestPluginStandsInForMail)
{
    KAPluginManager *const manager = KAPluginManager::shared();
    const std::pair<QString, QString> rows[] = {
        {"com.corvane.mail.kaplugin", "com.corvane.mail"},
        {"com.corvane.calendar.kaplugin", "com.corvane.Tidewell"},
        {"com.corvane.chat.kaplugin", "com.corvane.Parlex"},
        {"com.corvane.contacts.kaplugin", "com.corvane.Cardell"},
    };
    for (const auto &[plugin, application] : rows) {
        EXPECT_EQ(manager->appBundleIDForPluginID(plugin), application);
        EXPECT_EQ(manager->pluginIDForAppBundleID(application), plugin);
    }
    EXPECT_EQ(manager->appBundleIDForPluginID("com.corvane.test.kaplugin"), "com.corvane.mail");
    EXPECT_TRUE(manager->appBundleIDForPluginID("com.google.kaplugin").isNull());
    EXPECT_TRUE(manager->pluginIDForAppBundleID("com.corvane.Luminel").isNull());
}

TEST(KAPluginManager, PresentsPluginsInTheirFixedOrder)
{
    QStringList order{
        "com.aol.kaplugin",   "org.zeta.kaplugin",  "com.google.kaplugin",           "com.corvane.placeholder.kaplugin",
        "org.Alpha.kaplugin", "com.yahoo.kaplugin", "com.corvane.exchange.kaplugin", "com.corvane.nimbrel.kaplugin"};
    std::sort(order.begin(), order.end(),
              [](const QString &first, const QString &second) { return KAPluginIDCompare(first, second) < 0; });
    EXPECT_EQ(order, (QStringList{"com.corvane.placeholder.kaplugin", "com.corvane.exchange.kaplugin",
                                  "com.corvane.nimbrel.kaplugin", "com.google.kaplugin", "com.yahoo.kaplugin",
                                  "com.aol.kaplugin", "org.Alpha.kaplugin", "org.zeta.kaplugin"}));
}

TEST(KAPluginManager, UnlistedPluginsThatDifferInCaseOnlyCompareAsTheSame)
{
    int context = 0;
    EXPECT_TRUE(KAPluginIDCompare("org.a.kaplugin", "ORG.A.kaplugin", &context) == 0);
    EXPECT_TRUE(KAPluginIDCompare("com.corvane.mail.kaplugin", "com.aol.kaplugin") > 0);
}

TEST(KAPluginManager, AProviderIsThatOfItsPlugin)
{
    PluginDirectory plugins;
    plugins.addListPlugin({.identifier = kKAGooglePluginID, .providerType = kKAProviderGoogle});
    KAPluginManager *const manager = KAPluginManager::shared();
    ASSERT_TRUE(manager->providerOfType(kKAProviderGoogle));
    EXPECT_EQ(manager->providerOfType(kKAProviderGoogle)->providerType(), kKAProviderGoogle);
    EXPECT_FALSE(manager->providerOfType(kKAProviderYahoo));
    EXPECT_FALSE(manager->providerOfType("com.corvane.account.unknown"));
}

TEST(KAPluginManager, AClaimedDomainNeedsNoLookup)
{
    DnsServer server;
    PluginDirectory plugins;
    plugins.addListPlugin({.identifier = "org.zorbo.kaplugin",
                           .providerType = kKAProviderMail,
                           .serviceTypes = {kKAServiceIMAP, kKAServiceIM},
                           .domains = {"zorbo.example"}});
    KAPluginManager *const manager = KAPluginManager::shared();
    EXPECT_EQ(manager->pluginIDForDomain("Mail.Zorbo.example"), "org.zorbo.kaplugin");
    EXPECT_EQ(manager->servicesForDomain("zorbo.example"), (QStringList{kKAServiceIMAP, kKAServiceIM}));
    EXPECT_THAT(server.queries(), IsEmpty());
}

TEST(KAPluginManager, AnUnclaimedDomainIsLookedUpOnce)
{
    DnsServer server;
    server.addMailExchanger("hosted.example", 1, "alt1.aspmx.googlemail.com");
    server.addMailExchanger("plain.example", 1, "mx.plain.example");
    PluginDirectory plugins;
    KAPluginManager *const manager = KAPluginManager::shared();
    EXPECT_EQ(manager->pluginIDForDomain("hosted.example"), kKAGooglePluginID);
    EXPECT_EQ(server.queryCount("hosted.example"), 1);
    EXPECT_TRUE(manager->pluginIDForDomain("plain.example").isNull());
    EXPECT_FALSE(manager->servicesForDomain("plain.example").has_value());
    EXPECT_EQ(server.queryCount("plain.example"), 1);
    EXPECT_FALSE(manager->servicesForDomain("hosted.example").has_value());  // no such plug-in is installed
}

TEST(KAPluginManager, ANullDomainIsNobodysAndNotLookedUp)
{
    DnsServer server;
    EXPECT_TRUE(KAPluginManager::shared()->pluginIDForDomain({}).isNull());
    EXPECT_THAT(server.queries(), IsEmpty());
}

TEST(KAPluginManager, TellsAccountListAndDataPluginsApart)
{
    PluginDirectory plugins;
    plugins.addListPlugin({.identifier = kKAGooglePluginID});
    plugins.addDataPlugin({.identifier = kKAMailPluginID});
    KAPluginManager *const manager = KAPluginManager::shared();
    EXPECT_THAT(identifiers(manager->allAListPlugins()), ElementsAre(kKAGooglePluginID));
    EXPECT_THAT(identifiers(manager->allDataPlugins()), ElementsAre(kKAMailPluginID));
    EXPECT_THAT(identifiers(manager->allPlugins()), UnorderedElementsAre(kKAGooglePluginID, kKAMailPluginID));
}

TEST(KAPluginManager, FindsThePluginsThatSupportOneOfTheServicesInTheirOrder)
{
    PluginDirectory plugins;
    plugins.addListPlugin(
        {.identifier = "org.b.kaplugin", .providerType = kKAProviderMail, .serviceTypes = {kKAServiceCalDAV}});
    plugins.addListPlugin(
        {.identifier = kKAYahooPluginID, .providerType = kKAProviderYahoo, .serviceTypes = {kKAServiceIMAP}});
    plugins.addListPlugin({.identifier = kKAGooglePluginID,
                           .providerType = kKAProviderGoogle,
                           .serviceTypes = {kKAServiceIM, kKAServiceIMAP}});
    plugins.addListPlugin({.identifier = "org.none.kaplugin"});
    plugins.addDataPlugin(
        {.identifier = kKAMailPluginID, .providerType = kKAProviderMail, .serviceTypes = {kKAServiceIMAP}});
    KAPluginManager *const manager = KAPluginManager::shared();
    EXPECT_THAT(identifiers(manager->aListPluginsSupportingServices({kKAServiceIMAP, kKAServiceCalDAV})),
                ElementsAre(kKAGooglePluginID, kKAYahooPluginID, "org.b.kaplugin"));
    EXPECT_THAT(identifiers(manager->dataPluginsSupportingServices({kKAServiceIMAP})), ElementsAre(kKAMailPluginID));
    EXPECT_THAT(manager->aListPluginsSupportingServices({kKAServicePhotos}), IsEmpty());
    EXPECT_THAT(manager->aListPluginsSupportingServices({}), IsEmpty());
}

TEST(KAPluginManager, EachServiceHasItsApplication)
{
    KAPluginManager manager;
    const std::pair<QString, QString> rows[] = {
        {kKAServiceIMAP, kKAMailAppID},
        {kKAServicePOP, kKAMailAppID},
        {kKAServiceExchangeMail, kKAMailAppID},
        {kKAServiceCalDAV, kKATidewellAppID},
        {kKAServiceExchangeCalendar, kKATidewellAppID},
        {kKAServiceIM, kKAParlexAppID},
        {kKAServiceCustomContacts, kKACardellAppID},
        {kKAServiceExchangeContacts, kKACardellAppID},
        {kKAServiceCardDAV, kKACardellAppID},
        {kKAServiceLDAP, kKACardellAppID},
    };
    for (const auto &[service, application] : rows) {
        ASSERT_TRUE(manager.applicationForService(service)) << service.toStdString();
        EXPECT_EQ(manager.applicationForService(service)->bundleID(), application);
    }
    EXPECT_FALSE(manager.applicationForService(kKAServicePhotos));
    EXPECT_FALSE(manager.applicationForService("other"));
    EXPECT_FALSE(manager.luminelApp());
}

TEST(KAPluginManager, ServicesGiveTheirApplicationsOnceWithTheFirstService)
{
    KAPluginManager manager;
    QStringList services{"stale"};
    const auto applications =
        manager.applicationsForServices({kKAServiceIMAP, kKAServicePOP, kKAServicePhotos, kKAServiceCalDAV}, &services);
    EXPECT_THAT(bundleIDs(applications), ElementsAre(kKAMailAppID, kKATidewellAppID));
    EXPECT_THAT(services, ElementsAre(kKAServiceIMAP, kKAServiceCalDAV));
    EXPECT_THAT(bundleIDs(manager.applicationsForServices({kKAServiceCalDAV, kKAServiceIMAP})),
                ElementsAre(kKATidewellAppID, kKAMailAppID));
}

TEST(KAPluginManager, NoServicesGiveNoApplications)
{
    KAPluginManager manager;
    QStringList services{"stale"};
    EXPECT_THAT(manager.applicationsForServices({}, &services), IsEmpty());
    EXPECT_THAT(services, IsEmpty());
    EXPECT_THAT(manager.applicationsForServices({kKAServicePhotos}), IsEmpty());
}

TEST(KAPluginManager, FindsAccountsByUidOverAllPlugins)
{
    PluginDirectory plugins;
    plugins.addListPlugin({.identifier = kKAGooglePluginID, .providerType = kKAProviderGoogle});
    plugins.addDataPlugin({.identifier = kKAMailPluginID, .providerType = kKAProviderMail});
    plugins.addDataPlugin({.identifier = kKAChatPluginID});  // without a provider
    const auto listed = addAccount(kKAProviderGoogle, "anna");
    const auto other = addAccount(kKAProviderMail, "bert");
    listed->addChildAccountDict({{"uid", "child-1"}, {"pluginID", kKAMailPluginID}}, "child-1");
    other->addChildAccountDict({{"uid", "child-2"}, {"pluginID", kKAMailPluginID}}, "child-2");

    KAPluginManager *const manager = KAPluginManager::shared();
    ASSERT_TRUE(manager->accountWithUID(other->uid()));
    EXPECT_EQ(manager->accountWithUID(other->uid())->loginName(), "bert");
    ASSERT_TRUE(manager->accountWithUID(listed->uid()));
    EXPECT_EQ(manager->accountWithUID(listed->uid())->loginName(), "anna");
    EXPECT_FALSE(manager->accountWithUID("none"));
    ASSERT_TRUE(manager->aListAccountContainingChildUID("child-1"));
    EXPECT_EQ(manager->aListAccountContainingChildUID("child-1")->loginName(), "anna");
    EXPECT_FALSE(manager->aListAccountContainingChildUID("child-2"));  // not of the account list
    ASSERT_TRUE(manager->childAccountWithUID("child-1"));
    EXPECT_EQ(manager->childAccountWithUID("child-1")->value("pluginID"), kKAMailPluginID);
    EXPECT_FALSE(manager->childAccountWithUID("child-2"));
    EXPECT_FALSE(manager->childAccountWithUID("none"));
}
