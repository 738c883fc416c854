// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "store/collection_helpers.h"

#include "tests/runtime/values.h"

using namespace kavell;
using namespace kavell::test;

namespace {

using Texts = std::vector<std::string>;

ArraySlot slotOf(std::initializer_list<Value> values)
{
    return adopt(CSKavellArrayCreateMutableCopy(array(values).get()));
}

DictionarySlot slotOf(std::initializer_list<std::pair<std::string_view, Value>> pairs)
{
    return adopt(CSKavellDictionaryCreateMutableCopy(dictionary(pairs).get()));
}

bool isMutable(const Ref<CSKavellMutableArrayRef> &values)
{
    const size_t before = CSKavellArrayGetCount(values.get());
    CSKavellArrayAppendValue(values.get(), kCSKavellAccountServiceMail);
    return CSKavellArrayGetCount(values.get()) == before + 1;
}

bool isMutable(const Ref<CSKavellMutableDictionaryRef> &pairs)
{
    CSKavellDictionarySetValue(pairs.get(), text("probe").get(), kCSKavellAccountServiceMail);
    return valueOf(pairs.get(), "probe") != nullptr;
}

}  // namespace

TEST(ReleaseAndClear, ReleasesWhatTheSlotHoldsAndEmptiesIt)
{
    CountingAllocator allocator;
    ArraySlot slot = slotOf({watchedText(allocator, "a")});
    ReleaseAndClear(slot);
    EXPECT_FALSE(slot);
    EXPECT_EQ(allocator.deallocated(), 1);
    ReleaseAndClear(slot);
    EXPECT_FALSE(slot);
}

TEST(EmptyContainers, AreNewEmptyAndImmutable)
{
    const auto values = EmptyArray();
    ASSERT_TRUE(values);
    CSKavellArrayAppendValue(const_cast<CSKavellMutableArrayRef>(values.get()), kCSKavellAccountServiceMail);
    EXPECT_EQ(CSKavellArrayGetCount(values.get()), 0u);
    const auto pairs = EmptyDictionary();
    ASSERT_TRUE(pairs);
    CSKavellDictionarySetValue(const_cast<CSKavellMutableDictionaryRef>(pairs.get()), kCSKavellAccountServiceMail,
                               kCSKavellAccountServiceMail);
    EXPECT_EQ(CSKavellDictionaryGetCount(pairs.get()), 0u);
}

TEST(NewMutableContainers, AreEmptyMutableAndNotShared)
{
    const ArraySlot values = NewMutableArray(), otherValues = NewMutableArray();
    EXPECT_EQ(CSKavellArrayGetCount(values.get()), 0u);
    EXPECT_TRUE(isMutable(values));
    EXPECT_EQ(CSKavellArrayGetCount(otherValues.get()), 0u);
    const DictionarySlot pairs = NewMutableDictionary(), otherPairs = NewMutableDictionary();
    EXPECT_EQ(CSKavellDictionaryGetCount(pairs.get()), 0u);
    EXPECT_TRUE(isMutable(pairs));
    EXPECT_EQ(CSKavellDictionaryGetCount(otherPairs.get()), 0u);
}

TEST(CopyDictKeys, GivesTheKeysInTheDictionarysOrder)
{
    const auto keys = CopyDictKeys(dictionary({{"b", integer(1)}, {"a", integer(2)}}).get());
    EXPECT_EQ(textsOf(keys.get()), (Texts{"b", "a"}));
}

TEST(CopyDictKeys, IsAnEmptyArrayForNoneAndForAnEmptyDictionary)
{
    for (const auto &pairs : {Ref<CSKavellDictionaryRef>(), dictionary({})}) {
        const auto keys = CopyDictKeys(pairs.get());
        ASSERT_TRUE(keys);
        EXPECT_EQ(CSKavellArrayGetCount(keys.get()), 0u);
    }
}

TEST(MergeDictKeys, NoneChangesNothing)
{
    DictionarySlot empty, full = slotOf({{"a", integer(1)}});
    MergeDictKeys(empty, nullptr);
    MergeDictKeys(full, nullptr);
    EXPECT_FALSE(empty);
    EXPECT_TRUE(same(full, dictionary({{"a", integer(1)}})));
}

TEST(MergeDictKeys, AnEmptySlotReceivesAMutableCopyEvenOfAnEmptyDictionary)
{
    const auto given = dictionary({{"a", integer(1)}});
    DictionarySlot slot, slotOfNothing;
    MergeDictKeys(slot, given.get());
    MergeDictKeys(slotOfNothing, dictionary({}).get());
    EXPECT_TRUE(same(slot, given));
    EXPECT_TRUE(isMutable(slot));
    EXPECT_EQ(CSKavellDictionaryGetCount(given.get()), 1u);
    ASSERT_TRUE(slotOfNothing);
    EXPECT_EQ(CSKavellDictionaryGetCount(slotOfNothing.get()), 0u);
}

