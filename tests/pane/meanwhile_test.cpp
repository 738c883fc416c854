// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What happens in other programs while the user is busy in the pane, and how the pane keeps the two apart.

#include <filesystem>
#include <unistd.h>

#include <kavellaccounts/KAProvider.h>

#include "pane/account_registry.h"
#include "tests/pane/pane_fixture.h"

namespace kavell::test {

namespace {

using testing::ElementsAre;

class Meanwhile : public PaneTest {
protected:
    static QVariant descriptionOf(const QString &loginName)
    {
        return newAccount(loginName, kKindType)->providerAttributeForKey(KAMailAccountDescriptionKey);
    }

    /// Two accounts with a password each; the pane shows the first.
    void openPaneWithPasswords()
    {
        for (const QString &name : {QString("ada"), QString("bob")}) {
            const auto account = storedAccount(name);
            ASSERT_TRUE(account->setPassword("secret of " + name));
            commit(account);
        }
        openPane();
        waitForPage("ada");
        waitFor([] { return visible<QPushButton>("removePassword")->isEnabled(); }, "the password's state");
    }
};

TEST_F(Meanwhile, NewPasswordOfAnAccountThatGoesDoesNotReachTheNextOne)
{
    openPaneWithPasswords();
    click("setPassword");
    waitFor([] { return visible<QLineEdit>("newPassword") != nullptr; }, "the dialog");
    QTest::keyClicks(visible<QLineEdit>("newPassword"), "correct horse");
    removeElsewhere("ada");
    waitForPage("bob");
    click("savePassword");
    waitFor([&] { return !notice().isNull(); }, "the notice");
    EXPECT_EQ(notice(), "The account ada has been removed by another program.");
    EXPECT_EQ(newAccount("bob", kKindType)->password(), "secret of bob");
}

TEST_F(Meanwhile, QuestionForThePasswordOfAnAccountThatGoesDoesNotTouchTheNextOne)
{
    openPaneWithPasswords();
    click("removePassword");
    waitFor([] { return visible<QPushButton>("agree") != nullptr; }, "the question");
    removeElsewhere("ada");
    waitForPage("bob");
    click("agree");
    waitFor([&] { return !notice().isNull(); }, "the notice");
    EXPECT_EQ(newAccount("bob", kKindType)->password(), "secret of bob");
}

TEST_F(Meanwhile, QuestionForRemovingAnAccountThatGoesDoesNotTouchTheNextOne)
{
    storedAccount("ada");
    storedAccount("bob");
    openPane();
    waitForPage("ada");
    click("removeAccount");
    waitFor([] { return visible<QPushButton>("agree") != nullptr; }, "the question");
    removeElsewhere("ada");
    waitForPage("bob");
    click("agree");
    pane::backgroundThreads().waitForDone();
    QCoreApplication::processEvents();
    EXPECT_THAT(listed(), ElementsAre("Test Kind", "  bob"));
    EXPECT_EQ(KAProvider::initWithProviderType(kKindType)->accounts().size(), 1);
    EXPECT_EQ(notice(), QString());
}

TEST_F(Meanwhile, TypedDescriptionIsSavedWhenAnotherAccountIsSelected)
{
    storedAccount("ada");
    storedAccount("bob");
    openPane();
    waitForPage("ada");
    QTest::keyClicks(visible<QLineEdit>("accountDescription"), "Work");
    list().selectAccount({kKindType, "bob"});
    waitForPage("bob");
    EXPECT_EQ(visible<QLineEdit>("accountDescription")->text(), "");
    waitFor([] { return descriptionOf("ada") == "Work"; }, "the description");
    EXPECT_EQ(descriptionOf("bob"), QVariant());
}

TEST_F(Meanwhile, TypedDescriptionIsSavedWhenTheWindowIsClosed)
{
    storedAccount("ada");
    openPane();
    waitForPage("ada");
    QTest::keyClicks(visible<QLineEdit>("accountDescription"), "Work");
    closePane();
    EXPECT_EQ(descriptionOf("ada"), "Work");
}

TEST_F(Meanwhile, LastOfQuickChangesIsTheOneThatStays)
{
    storedAccount("ada");
    openPane();
    waitForPage("ada");
    for (int round = 0; round < 10; ++round) {
        QTest::keyClick(visible<QCheckBox>("accountEnabled"), Qt::Key_Space);
        visible<QLineEdit>("accountDescription")->clear();
        QTest::keyClicks(visible<QLineEdit>("accountDescription"), QString::number(round));
        QTest::keyClick(visible<QLineEdit>("accountDescription"), Qt::Key_Return);
    }
    const bool isChecked = visible<QCheckBox>("accountEnabled")->isChecked();
    waitFor(
        [&] { return descriptionOf("ada") == "9" && newAccount("ada", kKindType)->accountIsEnabled() == isChecked; },
        "the last change");
    waitForPage("9");
    EXPECT_EQ(visible<QCheckBox>("accountEnabled")->isChecked(), isChecked);
}

TEST_F(Meanwhile, OpenDialogsAndSheetsEndWithTheWindow)
{
    storedAccount("ada");
    openPane();
    waitForPage("ada");
    click("addAccount");
    click("continue");
    waitFor([] { return visible<QLineEdit>("address") != nullptr; }, "the plug-in's sheet");
    closePane();
    EXPECT_FALSE(visible<QLineEdit>("address"));
    for (const char *button : {"setPassword", "removeAccount", "addAccount"}) {
        openPane();
        waitForPage("ada");
        click(button);
        waitFor([] { return QApplication::activeModalWidget() != nullptr; }, "the dialog");
        closePane();
        EXPECT_FALSE(QApplication::activeModalWidget());
    }
}

TEST_F(Meanwhile, ThousandAccountsAreListedAndTheSelectionStaysThroughAChange)
{
    storedAccount("1000", kKAProviderGoogle);
    // Saving each of them would take most of the test's time.
    const std::string directory = homePath("Library/Kavell Accounts/V1/" + kKAProviderGoogle.toStdString() + "/");
    for (int number = 1001; number < 2000; ++number)
        std::filesystem::copy_file(directory + "1000.plist", directory + std::to_string(number) + ".plist");
    openPane();
    ASSERT_TRUE(list().selectAccount({kKAProviderGoogle, "1700"}));
    waitForPage("1700");
    const QRect place = list().visualRect(list().currentIndex());
    runClient({"set", "google", "1999", "accountDescription=Last"});
    waitFor([&] { return listed().last() == "  Last"; }, "the change");
    EXPECT_EQ(listed().size(), 1001);
    EXPECT_EQ(list().selectedAccount().loginName, "1700");
    EXPECT_EQ(list().visualRect(list().currentIndex()), place);
}

}  // namespace

}  // namespace kavell::test
