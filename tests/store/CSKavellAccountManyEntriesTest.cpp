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

/// Entries whose keys a simple multiplicative hash cannot tell apart: each pair of letters has the same sum.
std::string collidingEntries(int count)
{
    std::string entries;
    for (int number = 0; number < count; ++number) {
        entries += "<key>";
        for (int bit = 0; bit < 17; ++bit)
            entries += (number >> bit) & 1 ? "bA" : "ab";
        entries += "</key><true/>";
    }
    return entries;
}

/// How long opening the account takes.
std::chrono::steady_clock::duration timeToOpen()
{
    const auto start = std::chrono::steady_clock::now();
    const Account account = openAccount("ada");
    return std::chrono::steady_clock::now() - start;
}

// The bounds below only tell a second from many minutes.

TEST_F(ManyEntries, AFileOfManyServicesOfTheWrongTypeDoesNotHoldUpItsReader)
{
    std::string services;
    for (int number = 0; number < 9'990; ++number)
        services += "<key>" + std::to_string(number) + "</key><true/>";
    writeFile(fileOf("ada"), accountFile("<key>a</key><integer>1</integer>", services));
    EXPECT_LT(timeToOpen(), std::chrono::seconds(30));
    EXPECT_TRUE(same(attributes(openAccount("ada")), dictionary({{"a", integer(1)}})));
}

TEST_F(ManyEntries, KeysThatCollideDoNotHoldUpTheirReader)
{
    writeFile(fileOf("ada"), accountFile(collidingEntries(9'990)));
    EXPECT_LT(timeToOpen(), std::chrono::seconds(30));
    EXPECT_EQ(CSKavellDictionaryGetCount(attributes(openAccount("ada")).get()), 9'990u);
}

TEST_F(ManyEntries, AFileOfMoreKeysThanAnyAccountHasIsRefusedAtOnce)
{
    writeFile(fileOf("ada"), accountFile(collidingEntries(100'000)));
    StandardErrorCapture capture;
    EXPECT_LT(timeToOpen(), std::chrono::seconds(30));
    EXPECT_EQ(capture.take(), "Error: failed to load Kavell Accounts settings\n");
}

TEST_F(ManyEntries, MoreKeysThanCouldBeReadAgainAreNotSaved)
{
    const Account account = openAccount("ada");
    setAttribute(account, "a", integer(1));
    commit(account);
    const std::string before = readFile(fileOf("ada"));
    const auto many = adopt(CSKavellDictionaryCreateMutable());
    for (int number = 0; number < 10'001; ++number)
        CSKavellDictionarySetValue(many.get(), text(std::to_string(number)).get(), integer(number).get());
    _CSKavellAccountSetProviderAttribute(account.get(), text("many").get(), many.get());
    StandardErrorCapture capture;
    commit(account);
    EXPECT_EQ(capture.take(), "Error: unable to create XML property list for Kavell Accounts settings - save failed\n");
    EXPECT_EQ(readFile(fileOf("ada")), before);
}

}  // namespace
