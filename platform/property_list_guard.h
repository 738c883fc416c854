// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What must hold of an XML property list before the parser may see it. The parser trusts its input: a million unclosed
// tags exhaust its stack, a number followed by letters reads as the number, a broken date as 1970. Pure functions; any
// thread may call.

#ifndef KAVELL_PLATFORM_PROPERTY_LIST_GUARD_H
#define KAVELL_PLATFORM_PROPERTY_LIST_GUARD_H

#include <array>
#include <cstddef>
#include <cstdint>
#include <string_view>
#include <utility>

namespace kavell {

/// The largest document in bytes, far more than any honest one has. What is larger need not even be read.
inline constexpr size_t kLargestPropertyList = size_t{32} << 20;

/// How deep elements may stand in one another. The writer's recursion needs about 256 bytes of stack a level; this
/// leaves room on the smallest thread stacks in use.
inline constexpr int kDeepestPropertyList = 256;

/// How many keys all dictionaries of a document may have together, and how many bytes as they are written. The parser looks
/// keys up by a hash that is easy to make collide, in time that grows with the square of their number and with their length;
/// these take two seconds at the worst.
inline constexpr size_t kMostKeys = 10000;
inline constexpr size_t kMostKeyText = size_t{1} << 20;

/// The references by name (XML 1.0, section 4.6), and what they stand for.
inline constexpr std::array<std::pair<std::string_view, char>, 5> kNamedReferences{
    {{"&amp;", '&'}, {"&lt;", '<'}, {"&gt;", '>'}, {"&quot;", '"'}, {"&apos;", '\''}}};

/// The first and the last second since 1970 that a property list keeps: 32-bit seconds around 2001-01-01.
inline constexpr int64_t kPropertyListEpoch = 978307200;
inline constexpr int64_t kEarliestDate = kPropertyListEpoch + INT32_MIN;
inline constexpr int64_t kLatestDate = kPropertyListEpoch + INT32_MAX;

/// Whether the text may be handed to the parser: UTF-8 of characters that can be written again (isXMLText), be they
/// written out or references, one root, elements that are all closed, in their places and no deeper than
/// kDeepestPropertyList, at most kMostKeys keys of kMostKeyText bytes, no document-type subset, and only well-formed
/// references, numbers, dates and data within their ranges. What passes can be written again, unless it grows too large.
[[nodiscard]] bool isSafePropertyList(std::string_view xml) noexcept;

/// Whether a string can stand in an XML document: without control characters but for tab, line feed and carriage
/// return, and without U+FFFE and U+FFFF (XML 1.0, production 2). The string is UTF-8.
[[nodiscard]] bool isXMLText(std::string_view text) noexcept;

}  // namespace kavell

#endif
