// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/key_pool.h"

#include <thread>

#include "tests/runtime/values.h"

using namespace kavell;
using namespace kavell::test;

TEST(KeyPool, EqualKeysAreOneString)
{
    static_cast<void>(KeyMaker().key("host"));
    static_cast<void>(KeyMaker().key("port"));
    KeyMaker keys;
    const String host = keys.key("host"), port = keys.key("port"), again = keys.key("host");
    EXPECT_TRUE(same(host.get(), text("host").get()));
    EXPECT_TRUE(same(port.get(), text("port").get()));
    EXPECT_EQ(again.get(), host.get());
    EXPECT_TRUE(keys.sharesEqualKeys());
}

TEST(KeyPool, TheKeysOfTwoDocumentsAreTheSameStrings)
{
    String first;
    {
        KeyMaker keys;
        first = keys.key("of both documents");
    }
    KeyMaker keys;
    EXPECT_EQ(keys.key("of both documents").get(), first.get());
}

TEST(KeyPool, KeysInAnotherOrderThanBeforeAreRight)
{
    constexpr std::string_view orders[][4] = {{"a", "b", "c", "d"}, {"d", "c", "b", "a"}, {"b", "d", "a", "c"},
                                              {"a", "a", "b", "b"}, {"", "a", "", "d"},   {"a", "b", "c", "d"}};
    for (const auto &order : orders) {
        KeyMaker keys;
        for (const std::string_view key : order)
            EXPECT_TRUE(same(keys.key(key).get(), text(key).get()));
    }
}

TEST(KeyPool, MoreKeysThanItHoldsAreRightAndSaidNotToBeShared)
{
    KeyMaker keys;
    std::vector<String> all;
    for (int index = 0; index < 1000; ++index)
        all.push_back(keys.key("key " + std::to_string(index)));
    for (int index = 0; index < 1000; ++index)
        EXPECT_TRUE(same(all[static_cast<size_t>(index)].get(), text("key " + std::to_string(index)).get()));
    EXPECT_FALSE(keys.sharesEqualKeys());
}

TEST(KeyPool, AThreadThatFindsItInUseMakesKeysOfItsOwn)
{
    // One of another test may have to leave for it.
    static_cast<void>(KeyMaker().key("host"));
    KeyMaker keys;
    const String mine = keys.key("host");
    std::jthread([&] {
        KeyMaker others;
        EXPECT_FALSE(others.sharesEqualKeys());
        const String theirs = others.key("host");
        EXPECT_TRUE(same(theirs.get(), text("host").get()));
        EXPECT_NE(theirs.get(), mine.get());
    }).join();
    EXPECT_TRUE(keys.sharesEqualKeys());
}
