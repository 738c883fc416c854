// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// memory_probe COUNT: loads a provider of so many accounts and prints the process's resident memory in KiB.

#include <cstdlib>
#include <fstream>
#include <iostream>
#include <string>

#include "bench/accounts.h"

int main(int argumentCount, char **arguments)
{
    const int count = argumentCount > 1 ? std::atoi(arguments[1]) : 1000;
    const auto providerType = kavell::bench::providerWithAccounts(count);
    // The files are made in a process of their own (bench/run calls twice), so that making them leaves no memory
    // behind.
    if (argumentCount > 2)
        return 0;
    const auto provider = kavell::adopt(_CSKavellAccountProviderCreate(nullptr, providerType.get()));
    std::ifstream status("/proc/self/status");
    for (std::string line; std::getline(status, line);) {
        if (line.starts_with("VmRSS:"))
            std::cout << std::atoi(line.c_str() + 6) << "\n";
    }
    const auto accounts = kavell::adopt(_CSKavellAccountProviderCopyAccounts(provider.get()));
    return CSKavellArrayGetCount(accounts.get()) == static_cast<size_t>(count) ? 0 : 1;
}
