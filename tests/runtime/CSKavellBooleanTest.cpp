// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tests/runtime/values.h"

using namespace kavell;
using namespace kavell::test;

TEST(CSKavellBoolean, HasOneSharedObjectForEachValue)
{
    EXPECT_EQ(CSKavellBooleanGetShared(true), CSKavellBooleanGetShared(true));
    EXPECT_EQ(CSKavellBooleanGetShared(false), CSKavellBooleanGetShared(false));
    EXPECT_NE(CSKavellBooleanGetShared(true), CSKavellBooleanGetShared(false));
    EXPECT_FALSE(CSKavellEqual(CSKavellBooleanGetShared(true), CSKavellBooleanGetShared(false)));
    EXPECT_EQ(CSKavellGetTypeID(CSKavellBooleanGetShared(true)), CSKavellBooleanGetTypeID());
}

TEST(CSKavellBoolean, AnswersItsValue)
{
    EXPECT_TRUE(CSKavellBooleanGetValue(CSKavellBooleanGetShared(true)));
    EXPECT_FALSE(CSKavellBooleanGetValue(CSKavellBooleanGetShared(false)));
}

TEST(CSKavellBoolean, SurvivesAnyNumberOfReleases)
{
    for (int round = 0; round < 1000; ++round)
        CSKavellRelease(CSKavellBooleanGetShared(true));
    EXPECT_TRUE(CSKavellBooleanGetValue(CSKavellBooleanGetShared(true)));
}

TEST(CSKavellBoolean, NoneIsFalse)
{
    EXPECT_FALSE(CSKavellBooleanGetValue(nullptr));
}
