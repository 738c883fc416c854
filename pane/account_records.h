// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What the pane reads from the registry of accounts and changes there. Everything here may block, on the disk, on
// another program that holds an account's file (without a bound), or on the credential store (as CSKavellCofferel.h says),
// and so belongs on a background thread. Records are opened anew each time: the user-interface thread never shares one
// with a thread that waits.

#ifndef KAVELL_PANE_ACCOUNT_RECORDS_H
#define KAVELL_PANE_ACCOUNT_RECORDS_H

#include <atomic>
#include <functional>
#include <memory>

#include <QtCore/QList>
#include <QtCore/QString>

#include <kavellaccounts/CSKavellCofferel.h>

class KAAListPlugin;
class KAAccount;

namespace kavell::pane {

/// Names one account of the registry.
struct AccountName {
    QString providerType;
    QString loginName;

    [[nodiscard]] bool isNull() const { return loginName.isNull(); }
    bool operator==(const AccountName &other) const = default;
};

/// Whether an account can have such a name. It becomes the name of a file, in a directory named after the type.
[[nodiscard]] bool canBeStored(const AccountName &name);

/// What the list shows of an account.
struct AccountSummary {
    AccountName name;
    QString uid;
    QString description;   ///< what the user calls it; may be empty
    QString emailAddress;  ///< may be empty
    bool isEnabled = true;
    bool operator==(const AccountSummary &other) const = default;
};

/// The accounts of one provider, in the order of their login names.
struct AccountGroup {
    QString providerType;
    KAAListPlugin *plugin = nullptr;  ///< the registry's; null for accounts of a kind that no installed plug-in serves
    QList<AccountSummary> accounts;
    bool operator==(const AccountGroup &other) const = default;
};

/// The installed account-list plug-ins in the order of presentation.
[[nodiscard]] QList<KAAListPlugin *> accountListPlugins();

/// All accounts that the user may see: first those of the installed account-list plug-ins, in the order of presentation,
/// then those that no plug-in knows. Accounts that a client application keeps for itself are not among them.
[[nodiscard]] QList<AccountGroup> readAccounts();

/// The account with its attributes read; null when there is none of that name.
[[nodiscard]] std::shared_ptr<KAAccount> openAccount(const AccountName &name);

/// The directory that holds a directory for each provider type, whether or not it exists.
[[nodiscard]] QString accountsDirectory();

/// What became of a change.
enum class ChangeResult {
    Saved,
    Cancelled,     ///< nothing was changed
    NoAccount,     ///< it was removed meanwhile
    NotSaved,      ///< the file could not be written
    PasswordLeft,  ///< the account is gone, its password could not be deleted
};

/// Opens the account, changes and saves it. Once the account is open, `isCancelled` is looked at for the last time.
[[nodiscard]] ChangeResult changeAccount(const AccountName &name, const std::function<void(KAAccount &)> &change,
                                         const std::shared_ptr<std::atomic_bool> &isCancelled);

/// Saves what is pending in an account that a plug-in has just made.
[[nodiscard]] ChangeResult saveAccount(const std::shared_ptr<KAAccount> &account);

/// Deletes the account and then its password, which nobody could name any more without the account.
[[nodiscard]] ChangeResult removeAccount(const AccountName &name, const std::shared_ptr<std::atomic_bool> &isCancelled);

/// @name The password, of a freshly opened account
/// @{
[[nodiscard]] CSKavellCofferelStatus passwordStatus(const AccountName &name);
[[nodiscard]] QString readPassword(const AccountName &name);
[[nodiscard]] ChangeResult storePassword(const AccountName &name, const QString &password,
                                         const std::shared_ptr<std::atomic_bool> &isCancelled);
/// @}

/// Existing accounts that are probably the same as this one, under another name: the same address in whatever case of
/// letters, at whichever provider, or what the plug-in rules take for one identity.
[[nodiscard]] QList<AccountSummary> likelyDuplicates(const AccountSummary &account, const QList<AccountGroup> &groups);

/// The name of an open account. Does not block.
[[nodiscard]] AccountName nameOf(const KAAccount &account);

/// The summary of an open account. Does not block.
[[nodiscard]] AccountSummary summaryOf(const KAAccount &account);

}  // namespace kavell::pane

#endif
