// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <set>

#include "tests/runtime/values.h"

using namespace kavell;
using namespace kavell::test;

namespace {

// Constructed before main, and before anything of the library could have run code of its own.
[[gnu::constructor(101)]] void readConstantsBeforeMain();
char textBeforeMain[64];
size_t lengthBeforeMain;
uint64_t hashBeforeMain;
CSKavellTypeID typeBeforeMain;
bool equalBeforeMain;

void readConstantsBeforeMain()
{
    std::snprintf(textBeforeMain, sizeof textBeforeMain, "%s", CSKavellStringGetUTF8(kCSKavellAccountProviderMail));
    lengthBeforeMain = CSKavellStringGetLength(kCSKavellAccountProviderMail);
    hashBeforeMain = CSKavellHash(kCSKavellAccountProviderMail);
    typeBeforeMain = CSKavellGetTypeID(kCSKavellAccountProviderMail);
    equalBeforeMain = CSKavellEqual(kCSKavellAccountProviderMail, kCSKavellAccountProviderYahoo);
}

}  // namespace

TEST(CSKavellType, ConstantsCanBeUsedBeforeMain)
{
    EXPECT_STREQ(textBeforeMain, "com.corvane.account.mail");
    EXPECT_EQ(lengthBeforeMain, 24u);
    EXPECT_EQ(hashBeforeMain, CSKavellHash(text("com.corvane.account.mail").get()));
    EXPECT_EQ(typeBeforeMain, CSKavellStringGetTypeID());
    EXPECT_FALSE(equalBeforeMain);
}

TEST(CSKavellType, ConstantsAreNeverFreed)
{
    for (int round = 0; round < 1000; ++round)
        CSKavellRelease(kCSKavellAccountProviderMail);
    EXPECT_STREQ(CSKavellStringGetUTF8(kCSKavellAccountProviderMail), "com.corvane.account.mail");
    EXPECT_EQ(CSKavellRetain(kCSKavellAccountProviderMail), kCSKavellAccountProviderMail);
}

TEST(CSKavellType, EveryTypeHasAnIdentifierAndANameOfItsOwn)
{
    const CSKavellTypeID identifiers[] = {CSKavellStringGetTypeID(),
                                          CSKavellNumberGetTypeID(),
                                          CSKavellBooleanGetTypeID(),
                                          CSKavellDateGetTypeID(),
                                          CSKavellDataGetTypeID(),
                                          CSKavellArrayGetTypeID(),
                                          CSKavellDictionaryGetTypeID(),
                                          CSKavellUUIDGetTypeID(),
                                          CSKavellURLGetTypeID(),
                                          CSKavellNotificationGetTypeID(),
                                          CSKavellNotificationObserverGetTypeID(),
                                          CSKavellCofferelItemGetTypeID(),
                                          CSKavellCofferelAccessGetTypeID(),
                                          _CSKavellAccountSettingsGetTypeID(),
                                          _CSKavellAccountGetTypeID(),
                                          _CSKavellAccountProviderGetTypeID()};
    std::set<CSKavellTypeID> distinct;
    std::set<std::string> names;
    for (CSKavellTypeID identifier : identifiers) {
        EXPECT_NE(identifier, 0u);
        distinct.insert(identifier);
        ASSERT_NE(CSKavellTypeIDGetName(identifier), nullptr);
        names.insert(CSKavellTypeIDGetName(identifier));
    }
    EXPECT_EQ(distinct.size(), std::size(identifiers));
    EXPECT_EQ(names.size(), std::size(identifiers));
}

TEST(CSKavellType, TheRecordsAreRegisteredUnderTheirNames)
{
    EXPECT_STREQ(CSKavellTypeIDGetName(_CSKavellAccountSettingsGetTypeID()), "CSKavellAccountSettings");
    EXPECT_STREQ(CSKavellTypeIDGetName(_CSKavellAccountGetTypeID()), "CSKavellAccount");
    EXPECT_STREQ(CSKavellTypeIDGetName(_CSKavellAccountProviderGetTypeID()), "CSKavellAccountProvider");
}

TEST(CSKavellType, AnUnknownIdentifierHasNoName)
{
    EXPECT_EQ(CSKavellTypeIDGetName(0), nullptr);
    EXPECT_EQ(CSKavellTypeIDGetName(UINT32_MAX), nullptr);
    EXPECT_EQ(CSKavellTypeIDGetName(63), nullptr);
    EXPECT_EQ(CSKavellTypeIDGetName(64), nullptr);
}

TEST(CSKavellType, GenericOperationsTakeNone)
{
    EXPECT_EQ(CSKavellRetain(nullptr), nullptr);
    CSKavellRelease(nullptr);
    EXPECT_TRUE(CSKavellEqual(nullptr, nullptr));
    EXPECT_FALSE(CSKavellEqual(nullptr, kCSKavellAccountProviderMail));
    EXPECT_FALSE(CSKavellEqual(kCSKavellAccountProviderMail, nullptr));
    EXPECT_EQ(CSKavellHash(nullptr), 0u);
    EXPECT_EQ(CSKavellGetTypeID(nullptr), 0u);
    EXPECT_EQ(adopt(CSKavellCreateCopy(nullptr, nullptr)).get(), nullptr);
    EXPECT_EQ(describe(nullptr), "(null)");
}

