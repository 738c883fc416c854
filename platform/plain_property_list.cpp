// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/plain_property_list.h"

#include <algorithm>
#include <charconv>
#include <cstring>
#include <string>
#include <utility>
#include <vector>

#include <kavellaccounts/CSKavellArray.h>
#include <kavellaccounts/CSKavellBoolean.h>
#include <kavellaccounts/CSKavellData.h>

#include "platform/data_file.h"
#include "platform/key_pool.h"
#include "platform/property_list_guard.h"
#include "runtime/dictionary_p.h"
#include "runtime/number_p.h"
#include "runtime/object_block.h"
#include "runtime/string_p.h"
#include "runtime/utf8.h"

namespace kavell {

namespace {

/// What texts may hold beyond the characters of ASCII that stand for themselves.
struct Contents {
    bool areUnfit = false;  ///< what no text may hold (isXMLText); or a carriage return, which is not plain
    bool haveReferences = false;
    bool haveOtherThanASCII = false;
};

Contents contentsOf(std::string_view xml) noexcept
{
    // Without an early end, and in bytes alone, the compiler looks at many bytes at a time.
    uint8_t unfit = 0, references = 0, all = 0;
    for (const char character : xml) {
        const auto byte = static_cast<uint8_t>(character);
        unfit |= static_cast<uint8_t>((byte < 0x20) & (byte != '\t') & (byte != '\n'));
        references |= static_cast<uint8_t>(byte == '&');
        all |= byte;
    }
    const bool haveOtherThanASCII = (all & 0x80) != 0;
    return {unfit != 0 || (haveOtherThanASCII && !isXMLText(xml)), references != 0, haveOtherThanASCII};
}

constexpr bool isIdentifierCharacter(char character) noexcept
{
    return ((character >= '-') & (character <= ':')) | ((character >= 'A') & (character <= 'Z')) |
           ((character >= 'a') & (character <= 'z')) | (character == ' ');
}

/// How much of a document's length its objects usually take, and up to where that is likely: a longer one has long texts
/// or data in it, which need memory of their own.
constexpr size_t kUsualSixteenths = 11, kLargestBlock = 8 * 1024;

/// Of how many keys each is compared with each.
constexpr size_t kMostCompared = 16;

constexpr size_t kKeyTags = sizeof("<key></key>") - 1;

constexpr int kNoDigit = -1;

constexpr int base64Digit(char character) noexcept
{
    if (character >= 'A' && character <= 'Z')
        return character - 'A';
    if (character >= 'a' && character <= 'z')
        return character - 'a' + 26;
    if (character >= '0' && character <= '9')
        return character - '0' + 52;
    return character == '+' ? 62 : character == '/' ? 63 : kNoDigit;
}

/// Reads one document from its start to its end. Each member that answers a bool or a value passes what it has read, and
/// answers false or none for what is not plain.
class PlainReader {
public:
    explicit PlainReader(std::string_view xml)
        : m_rest(xml), m_contents(contentsOf(xml)), m_block(std::min(xml.size() / 16 * kUsualSixteenths, kLargestBlock))
    {
        m_pairs.reserve(32);
    }

    [[nodiscard]] Ref<CSKavellMutableDictionaryRef> document()
    {
        if (m_contents.areUnfit || !passPrologue() || !pass("<dict>"))
            return nullptr;
        auto root = dictionary(0);
        passBlanks();
        const bool isClosed = root && pass("</plist>");
        passBlanks();
        return isClosed && m_rest.empty() ? std::move(root) : nullptr;
    }

private:
    using Value = Ref<CSKavellTypeRef>;

    /// Passes a literal, whose length the compiler knows, so that it compares in place.
    template <size_t Size> bool pass(const char (&literal)[Size]) noexcept
    {
        constexpr size_t kLength = Size - 1;
        if (m_rest.size() < kLength || std::memcmp(m_rest.data(), literal, kLength) != 0)
            return false;
        m_rest.remove_prefix(kLength);
        return true;
    }

    void passBlanks() noexcept
    {
        size_t count = 0;
        while (count < m_rest.size() && (m_rest[count] == '\n' || m_rest[count] == '\t' || m_rest[count] == ' '))
            ++count;
        m_rest.remove_prefix(count);
    }

