// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Property-list values as JSON and back, without loss. Strings, booleans, integers, reals, arrays and dictionaries are
// JSON's own (a real always has a point or an exponent); what JSON has no word for is an object with one key:
//
//     {"$date": "2026-01-31T10:00:00Z"}   a date
//     {"$data": "aGVsbG8="}               bytes, in base64
//     {"$dict": { … }}                    a dictionary that itself has a key beginning with "$"
//
// Used by import, export, --json and the json type of the command line. One thread.

#ifndef KAVELL_TOOLS_JSON_VALUE_H
#define KAVELL_TOOLS_JSON_VALUE_H

#include <string>
#include <string_view>

#include <kavellaccounts/CSKavellBase.h>
#include <kavellaccounts/CSKavellDictionary.h>
#include <kavellaccounts/Ref.h>
#include <nlohmann/json.hpp>

namespace kavell::tools {

/// Objects keep the order of their keys, as data files do.
using Json = nlohmann::ordered_json;

/// The JSON object of a dictionary, keys as they are: for attributes, whose place says that they are no marked value.
[[nodiscard]] Json plainJson(CSKavellDictionaryRef dictionary);

/// The JSON form of a value of a data file.
[[nodiscard]] Json jsonOf(CSKavellTypeRef value);

/// The value of a JSON form. Refuses what a data file cannot hold, saying where: `place` begins the sentence.
[[nodiscard]] Ref<CSKavellTypeRef> valueOf(const Json &json, const std::string &place);

/// The dictionary of a JSON object; refuses anything else, and keys that cannot be attribute keys.
[[nodiscard]] Ref<CSKavellDictionaryRef> dictionaryOf(const Json &json, const std::string &place);

/// The parsed text; refuses text that is not JSON, with the line where it stops being so.
[[nodiscard]] Json parseJson(std::string_view text, const std::string &place);

/// The text of a JSON document, two blanks deep and ended by a line feed, or on one line; in either case without a
/// control character that a terminal would obey.
[[nodiscard]] std::string textOf(const Json &json, bool onOneLine = false);

}  // namespace kavell::tools

#endif
