// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The maker's online service is managed by a library of its own, which may be absent. These functions load it by its
// fixed path on first use and pass the call on; without it they answer none, false or nothing. Accounts are named by
// account name; services and properties by constants of that library (NBSShimGetStringConst). Arguments are borrowed.
//
// Any thread may call; what may block, the library says. A failed load is tried again by the next call. A library that
// loads is taken to have every function: one that lacks a function is a fault of the installation, and calling it ends
// the program.

#ifndef KAVELLACCOUNTS_NBSSHIM_H
#define KAVELLACCOUNTS_NBSSHIM_H

#include <kavellaccounts/CSKavellBase.h>
#include <kavellaccounts/CSKavellString.h>
#include <kavellaccounts/KAExport.h>

CSKAVELL_BEGIN_DECLS

/// The library's handle (dlopen), kept for the life of the process; none when it cannot be loaded.
KAVELL_ACCOUNTS_EXPORT void *NBSAccountsFramework(void);

/// @name Properties (caller owns them)
/// @{
KAVELL_ACCOUNTS_EXPORT CSKavellTypeRef NBSShimServiceCopyProperty(CSKavellStringRef account, CSKavellStringRef service,
                                                                  CSKavellStringRef property) CSKAVELL_NODISCARD;
KAVELL_ACCOUNTS_EXPORT CSKavellTypeRef NBSShimAccountCopyProperty(CSKavellStringRef account,
                                                                  CSKavellStringRef property) CSKAVELL_NODISCARD;
/// @}

/// @name Whether a service of the account is switched on
/// @{
KAVELL_ACCOUNTS_EXPORT void NBSShimServiceSetEnabled(CSKavellStringRef account, CSKavellStringRef service,
                                                     bool enabled);
KAVELL_ACCOUNTS_EXPORT bool NBSShimServiceIsEnabled(CSKavellStringRef account, CSKavellStringRef service);
/// @}

/// The name of the account that a mail alias belongs to (caller owns).
KAVELL_ACCOUNTS_EXPORT CSKavellStringRef NBSShimCopyAccountIDFromMailAlias(CSKavellStringRef mailAlias)
    CSKAVELL_NODISCARD;

/// The kind of an account, one of the library's constants "kNBAccountType…" (caller owns).
KAVELL_ACCOUNTS_EXPORT CSKavellTypeRef NBSShimCopyAccountType(CSKavellStringRef account) CSKAVELL_NODISCARD;

/// @name The session: ask the service anew whether the account is logged in, what is known of it, and log in
/// @{
KAVELL_ACCOUNTS_EXPORT void NBSShimAccountRefreshLoggedIn(CSKavellStringRef account);
KAVELL_ACCOUNTS_EXPORT bool NBSShimAccountIsLoggedIn(CSKavellStringRef account);
KAVELL_ACCOUNTS_EXPORT bool NBSShimAccountLogin(CSKavellStringRef account, CSKavellStringRef password);
/// @}

/// The text constant that the library exports under a name, borrowed from it; none when it exports none.
KAVELL_ACCOUNTS_EXPORT CSKavellStringRef NBSShimGetStringConst(const char *name);

CSKAVELL_END_DECLS

#endif
