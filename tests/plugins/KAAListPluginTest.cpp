// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAAListPlugin.h>

#include <gtest/gtest.h>

#include <QtCore/QTemporaryDir>

#include <kavellaccounts/KAApplication.h>
#include <kavellaccounts/KABundle.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KARequiredMethodException.h>

#include "tests/support/process.h"

namespace {

class OpenPlugin : public KAAListPlugin {
public:
    using KAAListPlugin::KAAListPlugin;
};

std::shared_ptr<KABundle> bundleNamed(const char *path)
{
    return KABundle::bundleWithPath(QStringLiteral(KAVELL_TEST_BUNDLES "/") + path);
}

template <typename Call> QString reasonOf(Call &&call)
{
    try {
        call();
    } catch (const KARequiredMethodException &exception) {
        EXPECT_EQ(exception.name(), "KavellAccountsRequiredMethod");
        return exception.reason();
    }
    return {};
}

TEST(KAAListPlugin, RequiredMethodsThrowWithTheNameOfTheDeclaringClass)
{
    OpenPlugin plugin(nullptr);
    EXPECT_EQ(reasonOf([&] { (void)plugin.accountFromSettings({}); }),
              "Subclassers must implement this method (-[KAAListPlugin accountFromSettings:])");
    EXPECT_EQ(reasonOf([&] { (void)plugin.imageForAccount(nullptr); }),
              "Subclassers must implement this method (-[KAAListPlugin imageForAccount:])");
    EXPECT_EQ(reasonOf([&] { plugin.createAccountInWindow(nullptr); }),
              "Subclassers must implement this method (-[KAAListPlugin createAccountInWindow:])");
    EXPECT_EQ(reasonOf([&] { plugin.setEnabled(true, nullptr, nullptr, nullptr); }),
              "Subclassers must implement this method (-[KAAListPlugin setEnabled:application:account:inWindow:])");
}

TEST(KAAListPlugin, HasTheseDefaults)
{
    OpenPlugin plugin(nullptr);
    EXPECT_TRUE(plugin.specialPluginBehaviors().empty());
    EXPECT_FALSE(plugin.supportsDataMigration());
    EXPECT_TRUE(plugin.shouldShowPasswordField());
    EXPECT_TRUE(plugin.bannerImage().isNull());
    EXPECT_TRUE(plugin.canSignOutForAccount(nullptr));
    EXPECT_EQ(plugin.signInView(), nullptr);
    EXPECT_FALSE(plugin.showMigrationSyncAlertForService(kKAServiceIMAP));
    EXPECT_FALSE(plugin.shouldShowMigrationSyncAlertForService(kKAServiceIMAP));
}

TEST(KAAListPlugin, WhatAPluginMayReactToDoesNothing)
{
    OpenPlugin plugin(nullptr);
    EXPECT_NO_THROW(plugin.continueButton(nullptr));
    EXPECT_NO_THROW(plugin.signInAccount(nullptr, nullptr));
    EXPECT_NO_THROW(plugin.createAccountInWindowWithWayfenArgs(nullptr, {}));
    EXPECT_NO_THROW(plugin.configViewDidLoad());
    EXPECT_NO_THROW(plugin.configViewWillLoad());
}

TEST(KAAListPlugin, OwnStringsAreNullWithoutTranslation)
{
    const OpenPlugin plugin(bundleNamed("Working/Working.kaplugin"));
    EXPECT_FALSE(plugin.supportURL().isValid());
    EXPECT_TRUE(plugin.brandName().isNull());
    EXPECT_TRUE(plugin.defaultAccountDescription().isNull());
    EXPECT_TRUE(plugin.autodiscoverDomain().isNull());
    EXPECT_TRUE(plugin.userNameFieldLabel().isNull());
}

TEST(KAAListPlugin, OwnStringsComeFromItsBundle)
{
    const OpenPlugin plugin(bundleNamed("good/ExampleList.kaplugin"));
    EXPECT_EQ(plugin.supportURL(), QUrl("https://support.example.com/"));
    EXPECT_EQ(plugin.brandName(), "Zorbo");
    EXPECT_EQ(plugin.defaultAccountDescription(), "Zorbo account");
    EXPECT_EQ(plugin.userNameFieldLabel(), "Zorbo name");
    EXPECT_TRUE(plugin.autodiscoverDomain().isNull());
}

TEST(KAAListPlugin, ServiceNameIsItsOwnElseBrandAndTheLibrarysElseTheLibrarys)
{
    const OpenPlugin withBrand(bundleNamed("good/ExampleList.kaplugin"));
    EXPECT_EQ(withBrand.serviceDisplayNameForService(kKAServiceIM), "Zorbo Talk");
    EXPECT_EQ(withBrand.serviceDisplayNameForService(kKAServicePOP), "Zorbo Mail");
    const OpenPlugin withoutBrand(bundleNamed("Working/Working.kaplugin"));
    EXPECT_EQ(withoutBrand.serviceDisplayNameForService(kKAServiceExchangeContacts), "Contacts");
}

TEST(KAAListPlugin, EachServiceHasTheNameOfItsKind)
{
    const std::pair<QString, QString> rows[] = {
        {kKAServiceIMAP, "Service Mail"},
        {kKAServicePOP, "Service Mail"},
        {kKAServiceExchangeMail, "Service Mail"},
        {kKAServiceCalDAV, "Service Days"},
        {kKAServiceExchangeCalendar, "Service Days"},
        {kKAServiceIM, "Service Talk"},
        {kKAServiceCardDAV, "Service People"},
        {kKAServiceCustomContacts, "Service People"},
        {kKAServiceExchangeContacts, "Service People"},
    };
    const OpenPlugin plugin(bundleNamed("Worded/Worded.kaplugin"));
    for (const auto &[service, name] : rows)
        EXPECT_EQ(plugin.serviceDisplayNameForService(service), name);
}

TEST(KAAListPlugin, EachApplicationsDataHasItsOwnName)
{
    const std::pair<QString, QString> rows[] = {
        {"com.corvane.mail", "Our Mail"},
        {"com.corvane.Tidewell", "Our Days"},
        {"com.corvane.Parlex", "Our Talk"},
        {"com.corvane.Cardell", "Our People"},
    };
    const OpenPlugin plugin(bundleNamed("Worded/Worded.kaplugin"));
    for (const auto &[identifier, name] : rows)
        EXPECT_EQ(plugin.displayNameForApplication(KAApplication::initWithBundleID(identifier)), name);
    EXPECT_TRUE(plugin.displayNameForApplication(KAApplication::initWithBundleID("com.corvane.Luminel")).isNull());
    EXPECT_EQ(plugin.autodiscoverDomain(), "discover.example");
}

TEST(KAAListPlugin, ServicesOutsideTheNineHaveNoName)
{
    const OpenPlugin plugin(bundleNamed("good/ExampleList.kaplugin"));
    EXPECT_TRUE(plugin.serviceDisplayNameForService(kKAServiceLDAP).isNull());
    EXPECT_TRUE(plugin.serviceDisplayNameForService(kKAServicePhotos).isNull());
    EXPECT_TRUE(plugin.serviceDisplayNameForService(QString()).isNull());
}

TEST(KAAListPlugin, ApplicationsDataIsNamedByThePluginElseByTheApplication)
{
    const OpenPlugin plugin(bundleNamed("good/ExampleList.kaplugin"));
    EXPECT_EQ(plugin.displayNameForApplication(KAApplication::initWithBundleID(kKATidewellAppID)), "Zorbo Days");
    const auto mail = KAApplication::initWithBundleID(kKAMailAppID);
    EXPECT_EQ(plugin.displayNameForApplication(mail), mail->displayNameForData());
    EXPECT_TRUE(plugin.displayNameForApplication(KAApplication::initWithBundleID("org.example.other")).isNull());
}

TEST(KAAListPlugin, SupportsDomainsOfItsFileInAnyCase)
{
    OpenPlugin plugin(bundleNamed("good/ExampleList.kaplugin"));
    EXPECT_FALSE(plugin.supportsDomain(QString()));
    EXPECT_TRUE(plugin.supportsDomain("Mail.Example.NET"));
    EXPECT_FALSE(plugin.supportsDomain("x.corp.example.net"));
    EXPECT_TRUE(plugin.supportsDomain("x.lone.example.net"));
    EXPECT_FALSE(plugin.supportsDomain("lone.example.net"));
}

TEST(KAAListPlugin, WithoutADomainsFileServesNone)
{
    OpenPlugin plugin(bundleNamed("Working/Working.kaplugin"));
    EXPECT_FALSE(plugin.domains());
    EXPECT_FALSE(plugin.supportsDomain("example.net"));
}

TEST(KAAListPlugin, DomainsFileIsLookedForUntilThereIsOneAndReadOnce)
{
    const QTemporaryDir scratch;
    const auto write = [&](const char *name, const std::string &entries) {
        kavell::test::writeFile(scratch.filePath(name).toStdString(),
                                "<plist version=\"1.0\"><dict>" + entries + "</dict></plist>");
    };
    const auto domain = [](const std::string &label) {
        return "<key>domains</key><array><string>" + label + "</string></array>";
    };
    write("Contents/Info.plist", "<key>KABundleIdentifier</key><string>org.example</string>");
    OpenPlugin plugin(KABundle::bundleWithPath(scratch.path()));
    EXPECT_FALSE(plugin.supportsDomain("one.test"));
    write("Contents/Resources/domains.plist", domain("one"));
    EXPECT_TRUE(plugin.supportsDomain("one.test"));
    write("Contents/Resources/domains.plist", domain("two"));
    EXPECT_TRUE(plugin.supportsDomain("one.test"));
    EXPECT_FALSE(plugin.supportsDomain("two.test"));
}

TEST(KAAListPlugin, FollowsASubclassThatChangesItsDomains)
{
    struct Changing : KAAListPlugin {
        using KAAListPlugin::KAAListPlugin;
        std::optional<QVariantMap> domains() override { return QVariantMap{{"domains", QVariantList{label}}}; }
        QString label = "one";
    } plugin(nullptr);
    EXPECT_TRUE(plugin.supportsDomain("one.test"));
    plugin.label = "two";
    EXPECT_FALSE(plugin.supportsDomain("one.test"));
    EXPECT_TRUE(plugin.supportsDomain("two.test"));
}

TEST(KAAListPlugin, ProviderNameIsLocalizedElsePlainElseTheIdentifier)
{
    EXPECT_EQ(OpenPlugin(bundleNamed("good/ExampleList.kaplugin")).userVisibleProviderName(), "Zorbo Online");
    EXPECT_EQ(OpenPlugin(bundleNamed("Worded/Worded.kaplugin")).userVisibleProviderName(), "Plain Name");
    EXPECT_EQ(OpenPlugin(bundleNamed("Working/Working.kaplugin")).userVisibleProviderName(),
              "com.corvane.Working.kaplugin");
}

}  // namespace