TEST(MergeDictKeys, OverwritesEqualKeysAndAddsTheOthers)
{
    DictionarySlot slot = slotOf({{"a", integer(1)}, {"b", integer(2)}});
    MergeDictKeys(slot, dictionary({{"b", integer(3)}, {"c", integer(4)}}).get());
    EXPECT_TRUE(same(slot, dictionary({{"a", integer(1)}, {"b", integer(3)}, {"c", integer(4)}})));
    MergeDictKeys(slot, dictionary({}).get());
    EXPECT_EQ(CSKavellDictionaryGetCount(slot.get()), 3u);
}

TEST(ArrayContainsValue, ComparesByValue)
{
    const auto values = array({text("a"), integer(1)});
    EXPECT_TRUE(ArrayContainsValue(values.get(), text("a").get()));
    EXPECT_TRUE(ArrayContainsValue(values.get(), integer(1).get()));
    EXPECT_FALSE(ArrayContainsValue(values.get(), text("b").get()));
    EXPECT_FALSE(ArrayContainsValue(values.get(), real(1.0).get()));
    EXPECT_FALSE(ArrayContainsValue(nullptr, text("a").get()));
    EXPECT_FALSE(ArrayContainsValue(array({}).get(), text("a").get()));
    EXPECT_FALSE(ArrayContainsValue(values.get(), nullptr));
}

TEST(GetDictValue, AnswersTheValueWithoutRetainingIt)
{
    CountingAllocator allocator;
    DictionarySlot pairs = slotOf({{"a", watchedText(allocator, "value")}});
    EXPECT_TRUE(same(GetDictValue(pairs.get(), text("a").get()), text("value").get()));
    pairs = nullptr;
    EXPECT_EQ(allocator.deallocated(), 1);
}

TEST(GetDictValue, IsNoneForNoneAndForAMissingKey)
{
    EXPECT_EQ(GetDictValue(nullptr, text("a").get()), nullptr);
    EXPECT_EQ(GetDictValue(dictionary({{"a", integer(1)}}).get(), text("b").get()), nullptr);
}

TEST(AddArrayValue, MakesTheArrayAndNeverADuplicate)
{
    ArraySlot slot;
    AddArrayValue(slot, text("a").get());
    AddArrayValue(slot, text("b").get());
    AddArrayValue(slot, text("a").get());
    EXPECT_EQ(textsOf(slot.get()), (Texts{"a", "b"}));
    EXPECT_TRUE(isMutable(slot));
}

TEST(MergeArrayValues, NoneChangesNothing)
{
    ArraySlot empty, full = slotOf({text("a")});
    MergeArrayValues(empty, nullptr);
    MergeArrayValues(full, nullptr);
    EXPECT_FALSE(empty);
    EXPECT_EQ(textsOf(full.get()), (Texts{"a"}));
}

TEST(MergeArrayValues, AnEmptySlotReceivesACopyWithItsDuplicates)
{
    ArraySlot slot, slotOfNothing;
    MergeArrayValues(slot, array({text("a"), text("b"), text("a")}).get());
    MergeArrayValues(slotOfNothing, array({}).get());
    EXPECT_EQ(textsOf(slot.get()), (Texts{"a", "b", "a"}));
    EXPECT_TRUE(isMutable(slot));
    ASSERT_TRUE(slotOfNothing);
    EXPECT_EQ(CSKavellArrayGetCount(slotOfNothing.get()), 0u);
}

TEST(MergeArrayValues, AppendsInOrderWhatIsNotThereYet)
{
    ArraySlot slot = slotOf({text("b")});
    MergeArrayValues(slot, array({text("c"), text("b"), text("a"), text("c")}).get());
    EXPECT_EQ(textsOf(slot.get()), (Texts{"b", "c", "a"}));
}

TEST(RemoveDictKeys, RemovesEachKeyAndKeepsTheRest)
{
    DictionarySlot slot = slotOf({{"a", integer(1)}, {"b", integer(2)}, {"c", integer(3)}});
    RemoveDictKeys(slot, array({text("a"), text("x"), text("c")}).get());
    EXPECT_TRUE(same(slot, dictionary({{"b", integer(2)}})));
}

TEST(RemoveDictKeys, AnEmptiedDictionaryBecomesNone)
{
    DictionarySlot slot = slotOf({{"a", integer(1)}});
    RemoveDictKeys(slot, array({text("a")}).get());
    EXPECT_FALSE(slot);
    DictionarySlot alreadyEmpty = NewMutableDictionary();
    RemoveDictKeys(alreadyEmpty, array({}).get());
    EXPECT_FALSE(alreadyEmpty);
}

