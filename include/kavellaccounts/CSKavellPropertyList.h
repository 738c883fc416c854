// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// XML property lists (format version 1.0), the text form of a dictionary: what data files, preferences and information
// dictionaries are written in. Any thread may call; nothing here blocks.

#ifndef KAVELLACCOUNTS_CSKAVELLPROPERTYLIST_H
#define KAVELLACCOUNTS_CSKAVELLPROPERTYLIST_H

#include <kavellaccounts/CSKavellBase.h>
#include <kavellaccounts/CSKavellData.h>
#include <kavellaccounts/CSKavellDictionary.h>

CSKAVELL_BEGIN_DECLS

/// The dictionary that `length` bytes of XML text describe (caller owns). None when they are not a well-formed property
/// list whose top level is a dictionary, or one too large or too deep to be trusted (32 MiB, 10,000 keys in a
/// dictionary, 256 levels).
CSKAVELL_EXPORT CSKavellDictionaryRef CSKavellPropertyListCreateDictionary(const void *bytes,
                                                                           size_t length) CSKAVELL_NODISCARD;

/// The XML text of a dictionary (caller owns). None for none, and when a value is one that a property list cannot hold:
/// an object of another type, text with a character that XML does not have (XML 1.0, section 2.2), a real that is no
/// number, an integer above INT64_MAX, a date outside 1932 to 2069, or more than CSKavellPropertyListCreateDictionary
/// would take.
CSKAVELL_EXPORT CSKavellDataRef CSKavellPropertyListCopyXML(CSKavellDictionaryRef dictionary) CSKAVELL_NODISCARD;

CSKAVELL_END_DECLS

#endif
