// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <algorithm>
#include <sys/stat.h>
#include <thread>

#include "tests/store/store_test.h"

using namespace kavell;
using namespace kavell::test;

namespace {

using CSKavellAccountProviderTest = StoreTest;
using Provider = Ref<CSKavellAccountProviderRef>;

Provider openProvider(std::string_view providerType = kMail)
{
    return adopt(_CSKavellAccountProviderCreate(nullptr, text(providerType).get()));
}

std::vector<CSKavellAccountRef> accountsOf(const Provider &provider)
{
    const auto values = adopt(_CSKavellAccountProviderCopyAccounts(provider.get()));
    std::vector<CSKavellAccountRef> accounts;
    for (size_t index = 0; index < CSKavellArrayGetCount(values.get()); ++index)
        accounts.push_back(
            static_cast<CSKavellAccountRef>(const_cast<void *>(CSKavellArrayGetValueAtIndex(values.get(), index))));
    return accounts;
}

Names namesOf(const Provider &provider)
{
    Names names;
    for (CSKavellAccountRef account : accountsOf(provider))
        names.push_back(toStdString(adopt(_CSKavellAccountCopyLoginName(account)).get()));
    return names;
}

Names sortedNamesOf(const Provider &provider)
{
    Names names = namesOf(provider);
    std::sort(names.begin(), names.end());
    return names;
}

Account copyAccount(const Provider &provider, std::string_view loginName, bool create = false)
{
    return adopt(_CSKavellAccountProviderCopyAccount(provider.get(), text(loginName).get(), create));
}

}  // namespace

TEST_F(CSKavellAccountProviderTest, RefusesANoneOrEmptyProviderTypeWithItsMessage)
{
    StandardErrorCapture capture;
    EXPECT_FALSE(adopt(_CSKavellAccountProviderCreate(nullptr, nullptr)));
    EXPECT_EQ(capture.take(), "Error: No service provider specified in CSKavellAccountProviderCreate\n");
    EXPECT_FALSE(openProvider(""));
    EXPECT_EQ(capture.take(), "Error: No service provider specified in CSKavellAccountProviderCreate\n");
}

TEST_F(CSKavellAccountProviderTest, AProviderWithoutADirectoryHasNoAccounts)
{
    StandardErrorCapture capture;
    const Provider provider = openProvider();
    const auto accounts = adopt(_CSKavellAccountProviderCopyAccounts(provider.get()));
    ASSERT_TRUE(accounts);
    EXPECT_EQ(CSKavellArrayGetCount(accounts.get()), 0u);
    EXPECT_EQ(capture.take(), "");
    EXPECT_FALSE(std::filesystem::exists(home() + "/Library"));
}

TEST_F(CSKavellAccountProviderTest, KeepsItsProviderType)
{
    const Provider provider = openProvider();
    EXPECT_TRUE(same(adopt(_CSKavellAccountProviderCopyProviderType(provider.get())), text(kMail)));
    EXPECT_EQ(CSKavellGetTypeID(provider.get()), _CSKavellAccountProviderGetTypeID());
}

TEST_F(CSKavellAccountProviderTest, EqualsByProviderTypeAndHashesByItsAddress)
{
    const Provider first = openProvider(), second = openProvider();
    EXPECT_TRUE(CSKavellEqual(first.get(), first.get()));
    EXPECT_TRUE(CSKavellEqual(first.get(), second.get()));
    EXPECT_NE(CSKavellHash(first.get()), CSKavellHash(second.get()));
    EXPECT_EQ(CSKavellHash(first.get()), reinterpret_cast<uintptr_t>(first.get()) >> 2);
    EXPECT_FALSE(CSKavellEqual(first.get(), openProvider("com.corvane.account.Mail").get()));
    EXPECT_FALSE(CSKavellEqual(first.get(), nullptr));
}

