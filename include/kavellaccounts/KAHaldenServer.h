// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The registry of the organisation servers (provider kKAProviderHaldenServer) that the user has set up, with what each
// offers, and the access group through which all client applications may read one stored password.
//
// The registry is the entry "HaldenServers" of KADefaults: a list of dictionaries with one pair each, from a server's
// address to its service types, latest last. Servers are compared to the letter. Nothing is forced to the disk here
// (KADefaults::synchronize); of two processes that add at the same moment one addition can be lost.

#ifndef KAVELLACCOUNTS_KAHALDENSERVER_H
#define KAVELLACCOUNTS_KAHALDENSERVER_H

#include <cstdint>

#include <QtCore/QString>
#include <QtCore/QVariant>

#include <kavellaccounts/CSKavellCofferel.h>
#include <kavellaccounts/KAExport.h>

/// @name The registry
/// @{

/// Adds a server, or replaces its entry; it is the last then. Nothing for a null server or null service types.
KAVELL_ACCOUNTS_EXPORT void KAAddHaldenServer(const QString &server, const QVariant &serviceTypes);

/// Removes a server. Without servers there is no entry.
KAVELL_ACCOUNTS_EXPORT void KARemoveHaldenServer(const QString &server);

/// Whether the server was added.
[[nodiscard]] KAVELL_ACCOUNTS_EXPORT bool KAIsKnownHaldenServer(const QString &server);

/// What was stored for the server; null for an unknown one.
[[nodiscard]] KAVELL_ACCOUNTS_EXPORT QVariant KAHaldenServiceTypesForServer(const QString &server);
/// @}

/// @name Shared access to a stored password. Blocks on the credential store as CSKavellCofferel.h says
/// @{

/// Lets an application group read an item, beside those that its access object names. 0 when done, and when the access
/// object trusts nobody, which is then left so; -1 when the item has no access object; else the status of the store
/// (CSKavellCofferelStatus), Unsupported for the Secret Service, which keeps none.
[[nodiscard]] KAVELL_ACCOUNTS_EXPORT int32_t KAAddTrustedAppGroup(CSKavellCofferelItemRef item,
                                                                  const QString &groupName);

/// An access object that trusts the group "KavellAccounts" (caller owns). None, with a line in the log, when the store
/// in use keeps no access objects.
[[nodiscard]] KAVELL_ACCOUNTS_EXPORT CSKavellCofferelAccessRef KACreateCofferelAccessGroup();
/// @}

#endif
