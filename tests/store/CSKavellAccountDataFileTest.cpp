// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Reading, merging and committing an account's data file: what is on disk before and after, and what is announced.

#include "store/CSKavellAccount_p.h"
#include "tests/store/store_test.h"

using namespace kavell;
using namespace kavell::test;

namespace {

using CSKavellAccountDataFileTest = StoreTest;

/// Sets the process's file mode mask for one test.
class FileModeMask {
public:
    explicit FileModeMask(mode_t mask) : m_before(umask(mask)) {}
    ~FileModeMask() { umask(m_before); }
    FileModeMask(const FileModeMask &) = delete;
    FileModeMask &operator=(const FileModeMask &) = delete;

private:
    mode_t m_before;
};

/// An account with the provider attribute "a" = 1 in its file, read by a record of its own.
Account savedAccount(std::string_view loginName = "ada")
{
    writeFile(dataFilePath(kMail, loginName), accountFile("<key>a</key><integer>1</integer>"));
    return openAccount(loginName);
}

void setMail(const Account &account, std::string_view key, const Value &value)
{
    _CSKavellAccountSetServiceAttribute(account.get(), kCSKavellAccountServiceMail, text(key).get(), value.get());
}

}  // namespace

TEST_F(CSKavellAccountDataFileTest, TheFirstCommitCreatesTheDirectoriesAndTheFileForTheUserOnly)
{
    const FileModeMask mask(0);
    const Account account = openAccount("ada");
    commit(account);
    EXPECT_EQ(permissionsOf(home() + "/Library"), 0700u);
    EXPECT_EQ(permissionsOf(home() + "/Library/Kavell Accounts"), 0700u);
    EXPECT_EQ(permissionsOf(home() + "/Library/Kavell Accounts/V1"), 0700u);
    EXPECT_EQ(permissionsOf(providerDirectory()), 0700u);
    EXPECT_EQ(permissionsOf(fileOf("ada")), 0600u);
    EXPECT_TRUE(std::filesystem::is_regular_file(fileOf("ada")));
    EXPECT_FALSE(hasPendingChanges(account));
}

TEST_F(CSKavellAccountDataFileTest, ExistingDirectoriesKeepTheirPermissions)
{
    std::filesystem::create_directories(providerDirectory());
    std::filesystem::permissions(home() + "/Library", std::filesystem::perms(0755));
    commit(openAccount("ada"));
    EXPECT_EQ(permissionsOf(home() + "/Library"), 0755u);
    EXPECT_TRUE(std::filesystem::exists(fileOf("ada")));
}

TEST_F(CSKavellAccountDataFileTest, ASaveGivesAnExistingFileTheUsersPermissions)
{
    const Account account = savedAccount();
    std::filesystem::permissions(fileOf("ada"), std::filesystem::perms(0644));
    setAttribute(account, "b", integer(2));
    commit(account);
    EXPECT_EQ(permissionsOf(fileOf("ada")), 0600u);
}

TEST_F(CSKavellAccountDataFileTest, AnExistingFileKeepsItsInode)
{
    // Other processes found their semaphore through it.
    const Account account = savedAccount();
    struct stat before {
    }, after{};
    ASSERT_EQ(stat(fileOf("ada").c_str(), &before), 0);
    for (int round = 0; round < 5; ++round) {
        setAttribute(account, "a", text(std::string(static_cast<size_t>(round) * 3000, 'x')));
        commit(account);
        ASSERT_EQ(stat(fileOf("ada").c_str(), &after), 0);
        EXPECT_EQ(after.st_ino, before.st_ino);
    }
}

TEST_F(CSKavellAccountDataFileTest, ASlashInALoginNameIsUsedVerbatim)
{
    const Account account = openAccount("group/ada");
    commit(account);
    EXPECT_TRUE(std::filesystem::is_regular_file(providerDirectory() + "/group/ada.plist"));
    EXPECT_EQ(permissionsOf(providerDirectory() + "/group"), 0700u);
    EXPECT_EQ(uuidOf(openAccount("group/ada")), uuidOf(account));
}

TEST_F(CSKavellAccountDataFileTest, ANewAccountsFileHoldsOnlyItsUUID)
{
    const Account account = openAccount("ada");
    commit(account);
    const std::string file = readFile(fileOf("ada"));
    EXPECT_NE(file.find("<plist version=\"1.0\">"), std::string::npos) << file;
    EXPECT_NE(file.find("<key>UUID</key>"), std::string::npos) << file;
    EXPECT_NE(file.find("<string>" + uuidOf(account) + "</string>"), std::string::npos) << file;
    EXPECT_EQ(file.find("AccountSettings"), std::string::npos) << file;
    EXPECT_EQ(file.find("Services"), std::string::npos) << file;
    // Provider type and login name stand in the path only.
    EXPECT_EQ(file.find("ada"), std::string::npos) << file;
    EXPECT_EQ(file.find(kMail), std::string::npos) << file;
}

