// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tests/runtime/values.h"

using namespace kavell;
using namespace kavell::test;

TEST(CSKavellString, KeepsTheTextItWasMadeFrom)
{
    const String string = adopt(CSKavellStringCreateWithUTF8("caf\xC3\xA9"));
    EXPECT_STREQ(CSKavellStringGetUTF8(string.get()), "caf\xC3\xA9");
    EXPECT_EQ(CSKavellGetTypeID(string.get()), CSKavellStringGetTypeID());
}

TEST(CSKavellString, CountsLengthInBytes)
{
    EXPECT_EQ(CSKavellStringGetLength(adopt(CSKavellStringCreateWithUTF8("caf\xC3\xA9")).get()), 5u);
    EXPECT_EQ(CSKavellStringGetLength(adopt(CSKavellStringCreateWithUTF8("")).get()), 0u);
}

TEST(CSKavellString, CopiesTheBytesItWasGiven)
{
    char bytes[] = "before";
    const String string = adopt(CSKavellStringCreateWithUTF8(bytes));
    bytes[0] = 'X';
    EXPECT_STREQ(CSKavellStringGetUTF8(string.get()), "before");
}

TEST(CSKavellString, HoldsNulBytesWhenGivenALength)
{
    const String string = adopt(CSKavellStringCreateWithBytes("a\0b", 3));
    ASSERT_EQ(CSKavellStringGetLength(string.get()), 3u);
    EXPECT_EQ(toStdString(string.get()), std::string("a\0b", 3));
    EXPECT_EQ(CSKavellStringGetUTF8(string.get())[3], '\0');
    EXPECT_FALSE(CSKavellEqual(string.get(), text("a").get()));
}

TEST(CSKavellString, TakesNoMoreThanTheGivenLength)
{
    EXPECT_STREQ(CSKavellStringGetUTF8(adopt(CSKavellStringCreateWithBytes("abcdef", 3)).get()), "abc");
    EXPECT_STREQ(CSKavellStringGetUTF8(adopt(CSKavellStringCreateWithBytes("abcdef", 0)).get()), "");
}

TEST(CSKavellString, IsNoneForNull)
{
    EXPECT_FALSE(adopt(CSKavellStringCreateWithUTF8(nullptr)));
    EXPECT_FALSE(adopt(CSKavellStringCreateWithBytes(nullptr, 0)));
    EXPECT_FALSE(adopt(CSKavellStringCreateWithBytes(nullptr, 4)));
}

TEST(CSKavellString, IsNoneForBytesThatAreNotUTF8)
{
    const char *const broken[] = {
        "\x80",              // a continuation without a lead
        "\xC3",              // cut off
        "\xC3(",             // a lead without its continuation
        "\xC0\xAF",          // an overlong slash
        "\xE0\x80\xAF",      // the same in three bytes
        "\xED\xA0\x80",      // half of a surrogate pair
        "\xF4\x90\x80\x80",  // above the last code point
        "\xF8\x88\x80\x80\x80",
        "\xFF\xFE",
        "plain text first, then \xE2\x82",
        "eight bytes of text\xBF and some more after it",
    };
    for (const char *bytes : broken)
        EXPECT_FALSE(adopt(CSKavellStringCreateWithUTF8(bytes))) << testing::PrintToString(bytes);
}

TEST(CSKavellString, TakesEveryLengthOfUTF8Sequence)
{
    const char *const whole[] = {"\x7F",         "\xC2\x80",     "\xDF\xBF",         "\xE0\xA0\x80",    "\xED\x9F\xBF",
                                 "\xEE\x80\x80", "\xEF\xBF\xBF", "\xF0\x90\x80\x80", "\xF4\x8F\xBF\xBF"};
    for (const char *bytes : whole)
        EXPECT_STREQ(CSKavellStringGetUTF8(adopt(CSKavellStringCreateWithUTF8(bytes)).get()), bytes);
}

TEST(CSKavellString, EqualTextIsEqualAndHashesAlike)
{
    const String first = text("com.corvane.Server"), second = text("com.corvane.Server");
    ASSERT_NE(first.get(), second.get());
    EXPECT_TRUE(CSKavellEqual(first.get(), second.get()));
    EXPECT_EQ(CSKavellHash(first.get()), CSKavellHash(second.get()));
}

TEST(CSKavellString, ComparesToTheLetter)
{
    EXPECT_FALSE(CSKavellEqual(text("Mail").get(), text("mail").get()));
    EXPECT_FALSE(CSKavellEqual(text("Mail").get(), text("Mail ").get()));
    // The same letter, composed and decomposed, is two different texts.
    EXPECT_FALSE(CSKavellEqual(text("\xC3\xA9").get(), text("e\xCC\x81").get()));
}

TEST(CSKavellString, ACopyWithoutAnAllocatorIsTheSameObjectRetained)
{
    CountingAllocator allocator;
    String original = watchedText(allocator, "kept");
    const String copy = adopt(CSKavellStringCreateCopy(nullptr, original.get()));
    EXPECT_EQ(copy.get(), original.get());
    original = nullptr;
    EXPECT_EQ(allocator.deallocated(), 0);
    EXPECT_STREQ(CSKavellStringGetUTF8(copy.get()), "kept");
}

TEST(CSKavellString, ACopyWithAnAllocatorLivesInItsMemoryAndGivesItBack)
{
    CountingAllocator allocator;
    String copy = watchedText(allocator, "text");
    EXPECT_EQ(allocator.allocated(), 1);
    EXPECT_TRUE(CSKavellEqual(copy.get(), text("text").get()));
    copy = nullptr;
    EXPECT_EQ(allocator.deallocated(), 1);
}

TEST(CSKavellString, ACopyIsNoneWhenTheAllocatorGivesNothing)
{
    CountingAllocator allocator(0);
    EXPECT_FALSE(watchedText(allocator, "text"));
    EXPECT_EQ(allocator.deallocated(), 0);
}

TEST(CSKavellString, NoneHasNoTextAndNoCopy)
{
    CountingAllocator allocator;
    EXPECT_EQ(CSKavellStringGetUTF8(nullptr), nullptr);
    EXPECT_EQ(CSKavellStringGetLength(nullptr), 0u);
    EXPECT_FALSE(adopt(CSKavellStringCreateCopy(nullptr, nullptr)));
    EXPECT_FALSE(adopt(CSKavellStringCreateCopy(allocator.get(), nullptr)));
    EXPECT_EQ(allocator.allocated(), 0);
}
