// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A durable commit of one changed attribute, with one observer listening, against the same reads, writes, syncs and
// post.

#include <benchmark/benchmark.h>

#include "bench/accounts.h"
#include "bench/bare_store.h"

using namespace kavell;

namespace {

struct CommittedAccount {
    Ref<CSKavellAccountRef> account;
    std::string path;
    Ref<CSKavellNotificationObserverRef> observer = adopt(CSKavellNotificationObserverCreate(nullptr));

    explicit CommittedAccount(const char *loginName)
    {
        const auto providerType = makeString("org.example.commit");
        account = adopt(_CSKavellAccountCreate(nullptr, providerType.get(), makeString(loginName).get()));
        path = bench::providerDirectory(providerType.get()) + "/" + loginName + ".plist";
        bench::fillAccount(account.get(), 1);
        _CSKavellAccountCommitChanges(account.get());
    }

    void drain() const
    {
        while (adopt(CSKavellNotificationObserverCopyNext(observer.get()))) {
        }
    }
};

void commit(benchmark::State &state)
{
    const CommittedAccount fixture("store");
    int64_t number = 0;
    for (auto _ : state) {
        const auto value = makeString("value " + std::to_string(1000000 + ++number));
        _CSKavellAccountSetServiceAttribute(fixture.account.get(), kCSKavellAccountServiceCalDAV,
                                            kCSKavellAccountSettingServer, value.get());
        _CSKavellAccountCommitChanges(fixture.account.get());
        state.PauseTiming();
        if (_CSKavellAccountHasPendingChanges(fixture.account.get()))
            state.SkipWithError("not saved");
        fixture.drain();
        state.ResumeTiming();
    }
}

void bareSequence(benchmark::State &state)
{
    const CommittedAccount fixture("bare");
    const bench::BareSemaphore semaphore(fixture.path.c_str());
    std::string contents = bench::readFileBare(fixture.path.c_str(), semaphore);
    const std::string message(420, 'm');
    for (auto _ : state) {
        contents[contents.size() - 40] = static_cast<char>('a' + state.iterations() % 26);
        bench::replaceFileBare(fixture.path.c_str(), contents, semaphore);
        bench::postBare(message);
        state.PauseTiming();
        fixture.drain();
        state.ResumeTiming();
    }
}

BENCHMARK(commit)->Unit(benchmark::kMicrosecond)->UseRealTime();
BENCHMARK(bareSequence)->Unit(benchmark::kMicrosecond)->UseRealTime();

}  // namespace

BENCHMARK_MAIN();
