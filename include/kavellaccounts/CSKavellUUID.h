// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Universally unique identifiers (RFC 4122). Immutable; safe from any thread.

#ifndef KAVELLACCOUNTS_CSKAVELLUUID_H
#define KAVELLACCOUNTS_CSKAVELLUUID_H

#include <kavellaccounts/CSKavellBase.h>
#include <kavellaccounts/CSKavellString.h>

CSKAVELL_BEGIN_DECLS

typedef const struct CSKavellUUID *CSKavellUUIDRef;

CSKAVELL_EXPORT CSKavellTypeID CSKavellUUIDGetTypeID(void);

/// A fresh random identifier (RFC 4122 version 4; caller owns); none when the system gives no random bytes.
CSKAVELL_EXPORT CSKavellUUIDRef CSKavellUUIDCreate(void) CSKAVELL_NODISCARD;

/// The identifier (caller owns) written in the string in the 36-character form, in either case; none for anything else.
CSKAVELL_EXPORT CSKavellUUIDRef CSKavellUUIDCreateFromString(CSKavellStringRef string) CSKAVELL_NODISCARD;

/// The 36-character form (caller owns), with digits in lower case as RFC 4122, section 3, has them; none for none.
CSKAVELL_EXPORT CSKavellStringRef CSKavellUUIDCopyString(CSKavellUUIDRef uuid) CSKAVELL_NODISCARD;

CSKAVELL_END_DECLS

#endif
