// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// One set of attributes in two layers: the committed side, as the data file last said, and this process's pending
// changes over it (values set and keys removed). Keys are strings, values property-list objects; none is "no value". A
// settings record has no lock of its own: one that belongs to an account is used under that account's lock only, one
// made here by one thread at a time. Nothing here blocks or touches the disk.

#ifndef KAVELLACCOUNTS_CSKAVELLACCOUNTSETTINGS_H
#define KAVELLACCOUNTS_CSKAVELLACCOUNTSETTINGS_H

#include <kavellaccounts/CSKavellBase.h>
#include <kavellaccounts/CSKavellDictionary.h>
#include <kavellaccounts/CSKavellString.h>

CSKAVELL_BEGIN_DECLS

typedef struct CSKavellAccountSettings *CSKavellAccountSettingsRef;

/// The type, named "CSKavellAccountSettings". Records are equal only to themselves; the hash is the address shifted
/// right by two bits.
CSKAVELL_EXPORT CSKavellTypeID _CSKavellAccountSettingsGetTypeID(void);

/// Empty settings (caller owns); none when the allocator gives no memory.
CSKAVELL_EXPORT CSKavellAccountSettingsRef CSKavellAccountSettingsCreate(const CSKavellAllocator *allocator)
    CSKAVELL_NODISCARD;

/// New settings (caller owns) whose committed side is the source's effective attributes, without pending changes; none
/// for none.
CSKAVELL_EXPORT CSKavellAccountSettingsRef CSKavellAccountSettingsCreateCopy(
    const CSKavellAllocator *allocator, CSKavellAccountSettingsRef settings) CSKAVELL_NODISCARD;

/// Whether anything is pending. An empty dictionary given to SetAttributes counts.
CSKAVELL_EXPORT bool CSKavellAccountSettingsHasChanges(CSKavellAccountSettingsRef settings);

/// Whether there are committed or pending values; pending removals alone do not count, and do not hide the committed
/// values from this question.
CSKAVELL_EXPORT bool CSKavellAccountSettingsHasAttributes(CSKavellAccountSettingsRef settings);

/// Whether the key has an effective value.
CSKAVELL_EXPORT bool CSKavellAccountSettingsHasAttribute(CSKavellAccountSettingsRef settings, CSKavellStringRef key);

/// The key's effective value (caller owns): none if its removal is pending, else the pending value, else the committed
/// one, else none.
CSKAVELL_EXPORT CSKavellTypeRef CSKavellAccountSettingsCopyAttribute(CSKavellAccountSettingsRef settings,
                                                                     CSKavellStringRef key) CSKAVELL_NODISCARD;

/// All effective attributes as they are now (caller owns), empty when there are none; none only for a none
/// record.
CSKAVELL_EXPORT CSKavellDictionaryRef CSKavellAccountSettingsCopyAttributes(CSKavellAccountSettingsRef settings)
    CSKAVELL_NODISCARD;

/// Makes a value pending; a none value makes the key's removal pending.
CSKAVELL_EXPORT void CSKavellAccountSettingsSetAttribute(CSKavellAccountSettingsRef settings, CSKavellStringRef key,
                                                         CSKavellTypeRef value);

/// Makes the key's removal pending, also of a key without a value: another process may have saved one meanwhile.
CSKAVELL_EXPORT void CSKavellAccountSettingsRemoveAttribute(CSKavellAccountSettingsRef settings, CSKavellStringRef key);

/// Replaces all attributes: after a commit the effective attributes are exactly the dictionary's. Earlier pending
/// changes are dropped. A none dictionary does nothing.
CSKAVELL_EXPORT void CSKavellAccountSettingsSetAttributes(CSKavellAccountSettingsRef settings,
                                                          CSKavellDictionaryRef attributes);

/// Makes the removal of every committed key pending and drops all other pending changes.
CSKAVELL_EXPORT void CSKavellAccountSettingsRemoveAllAttributes(CSKavellAccountSettingsRef settings);

/// Folds the pending changes into the committed side. Nothing is written anywhere.
CSKAVELL_EXPORT void CSKavellAccountSettingsCommitChanges(CSKavellAccountSettingsRef settings);

/// Drops the pending changes.
CSKAVELL_EXPORT void CSKavellAccountSettingsCancelChanges(CSKavellAccountSettingsRef settings);

/// Replaces the committed side by a copy of the dictionary, or by nothing for none; pending changes stay layered over
/// it.
CSKAVELL_EXPORT void CSKavellAccountSettingsUpdateAttributes(CSKavellAccountSettingsRef settings,
                                                             CSKavellDictionaryRef attributes);

CSKAVELL_END_DECLS

#endif
