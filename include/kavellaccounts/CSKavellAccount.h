// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// One online account: a login name at a provider, backed by one data file, with attributes of the account itself
// (provider attributes) and of each of its services. Changes stay pending in the record until
// _CSKavellAccountCommitChanges.
//
// Any thread may call. Each operation holds the record's lock, for a short span unless it says that it reads or writes
// the data file; then it may block on the disk and, without a bound, on another process that holds the file's
// semaphore. Failures write one line to standard error and answer none or false. A none record, and a none key where
// one is needed, answer none, false or nothing. Strings and values handed in are copied or retained.

#ifndef KAVELLACCOUNTS_CSKAVELLACCOUNT_H
#define KAVELLACCOUNTS_CSKAVELLACCOUNT_H

#include <kavellaccounts/CSKavellAccountSettings.h>
#include <kavellaccounts/CSKavellArray.h>
#include <kavellaccounts/CSKavellBase.h>
#include <kavellaccounts/CSKavellCofferel.h>
#include <kavellaccounts/CSKavellDictionary.h>
#include <kavellaccounts/CSKavellString.h>
#include <kavellaccounts/CSKavellURL.h>
#include <kavellaccounts/CSKavellUUID.h>

CSKAVELL_BEGIN_DECLS

typedef struct CSKavellAccount *CSKavellAccountRef;

/// The type, named "CSKavellAccount". Two accounts are equal when provider type and login name are, to the letter. The
/// hash is the record's address shifted right by two bits, deliberately so: equal records do not hash alike.
CSKAVELL_EXPORT CSKavellTypeID _CSKavellAccountGetTypeID(void);

/// The record of an account (caller owns), with what its data file holds; reads the file. An account without a file is
/// new: it has a fresh UUID and pending changes, and its first commit writes the file. None, with a message, for a none
/// or empty provider type or login name, which become parts of the file's path as they stand.
CSKAVELL_EXPORT CSKavellAccountRef _CSKavellAccountCreate(const CSKavellAllocator *allocator,
                                                          CSKavellStringRef providerType,
                                                          CSKavellStringRef loginName) CSKAVELL_NODISCARD;

/// @name Identity. Copies belong to the caller
/// @{
CSKAVELL_EXPORT CSKavellStringRef _CSKavellAccountCopyProviderType(CSKavellAccountRef account) CSKAVELL_NODISCARD;
CSKAVELL_EXPORT CSKavellStringRef _CSKavellAccountCopyLoginName(CSKavellAccountRef account) CSKAVELL_NODISCARD;

/// Whether the login name is exactly this one.
CSKAVELL_EXPORT bool _CSKavellAccountHasLoginName(CSKavellAccountRef account, CSKavellStringRef loginName);

/// The pending UUID if one is set, else the committed one, else "".
CSKAVELL_EXPORT CSKavellStringRef _CSKavellAccountCopyUUIDString(CSKavellAccountRef account) CSKAVELL_NODISCARD;

/// The same as a UUID; none when the text is not one.
CSKAVELL_EXPORT CSKavellUUIDRef _CSKavellAccountCopyUUID(CSKavellAccountRef account) CSKAVELL_NODISCARD;

/// Sets the pending UUID; none drops it. Deliberately no change of its own: it is saved together with some other
/// change.
CSKAVELL_EXPORT void _CSKavellAccountSetUUIDString(CSKavellAccountRef account, CSKavellStringRef uuidString);
CSKAVELL_EXPORT void _CSKavellAccountSetUUID(CSKavellAccountRef account, CSKavellUUIDRef uuid);

/// The directory that holds all accounts, "Library/Kavell Accounts/V1" below the user's home directory (caller owns).
/// The account does not matter and may be none.
CSKAVELL_EXPORT CSKavellURLRef _CSKavellAccountCopyBaseURL(CSKavellAccountRef account) CSKAVELL_NODISCARD;
/// @}

/// @name Attributes of a service, or of the account itself for a service identifier of none
/// @{

/// The identifiers of the services that have effective attributes (caller owns), pending ones included; empty when
/// there are none.
CSKAVELL_EXPORT CSKavellArrayRef _CSKavellAccountCopyServiceIDs(CSKavellAccountRef account) CSKAVELL_NODISCARD;

/// All effective attributes (caller owns), empty when there are none.
CSKAVELL_EXPORT CSKavellDictionaryRef
_CSKavellAccountCopyServiceAttributes(CSKavellAccountRef account, CSKavellStringRef serviceID) CSKAVELL_NODISCARD;

/// The effective value of a key (caller owns); none when there is none.
CSKAVELL_EXPORT CSKavellTypeRef _CSKavellAccountCopyServiceAttribute(CSKavellAccountRef account,
                                                                     CSKavellStringRef serviceID,
                                                                     CSKavellStringRef key) CSKAVELL_NODISCARD;

/// Replaces all attributes of the service, creating it if need be. A none dictionary does nothing.
CSKAVELL_EXPORT void _CSKavellAccountSetServiceAttributes(CSKavellAccountRef account, CSKavellStringRef serviceID,
                                                          CSKavellDictionaryRef attributes);

/// Sets a value, creating the service if need be; a none value removes the key. Values that a property list cannot hold
/// are taken, but then the account cannot be saved.
CSKAVELL_EXPORT void _CSKavellAccountSetServiceAttribute(CSKavellAccountRef account, CSKavellStringRef serviceID,
                                                         CSKavellStringRef key, CSKavellTypeRef value);

