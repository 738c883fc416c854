// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The document that export writes and import reads:
//
//     {"kavellAccounts": 1, "accounts": [ACCOUNT, …]}        ACCOUNT as in account_json.h
//
// The number is raised when a reader of the former form could misunderstand the new one. One thread.

#ifndef KAVELL_TOOLS_TRANSFER_FORMAT_H
#define KAVELL_TOOLS_TRANSFER_FORMAT_H

#include <map>
#include <string>
#include <vector>

#include <kavellaccounts/CSKavellDictionary.h>
#include <kavellaccounts/Ref.h>

#include "tools/account_access.h"

namespace kavell::tools {

inline constexpr const char *transferVersionKey = "kavellAccounts";
inline constexpr int transferVersion = 1;

/// An account as a document describes it.
struct TransferredAccount {
    Address address;
    std::string uuid;  ///< empty when the document has none
    Ref<CSKavellDictionaryRef> attributes;
    std::map<std::string, Ref<CSKavellDictionaryRef>> services;
};

/// The accounts of a document. Refuses the whole of it for any mistake, saying where it is; `name` is the document's.
[[nodiscard]] std::vector<TransferredAccount> readTransferDocument(std::string_view text, const std::string &name);

}  // namespace kavell::tools

#endif
