// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Immutable numbers, which remember whether they are integers (64 bits, signed or unsigned) or reals. An integer and a
// real are equal only when both are of the same kind and value. Safe from any thread.

#ifndef KAVELLACCOUNTS_CSKAVELLNUMBER_H
#define KAVELLACCOUNTS_CSKAVELLNUMBER_H

#include <kavellaccounts/CSKavellBase.h>

CSKAVELL_BEGIN_DECLS

typedef const struct CSKavellNumber *CSKavellNumberRef;

CSKAVELL_EXPORT CSKavellTypeID CSKavellNumberGetTypeID(void);

/// A number each (caller owns).
CSKAVELL_EXPORT CSKavellNumberRef CSKavellNumberCreateWithInt64(int64_t value) CSKAVELL_NODISCARD;
CSKAVELL_EXPORT CSKavellNumberRef CSKavellNumberCreateWithUInt64(uint64_t value) CSKAVELL_NODISCARD;
CSKAVELL_EXPORT CSKavellNumberRef CSKavellNumberCreateWithDouble(double value) CSKAVELL_NODISCARD;

/// The value as a signed integer: a real is cut toward zero, a value out of range becomes the nearest limit,
/// not-a-number becomes 0. 0 for none.
CSKAVELL_EXPORT int64_t CSKavellNumberGetInt64(CSKavellNumberRef number);

/// The value as an unsigned integer, converted as above; 0 for none.
CSKAVELL_EXPORT uint64_t CSKavellNumberGetUInt64(CSKavellNumberRef number);

/// The value as a real, rounded to the nearest one; 0 for none.
CSKAVELL_EXPORT double CSKavellNumberGetDouble(CSKavellNumberRef number);

/// Whether the number was made as a real; false for none.
CSKAVELL_EXPORT bool CSKavellNumberIsReal(CSKavellNumberRef number);

/// Whether the number is an integer above INT64_MAX, which only the unsigned form holds; false for none.
CSKAVELL_EXPORT bool CSKavellNumberIsUnsigned(CSKavellNumberRef number);

CSKAVELL_END_DECLS

#endif
