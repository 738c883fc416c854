// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "plugins/KADNSServiceNames_p.h"

namespace {

constexpr size_t kLongestLabel = 63;
constexpr uint8_t kFirstPlainByte = 33;

/// How many characters a byte of a label takes.
size_t textLength(uint8_t byte, char escape)
{
    if (escape == 0)
        return 1;
    if (byte == '.' || byte == static_cast<uint8_t>(escape))
        return 2;
    return byte < kFirstPlainByte ? 4 : 1;
}

char *appendByte(char *text, uint8_t byte, char escape)
{
    const size_t length = textLength(byte, escape);
    if (length > 1)
        *text++ = escape;
    if (length == 4) {
        *text++ = static_cast<char>('0' + byte / 100);
        *text++ = static_cast<char>('0' + byte / 10 % 10);
        *text++ = static_cast<char>('0' + byte % 10);
    } else {
        *text++ = static_cast<char>(byte);
    }
    return text;
}

}  // namespace

char *_KADNSServiceConvertDomainLabelToCString_withescape(const uint8_t *label, char *text, const char *end,
                                                          char escape)
{
    const size_t length = *label;
    if (length > kLongestLabel)
        return nullptr;
    for (const uint8_t *byte = label + 1; byte != label + 1 + length; ++byte) {
        if (static_cast<size_t>(end - text) < textLength(*byte, escape))
            return nullptr;
        text = appendByte(text, *byte, escape);
    }
    return text;
}

char *_KADNSServiceConvertDomainNameToCString_withescape(const KADNSServiceWireName &name, KADNSServiceNameText &text,
                                                         char escape)
{
    char *out = text.data();
    const char *const end = text.data() + text.size() - 1;  // the closing NUL has the last place
    if (name[0] == 0)
        *out++ = '.';
    for (size_t at = 0; name[at] != 0;) {
        const size_t next = at + 1 + name[at];
        if (next >= name.size())  // the closing root label would lie outside
            return nullptr;
        out = _KADNSServiceConvertDomainLabelToCString_withescape(&name[at], out, end, escape);
        if (!out || out == end)
            return nullptr;
        *out++ = '.';
        at = next;
    }
    *out = 0;
    return out;
}
