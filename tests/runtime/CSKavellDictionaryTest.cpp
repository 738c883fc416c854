// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <chrono>

#include "tests/runtime/values.h"
#include "tests/support/short_memory.h"

using namespace kavell;
using namespace kavell::test;

namespace {

using Texts = std::vector<std::string>;

Ref<CSKavellMutableDictionaryRef> mutableDictionary(std::initializer_list<std::pair<std::string_view, Value>> pairs)
{
    return adopt(CSKavellDictionaryCreateMutableCopy(dictionary(pairs).get()));
}

}  // namespace

TEST(CSKavellDictionary, LooksKeysUpByValue)
{
    const String key = text("key");
    const CSKavellTypeRef keys[] = {key.get()}, values[] = {kCSKavellAccountServiceMail};
    const auto pairs = adopt(CSKavellDictionaryCreate(keys, values, 1));
    const String equalKey = text("key");
    ASSERT_NE(equalKey.get(), key.get());
    EXPECT_EQ(CSKavellDictionaryGetValue(pairs.get(), equalKey.get()), kCSKavellAccountServiceMail);
    EXPECT_EQ(CSKavellDictionaryGetValue(pairs.get(), text("Key").get()), nullptr);
    EXPECT_EQ(CSKavellGetTypeID(pairs.get()), CSKavellDictionaryGetTypeID());
}

TEST(CSKavellDictionary, TakesKeysOfAnyTypeByValue)
{
    const auto pairs = adopt(CSKavellDictionaryCreateMutable());
    CSKavellDictionarySetValue(pairs.get(), integer(1).get(), text("integer").get());
    CSKavellDictionarySetValue(pairs.get(), real(1.0).get(), text("real").get());
    CSKavellDictionarySetValue(pairs.get(), text("1").get(), text("text").get());
    EXPECT_TRUE(same(CSKavellDictionaryGetValue(pairs.get(), integer(1).get()), text("integer").get()));
    EXPECT_TRUE(same(CSKavellDictionaryGetValue(pairs.get(), real(1.0).get()), text("real").get()));
    EXPECT_TRUE(same(CSKavellDictionaryGetValue(pairs.get(), text("1").get()), text("text").get()));
}

TEST(CSKavellDictionary, ALaterPairWinsOverAnEarlierOneOfAnEqualKey)
{
    const String key = text("key"), equalKey = text("key"), first = text("first"), second = text("second");
    const CSKavellTypeRef keys[] = {key.get(), equalKey.get()}, values[] = {first.get(), second.get()};
    const auto pairs = adopt(CSKavellDictionaryCreate(keys, values, 2));
    EXPECT_EQ(CSKavellDictionaryGetCount(pairs.get()), 1u);
    EXPECT_TRUE(same(valueOf(pairs.get(), "key"), second.get()));
}

TEST(CSKavellDictionary, IsNoneForMissingKeysOrValues)
{
    const CSKavellTypeRef one[] = {kCSKavellAccountServiceMail}, none[] = {nullptr};
    EXPECT_FALSE(adopt(CSKavellDictionaryCreate(nullptr, one, 1)));
    EXPECT_FALSE(adopt(CSKavellDictionaryCreate(one, nullptr, 1)));
    EXPECT_FALSE(adopt(CSKavellDictionaryCreate(none, one, 1)));
    EXPECT_FALSE(adopt(CSKavellDictionaryCreate(one, none, 1)));
    const auto empty = adopt(CSKavellDictionaryCreate(nullptr, nullptr, 0));
    ASSERT_TRUE(empty);
    EXPECT_EQ(CSKavellDictionaryGetCount(empty.get()), 0u);
}

