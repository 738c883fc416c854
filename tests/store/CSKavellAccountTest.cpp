// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <atomic>
#include <thread>

#include "store/CSKavellAccount_p.h"
#include "tests/store/store_test.h"

using namespace kavell;
using namespace kavell::test;

namespace {

using CSKavellAccountTest = StoreTest;

/// The URL's path; "(none)" for none.
std::string pathOf(CSKavellURLRef url)
{
    const OwnedCString path(CSKavellURLCopyFileSystemPath(url));
    return path ? path.get() : "(none)";
}

/// An account whose file holds a provider attribute and a mail attribute.
Account savedAccount(std::string_view loginName = "ada")
{
    writeFile(dataFilePath(kMail, loginName),
              accountFile("<key>name</key><string>Ada</string>",
                          "<key>com.corvane.service.Mail</key><dict><key>port</key><integer>25</integer></dict>"));
    return openAccount(loginName);
}

}  // namespace

TEST_F(CSKavellAccountTest, KeepsProviderTypeAndLoginNameVerbatim)
{
    const Account account = openAccount("Ada Lovelace@Example.org \xC3\xA9", "com.corvane.account.google");
    EXPECT_TRUE(same(adopt(_CSKavellAccountCopyProviderType(account.get())), text("com.corvane.account.google")));
    EXPECT_TRUE(same(adopt(_CSKavellAccountCopyLoginName(account.get())), text("Ada Lovelace@Example.org \xC3\xA9")));
    EXPECT_EQ(CSKavellGetTypeID(account.get()), _CSKavellAccountGetTypeID());
}

TEST_F(CSKavellAccountTest, RefusesANoneOrEmptyProviderTypeWithItsMessage)
{
    StandardErrorCapture capture;
    EXPECT_FALSE(adopt(_CSKavellAccountCreate(nullptr, nullptr, text("ada").get())));
    EXPECT_EQ(capture.take(), "Error: No service provider specified in CSKavellAccountCreate\n");
    EXPECT_FALSE(adopt(_CSKavellAccountCreate(nullptr, text("").get(), text("ada").get())));
    EXPECT_EQ(capture.take(), "Error: No service provider specified in CSKavellAccountCreate\n");
}

TEST_F(CSKavellAccountTest, RefusesANoneOrEmptyLoginNameWithItsMessage)
{
    StandardErrorCapture capture;
    EXPECT_FALSE(adopt(_CSKavellAccountCreate(nullptr, text(kMail).get(), nullptr)));
    EXPECT_EQ(capture.take(), "Error: No account name specified in CSKavellAccountCreate\n");
    EXPECT_FALSE(adopt(_CSKavellAccountCreate(nullptr, text(kMail).get(), text("").get())));
    EXPECT_EQ(capture.take(), "Error: No account name specified in CSKavellAccountCreate\n");
}

TEST_F(CSKavellAccountTest, ComplainsAboutTheProviderTypeFirst)
{
    StandardErrorCapture capture;
    EXPECT_FALSE(adopt(_CSKavellAccountCreate(nullptr, text("").get(), nullptr)));
    EXPECT_FALSE(adopt(_CSKavellAccountCreate(nullptr, nullptr, text("").get())));
    EXPECT_EQ(capture.take(), "Error: No service provider specified in CSKavellAccountCreate\n"
                              "Error: No service provider specified in CSKavellAccountCreate\n");
}

TEST_F(CSKavellAccountTest, AnAccountWithoutAFileIsNewAndPending)
{
    StandardErrorCapture capture;
    const Account account = openAccount("ada"), other = openAccount("grace");
    EXPECT_TRUE(hasPendingChanges(account));
    EXPECT_TRUE(adopt(_CSKavellAccountCopyUUID(account.get())));
    EXPECT_EQ(uuidOf(account).size(), 36u);
    EXPECT_NE(uuidOf(account), uuidOf(other));
    EXPECT_EQ(CSKavellDictionaryGetCount(attributes(account).get()), 0u);
    EXPECT_EQ(capture.take(), "");
    EXPECT_FALSE(std::filesystem::exists(home() + "/Library"));
}

