// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A quick reader and a quick writer for the form in which property lists are nearly always found: as a writer writes
// them, without comments, sections, references by number, dates or reals. They turn text into objects and objects into
// text in one pass, where the general way (property_list.cpp) takes three passes to make sure that the parser may see
// the text, and a tree in between. Of anything that is not of the plain form they say so, and the general way decides.
// Any thread may call.

#ifndef KAVELL_PLATFORM_PLAIN_PROPERTY_LIST_H
#define KAVELL_PLATFORM_PLAIN_PROPERTY_LIST_H

#include <string>
#include <string_view>

#include <kavellaccounts/CSKavellDictionary.h>
#include <kavellaccounts/Ref.h>

namespace kavell {

/// How deep containers may stand in one another in the plain form. Each takes a frame of the stack; what is deeper, or
/// goes in circles, is not plain.
inline constexpr int kDeepestPlainContainer = 32;

/// The dictionary that the general way would read from the text; none when the text is not of the plain form, which does
/// not make it wrong. May throw std::bad_alloc.
[[nodiscard]] Ref<CSKavellMutableDictionaryRef> parsePlainPropertyList(std::string_view xml);

/// Writes what the general way would write of the dictionary. False, with `xml` as it was, when it is not plain: what has
/// data in it, too, or cannot be written at all. The frame is the document of an empty dictionary. May throw
/// std::bad_alloc.
[[nodiscard]] bool writePlainPropertyList(CSKavellDictionaryRef dictionary, std::string_view frame, std::string &xml);

}  // namespace kavell

#endif