TEST(CSKavellType, ValuesOfDifferentTypesAreNotEqual)
{
    const Value values[] = {text("1"),      integer(1),
                            boolean(true),  date(1),
                            bytes("1"),     array({}),
                            dictionary({}), adopt(CSKavellUUIDCreate()),
                            real(1.0),      adopt(CSKavellURLCreateWithString(text("x:1").get()))};
    for (const Value &first : values) {
        for (const Value &second : values)
            EXPECT_EQ(CSKavellEqual(first.get(), second.get()), &first == &second)
                << describe(first.get()) << " and " << describe(second.get());
    }
}

TEST(CSKavellType, RetainReturnsTheObjectAndTheLastReleaseFreesIt)
{
    CountingAllocator allocator;
    const CSKavellStringRef string = watchedText(allocator, "text").leak();
    EXPECT_EQ(CSKavellRetain(string), string);
    CSKavellRelease(string);
    EXPECT_EQ(allocator.deallocated(), 0);
    CSKavellRelease(string);
    EXPECT_EQ(allocator.deallocated(), 1);
}

TEST(CSKavellType, TheAllocatorStructureNeedNotOutliveTheCall)
{
    CountingAllocator allocator;
    CSKavellAllocator passing = *allocator.get();
    String copy = adopt(CSKavellStringCreateCopy(&passing, text("text").get()));
    passing = {};
    copy = nullptr;
    EXPECT_EQ(allocator.deallocated(), 1);
}

TEST(CSKavellType, CopiesContainersToMutableContainersThatShareTheirValues)
{
    const auto values = array({text("a")});
    const auto copy = adopt(CSKavellCreateCopy(nullptr, values.get()));
    ASSERT_NE(copy.get(), values.get());
    EXPECT_TRUE(same(copy, values));
    const auto changeable = const_cast<CSKavellMutableArrayRef>(static_cast<CSKavellArrayRef>(copy.get()));
    CSKavellArrayAppendValue(changeable, text("b").get());
    EXPECT_EQ(CSKavellArrayGetCount(changeable), 2u);
    EXPECT_EQ(CSKavellArrayGetCount(values.get()), 1u);
    EXPECT_EQ(CSKavellArrayGetValueAtIndex(changeable, 0), CSKavellArrayGetValueAtIndex(values.get(), 0));

    const auto pairs = dictionary({{"a", integer(1)}});
    const auto copiedPairs = adopt(CSKavellCreateCopy(nullptr, pairs.get()));
    ASSERT_NE(copiedPairs.get(), CSKavellTypeRef(pairs.get()));
    EXPECT_TRUE(same(copiedPairs, pairs));
}

TEST(CSKavellType, CopiesAnImmutableValueByRetainingIt)
{
    for (const Value &value : {Value(integer(5)), Value(boolean(true)), Value(date(5)), Value(text("a"))})
        EXPECT_EQ(adopt(CSKavellCreateCopy(nullptr, value.get())).get(), value.get()) << describe(value.get());
}

TEST(CSKavellType, CopiesSettingsToSettingsWithTheirEffectiveAttributes)
{
    const auto settings = adopt(CSKavellAccountSettingsCreate(nullptr));
    CSKavellAccountSettingsSetAttribute(settings.get(), text("a").get(), integer(1).get());
    const auto copy = adopt(CSKavellCreateCopy(nullptr, settings.get()));
    ASSERT_EQ(CSKavellGetTypeID(copy.get()), _CSKavellAccountSettingsGetTypeID());
    ASSERT_NE(copy.get(), CSKavellTypeRef(settings.get()));
    const auto copied =
        const_cast<CSKavellAccountSettingsRef>(static_cast<const struct CSKavellAccountSettings *>(copy.get()));
    EXPECT_TRUE(same(adopt(CSKavellAccountSettingsCopyAttributes(copied)), dictionary({{"a", integer(1)}})));
    EXPECT_FALSE(CSKavellAccountSettingsHasChanges(copied));
}

TEST(CSKavellType, DescribesValuesForPeople)
{
    EXPECT_EQ(describe(text("a text").get()), "a text");
    EXPECT_EQ(describe(integer(-12).get()), "-12");
    EXPECT_EQ(describe(unsignedInteger(UINT64_MAX).get()), "18446744073709551615");
    EXPECT_EQ(describe(array({text("a"), text("b")}).get()), "(a, b)");
}

TEST(CSKavellType, DescribesDictionariesWithSortedKeys)
{
    const std::string description =
        describe(dictionary({{"b", integer(2)}, {"a", array({text("x"), text("y")})}}).get());
    EXPECT_EQ(description.front(), '{');
    EXPECT_EQ(description.back(), '}');
    ASSERT_NE(description.find("a = (x, y); b = 2"), std::string::npos) << description;
}

TEST(CSKavellType, DescribesARecordByTypeAndAddress)
{
    const auto settings = adopt(CSKavellAccountSettingsCreate(nullptr));
    char expected[64];
    std::snprintf(expected, sizeof expected, "<CSKavellAccountSettings %p>", static_cast<void *>(settings.get()));
    EXPECT_EQ(describe(settings.get()), expected);
}

TEST(CSKavellType, DescribesAContainerThatHoldsItselfWithoutEnd)
{
    const auto loop = adopt(CSKavellArrayCreateMutable());
    CSKavellArrayAppendValue(loop.get(), loop.get());
    EXPECT_FALSE(describe(loop.get()).empty());
    CSKavellArrayRemoveValueAtIndex(loop.get(), 0);
}
