// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/property_list.h"

#include <algorithm>
#include <array>
#include <clocale>
#include <cmath>
#include <cstdlib>
#include <locale.h>
#include <memory>
#include <utility>

#include <plist/plist.h>

#include <kavellaccounts/CSKavellArray.h>
#include <kavellaccounts/CSKavellBoolean.h>
#include <kavellaccounts/CSKavellData.h>
#include <kavellaccounts/CSKavellDate.h>
#include <kavellaccounts/CSKavellNumber.h>

#include "platform/data_file.h"
#include "platform/key_pool.h"
#include "platform/plain_property_list.h"
#include "platform/property_list_guard.h"
#include "runtime/dictionary_p.h"
#include "runtime/string_p.h"
#include "runtime/utf8.h"

namespace kavell {

namespace {

struct PlistDeleter {
    void operator()(void *node) const noexcept { plist_free(node); }
};

using PlistNode = std::unique_ptr<void, PlistDeleter>;

struct XMLDeleter {
    void operator()(char *xml) const noexcept { plist_to_xml_free(xml); }
};

/// For what the library says is to be freed with free().
struct FreeMemory {
    void operator()(void *memory) const noexcept { std::free(memory); }
};

/// Gives the thread the C locale while it lives: the library writes and reads reals with the locale's decimal point.
class CLocaleScope {
public:
    CLocaleScope() noexcept : m_previous(uselocale(cLocale())) {}
    ~CLocaleScope() { uselocale(m_previous); }
    CLocaleScope(const CLocaleScope &) = delete;
    CLocaleScope &operator=(const CLocaleScope &) = delete;

private:
    static locale_t cLocale() noexcept
    {
        static const locale_t locale = newlocale(LC_ALL_MASK, "C", nullptr);
        return locale;
    }

    locale_t m_previous;
};

/// Turns the parser's tree into objects. None for a tree with anything that a property list does not have.
class ObjectMaker {
public:
    [[nodiscard]] Ref<CSKavellTypeRef> object(plist_t node)
    {
        switch (plist_get_node_type(node)) {
        case PLIST_DICT:
            return Ref<CSKavellTypeRef>(dictionary(node));
        case PLIST_ARRAY:
            return array(node);
        case PLIST_STRING:
            return Ref<CSKavellTypeRef>(string(node));
        default:
            return scalar(node);
        }
    }

    [[nodiscard]] Ref<CSKavellMutableDictionaryRef> dictionary(plist_t node)
    {
        auto result = adopt(CSKavellDictionary::make(kObjectIsMutable, plist_dict_get_size(node)));
        if (!result)
            return nullptr;
        plist_dict_iter rawIterator = nullptr;
        plist_dict_new_iter(node, &rawIterator);
        const std::unique_ptr<void, FreeMemory> iterator(rawIterator);
        for (plist_t item = nullptr;;) {
            plist_dict_next_item(node, iterator.get(), nullptr, &item);
            if (!item)
                return result;
            auto itemKey = key(item);
            auto value = object(item);
            if (!itemKey || !value)
                return nullptr;
            result->take(std::move(itemKey), std::move(value));
        }
    }

private:
    [[nodiscard]] Ref<CSKavellStringRef> key(plist_t item)
    {
        char *rawText = nullptr;
        plist_dict_get_item_key(item, &rawText);
        const std::unique_ptr<char, FreeMemory> text(rawText);
        if (!text || !isUTF8(text.get()))
            return nullptr;
        return m_keyMaker.key(text.get());
    }

    [[nodiscard]] static Ref<CSKavellStringRef> string(plist_t node)
    {
        uint64_t length = 0;
        const char *text = plist_get_string_ptr(node, &length);
        return adopt(CSKavellStringCreateWithBytes(text, length));
    }

    [[nodiscard]] Ref<CSKavellTypeRef> array(plist_t node)
    {
        auto result = adopt(CSKavellArrayCreateMutable());
        for (uint32_t index = 0, count = plist_array_get_size(node); index < count; ++index) {
            const auto value = object(plist_array_get_item(node, index));
            if (!value)
                return nullptr;
            CSKavellArrayAppendValue(result.get(), value.get());
        }
        return Ref<CSKavellTypeRef>(result);
    }

    [[nodiscard]] static Ref<CSKavellTypeRef> scalar(plist_t node)
    {
        switch (plist_get_node_type(node)) {
        case PLIST_BOOLEAN: {
            uint8_t value = 0;
            plist_get_bool_val(node, &value);
            return retain<CSKavellTypeRef>(CSKavellBooleanGetShared(value != 0));
        }
        case PLIST_UINT: {
            uint64_t value = 0;
            plist_get_uint_val(node, &value);
            return adopt<CSKavellTypeRef>(CSKavellNumberCreateWithInt64(static_cast<int64_t>(value)));
        }
        case PLIST_REAL: {
            double value = 0;
            plist_get_real_val(node, &value);
            return adopt<CSKavellTypeRef>(CSKavellNumberCreateWithDouble(value));
        }
        case PLIST_DATE: {
            int32_t seconds = 0, microseconds = 0;
            plist_get_date_val(node, &seconds, &microseconds);
            return adopt<CSKavellTypeRef>(CSKavellDateCreate(kPropertyListEpoch + seconds));
        }
        case PLIST_DATA: {
            uint64_t length = 0;
            const char *bytes = plist_get_data_ptr(node, &length);
            return adopt<CSKavellTypeRef>(CSKavellDataCreate(bytes, bytes ? length : 0));
        }
        default:
            return nullptr;
        }
    }