TEST_F(CSKavellAccountProviderTest, LivesInTheAllocatorsMemoryAndGivesItBack)
{
    writeFile(fileOf("ada"), accountFile(""));
    CountingAllocator allocator, failing(0);
    {
        const Provider provider = adopt(_CSKavellAccountProviderCreate(allocator.get(), text(kMail).get()));
    }
    EXPECT_GE(allocator.allocated(), 1);
    EXPECT_EQ(allocator.deallocated(), allocator.allocated());
    EXPECT_FALSE(adopt(_CSKavellAccountProviderCreate(failing.get(), text(kMail).get())));
}

TEST_F(CSKavellAccountProviderTest, FindsOneAccountForEachDataFile)
{
    writeFile(fileOf("ada"), accountFile("<key>name</key><string>Ada</string>"));
    writeFile(fileOf("Grace Hopper@example.org"), accountFile(""));
    writeFile(fileOf("dotted.plist"), accountFile(""));
    writeFile(dataFilePath("com.corvane.account.google", "other"), accountFile(""));
    const Provider provider = openProvider();
    EXPECT_EQ(sortedNamesOf(provider), (Names{"Grace Hopper@example.org", "ada", "dotted.plist"}));
    const Account account = copyAccount(provider, "ada");
    EXPECT_TRUE(same(attribute(account, "name"), text("Ada")));
    EXPECT_FALSE(hasPendingChanges(account));
}

TEST_F(CSKavellAccountProviderTest, SkipsEverythingElseInTheDirectory)
{
    writeFile(fileOf("a"), accountFile(""));
    for (const char *name : {".plist", "a.PLIST", "notes.txt", "plist", "b.plist.bak", "bplist", "c.plist~"})
        writeFile(providerDirectory() + "/" + name, accountFile(""));
    std::filesystem::create_directory(fileOf("directory"));
    std::filesystem::create_symlink(fileOf("a"), fileOf("link"));
    ASSERT_EQ(mkfifo(fileOf("fifo").c_str(), 0600), 0);
    EXPECT_EQ(namesOf(openProvider()), (Names{"a"}));
}

TEST_F(CSKavellAccountProviderTest, ListsTheFilesInTheDirectorysOrder)
{
    for (int index = 0; index < 40; ++index)
        writeFile(fileOf("account " + std::to_string(index * 7919 % 40)), accountFile(""));
    Names expected;
    for (const auto &entry : std::filesystem::directory_iterator(providerDirectory()))
        expected.push_back(entry.path().stem());
    EXPECT_EQ(namesOf(openProvider()), expected);
}

TEST_F(CSKavellAccountProviderTest, ADirectoryThatIsAFileHasNoAccounts)
{
    writeFile(providerDirectory(), "not a directory");
    EXPECT_EQ(namesOf(openProvider()), Names{});
}

TEST_F(CSKavellAccountProviderTest, AFileThatIsNoPropertyListIsAnAccountAllTheSame)
{
    writeFile(fileOf("ada"), "garbage");
    StandardErrorCapture capture;
    const Provider provider = openProvider();
    EXPECT_EQ(capture.take(), kLoadMessage);
    EXPECT_EQ(namesOf(provider), (Names{"ada"}));
}

TEST_F(CSKavellAccountProviderTest, GetsAnAccountByItsExactLoginName)
{
    writeFile(fileOf("ada"), accountFile(""));
    const Provider provider = openProvider();
    const CSKavellAccountRef account = _CSKavellAccountProviderGetAccount(provider.get(), text("ada").get(), false);
    EXPECT_EQ(account, accountsOf(provider)[0]);
    EXPECT_EQ(_CSKavellAccountProviderGetAccount(provider.get(), text("ada").get(), true), account);
    EXPECT_EQ(_CSKavellAccountProviderGetAccount(provider.get(), text("Ada").get(), false), nullptr);
    EXPECT_EQ(namesOf(provider), (Names{"ada"}));
}

