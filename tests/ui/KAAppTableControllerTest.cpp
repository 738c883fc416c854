// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The application table's data: which applications it has, in which order, picked or not, and what rows are made with.

#include <kavellaccounts/KAAppTableController.h>

#include <gmock/gmock.h>

#include <QtCore/QDir>
#include <QtCore/QFile>
#include <QtCore/QTemporaryDir>
#include <QtWidgets/QScroller>

#include <kavellaccounts/KABundle.h>
#include <kavellaccounts/KAFieldList.h>

#include "tests/support/log_capture.h"
#include "tests/ui/app_table_fixture.h"

using namespace kavell::test;
using testing::ElementsAre;
using testing::IsEmpty;

namespace {

/// A bundle that is nothing but an identifier.
class IdentifierBundle {
public:
    explicit IdentifierBundle(const QString &identifier)
    {
        const QString path = m_directory.filePath("Named.kaplugin");
        QDir().mkpath(path + "/Contents");
        QFile file(path + "/Contents/Info.plist");
        if (file.open(QIODevice::WriteOnly))
            file.write(QStringLiteral("<plist version=\"1.0\"><dict><key>KABundleIdentifier</key>"
                                      "<string>%1</string></dict></plist>")
                           .arg(identifier)
                           .toUtf8());
        file.close();
        bundle = KABundle::bundleWithPath(path);
    }

