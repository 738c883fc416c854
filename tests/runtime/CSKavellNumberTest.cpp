// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <cmath>
#include <cstdint>
#include <limits>

#include "tests/runtime/values.h"

using namespace kavell;
using namespace kavell::test;

TEST(CSKavellNumber, KeepsSignedIntegersOfTheWholeRange)
{
    for (int64_t value : {INT64_MIN, int64_t{-1}, int64_t{0}, int64_t{993}, INT64_MAX}) {
        const auto number = integer(value);
        EXPECT_EQ(CSKavellNumberGetInt64(number.get()), value);
        EXPECT_FALSE(CSKavellNumberIsReal(number.get()));
        EXPECT_FALSE(CSKavellNumberIsUnsigned(number.get()));
        EXPECT_EQ(CSKavellGetTypeID(number.get()), CSKavellNumberGetTypeID());
    }
}

TEST(CSKavellNumber, KeepsUnsignedIntegersAboveTheSignedRange)
{
    const auto number = unsignedInteger(UINT64_MAX);
    EXPECT_EQ(CSKavellNumberGetUInt64(number.get()), UINT64_MAX);
    EXPECT_TRUE(CSKavellNumberIsUnsigned(number.get()));
    EXPECT_FALSE(CSKavellNumberIsReal(number.get()));
    EXPECT_EQ(CSKavellNumberGetInt64(number.get()), INT64_MAX);
    EXPECT_EQ(CSKavellNumberGetDouble(number.get()), 18446744073709551616.0);
}

TEST(CSKavellNumber, AnUnsignedIntegerInTheSignedRangeIsTheSameAsASignedOne)
{
    EXPECT_FALSE(CSKavellNumberIsUnsigned(unsignedInteger(INT64_MAX).get()));
    EXPECT_TRUE(CSKavellNumberIsUnsigned(unsignedInteger(uint64_t{INT64_MAX} + 1).get()));
    EXPECT_TRUE(same(unsignedInteger(993), integer(993)));
    EXPECT_EQ(CSKavellHash(unsignedInteger(993).get()), CSKavellHash(integer(993).get()));
}

TEST(CSKavellNumber, KeepsReals)
{
    for (double value : {0.1, -0.5, 1e300, 5e-324, 0.0}) {
        const auto number = real(value);
        EXPECT_EQ(CSKavellNumberGetDouble(number.get()), value);
        EXPECT_TRUE(CSKavellNumberIsReal(number.get()));
        EXPECT_FALSE(CSKavellNumberIsUnsigned(number.get()));
    }
}

TEST(CSKavellNumber, CutsRealsTowardZero)
{
    EXPECT_EQ(CSKavellNumberGetInt64(real(2.9).get()), 2);
    EXPECT_EQ(CSKavellNumberGetInt64(real(-2.9).get()), -2);
    EXPECT_EQ(CSKavellNumberGetUInt64(real(2.9).get()), 2u);
}

TEST(CSKavellNumber, TurnsRealsOutOfRangeIntoTheNearestLimit)
{
    const double infinity = std::numeric_limits<double>::infinity();
    EXPECT_EQ(CSKavellNumberGetInt64(real(1e300).get()), INT64_MAX);
    EXPECT_EQ(CSKavellNumberGetInt64(real(-1e300).get()), INT64_MIN);
    EXPECT_EQ(CSKavellNumberGetInt64(real(9223372036854775808.0).get()), INT64_MAX);
    EXPECT_EQ(CSKavellNumberGetInt64(real(-9223372036854775808.0).get()), INT64_MIN);
    EXPECT_EQ(CSKavellNumberGetInt64(real(infinity).get()), INT64_MAX);
    EXPECT_EQ(CSKavellNumberGetInt64(real(-infinity).get()), INT64_MIN);
    EXPECT_EQ(CSKavellNumberGetUInt64(real(1e300).get()), UINT64_MAX);
    EXPECT_EQ(CSKavellNumberGetUInt64(real(18446744073709551616.0).get()), UINT64_MAX);
    EXPECT_EQ(CSKavellNumberGetUInt64(real(-1.0).get()), 0u);
    EXPECT_EQ(CSKavellNumberGetUInt64(integer(-7).get()), 0u);
}

TEST(CSKavellNumber, NotANumberIsZeroAsAnInteger)
{
    EXPECT_EQ(CSKavellNumberGetInt64(real(std::nan("")).get()), 0);
    EXPECT_EQ(CSKavellNumberGetUInt64(real(std::nan("")).get()), 0u);
    EXPECT_TRUE(std::isnan(CSKavellNumberGetDouble(real(std::nan("")).get())));
}

TEST(CSKavellNumber, RoundsIntegersToTheNearestReal)
{
    EXPECT_EQ(CSKavellNumberGetDouble(integer(-3).get()), -3.0);
    EXPECT_EQ(CSKavellNumberGetDouble(integer(9007199254740993).get()), 9007199254740992.0);
}

TEST(CSKavellNumber, EqualNumbersAreOfOneKindAndValue)
{
    EXPECT_TRUE(same(integer(5), integer(5)));
    EXPECT_EQ(CSKavellHash(integer(5).get()), CSKavellHash(integer(5).get()));
    EXPECT_TRUE(same(real(2.5), real(2.5)));
    EXPECT_EQ(CSKavellHash(real(2.5).get()), CSKavellHash(real(2.5).get()));
    EXPECT_TRUE(same(unsignedInteger(UINT64_MAX), unsignedInteger(UINT64_MAX)));

    EXPECT_FALSE(CSKavellEqual(integer(5).get(), integer(6).get()));
    EXPECT_FALSE(CSKavellEqual(integer(5).get(), real(5.0).get()));
    EXPECT_FALSE(CSKavellEqual(integer(-1).get(), unsignedInteger(UINT64_MAX).get()));
    EXPECT_FALSE(CSKavellEqual(integer(1).get(), boolean(true).get()));
    EXPECT_FALSE(CSKavellEqual(integer(0).get(), boolean(false).get()));
}

TEST(CSKavellNumber, EqualRealsHashAlikeWhateverTheSignOfZero)
{
    if (CSKavellEqual(real(0.0).get(), real(-0.0).get())) {
        EXPECT_EQ(CSKavellHash(real(0.0).get()), CSKavellHash(real(-0.0).get()));
    }
    EXPECT_EQ(CSKavellNumberGetDouble(real(-0.0).get()), 0.0);
}

TEST(CSKavellNumber, NoneIsZeroAndOfNoKind)
{
    EXPECT_EQ(CSKavellNumberGetInt64(nullptr), 0);
    EXPECT_EQ(CSKavellNumberGetUInt64(nullptr), 0u);
    EXPECT_EQ(CSKavellNumberGetDouble(nullptr), 0.0);
    EXPECT_FALSE(CSKavellNumberIsReal(nullptr));
    EXPECT_FALSE(CSKavellNumberIsUnsigned(nullptr));
}
