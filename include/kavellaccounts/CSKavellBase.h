// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What every other header of the store stands on: linkage and visibility, the allocator, the generic reference.
// Compiles as C11 and as C++20. Nothing here blocks or allocates.

#ifndef KAVELLACCOUNTS_CSKAVELLBASE_H
#define KAVELLACCOUNTS_CSKAVELLBASE_H

#include <stdbool.h>
#include <stddef.h>
#include <stdint.h>

#ifdef __cplusplus
#define CSKAVELL_BEGIN_DECLS extern "C" {
#define CSKAVELL_END_DECLS }
#else
#define CSKAVELL_BEGIN_DECLS
#define CSKAVELL_END_DECLS
#endif

/// Marks a function or constant as part of the library's interface; everything else is hidden.
#define CSKAVELL_EXPORT __attribute__((visibility("default")))

/// Marks a result that the caller owns and would leak if it were ignored.
#define CSKAVELL_NODISCARD __attribute__((warn_unused_result))

CSKAVELL_BEGIN_DECLS

/// A reference to an object of any type. It is the one pointer to void of the interface, because C has no other way to
/// let a reference of each type be handed to the generic operations without a cast. None is NULL.
typedef const void *CSKavellTypeRef;

/// Identifies a registered type within this process; 0 is no type. Values may differ from run to run.
typedef uint32_t CSKavellTypeID;

/// Where an object's memory comes from. A function that takes an allocator copies these three values, so the structure
/// itself need not outlive the call; what `context` points to must outlive the object. NULL for an allocator means
/// malloc and free.
typedef struct CSKavellAllocator {
    /// Returns `size` bytes aligned for any type, or NULL, which makes the creation answer none.
    void *(*allocate)(size_t size, void *context);
    /// Takes back what `allocate` returned; never called with NULL.
    void (*deallocate)(void *memory, void *context);
    /// Handed to both functions as it is.
    void *context;
} CSKavellAllocator;

CSKAVELL_END_DECLS

#endif
