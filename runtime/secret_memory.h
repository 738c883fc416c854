// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Memory that is overwritten before it is given back, for objects that hold a password. Any thread.

#ifndef KAVELL_RUNTIME_SECRET_MEMORY_H
#define KAVELL_RUNTIME_SECRET_MEMORY_H

#include <kavellaccounts/CSKavellBase.h>

namespace kavell {

/// Allocates with malloc, and overwrites all of it before free.
extern const CSKavellAllocator secretAllocator;

}  // namespace kavell

#endif