TEST_F(CSKavellAccountDataFileTest, AttributesStandUnderTheirKeys)
{
    const Account account = openAccount("ada");
    setAttribute(account, "com.corvane.provider.fullname", text("Ada"));
    setMail(account, "com.corvane.Port", integer(993));
    commit(account);
    const std::string file = readFile(fileOf("ada"));
    const size_t settings = file.find("<key>AccountSettings</key>"), services = file.find("<key>Services</key>");
    ASSERT_NE(settings, std::string::npos) << file;
    ASSERT_NE(services, std::string::npos) << file;
    EXPECT_GT(file.find("<key>com.corvane.provider.fullname</key>"), settings);
    EXPECT_GT(file.find("<key>com.corvane.service.Mail</key>"), services);
    EXPECT_NE(file.find("<integer>993</integer>"), std::string::npos);
    const Account fresh = openAccount("ada");
    EXPECT_TRUE(same(attributes(fresh), dictionary({{"com.corvane.provider.fullname", text("Ada")}})));
    EXPECT_TRUE(
        same(serviceAttributes(fresh, kCSKavellAccountServiceMail), dictionary({{"com.corvane.Port", integer(993)}})));
}

TEST_F(CSKavellAccountDataFileTest, RemovingTheLastAttributeOfAServiceDropsItsEntry)
{
    const Account account = openAccount("ada");
    setMail(account, "port", integer(25));
    _CSKavellAccountSetServiceAttribute(account.get(), kCSKavellAccountServiceLDAP, text("a").get(), integer(1).get());
    commit(account);
    _CSKavellAccountRemoveServiceAttribute(account.get(), kCSKavellAccountServiceMail, text("port").get());
    commit(account);
    std::string file = readFile(fileOf("ada"));
    EXPECT_EQ(file.find("com.corvane.service.Mail"), std::string::npos) << file;
    EXPECT_NE(file.find("com.corvane.service.LDAP"), std::string::npos) << file;

    _CSKavellAccountRemoveAllServiceAttributes(account.get(), kCSKavellAccountServiceLDAP);
    commit(account);
    file = readFile(fileOf("ada"));
    EXPECT_EQ(file.find("Services"), std::string::npos) << file;
    EXPECT_NE(file.find("UUID"), std::string::npos) << file;
}

TEST_F(CSKavellAccountDataFileTest, RemovingTheLastProviderAttributeDropsTheirEntry)
{
    const Account account = savedAccount();
    _CSKavellAccountRemoveAllProviderAttributes(account.get());
    commit(account);
    EXPECT_EQ(readFile(fileOf("ada")).find("AccountSettings"), std::string::npos);
}

TEST_F(CSKavellAccountDataFileTest, AServiceEmptiedByACommitStaysInTheRecordUntilTheNextRead)
{
    const Account account = openAccount("ada");
    setMail(account, "port", integer(25));
    commit(account);
    _CSKavellAccountRemoveServiceAttribute(account.get(), kCSKavellAccountServiceMail, text("port").get());
    commit(account);
    EXPECT_NE(ServiceForID(account.get(), kCSKavellAccountServiceMail, false), nullptr);
    writeFile(fileOf("ada"), accountFile(""));
    EXPECT_TRUE(CSKavellAccountLoadData(account.get()));
    EXPECT_EQ(ServiceForID(account.get(), kCSKavellAccountServiceMail, false), nullptr);
}

TEST_F(CSKavellAccountDataFileTest, TwoRecordsThatChangeDifferentKeysBothSurvive)
{
    const Account first = savedAccount(), second = openAccount("ada");
    setAttribute(first, "first", integer(1));
    setAttribute(second, "second", integer(2));
    setMail(first, "port", integer(25));
    setMail(second, "host", text("mail.example"));
    commit(first);
    commit(second);
    const Account fresh = openAccount("ada");
    EXPECT_TRUE(
        same(attributes(fresh), dictionary({{"a", integer(1)}, {"first", integer(1)}, {"second", integer(2)}})));
    EXPECT_TRUE(same(serviceAttributes(fresh, kCSKavellAccountServiceMail),
                     dictionary({{"port", integer(25)}, {"host", text("mail.example")}})));
}

