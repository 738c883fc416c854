// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What many threads may do at once with the runtime. A program of its own, so that the types are not registered yet
// when the threads ask for them.

#include <array>
#include <barrier>
#include <deque>
#include <set>

#include "runtime/object_block.h"
#include "runtime/object_p.h"
#include "runtime/string_p.h"
#include "tests/runtime/values.h"
#include "tests/support/threads.h"

using namespace kavell;
using namespace kavell::test;

namespace {

constexpr int kThreads = 16;

template <typename Body> void onAllThreads(Body body)
{
    onThreads(kThreads, body);
}

}  // namespace

TEST(Threads, ATypeAskedForByAllAtOnceIsRegisteredOnce)
{
    using Identifiers = std::array<CSKavellTypeID, 5>;
    std::array<Identifiers, kThreads> answers;
    onAllThreads([&](int index) {
        answers[static_cast<size_t>(index)] = {_CSKavellAccountGetTypeID(), _CSKavellAccountProviderGetTypeID(),
                                               _CSKavellAccountSettingsGetTypeID(), CSKavellNotificationGetTypeID(),
                                               CSKavellCofferelItemGetTypeID()};
    });
    for (const Identifiers &answer : answers)
        EXPECT_EQ(answer, answers[0]);
    EXPECT_STREQ(CSKavellTypeIDGetName(answers[0][0]), "CSKavellAccount");
    EXPECT_STREQ(CSKavellTypeIDGetName(answers[0][1]), "CSKavellAccountProvider");
    EXPECT_STREQ(CSKavellTypeIDGetName(answers[0][2]), "CSKavellAccountSettings");
}

TEST(Threads, TypesThatAreRegisteredTogetherGetOneNumberEach)
{
    constexpr size_t rounds = 16;
    static constexpr TypeOperations operations{.name = "Registered by many"};
    static std::deque<LazyType> types;  // which stay registered
    for (size_t index = 0; index < 2 * rounds; ++index)
        types.emplace_back(operations);
    std::array<std::array<CSKavellTypeID, rounds>, kThreads> answers;
    std::barrier next(kThreads);
    onAllThreads([&](int index) {
        for (size_t round = 0; round < rounds; ++round) {
            next.arrive_and_wait();
            const size_t asked = 2 * round + static_cast<size_t>(index % 2);  // half of the threads ask for each
            answers[static_cast<size_t>(index)][round] = types[asked].typeID();
        }
    });
    std::set<CSKavellTypeID> numbers(answers[0].begin(), answers[0].end());
    numbers.insert(answers[1].begin(), answers[1].end());
    EXPECT_EQ(numbers.size(), 2 * rounds);
    EXPECT_EQ(*numbers.rbegin() - *numbers.begin(), 2 * rounds - 1);
    for (size_t index = 0; index < kThreads; ++index)
        EXPECT_EQ(answers[index], answers[index % 2]);
    for (const CSKavellTypeID number : numbers)
        EXPECT_STREQ(CSKavellTypeIDGetName(number), "Registered by many");
}

TEST(Threads, TypesKeepTheirNamesWhileOthersAreRegistered)
{
    const CSKavellTypeID known[] = {CSKavellStringGetTypeID(), CSKavellDictionaryGetTypeID(), CSKavellUUIDGetTypeID()};
    onAllThreads([&](int index) {
        if (index % 2 == 0) {
            EXPECT_STREQ(CSKavellTypeIDGetName(CSKavellNotificationObserverGetTypeID()),
                         "CSKavellNotificationObserver");
            EXPECT_STREQ(CSKavellTypeIDGetName(CSKavellCofferelAccessGetTypeID()), "CSKavellCofferelAccess");
        }
        for (int round = 0; round < 2000; ++round) {
            EXPECT_STREQ(CSKavellTypeIDGetName(known[0]), "CSKavellString");
            EXPECT_STREQ(CSKavellTypeIDGetName(known[1]), "CSKavellDictionary");
            EXPECT_STREQ(CSKavellTypeIDGetName(known[2]), "CSKavellUUID");
            EXPECT_EQ(CSKavellTypeIDGetName(0), nullptr);
        }
    });
}

TEST(Threads, RetainAndReleaseFromAllThreadsLoseNoReference)
{
    CountingAllocator allocator;
    String shared = watchedText(allocator, "shared");
    const CSKavellStringRef bare = shared.get();
    onAllThreads([bare](int) {
        for (int round = 0; round < 20000; ++round) {
            CSKavellRetain(bare);
            CSKavellRelease(bare);
        }
    });
    EXPECT_EQ(allocator.deallocated(), 0);
    EXPECT_EQ(toStringView(shared.get()), "shared");
    shared = nullptr;
    EXPECT_EQ(allocator.deallocated(), 1);
}

TEST(Threads, TheLastOfManyReleasesFreesAContainerOnce)
{
    CountingAllocator allocator;
    for (int round = 0; round < 200; ++round) {
        const CSKavellDictionaryRef pairs = dictionary({{"key", watchedText(allocator, "value")}}).leak();
        for (int index = 1; index < kThreads; ++index)
            CSKavellRetain(pairs);
        onAllThreads([pairs](int) {
            EXPECT_TRUE(CSKavellEqual(valueOf(pairs, "key"), text("value").get()));
            CSKavellRelease(pairs);
        });
    }
    EXPECT_EQ(allocator.deallocated(), 200);
}

TEST(Threads, TheObjectsOfOnePieceOfMemoryGoOnAllThreadsAtOnce)
{
    for (int round = 0; round < 200; ++round) {
        std::array<CSKavellStringRef, kThreads> texts{};
        {
            ObjectBlock block(1000);
            for (CSKavellStringRef &each : texts)
                each = makeValidString(block, "text");
        }
        onAllThreads([&](int index) {
            const String own = adopt(texts[static_cast<size_t>(index)]);
            EXPECT_TRUE(same(own.get(), text("text").get()));
        });
    }
}

TEST(Threads, ConstantsAndSharedStringsHashAlikeOnAllThreads)
{
    const String shared = text("com.corvane.account.mail");
    const uint64_t expected = CSKavellHash(text("com.corvane.account.mail").get());
    onAllThreads([&](int) {
        EXPECT_EQ(CSKavellHash(shared.get()), expected);
        EXPECT_EQ(CSKavellHash(kCSKavellAccountProviderMail), expected);
        EXPECT_TRUE(CSKavellEqual(shared.get(), kCSKavellAccountProviderMail));
    });
}

TEST(Threads, OneDictionaryIsReadByAllAtOnce)
{
    const auto pairs = adopt(CSKavellDictionaryCreateMutable());
    for (int index = 0; index < 1000; ++index)
        CSKavellDictionarySetValue(pairs.get(), text(std::to_string(index)).get(), integer(index).get());
    onAllThreads([&](int) {
        for (int index = 0; index < 1000; ++index)
            ASSERT_TRUE(same(valueOf(pairs.get(), std::to_string(index)), integer(index).get()));
    });
}
