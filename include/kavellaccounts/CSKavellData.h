// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Immutable bytes. Safe from any thread.

#ifndef KAVELLACCOUNTS_CSKAVELLDATA_H
#define KAVELLACCOUNTS_CSKAVELLDATA_H

#include <kavellaccounts/CSKavellBase.h>

CSKAVELL_BEGIN_DECLS

typedef const struct CSKavellData *CSKavellDataRef;

CSKAVELL_EXPORT CSKavellTypeID CSKavellDataGetTypeID(void);

/// Data (caller owns) with a copy of `length` bytes; none when `bytes` is NULL and `length` is not 0.
CSKAVELL_EXPORT CSKavellDataRef CSKavellDataCreate(const void *bytes, size_t length) CSKAVELL_NODISCARD;

/// The same for a secret: its memory is overwritten when the last reference goes.
CSKAVELL_EXPORT CSKavellDataRef CSKavellDataCreateSecret(const void *bytes, size_t length) CSKAVELL_NODISCARD;

/// The bytes, borrowed until the data is released; NULL for none. Never NULL for empty data.
CSKAVELL_EXPORT const uint8_t *CSKavellDataGetBytes(CSKavellDataRef data);

/// The number of bytes; 0 for none.
CSKAVELL_EXPORT size_t CSKavellDataGetLength(CSKavellDataRef data);

CSKAVELL_END_DECLS

#endif