TEST_F(CSKavellAccountDataFileTest, ForOneKeyTheLaterCommitWins)
{
    const Account first = savedAccount(), second = openAccount("ada");
    setAttribute(first, "a", text("first"));
    _CSKavellAccountRemoveProviderAttribute(second.get(), text("a").get());
    commit(first);
    EXPECT_TRUE(same(attribute(openAccount("ada"), "a"), text("first")));
    commit(second);
    EXPECT_FALSE(attribute(openAccount("ada"), "a"));
}

TEST_F(CSKavellAccountDataFileTest, ReadingBringsInWhatAnotherSavedUnderThePendingChanges)
{
    const Account account = savedAccount();
    setAttribute(account, "a", text("mine"));
    setMail(account, "port", integer(25));
    writeFile(fileOf("ada"),
              accountFile("<key>a</key><string>theirs</string><key>b</key><string>new</string>",
                          "<key>com.corvane.service.Mail</key><dict><key>host</key><string>h</string></dict>"
                          "<key>com.corvane.service.LDAP</key><dict><key>base</key><string>o</string></dict>"));
    EXPECT_TRUE(CSKavellAccountLoadData(account.get()));
    EXPECT_TRUE(same(attributes(account), dictionary({{"a", text("mine")}, {"b", text("new")}})));
    EXPECT_TRUE(same(serviceAttributes(account, kCSKavellAccountServiceMail),
                     dictionary({{"host", text("h")}, {"port", integer(25)}})));
    EXPECT_TRUE(same(serviceAttributes(account, kCSKavellAccountServiceLDAP), dictionary({{"base", text("o")}})));
    EXPECT_TRUE(hasPendingChanges(account));
}

TEST_F(CSKavellAccountDataFileTest, ReadingDropsAServiceThatTheFileNoLongerHas)
{
    const Account account = openAccount("ada");
    setMail(account, "port", integer(25));
    commit(account);
    writeFile(fileOf("ada"), accountFile(""));
    EXPECT_TRUE(CSKavellAccountLoadData(account.get()));
    EXPECT_EQ(ServiceForID(account.get(), kCSKavellAccountServiceMail, false), nullptr);
}

TEST_F(CSKavellAccountDataFileTest, AReadThatDropsAServiceDropsItsPendingRemovals)
{
    const Account account = savedAccount();
    setMail(account, "host", text("h"));
    commit(account);
    _CSKavellAccountRemoveServiceAttribute(account.get(), kCSKavellAccountServiceMail, text("port").get());
    writeFile(fileOf("ada"), accountFile(""));
    EXPECT_TRUE(CSKavellAccountLoadData(account.get()));
    writeFile(fileOf("ada"), accountFile("", "<key>com.corvane.service.Mail</key>"
                                             "<dict><key>port</key><integer>25</integer></dict>"));
    EXPECT_TRUE(CSKavellAccountLoadData(account.get()));
    EXPECT_TRUE(same(serviceAttributes(account, kCSKavellAccountServiceMail), dictionary({{"port", integer(25)}})));
}

TEST_F(CSKavellAccountDataFileTest, AFileWithAUUIDReplacesTheRecordsAndOneWithoutKeepsIt)
{
    const Account account = openAccount("ada");
    writeFile(fileOf("ada"), accountFile(""));
    EXPECT_TRUE(CSKavellAccountLoadData(account.get()));
    EXPECT_EQ(uuidOf(account), kUUID);
    writeFile(fileOf("ada"), propertyList("<key>AccountSettings</key><dict><key>a</key><true/></dict>"));
    EXPECT_TRUE(CSKavellAccountLoadData(account.get()));
    EXPECT_EQ(uuidOf(account), kUUID);
    EXPECT_TRUE(same(attribute(account, "a"), boolean(true)));
}

TEST_F(CSKavellAccountDataFileTest, AMissingFileEmptiesTheCommittedSideAndKeepsPendingChangesAndUUID)
{
    const Account account = savedAccount();
    setAttribute(account, "b", integer(2));
    std::filesystem::remove(fileOf("ada"));
    StandardErrorCapture capture;
    EXPECT_TRUE(CSKavellAccountLoadData(account.get()));
    EXPECT_EQ(capture.take(), "");
    EXPECT_TRUE(same(attributes(account), dictionary({{"b", integer(2)}})));
    EXPECT_EQ(uuidOf(account), kUUID);
}

