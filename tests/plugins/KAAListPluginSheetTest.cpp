// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The sheet of an account-list plug-in: its views, buttons and outlets.

#include <kavellaccounts/KAAListPlugin.h>

#include <gmock/gmock.h>

#include <QtCore/QPointer>
#include <QtWidgets/QCheckBox>

#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KAAppTableController.h>
#include <kavellaccounts/KAAppTableRow.h>
#include <kavellaccounts/KAApplication.h>
#include <kavellaccounts/KABundle.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KAFieldList.h>
#include <kavellaccounts/KANotificationCenter.h>
#include <kavellaccounts/KAProvider.h>
#include <kavellaccounts/KASheetMorpher.h>
#include <kavellaccounts/KASheetWindow.h>

#include "tests/support/log_capture.h"

namespace {

class FixedTable : public KAAppTableController {
public:
    QList<std::shared_ptr<KAApplication>> selectedApps() const override { return apps; }
    QList<std::shared_ptr<KAApplication>> apps;
};

class OpenPlugin : public KAAListPlugin {
public:
    using KAAListPlugin::_appSelectionAccountName;
    using KAAListPlugin::_appSelectionOKButton;
    using KAAListPlugin::_appSelectionView;
    using KAAListPlugin::_appTableContainer;
    using KAAListPlugin::_appTableController;
    using KAAListPlugin::_hostSheet;
    using KAAListPlugin::_provisionalAccount;
    using KAAListPlugin::_sheetMorpher;
    using KAAListPlugin::_validationView;
    using KAAListPlugin::KAAListPlugin;
    using KAAListPlugin::loadInterfaceFile;
    using KAAListPlugin::makeAppTable;
};

/// A plug-in with mail and chat, its interface read, whose sheet shows the applications of an account.
class AppSelection {
public:
    AppSelection()
    {
        const auto provider = KAProvider::initWithProviderType(kKAProviderTest);
        provider->setServiceTypesProvided({kKAServiceIM, kKAServiceIMAP});
        plugin.setProvider(provider);
        isLoaded = plugin.loadInterfaceFile("Sheet");
        plugin._provisionalAccount = KAAccount::initWithProviderType(kKAProviderTest, "<b>anna</b>");
        plugin.makeAppTable(plugin._provisionalAccount);
        plugin.showAppSelectionPanel(false);
    }

    [[nodiscard]] KAAppTableController &table() { return *plugin._appTableController; }
    void click(int row) { table().rowViewForRow(row)->findChild<QCheckBox *>("checkbox")->click(); }

