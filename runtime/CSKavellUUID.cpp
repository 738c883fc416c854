// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/CSKavellUUID.h>

#include <array>
#include <cstring>
#include <sys/random.h>

#include "runtime/object_p.h"
#include "runtime/string_p.h"

namespace {

using UUIDBytes = std::array<uint8_t, 16>;

}  // namespace

struct CSKavellUUID : kavell::Object {
    UUIDBytes bytes;
};

namespace kavell {

namespace {

constexpr size_t kTextLength = 36;

constexpr bool isHyphenPlace(size_t place)
{
    return place == 8 || place == 13 || place == 18 || place == 23;
}

int hexDigit(char character)
{
    if (character >= '0' && character <= '9')
        return character - '0';
    const char lower = static_cast<char>(character | 0x20);
    return lower >= 'a' && lower <= 'f' ? lower - 'a' + 10 : -1;
}

bool parseUUID(std::string_view text, UUIDBytes &bytes)
{
    if (text.size() != kTextLength)
        return false;
    size_t digits = 0;
    for (size_t place = 0; place < kTextLength; ++place) {
        if (isHyphenPlace(place)) {
            if (text[place] != '-')
                return false;
            continue;
        }
        const int digit = hexDigit(text[place]);
        if (digit < 0)
            return false;
        bytes[digits / 2] = static_cast<uint8_t>(bytes[digits / 2] << 4 | digit);
        ++digits;
    }
    return true;
}

std::array<char, kTextLength> formatUUID(const UUIDBytes &bytes)
{
    constexpr char kDigits[] = "0123456789abcdef";
    std::array<char, kTextLength> text;
    size_t digits = 0;
    for (size_t place = 0; place < kTextLength; ++place) {
        if (isHyphenPlace(place)) {
            text[place] = '-';
            continue;
        }
        const uint8_t byte = bytes[digits / 2];
        text[place] = kDigits[digits % 2 == 0 ? byte >> 4 : byte & 15];
        ++digits;
    }
    return text;
}

bool uuidsEqual(CSKavellTypeRef first, CSKavellTypeRef second)
{
    return static_cast<CSKavellUUIDRef>(first)->bytes == static_cast<CSKavellUUIDRef>(second)->bytes;
}

uint64_t uuidHash(CSKavellTypeRef object)
{
    uint64_t hash;
    std::memcpy(&hash, static_cast<CSKavellUUIDRef>(object)->bytes.data(), sizeof hash);
    return hash;
}

void describeUUID(CSKavellTypeRef object, int, std::string &text)
{
    const auto written = formatUUID(static_cast<CSKavellUUIDRef>(object)->bytes);
    text.append(written.data(), written.size());
}

}  // namespace

constinit const TypeOperations uuidOperations{"CSKavellUUID", nullptr, nullptr, uuidsEqual, uuidHash, describeUUID};

}  // namespace kavell

using namespace kavell;

CSKavellTypeID CSKavellUUIDGetTypeID(void)
{
    return kTypeUUID;
}

CSKavellUUIDRef CSKavellUUIDCreate(void)
{
    UUIDBytes bytes;
    // Up to 256 bytes come whole and without a signal's interruption (getrandom(2)).
    if (getrandom(bytes.data(), bytes.size(), 0) != static_cast<ssize_t>(bytes.size()))
        return nullptr;
    // RFC 4122, section 4.4: version 4 and the variant in their places, all other bits random.
    bytes[6] = static_cast<uint8_t>((bytes[6] & 0x0F) | 0x40);
    bytes[8] = static_cast<uint8_t>((bytes[8] & 0x3F) | 0x80);
    return makeObject<CSKavellUUID>(nullptr, kTypeUUID, 0, bytes);
}

CSKavellUUIDRef CSKavellUUIDCreateFromString(CSKavellStringRef string)
{
    UUIDBytes bytes{};
    if (!string || !parseUUID(string->view(), bytes))
        return nullptr;
    return makeObject<CSKavellUUID>(nullptr, kTypeUUID, 0, bytes);
}

CSKavellStringRef CSKavellUUIDCopyString(CSKavellUUIDRef uuid)
{
    if (!uuid)
        return nullptr;
    const auto text = formatUUID(uuid->bytes);
    return makeValidString(nullptr, {text.data(), text.size()});
}
