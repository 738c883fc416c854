// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "runtime/utf8.h"

#include <cstdint>
#include <cstring>

namespace kavell {

namespace {

constexpr bool isContinuation(unsigned char byte) noexcept
{
    return (byte & 0xC0) == 0x80;
}

/// The length of the well-formed sequence that starts at `next`, or 0 (table 3-7 of the Unicode Standard).
size_t sequenceLength(const unsigned char *next, const unsigned char *end) noexcept
{
    const unsigned char lead = next[0];
    const auto left = static_cast<size_t>(end - next);
    if (lead < 0x80)
        return 1;
    if (lead >= 0xC2 && lead <= 0xDF)
        return left >= 2 && isContinuation(next[1]) ? 2 : 0;
    if (lead >= 0xE0 && lead <= 0xEF) {
        const unsigned char lowest = lead == 0xE0 ? 0xA0 : 0x80, highest = lead == 0xED ? 0x9F : 0xBF;
        return left >= 3 && next[1] >= lowest && next[1] <= highest && isContinuation(next[2]) ? 3 : 0;
    }
    if (lead >= 0xF0 && lead <= 0xF4) {
        const unsigned char lowest = lead == 0xF0 ? 0x90 : 0x80, highest = lead == 0xF4 ? 0x8F : 0xBF;
        return left >= 4 && next[1] >= lowest && next[1] <= highest && isContinuation(next[2]) &&
                       isContinuation(next[3])
                   ? 4
                   : 0;
    }
    return 0;
}

}  // namespace

bool isUTF8(std::string_view bytes) noexcept
{
    const auto *next = reinterpret_cast<const unsigned char *>(bytes.data());
    const unsigned char *end = next + bytes.size();
    while (next < end) {
        // Nearly all text is ASCII; eight bytes of it are passed over at once.
        uint64_t word;
        if (end - next >= 8 && (std::memcpy(&word, next, 8), (word & 0x8080808080808080u) == 0)) {
            next += 8;
            continue;
        }
        const size_t length = sequenceLength(next, end);
        if (length == 0)
            return false;
        next += length;
    }
    return true;
}

}  // namespace kavell
