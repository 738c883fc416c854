// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// An account as a JSON object, the form that show, list, export and import share:
//
//     {"provider": "com.corvane.account.google", "login": "anna", "uuid": "…",
//      "attributes": {key: value, …}, "services": {identifier: {key: value, …}, …}}
//
// The reference to the password is left out. One thread.

#ifndef KAVELL_TOOLS_ACCOUNT_JSON_H
#define KAVELL_TOOLS_ACCOUNT_JSON_H

#include "tools/account_access.h"
#include "tools/json_value.h"

namespace kavell::tools {

/// {"provider", "login"}, the beginning of every result about an account.
[[nodiscard]] Json addressJson(const Address &address);

/// The whole object.
[[nodiscard]] Json accountJson(const OpenedAccount &account);

/// {"provider", "login", `what`: true}, as text: the result of a command that changed the account.
[[nodiscard]] std::string outcomeText(const Address &address, const char *what);

}  // namespace kavell::tools

#endif
