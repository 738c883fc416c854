// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The operations that every object has. Objects are counted references: a result of a function with Create or Copy in
// its name belongs to the caller, who releases it; a result of one with Get is borrowed from the object asked.
// Any thread may retain, release, compare and hash; what an object's own operations allow is said at its type.

#ifndef KAVELLACCOUNTS_CSKAVELLTYPE_H
#define KAVELLACCOUNTS_CSKAVELLTYPE_H

#include <kavellaccounts/CSKavellBase.h>
#include <kavellaccounts/CSKavellString.h>

CSKAVELL_BEGIN_DECLS

/// Adds a reference and returns the object. None does nothing and returns none.
CSKAVELL_EXPORT CSKavellTypeRef CSKavellRetain(CSKavellTypeRef object);

/// Gives a reference back; the last one finalises the object. None does nothing. Constants are never freed.
CSKAVELL_EXPORT void CSKavellRelease(CSKavellTypeRef object);

/// Whether both are the same value: of one type and equal by that type's rule. Two none operands are equal; one is not.
CSKAVELL_EXPORT bool CSKavellEqual(CSKavellTypeRef first, CSKavellTypeRef second);

/// A hash by the type's rule; 0 for none. Equal values of the property-list types have equal hashes.
CSKAVELL_EXPORT uint64_t CSKavellHash(CSKavellTypeRef object);

/// The object's type; 0 for none.
CSKAVELL_EXPORT CSKavellTypeID CSKavellGetTypeID(CSKavellTypeRef object);

/// The name under which a type was registered, borrowed for the life of the process; NULL for an unknown identifier.
CSKAVELL_EXPORT const char *CSKavellTypeIDGetName(CSKavellTypeID typeID);

/// A copy in memory of the allocator (caller owns), by the copy operation of its type; an object of a type without one,
/// which includes every immutable type, is retained instead. Settings copy to settings with the same effective
/// attributes, containers to mutable containers that share their values. None for none.
CSKAVELL_EXPORT CSKavellTypeRef CSKavellCreateCopy(const CSKavellAllocator *allocator,
                                                   CSKavellTypeRef object) CSKAVELL_NODISCARD;

/// A text for people and logs (caller owns): values are written out, containers as {key = value; …} with sorted keys
/// and (a, b), records as <TypeName 0xADDRESS>; "(null)" for none. The form is not meant to be parsed.
CSKAVELL_EXPORT CSKavellStringRef CSKavellCopyDescription(CSKavellTypeRef object) CSKAVELL_NODISCARD;

CSKAVELL_END_DECLS

#endif
