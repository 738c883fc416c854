// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The structure of strings, for constants and for code that makes many of them.

#ifndef KAVELL_RUNTIME_STRING_P_H
#define KAVELL_RUNTIME_STRING_P_H

#include <algorithm>
#include <cstring>
#include <string_view>

#include <kavellaccounts/CSKavellString.h>

#include "runtime/object_block.h"
#include "runtime/object_p.h"

/// The text follows the structure, with its terminator.
struct CSKavellString : kavell::Object {
    uint32_t length;
    /// Made when it is first asked for; 0 until then. Most strings are values and are never asked.
    mutable std::atomic<uint32_t> cachedHash;

    [[nodiscard]] const char *text() const noexcept { return reinterpret_cast<const char *>(this + 1); }
    [[nodiscard]] char *text() noexcept { return reinterpret_cast<char *>(this + 1); }
    [[nodiscard]] std::string_view view() const noexcept { return {text(), length}; }
    [[nodiscard]] uint32_t hash() const noexcept;
};

namespace kavell {

/// A hash of text, eight bytes a step (the multiply-and-fold step of the public-domain hash wyhash); never 0, which
/// means "not made yet".
[[nodiscard]] uint32_t hashOfText(std::string_view text) noexcept;

/// A string that the compiler lays out: usable before main, never freed.
template <size_t Size> struct ConstantString {
    CSKavellString header;
    char text[Size];

    constexpr ConstantString(const char (&literal)[Size]) noexcept
        : header{{{kImmortal}, kTypeString, 0}, static_cast<uint32_t>(Size - 1), {0}}, text{}
    {
        std::copy(literal, literal + Size, text);
    }
};

static_assert(sizeof(CSKavellString) == 16, "the text of a constant follows its header without a gap");

/// A string of text that is known to be UTF-8; none when there is no memory for it.
[[nodiscard]] CSKavellStringRef makeValidString(const CSKavellAllocator *allocator, std::string_view text) noexcept;
[[nodiscard]] CSKavellStringRef makeValidString(ObjectBlock &block, std::string_view text) noexcept;

/// Whether the first and the last bytes of two texts of one length, as many as a Word has, are equal.
template <typename Word> [[nodiscard]] bool equalEnds(const char *first, const char *second, size_t length) noexcept
{
    Word ends[4];
    std::memcpy(&ends[0], first, sizeof(Word));
    std::memcpy(&ends[1], second, sizeof(Word));
    std::memcpy(&ends[2], first + length - sizeof(Word), sizeof(Word));
    std::memcpy(&ends[3], second + length - sizeof(Word), sizeof(Word));
    return ends[0] == ends[1] && ends[2] == ends[3];
}

/// Equality of texts. Most are keys, which are short, and the call of a library function would cost more than comparing
/// them.
[[nodiscard]] inline bool equalTexts(std::string_view first, std::string_view second) noexcept
{
    const size_t length = first.size();
    if (length != second.size())
        return false;
    const char *const one = first.data(), *const other = second.data();
    if (length > 16)
        return std::memcmp(one, other, length) == 0;
    if (length >= 8)
        return equalEnds<uint64_t>(one, other, length);
    if (length >= 4)
        return equalEnds<uint32_t>(one, other, length);
    return length == 0 ||
           (one[0] == other[0] && one[length / 2] == other[length / 2] && one[length - 1] == other[length - 1]);
}

/// Equality of two strings of which neither is none.
[[nodiscard]] inline bool equalStrings(const CSKavellString &first, const CSKavellString &second) noexcept
{
    return equalTexts(first.view(), second.view());
}

}  // namespace kavell

#endif
