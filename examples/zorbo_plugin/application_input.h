// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What a client application is told when it is to make an account for a Zorbo account.
//
// What to take from it: an account-list plug-in knows its service's servers, so that nobody has to look for them. Reads
// the password, which may block: not on the user-interface thread.

#ifndef EXAMPLES_ZORBO_PLUGIN_APPLICATION_INPUT_H
#define EXAMPLES_ZORBO_PLUGIN_APPLICATION_INPUT_H

#include <memory>

class KAAccount;
class KAAccountSetupInput;
class KAApplication;

/// The input record of the application's kind; null for an application that no service of Zorbo's is for.
[[nodiscard]] std::shared_ptr<KAAccountSetupInput> applicationInput(const KAApplication &application,
                                                                    const KAAccount &account);

#endif
