// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KAAListPlugin.h>

#include <gtest/gtest.h>
#include <kavellaccounts/KAAppTableController.h>
#include <kavellaccounts/KAApplication.h>
#include <kavellaccounts/KABundle.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KANotificationCenter.h>
#include <kavellaccounts/KARequiredMethodException.h>
#include <kavellaccounts/KASheetMorpher.h>
#include <kavellaccounts/KASheetWindow.h>

namespace {

class FixedTable : public KAAppTableController {
public:
    QList<std::shared_ptr<KAApplication>> selectedApps() const override { return apps; }
    QList<std::shared_ptr<KAApplication>> apps;
};

class OpenPlugin : public KAAListPlugin {
public:
    using KAAListPlugin::_appSelectionOKButton;
    using KAAListPlugin::_appSelectionView;
    using KAAListPlugin::_appTableController;
    using KAAListPlugin::_hostSheet;
    using KAAListPlugin::_sheetMorpher;
    using KAAListPlugin::_validationView;
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
    EXPECT_EQ(OpenPlugin(bundleNamed("Working/Working.kaplugin")).userVisibleProviderName(),
              "com.corvane.Working.kaplugin");
}

TEST(KAAListPlugin, OKButtonIsEnabledWhileAnApplicationIsSelected)
{
    OpenPlugin plugin(nullptr);
    QPushButton button;
    const auto table = std::make_shared<FixedTable>();
    plugin._appSelectionOKButton = &button;
    plugin._appTableController = table;
    EXPECT_TRUE(plugin.appToggle(nullptr));
    EXPECT_FALSE(button.isEnabled());
    table->apps = {KAApplication::initWithBundleID(kKAMailAppID)};
    EXPECT_TRUE(plugin.appToggle(nullptr));
    EXPECT_TRUE(button.isEnabled());
}

TEST(KAAListPlugin, AddingAnAccountTellsThePluginAndTheSelectedApplications)
{
    OpenPlugin plugin(nullptr);
    const auto table = std::make_shared<FixedTable>();
    table->apps = {KAApplication::initWithBundleID(kKAMailAppID)};
    plugin._appTableController = table;
    QList<KANotification> posted;
    const auto observation = KANotificationCenter::shared().addObserver(
        KACreatedAccountsNotification, [&](const KANotification &notification) { posted += notification; });
    plugin.addAccount(nullptr);
    ASSERT_EQ(posted.size(), 1);
    EXPECT_EQ(posted.first().userInformation.value("plugin").value<KAAListPlugin *>(), &plugin);
    EXPECT_EQ(posted.first().userInformation.value("selectedApps").value<QList<std::shared_ptr<KAApplication>>>(),
              table->apps);
}

TEST(KAAListPlugin, FirstViewMakesTheHostSheetWhichCancelEnds)
{
    OpenPlugin plugin(nullptr);
    QWidget view;
    plugin._validationView = &view;
    plugin.showValidationPanel(false);
    ASSERT_TRUE(plugin._hostSheet);
    EXPECT_EQ(plugin._hostSheet->contentView(), &view);
    int code = -1;
    QObject::connect(plugin._hostSheet.get(), &QDialog::finished, [&](int result) { code = result; });
    plugin._hostSheet->beginSheet(nullptr);
    plugin.cancel(nullptr);
    EXPECT_EQ(code, 0);
    EXPECT_FALSE(plugin._hostSheet->isVisible());
    plugin._hostSheet->setContentView(nullptr);
}

TEST(KAAListPlugin, GoingBackBeforeAnyViewWasShownMakesTheMorpherButNoSheet)
{
    OpenPlugin plugin(nullptr);
    QWidget view;
    plugin._validationView = &view;
    plugin.back(nullptr);
    ASSERT_TRUE(plugin._sheetMorpher);
    EXPECT_FALSE(plugin._hostSheet);
    plugin.showValidationPanel(false);
    EXPECT_EQ(plugin._sheetMorpher->hostSheet(), plugin._hostSheet);
    EXPECT_EQ(plugin._hostSheet->contentView(), &view);
    plugin._hostSheet->setContentView(nullptr);
}

TEST(KAAListPlugin, GoingBackShowsTheValidationViewAgain)
{
    OpenPlugin plugin(nullptr);
    QWidget validation;
    QWidget selection;
    plugin._validationView = &validation;
    plugin._appSelectionView = &selection;
    plugin.showAppSelectionPanel(false);
    ASSERT_EQ(plugin._hostSheet->contentView(), &selection);
    plugin.back(nullptr);
    EXPECT_EQ(plugin._hostSheet->contentView(), &validation);
    plugin._hostSheet->setContentView(nullptr);
}

}  // namespace
