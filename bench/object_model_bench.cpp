// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What the object layer adds to the store: the list of a provider's accounts as objects, and one attribute through an
// account object beside the same calls made straight to the store.

#include <benchmark/benchmark.h>
#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KAProvider.h>

#include "bench/accounts.h"

using namespace kavell;

namespace {

const QString kService = QStringLiteral("com.corvane.service.CalDAV");
const QString kServer = QStringLiteral("com.corvane.Server");
const QString kAddress = QStringLiteral("emailAddress");

/// With the objects' end, as a program that walks the list pays for it.
void accounts(benchmark::State &state)
{
    const auto providerType = bench::providerWithAccounts(static_cast<int>(state.range(0)));
    const auto provider = KAProvider::initWithProviderType(QString::fromStdString(toStdString(providerType.get())));
    for (auto _ : state)
        benchmark::DoNotOptimize(provider->accounts().constData());
}

std::shared_ptr<KAAccount> savedAccount()
{
    auto account = KAAccount::accountWithProviderType(kKAProviderTest, QStringLiteral("object"));
    bench::fillAccount(account->accountRef(), 1);
    _CSKavellAccountCommitChanges(account->accountRef());
    return account;
}

void getAttribute(benchmark::State &state)
{
    const auto account = savedAccount();
    for (auto _ : state)
        benchmark::DoNotOptimize(account->providerAttributeForKey(kAddress));
}

void bareGetAttribute(benchmark::State &state)
{
    const auto account = savedAccount();
    const auto key = makeString("emailAddress");
    for (auto _ : state)
        CSKavellRelease(_CSKavellAccountCopyProviderAttribute(account->accountRef(), key.get()));
}

void setAttribute(benchmark::State &state)
{
    const auto account = savedAccount();
    const QVariant values[] = {QStringLiteral("one.example.org"), QStringLiteral("two.example.org")};
    size_t number = 0;
    for (auto _ : state)
        account->setAttribute(values[++number % 2], kServer, kService);
}

void bareSetAttribute(benchmark::State &state)
{
    const auto account = savedAccount();
    const Ref<CSKavellStringRef> values[] = {makeString("one.example.org"), makeString("two.example.org")};
    size_t number = 0;
    for (auto _ : state)
        _CSKavellAccountSetServiceAttribute(account->accountRef(), kCSKavellAccountServiceCalDAV,
                                            kCSKavellAccountSettingServer, values[++number % 2].get());
}

void getAllAttributes(benchmark::State &state)
{
    const auto account = savedAccount();
    for (auto _ : state)
        benchmark::DoNotOptimize(account->attributesForService(kService));
}

BENCHMARK(accounts)->Arg(1)->Arg(100)->Arg(1000)->Unit(benchmark::kMicrosecond);
BENCHMARK(getAttribute);
BENCHMARK(bareGetAttribute);
BENCHMARK(setAttribute);
BENCHMARK(bareSetAttribute);
BENCHMARK(getAllAttributes);

}  // namespace

BENCHMARK_MAIN();
