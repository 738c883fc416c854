// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/property_list_guard.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <chrono>

#include "runtime/utf8.h"

namespace kavell {

namespace {

constexpr std::string_view kBlanks = " \t\r\n";

constexpr bool isDigit(char character) noexcept
{
    return character >= '0' && character <= '9';
}

std::string_view trimmed(std::string_view text) noexcept
{
    const size_t first = text.find_first_not_of(kBlanks);
    if (first == std::string_view::npos)
        return {};
    return text.substr(first, text.find_last_not_of(kBlanks) - first + 1);
}

/// A number's text without the blanks around it and the plus before it.
std::string_view numberText(std::string_view text) noexcept
{
    text = trimmed(text);
    if (text.starts_with('+') && !text.starts_with("+-"))
        text.remove_prefix(1);
    return text;
}

template <typename Number> bool isNumber(std::string_view text, Number &value) noexcept
{
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), value);
    return error == std::errc() && end == text.data() + text.size();
}

/// A decimal integer from -2^63 to 2^63 - 1: what can be read and written again unchanged. For the parser, one is octal that
/// has a zero before its other digits.
bool isIntegerText(std::string_view text) noexcept
{
    text = numberText(text);
    const std::string_view digits = text.substr(text.starts_with('-') ? 1 : 0);
    int64_t value;
    return (digits == "0" || !digits.starts_with('0')) && isNumber(text, value);
}

bool isRealText(std::string_view text) noexcept
{
    double value;
    return isNumber(numberText(text), value) && value - value == 0;
}

/// YYYY-MM-DDTHH:MM:SSZ, an existing date within the range. With many blanks behind it, it is 1970 for the parser.
bool isDateText(std::string_view text) noexcept
{
    constexpr std::string_view kForm = "dddd-dd-ddTdd:dd:ddZ";
    constexpr size_t kLongestWithBlanks = 31;  // behind it, not before it
    text.remove_prefix(std::min(text.find_first_not_of(kBlanks), text.size()));
    const bool isShort = text.size() <= kLongestWithBlanks;
    text = trimmed(text);
    if (!isShort || text.size() != kForm.size())
        return false;
    for (size_t place = 0; place < kForm.size(); ++place) {
        if (kForm[place] == 'd' ? !isDigit(text[place]) : text[place] != kForm[place])
            return false;
    }
    const auto number = [text](size_t place, size_t length) {
        int value = 0;
        std::from_chars(text.data() + place, text.data() + place + length, value);
        return value;
    };
    const std::chrono::year_month_day date{std::chrono::year(number(0, 4)),
                                           std::chrono::month(static_cast<unsigned>(number(5, 2))),
                                           std::chrono::day(static_cast<unsigned>(number(8, 2)))};
    if (!date.ok() || number(11, 2) > 23 || number(14, 2) > 59 || number(17, 2) > 59)
        return false;
    const int64_t days = std::chrono::sys_days(date).time_since_epoch().count();
    const int64_t seconds = days * 86400 + number(11, 2) * 3600 + number(14, 2) * 60 + number(17, 2);
    return seconds >= kEarliestDate && seconds <= kLatestDate;
}

/// Base64 (RFC 4648, section 4), with blanks anywhere.
bool isBase64Text(std::string_view text) noexcept
{
    size_t digits = 0, padding = 0;
    for (const char character : text) {
        if (kBlanks.find(character) != std::string_view::npos)
            continue;
        if (character == '=') {
            ++padding;
            continue;
        }
        const bool isDigit64 = isDigit(character) || (character >= 'A' && character <= 'Z') ||
                               (character >= 'a' && character <= 'z') || character == '+' || character == '/';
        if (!isDigit64 || padding > 0)
            return false;
        ++digits;
    }
    return padding <= 2 && (digits + padding) % 4 == 0;
}

/// The characters that a document may have, written out or as references (XML 1.0, production 2).
constexpr bool isXMLCharacter(uint32_t character) noexcept
{
    return character == '\t' || character == '\n' || character == '\r' || (character >= 0x20 && character <= 0xD7FF) ||
           (character >= 0xE000 && character <= 0xFFFD) || (character >= 0x10000 && character <= 0x10FFFF);
}

/// Whether a text begins with a reference to a character that XML has, by its number; what the parser made of others could
/// not be written again.
bool isCharacterReference(std::string_view text) noexcept
{
    if (!text.starts_with("&#"))
        return false;
    const bool isHexadecimal = text.starts_with("&#x");
    text.remove_prefix(isHexadecimal ? 3 : 2);
    uint32_t character = 0;
    const auto [end, error] =
        std::from_chars(text.data(), text.data() + text.size(), character, isHexadecimal ? 16 : 10);
    return error == std::errc() && end != text.data() + text.size() && *end == ';' && isXMLCharacter(character);
}

