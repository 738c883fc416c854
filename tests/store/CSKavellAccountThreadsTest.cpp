// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Many threads with one account's record.

#include <atomic>

#include "tests/store/store_test.h"
#include "tests/support/threads.h"

using namespace kavell;
using namespace kavell::test;

namespace {

class AccountThreads : public StoreTest {
protected:
    static constexpr int kThreads = 8;
};

}  // namespace

TEST_F(AccountThreads, ChangesOfAllAreSavedWhileOthersSaveAndReload)
{
    const Account account = openAccount("ada");
    std::atomic<int> setting{kThreads - 2};
    onThreads(kThreads, [&](int index) {
        const std::string key = "key " + std::to_string(index), passing = "passing " + std::to_string(index);
        if (index >= kThreads - 2) {
            while (setting > 0) {
                commit(account);
                EXPECT_TRUE(CSKavellAccountLoadData(account.get()));
            }
            return;
        }
        for (int round = 0; round <= 200; ++round) {
            setAttribute(account, key, integer(round));
            setAttribute(account, passing, integer(round));
            EXPECT_TRUE(same(attribute(account, key), integer(round)));
            _CSKavellAccountRemoveProviderAttribute(account.get(), text(passing).get());
            EXPECT_FALSE(attribute(account, passing));
        }
        --setting;
    });
    commit(account);
    EXPECT_FALSE(hasPendingChanges(account));

    const Account reread = openAccount("ada");
    EXPECT_EQ(CSKavellDictionaryGetCount(attributes(reread).get()), size_t{kThreads - 2});
    for (int index = 0; index < kThreads - 2; ++index)
        EXPECT_TRUE(same(attribute(reread, "key " + std::to_string(index)), integer(200)));
}

TEST_F(AccountThreads, AServicesAttributesAreReadAsTheyWereSetTogether)
{
    const Account account = openAccount("ada");
    onThreads(kThreads, [&](int index) {
        for (int round = 0; round < 300; ++round) {
            if (index % 2 == 0) {
                const auto both = dictionary({{"one", integer(round)}, {"other", integer(round)}});
                _CSKavellAccountSetServiceAttributes(account.get(), kCSKavellAccountServiceMail, both.get());
            } else {
                const auto both = serviceAttributes(account, kCSKavellAccountServiceMail);
                EXPECT_TRUE(CSKavellDictionaryGetCount(both.get()) == 0 ||
                            same(valueOf(both.get(), "one"), valueOf(both.get(), "other")));
            }
        }
    });
    EXPECT_TRUE(same(serviceAttributes(account, kCSKavellAccountServiceMail),
                     dictionary({{"one", integer(299)}, {"other", integer(299)}})));
}

TEST_F(AccountThreads, WhatIsHandedOutStaysAsItWasWhileOthersChangeTheAccount)
{
    const Account account = openAccount("ada");
    for (int index = 0; index < 20; ++index)
        setAttribute(account, std::to_string(index), integer(index));
    const auto before = attributes(account);
    std::atomic<bool> isChanging{true};
    onThreads(kThreads, [&](int index) {
        if (index == 0) {
            for (int round = 0; round < 2000; ++round)
                setAttribute(account, std::to_string(round % 40), integer(-1));
            isChanging = false;
            return;
        }
        while (isChanging) {
            const auto copy = attributes(account);
            EXPECT_GE(CSKavellDictionaryGetCount(copy.get()), 20U);
            EXPECT_EQ(CSKavellDictionaryGetCount(before.get()), 20U);
            EXPECT_TRUE(same(valueOf(before.get(), "7"), integer(7).get()));
        }
    });
    EXPECT_EQ(CSKavellDictionaryGetCount(attributes(account).get()), 40U);
}

