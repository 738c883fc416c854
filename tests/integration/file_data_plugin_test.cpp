// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The example data plug-ins and the accounts in their files: making, changing, deleting and finding them, several
// processes at one file, and a file that is damaged.

#include <filesystem>

#include <gmock/gmock.h>

#include <QtCore/QJsonArray>
#include <QtCore/QJsonDocument>
#include <QtCore/QJsonObject>
#include <QtTest/QTest>
#include <QtWidgets/QApplication>
#include <QtWidgets/QInputDialog>
#include <QtWidgets/QLineEdit>
#include <QtWidgets/QPushButton>

#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KAProvider.h>

#include "tests/integration/data_plugin_fixture.h"
#include "tests/support/standard_error_capture.h"

namespace kavell::test {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::SizeIs;

class FileDataPlugin : public DataPluginTest {
protected:
    [[nodiscard]] QString makeMailAccount(const QString &address = QStringLiteral("carla@zorbo.example"))
    {
        return makeAccount(plugin(), mailInput(address));
    }

    [[nodiscard]] static QInputDialog *descriptionDialog()
    {
        for (QWidget *window : QApplication::topLevelWidgets()) {
            if (auto *const dialog = qobject_cast<QInputDialog *>(window); dialog && dialog->isVisible())
                return dialog;
        }
        return nullptr;
    }

    static QPushButton *button(QWidget *window, const QString &label)
    {
        for (auto *candidate : window->findChildren<QPushButton *>()) {
            if (candidate->text() == label)
                return candidate;
        }
        return nullptr;
    }

    /// The copies that were put aside.
    [[nodiscard]] std::vector<std::string> damagedCopies() const
    {
        std::vector<std::string> copies;
        for (const auto &entry : std::filesystem::directory_iterator(homePath("data/kavell-accounts-example"))) {
            if (entry.path().string().find(".json.damaged-") != std::string::npos)
                copies.push_back(entry.path().string());
        }
        return copies;
    }