/// Whether each ampersand begins a reference. For the parser, one goes on to the next semicolon, however far that is.
bool referencesAreSound(std::string_view text) noexcept
{
    for (size_t next; (next = text.find('&')) != std::string_view::npos; text.remove_prefix(1)) {
        text.remove_prefix(next);
        const bool isNamed = std::ranges::any_of(
            kNamedReferences, [text](const auto &reference) { return text.starts_with(reference.first); });
        if (!isNamed && !isCharacterReference(text))
            return false;
    }
    return true;
}

bool isBlank(std::string_view text) noexcept
{
    return text.find_first_not_of(kBlanks) == std::string_view::npos;
}

struct ScalarElement {
    std::string_view name;
    bool (*isText)(std::string_view) noexcept;
};

constexpr std::array kScalarElements{
    ScalarElement{"integer", isIntegerText}, ScalarElement{"real", isRealText}, ScalarElement{"date", isDateText},
    ScalarElement{"data", isBase64Text},     ScalarElement{"true", isBlank},    ScalarElement{"false", isBlank},
};

constexpr bool isContainer(std::string_view name) noexcept
{
    return name == "dict" || name == "array";
}

/// Whether quotes stand in pairs. The parser passes over what stands between two double ones, the end of the markup
/// included; XML does so for single ones too.
bool quotesArePaired(std::string_view markup) noexcept
{
    return std::ranges::count(markup, '"') % 2 == 0 && std::ranges::count(markup, '\'') % 2 == 0;
}

/// Walks the markup of a document, counting depth the way the parser recurses. It never takes for a comment or a
/// section what the parser does not, so that no nesting stays hidden from it, and it lets no element stand where the parser
/// would leave it out or take it for another.
class MarkupWalk {
public:
    explicit MarkupWalk(std::string_view xml) noexcept
        : m_rest(xml), m_hasReferences(xml.find('&') != std::string_view::npos)
    {
    }

    [[nodiscard]] bool isSafe() noexcept
    {
        for (size_t next; (next = m_rest.find('<')) != std::string_view::npos;) {
            if (!isSound(m_rest.substr(0, next)))
                return false;
            m_rest.remove_prefix(next + 1);
            if (!passMarkup())
                return false;
        }
        // The parser would make do with a file that was cut off; here it must have been closed to its last element.
        return m_sawRoot && m_depth == 0 && isBlank(m_rest);
    }

private:
    /// What an open element may have in it next.
    enum class Next : uint8_t { Anything, Key, Value };

    /// Whether a text between two pieces of markup may stand there.
    [[nodiscard]] bool isSound(std::string_view text) const noexcept
    {
        return (m_depth > m_depthOfRoot || isBlank(text)) && (!m_hasReferences || referencesAreSound(text));
    }

    /// Passes what begins after a "<".
    bool passMarkup() noexcept
    {
        const char first = m_rest.empty() ? '\0' : m_rest.front();
        // A declaration is legal before the first element only; a subset of declarations inside a document type is not
        // needed by any property list.
        if (first == '?')
            return !m_sawElement && passInstruction();
        return first == '!' ? passDeclaration() : passTag();
    }

    /// An instruction of nothing, "<?>", ends there for the parser, and in XML it does not end there.
    bool passInstruction() noexcept
    {
        const size_t end = m_rest.find("?>");
        if (end == 0 || end == std::string_view::npos || !quotesArePaired(m_rest.substr(0, end)))
            return false;
        m_rest.remove_prefix(end + 2);
        return true;
    }

    bool passDeclaration() noexcept
    {
        if (m_rest.starts_with("!--"))
            return passThrough("-->", 3);
        if (m_rest.starts_with("![CDATA["))
            return m_depth > 0 && passThrough("]]>", 8);
        return m_rest.starts_with("!DOCTYPE") && !m_sawElement && passDocumentType();
    }

    bool passThrough(std::string_view end, size_t from) noexcept
    {
        const size_t found = m_rest.find(end, from);
        if (found == std::string_view::npos)
            return false;
        m_rest.remove_prefix(found + end.size());
        return true;
    }

    bool passDocumentType() noexcept
    {
        const size_t end = m_rest.find('>');
        const std::string_view declaration = m_rest.substr(0, end);
        if (end == std::string_view::npos || declaration.find_first_of("[<") != std::string_view::npos ||
            !quotesArePaired(declaration))
            return false;
        m_rest.remove_prefix(end + 1);
        return true;
    }

