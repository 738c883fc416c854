// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// XML property lists (format version 1.0) to objects and back: through libplist behind a guard, and, for the form that
// is found nearly always, through a quicker reader (plain_property_list.h). Used for data files and for notifications
// between processes. Any thread may call; nothing here blocks.

#ifndef KAVELL_PLATFORM_PROPERTY_LIST_H
#define KAVELL_PLATFORM_PROPERTY_LIST_H

#include <string>
#include <string_view>

#include <kavellaccounts/CSKavellDictionary.h>
#include <kavellaccounts/Ref.h>

namespace kavell {

/// The dictionary that the XML text describes, with mutable containers; none when the text is not a property list that
/// can be trusted (property_list_guard.h) or its top level is not a dictionary.
[[nodiscard]] Ref<CSKavellMutableDictionaryRef> parsePropertyList(std::string_view xml) noexcept;

/// The same without the quicker reader, whose answers must be equal. May throw std::bad_alloc.
[[nodiscard]] Ref<CSKavellMutableDictionaryRef> parseAnyPropertyList(std::string_view xml);

/// Whether parsePropertyList would answer a dictionary.
[[nodiscard]] bool isPropertyList(std::string_view xml) noexcept;

/// Writes a dictionary as XML. False, with `xml` as it was, when a value cannot be kept by a property list: an object
/// of another type, a key that is no string, text with control characters, a real that is no number, an integer above
/// INT64_MAX, a date out of range, containers deeper than the guard allows or holding themselves, more keys than it
/// allows, or more than the largest file.
[[nodiscard]] bool writePropertyList(CSKavellDictionaryRef dictionary, std::string &xml) noexcept;

/// The same without the quicker writer, whose text must be equal. May throw std::bad_alloc.
[[nodiscard]] bool writeAnyPropertyList(CSKavellDictionaryRef dictionary, std::string &xml);

}  // namespace kavell

#endif
