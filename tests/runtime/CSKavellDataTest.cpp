// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tests/runtime/values.h"

using namespace kavell;
using namespace kavell::test;

TEST(CSKavellData, KeepsACopyOfAnyBytes)
{
    unsigned char bytes[] = {0x00, 0xFF, 0x80, 0x00, 0x01};
    const auto value = adopt(CSKavellDataCreate(bytes, sizeof bytes));
    bytes[1] = 0;
    ASSERT_EQ(CSKavellDataGetLength(value.get()), 5u);
    EXPECT_EQ(CSKavellDataGetBytes(value.get())[0], 0x00);
    EXPECT_EQ(CSKavellDataGetBytes(value.get())[1], 0xFF);
    EXPECT_EQ(CSKavellDataGetBytes(value.get())[4], 0x01);
    EXPECT_EQ(CSKavellGetTypeID(value.get()), CSKavellDataGetTypeID());
}

TEST(CSKavellData, EmptyDataHasBytesToPointAt)
{
    const auto value = adopt(CSKavellDataCreate(nullptr, 0));
    ASSERT_TRUE(value);
    EXPECT_EQ(CSKavellDataGetLength(value.get()), 0u);
    EXPECT_NE(CSKavellDataGetBytes(value.get()), nullptr);
}

TEST(CSKavellData, IsNoneForALengthWithoutBytes)
{
    EXPECT_FALSE(adopt(CSKavellDataCreate(nullptr, 1)));
}

TEST(CSKavellData, EqualBytesAreEqualAndHashAlike)
{
    EXPECT_TRUE(same(bytes("abc"), bytes("abc")));
    EXPECT_EQ(CSKavellHash(bytes("abc").get()), CSKavellHash(bytes("abc").get()));
    EXPECT_TRUE(same(bytes(""), bytes("")));
    EXPECT_FALSE(CSKavellEqual(bytes("abc").get(), bytes("abd").get()));
    EXPECT_FALSE(CSKavellEqual(bytes("abc").get(), bytes("ab").get()));
    EXPECT_FALSE(CSKavellEqual(bytes("abc").get(), text("abc").get()));
}

TEST(CSKavellData, NoneHasNoBytes)
{
    EXPECT_EQ(CSKavellDataGetBytes(nullptr), nullptr);
    EXPECT_EQ(CSKavellDataGetLength(nullptr), 0u);
}