TEST_F(CSKavellAccountTest, AnAccountWhoseFileHoldsAUUIDStartsWithoutPendingChanges)
{
    const Account account = savedAccount();
    EXPECT_FALSE(hasPendingChanges(account));
    EXPECT_EQ(uuidOf(account), kUUID);
    EXPECT_TRUE(same(attribute(account, "name"), text("Ada")));
    EXPECT_TRUE(same(serviceAttributes(account, kCSKavellAccountServiceMail), dictionary({{"port", integer(25)}})));
}

TEST_F(CSKavellAccountTest, AnAccountWhoseFileHoldsNoUUIDGetsOneAndIsPending)
{
    writeFile(fileOf("ada"), propertyList("<key>AccountSettings</key><dict><key>a</key><true/></dict>"));
    const Account account = openAccount("ada");
    EXPECT_TRUE(hasPendingChanges(account));
    EXPECT_EQ(uuidOf(account).size(), 36u);
    EXPECT_TRUE(same(attribute(account, "a"), boolean(true)));
}

TEST_F(CSKavellAccountTest, LivesInTheAllocatorsMemoryAndGivesItBack)
{
    CountingAllocator allocator;
    {
        const Account account = adopt(_CSKavellAccountCreate(allocator.get(), text(kMail).get(), text("ada").get()));
        ASSERT_TRUE(account);
        EXPECT_GE(allocator.allocated(), 3);  // the record and copies of both strings
        setAttribute(account, "a", text("b"));
    }
    EXPECT_EQ(allocator.deallocated(), allocator.allocated());
}

TEST_F(CSKavellAccountTest, IsNoneWhenTheAllocatorGivesNothingAtAnyStep)
{
    for (int given = 0; given < 3; ++given) {
        CountingAllocator allocator(given);
        EXPECT_FALSE(adopt(_CSKavellAccountCreate(allocator.get(), text(kMail).get(), text("ada").get()))) << given;
        EXPECT_EQ(allocator.deallocated(), allocator.allocated()) << given;
    }
}

TEST_F(CSKavellAccountTest, TwoRecordsOfOneAccountAreEqualThoughTheirHashesDiffer)
{
    const Account first = openAccount("ada"), second = openAccount("ada");
    EXPECT_TRUE(CSKavellEqual(first.get(), first.get()));
    EXPECT_TRUE(CSKavellEqual(first.get(), second.get()));
    EXPECT_TRUE(CSKavellEqual(second.get(), first.get()));
    EXPECT_NE(CSKavellHash(first.get()), CSKavellHash(second.get()));
    EXPECT_EQ(CSKavellHash(first.get()), reinterpret_cast<uintptr_t>(first.get()) >> 2);
}

TEST_F(CSKavellAccountTest, EqualityComparesProviderTypeAndLoginNameToTheLetter)
{
    const Account account = openAccount("ada");
    EXPECT_FALSE(CSKavellEqual(account.get(), openAccount("Ada").get()));
    EXPECT_FALSE(CSKavellEqual(account.get(), openAccount("ada", "com.corvane.account.google").get()));
    EXPECT_FALSE(CSKavellEqual(account.get(), nullptr));
    EXPECT_FALSE(CSKavellEqual(nullptr, account.get()));
    EXPECT_FALSE(CSKavellEqual(account.get(), text("ada").get()));
}

TEST_F(CSKavellAccountTest, KnowsItsLoginNameToTheLetter)
{
    const Account account = openAccount("ada");
    EXPECT_TRUE(_CSKavellAccountHasLoginName(account.get(), text("ada").get()));
    EXPECT_FALSE(_CSKavellAccountHasLoginName(account.get(), text("Ada").get()));
    EXPECT_FALSE(_CSKavellAccountHasLoginName(account.get(), text("ada ").get()));
    EXPECT_FALSE(_CSKavellAccountHasLoginName(account.get(), nullptr));
}

TEST_F(CSKavellAccountTest, AnswersAPendingUUIDAsSoonAsItIsSet)
{
    const Account account = savedAccount();
    _CSKavellAccountSetUUIDString(account.get(), text("11111111-2222-4333-8444-555555555555").get());
    EXPECT_EQ(uuidOf(account), "11111111-2222-4333-8444-555555555555");
    _CSKavellAccountSetUUIDString(account.get(), nullptr);
    EXPECT_EQ(uuidOf(account), kUUID);
}

