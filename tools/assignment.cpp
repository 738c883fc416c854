// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tools/assignment.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <optional>
#include <vector>

#include <kavellaccounts/CSKavellArray.h>
#include <kavellaccounts/CSKavellBoolean.h>
#include <kavellaccounts/CSKavellData.h>
#include <kavellaccounts/CSKavellDate.h>
#include <kavellaccounts/CSKavellDictionary.h>
#include <kavellaccounts/CSKavellNumber.h>

#include "tools/failure.h"
#include "tools/files.h"
#include "tools/json_value.h"
#include "tools/names.h"
#include "tools/text.h"
#include "tools/value_forms.h"

namespace kavell::tools {

namespace {

/// Data of more bytes than this is counted, not shown.
constexpr size_t longestShownData = 48;

using Reader = Ref<CSKavellTypeRef> (*)(const std::string &key, std::string_view text);

Ref<CSKavellTypeRef> readString(const std::string &key, std::string_view text)
{
    if (!isUTF8(text))
        refuse("the value of " + inQuotes(key) + " is not valid UTF-8; give such bytes as " + escaped(key) +
               ":data=BASE64 or :data=@FILE");
    if (!isStorableText(text))
        refuse("the value of " + inQuotes(key) +
               " has a control character, which a data file cannot hold; give it as " + escaped(key) +
               ":data=BASE64 or :data=@FILE");
    return makeString(text);
}

Ref<CSKavellTypeRef> readInteger(const std::string &key, std::string_view text)
{
    const bool plus = text.starts_with('+') && !text.starts_with("+-");
    int64_t value = 0;
    const std::from_chars_result end = std::from_chars(text.data() + (plus ? 1 : 0), text.data() + text.size(), value);
    if (end.ec != std::errc() || end.ptr != text.data() + text.size())
        refuse("the value of " + inQuotes(key) + ", " + inQuotes(text) + ", is no whole number from " +
               std::to_string(INT64_MIN) + " to " + std::to_string(INT64_MAX) + "; write it like " + escaped(key) +
               ":int=993");
    return adopt(CSKavellNumberCreateWithInt64(value));
}

Ref<CSKavellTypeRef> readReal(const std::string &key, std::string_view text)
{
    if (const auto value = parseReal(text))
        return adopt(CSKavellNumberCreateWithDouble(*value));
    refuse("the value of " + inQuotes(key) + ", " + inQuotes(text) + ", is no real number; write it like " +
           escaped(key) + ":real=1.5");
}

Ref<CSKavellTypeRef> readBoolean(const std::string &key, std::string_view text)
{
    constexpr std::array<std::pair<std::string_view, bool>, 6> words{
        {{"true", true}, {"false", false}, {"yes", true}, {"no", false}, {"on", true}, {"off", false}}};
    for (const auto &[word, value] : words)
        if (word == text)
            return retain(CSKavellBooleanGetShared(value));
    refuse("the value of " + inQuotes(key) + ", " + inQuotes(text) + ", is neither true nor false; write " +
           escaped(key) + ":bool=true or " + escaped(key) + ":bool=false");
}

Ref<CSKavellTypeRef> readDate(const std::string &key, std::string_view text)
{
    const std::optional<int64_t> date = parseDate(text);
    if (!date)
        refuse("the value of " + inQuotes(key) + ", " + inQuotes(text) + ", is no date; write it like " + escaped(key) +
               ":date=2026-01-31T10:00:00Z");
    if (!isStorableDate(*date))
        refuse("the value of " + inQuotes(key) + ", " + inQuotes(text) +
               ", is outside the dates that a data file can hold, 1932-12-13T20:45:52Z to 2069-01-19T03:14:07Z");
    return adopt(CSKavellDateCreate(*date));
}

// A data file has room for 32 MiB, and keeps data as base64, a third longer.
constexpr size_t largestData = size_t{16} << 20;

Ref<CSKavellTypeRef> readData(const std::string &key, std::string_view text)
{
    if (text.starts_with('@')) {
        const std::string contents = readInputFile(std::string(text.substr(1)));
        if (contents.size() > largestData)
            refuse("the value of " + inQuotes(key) + ", the file " + inQuotes(text.substr(1)) +
                   ", is larger than the 16 MiB that an attribute may have");
        return adopt(CSKavellDataCreate(contents.data(), contents.size()));
    }
    if (const auto bytes = parseBase64(text))
        return adopt(CSKavellDataCreate(bytes->data(), bytes->size()));
    refuse("the value of " + inQuotes(key) + " is not base64; write it like " + escaped(key) + ":data=aGVsbG8= or " +
           escaped(key) + ":data=@FILE");
}

Ref<CSKavellTypeRef> readJson(const std::string &key, std::string_view text)
{
    const std::string place = "the value of " + inQuotes(key);
    if (text.starts_with('@'))
        return valueOf(parseJson(readInputFile(std::string(text.substr(1))), place), place);
    return valueOf(parseJson(text, place), place);
}

Ref<CSKavellTypeRef> readArray(const std::string &key, std::string_view text)
{
    Ref<CSKavellTypeRef> value = readJson(key, text);
    if (CSKavellGetTypeID(value.get()) != CSKavellArrayGetTypeID())
        refuse("the value of " + inQuotes(key) + " is no JSON array; write it like " + escaped(key) +
               ":array='[\"a\", \"b\"]'");
    return value;
}

Ref<CSKavellTypeRef> readDictionary(const std::string &key, std::string_view text)
{
    Ref<CSKavellTypeRef> value = readJson(key, text);
    if (CSKavellGetTypeID(value.get()) != CSKavellDictionaryGetTypeID())
        refuse("the value of " + inQuotes(key) + " is no JSON object; write it like " + escaped(key) +
               ":dict='{\"a\": 1}'");
    return value;
}

struct ValueType {
    std::string_view word;
    Reader read;
};

constexpr std::array<ValueType, 9> valueTypes{{{"string", readString},
                                               {"int", readInteger},
                                               {"real", readReal},
                                               {"bool", readBoolean},
                                               {"date", readDate},
                                               {"data", readData},
                                               {"json", readJson},
                                               {"array", readArray},
                                               {"dict", readDictionary}}};

Reader readerOf(std::string_view word)
{
    for (const ValueType &type : valueTypes)
        if (type.word == word)
            return type.read;
    return nullptr;
}

/// Whether what stands behind a colon reads like a type, so that a mistyped one is not taken for a part of the key.
bool looksLikeType(std::string_view word)
{
    return !word.empty() &&
           std::all_of(word.begin(), word.end(), [](char letter) { return letter >= 'a' && letter <= 'z'; });
}

/// Whether the end of a key would be read as a type, so that a string under it needs one of its own.
bool endsLikeType(std::string_view key)
{
    const size_t colon = key.rfind(':');
    return colon != key.npos && looksLikeType(key.substr(colon + 1));
}

[[noreturn]] void refuseType(std::string_view type, std::string_view word)
{
    std::vector<std::string_view> known;
    for (const ValueType &each : valueTypes)
        known.push_back(each.word);
    const std::string_view near = nearestWord(type, known);
    refuse("unknown type " + inQuotes(type) + " in " + inQuotes(word) +
           (near.empty() ? "" : " (did you mean " + inQuotes(near) + "?)") + "; known are " + joined(known, ", "));
}

std::string dataText(std::string_view key, CSKavellDataRef data)
{
    const size_t length = CSKavellDataGetLength(data);
    if (length > longestShownData)
        return std::string(key) + ":data=(" + std::to_string(length) + " bytes)";
    return std::string(key) + ":data=" + formatBase64({CSKavellDataGetBytes(data), length});
}

std::string numberText(std::string_view key, CSKavellNumberRef number)
{
    if (CSKavellNumberIsReal(number))
        return std::string(key) + ":real=" + formatReal(CSKavellNumberGetDouble(number));
    return std::string(key) + ":int=" +
           (CSKavellNumberIsUnsigned(number) ? std::to_string(CSKavellNumberGetUInt64(number))
                                             : std::to_string(CSKavellNumberGetInt64(number)));
}

}  // namespace

std::string parseKey(std::string_view word)
{
    if (word.empty())
        refuse("an attribute key is missing; write KEY=VALUE, such as server=imap.example.org");
    if (!isUTF8(word) || hasControlCharacter(word))
        refuse("the attribute key " + inQuotes(word) + " has a control character or is not UTF-8; choose another");
    if (!isStorableText(word))
        refuse("the attribute key " + inQuotes(word) + " has a character that a data file cannot hold; choose another");
    std::string key = attributeKeyOf(word);
    if (key == passwordReferenceKey)
        refuse("the attribute " + inQuotes(key) +
               " refers to the password; change it with 'kavell-accounts password set' or 'password remove'");
    return key;
}

Assignment parseAssignment(std::string_view word)
{
    const size_t equals = word.find('=');
    if (equals == word.npos)
        refuse("the word " + inQuotes(word) + " is no attribute; write KEY=VALUE, such as server=imap.example.org");
    std::string_view key = word.substr(0, equals);
    Reader read = readString;
    const size_t colon = key.rfind(':');
    if (colon != key.npos) {
        const std::string_view type = key.substr(colon + 1);
        if (Reader named = readerOf(type)) {
            read = named;
            key = key.substr(0, colon);
        } else if (looksLikeType(type)) {
            refuseType(type, key);
        }
    }
    std::string fullKey = parseKey(key);
    Ref<CSKavellTypeRef> value = read(std::string(key), word.substr(equals + 1));
    return {std::move(fullKey), std::move(value)};
}

std::string assignmentText(std::string_view key, CSKavellTypeRef value)
{
    const std::string shown = escaped(shortAttributeKey(key));
    const CSKavellTypeID type = CSKavellGetTypeID(value);
    if (type == CSKavellStringGetTypeID())
        return shown + (endsLikeType(shown) ? ":string=" : "=") +
               escaped(toStringView(static_cast<CSKavellStringRef>(value)));
    if (type == CSKavellNumberGetTypeID())
        return numberText(shown, static_cast<CSKavellNumberRef>(value));
    if (type == CSKavellBooleanGetTypeID())
        return shown + ":bool=" + (CSKavellBooleanGetValue(static_cast<CSKavellBooleanRef>(value)) ? "true" : "false");
    if (type == CSKavellDateGetTypeID())
        return shown + ":date=" + formatDate(CSKavellDateGetSeconds(static_cast<CSKavellDateRef>(value)));
    if (type == CSKavellDataGetTypeID())
        return dataText(shown, static_cast<CSKavellDataRef>(value));
    std::string json = textOf(jsonOf(value), true);
    json.pop_back();
    return shown + ":json=" + escaped(json);
}

}  // namespace kavell::tools