    bool passPrologue() noexcept
    {
        return pass("<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n") && pass("<!DOCTYPE plist PUBLIC ") &&
               passIdentifier() && pass(" ") && passIdentifier() && pass(">\n<plist version=\"1.0\">\n");
    }

    /// One of the two identifiers of a document type, in its quotes.
    bool passIdentifier() noexcept
    {
        if (!pass("\""))
            return false;
        const size_t length = std::min(m_rest.find('"'), m_rest.size());
        // In bytes alone, for the same reason as above.
        uint8_t unfit = 0;
        for (const char character : m_rest.substr(0, length))
            unfit |= static_cast<uint8_t>(!isIdentifierCharacter(character));
        m_rest.remove_prefix(length);
        return unfit == 0 && pass("\"");
    }

    /// What stands up to the element's end; a view into the document or, where references stood in it, into m_decoded.
    template <size_t Size> bool text(const char (&end)[Size], std::string_view &result)
    {
        const size_t length = m_rest.find('<');
        if (length == std::string_view::npos)
            return false;
        result = m_rest.substr(0, length);
        m_rest.remove_prefix(length);
        if (m_contents.haveReferences && !decode(result))
            return false;
        return pass(end) && (!m_contents.haveOtherThanASCII || isUTF8(result));
    }

    /// Puts what a text with references says in its place; false when one of them is not plain.
    bool decode(std::string_view &encoded)
    {
        if (encoded.find('&') == std::string_view::npos)
            return true;
        m_decoded.clear();
        while (!encoded.empty()) {
            const size_t length = std::min(encoded.find('&'), encoded.size());
            m_decoded.append(encoded.substr(0, length));
            encoded.remove_prefix(length);
            if (!encoded.empty() && !decodeReference(encoded))
                return false;
        }
        encoded = m_decoded;
        return true;
    }

    bool decodeReference(std::string_view &encoded)
    {
        for (const auto &[reference, character] : kNamedReferences) {
            if (encoded.starts_with(reference)) {
                m_decoded += character;
                encoded.remove_prefix(reference.size());
                return true;
            }
        }
        return false;
    }

    [[nodiscard]] Value value(int depth)
    {
        if (pass("<string>"))
            return string();
        if (pass("<integer>"))
            return integer();
        if (pass("<true/>"))
            return retain<CSKavellTypeRef>(CSKavellBooleanGetShared(true));
        if (pass("<false/>"))
            return retain<CSKavellTypeRef>(CSKavellBooleanGetShared(false));
        if (pass("<dict>"))
            return Value(dictionary(depth + 1));
        if (pass("<dict/>"))
            return adopt<CSKavellTypeRef>(CSKavellDictionaryCreateMutable());
        if (pass("<array>"))
            return array(depth + 1);
        if (pass("<array/>"))
            return adopt<CSKavellTypeRef>(CSKavellArrayCreateMutable());
        return pass("<data>") ? data() : nullptr;
    }

    [[nodiscard]] Value string()
    {
        std::string_view characters;
        return text("</string>", characters) ? adopt<CSKavellTypeRef>(makeValidString(m_block, characters)) : nullptr;
    }

    /// A number as a writer writes it: "0", or digits that do not begin with one.
    [[nodiscard]] Value integer()
    {
        int64_t number = 0;
        const char *const first = m_rest.data(), *const last = first + m_rest.size();
        const char *const digits = m_rest.starts_with('-') ? first + 1 : first;
        const auto [end, error] = std::from_chars(first, last, number);
        if (error != std::errc() || (*digits == '0' && (end != first + 1 || digits != first)))
            return nullptr;
        m_rest.remove_prefix(static_cast<size_t>(end - first));
        return pass("</integer>") ? adopt<CSKavellTypeRef>(makeInteger(m_block, number)) : nullptr;
    }

