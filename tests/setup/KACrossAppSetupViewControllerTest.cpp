// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What the cross-application set-up offers.

#include <kavellaccounts/KACrossAppSetupViewController.h>

#include <QtCore/QFile>
#include <QtGui/QAccessible>

#include <kavellaccounts/KABundle.h>
#include <kavellaccounts/KAFieldList.h>
#include <kavellaccounts/KAProvider.h>

#include "tests/setup/cross_app_fixture.h"

using namespace kavell::test;

namespace {

using KACrossAppSetupViewControllerTest = CrossAppTest;

/// Offered for an account that the mail client has.
std::shared_ptr<Controller> fromMail(const QVariantMap &settings = kAda)
{
    return Controller::initWithSettings(settings, kKAMailAppID);
}

TEST_F(KACrossAppSetupViewControllerTest, SettingsOfNobodyHaveNoViewAndNothingToSetUp)
{
    addProvider();
    const auto controller = fromMail({{"emailAddress", "ada@unclaimed.example"}});
    EXPECT_EQ(controller->view(), nullptr);
    EXPECT_EQ(controller->numberOfAppsNeedingSetup(), 0);
}

TEST_F(KACrossAppSetupViewControllerTest, EmptySettingsAreNobodys)
{
    addProvider();
    EXPECT_EQ(fromMail({})->view(), nullptr);
    EXPECT_EQ(fromMail({})->numberOfAppsNeedingSetup(), 0);
}

TEST_F(KACrossAppSetupViewControllerTest, NoPluginIsAskedBeforeTheFirstQuestion)
{
    addProvider();
    ScriptedDataPlugin &calendars = addDataPlugin(kKACalendarPluginID);
    m_plugins.setSettings(&calendars, "uid-1", {});
    const LogCapture log;
    const auto controller = fromMail();
    EXPECT_EQ(log.messages(), QStringList{});
    EXPECT_EQ(controller->numberOfAppsNeedingSetup(), 3);
    EXPECT_EQ(log.messages(), QStringList{"*** Settings for uid-1 were empty"});
}

TEST_F(KACrossAppSetupViewControllerTest, TheOtherApplicationsAreOfferedInTheirOrder)
{
    addProvider({"kKAServiceIM", "kKAServiceCalDAV", "kKAServiceIMAP", "kKAServiceCardDAV"});
    const auto expectOffered = [&](const QString &source, const QStringList &titles) {
        const auto controller = Controller::initWithSettings(kAda, source);
        EXPECT_EQ(shown(controller->view()), titles);
        EXPECT_EQ(controller->numberOfAppsNeedingSetup(), 3);
    };
    expectOffered(kKAMailAppID, {"Contacts", "Calendars", "Messages"});
    expectOffered(kKACardellAppID, {"Mail", "Calendars", "Messages"});
    expectOffered(kKATidewellAppID, {"Mail", "Contacts", "Messages"});
    expectOffered(kKAParlexAppID, {"Mail", "Contacts", "Calendars"});
}

TEST_F(KACrossAppSetupViewControllerTest, OnlyApplicationsThatUseTheProvidersServicesAreOffered)
{
    addProvider({"kKAServicePOP", "kKAServiceIM", "kKAServicePhotos"});
    const auto controller = fromMail();
    EXPECT_EQ(shown(controller->view()), QStringList{"Messages"});
    EXPECT_EQ(controller->numberOfAppsNeedingSetup(), 1);
}

TEST_F(KACrossAppSetupViewControllerTest, TheSourceAloneLeavesNothingToOffer)
{
    addProvider({"kKAServiceIMAP"});
    const auto controller = fromMail();
    ASSERT_TRUE(controller->view());
    EXPECT_EQ(shown(controller->view()), QStringList{});
    EXPECT_EQ(controller->numberOfAppsNeedingSetup(), 0);
}

TEST_F(KACrossAppSetupViewControllerTest, TheProviderIsFoundByTheFirstOfFourKeys)
{
    addProvider();
    const QVariantMap all{{"emailAddress", "ada@unclaimed.example"},
                          {"incomingMailServer", "zorbo.example"},
                          {"serverAddress", "zorbo.example"},
                          {"KAChatServer", "zorbo.example"},
                          {"userName", "ada"}};
    const auto isFound = [](const QVariantMap &settings) {
        return Controller::initWithSettings(settings, kKAMailAppID)->view() != nullptr;
    };
    EXPECT_FALSE(isFound(all));
    QVariantMap settings = all;
    settings.remove("emailAddress");
    EXPECT_TRUE(isFound(settings));
    settings["incomingMailServer"] = "unclaimed.example";
    EXPECT_FALSE(isFound(settings));
    settings.remove("incomingMailServer");
    EXPECT_TRUE(isFound(settings));
    settings["serverAddress"] = "unclaimed.example";
    EXPECT_FALSE(isFound(settings));
    settings.remove("serverAddress");
    EXPECT_TRUE(isFound(settings));
    settings["KAChatServer"] = "unclaimed.example";
    EXPECT_FALSE(isFound(settings));
}

TEST_F(KACrossAppSetupViewControllerTest, AnAddressIsLookedAtFromItsHostAndAServerUpToItsPath)
{
    addProvider();
    EXPECT_TRUE(fromMail({{"emailAddress", "Ada@ZORBO.example"}})->view());
    EXPECT_TRUE(fromMail({{"serverAddress", "ZORBO.example/dav/"}, {"userName", "ada"}})->view());
    EXPECT_TRUE(fromMail({{"incomingMailServer", "ada@zorbo.example"}, {"userName", "ada"}})->view());
    EXPECT_FALSE(fromMail({{"emailAddress", "ada@"}})->view());
    EXPECT_FALSE(fromMail({{"emailAddress", ""}, {"serverAddress", "zorbo.example"}})->view());
}

TEST_F(KACrossAppSetupViewControllerTest, AValueThatIsNoTextIsPassedOver)
{
    addProvider();
    EXPECT_TRUE(fromMail({{"emailAddress", 5}, {"serverAddress", "zorbo.example"}, {"userName", "ada"}})->view());
}

TEST_F(KACrossAppSetupViewControllerTest, AClaimingPluginWithoutAProviderClaimsForNobody)
{
    addListPlugin({.identifier = kKAYahooPluginID, .domains = {"zorbo.example"}});
    EXPECT_EQ(fromMail()->view(), nullptr);
}

TEST_F(KACrossAppSetupViewControllerTest, AMissingProviderIsLookedForAgain)
{
    const auto controller = fromMail();
    EXPECT_EQ(controller->numberOfAppsNeedingSetup(), 0);
    addProvider();
    EXPECT_EQ(controller->numberOfAppsNeedingSetup(), 3);
    EXPECT_EQ(shown(controller->view()), QStringList({"Contacts", "Calendars", "Messages"}));
}

TEST_F(KACrossAppSetupViewControllerTest, AMissingIdentifierIsNotLookedForAgain)
{
    addProvider();
    const auto controller = fromMail({{"serverAddress", "zorbo.example"}});  // of a provider, but of no user
    EXPECT_EQ(controller->view(), nullptr);
    controller->setSettings(kAda);
    ASSERT_TRUE(controller->view());
    EXPECT_EQ(shown(controller->view()), QStringList{});
    EXPECT_EQ(controller->numberOfAppsNeedingSetup(), 0);
}

TEST_F(KACrossAppSetupViewControllerTest, AnApplicationThatHasTheAccountIsTickedAndDisabled)
{
    addProvider();
    ScriptedDataPlugin &calendars = addDataPlugin(kKACalendarPluginID);
    m_plugins.setSettings(&calendars, "uid-1", kAda);
    const auto controller = fromMail();
    EXPECT_EQ(shown(controller->view()), QStringList({"Contacts", "Calendars (there)", "Messages"}));
    EXPECT_EQ(controller->numberOfAppsNeedingSetup(), 2);
}

TEST_F(KACrossAppSetupViewControllerTest, AnAccountMatchesByUserAndProviderAndNotByItsAddressAlone)
{
    addProvider();
    m_plugins.setSettings(&addDataPlugin(kKACalendarPluginID), "uid-1",
                          {{"userName", "ada"}, {"serverAddress", "zorbo.example/dav"}});
    m_plugins.setSettings(&addDataPlugin(kKAContactsPluginID), "uid-2", {{"emailAddress", "bea@zorbo.example"}});
    EXPECT_EQ(shown(fromMail()->view()), QStringList({"Contacts", "Calendars (there)", "Messages"}));
}

TEST_F(KACrossAppSetupViewControllerTest, AnInactiveAccountIsToBeSetUp)
{
    addProvider();
    ScriptedDataPlugin &calendars = addDataPlugin(kKACalendarPluginID);
    m_plugins.setSettings(&calendars, "uid-1", {{"emailAddress", "ada@zorbo.example"}, {"inactive", true}});
    const auto controller = fromMail();
    EXPECT_EQ(shown(controller->view()), QStringList({"Contacts", "Calendars", "Messages"}));
    EXPECT_EQ(controller->numberOfAppsNeedingSetup(), 3);
}

TEST_F(KACrossAppSetupViewControllerTest, AFalseInactiveMarkIsNone)
{
    addProvider();
    ScriptedDataPlugin &calendars = addDataPlugin(kKACalendarPluginID);
    m_plugins.setSettings(&calendars, "uid-1", {{"emailAddress", "ada@zorbo.example"}, {"inactive", false}});
    EXPECT_EQ(fromMail()->numberOfAppsNeedingSetup(), 2);
}

TEST_F(KACrossAppSetupViewControllerTest, TheLaterOfTwoMatchesCounts)
{
    addProvider();
    const QVariantMap inactive{{"emailAddress", "ada@zorbo.example"}, {"inactive", true}};
    ScriptedDataPlugin &calendars = addDataPlugin(kKACalendarPluginID);
    m_plugins.setSettings(&calendars, "uid-1", kAda);
    m_plugins.setSettings(&calendars, "uid-2", inactive);
    ScriptedDataPlugin &contacts = addDataPlugin(kKAContactsPluginID);
    m_plugins.setSettings(&contacts, "uid-1", inactive);
    m_plugins.setSettings(&contacts, "uid-2", kAda);
    EXPECT_EQ(shown(fromMail()->view()), QStringList({"Contacts (there)", "Calendars", "Messages"}));
}

TEST_F(KACrossAppSetupViewControllerTest, AnAccountThatThePluginsProviderHoldsIsPassedOver)
{
    addProvider();
    const auto held = newAccount("ada", kKAProviderTidewell);
    commit(held);
    ScriptedDataPlugin &calendars = addDataPlugin(kKACalendarPluginID, kKAProviderTidewell);
    ASSERT_TRUE(calendars.provider()->accountWithUID(held->uid()));
    m_plugins.setSettings(&calendars, held->uid(), kAda);
    EXPECT_EQ(fromMail()->numberOfAppsNeedingSetup(), 3);
    m_plugins.setSettings(&calendars, "another", kAda);
    EXPECT_EQ(fromMail()->numberOfAppsNeedingSetup(), 2);
}

TEST_F(KACrossAppSetupViewControllerTest, EmptySettingsOfAnAccountAreLoggedAndPassedOver)
{
    addProvider();
    ScriptedDataPlugin &calendars = addDataPlugin(kKACalendarPluginID);
    m_plugins.setSettings(&calendars, "uid-1", {});
    m_plugins.setSettings(&calendars, "uid-2", kAda);
    const LogCapture log;
    EXPECT_EQ(fromMail()->numberOfAppsNeedingSetup(), 2);
    EXPECT_EQ(log.messages(), QStringList{"*** Settings for uid-1 were empty"});
}

TEST_F(KACrossAppSetupViewControllerTest, AMatchOfAPluginWithoutAnApplicationIsNobodys)
{
    addProvider();
    m_plugins.setSettings(&addDataPlugin("org.zorbo.notes.kaplugin"), "uid-1", kAda);
    const auto controller = fromMail();
    EXPECT_EQ(controller->numberOfAppsNeedingSetup(), 3);
    KAFieldList list;
    controller->describeFields(list);
    EXPECT_EQ(list.fields()[6].name, "_existingAccounts");
    EXPECT_EQ(list.fields()[6].value, "{}");
}

TEST_F(KACrossAppSetupViewControllerTest, TheSourcesOwnPluginIsNotSearched)
{
    addProvider();
    m_plugins.setSettings(&addDataPlugin(kKAMailPluginID), "uid-1", {});
    const LogCapture log;
    EXPECT_EQ(fromMail()->numberOfAppsNeedingSetup(), 3);
    EXPECT_EQ(log.messages(), QStringList{});
}

TEST_F(KACrossAppSetupViewControllerTest, AnyMarkOfDisabledMailKeepsTheMailClientOut)
{
    addProvider();
    for (const QVariant &mark : {QVariant("yes"), QVariant("no"), QVariant(false), QVariant("")}) {
        QVariantMap settings = kAda;
        settings["mailDisabled"] = mark;
        EXPECT_EQ(shown(Controller::initWithSettings(settings, kKACardellAppID)->view()),
                  QStringList({"Calendars", "Messages"}));
    }
}

TEST_F(KACrossAppSetupViewControllerTest, FourCandidatesShareThreeCheckBoxes)
{
    addProvider();
    const LogCapture log;
    const auto controller = Controller::initWithSettings(kAda, "org.zorbo.assistant");
    EXPECT_EQ(controller->numberOfAppsNeedingSetup(), 4);
    EXPECT_EQ(log.messages(), QStringList{});
    EXPECT_EQ(shown(controller->view()), QStringList({"Mail", "Contacts", "Calendars"}));
    EXPECT_EQ(log.messages(), QStringList{"*** No check box is left for com.corvane.Parlex"});
}

TEST_F(KACrossAppSetupViewControllerTest, EachViewSetsTheCheckBoxesUpAnew)
{
    addProvider();
    const auto controller = fromMail();
    QWidget *const view = controller->view();
    click(checkboxes(view)[0]);
    checkboxes(view)[1]->setEnabled(false);
    EXPECT_EQ(shown(view), QStringList({"-Contacts", "Calendars (there)", "Messages"}));
    EXPECT_EQ(controller->view(), view);
    EXPECT_EQ(shown(view), QStringList({"Contacts", "Calendars", "Messages"}));
}

TEST_F(KACrossAppSetupViewControllerTest, SettingsAndSourceAreItsOwn)
{
    QVariantMap settings = kAda;
    const auto controller = fromMail(settings);
    settings["emailAddress"] = "bea@zorbo.example";
    EXPECT_EQ(controller->settings(), kAda);
    EXPECT_EQ(controller->appBundleID(), "com.corvane.mail");
    controller->setAppBundleID(kKACardellAppID);
    controller->setSettings(settings);
    EXPECT_EQ(controller->appBundleID(), "com.corvane.Cardell");
    EXPECT_EQ(controller->settings(), settings);
}

TEST_F(KACrossAppSetupViewControllerTest, SettingsOfAnOrdinaryProviderAreNotAddedTo)
{
    addProvider();
    const auto controller = fromMail();
    EXPECT_TRUE(controller->view());
    EXPECT_EQ(controller->settings(), kAda);
}

TEST_F(KACrossAppSetupViewControllerTest, AMissingInterfaceIsLoggedAndTheControllerWorksWithoutAView)
{
    addProvider();
    const LogCapture log;
    const auto controller = Controller::initWithNibName("Nowhere", nullptr);
    EXPECT_EQ(log.messages(), QStringList{"*** Couldn't load nib Nowhere"});
    ASSERT_TRUE(controller);
    controller->setSettings(kAda);
    controller->setAppBundleID(kKAMailAppID);
    EXPECT_EQ(controller->view(), nullptr);
    EXPECT_EQ(controller->numberOfAppsNeedingSetup(), 3);
    EXPECT_TRUE(controller->createAccounts());
    EXPECT_EQ(log.messages(), QStringList{"*** Couldn't load nib Nowhere"});
}

TEST_F(KACrossAppSetupViewControllerTest, TheInterfaceOfAnotherBundleMayHaveFewerCheckBoxes)
{
    addProvider();
    const QString bundle = m_plugins.path() + u'/' + kKAYahooPluginID;
    QFile file(bundle + "/Contents/Resources/Small.ui");
    ASSERT_TRUE(file.open(QIODevice::WriteOnly));
    file.write(R"(<ui version="4.0"><widget class="QWidget" name="view">
                  <widget class="QCheckBox" name="checkbox2"/></widget></ui>)");
    file.close();
    const LogCapture log;
    const auto controller = Controller::initWithNibName("Small", KABundle::bundleWithPath(bundle));
    EXPECT_EQ(log.messages().size(), 2);  // for each of the outlets that are missing
    controller->setSettings(kAda);
    controller->setAppBundleID(kKAMailAppID);
    QWidget *const view = controller->view();
    ASSERT_TRUE(view);
    EXPECT_EQ(view->findChild<QCheckBox *>("checkbox2")->text(), "Contacts");
    EXPECT_EQ(log.messages().mid(2), QStringList({"*** No check box is left for com.corvane.Tidewell",
                                                  "*** No check box is left for com.corvane.Parlex"}));
}

TEST_F(KACrossAppSetupViewControllerTest, TheKeyboardAndAssistiveToolsReachTheCheckBoxesInOrder)
{
    addProvider();
    const auto controller = fromMail();
    QWidget *const view = controller->view();
    view->show();
    view->activateWindow();
    ASSERT_TRUE(QTest::qWaitForWindowActive(view));
    QStringList names;
    for (QCheckBox *box : checkboxes(view))
        names += QAccessible::queryAccessibleInterface(box)->text(QAccessible::Name);
    EXPECT_EQ(names, QStringList({"Contacts", "Calendars", "Messages"}));
    checkboxes(view)[0]->setFocus();
    QTest::keyClick(view, Qt::Key_Tab);
    EXPECT_TRUE(checkboxes(view)[1]->hasFocus());
    QTest::keyClick(checkboxes(view)[1], Qt::Key_Space);
    EXPECT_FALSE(checkboxes(view)[1]->isChecked());
    QTest::keyClick(view, Qt::Key_Tab);
    EXPECT_TRUE(checkboxes(view)[2]->hasFocus());
}

TEST_F(KACrossAppSetupViewControllerTest, TheCheckBoxesStandInAColumnThatMirrorsForRightToLeftText)
{
    addProvider();
    const auto controller = fromMail();
    QWidget *const view = controller->view();
    view->resize(400, 200);
    view->setLayoutDirection(Qt::RightToLeft);
    view->show();
    const QList<QCheckBox *> boxes = checkboxes(view);
    EXPECT_EQ(boxes[0]->layoutDirection(), Qt::RightToLeft);
    EXPECT_LT(boxes[0]->y(), boxes[1]->y());
    EXPECT_LT(boxes[1]->y(), boxes[2]->y());
    EXPECT_EQ(boxes[0]->geometry().right(), boxes[2]->geometry().right());
    QTest::mouseClick(boxes[0], Qt::LeftButton, {}, QPoint(boxes[0]->width() - 8, boxes[0]->height() / 2));
    EXPECT_FALSE(boxes[0]->isChecked());
}

TEST_F(KACrossAppSetupViewControllerTest, FieldsAreShownInTheirOrder)
{
    addProvider({"kKAServiceIMAP", "kKAServiceCalDAV"});
    m_plugins.setSettings(&addDataPlugin(kKACalendarPluginID), "uid-1", kAda);
    const auto controller = fromMail();
    const auto rows = [&](auto &&part) {
        KAFieldList list;
        controller->describeFields(list);
        QStringList texts;
        for (const KAField &field : list.fields())
            texts += part(field);
        return texts;
    };
    const auto names = [](const KAField &field) {
        return field.name + ' ' + field.encoding;
    };
    const auto values = [](const KAField &field) {
        return field.value;
    };
    EXPECT_EQ(rows(names),
              QStringList({"_appBundleID @\"QString\"", "_settings @\"QVariantMap\"", "_delegate @\"QObject\"",
                           "_contextInfo ^v", "_providerID @\"QString\"", "_accountID @\"QString\"",
                           "_existingAccounts @\"QVariantMap\"", "_checkboxes @\"QVariantMap\"",
                           "_apps @\"QVariantMap\"", "_view @\"QWidget\"", "_checkbox1 @\"QCheckBox\"",
                           "_checkbox2 @\"QCheckBox\"", "_checkbox3 @\"QCheckBox\""}));
    EXPECT_EQ(rows(values)[4], "(null)");
    ASSERT_TRUE(controller->view());
    EXPECT_EQ(rows(values)[0], "com.corvane.mail");
    EXPECT_EQ(rows(values)[4], "com.corvane.account.yahoo");
    EXPECT_EQ(rows(values)[5], "ada@com.corvane.account.yahoo");
    EXPECT_TRUE(rows(values)[6].contains("com.corvane.Tidewell")) << rows(values)[6].toStdString();
    EXPECT_TRUE(rows(values)[7].startsWith("{com.corvane.Tidewell = <QCheckBox: 0x")) << rows(values)[7].toStdString();
    EXPECT_TRUE(rows(values)[8].startsWith("{com.corvane.Tidewell = <KAApplication: 0x"))
        << rows(values)[8].toStdString();
    EXPECT_EQ(controller->className(), "KACrossAppSetupViewController");
}

}  // namespace
