// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Data files with very many entries: reading them takes time in proportion to their size.

#include <chrono>

#include "tests/store/store_test.h"

using namespace kavell;
using namespace kavell::test;

namespace {

using ManyEntries = StoreTest;

TEST_F(ManyEntries, AFileOfManyServicesOfTheWrongTypeDoesNotHoldUpItsReader)
{
    std::string services;
    for (int number = 0; number < 200'000; ++number)
        services += "<key>" + std::to_string(number) + "</key><true/>";
    writeFile(fileOf("ada"), accountFile("<key>a</key><integer>1</integer>", services));

    const auto start = std::chrono::steady_clock::now();
    const Account account = openAccount("ada");
    const auto took = std::chrono::steady_clock::now() - start;

    EXPECT_TRUE(same(attributes(account), dictionary({{"a", integer(1)}})));
    // One pass takes about a second; comparing each entry with each takes longer than this on any machine.
    EXPECT_LT(took, std::chrono::seconds(30));
}

}  // namespace