    KeyMaker m_keyMaker;
};

/// Turns objects into the writer's tree. None for anything that a property list cannot keep.
class NodeMaker {
public:
    [[nodiscard]] PlistNode dictionary(CSKavellDictionaryRef dictionary, int depth) noexcept
    {
        PlistNode result(plist_new_dict());
        bool whole = result && isAllowedDepth(depth);
        if (!whole)
            return nullptr;
        dictionary->forEach([&](CSKavellTypeRef key, CSKavellTypeRef value) {
            whole = whole && ++m_keys <= kMostKeys && isPlainText(key) && hasRoomFor(key);
            PlistNode node = whole ? object(value, depth) : nullptr;
            whole = whole && node;
            if (whole)
                plist_dict_set_item(result.get(), static_cast<CSKavellStringRef>(key)->text(), node.release());
        });
        return whole ? std::move(result) : nullptr;
    }

private:
    // Within the depth, a container may still name another many times over; what cannot fit the largest file ends
    // early.
    static constexpr size_t kMostValues = kLargestDataFile / sizeof("<true/>");

    /// A container at the deepest allowed level could hold nothing: its contents are elements too.
    [[nodiscard]] static bool isAllowedDepth(int depth) noexcept { return depth < kDeepestPropertyList; }

    [[nodiscard]] PlistNode object(CSKavellTypeRef value, int depth) noexcept
    {
        if (++m_values > kMostValues)
            return nullptr;
        switch (CSKavellGetTypeID(value)) {
        case kTypeDictionary:
            return dictionary(static_cast<CSKavellDictionaryRef>(value), depth + 1);
        case kTypeArray:
            return array(static_cast<CSKavellArrayRef>(value), depth + 1);
        case kTypeString:
            return isPlainText(value) ? PlistNode(plist_new_string(static_cast<CSKavellStringRef>(value)->text()))
                                      : nullptr;
        case kTypeNumber:
            return number(static_cast<CSKavellNumberRef>(value));
        case kTypeBoolean:
            return PlistNode(plist_new_bool(CSKavellBooleanGetValue(static_cast<CSKavellBooleanRef>(value))));
        case kTypeDate:
            return date(CSKavellDateGetSeconds(static_cast<CSKavellDateRef>(value)));
        case kTypeData:
            return data(static_cast<CSKavellDataRef>(value));
        default:
            return nullptr;
        }
    }

    [[nodiscard]] PlistNode array(CSKavellArrayRef array, int depth) noexcept
    {
        PlistNode result(plist_new_array());
        if (!result || !isAllowedDepth(depth))
            return nullptr;
        for (size_t index = 0; index < CSKavellArrayGetCount(array); ++index) {
            PlistNode node = object(CSKavellArrayGetValueAtIndex(array, index), depth);
            if (!node)
                return nullptr;
            plist_array_append_item(result.get(), node.release());
        }
        return result;
    }

    [[nodiscard]] static PlistNode number(CSKavellNumberRef number) noexcept
    {
        if (CSKavellNumberIsUnsigned(number))
            return nullptr;
        if (!CSKavellNumberIsReal(number))
            return PlistNode(plist_new_uint(static_cast<uint64_t>(CSKavellNumberGetInt64(number))));
        const double value = CSKavellNumberGetDouble(number);
        return std::isfinite(value) ? PlistNode(plist_new_real(value)) : nullptr;
    }

    [[nodiscard]] static PlistNode date(int64_t seconds) noexcept
    {
        if (seconds < kEarliestDate || seconds > kLatestDate)
            return nullptr;
        return PlistNode(plist_new_date(static_cast<int32_t>(seconds - kPropertyListEpoch), 0));
    }

    [[nodiscard]] static PlistNode data(CSKavellDataRef data) noexcept
    {
        const size_t length = CSKavellDataGetLength(data);
        if (length > kLargestDataFile)
            return nullptr;
        return PlistNode(plist_new_data(reinterpret_cast<const char *>(CSKavellDataGetBytes(data)), length));
    }

    /// Whether the keys stay within kMostKeyText with this one, however its characters will be written.
    [[nodiscard]] bool hasRoomFor(CSKavellTypeRef key) noexcept
    {
        constexpr size_t kLongestReference = sizeof("&amp;") - 1;
        const std::string_view text = static_cast<CSKavellStringRef>(key)->view();
        const auto references =
            std::ranges::count_if(text, [](char each) { return each == '&' || each == '<' || each == '>'; });
        m_keyText += text.size() + static_cast<size_t>(references) * (kLongestReference - 1);
        return m_keyText <= kMostKeyText;
    }