    bool passTag() noexcept
    {
        const size_t end = m_rest.find('>');
        if (end == std::string_view::npos)
            return false;
        std::string_view tag = m_rest.substr(0, end);
        if (!quotesArePaired(tag))
            return false;
        m_rest.remove_prefix(end + 1);
        const bool isFirst = !m_sawElement;
        m_sawElement = true;
        if (tag.starts_with('/'))
            return close(tag);
        const bool isEmpty = tag.ends_with('/');
        tag.remove_suffix(isEmpty ? 1 : 0);
        const std::string_view name = tag.substr(0, tag.find_first_of(kBlanks));
        if (name == "plist") {
            m_depth = m_depthOfRoot = 1;
            return isFirst && !isEmpty;
        }
        return place(name) && (isEmpty ? mayBeEmpty(name) : open(name));
    }

    /// Closes the element that is open.
    [[nodiscard]] bool close(std::string_view tag) noexcept
    {
        if (m_depth == 0 || m_next[m_depth] == Next::Value || (m_depth == m_depthOfRoot && trimmed(tag) != "/plist"))
            return false;
        if (m_key)
            m_keyText += static_cast<size_t>(tag.data() - m_key) - 1;  // without the "<" of this tag
        m_key = nullptr;
        --m_depth;
        return m_keyText <= kMostKeyText;
    }

    /// Puts an element into the one that is open, and answers whether it may stand there: there is one root, a dictionary has
    /// keys and values by turns, and the writer could write it at this depth.
    [[nodiscard]] bool place(std::string_view name) noexcept
    {
        const bool isKey = name == "key";
        Next &next = m_next[m_depth];
        if ((m_sawRoot && m_depth <= m_depthOfRoot) || isKey != (next == Next::Key) || (isKey && ++m_keys > kMostKeys))
            return false;
        m_sawRoot = true;
        if (next != Next::Anything)
            next = isKey ? Next::Value : Next::Key;
        // A document may do without its outermost element, which the writer writes.
        const int depth = m_depth + 2 - m_depthOfRoot;
        return depth < kDeepestPropertyList || (depth == kDeepestPropertyList && !isContainer(name));
    }

    [[nodiscard]] static const ScalarElement *scalarOf(std::string_view name) noexcept
    {
        const auto *element = std::find_if(kScalarElements.begin(), kScalarElements.end(),
                                           [name](const ScalarElement &each) { return each.name == name; });
        return element == kScalarElements.end() ? nullptr : element;
    }

    /// The parser makes a number or a date up for an empty element, and takes an empty key for a value.
    [[nodiscard]] static bool mayBeEmpty(std::string_view name) noexcept
    {
        const ScalarElement *const scalar = scalarOf(name);
        return name != "key" && (!scalar || scalar->isText({}));
    }

    /// Opens an element, and answers whether the text that follows fits it.
    [[nodiscard]] bool open(std::string_view name) noexcept
    {
        m_next[++m_depth] = name == "dict" ? Next::Key : Next::Anything;
        if (name == "key")
            m_key = m_rest.data();
        // Most elements are keys and strings.
        const ScalarElement *const scalar = name == "key" || name == "string" ? nullptr : scalarOf(name);
        if (!scalar)
            return true;
        const size_t end = m_rest.find('<');
        return end != std::string_view::npos && m_rest.substr(end).starts_with("</") &&
               scalar->isText(m_rest.substr(0, end));
    }

    std::string_view m_rest;
    const bool m_hasReferences;  // hardly any document has some
    int m_depth = 0;
    int m_depthOfRoot = 0;  // of what the root stands in
    std::array<Next, kDeepestPropertyList + 1> m_next{};
    const char *m_key = nullptr;  // the text of an open one
    size_t m_keys = 0, m_keyText = 0;
    bool m_sawElement = false, m_sawRoot = false;
};

bool hasControlCharacter(std::string_view text) noexcept
{
    // Without an early end the compiler checks many bytes at a time.
    bool found = false;
    for (const char character : text) {
        const auto byte = static_cast<unsigned char>(character);
        found |= (byte < 0x20) & (byte != '\t') & (byte != '\n') & (byte != '\r');
    }
    return found;
}

}  // namespace

bool isSafePropertyList(std::string_view xml) noexcept
{
    return isXMLText(xml) && isUTF8(xml) && MarkupWalk(xml).isSafe();
}

bool isXMLText(std::string_view text) noexcept
{
    return !hasControlCharacter(text) && text.find("\xEF\xBF\xBE") == std::string_view::npos &&
           text.find("\xEF\xBF\xBF") == std::string_view::npos;
}

}  // namespace kavell
