// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tools/settings_words.h"

#include <array>
#include <cstdio>
#include <vector>

#include <kavellaccounts/CSKavellPropertyList.h>

#include "tools/assignment.h"
#include "tools/failure.h"
#include "tools/files.h"
#include "tools/text.h"

namespace kavell::tools {

namespace {

constexpr char addressKey[] = "emailAddress";
constexpr char serverKey[] = "serverAddress";

constexpr std::array<std::string_view, 9> keys{addressKey,           "userName",         serverKey,
                                               "incomingMailServer", "KAAccountTypeKey", "serverRootPath",
                                               "KAChatAccountType",  "KAChatLoginName",  "KAChatServer"};

bool looksLikeFile(const std::string &word)
{
    return word == "-" || word.find('/') != std::string::npos || word.ends_with(".plist") || word.ends_with(".json");
}

Json settingsInFile(const std::string &path)
{
    const std::string contents = readInputFile(path);
    if (const auto dictionary = adopt(CSKavellPropertyListCreateDictionary(contents.data(), contents.size())))
        return plainJson(dictionary.get());
    const Json json = parseJson(contents, path);
    if (!json.is_object())
        refuse(inQuotes(path) + " holds no settings: a property list or a JSON object is needed");
    return json;
}

/// The key of a KEY=VALUE word as it stands, without a type; empty when the word is none.
std::string keyOf(const std::string &word)
{
    const size_t equals = word.find('=');
    return equals == std::string::npos ? std::string() : word.substr(0, std::min(equals, word.find(':')));
}

/// A server address: letters, digits, dots and the like, with a path perhaps.
bool looksLikeServer(const std::string &word)
{
    return !word.empty() && word.find_first_of(" \t\n\"'<>\\") == std::string::npos && word.front() != '-';
}

std::string duration(double microseconds)
{
    char text[32];
    if (microseconds < 1000)
        std::snprintf(text, sizeof text, "%.1f us", microseconds);
    else
        std::snprintf(text, sizeof text, "%.1f ms", microseconds / 1000);
    return text;
}

}  // namespace

Json settingsOf(const Words &words)
{
    if (words.empty())
        refuse("settings are missing: an address, a server, a file or KEY=VALUE");
    Json settings = Json::object();
    for (const std::string &word : words) {
        if (const std::string key = keyOf(word); !key.empty())
            settings[key] = jsonOf(parseAssignment(word).value.get());
        else if (looksLikeFile(word))
            settings.update(settingsInFile(word));
        else if (word.find('@') != std::string::npos)
            settings[addressKey] = word;
        else if (looksLikeServer(word))
            settings[serverKey] = word;
        else
            refuse(inQuotes(word) + " is no address, server, file or KEY=VALUE");
    }
    return settings;
}

std::span<const std::string_view> settingKeys()
{
    return keys;
}

std::string textMember(const Json &object, const char *key, std::string_view missing)
{
    const auto found = object.find(key);
    return found != object.end() && found->is_string() ? escaped(found->get<std::string>()) : std::string(missing);
}

std::string stepsTable(const Json &steps)
{
    if (steps.empty())
        return "Nothing was asked: the settings lack what the rules look at.\n";
    std::vector<std::vector<std::string>> rows{{"RULE", "ASKED ABOUT", "ANSWER", "TIME"}};
    for (const Json &step : steps) {
        rows.push_back({textMember(step, "rule", ""), textMember(step, "askedAbout", "-"),
                        textMember(step, "answer", "-"), duration(step.value("microseconds", 0.0))});
    }
    return alignedTable(rows);
}

}  // namespace kavell::tools
