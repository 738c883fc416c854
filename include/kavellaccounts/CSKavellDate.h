// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Points in time in whole seconds, as precise as a property list keeps them. A data file keeps dates from
// 1932-12-13T20:45:52Z to 2069-01-19T03:14:07Z (32-bit seconds around 2001-01-01); saving another date fails rather
// than changing it. Immutable; safe from any thread.

#ifndef KAVELLACCOUNTS_CSKAVELLDATE_H
#define KAVELLACCOUNTS_CSKAVELLDATE_H

#include <kavellaccounts/CSKavellBase.h>

CSKAVELL_BEGIN_DECLS

typedef const struct CSKavellDate *CSKavellDateRef;

CSKAVELL_EXPORT CSKavellTypeID CSKavellDateGetTypeID(void);

/// A date (caller owns), in seconds since 1970-01-01T00:00:00Z, negative before it.
CSKAVELL_EXPORT CSKavellDateRef CSKavellDateCreate(int64_t secondsSince1970) CSKAVELL_NODISCARD;

/// Seconds since 1970-01-01T00:00:00Z; 0 for none.
CSKAVELL_EXPORT int64_t CSKavellDateGetSeconds(CSKavellDateRef date);

CSKAVELL_END_DECLS

#endif