    /// Whole groups of base64 (RFC 4648, section 4), with blanks between its digits.
    [[nodiscard]] Value data()
    {
        std::string bytes;
        unsigned bits = 0;
        int count = 0, padding = 0;
        for (; !m_rest.empty() && m_rest.front() != '<'; m_rest.remove_prefix(1)) {
            const char character = m_rest.front();
            if (character == '\n' || character == '\t' || character == ' ')
                continue;
            const int digit = base64Digit(character);
            padding += character == '=';
            if ((digit == kNoDigit && character != '=') || (digit != kNoDigit && padding > 0) || padding > 2)
                return nullptr;
            bits = bits << 6 | static_cast<unsigned>(digit == kNoDigit ? 0 : digit);
            if (++count % 4 != 0)
                continue;
            for (int shift = 16; shift >= 0; shift -= 8)
                bytes += static_cast<char>(bits >> shift);
        }
        if (count % 4 != 0 || !pass("</data>"))
            return nullptr;
        // The padding stands for bytes that are not there; bits in their place are no writer's.
        for (; padding > 0; --padding) {
            if (bytes.back() != '\0')
                return nullptr;
            bytes.pop_back();
        }
        return adopt<CSKavellTypeRef>(CSKavellDataCreate(bytes.data(), bytes.size()));
    }

    [[nodiscard]] Value array(int depth)
    {
        const auto result = adopt(CSKavellArrayCreateMutable());
        for (passBlanks(); result && depth < kDeepestPlainContainer && !pass("</array>"); passBlanks()) {
            const Value element = value(depth);
            if (!element)
                return nullptr;
            CSKavellArrayAppendValue(result.get(), element.get());
        }
        return depth < kDeepestPlainContainer ? Value(result) : nullptr;
    }

    [[nodiscard]] Ref<CSKavellMutableDictionaryRef> dictionary(int depth)
    {
        const size_t first = m_pairs.size();
        if (depth >= kDeepestPlainContainer || !pairs(depth))
            return nullptr;
        const size_t count = m_pairs.size() - first;
        // What holds dictionaries is mostly taken apart and let go at once, and would only keep the block's room.
        const bool isTakenApart =
            std::any_of(m_pairs.begin() + static_cast<ptrdiff_t>(first), m_pairs.end(),
                        [](const auto &pair) { return isType(pair.second.get(), kTypeDictionary); });
        auto result = adopt(CSKavellDictionary::make(kObjectIsMutable, count, isTakenApart ? nullptr : &m_block));
        if (!result || (m_keys += count) > kMostKeys || m_keyText > kMostKeyText)
            return nullptr;
        const bool areDistinct = m_keyMaker.sharesEqualKeys() && count <= kMostCompared && haveDistinctKeys(first);
        for (size_t index = first; index < m_pairs.size(); ++index) {
            auto &[key, value] = m_pairs[index];
            areDistinct ? result->takeNew(std::move(key), std::move(value))
                        : result->take(std::move(key), std::move(value));
        }
        m_pairs.resize(first);
        // No writer writes a key twice.
        return result->count == count ? std::move(result) : nullptr;
    }

    /// Whether no key of the pairs from there on is the same string as another's.
    [[nodiscard]] bool haveDistinctKeys(size_t first) const noexcept
    {
        for (size_t index = first; index < m_pairs.size(); ++index) {
            for (size_t earlier = first; earlier < index; ++earlier) {
                if (m_pairs[earlier].first.get() == m_pairs[index].first.get())
                    return false;
            }
        }
        return true;
    }

    /// Adds the pairs up to the dictionary's end to m_pairs.
    bool pairs(int depth)
    {
        for (passBlanks(); !pass("</dict>"); passBlanks()) {
            std::string_view keyText;
            const size_t before = m_rest.size();
            if (!pass("<key>") || !text("</key>", keyText))
                return false;
            m_keyText += before - m_rest.size() - kKeyTags;
            Value key(m_keyMaker.key(keyText));
            passBlanks();
            Value pairValue = value(depth);
            if (!key || !pairValue)
                return false;
            m_pairs.emplace_back(std::move(key), std::move(pairValue));
        }
        return true;
    }

    std::string_view m_rest;
    Contents m_contents;
    std::string m_decoded;
    /// Those of all dictionaries that are not closed yet, so that each is made with exactly the room that it needs.
    std::vector<std::pair<Value, Value>> m_pairs;
    size_t m_keys = 0, m_keyText = 0;
    KeyMaker m_keyMaker;
    ObjectBlock m_block;
};

}  // namespace

Ref<CSKavellMutableDictionaryRef> parsePlainPropertyList(std::string_view xml)
{
    return xml.size() <= kLargestDataFile ? PlainReader(xml).document() : nullptr;
}

}  // namespace kavell
