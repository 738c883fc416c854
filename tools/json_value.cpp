// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tools/json_value.h"

#include <algorithm>
#include <vector>

#include <kavellaccounts/CSKavellArray.h>
#include <kavellaccounts/CSKavellBoolean.h>
#include <kavellaccounts/CSKavellData.h>
#include <kavellaccounts/CSKavellDate.h>
#include <kavellaccounts/CSKavellNumber.h>

#include "tools/failure.h"
#include "tools/text.h"
#include "tools/value_forms.h"

namespace kavell::tools {

namespace {

/// Far deeper than any account, and far from what a reader's stack holds.
constexpr int deepestNesting = 100;

/// An object with one key. (A list in braces would not do: compilers disagree on whether one pair is an object.)
Json marked(const char *mark, Json content)
{
    Json json = Json::object();
    json[mark] = std::move(content);
    return json;
}

Json jsonOfNumber(CSKavellNumberRef number)
{
    if (!CSKavellNumberIsReal(number)) {
        if (CSKavellNumberIsUnsigned(number))
            return CSKavellNumberGetUInt64(number);
        return CSKavellNumberGetInt64(number);
    }
    return CSKavellNumberGetDouble(number);
}

Json jsonOfArray(CSKavellArrayRef array)
{
    Json json = Json::array();
    for (size_t index = 0; index < CSKavellArrayGetCount(array); ++index)
        json.push_back(jsonOf(CSKavellArrayGetValueAtIndex(array, index)));
    return json;
}

Json jsonOfDictionary(CSKavellDictionaryRef dictionary)
{
    Json json = plainJson(dictionary);
    for (const auto &[key, value] : json.items())
        if (key.starts_with('$'))
            return marked("$dict", std::move(json));
    return json;
}

Ref<CSKavellTypeRef> read(const Json &json, const std::string &place, int depth);

Ref<CSKavellTypeRef> readString(const std::string &text, const std::string &place)
{
    if (!isStorableText(text))
        refuse(place + " has a character that a data file cannot hold; give such bytes as data");
    return makeString(text);
}

Ref<CSKavellTypeRef> readArray(const Json &json, const std::string &place, int depth)
{
    Ref<CSKavellMutableArrayRef> array = adopt(CSKavellArrayCreateMutable());
    for (size_t index = 0; index < json.size(); ++index)
        CSKavellArrayAppendValue(array.get(),
                                 read(json[index], place + "[" + std::to_string(index) + "]", depth).get());
    return array;
}

Ref<CSKavellDictionaryRef> readPlainDictionary(const Json &json, const std::string &place, int depth)
{
    Ref<CSKavellMutableDictionaryRef> dictionary = adopt(CSKavellDictionaryCreateMutable());
    for (const auto &[key, value] : json.items()) {
        const std::string inner = place + "." + escaped(key);
        if (key.empty() || hasControlCharacter(key))
            refuse("the key " + inQuotes(key) + " in " + place + " is empty or has a control character");
        if (!isStorableText(key))
            refuse("the key " + inQuotes(key) + " in " + place + " has a character that a data file cannot hold");
        CSKavellDictionarySetValue(dictionary.get(), makeString(key).get(), read(value, inner, depth).get());
    }
    return dictionary;
}

/// An object with one key that says what the value is.
Ref<CSKavellTypeRef> readMarked(const Json &json, const std::string &place, int depth)
{
    const std::string &mark = json.begin().key();
    const Json &content = json.begin().value();
    const std::string text = content.is_string() ? content.get<std::string>() : std::string();
    if (json.size() == 1 && mark == "$date") {
        const std::optional<int64_t> date = parseDate(text);
        if (!date || !isStorableDate(*date))
            refuse(place + " is no date between 1932-12-13T20:45:52Z and 2069-01-19T03:14:07Z; write it like "
                           "{\"$date\": \"2026-01-31T10:00:00Z\"}");
        return adopt(CSKavellDateCreate(*date));
    }
    if (json.size() == 1 && mark == "$data" && content.is_string()) {
        if (const auto bytes = parseBase64(text))
            return adopt(CSKavellDataCreate(bytes->data(), bytes->size()));
        refuse(place + " is not base64; write it like {\"$data\": \"aGVsbG8=\"}");
    }
    if (json.size() == 1 && mark == "$dict" && content.is_object())
        return readPlainDictionary(content, place, depth);
    refuse(place + " has a key beginning with \"$\" that means nothing here; a dictionary with such keys is written "
                   "{\"$dict\": {...}}");
}

Ref<CSKavellTypeRef> readObject(const Json &json, const std::string &place, int depth)
{
    for (const auto &[key, value] : json.items())
        if (key.starts_with('$'))
            return readMarked(json, place, depth);
    return readPlainDictionary(json, place, depth);
}

Ref<CSKavellTypeRef> read(const Json &json, const std::string &place, int depth)
{
    if (depth > deepestNesting)
        refuse(place + " is nested more than " + std::to_string(deepestNesting) + " levels deep");
    switch (json.type()) {
    case Json::value_t::string:
        return readString(json.get_ref<const std::string &>(), place);
    case Json::value_t::boolean:
        return retain(CSKavellBooleanGetShared(json.get<bool>()));
    case Json::value_t::number_integer:
        return adopt(CSKavellNumberCreateWithInt64(json.get<int64_t>()));
    case Json::value_t::number_unsigned:
        if (json.get<uint64_t>() > INT64_MAX)
            refuse(place + " is larger than " + std::to_string(INT64_MAX) + ", the largest integer of a data file");
        return adopt(CSKavellNumberCreateWithInt64(json.get<int64_t>()));
    case Json::value_t::number_float:
        return adopt(CSKavellNumberCreateWithDouble(json.get<double>()));
    case Json::value_t::array:
        return readArray(json, place, depth + 1);
    case Json::value_t::object:
        return readObject(json, place, depth + 1);
    default:
        refuse(place + " is null, and accounts have no such value; leave it out or remove it with unset");
    }
}

size_t lineOf(std::string_view text, size_t byte)
{
    return 1 + static_cast<size_t>(
                   std::count(text.begin(), text.begin() + static_cast<ptrdiff_t>(std::min(byte, text.size())), '\n'));
}

}  // namespace

Json plainJson(CSKavellDictionaryRef dictionary)
{
    std::vector<CSKavellTypeRef> keys(CSKavellDictionaryGetCount(dictionary));
    std::vector<CSKavellTypeRef> values(keys.size());
    CSKavellDictionaryGetKeysAndValues(dictionary, keys.data(), values.data());
    Json json = Json::object();
    for (size_t index = 0; index < keys.size(); ++index)
        json[toStdString(cast<CSKavellStringRef>(keys[index], CSKavellStringGetTypeID()))] = jsonOf(values[index]);
    return json;
}

Json jsonOf(CSKavellTypeRef value)
{
    const CSKavellTypeID type = CSKavellGetTypeID(value);
    if (type == CSKavellStringGetTypeID())
        return std::string(toStringView(static_cast<CSKavellStringRef>(value)));
    if (type == CSKavellBooleanGetTypeID())
        return CSKavellBooleanGetValue(static_cast<CSKavellBooleanRef>(value));
    if (type == CSKavellNumberGetTypeID())
        return jsonOfNumber(static_cast<CSKavellNumberRef>(value));
    if (type == CSKavellDateGetTypeID())
        return marked("$date", formatDate(CSKavellDateGetSeconds(static_cast<CSKavellDateRef>(value))));
    if (type == CSKavellDataGetTypeID()) {
        const auto data = static_cast<CSKavellDataRef>(value);
        return marked("$data", formatBase64({CSKavellDataGetBytes(data), CSKavellDataGetLength(data)}));
    }
    if (type == CSKavellArrayGetTypeID())
        return jsonOfArray(static_cast<CSKavellArrayRef>(value));
    if (type == CSKavellDictionaryGetTypeID())
        return jsonOfDictionary(static_cast<CSKavellDictionaryRef>(value));
    return nullptr;
}

Ref<CSKavellTypeRef> valueOf(const Json &json, const std::string &place)
{
    return read(json, place, 0);
}

Ref<CSKavellDictionaryRef> dictionaryOf(const Json &json, const std::string &place)
{
    if (!json.is_object())
        refuse(place + " is not a JSON object");
    return readPlainDictionary(json, place, 1);
}

Json parseJson(std::string_view text, const std::string &place)
{
    try {
        return Json::parse(text);
    } catch (const Json::parse_error &error) {
        refuse(place + " is not JSON: it goes wrong in line " + std::to_string(lineOf(text, error.byte)) + ", byte " +
               std::to_string(error.byte));
    } catch (const Json::exception &) {
        refuse(place + " has a number that is out of range");
    }
}

std::string textOf(const Json &json, bool onOneLine)
{
    const std::string dumped = json.dump(onOneLine ? -1 : 2, ' ', false, Json::error_handler_t::replace);
    std::string text;
    text.reserve(dumped.size() + 1);
    // JSON escapes C0 itself. DEL is one byte, and C1 is C2 80 to C2 9F.
    for (size_t index = 0; index < dumped.size(); ++index) {
        const auto byte = static_cast<unsigned char>(dumped[index]);
        const auto next = static_cast<unsigned char>(index + 1 < dumped.size() ? dumped[index + 1] : 0);
        if (byte == 0x7F)
            text += "\\u007f";
        else if (byte == 0xC2 && next >= 0x80 && next <= 0x9F) {
            constexpr std::string_view digits = "0123456789abcdef";
            text += std::string("\\u00") + digits[next >> 4] + digits[next & 15U];
            ++index;
        } else
            text += dumped[index];
    }
    return text + "\n";
}

}  // namespace kavell::tools
