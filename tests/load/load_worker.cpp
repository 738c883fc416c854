// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// One of the many processes of the load test, linked with the shared library like any other client:
//
//     load_worker work WORKER     saves, reads, removes and reloads accounts at random until all is over
//     load_worker watch WATCHER   counts the notifications of each account until all is over

#include <cstdio>
#include <cstdlib>
#include <map>
#include <poll.h>
#include <random>
#include <string_view>
#include <unistd.h>

#include <kavellaccounts/KavellStore.h>
#include <kavellaccounts/Ref.h>

#include "tests/load/load_recorder.h"

using namespace kavell;
using namespace kavell::test;

namespace {

using Account = Ref<CSKavellAccountRef>;

/// What is done, of 10,000 times. A reload reads every account, so that it weighs more than its number.
constexpr int kRemovals = 40, kReloads = 5, kReads = 3000;
/// Half of all that is done goes to so few accounts, so that processes meet.
constexpr size_t kBusyAccounts = 20;

class Worker {
public:
    explicit Worker(size_t worker) : m_key(makeString(loadKey(worker))), m_random(std::random_device()()) {}

    void workUntilOver()
    {
        while (!loadLog().isOver && loadLog().count < kMostLoadEntries - kLoadWorkers * kLoadAccounts * 4) {
            const int choice = roll(10000);
            if (choice < kReloads)
                reload();
            else if (choice < kReloads + kRemovals)
                remove(anyAccount());
            else if (choice < kReloads + kRemovals + kReads)
                read(anyAccount());
            else
                save(anyAccount());
        }
    }

private:
    int roll(int sides) { return std::uniform_int_distribution(0, sides - 1)(m_random); }

    size_t anyAccount()
    {
        return static_cast<size_t>(roll(static_cast<int>(roll(2) == 0 ? kBusyAccounts : kLoadAccounts)));
    }

    /// The process's one record of the account.
    const Account &record(size_t account)
    {
        auto found = m_records.find(account);
        if (found == m_records.end()) {
            const auto loginName = makeString(loadLoginName(account));
            found = m_records
                        .emplace(account,
                                 adopt(_CSKavellAccountCreate(nullptr, kCSKavellAccountProviderMail, loginName.get())))
                        .first;
        }
        return found->second;
    }

    void save(size_t account)
    {
        const Account &saved = record(account);
        LoadEntry entry;
        entry.number = ++loadLog().lastNumber;
        const auto number = adopt(CSKavellNumberCreateWithInt64(entry.number));
        _CSKavellAccountSetProviderAttribute(saved.get(), m_key.get(), number.get());
        recordLoad(LoadEvent::WillSave, account, entry);
        _CSKavellAccountCommitChanges(saved.get());
        entry.flag = !_CSKavellAccountHasPendingChanges(saved.get());
        recordLoad(LoadEvent::Done, account, entry);
    }

    void remove(size_t account)
    {
        const Account removed = record(account);
        _CSKavellAccountRemove(removed.get());
        recordLoad(LoadEvent::WillRemove, account);
        _CSKavellAccountCommitChanges(removed.get());
        recordLoad(LoadEvent::Done, account);
        m_records.erase(account);
    }

    void read(size_t account)
    {
        const Account &loaded = record(account);
        LoadEntry entry;
        entry.flag = CSKavellAccountLoadData(loaded.get());
        for (size_t worker = 0; worker < kLoadWorkers; ++worker) {
            const auto value =
                adopt(_CSKavellAccountCopyProviderAttribute(loaded.get(), makeString(loadKey(worker)).get()));
            if (const auto number = cast<CSKavellNumberRef>(value.get(), CSKavellNumberGetTypeID()))
                entry.values[worker] = static_cast<uint32_t>(CSKavellNumberGetInt64(number));
        }
        recordLoad(LoadEvent::Seen, account, entry);
    }

    /// Every account is read, by records that replace those of before.
    void reload()
    {
        m_records.clear();
        recordLoad(LoadEvent::Forgot, 0);
        if (m_provider)
            _CSKavellAccountProviderReloadAccountData(m_provider.get());
        else
            m_provider = adopt(_CSKavellAccountProviderCreate(nullptr, kCSKavellAccountProviderMail));
        for (size_t account = 0; account < kLoadAccounts; ++account) {
            const auto loginName = makeString(loadLoginName(account));
            if (auto found = adopt(_CSKavellAccountProviderCopyAccount(m_provider.get(), loginName.get(), false)))
                m_records.emplace(account, std::move(found));
        }
    }

    const Ref<CSKavellStringRef> m_key;
    std::mt19937 m_random;
    std::map<size_t, Account> m_records;
    Ref<CSKavellAccountProviderRef> m_provider;
};

int work(size_t worker)
{
    setLoadWorker(worker);
    Worker(worker).workUntilOver();
    return 0;
}

int watch(size_t watcher)
{
    const auto observer = adopt(CSKavellNotificationObserverCreate(kCSKavellAccountNotificationSender));
    if (!observer)
        return 1;
    std::puts("ready");
    std::fflush(stdout);
    for (;;) {
        const bool isSilent = loadLog().isSilent;
        bool hadAny = false;
        while (const auto notification = adopt(CSKavellNotificationObserverCopyNext(observer.get()))) {
            hadAny = true;
            const auto information = CSKavellNotificationGetUserInformation(notification.get());
            const std::string_view loginName = CSKavellStringGetUTF8(cast<CSKavellStringRef>(
                CSKavellDictionaryGetValue(information, kCSKavellAccountUserLoginName), CSKavellStringGetTypeID()));
            const size_t account = std::strtoul(loginName.data() + loginName.find(' '), nullptr, 10);
            ++loadLog().notifications[watcher].at(account);
        }
        if (isSilent && !hadAny)
            return 0;
        pollfd waiting{CSKavellNotificationObserverGetFileDescriptor(observer.get()), POLLIN, 0};
        poll(&waiting, 1, 100);
    }
}

}  // namespace

int main(int argumentCount, char **arguments)
{
    if (argumentCount == 3 && std::string_view(arguments[1]) == "work")
        return work(std::strtoul(arguments[2], nullptr, 10));
    if (argumentCount == 3 && std::string_view(arguments[1]) == "watch")
        return watch(std::strtoul(arguments[2], nullptr, 10));
    std::fprintf(stderr, "usage: load_worker work|watch NUMBER\n");
    return 64;
}