TEST_F(CSKavellAccountDataFileTest, AStatusThatCannotBeHadIsReportedWithTheCallsResult)
{
    const Account account = savedAccount();
    setAttribute(account, "b", integer(2));
    std::filesystem::remove_all(providerDirectory());
    writeFile(providerDirectory(), "a file where the directory should be");
    StandardErrorCapture capture;
    EXPECT_FALSE(CSKavellAccountLoadData(account.get()));
    EXPECT_EQ(capture.take(), kStatMessage);
    EXPECT_TRUE(same(attributes(account), dictionary({{"b", integer(2)}})));
    EXPECT_EQ(uuidOf(account), kUUID);
}

TEST_F(CSKavellAccountDataFileTest, ALoginNameTooLongForTheFileSystemIsReportedAndCannotBeSaved)
{
    std::filesystem::create_directories(providerDirectory());
    StandardErrorCapture capture;
    const Account account = openAccount(std::string(300, 'x'));
    ASSERT_TRUE(account);
    EXPECT_EQ(capture.take(), kStatMessage);
    commit(account);
    EXPECT_EQ(capture.take(), std::string(kStatMessage) + std::string(kSaveMessage));
    EXPECT_TRUE(hasPendingChanges(account));
}

TEST_F(CSKavellAccountDataFileTest, TheRecordsOwnLastWriteIsNotReadAgain)
{
    const Account account = openAccount("ada");
    setAttribute(account, "a", text("mine"));
    commit(account);
    const struct timespec saved = modificationTime(fileOf("ada"));
    writeFile(fileOf("ada"), accountFile("<key>a</key><string>theirs</string>"));
    setModificationTime(fileOf("ada"), saved);
    EXPECT_TRUE(CSKavellAccountLoadData(account.get()));
    EXPECT_TRUE(same(attribute(account, "a"), text("mine")));
}

TEST_F(CSKavellAccountDataFileTest, ANanosecondOfDifferenceIsReadAgain)
{
    const Account account = openAccount("ada");
    setAttribute(account, "a", text("mine"));
    commit(account);
    struct timespec moment = modificationTime(fileOf("ada"));
    writeFile(fileOf("ada"), accountFile("<key>a</key><string>theirs</string>"));
    moment.tv_nsec += moment.tv_nsec == 999999999 ? -1 : 1;
    setModificationTime(fileOf("ada"), moment);
    EXPECT_TRUE(CSKavellAccountLoadData(account.get()));
    EXPECT_TRUE(same(attribute(account, "a"), text("theirs")));
}

TEST_F(CSKavellAccountDataFileTest, AReadNeverSparesTheNextRead)
{
    const Account account = savedAccount();
    const struct timespec moment = modificationTime(fileOf("ada"));
    for (const char *value : {"one", "two", "three"}) {
        writeFile(fileOf("ada"), accountFile(std::string("<key>a</key><string>") + value + "</string>"));
        setModificationTime(fileOf("ada"), moment);
        EXPECT_TRUE(CSKavellAccountLoadData(account.get()));
        EXPECT_TRUE(same(attribute(account, "a"), text(value)));
    }
}

TEST_F(CSKavellAccountDataFileTest, WithoutChangesACommitDoesNothing)
{
    const Account account = savedAccount();
    const std::string before = readFile(fileOf("ada"));
    const struct timespec moment = modificationTime(fileOf("ada"));
    Notifications notifications;
    commit(account);
    EXPECT_EQ(readFile(fileOf("ada")), before);
    EXPECT_EQ(modificationTime(fileOf("ada")).tv_nsec, moment.tv_nsec);
    EXPECT_EQ(notifications.takeLoginNames(), Names{});
}

TEST_F(CSKavellAccountDataFileTest, ASaveIsAnnouncedWithNameObjectAndUserInformation)
{
    Notifications notifications;
    commit(openAccount("ada"));
    const auto notification = notifications.next();
    ASSERT_TRUE(notification);
    EXPECT_EQ(toStringView(CSKavellNotificationGetName(notification.get())), "com.corvane.KavellAccounts");
    EXPECT_EQ(toStringView(CSKavellNotificationGetObject(notification.get())),
              "com.corvane.KavellAccounts.settingsChanged");
    EXPECT_TRUE(same(CSKavellNotificationGetUserInformation(notification.get()),
                     dictionary({{"Provider", text("com.corvane.account.mail")}, {"LoginName", text("ada")}}).get()));
    EXPECT_EQ(notifications.takeLoginNames(), Names{});
}

