// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tests/runtime/values.h"

using namespace kavell;
using namespace kavell::test;

TEST(Ref, AdoptTakesTheReferenceOverAndReleasesIt)
{
    CountingAllocator allocator;
    {
        const String owner = adopt(CSKavellStringCreateCopy(allocator.get(), text("a").get()));
        EXPECT_EQ(allocator.deallocated(), 0);
    }
    EXPECT_EQ(allocator.deallocated(), 1);
}

TEST(Ref, RetainAddsAReferenceOfItsOwn)
{
    CountingAllocator allocator;
    String owner = watchedText(allocator, "a");
    {
        const String second = retain(owner.get());
        EXPECT_EQ(second.get(), owner.get());
    }
    EXPECT_EQ(allocator.deallocated(), 0);
    owner = nullptr;
    EXPECT_EQ(allocator.deallocated(), 1);
}

TEST(Ref, CopiesShareAndMovesPassTheReferenceOn)
{
    CountingAllocator allocator;
    String first = watchedText(allocator, "a");
    String copy = first;
    String moved = std::move(first);
    EXPECT_FALSE(first);  // NOLINT: a moved-from Ref is none, and that is what is shown
    EXPECT_EQ(copy.get(), moved.get());
    copy = nullptr;
    EXPECT_EQ(allocator.deallocated(), 0);
    moved = nullptr;
    EXPECT_EQ(allocator.deallocated(), 1);
}

TEST(Ref, AssigningReleasesWhatWasHeldAndMayAssignItself)
{
    CountingAllocator allocator;
    String first = watchedText(allocator, "a");
    first = watchedText(allocator, "b");
    EXPECT_EQ(allocator.deallocated(), 1);
    const String &alias = first;
    first = alias;
    EXPECT_EQ(allocator.deallocated(), 1);
    EXPECT_EQ(toStringView(first.get()), "b");
}

TEST(Ref, LeakGivesTheReferenceToTheCaller)
{
    CountingAllocator allocator;
    String owner = watchedText(allocator, "a");
    const CSKavellStringRef bare = owner.leak();
    EXPECT_FALSE(owner);
    EXPECT_EQ(allocator.deallocated(), 0);
    CSKavellRelease(bare);
    EXPECT_EQ(allocator.deallocated(), 1);
}

TEST(Ref, ConvertsToAMoreGeneralReference)
{
    CountingAllocator allocator;
    Value general = watchedText(allocator, "a");
    EXPECT_EQ(CSKavellGetTypeID(general.get()), CSKavellStringGetTypeID());
    general = nullptr;
    EXPECT_EQ(allocator.deallocated(), 1);
    const Ref<CSKavellArrayRef> fixed = adopt(CSKavellArrayCreateMutable());
    EXPECT_EQ(CSKavellArrayGetCount(fixed.get()), 0u);
}

TEST(Ref, IsNoneByDefaultAndFromNull)
{
    EXPECT_FALSE(String());
    EXPECT_FALSE(String(nullptr));
    EXPECT_FALSE(adopt(CSKavellStringRef()));
    EXPECT_FALSE(retain(CSKavellStringRef()));
}

TEST(Ref, TextHelpersTakeNoneAndKeepEveryByte)
{
    EXPECT_EQ(toStringView(nullptr), "");
    EXPECT_EQ(toStdString(nullptr), "");
    EXPECT_EQ(toStdString(makeString(std::string_view()).get()), "");
    EXPECT_TRUE(makeString(std::string_view()));
    EXPECT_FALSE(makeString("\xFF"));
    EXPECT_EQ(toStringView(makeString(std::string_view("a\0b", 3)).get()), std::string_view("a\0b", 3));
}

TEST(Ref, CastAnswersNoneForAnotherType)
{
    const String string = text("a");
    const CSKavellTypeRef object = string.get();
    EXPECT_EQ(cast<CSKavellStringRef>(object, CSKavellStringGetTypeID()), string.get());
    EXPECT_EQ(cast<CSKavellNumberRef>(object, CSKavellNumberGetTypeID()), nullptr);
    EXPECT_EQ(cast<CSKavellNumberRef>(nullptr, CSKavellNumberGetTypeID()), nullptr);
}
