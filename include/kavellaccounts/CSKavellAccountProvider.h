// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// One provider type and the accounts that the user has there, found by listing the provider's directory.
// Any thread may call. Each operation holds the record's lock, which is always taken before an account's; those that
// read or delete data files may block as CSKavellAccount.h says.

#ifndef KAVELLACCOUNTS_CSKAVELLACCOUNTPROVIDER_H
#define KAVELLACCOUNTS_CSKAVELLACCOUNTPROVIDER_H

#include <kavellaccounts/CSKavellAccount.h>
#include <kavellaccounts/CSKavellArray.h>
#include <kavellaccounts/CSKavellBase.h>
#include <kavellaccounts/CSKavellString.h>

CSKAVELL_BEGIN_DECLS

typedef struct CSKavellAccountProvider *CSKavellAccountProviderRef;

/// The type, named "CSKavellAccountProvider". Two providers are equal when their provider types are; the hash is the
/// record's address shifted right by two bits, deliberately so.
CSKAVELL_EXPORT CSKavellTypeID _CSKavellAccountProviderGetTypeID(void);

/// The record of a provider type (caller owns) with all its accounts; reads every data file of the provider. None, with
/// a message, for a none or empty provider type.
CSKAVELL_EXPORT CSKavellAccountProviderRef
_CSKavellAccountProviderCreate(const CSKavellAllocator *allocator, CSKavellStringRef providerType) CSKAVELL_NODISCARD;

/// The provider type (caller owns).
CSKAVELL_EXPORT CSKavellStringRef _CSKavellAccountProviderCopyProviderType(CSKavellAccountProviderRef provider)
    CSKAVELL_NODISCARD;

/// The account records in the order in which they were found or added (caller owns), empty when there are none.
CSKAVELL_EXPORT CSKavellArrayRef _CSKavellAccountProviderCopyAccounts(CSKavellAccountProviderRef provider)
    CSKAVELL_NODISCARD;

/// The account of a login name, borrowed; if there is none, a new one when `create` is set, else none. For code that
/// holds the provider's lock.
CSKAVELL_EXPORT CSKavellAccountRef _CSKavellAccountProviderGetAccount(CSKavellAccountProviderRef provider,
                                                                      CSKavellStringRef loginName, bool create);

/// The account of a login name (caller owns); if there is none, a new one when `create` is set, else none.
CSKAVELL_EXPORT CSKavellAccountRef _CSKavellAccountProviderCopyAccount(CSKavellAccountProviderRef provider,
                                                                       CSKavellStringRef loginName,
                                                                       bool create) CSKAVELL_NODISCARD;

/// The account of a login name, made if need be (caller owns). It is on disk only after its commit.
CSKAVELL_EXPORT CSKavellAccountRef _CSKavellAccountProviderCreateAccount(
    CSKavellAccountProviderRef provider, CSKavellStringRef loginName) CSKAVELL_NODISCARD;

/// Adds an account of this provider type, unless one of its login name is there; otherwise nothing happens.
CSKAVELL_EXPORT void _CSKavellAccountProviderAddAccount(CSKavellAccountProviderRef provider,
                                                        CSKavellAccountRef account);

/// Takes the account of a login name out and deletes its data file at once, whatever changes it has pending.
CSKAVELL_EXPORT void _CSKavellAccountProviderRemoveAccount(CSKavellAccountProviderRef provider,
                                                           CSKavellStringRef loginName);

/// Drops all account records and reads the directory afresh. Records handed out earlier stay usable, but are no longer
/// this provider's.
CSKAVELL_EXPORT void _CSKavellAccountProviderReloadAccountData(CSKavellAccountProviderRef provider);

CSKAVELL_END_DECLS

#endif