    std::shared_ptr<KABundle> bundle;

private:
    QTemporaryDir m_directory;
};

class KAAppTableControllerTest : public AppTableTest {};

TEST_F(KAAppTableControllerTest, AMissingInterfaceIsLoggedAndLeavesNoView)
{
    const LogCapture log;
    const auto table = KAAppTableController::initWithNibName("NoSuchTable", nullptr);
    ASSERT_TRUE(table);
    EXPECT_EQ(table->view(), nullptr);
    EXPECT_THAT(log.messages(), ElementsAre("*** Couldn't load nib NoSuchTable"));
    table->setServices(allServices());
    EXPECT_EQ(table->numberOfRows(), 4);
}

TEST_F(KAAppTableControllerTest, ATableOfAnInterfaceAloneHasNothingSet)
{
    const auto table = KAAppTableController::initWithNibName("AppTable", nullptr);
    ASSERT_TRUE(table->view());
    EXPECT_EQ(table->account(), nullptr);
    EXPECT_EQ(table->delegate(), nullptr);
    EXPECT_FALSE(table->showInfoButtons());
    EXPECT_FALSE(table->spinOnSelection());
    EXPECT_THAT(table->apps(), IsEmpty());
}

TEST_F(KAAppTableControllerTest, TheTableDoesNotBounceVertically)
{
    const auto table = KAAppTableController::initWithNibName("AppTable", nullptr);
    const auto *const scrollView = qobject_cast<QScrollArea *>(table->view());
    ASSERT_TRUE(scrollView);
    const QVariant policy = QScroller::scroller(scrollView->viewport())
                                ->scrollerProperties()
                                .scrollMetric(QScrollerProperties::VerticalOvershootPolicy);
    EXPECT_EQ(policy.value<QScrollerProperties::OvershootPolicy>(), QScrollerProperties::OvershootAlwaysOff);
}

TEST_F(KAAppTableControllerTest, ATableOfAnAccountShowsButtonsSpinsAndFetches)
{
    const auto account = accountFor({});
    const auto table = tableFor(account);
    EXPECT_EQ(table->account(), account);
    EXPECT_TRUE(table->showInfoButtons());
    EXPECT_TRUE(table->spinOnSelection());
    EXPECT_EQ(table->numberOfRows(), 4);
}

TEST_F(KAAppTableControllerTest, WithoutAPluginThereIsNothingToShow)
{
    const auto table = KAAppTableController::initWithAccount(accountFor({}), nullptr);
    EXPECT_EQ(table->numberOfRows(), 0);
    EXPECT_TRUE(table->view());
}

TEST_F(KAAppTableControllerTest, ApplicationsStandInTheOrderOfTheirSortValuesWithTheirServices)
{
    const auto table = tableFor(accountFor({}));
    EXPECT_THAT(bundleIDsOf(table->apps()),
                ElementsAre(kKAMailAppID, kKACardellAppID, kKATidewellAppID, kKAParlexAppID));
    EXPECT_THAT(table->pairedServices(),
                ElementsAre(kKAServiceIMAP, kKAServiceCardDAV, kKAServiceCalDAV, kKAServiceIM));
}

TEST_F(KAAppTableControllerTest, ApplicationsArePickedAsTheAccountSays)
{
    const auto table = tableFor(accountFor({kKAMailPluginID, kKAChatPluginID}));
    EXPECT_THAT(bundleIDsOf(table->selectedApps()), ElementsAre(kKAMailAppID, kKAParlexAppID));
}

TEST_F(KAAppTableControllerTest, ServicesCanBeGiven)
{
    const auto table = KAAppTableController::initWithAccount(accountFor({kKACalendarPluginID}), nullptr);
    table->setServices({kKAServiceCalDAV, kKAServicePOP, kKAServiceIMAP, "no service"});
    EXPECT_THAT(bundleIDsOf(table->apps()), ElementsAre(kKAMailAppID, kKATidewellAppID));
    EXPECT_THAT(table->pairedServices(), ElementsAre(kKAServicePOP, kKAServiceCalDAV));
    EXPECT_THAT(bundleIDsOf(table->selectedApps()), ElementsAre(kKATidewellAppID));
}

TEST_F(KAAppTableControllerTest, JapaneseYahooAccountsOfferNeitherContactsNorCalendars)
{
    const IdentifierBundle yahoo("com.yahoo.kaplugin");
    OfferingPlugin yahooPlugin(allServices(), yahoo.bundle);
    const auto table = KAAppTableController::initWithAccount(accountFor({}, "anna@yahoo.co.jp"), &yahooPlugin);
    EXPECT_THAT(bundleIDsOf(table->apps()), ElementsAre(kKAMailAppID, kKAParlexAppID));
    table->setAccountAndPlugin(accountFor({}, "anna@yahoo.com"), &yahooPlugin);
    EXPECT_EQ(table->numberOfRows(), 4);
    table->setAccountAndPlugin(accountFor({}, "berta@yahoo.co.jp"), &yahooPlugin);
    EXPECT_EQ(table->numberOfRows(), 2);
    EXPECT_THAT(yahooPlugin.provider()->serviceTypesProvided(), testing::SizeIs(4));
}

TEST_F(KAAppTableControllerTest, JapaneseAccountsOfOtherPluginsOfferEverything)
{
    EXPECT_EQ(tableFor(accountFor({}, "anna@yahoo.co.jp"))->numberOfRows(), 4);
}

TEST_F(KAAppTableControllerTest, TheAccountThatIsShownIsNotFetchedAgain)
{
    const auto account = accountFor({});
    const auto table = tableFor(account);
    const QList<Application> apps = table->apps();
    OfferingPlugin other({kKAServiceIM});
    table->setAccountAndPlugin(account, &other);
    EXPECT_EQ(table->apps(), apps);
}

TEST_F(KAAppTableControllerTest, AnotherAccountIsShownWithItsPlugin)
{
    const auto table = tableFor(accountFor({kKAMailPluginID}));
    OfferingPlugin other({kKAServiceIM, kKAServiceIMAP});
    const auto account = accountFor({kKAChatPluginID}, "berta@zorbo.test");
    table->setAccountAndPlugin(account, &other);
    EXPECT_EQ(table->account(), account);
    EXPECT_THAT(bundleIDsOf(table->apps()), ElementsAre(kKAMailAppID, kKAParlexAppID));
    EXPECT_THAT(bundleIDsOf(table->selectedApps()), ElementsAre(kKAParlexAppID));
    EXPECT_TRUE(checkboxOf(*table->rowViewForRow(1))->isChecked());
    EXPECT_FALSE(checkboxOf(*table->rowViewForRow(0))->isChecked());
}

TEST_F(KAAppTableControllerTest, NoAccountAndNoPluginShowNothing)
{
    const auto table = tableFor(accountFor({kKAMailPluginID}));
    table->setAccountAndPlugin(nullptr, nullptr);
    EXPECT_EQ(table->account(), nullptr);
    EXPECT_EQ(table->numberOfRows(), 0);
}

TEST_F(KAAppTableControllerTest, UpdatingPicksAnewAsTheAccountSaysExceptWhereItSpins)
{
    const auto account = accountFor({});
    const auto table = tableFor(account);
    const auto mailRow = table->rowViewForRow(0);
    const auto contactsRow = table->rowViewForRow(1);
    table->startProgressForApp(table->appAtRow(1));
    for (const QString &pluginID : {kKAMailPluginID, kKAContactsPluginID, kKACalendarPluginID})
        account->addChildAccountDict(KAAccount::childDictionaryWithSettings({}, pluginID, pluginID), pluginID);
    table->updateTable();
    EXPECT_TRUE(table->appAtRow(0)->enabled());
    EXPECT_TRUE(checkboxOf(*mailRow)->isChecked());
    EXPECT_FALSE(table->appAtRow(1)->enabled());
    EXPECT_FALSE(checkboxOf(*contactsRow)->isChecked());
    EXPECT_TRUE(table->appAtRow(2)->enabled());
    EXPECT_TRUE(checkboxOf(*table->rowViewForRow(2))->isChecked());
    account->removeChildAccountWithUID(kKAMailPluginID);
    table->updateTable();
    EXPECT_FALSE(table->appAtRow(0)->enabled());
    EXPECT_FALSE(checkboxOf(*mailRow)->isChecked());
}

TEST_F(KAAppTableControllerTest, AllApplicationsCanBePicked)
{
    const auto table = tableFor(accountFor({}));
    const auto mailRow = table->rowViewForRow(0);
    table->selectAllApps();
    EXPECT_EQ(table->selectedApps(), table->apps());
    EXPECT_TRUE(checkboxOf(*mailRow)->isChecked());
    EXPECT_TRUE(checkboxOf(*table->rowViewForRow(3))->isChecked());
}

TEST_F(KAAppTableControllerTest, PickingOneApplicationsBoxLeavesItsFlag)
{
    const auto table = tableFor(accountFor({}));
    const Application mail = table->appAtRow(0);
    table->selectApp(mail);
    EXPECT_TRUE(checkboxOf(*table->rowViewForApp(mail))->isChecked());
    EXPECT_FALSE(mail->enabled());
    table->deselectApp(mail);
    EXPECT_FALSE(checkboxOf(*table->rowViewForApp(mail))->isChecked());
}

TEST_F(KAAppTableControllerTest, ProgressIsShownForOneAndStoppedForAll)
{
    const auto table = tableFor(accountFor({}));
    table->startProgressForApp(table->appAtRow(0));
    table->startProgressForApp(table->appAtRow(2));
    table->stopProgressForApp(table->appAtRow(0));
    EXPECT_FALSE(table->rowViewForRow(0)->isSpinning());
    EXPECT_TRUE(table->rowViewForRow(2)->isSpinning());
    table->startProgressForApp(table->appAtRow(1));
    table->stopProgressForAllApps();
    for (int row = 0; row < 4; ++row)
        EXPECT_FALSE(table->rowViewForRow(row)->isSpinning());
}

TEST_F(KAAppTableControllerTest, ApplicationsAreFoundByBundleIdentifierInTheTablesOrder)
{
    const auto table = tableFor(accountFor({}));
    const QList<Application> found = table->appsWithBundleIDs({kKAParlexAppID, "com.example.none", kKAMailAppID});
    EXPECT_THAT(bundleIDsOf(found), ElementsAre(kKAMailAppID, kKAParlexAppID));
    table->setApps({KAApplication::initWithBundleID({})});
    EXPECT_THAT(table->appsWithBundleIDs({QString(), ""}), IsEmpty());
}

TEST_F(KAAppTableControllerTest, RowsOutsideTheTableHaveNoApplication)
{
    const auto table = tableFor(accountFor({}));
    EXPECT_EQ(table->appAtRow(-1), nullptr);
    EXPECT_EQ(table->appAtRow(table->numberOfRows()), nullptr);
    EXPECT_EQ(table->objectValueForRow(-1), nullptr);
    EXPECT_EQ(table->rowViewForRow(4), nullptr);
    EXPECT_EQ(table->rowViewForApp(nullptr), nullptr);
    EXPECT_EQ(table->objectValueForRow(3), table->apps().last());
}

TEST_F(KAAppTableControllerTest, AnApplicationHasOneRow)
{
    const auto table = tableFor(accountFor({}));
    const Application mail = table->appAtRow(0);
    const auto row = table->rowViewForApp(mail);
    EXPECT_EQ(table->rowViewForApp(mail), row);
    EXPECT_EQ(table->rowViewForRow(0), row);
    EXPECT_EQ(mail->userInfo()->value("rowView").value<std::shared_ptr<KAAppTableRow>>(), row);
    EXPECT_EQ(row->application(), mail);
    EXPECT_EQ(row->delegate(), table.get());
}

TEST_F(KAAppTableControllerTest, AnApplicationWithARowCanBeDescribed)
{
    const auto table = tableFor(accountFor({}));
    (void)table->rowViewForRow(0);
    KAFieldList list;
    table->appAtRow(0)->describeFields(list);
    EXPECT_EQ(list.fields().at(4).name, "_userInfo");
    EXPECT_THAT(list.fields().at(4).value.toStdString(), testing::HasSubstr("rowView"));
    EXPECT_FALSE(table->appAtRow(0)->description().isEmpty());
}

TEST_F(KAAppTableControllerTest, RowsAreMadeWithTheTablesSettings)
{
    const auto table = tableFor(accountFor({}));
    table->setSpinOnSelection(false);
    table->setShowInfoButtons(false);
    EXPECT_FALSE(table->rowViewForRow(0)->spinOnSelection());
    EXPECT_FALSE(table->rowViewForRow(0)->showInfoButton());
    table->setSpinOnSelection(true);
    table->setShowInfoButtons(true);
    EXPECT_FALSE(table->rowViewForRow(0)->spinOnSelection());
    EXPECT_TRUE(table->rowViewForRow(1)->spinOnSelection());
    EXPECT_TRUE(table->rowViewForRow(1)->showInfoButton());
}

TEST_F(KAAppTableControllerTest, ThePluginNamesApplicationAndService)
{
    const auto table = tableFor(accountFor({}));
    const auto row = table->rowViewForRow(0);
    EXPECT_EQ(row->appDisplayName(), "Letters");
    EXPECT_EQ(row->serviceDisplayName(), "Zorbo Mail");
    EXPECT_EQ(row->secondaryText(), "");
    EXPECT_FALSE(row->secondaryText().isNull());
    EXPECT_EQ(table->rowViewForRow(3)->appDisplayName(), "Messages");
}

TEST_F(KAAppTableControllerTest, ARowThatIsMadeHasNamesForScreenReaders)
{
    const auto table = tableFor(conflictingAccount());
    const QCheckBox *const box = checkboxOf(*table->rowViewForRow(0));
    EXPECT_EQ(box->accessibleName(), "Letters (Zorbo Mail)");
    EXPECT_EQ(box->accessibleDescription(), "Not available with your online-service account");
}

TEST_F(KAAppTableControllerTest, APluginThatHasGoneOffersAndNamesNothing)
{
    auto gone = std::make_unique<OfferingPlugin>(QStringList{kKAServiceIMAP});
    const auto table = KAAppTableController::initWithAccount(accountFor({kKAMailPluginID}), gone.get());
    table->setDelegate(gone.get());
    ASSERT_EQ(table->numberOfRows(), 1);
    gone.reset();
    EXPECT_EQ(table->delegate(), nullptr);
    const auto row = table->rowViewForRow(0);
    EXPECT_EQ(row->appDisplayName(), "");
    EXPECT_EQ(row->serviceDisplayName(), "");
    checkboxOf(*row)->click();
    EXPECT_TRUE(checkboxOf(*row)->isChecked());
    table->updateTable();
    EXPECT_THAT(bundleIDsOf(table->selectedApps()), ElementsAre(kKAMailAppID));
}

TEST_F(KAAppTableControllerTest, WithoutAPluginNamesAreEmpty)
{
    const auto table = KAAppTableController::initWithAccount(accountFor({}), nullptr);
    table->setServices({kKAServiceIMAP});
    const auto row = table->rowViewForRow(0);
    EXPECT_EQ(row->appDisplayName(), "");
    EXPECT_FALSE(row->appDisplayName().isNull());
    EXPECT_EQ(row->serviceDisplayName(), "");
    EXPECT_FALSE(row->serviceDisplayName().isNull());
}

TEST_F(KAAppTableControllerTest, AnApplicationWithoutUserInformationIsGivenSome)
{
    const auto table = tableFor(accountFor({}));
    const Application mail = table->appAtRow(0);
    mail->setUserInfo(nullptr);
    const auto row = table->rowViewForApp(mail);
    ASSERT_TRUE(row);
    EXPECT_EQ(table->rowViewForApp(mail), row);
    table->reloadTable();
    table->updateTable();
    table->selectAllApps();
    EXPECT_TRUE(checkboxOf(*row)->isChecked());
}

TEST_F(KAAppTableControllerTest, AConflictingAccountLeavesOnlyChatUsable)
{
    const auto table = tableFor(conflictingAccount({kKAMailPluginID, kKAChatPluginID}));
    for (int row = 0; row < 3; ++row) {
        const auto view = table->rowViewForRow(row);
        EXPECT_TRUE(view->disableControls());
        EXPECT_FALSE(checkboxOf(*view)->isChecked());
        EXPECT_FALSE(checkboxOf(*view)->isEnabled());
        EXPECT_EQ(view->secondaryText(), "Not available with your online-service account");
    }
    const auto chat = table->rowViewForRow(3);
    EXPECT_FALSE(chat->disableControls());
    EXPECT_TRUE(checkboxOf(*chat)->isChecked());
    EXPECT_TRUE(checkboxOf(*chat)->isEnabled());
    EXPECT_EQ(chat->secondaryText(), "");
    EXPECT_THAT(bundleIDsOf(table->selectedApps()), ElementsAre(kKAParlexAppID));
}

TEST_F(KAAppTableControllerTest, ConflictingApplicationsAreOffBeforeTheirRowsAreMade)
{
    const auto table = tableFor(conflictingAccount({kKAMailPluginID, kKAChatPluginID}));
    EXPECT_THAT(bundleIDsOf(table->selectedApps()), ElementsAre(kKAParlexAppID));
    table->updateTable();
    EXPECT_THAT(bundleIDsOf(table->selectedApps()), ElementsAre(kKAParlexAppID));
}

TEST_F(KAAppTableControllerTest, PickingAllLeavesConflictingApplicationsOff)
{
    for (const bool rowsExist : {false, true}) {
        const auto table = tableFor(conflictingAccount());
        for (int row = 0; rowsExist && row < 4; ++row)
            (void)table->rowViewForRow(row);
        table->selectAllApps();
        EXPECT_THAT(bundleIDsOf(table->selectedApps()), ElementsAre(kKAParlexAppID));
        for (int row = 0; row < 3; ++row)
            EXPECT_FALSE(checkboxOf(*table->rowViewForRow(row))->isChecked());
    }
}

TEST_F(KAAppTableControllerTest, OnlyATrueAttributeConflicts)
{
    const auto account = accountFor({});
    account->setProviderAttribute(false, "KAConflictsWithAerwyn");
    EXPECT_FALSE(tableFor(account)->rowViewForRow(0)->disableControls());
}

TEST_F(KAAppTableControllerTest, PropertiesAreKept)
{
    const auto table = KAAppTableController::initWithNibName("AppTable", nullptr);
    const auto account = accountFor({});
    table->setAccount(account);
    table->setShowInfoButtons(true);
    table->setSpinOnSelection(true);
    table->setPairedServices({"a"});
    EXPECT_EQ(table->account(), account);
    EXPECT_TRUE(table->showInfoButtons());
    EXPECT_TRUE(table->spinOnSelection());
    EXPECT_THAT(table->pairedServices(), ElementsAre("a"));
}

TEST_F(KAAppTableControllerTest, FieldsAreListedInTheirOrder)
{
    KAFieldList list;
    tableFor(accountFor({}))->describeFields(list);
    QStringList names;
    for (const KAField &field : list.fields())
        names += field.name;
    EXPECT_THAT(names, ElementsAre("_account", "_apps", "_pairedServices", "_plugin", "_delegate", "_showInfoButtons",
                                   "_spinOnSelection", "_scrollView", "_appTable"));
    EXPECT_EQ(list.fields().at(0).encoding, "@\"KAAccount\"");
    EXPECT_EQ(list.fields().at(3).encoding, "@\"KAAListPlugin\"");
    EXPECT_EQ(list.fields().at(5).encoding, "c");
}

}  // namespace
