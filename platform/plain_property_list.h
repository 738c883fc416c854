// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A quick reader for the form in which property lists are nearly always found: as a writer writes them, without
// comments, sections, references by number, dates or reals. It turns text into objects in one pass, where the general
// way (property_list.cpp) takes three passes to make sure that the parser may see the text, and a tree in between. Of
// anything that is not of the plain form it says so, and the general way decides. Any thread may call.

#ifndef KAVELL_PLATFORM_PLAIN_PROPERTY_LIST_H
#define KAVELL_PLATFORM_PLAIN_PROPERTY_LIST_H

#include <string_view>

#include <kavellaccounts/CSKavellDictionary.h>
#include <kavellaccounts/Ref.h>

namespace kavell {

/// The dictionary that the general way would read from the text; none when the text is not of the plain form, which does
/// not make it wrong. May throw std::bad_alloc.
[[nodiscard]] Ref<CSKavellMutableDictionaryRef> parsePlainPropertyList(std::string_view xml);

}  // namespace kavell

#endif