    OpenPlugin plugin{KABundle::bundleWithPath(QStringLiteral(KAVELL_TEST_BUNDLES "/good/ExampleList.kaplugin"))};
    bool isLoaded = false;
};

/// Whether the sheet's content was ever changed with an animation: the morpher makes a view for the first.
bool wasAnimated(const KASheetMorpher &morpher)
{
    KAFieldList list;
    morpher.describeFields(list);
    return list.fields().at(1).pointer != nullptr;
}

std::shared_ptr<KABundle> exampleBundle()
{
    return KABundle::bundleWithPath(QStringLiteral(KAVELL_TEST_BUNDLES "/good/ExampleList.kaplugin"));
}

TEST(KAAListPluginSheet, OKButtonIsEnabledWhileAnApplicationIsSelected)
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

TEST(KAAListPluginSheet, AddingAnAccountTellsThePluginAndTheSelectedApplications)
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

TEST(KAAListPluginSheet, FirstViewMakesTheHostSheetWhichCancelEnds)
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

TEST(KAAListPluginSheet, GoingBackBeforeAnyViewWasShownMakesTheMorpherButNoSheet)
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

TEST(KAAListPluginSheet, GoingBackShowsTheValidationViewAgain)
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

TEST(KAAListPluginSheet, GoingBackIsAnimatedAndPanelsAreWhenAsked)
{
    for (const bool goesBack : {false, true}) {
        OpenPlugin plugin(nullptr);
        QWidget validation;
        QWidget selection;
        plugin._validationView = &validation;
        plugin._appSelectionView = &selection;
        plugin.showValidationPanel(false);
        plugin.showAppSelectionPanel(false);
        EXPECT_FALSE(wasAnimated(*plugin._sheetMorpher));
        goesBack ? plugin.back(nullptr) : plugin.showValidationPanel(true);
        EXPECT_TRUE(wasAnimated(*plugin._sheetMorpher));
        EXPECT_EQ(plugin._hostSheet->contentView(), &validation);
        plugin._hostSheet->setContentView(nullptr);
    }
}

TEST(KAAListPluginSheet, TheApplicationsAreAnimatedWhenAsked)
{
    OpenPlugin plugin(nullptr);
    QWidget view;
    plugin._appSelectionView = &view;
    plugin.showAppSelectionPanel(true);
    EXPECT_TRUE(wasAnimated(*plugin._sheetMorpher));
    EXPECT_EQ(plugin._hostSheet->contentView(), &view);
    plugin._hostSheet->setContentView(nullptr);
}

TEST(KAAListPluginSheet, FirstViewMakesASheetOf200By200Points)
{
    OpenPlugin plugin(nullptr);
    plugin.showView(nullptr, false);
    ASSERT_TRUE(plugin._hostSheet);
    EXPECT_EQ(plugin._hostSheet->size(), QSize(200, 200));
    const auto sheet = plugin._hostSheet;
    const auto morpher = plugin._sheetMorpher;
    plugin.showView(nullptr, false);
    EXPECT_EQ(plugin._hostSheet, sheet);
    EXPECT_EQ(plugin._sheetMorpher, morpher);
}

TEST(KAAListPluginSheet, AddingAnAccountEndsTheSheetAndTellsOfTheAccount)
{
    OpenPlugin plugin(nullptr);
    QWidget view;
    plugin.showView(&view, false);
    plugin._hostSheet->beginSheet(nullptr);
    plugin._provisionalAccount = KAAccount::initWithProviderType("com.corvane.account.mail", "anna");
    int timesFinished = 0;
    QObject::connect(plugin._hostSheet.get(), &QDialog::finished, [&timesFinished] { ++timesFinished; });
    QVariant object;
    bool wasVisible = true;
    const auto observation = KANotificationCenter::shared().addObserver(KACreatedAccountsNotification,
                                                                        [&](const KANotification &notification) {
                                                                            object = notification.object;
                                                                            wasVisible = plugin._hostSheet->isVisible();
                                                                        });
    plugin.addAccount(nullptr);
    const auto accounts = object.value<QList<std::shared_ptr<KAAccount>>>();
    EXPECT_THAT(accounts, testing::ElementsAre(plugin._provisionalAccount));
    EXPECT_FALSE(wasVisible);
    EXPECT_EQ(timesFinished, 1);
    plugin._hostSheet->setContentView(nullptr);
}

TEST(KAAListPluginSheet, ShowingTheApplicationsEnablesOKOnlyForASelection)
{
    OpenPlugin plugin(nullptr);
    QWidget view;
    QPushButton button;
    const auto table = std::make_shared<FixedTable>();
    plugin._appSelectionView = &view;
    plugin._appSelectionOKButton = &button;
    plugin._appTableController = table;
    plugin.showAppSelectionPanel(false);
    EXPECT_FALSE(button.isEnabled());
    table->apps = {KAApplication::initWithBundleID(kKAMailAppID)};
    plugin.showAppSelectionPanel(false);
    EXPECT_TRUE(button.isEnabled());
    plugin._hostSheet->setContentView(nullptr);
}

TEST(KAAListPluginSheet, TheTableFillsItsContainerBesideTheAccountsName)
{
    AppSelection selection;
    ASSERT_TRUE(selection.isLoaded);
    EXPECT_EQ(selection.table().view()->parent(), selection.plugin._appTableContainer);
    EXPECT_EQ(selection.table().numberOfRows(), 2);
    EXPECT_EQ(selection.plugin._appSelectionAccountName->text(), "<b>anna</b>");
    EXPECT_EQ(selection.plugin._appSelectionAccountName->textFormat(), Qt::PlainText);
    selection.plugin._appTableContainer->resize(300, 150);
    (void)selection.plugin._appTableContainer->grab();
    EXPECT_EQ(selection.table().view()->geometry(), QRect(0, 0, 300, 150));
}

TEST(KAAListPluginSheet, ClickedCheckBoxesEnableOKWhileOneIsOn)
{
    AppSelection selection;
    EXPECT_FALSE(selection.plugin._appSelectionOKButton->isEnabled());
    selection.click(0);
    EXPECT_TRUE(selection.plugin._appSelectionOKButton->isEnabled());
    selection.click(1);
    selection.click(0);
    EXPECT_TRUE(selection.plugin._appSelectionOKButton->isEnabled());
    selection.click(1);
    EXPECT_FALSE(selection.plugin._appSelectionOKButton->isEnabled());
}

TEST(KAAListPluginSheet, RowsOfTheSheetNeitherSpinNorInform)
{
    AppSelection selection;
    selection.click(0);
    EXPECT_FALSE(selection.table().rowViewForRow(0)->isSpinning());
    EXPECT_FALSE(selection.table().rowViewForRow(0)->showInfoButton());
}

TEST(KAAListPluginSheet, OKTellsTheApplicationsThatAreOnInTheTablesOrder)
{
    AppSelection selection;
    selection.click(1);
    selection.click(0);
    QList<std::shared_ptr<KAApplication>> chosen;
    const auto observation =
        KANotificationCenter::shared().addObserver(KACreatedAccountsNotification, [&](const KANotification &posted) {
            chosen = posted.userInformation.value("selectedApps").value<QList<std::shared_ptr<KAApplication>>>();
        });
    selection.plugin._appSelectionOKButton->click();
    ASSERT_EQ(chosen.size(), 2);
    EXPECT_EQ(chosen.at(0)->bundleID(), kKAMailAppID);
    EXPECT_EQ(chosen.at(1)->bundleID(), kKAParlexAppID);
}

TEST(KAAListPluginSheet, APluginAndItsTableCanBeDescribed)
{
    AppSelection selection;
    KAFieldList plugin, table;
    selection.plugin.describeFields(plugin);
    selection.table().describeFields(table);
    EXPECT_FALSE(plugin.fields().front().value.isEmpty());
    EXPECT_EQ(table.fields().at(4).name, "_delegate");
    EXPECT_EQ(table.fields().at(4).pointer, static_cast<const QObject *>(&selection.plugin));
}

TEST(KAAListPluginSheet, AnotherAccountsTableTakesThePlaceOfTheFormer)
{
    AppSelection selection;
    const QPointer<QWidget> former = selection.table().view();
    selection.click(0);
    selection.plugin.makeAppTable(KAAccount::initWithProviderType(kKAProviderTest, "berta"));
    selection.plugin.showAppSelectionPanel(false);
    EXPECT_FALSE(former);
    EXPECT_EQ(selection.plugin._appTableContainer->findChildren<QScrollArea *>().size(), 1);
    EXPECT_EQ(selection.plugin._appSelectionAccountName->text(), "berta");
    EXPECT_FALSE(selection.plugin._appSelectionOKButton->isEnabled());
}

TEST(KAAListPluginSheet, ATableWithoutItsOutletsStillAnswers)
{
    OpenPlugin plugin(nullptr);
    plugin.makeAppTable(nullptr);
    ASSERT_TRUE(plugin._appTableController);
    EXPECT_TRUE(plugin._appTableController->selectedApps().isEmpty());
}

TEST(KAAListPluginSheet, InterfaceFileConnectsTheOutlets)
{
    const kavell::test::LogCapture log;
    OpenPlugin plugin(exampleBundle());
    ASSERT_TRUE(plugin.loadInterfaceFile("Sheet"));
    ASSERT_TRUE(plugin._validationView);
    EXPECT_EQ(plugin._validationView->size(), QSize(300, 100));
    ASSERT_TRUE(plugin._appSelectionView);
    EXPECT_EQ(plugin._appSelectionView->size(), QSize(400, 200));
    EXPECT_TRUE(plugin._appTableContainer);
    EXPECT_TRUE(plugin._appSelectionAccountName);
    EXPECT_TRUE(plugin._appSelectionOKButton);
    EXPECT_THAT(log.messages(), testing::IsEmpty());
}

TEST(KAAListPluginSheet, ButtonsOfTheInterfaceFileCallTheirMethods)
{
    OpenPlugin plugin(exampleBundle());
    ASSERT_TRUE(plugin.loadInterfaceFile("Sheet"));
    plugin.showAppSelectionPanel(false);
    plugin._appSelectionView->findChild<QPushButton *>("backButton")->click();
    EXPECT_EQ(plugin._hostSheet->contentView(), plugin._validationView);
    int code = -1;
    QObject::connect(plugin._hostSheet.get(), &QDialog::finished, [&](int result) { code = result; });
    plugin._validationView->findChild<QPushButton *>("cancelButton")->click();
    EXPECT_EQ(code, 0);
}

TEST(KAAListPluginSheet, ViewsOfTheInterfaceFileGoWithThePluginWhereverTheyStand)
{
    auto plugin = std::make_unique<OpenPlugin>(exampleBundle());
    ASSERT_TRUE(plugin->loadInterfaceFile("Sheet"));
    plugin->showValidationPanel(false);
    plugin->showAppSelectionPanel(false);
    const QPointer<QWidget> takenOut = plugin->_validationView;
    const QPointer<QWidget> shown = plugin->_appSelectionView;
    plugin.reset();
    EXPECT_FALSE(takenOut);
    EXPECT_FALSE(shown);
}

TEST(KAAListPluginSheet, InterfaceFileThatDoesNotFitIsLogged)
{
    const kavell::test::LogCapture log;
    OpenPlugin plugin(exampleBundle());
    EXPECT_FALSE(plugin.loadInterfaceFile("WrongSheet"));
    EXPECT_TRUE(plugin._validationView);
    EXPECT_FALSE(plugin._appSelectionOKButton);
    const QString path = exampleBundle()->pathForResource("WrongSheet", "ui");
    EXPECT_THAT(log.messages(),
                testing::ElementsAre("*** The interface file " + path +
                                         " has a QLabel named appSelectionOKButton where a QPushButton is expected",
                                     "*** The interface file " + path +
                                         " names the action dance, which KAAListPlugin does not have"));
}

TEST(KAAListPluginSheet, MissingInterfaceFileIsLogged)
{
    const kavell::test::LogCapture log;
    OpenPlugin plugin(exampleBundle());
    EXPECT_FALSE(plugin.loadInterfaceFile("NoSuchSheet"));
    EXPECT_THAT(log.messages(),
                testing::ElementsAre("*** Cannot read the interface file (null): It cannot be opened."));
}

}  // namespace
