// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Opening a provider: every data file of a directory read, parsed and made into a record.

#include <benchmark/benchmark.h>

#include "bench/accounts.h"
#include "bench/bare_store.h"

using namespace kavell;

namespace {

void openProvider(benchmark::State &state)
{
    const auto providerType = bench::providerWithAccounts(static_cast<int>(state.range(0)));
    for (auto _ : state) {
        auto provider = adopt(_CSKavellAccountProviderCreate(nullptr, providerType.get()));
        benchmark::DoNotOptimize(provider.get());
        // Opening is measured, not letting go.
        state.PauseTiming();
        provider = nullptr;
        state.ResumeTiming();
    }
}

void bareLoop(benchmark::State &state)
{
    const auto providerType = bench::providerWithAccounts(static_cast<int>(state.range(0)));
    const std::string directory = bench::providerDirectory(providerType.get());
    for (auto _ : state)
        benchmark::DoNotOptimize(bench::readDirectoryBare(directory));
}

BENCHMARK(openProvider)->Arg(1)->Arg(100)->Arg(1000)->Arg(10000)->Unit(benchmark::kMicrosecond);
BENCHMARK(bareLoop)->Arg(1)->Arg(100)->Arg(1000)->Arg(10000)->Unit(benchmark::kMicrosecond);

}  // namespace

BENCHMARK_MAIN();
