// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Ordered lists of objects, which they retain. A mutable array is an array too, of the same type. Reading an array from
// several threads is safe while no thread changes it.

#ifndef KAVELLACCOUNTS_CSKAVELLARRAY_H
#define KAVELLACCOUNTS_CSKAVELLARRAY_H

#include <kavellaccounts/CSKavellBase.h>

CSKAVELL_BEGIN_DECLS

typedef const struct CSKavellArray *CSKavellArrayRef;
typedef struct CSKavellArray *CSKavellMutableArrayRef;

CSKAVELL_EXPORT CSKavellTypeID CSKavellArrayGetTypeID(void);

/// An immutable array (caller owns) of `count` values, each retained. None when `values` is NULL and `count` is not 0,
/// or when one of the values is none.
CSKAVELL_EXPORT CSKavellArrayRef CSKavellArrayCreate(const CSKavellTypeRef *values, size_t count) CSKAVELL_NODISCARD;

/// An empty mutable array (caller owns).
CSKAVELL_EXPORT CSKavellMutableArrayRef CSKavellArrayCreateMutable(void) CSKAVELL_NODISCARD;

/// A mutable array (caller owns) with the same values in the same order; none for none.
CSKAVELL_EXPORT CSKavellMutableArrayRef CSKavellArrayCreateMutableCopy(CSKavellArrayRef array) CSKAVELL_NODISCARD;

/// The number of values; 0 for none.
CSKAVELL_EXPORT size_t CSKavellArrayGetCount(CSKavellArrayRef array);

/// The value at an index, borrowed; none for none or past the end.
CSKAVELL_EXPORT CSKavellTypeRef CSKavellArrayGetValueAtIndex(CSKavellArrayRef array, size_t index);

/// The index of the first equal value; the array's count when there is none.
CSKAVELL_EXPORT size_t CSKavellArrayGetFirstIndexOfValue(CSKavellArrayRef array, CSKavellTypeRef value);

/// Appends a value and retains it. Nothing happens for none, for a none value, or for an array made immutable.
CSKAVELL_EXPORT void CSKavellArrayAppendValue(CSKavellMutableArrayRef array, CSKavellTypeRef value);

/// Removes the value at an index; nothing happens past the end.
CSKAVELL_EXPORT void CSKavellArrayRemoveValueAtIndex(CSKavellMutableArrayRef array, size_t index);

CSKAVELL_END_DECLS

#endif
