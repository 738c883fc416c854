// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The example account-list plug-in, loaded as the build makes it, and its sheet used by hand: fields are filled in,
// buttons are clicked and keys pressed.

#include <fcntl.h>
#include <sys/file.h>
#include <unistd.h>

#include <gmock/gmock.h>

#include <QtCore/QProcess>
#include <QtCore/QTimer>
#include <QtCore/QXmlStreamReader>
#include <QtGui/QWindow>

#include <kavellaccounts/CSKavellAccountConstants.h>
#include <kavellaccounts/CSKavellNotification.h>
#include <kavellaccounts/Ref.h>

#include "tests/integration/zorbo_fixture.h"

namespace kavell::test {

using testing::ElementsAre;
using testing::IsEmpty;
using testing::SizeIs;

class ZorboSheet : public ZorboTest {};

QStringList bundleIDsOf(const QVariant &applications)
{
    QStringList identifiers;
    for (const auto &application : applications.value<QList<std::shared_ptr<KAApplication>>>())
        identifiers += application->bundleID();
    return identifiers;
}

/// The texts of a string table of the source tree, by their keys.
QMap<QString, QString> textsOf(const std::string &path)
{
    QMap<QString, QString> texts;
    QXmlStreamReader reader(QByteArray::fromStdString(readFile(sourcePath(path))));
    QString key;
    while (!reader.atEnd()) {
        if (!reader.readNextStartElement() && !reader.isStartElement())
            continue;
        if (reader.name() == QLatin1String("message"))
            key = reader.attributes().value("id").toString();
        if (reader.name() == QLatin1String("translation"))
            texts.insert(key, reader.readElementText());
    }
    return texts;
}

TEST_F(ZorboSheet, ThePluginServesItsDomainButNotTheStaff)
{
    EXPECT_TRUE(zorbo().supportsDomain("mail.zorbo.example"));
    EXPECT_FALSE(zorbo().supportsDomain("x.staff.zorbo.example"));
}

TEST_F(ZorboSheet, ThePluginSaysWhatItsTablesSay)
{
    EXPECT_EQ(zorbo().brandName(), "Zorbo");
    EXPECT_EQ(zorbo().supportURL(), QUrl("https://help.zorbo.example/en/"));
    EXPECT_EQ(zorbo().autodiscoverDomain(), "zorbo.example");
    EXPECT_EQ(zorbo().serviceDisplayNameForService(kKAServiceIM), "Zorbo Talk");
    EXPECT_EQ(zorbo().serviceDisplayNameForService(kKAServiceCalDAV), "Zorbo Calendars");
    EXPECT_EQ(zorbo().displayNameForApplication(KAPluginManager::shared()->parlexApp()), "Messages");
    EXPECT_FALSE(zorbo().bannerImage().isNull());
    EXPECT_FALSE(zorbo().imageForAccount(nullptr).isNull());
}

TEST_F(ZorboSheet, ContinueNeedsAnAddressOfTheDomainAndAPassword)
{
    openSheet();
    EXPECT_FALSE(button("signInContinue")->isEnabled());
    fillIn("carla@other.example");
    EXPECT_FALSE(button("signInContinue")->isEnabled());
    type("addressField", "zorbo.example");
    EXPECT_FALSE(button("signInContinue")->isEnabled());
    type("addressField", " Carla@Zorbo.Example ");
    EXPECT_TRUE(button("signInContinue")->isEnabled());
    field("passwordField")->clear();
    EXPECT_FALSE(button("signInContinue")->isEnabled());
}

TEST_F(ZorboSheet, ReturnDoesNothingWhileThereIsNothingToContinueWith)
{
    openSheet();
    QTest::keyClick(field("addressField"), Qt::Key_Return);
    EXPECT_EQ(page(), "signInView");
}

TEST_F(ZorboSheet, AnAccountIsAddedWithTheApplicationsThatAreTicked)
{
    QList<KANotification> posted;
    const auto observation = KANotificationCenter::shared().addObserver(
        KACreatedAccountsNotification, [&](const KANotification &notification) { posted += notification; });
    openApplications();
    EXPECT_EQ(textOf("appSelectionAccountName"), "carla@zorbo.example");
    for (const QString &unwanted : {kKACardellAppID, kKAParlexAppID}) {
        ASSERT_TRUE(checkBox(unwanted)->isChecked()) << "all are ticked at first";
        QTest::mouseClick(checkBox(unwanted), Qt::LeftButton);
    }
    click("appSelectionOKButton");

    ASSERT_TRUE(runUntil([&] { return !posted.isEmpty(); }));
    EXPECT_FALSE(sheet());
    ASSERT_THAT(posted, SizeIs(1));
    const auto created = posted.first().object.value<QList<std::shared_ptr<KAAccount>>>();
    ASSERT_THAT(created, SizeIs(1));
    EXPECT_EQ(created.first()->loginName(), "carla@zorbo.example");
    EXPECT_FALSE(created.first()->hasPendingChanges());
    EXPECT_EQ(posted.first().userInformation.value("plugin").value<KAAListPlugin *>(), &zorbo());
    EXPECT_THAT(bundleIDsOf(posted.first().userInformation.value("selectedApps")),
                ElementsAre(kKAMailAppID, kKATidewellAppID));

    ASSERT_THAT(storedAccounts(), SizeIs(1));
    const auto stored = storedAccounts().first();
    EXPECT_EQ(stored->password(), "secret");
    EXPECT_EQ(stored->fullName(), "Carla Zorbo");
    EXPECT_EQ(stored->providerAttributeForKey(KAMailEmailAddressKey).toString(), "carla@zorbo.example");
    EXPECT_EQ(stored->providerAttributeForKey(KAMailAccountDescriptionKey).toString(), "Zorbo account");
    EXPECT_TRUE(zorbo().provider()->accountForLoginName("carla@zorbo.example", false)) << "known in this process";
}

TEST_F(ZorboSheet, AnAccountWithoutAnApplicationIsNotAdded)
{
    openApplications();
    for (const QString &application : {kKAMailAppID, kKACardellAppID, kKATidewellAppID, kKAParlexAppID})
        QTest::mouseClick(checkBox(application), Qt::LeftButton);
    EXPECT_FALSE(button("appSelectionOKButton")->isEnabled());
    QTest::mouseClick(checkBox(kKAMailAppID), Qt::LeftButton);
    EXPECT_TRUE(button("appSelectionOKButton")->isEnabled());
}

TEST_F(ZorboSheet, ARefusedPasswordIsSaidWithEverythingThatWasTyped)
{
    openSheet();
    fillIn("carla@zorbo.example", "wrong");
    click("signInContinue");
    ASSERT_TRUE(runUntil([&] { return page() == "signInView" && !textOf("signInProblem").isEmpty(); }));
    EXPECT_EQ(textOf("signInProblem"), "Zorbo does not accept this password for carla@zorbo.example.");
    EXPECT_EQ(field("addressField")->text(), "carla@zorbo.example");
    EXPECT_EQ(field("passwordField")->text(), "wrong");
    EXPECT_EQ(field("fullNameField")->text(), "Carla Zorbo");
    EXPECT_EQ(sheet()->focusWidget(), field("passwordField"));
    EXPECT_EQ(field("passwordField")->accessibleDescription(), textOf("signInProblem"));

    QTest::keyClicks(field("passwordField"), "secret");  // over the selected one
    EXPECT_EQ(textOf("signInProblem"), "");
    QTest::keyClick(field("passwordField"), Qt::Key_Return);
    EXPECT_TRUE(reaches("appSelectionView"));
}

TEST_F(ZorboSheet, AServiceThatDoesNotAnswerIsGivenUp)
{
    auto *const checker = zorbo().findChild<QObject *>("signInChecker");
    ASSERT_TRUE(checker);
    ASSERT_EQ(checker->property("bound").toInt(), 20000);
    checker->setProperty("bound", 10);
    openSheet();
    fillIn("carla@zorbo.example", "silence");
    click("signInContinue");
    ASSERT_TRUE(runUntil([&] { return page() == "signInView" && !textOf("signInProblem").isEmpty(); }));
    EXPECT_EQ(textOf("signInProblem"), "Zorbo has not answered. Check the network connection and try again.");
}

TEST_F(ZorboSheet, AnAccountThatIsThereIsNotAddedAgain)
{
    const auto before = storedAccount("old");
    openSheet();
    fillIn("CARLA@zorbo.example");
    click("signInContinue");
    ASSERT_TRUE(runUntil([&] { return page() == "signInView" && !textOf("signInProblem").isEmpty(); }));
    EXPECT_EQ(textOf("signInProblem"), "carla@zorbo.example is already among your accounts.");
    EXPECT_EQ(storedAccounts().first()->password(), "old");
}

TEST_F(ZorboSheet, TheValidationSaysWhatIsBeingDone)
{
    openSheet();
    fillIn("carla@zorbo.example", "silence");
    click("signInContinue");
    ASSERT_TRUE(reaches("validationView"));
    EXPECT_EQ(textOf("validationStatus"), "Signing in as carla@zorbo.example…");
}

TEST_F(ZorboSheet, CancelEndsTheSignIn)
{
    openSheet();
    fillIn();
    click("signInCancel");
    EXPECT_FALSE(sheet());
    EXPECT_THAT(storedAccounts(), IsEmpty());
}

TEST_F(ZorboSheet, CancelEndsTheValidationAtOnce)
{
    openSheet();
    fillIn();
    click("signInContinue");
    ASSERT_TRUE(reaches("validationView"));
    click("validationCancel");
    EXPECT_FALSE(sheet());

    // What the service answers now is for nobody.
    openSheet();
    EXPECT_TRUE(staysTrue([] { return page() == "signInView" && textOf("signInProblem").isEmpty(); }));
}

TEST_F(ZorboSheet, CancelEndsTheChoiceOfApplications)
{
    openApplications();
    click("appSelectionCancel");
    EXPECT_FALSE(sheet());
    EXPECT_THAT(storedAccounts(), IsEmpty());
}

TEST_F(ZorboSheet, EscapeEndsEachPage)
{
    openSheet();
    QTest::keyClick(sheet(), Qt::Key_Escape);
    EXPECT_FALSE(sheet());

    openSheet();
    fillIn("carla@zorbo.example", "silence");
    click("signInContinue");
    ASSERT_TRUE(reaches("validationView"));
    QTest::keyClick(sheet(), Qt::Key_Escape);
    EXPECT_FALSE(sheet());

    openApplications();
    QTest::keyClick(sheet(), Qt::Key_Escape);
    EXPECT_FALSE(sheet());
    EXPECT_THAT(storedAccounts(), IsEmpty());
}

TEST_F(ZorboSheet, ReturnLeadsFromTheFirstFieldToTheAccount)
{
    openSheet();
    fillIn();
    QTest::keyClick(field("fullNameField"), Qt::Key_Return);
    ASSERT_TRUE(reaches("appSelectionView"));
    QTest::keyClick(sheet(), Qt::Key_Return);
    ASSERT_TRUE(runUntil([] { return !sheet(); }));
    EXPECT_THAT(storedAccounts(), SizeIs(1));
}

TEST_F(ZorboSheet, ReturnPressesTheButtonThatHasTheKeyboard)
{
    openSheet();
    fillIn();
    button("signInCancel")->setFocus();
    QTest::keyClick(button("signInCancel"), Qt::Key_Return);
    EXPECT_FALSE(sheet());

    openSheet();
    fillIn();
    button("signInCancel")->setFocus();
    field("fullNameField")->setFocus();
    QTest::keyClick(field("fullNameField"), Qt::Key_Return);
    EXPECT_TRUE(reaches("appSelectionView")) << "Continue is the default button again";
}

TEST_F(ZorboSheet, BackKeepsWhatWasTyped)
{
    openApplications();
    click("appSelectionBack");
    ASSERT_TRUE(reaches("signInView"));
    EXPECT_EQ(field("addressField")->text(), "carla@zorbo.example");
    EXPECT_EQ(field("passwordField")->text(), "secret");
    type("addressField", "dora@zorbo.example");
    click("signInContinue");
    ASSERT_TRUE(reaches("appSelectionView"));
    EXPECT_EQ(textOf("appSelectionAccountName"), "dora@zorbo.example");
    EXPECT_EQ(sheet()->findChildren<KAAppTableRow *>().size(), 4) << "one table";
}

TEST_F(ZorboSheet, TheNextSheetIsEmpty)
{
    openSheet();
    fillIn("carla@zorbo.example", "wrong");
    click("signInContinue");
    ASSERT_TRUE(runUntil([&] { return page() == "signInView" && !textOf("signInProblem").isEmpty(); }));
    click("signInCancel");
    openSheet();
    for (const char *name : {"addressField", "passwordField", "fullNameField"})
        EXPECT_EQ(field(name)->text(), "") << name;
    field("addressField")->undo();
    EXPECT_EQ(field("addressField")->text(), "");
    EXPECT_EQ(textOf("signInProblem"), "");
    EXPECT_FALSE(button("signInContinue")->isEnabled());
    EXPECT_EQ(sheet()->focusWidget(), field("addressField"));
}

TEST_F(ZorboSheet, OpeningASheetEndsTheOneThatIsOpen)
{
    openSheet();
    fillIn("carla@zorbo.example", "silence");
    click("signInContinue");
    ASSERT_TRUE(reaches("validationView"));
    openSheet();
    EXPECT_EQ(field("addressField")->text(), "");
}

TEST_F(ZorboSheet, PressingAButtonTwiceIsPressingItOnce)
{
    int added = 0;
    const auto observation = KANotificationCenter::shared().addObserver(KACreatedAccountsNotification,
                                                                        [&](const KANotification &) { ++added; });
    openApplications();
    QTimer::singleShot(0, &zorbo(), [] { zorbo().addAccount(nullptr); });  // while the page turns into the next
    click("appSelectionOKButton");
    ASSERT_TRUE(runUntil([] { return !sheet(); }));
    EXPECT_TRUE(staysTrue([&] { return added == 1; }));
    EXPECT_THAT(storedAccounts(), SizeIs(1));
}

TEST_F(ZorboSheet, TheButtonsMethodsDoNothingWithoutASheet)
{
    zorbo().continueButton(nullptr);
    zorbo().back(nullptr);
    zorbo().addAccount(nullptr);
    zorbo().cancel(nullptr);
    EXPECT_FALSE(sheet());
    zorbo().showAppSelectionPanel(false);
    EXPECT_FALSE(sheet());
}

TEST_F(ZorboSheet, TwoAccountsAreAddedOneAfterTheOther)
{
    for (const char *address : {"carla@zorbo.example", "dora@zorbo.example"}) {
        openSheet();
        fillIn(address);
        click("signInContinue");
        ASSERT_TRUE(reaches("appSelectionView"));
        click("appSelectionOKButton");
        ASSERT_TRUE(runUntil([] { return !sheet(); }));
    }
    EXPECT_THAT(storedAccounts(), SizeIs(2));
}

TEST_F(ZorboSheet, TheWindowMayGoDuringTheValidation)
{
    {
        QWidget other;
        other.show();
        zorbo().createAccountInWindow(&other);
        ASSERT_TRUE(reaches("signInView"));
        fillIn();
        click("signInContinue");
        ASSERT_TRUE(reaches("validationView"));
    }
    EXPECT_FALSE(sheet());
    openApplications();
    click("appSelectionOKButton");
    EXPECT_TRUE(runUntil([] { return !sheet(); }));
    EXPECT_THAT(storedAccounts(), SizeIs(1));
}

TEST_F(ZorboSheet, CancelWhileTheAccountIsBeingSavedTakesItBack)
{
    openApplications();
    // Somebody else has the vault for a while, so that saving takes as long as this test wants.
    const std::string vault = homePath("data/kavell-accounts");
    std::filesystem::create_directories(vault);
    const int lock = open((vault + "/vault.lock").c_str(), O_RDWR | O_CREAT | O_CLOEXEC, 0600);
    ASSERT_EQ(flock(lock, LOCK_EX), 0);
    const auto changes = adopt(CSKavellNotificationObserverCreate(kCSKavellAccountNotificationSender));
    auto changesSeen = [&, seen = 0]() mutable {
        while (adopt(CSKavellNotificationObserverCopyNext(changes.get())))
            ++seen;
        return seen;
    };

    click("appSelectionOKButton");
    ASSERT_TRUE(reaches("validationView"));
    EXPECT_EQ(textOf("validationStatus"), "Saving the account…");
    click("validationCancel");
    EXPECT_FALSE(sheet());
    close(lock);

    ASSERT_TRUE(runUntil([&] { return changesSeen() == 2; })) << "saved, and removed";
    EXPECT_THAT(storedAccounts(), IsEmpty());
    EXPECT_TRUE(newAccount("carla@zorbo.example", kZorboProviderType)->password().isNull());
}

TEST_F(ZorboSheet, AnAccountWhosePasswordCannotBeStoredIsNotAdded)
{
    openApplications();
    std::filesystem::remove(homePath("passphrase"));
    setenv("KAVELL_VAULT_PASSPHRASE_FILE", homePath("nothing").c_str(), 1);
    click("appSelectionOKButton");
    ASSERT_TRUE(runUntil([&] { return page() == "appSelectionView" && !textOf("appSelectionProblem").isEmpty(); }));
    EXPECT_EQ(textOf("appSelectionProblem"),
              "The password could not be stored, so nothing was changed. Unlock your password store and try again.");
    EXPECT_THAT(storedAccounts(), IsEmpty());
    click("appSelectionBack");
    ASSERT_TRUE(reaches("signInView"));
    EXPECT_EQ(field("passwordField")->text(), "secret");
}

TEST_F(ZorboSheet, SigningInAgainStoresTheNewPassword)
{
    const auto account = storedAccount("old");
    zorbo().signInAccount(account, window());
    ASSERT_TRUE(reaches("signInView"));
    EXPECT_EQ(field("addressField")->text(), "carla@zorbo.example");
    EXPECT_TRUE(field("addressField")->isReadOnly());
    EXPECT_FALSE(field("fullNameField")->isVisible());
    EXPECT_EQ(sheet()->focusWidget(), field("passwordField"));
    QTest::keyClicks(field("passwordField"), "wrong");
    QTest::keyClick(field("passwordField"), Qt::Key_Return);
    ASSERT_TRUE(runUntil([&] { return page() == "signInView" && !textOf("signInProblem").isEmpty(); }));
    EXPECT_EQ(account->password(), "old");

    QTest::keyClicks(field("passwordField"), "new");
    QTest::keyClick(field("passwordField"), Qt::Key_Return);
    ASSERT_TRUE(runUntil([] { return !sheet(); }));
    EXPECT_EQ(storedAccounts().first()->password(), "new");

    openSheet();
    EXPECT_FALSE(field("addressField")->isReadOnly());
    EXPECT_TRUE(field("fullNameField")->isVisible());
}

TEST_F(ZorboSheet, AWebPageFillsInNameAndAddressAndNothingElse)
{
    zorbo().createAccountInWindowWithWayfenArgs(
        window(),
        {{"emailAddress", " carla@zorbo.example\n"}, {"fullName", QString(5000, u'x')}, {"password", "secret"}});
    ASSERT_TRUE(reaches("signInView"));
    EXPECT_EQ(field("addressField")->text(), "carla@zorbo.example");
    EXPECT_EQ(field("fullNameField")->text().size(), 200);
    EXPECT_EQ(field("passwordField")->text(), "");
    EXPECT_EQ(sheet()->focusWidget(), field("passwordField"));
}

TEST_F(ZorboSheet, AnAccountThatIsMadeOfSettingsIsNotStored)
{
    const auto account = zorbo().accountFromSettings({{"emailAddress", "carla@zorbo.example"}, {"fullName", "Carla"}});
    ASSERT_TRUE(account);
    EXPECT_EQ(account->provider(), kZorboProviderType);
    EXPECT_EQ(account->fullName(), "Carla");
    EXPECT_TRUE(zorbo().canSignOutForAccount(account));
    EXPECT_FALSE(zorbo().canSignOutForAccount(newAccount()));
    EXPECT_THAT(storedAccounts(), IsEmpty());
}

TEST(ZorboStringTables, HaveTheSameKeysInEachLanguage)
{
    const QStringList keys = textsOf("examples/zorbo_plugin/Localizable_en.ts").keys();
    EXPECT_THAT(keys, testing::Contains("BRAND_NAME"));
    EXPECT_EQ(textsOf("examples/zorbo_plugin/Localizable_de.ts").keys(), keys);
    EXPECT_EQ(textsOf("examples/zorbo_plugin/Localizable_ar_XB.ts").keys(), keys);
    EXPECT_EQ(textsOf("examples/file_data_plugin/Localizable_de.ts").keys(),
              textsOf("examples/file_data_plugin/Localizable_en.ts").keys());
}

TEST(ZorboStringTables, ThePseudoLanguagesAreThoseOfTheEnglishTables)
{
    for (const std::string folder : {"examples/zorbo_plugin", "examples/file_data_plugin"}) {
        const ProgramResult made =
            runProgram({sourcePath("resources/make_pseudo_language"), sourcePath(folder + "/Localizable_en.ts")});
        EXPECT_EQ(made.status, 0) << made.error;
        EXPECT_EQ(made.output, readFile(sourcePath(folder + "/Localizable_ar_XB.ts"))) << folder;
    }
}

}  // namespace kavell::test