TEST_F(CSKavellAccountTest, SettingAUUIDAloneIsNoPendingChange)
{
    const Account account = savedAccount();
    _CSKavellAccountSetUUIDString(account.get(), text("11111111-2222-4333-8444-555555555555").get());
    EXPECT_FALSE(hasPendingChanges(account));
    const std::string before = readFile(fileOf("ada"));
    commit(account);
    EXPECT_EQ(readFile(fileOf("ada")), before);
    EXPECT_EQ(uuidOf(account), "11111111-2222-4333-8444-555555555555");
}

TEST_F(CSKavellAccountTest, APendingUUIDIsSavedWithAnotherChange)
{
    const Account account = savedAccount();
    _CSKavellAccountSetUUIDString(account.get(), text("11111111-2222-4333-8444-555555555555").get());
    setAttribute(account, "name", text("Grace"));
    commit(account);
    EXPECT_EQ(uuidOf(openAccount("ada")), "11111111-2222-4333-8444-555555555555");
    EXPECT_EQ(uuidOf(account), "11111111-2222-4333-8444-555555555555");
}

TEST_F(CSKavellAccountTest, SetsAndReadsItsUUIDAsAnObject)
{
    const Account account = openAccount("ada");
    const auto uuid = adopt(CSKavellUUIDCreateFromString(text("11111111-2222-4333-8444-555555555555").get()));
    _CSKavellAccountSetUUID(account.get(), uuid.get());
    EXPECT_EQ(uuidOf(account), "11111111-2222-4333-8444-555555555555");
    EXPECT_TRUE(same(adopt(_CSKavellAccountCopyUUID(account.get())), uuid));
    _CSKavellAccountSetUUID(account.get(), nullptr);
    EXPECT_EQ(uuidOf(account), "11111111-2222-4333-8444-555555555555");
}

TEST_F(CSKavellAccountTest, ATextThatIsNoUUIDGivesNoUUIDObject)
{
    const Account account = openAccount("ada");
    _CSKavellAccountSetUUIDString(account.get(), text("not a uuid").get());
    EXPECT_EQ(uuidOf(account), "not a uuid");
    EXPECT_FALSE(adopt(_CSKavellAccountCopyUUID(account.get())));
}

TEST_F(CSKavellAccountTest, WithoutAnyUUIDAnswersTheEmptyString)
{
    const Account account = openAccount("ada");
    account->uuidString = nullptr;
    const String uuid = adopt(_CSKavellAccountCopyUUIDString(account.get()));
    ASSERT_TRUE(uuid);
    EXPECT_EQ(toStringView(uuid.get()), "");
    EXPECT_FALSE(adopt(_CSKavellAccountCopyUUID(account.get())));
}

TEST_F(CSKavellAccountTest, TheMarkForRemovalIsAPendingChangeThatCanBeTakenBack)
{
    const Account account = savedAccount();
    _CSKavellAccountRemove(account.get());
    EXPECT_TRUE(hasPendingChanges(account));
    _CSKavellAccountCancelRemove(account.get());
    EXPECT_FALSE(hasPendingChanges(account));
    commit(account);
    EXPECT_TRUE(std::filesystem::exists(fileOf("ada")));
}

TEST_F(CSKavellAccountTest, TakingTheMarkBackKeepsOtherChanges)
{
    const Account account = savedAccount();
    setAttribute(account, "a", text("b"));
    _CSKavellAccountRemove(account.get());
    _CSKavellAccountCancelRemove(account.get());
    EXPECT_TRUE(hasPendingChanges(account));
}

