// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The quick reader answers what the general one answers, or nothing: for what writers write, and for thousands of texts
// that differ from it in one place.

#include "platform/plain_property_list.h"

#include <string>
#include <thread>

#include <gtest/gtest.h>

#include <kavellaccounts/KavellStore.h>

#include "platform/key_pool.h"
#include "platform/property_list.h"

using namespace kavell;

namespace {

Ref<CSKavellStringRef> text(std::string_view characters)
{
    return adopt(CSKavellStringCreateWithBytes(characters.data(), characters.size()));
}

void set(const Ref<CSKavellMutableDictionaryRef> &dictionary, const char *key, CSKavellTypeRef value)
{
    CSKavellDictionarySetValue(dictionary.get(), text(key).get(), value);
}

/// A dictionary with all that is plain.
Ref<CSKavellMutableDictionaryRef> sample()
{
    const auto inner = adopt(CSKavellDictionaryCreateMutable());
    set(inner, "<&>\"'", text("a < b && c > d \"e\" 'f'\n\tline").get());
    set(inner, "caf\xC3\xA9", text("\xE2\x82\xAC \xF0\x9F\x93\xAC").get());
    set(inner, "empty", text("").get());
    const auto list = adopt(CSKavellArrayCreateMutable());
    CSKavellArrayAppendValue(list.get(), inner.get());
    CSKavellArrayAppendValue(list.get(), adopt(CSKavellArrayCreateMutable()).get());
    CSKavellArrayAppendValue(list.get(), adopt(CSKavellDictionaryCreateMutable()).get());
    const auto result = adopt(CSKavellDictionaryCreateMutable());
    set(result, "list", list.get());
    set(result, "no", CSKavellBooleanGetShared(false));
    set(result, "yes", CSKavellBooleanGetShared(true));
    for (const int64_t number : {int64_t{0}, int64_t{-7}, int64_t{993}, INT64_MIN, INT64_MAX})
        set(result, std::to_string(number).c_str(), adopt(CSKavellNumberCreateWithInt64(number)).get());
    for (const char *bytes :
         {"", "a", "ab", "abc", "\xFF\xFE twelve bytes and more than one line of base64 takes to hold"})
        set(result, bytes[0] == '\xFF' ? "long" : bytes, adopt(CSKavellDataCreate(bytes, strlen(bytes))).get());
    return result;
}

std::string written(CSKavellDictionaryRef dictionary)
{
    std::string xml;
    EXPECT_TRUE(writeAnyPropertyList(dictionary, xml));
    return xml;
}

/// What the quick writer writes; "(not plain)" when it does not.
std::string writtenPlain(CSKavellDictionaryRef dictionary)
{
    static const std::string frame = written(adopt(CSKavellDictionaryCreateMutable()).get());
    std::string xml = "(not plain)";
    return writePlainPropertyList(dictionary, frame, xml) ? xml : "(not plain)";
}

/// The sample with its innermost text and nothing else that is long, so that all its neighbours can be tried.
std::string shortDocument()
{
    const auto inner = adopt(CSKavellDictionaryCreateMutable());
    set(inner, "k&", text("v<\xC3\xA9").get());
    set(inner, "n", adopt(CSKavellNumberCreateWithInt64(-10)).get());
    set(inner, "d", adopt(CSKavellDataCreate("wxyz", 4)).get());
    const auto list = adopt(CSKavellArrayCreateMutable());
    CSKavellArrayAppendValue(list.get(), inner.get());
    CSKavellArrayAppendValue(list.get(), CSKavellBooleanGetShared(true));
    const auto result = adopt(CSKavellDictionaryCreateMutable());
    set(result, "l", list.get());
    set(result, "e", adopt(CSKavellDictionaryCreateMutable()).get());
    return written(result.get());
}

/// Whether the quick reader answered, which must then be the general reader's answer.
bool isPlainAndRight(const std::string &xml)
{
    const auto plain = parsePlainPropertyList(xml);
    if (plain) {
        const auto general = parseAnyPropertyList(xml);
        EXPECT_TRUE(general && CSKavellEqual(plain.get(), general.get())) << xml;
    }
    return static_cast<bool>(plain);
}

const std::string kHead = shortDocument().substr(0, shortDocument().find("<dict>"));

std::string document(const std::string &value)
{
    return kHead + "<dict>\n\t<key>k</key>\n\t" + value + "\n</dict>\n</plist>\n";
}

TEST(PlainPropertyList, ReadsWhatTheWriterWrites)
{
    const auto original = sample();
    const auto read = parsePlainPropertyList(written(original.get()));
    ASSERT_TRUE(read);
    EXPECT_TRUE(CSKavellEqual(read.get(), original.get()));
    EXPECT_TRUE(isPlainAndRight(written(original.get())));
}

TEST(PlainPropertyList, GivesContainersThatCanBeChanged)
{
    const auto read = parsePlainPropertyList(document("<dict><key>a</key><array></array></dict>"));
    ASSERT_TRUE(read);
    const auto *inner = static_cast<CSKavellDictionaryRef>(CSKavellDictionaryGetValue(read.get(), text("k").get()));
    const auto *list = static_cast<CSKavellArrayRef>(CSKavellDictionaryGetValue(inner, text("a").get()));
    CSKavellArrayAppendValue(const_cast<CSKavellMutableArrayRef>(list), CSKavellBooleanGetShared(true));
    CSKavellDictionarySetValue(const_cast<CSKavellMutableDictionaryRef>(inner), text("b").get(), text("c").get());
    EXPECT_EQ(CSKavellArrayGetCount(list), 1u);
    EXPECT_EQ(CSKavellDictionaryGetCount(inner), 2u);
}

TEST(PlainPropertyList, LeavesWhatIsNotPlainToTheGeneralReader)
{
    const char *values[] = {
        "<real>1.5</real>",
        "<date>2001-01-01T00:00:00Z</date>",
        "<string>&#65;</string>",
        "<string>a<!-- comment --></string>",
        "<string><![CDATA[a]]></string>",
        "<string>a\rb</string>",
        "<string/>",
        "<true></true>",
        "<integer>+1</integer>",
        "<integer>007</integer>",
        "<integer>-0</integer>",
        "<integer> 1 </integer>",
        "<integer>0x1F</integer>",
        "<integer>9223372036854775808</integer>",
        "<integer>12abc</integer>",
        "<data>YQ=</data>",
        "<data>YR==</data>",
        "<data>YQ</data>",
        "<data>YQ==YQ==</data>",
        "<dict><key>a</key><true/><key>a</key><false/></dict>",
        "<dict><key>a</key></dict>",
        "<dict><string>a</string></dict>",
        "<string>\xC3</string>",
        "<string>a\x01</string>",
        "<string>a\xEF\xBF\xBE</string>",
        "<string>a\xEF\xBF\xBF</string>",
        "<unknown/>",
        "<string>a</string",
    };
    for (const char *value : values)
        EXPECT_FALSE(isPlainAndRight(document(value))) << value;
}

// Equal keys are one string, unless another key has pushed the first one out of the pool, or the pool is in use.
TEST(PlainPropertyList, LeavesAKeyThatStandsTwiceToTheGeneralReaderWhateverStandsBetween)
{
    for (int between = 0; between < 3000; ++between) {
        const std::string key = std::to_string(between);
        ASSERT_FALSE(parsePlainPropertyList(
            document("<dict><key>a</key><true/><key>" + key + "</key><true/>" + "<key>a</key><false/></dict>")))
            << key;
    }
}

TEST(PlainPropertyList, LeavesAKeyThatStandsTwiceToTheGeneralReaderWhileAnotherThreadReads)
{
    const KeyMaker another;
    std::jthread([] {
        EXPECT_TRUE(parsePlainPropertyList(document("<dict><key>a</key><true/><key>b</key><false/></dict>")));
        EXPECT_FALSE(parsePlainPropertyList(document("<dict><key>a</key><true/><key>a</key><false/></dict>")));
    }).join();
}

TEST(PlainPropertyList, ReadsTheNeighboursOfCharactersThatNoDocumentMayHave)
{
    EXPECT_TRUE(isPlainAndRight(document("<string>\xEF\xBF\xBD \xEF\xBE\xBF \xF0\x90\x80\x80</string>")));
}

TEST(PlainPropertyList, LeavesOtherHeadsAndTailsToTheGeneralReader)
{
    const std::string plain = document("<true/>");
    ASSERT_TRUE(isPlainAndRight(plain));
    EXPECT_FALSE(isPlainAndRight(""));
    EXPECT_FALSE(isPlainAndRight(plain.substr(plain.find("<plist"))));
    EXPECT_FALSE(isPlainAndRight(" " + plain));
    EXPECT_FALSE(isPlainAndRight(plain + "<true/>"));
    EXPECT_FALSE(isPlainAndRight(kHead + "<array/>\n</plist>\n"));
    EXPECT_FALSE(isPlainAndRight(kHead + "<dict/>\n</plist>\n"));
}

TEST(PlainPropertyList, LeavesDeepNestingToTheGeneralReader)
{
    std::string opened, closed;
    for (int level = 0; level < 40; ++level) {
        opened += "<array>";
        closed += "</array>";
    }
    EXPECT_FALSE(isPlainAndRight(document(opened + closed)));
    EXPECT_TRUE(parsePropertyList(document(opened + closed)));
}

TEST(PlainPropertyList, IsRightAboutEveryTextThatEndsEarly)
{
    const std::string whole = shortDocument();
    for (size_t length = 0; length < whole.size(); ++length)
        isPlainAndRight(whole.substr(0, length));
}

TEST(PlainPropertyList, IsRightAboutEveryTextWithOneOtherByte)
{
    const std::string whole = shortDocument();
    ASSERT_TRUE(isPlainAndRight(whole));
    size_t plainCount = 0;
    for (size_t place = 0; place < whole.size(); ++place) {
        for (const char byte : std::string("\0\t\n\r \"&'+-/019;<=>AZk\x7F\x80\xC3\xFF", 25)) {
            std::string other = whole;
            other[place] = byte;
            plainCount += isPlainAndRight(other);
            plainCount += isPlainAndRight(whole.substr(0, place) + byte + whole.substr(place));
        }
        isPlainAndRight(whole.substr(0, place) + whole.substr(place + 1));
    }
    // Were none of them plain, nothing would have been compared.
    EXPECT_GT(plainCount, 1000u);
}

TEST(PlainPropertyList, IsRightAboutEveryTextWithAPieceMoved)
{
    const std::string whole = shortDocument();
    const size_t first = kHead.size();
    for (size_t from = first; from < whole.size(); ++from) {
        for (const size_t length : {1, 4, 7, 11}) {
            const std::string piece = whole.substr(from, length);
            for (size_t to = first; to < whole.size(); to += 5)
                isPlainAndRight(whole.substr(0, to) + piece + whole.substr(to));
        }
    }
}

/// A dictionary with the value as its only one.
Ref<CSKavellMutableDictionaryRef> holding(CSKavellTypeRef value)
{
    const auto result = adopt(CSKavellDictionaryCreateMutable());
    set(result, "k", value);
    return result;
}

TEST(PlainPropertyList, IsWrittenAsTheGeneralWriterWritesIt)
{
    const auto inner = adopt(CSKavellDictionaryCreateMutable());
    for (const char *each :
         {"", "a", "<&>\"'", "]]>", " two  blanks ", "tab\tline\nreturn\r", "caf\xC3\xA9", "&amp;"}) {
        set(inner, each, text(each).get());
        EXPECT_EQ(writtenPlain(inner.get()), written(inner.get()));
    }
    const auto list = adopt(CSKavellArrayCreateMutable());
    const auto all = holding(list.get());
    set(all, "inner", inner.get());
    for (const int64_t number : {int64_t{0}, int64_t{-7}, int64_t{993}, INT64_MIN, INT64_MAX})
        CSKavellArrayAppendValue(list.get(), adopt(CSKavellNumberCreateWithInt64(number)).get());
    CSKavellArrayAppendValue(list.get(), CSKavellBooleanGetShared(true));
    CSKavellArrayAppendValue(list.get(), CSKavellBooleanGetShared(false));
    CSKavellArrayAppendValue(list.get(), adopt(CSKavellArrayCreateMutable()).get());
    CSKavellArrayAppendValue(list.get(), adopt(CSKavellDictionaryCreateMutable()).get());
    CSKavellArrayAppendValue(list.get(), inner.get());
    EXPECT_EQ(writtenPlain(all.get()), written(all.get()));
}

TEST(PlainPropertyList, LeavesWhatIsNotPlainToTheGeneralWriter)
{
    const auto circle = adopt(CSKavellDictionaryCreateMutable());
    set(circle, "self", circle.get());
    EXPECT_EQ(writtenPlain(circle.get()), "(not plain)");
    CSKavellDictionaryRemoveValue(circle.get(), text("self").get());
    EXPECT_EQ(writtenPlain(holding(adopt(CSKavellNumberCreateWithDouble(1.5)).get()).get()), "(not plain)");
    EXPECT_EQ(writtenPlain(holding(adopt(CSKavellNumberCreateWithUInt64(UINT64_MAX)).get()).get()), "(not plain)");
    EXPECT_EQ(writtenPlain(holding(adopt(CSKavellDateCreate(0)).get()).get()), "(not plain)");
    EXPECT_EQ(writtenPlain(holding(adopt(CSKavellDataCreate("a", 1)).get()).get()), "(not plain)");
    EXPECT_EQ(writtenPlain(holding(adopt(CSKavellUUIDCreate()).get()).get()), "(not plain)");
    EXPECT_EQ(writtenPlain(holding(text("a\x01").get()).get()), "(not plain)");
    EXPECT_EQ(writtenPlain(holding(text("\xEF\xBF\xBF").get()).get()), "(not plain)");
    const auto numbered = adopt(CSKavellDictionaryCreateMutable());
    CSKavellDictionarySetValue(numbered.get(), CSKavellBooleanGetShared(true), text("a").get());
    EXPECT_EQ(writtenPlain(numbered.get()), "(not plain)");
}

}  // namespace