TEST_F(CSKavellAccountProviderTest, CreatesAnAccountAtTheEndOfTheListWhenAsked)
{
    writeFile(fileOf("ada"), accountFile(""));
    const Provider provider = openProvider();
    const CSKavellAccountRef created = _CSKavellAccountProviderGetAccount(provider.get(), text("grace").get(), true);
    ASSERT_NE(created, nullptr);
    EXPECT_EQ(namesOf(provider), (Names{"ada", "grace"}));
    EXPECT_EQ(accountsOf(provider)[1], created);
    EXPECT_TRUE(same(adopt(_CSKavellAccountCopyProviderType(created)), text(kMail)));
    EXPECT_FALSE(std::filesystem::exists(fileOf("grace")));
}

TEST_F(CSKavellAccountProviderTest, CopyingAnAccountRetainsIt)
{
    Provider provider = openProvider();
    EXPECT_FALSE(copyAccount(provider, "ada"));
    const Account account = copyAccount(provider, "ada", true);
    EXPECT_EQ(copyAccount(provider, "ada").get(), account.get());
    provider = nullptr;
    EXPECT_TRUE(_CSKavellAccountHasLoginName(account.get(), text("ada").get()));
}

TEST_F(CSKavellAccountProviderTest, CreatingAListedAccountAnswersTheSameRecordEachTime)
{
    writeFile(fileOf("ada"), accountFile(""));
    const Provider provider = openProvider();
    for (const char *name : {"ada", "grace"}) {
        const Account first = adopt(_CSKavellAccountProviderCreateAccount(provider.get(), text(name).get()));
        const Account second = adopt(_CSKavellAccountProviderCreateAccount(provider.get(), text(name).get()));
        ASSERT_TRUE(first);
        EXPECT_EQ(first.get(), second.get());
    }
    EXPECT_EQ(namesOf(provider), (Names{"ada", "grace"}));
}

TEST_F(CSKavellAccountProviderTest, CreatingAnAccountWithoutANameGivesTheAccountsMessage)
{
    const Provider provider = openProvider();
    StandardErrorCapture capture;
    EXPECT_FALSE(adopt(_CSKavellAccountProviderCreateAccount(provider.get(), text("").get())));
    EXPECT_EQ(capture.take(), "Error: No account name specified in CSKavellAccountCreate\n");
    EXPECT_EQ(namesOf(provider), Names{});
}

TEST_F(CSKavellAccountProviderTest, AddsAnAccountOfItsOwnProviderType)
{
    const Provider provider = openProvider();
    const Account account = openAccount("ada");
    _CSKavellAccountProviderAddAccount(provider.get(), account.get());
    EXPECT_EQ(accountsOf(provider), (std::vector<CSKavellAccountRef>{account.get()}));
    EXPECT_EQ(copyAccount(provider, "ada").get(), account.get());
}

TEST_F(CSKavellAccountProviderTest, IgnoresAnAccountOfAnotherProviderTypeOrALoginNameAlreadyListed)
{
    const Provider provider = openProvider();
    const Account account = openAccount("ada");
    _CSKavellAccountProviderAddAccount(provider.get(), account.get());
    StandardErrorCapture capture;
    _CSKavellAccountProviderAddAccount(provider.get(), openAccount("ada").get());
    _CSKavellAccountProviderAddAccount(provider.get(), account.get());
    _CSKavellAccountProviderAddAccount(provider.get(), openAccount("grace", "com.corvane.account.google").get());
    _CSKavellAccountProviderAddAccount(provider.get(), nullptr);
    EXPECT_EQ(accountsOf(provider), (std::vector<CSKavellAccountRef>{account.get()}));
    EXPECT_EQ(capture.take(), "");
}

TEST_F(CSKavellAccountProviderTest, RemovingAnAccountDeletesItsFileAndAnnouncesIt)
{
    writeFile(fileOf("ada"), accountFile(""));
    writeFile(fileOf("grace"), accountFile(""));
    const Provider provider = openProvider();
    Notifications notifications;
    _CSKavellAccountProviderRemoveAccount(provider.get(), text("ada").get());
    EXPECT_EQ(namesOf(provider), (Names{"grace"}));
    EXPECT_FALSE(std::filesystem::exists(fileOf("ada")));
    EXPECT_TRUE(std::filesystem::exists(fileOf("grace")));
    EXPECT_EQ(notifications.takeLoginNames(), (Names{"ada"}));
}