TEST_F(CSKavellAccountTest, SetsProviderAttributesWithOrWithoutTheServiceForm)
{
    const Account account = savedAccount();
    setAttribute(account, "a", integer(1));
    EXPECT_TRUE(hasPendingChanges(account));
    _CSKavellAccountSetServiceAttribute(account.get(), nullptr, text("b").get(), integer(2).get());
    const auto expected = dictionary({{"name", text("Ada")}, {"a", integer(1)}, {"b", integer(2)}});
    EXPECT_TRUE(same(attributes(account), expected));
    EXPECT_TRUE(same(serviceAttributes(account, nullptr), expected));
    EXPECT_TRUE(same(adopt(_CSKavellAccountCopyServiceAttribute(account.get(), nullptr, text("a").get())), integer(1)));
    EXPECT_TRUE(same(attribute(account, "b"), integer(2)));
    EXPECT_FALSE(attribute(account, "missing"));
}

TEST_F(CSKavellAccountTest, RemovesAProviderAttributeWhetherOrNotItIsThere)
{
    const Account account = savedAccount();
    _CSKavellAccountRemoveProviderAttribute(account.get(), text("name").get());
    EXPECT_FALSE(attribute(account, "name"));
    EXPECT_TRUE(hasPendingChanges(account));
    const Account second = savedAccount("grace");
    _CSKavellAccountRemoveProviderAttribute(second.get(), text("never set").get());
    EXPECT_TRUE(hasPendingChanges(second));
}

TEST_F(CSKavellAccountTest, SettingANoneValueRemovesTheAttribute)
{
    const Account account = savedAccount();
    setAttribute(account, "name", nullptr);
    EXPECT_FALSE(attribute(account, "name"));
    EXPECT_TRUE(hasPendingChanges(account));
    _CSKavellAccountSetServiceAttribute(account.get(), kCSKavellAccountServiceMail, text("port").get(), nullptr);
    EXPECT_EQ(CSKavellDictionaryGetCount(serviceAttributes(account, kCSKavellAccountServiceMail).get()), 0u);
}

TEST_F(CSKavellAccountTest, SettingANoneValueInAServiceItNeverHadDoesNothing)
{
    const Account account = savedAccount();
    _CSKavellAccountSetServiceAttribute(account.get(), kCSKavellAccountServiceLDAP, text("a").get(), nullptr);
    EXPECT_FALSE(hasPendingChanges(account));
    EXPECT_EQ(ServiceForID(account.get(), kCSKavellAccountServiceLDAP, false), nullptr);
}

TEST_F(CSKavellAccountTest, ReplacesAndRemovesAllProviderAttributes)
{
    const Account account = savedAccount();
    _CSKavellAccountSetProviderAttributes(account.get(), dictionary({{"b", integer(2)}}).get());
    EXPECT_TRUE(same(attributes(account), dictionary({{"b", integer(2)}})));
    EXPECT_TRUE(hasPendingChanges(account));
    _CSKavellAccountRemoveAllProviderAttributes(account.get());
    ASSERT_TRUE(attributes(account));
    EXPECT_EQ(CSKavellDictionaryGetCount(attributes(account).get()), 0u);
}

TEST_F(CSKavellAccountTest, ReplacingAllByNothingIsAPendingChange)
{
    const Account account = savedAccount();
    _CSKavellAccountSetServiceAttributes(account.get(), kCSKavellAccountServiceLDAP, dictionary({}).get());
    EXPECT_TRUE(hasPendingChanges(account));
    EXPECT_NE(ServiceForID(account.get(), kCSKavellAccountServiceLDAP, false), nullptr);
}

TEST_F(CSKavellAccountTest, SettingAnAttributeOfAServiceItNeverHadCreatesTheService)
{
    const Account account = savedAccount();
    ASSERT_EQ(ServiceForID(account.get(), kCSKavellAccountServiceLDAP, false), nullptr);
    _CSKavellAccountSetServiceAttribute(account.get(), kCSKavellAccountServiceLDAP, text("a").get(), integer(1).get());
    EXPECT_NE(ServiceForID(account.get(), kCSKavellAccountServiceLDAP, false), nullptr);
    EXPECT_TRUE(hasPendingChanges(account));
    EXPECT_TRUE(same(serviceAttributes(account, kCSKavellAccountServiceLDAP), dictionary({{"a", integer(1)}})));
    EXPECT_TRUE(same(serviceAttributes(account, kCSKavellAccountServiceMail), dictionary({{"port", integer(25)}})));
    EXPECT_FALSE(attribute(account, "a"));
}

