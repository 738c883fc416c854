// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tools/names.h"

#include <algorithm>
#include <array>
#include <vector>

#include "tools/failure.h"
#include "tools/text.h"

namespace kavell::tools {

namespace {

/// The longest name that is still a file name with ".plist" behind it.
constexpr size_t longestName = 249;

// The values are written out here because three provider types (quillane, aol, haldenserver) have no constant in the
// store.
constexpr std::array<ShortName, 13> providerTable{{
    {"yahoo", "com.corvane.account.yahoo"},
    {"google", "com.corvane.account.google"},
    {"nimbrel", "com.corvane.account.nimbrel"},
    {"quillane", "com.corvane.account.placeholder"},
    {"facebook", "com.corvane.account.facebook"},
    {"exchange", "com.corvane.account.exchange"},
    {"aol", "com.corvane.account.aol"},
    {"mail", "com.corvane.account.mail"},
    {"cardell", "com.corvane.account.cardell"},
    {"parlex", "com.corvane.account.parlex"},
    {"tidewell", "com.corvane.account.tidewell"},
    {"haldenserver", "com.corvane.account.haldenserver"},
    {"test", "com.corvane.account.testing"},
}};

constexpr std::array<ShortName, 9> serviceTable{{
    {"Mail", "com.corvane.service.Mail"},
    {"POPMail", "com.corvane.service.POPMail"},
    {"IMAPMail", "com.corvane.service.IMAPMail"},
    {"Photos", "com.corvane.service.Photos"},
    {"LDAP", "com.corvane.service.LDAP"},
    {"CardDAV", "com.corvane.service.CardDAV"},
    {"CalDAV", "com.corvane.service.CalDAV"},
    {"Jabber", "com.corvane.service.Jabber"},
    {"VoIP", "com.corvane.service.VoIP"},
}};

constexpr std::array<ShortName, 9> attributeTable{{
    {"server", "com.corvane.Server"},
    {"port", "com.corvane.Port"},
    {"path", "com.corvane.path"},
    {"smtpServer", "com.corvane.smtpServer"},
    {"smtpPort", "com.corvane.smtpPort"},
    {"uid", "com.corvane.uid"},
    {"fullname", "com.corvane.provider.fullname"},
    {"nickname", "com.corvane.provider.nickname"},
    {"picture", "com.corvane.provider.picture"},
}};

char lowered(char letter)
{
    return letter >= 'A' && letter <= 'Z' ? static_cast<char>(letter + ('a' - 'A')) : letter;
}

bool equalInAnyCase(std::string_view left, std::string_view right)
{
    return std::equal(left.begin(), left.end(), right.begin(), right.end(),
                      [](char one, char other) { return lowered(one) == lowered(other); });
}

/// How many letters have to be added, dropped, replaced or swapped with their neighbour (optimal string alignment).
size_t editDistance(std::string_view from, std::string_view to)
{
    std::vector<std::vector<size_t>> distance(from.size() + 1, std::vector<size_t>(to.size() + 1));
    for (size_t line = 0; line <= from.size(); ++line)
        for (size_t column = 0; column <= to.size(); ++column) {
            if (line == 0 || column == 0) {
                distance[line][column] = line + column;
                continue;
            }
            const auto same = [&](size_t one, size_t other) {
                return lowered(from[one - 1]) == lowered(to[other - 1]);
            };
            const size_t replaced = distance[line - 1][column - 1] + (same(line, column) ? 0 : 1);
            size_t best = std::min({replaced, distance[line - 1][column] + 1, distance[line][column - 1] + 1});
            if (line > 1 && column > 1 && same(line, column - 1) && same(line - 1, column))
                best = std::min(best, distance[line - 2][column - 2] + 1);
            distance[line][column] = best;
        }
    return distance.back().back();
}

/// Whether a word reads like a full name, such as "org.example.account.forum": parts that are not empty between dots.
bool looksLikeReverseDNS(std::string_view word)
{
    return word.find('.') != word.npos && word.front() != '.' && word.back() != '.' && word.find("..") == word.npos;
}

std::vector<std::string_view> wordsOf(std::span<const ShortName> table)
{
    std::vector<std::string_view> words;
    for (const ShortName &entry : table)
        words.push_back(entry.word);
    return words;
}

std::string valueOf(std::string_view word, std::span<const ShortName> table, const std::string &what)
{
    for (const ShortName &entry : table)
        if (equalInAnyCase(entry.word, word))
            return std::string(entry.value);
    checkName(word, what);
    if (looksLikeReverseDNS(word))
        return std::string(word);
    const std::vector<std::string_view> known = wordsOf(table);
    const std::string_view near = nearestWord(word, known);
    refuse("unknown " + what + " " + inQuotes(word) + (near.empty() ? "" : " (did you mean " + inQuotes(near) + "?)") +
           "; known are " + joined(known, ", ") + ", or a full name such as " + std::string(table.front().value));
}

std::string_view shortOf(std::string_view value, std::span<const ShortName> table)
{
    for (const ShortName &entry : table)
        if (entry.value == value)
            return entry.word;
    return value;
}

}  // namespace

std::span<const ShortName> providerTypes()
{
    return providerTable;
}

std::span<const ShortName> services()
{
    return serviceTable;
}

std::span<const ShortName> attributeKeys()
{
    return attributeTable;
}

std::string providerTypeOf(std::string_view word)
{
    return valueOf(word, providerTable, "provider type");
}

std::string serviceOf(std::string_view word)
{
    // Unlike a provider type, which is a directory's name only, a service stands inside the data file.
    if (isUTF8(word) && !hasControlCharacter(word) && !isStorableText(word))
        refuse("the service " + inQuotes(word) + " has a character that a data file cannot hold; choose another");
    return valueOf(word, serviceTable, "service");
}

std::string attributeKeyOf(std::string_view word)
{
    for (const ShortName &entry : attributeTable)
        if (entry.word == word)
            return std::string(entry.value);
    return std::string(word);
}

std::string_view shortProviderType(std::string_view value)
{
    return shortOf(value, providerTable);
}

std::string_view shortService(std::string_view value)
{
    return shortOf(value, serviceTable);
}

std::string_view shortAttributeKey(std::string_view value)
{
    return shortOf(value, attributeTable);
}

std::string nameProblem(std::string_view name)
{
    if (name.empty())
        return "is empty";
    if (!isUTF8(name))
        return "is not valid UTF-8";
    if (hasControlCharacter(name))
        return "contains a control character";
    if (name.find('/') != name.npos)
        return "contains a \"/\"";
    if (name == "." || name == "..")
        return "means a directory";
    if (name.size() > longestName)
        return "has " + std::to_string(name.size()) + " bytes, and at most " + std::to_string(longestName) +
               " are possible";
    return {};
}

void checkName(std::string_view name, std::string_view what)
{
    const std::string problem = nameProblem(name);
    if (problem.empty())
        return;
    const std::string subject =
        name.empty() || name.size() > longestName ? std::string() : std::string(" ").append(inQuotes(name));
    refuse("the " + std::string(what) + subject + " " + problem + "; it becomes a file's name, so choose another");
}

std::string_view nearestWord(std::string_view word, std::span<const std::string_view> candidates)
{
    constexpr size_t longestCompared = 64;
    std::string_view best;
    size_t bestDistance = std::max<size_t>(1, std::min<size_t>(word.size() / 2, 3)) + 1;
    if (word.size() > longestCompared)
        return best;
    for (const std::string_view candidate : candidates) {
        if (candidate.size() > longestCompared)
            continue;
        const size_t distance = editDistance(word, candidate);
        if (distance < bestDistance) {
            best = candidate;
            bestDistance = distance;
        }
    }
    return best;
}

}  // namespace kavell::tools