TEST_F(CSKavellAccountProviderTest, RemovingAnAccountDeletesItsFileWhateverElseIsPending)
{
    writeFile(fileOf("ada"), accountFile(""));
    const Provider provider = openProvider();
    const Account account = copyAccount(provider, "ada");
    setAttribute(account, "a", text("b"));
    _CSKavellAccountProviderRemoveAccount(provider.get(), text("ada").get());
    EXPECT_FALSE(std::filesystem::exists(fileOf("ada")));
    EXPECT_TRUE(hasPendingChanges(account));
    EXPECT_TRUE(same(attribute(account, "a"), text("b")));
}

TEST_F(CSKavellAccountProviderTest, RemovingTheOnlyAccountLeavesAnEmptyListThatCanGrowAgain)
{
    writeFile(fileOf("ada"), accountFile(""));
    const Provider provider = openProvider();
    _CSKavellAccountProviderRemoveAccount(provider.get(), text("ada").get());
    EXPECT_EQ(namesOf(provider), Names{});
    EXPECT_FALSE(copyAccount(provider, "ada"));
    EXPECT_TRUE(copyAccount(provider, "ada", true));
    EXPECT_EQ(namesOf(provider), (Names{"ada"}));
}

TEST_F(CSKavellAccountProviderTest, RemovingAnAccountThatWasNeverSavedAnnouncesNothing)
{
    const Provider provider = openProvider();
    EXPECT_TRUE(copyAccount(provider, "ada", true));
    Notifications notifications;
    _CSKavellAccountProviderRemoveAccount(provider.get(), text("ada").get());
    EXPECT_EQ(namesOf(provider), Names{});
    EXPECT_EQ(notifications.takeLoginNames(), Names{});
}

TEST_F(CSKavellAccountProviderTest, RemovingANameThatIsNotListedDoesNothing)
{
    const Provider provider = openProvider();
    writeFile(fileOf("ada"), accountFile(""));  // since the provider looked
    _CSKavellAccountProviderRemoveAccount(provider.get(), text("ada").get());
    _CSKavellAccountProviderRemoveAccount(provider.get(), nullptr);
    EXPECT_TRUE(std::filesystem::exists(fileOf("ada")));
}

TEST_F(CSKavellAccountProviderTest, TheOrderSurvivesARemovalInTheMiddle)
{
    const Provider provider = openProvider();
    for (const char *name : {"d", "a", "c", "b"})
        EXPECT_TRUE(copyAccount(provider, name, true));
    _CSKavellAccountProviderRemoveAccount(provider.get(), text("a").get());
    EXPECT_TRUE(copyAccount(provider, "a", true));
    EXPECT_EQ(namesOf(provider), (Names{"d", "c", "b", "a"}));
    for (const char *name : {"d", "c", "b", "a"})
        EXPECT_TRUE(_CSKavellAccountHasLoginName(copyAccount(provider, name).get(), text(name).get()));
}

TEST_F(CSKavellAccountProviderTest, ReloadingReadsTheDirectoryAfreshIntoNewRecords)
{
    writeFile(fileOf("ada"), accountFile("<key>name</key><string>Ada</string>"));
    writeFile(fileOf("gone"), accountFile(""));
    const Provider provider = openProvider();
    const Account before = copyAccount(provider, "ada");
    EXPECT_TRUE(copyAccount(provider, "never saved", true));
    setAttribute(before, "pending", text("x"));
    writeFile(fileOf("ada"), accountFile("<key>name</key><string>Augusta</string>"));
    writeFile(fileOf("new"), accountFile(""));
    std::filesystem::remove(fileOf("gone"));

    _CSKavellAccountProviderReloadAccountData(provider.get());

    EXPECT_EQ(sortedNamesOf(provider), (Names{"ada", "new"}));
    const Account after = copyAccount(provider, "ada");
    EXPECT_NE(after.get(), before.get());
    EXPECT_TRUE(same(attributes(after), dictionary({{"name", text("Augusta")}})));
    EXPECT_TRUE(same(attribute(before, "pending"), text("x")));
}

