// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Getting and setting one attribute of an account in memory.

#include <benchmark/benchmark.h>

#include "bench/accounts.h"

using namespace kavell;

namespace {

Ref<CSKavellAccountRef> savedAccount()
{
    const auto account =
        adopt(_CSKavellAccountCreate(nullptr, kCSKavellAccountProviderTest, makeString("attributes").get()));
    bench::fillAccount(account.get(), 1);
    _CSKavellAccountCommitChanges(account.get());
    return account;
}

void getProviderAttribute(benchmark::State &state)
{
    const auto account = savedAccount();
    for (auto _ : state)
        CSKavellRelease(_CSKavellAccountCopyProviderAttribute(account.get(), kCSKavellAccountUserFullName));
}

void getServiceAttribute(benchmark::State &state)
{
    const auto account = savedAccount();
    // A key of the caller's own, as a program that builds it would have.
    const auto key = makeString("com.corvane.smtpServer");
    for (auto _ : state)
        CSKavellRelease(_CSKavellAccountCopyServiceAttribute(account.get(), kCSKavellAccountServiceCalDAV, key.get()));
}

void setServiceAttribute(benchmark::State &state)
{
    const auto account = savedAccount();
    const Ref<CSKavellStringRef> values[] = {makeString("one.example.org"), makeString("two.example.org")};
    size_t number = 0;
    for (auto _ : state)
        _CSKavellAccountSetServiceAttribute(account.get(), kCSKavellAccountServiceCalDAV, kCSKavellAccountSettingServer,
                                            values[++number % 2].get());
}

void setAndUnsetProviderAttribute(benchmark::State &state)
{
    const auto account = savedAccount();
    const auto value = makeString("one.example.org");
    for (auto _ : state) {
        _CSKavellAccountSetProviderAttribute(account.get(), kCSKavellAccountUserPicture, value.get());
        _CSKavellAccountRemoveProviderAttribute(account.get(), kCSKavellAccountUserPicture);
    }
}

BENCHMARK(getProviderAttribute);
BENCHMARK(getServiceAttribute);
BENCHMARK(setServiceAttribute);
BENCHMARK(setAndUnsetProviderAttribute);

}  // namespace

BENCHMARK_MAIN();
