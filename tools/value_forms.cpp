// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tools/value_forms.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <chrono>
#include <cmath>
#include <cstdio>

namespace kavell::tools {

namespace {

constexpr std::string_view base64Digits = "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789+/";

constexpr int64_t secondsTo2001 = 978307200;

/// Takes a number of exactly `digits` digits off the text.
std::optional<int> takeNumber(std::string_view &text, size_t digits)
{
    if (text.size() < digits)
        return std::nullopt;
    int number = 0;
    for (const char digit : text.substr(0, digits)) {
        if (digit < '0' || digit > '9')
            return std::nullopt;
        number = number * 10 + (digit - '0');
    }
    text.remove_prefix(digits);
    return number;
}

bool take(std::string_view &text, char expected)
{
    if (text.empty() || text.front() != expected)
        return false;
    text.remove_prefix(1);
    return true;
}

/// "HH:MM" as seconds.
std::optional<int64_t> takeHoursAndMinutes(std::string_view &text)
{
    const std::optional<int> hours = takeNumber(text, 2);
    if (!hours || *hours > 23 || !take(text, ':'))
        return std::nullopt;
    const std::optional<int> minutes = takeNumber(text, 2);
    if (!minutes || *minutes > 59)
        return std::nullopt;
    return *hours * 3600 + *minutes * 60;
}

/// "Z", "+HH:MM" or "-HH:MM", as seconds east of UTC.
std::optional<int64_t> takeOffset(std::string_view &text)
{
    if (take(text, 'Z'))
        return 0;
    const bool west = take(text, '-');
    if (!west && !take(text, '+'))
        return std::nullopt;
    const std::optional<int64_t> offset = takeHoursAndMinutes(text);
    if (!offset)
        return std::nullopt;
    return west ? -*offset : *offset;
}

/// "YYYY-MM-DD" as seconds since 1970.
std::optional<int64_t> takeDay(std::string_view &text)
{
    const std::optional<int> year = takeNumber(text, 4);
    const std::optional<int> month = year && take(text, '-') ? takeNumber(text, 2) : std::nullopt;
    const std::optional<int> day = month && take(text, '-') ? takeNumber(text, 2) : std::nullopt;
    if (!day)
        return std::nullopt;
    const std::chrono::year_month_day date{std::chrono::year(*year), std::chrono::month(static_cast<unsigned>(*month)),
                                           std::chrono::day(static_cast<unsigned>(*day))};
    if (!date.ok())
        return std::nullopt;
    return int64_t{std::chrono::sys_days(date).time_since_epoch().count()} * 86400;
}

}  // namespace

std::optional<int64_t> parseDate(std::string_view text)
{
    const std::optional<int64_t> day = takeDay(text);
    if (!day || text.empty())
        return day;
    if (!take(text, 'T'))
        return std::nullopt;
    const std::optional<int64_t> time = takeHoursAndMinutes(text);
    if (!time || !take(text, ':'))
        return std::nullopt;
    const std::optional<int> seconds = takeNumber(text, 2);
    if (!seconds || *seconds > 59)
        return std::nullopt;
    const std::optional<int64_t> offset = takeOffset(text);
    if (!offset || !text.empty())
        return std::nullopt;
    return *day + *time + *seconds - *offset;
}

std::string formatDate(int64_t secondsSince1970)
{
    using namespace std::chrono;
    const sys_seconds moment{seconds(secondsSince1970)};
    const sys_days day = floor<days>(moment);
    const year_month_day date(day);
    const hh_mm_ss<seconds> time(moment - day);
    std::array<char, 64> buffer;
    std::snprintf(buffer.data(), buffer.size(), "%04d-%02u-%02uT%02ld:%02ld:%02ldZ", static_cast<int>(date.year()),
                  static_cast<unsigned>(date.month()), static_cast<unsigned>(date.day()),
                  static_cast<long>(time.hours().count()), static_cast<long>(time.minutes().count()),
                  static_cast<long>(time.seconds().count()));
    return buffer.data();
}

bool isStorableDate(int64_t secondsSince1970)
{
    return secondsSince1970 >= INT32_MIN + secondsTo2001 && secondsSince1970 <= INT32_MAX + secondsTo2001;
}

std::optional<std::vector<uint8_t>> parseBase64(std::string_view text)
{
    std::vector<uint8_t> bytes;
    uint32_t bits = 0;
    size_t digits = 0;
    size_t padding = 0;
    for (const char letter : text) {
        if (letter == ' ' || letter == '\n' || letter == '\r' || letter == '\t')
            continue;
        if (letter == '=') {
            ++padding;
            continue;
        }
        const size_t digit = base64Digits.find(letter);
        if (digit == base64Digits.npos || padding > 0)
            return std::nullopt;
        bits = (bits << 6) | static_cast<uint32_t>(digit);
        if (++digits % 4 != 1)
            bytes.push_back(static_cast<uint8_t>(bits >> (6 - 2 * ((digits - 1) % 4))));
    }
    const size_t wanted = (4 - digits % 4) % 4;
    if (wanted == 3 || padding != wanted)
        return std::nullopt;
    return bytes;
}

std::string formatBase64(std::span<const uint8_t> bytes)
{
    std::string text;
    text.reserve((bytes.size() + 2) / 3 * 4);
    for (size_t index = 0; index < bytes.size(); index += 3) {
        const size_t count = std::min<size_t>(3, bytes.size() - index);
        uint32_t bits = 0;
        for (size_t offset = 0; offset < 3; ++offset)
            bits = (bits << 8) | (offset < count ? bytes[index + offset] : 0U);
        for (size_t digit = 0; digit < 4; ++digit)
            text += digit <= count ? base64Digits[(bits >> (18 - 6 * digit)) & 0x3FU] : '=';
    }
    return text;
}

std::string formatReal(double value)
{
    std::array<char, 64> buffer;
    const std::to_chars_result end = std::to_chars(buffer.data(), buffer.data() + buffer.size(), value);
    std::string text(buffer.data(), end.ptr);
    if (text.find_first_not_of("-0123456789") == text.npos)
        text += ".0";
    return text;
}

std::optional<double> parseReal(std::string_view text)
{
    double value = 0;
    if (!text.empty() && text.front() == '+')
        text.remove_prefix(1);
    const std::from_chars_result end = std::from_chars(text.data(), text.data() + text.size(), value);
    if (text.empty() || end.ec != std::errc() || end.ptr != text.data() + text.size() || !std::isfinite(value))
        return std::nullopt;
    return value;
}

}  // namespace kavell::tools