TEST_F(CSKavellAccountProviderTest, ReloadingWithoutADirectoryLeavesNoAccounts)
{
    writeFile(fileOf("ada"), accountFile(""));
    const Provider provider = openProvider();
    std::filesystem::remove_all(providerDirectory());
    _CSKavellAccountProviderReloadAccountData(provider.get());
    EXPECT_EQ(namesOf(provider), Names{});
}

TEST_F(CSKavellAccountProviderTest, TheListHandedOutIsIndependentOfTheProvider)
{
    const Provider provider = openProvider();
    EXPECT_TRUE(copyAccount(provider, "ada", true));
    const auto accounts = adopt(_CSKavellAccountProviderCopyAccounts(provider.get()));
    EXPECT_TRUE(copyAccount(provider, "grace", true));
    EXPECT_EQ(CSKavellArrayGetCount(accounts.get()), 1u);
}

TEST_F(CSKavellAccountProviderTest, ANoneRecordAnswersNoneOrNothing)
{
    StandardErrorCapture capture;
    const String name = text("ada");
    EXPECT_FALSE(adopt(_CSKavellAccountProviderCopyProviderType(nullptr)));
    EXPECT_FALSE(adopt(_CSKavellAccountProviderCopyAccounts(nullptr)));
    EXPECT_EQ(_CSKavellAccountProviderGetAccount(nullptr, name.get(), true), nullptr);
    EXPECT_FALSE(adopt(_CSKavellAccountProviderCopyAccount(nullptr, name.get(), true)));
    EXPECT_FALSE(adopt(_CSKavellAccountProviderCreateAccount(nullptr, name.get())));
    _CSKavellAccountProviderAddAccount(nullptr, openAccount("ada").get());
    _CSKavellAccountProviderRemoveAccount(nullptr, name.get());
    _CSKavellAccountProviderReloadAccountData(nullptr);
    EXPECT_EQ(capture.take(), "");
}

TEST_F(CSKavellAccountProviderTest, ANoneLoginNameFindsNothing)
{
    writeFile(fileOf("ada"), accountFile(""));
    const Provider provider = openProvider();
    EXPECT_EQ(_CSKavellAccountProviderGetAccount(provider.get(), nullptr, false), nullptr);
    EXPECT_FALSE(adopt(_CSKavellAccountProviderCopyAccount(provider.get(), nullptr, false)));
    EXPECT_EQ(namesOf(provider), (Names{"ada"}));
}

TEST_F(CSKavellAccountProviderTest, ThreadsThatCreateOneAccountAtOnceGetOneRecord)
{
    const Provider provider = openProvider();
    std::vector<CSKavellAccountRef> answers(8);
    {
        std::vector<std::jthread> threads;
        for (size_t index = 0; index < answers.size(); ++index)
            threads.emplace_back([&, index] { answers[index] = copyAccount(provider, "ada", true).get(); });
    }
    EXPECT_EQ(namesOf(provider), (Names{"ada"}));
    for (CSKavellAccountRef answer : answers)
        EXPECT_EQ(answer, accountsOf(provider)[0]);
}

TEST_F(CSKavellAccountProviderTest, LoadsAThousandAccountsEachUnderItsName)
{
    for (int index = 0; index < 1000; ++index)
        writeFile(fileOf("account " + std::to_string(index)),
                  accountFile("<key>index</key><integer>" + std::to_string(index) + "</integer>"));
    const Provider provider = openProvider();
    ASSERT_EQ(namesOf(provider).size(), 1000u);
    for (int index = 0; index < 1000; ++index)
        ASSERT_TRUE(
            same(attribute(copyAccount(provider, "account " + std::to_string(index)), "index"), integer(index)));
}
