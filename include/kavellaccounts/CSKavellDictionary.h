// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Maps from keys to values, both retained. Look-up takes constant time and compares keys by value; enumeration follows
// the order in which the keys were first set; equality ignores the order. Keys are strings wherever a dictionary is to
// be saved. A mutable dictionary is a dictionary too, of the same type. Reading from several threads is safe while no
// thread changes it.

#ifndef KAVELLACCOUNTS_CSKAVELLDICTIONARY_H
#define KAVELLACCOUNTS_CSKAVELLDICTIONARY_H

#include <kavellaccounts/CSKavellBase.h>

CSKAVELL_BEGIN_DECLS

typedef const struct CSKavellDictionary *CSKavellDictionaryRef;
typedef struct CSKavellDictionary *CSKavellMutableDictionaryRef;

CSKAVELL_EXPORT CSKavellTypeID CSKavellDictionaryGetTypeID(void);

/// An immutable dictionary (caller owns) of `count` pairs; a later pair wins over an earlier one of an equal key. None
/// when a pointer is NULL and `count` is not 0, or when a key or value is none.
CSKAVELL_EXPORT CSKavellDictionaryRef CSKavellDictionaryCreate(const CSKavellTypeRef *keys,
                                                               const CSKavellTypeRef *values,
                                                               size_t count) CSKAVELL_NODISCARD;

/// An empty mutable dictionary (caller owns).
CSKAVELL_EXPORT CSKavellMutableDictionaryRef CSKavellDictionaryCreateMutable(void) CSKAVELL_NODISCARD;

/// A mutable dictionary (caller owns) of the same pairs in the same order; none for none. The values are shared.
CSKAVELL_EXPORT CSKavellMutableDictionaryRef CSKavellDictionaryCreateMutableCopy(CSKavellDictionaryRef dictionary)
    CSKAVELL_NODISCARD;

/// The number of pairs; 0 for none.
CSKAVELL_EXPORT size_t CSKavellDictionaryGetCount(CSKavellDictionaryRef dictionary);

/// The value of a key, borrowed; none when there is none.
CSKAVELL_EXPORT CSKavellTypeRef CSKavellDictionaryGetValue(CSKavellDictionaryRef dictionary, CSKavellTypeRef key);

/// Fills `keys` and `values` (each NULL or room for the dictionary's count) with borrowed references, in order.
CSKAVELL_EXPORT void CSKavellDictionaryGetKeysAndValues(CSKavellDictionaryRef dictionary, CSKavellTypeRef *keys,
                                                        CSKavellTypeRef *values);

/// Sets a key to a value and retains both; an equal key keeps its place. Nothing happens for a none operand, or for a
/// dictionary made immutable.
CSKAVELL_EXPORT void CSKavellDictionarySetValue(CSKavellMutableDictionaryRef dictionary, CSKavellTypeRef key,
                                                CSKavellTypeRef value);

/// Removes a key and its value; nothing happens when it is not there.
CSKAVELL_EXPORT void CSKavellDictionaryRemoveValue(CSKavellMutableDictionaryRef dictionary, CSKavellTypeRef key);

CSKAVELL_END_DECLS

#endif
