// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/plain_property_list.h"

#include <array>
#include <charconv>

#include <kavellaccounts/CSKavellArray.h>
#include <kavellaccounts/CSKavellBoolean.h>
#include <kavellaccounts/CSKavellNumber.h>
#include <kavellaccounts/CSKavellType.h>

#include "platform/data_file.h"
#include "platform/property_list_guard.h"
#include "runtime/dictionary_p.h"
#include "runtime/string_p.h"

namespace kavell {

namespace {

/// Adds objects to a text as the general way writes them. Each member answers false for what is not plain.
class PlainWriter {
public:
    explicit PlainWriter(std::string &xml) noexcept : m_xml(xml) {}

    [[nodiscard]] bool dictionary(CSKavellDictionaryRef dictionary, int depth)
    {
        m_keys += dictionary->count;
        if (depth >= kDeepestPlainContainer || m_keys > kMostKeys || m_xml.size() > kLargestDataFile)
            return false;
        if (dictionary->count == 0)
            return line(depth, "<dict/>");
        static_cast<void>(line(depth, "<dict>"));
        bool isPlain = true;
        dictionary->forEach([&](CSKavellTypeRef key, CSKavellTypeRef each) {
            const size_t before = m_xml.size();
            isPlain = isPlain && element(depth + 1, "<key>", key, "</key>") &&
                      (m_keyText += m_xml.size() - before) <= kMostKeyText && value(each, depth + 1);
        });
        return isPlain && line(depth, "</dict>");
    }

private:
    [[nodiscard]] bool value(CSKavellTypeRef value, int depth)
    {
        switch (CSKavellGetTypeID(value)) {
        case kTypeDictionary:
            return dictionary(static_cast<CSKavellDictionaryRef>(value), depth);
        case kTypeArray:
            return array(static_cast<CSKavellArrayRef>(value), depth);
        case kTypeString:
            return element(depth, "<string>", value, "</string>");
        case kTypeNumber:
            return number(static_cast<CSKavellNumberRef>(value), depth);
        case kTypeBoolean:
            return line(depth,
                        CSKavellBooleanGetValue(static_cast<CSKavellBooleanRef>(value)) ? "<true/>" : "<false/>");
        default:
            return false;
        }
    }

    [[nodiscard]] bool array(CSKavellArrayRef array, int depth)
    {
        const size_t count = CSKavellArrayGetCount(array);
        if (depth >= kDeepestPlainContainer || m_xml.size() > kLargestDataFile)
            return false;
        if (count == 0)
            return line(depth, "<array/>");
        static_cast<void>(line(depth, "<array>"));
        for (size_t index = 0; index < count; ++index) {
            if (!value(CSKavellArrayGetValueAtIndex(array, index), depth + 1))
                return false;
        }
        return line(depth, "</array>");
    }

    [[nodiscard]] bool number(CSKavellNumberRef number, int depth)
    {
        if (CSKavellNumberIsUnsigned(number) || CSKavellNumberIsReal(number))
            return false;
        std::array<char, 24> digits;
        const auto [end, error] =
            std::to_chars(digits.data(), digits.data() + digits.size(), CSKavellNumberGetInt64(number));
        m_xml.append(static_cast<size_t>(depth), '\t').append("<integer>");
        m_xml.append(digits.data(), end).append("</integer>\n");
        return error == std::errc();
    }

    /// A line with a key or a string, which only plain text may be.
    [[nodiscard]] bool element(int depth, std::string_view begin, CSKavellTypeRef string, std::string_view end)
    {
        if (!isType(string, kTypeString))
            return false;
        const std::string_view text = static_cast<CSKavellStringRef>(string)->view();
        if (!isXMLText(text))
            return false;
        m_xml.append(static_cast<size_t>(depth), '\t').append(begin);
        appendEscaped(text);
        m_xml.append(end).append("\n");
        return true;
    }

    void appendEscaped(std::string_view text)
    {
        for (;;) {
            const size_t length = text.find_first_of("&<>");
            m_xml.append(text.substr(0, length));
            if (length == std::string_view::npos)
                return;
            m_xml.append(text[length] == '&' ? "&amp;" : text[length] == '<' ? "&lt;" : "&gt;");
            text.remove_prefix(length + 1);
        }
    }

    bool line(int depth, std::string_view tag)
    {
        m_xml.append(static_cast<size_t>(depth), '\t').append(tag).append("\n");
        return true;
    }

    std::string &m_xml;
    size_t m_keys = 0, m_keyText = 0;
};

}  // namespace

bool writePlainPropertyList(CSKavellDictionaryRef dictionary, std::string_view frame, std::string &xml)
{
    constexpr std::string_view kEmpty = "<dict/>\n";
    const size_t place = frame.find(kEmpty);
    if (place == std::string_view::npos)
        return false;
    std::string written(frame.substr(0, place));
    if (!PlainWriter(written).dictionary(dictionary, 0))
        return false;
    written.append(frame.substr(place + kEmpty.size()));
    if (written.size() > kLargestDataFile)
        return false;
    xml = std::move(written);
    return true;
}

}  // namespace kavell
