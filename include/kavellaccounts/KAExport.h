// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Visibility of the object layer's classes and functions. Everything that is not marked is hidden.

#ifndef KAVELLACCOUNTS_KAEXPORT_H
#define KAVELLACCOUNTS_KAEXPORT_H

/// Marks a class, function or constant as part of the library's interface.
#define KAVELL_ACCOUNTS_EXPORT __attribute__((visibility("default")))

#endif
