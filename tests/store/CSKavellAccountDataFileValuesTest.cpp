// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Which values survive a data file, and what happens to those that cannot stand in one.

#include <clocale>
#include <cmath>
#include <cstdlib>
#include <filesystem>
#include <functional>
#include <limits>

#include "tests/store/store_test.h"

using namespace kavell;
using namespace kavell::test;

namespace {

struct Sample {
    const char *name;
    std::function<Value()> make;
};

void PrintTo(const Sample &sample, std::ostream *stream)
{
    *stream << sample.name;
}

std::string sampleName(const testing::TestParamInfo<Sample> &info)
{
    return info.param.name;
}

Value nestedArray(int depth)
{
    Value value = text("deepest");
    for (int level = 0; level < depth; ++level)
        value = array({value});
    return value;
}

/// The first and the last second that a property list keeps.
constexpr int64_t kFirstSecond = -1169176448, kLastSecond = 3125790847;

const Sample kKept[] = {
    {"EmptyString",
     [] {
         return Value(text(""));
     }},
    {"Text",
     [] {
         return Value(text("mail.example"));
     }},
    {"TextWithMarkup",
     [] {
         return Value(text("<&>\"' ]]> &amp; &#65; <!-- -->"));
     }},
    {"TextWithBlanks",
     [] {
         return Value(text("  two  blanks\tand\na line  "));
     }},
    {"UnicodeText",
     [] {
         return Value(text("caf\xC3\xA9 \xE2\x82\xAC \xF0\x9F\x93\xAC \xE5\x90\x8D"));
     }},
    {"LongText",
     [] {
         return Value(text(std::string(100000, 'x')));
     }},
    {"Zero",
     [] {
         return Value(integer(0));
     }},
    {"NegativeInteger",
     [] {
         return Value(integer(-1));
     }},
    {"SmallestInteger",
     [] {
         return Value(integer(INT64_MIN));
     }},
    {"LargestInteger",
     [] {
         return Value(integer(INT64_MAX));
     }},
    {"UnsignedInTheSignedRange",
     [] {
         return Value(unsignedInteger(INT64_MAX));
     }},
    {"Tenth",
     [] {
         return Value(real(0.1));
     }},
    {"Third",
     [] {
         return Value(real(1.0 / 3.0));
     }},
    {"LargeReal",
     [] {
         return Value(real(1e300));
     }},
    {"SmallReal",
     [] {
         return Value(real(1.5e-300));
     }},
    {"LargestReal",
     [] {
         return Value(real(std::numeric_limits<double>::max()));
     }},
    {"NegativeReal",
     [] {
         return Value(real(-2.5));
     }},
    {"WholeReal",
     [] {
         return Value(real(3.0));
     }},
    {"ZeroReal",
     [] {
         return Value(real(0.0));
     }},
    {"True",
     [] {
         return Value(boolean(true));
     }},
    {"False",
     [] {
         return Value(boolean(false));
     }},
    {"FirstDate",
     [] {
         return Value(date(kFirstSecond));
     }},
    {"DateBefore1970",
     [] {
         return Value(date(-86399));
     }},
    {"DateOf1970",
     [] {
         return Value(date(0));
     }},
    {"LeapDay",
     [] {
         return Value(date(951782400));
     }},
    {"LastDate",
     [] {
         return Value(date(kLastSecond));
     }},
    {"EmptyData",
     [] {
         return Value(bytes(""));
     }},
    {"Data",
     [] {
         return Value(bytes(std::string_view("\x00\xFF\x10z", 4)));
     }},
    {"LongData",
     [] {
         return Value(bytes(std::string(5000, '\xA5')));
     }},
    {"EmptyArray",
     [] {
         return Value(array({}));
     }},
    {"ArrayOfAll",
     [] {
         return Value(
             array({text("a"), integer(1), real(0.5), boolean(false), date(5), bytes("d"), array({}), dictionary({})}));
     }},
    {"ArrayWithDuplicates",
     [] {
         return Value(array({text("a"), text("a")}));
     }},
    {"EmptyDictionary",
     [] {
         return Value(dictionary({}));
     }},
    {"NestedDictionary",
     [] {
         return Value(dictionary({{"<key>&", dictionary({{"", array({dictionary({{"x", integer(1)}})})}})}}));
     }},
    {"FiftyLevels",
     [] {
         return nestedArray(50);
     }},
};

class KeptValue : public StoreTest, public testing::WithParamInterface<Sample> {};

TEST_P(KeptValue, SurvivesTheFileForTheAccountAndForAService)
{
    const Value value = GetParam().make();
    ASSERT_TRUE(value);
    StandardErrorCapture capture;
    const Account account = openAccount("ada");
    setAttribute(account, "value", value);
    _CSKavellAccountSetServiceAttribute(account.get(), kCSKavellAccountServiceMail, text("value").get(), value.get());
    commit(account);
    EXPECT_FALSE(hasPendingChanges(account));
    const Account fresh = openAccount("ada");
    EXPECT_EQ(capture.take(), "");
    EXPECT_TRUE(same(attributes(fresh), dictionary({{"value", value}})));
    EXPECT_TRUE(same(serviceAttributes(fresh, kCSKavellAccountServiceMail), dictionary({{"value", value}})));
}

INSTANTIATE_TEST_SUITE_P(CSKavellAccountDataFile, KeptValue, testing::ValuesIn(kKept), sampleName);

const Sample kRefused[] = {
    {"UUID",
     [] {
         return Value(adopt(CSKavellUUIDCreate()));
     }},
    {"URL",
     [] {
         return Value(adopt(CSKavellURLCreateWithString(text("https://example.org").get())));
     }},
    {"Record",
     [] {
         return Value(adopt(CSKavellAccountSettingsCreate(nullptr)));
     }},
    {"UUIDInAnArray",
     [] {
         return Value(array({Value(array({Value(adopt(CSKavellUUIDCreate()))}))}));
     }},
    {"TextWithAControlCharacter",
     [] {
         return Value(text("a\x01z"));
     }},
    {"TextWithANul",
     [] {
         return Value(text(std::string_view("a\0z", 3)));
     }},
    {"TextWithANonCharacter",
     [] {
         return Value(text("\xEF\xBF\xBF"));
     }},
    {"KeyWithAControlCharacter",
     [] {
         return Value(dictionary({{"a\x1F", integer(1)}}));
     }},
    {"KeyThatIsNoString",
     [] {
         const auto pairs = adopt(CSKavellDictionaryCreateMutable());
         CSKavellDictionarySetValue(pairs.get(), integer(1).get(), text("one").get());
         return Value(pairs);
     }},
    {"UnsignedAboveTheSignedRange",
     [] {
         return Value(unsignedInteger(uint64_t{INT64_MAX} + 1));
     }},
    {"LargestUnsigned",
     [] {
         return Value(unsignedInteger(UINT64_MAX));
     }},
    {"DateTooEarly",
     [] {
         return Value(date(kFirstSecond - 1));
     }},
    {"DateTooLate",
     [] {
         return Value(date(kLastSecond + 1));
     }},
    {"NotANumber",
     [] {
         return Value(real(std::nan("")));
     }},
    {"Infinity",
     [] {
         return Value(real(std::numeric_limits<double>::infinity()));
     }},
    {"AThousandLevels",
     [] {
         return nestedArray(1000);
     }},
};

class RefusedValue : public StoreTest, public testing::WithParamInterface<Sample> {};

TEST_P(RefusedValue, FailsTheSaveAndLeavesTheFileAsItWas)
{
    writeFile(fileOf("ada"), accountFile("<key>a</key><integer>1</integer>"));
    const std::string before = readFile(fileOf("ada"));
    const Account account = openAccount("ada");
    const Value value = GetParam().make();
    ASSERT_TRUE(value);
    setAttribute(account, "value", value);
    EXPECT_TRUE(same(attribute(account, "value"), value));
    Notifications notifications;
    StandardErrorCapture capture;
    commit(account);
    EXPECT_EQ(capture.take(), kSerialiseMessage);
    EXPECT_TRUE(hasPendingChanges(account));
    EXPECT_EQ(readFile(fileOf("ada")), before);
    EXPECT_EQ(notifications.takeLoginNames(), (Names{"ada"}));
}

TEST_P(RefusedValue, LeavesNoFileOfANewAccount)
{
    const Account account = openAccount("ada");
    _CSKavellAccountSetServiceAttribute(account.get(), kCSKavellAccountServiceMail, text("value").get(),
                                        GetParam().make().get());
    StandardErrorCapture capture;
    commit(account);
    EXPECT_EQ(capture.take(), kSerialiseMessage);
    EXPECT_FALSE(std::filesystem::exists(fileOf("ada")));
}

INSTANTIATE_TEST_SUITE_P(CSKavellAccountDataFile, RefusedValue, testing::ValuesIn(kRefused), sampleName);

using SavedValues = StoreTest;

TEST_F(SavedValues, AContainerThatHoldsItselfFailsTheSave)
{
    const auto loop = adopt(CSKavellArrayCreateMutable());
    CSKavellArrayAppendValue(loop.get(), loop.get());
    const auto ring = adopt(CSKavellDictionaryCreateMutable());
    CSKavellDictionarySetValue(ring.get(), text("self").get(), array({ring}).get());
    for (const Value &value : {Value(loop), Value(ring)}) {
        const Account account = openAccount("ada");
        setAttribute(account, "value", value);
        StandardErrorCapture capture;
        commit(account);
        EXPECT_EQ(capture.take(), kSerialiseMessage);
        EXPECT_FALSE(std::filesystem::exists(fileOf("ada")));
    }
    CSKavellArrayRemoveValueAtIndex(loop.get(), 0);
    CSKavellDictionaryRemoveValue(ring.get(), text("self").get());
}

TEST_F(SavedValues, AFailedSaveHasFoldedItsChangesInSoAReadOfTheFileDropsThem)
{
    writeFile(fileOf("ada"), accountFile("<key>a</key><integer>1</integer>"));
    const Account account = openAccount("ada");
    setAttribute(account, "bad", Value(adopt(CSKavellUUIDCreate())));
    setAttribute(account, "good", integer(2));
    {
        StandardErrorCapture capture;
        commit(account);
        EXPECT_EQ(capture.take(), kSerialiseMessage);
    }
    EXPECT_TRUE(same(attribute(account, "good"), integer(2)));
    StandardErrorCapture capture;
    commit(account);
    EXPECT_EQ(capture.take(), "");
    EXPECT_FALSE(hasPendingChanges(account));
    EXPECT_TRUE(same(attributes(account), dictionary({{"a", integer(1)}})));
    EXPECT_TRUE(same(attributes(openAccount("ada")), dictionary({{"a", integer(1)}})));
}

TEST_F(SavedValues, AFailedSaveOverTheRecordsOwnFileKeepsItsChangesFolded)
{
    const Account account = openAccount("ada");
    commit(account);
    setAttribute(account, "bad", Value(adopt(CSKavellUUIDCreate())));
    setAttribute(account, "good", integer(2));
    StandardErrorCapture capture;
    commit(account);
    commit(account);
    EXPECT_EQ(capture.take(), std::string(kSerialiseMessage) + std::string(kSerialiseMessage));
    setAttribute(account, "bad", nullptr);
    commit(account);
    EXPECT_EQ(capture.take(), "");
    EXPECT_TRUE(same(attributes(openAccount("ada")), dictionary({{"good", integer(2)}})));
}

TEST_F(SavedValues, ADecimalCommaOfTheUsersLocaleChangesNoNumber)
{
    // Made for this test, so that it does not depend on what is installed in the system's own place.
    const std::string locales = std::string(std::getenv("TMPDIR")) + "/locales";
    std::filesystem::create_directories(locales);
    const ProgramResult made = runProgram({"localedef", "-i", "de_DE", "-f", "UTF-8", locales + "/de_DE.UTF-8"});
    setenv("LOCPATH", locales.c_str(), 1);
    ASSERT_NE(std::setlocale(LC_ALL, "de_DE.UTF-8"), nullptr) << made.error;
    ASSERT_STREQ(std::localeconv()->decimal_point, ",");
    const Account account = openAccount("ada");
    setAttribute(account, "value", real(1.5));
    commit(account);
    EXPECT_NE(readFile(fileOf("ada")).find("<real>1.5"), std::string::npos);
    EXPECT_TRUE(same(attribute(openAccount("ada"), "value"), real(1.5)));
    std::setlocale(LC_ALL, "C");
}

}  // namespace