TEST_F(CSKavellAccountDataFileTest, EachCommitIsAnnouncedOnceInOrder)
{
    Notifications notifications;
    const Account ada = openAccount("ada"), grace = openAccount("grace");
    commit(ada);
    commit(grace);
    commit(grace);
    setAttribute(ada, "a", integer(1));
    commit(ada);
    EXPECT_EQ(notifications.takeLoginNames(), (Names{"ada", "grace", "ada"}));
}

TEST_F(CSKavellAccountDataFileTest, AnAccountMarkedForRemovalIsDeletedThoughOtherChangesArePending)
{
    const Account account = savedAccount();
    setAttribute(account, "b", integer(2));
    _CSKavellAccountRemove(account.get());
    Notifications notifications;
    commit(account);
    EXPECT_FALSE(std::filesystem::exists(fileOf("ada")));
    EXPECT_EQ(notifications.takeLoginNames(), (Names{"ada"}));
    EXPECT_TRUE(hasPendingChanges(account));
}

TEST_F(CSKavellAccountDataFileTest, ADeletedAccountWithoutOtherChangesHasNothingPending)
{
    const Account account = savedAccount();
    _CSKavellAccountRemove(account.get());
    commit(account);
    EXPECT_FALSE(hasPendingChanges(account));
    Notifications notifications;
    commit(account);
    EXPECT_FALSE(std::filesystem::exists(fileOf("ada")));
    EXPECT_EQ(notifications.takeLoginNames(), Names{});
}

TEST_F(CSKavellAccountDataFileTest, TheCommitAfterARemovalWritesThePendingChangesAgain)
{
    const Account account = savedAccount();
    setAttribute(account, "b", integer(2));
    _CSKavellAccountRemove(account.get());
    commit(account);
    commit(account);
    EXPECT_FALSE(hasPendingChanges(account));
    const Account fresh = openAccount("ada");
    EXPECT_EQ(uuidOf(fresh), kUUID);
    EXPECT_TRUE(same(attributes(fresh), dictionary({{"b", integer(2)}})));
}

TEST_F(CSKavellAccountDataFileTest, ARemovalWithoutAFileIsNotAnnouncedAndStillClearsTheMark)
{
    const Account account = openAccount("ada");
    _CSKavellAccountRemove(account.get());
    Notifications notifications;
    StandardErrorCapture capture;
    commit(account);
    EXPECT_EQ(capture.take(), "");
    EXPECT_EQ(notifications.takeLoginNames(), Names{});
    EXPECT_TRUE(hasPendingChanges(account));
    EXPECT_FALSE(account->pendingRemove);
}

TEST_F(CSKavellAccountDataFileTest, AnAccountWithoutUUIDAndAttributesLosesItsFileAndKeepsItsChanges)
{
    writeFile(fileOf("ada"), propertyList("<key>AccountSettings</key><dict><key>a</key><integer>1</integer></dict>"));
    const Account account = openAccount("ada");
    account->uuidString = nullptr;
    _CSKavellAccountRemoveAllProviderAttributes(account.get());
    Notifications notifications;
    commit(account);
    EXPECT_FALSE(std::filesystem::exists(fileOf("ada")));
    EXPECT_TRUE(hasPendingChanges(account));
    EXPECT_EQ(notifications.takeLoginNames(), (Names{"ada"}));
    commit(account);
    EXPECT_EQ(notifications.takeLoginNames(), Names{});
    EXPECT_TRUE(hasPendingChanges(account));
}

TEST_F(CSKavellAccountDataFileTest, AFileThatCannotBeWrittenIsReportedAndStaysPending)
{
    std::filesystem::create_directories(fileOf("ada") + "/in the way");
    const Account account = openAccount("ada");
    setAttribute(account, "b", integer(2));
    Notifications notifications;
    StandardErrorCapture capture;
    commit(account);
    EXPECT_EQ(capture.take(), kSaveMessage);
    EXPECT_TRUE(hasPendingChanges(account));
    EXPECT_EQ(notifications.takeLoginNames(), (Names{"ada"}));
    EXPECT_TRUE(std::filesystem::is_directory(fileOf("ada") + "/in the way"));
}

TEST_F(CSKavellAccountDataFileTest, ASaveLeavesNothingBesideTheFileButAVoidRecord)
{
    const Account account = openAccount("ada");
    for (int round = 0; round < 3; ++round) {
        setAttribute(account, "a", integer(round));
        commit(account);
    }
    EXPECT_EQ(entriesBesideVoidRecords(), Names{"ada.plist"});
    EXPECT_EQ(entriesBeginningWith("").size(), 2U);
    _CSKavellAccountRemove(account.get());
    commit(account);
    EXPECT_EQ(entriesBeginningWith(""), Names{});
}