TEST(RemoveDictKeys, DoesNothingUnlessBothArePresent)
{
    DictionarySlot empty, alreadyEmpty = NewMutableDictionary(), full = slotOf({{"a", integer(1)}});
    RemoveDictKeys(empty, array({text("a")}).get());
    RemoveDictKeys(alreadyEmpty, nullptr);
    RemoveDictKeys(full, nullptr);
    EXPECT_FALSE(empty);
    EXPECT_TRUE(alreadyEmpty);
    EXPECT_TRUE(same(full, dictionary({{"a", integer(1)}})));
}

TEST(RemoveArrayValues, RemovesTheFirstEqualValueOnceForEachGiven)
{
    ArraySlot slot = slotOf({text("a"), text("b"), text("a"), text("a")});
    RemoveArrayValues(slot, array({text("a"), text("a"), text("x")}).get());
    EXPECT_EQ(textsOf(slot.get()), (Texts{"b", "a"}));
}

TEST(RemoveArrayValues, TakesTheGivenValuesFromTheLastToTheFirst)
{
    // Equal values can be told apart by their identity: each removal takes the first that is still there.
    const String first = text("a"), second = text("a");
    ArraySlot slot = slotOf({first, text("b"), second});
    RemoveArrayValues(slot, array({text("a"), text("b")}).get());
    ASSERT_EQ(CSKavellArrayGetCount(slot.get()), 1u);
    EXPECT_EQ(CSKavellArrayGetValueAtIndex(slot.get(), 0), second.get());
}

TEST(RemoveArrayValues, AnEmptiedArrayBecomesNone)
{
    ArraySlot slot = slotOf({text("a"), text("b")});
    RemoveArrayValues(slot, array({text("b"), text("a")}).get());
    EXPECT_FALSE(slot);
}

TEST(RemoveArrayValues, DoesNothingUnlessBothArePresent)
{
    ArraySlot empty, full = slotOf({text("a")});
    RemoveArrayValues(empty, array({text("a")}).get());
    RemoveArrayValues(full, nullptr);
    EXPECT_FALSE(empty);
    EXPECT_EQ(textsOf(full.get()), (Texts{"a"}));
}

TEST(RemoveArrayValue, RemovesTheFirstEqualValue)
{
    const String second = text("a");
    ArraySlot slot = slotOf({text("a"), text("b"), second});
    RemoveArrayValue(slot, text("a").get());
    EXPECT_EQ(textsOf(slot.get()), (Texts{"b", "a"}));
    EXPECT_EQ(CSKavellArrayGetValueAtIndex(slot.get(), 1), second.get());
    RemoveArrayValue(slot, text("x").get());
    EXPECT_EQ(textsOf(slot.get()), (Texts{"b", "a"}));
}

TEST(RemoveArrayValue, AnEmptyArrayBecomesNoneEvenWhenNothingWasRemoved)
{
    ArraySlot slot = slotOf({text("a")}), alreadyEmpty = NewMutableArray(), none;
    RemoveArrayValue(slot, text("a").get());
    RemoveArrayValue(alreadyEmpty, text("a").get());
    RemoveArrayValue(none, text("a").get());
    EXPECT_FALSE(slot);
    EXPECT_FALSE(alreadyEmpty);
    EXPECT_FALSE(none);
}

TEST(RemoveDictKey, RemovesTheKeyAndAnEmptiedDictionaryBecomesNone)
{
    DictionarySlot slot = slotOf({{"a", integer(1)}, {"b", integer(2)}}), none;
    RemoveDictKey(slot, text("x").get());
    EXPECT_EQ(CSKavellDictionaryGetCount(slot.get()), 2u);
    RemoveDictKey(slot, text("a").get());
    EXPECT_TRUE(same(slot, dictionary({{"b", integer(2)}})));
    RemoveDictKey(slot, text("b").get());
    EXPECT_FALSE(slot);
    RemoveDictKey(none, text("a").get());
    EXPECT_FALSE(none);
}

TEST(SetDictKey, MakesTheDictionaryAndOverwrites)
{
    DictionarySlot slot;
    SetDictKey(slot, text("a").get(), integer(1).get());
    SetDictKey(slot, text("a").get(), integer(2).get());
    EXPECT_TRUE(same(slot, dictionary({{"a", integer(2)}})));
}

TEST(SetDictKey, ANoneValueRemovesTheKey)
{
    DictionarySlot slot = slotOf({{"a", integer(1)}, {"b", integer(2)}}), none;
    SetDictKey(slot, text("a").get(), nullptr);
    EXPECT_TRUE(same(slot, dictionary({{"b", integer(2)}})));
    SetDictKey(slot, text("b").get(), nullptr);
    EXPECT_FALSE(slot);
    SetDictKey(none, text("a").get(), nullptr);
    EXPECT_FALSE(none);
}
