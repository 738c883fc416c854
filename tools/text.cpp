// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tools/text.h"

#include <algorithm>
#include <array>
#include <cerrno>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <unistd.h>
#include <utility>

#include "tools/failure.h"

namespace kavell::tools {

namespace {

constexpr char32_t invalid = 0xFFFFFFFF;

struct Range {
    char32_t first;
    char32_t last;
};

// Marks that stand on the letter before them, and characters without a width.
constexpr std::array<Range, 8> zeroWidth{{{0x0300, 0x036F},
                                          {0x0483, 0x0489},
                                          {0x0591, 0x05BD},
                                          {0x1AB0, 0x1AFF},
                                          {0x1DC0, 0x1DFF},
                                          {0x200B, 0x200D},
                                          {0x20D0, 0x20FF},
                                          {0xFE00, 0xFE0F}}};

// East Asian wide and full-width characters and pictures (Unicode Standard Annex 11, in large blocks).
constexpr std::array<Range, 10> doubleWidth{{{0x1100, 0x115F},
                                             {0x2E80, 0x303E},
                                             {0x3041, 0x33FF},
                                             {0x3400, 0x4DBF},
                                             {0x4E00, 0x9FFF},
                                             {0xA000, 0xA4CF},
                                             {0xAC00, 0xD7A3},
                                             {0xF900, 0xFAFF},
                                             {0xFF00, 0xFF60},
                                             {0x1F300, 0x1FAFF}}};

// What could steer a terminal or make a line read otherwise than it is: C0, DEL and C1, line and paragraph separators,
// and the characters that turn the direction of writing.
constexpr std::array<Range, 6> steering{
    {{0x00, 0x1F}, {0x7F, 0x9F}, {0x200E, 0x200F}, {0x2028, 0x202E}, {0x2066, 0x2069}, {0xFEFF, 0xFEFF}}};

bool isIn(char32_t character, std::span<const Range> ranges)
{
    return std::any_of(ranges.begin(), ranges.end(),
                       [&](const Range &range) { return character >= range.first && character <= range.last; });
}

bool isControl(char32_t character)
{
    return character < 0x20 || (character >= 0x7F && character <= 0x9F);
}

/// How many bytes a character has that begins with this one; 0 when none does.
size_t lengthOfCharacter(unsigned char lead)
{
    constexpr std::array<std::pair<unsigned char, size_t>, 5> lengthsBelow{
        {{0x80, 1}, {0xC2, 0}, {0xE0, 2}, {0xF0, 3}, {0xF5, 4}}};
    const auto row = std::find_if(lengthsBelow.begin(), lengthsBelow.end(),
                                  [lead](const auto &lengthBelow) { return lead < lengthBelow.first; });
    return row != lengthsBelow.end() ? row->second : 0;
}

/// Takes the next character off the text; `invalid`, and one byte less, where the bytes are not UTF-8 (RFC 3629).
char32_t takeCharacter(std::string_view &text)
{
    const auto lead = static_cast<unsigned char>(text.front());
    const size_t length = lengthOfCharacter(lead);
    constexpr std::array<char32_t, 5> smallest{0, 0, 0x80, 0x800, 0x10000};
    char32_t character = length == 1 ? lead : lead & (0x7FU >> length);
    bool valid = length > 0 && length <= text.size();
    for (size_t index = 1; valid && index < length; ++index) {
        const auto next = static_cast<unsigned char>(text[index]);
        valid = (next & 0xC0U) == 0x80;
        character = (character << 6) | (next & 0x3FU);
    }
    valid =
        valid && character >= smallest[length] && character <= 0x10FFFF && (character < 0xD800 || character > 0xDFFF);
    text.remove_prefix(valid ? length : 1);
    return valid ? character : invalid;
}

template <typename Predicate> bool everyCharacter(std::string_view text, Predicate holds)
{
    while (!text.empty())
        if (!holds(takeCharacter(text)))
            return false;
    return true;
}

std::string escapeOf(char32_t character)
{
    if (character == '\n')
        return "\\n";
    if (character == '\t')
        return "\\t";
    if (character == '\r')
        return "\\r";
    std::array<char, 16> buffer;
    std::snprintf(buffer.data(), buffer.size(), character < 0x100 ? "\\x%02x" : "\\u{%x}",
                  static_cast<unsigned>(character));
    return buffer.data();
}

}  // namespace

bool isUTF8(std::string_view text)
{
    return everyCharacter(text, [](char32_t character) { return character != invalid; });
}

bool hasControlCharacter(std::string_view text)
{
    return !everyCharacter(text, [](char32_t character) { return !isControl(character); });
}

bool isStorableText(std::string_view text)
{
    return everyCharacter(text, [](char32_t character) {
        const bool control = character < 0x20 && character != '\t' && character != '\n' && character != '\r';
        return !control && character != 0xFFFE && character != 0xFFFF && character != invalid;
    });
}

std::string escaped(std::string_view text)
{
    std::string result;
    result.reserve(text.size());
    while (!text.empty()) {
        const std::string_view before = text;
        const char32_t character = takeCharacter(text);
        if (character == invalid)
            result += escapeOf(static_cast<unsigned char>(before.front()));
        else if (isIn(character, steering))
            result += escapeOf(character);
        else if (character == '\\' && !text.empty() &&
                 std::string_view("ntrxu\\").find(text.front()) != std::string_view::npos)
            result += "\\\\";
        else
            result += before.substr(0, before.size() - text.size());
    }
    return result;
}

std::string inQuotes(std::string_view text)
{
    std::string quoted = "'";
    quoted.append(escaped(text)).append("'");
    return quoted;
}

std::string joined(std::span<const std::string_view> words, std::string_view separator)
{
    std::string result;
    for (const std::string_view word : words) {
        if (!result.empty())
            result += separator;
        result += word;
    }
    return result;
}

size_t displayWidth(std::string_view text)
{
    size_t width = 0;
    while (!text.empty()) {
        const char32_t character = takeCharacter(text);
        width += isIn(character, zeroWidth) ? 0 : isIn(character, doubleWidth) ? 2 : 1;
    }
    return width;
}

std::string alignedTable(const std::vector<std::vector<std::string>> &rows, std::string_view indent)
{
    std::vector<size_t> widths;
    for (const std::vector<std::string> &row : rows) {
        widths.resize(std::max(widths.size(), row.size()));
        for (size_t column = 0; column < row.size(); ++column)
            widths[column] = std::max(widths[column], displayWidth(row[column]));
    }
    std::string table;
    for (const std::vector<std::string> &row : rows) {
        std::string line(indent);
        for (size_t column = 0; column < row.size(); ++column) {
            line += row[column];
            line.append(widths[column] - displayWidth(row[column]) + 2, ' ');
        }
        line.erase(line.find_last_not_of(' ') + 1);
        table += line + "\n";
    }
    return table;
}

std::string bold(std::string_view text)
{
    static const bool wanted = isatty(STDOUT_FILENO) != 0 && std::getenv("NO_COLOR") == nullptr;
    return wanted ? "\033[1m" + std::string(text) + "\033[0m" : std::string(text);
}

void print(std::string_view text)
{
    while (!text.empty()) {
        const ssize_t written = write(STDOUT_FILENO, text.data(), text.size());
        if (written < 0 && errno == EINTR)
            continue;
        if (written < 0)
            throw Failure(ExitCode::Failed, std::string("cannot write to standard output: ") + std::strerror(errno));
        text.remove_prefix(static_cast<size_t>(written));
    }
}

void complain(std::string_view sentence)
{
    const std::string line = "kavell-accounts: " + std::string(sentence) + "\n";
    std::fputs(line.c_str(), stderr);
}

}  // namespace kavell::tools