TEST_F(CSKavellAccountTest, RemovingFromAServiceItNeverHadDoesNothing)
{
    const Account account = savedAccount();
    _CSKavellAccountRemoveServiceAttribute(account.get(), kCSKavellAccountServiceLDAP, text("a").get());
    _CSKavellAccountRemoveAllServiceAttributes(account.get(), kCSKavellAccountServiceLDAP);
    EXPECT_FALSE(hasPendingChanges(account));
    EXPECT_EQ(ServiceForID(account.get(), kCSKavellAccountServiceLDAP, false), nullptr);
}

TEST_F(CSKavellAccountTest, RemovesFromAServiceItHas)
{
    const Account account = savedAccount(), second = savedAccount("grace");
    _CSKavellAccountRemoveServiceAttribute(account.get(), kCSKavellAccountServiceMail, text("port").get());
    EXPECT_TRUE(hasPendingChanges(account));
    EXPECT_EQ(CSKavellDictionaryGetCount(serviceAttributes(account, kCSKavellAccountServiceMail).get()), 0u);
    _CSKavellAccountRemoveAllServiceAttributes(second.get(), kCSKavellAccountServiceMail);
    EXPECT_TRUE(hasPendingChanges(second));
    EXPECT_EQ(CSKavellDictionaryGetCount(serviceAttributes(second, kCSKavellAccountServiceMail).get()), 0u);
}

TEST_F(CSKavellAccountTest, TheAttributesOfAServiceWithoutAnyAreAnEmptyDictionary)
{
    const Account account = openAccount("ada");
    ASSERT_TRUE(serviceAttributes(account, kCSKavellAccountServiceLDAP));
    EXPECT_EQ(CSKavellDictionaryGetCount(serviceAttributes(account, kCSKavellAccountServiceLDAP).get()), 0u);
    EXPECT_FALSE(
        adopt(_CSKavellAccountCopyServiceAttribute(account.get(), kCSKavellAccountServiceLDAP, text("a").get())));
    EXPECT_NE(ServiceForID(account.get(), kCSKavellAccountServiceLDAP, true), nullptr);
    ASSERT_TRUE(serviceAttributes(account, kCSKavellAccountServiceLDAP));
    EXPECT_EQ(CSKavellDictionaryGetCount(serviceAttributes(account, kCSKavellAccountServiceLDAP).get()), 0u);
}

TEST_F(CSKavellAccountTest, TheSettingsOfAServiceAreFoundOrMade)
{
    const Account account = savedAccount();
    const CSKavellAccountSettingsRef own = ServiceForID(account.get(), nullptr, false);
    EXPECT_TRUE(same(adopt(CSKavellAccountSettingsCopyAttributes(own)), dictionary({{"name", text("Ada")}})));
    EXPECT_EQ(ServiceForID(account.get(), kCSKavellAccountServiceLDAP, false), nullptr);
    const CSKavellAccountSettingsRef made = ServiceForID(account.get(), kCSKavellAccountServiceLDAP, true);
    EXPECT_EQ(CSKavellGetTypeID(made), _CSKavellAccountSettingsGetTypeID());
    EXPECT_EQ(ServiceForID(account.get(), text("com.corvane.service.LDAP").get(), false), made);
    EXPECT_FALSE(hasPendingChanges(account));
}

TEST_F(CSKavellAccountTest, CancellingDropsAttributesUUIDAndMark)
{
    const Account account = savedAccount();
    setAttribute(account, "name", text("Grace"));
    _CSKavellAccountSetServiceAttribute(account.get(), kCSKavellAccountServiceMail, text("port").get(),
                                        integer(993).get());
    _CSKavellAccountSetServiceAttribute(account.get(), kCSKavellAccountServiceLDAP, text("a").get(), integer(1).get());
    _CSKavellAccountSetUUIDString(account.get(), text("11111111-2222-4333-8444-555555555555").get());
    _CSKavellAccountRemove(account.get());
    _CSKavellAccountCancelChanges(account.get());
    EXPECT_FALSE(hasPendingChanges(account));
    EXPECT_EQ(uuidOf(account), kUUID);
    EXPECT_TRUE(same(attribute(account, "name"), text("Ada")));
    EXPECT_TRUE(same(serviceAttributes(account, kCSKavellAccountServiceMail), dictionary({{"port", integer(25)}})));
    EXPECT_EQ(ServiceForID(account.get(), kCSKavellAccountServiceLDAP, false), nullptr);
    commit(account);
    EXPECT_TRUE(std::filesystem::exists(fileOf("ada")));
}

