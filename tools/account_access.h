// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Accounts by address, as every command reaches them: finding them on disk, opening them through the store, saving
// them. Opening and saving may wait for another program (see store_wait.h). One thread.

#ifndef KAVELL_TOOLS_ACCOUNT_ACCESS_H
#define KAVELL_TOOLS_ACCOUNT_ACCESS_H

#include <compare>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include <kavellaccounts/CSKavellAccount.h>
#include <kavellaccounts/Ref.h>

#include "tools/store_wait.h"

namespace kavell::tools {

/// The words of a command line that remain to be read.
using Words = std::vector<std::string>;

/// Which account: the full provider type and the login name.
struct Address {
    std::string providerType;
    std::string login;

    /// For people: "google anna".
    [[nodiscard]] std::string text() const;

    auto operator<=>(const Address &) const = default;
};

/// Takes PROVIDER LOGIN, or PROVIDER/LOGIN in one word, off the front; refuses what is neither.
[[nodiscard]] Address takeAddress(Words &words);

/// The directory of all accounts, of a provider type, and the path of an account's data file.
[[nodiscard]] std::string dataRoot();
[[nodiscard]] std::string providerDirectory(std::string_view providerType);
[[nodiscard]] std::string dataFileOf(const Address &address);

/// The accounts that have a data file, sorted; of one provider type, or of all. A file whose name is not UTF-8 is none,
/// because the store cannot name it.
[[nodiscard]] std::vector<Address> accountsOnDisk(const std::optional<std::string> &providerType = std::nullopt);

/// Whether something stands in the data file's place.
[[nodiscard]] bool isOnDisk(const Address &address);

/// The login name that a directory entry of this name is the data file of; none when it is not named like one.
[[nodiscard]] std::optional<std::string> loginOfDataFile(std::string_view name);

/// Whether it is a file, and no directory or device.
[[nodiscard]] bool isRegularFile(const Address &address);

/// An account opened through the store.
struct OpenedAccount {
    Address address;
    Ref<CSKavellAccountRef> record;
    bool existed = false;       ///< whether it has a data file
    bool readable = false;      ///< whether that file could be read and understood
    bool wasBrokenOff = false;  ///< whether its lock was not to be had with bounded patience; nothing else counts then
};

/// Opens an account, or a new one if there is none.
[[nodiscard]] OpenedAccount openAccount(const Address &address, Patience patience = Patience::Endless);

/// Opens an account that exists; fails with NoSuchAccount, naming the nearest, or with Failed when its file is damaged.
[[nodiscard]] OpenedAccount openExisting(const Address &address);

/// Saves the pending changes, or fails saying that `what` ("google anna", "its new password") was not saved.
void save(const OpenedAccount &account, const std::string &what);

/// The effective text of an attribute of the account; empty when it has none or it is no text.
[[nodiscard]] std::string textAttribute(CSKavellAccountRef account, std::string_view key);

/// The account's services that have attributes: the full identifiers, in the order of the data file.
[[nodiscard]] std::vector<std::string> serviceIdentifiers(const OpenedAccount &account);

/// The attributes of the account itself without the reference to its password.
[[nodiscard]] Ref<CSKavellDictionaryRef> ownAttributes(CSKavellAccountRef account);

}  // namespace kavell::tools

#endif
