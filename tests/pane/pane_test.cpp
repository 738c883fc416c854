// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The pane as a person uses it: what it lists, shows and changes, and what it does when another process changes something.

#include "pane/pane_window.h"

#include <kavellaccounts/KAApplication.h>
#include <kavellaccounts/KANotificationCenter.h>
#include <kavellaccounts/KAProvider.h>

#include "tests/pane/pane_fixture.h"

namespace kavell::test {

namespace {

using testing::ElementsAre;
using testing::IsEmpty;

class Pane : public PaneTest {};

TEST_F(Pane, EmptyRegistrySaysWhatToDo)
{
    openPane();
    EXPECT_THAT(listed(), IsEmpty());
    EXPECT_TRUE(visible<QPushButton>("addFirstAccount"));
    EXPECT_FALSE(window().findChild<QPushButton *>("removeAccount")->isEnabled());
}

TEST_F(Pane, AccountsStandBelowTheirProvidersAndUnknownKindsComeLast)
{
    storedAccount("carla");
    storedAccount("ada");
    storedAccount("zoe@example.org", kKAProviderGoogle);
    openPane();
    EXPECT_THAT(listed(), ElementsAre("Test Kind", "  ada", "  carla", "Google", "  zoe@example.org"));
}

TEST_F(Pane, FirstAccountIsShownWithItsDetails)
{
    const auto account = storedAccount("ada");
    account->setFullName("Ada Example");
    commit(account);
    openPane();
    waitForPage("ada");
    EXPECT_EQ(visible<QLabel>("accountSubtitle")->text(), "Test Kind – ada");
    EXPECT_TRUE(visible<QCheckBox>("accountEnabled")->isChecked());
    EXPECT_EQ(visible<QLineEdit>("accountDescription")->placeholderText(), "A test account");
    EXPECT_EQ(kind().property("selected").toString(), "ada");
}

TEST_F(Pane, AccountsWithoutPluginCanBeLookedAtAndSayWhatIsMissing)
{
    storedAccount("zoe@example.org", kKAProviderGoogle);
    openPane();
    waitForPage("zoe@example.org");
    ASSERT_TRUE(visible<QLabel>("noApplications"));
    EXPECT_EQ(
        visible<QLabel>("noApplications")->text(),
        "The plug-in for this kind of account is not installed, so its applications cannot be chosen here. You can "
        "still change its description and password, and remove it.");
}

TEST_F(Pane, DescriptionIsSavedOnReturn)
{
    storedAccount("ada");
    openPane();
    waitForPage("ada");
    QTest::keyClicks(visible<QLineEdit>("accountDescription"), "Work");
    QTest::keyClick(visible<QLineEdit>("accountDescription"), Qt::Key_Return);
    waitForPage("Work");
    EXPECT_THAT(listed(), ElementsAre("Test Kind", "  Work"));
    EXPECT_EQ(newAccount("ada", kKindType)->providerAttributeForKey(KAMailAccountDescriptionKey), "Work");
}

TEST_F(Pane, EnableSwitchIsSavedAndShownInTheList)
{
    storedAccount("ada");
    openPane();
    waitForPage("ada");
    click<QCheckBox>("accountEnabled");
    waitFor([] { return !newAccount("ada", kKindType)->accountIsEnabled(); }, "the account to be off");
    waitFor(
        [&] {
            const auto *model = list().model();
            return model->index(0, 0, model->index(0, 0)).data(Qt::AccessibleTextRole) == QStringLiteral("ada, Off");
        },
        "the list");
    EXPECT_FALSE(visible<QCheckBox>("accountEnabled")->isChecked());
}

TEST_F(Pane, AnotherProcessAddsChangesAndRemovesWhileItIsShown)
{
    storedAccount("ada", kKAProviderGoogle);
    openPane();
    runClient({"add", "google", "bob"});
    waitFor([&] { return listed() == QStringList{"Google", "  ada", "  bob"}; }, "the new account");
    runClient({"set", "google", "ada", "accountDescription=Home"});
    waitForPage("Home");
    runClient({"remove", "google", "ada", "--yes"});
    waitFor([&] { return listed() == QStringList{"Google", "  bob"}; }, "the removal");
    waitForPage("bob");
}

TEST_F(Pane, WhatIsBeingTypedSurvivesAnotherProcessesChange)
{
    storedAccount("ada", kKAProviderGoogle);
    openPane();
    waitForPage("ada");
    QTest::keyClicks(visible<QLineEdit>("accountDescription"), "Wo");
    runClient({"set", "google", "ada", "fullname=Ada"});
    waitFor(
        [&] {
            const auto labels = window().findChildren<QLabel *>();
            return std::any_of(labels.begin(), labels.end(),
                               [](const QLabel *label) { return label->text() == "Ada"; });
        },
        "the full name among the details");
    EXPECT_EQ(visible<QLineEdit>("accountDescription")->text(), "Wo");
}

TEST_F(Pane, ApplicationIsSwitchedOnAndOffByItsCheckBox)
{
    storedAccount("ada");
    openPane();
    waitForPage("ada");
    waitFor([&] { return applicationCheckBox(kKAMailAppID) != nullptr; }, "the table");
    QTest::mouseClick(applicationCheckBox(kKAMailAppID), Qt::LeftButton);
    EXPECT_TRUE(newAccount("ada", kKindType)->enabledForApplication(kKAMailAppID));
    waitFor([&] { return applicationCheckBox(kKAMailAppID)->isVisible(); }, "the spinner's end");
    EXPECT_TRUE(applicationCheckBox(kKAMailAppID)->isChecked());
    QTest::mouseClick(applicationCheckBox(kKAMailAppID), Qt::LeftButton);
    EXPECT_FALSE(newAccount("ada", kKindType)->enabledForApplication(kKAMailAppID));
    EXPECT_FALSE(applicationCheckBox(kKAMailAppID)->isChecked());
}

TEST_F(Pane, SlowApplicationSpinsUntilTheAccountSaysSo)
{
    storedAccount("ada");
    openPane();
    waitForPage("ada");
    waitFor([&] { return applicationCheckBox(kKAMailAppID) != nullptr; }, "the table");
    kind().setProperty("switching", "later");
    QTest::mouseClick(applicationCheckBox(kKAMailAppID), Qt::LeftButton);
    EXPECT_FALSE(applicationCheckBox(kKAMailAppID)->isVisible());
    waitFor([&] { return applicationCheckBox(kKAMailAppID)->isVisible(); }, "the spinner's end");
    EXPECT_TRUE(applicationCheckBox(kKAMailAppID)->isChecked());
}

/// As a plug-in posts it when it is done with an order that came to nothing.
void postChanged(const std::shared_ptr<KAAccount> &account)
{
    KANotificationCenter::shared().post(KAChangedAccountsNotification,
                                        QVariant::fromValue(QList<std::shared_ptr<KAAccount>>{account}));
}

TEST_F(Pane, SpinnerEndsWhenThePluginSaysThatItIsDoneWithThisAccount)
{
    const auto ada = storedAccount("ada");
    const auto bob = storedAccount("bob");
    openPane();
    waitForPage("ada");
    waitFor([&] { return applicationCheckBox(kKAMailAppID) != nullptr; }, "the table");
    kind().setProperty("switching", "never");
    QTest::mouseClick(applicationCheckBox(kKAMailAppID), Qt::LeftButton);
    postChanged(bob);
    QCoreApplication::sendPostedEvents();
    EXPECT_FALSE(applicationCheckBox(kKAMailAppID)->isVisible());
    postChanged(ada);
    waitFor([&] { return applicationCheckBox(kKAMailAppID)->isVisible(); }, "the spinner's end");
    EXPECT_FALSE(applicationCheckBox(kKAMailAppID)->isChecked());
}

TEST_F(Pane, FailingPluginIsNamedAndTheCheckBoxGoesBack)
{
    storedAccount("ada");
    openPane();
    waitForPage("ada");
    waitFor([&] { return applicationCheckBox(kKAMailAppID) != nullptr; }, "the table");
    kind().setProperty("switching", "throws");
    QTest::mouseClick(applicationCheckBox(kKAMailAppID), Qt::LeftButton);
    EXPECT_EQ(notice(), "The plug-in of Test Kind failed: no such luck");
    EXPECT_TRUE(applicationCheckBox(kKAMailAppID)->isVisible());
    EXPECT_FALSE(applicationCheckBox(kKAMailAppID)->isChecked());
}

TEST_F(Pane, AccountIsAddedThroughThePluginsSheetAndSwitchedOnWherePicked)
{
    openPane();
    click("addFirstAccount");
    click("continue");
    waitFor([] { return visible<QLineEdit>("address") != nullptr; }, "the plug-in's sheet");
    QTest::keyClicks(visible<QLineEdit>("address"), "ada@example.org");
    click("addTyped");
    waitForPage("ada@example.org");
    EXPECT_THAT(listed(), ElementsAre("Test Kind", "  ada@example.org"));
    waitFor([] { return newAccount("ada@example.org", kKindType)->enabledForApplication(kKAMailAppID); },
            "the picked application");
    EXPECT_EQ(notice(), QString());
}

TEST_F(Pane, LikelyDuplicateIsPointedOutAndKept)
{
    storedAccount("Ada@Example.org", kKAProviderGoogle);
    openPane();
    click("addAccount");
    click("continue");
    waitFor([] { return visible<QLineEdit>("address") != nullptr; }, "the plug-in's sheet");
    QTest::keyClicks(visible<QLineEdit>("address"), "ada@example.org");
    click("addTyped");
    waitForPage("ada@example.org");
    EXPECT_EQ(notice(),
              "ada@example.org looks like the account Ada@Example.org at Google, which you already have. Keep "
              "both, or remove the one that you do not need.");
    EXPECT_THAT(listed(), ElementsAre("Test Kind", "  ada@example.org", "Google", "  Ada@Example.org"));
    click("noticeAction");
    waitForPage("Ada@Example.org");
}

TEST_F(Pane, AddingWhatIsThereAlreadySaysSo)
{
    storedAccount("ada@example.org");
    openPane();
    click("addAccount");
    click("continue");
    waitFor([] { return visible<QLineEdit>("address") != nullptr; }, "the plug-in's sheet");
    QTest::keyClicks(visible<QLineEdit>("address"), "ada@example.org");
    click("addTyped");
    waitFor([&] { return !notice().isNull(); }, "the notice");
    EXPECT_EQ(notice(), "You already had the account ada@example.org. It has been brought up to date.");
    EXPECT_THAT(listed(), ElementsAre("Test Kind", "  ada@example.org"));
}

TEST_F(Pane, RemovalAsksFirstAndReturnDoesNotAgree)
{
    storedAccount("ada");
    openPane();
    waitForPage("ada");
    click("removeAccount");
    waitFor([] { return visible<QPushButton>("disagree") != nullptr; }, "the question");
    QTest::keyClick(QApplication::activeModalWidget(), Qt::Key_Return);
    waitFor([] { return visible<QPushButton>("disagree") == nullptr; }, "the question's end");
    EXPECT_THAT(listed(), ElementsAre("Test Kind", "  ada"));
}

TEST_F(Pane, RemovalSwitchesApplicationsOffAndTakesThePasswordAlong)
{
    const auto account = storedAccount("ada");
    ASSERT_TRUE(account->setPassword("secret"));
    account->addChildAccountDict(
        KAAccount::childDictionaryWithSettings({}, account->uid() + kKAMailPluginID, kKAMailPluginID),
        account->uid() + kKAMailPluginID);
    commit(account);
    const auto item = adopt(account->cofferelItem());
    openPane();
    waitForPage("ada");
    click("removeAccount");
    click("agree");
    waitFor([&] { return listed().isEmpty(); }, "the removal");
    EXPECT_THAT(KAProvider::initWithProviderType(kKindType)->accounts(), IsEmpty());
    EXPECT_EQ(CSKavellCofferelItemCopySecret(item.get(), nullptr), kCSKavellCofferelStatusAbsent);
    EXPECT_EQ(notice(), QString());
    EXPECT_TRUE(visible<QPushButton>("addFirstAccount"));
}

TEST_F(Pane, PasswordIsSetShownAndRemoved)
{
    storedAccount("ada");
    openPane();
    waitForPage("ada");
    const auto state = [] {
        return visible<QLabel>("passwordState")->text();
    };
    waitFor([&] { return state() == "No password is stored."; }, "the password's state");
    click("setPassword");
    waitFor([] { return visible<QLineEdit>("newPassword") != nullptr; }, "the dialog");
    EXPECT_EQ(visible<QLineEdit>("newPassword")->echoMode(), QLineEdit::Password);
    QTest::keyClicks(visible<QLineEdit>("newPassword"), "correct horse");
    click("savePassword");
    waitFor([&] { return state() == "A password is stored."; }, "the password to be stored");
    EXPECT_EQ(newAccount("ada", kKindType)->password(), "correct horse");
    click("showPassword");
    waitFor([] { return visible<QLineEdit>("revealedPassword") != nullptr; }, "the password");
    EXPECT_EQ(visible<QLineEdit>("revealedPassword")->text(), "correct horse");
    click("removePassword");
    click("agree");
    waitFor([&] { return state() == "No password is stored."; }, "the password to be gone");
    EXPECT_FALSE(visible<QLineEdit>("revealedPassword"));
    EXPECT_EQ(newAccount("ada", kKindType)->password(), QString());
}

TEST_F(Pane, RefreshAsksTheCredentialStoreAgain)
{
    const auto account = storedAccount("ada");
    ASSERT_TRUE(account->setPassword("secret"));
    commit(account);
    openPane();
    waitForPage("ada");
    const auto state = [] {
        return visible<QLabel>("passwordState")->text();
    };
    waitFor([&] { return state() == "A password is stored."; }, "the password's state");
    // The store's own tools take it away, which the account does not tell.
    const auto item = adopt(account->cofferelItem());
    ASSERT_EQ(CSKavellCofferelItemDelete(item.get()), kCSKavellCofferelStatusStored);
    QApplication::setActiveWindow(&window());
    QTest::keyClick(&window(), Qt::Key_F5);
    waitFor([&] { return state() == "No password is stored."; }, "the new state");
}

TEST_F(Pane, EveryControlHasANameForScreenReaders)
{
    storedAccount("ada");
    openPane();
    waitForPage("ada");
    // Rows of the table are made in idle time and name themselves when they are drawn.
    waitFor(
        [&] {
            const QCheckBox *const last = applicationCheckBox(kKAParlexAppID);
            return last && !last->accessibleName().isEmpty();
        },
        "the last row");
    for (QWidget *control : window().findChildren<QWidget *>()) {
        if (control->focusPolicy() == Qt::NoFocus || !control->isVisible())
            continue;
        if (qobject_cast<QAbstractScrollArea *>(control) && !qobject_cast<QAbstractItemView *>(control))
            continue;
        QAccessibleInterface *const interface = QAccessible::queryAccessibleInterface(control);
        ASSERT_TRUE(interface);
        const bool isNamed = !interface->text(QAccessible::Name).isEmpty() || qobject_cast<QLabel *>(control);
        EXPECT_TRUE(isNamed) << control->metaObject()->className() << " " << control->objectName().toStdString();
    }
}

}  // namespace

}  // namespace kavell::test