    SetupRecorder recorder;
};

TEST_F(FileDataPlugin, EachBundleServesItsClientApplication)
{
    struct Row {
        QString pluginID, appID, providerType, service;
    };
    const Row rows[] = {{kKAMailPluginID, kKAMailAppID, kKAProviderMail, kKAServiceIMAP},
                        {kKACalendarPluginID, kKATidewellAppID, kKAProviderTidewell, kKAServiceCalDAV},
                        {kKAContactsPluginID, kKACardellAppID, kKAProviderCardell, kKAServiceCardDAV},
                        {kKAChatPluginID, kKAParlexAppID, kKAProviderParlex, kKAServiceIM}};
    for (const Row &row : rows) {
        EXPECT_EQ(KAPluginManager::shared()->pluginIDForAppBundleID(row.appID), row.pluginID);
        EXPECT_EQ(plugin(row.pluginID).provider()->providerType(), row.providerType);
        EXPECT_THAT(KAPluginManager::shared()->dataPluginsSupportingServices({row.service}),
                    ElementsAre(&plugin(row.pluginID)));
    }
}

TEST_F(FileDataPlugin, HasNoAccountsAtFirst)
{
    EXPECT_THAT(plugin().accountUIDs(), IsEmpty());
    EXPECT_THAT(plugin().settingsForAccountUID("nobody"), IsEmpty());
}

TEST_F(FileDataPlugin, AnAccountIsMadeInTheWordsOfItsKind)
{
    const QString uid = makeMailAccount();
    EXPECT_THAT(plugin().accountUIDs(), ElementsAre(uid));
    EXPECT_EQ(plugin().settingsForAccountUID(uid), (QVariantMap{{"emailAddress", "carla@zorbo.example"},
                                                                {"userName", "carla@zorbo.example"},
                                                                {"fullName", "Carla Zorbo"},
                                                                {"accountDescription", "My mail"},
                                                                {"incomingMailServer", "imap.zorbo.example"},
                                                                {"incomingUseSSL", true},
                                                                {"outgoingMailServer", "smtp.zorbo.example"},
                                                                {"outgoingUseSSL", true}}));
}

TEST_F(FileDataPlugin, TheFileHoldsTheAccountButNotThePasswordAndIsItsOwnersAlone)
{
    const QString uid = makeMailAccount();
    const QJsonObject file = QJsonDocument::fromJson(QByteArray::fromStdString(readFile(accountsPath()))).object();
    EXPECT_EQ(file["accounts"][uid]["emailAddress"].toString(), "carla@zorbo.example");
    EXPECT_THAT(readFile(accountsPath()), testing::Not(HasSubstr("secret")));
    using std::filesystem::perms;
    EXPECT_EQ(std::filesystem::status(accountsPath()).permissions(), perms::owner_read | perms::owner_write);
}

TEST_F(FileDataPlugin, MakingAnAccountTellsTheDelegate)
{
    plugin().setDelegate(&recorder);
    const QString uid = makeMailAccount();
    EXPECT_THAT(recorder.messages, ElementsAre("create " + uid));
}

TEST_F(FileDataPlugin, EachAccountHasItsOwnUID)
{
    EXPECT_NE(makeMailAccount("carla@zorbo.example"), makeMailAccount("dora@zorbo.example"));
    EXPECT_THAT(plugin().accountUIDs(), SizeIs(2));
}

TEST_F(FileDataPlugin, AnAccountThatIsThereIsUsedAgainAndActive)
{
    const QString uid = makeMailAccount();
    plugin().deactivateAccountUID(uid);
    plugin().setDelegate(&recorder);
    EXPECT_EQ(makeMailAccount(), uid);
    EXPECT_THAT(recorder.messages, ElementsAre("change " + uid));
    EXPECT_FALSE(plugin().settingsForAccountUID(uid).contains(KAMailInactiveAccountKey));
}

TEST_F(FileDataPlugin, AnAccountIsNotMadeOfNothingFound)
{
    KAError error;
    EXPECT_TRUE(plugin().createAccountForInput(mailInput("carla@zorbo.example"), nullptr, &error).isNull());
    EXPECT_EQ(error.domain(), kKAErrorDomain);
    EXPECT_EQ(error.code(), 5);
    EXPECT_TRUE(plugin().createAccountForInput(nullptr, std::make_shared<KAMailAccountSetupResult>(), &error).isNull());
    EXPECT_EQ(error.code(), 1);
    EXPECT_THAT(plugin().accountUIDs(), IsEmpty());
}

TEST_F(FileDataPlugin, DeactivatingMarksTheAccountAndActivatingUnmarksIt)
{
    const QString uid = makeMailAccount();
    plugin().setDelegate(&recorder);
    plugin().deactivateAccountUID(uid);
    EXPECT_TRUE(plugin().settingsForAccountUID(uid).value(KAMailInactiveAccountKey).toBool());
    plugin().activateAccountUID(uid);
    EXPECT_FALSE(plugin().settingsForAccountUID(uid).contains(KAMailInactiveAccountKey));
    EXPECT_THAT(recorder.messages, ElementsAre("change " + uid, "change " + uid));
}

TEST_F(FileDataPlugin, NothingIsToldOfWhatDidNotChange)
{
    const QString uid = makeMailAccount();
    plugin().setDelegate(&recorder);
    plugin().activateAccountUID(uid);
    plugin().deactivateAccountUID("nobody");
    plugin().deleteAccountUID("nobody");
    EXPECT_THAT(recorder.messages, IsEmpty());
}

TEST_F(FileDataPlugin, ADeletedAccountIsGone)
{
    const QString uid = makeMailAccount();
    plugin().setDelegate(&recorder);
    plugin().deleteAccountUID(uid);
    EXPECT_THAT(plugin().accountUIDs(), IsEmpty());
    EXPECT_THAT(recorder.messages, ElementsAre("delete " + uid));
}

TEST_F(FileDataPlugin, AMigrationIsFinishedAtOnce)
{
    plugin().setDelegate(&recorder);
    plugin().nbsAccountStartedMigration(newAccount("ada"));
    EXPECT_THAT(recorder.messages, ElementsAre(QStringLiteral("migrated ada")));
}

TEST_F(FileDataPlugin, TheSettingsOfMailCalendarsAndContactsBelongToTheOnlineAccount)
{
    auto *const zorbo = KAPluginManager::shared()->pluginWithIdentifier("com.example.zorbo.kaplugin");
    ASSERT_TRUE(zorbo);
    const auto online = newAccount("carla@zorbo.example", "com.example.account.zorbo");
    zorbo->provider()->addAccount(online);

    const auto calendar = std::make_shared<KACalDAVAccountSetupInput>();
    calendar->setUserName("carla@zorbo.example");
    calendar->setPassword("secret");
    const auto contacts = std::make_shared<KACardDAVAccountSetupInput>();
    contacts->setUserName("carla@zorbo.example");
    contacts->setPassword("secret");
    const std::pair<QString, std::shared_ptr<KAAccountSetupInput>> inputs[] = {
        {kKAMailPluginID, mailInput("carla@zorbo.example")},
        {kKACalendarPluginID, calendar},
        {kKAContactsPluginID, contacts}};
    for (const auto &[identifier, input] : inputs) {
        const QString uid = makeAccount(plugin(identifier), input);
        const QVariantMap settings = plugin(identifier).settingsForAccountUID(uid);
        const auto found = KAPluginManager::shared()->matchingAListAccountForAccountSettings(settings, identifier);
        ASSERT_TRUE(found) << identifier.toStdString();
        EXPECT_EQ(found->loginName(), "carla@zorbo.example");
        EXPECT_EQ(KAAccount::accountIdentifierForSettings(settings), "carla@com.example.account.zorbo");
        EXPECT_EQ(KAAccount::aListPluginIDForSettings(settings), "com.example.zorbo.kaplugin");
    }
    zorbo->provider()->removeAccount(online);
}

TEST_F(FileDataPlugin, TwoProcessesLoseNoneOfEachOthersAccounts)
{
    constexpr int kAccounts = 25;
    (void)plugin();  // loaded before the fork
    const auto makeMany = [](const QString &name) {
        for (int number = 0; number < kAccounts; ++number) {
            const auto input = mailInput(QStringLiteral("%1%2@zorbo.example").arg(name).arg(number));
            if (plugin().createAccountForInput(input, std::make_shared<KAMailAccountSetupResult>(), nullptr).isEmpty())
                return 1;
        }
        return 0;
    };
    ChildProcess first([&] { return makeMany("ada"); });
    ChildProcess second([&] { return makeMany("bob"); });
    EXPECT_EQ(first.wait(), 0);
    EXPECT_EQ(second.wait(), 0);
    EXPECT_THAT(plugin().accountUIDs(), SizeIs(2 * kAccounts));
}

TEST_F(FileDataPlugin, ADamagedFileIsReportedAndKeptWhenTheNextAccountIsMade)
{
    writeFile(accountsPath(), "{ \"accounts\": { \"A\": {} ");
    std::string log;
    {
        StandardErrorCapture capture;
        EXPECT_THAT(plugin().accountUIDs(), IsEmpty());
        log = capture.take();
    }
    EXPECT_THAT(log, HasSubstr("The file " + accountsPath() + " is damaged: "));
    EXPECT_EQ(readFile(accountsPath()), "{ \"accounts\": { \"A\": {} ") << "reading changes nothing";

    const QString uid = makeMailAccount();
    EXPECT_THAT(plugin().accountUIDs(), ElementsAre(uid));
    ASSERT_THAT(damagedCopies(), SizeIs(1));
    EXPECT_EQ(readFile(damagedCopies().front()), "{ \"accounts\": { \"A\": {} ");
}

TEST_F(FileDataPlugin, AFileOfAnotherFormatCountsAsDamaged)
{
    for (const char *other : {"[1, 2]", "{\"accounts\": []}", "{\"accounts\": {\"A\": 1}}"}) {
        writeFile(accountsPath(), other);
        EXPECT_THAT(plugin().accountUIDs(), IsEmpty());
        (void)makeMailAccount();
    }
    EXPECT_THAT(damagedCopies(), SizeIs(3));
}

TEST_F(FileDataPlugin, AFileThatCannotBeReadIsLeftAloneAndTheReasonReachesTheCaller)
{
    std::filesystem::create_directories(accountsPath());  // a directory in the file's place
    KAError error;
    const QString uid = plugin().createAccountForInput(mailInput("carla@zorbo.example"),
                                                       std::make_shared<KAMailAccountSetupResult>(), &error);
    EXPECT_TRUE(uid.isNull());
    EXPECT_EQ(error.code(), 6);
    EXPECT_THAT(error.description().toStdString(),
                HasSubstr("The accounts in " + accountsPath() + " cannot be read: "));
    EXPECT_TRUE(std::filesystem::is_directory(accountsPath()));
}

TEST_F(FileDataPlugin, ConfiguringChangesTheDescription)
{
    const QString uid = makeMailAccount();
    plugin().setDelegate(&recorder);
    plugin().configureAccountUID(uid);
    QInputDialog *const dialog = descriptionDialog();
    ASSERT_TRUE(dialog);
    EXPECT_EQ(dialog->textValue(), "My mail");

    auto *const field = dialog->findChild<QLineEdit *>();
    field->selectAll();
    QTest::keyClicks(field, "Home");
    QTest::mouseClick(button(dialog, "Save"), Qt::LeftButton);

    EXPECT_EQ(plugin().settingsForAccountUID(uid).value("accountDescription").toString(), "Home");
    EXPECT_THAT(recorder.messages, ElementsAre("change " + uid));
    EXPECT_FALSE(descriptionDialog());
}

TEST_F(FileDataPlugin, ConfiguringTwiceShowsOneWindowAndCancelChangesNothing)
{
    const QString uid = makeMailAccount();
    plugin().configureAccountUID(uid);
    QInputDialog *const dialog = descriptionDialog();
    plugin().configureAccountUID(uid);
    EXPECT_EQ(descriptionDialog(), dialog);
    QTest::keyClicks(dialog->findChild<QLineEdit *>(), "other");
    QTest::mouseClick(button(dialog, "Cancel"), Qt::LeftButton);
    EXPECT_EQ(plugin().settingsForAccountUID(uid).value("accountDescription").toString(), "My mail");
}

TEST_F(FileDataPlugin, ThereIsNothingToConfigureForAnUnknownAccount)
{
    plugin().configureAccountUID("nobody");
    EXPECT_FALSE(descriptionDialog());
}

TEST_F(FileDataPlugin, AnInactiveAccountIsDrawnInGrey)
{
    const QString uid = makeMailAccount();
    const QPoint inside(2, 16);
    EXPECT_EQ(plugin().imageForAccountUID(uid).pixelColor(inside), QColor(0x2f, 0x6f, 0xb5));
    plugin().deactivateAccountUID(uid);
    EXPECT_EQ(plugin().imageForAccountUID(uid).pixelColor(inside), QColor(Qt::gray));
}

}  // namespace kavell::test
