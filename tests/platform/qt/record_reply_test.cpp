// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/qt/record_reply.h"

#include <gtest/gtest.h>

#include "platform/qt/record_query.h"

using namespace std::string_literals;

namespace {

std::string number16(unsigned value)
{
    return {static_cast<char>(value >> 8), static_cast<char>(value)};
}

/// Identifier, flags, one question and so many answers; then the question "example" (offset 12), type and class.
std::string replyStart(unsigned answers)
{
    return number16(7) + number16(0x8180) + number16(1) + number16(answers) + number16(0) + number16(0) +
           "\7example\0"s + number16(15) + number16(1);
}

constexpr size_t kFirstRecordData = 12 + 13 + 2 + 10;  ///< offset of the first answer's data

/// An answer of the question's name with these data, which may announce another length than they have.
std::string record(const std::string &data, unsigned type = 15, int announced = -1, unsigned recordClass = 1)
{
    return number16(0xC00C) + number16(type) + number16(recordClass) + number16(1) + number16(2) +
           number16(announced < 0 ? static_cast<unsigned>(data.size()) : static_cast<unsigned>(announced)) + data;
}

std::vector<kavell::ReplyRecord> read(const std::string &reply)
{
    return kavell::recordsOfReply(reply, kavell::kRecordTypeMX, kavell::kRecordClassIN);
}

/// The data of the only record that such an exchanger's name leaves; nothing when it leaves none.
std::string onlyData(const std::string &exchanger)
{
    const auto records = read(replyStart(1) + record(number16(10) + exchanger));
    return records.size() == 1 ? records.front().data : std::string();
}

std::string label(size_t length)
{
    return static_cast<char>(length) + std::string(length, 'a');
}

std::string pointer(size_t offset)
{
    return number16(0xC000U + static_cast<unsigned>(offset));
}

TEST(RecordReplyTest, RecordsComeInTheirOrderWithTheirTimeToLive)
{
    const auto records = read(replyStart(2) + record(number16(20) + "\1b\0"s) + record(number16(10) + "\1a\0"s));
    ASSERT_EQ(records.size(), 2U);
    EXPECT_EQ(records[0].data, number16(20) + "\1b\0"s);
    EXPECT_EQ(records[1].data, number16(10) + "\1a\0"s);
    EXPECT_EQ(records[0].timeToLive, 65538U);
}

TEST(RecordReplyTest, OtherTypesAndClassesArePassedOver)
{
    const auto records = read(replyStart(3) + record("\1x\0"s, 5) + record(number16(1) + "\1b\0"s, 15, -1, 3) +
                              record(number16(1) + "\1a\0"s));
    ASSERT_EQ(records.size(), 1U);
    EXPECT_EQ(records[0].data, number16(1) + "\1a\0"s);
}

TEST(RecordReplyTest, DataOfOtherTypesAreTakenAsTheyAre)
{
    const auto records = kavell::recordsOfReply(replyStart(1) + record("\4text"s, 16), 16, 1);
    ASSERT_EQ(records.size(), 1U);
    EXPECT_EQ(records[0].data, "\4text"s);
}

TEST(RecordReplyTest, APointerIsFollowed)
{
    EXPECT_EQ(onlyData("\2mx"s + pointer(12)), number16(10) + "\2mx\7example\0"s);
    EXPECT_EQ(onlyData(pointer(12)), number16(10) + "\7example\0"s);
}

TEST(RecordReplyTest, PointersThatLoopLeaveTheRecordOut)
{
    const size_t name = kFirstRecordData + 2;
    EXPECT_EQ(onlyData(pointer(name)), "");
    EXPECT_EQ(onlyData("\1a"s + pointer(name)), "");
}

TEST(RecordReplyTest, TwoPointersAtEachOtherLeaveTheirRecordsOut)
{
    const std::string first = record(number16(10) + pointer(kFirstRecordData + 18));
    const std::string second = record(number16(10) + pointer(kFirstRecordData + 2));
    EXPECT_TRUE(read(replyStart(2) + first + second).empty());
}

TEST(RecordReplyTest, APointerForwardsWithinTheReplyIsFollowedOnlyToAName)
{
    const size_t name = kFirstRecordData + 2;
    EXPECT_EQ(onlyData(pointer(name + 2)), "");  // to the end of the reply
    // The next record's name, which itself points at the question.
    const auto records = read(replyStart(2) + record(number16(10) + pointer(name + 2)) + record("\1x\0"s, 5));
    ASSERT_EQ(records.size(), 1U);
    EXPECT_EQ(records[0].data, number16(10) + "\7example\0"s);
}

TEST(RecordReplyTest, APointerPastTheEndLeavesTheRecordOut)
{
    EXPECT_EQ(onlyData(pointer(0x3FFF)), "");
    EXPECT_EQ(onlyData("\1a"s + pointer(0x3FFF)), "");
}

TEST(RecordReplyTest, HalfAPointerLeavesTheRecordOut)
{
    EXPECT_EQ(onlyData("\xC0"s), "");
    EXPECT_EQ(onlyData("\1a\xC0"s), "");
}

TEST(RecordReplyTest, ALabelOf63BytesIsReadAndReservedLengthsAreNot)
{
    EXPECT_EQ(onlyData(label(63) + '\0').size(), 2U + 65U);
    EXPECT_EQ(onlyData(label(64) + '\0'), "");
    EXPECT_EQ(onlyData(label(128) + '\0'), "");
}

TEST(RecordReplyTest, ANameTakes255BytesAndNoMore)
{
    const std::string three = label(63) + label(63) + label(63);
    EXPECT_EQ(onlyData(three + label(61) + '\0').size(), 2U + 255U);
    EXPECT_EQ(onlyData(three + label(62) + '\0'), "");
    EXPECT_EQ(onlyData(three + label(60) + pointer(12)), "") << "expansion counts, too";
}

TEST(RecordReplyTest, ALabelReachingPastTheRecordLeavesItOut)
{
    EXPECT_EQ(onlyData("\5ab"s), "");
    EXPECT_EQ(onlyData("\2ab"s), "") << "the root is missing";
}

TEST(RecordReplyTest, BytesAfterTheNameLeaveTheRecordOut)
{
    EXPECT_EQ(onlyData("\1a\0\0"s), "");
}

TEST(RecordReplyTest, ARecordWithoutANameIsLeftOut)
{
    for (const std::string &data : {""s, "\0"s, "\0\12"s})
        EXPECT_TRUE(read(replyStart(1) + record(data)).empty()) << data.size();
}

TEST(RecordReplyTest, ALengthBeyondTheReplyMakesItADamagedOne)
{
    const std::string good = record(number16(10) + "\1a\0"s);
    EXPECT_TRUE(read(replyStart(2) + good + record(number16(10) + "\1b\0"s, 15, 6)).empty());
    EXPECT_TRUE(read(replyStart(2) + good + record(number16(10) + "\1b\0"s, 15, 0xFFFF)).empty());
}

TEST(RecordReplyTest, ALengthThatIsTooShortMakesItADamagedOne)
{
    EXPECT_TRUE(read(replyStart(1) + record(number16(10) + "\5abcde\0"s, 15, 4)).empty());
}

TEST(RecordReplyTest, MoreRecordsAnnouncedThanThereAreMakeItADamagedOne)
{
    EXPECT_TRUE(read(replyStart(2) + record(number16(10) + "\1a\0"s)).empty());
    EXPECT_TRUE(read(replyStart(0xFFFF) + record(number16(10) + "\1a\0"s)).empty());
}

TEST(RecordReplyTest, NoReplyHoldsWhatAWholeOneHoldsWhenItIsCutShort)
{
    const std::string whole = replyStart(1) + record(number16(10) + "\2mx"s + pointer(12));
    ASSERT_EQ(read(whole).size(), 1U);
    for (size_t length = 0; length < whole.size(); ++length)
        EXPECT_TRUE(read(whole.substr(0, length)).empty()) << length;
}

TEST(RecordReplyTest, AReplyOfMoreThan65535BytesIsNone)
{
    const std::string reply = replyStart(1) + record(number16(10) + "\1a\0"s);
    EXPECT_TRUE(read(reply + std::string(65536 - reply.size(), '\0')).empty());
}

}  // namespace