/// Removes a key; nothing happens for a service that the account does not have.
CSKAVELL_EXPORT void _CSKavellAccountRemoveServiceAttribute(CSKavellAccountRef account, CSKavellStringRef serviceID,
                                                            CSKavellStringRef key);

/// Removes all attributes; nothing happens for a service that the account does not have.
CSKAVELL_EXPORT void _CSKavellAccountRemoveAllServiceAttributes(CSKavellAccountRef account,
                                                                CSKavellStringRef serviceID);

/// The settings of a service, borrowed from the account; when there are none, new empty ones if `create` is set, else
/// none. For code that holds the account's lock.
CSKAVELL_EXPORT CSKavellAccountSettingsRef ServiceForID(CSKavellAccountRef account, CSKavellStringRef serviceID,
                                                        bool create);
/// @}

/// @name Attributes of the account itself: the operations above with a service identifier of none
/// @{
CSKAVELL_EXPORT CSKavellDictionaryRef _CSKavellAccountCopyProviderAttributes(CSKavellAccountRef account)
    CSKAVELL_NODISCARD;
CSKAVELL_EXPORT CSKavellTypeRef _CSKavellAccountCopyProviderAttribute(CSKavellAccountRef account,
                                                                      CSKavellStringRef key) CSKAVELL_NODISCARD;
CSKAVELL_EXPORT void _CSKavellAccountSetProviderAttributes(CSKavellAccountRef account,
                                                           CSKavellDictionaryRef attributes);
CSKAVELL_EXPORT void _CSKavellAccountSetProviderAttribute(CSKavellAccountRef account, CSKavellStringRef key,
                                                          CSKavellTypeRef value);
CSKAVELL_EXPORT void _CSKavellAccountRemoveProviderAttribute(CSKavellAccountRef account, CSKavellStringRef key);
CSKAVELL_EXPORT void _CSKavellAccountRemoveAllProviderAttributes(CSKavellAccountRef account);
/// @}

/// @name Pending changes and the data file
/// @{

/// Whether a commit would do something: attributes were changed, the account is new, or it is marked for removal.
CSKAVELL_EXPORT bool _CSKavellAccountHasPendingChanges(CSKavellAccountRef account);

/// Marks the account for removal: the next commit deletes its data file.
CSKAVELL_EXPORT void _CSKavellAccountRemove(CSKavellAccountRef account);

/// Takes the mark back.
CSKAVELL_EXPORT void _CSKavellAccountCancelRemove(CSKavellAccountRef account);

/// Drops all pending changes, the pending UUID and the mark, and reads the data file again.
CSKAVELL_EXPORT void _CSKavellAccountCancelChanges(CSKavellAccountRef account);

/// Saves the pending changes over what the data file holds now, key by key, or deletes the file of an account marked
/// for removal, and posts the change notification. On return the save is on the disk, or a message was written and the
/// changes are still pending (_CSKavellAccountHasPendingChanges). Another process's save between this one's re-read and
/// its write is overwritten, by contract.
CSKAVELL_EXPORT void _CSKavellAccountCommitChanges(CSKavellAccountRef account);

/// Reads the data file again, keeping the pending changes over it. False, with a message, when the file's status cannot
/// be had or its contents are not a property list; the attributes then stay as they were, except that a file whose
/// status cannot be had counts as empty. A missing file is no error.
CSKAVELL_EXPORT bool CSKavellAccountLoadData(CSKavellAccountRef account);
/// @}

/// @name Password. It lives in the credential store (CSKavellCofferel.h, which says how long these may block); the
/// account holds a reference to it as the provider attribute "com.corvane.account.CofferelToken"
/// @{

/// The item that the account refers to (caller owns); none when there is no reference or it does not resolve.
CSKAVELL_EXPORT CSKavellCofferelItemRef _CSKavellAccountCopyCofferelItem(CSKavellAccountRef account) CSKAVELL_NODISCARD;

/// Makes the account refer to an item, or to none. The change is pending until the account is committed.
CSKAVELL_EXPORT void _CSKavellAccountSetCofferelItem(CSKavellAccountRef account, CSKavellCofferelItemRef item);

/// The password (caller owns); none when there is no item, its secret cannot be read, or it is not UTF-8. Its memory is
/// overwritten when the last reference goes.
/// _CSKavellAccountGetPasswordStatus tells these apart.
CSKAVELL_EXPORT CSKavellStringRef _CSKavellAccountCopyPassword(CSKavellAccountRef account) CSKAVELL_NODISCARD;

/// Stores the password and makes the account refer to it; the item (caller owns), or none on failure. The item is
/// stored at once; a new reference to it is pending until the account is committed. A none or empty password removes
/// it.
CSKAVELL_EXPORT CSKavellCofferelItemRef _CSKavellAccountSetPassword(CSKavellAccountRef account,
                                                                    CSKavellStringRef password) CSKAVELL_NODISCARD;

/// Deletes the item and the reference to it; the latter is a pending change.
CSKAVELL_EXPORT void _CSKavellAccountRemovePassword(CSKavellAccountRef account);

/// Whether the account's password can be read, without prompting anyone: Stored, Absent (no reference, or the store
/// says that the item is gone), Locked, Refused, Unreachable or Failed.
CSKAVELL_EXPORT CSKavellCofferelStatus _CSKavellAccountGetPasswordStatus(CSKavellAccountRef account);
/// @}

CSKAVELL_END_DECLS

#endif