TEST(CSKavellDictionary, EnumeratesInTheOrderOfFirstSetting)
{
    const auto pairs = mutableDictionary({{"c", integer(1)}, {"a", integer(2)}, {"b", integer(3)}});
    CSKavellDictionarySetValue(pairs.get(), text("c").get(), integer(4).get());
    EXPECT_EQ(keysOf(pairs.get()), (Texts{"c", "a", "b"}));
    EXPECT_TRUE(same(valueOf(pairs.get(), "c"), integer(4).get()));

    CSKavellTypeRef values[3];
    CSKavellDictionaryGetKeysAndValues(pairs.get(), nullptr, values);
    EXPECT_TRUE(same(values[0], integer(4).get()));
    EXPECT_TRUE(same(values[1], integer(2).get()));
    EXPECT_TRUE(same(values[2], integer(3).get()));
}

TEST(CSKavellDictionary, AKeySetAgainAfterItsRemovalComesLast)
{
    const auto pairs = mutableDictionary({{"a", integer(1)}, {"b", integer(2)}, {"c", integer(3)}});
    CSKavellDictionaryRemoveValue(pairs.get(), text("a").get());
    EXPECT_EQ(keysOf(pairs.get()), (Texts{"b", "c"}));
    CSKavellDictionarySetValue(pairs.get(), text("a").get(), integer(4).get());
    EXPECT_EQ(keysOf(pairs.get()), (Texts{"b", "c", "a"}));
    EXPECT_TRUE(same(valueOf(pairs.get(), "a"), integer(4).get()));
}

TEST(CSKavellDictionary, RemovingTheLastKeyLeavesAnEmptyDictionary)
{
    const auto pairs = mutableDictionary({{"a", integer(1)}});
    CSKavellDictionaryRemoveValue(pairs.get(), text("a").get());
    EXPECT_EQ(CSKavellDictionaryGetCount(pairs.get()), 0u);
    EXPECT_EQ(valueOf(pairs.get(), "a"), nullptr);
    CSKavellDictionarySetValue(pairs.get(), text("b").get(), integer(2).get());
    EXPECT_EQ(keysOf(pairs.get()), (Texts{"b"}));
}

TEST(CSKavellDictionary, RemovingAKeyThatIsNotThereDoesNothing)
{
    const auto pairs = mutableDictionary({{"a", integer(1)}});
    CSKavellDictionaryRemoveValue(pairs.get(), text("b").get());
    CSKavellDictionaryRemoveValue(pairs.get(), nullptr);
    CSKavellDictionaryRemoveValue(nullptr, text("a").get());
    EXPECT_EQ(keysOf(pairs.get()), (Texts{"a"}));
}

TEST(CSKavellDictionary, SettingNoneDoesNothing)
{
    const auto pairs = mutableDictionary({{"a", integer(1)}});
    CSKavellDictionarySetValue(pairs.get(), text("a").get(), nullptr);
    CSKavellDictionarySetValue(pairs.get(), nullptr, integer(2).get());
    CSKavellDictionarySetValue(nullptr, text("a").get(), integer(2).get());
    EXPECT_EQ(keysOf(pairs.get()), (Texts{"a"}));
    EXPECT_TRUE(same(valueOf(pairs.get(), "a"), integer(1).get()));
}

TEST(CSKavellDictionary, AnImmutableDictionaryStaysAsItIs)
{
    const CSKavellTypeRef keys[] = {kCSKavellAccountServiceMail}, values[] = {kCSKavellAccountServiceLDAP};
    const auto pairs = adopt(CSKavellDictionaryCreate(keys, values, 1));
    const auto forced = const_cast<CSKavellMutableDictionaryRef>(pairs.get());
    CSKavellDictionarySetValue(forced, text("b").get(), integer(2).get());
    CSKavellDictionaryRemoveValue(forced, kCSKavellAccountServiceMail);
    EXPECT_EQ(CSKavellDictionaryGetCount(pairs.get()), 1u);
    EXPECT_EQ(CSKavellDictionaryGetValue(pairs.get(), kCSKavellAccountServiceMail), kCSKavellAccountServiceLDAP);
}

