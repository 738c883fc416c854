// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Items of the user's credential store, which holds the passwords: the desktop's Secret Service where there is one,
// else an encrypted vault file. An item is a handle, not the secret; the secret is read when it is asked for.
//
// The environment variable KAVELL_CREDENTIAL_STORE forces a store: "secret-service" or "vault"; unset or "auto" chooses
// the vault only where no Secret Service can be had, and "none" uses no store at all. The vault's passphrase comes from
// the file named by KAVELL_VAULT_PASSPHRASE_FILE, else it is asked for on the controlling terminal and kept for the
// login session. No password is ever written unencrypted.
//
// Every function here that asks the store may block while the store works or the user answers a prompt, but for a
// bounded time: 5 seconds a question, and 60 seconds for an unlocking prompt (KAVELL_CREDENTIAL_TIMEOUT and
// KAVELL_UNLOCK_TIMEOUT, in milliseconds, change these). One that finds its store locked asks for the store to be
// unlocked and tries once more, unless it says that it does not prompt. Any thread may call.

#ifndef KAVELLACCOUNTS_CSKAVELLCOFFEREL_H
#define KAVELLACCOUNTS_CSKAVELLCOFFEREL_H

#include <kavellaccounts/CSKavellArray.h>
#include <kavellaccounts/CSKavellBase.h>
#include <kavellaccounts/CSKavellData.h>
#include <kavellaccounts/CSKavellString.h>

CSKAVELL_BEGIN_DECLS

/// An item of the credential store.
typedef const struct CSKavellCofferelItem *CSKavellCofferelItemRef;

/// Who may read an item: a description and the names of the trusted application groups.
typedef const struct CSKavellCofferelAccess *CSKavellCofferelAccessRef;

/// What became of a question to the credential store.
typedef enum CSKavellCofferelStatus {
    /// Done; for a question about a password: it is stored and can be read.
    kCSKavellCofferelStatusStored = 0,
    /// The store answered that there is no such item.
    kCSKavellCofferelStatusAbsent = 1,
    /// The store, or the item, is locked and nobody was asked or able to unlock it.
    kCSKavellCofferelStatusLocked = 2,
    /// The user dismissed the unlocking prompt, or the passphrase was wrong.
    kCSKavellCofferelStatusRefused = 3,
    /// No store could be reached, or it did not answer in time. Says nothing about whether there is an item.
    kCSKavellCofferelStatusUnreachable = 4,
    /// The store answered with another failure, such as a full disk.
    kCSKavellCofferelStatusFailed = 5,
    /// The store has no such notion (access lists, on the Secret Service).
    kCSKavellCofferelStatusUnsupported = 6,
} CSKavellCofferelStatus;

CSKAVELL_EXPORT CSKavellTypeID CSKavellCofferelItemGetTypeID(void);
CSKAVELL_EXPORT CSKavellTypeID CSKavellCofferelAccessGetTypeID(void);

/// The status as one lower-case English word, for messages and logs ("stored", "absent", …); borrowed for ever.
CSKAVELL_EXPORT const char *CSKavellCofferelStatusGetName(CSKavellCofferelStatus status);

/// Which store this process uses: "secret-service", "vault" or "none" (borrowed for ever). Looks for a Secret Service
/// on the first call, and may block for that as said above.
CSKAVELL_EXPORT const char *CSKavellCofferelStoreGetName(void);

/// Makes the default store ready, letting the platform prompt the user when it is locked. Stored means ready.
CSKAVELL_EXPORT CSKavellCofferelStatus CSKavellCofferelStoreUnlock(void);

/// Finds the generic-password item of a service name and an account name. On Stored, `*item` (may be NULL) receives it
/// (caller owns); on any other status `*item` is left alone.
CSKAVELL_EXPORT CSKavellCofferelStatus CSKavellCofferelStoreFindItem(CSKavellStringRef serviceName,
                                                                     CSKavellStringRef accountName,
                                                                     CSKavellCofferelItemRef *item);

/// All items that this library has stored (caller owns), in no particular order; on Stored `*items` receives them. Does
/// not prompt.
CSKAVELL_EXPORT CSKavellCofferelStatus CSKavellCofferelStoreCopyItems(CSKavellArrayRef *items);

/// The item of a persistent reference made by CSKavellCofferelItemCopyPersistentReference, in any process and after a
/// restart. On Stored `*item` receives it (caller owns). Absent for what is no such reference; Unreachable for a
/// reference into a store that this process may not use.
CSKAVELL_EXPORT CSKavellCofferelStatus CSKavellCofferelItemResolve(CSKavellDataRef persistentReference,
                                                                   CSKavellCofferelItemRef *item);

/// The item's persistent reference (caller owns); none when none can be made. Does not ask the store.
CSKAVELL_EXPORT CSKavellDataRef CSKavellCofferelItemCopyPersistentReference(CSKavellCofferelItemRef item)
    CSKAVELL_NODISCARD;

/// The item's service name and account name (caller owns); none for none. Does not ask the store.
CSKAVELL_EXPORT CSKavellStringRef CSKavellCofferelItemCopyServiceName(CSKavellCofferelItemRef item) CSKAVELL_NODISCARD;
CSKAVELL_EXPORT CSKavellStringRef CSKavellCofferelItemCopyAccountName(CSKavellCofferelItemRef item) CSKAVELL_NODISCARD;

/// Reads the item's secret. On Stored `*secret` receives its bytes (caller owns), which are overwritten when the last
/// reference goes.
CSKAVELL_EXPORT CSKavellCofferelStatus CSKavellCofferelItemCopySecret(CSKavellCofferelItemRef item,
                                                                      CSKavellDataRef *secret);

/// Deletes the item from the store.
CSKAVELL_EXPORT CSKavellCofferelStatus CSKavellCofferelItemDelete(CSKavellCofferelItemRef item);

/// The access object that is kept with the item. On Stored `*access` receives it (caller owns); one that was never set
/// is empty. Unsupported where the store keeps none.
CSKAVELL_EXPORT CSKavellCofferelStatus CSKavellCofferelItemCopyAccess(CSKavellCofferelItemRef item,
                                                                      CSKavellCofferelAccessRef *access);

/// Replaces the access object that is kept with the item. Unsupported where the store keeps none.
CSKAVELL_EXPORT CSKavellCofferelStatus CSKavellCofferelItemSetAccess(CSKavellCofferelItemRef item,
                                                                     CSKavellCofferelAccessRef access);

/// An access object (caller owns) with a description and an array of group names; none for a none operand.
CSKAVELL_EXPORT CSKavellCofferelAccessRef CSKavellCofferelAccessCreate(CSKavellStringRef description,
                                                                       CSKavellArrayRef groups) CSKAVELL_NODISCARD;

/// The access object's description, borrowed; none for none.
CSKAVELL_EXPORT CSKavellStringRef CSKavellCofferelAccessGetDescription(CSKavellCofferelAccessRef access);

/// The names of the trusted application groups, borrowed; none for none.
CSKAVELL_EXPORT CSKavellArrayRef CSKavellCofferelAccessGetGroups(CSKavellCofferelAccessRef access);

CSKAVELL_END_DECLS

#endif
