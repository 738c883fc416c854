// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <cstdint>

#include "tests/runtime/values.h"

using namespace kavell;
using namespace kavell::test;

TEST(CSKavellDate, KeepsSecondsBeforeAndAfter1970)
{
    for (int64_t seconds : {INT64_MIN, int64_t{-1169176448}, int64_t{-1}, int64_t{0}, int64_t{3125790847}, INT64_MAX}) {
        const auto moment = date(seconds);
        EXPECT_EQ(CSKavellDateGetSeconds(moment.get()), seconds);
        EXPECT_EQ(CSKavellGetTypeID(moment.get()), CSKavellDateGetTypeID());
    }
}

TEST(CSKavellDate, TheSameMomentIsEqualAndHashesAlike)
{
    EXPECT_TRUE(same(date(978307200), date(978307200)));
    EXPECT_EQ(CSKavellHash(date(978307200).get()), CSKavellHash(date(978307200).get()));
    EXPECT_FALSE(CSKavellEqual(date(978307200).get(), date(978307201).get()));
    EXPECT_FALSE(CSKavellEqual(date(5).get(), integer(5).get()));
}

TEST(CSKavellDate, NoneIsTheBeginningOf1970)
{
    EXPECT_EQ(CSKavellDateGetSeconds(nullptr), 0);
}