TEST(CSKavellDictionary, RetainsKeysAndValuesAndReleasesThemAtItsEnd)
{
    CountingAllocator allocator;
    String key = watchedText(allocator, "key"), value = watchedText(allocator, "value");
    auto pairs = adopt(CSKavellDictionaryCreateMutable());
    CSKavellDictionarySetValue(pairs.get(), key.get(), value.get());
    key = value = nullptr;
    EXPECT_EQ(allocator.deallocated(), 0);
    pairs = nullptr;
    EXPECT_EQ(allocator.deallocated(), 2);
}

TEST(CSKavellDictionary, ReleasesAValueThatIsReplacedOrRemoved)
{
    CountingAllocator allocator;
    const auto pairs = adopt(CSKavellDictionaryCreateMutable());
    CSKavellDictionarySetValue(pairs.get(), text("a").get(), watchedText(allocator, "one").get());
    CSKavellDictionarySetValue(pairs.get(), text("a").get(), watchedText(allocator, "two").get());
    EXPECT_EQ(allocator.deallocated(), 1);
    CSKavellDictionaryRemoveValue(pairs.get(), text("a").get());
    EXPECT_EQ(allocator.deallocated(), 2);
}

TEST(CSKavellDictionary, AValueMaySetItselfAgain)
{
    CountingAllocator allocator;
    const auto pairs = adopt(CSKavellDictionaryCreateMutable());
    CSKavellDictionarySetValue(pairs.get(), text("a").get(), watchedText(allocator, "one").get());
    CSKavellDictionarySetValue(pairs.get(), text("a").get(), valueOf(pairs.get(), "a"));
    EXPECT_EQ(allocator.deallocated(), 0);
    EXPECT_TRUE(same(valueOf(pairs.get(), "a"), text("one").get()));
}

TEST(CSKavellDictionary, AMutableCopyKeepsTheOrderAndIsIndependent)
{
    const auto original = dictionary({{"b", integer(1)}, {"a", integer(2)}});
    const auto copy = adopt(CSKavellDictionaryCreateMutableCopy(original.get()));
    CSKavellDictionarySetValue(copy.get(), text("c").get(), integer(3).get());
    CSKavellDictionaryRemoveValue(copy.get(), text("b").get());
    EXPECT_EQ(keysOf(original.get()), (Texts{"b", "a"}));
    EXPECT_EQ(keysOf(copy.get()), (Texts{"a", "c"}));
    EXPECT_FALSE(adopt(CSKavellDictionaryCreateMutableCopy(nullptr)));
}

TEST(CSKavellDictionary, EqualPairsInAnyOrderAreEqualAndHashAlike)
{
    const auto first = dictionary({{"a", integer(1)}, {"b", array({text("x")})}});
    const auto second = dictionary({{"b", array({text("x")})}, {"a", integer(1)}});
    EXPECT_TRUE(same(first, second));
    EXPECT_EQ(CSKavellHash(first.get()), CSKavellHash(second.get()));
    EXPECT_FALSE(CSKavellEqual(first.get(), dictionary({{"a", integer(1)}}).get()));
    EXPECT_FALSE(CSKavellEqual(first.get(), dictionary({{"a", integer(1)}, {"b", array({text("y")})}}).get()));
    EXPECT_FALSE(CSKavellEqual(first.get(), dictionary({{"a", integer(1)}, {"c", array({text("x")})}}).get()));
}

