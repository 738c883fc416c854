// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Many threads with one provider's record.

#include <algorithm>
#include <atomic>
#include <map>
#include <mutex>

#include "tests/store/store_test.h"
#include "tests/support/threads.h"

using namespace kavell;
using namespace kavell::test;

namespace {

using Provider = Ref<CSKavellAccountProviderRef>;

class ProviderThreads : public StoreTest {
protected:
    static constexpr int kThreads = 8;

    static Provider openProvider() { return adopt(_CSKavellAccountProviderCreate(nullptr, text(kMail).get())); }

    static Account copyAccount(const Provider &provider, const std::string &name, bool create = false)
    {
        return adopt(_CSKavellAccountProviderCopyAccount(provider.get(), text(name).get(), create));
    }

    /// The login names of the list, sorted.
    static Names namesOf(const Provider &provider)
    {
        const auto accounts = adopt(_CSKavellAccountProviderCopyAccounts(provider.get()));
        Names names;
        for (size_t index = 0; index < CSKavellArrayGetCount(accounts.get()); ++index) {
            const auto account = static_cast<CSKavellAccountRef>(
                const_cast<void *>(CSKavellArrayGetValueAtIndex(accounts.get(), index)));
            names.push_back(toStdString(adopt(_CSKavellAccountCopyLoginName(account)).get()));
        }
        std::sort(names.begin(), names.end());
        return names;
    }

    static std::string numbered(const std::string &name, int number) { return name + " " + std::to_string(number); }
};

}  // namespace

TEST_F(ProviderThreads, AccountsThatAllCreateAreListedOnceAndAreOneRecordEach)
{
    constexpr int names = 40;
    const Provider provider = openProvider();
    std::mutex mutex;
    std::map<std::string, Account> found;
    onThreads(kThreads, [&](int index) {
        for (int step = 0; step < names; ++step) {
            // Half of the threads go through the names backwards.
            const std::string name = numbered("user", index % 2 == 0 ? step : names - 1 - step);
            const Account account = copyAccount(provider, name, true);
            const std::lock_guard lock(mutex);
            EXPECT_EQ(found.emplace(name, account).first->second.get(), account.get());
        }
    });
    const Names listed = namesOf(provider);
    EXPECT_EQ(listed.size(), size_t{names});
    EXPECT_EQ(std::adjacent_find(listed.begin(), listed.end()), listed.end());
}

TEST_F(ProviderThreads, AccountsThatStayAreInEachListWhileOthersComeAndGo)
{
    const Provider provider = openProvider();
    const Names staying{"ada", "bea", "cleo"};
    for (const std::string &name : staying)
        commit(copyAccount(provider, name, true));
    onThreads(kThreads, [&](int index) {
        const std::string own = numbered("passing", index);
        for (int round = 0; round < 25; ++round) {
            if (index % 2 == 0) {
                const Account account = copyAccount(provider, own, true);
                setAttribute(account, "round", integer(round));
                commit(account);
                EXPECT_TRUE(copyAccount(provider, own));
                _CSKavellAccountProviderRemoveAccount(provider.get(), text(own).get());
                EXPECT_FALSE(copyAccount(provider, own));
            } else {
                const Names listed = namesOf(provider);
                EXPECT_TRUE(std::includes(listed.begin(), listed.end(), staying.begin(), staying.end()));
                EXPECT_EQ(std::adjacent_find(listed.begin(), listed.end()), listed.end());
            }
        }
    });
    EXPECT_EQ(namesOf(provider), staying);
    EXPECT_EQ(namesOf(openProvider()), staying);
}

TEST_F(ProviderThreads, ReloadingHidesNoAccountFromTheOthers)
{
    constexpr int names = 12;
    for (int index = 0; index < names; ++index)
        writeFile(fileOf(numbered("user", index)),
                  accountFile("<key>index</key><integer>" + std::to_string(index) + "</integer>"));
    const Provider provider = openProvider();
    onThreads(kThreads, [&](int index) {
        for (int round = 0; round < 30; ++round) {
            if (index < 2) {
                _CSKavellAccountProviderReloadAccountData(provider.get());
                continue;
            }
            EXPECT_EQ(namesOf(provider).size(), size_t{names});
            const Account account = copyAccount(provider, numbered("user", round % names));
            ASSERT_TRUE(account);
            EXPECT_TRUE(same(attribute(account, "index"), integer(round % names)));
        }
    });
}

TEST_F(ProviderThreads, AnAccountMayBeSavedWhileItIsRemoved)
{
    const Provider provider = openProvider();
    for (int round = 0; round < 20; ++round) {
        const std::string name = numbered("user", round);
        const Account account = copyAccount(provider, name, true);
        commit(account);
        onThreads(4, [&](int index) {
            if (index == 0)
                _CSKavellAccountProviderRemoveAccount(provider.get(), text(name).get());
            setAttribute(account, numbered("key", index), integer(round));
            commit(account);
        });
        EXPECT_FALSE(copyAccount(provider, name));
        // Whoever saves a removed account makes it anew, with what was set.
        EXPECT_TRUE(same(attribute(openAccount(name), "key 0"), integer(round)));
    }
}
