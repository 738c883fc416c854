// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Accounts for the benches: 18 attributes each, 4 of the account and 7 in each of 2 services.

#ifndef KAVELL_BENCH_ACCOUNTS_H
#define KAVELL_BENCH_ACCOUNTS_H

#include <string>

#include <kavellaccounts/KavellStore.h>
#include <kavellaccounts/Ref.h>

namespace kavell::bench {

/// Sets the 18 attributes of an account; nothing is saved.
void fillAccount(CSKavellAccountRef account, int number);

/// The provider type that holds `count` accounts, which are written below HOME on the first call.
[[nodiscard]] Ref<CSKavellStringRef> providerWithAccounts(int count);

/// The directory of a provider type's data files.
[[nodiscard]] std::string providerDirectory(CSKavellStringRef providerType);

}  // namespace kavell::bench

#endif