TEST(CSKavellDictionary, FindsEachOfManyKeysAfterHalfWereRemovedAndSetAgain)
{
    constexpr int kCount = 20000;
    const auto pairs = adopt(CSKavellDictionaryCreateMutable());
    const auto key = [](int index) {
        return text("key " + std::to_string(index));
    };
    for (int index = 0; index < kCount; ++index)
        CSKavellDictionarySetValue(pairs.get(), key(index).get(), integer(index).get());
    for (int index = 0; index < kCount; index += 2)
        CSKavellDictionaryRemoveValue(pairs.get(), key(index).get());
    ASSERT_EQ(CSKavellDictionaryGetCount(pairs.get()), 10000u);
    for (int index = 0; index < kCount; index += 4)
        CSKavellDictionarySetValue(pairs.get(), key(index).get(), integer(-index).get());
    ASSERT_EQ(CSKavellDictionaryGetCount(pairs.get()), 15000u);

    for (int index = 0; index < kCount; ++index) {
        const CSKavellTypeRef found = CSKavellDictionaryGetValue(pairs.get(), key(index).get());
        if (index % 4 == 2)
            ASSERT_EQ(found, nullptr) << index;
        else
            ASSERT_TRUE(same(found, integer(index % 2 ? index : -index).get())) << index;
    }
    const Texts order = keysOf(pairs.get());
    EXPECT_EQ(order.front(), "key 1");
    EXPECT_EQ(order[9999], "key 19999");
    EXPECT_EQ(order[10000], "key 0");
    EXPECT_EQ(order.back(), "key 19996");
}

TEST(CSKavellDictionary, IsAsBeforeWhereThereIsNoMemoryToGrow)
{
    const auto pairs = adopt(CSKavellDictionaryCreateMutable());
    int held = 0, refusals = 0;
    for (int round = 0; round < 200; ++round) {
        const String key = text(std::to_string(held));
        const auto value = integer(held);
        {
            // Its entries, or its index, are too many now; then there is memory again.
            const ShortMemory memory(0);
            CSKavellDictionarySetValue(pairs.get(), key.get(), value.get());
        }
        const bool isSet = valueOf(pairs.get(), std::to_string(held)) != nullptr;
        refusals += !isSet;
        if (!isSet)
            CSKavellDictionarySetValue(pairs.get(), key.get(), value.get());
        ++held;
        ASSERT_EQ(CSKavellDictionaryGetCount(pairs.get()), static_cast<size_t>(held));
        for (int index = 0; index < held; ++index)
            ASSERT_TRUE(same(valueOf(pairs.get(), std::to_string(index)), integer(index).get()));
    }
    // The room behind it is for 4; entries grow to 8, 16, 32, 64, 128 and 256, and the index at times of its own.
    EXPECT_GT(refusals, 6);
}

TEST(CSKavellDictionary, LooksUpAndRemovesInConstantTime)
{
    // Looked through one by one, 200,000 keys would take ten thousand million comparisons; minutes, not this bound.
    constexpr int kCount = 200000;
    const auto start = std::chrono::steady_clock::now();
    const auto pairs = adopt(CSKavellDictionaryCreateMutable());
    for (int index = 0; index < kCount; ++index)
        CSKavellDictionarySetValue(pairs.get(), integer(index).get(), kCSKavellAccountServiceMail);
    for (int index = 0; index < kCount; ++index)
        ASSERT_EQ(CSKavellDictionaryGetValue(pairs.get(), integer(index).get()), kCSKavellAccountServiceMail);
    for (int index = 0; index < kCount; ++index)
        CSKavellDictionaryRemoveValue(pairs.get(), integer(index).get());
    EXPECT_EQ(CSKavellDictionaryGetCount(pairs.get()), 0u);
    EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::seconds(20));
}

TEST(CSKavellDictionary, NoneIsADictionaryOfNothing)
{
    CSKavellTypeRef untouched = kCSKavellAccountServiceMail;
    CSKavellDictionaryGetKeysAndValues(nullptr, &untouched, &untouched);
    EXPECT_EQ(untouched, kCSKavellAccountServiceMail);
    EXPECT_EQ(CSKavellDictionaryGetCount(nullptr), 0u);
    EXPECT_EQ(CSKavellDictionaryGetValue(nullptr, kCSKavellAccountServiceMail), nullptr);
    EXPECT_EQ(CSKavellDictionaryGetValue(dictionary({{"a", integer(1)}}).get(), nullptr), nullptr);
}
