// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "plugins/KADNSServiceNames_p.h"

#include <algorithm>
#include <optional>
#include <string>

#include <gtest/gtest.h>

#include "plugins/KADNSService_p.h"

using namespace std::string_literals;

namespace {

/// The text of a name whose remaining bytes are zero.
std::optional<std::string> textOf(const std::string &wire, char escape = '\\')
{
    KADNSServiceWireName name{};
    std::copy_n(wire.begin(), std::min(wire.size(), name.size()), name.begin());
    KADNSServiceNameText text;
    text.fill('#');
    const char *end = _KADNSServiceConvertDomainNameToCString_withescape(name, text, escape);
    if (!end)
        return std::nullopt;
    EXPECT_EQ(*end, '\0');
    return std::string(text.data(), static_cast<size_t>(end - text.data()));
}

std::string label(size_t length, char byte = 'a')
{
    return static_cast<char>(length) + std::string(length, byte);
}

const std::string kThreeLabels = label(63) + label(63) + label(63);  ///< 192 bytes
const std::string kPreference = "\0\12"s;

TEST(KADNSServiceNamesTest, EachLabelIsFollowedByADot)
{
    EXPECT_EQ(textOf("\2mx\7example\3org\0"s), "mx.example.org.");
}

TEST(KADNSServiceNamesTest, TheRootIsADot)
{
    EXPECT_EQ(textOf("\0"s), ".");
}

TEST(KADNSServiceNamesTest, ADotAndTheEscapeCharacterAreEscaped)
{
    EXPECT_EQ(textOf("\5a.b\\c\0"s), "a\\.b\\\\c.");
}

TEST(KADNSServiceNamesTest, BytesBelow33AreThreeDigits)
{
    EXPECT_EQ(textOf("\4\0\11\37 \0"s), "\\000\\009\\031\\032.");
}

TEST(KADNSServiceNamesTest, AllOtherBytesStayAsTheyAre)
{
    EXPECT_EQ(textOf("\4!\177\200\377\0"s), "!\177\200\377.");
}

TEST(KADNSServiceNamesTest, WithoutAnEscapeCharacterNothingIsEscaped)
{
    EXPECT_EQ(textOf("\4a.\\\11\0"s, 0), "a.\\\11.");
}

TEST(KADNSServiceNamesTest, AnotherEscapeCharacterTakesTheBackslashesPlace)
{
    EXPECT_EQ(textOf("\4%.\\\11\0"s, '%'), "%%%.\\%009.");
}

TEST(KADNSServiceNamesTest, ALabelOf63BytesConvertsAndOneOf64DoesNot)
{
    EXPECT_EQ(textOf(label(63)), std::string(63, 'a') + ".");
    EXPECT_EQ(textOf(label(64)), std::nullopt);
    EXPECT_EQ(textOf(label(255)), std::nullopt);
}

TEST(KADNSServiceNamesTest, ACompressionPointerIsNoLabel)
{
    EXPECT_EQ(textOf("\2mx\300\14"s), std::nullopt);
}

TEST(KADNSServiceNamesTest, ANameTakes256BytesWithItsRootAndNoMore)
{
    const std::string longest = std::string(63, 'a') + '.';
    EXPECT_EQ(textOf(kThreeLabels + label(62)), longest + longest + longest + std::string(62, 'a') + '.');
    EXPECT_EQ(textOf(kThreeLabels + label(63)), std::nullopt);
}

TEST(KADNSServiceNamesTest, ATextThatDoesNotFitIsNone)
{
    // 63 controls are 252 characters and a dot: one character is left for the NUL, and one for nothing else.
    const std::string fits = label(63, '\1');
    EXPECT_EQ(textOf(fits).value_or("").size(), 253U);
    EXPECT_EQ(textOf(fits + label(1)).value_or("").size(), 255U);
    EXPECT_EQ(textOf(fits + label(2)), std::nullopt);
    EXPECT_EQ(textOf(fits + label(1, '.')), std::nullopt);
    EXPECT_EQ(textOf(fits + label(1, '\1')), std::nullopt);
}

TEST(KADNSServiceNamesTest, AnExchangerIsTheNameAfterThePreferenceInLowerCase)
{
    EXPECT_EQ(KADNSServiceHostOfMailExchanger(kPreference + "\2MX\3Org\0"s), "mx.org.");
    EXPECT_EQ(KADNSServiceHostOfMailExchanger("\377\377\2mx\0"s), "mx.");
}

TEST(KADNSServiceNamesTest, NonASCIINamesAreLowerCasedToo)
{
    EXPECT_EQ(KADNSServiceHostOfMailExchanger(kPreference + "\2\303\204\0"s), QStringLiteral(u"\u00E4."));
}

TEST(KADNSServiceNamesTest, NoDataAreNoExchanger)
{
    EXPECT_TRUE(KADNSServiceHostOfMailExchanger({}).isNull());
}

TEST(KADNSServiceNamesTest, ARecordThatEndsWithItsPreferenceHasTheRootsName)
{
    EXPECT_EQ(KADNSServiceHostOfMailExchanger(kPreference), ".");
}

TEST(KADNSServiceNamesTest, ALengthThatWrapsReadsNoByteThatIsNotThere)
{
    // One byte less two is 65535 in 16 bits. What follows the record in memory must not be taken for its name.
    const std::string memory = "\1\2mx\0"s;
    EXPECT_EQ(KADNSServiceHostOfMailExchanger(std::string_view(memory).substr(0, 1)), ".");
}

TEST(KADNSServiceNamesTest, ANameThatEndsEarlyIsFilledWithZeros)
{
    EXPECT_EQ(KADNSServiceHostOfMailExchanger(kPreference + "\2mx"s), "mx.");
    EXPECT_EQ(KADNSServiceHostOfMailExchanger(kPreference + "\3mx"s), "mx\\000.");
}

TEST(KADNSServiceNamesTest, OfALongRecordThe256BytesAfterThePreferenceAreLookedAt)
{
    const std::string name = kThreeLabels + label(62) + '\0';
    ASSERT_EQ(name.size(), 256U);
    EXPECT_EQ(KADNSServiceHostOfMailExchanger(kPreference + name + std::string(1000, 'b')).size(), 255);
    EXPECT_TRUE(KADNSServiceHostOfMailExchanger(kPreference + kThreeLabels + label(63) + label(3) + '\0').isNull());
}

TEST(KADNSServiceNamesTest, ANameCutInTheMiddleOfACharacterIsNone)
{
    // The 256th byte is the first half of a character of two.
    const std::string cut = kPreference + kThreeLabels + '\77' + std::string(62, 'a') + "\303\204\0"s;
    EXPECT_TRUE(KADNSServiceHostOfMailExchanger(cut).isNull());
}

TEST(KADNSServiceNamesTest, ANameThatIsNoUTF8IsNone)
{
    EXPECT_TRUE(KADNSServiceHostOfMailExchanger(kPreference + "\2x\377\0"s).isNull());
    EXPECT_TRUE(KADNSServiceHostOfMailExchanger(kPreference + "\2x\303\0"s).isNull());
    EXPECT_TRUE(KADNSServiceHostOfMailExchanger(kPreference + "\1\303\1\204\0"s).isNull()) << "halves in two labels";
}

}  // namespace