TEST_F(CSKavellAccountTest, CancellingReadsTheFileAgain)
{
    const Account account = savedAccount();
    setAttribute(account, "name", text("Grace"));
    writeFile(fileOf("ada"), accountFile("<key>name</key><string>Augusta</string>"));
    _CSKavellAccountCancelChanges(account.get());
    EXPECT_TRUE(same(attributes(account), dictionary({{"name", text("Augusta")}})));
    EXPECT_EQ(CSKavellDictionaryGetCount(serviceAttributes(account, kCSKavellAccountServiceMail).get()), 0u);
}

TEST_F(CSKavellAccountTest, CancellingANewAccountLeavesNothingToSave)
{
    const Account account = openAccount("ada");
    const std::string uuid = uuidOf(account);
    _CSKavellAccountCancelChanges(account.get());
    EXPECT_FALSE(hasPendingChanges(account));
    EXPECT_EQ(uuidOf(account), uuid);
    commit(account);
    EXPECT_FALSE(std::filesystem::exists(fileOf("ada")));
}

TEST_F(CSKavellAccountTest, TheDataRootIsBelowTheHomeDirectory)
{
    const Account account = openAccount("ada");
    EXPECT_EQ(pathOf(adopt(_CSKavellAccountCopyBaseURL(account.get())).get()), home() + "/Library/Kavell Accounts/V1");
    EXPECT_EQ(pathOf(adopt(_CSKavellAccountCopyBaseURL(nullptr)).get()), home() + "/Library/Kavell Accounts/V1");
    const auto url = adopt(_CSKavellAccountCopyBaseURL(nullptr));
    EXPECT_TRUE(toStringView(CSKavellURLGetString(url.get())).starts_with("file:///"));
    EXPECT_NE(toStringView(CSKavellURLGetString(url.get())).find("/Kavell%20Accounts/V1"), std::string::npos);
}

TEST_F(CSKavellAccountTest, ANoneRecordAnswersNoneFalseOrNothing)
{
    StandardErrorCapture capture;
    const CSKavellAccountRef none = nullptr;
    const String key = text("a");
    EXPECT_FALSE(adopt(_CSKavellAccountCopyProviderType(none)));
    EXPECT_FALSE(adopt(_CSKavellAccountCopyLoginName(none)));
    EXPECT_FALSE(_CSKavellAccountHasLoginName(none, key.get()));
    EXPECT_FALSE(adopt(_CSKavellAccountCopyUUIDString(none)));
    EXPECT_FALSE(adopt(_CSKavellAccountCopyUUID(none)));
    _CSKavellAccountSetUUIDString(none, key.get());
    _CSKavellAccountSetUUID(none, adopt(CSKavellUUIDCreate()).get());
    EXPECT_FALSE(_CSKavellAccountHasPendingChanges(none));
    _CSKavellAccountRemove(none);
    _CSKavellAccountCancelRemove(none);
    EXPECT_FALSE(adopt(_CSKavellAccountCopyServiceAttributes(none, key.get())));
    EXPECT_FALSE(adopt(_CSKavellAccountCopyServiceAttribute(none, key.get(), key.get())));
    _CSKavellAccountSetServiceAttributes(none, key.get(), dictionary({}).get());
    _CSKavellAccountSetServiceAttribute(none, key.get(), key.get(), key.get());
    _CSKavellAccountRemoveServiceAttribute(none, key.get(), key.get());
    _CSKavellAccountRemoveAllServiceAttributes(none, key.get());
    EXPECT_EQ(ServiceForID(none, key.get(), true), nullptr);
    EXPECT_FALSE(adopt(_CSKavellAccountCopyProviderAttributes(none)));
    EXPECT_FALSE(adopt(_CSKavellAccountCopyProviderAttribute(none, key.get())));
    _CSKavellAccountSetProviderAttributes(none, dictionary({}).get());
    _CSKavellAccountSetProviderAttribute(none, key.get(), key.get());
    _CSKavellAccountRemoveProviderAttribute(none, key.get());
    _CSKavellAccountRemoveAllProviderAttributes(none);
    _CSKavellAccountCancelChanges(none);
    _CSKavellAccountCommitChanges(none);
    EXPECT_FALSE(CSKavellAccountLoadData(none));
    EXPECT_EQ(capture.take(), "");
}