    [[nodiscard]] static bool isPlainText(CSKavellTypeRef value) noexcept
    {
        if (!isType(value, kTypeString))
            return false;
        const auto text = static_cast<CSKavellStringRef>(value)->view();
        return text.size() <= kLargestDataFile && isXMLText(text);
    }

    size_t m_values = 0;
    size_t m_keys = 0, m_keyText = 0;
};

// The top-level dictionary stands in the document's root element.
constexpr int kRootDepth = 2;

/// How long the piece of markup is that the rest of a checked document begins with; 0 when there is none left.
size_t lengthOfMarkup(std::string_view xml) noexcept
{
    constexpr std::array<std::pair<std::string_view, std::string_view>, 4> kForms{
        {{"<!--", "-->"}, {"<![CDATA[", "]]>"}, {"<?", "?>"}, {"<", ">"}}};
    for (const auto &[begin, end] : kForms) {
        if (xml.starts_with(begin))
            return xml.find(end, begin.size()) + end.size();
    }
    return 0;
}

/// How much of a text the parser shall see as one part.
size_t lengthOfPart(std::string_view text) noexcept
{
    constexpr int kMostReferences = 256;
    size_t place = 0;
    for (int references = 0; references < kMostReferences; ++references) {
        const size_t next = text.find('&', place);
        if (next == std::string_view::npos)
            return text.size();
        place = text.find(';', next) + 1;
    }
    return place;
}

/// A checked document with empty comments that part its texts behind every so many references. For each reference, the
/// parser moves what follows it in its part of the text, which would take an hour for the largest text of them.
std::string withTextsInParts(std::string_view xml)
{
    std::string parted;
    parted.reserve(xml.size() + xml.size() / 64);
    while (!xml.empty()) {
        std::string_view text = xml.substr(0, xml.find('<'));
        xml.remove_prefix(text.size());
        for (size_t length; (length = lengthOfPart(text)) < text.size(); text.remove_prefix(length))
            parted.append(text.substr(0, length)).append("<!---->");
        const size_t markup = lengthOfMarkup(xml);
        parted.append(text).append(xml.substr(0, markup));
        xml.remove_prefix(markup);
    }
    return parted;
}

PlistNode parsedTree(std::string_view xml)
{
    if (xml.empty() || xml.size() > kLargestDataFile || !isSafePropertyList(xml))
        return nullptr;
    constexpr ptrdiff_t kManyReferences = 1024;
    std::string parted;
    if (std::ranges::count(xml, '&') > kManyReferences)
        xml = parted = withTextsInParts(xml);
    const CLocaleScope locale;
    plist_t root = nullptr;
    plist_from_xml(xml.data(), static_cast<uint32_t>(xml.size()), &root);
    PlistNode tree(root);
    return tree && plist_get_node_type(tree.get()) == PLIST_DICT ? std::move(tree) : nullptr;
}

/// The document of an empty dictionary, written once.
const std::string &emptyDocument()
{
    static const std::string document = [] {
        std::string xml;
        const auto empty = adopt(CSKavellDictionaryCreateMutable());
        return empty && writeAnyPropertyList(empty.get(), xml) ? xml : std::string();
    }();
    return document;
}

}  // namespace

Ref<CSKavellMutableDictionaryRef> parsePropertyList(std::string_view xml) noexcept
{
    return guarded(Ref<CSKavellMutableDictionaryRef>(), [&] {
        auto plain = parsePlainPropertyList(xml);
        return plain ? plain : parseAnyPropertyList(xml);
    });
}

Ref<CSKavellMutableDictionaryRef> parseAnyPropertyList(std::string_view xml)
{
    const PlistNode tree = parsedTree(xml);
    return tree ? ObjectMaker().dictionary(tree.get()) : nullptr;
}

bool isPropertyList(std::string_view xml) noexcept
{
    return static_cast<bool>(parsePropertyList(xml));
}

bool writePropertyList(CSKavellDictionaryRef dictionary, std::string &xml) noexcept
{
    if (!dictionary)
        return false;
    return guarded(false, [&] {
        return writePlainPropertyList(dictionary, emptyDocument(), xml) || writeAnyPropertyList(dictionary, xml);
    });
}

bool writeAnyPropertyList(CSKavellDictionaryRef dictionary, std::string &xml)
{
    const PlistNode tree = NodeMaker().dictionary(dictionary, kRootDepth);
    if (!tree)
        return false;
    const CLocaleScope locale;
    char *rawText = nullptr;
    uint32_t length = 0;
    plist_to_xml(tree.get(), &rawText, &length);
    const std::unique_ptr<char, XMLDeleter> text(rawText);
    if (!text || length > kLargestDataFile)
        return false;
    xml.assign(text.get(), length);
    return true;
}

}  // namespace kavell
