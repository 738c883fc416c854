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

/// Equality of two strings of which neither is none.
[[nodiscard]] inline bool equalStrings(const CSKavellString &first, const CSKavellString &second) noexcept
{
    return first.length == second.length && std::memcmp(first.text(), second.text(), first.length) == 0;
}

}  // namespace kavell

#endif
