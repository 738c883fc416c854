// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tests/runtime/values.h"

using namespace kavell;
using namespace kavell::test;

namespace {

using Texts = std::vector<std::string>;

Ref<CSKavellMutableArrayRef> mutableArray(std::initializer_list<Value> values)
{
    return adopt(CSKavellArrayCreateMutableCopy(array(values).get()));
}

}  // namespace

TEST(CSKavellArray, KeepsValuesInOrderWithDuplicates)
{
    const auto values = array({text("b"), text("a"), text("b")});
    EXPECT_EQ(textsOf(values.get()), (Texts{"b", "a", "b"}));
    EXPECT_EQ(CSKavellGetTypeID(values.get()), CSKavellArrayGetTypeID());
}

TEST(CSKavellArray, CreatesAnEmptyArrayOfNoValues)
{
    const auto values = adopt(CSKavellArrayCreate(nullptr, 0));
    ASSERT_TRUE(values);
    EXPECT_EQ(CSKavellArrayGetCount(values.get()), 0u);
}

TEST(CSKavellArray, IsNoneForMissingValues)
{
    const CSKavellTypeRef withNone[] = {kCSKavellAccountServiceMail, nullptr};
    EXPECT_FALSE(adopt(CSKavellArrayCreate(nullptr, 1)));
    EXPECT_FALSE(adopt(CSKavellArrayCreate(withNone, 2)));
}

TEST(CSKavellArray, RetainsItsValuesAndReleasesThemAtItsEnd)
{
    CountingAllocator allocator;
    String value = watchedText(allocator, "value");
    Ref<CSKavellArrayRef> values = array({value, value});
    value = nullptr;
    EXPECT_EQ(allocator.deallocated(), 0);
    values = nullptr;
    EXPECT_EQ(allocator.deallocated(), 1);
}

TEST(CSKavellArray, ReleasesTheValuesOfAnArrayThatCouldNotBeMade)
{
    CountingAllocator allocator;
    String value = watchedText(allocator, "value");
    const CSKavellTypeRef withNone[] = {value.get(), nullptr};
    EXPECT_FALSE(adopt(CSKavellArrayCreate(withNone, 2)));
    value = nullptr;
    EXPECT_EQ(allocator.deallocated(), 1);
}

TEST(CSKavellArray, AppendsToAMutableArray)
{
    const auto values = adopt(CSKavellArrayCreateMutable());
    EXPECT_EQ(CSKavellArrayGetCount(values.get()), 0u);
    for (int index = 0; index < 1000; ++index)
        CSKavellArrayAppendValue(values.get(), integer(index).get());
    ASSERT_EQ(CSKavellArrayGetCount(values.get()), 1000u);
    EXPECT_TRUE(same(CSKavellArrayGetValueAtIndex(values.get(), 0), integer(0).get()));
    EXPECT_TRUE(same(CSKavellArrayGetValueAtIndex(values.get(), 999), integer(999).get()));
}

TEST(CSKavellArray, AppendingNoneDoesNothing)
{
    const auto values = adopt(CSKavellArrayCreateMutable());
    CSKavellArrayAppendValue(values.get(), nullptr);
    CSKavellArrayAppendValue(nullptr, kCSKavellAccountServiceMail);
    EXPECT_EQ(CSKavellArrayGetCount(values.get()), 0u);
}

TEST(CSKavellArray, AnImmutableArrayStaysAsItIs)
{
    const auto values = array({text("a")});
    const auto forced = const_cast<CSKavellMutableArrayRef>(values.get());
    CSKavellArrayAppendValue(forced, text("b").get());
    CSKavellArrayRemoveValueAtIndex(forced, 0);
    EXPECT_EQ(textsOf(values.get()), (Texts{"a"}));
}

TEST(CSKavellArray, RemovesTheValueAtAnIndexAndClosesTheGap)
{
    CountingAllocator allocator;
    const auto values = mutableArray({text("a"), watchedText(allocator, "b"), text("c")});
    CSKavellArrayRemoveValueAtIndex(values.get(), 1);
    EXPECT_EQ(textsOf(values.get()), (Texts{"a", "c"}));
    EXPECT_EQ(allocator.deallocated(), 1);
    CSKavellArrayRemoveValueAtIndex(values.get(), 1);
    CSKavellArrayRemoveValueAtIndex(values.get(), 0);
    EXPECT_EQ(CSKavellArrayGetCount(values.get()), 0u);
}

TEST(CSKavellArray, RemovingPastTheEndDoesNothing)
{
    const auto values = mutableArray({text("a")});
    CSKavellArrayRemoveValueAtIndex(values.get(), 1);
    CSKavellArrayRemoveValueAtIndex(values.get(), SIZE_MAX);
    CSKavellArrayRemoveValueAtIndex(nullptr, 0);
    EXPECT_EQ(textsOf(values.get()), (Texts{"a"}));
}

TEST(CSKavellArray, FindsTheFirstEqualValue)
{
    const auto values = array({text("a"), text("b"), text("b")});
    EXPECT_EQ(CSKavellArrayGetFirstIndexOfValue(values.get(), text("b").get()), 1u);
    EXPECT_EQ(CSKavellArrayGetFirstIndexOfValue(values.get(), text("c").get()), 3u);
    EXPECT_EQ(CSKavellArrayGetFirstIndexOfValue(values.get(), nullptr), 3u);
    EXPECT_EQ(CSKavellArrayGetFirstIndexOfValue(nullptr, text("a").get()), 0u);
}

TEST(CSKavellArray, AMutableCopyHasItsOwnPlacesAndSharesTheValues)
{
    const auto original = array({text("a"), text("a")});
    const auto copy = adopt(CSKavellArrayCreateMutableCopy(original.get()));
    EXPECT_EQ(CSKavellArrayGetValueAtIndex(copy.get(), 1), CSKavellArrayGetValueAtIndex(original.get(), 1));
    CSKavellArrayAppendValue(copy.get(), text("b").get());
    EXPECT_EQ(textsOf(original.get()), (Texts{"a", "a"}));
    EXPECT_EQ(textsOf(copy.get()), (Texts{"a", "a", "b"}));
    EXPECT_FALSE(adopt(CSKavellArrayCreateMutableCopy(nullptr)));
}

TEST(CSKavellArray, EqualValuesInTheSameOrderAreEqualWhetherMutableOrNot)
{
    const auto fixed = array({text("a"), integer(1)});
    const auto changeable = mutableArray({text("a"), integer(1)});
    EXPECT_TRUE(same(fixed, changeable));
    EXPECT_EQ(CSKavellHash(fixed.get()), CSKavellHash(changeable.get()));
    EXPECT_FALSE(CSKavellEqual(fixed.get(), array({integer(1), text("a")}).get()));
    EXPECT_FALSE(CSKavellEqual(fixed.get(), array({text("a")}).get()));
    EXPECT_TRUE(same(array({}), array({})));
}

TEST(CSKavellArray, NoneIsAnArrayOfNothing)
{
    EXPECT_EQ(CSKavellArrayGetCount(nullptr), 0u);
    EXPECT_EQ(CSKavellArrayGetValueAtIndex(nullptr, 0), nullptr);
}

TEST(CSKavellArray, PastTheEndThereIsNone)
{
    const auto values = array({text("a")});
    EXPECT_EQ(CSKavellArrayGetValueAtIndex(values.get(), 1), nullptr);
    EXPECT_EQ(CSKavellArrayGetValueAtIndex(values.get(), SIZE_MAX), nullptr);
}
