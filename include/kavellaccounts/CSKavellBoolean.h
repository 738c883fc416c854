// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The two truth values: one shared, immortal object each, of a type that no number equals. Safe from any thread.

#ifndef KAVELLACCOUNTS_CSKAVELLBOOLEAN_H
#define KAVELLACCOUNTS_CSKAVELLBOOLEAN_H

#include <kavellaccounts/CSKavellBase.h>

CSKAVELL_BEGIN_DECLS

typedef const struct CSKavellBoolean *CSKavellBooleanRef;

CSKAVELL_EXPORT CSKavellTypeID CSKavellBooleanGetTypeID(void);

/// The shared object of a value, borrowed for ever.
CSKAVELL_EXPORT CSKavellBooleanRef CSKavellBooleanGetShared(bool value);

/// The value; false for none.
CSKAVELL_EXPORT bool CSKavellBooleanGetValue(CSKavellBooleanRef boolean);

CSKAVELL_END_DECLS

#endif
