// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Immutable text in UTF-8. Lengths are bytes. Safe from any thread.

#ifndef KAVELLACCOUNTS_CSKAVELLSTRING_H
#define KAVELLACCOUNTS_CSKAVELLSTRING_H

#include <kavellaccounts/CSKavellBase.h>

CSKAVELL_BEGIN_DECLS

typedef const struct CSKavellString *CSKavellStringRef;

CSKAVELL_EXPORT CSKavellTypeID CSKavellStringGetTypeID(void);

/// A string (caller owns) with a copy of the NUL-terminated text; none for NULL or for bytes that are not UTF-8.
CSKAVELL_EXPORT CSKavellStringRef CSKavellStringCreateWithUTF8(const char *text) CSKAVELL_NODISCARD;

/// A string (caller owns) with a copy of `length` bytes, which may contain NUL; none for NULL or for bytes that are not
/// UTF-8.
CSKAVELL_EXPORT CSKavellStringRef CSKavellStringCreateWithBytes(const char *bytes, size_t length) CSKAVELL_NODISCARD;

/// The same for a password: its memory is overwritten when the last reference goes.
CSKAVELL_EXPORT CSKavellStringRef CSKavellStringCreateSecret(const char *bytes, size_t length) CSKAVELL_NODISCARD;

/// A string (caller owns) equal to `string`, in memory of the allocator (NULL: malloc, and then the same object
/// retained); none for none.
CSKAVELL_EXPORT CSKavellStringRef CSKavellStringCreateCopy(const CSKavellAllocator *allocator,
                                                           CSKavellStringRef string) CSKAVELL_NODISCARD;

/// The text, NUL-terminated, borrowed until the string is released; NULL for none.
CSKAVELL_EXPORT const char *CSKavellStringGetUTF8(CSKavellStringRef string);

/// The length in bytes without the terminator; 0 for none.
CSKAVELL_EXPORT size_t CSKavellStringGetLength(CSKavellStringRef string);

CSKAVELL_END_DECLS

#endif