TEST_F(CSKavellAccountTest, NoneKeysAndDictionariesChangeNothing)
{
    const Account account = savedAccount();
    EXPECT_FALSE(adopt(_CSKavellAccountCopyProviderAttribute(account.get(), nullptr)));
    EXPECT_FALSE(adopt(_CSKavellAccountCopyServiceAttribute(account.get(), kCSKavellAccountServiceMail, nullptr)));
    _CSKavellAccountSetProviderAttribute(account.get(), nullptr, text("a").get());
    _CSKavellAccountRemoveProviderAttribute(account.get(), nullptr);
    _CSKavellAccountSetProviderAttributes(account.get(), nullptr);
    _CSKavellAccountSetServiceAttributes(account.get(), kCSKavellAccountServiceMail, nullptr);
    EXPECT_TRUE(same(attributes(account), dictionary({{"name", text("Ada")}})));
    EXPECT_TRUE(same(serviceAttributes(account, kCSKavellAccountServiceMail), dictionary({{"port", integer(25)}})));
}

TEST_F(CSKavellAccountTest, ManyThreadsUseOneRecordAtOnce)
{
    const Account account = openAccount("ada");
    {
        std::vector<std::jthread> threads;
        for (int thread = 0; thread < 8; ++thread)
            threads.emplace_back([&account, thread] {
                const std::string key = "key " + std::to_string(thread);
                for (int round = 0; round < 500; ++round) {
                    setAttribute(account, key, integer(round));
                    EXPECT_TRUE(same(attribute(account, key), integer(round)));
                    EXPECT_TRUE(CSKavellEqual(account.get(), account.get()));
                }
            });
    }
    EXPECT_EQ(CSKavellDictionaryGetCount(attributes(account).get()), 8u);
    EXPECT_TRUE(same(attribute(account, "key 7"), integer(499)));
}

TEST_F(CSKavellAccountTest, AThreadThatWaitsForTheRecordSleeps)
{
    const Account account = openAccount("ada");
    account->lock.lock();
    std::atomic<bool> begun{false}, done{false};
    clockid_t clock;
    std::jthread waiting([&] {
        begun = true;
        EXPECT_TRUE(hasPendingChanges(account));
        done = true;
    });
    ASSERT_EQ(pthread_getcpuclockid(waiting.native_handle(), &clock), 0);
    // The processor time of the waiting thread stands still while real time passes.
    const auto until = std::chrono::steady_clock::now() + std::chrono::milliseconds(300);
    while (std::chrono::steady_clock::now() < until)
        std::this_thread::yield();
    struct timespec used {};
    EXPECT_EQ(clock_gettime(clock, &used), 0);
    EXPECT_TRUE(begun);
    EXPECT_FALSE(done);
    EXPECT_EQ(used.tv_sec, 0);
    EXPECT_LT(used.tv_nsec, 100000000);
    account->lock.unlock();
    waiting.join();
    EXPECT_TRUE(done);
}

TEST(CreateUTF8CString, GivesTheTextWithItsTerminator)
{
    EXPECT_STREQ(CreateUTF8CString(text("caf\xC3\xA9").get()).get(), "caf\xC3\xA9");
    EXPECT_STREQ(CreateUTF8CString(text("").get()).get(), "");
}

TEST(CreateUTF8CString, IsNoneForNone)
{
    EXPECT_EQ(CreateUTF8CString(nullptr).get(), nullptr);
}
