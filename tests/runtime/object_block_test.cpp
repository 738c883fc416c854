// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Objects that share a piece of memory are like any others. The address sanitizer sees what is freed too early or never.

#include "runtime/object_block.h"

#include "runtime/dictionary_p.h"
#include "runtime/number_p.h"
#include "runtime/string_p.h"
#include "tests/runtime/values.h"

using namespace kavell;
using namespace kavell::test;

namespace {

String textIn(ObjectBlock &block, std::string_view characters)
{
    return adopt(makeValidString(block, characters));
}

/// Of an object from the start of its piece, in bytes; 0 for one with memory of its own.
size_t distanceOf(CSKavellTypeRef object)
{
    return size_t{8} * (objectOf(object)->flags >> kObjectDistanceShift);
}

constexpr ptrdiff_t kGap = ObjectBlock::kGap;

ptrdiff_t bytesBetween(CSKavellTypeRef first, CSKavellTypeRef second)
{
    return static_cast<const char *>(second) - static_cast<const char *>(first);
}

}  // namespace

TEST(ObjectBlock, ItsObjectsStandSideBySide)
{
    ObjectBlock block(100);
    const String first = textIn(block, "first"), second = textIn(block, "second");
    const auto number = adopt(makeInteger(block, 993));
    EXPECT_EQ(distanceOf(first.get()), 8u);
    // A string is 16 bytes and its text with the terminator, up to a multiple of eight.
    EXPECT_EQ(bytesBetween(first.get(), second.get()), 24 + kGap);
    EXPECT_EQ(bytesBetween(second.get(), number.get()), 24 + kGap);
    EXPECT_TRUE(same(first.get(), text("first").get()));
    EXPECT_TRUE(same(second.get(), text("second").get()));
    EXPECT_TRUE(same(number.get(), integer(993).get()));
}

TEST(ObjectBlock, WhatDoesNotFitInHasMemoryOfItsOwn)
{
    ObjectBlock block(24);
    const String first = textIn(block, "first"), second = textIn(block, "second");
    EXPECT_EQ(distanceOf(first.get()), 8u);
    EXPECT_EQ(distanceOf(second.get()), 0u);
    EXPECT_TRUE(same(second.get(), text("second").get()));
}

TEST(ObjectBlock, ItsLastBytesHoldAnObject)
{
    // 16 bytes, the text and its terminator; nothing behind it.
    ObjectBlock block(22);
    const String only = textIn(block, "first"), next = textIn(block, "");
    EXPECT_EQ(distanceOf(only.get()), 8u);
    EXPECT_EQ(distanceOf(next.get()), 0u);
}

TEST(ObjectBlock, HoldsAsManyAsCanBeToldApart)
{
    ObjectBlock block(SIZE_MAX);
    std::vector<String> texts;
    for (int index = 0; index < 10000; ++index)
        texts.push_back(textIn(block, std::to_string(index)));
    // The last one that fits in ends 65,536 bytes from the start at the most, after 16 bytes, four digits and a terminator.
    constexpr size_t kEach = 24 + ObjectBlock::kGap, kFit = (65536 - 8 - 21) / kEach + 1;
    EXPECT_EQ(distanceOf(texts[kFit - 1].get()), 8 + kEach * (kFit - 1));
    EXPECT_EQ(distanceOf(texts[kFit].get()), 0u);
    for (int index = 0; index < 10000; ++index)
        EXPECT_TRUE(same(texts[static_cast<size_t>(index)].get(), text(std::to_string(index)).get()));
}

TEST(ObjectBlock, AnObjectOutlivesTheBlockAndItsNeighbours)
{
    String kept;
    {
        ObjectBlock block(1000);
        const String before = textIn(block, "before");
        kept = textIn(block, "kept");
        const String after = textIn(block, "after");
    }
    EXPECT_TRUE(same(kept.get(), text("kept").get()));
}

TEST(ObjectBlock, ABlockWithoutObjectsIsFreed)
{
    const ObjectBlock block(1000);
}

TEST(ObjectBlock, ADictionaryInItGrowsLikeAnyOther)
{
    ObjectBlock block(1000);
    const auto pairs = adopt(CSKavellDictionary::make(kObjectIsMutable, 2, &block));
    ASSERT_NE(distanceOf(pairs.get()), 0u);
    for (int index = 0; index < 40; ++index) {
        CSKavellDictionarySetValue(pairs.get(), textIn(block, std::to_string(index)).get(), integer(index).get());
        for (int earlier = 0; earlier <= index; ++earlier)
            ASSERT_TRUE(same(valueOf(pairs.get(), std::to_string(earlier)), integer(earlier).get()));
    }
    // That it can be changed no more takes nothing from where it is.
    pairs->flags &= static_cast<uint16_t>(~kObjectIsMutable);
    EXPECT_EQ(distanceOf(pairs.get()), 8u);
}