TEST_F(AccountThreads, EachListsServicesOnceWhileOthersAddAndRemoveThem)
{
    const Account account = openAccount("ada");
    onThreads(kThreads, [&](int index) {
        const String own = text("com.corvane.service." + std::to_string(index));
        for (int round = 0; round < 100; ++round) {
            _CSKavellAccountSetServiceAttribute(account.get(), own.get(), text("on").get(), boolean(true).get());
            auto names = textsOf(adopt(_CSKavellAccountCopyServiceIDs(account.get())).get());
            std::sort(names.begin(), names.end());
            EXPECT_EQ(std::adjacent_find(names.begin(), names.end()), names.end());
            EXPECT_TRUE(std::binary_search(names.begin(), names.end(), toStringView(own.get())));
            _CSKavellAccountRemoveServiceAttribute(account.get(), own.get(), text("on").get());
        }
    });
    EXPECT_EQ(CSKavellArrayGetCount(adopt(_CSKavellAccountCopyServiceIDs(account.get())).get()), 0U);
}

TEST_F(AccountThreads, CancellingLeavesWhatWasSaved)
{
    const Account account = openAccount("ada");
    setAttribute(account, "saved", integer(1));
    commit(account);
    onThreads(kThreads, [&](int index) {
        for (int round = 0; round < 50; ++round) {
            EXPECT_TRUE(same(attribute(account, "saved"), integer(1)));
            if (index % 2 == 0)
                _CSKavellAccountCancelChanges(account.get());
            else
                setAttribute(account, "pending", integer(round));
        }
    });
    _CSKavellAccountCancelChanges(account.get());
    EXPECT_TRUE(same(attributes(account), dictionary({{"saved", integer(1)}})));
}

TEST_F(AccountThreads, TwoRecordsAreComparedInBothOrdersWhileTheyAreSaved)
{
    const Account one = openAccount("ada"), same = openAccount("ada"), other = openAccount("bea");
    onThreads(kThreads, [&](int index) {
        for (int round = 0; round < 40; ++round) {
            if (index >= 6) {
                setAttribute(index == 6 ? one : same, "round", integer(round));
                commit(index == 6 ? one : same);
                continue;
            }
            EXPECT_TRUE(CSKavellEqual(one.get(), same.get()));
            EXPECT_TRUE(CSKavellEqual(same.get(), one.get()));
            EXPECT_FALSE(CSKavellEqual(other.get(), one.get()));
        }
    });
}

TEST_F(AccountThreads, RecordsOfOneFileNeverReadHalfOfWhatOthersSave)
{
    const std::string padding(20000, 'x');
    commit([&] {
        Account account = openAccount("ada");
        setAttribute(account, "padding", text(padding));
        return account;
    }());
    const StandardErrorCapture messages;
    onThreads(kThreads, [&](int index) {
        const Account own = openAccount("ada");
        for (int round = 0; round < 20; ++round) {
            if (index % 2 == 0) {
                setAttribute(own, "padding", text(padding.substr(static_cast<size_t>(round) * 500)));
                commit(own);
            } else {
                EXPECT_TRUE(CSKavellAccountLoadData(own.get()));
            }
            EXPECT_GE(toStringView(static_cast<CSKavellStringRef>(attribute(own, "padding").get())).size(), 10500U);
        }
    });
}

TEST_F(AccountThreads, AUUIDIsOneOfThoseThatWereSet)
{
    const Account account = openAccount("ada");
    const std::string made = uuidOf(account);
    onThreads(kThreads, [&](int index) {
        const String uuid = text("0a1b2c3d-4e5f-4a6b-8c7d-00000000000" + std::to_string(index));
        for (int round = 0; round < 500; ++round) {
            _CSKavellAccountSetUUIDString(account.get(), uuid.get());
            const std::string read = uuidOf(account);
            EXPECT_TRUE(read == made || read.substr(0, 35) == "0a1b2c3d-4e5f-4a6b-8c7d-00000000000") << read;
            EXPECT_EQ(read.size(), 36U);
        }
    });
}
